// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/time/TimecodeRange.h"
#include "gui/files/EdlOffset.h"

#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

class EdlFile;

/// The EDL files that the user has given for one of the three lists and not yet confirmed, in the order of their paths.
class TakenFiles {
public:
    /// `listKind` is a core::ListKind.
    explicit TakenFiles(std::int32_t listKind) : m_listKind(listKind) {}

    std::int32_t listKind() const { return m_listKind; }
    bool isEmpty() const { return m_files.empty(); }
    /// Replaces what was taken from the same file before. A file without an event for the list is forgotten.
    void take(const EdlFile& file);

    /// What all files hold together, unshifted; nothing when there is no valid event. `side` is a core::ListSide.
    std::optional<core::TimecodeRange> range(core::ListSide side) const;
    /// The offset as it may be: the range must not leave the day, and ends at its border when the offset is too large.
    /// Without a range, any offset may be.
    EdlOffset bounded(core::ListSide side, const EdlOffset& offset) const;
    /// Where the range comes to lie. Throws Result::OutOfRange unless the offset is bounded.
    std::optional<core::TimecodeRange> shifted(core::ListSide side, const EdlOffset& offset) const;
    /// A line for each file with its ranges and its name, and under it the lines that could not be read.
    std::wstring summary() const;

    /// Appends all events to the list of the model, shifted by the offsets, and stores the folder for the next time, as
    /// one entry in the undo list. Throws Result::OutOfRange when a list would leave the day, and what the
    /// host's undo list throws; nothing is changed then.
    void appendTo(core::DataModel& model, const EdlOffset& destination, const EdlOffset& source,
                  const std::wstring& folder) const;

private:
    struct Taken {
        core::EventList events;
        std::wstring name;   ///< of the file, without its folder
        std::wstring unread; ///< its lines that could not be read, each with a line end
    };

    std::vector<std::shared_ptr<core::EventBase>> shiftedEvents(const EdlOffset& destination,
                                                                const EdlOffset& source) const;
    std::wstring rangesText(const core::EventList& events) const;

    std::int32_t m_listKind;
    std::map<std::string, Taken> m_files; ///< by path
};

} // namespace cadrel::gui
