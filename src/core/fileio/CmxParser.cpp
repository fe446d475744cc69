// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/CmxParser.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/EventLine.h"
#include "core/fileio/LineReader.h"
#include "core/fileio/MotionLine.h"
#include "core/fileio/UnreadLines.h"
#include "core/fileio/Utf16Lines.h"
#include "util/FilePath.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <filesystem>
#include <limits>
#include <memory>
#include <utility>
#include <vector>

namespace cadrel::core::fileio {

using util::Result;
using util::StringUtil;

namespace {

constexpr std::string_view ClipNameKey = "NAME:";
constexpr std::string_view ByteOrderMark = "\xEF\xBB\xBF";
constexpr std::string_view TitleWord = "TITLE:";
constexpr std::size_t DstIn = 2; ///< of the four timecodes of a line

bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

bool isRollNameCharacter(char character)
{
    return isDigit(character) || (character >= 'a' && character <= 'z') || (character >= 'A' && character <= 'Z') ||
           character == '.' || character == '-' || character == '_';
}

bool contains(std::string_view text, std::string_view part)
{
    return text.find(part) != std::string_view::npos;
}

/// The value of a text of digits, as large as the field can hold; nothing for any other text.
template <class Number>
std::optional<Number> parseNumber(std::string_view text)
{
    constexpr auto Greatest = static_cast<std::uint64_t>(std::numeric_limits<Number>::max());
    std::uint64_t value = 0;
    for (const char character : text) {
        if (!isDigit(character))
            return std::nullopt;
        value = std::min(value * 10 + static_cast<std::uint64_t>(character - '0'), Greatest);
    }
    return static_cast<Number>(value);
}

/// Why a line makes no event, as UnreadLine tells it.
std::string problemOf(const EventLine& columns)
{
    const bool lacksDuration = columns.duration && !columns.duration->empty() && !parseNumber<int>(*columns.duration);
    return lacksDuration ? "has a dissolve or wipe without a duration and isn't read" : "misses a field and isn't read";
}

/// An event that comment lines may still follow. Its comment is set when they all are there, so that it takes no more
/// memory than it needs.
struct OpenEvent {
    std::shared_ptr<EventBase> event = std::make_shared<EventBase>();
    std::string comment;

    void applyComment(std::string_view line)
    {
        const std::size_t key = line.find(ClipNameKey);
        if (key != std::string_view::npos) {
            const std::string_view name = StringUtil::trimView(line.substr(key + ClipNameKey.size()));
            if (name.empty())
                return;
            event->setClipName(std::string(name));
        }
        comment += '\n';
        comment += line;
    }
};

/// Collects the events of a file in their order, with their comment lines. A transition has two lines with the same
/// number: FROM CLIP in its comments names the clip of the first line, and TO CLIP that of the second.
class EventCollector {
public:
    /// The event that the next line is read into.
    EventBase& begin()
    {
        if (m_isPending) {
            close(m_previous);
            std::swap(m_previous, m_current);
            m_events.push_back(m_previous.event);
        }
        m_current.event = std::make_shared<EventBase>();
        m_isPending = false;
        m_isAfterUnread = false;
        return *m_current.event;
    }

    /// Adds the event that was begun to the list.
    void accept(std::string_view line)
    {
        m_current.comment = line;
        m_isPending = true;
    }

    /// An event comes here that isn't read. The lines up to the next event are about that one.
    void passOver() { m_isAfterUnread = true; }

    void addComment(std::string_view line)
    {
        if (!m_isPending || m_isAfterUnread)
            return;
        if (m_previous.event->eventNumber() != m_current.event->eventNumber())
            m_current.applyComment(line);
        else if (contains(line, "FROM CLIP"))
            m_previous.applyComment(line);
        else if (contains(line, "TO CLIP"))
            m_current.applyComment(line);
    }

    /// The shot that the line speaks of plays backwards: that of the event in hand, or in a transition that of the line with
    /// the same roll. False when there is none of the roll that the line names.
    bool reverse(const MotionLine& motion)
    {
        if (!m_isPending || m_isAfterUnread)
            return false;
        EventBase& current = *m_current.event;
        EventBase& previous = *m_previous.event;
        if (previous.eventNumber() != current.eventNumber()) {
            const bool isMeant = motion.roll.empty() || motion.roll == current.rollName();
            current.setReversed(current.isReversed() || isMeant);
            return isMeant;
        }
        const auto isMeant = [&](const EventBase& event) {
            const bool tellsRoll = previous.rollName() != current.rollName();
            return event.rollName() == motion.roll && (tellsRoll || motion.start == event.srcIn());
        };
        const bool isPreviousMeant = isMeant(previous);
        const bool isCurrentMeant = isMeant(current) || (!isPreviousMeant && current.rollName() == motion.roll);
        if (isPreviousMeant)
            previous.setReversed(true);
        if (isCurrentMeant)
            current.setReversed(true);
        return isPreviousMeant || isCurrentMeant;
    }

