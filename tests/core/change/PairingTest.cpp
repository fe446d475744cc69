// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/change/ChangeEdlGenerator.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/settings/Settings.h"
#include "core/time/Timecode.h"
#include "tests/core/change/AmpleTime.h"
#include "tests/core/change/PairwiseGenerator.h"
#include "tests/support/SecondsOf.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <ostream>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::ChangeEdlGenerator;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::MatchBy;
using core::Timecode;
using core::TransitionType;
using core::VfxPatternEntry;
using util::Result;

/// A whole number as a stack of choices, the first of which is the simplest. Shrinking the number towards zero makes
/// one choice after the other simple.
class Choices {
public:
    explicit Choices(std::uint64_t number) : m_number(number) {}

    int below(int count)
    {
        const auto divisor = static_cast<std::uint64_t>(count);
        const auto choice = static_cast<int>(m_number % divisor);
        m_number /= divisor;
        return choice;
    }
    template <typename T, std::size_t N>
    const T& oneOf(const T (&values)[N])
    {
        return values[static_cast<std::size_t>(below(static_cast<int>(N)))];
    }

private:
    std::uint64_t m_number;
};

/// What a random film is made from: a number for its setting and one for each event.
struct FilmSeed {
    std::uint64_t setting = 0;
    std::vector<std::uint64_t> oldEvents;
    std::vector<std::uint64_t> newEvents;
};

std::ostream& operator<<(std::ostream& out, const FilmSeed& seed)
{
    return out << seed.setting << ", " << seed.oldEvents.size() << " old and " << seed.newEvents.size()
               << " new events";
}

/// What an event is, without its place in the programme. Lengths and places are in frames.
struct Shot {
    std::string roll;
    std::string clip;
    int srcIn = 0;
    int srcLength = 0;
    int dstLength = 0;
    int transitionType = TransitionType::Cut;
    int transitionDuration = 0;
    bool sharesNumber = false;
};

enum class Damage { None, SrcReversed, DstReversed, SrcOutOfRate, DstInOutOfRate, Unreadable, Uninitialized };

enum class Speeds { Normal, Odd, Freezes };

/// A pair of small EDLs in which everything happens often that is rare in a reel: the same material in many places,
/// nested and chained source ranges, ties, transitions longer than their event, odd speeds, flaws.
class Film {
public:
    explicit Film(const FilmSeed& seed) : m_setting(seed.setting)
    {
        framerate = m_setting.oneOf(
            {Framerate(25, 0), Framerate(24, 0), Framerate(30, 1), Framerate(30, true, 1), Framerate(24, true, 0)});
        matchBy = m_setting.oneOf<int>({MatchBy::RollName, MatchBy::ClipName, MatchBy::RollName});
        m_nameCount = m_setting.oneOf({1, 2, 1, 4, 0});
        vfxRows = m_setting.oneOf(VfxRows);
        m_grid = m_setting.oneOf({10, 25, 1, 4});
        m_placeCount = m_setting.oneOf({3, 12, 1, 40});
        const int nearTheEnd = framerate.lastFrame - 400;
        m_srcBase = m_setting.oneOf({0, 90000, 0, 90000, 0, 90000, 0, nearTheEnd});
        m_dstBase = m_setting.oneOf({0, 90000, 0, 90000, 0, 90000, 0, nearTheEnd});
        m_hasMaterialInARow = m_setting.below(3) == 1;
        m_hasDailies = m_setting.below(4) == 1;
        m_hasOnlyCuts = m_setting.below(3) == 0;
        m_speeds = m_setting.oneOf({Speeds::Normal, Speeds::Odd, Speeds::Normal, Speeds::Freezes});
        m_hasTrims = m_setting.below(3) == 1;
        m_hasDamage = m_setting.below(4) == 1;
        m_hasBadDurations = m_setting.below(16) == 1;
        m_order = m_setting.below(4);
        m_copyShift = static_cast<std::size_t>(m_setting.below(3));

        const TestProject project(framerate);
        std::vector<Shot> oldShots;
        int sourceEnd = m_srcBase;
        for (const std::uint64_t number : seed.oldEvents) {
            Choices choices(number);
            Shot shot = newShot(choices);
            if (m_hasMaterialInARow) {
                shot.srcIn = std::max(m_srcBase, sourceEnd + choices.oneOf({0, -3, 5}));
                sourceEnd = shot.srcIn + shot.srcLength;
            }
            // In an old programme of whole dailies all candidates are equally far from their new place, but for the last
            // bit of the seconds.
            if (m_hasDailies)
                m_programmeEnd = shot.srcIn - m_srcBase;
            oldShots.push_back(shot);
            place(oldShots.back(), choices, oldEvents);
        }
        m_programmeEnd = 0;
        m_lastIn = 0;
        for (std::size_t i = 0; i < seed.newEvents.size(); ++i) {
            Choices choices(seed.newEvents[i]);
            const bool isNew = choices.below(3) == 0 || oldShots.empty();
            Shot shot = isNew ? newShot(choices) : oldShots[(i + m_copyShift) % oldShots.size()];
            if (!isNew && m_hasTrims)
                trim(shot, choices);
            place(shot, choices, newEvents);
        }
    }

