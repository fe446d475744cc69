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
using core::FrameSpan;
using core::NoteStep;
using core::PictureRules;
using core::ReelChange;
using core::StepAction;

namespace {

constexpr int GapBetweenReels = 60; // seconds

/// `before` is the event that is seen right before this one, or null.
std::string transitionText(const EventList& events, std::size_t index, const EventBase* before,
                           const PictureRules& rules)
{
    const EventBase& event = events.at(index);
    std::string text = std::to_string(event.transitionType()) + " of " + std::to_string(event.transitionDuration()) +
                       " to " + core::nameBy(rules.matchBy, event) + " from " + event.srcIn().toString();
    if (index > 0 && events.at(index - 1).eventNumber() == event.eventNumber())
        text += " out of " + core::nameBy(rules.matchBy, events.at(index - 1)) + " at " +
                events.at(index - 1).srcOut().toString();
    else if (before != nullptr && before->dstOut() == event.dstIn())
        text += " out of " + core::nameBy(rules.matchBy, *before) + " at " + before->srcOut().toString();
    return text;
}

bool isFrozen(const EventBase& event, const PictureRules& rules)
{
    const auto count = [&rules](const core::Timecode& timecode) { return timecode.toFrameCount(rules.framerate); };
    const int source = count(event.srcOut()) - count(event.srcIn());
    return source == 0 || (source == 1 && count(event.dstOut()) - count(event.dstIn()) > 1);
}

SeenFrame frameOf(const EventList& events, std::size_t index, const EventBase* before, int frame,
                  const PictureRules& rules)
{
    const EventBase& event = events.at(index);
    const std::string& name = core::nameBy(rules.matchBy, event);
    if (!event.isValid())
        return {"flawed " + event.rollName() + "/" + event.clipName() + event.srcIn().toString() +
                    event.srcOut().toString() + std::to_string(event.transitionType()) + "/" +
                    std::to_string(event.transitionDuration()) + name,
                static_cast<double>(frame)};
    const bool isStill = isFrozen(event, rules);
    const double speed = isStill || event.isNormalSpeed() ? 1.0 : event.motionSpeed();
    const int length = event.dstOut().toFrameCount(rules.framerate) - event.dstIn().toFrameCount(rules.framerate);
    if (event.isTransition() && frame < event.transitionDuration())
        return {transitionText(events, index, before, rules) + (isStill ? " frozen" : ""), frame * speed, speed, length,
                frame};
    if (isStill)
        return {name + " frozen at " + event.srcIn().toString(), static_cast<double>(frame)};
    return {name, event.srcIn().toFrameCount(rules.framerate) + frame * speed, speed, length, frame};
}

} // namespace

bool SeenFrame::looksLike(const SeenFrame& other) const
{
    if (what != other.what)
        return false;
    if (speed == 1.0 && other.speed == 1.0)
        return source == other.source;
    constexpr double LongestShot = 2000;
    const double apart = std::abs(speed - other.speed);
    if (apart < 0.01)
        return std::abs(source - other.source) <= std::abs(speed) + apart * LongestShot;
    const double common = shotLength < other.shotLength ? other.speed : speed;
    const auto sourceAt = [common](const SeenFrame& frame) {
        return frame.source + frame.shotFrame * (common - frame.speed);
    };
    return apart * std::min(shotLength, other.shotLength) < 1.0 - 1e-6 &&
           std::abs(sourceAt(*this) - sourceAt(other)) <= common + 1.0;
}

std::vector<SeenReel> framesOf(const EventList& events, const PictureRules& rules)
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
    std::map<int, std::size_t> painted;
    for (const std::size_t index : order) {
        const int in = events.at(index).dstIn().toFrameCount(rules.framerate);
        const int out = events.at(index).dstOut().toFrameCount(rules.framerate);
        for (int frame = in; frame < out; ++frame)
            painted[frame] = index;
    }
    std::map<std::size_t, const EventBase*> before; // what is seen before each event
    for (const auto& [frame, index] : painted) {
        const auto frameBefore = painted.find(frame - 1);
        before.emplace(index, frameBefore == painted.end() ? nullptr : &events.at(frameBefore->second));
    }
    std::vector<SeenReel> reels;
    int next = 0;
    for (const auto& [frame, index] : painted) {
        if (reels.empty() || frame - next >= GapBetweenReels * rules.framerate.framesPerSecond)
            reels.push_back({frame, {}});
        else
            for (int gap = next; gap < frame; ++gap)
                reels.back().frames.push_back({"gap", static_cast<double>(gap - next)});
        const int in = events.at(index).dstIn().toFrameCount(rules.framerate);
        reels.back().frames.push_back(frameOf(events, index, before.at(index), frame - in, rules));
        next = frame + 1;
    }
    return reels;
}