    /// All events, once the file has ended.
    std::vector<std::shared_ptr<EventBase>> end()
    {
        close(m_previous);
        if (m_isPending) {
            close(m_current);
            m_events.push_back(m_current.event);
        }
        return std::move(m_events);
    }

private:
    static void close(const OpenEvent& open) { open.event->setComment(open.comment); }

    // The first event of a file has no previous one, so an event with number 0 outside the list takes its place.
    OpenEvent m_previous;
    OpenEvent m_current;
    bool m_isPending = false;
    bool m_isAfterUnread = false;
    std::vector<std::shared_ptr<EventBase>> m_events;
};

} // namespace

Result::Type CmxParser::parse(const std::wstring& path, EventList& events, Framerate& framerate, bool acceptAudio)
try {
    const std::string fileName = StringUtil::toUtf8(StringUtil::fileNameOf(path));
    EventCollector collector;
    UnreadLines unread;
    m_remarks = {};
    readLines(path, [&](LineKind kind, std::string_view line, std::uint32_t lineNumber) {
        if (kind == LineKind::Event) {
            const EventLine columns = columnsOf(line);
            EventBase& event = collector.begin();
            event.setEdlFileName(fileName);
            event.setSourceLine(lineNumber);
            if (readEvent(columns, acceptAudio, event)) {
                collector.accept(line);
                readDropFrameMark(columns, line, lineNumber);
                if (unread.lookAfterEvent(line, lineNumber, columns.lengthIn(line)) && m_isThorough)
                    collector.passOver();
            } else {
                unread.lookAtDropped(line, lineNumber, problemOf(columns));
            }
            return;
        }
        if (m_remarks.title.empty() && line.starts_with(TitleWord))
            m_remarks.title = StringUtil::trimView(line.substr(TitleWord.size()));
        const auto lookedAs = kind == LineKind::Comment ? UnreadLines::Kind::Comment : UnreadLines::Kind::Other;
        if (unread.lookAt(line, lineNumber, lookedAs) && m_isThorough)
            collector.passOver();
        if (kind == LineKind::Comment)
            collector.addComment(line);
        if (m_isThorough && MotionLine::isOne(line)) {
            const MotionLine motion(line);
            if (!motion.isReadable)
                unread.add(line, lineNumber, "is a motion line whose speed can't be read");
            else if (motion.isBackwards && !collector.reverse(motion))
                unread.add(line, lineNumber, "plays no event backwards, since none of its roll stands before it");
        }
    });
    events.append(collector.end());
    finishRemarks(path, unread.release());
    framerate = detectedFramerate();
    return Result::Ok;
} catch (Result::Type failure) {
    return failure;
}

Result::Type CmxParser::detect(const std::wstring& path, Framerate& framerate)
try {
    readLines(path, [&](LineKind kind, std::string_view line, std::uint32_t) {
        if (kind != LineKind::Event)
            return;
        const EventLine columns = columnsOf(line);
        for (std::size_t index = 0; index < columns.timecodeCount; ++index)
            parseTimecode(columns.timecodes[index]);
    });
    framerate = detectedFramerate();
    return Result::Ok;
} catch (Result::Type failure) {
    return failure;
}

bool CmxParser::recognises(std::string_view) const
{
    return true;
}

std::optional<SourceLine> CmxParser::rateLine() const
{
    if (m_dropFrameState != 1)
        return std::nullopt;
    return m_frameCountModeLine;
}

Framerate CmxParser::detectedFramerate() const
{
    if (m_dropFrameState == 1)
        return {30, 1};
    std::size_t highest = m_frameHistogram.size() - 1;
    while (highest > 0 && m_frameHistogram[highest] == 0)
        --highest;
    if (highest == 0)
        return {0, m_dropFrameState};
    for (const std::int32_t rate : {24, 25, 30}) {
        if (highest < static_cast<std::size_t>(rate))
            return {rate, m_dropFrameState};
    }
    return {60, m_dropFrameState};
}

/// Calls the action with each line, and looks at the frame-count mode.
template <class Action>
void CmxParser::readLines(const std::wstring& path, Action action)
{
    LineReader reader(util::toFilePath(path));
    m_dropFrameState = -1;
    while (const std::optional<std::string_view> read = reader.next()) {
        std::string_view line = *read;
        if (m_isThorough && line.starts_with(ByteOrderMark))
            line = StringUtil::trimView(line.substr(ByteOrderMark.size()));
        if (line.empty())
            continue;
        LineKind kind = LineKind::Other;
        if (line.starts_with("FCM")) {
            kind = LineKind::FrameCountMode;
            readFrameCountMode(line, reader.lineNumber());
        } else if (isDigit(line.front())) {
            kind = LineKind::Event;
        } else if (line.front() == '*') {
            kind = LineKind::Comment;
        }
        action(kind, line, reader.lineNumber());
    }
}

void CmxParser::readFrameCountMode(std::string_view line, std::uint32_t lineNumber)
{
    if (!contains(line, "DROP FRAME"))
        return;
    const std::int32_t state = contains(line, "NON-DROP FRAME") ? 0 : 1;
    if (state != m_dropFrameState)
        m_frameCountModeLine = {lineNumber, std::string(line)};
    m_dropFrameState = state;
}

EventLine CmxParser::columnsOf(std::string_view line) const
{
    return m_isThorough ? EventLine::withTabs(line) : EventLine(line);
}

/// False for a line that makes no event, because it has too few columns or the timecodes have no provider.
bool CmxParser::readEvent(const EventLine& columns, bool acceptAudio, EventBase& event)
try {
    using Setter = void (EventBase::*)(const Timecode&);
    static constexpr std::array<Setter, 4> Setters{&EventBase::setSrcIn, &EventBase::setSrcOut, &EventBase::setDstIn,
                                                   &EventBase::setDstOut};
    if (const auto number = parseNumber<std::uint32_t>(columns.number))
        event.setEventNumber(*number);
    else
        event.addFlaw(EventFlaw::EventNumberNotNumeric);

    if (std::all_of(columns.rollName.begin(), columns.rollName.end(), isRollNameCharacter))
        event.setRollName(std::string(columns.rollName));
    else
        event.addFlaw(EventFlaw::RollNameInvalid);

    if (columns.channel.find_first_of(acceptAudio ? "ABV" : "BV") == std::string_view::npos)
        event.addFlaw(EventFlaw::NotVideoEvent);

    if (columns.transitionType)
        event.setTransitionType(*columns.transitionType);
    else
        event.addFlaw(EventFlaw::TransitionTypeUnsupported);

    if (columns.duration) {
        if (const auto duration = parseNumber<std::int32_t>(*columns.duration))
            event.setTransitionDuration(*duration);
        else
            event.addFlaw(EventFlaw::TransitionDurationInvalid);
    }

    for (std::size_t index = 0; index < columns.timecodeCount; ++index) {
        if (const std::optional<Timecode> timecode = parseTimecode(columns.timecodes[index]))
            (event.*Setters[index])(*timecode);
        else
            event.addFlaw(EventFlaw::SrcInUnreadable + static_cast<std::int32_t>(index));
    }
    return columns.isComplete();
} catch (Result::Type) {
    return false;
}

/// A ";" in a time of the programme says drop-frame, where no other line says more.
void CmxParser::readDropFrameMark(const EventLine& columns, std::string_view line, std::uint32_t lineNumber)
{
    if (!m_remarks.dropFrameLine && contains(columns.timecodes[DstIn], ";"))
        m_remarks.dropFrameLine = {lineNumber, std::string(line)};
}

void CmxParser::finishRemarks(const std::wstring& path, std::vector<UnreadLine> unreadLines)
{
    if (m_dropFrameState != -1)
        m_remarks.dropFrameLine = m_frameCountModeLine;
    m_remarks.dropFrame = m_remarks.dropFrameLine && m_dropFrameState == -1 ? 1 : m_dropFrameState;
    for (std::size_t frames = 0; frames < m_frameHistogram.size(); ++frames) {
        m_remarks.timecodeCount += static_cast<std::size_t>(m_frameHistogram[frames]);
        if (m_frameHistogram[frames] > 0)
            m_remarks.highestFrame = static_cast<std::int32_t>(frames);
    }
    m_remarks.unreadLines = std::move(unreadLines);
    const std::filesystem::path file = util::toFilePath(path);
    if (!isUtf16(file))
        return;
    m_remarks.unreadLines.clear();
    for (SourceLine& line : numberedUtf16Lines(file))
        m_remarks.unreadLines.push_back({std::move(line), "is UTF-16 text and isn't read"});
}

/// Also counts the timecode for the frame rate.
std::optional<Timecode> CmxParser::parseTimecode(std::string_view column)
{
    const std::optional<Timecode> timecode = Timecode::parse(column);
    if (timecode) {
        const auto frames = static_cast<std::size_t>(timecode->frames());
        if (frames < m_frameHistogram.size() && m_frameHistogram[frames] < std::numeric_limits<std::int32_t>::max())
            ++m_frameHistogram[frames];
    }
    return timecode;
}

} // namespace cadrel::core::fileio