    Framerate framerate;
    int matchBy;
    std::vector<VfxPatternEntry> vfxRows;
    EventList oldEvents;
    EventList newEvents;

private:
    static const std::vector<VfxPatternEntry> VfxRows[4];

    std::string newName(Choices& choices)
    {
        if (m_nameCount == 0)
            return {};
        const std::string letter(1, static_cast<char>('A' + choices.below(m_nameCount)));
        if (vfxRows.empty())
            return letter;
        const std::string version = std::to_string(choices.below(3));
        return choices.oneOf<std::string>(
            {"SHOT_" + letter + "_V" + version + "_COMP", letter, "VFX_" + version, "SHOT_" + letter + "_V_COMP"});
    }

    Shot newShot(Choices& choices)
    {
        Shot shot;
        shot.roll = newName(choices);
        shot.clip = newName(choices);
        shot.srcIn = m_srcBase + m_grid * choices.below(m_placeCount);
        shot.srcLength = choices.oneOf({10, 20, 24, 100, 50, 51, 1, 2, 3, 5, 0, 101, 200});
        shot.dstLength = shot.srcLength;
        if (m_speeds == Speeds::Odd)
            shot.dstLength = oddLength(shot.srcLength, choices);
        if (m_speeds == Speeds::Freezes)
            shot.dstLength = choices.oneOf({150, 101, 400}) * shot.srcLength;
        if (!m_hasOnlyCuts)
            shot.transitionType =
                choices.oneOf<int>({TransitionType::Cut, TransitionType::Dissolve, TransitionType::Cut,
                                    TransitionType::Wipe, TransitionType::Cut, TransitionType::Dissolve, 3});
        if (shot.transitionType != TransitionType::Cut || choices.below(32) == 1)
            shot.transitionDuration = choices.oneOf({4, 8, 1, 0, 12, 60, 250});
        if (m_hasBadDurations && choices.below(8) == 1)
            shot.transitionDuration = choices.oneOf({-1, 5000000, 2000000});
        shot.sharesNumber = choices.below(2) == 1;
        return shot;
    }

    /// The length in the programme of a shot that is slow, fast or frozen, or nearly at normal speed.
    static int oddLength(int length, Choices& choices)
    {
        return choices.oneOf({length, 2 * length, length / 2, 3 * length / 2, length + 1, std::max(0, length - 1),
                              200 * length, 100 * length, 50 * length, length / 50, 99 * length / 100, 100, 10, 0});
    }

    /// The picture editor's changes of a shot that stays.
    static void trim(Shot& shot, Choices& choices)
    {
        const int frames = choices.oneOf({0, 1, 0, 3, 6});
        const bool isAtHead = choices.below(2) == 1;
        if (isAtHead)
            shot.srcIn += frames;
        shot.srcLength = std::max(0, shot.srcLength - frames);
        shot.dstLength = std::max(0, shot.dstLength - frames);
        if (choices.below(8) == 1)
            shot.transitionDuration += 1;
        if (choices.below(8) == 1)
            shot.dstLength += 1;
    }