NotesPlayer::NotesPlayer(const EventList& oldCut, const EventList& newCut, const PictureRules& rules,
                         const std::vector<ReelChange>& reels)
{
    const auto oldReels = framesOf(oldCut, rules);
    const auto newReels = framesOf(newCut, rules);
    std::vector<int> used(oldReels.size(), 0);
    for (const ReelChange& pair : reels) {
        m_reels.push_back(pair.oldReel ? oldReels.at(*pair.oldReel) : SeenReel{newReels.at(*pair.newReel).start, {}});
        m_goal.push_back(pair.newReel ? newReels.at(*pair.newReel) : SeenReel{oldReels.at(*pair.oldReel).start, {}});
        if (pair.oldReel)
            ++used.at(*pair.oldReel);
    }
    for (const int count : used) {
        if (count != 1)
            throw std::logic_error("an old reel is used " + std::to_string(count) + " times");
    }
    for (const auto& [start, frames] : newReels)
        m_newFrames.insert(m_newFrames.end(), frames.begin(), frames.end());
}

void NotesPlayer::carryOut(const NoteStep& step)
{
    carryOutAlone(step);
    if (const std::string wrong = overlap(); !wrong.empty())
        throw std::logic_error(wrong);
}

/// Which reels lie on each other; empty for none.
std::string NotesPlayer::overlap() const
{
    std::map<int, std::size_t> byStart;
    for (std::size_t index = 0; index < m_reels.size(); ++index) {
        if (!m_reels[index].frames.empty() && !byStart.emplace(m_reels[index].start, index).second)
            return "two reels begin at " + std::to_string(m_reels[index].start);
    }
    const SeenReel* before = nullptr;
    for (const auto& [start, index] : byStart) {
        if (before != nullptr && before->start + static_cast<int>(before->frames.size()) > start)
            return "the reel at " + std::to_string(before->start) + " lies on that at " + std::to_string(start);
        before = &m_reels[index];
    }
    return {};
}

int NotesPlayer::timecodeAt(const core::WorkPlace& place) const
{
    const SeenReel& reel = m_reels.at(place.reel);
    return (reel.frames.empty() ? place.reelStart : reel.start) + place.frame;
}

void NotesPlayer::carryOutAlone(const NoteStep& step)
{
    if (step.action != StepAction::MoveReel && m_reels.at(step.place.reel).frames.empty())
        m_reels.at(step.place.reel).start = step.place.reelStart;
    auto& reel = m_reels.at(step.place.reel).frames;
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
        insert(step.place.frame, cutOut(m_reels.at(step.from.reel).frames, step.from.frame, step.moved));
        break;
    case StepAction::Relabel:
        cutOut(reel, step.place.frame, step.inserted.length);
        insert(step.place.frame, fromNewCut);
        break;
    case StepAction::MoveReel:
        check(!reel.empty() && step.place.frame == 0 && step.changes.front().frames != 0 &&
              step.from.timecode() == m_reels.at(step.from.reel).start);
        m_reels.at(step.place.reel).start += step.changes.front().frames;
        check(step.place.timecode() == m_reels.at(step.place.reel).start);
        break;
    }
}

std::string NotesPlayer::difference() const
{
    for (std::size_t index = 0; index < m_reels.size(); ++index) {
        const std::string where = "reel " + std::to_string(index);
        const auto& [start, frames] = m_reels[index];
        const auto& [goalStart, goal] = m_goal[index];
        if (start != goalStart && !goal.empty())
            return where + " begins at " + std::to_string(start) + " and not " + std::to_string(goalStart);
        if (frames.size() != goal.size())
            return where + " has " + std::to_string(frames.size()) + " frames and not " + std::to_string(goal.size());
        for (std::size_t frame = 0; frame < frames.size(); ++frame) {
            if (!frames[frame].looksLike(goal[frame]))
                return where + ", frame " + std::to_string(frame) + ": " + frames[frame].what + " " +
                       std::to_string(frames[frame].source) + " and not " + goal[frame].what + " " +
                       std::to_string(goal[frame].source);
        }
    }
    return {};
}

bool NotesPlayer::isDoneBefore(const core::WorkPlace& place) const
{
    const auto& [start, frames] = m_reels.at(place.reel);
    const auto& [goalStart, goal] = m_goal.at(place.reel);
    const auto count = static_cast<std::size_t>(place.frame);
    return ((frames.empty() ? place.reelStart : start) == goalStart || goal.empty()) && count <= frames.size() &&
           count <= goal.size() &&
           std::equal(frames.begin(), frames.begin() + place.frame, goal.begin(),
                      [](const SeenFrame& a, const SeenFrame& b) { return a.looksLike(b); });
}

bool NotesPlayer::showsAt(const core::WorkPlace& place, int newStart) const
{
    const SeenFrame& seen = m_reels.at(place.reel).frames.at(static_cast<std::size_t>(place.frame));
    SeenFrame wanted = m_newFrames.at(static_cast<std::size_t>(newStart));
    if (wanted.what.find("VFX") != std::string::npos && seen.what.find("VFX") != std::string::npos)
        wanted.what = seen.what;
    return seen.looksLike(wanted);
}

} // namespace cadrel::tests
