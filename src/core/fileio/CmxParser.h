// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/ParserInterface.h"
#include "core/time/Timecode.h"

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::core {
class EventBase;
}

namespace cadrel::core::fileio {

struct EventLine;

/// Reads CMX EDLs. It skips what it doesn't know, but checks each field: a line that is neither an event nor a comment
/// is skipped, and a field that can't be read adds a flaw to the event, which stays in the list. An event line with too
/// few columns makes no event. The remarks tell of all lines that hold an event and made none.
///
///     FCM: NON-DROP FRAME
///     001  A001C003 V     C        10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00
///     * FROM CLIP NAME: SC12_TK3
///     002  A001C003 V     C        10:00:04:00 10:00:04:00 01:00:04:00 01:00:04:00      a dissolve in two lines
///     002  A002C001 V     D    024 11:00:00:00 11:00:03:00 01:00:04:00 01:00:07:00      with one number
///     * FROM CLIP NAME: SC12_TK3
///     * TO CLIP NAME: SC14_TK1
///
/// Lines end with CR if a CR comes before the first LF, otherwise with LF.
///
/// A thorough reading also takes lines whose columns are separated by tabs, a line after a byte order mark, and motion
/// lines as far as they say that a shot is played backwards:
///
///     M2   A002C001       -24.0                11:00:03:00
class CmxParser : public ParserInterface {
public:
    using ParserInterface::parse;
    util::Result::Type parse(const std::wstring& path, EventList& events, Framerate& framerate,
                             bool acceptAudio) override;

    util::Result::Type detect(const std::wstring& path, Framerate& framerate) override;

    /// True for everything, since the reader refuses no text.
    bool recognises(std::string_view beginning) const override;

    /// The "FCM" line that says drop-frame, which stands for a rate of its own.
    std::optional<SourceLine> rateLine() const override;

    void readThoroughly() override { m_isThorough = true; }
    const FileRemarks& remarks() const override { return m_remarks; }

    /// The rate that the files show. It is drop-frame 30 if the last file says drop-frame. Otherwise it is the lowest
    /// nominal rate for the highest frames field below 60 that this parser has seen, with the drop-frame state of the
    /// last file's "FCM" lines. It is unknown when nothing shows it. Pulled-down rates are never detected.
    Framerate detectedFramerate() const;

private:
    enum class LineKind { FrameCountMode, Event, Comment, Other };

    template <class Action>
    void readLines(const std::wstring& path, Action action);
    void readFrameCountMode(std::string_view line, std::uint32_t lineNumber);
    EventLine columnsOf(std::string_view line) const;
    bool readEvent(const EventLine& columns, bool acceptAudio, EventBase& event);
    void readDropFrameMark(const EventLine& columns, std::string_view line, std::uint32_t lineNumber);
    void finishRemarks(const std::wstring& path, std::vector<UnreadLine> unreadLines);
    std::optional<Timecode> parseTimecode(std::string_view column);

    std::int32_t m_dropFrameState = -1; ///< 0 non-drop, 1 drop-frame
    SourceLine m_frameCountModeLine;    ///< where `m_dropFrameState` was found
    bool m_isThorough = false;
    FileRemarks m_remarks;
    std::array<std::int32_t, 60> m_frameHistogram{};
};

} // namespace cadrel::core::fileio