    void place(const Shot& shot, Choices& choices, EventList& list)
    {
        const int gap = choices.oneOf({0, 0, 0, 1, 7, -4});
        const bool coversThePrevious = choices.below(8) == 1;
        const int dstIn = coversThePrevious ? m_lastIn : std::max(0, m_programmeEnd + gap);
        const auto damage = m_hasDamage
                                ? choices.oneOf({Damage::None, Damage::None, Damage::None, Damage::None, Damage::None,
                                                 Damage::SrcReversed, Damage::DstReversed, Damage::SrcOutOfRate,
                                                 Damage::DstInOutOfRate, Damage::Unreadable, Damage::Uninitialized})
                                : Damage::None;
        m_lastIn = dstIn;
        m_programmeEnd = dstIn + shot.dstLength;

        const auto event = std::make_shared<EventBase>();
        event->setRollName(shot.roll);
        event->setClipName(shot.clip);
        event->setTransitionType(shot.transitionType);
        event->setTransitionDuration(shot.transitionDuration);
        setTimes(*event, damage, inDay(shot.srcIn), inDay(shot.srcIn + shot.srcLength), inDay(m_dstBase + dstIn),
                 inDay(m_dstBase + m_programmeEnd));
        const auto number = static_cast<std::uint32_t>(list.size());
        event->setEventNumber(shot.sharesNumber && number > 0 ? list.at(number - 1).eventNumber() : number + 1);
        addInOrder(event, list);
    }

    Timecode inDay(int frame) const { return Timecode(std::min(frame, framerate.lastFrame)); }

    static void setTimes(EventBase& event, Damage damage, Timecode srcIn, Timecode srcOut, Timecode dstIn,
                         Timecode dstOut)
    {
        if (damage == Damage::SrcReversed)
            std::swap(srcIn, srcOut);
        if (damage == Damage::DstReversed)
            std::swap(dstIn, dstOut);
        if (damage == Damage::SrcOutOfRate)
            srcOut.set(srcOut.hours(), srcOut.minutes(), srcOut.seconds(), 30);
        if (damage == Damage::DstInOutOfRate)
            dstIn.set(dstIn.hours(), dstIn.minutes(), dstIn.seconds(), 31);
        if (damage == Damage::Unreadable)
            event.addFlaw(core::EventFlaw::NotVideoEvent);
        event.setSrc(srcIn, srcOut);
        if (damage != Damage::Uninitialized)
            event.setDst(dstIn, dstOut);
    }

    void addInOrder(const std::shared_ptr<EventBase>& event, EventList& list) const
    {
        const bool comesFirst = m_order == 1 || (m_order == 2 && list.size() % 3 == 2);
        if (!comesFirst) {
            list.add(event);
            return;
        }
        EventList others = list;
        list.clear();
        list.add(event);
        list.append(others);
    }

    Choices m_setting;
    int m_nameCount;
    int m_grid;
    int m_placeCount;
    int m_srcBase;
    int m_dstBase;
    bool m_hasMaterialInARow;
    bool m_hasDailies;
    bool m_hasOnlyCuts;
    Speeds m_speeds;
    bool m_hasTrims;
    bool m_hasDamage;
    bool m_hasBadDurations;
    int m_order;
    std::size_t m_copyShift;
    int m_programmeEnd = 0;
    int m_lastIn = 0;
};

const std::vector<VfxPatternEntry> Film::VfxRows[4] = {
    {},
    {VfxPatternEntry("SHOT_*_V", "_COMP", true)},
    {VfxPatternEntry("", "", true), VfxPatternEntry("VFX_", "", true), VfxPatternEntry("SHOT_A_V", "_COMP", false)},
    {},
};

/// Every field of every event, a line each.
std::string textOf(const EventList& list)
{
    std::ostringstream text;
    for (const auto& event : list.events()) {
        text << event->eventNumber() << " [" << event->rollName() << "] [" << event->clipName() << "] "
             << event->transitionType() << "/" << event->transitionDuration() << " " << event->srcIn().toString() << " "
             << event->srcOut().toString() << " " << event->dstIn().toString() << " " << event->dstOut().toString()
             << " x" << event->motionSpeed() << (event->vfx() ? " vfx" : "") << (event->isValid() ? "" : " invalid")
             << " kind " << event->eventKind() << " [" << event->edlFileName() << event->comment() << "]\n";
    }
    return text.str();
}

/// The change list as text, or the result that was thrown.
template <typename Generator>
std::string outcomeOf(const Generator& generator, const Film& film)
{
    EventList changeEvents;
    try {
        generator.generate(film.oldEvents, film.newEvents, changeEvents);
    } catch (Result::Type result) {
        return "throws " + std::to_string(result);
    }
    return textOf(changeEvents);
}

std::string outcomeOfThePairwise(const Film& film)
{
    return outcomeOf(PairwiseGenerator(film.matchBy, film.vfxRows), film);
}

