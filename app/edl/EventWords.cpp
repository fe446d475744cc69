// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EventWords.h"

#include <array>
#include <cstddef>

namespace cadrel::app {

using core::EventBase;

namespace {

/// In the order of EventFlaw.
constexpr std::array<std::string_view, 13> FlawWords{
    "timecode-uninitialized", "free-text",        "event-number-not-numeric", "roll-name-invalid",  "not-video-event",
    "transition-duration",    "transition-type",  "src-in-unreadable",        "src-out-unreadable", "dst-in-unreadable",
    "dst-out-unreadable",     "timecode-invalid", "timecode-range-invalid"};
static_assert(core::EventFlaw::Last + 1 == FlawWords.size());

} // namespace

std::string_view kindWordOf(const EventBase& event)
{
    return event.eventKind() == core::EventKind::Healed ? "healed" : "plain";
}

std::string_view transitionWordOf(const EventBase& event)
{
    if (event.transitionType() == core::TransitionType::Wipe)
        return "wipe";
    return event.transitionType() == core::TransitionType::Dissolve ? "dissolve" : "cut";
}

std::vector<std::string_view> flawWordsOf(const EventBase& event)
{
    std::vector<std::string_view> words;
    for (const std::int32_t flaw : event.flaws())
        words.push_back(FlawWords.at(static_cast<std::size_t>(flaw)));
    return words;
}

} // namespace cadrel::app
