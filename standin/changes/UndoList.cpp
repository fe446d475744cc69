// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/UndoList.h"

#include <utility>

namespace standin {

void UndoList::add(std::u16string name, ChangeLog::Edits edits)
{
    m_entries.resize(m_done);
    m_entries.push_back({++m_lastNumber, std::move(name), std::move(edits)});
    ++m_done;
}

bool UndoList::undo()
{
    if (!canUndo())
        return false;
    const ChangeLog::Edits& edits = m_entries[--m_done].edits;
    for (auto edit = edits.rbegin(); edit != edits.rend(); ++edit)
        (*edit)->undo();
    return true;
}

bool UndoList::redo()
{
    if (!canRedo())
        return false;
    for (const auto& edit : m_entries[m_done++].edits)
        edit->redo();
    return true;
}

void UndoList::clear()
{
    m_done = 0;
    m_entries.clear();
}

} // namespace standin
