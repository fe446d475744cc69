// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/TakenFiles.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/model/ListOfKind.h"
#include "gui/files/EdlFile.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <utility>

namespace cadrel::gui {

using core::DataModel;
using core::EventList;
using core::ListKind;
using core::ListSide;
using core::Timecode;
using core::TimecodeRange;
using util::Result;
using util::StringUtil;

namespace {

/// Of a file's unread lines in the summary; the rest is counted.
constexpr std::size_t MostLinesOfASummary = 10;

constexpr const wchar_t* Gap = L"     ";

bool hasValidEvent(const EventList& events)
{
    return std::any_of(events.events().begin(), events.events().end(),
                       [](const auto& event) { return event->isValid(); });
}

TimecodeRange rangeOf(const EventList& events, ListSide side)
{
    return side == ListSide::Source ? events.sourceRange() : events.destinationRange();
}

/// A copy of the events that has moved. A list without a valid event has nothing to move.
void shift(EventList& events, ListSide side, const EdlOffset& offset)
{
    if (offset.isNone() || !hasValidEvent(events))
        return;
    if (side == ListSide::Source)
        events.shiftSource(offset.amount, offset.isForward);
    else
        events.shiftDestination(offset.amount, offset.isForward);
}

std::wstring rangeText(const std::wstring& in, const std::wstring& out, const TimecodeRange& range)
{
    return StringUtil::translate(in) + L": " + util::toShownLine(range.start.toString()) + L" " +
           StringUtil::translate(out) + L": " + util::toShownLine(range.end.toString());
}

std::wstring indented(const std::wstring& lines)
{
    std::wstring text;
    for (std::size_t start = 0; start < lines.size();) {
        const std::size_t end = lines.find(L'\n', start) + 1;
        text += Gap + lines.substr(start, end - start);
        start = end;
    }
    return text;
}

std::wstring undoNameOf(std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return L"Load Old EDL";
    case ListKind::New:
        return L"Load New EDL";
    default:
        return L"Load Change EDL";
    }
}

} // namespace

void TakenFiles::take(const EdlFile& file)
{
    m_files.erase(file.path());
    Taken taken{file.takeEvents(), file.name(), file.unreadText(MostLinesOfASummary)};
    if (!taken.events.isEmpty())
        m_files.emplace(file.path(), std::move(taken));
}

std::optional<TimecodeRange> TakenFiles::range(ListSide side) const
{
    std::optional<TimecodeRange> united;
    for (const auto& [path, taken] : m_files) {
        if (!hasValidEvent(taken.events))
            continue;
        const TimecodeRange own = rangeOf(taken.events, side);
        united = united ? TimecodeRange::unite(*united, own) : own;
    }
    return united;
}

EdlOffset TakenFiles::bounded(ListSide side, const EdlOffset& offset) const
{
    const std::optional<TimecodeRange> whole = range(side);
    if (!whole)
        return offset;
    const std::int32_t latest = Timecode::maxTimecode().toFrameCount();
    const std::int32_t start = whole->start.toFrameCount();
    const std::int32_t end = whole->end.toFrameCount();
    if (start + offset.frames() < 0)
        return {whole->start, false};
    if (end + offset.frames() > latest)
        return {Timecode(latest - end), true};
    return offset;
}

std::optional<TimecodeRange> TakenFiles::shifted(ListSide side, const EdlOffset& offset) const
{
    const std::optional<TimecodeRange> whole = range(side);
    if (!whole)
        return std::nullopt;
    const auto moved = [&](const Timecode& timecode) { return Timecode(timecode.toFrameCount() + offset.frames()); };
    return TimecodeRange(moved(whole->start), moved(whole->end));
}

std::wstring TakenFiles::rangesText(const EventList& events) const
{
    const std::wstring destination = rangeText(L"DST IN", L"DST OUT", events.destinationRange());
    if (m_listKind != ListKind::Change)
        return destination;
    return destination + Gap + rangeText(L"SRC IN", L"SRC OUT", events.sourceRange());
}

std::wstring TakenFiles::summary() const
{
    std::wstring text;
    for (const auto& [path, taken] : m_files) {
        text += rangesText(taken.events) + Gap + StringUtil::translate(L"File") + L": " + taken.name + L"\n";
        text += indented(taken.unread);
    }
    return text;
}

std::vector<std::shared_ptr<core::EventBase>> TakenFiles::shiftedEvents(const EdlOffset& destination,
                                                                        const EdlOffset& source) const
{
    std::vector<std::shared_ptr<core::EventBase>> all;
    for (const auto& [path, taken] : m_files) {
        EventList events;
        if (destination.isNone() && source.isNone())
            events = taken.events;
        else
            events.copyFrom(taken.events);
        shift(events, ListSide::Destination, destination);
        shift(events, ListSide::Source, source);
        all.insert(all.end(), events.events().begin(), events.events().end());
    }
    return all;
}

void TakenFiles::appendTo(DataModel& model, const EdlOffset& destination, const EdlOffset& source,
                          const std::wstring& folder) const
{
    EventList& target = core::listOf(model, m_listKind);
    // All of it or nothing: what can fail comes first.
    const core::Variant storedFolder(StringUtil::toUtf8(folder));
    std::vector<std::shared_ptr<core::EventBase>> events = shiftedEvents(destination, source);
    const auto command = core::createDataModelCommand(StringUtil::translate(undoNameOf(m_listKind)));
    if (!events.empty())
        target.append(std::move(events));
    model.setProperty(core::PropertyKey::LastEdlFolder, storedFolder);
}

} // namespace cadrel::gui
