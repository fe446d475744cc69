// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/HealedEvent.h"
#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "core/time/Timecode.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <fstream>
#include <memory>
#include <string>
#include <sys/resource.h>
#include <unistd.h>
#include <vector>

// The stored forms of the model, written down byte by byte. Files of every version must stay readable.

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::DataModel;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::HealedEvent;
using core::Timecode;
using core::Variant;
using core::VfxPatternEntry;
using core::VideoList;
using core::serialize::ByteArchive;
using core::serialize::Serializable;
using util::Result;

using Flaws = std::vector<std::int32_t>;

std::vector<std::uint8_t> written(const Serializable& object)
{
    ByteArchive archive;
    archive << object;
    return bytesOf(archive);
}

/// Reads all the bytes, or gives what the reading throws.
Result::Type reading(Serializable& object, const std::vector<std::uint8_t>& bytes)
{
    ByteArchive archive = archiveOf(bytes);
    const Result::Type result = thrownBy([&] { archive >> object; });
    if (result == Result::Ok) {
        EXPECT_EQ(archive.bytesLeft(), 0U);
    }
    return result;
}

Result::Type reading(Serializable& object, const std::string& hex)
{
    return reading(object, bytesOf(hex));
}

std::vector<std::uint8_t> beginningOf(const std::vector<std::uint8_t>& bytes, std::size_t size)
{
    return {bytes.data(), bytes.data() + size};
}

// Counts that no writer writes.
const std::string CountOfMinusOne = "FF FF FF FF ";
const std::string SmallestCount = "00 00 00 80 ";
const std::string LargestCount = "FF FF FF 7F ";
const std::string CountOfZero = "00 00 00 00 ";

class PersistedLayout : public testing::Test {
protected:
    TestProject project;
};

TEST_F(PersistedLayout, TimecodeIsItsFourFieldsAndItsFlagInOneByteEach)
{
    EXPECT_EQ(written(Timecode("01:02:03:04")), bytesOf("02 00 00 00  01 02 03 04 01"));
    EXPECT_EQ(written(Timecode("99:99:99:99")), bytesOf("02 00 00 00  63 63 63 63 01"));
    EXPECT_EQ(written(Timecode()), bytesOf("02 00 00 00  00 00 00 00 00"));
}

TEST_F(PersistedLayout, TimecodeReadsItsCurrentVersion)
{
    Timecode timecode;
    EXPECT_EQ(reading(timecode, "02 00 00 00  01 02 03 FF 01"), Result::Ok);
    EXPECT_EQ(timecode, Timecode(1, 2, 3, 255));
    EXPECT_TRUE(timecode.isInitialized());

    EXPECT_EQ(reading(timecode, "02 00 00 00  00 00 00 00 00"), Result::Ok);
    EXPECT_EQ(timecode, Timecode());
    EXPECT_FALSE(timecode.isInitialized());
}

TEST_F(PersistedLayout, TimecodeReadsVersionOne)
{
    Timecode timecode;
    EXPECT_EQ(reading(timecode, "01 00 00 00  01 00 00 00 02 00 00 00 03 00 00 00 04 00 00 00  01"), Result::Ok);
    EXPECT_EQ(timecode.toString(), "01:02:03:04");
    EXPECT_TRUE(timecode.isInitialized());

    EXPECT_EQ(reading(timecode, "01 00 00 00  01 00 00 00 02 00 00 00 03 00 00 00 FF FF FF FF  00"), Result::Ok);
    EXPECT_EQ(timecode, Timecode(1, 2, 3, -1));
    EXPECT_FALSE(timecode.isInitialized());
}

TEST_F(PersistedLayout, TimecodeOfVersionZeroIsInitialized)
{
    Timecode timecode;
    EXPECT_EQ(reading(timecode, "00 00 00 00  17 00 00 00 3B 00 00 00 3A 00 00 00 18 00 00 00"), Result::Ok);
    EXPECT_EQ(timecode.toString(), "23:59:58:24");
    EXPECT_TRUE(timecode.isInitialized());
}

TEST_F(PersistedLayout, TimecodeOfVersionThreeIsNewer)
{
    Timecode timecode;
    EXPECT_EQ(reading(timecode, "03 00 00 00  01 02 03 04 01"), Result::NewerVersion);
}

TEST_F(PersistedLayout, TimecodeThatBreaksOffFailsInEveryVersion)
{
    Timecode timecode;
    EXPECT_EQ(reading(timecode, "02 00 00 00  01 02 03 04"), Result::EndOfData);
    EXPECT_EQ(reading(timecode, "01 00 00 00  01 00 00 00 02 00 00 00 03 00 00 00 04 00 00 00"), Result::EndOfData);
    EXPECT_EQ(reading(timecode, "00 00 00 00  01 00 00 00 02 00 00 00 03 00 00 00 04 00 00"), Result::EndOfData);
}

// 00:00:01:00 to 00:00:03:00 over 00:00:04:00 to 00:00:05:00.
const std::string FourTimecodes = "02 00 00 00 00 00 01 00 01  02 00 00 00 00 00 03 00 01 "
                                  "02 00 00 00 00 00 04 00 01  02 00 00 00 00 00 05 00 01 ";
const std::string NumberSeven = "07 00 00 00 ";
const std::string RollA = "01 00 00 00 41 ";
const std::string ClipBc = "02 00 00 00 42 43 ";
const std::string DissolveOfTwelve = "01 00 00 00  0C 00 00 00 ";
const std::string ReservedR = "01 00 00 00 52 ";
const std::string FileE = "01 00 00 00 45 ";
const std::string CommentNote = "04 00 00 00 6E 6F 74 65 ";
const std::string FlawTextOdd = "03 00 00 00 6F 64 64 ";
const std::string NoText = "00 00 00 00 ";
const std::string Vfx = "01 ";