std::string outcomeOfTheGenerator(const Film& film)
{
    ChangeEdlGenerator generator;
    generator.configure(film.matchBy, film.vfxRows);
    return outcomeOf(generator, film);
}

rc::Gen<FilmSeed> anyFilm(int largestList)
{
    const auto number = rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>());
    const auto numbers = rc::gen::resize(largestList, rc::gen::container<std::vector<std::uint64_t>>(number));
    return rc::gen::build<FilmSeed>(rc::gen::set(&FilmSeed::setting, number),
                                    rc::gen::set(&FilmSeed::oldEvents, numbers),
                                    rc::gen::set(&FilmSeed::newEvents, numbers));
}

void checkFilm(const FilmSeed& seed)
{
    const Film film(seed);
    const TestProject project(film.framerate);
    const std::string oldBefore = textOf(film.oldEvents);
    const std::string newBefore = textOf(film.newEvents);
    const std::string expected = outcomeOfThePairwise(film);

    const std::string found = outcomeOfTheGenerator(film);

    if (found != expected)
        RC_FAIL("at " + std::to_string(film.framerate.rate) + " fps, matching " + std::to_string(film.matchBy) +
                "\nold\n" + oldBefore + "new\n" + newBefore + "pairwise\n" + expected + "generated\n" + found);
    RC_ASSERT(textOf(film.oldEvents) == oldBefore);
    RC_ASSERT(textOf(film.newEvents) == newBefore);
}

} // namespace

RC_GTEST_PROP(Pairing, SmallFilmsGiveWhatPairingOneByOneGives, ())
{
    for (const FilmSeed& seed : *rc::gen::container<std::vector<FilmSeed>>(50, anyFilm(24)))
        checkFilm(seed);
}

RC_GTEST_PROP(Pairing, LargerFilmsGiveWhatPairingOneByOneGives, ())
{
    checkFilm(*anyFilm(80));
}

namespace {

/// Twice the place in the source that stays where it is when a list is played backwards.
constexpr int Mirror = 400000;

/// The same programme of material that was shot the other way round, so that each shot has to be reversed.
EventList mirrored(const EventList& list)
{
    EventList copy;
    copy.copyFrom(list);
    for (const auto& event : copy.events()) {
        event->setSrc(Timecode(Mirror - event->srcOut().toFrameCount()),
                      Timecode(Mirror - event->srcIn().toFrameCount()));
        event->setReversed(true);
    }
    return copy;
}

/// Near the ends of the day a transition of impossible length fails on one side alone.
bool canBeMirrored(const EventList& list)
{
    return std::all_of(list.events().begin(), list.events().end(), [](const auto& event) {
        return event->isValid() && event->srcOut().toFrameCount() < Mirror / 2 && event->transitionDuration() < Mirror;
    });
}

std::vector<std::string> allTimecodesOf(const EventList& list)
{
    std::vector<std::string> timecodes;
    for (const auto& event : list.events())
        timecodes.push_back(timecodesOf(*event));
    return timecodes;
}

} // namespace

RC_GTEST_PROP(Pairing, ReversedShotsOfMirroredMaterialGiveWhatTheShotsGive, ())
{
    const Film film(*anyFilm(40));
    const TestProject project(film.framerate);
    RC_PRE(canBeMirrored(film.oldEvents) && canBeMirrored(film.newEvents));
    ChangeEdlGenerator generator;
    generator.configure(film.matchBy, film.vfxRows);
    const auto passOver = [](const core::GenerationFailure&) { return core::FailureAnswer::PassOver; };
    EventList changes;
    generator.generate(film.oldEvents, film.newEvents, changes, passOver);

    EventList mirroredChanges;
    generator.generate(mirrored(film.oldEvents), mirrored(film.newEvents), mirroredChanges, passOver);

    if (allTimecodesOf(mirroredChanges) != allTimecodesOf(changes))
        RC_FAIL("old\n" + textOf(film.oldEvents) + "new\n" + textOf(film.newEvents) + "gives\n" + textOf(changes) +
                "reversed\n" + textOf(mirroredChanges));
}

