// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/fileio/FileRemarks.h"
#include "core/time/Framerate.h"

#include <cstdint>
#include <string>

namespace cadrel::gui {

/// An EDL file that was read for one of the three lists, which hasn't got its events yet.
class EdlFile {
public:
    /// Reads the file. `path` is in UTF-8 and `listKind` a core::ListKind. Throws Result::FileAccessFailed for what isn't a
    /// file or is larger than any EDL, and what EventList::load throws.
    EdlFile(const std::string& path, std::int32_t listKind, bool renameBRolls);

    /// One and the same for all ways to write it.
    const std::string& path() const { return m_path; }
    /// Without its folder.
    std::wstring name() const;

    /// Whether the file says another rate than the project has, or drop-frame against non-drop. A file of fewer frames a
    /// second says the same as the project.
    bool hasOtherRate() const;
    /// Whether some timecode doesn't exist at the project's rate.
    bool hasInvalidTimecodes() const { return m_events.countInvalidTimecodes() > 0; }
    bool hasReadableEvent() const { return m_events.hasReadableEvent(); }
    bool hasUnreadLines() const { return !m_remarks.unreadLines.empty(); }
    /// The lines that hold something that was not read, in lines for the user: at most `mostLines` of them, and how many
    /// there are more.
    std::wstring unreadText(std::size_t mostLines) const;

    /// What the list takes of it: all events, but only the cuts for the change EDL.
    core::EventList takeEvents() const;

private:
    std::string m_path;
    std::int32_t m_listKind;
    core::EventList m_events;
    core::Framerate m_shown;
    core::fileio::FileRemarks m_remarks;
};

} // namespace cadrel::gui