/// An event of the current version, framed, with a flaw set in hexadecimal.
std::string eventWithFlaws(const std::string& flaws)
{
    return "02 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc + flaws + DissolveOfTwelve + NoText + FileE +
           Vfx;
}

void expectTheEvent(const EventBase& event)
{
    EXPECT_EQ(timecodesOf(event), "00:00:01:00 00:00:03:00 00:00:04:00 00:00:05:00");
    EXPECT_EQ(event.eventNumber(), 7U);
    EXPECT_EQ(event.rollName(), "A");
    EXPECT_EQ(event.clipName(), "BC");
    EXPECT_EQ(event.transitionType(), 1);
    EXPECT_EQ(event.transitionDuration(), 12);
    EXPECT_EQ(event.edlFileName(), "E");
    EXPECT_TRUE(event.vfx());
    EXPECT_EQ(event.motionSpeed(), 2.0);
}

TEST_F(PersistedLayout, EventIsItsFieldsInOrder)
{
    const auto event = makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00", 7);
    event->setClipName("BC");
    event->setEdlFileName("E");
    event->setTransitionType(core::TransitionType::Dissolve);
    event->setTransitionDuration(12);
    event->setVfx(true);
    event->setComment("not stored");
    event->addFlaw(5);
    event->addFlaw(4);

    EXPECT_EQ(written(*event), bytesOf(eventWithFlaws("02 00 00 00  04 00 00 00 05 00 00 00 ")));
}

TEST_F(PersistedLayout, ANewEventIsStoredUnset)
{
    const std::string unset = "02 00 00 00 00 00 00 00 00 ";

    EXPECT_EQ(written(EventBase()), bytesOf("02 00 00 00 " + unset + unset + unset + unset + //
                                            "00 00 00 00 " + NoText + NoText +               //
                                            "01 00 00 00  00 00 00 00 "                      // flaw 0
                                            "00 00 00 00  00 00 00 00 " +
                                            NoText + NoText + "00"));
}

TEST_F(PersistedLayout, EventReadsItsCurrentVersion)
{
    EventBase event;

    EXPECT_EQ(reading(event, "02 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc +
                                 "01 00 00 00  04 00 00 00 " + DissolveOfTwelve + ReservedR + FileE + Vfx),
              Result::Ok);

    expectTheEvent(event);
    EXPECT_EQ(event.reservedText(), "R");
    EXPECT_EQ(event.flaws(), Flaws{4});
}

TEST_F(PersistedLayout, TheReservedTextSurvives)
{
    EventBase event;
    const std::string hex = "02 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc + CountOfZero +
                            DissolveOfTwelve + ReservedR + FileE + Vfx;
    ASSERT_EQ(reading(event, hex), Result::Ok);

    EXPECT_EQ(written(event), bytesOf(hex));
}

TEST_F(PersistedLayout, EventReadsVersionOneWithItsComment)
{
    EventBase event;

    EXPECT_EQ(reading(event, "01 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc +
                                 "01 00 00 00  04 00 00 00 " + DissolveOfTwelve + ReservedR + FileE + CommentNote +
                                 Vfx),
              Result::Ok);

    expectTheEvent(event);
    EXPECT_EQ(event.reservedText(), "R");
    EXPECT_EQ(event.comment(), "note");
    EXPECT_EQ(event.flaws(), Flaws{4});
    EXPECT_EQ(event.version(), 2U);
}

/// An event of version 0, framed, with its flaw word in hexadecimal.
std::string oldestEvent(const std::string& flawWord)
{
    return "00 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc + flawWord + DissolveOfTwelve + ReservedR +
           FileE + CommentNote + FlawTextOdd + Vfx;
}

TEST_F(PersistedLayout, EventReadsVersionZeroWithItsCommentAndFreeText)
{
    EventBase event;

    EXPECT_EQ(reading(event, oldestEvent("00 00 00 00 ")), Result::Ok);

    expectTheEvent(event);
    EXPECT_EQ(event.reservedText(), "R");
    EXPECT_EQ(event.comment(), "note");
    EXPECT_EQ(event.flawText(), "odd");
    EXPECT_EQ(event.flaws(), Flaws());
}

TEST_F(PersistedLayout, VersionZeroAddsFlawOneToTheSetAsItWas)
{
    EventBase event;
    event.addFlaw(4);
    EXPECT_EQ(reading(event, oldestEvent("01 00 00 00 ")), Result::Ok);
    EXPECT_EQ(event.flaws(), (Flaws{1, 4}));

    EXPECT_EQ(reading(event, oldestEvent("00 00 00 00 ")), Result::Ok);
    EXPECT_EQ(event.flaws(), (Flaws{1, 4}));
}

TEST_F(PersistedLayout, AnyOtherFlawWordOfVersionZeroIsCorrupt)
{
    for (const char* word : {"02 00 00 00 ", "FF FF FF FF ", "00 01 00 00 "}) {
        EventBase event;
        EXPECT_EQ(reading(event, oldestEvent(word)), Result::CorruptData) << word;
    }
}