namespace {

constexpr double AmpleSeconds = IsSanitized ? 60.0 : IsOptimized ? 2.0 : 10.0;
constexpr int ManyEvents = 20000;
constexpr int ShotLength = 100;

std::shared_ptr<EventBase> makeShot(int srcIn, int dstIn, int length)
{
    const auto event = std::make_shared<EventBase>();
    event->setRollName("ONE_NAME");
    event->setTimecodes(Timecode(srcIn), Timecode(srcIn + length), Timecode(dstIn), Timecode(dstIn + length));
    return event;
}

/// A list of shots of one length, each from where in its source `srcInOf` says, in a row in the programme.
template <typename SrcInOf>
EventList rowOfShots(int count, SrcInOf srcInOf)
{
    EventList list;
    for (int i = 0; i < count; ++i)
        list.add(makeShot(srcInOf(i), i * ShotLength, ShotLength));
    return list;
}

/// Generates within a time that is ample for work close to n log n, and far too short for pairing one by one.
EventList generatedInTime(const EventList& oldEvents, const EventList& newEvents)
{
    EventList changeEvents;
    EXPECT_LT(secondsOf([&] { ChangeEdlGenerator().generate(oldEvents, newEvents, changeEvents); }), AmpleSeconds);
    return changeEvents;
}

/// Expects an event of one shot's length that carries the material at `oldIn` to `newIn`; quick, for thousands of them.
void expectChange(const EventBase& event, int number, int oldIn, int newIn, int length = ShotLength)
{
    const bool isRight = event.eventNumber() == static_cast<std::uint32_t>(number) &&
                         event.srcIn() == Timecode(oldIn) && event.srcOut() == Timecode(oldIn + length) &&
                         event.dstIn() == Timecode(newIn) && event.dstOut() == Timecode(newIn + length);
    ASSERT_TRUE(isRight) << "event " << number << ": from " << oldIn << " to " << newIn << ", but found "
                         << timecodesOf(event);
}

} // namespace

TEST(PairingSpeed, DistinctMaterialUnderOneNameIsFoundAtItsPlace)
{
    const EventList oldEvents = rowOfShots(ManyEvents, [](int i) { return i * ShotLength; });
    const EventList newEvents = rowOfShots(ManyEvents, [](int i) { return (ManyEvents - 1 - i) * ShotLength; });

    const EventList changeEvents = generatedInTime(oldEvents, newEvents);

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents});
    for (int i = 0; i < ManyEvents; ++i) {
        const int oldIn = (ManyEvents - 1 - i) * ShotLength;
        ASSERT_NO_FATAL_FAILURE(
            expectChange(changeEvents.at(static_cast<std::size_t>(i)), i + 1, oldIn, i * ShotLength));
    }
}

//  old programme   |A|B|C| ... |Y|Z|
//  new programme   |--- A to M ---|N|O| ... |Z|
TEST(PairingSpeed, ALongNewShotGivesAnEventForEachOldShotInIt)
{
    constexpr int Covered = ManyEvents / 2;
    const EventList oldEvents = rowOfShots(ManyEvents, [](int i) { return i * ShotLength; });
    EventList newEvents;
    newEvents.add(makeShot(0, 0, Covered * ShotLength));
    for (int i = Covered; i < ManyEvents; ++i)
        newEvents.add(makeShot(i * ShotLength, i * ShotLength, ShotLength));

    const EventList changeEvents = generatedInTime(oldEvents, newEvents);

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents});
    for (int i = 0; i < ManyEvents; ++i)
        ASSERT_NO_FATAL_FAILURE(
            expectChange(changeEvents.at(static_cast<std::size_t>(i)), i + 1, i * ShotLength, i * ShotLength));
}

TEST(PairingSpeed, ALongOldShotGivesAnEventForEachNewShotInIt)
{
    constexpr int Covered = ManyEvents / 2;
    EventList oldEvents;
    oldEvents.add(makeShot(0, 0, Covered * ShotLength));
    for (int i = Covered; i < ManyEvents; ++i)
        oldEvents.add(makeShot(i * ShotLength, i * ShotLength, ShotLength));
    const EventList newEvents = rowOfShots(ManyEvents, [](int i) { return (ManyEvents - 1 - i) * ShotLength; });

    const EventList changeEvents = generatedInTime(oldEvents, newEvents);

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents});
    for (int i = 0; i < ManyEvents; ++i) {
        const int oldIn = (ManyEvents - 1 - i) * ShotLength;
        ASSERT_NO_FATAL_FAILURE(
            expectChange(changeEvents.at(static_cast<std::size_t>(i)), i + 1, oldIn, i * ShotLength));
    }
}

