// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace standin {

/// The named steps of a project that the user can take back and make again.
class UndoList {
public:
    /// Drops what could have been made again.
    void add(std::u16string name, ChangeLog::Edits edits);

    bool canUndo() const { return m_done > 0; }
    bool canRedo() const { return m_done < m_entries.size(); }
    /// Takes the last entry back: its edits from the last to the first. False when there is none.
    bool undo();
    /// Makes the entry that was taken back last again: its edits from the first to the last. False when there is none.
    bool redo();
    /// Drops all entries.
    void clear();

    /// All entries, the oldest first; those from `doneCount` on have been taken back.
    std::size_t size() const { return m_entries.size(); }
    std::size_t doneCount() const { return m_done; }
    const std::u16string& nameAt(std::size_t index) const { return m_entries[index].name; }
    /// Where the list stands: the same number again means that the same entries are done. 0 before the first of them.
    std::uint64_t state() const { return m_done > 0 ? m_entries[m_done - 1].number : 0; }

private:
    struct Entry {
        std::uint64_t number; ///< no other entry ever has it
        std::u16string name;
        ChangeLog::Edits edits;
    };

    std::vector<Entry> m_entries;
    std::size_t m_done = 0;
    std::uint64_t m_lastNumber = 0;
};

} // namespace standin