TEST_F(PersistedLayout, AnOlderEventMayHoldOlderTimecodesAndANewerOneFails)
{
    const std::string wide = "00 00 00 00  00 00 00 00 00 00 00 00 01 00 00 00 00 00 00 00 ";
    const std::string narrow = "02 00 00 00  00 00 01 00 01 ";
    const std::string newer = "03 00 00 00  00 00 01 00 01 ";
    const std::string rest = NumberSeven + NoText + NoText + CountOfZero + DissolveOfTwelve + NoText + NoText + NoText;

    EventBase event;
    EXPECT_EQ(reading(event, "01 00 00 00 " + wide + narrow + wide + narrow + rest + "00"), Result::Ok);
    EXPECT_EQ(timecodesOf(event), "00:00:01:00 00:00:01:00 00:00:01:00 00:00:01:00");
    EXPECT_EQ(reading(event, "01 00 00 00 " + wide + narrow + wide + newer + rest + "00"), Result::NewerVersion);
}

TEST_F(PersistedLayout, FlawsReplaceThoseOfTheEventInAscendingOrder)
{
    EventBase event;
    event.addFlaw(10);

    EXPECT_EQ(reading(event, eventWithFlaws("04 00 00 00  09 00 00 00 04 00 00 00 09 00 00 00 02 00 00 00 ")),
              Result::Ok);

    EXPECT_EQ(event.flaws(), (Flaws{2, 4, 9}));
}

TEST_F(PersistedLayout, FlawsOfTheTimecodesFollowFromThemAndNotFromTheStream)
{
    EventBase event;
    EXPECT_EQ(reading(event, eventWithFlaws("03 00 00 00  00 00 00 00 0B 00 00 00 0C 00 00 00 ")), Result::Ok);
    EXPECT_EQ(event.flaws(), Flaws());

    project.framerate = Framerate(24, 0);
    const std::string frame24 = "02 00 00 00 00 00 01 18 01 ";
    const std::string invalid = frame24 + frame24 + frame24 + frame24;
    EXPECT_EQ(reading(event, "02 00 00 00 " + invalid + NumberSeven + RollA + ClipBc + "01 00 00 00  0C 00 00 00 " +
                                 DissolveOfTwelve + NoText + FileE + Vfx),
              Result::Ok);
    EXPECT_EQ(event.flaws(), (Flaws{11, 12}));
}

TEST_F(PersistedLayout, AnUnsetTimecodeStaysUnset)
{
    const std::string unset = "02 00 00 00 00 00 00 00 00 ";
    EventBase event;
    event.setTimecodes(Timecode(1), Timecode(1), Timecode(1), Timecode(1));

    EXPECT_EQ(reading(event, "02 00 00 00 " + unset + unset + unset + unset + NumberSeven + RollA + ClipBc +
                                 CountOfZero + DissolveOfTwelve + NoText + FileE + Vfx),
              Result::Ok);

    EXPECT_FALSE(event.srcIn().isInitialized());
    EXPECT_FALSE(event.dstOut().isInitialized());
    EXPECT_EQ(event.flaws(), Flaws{0});
}

TEST_F(PersistedLayout, AFlawCountBelowOneIsAnEmptySet)
{
    for (const std::string& count : {CountOfMinusOne, SmallestCount, CountOfZero}) {
        EventBase event;
        event.addFlaw(4);
        EXPECT_EQ(reading(event, eventWithFlaws(count)), Result::Ok) << count;
        EXPECT_EQ(event.flaws(), Flaws()) << count;
        expectTheEvent(event);
    }
}

TEST_F(PersistedLayout, AFlawCountBeyondTheDataFails)
{
    EventBase event;

    EXPECT_EQ(reading(event, eventWithFlaws(LargestCount)), Result::EndOfData);
}

TEST_F(PersistedLayout, FlawsOutsideTheTableAreKept)
{
    EventBase event;
    const std::string hex = eventWithFlaws("03 00 00 00  FF FF FF FF 04 00 00 00 4D 00 00 00 ");
    ASSERT_EQ(reading(event, hex), Result::Ok);

    EXPECT_EQ(event.flaws(), (Flaws{-1, 4, 77}));
    EXPECT_EQ(event.flawsText(), "Not a video event.\n");
    EXPECT_EQ(written(event), bytesOf(hex));
}

TEST_F(PersistedLayout, ReadingAnEventNotifiesOnceInEveryVersion)
{
    for (const std::string& hex : {eventWithFlaws(CountOfZero), oldestEvent("00 00 00 00 "),
                                   "01 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc + CountOfZero +
                                       DissolveOfTwelve + NoText + FileE + NoText + Vfx}) {
        EventBase event;
        RecordingListener listener;
        event.addListener(&listener);
        EXPECT_EQ(reading(event, hex), Result::Ok);
        EXPECT_EQ(listener.types, Flaws{ChangeContext::EventChanged});
    }
}

TEST_F(PersistedLayout, ReadingAnEventNeedsAProvider)
{
    Timecode::setFramerateProvider(nullptr);
    EventBase event;

    EXPECT_EQ(reading(event, eventWithFlaws(CountOfZero)), Result::NotAvailable);
}

TEST_F(PersistedLayout, AnEventOfVersionThreeIsNewer)
{
    EventBase event;
    HealedEvent healed;

    EXPECT_EQ(reading(event, "03 00 00 00 " + FourTimecodes), Result::NewerVersion);
    EXPECT_EQ(reading(healed, "03 00 00 00 " + FourTimecodes), Result::NewerVersion);
}

TEST_F(PersistedLayout, AnEventThatBreaksOffAnywhereFails)
{
    for (const std::string& hex : {eventWithFlaws("01 00 00 00  04 00 00 00 "), oldestEvent("01 00 00 00 ")}) {
        const std::vector<std::uint8_t> bytes = bytesOf(hex);
        for (std::size_t size = 0; size < bytes.size(); ++size) {
            EventBase event;
            EXPECT_EQ(reading(event, beginningOf(bytes, size)), Result::EndOfData) << size;
        }
    }
}

