// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/WriterInterface.h"

#include <cstddef>
#include <string>
#include <vector>

namespace cadrel::core {
struct Framerate;
} // namespace cadrel::core

namespace cadrel::core::fileio {

/// Writes CMX EDLs of cuts: a title line, then a line for each valid event, numbered by its position in the list. No
/// comments, clip names or durations are written, and the frame-count mode only where it is asked for.
///
///     TITLE:   reel3_change.edl
///     001  A001C003 V     C        10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00
///
/// A list of more than 999 events goes into several files, "name_1.edl", "name_2.edl" and so on, each numbered from 1.
/// A file is written next to its target and takes its place when it is complete, so that a failure leaves the old file
/// as it was. A target that isn't a regular file is written directly.
class CmxWriter : public WriterInterface {
public:
    /// The highest number for the three digits of the event number column.
    static constexpr std::size_t MostEventsInAFile = 999;

    /// Whether a line after the title says that the timecodes are drop-frame. Without it the reader takes them for
    /// non-drop, since all are written with ":".
    enum class FrameCountMode { Unsaid, DropFrame };

    /// Whether a file that stands under the name by the time that the list is complete is replaced.
    enum class Existing { Replaced, Kept };

    explicit CmxWriter(FrameCountMode mode = FrameCountMode::Unsaid, Existing existing = Existing::Replaced)
        : m_mode(mode), m_existing(existing)
    {
    }

    /// Returns InvalidArgument for an empty list and for one without a readable event, FileAccessFailed when the file
    /// can't be opened or written, NotAvailable when it could be but has an empty last component, Refused where a file is to
    /// be kept, or what is thrown while writing.
    util::Result::Type write(const std::wstring& path, const EventList& events) override;

    /// The files into which a list of that many events goes.
    static std::vector<std::wstring> filesOf(const std::wstring& path, std::size_t eventCount);
    /// What a list of that rate says, so that it is read as it was.
    static FrameCountMode modeFor(const Framerate& framerate);

    /// A roll name as the file's eight columns take it: capitals, digits and ".-_", and "SHOT_-12" for
    /// "SHOT_LONGNAME_12".
    static std::string normalizedRollName(const std::string& name);

private:
    FrameCountMode m_mode;
    Existing m_existing;
};

} // namespace cadrel::core::fileio