// Every old place fits every new one; the placement before decides, which starts with no displacement.
TEST(PairingSpeed, TheSameStretchInManyPlacesStaysWhereItWas)
{
    const EventList oldEvents = rowOfShots(ManyEvents, [](int) { return 0; });
    const EventList newEvents = rowOfShots(ManyEvents, [](int) { return 0; });

    const EventList changeEvents = generatedInTime(oldEvents, newEvents);

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents});
    for (int i = 0; i < ManyEvents; ++i)
        ASSERT_NO_FATAL_FAILURE(
            expectChange(changeEvents.at(static_cast<std::size_t>(i)), i + 1, i * ShotLength, i * ShotLength));
}

// The new programme starts seven frames later, so that of all places the first is the nearest to the first; from there
// on each keeps that displacement.
TEST(PairingSpeed, TheSameStretchInManyPlacesKeepsItsDisplacement)
{
    constexpr int Offset = 7;
    const EventList oldEvents = rowOfShots(ManyEvents, [](int) { return 0; });
    EventList newEvents;
    for (int i = 0; i < ManyEvents; ++i)
        newEvents.add(makeShot(0, Offset + i * ShotLength, ShotLength));

    const EventList changeEvents = generatedInTime(oldEvents, newEvents);

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents});
    for (int i = 0; i < ManyEvents; ++i)
        ASSERT_NO_FATAL_FAILURE(
            expectChange(changeEvents.at(static_cast<std::size_t>(i)), i + 1, i * ShotLength, Offset + i * ShotLength));
}

namespace {

//  source of a new shot   |------------------------------|
//  first old shot         |--------|
//  its twins                     |---------|
//  last old shot                         |---------------|   (each 60 frames)
class PairingSpeedOfTwinsBetweenTwo : public testing::Test {
protected:
    static constexpr int OldLength = 60;
    static constexpr int NewLength = 160;
    static constexpr int TwinStart = 50;
    static constexpr int LastStart = 100;

    /// The old shots in the order of the programme, without a gap.
    static std::vector<std::shared_ptr<EventBase>> oldShots(int count)
    {
        std::vector<std::shared_ptr<EventBase>> shots;
        for (int i = 0; i < count; ++i) {
            const int srcIn = i == 0 ? 0 : i == count - 1 ? LastStart : TwinStart;
            shots.push_back(makeShot(srcIn, i * OldLength, OldLength));
        }
        return shots;
    }

    static EventList newShots(int count)
    {
        EventList list;
        for (int i = 0; i < count; ++i)
            list.add(makeShot(0, i * NewLength, NewLength));
        return list;
    }

    static EventList listOf(const std::vector<std::shared_ptr<EventBase>>& shots)
    {
        EventList list;
        list.append(shots);
        return list;
    }

    // 20,000 shots of 160 frames fit into the day, and seconds are exact, so that a tie is one.
    const TestProject project{Framerate(64, 0)};
};

} // namespace

// The first new shot keeps the first old one where it is, and the last one, which the first doesn't overlap, gets the
// last word on the displacement: 160 frames before the one that it needs for the next new shot. The last twin is 170
// away, and the first old shot very far.
TEST_F(PairingSpeedOfTwinsBetweenTwo, TheLastOneStaysNearestInTheOrderOfTheProgramme)
{
    constexpr int LastIn = (ManyEvents - 1) * OldLength;

    const EventList changeEvents = generatedInTime(listOf(oldShots(ManyEvents)), newShots(ManyEvents));

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents + 1});
    ASSERT_NO_FATAL_FAILURE(expectChange(changeEvents.at(0), 1, 0, 0, OldLength));
    for (int i = 0; i < ManyEvents; ++i)
        ASSERT_NO_FATAL_FAILURE(expectChange(changeEvents.at(static_cast<std::size_t>(i) + 1), i + 2, LastIn,
                                             i * NewLength + LastStart, OldLength));
}

