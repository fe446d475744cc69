// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/ChangeLog.h"

#include <utility>

namespace standin {

std::vector<ChangeLog::Record> ChangeLog::close()
{
    m_isOpen = false;
    return std::exchange(m_records, {});
}

void ChangeLog::add(Project& project, std::unique_ptr<Edit> edit)
{
    if (m_isOpen)
        m_records.push_back({&project, std::move(edit)});
}

void ChangeLog::add(std::unique_ptr<Edit> edit)
{
    if (m_isOpen)
        m_records.push_back({nullptr, std::move(edit)});
}

} // namespace standin