/// The list with one event that a healed event holds as its members, framed.
std::string listOfOne(const std::string& kind, const std::string& event)
{
    return "00 00 00 00  01 00 00 00 " + kind + event;
}

const std::string PlainKind = "00 00 00 00 ";
const std::string HealedKind = "01 00 00 00 ";
const std::string EmptyList = "00 00 00 00  00 00 00 00 ";

TEST_F(PersistedLayout, HealedEventIsAnEventAndItsMembers)
{
    const auto member = makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00", 7);
    member->setClipName("BC");
    member->setEdlFileName("E");
    member->setTransitionType(1);
    member->setTransitionDuration(12);
    member->setVfx(true);
    HealedEvent healed;
    healed.addEvent(member);
    healed.setClipName("H");

    EXPECT_EQ(written(healed), bytesOf("02 00 00 00 " + FourTimecodes + "00 00 00 00 " + NoText + "01 00 00 00 48 " +
                                       CountOfZero + "00 00 00 00  00 00 00 00 " + NoText + NoText + Vfx +
                                       listOfOne(PlainKind, eventWithFlaws(CountOfZero))));
}

TEST_F(PersistedLayout, HealedEventReadsEveryVersionWithItsMembersBehind)
{
    const std::string members = listOfOne(PlainKind, oldestEvent("00 00 00 00 "));
    const std::string versionOne = "01 00 00 00 " + FourTimecodes + NumberSeven + RollA + ClipBc + CountOfZero +
                                   DissolveOfTwelve + ReservedR + FileE + CommentNote + Vfx;
    for (const std::string& event : {eventWithFlaws(CountOfZero), versionOne, oldestEvent("00 00 00 00 ")}) {
        HealedEvent healed;
        EXPECT_EQ(reading(healed, event + members), Result::Ok);
        EXPECT_EQ(healed.eventKind(), 1);
        expectTheEvent(healed);
        ASSERT_EQ(healed.healedEvents().size(), 1U);
        expectTheEvent(healed.healedEvents().at(0));
        EXPECT_EQ(healed.healedEvents().listKind(), 2);
    }
}

