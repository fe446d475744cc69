// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/edit/EventEdit.h"

#include "core/model/DataModelCommandCreator.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <charconv>
#include <utility>

namespace cadrel::gui {

using core::EventBase;
using core::EventFlaw;
using core::Timecode;
using util::Result;
using util::StringUtil;

namespace {

/// What the reader never set counts as set in a copy, so this is asked of the event itself.
bool isUsable(const Timecode& timecode)
{
    return timecode.isInitialized() && timecode.isValid();
}

} // namespace

EventEdit::EventEdit(std::shared_ptr<EventBase> event, bool isSingle)
    : m_event(std::move(event)),
      m_workingCopy(*m_event), m_isUsable{isUsable(m_event->srcIn()), isUsable(m_event->srcOut()),
                                          isUsable(m_event->dstIn()), isUsable(m_event->dstOut())},
      m_fewestTicks(isSingle ? 1 : MostTicks), m_tickOrder{SrcIn, SrcOut}
{
}

std::string EventEdit::name() const
{
    return m_event->clipName() + " " + m_event->rollName();
}

const Timecode& EventEdit::timecode(std::size_t place) const
{
    switch (place) {
    case SrcIn:
        return m_workingCopy.srcIn();
    case SrcOut:
        return m_workingCopy.srcOut();
    case DstIn:
        return m_workingCopy.dstIn();
    case DstOut:
        return m_workingCopy.dstOut();
    default:
        throw Result::InvalidArgument;
    }
}

EventEdit::Timecodes EventEdit::timecodes() const
{
    return {timecode(SrcIn), timecode(SrcOut), timecode(DstIn), timecode(DstOut)};
}

std::string EventEdit::speedText() const
{
    // The longest double has 309 digits before its point.
    std::array<char, 320> digits{};
    const auto [end, error] = std::to_chars(digits.data(), digits.data() + digits.size(), m_workingCopy.motionSpeed(),
                                            std::chars_format::fixed, 2);
    const std::string text(digits.data(), end);
    return (text == "-0.00" ? "0.00" : text) + "x";
}

bool EventEdit::isInAfterOut() const
{
    return timecode(SrcIn) > timecode(SrcOut) || timecode(DstIn) > timecode(DstOut);
}

std::optional<std::int32_t> EventEdit::flaw() const
{
    if (isInAfterOut())
        return EventFlaw::TimecodeRangeInvalid;
    if (m_workingCopy.hasFlaw(EventFlaw::TimecodeInvalid))
        return EventFlaw::TimecodeInvalid;
    return std::nullopt;
}

bool EventEdit::isTicked(std::size_t place) const
{
    return std::find(m_tickOrder.begin(), m_tickOrder.end(), place) != m_tickOrder.end();
}

void EventEdit::click(std::size_t place)
{
    if (isTicked(place)) {
        if (m_tickOrder.size() > m_fewestTicks)
            std::erase(m_tickOrder, place);
        return;
    }
    if (m_tickOrder.size() == MostTicks)
        m_tickOrder.erase(m_tickOrder.begin());
    m_tickOrder.push_back(place);
}

std::optional<std::size_t> EventEdit::partnerOf(std::size_t place) const
{
    const auto found = std::find_if(m_tickOrder.begin(), m_tickOrder.end(), [&](std::size_t other) {
        return other != place && m_isUsable[place] && m_isUsable[other];
    });
    return found == m_tickOrder.end() ? std::nullopt : std::optional(*found);
}

bool EventEdit::change(std::size_t place, const Timecode& timecode)
try {
    if (!isTicked(place))
        return false;
    Timecodes changed = timecodes();
    if (const std::optional<std::size_t> partner = partnerOf(place))
        changed[*partner].addSeconds(timecode.toSeconds() - changed[place].toSeconds());
    changed[place] = timecode;
    m_workingCopy.setTimecodes(changed[SrcIn], changed[SrcOut], changed[DstIn], changed[DstOut]);
    m_isUsable[place] = true;
    return true;
} catch (Result::Type) {
    return false;
}

void EventEdit::apply()
{
    if (!isChanged())
        return;
    const auto command = core::createDataModelCommand(StringUtil::translate(L"Edit EDL Event"));
    m_event->setTimecodes(timecode(SrcIn), timecode(SrcOut), timecode(DstIn), timecode(DstOut));
}

} // namespace cadrel::gui
