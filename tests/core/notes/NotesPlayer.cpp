// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/notes/NotesPlayer.h"

#include "core/edl/EventBase.h"
#include "core/edl/MatchedName.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <stdexcept>

namespace cadrel::tests {

using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::FrameRange;
using core::NoteStep;
using core::PictureRules;
using core::ReelPair;
using core::StepAction;

namespace {

constexpr int GapBetweenReels = 60; // seconds

std::string transitionText(const EventList& events, std::size_t index, const PictureRules& rules)
{
    const EventBase& event = events.at(index);
    std::string text = std::to_string(event.transitionType()) + " of " + std::to_string(event.transitionDuration()) +
                       " at " + std::to_string(std::lround(event.motionSpeed() * 100)) + " % to " +
                       core::nameBy(rules.matchBy, event) + " from " + event.srcIn().toString();
    if (index > 0 && events.at(index - 1).eventNumber() == event.eventNumber())
        text += " out of " + core::nameBy(rules.matchBy, events.at(index - 1)) + " at " +
                events.at(index - 1).srcOut().toString();
    return text;
}

SeenFrame frameOf(const EventList& events, std::size_t index, int frame, const PictureRules& rules)
{
    const EventBase& event = events.at(index);
    const std::string& name = core::nameBy(rules.matchBy, event);
    if (!event.isValid())
        return {"flawed " + event.rollName() + "/" + event.clipName() + event.srcIn().toString() +
                    event.srcOut().toString() + std::to_string(event.transitionType()) + "/" +
                    std::to_string(event.transitionDuration()) + name,
                static_cast<double>(frame)};
    if (event.isTransition() && frame < event.transitionDuration())
        return {transitionText(events, index, rules), static_cast<double>(frame)};
    if (std::abs(event.motionSpeed()) < 0.01)
        return {name + " frozen at " + event.srcIn().toString(), static_cast<double>(frame)};
    const double speed = event.isNormalSpeed() ? 1.0 : event.motionSpeed();
    return {name, event.srcIn().toFrameCount(rules.framerate) + frame * speed, speed};
}

} // namespace

bool SeenFrame::looksLike(const SeenFrame& other) const
{
    if (what != other.what)
        return false;
    if (speed == 1.0 && other.speed == 1.0)
        return source == other.source;
    constexpr double LongestShot = 2000;
    return std::abs(speed - other.speed) < 0.01 &&
           std::abs(source - other.source) <= std::abs(speed) + std::abs(speed - other.speed) * LongestShot;
}

std::vector<std::vector<SeenFrame>> framesOf(const EventList& events, const PictureRules& rules)
{
    std::vector<std::size_t> order;
    for (std::size_t index = 0; index < events.size(); ++index) {
        const EventBase& event = events.at(index);
        if (event.dstIn().isValid(rules.framerate) && event.dstOut().isValid(rules.framerate) &&
            event.dstIn().isInitialized() && event.dstOut().isInitialized() && !event.hasFlaw(EventFlaw::NotVideoEvent))
            order.push_back(index);
    }
    std::stable_sort(order.begin(), order.end(),
                     [&](std::size_t a, std::size_t b) { return events.at(a).dstIn() < events.at(b).dstIn(); });
    std::map<int, SeenFrame> painted;
    for (const std::size_t index : order) {
        const int in = events.at(index).dstIn().toFrameCount(rules.framerate);
        const int out = events.at(index).dstOut().toFrameCount(rules.framerate);
        for (int frame = in; frame < out; ++frame)
            painted[frame] = frameOf(events, index, frame - in, rules);
    }
    std::vector<std::vector<SeenFrame>> reels;
    int next = 0;
    for (const auto& [frame, seen] : painted) {
        if (reels.empty() || frame - next >= GapBetweenReels * rules.framerate.framesPerSecond)
            reels.emplace_back();
        else
            for (int gap = next; gap < frame; ++gap)
                reels.back().push_back({"gap", static_cast<double>(gap - next)});
        reels.back().push_back(seen);
        next = frame + 1;
    }
    return reels;
}

NotesPlayer::NotesPlayer(const EventList& oldCut, const EventList& newCut, const PictureRules& rules,
                         const std::vector<ReelPair>& reels)
{
    const auto oldReels = framesOf(oldCut, rules);
    const auto newReels = framesOf(newCut, rules);
    std::vector<int> used(oldReels.size(), 0);
    for (const ReelPair& pair : reels) {
        m_reels.push_back(pair.oldReel ? oldReels.at(*pair.oldReel) : std::vector<SeenFrame>());
        m_goal.push_back(pair.newReel ? newReels.at(*pair.newReel) : std::vector<SeenFrame>());
        if (pair.oldReel)
            ++used.at(*pair.oldReel);
    }
    for (const int count : used) {
        if (count != 1)
            throw std::logic_error("an old reel is used " + std::to_string(count) + " times");
    }
    for (const auto& reel : newReels)
        m_newFrames.insert(m_newFrames.end(), reel.begin(), reel.end());
}

void NotesPlayer::carryOut(const NoteStep& step)
{
    auto& reel = m_reels.at(step.place.reel);
    const auto check = [](bool isPossible) {
        if (!isPossible)
            throw std::logic_error("a step can't be carried out");
    };
    const auto cutOut = [&](std::vector<SeenFrame>& from, int place, int length) {
        check(place >= 0 && length >= 0 && place + length <= static_cast<int>(from.size()));
        const std::vector<SeenFrame> frames(from.begin() + place, from.begin() + place + length);
        from.erase(from.begin() + place, from.begin() + place + length);
        return frames;
    };
    const auto insert = [&](int place, const std::vector<SeenFrame>& frames) {
        check(place >= 0 && place <= static_cast<int>(reel.size()));
        reel.insert(reel.begin() + place, frames.begin(), frames.end());
    };
    const std::vector<SeenFrame> fromNewCut(m_newFrames.begin() + step.inserted.start,
                                            m_newFrames.begin() + step.inserted.end());
    switch (step.action) {
    case StepAction::Replace:
        cutOut(reel, step.place.frame, step.removed);
        insert(step.place.frame, fromNewCut);
        break;
    case StepAction::Move:
        check(step.moved > 0);
        insert(step.place.frame, cutOut(m_reels.at(step.from.reel), step.from.frame, step.moved));
        break;
    case StepAction::Relabel:
        cutOut(reel, step.place.frame, step.inserted.length);
        insert(step.place.frame, fromNewCut);
        break;
    }
}

std::string NotesPlayer::difference() const
{
    for (std::size_t index = 0; index < m_reels.size(); ++index) {
        const std::string where = "reel " + std::to_string(index);
        if (m_reels[index].size() != m_goal[index].size())
            return where + " has " + std::to_string(m_reels[index].size()) + " frames and not " +
                   std::to_string(m_goal[index].size());
        for (std::size_t frame = 0; frame < m_reels[index].size(); ++frame) {
            if (!m_reels[index][frame].looksLike(m_goal[index][frame]))
                return where + ", frame " + std::to_string(frame) + ": " + m_reels[index][frame].what + " " +
                       std::to_string(m_reels[index][frame].source) + " and not " + m_goal[index][frame].what + " " +
                       std::to_string(m_goal[index][frame].source);
        }
    }
    return {};
}

bool NotesPlayer::isDoneBefore(const core::WorkPlace& place) const
{
    const auto& reel = m_reels.at(place.reel);
    const auto& goal = m_goal.at(place.reel);
    const auto count = static_cast<std::size_t>(place.frame);
    return count <= reel.size() && count <= goal.size() &&
           std::equal(reel.begin(), reel.begin() + place.frame, goal.begin(),
                      [](const SeenFrame& a, const SeenFrame& b) { return a.looksLike(b); });
}

bool NotesPlayer::showsAt(const core::WorkPlace& place, int newStart) const
{
    const SeenFrame& seen = m_reels.at(place.reel).at(static_cast<std::size_t>(place.frame));
    SeenFrame wanted = m_newFrames.at(static_cast<std::size_t>(newStart));
    if (wanted.what.find("VFX") != std::string::npos && seen.what.find("VFX") != std::string::npos)
        wanted.what = seen.what;
    return seen.looksLike(wanted);
}

} // namespace cadrel::tests
