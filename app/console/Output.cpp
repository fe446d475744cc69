// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Output.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Paths.h"
#include "util/FilePath.h"
#include "util/Result.h"

#include <iostream>

namespace cadrel::app {

using util::Result;

Output::Output(const std::string& path, bool mayReplace) : m_path(path), m_mayReplace(mayReplace)
{
    if (isStandardOutput(path))
        return;
    const auto target = util::toFilePath(toWide(path));
    orUnwritable([&] { m_file.emplace(target); });
}

/// Does what fails when the file can't be written.
template <class Action>
void Output::orUnwritable(Action action)
{
    try {
        action();
    } catch (const util::FileReplacement::TargetChanged&) {
        throw writtenMeanwhile(m_path);
    } catch (const Result::Type&) {
        throw unwritable({m_path});
    }
}

void Output::write(std::string_view text)
{
    Interruption::check();
    if (m_file)
        orUnwritable([&] { m_file->write(text); });
    else
        std::cout << text;
}

void Output::finish()
{
    if (m_file)
        orUnwritable([&] {
            m_file->finish();
            if (!m_mayReplace)
                m_file->requireUnchanged(util::FileStamp());
        });
    else
        flushStandardOutput();
}

void Output::place()
{
    finish();
    if (m_file)
        orUnwritable([&] { m_file->commit(m_mayReplace ? std::nullopt : std::optional(util::FileStamp())); });
}

void flushStandardOutput()
{
    if (!std::cout.flush())
        throw Failure{"standard output", "can't be written", "see whether the disk is full"};
}

} // namespace cadrel::app
