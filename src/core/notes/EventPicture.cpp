// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/EventPicture.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/MatchedName.h"
#include "core/edl/ProgrammePlace.h"

#include <algorithm>
#include <cmath>

namespace cadrel::core {

namespace {

/// Separates the parts of a material's text; no name of an EDL holds it.
constexpr char Separator = '\n';

std::string materialText(const std::string& kind, std::initializer_list<std::string> parts)
{
    std::string text = kind;
    for (const std::string& part : parts)
        text += Separator + part;
    return text;
}

std::string timesOf(const EventBase& event)
{
    return event.srcIn().toString() + " " + event.srcOut().toString();
}

/// The material's name without its version.
std::string plainNameOf(const EventBase& event, const PictureRules& rules)
{
    return rules.versions.stripVersion(nameBy(rules.matchBy, event));
}

/// A reversed shot is another material than one that plays forwards.
std::string keyOf(const EventBase& event, const PictureRules& rules)
{
    return plainNameOf(event, rules) + (event.isReversed() ? Separator + std::string("reversed") : std::string());
}

/// The first source frame, in a count that rises with the programme.
std::int32_t firstSourceFrame(const EventBase& event, const Framerate& framerate)
{
    const std::int32_t frame = event.firstSource().toFrameCount(framerate);
    return event.isReversed() ? framerate.lastFrame - frame : frame;
}

} // namespace

EventPicture::EventPicture(const EventList& events, std::size_t index, const EventBase* before,
                           const PictureRules& rules, TextNumbers& numbers)
    : m_event(static_cast<std::int32_t>(index)),
      m_name(numbers.numberOf(materialText("name", {plainNameOf(events.at(index), rules)})))
{
    const EventBase& event = events.at(index);
    m_length = event.dstOut().toFrameCount(rules.framerate) - event.dstIn().toFrameCount(rules.framerate);
    const std::string& name = nameBy(rules.matchBy, event);
    const std::string key = keyOf(event, rules);
    const std::int32_t version = numbers.numberOf(materialText("version", {name}));

    if (!event.isValid()) {
        const std::string text = materialText("flawed", {event.rollName(), event.clipName(), timesOf(event),
                                                         std::to_string(event.transitionType()),
                                                         std::to_string(event.transitionDuration())});
        m_body = {numbers.numberOf(text), version, 0.0, 1.0};
        return;
    }
    const double source = firstSourceFrame(event, rules.framerate);
    const bool isStill = isFreeze(event, rules.framerate);
    const double speed = isStill || event.isNormalSpeed() ? 1.0 : event.motionSpeed();
    if (isStill)
        m_body = {numbers.numberOf(materialText("freeze", {key, event.srcIn().toString()})), version, 0.0, 1.0};
    else
        m_body = {numbers.numberOf(materialText("clip", {key})), version, source, speed};
    if (!event.isTransition() || event.transitionDuration() <= 0)
        return;

    const EventBase* outgoing = outgoingOf(events, index);
    if (outgoing == nullptr && before != nullptr && before->dstOut() == event.dstIn())
        outgoing = before;
    const std::string outgoingName = outgoing == nullptr ? std::string() : nameBy(rules.matchBy, *outgoing);
    const std::string text =
        materialText("transition", {std::to_string(event.transitionType()), std::to_string(event.transitionDuration()),
                                    key, event.firstSource().toString(), isStill ? "freeze" : "",
                                    outgoing == nullptr ? std::string() : keyOf(*outgoing, rules),
                                    outgoing == nullptr ? std::string() : outgoing->lastSource().toString()});
    m_transition = {numbers.numberOf(text), numbers.numberOf(materialText("version", {name, outgoingName})), 0.0,
                    speed};
    m_transitionLength = std::min(event.transitionDuration(), m_length);
}

ShownRun EventPicture::runFrom(std::int32_t from) const
{
    const bool isTransition = from < transitionLength();
    const Material& material = isTransition ? *m_transition : m_body;
    return {.start = 0,
            .length = 0,
            .material = material.number,
            .version = material.version,
            .name = m_name,
            .source = material.source + from * material.sourceStep,
            .sourceStep = material.sourceStep,
            .event = m_event,
            .isTransition = isTransition,
            .eventFrame = from,
            .eventLength = m_length};
}

bool canBeSameSpeed(double a, std::int32_t lengthOfA, double b, std::int32_t lengthOfB)
{
    constexpr double OneFrame = 1.0 - 1e-6; // a speed is no whole number of frames
    const bool haveSameDirection = std::signbit(a) == std::signbit(b);
    return EventBase::areSameSpeed(a, b) ||
           (haveSameDirection && std::abs(a - b) * std::min(lengthOfA, lengthOfB) < OneFrame);
}

bool isFreeze(const EventBase& event, const Framerate& framerate)
{
    if (!event.isValid())
        return false;
    const std::int32_t source = event.srcOut().toFrameCount(framerate) - event.srcIn().toFrameCount(framerate);
    const std::int32_t shown = event.dstOut().toFrameCount(framerate) - event.dstIn().toFrameCount(framerate);
    return source == 0 || (source == 1 && shown > 1);
}

bool tellsNothing(const std::string& name)
{
    return name.empty() || name == "AX";
}

} // namespace cadrel::core
