// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/TransitionPieces.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"
#include "core/edl/ProgrammeOrder.h"
#include "util/Result.h"

#include <algorithm>
#include <memory>
#include <string>

namespace cadrel::core {

using util::Result;

namespace {

const std::string PieceNamePrefix = "TRANS_";

/// The name of a piece between two clips: the timecode stands twice in this format of name.
std::string pieceName(const std::string& incoming, const std::string& outgoing, const std::string& timecode)
{
    return PieceNamePrefix + incoming + "--" + outgoing + "_" + timecode + "_" + timecode;
}

/// `length` from `start`, but not beyond `end`.
Timecode limited(const Timecode& length, const Timecode& start, const Timecode& end)
{
    return start + length > end ? end - start : length;
}

/// How much source the transition takes. A fast event gets a shorter piece; the division is deliberate.
Timecode transitionSourceLength(const EventBase& event)
{
    Timecode length(event.transitionDuration());
    if (event.motionSpeed() == 0.0)
        length.setSeconds(0.0);
    else
        length.setSeconds(length.toSeconds() / event.motionSpeed());
    return limited(length, event.srcIn(), event.srcOut());
}

/// Takes the transition off the front of an event and returns it as an event of its own. A reversed shot begins at SRC OUT.
std::shared_ptr<EventBase> cutOutTransition(EventBase& event, const EventBase* before)
{
    const Timecode srcLength = transitionSourceLength(event);
    const Timecode srcSplit = event.isReversed() ? event.srcOut() - srcLength : event.srcIn() + srcLength;
    const Timecode dstLength = limited(Timecode(event.transitionDuration()), event.dstIn(), event.dstOut());
    const Timecode dstSplit = event.dstIn() + dstLength;

    auto piece = std::make_shared<EventBase>();
    *piece = event;
    if (event.isReversed())
        piece->setTimecodes(srcSplit, event.srcOut(), event.dstIn(), dstSplit);
    else
        piece->setTimecodes(event.srcIn(), srcSplit, event.dstIn(), dstSplit);
    if (before != nullptr && before->eventNumber() == event.eventNumber()) {
        const std::string timecode = before->lastSource().toString();
        piece->setRollName(pieceName(event.rollName(), before->rollName(), timecode));
        piece->setClipName(pieceName(event.clipName(), before->clipName(), timecode));
    }

    if (event.isReversed())
        event.setTimecodes(event.srcIn(), srcSplit, dstSplit, event.dstOut());
    else
        event.setIn(srcSplit, dstSplit);
    event.setTransitionType(TransitionType::Cut);
    event.setTransitionDuration(0);
    return piece;
}

} // namespace

std::vector<std::size_t> expandTransitions(EventList& events,
                                           const std::function<FailureAnswer(std::size_t)>& onFailure)
{
    EventList pieces;
    std::vector<std::size_t> origins;
    for (std::size_t index = 0; index < events.size(); ++index) {
        EventBase& event = events.at(index);
        if (!event.isTransition())
            continue;
        try {
            pieces.add(cutOutTransition(event, index > 0 ? &events.at(index - 1) : nullptr));
            origins.push_back(index);
        } catch (Result::Type) {
            if (!event.isValid())
                continue;
            if (onFailure(index) == FailureAnswer::Stop)
                throw;
            event.addFlaw(EventFlaw::TransitionDurationInvalid);
        }
    }
    events.append(pieces);
    return origins;
}

void mergeTransitionPieces(EventList& changeEvents, std::int32_t matchBy)
{
    const auto& events = changeEvents.events();
    if (std::none_of(events.begin(), events.end(), [](const auto& event) { return event->isTransition(); }))
        return;
    const std::vector<PlacedEvent> order = inProgrammeOrder(events, Timecode::framerate());
    EventList absorbed;
    for (std::size_t index = 0; index < order.size(); ++index) {
        const std::shared_ptr<EventBase> piece = changeEvents.eventAt(order[index].index);
        if (!piece->isTransition())
            continue;
        if (index + 1 < order.size()) {
            const std::shared_ptr<EventBase> body = changeEvents.eventAt(order[index + 1].index);
            const bool bodyFollows = body->dstIn() == piece->dstOut() && body->srcIn() == piece->srcOut();
            if (bodyFollows && nameBy(matchBy, *piece).starts_with(PieceNamePrefix + nameBy(matchBy, *body))) {
                piece->setOut(body->srcOut(), body->dstOut());
                piece->setRollName(body->rollName());
                piece->setClipName(body->clipName());
                absorbed.add(body);
            }
        }
        piece->setTransitionType(TransitionType::Cut);
    }
    changeEvents.remove(absorbed);
}

} // namespace cadrel::core