// Behind the first new shot the displacement is that of the first old one. Each further new shot is 160 frames later,
// and 160 + 50 - 3 * 60 = 30 makes the third twin nearer than the first old shot; the fourth is as near, but stands
// earlier in the list. From there on each new shot takes the third twin further, 20 frames less displaced, where the
// twin before that one would be 40 frames more. Twin 3 * 6666 is the last there is. The new shot behind would need it
// 160 frames further, the last old shot 150: that one beats all twins, so that also the first old shot stands, and the
// displacement is its own again.
TEST_F(PairingSpeedOfTwinsBetweenTwo, EachTakesTheThirdTwinFurtherAgainstTheOrderOfTheProgramme)
{
    constexpr int LastIn = (ManyEvents - 1) * OldLength;
    constexpr int Cycle = 6667;
    std::vector<std::shared_ptr<EventBase>> shots = oldShots(ManyEvents);
    std::reverse(shots.begin(), shots.end());

    const EventList changeEvents = generatedInTime(listOf(shots), newShots(ManyEvents));

    ASSERT_EQ(changeEvents.size(), std::size_t{ManyEvents + 2});
    std::size_t place = 0;
    const auto expectNext = [&](int oldIn, int newIn) {
        const int number = static_cast<int>(place) + 1;
        expectChange(changeEvents.at(place++), number, oldIn, newIn, OldLength);
    };
    for (int i = 0; i < ManyEvents; ++i) {
        const int newIn = i * NewLength;
        const int step = i % Cycle;
        if (step > 0) {
            ASSERT_NO_FATAL_FAILURE(expectNext(3 * step * OldLength, newIn + TwinStart));
            continue;
        }
        if (i > 0) {
            ASSERT_NO_FATAL_FAILURE(expectNext(LastIn, newIn + LastStart));
        }
        ASSERT_NO_FATAL_FAILURE(expectNext(0, newIn));
    }
}

TEST_F(PairingSpeedOfTwinsBetweenTwo, AFewOfThemGiveWhatPairingOneByOneGives)
{
    constexpr int Few = 60;
    const EventList newEvents = newShots(Few);

    for (const int stride : {1, Few - 1, 7, 23}) {
        const std::vector<std::shared_ptr<EventBase>> shots = oldShots(Few);
        std::vector<std::shared_ptr<EventBase>> order;
        for (int i = 0; i < Few; ++i)
            order.push_back(shots[static_cast<std::size_t>(i * stride % Few)]);
        EventList changeEvents;
        EventList pairwise;
        ChangeEdlGenerator().generate(listOf(order), newEvents, changeEvents);
        PairwiseGenerator(MatchBy::RollName, {}).generate(listOf(order), newEvents, pairwise);

        EXPECT_EQ(textOf(changeEvents), textOf(pairwise)) << stride;
    }
}

// A picture editor who changes nothing gets a change list that moves nothing.
RC_GTEST_PROP(Pairing, IdenticalListsOfPlainCutsAtNormalSpeedMoveNothing, ())
{
    struct Cut {
        int name;
        int srcIn;
        int length;
        int gap;
    };
    const auto cuts = *rc::gen::container<std::vector<Cut>>(rc::gen::build<Cut>(
        rc::gen::set(&Cut::name, rc::gen::inRange(0, 3)), rc::gen::set(&Cut::srcIn, rc::gen::inRange(0, 60)),
        rc::gen::set(&Cut::length, rc::gen::inRange(1, 40)), rc::gen::set(&Cut::gap, rc::gen::inRange(0, 5))));
    const TestProject project(*rc::gen::element(Framerate(25, 0), Framerate(24, true, 0), Framerate(30, true, 1)));
    EventList programme;
    int end = 0;
    for (const Cut& cut : cuts) {
        const auto event = makeShot(cut.srcIn, end + cut.gap, cut.length);
        event->setRollName("ROLL" + std::to_string(cut.name));
        programme.add(event);
        end += cut.gap + cut.length;
    }
    EventList changeEvents;

    ChangeEdlGenerator().generate(programme, programme, changeEvents);

    RC_ASSERT(changeEvents.size() == programme.size());
    for (std::size_t i = 0; i < programme.size(); ++i) {
        const EventBase& change = changeEvents.at(i);
        const EventBase& event = programme.at(i);
        RC_ASSERT(change.eventNumber() == i + 1);
        RC_ASSERT(change.rollName() == event.rollName());
        RC_ASSERT(change.srcIn() == event.dstIn());
        RC_ASSERT(change.srcOut() == event.dstOut());
        RC_ASSERT(change.dstIn() == event.dstIn());
        RC_ASSERT(change.dstOut() == event.dstOut());
    }
}

} // namespace cadrel::tests
