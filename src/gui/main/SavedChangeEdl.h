// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <vector>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// A change EDL that is saved under a name that the user has chosen.
class SavedChangeEdl {
public:
    /// The list is borrowed.
    SavedChangeEdl(const core::EventList& list, std::wstring path) : m_list(list), m_path(std::move(path)) {}

    /// What the user has to be asked before files of other names than his are overwritten, in his language; empty when there
    /// are none: the file box has asked for the name that he chose.
    std::wstring question() const;
    /// Throws what the writer returns.
    void write() const;

private:
    std::vector<std::wstring> overwritten() const;

    const core::EventList& m_list;
    std::wstring m_path;
};

} // namespace cadrel::gui