TEST_F(PersistedLayout, ReadingAHealedEventReplacesItsMembersAndHearsTheNewOnes)
{
    HealedEvent healed;
    healed.addEvent(makeEvent("OLD", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00"));
    RecordingListener listener;
    healed.healedEvents().addListener(&listener);

    EXPECT_EQ(
        reading(healed, eventWithFlaws(CountOfZero) + listOfOne(PlainKind, eventWithFlaws("01 00 00 00 04 00 00 00 "))),
        Result::Ok);
    ASSERT_EQ(healed.healedEvents().size(), 1U);
    listener.forget();
    healed.healedEvents().at(0).setRollName("X");

    EXPECT_EQ(listener.types.size(), 1U);
}

TEST_F(PersistedLayout, AHealedEventWithoutMembersIsRead)
{
    HealedEvent healed;

    EXPECT_EQ(reading(healed, eventWithFlaws(CountOfZero) + EmptyList), Result::Ok);

    EXPECT_TRUE(healed.healedEvents().isEmpty());
}

/// A healed event, framed, with so many healed events within each other, itself included.
std::string nestedHealedEvents(int depth)
{
    std::string hex = eventWithFlaws(CountOfZero) + EmptyList;
    for (int i = 1; i < depth; ++i)
        hex = eventWithFlaws(CountOfZero) + listOfOne(HealedKind, hex);
    return hex;
}

TEST_F(PersistedLayout, HealedEventsMayStandEightDeepAndNoDeeper)
{
    HealedEvent healed;

    EXPECT_EQ(reading(healed, nestedHealedEvents(8)), Result::Ok);
    EXPECT_EQ(reading(healed, nestedHealedEvents(9)), Result::CorruptData);
    EXPECT_EQ(reading(healed, nestedHealedEvents(8)), Result::Ok);
    EXPECT_EQ(reading(healed, nestedHealedEvents(100)), Result::CorruptData);
}

TEST_F(PersistedLayout, HealedEventsOfAListMayStandEightDeepEach)
{
    EventList list;
    std::string hex = "00 00 00 00  14 00 00 00 ";
    for (int i = 0; i < 20; ++i)
        hex += HealedKind + nestedHealedEvents(8);

    EXPECT_EQ(reading(list, hex), Result::Ok);

    EXPECT_EQ(list.size(), 20U);
    EXPECT_EQ(reading(list, listOfOne(HealedKind, nestedHealedEvents(9))), Result::CorruptData);
}

TEST_F(PersistedLayout, AFailureDeepWithinLeavesTheFullDepthToTheNextReading)
{
    HealedEvent healed;
    std::vector<std::uint8_t> broken = bytesOf(nestedHealedEvents(8));
    broken.pop_back();
    for (int i = 0; i < 10; ++i)
        EXPECT_EQ(reading(healed, broken), Result::EndOfData);

    EXPECT_EQ(reading(healed, nestedHealedEvents(8)), Result::Ok);
}

TEST_F(PersistedLayout, WhatCouldNotBeReadBackIsNotWritten)
{
    auto healed = std::make_shared<HealedEvent>();
    for (int depth = 2; depth <= 8; ++depth) {
        const auto around = std::make_shared<HealedEvent>();
        around->addEvent(healed);
        healed = around;
    }
    HealedEvent nineDeep;
    nineDeep.addEvent(healed);
    HealedEvent copy;

    EXPECT_EQ(reading(copy, written(*healed)), Result::Ok);
    EXPECT_EQ(thrownBy([&] { written(nineDeep); }), Result::CorruptData);
    EXPECT_EQ(written(*healed), written(copy));
}

TEST_F(PersistedLayout, ThousandsOfNestedHealedEventsAreRefusedAtOnce)
{
    const std::vector<std::uint8_t> around =
        bytesOf(eventWithFlaws(CountOfZero) + "00 00 00 00  01 00 00 00 " + HealedKind);
    std::vector<std::uint8_t> bytes;
    for (int i = 0; i < 100'000; ++i)
        bytes.insert(bytes.end(), around.begin(), around.end());
    HealedEvent healed;

    EXPECT_EQ(reading(healed, bytes), Result::CorruptData);
}

TEST_F(PersistedLayout, AnEmptyListIsEightBytesOfZero)
{
    EXPECT_EQ(written(EventList(0)), bytesOf("00 00 00 00  00 00 00 00"));
    EXPECT_EQ(written(EventList(2)), bytesOf("00 00 00 00  00 00 00 00"));
}

TEST_F(PersistedLayout, AListIsItsEventsWithTheKindOfEach)
{
    EventList list(1);
    auto healed = std::make_shared<HealedEvent>();
    list.add(std::make_shared<EventBase>());
    list.add(healed);
    const std::string unset = "02 00 00 00 00 00 00 00 00 ";
    const std::string event = "02 00 00 00 " + unset + unset + unset + unset + "00 00 00 00 " + NoText + NoText +
                              "01 00 00 00  00 00 00 00  00 00 00 00  00 00 00 00 " + NoText + NoText + "00 ";

    EXPECT_EQ(written(list), bytesOf("00 00 00 00  02 00 00 00 " + PlainKind + event + HealedKind + event + EmptyList));
}

TEST_F(PersistedLayout, AMemberlessCopyOfAHealedEventIsWrittenSoThatItReadsBack)
{
    EventList healed;
    healed.add(std::make_shared<HealedEvent>());
    EventList copies;
    copies.copyFrom(healed);
    ASSERT_EQ(copies.at(0).eventKind(), 1);
    EventList list;

    EXPECT_EQ(reading(list, written(copies)), Result::Ok);

    EXPECT_EQ(list.size(), 1U);
}

TEST_F(PersistedLayout, AListReadsPlainAndHealedEventsInPlaceOfItsOwn)
{
    EventList list(1);
    const auto former = std::make_shared<EventBase>();
    list.add(former);
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(reading(list, "00 00 00 00  02 00 00 00 " + HealedKind + nestedHealedEvents(1) + PlainKind +
                                eventWithFlaws(CountOfZero)),
              Result::Ok);

    ASSERT_EQ(list.size(), 2U);
    EXPECT_NE(dynamic_cast<HealedEvent*>(&list.at(0)), nullptr);
    EXPECT_EQ(list.at(0).eventKind(), 1);
    EXPECT_EQ(list.at(1).eventKind(), 0);
    EXPECT_EQ(list.listKind(), 1);
    EXPECT_EQ(listener.listKinds, Flaws{1});

    listener.forget();
    former->setRollName("gone");
    EXPECT_TRUE(listener.types.empty());
    list.at(0).setRollName("heard");
    list.at(1).setRollName("heard");
    EXPECT_EQ(listener.listKinds, (Flaws{1, 1}));
}

TEST_F(PersistedLayout, AListRefusesAKindThatDoesNotExist)
{
    for (const char* kind : {"02 00 00 00 ", "FF FF FF FF ", "00 00 00 80 ", "01 01 00 00 "}) {
        EventList list;
        EXPECT_EQ(reading(list, listOfOne(kind, eventWithFlaws(CountOfZero))), Result::CorruptData) << kind;
    }
}

TEST_F(PersistedLayout, AListCountBelowOneIsAnEmptyListAndNotifies)
{
    for (const std::string& count : {CountOfMinusOne, SmallestCount, CountOfZero}) {
        EventList list(0);
        const auto former = std::make_shared<EventBase>();
        list.add(former);
        RecordingListener listener;
        list.addListener(&listener);
        EXPECT_EQ(reading(list, "00 00 00 00 " + count), Result::Ok) << count;
        EXPECT_TRUE(list.isEmpty()) << count;
        EXPECT_EQ(listener.listKinds, Flaws{0}) << count;
        former->setRollName("gone");
        EXPECT_EQ(listener.listKinds.size(), 1U) << count;
    }
}

TEST_F(PersistedLayout, AListCountBeyondTheDataFails)
{
    EventList list;

    EXPECT_EQ(reading(list, "00 00 00 00 " + LargestCount), Result::EndOfData);
    EXPECT_EQ(reading(list, "00 00 00 00 " + LargestCount + PlainKind + eventWithFlaws(CountOfZero)),
              Result::EndOfData);
    EXPECT_EQ(reading(list, "00 00 00 00  02 00 00 00 " + PlainKind + eventWithFlaws(CountOfZero)), Result::EndOfData);
}

TEST_F(PersistedLayout, ErrorsOfAnEventPassThroughItsList)
{
    EventList list;

    EXPECT_EQ(reading(list, listOfOne(PlainKind, "03 00 00 00 " + FourTimecodes)), Result::NewerVersion);
    EXPECT_EQ(reading(list, listOfOne(PlainKind, oldestEvent("02 00 00 00 "))), Result::CorruptData);
    EXPECT_EQ(reading(list, listOfOne(HealedKind, eventWithFlaws(CountOfZero))), Result::EndOfData);
}

TEST_F(PersistedLayout, AListOfAnotherVersionIsNewer)
{
    EventList list;

    EXPECT_EQ(reading(list, "01 00 00 00  00 00 00 00"), Result::NewerVersion);
}

const std::string EmptyRow = "00 00 00 00 " + NoText + NoText + "00 ";
const std::string DefaultSettings = "04 00 00 00 "
                                    "00 00 00 00  01 00 00 00  00 00 00 00 " // match, heal, apply
                                    "01 01 01 01  01 01 "                    // the markers
                                    "03 00 00 00 " +
                                    EmptyRow + EmptyRow + EmptyRow +
                                    "01  00 00 00 00 00 00 49 40  00  05 00 00 00 " // snippets: 50.0 percent, 5 frames
                                    "01  05 00 00 00  00  00 "
                                    "00 00 00 00 00 00 00 00  00 00 00 00 00 00 00 00 ";
const std::string ThreeEmptyLists = EmptyList + EmptyList + EmptyList;
const std::string NoProperties = CountOfZero;
const std::string NoVideos = "00 00 00 00  00 00 00 00 ";

TEST_F(PersistedLayout, AnEmptyModelIsItsMembersInOrder)
{
    EXPECT_EQ(written(DataModel()),
              bytesOf("01 00 00 00 " + ThreeEmptyLists + NoProperties + DefaultSettings + NoVideos));
}

TEST_F(PersistedLayout, AModelWritesItsPropertiesByAscendingKey)
{
    DataModel model;
    model.setProperty(10005, Variant(true));
    model.setProperty(10003, Variant("/e"));
    model.setProperty(-1, Variant(50.0));

    EXPECT_EQ(written(model), bytesOf("01 00 00 00 " + ThreeEmptyLists +                                //
                                      "03 00 00 00 "                                                    //
                                      "FF FF FF FF  01 00 00 00  04 00 00 00  00 00 00 00 00 00 49 40 " // double
                                      "13 27 00 00  01 00 00 00  03 00 00 00  02 00 00 00 2F 65 "       // string
                                      "15 27 00 00  01 00 00 00  00 00 00 00  00 00 80 3F " +           // bool
                                      DefaultSettings +
                                      NoVideos));
}

TEST_F(PersistedLayout, AModelKeepsItsListsApart)
{
    DataModel model;

    EXPECT_EQ(reading(model, "01 00 00 00 " + listOfOne(PlainKind, eventWithFlaws(CountOfZero)) + EmptyList +
                                 listOfOne(HealedKind, nestedHealedEvents(2)) + NoProperties + DefaultSettings +
                                 NoVideos),
              Result::Ok);

    EXPECT_EQ(model.oldEdl().size(), 1U);
    EXPECT_EQ(model.oldEdl().listKind(), 0);
    EXPECT_EQ(model.newEdl().size(), 0U);
    EXPECT_EQ(model.changeEdl().size(), 1U);
    EXPECT_EQ(model.changeEdl().listKind(), 2);
}

TEST_F(PersistedLayout, AModelReadsItsPropertiesInPlaceOfItsOwn)
{
    DataModel model;
    model.setProperty(10020, Variant(true));

    EXPECT_EQ(reading(model, "01 00 00 00 " + ThreeEmptyLists +
                                 "02 00 00 00 "
                                 "13 27 00 00  00 00 00 00  03 00 00 00  02 00 00 00 2F 65 "
                                 "16 27 00 00  01 00 00 00  01 00 00 00  00 00 40 40 " + // 3.0
                                 DefaultSettings +
                                 NoVideos),
              Result::Ok);

    Variant value;
    EXPECT_EQ(model.getProperty(10003, value), Result::Ok);
    EXPECT_EQ(value.toText(), "/e");
    EXPECT_EQ(model.getProperty(10006, value), Result::Ok);
    EXPECT_EQ(value.toInt(), 3);
    EXPECT_FALSE(model.hasProperty(10020));
}

TEST_F(PersistedLayout, APropertyCountBelowOneIsAnEmptyMap)
{
    for (const std::string& count : {CountOfMinusOne, SmallestCount, CountOfZero}) {
        DataModel model;
        model.setProperty(10020, Variant(true));
        EXPECT_EQ(reading(model, "01 00 00 00 " + ThreeEmptyLists + count + DefaultSettings + NoVideos), Result::Ok)
            << count;
        EXPECT_FALSE(model.hasProperty(10020)) << count;
    }
}

TEST_F(PersistedLayout, APropertyCountBeyondTheDataFails)
{
    DataModel model;

    EXPECT_EQ(reading(model, "01 00 00 00 " + ThreeEmptyLists + LargestCount), Result::EndOfData);
}

/// Leaves this process 512 MB beyond what it has already.
void limitMemory()
{
    std::size_t pages = 0;
    std::ifstream("/proc/self/statm") >> pages;
    const rlim_t limit = pages * static_cast<std::size_t>(sysconf(_SC_PAGESIZE)) + (512U << 20U);
    const rlimit both{limit, limit};
    ASSERT_EQ(setrlimit(RLIMIT_AS, &both), 0);
}

TEST(HostileCountDeathTest, NoCountMakesAReaderTakeMemoryForWhatIsNotThere)
{
    const std::string lists = "01 00 00 00 " + ThreeEmptyLists;
    const auto allAreRefused = [&] {
        EventBase event;
        EventList list;
        DataModel model;
        return reading(event, eventWithFlaws(LargestCount)) == Result::EndOfData &&
               reading(event, "02 00 00 00 " + FourTimecodes + NumberSeven + LargestCount) == Result::EndOfData &&
               reading(list, "00 00 00 00 " + LargestCount + PlainKind) == Result::EndOfData &&
               reading(model, lists + LargestCount) == Result::EndOfData &&
               reading(model, lists + NoProperties + "04 00 00 00  00 00 00 00 00 00 00 00 00 00 00 00 " +
                                  "00 00 00 00 00 00 " + LargestCount) == Result::EndOfData &&
               reading(model, lists + NoProperties + DefaultSettings + "00 00 00 00 " + LargestCount) ==
                   Result::EndOfData;
    };

    EXPECT_EXIT(
        {
            limitMemory();
            std::_Exit(allAreRefused() ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST_F(PersistedLayout, AModelOfVersionZeroHasNoVideoListAndKeepsItsOwn)
{
    DataModel model;
    model.videoList().add(VideoList::Entry("/video/reel.mov", Timecode("01:00:00:00"), Timecode("00:20:00:00")), false);
    RecordingNotifier host;
    model.setNotifier(&host);

    EXPECT_EQ(reading(model, "00 00 00 00 " + listOfOne(PlainKind, oldestEvent("00 00 00 00 ")) + EmptyList +
                                 EmptyList + NoProperties + DefaultSettings),
              Result::Ok);

    EXPECT_EQ(model.oldEdl().size(), 1U);
    ASSERT_EQ(model.videoList().size(), 1U);
    EXPECT_EQ(model.videoList().at(0).path, "/video/reel.mov");
    EXPECT_EQ(host.heard.types, Flaws{ChangeContext::DataModelChanged});
}

TEST_F(PersistedLayout, NestingBeyondTheDepthMakesAModelEmpty)
{
    DataModel model;

    EXPECT_EQ(reading(model, "01 00 00 00 " + listOfOne(PlainKind, eventWithFlaws(CountOfZero)) + EmptyList +
                                 listOfOne(HealedKind, nestedHealedEvents(9)) + NoProperties + DefaultSettings +
                                 NoVideos),
              Result::CorruptData);

    EXPECT_TRUE(model.oldEdl().isEmpty());
    EXPECT_TRUE(model.changeEdl().isEmpty());
}

/// A bit of everything that a model holds.
void fill(DataModel& model)
{
    model.oldEdl().add(makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00", 1));
    model.newEdl().add(std::make_shared<EventBase>());
    const auto flawed = makeEvent("B", "00:00:03:00", "00:00:01:00", "00:00:04:00", "00:00:05:00", 2);
    flawed->addFlaw(4);
    model.newEdl().add(flawed);
    const auto healed = std::make_shared<HealedEvent>();
    healed->addEvent(makeEvent("C", "00:00:01:00", "00:00:02:00", "00:00:04:00", "00:00:05:00", 3));
    healed->addEvent(makeEvent("C", "00:00:02:00", "00:00:03:00", "00:00:05:00", "00:00:06:00", 4));
    model.changeEdl().add(healed);
    model.setProperty(10003, Variant("/edl"));
    model.setProperty(10006, Variant(std::int32_t{3}));
    model.settings().setHealMode(core::HealMode::GapsWithInserts);
    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "_v", true), 1);
    model.videoList().add(VideoList::Entry("/video/reel.mov", Timecode("01:00:00:00"), Timecode("00:20:00:00")), false);
}

void expectEmpty(const DataModel& model, std::size_t size)
{
    EXPECT_TRUE(model.oldEdl().isEmpty()) << size;
    EXPECT_TRUE(model.newEdl().isEmpty()) << size;
    EXPECT_TRUE(model.changeEdl().isEmpty()) << size;
    EXPECT_FALSE(model.hasProperty(10003)) << size;
    EXPECT_FALSE(model.hasProperty(10006)) << size;
    EXPECT_TRUE(model.videoList().isEmpty()) << size;
    EXPECT_EQ(model.settings().healMode(), core::HealMode::Normal) << size;
    EXPECT_EQ(model.settings().vfxPatterns().size(), 3U) << size;
}

TEST_F(PersistedLayout, AModelThatBreaksOffAnywhereIsEmptyBehindAPlainFailure)
{
    DataModel source;
    fill(source);
    const std::vector<std::uint8_t> bytes = written(source);
    ASSERT_GT(bytes.size(), 500U);

    for (std::size_t size = 0; size < bytes.size(); ++size) {
        DataModel model;
        // The version itself takes four bytes; up to there nothing of the model is touched.
        if (size >= 4)
            fill(model);
        EXPECT_EQ(reading(model, beginningOf(bytes, size)), Result::EndOfData) << size;
        expectEmpty(model, size);
    }
}

TEST_F(PersistedLayout, AnOldestModelThatBreaksOffAnywhereIsEmptyAndOfUnknownVersion)
{
    const std::vector<std::uint8_t> bytes =
        bytesOf("00 00 00 00 " + listOfOne(PlainKind, oldestEvent("00 00 00 00 ")) + EmptyList +
                listOfOne(HealedKind, oldestEvent("01 00 00 00 ") + EmptyList) + NoProperties + DefaultSettings);

    for (std::size_t size = 4; size < bytes.size(); ++size) {
        DataModel model;
        fill(model);
        EXPECT_EQ(reading(model, beginningOf(bytes, size)), Result::UnknownVersion) << size;
        expectEmpty(model, size);
    }
    DataModel model;
    EXPECT_EQ(reading(model, bytes), Result::Ok);
    EXPECT_EQ(model.oldEdl().size(), 1U);
}

RC_GTEST_PROP(PersistedModel, ChangedBytesNeverDoWorseThanAResult, ())
{
    DataModel source;
    fill(source);
    std::vector<std::uint8_t> bytes = written(source);
    const auto changes = *rc::gen::inRange(1, 5);
    for (int i = 0; i < changes; ++i)
        bytes[*rc::gen::inRange<std::size_t>(0, bytes.size())] = *rc::gen::oneOf(
            rc::gen::element<std::uint8_t>(0, 1, 2, 0x7F, 0x80, 0xFF), rc::gen::arbitrary<std::uint8_t>());
    ByteArchive archive = archiveOf(bytes);
    DataModel model;

    const Result::Type result = thrownBy([&] { archive >> model; });

    RC_ASSERT(result == Result::Ok || result == Result::EndOfData || result == Result::CorruptData ||
              result == Result::NewerVersion || result == Result::UnknownVersion || result == Result::NotSupported);
    RC_ASSERT(result == Result::Ok || model.oldEdl().isEmpty());
}

std::shared_ptr<EventBase> anyEvent(int depth)
{
    // Frame 25 is one too many at 25 fps.
    const auto timecode = [] {
        return Timecode(*rc::gen::inRange(0, 24), *rc::gen::inRange(0, 60), *rc::gen::inRange(0, 60),
                        *rc::gen::weightedOneOf<int>({{9, rc::gen::inRange(0, 25)}, {1, rc::gen::just(25)}}));
    };
    std::shared_ptr<EventBase> event;
    if (depth < HealedEvent::DeepestNesting && *rc::gen::weightedElement<bool>({{3, false}, {1, true}})) {
        const auto healed = std::make_shared<HealedEvent>();
        const int members = *rc::gen::inRange(0, 3);
        for (int i = 0; i < members; ++i)
            healed->addEvent(anyEvent(depth + 1));
        event = healed;
    } else {
        event = std::make_shared<EventBase>();
        if (*rc::gen::weightedElement<bool>({{9, true}, {1, false}}))
            event->setTimecodes(timecode(), timecode(), timecode(), timecode());
        event->setVfx(*rc::gen::arbitrary<bool>());
    }
    event->setEventNumber(*rc::gen::arbitrary<std::uint32_t>());
    event->setRollName(*rc::gen::arbitrary<std::string>());
    event->setClipName(*rc::gen::arbitrary<std::string>());
    event->setEdlFileName(*rc::gen::arbitrary<std::string>());
    event->setTransitionType(*rc::gen::inRange(0, 3));
    event->setTransitionDuration(*rc::gen::arbitrary<std::int32_t>());
    if (*rc::gen::arbitrary<bool>())
        event->addFlaw(*rc::gen::inRange(1, 11));
    return event;
}

Variant anyValue()
{
    switch (*rc::gen::inRange(0, 6)) {
    case 0:
        return Variant();
    case 1:
        return Variant(*rc::gen::arbitrary<bool>());
    case 2:
        return Variant(*rc::gen::arbitrary<std::int32_t>());
    case 3:
        return Variant(*rc::gen::arbitrary<float>());
    case 4:
        return Variant(*rc::gen::arbitrary<double>());
    default:
        return Variant(*rc::gen::arbitrary<std::string>());
    }
}

void fillWithAnything(DataModel& model)
{
    for (EventList* list : {&model.oldEdl(), &model.newEdl(), &model.changeEdl()}) {
        const int count = *rc::gen::inRange(0, 4);
        for (int i = 0; i < count; ++i)
            list->add(anyEvent(1));
    }
    const int properties = *rc::gen::inRange(0, 5);
    for (int i = 0; i < properties; ++i)
        model.setProperty(*rc::gen::arbitrary<std::int32_t>(), anyValue());
    core::Settings& settings = model.settings();
    settings.setMatchBy(*rc::gen::inRange(0, 2));
    settings.setHealMode(*rc::gen::inRange(0, 4));
    settings.setApplyTo(*rc::gen::inRange(0, 2));
    settings.setRemainsThreshold(*rc::gen::inRange(0, 1000));
    settings.setSnippetThreshold(*rc::gen::inRange(0, 1000));
    settings.setSnippetMaxPercentage(*rc::gen::arbitrary<double>());
    settings.setCreateInsertMarkers(*rc::gen::arbitrary<bool>());
    settings.setBRollRenaming(*rc::gen::arbitrary<bool>());
    settings.setRestrictRange(*rc::gen::arbitrary<bool>());
    settings.setVfxPattern(VfxPatternEntry(*rc::gen::arbitrary<std::string>(), *rc::gen::arbitrary<std::string>(),
                                           *rc::gen::arbitrary<bool>()),
                           *rc::gen::inRange<std::size_t>(0, 3));
    const int videos = *rc::gen::inRange(0, 3);
    for (int i = 0; i < videos; ++i)
        model.videoList().add(VideoList::Entry("/video/" + std::to_string(i) + ".mov",
                                               Timecode(*rc::gen::inRange<std::int32_t>(0, 2160000)),
                                               Timecode(*rc::gen::inRange<std::int32_t>(0, 2160000))),
                              true);
}

RC_GTEST_PROP(PersistedModel, AModelFilledThroughItsOperationsSurvivesByteForByte, ())
{
    DataModel source;
    fillWithAnything(source);
    const std::vector<std::uint8_t> bytes = written(source);
    DataModel model;

    RC_ASSERT(reading(model, bytes) == Result::Ok);

    RC_ASSERT(written(model) == bytes);
}

} // namespace
} // namespace cadrel::tests
