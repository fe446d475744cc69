// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/core/notes/RandomRecut.h"

#include "core/edl/EventBase.h"
#include "tests/support/core/TestProject.h"

#include <algorithm>
#include <memory>
#include <optional>
#include <ostream>
#include <random>
#include <string>

namespace cadrel::tests {

using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::Framerate;
using core::Timecode;
using core::TransitionType;

namespace {

using Random = std::mt19937_64;

constexpr int FirstHour = 90000; // frames at 25 frames a second

int below(Random& random, int count)
{
    return static_cast<int>(random() % static_cast<std::uint64_t>(count));
}

/// A shot before it has a place in the programme. Lengths in frames.
struct Shot {
    std::string roll;
    int srcIn = 0;
    int srcLength = 0;
    int length = 0;
    int gapBefore = 0; ///< below 0: it begins before the end of the shot before
    int transitionType = TransitionType::Cut;
    int transitionDuration = 0;
    bool hasTwoLines = false;
    std::optional<int> flaw;
};

Shot randomShot(Random& random, int rollCount)
{
    Shot shot;
    const int roll = below(random, rollCount);
    shot.roll = roll == 0 ? "VFX_0010_v00" + std::to_string(1 + below(random, 3)) : "A00" + std::to_string(roll);
    shot.srcIn = 1000 + below(random, 8) * 10;
    shot.length = 1 + below(random, 40);
    shot.srcLength = shot.length;
    switch (below(random, 10)) {
    case 0:
        shot.srcLength = shot.length * 2;
        break;
    case 1:
        shot.srcLength = (shot.length + 1) / 2;
        break;
    case 2:
        shot.srcLength = 0;
        break;
    case 3:
        shot.transitionType = 1 + below(random, 2);
        shot.transitionDuration = 1 + below(random, 12);
        shot.hasTwoLines = below(random, 2) == 0;
        break;
    case 4:
        shot.gapBefore = below(random, 10) - 5;
        break;
    case 5:
        if (below(random, 4) == 0)
            shot.gapBefore = 4000 + below(random, 3000);
        break;
    case 6:
        if (below(random, 3) == 0)
            shot.flaw = below(random, 2) == 0 ? EventFlaw::RollNameInvalid : EventFlaw::NotVideoEvent;
        break;
    default:
        break;
    }
    return shot;
}

/// An event of frame counts.
std::shared_ptr<EventBase> eventOf(const Shot& shot, int srcIn, int srcOut, int dstIn, int dstOut, unsigned number)
{
    auto event = std::make_shared<EventBase>();
    event->setRollName(shot.roll);
    event->setEventNumber(number);
    event->setTimecodes(Timecode(srcIn), Timecode(srcOut), Timecode(dstIn), Timecode(dstOut));
    return event;
}

EventList listOf(const std::vector<Shot>& shots, int start = FirstHour)
{
    EventList events;
    int end = start;
    unsigned number = 0;
    std::string before = "BL";
    for (const Shot& shot : shots) {
        const int in = std::max(0, end + shot.gapBefore);
        ++number;
        if (shot.hasTwoLines) {
            Shot outgoing;
            outgoing.roll = before;
            events.add(eventOf(outgoing, 500, 500, in, in, number));
        }
        const int last = Timecode::framerate().lastFrame;
        const int srcIn = std::clamp(shot.srcIn, 0, last);
        const int srcOut = std::min(srcIn + shot.srcLength, last);
        const auto event = eventOf(shot, srcIn, srcOut, in, in + shot.length, number);
        event->setTransitionType(shot.transitionType);
        event->setTransitionDuration(shot.transitionDuration);
        if (shot.flaw)
            event->addFlaw(*shot.flaw);
        events.add(event);
        end = in + shot.length;
        before = shot.roll;
    }
    return events;
}

/// One change somewhere in the programme.
void change(std::vector<Shot>& shots, Random& random, int rollCount)
{
    if (shots.empty()) {
        shots.push_back(randomShot(random, rollCount));
        return;
    }
    const int count = static_cast<int>(shots.size());
    const int place = below(random, count);
    const int length = 1 + below(random, std::min(4, count - place));
    const int goal = below(random, count - length + 1);
    Shot& shot = shots[static_cast<std::size_t>(place)];
    const bool isPlain = shot.srcLength == shot.length;
    const int trim = 1 + below(random, std::max(1, shot.length - 1));
    switch (below(random, 12)) {
    case 0: // the head loses frames
        if (isPlain && shot.length > trim) {
            shot.srcIn += trim;
            shot.srcLength -= trim;
            shot.length -= trim;
        }
        break;
    case 1: // the head wins some
        if (isPlain) {
            shot.srcIn -= trim;
            shot.srcLength += trim;
            shot.length += trim;
        }
        break;
    case 2: // the tail loses frames
        if (isPlain && shot.length > trim) {
            shot.srcLength -= trim;
            shot.length -= trim;
        }
        break;
    case 3: // the tail wins some
        if (isPlain) {
            shot.srcLength += trim;
            shot.length += trim;
        }
        break;
    case 4: // a lift
        shots.erase(shots.begin() + place, shots.begin() + place + length);
        break;
    case 5: // an insert
        shots.insert(shots.begin() + place, randomShot(random, rollCount));
        break;
    case 6: { // a move
        const std::vector<Shot> moved(shots.begin() + place, shots.begin() + place + length);
        shots.erase(shots.begin() + place, shots.begin() + place + length);
        shots.insert(shots.begin() + goal, moved.begin(), moved.end());
        break;
    }
    case 7: { // a double
        const std::vector<Shot> doubled(shots.begin() + place, shots.begin() + place + length);
        shots.insert(shots.begin() + goal, doubled.begin(), doubled.end());
        break;
    }
    case 8: // another speed
        shot.srcLength = shot.length * 2;
        break;
    case 9: // a slip
        shot.srcIn += 7;
        break;
    case 10: // another version
        if (shot.roll.starts_with("VFX"))
            shot.roll.back() = '9';
        break;
    default: // another transition
        shot.transitionType = below(random, 3);
        shot.transitionDuration = shot.transitionType == TransitionType::Cut ? 0 : 1 + below(random, 12);
        shot.hasTwoLines = shot.transitionType != TransitionType::Cut && below(random, 2) == 0;
        break;
    }
}

} // namespace

std::ostream& operator<<(std::ostream& out, const RecutSeed& seed)
{
    return out << seed.setting << ", " << seed.shots.size() << " shots, " << seed.changes.size() << " changes";
}

rc::Gen<RecutSeed> genRecutSeed()
{
    return rc::gen::map(rc::gen::tuple(rc::gen::arbitrary<std::uint64_t>(),
                                       rc::gen::arbitrary<std::vector<std::uint64_t>>(),
                                       rc::gen::arbitrary<std::vector<std::uint64_t>>()),
                        [](const auto& parts) {
                            return RecutSeed{std::get<0>(parts), std::get<1>(parts), std::get<2>(parts)};
                        });
}

RandomRecut::RandomRecut(const RecutSeed& seed)
{
    Random setting(seed.setting);
    const int rollCount = 1 + below(setting, 6);
    rules.framerate = below(setting, 4) == 0 ? Framerate(30, 1) : Framerate(25, 0);
    if (below(setting, 2) == 0)
        rules.versions.compile({{"VFX_0010_v", ""}});
    const TestProject project(rules.framerate);
    std::vector<Shot> shots;
    for (const std::uint64_t number : seed.shots) {
        Random random(number);
        shots.push_back(randomShot(random, rollCount));
    }
    oldCut = listOf(shots);
    for (const std::uint64_t number : seed.changes) {
        Random random(number);
        change(shots, random, rollCount);
    }
    // One cut in three begins elsewhere.
    constexpr int Most = 10000;
    newCut = listOf(shots, FirstHour + (below(setting, 3) == 0 ? below(setting, 2 * Most) - Most : 0));
}

namespace {

using ReelOfShots = std::vector<Shot>;

int lengthOf(const ReelOfShots& reel)
{
    int length = 0;
    for (const Shot& shot : reel)
        length += shot.length;
    return length;
}

/// Each some seconds more than a minute after the end of the one before.
EventList timelineOf(const std::vector<ReelOfShots>& reels, int start, Random& random)
{
    EventList events;
    for (const ReelOfShots& reel : reels) {
        if (reel.empty())
            continue;
        events.append(listOf(reel, start));
        start += lengthOf(reel) + 1500 + below(random, 1500);
    }
    return events;
}

Shot longShot(Random& random, int number)
{
    Shot shot;
    shot.roll = std::string("L").append(std::to_string(number));
    shot.srcIn = 1000;
    shot.length = 100 + below(random, 1500);
    shot.srcLength = shot.length;
    return shot;
}

/// One change to whole shots or to whole reels.
void changeTimeline(std::vector<ReelOfShots>& reels, Random& random, int number)
{
    ReelOfShots& reel = reels[static_cast<std::size_t>(below(random, static_cast<int>(reels.size())))];
    ReelOfShots& other = reels[static_cast<std::size_t>(below(random, static_cast<int>(reels.size())))];
    const auto placeIn = [&random](const ReelOfShots& shots) {
        return below(random, static_cast<int>(shots.size()) + 1);
    };
    switch (below(random, 12)) {
    case 10:
        if (&reel != &other) {
            other.insert(other.end(), reel.begin(), reel.end());
            reel.clear();
        }
        break;
    case 11: {
        const auto half = reel.begin() + placeIn(reel);
        const ReelOfShots rest(half, reel.end());
        reel.erase(half, reel.end());
        reels.insert(reels.begin() + below(random, static_cast<int>(reels.size()) + 1), rest);
        break;
    }
    case 0:
        std::swap(reel, other);
        break;
    case 1:
        if (below(random, 4) == 0)
            reel.clear();
        break;
    case 2:
        if (below(random, 2) == 0)
            reels.insert(reels.begin() + below(random, static_cast<int>(reels.size())), {longShot(random, number)});
        break;
    case 3:
    case 4:
        reel.insert(reel.begin() + placeIn(reel), longShot(random, number));
        break;
    case 5:
    case 6:
        if (!reel.empty())
            reel.erase(reel.begin() + below(random, static_cast<int>(reel.size())));
        break;
    default:
        if (!reel.empty()) {
            const int place = below(random, static_cast<int>(reel.size()));
            const Shot moved = reel[static_cast<std::size_t>(place)];
            reel.erase(reel.begin() + place);
            other.insert(other.begin() + placeIn(other), moved);
        }
        break;
    }
}

} // namespace

RandomTimeline::RandomTimeline(std::uint64_t seed)
{
    Random random(seed);
    rules.framerate = Framerate(25, 0);
    const TestProject project(rules.framerate);
    int number = 0;
    std::vector<ReelOfShots> reels(static_cast<std::size_t>(2 + below(random, 3)));
    for (ReelOfShots& reel : reels) {
        for (int shot = 0; shot < 5; ++shot)
            reel.push_back(longShot(random, ++number));
    }
    oldCut = timelineOf(reels, FirstHour, random);
    const int changes = below(random, 8);
    for (int count = 0; count < changes; ++count)
        changeTimeline(reels, random, ++number);
    const int shift = below(random, 2) == 0 ? 0 : below(random, 20000) - 10000;
    newCut = timelineOf(reels, FirstHour + shift, random);
}

EventList recutOf(const EventList& events, const Framerate& framerate, std::uint64_t seed)
{
    std::vector<Shot> shots;
    for (const auto& event : events.events()) {
        if (!event->isValid() || !(event->dstIn() < event->dstOut()))
            continue;
        Shot shot;
        shot.roll = event->rollName();
        shot.srcIn = event->srcIn().toFrameCount(framerate);
        shot.srcLength = event->srcOut().toFrameCount(framerate) - shot.srcIn;
        shot.length = event->dstOut().toFrameCount(framerate) - event->dstIn().toFrameCount(framerate);
        shot.transitionType = event->transitionType();
        shot.transitionDuration = event->transitionDuration();
        shots.push_back(shot);
    }
    Random random(seed);
    for (std::size_t count = 0; count < 1 + shots.size() / 8; ++count)
        change(shots, random, 5);
    return listOf(shots);
}

} // namespace cadrel::tests
