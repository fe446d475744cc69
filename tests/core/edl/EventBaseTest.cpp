// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"

#include "core/edl/HealedEvent.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::HealedEvent;
using core::Timecode;
using util::Result;

using Flaws = std::vector<std::int32_t>;

/// An event whose every stored field differs from its default, the reserved text and the text of flaw 1 included, which
/// only the oldest layout brings.
std::shared_ptr<EventBase> fullEvent()
{
    auto archive = archiveOf("00 00 00 00"
                             "02 00 00 00 00 00 01 00 01  02 00 00 00 00 00 03 00 01"
                             "02 00 00 00 00 00 04 00 01  02 00 00 00 00 00 05 00 01"
                             "07 00 00 00"          // number 7
                             "01 00 00 00 41"       // roll name A
                             "01 00 00 00 42"       // clip name B
                             "01 00 00 00"          // flaw 1
                             "01 00 00 00"          // dissolve
                             "0C 00 00 00"          // of 12 frames
                             "02 00 00 00 52 54"    // reserved text RT
                             "01 00 00 00 45"       // file E
                             "01 00 00 00 43"       // comment C
                             "03 00 00 00 6F 64 64" // text of flaw 1: odd
                             "01");                 // VFX
    auto event = std::make_shared<EventBase>();
    archive >> *event;
    return event;
}

/// Two seconds of source in one second of programme.
std::shared_ptr<EventBase> doubleSpeedEvent()
{
    return makeEvent("A", "00:00:01:00", "00:00:03:00", "00:00:04:00", "00:00:05:00");
}

/// The speed of an event of so many frames, at 25 frames a second.
double speedOf(std::int32_t sourceFrames, std::int32_t destinationFrames)
{
    EventBase event;
    event.setTimecodes(Timecode(1000), Timecode(1000 + sourceFrames), Timecode(2000),
                       Timecode(2000 + destinationFrames));
    return event.motionSpeed();
}

TEST(EventBase, ANewEventHasTheDefaultsAndFlawZeroAlone)
{
    const EventBase event;

    EXPECT_EQ(event.eventKind(), 0);
    EXPECT_FALSE(event.srcIn().isInitialized());
    EXPECT_FALSE(event.srcOut().isInitialized());
    EXPECT_FALSE(event.dstIn().isInitialized());
    EXPECT_FALSE(event.dstOut().isInitialized());
    EXPECT_EQ(event.eventNumber(), 0U);
    EXPECT_EQ(event.rollName(), "");
    EXPECT_EQ(event.clipName(), "");
    EXPECT_EQ(event.flaws(), Flaws{0});
    EXPECT_FALSE(event.isValid());
    EXPECT_EQ(event.transitionType(), 0);
    EXPECT_EQ(event.transitionDuration(), 0);
    EXPECT_EQ(event.reservedText(), "");
    EXPECT_EQ(event.edlFileName(), "");
    EXPECT_EQ(event.comment(), "");
    EXPECT_FALSE(event.vfx());
    EXPECT_EQ(event.motionSpeed(), 1.0);
    EXPECT_EQ(event.flawText(), "");
}

TEST(EventBase, IsCreatedByItsKind)
{
    const auto plain = EventBase::create(0);
    const auto healed = EventBase::create(1);

    EXPECT_EQ(plain->eventKind(), 0);
    EXPECT_EQ(std::dynamic_pointer_cast<HealedEvent>(plain), nullptr);
    EXPECT_EQ(healed->eventKind(), 1);
    EXPECT_NE(std::dynamic_pointer_cast<HealedEvent>(healed), nullptr);
    EXPECT_EQ(thrownBy([] { EventBase::create(2); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([] { EventBase::create(-1); }), Result::InvalidArgument);
}

TEST(EventBase, AssignmentCopiesAllButTheTextOfFlawOne)
{
    const auto source = fullEvent();
    ASSERT_EQ(source->reservedText(), "RT");
    ASSERT_EQ(source->flawText(), "odd");
    EventBase target;

    target = *source;

    EXPECT_EQ(timecodesOf(target), "00:00:01:00 00:00:03:00 00:00:04:00 00:00:05:00");
    EXPECT_EQ(target.eventNumber(), 7U);
    EXPECT_EQ(target.rollName(), "A");
    EXPECT_EQ(target.clipName(), "B");
    EXPECT_EQ(target.flaws(), source->flaws());
    EXPECT_TRUE(target.hasFlaw(1));
    EXPECT_EQ(target.transitionType(), 1);
    EXPECT_EQ(target.transitionDuration(), 12);
    EXPECT_EQ(target.reservedText(), "RT");
    EXPECT_EQ(target.edlFileName(), "E");
    EXPECT_EQ(target.comment(), "C");
    EXPECT_TRUE(target.vfx());
    EXPECT_EQ(target.motionSpeed(), 2.0);
    EXPECT_EQ(target.flawText(), "");
}

TEST(EventBase, ACopyHasTheSameFieldsWithoutTheTextOfFlawOne)
{
    const auto source = fullEvent();

    const EventBase copy(*source);

    EXPECT_EQ(timecodesOf(copy), timecodesOf(*source));
    EXPECT_EQ(copy.flaws(), source->flaws());
    EXPECT_EQ(copy.reservedText(), "RT");
    EXPECT_EQ(copy.comment(), "C");
    EXPECT_EQ(copy.motionSpeed(), 2.0);
    EXPECT_EQ(copy.flawText(), "");
}

TEST(EventBase, ComesFromNoLineUntilAReaderSaysSoAndItsCopiesComeFromTheSame)
{
    EventBase source;
    EXPECT_EQ(source.sourceLine(), 0U);

    source.setSourceLine(12);
    const EventBase copy(source);
    EventBase assigned;
    assigned = source;

    EXPECT_EQ(copy.sourceLine(), 12U);
    EXPECT_EQ(assigned.sourceLine(), 12U);
}

TEST(EventBase, TheLineThatItComesFromIsNotStored)
{
    const TestProject project;
    const auto event = doubleSpeedEvent();
    core::serialize::ByteArchive without;
    without << *event;

    event->setSourceLine(12);
    core::serialize::ByteArchive with;
    with << *event;

    EXPECT_EQ(bytesOf(with), bytesOf(without));
    with.rewind();
    with >> *event;
    EXPECT_EQ(event->sourceLine(), 0U);
}

TEST(EventBase, AssignmentKeepsTheTargetsOwnTextOfFlawOne)
{
    const auto target = fullEvent();

    *target = EventBase();

    EXPECT_EQ(target->flawText(), "odd");
    EXPECT_EQ(target->reservedText(), "");
}

TEST(EventBase, AssignmentCopiesTheKindAlone)
{
    HealedEvent healed;
    EventBase plain;

    plain = healed;

    EXPECT_EQ(plain.eventKind(), 1);
}

TEST(EventBase, ACopiedNewEventKeepsFlawZeroUntilItsTimecodesAreLookedAt)
{
    const EventBase fresh;

    EventBase copy(fresh);

    EXPECT_TRUE(copy.srcIn().isInitialized());
    EXPECT_TRUE(copy.dstOut().isInitialized());
    EXPECT_EQ(copy.flaws(), Flaws{0});
    copy.revalidate();
    EXPECT_EQ(copy.flaws(), Flaws());
}

TEST(EventBase, SelfAssignmentDoesNothing)
{
    EventBase event;
    const EventBase& itself = event;

    event = itself;

    EXPECT_FALSE(event.srcIn().isInitialized());
    EXPECT_EQ(event.flaws(), Flaws{0});
}

TEST(EventBase, ACopyHasNoListenersAndAssignmentKeepsThoseOfTheTargetInSilence)
{
    const auto source = doubleSpeedEvent();
    EventBase target;
    RecordingListener sourceListener;
    RecordingListener targetListener;
    source->addListener(&sourceListener);
    target.addListener(&targetListener);

    EventBase copy(*source);
    copy.setRollName("copy");
    target = *source;

    EXPECT_TRUE(sourceListener.types.empty());
    EXPECT_TRUE(targetListener.types.empty());
    target.setRollName("target");
    EXPECT_TRUE(sourceListener.types.empty());
    EXPECT_EQ(targetListener.types, std::vector<std::int32_t>{ChangeContext::EventChanged});
}

TEST(EventBase, FourValidTimecodesLeaveNoFlaw)
{
    EventBase event;

    event.setTimecodes(Timecode("00:00:01:00"), Timecode("00:00:02:00"), Timecode("01:00:00:00"),
                       Timecode("01:00:01:00"));

    EXPECT_EQ(event.flaws(), Flaws());
    EXPECT_TRUE(event.isValid());
}

TEST(EventBase, FlawZeroGoesWithTheLastOfTheFourTimecodes)
{
    EventBase event;
    const Timecode time("00:00:01:00");

    event.setDstOut(time);
    EXPECT_TRUE(event.hasFlaw(0));
    event.setSrcIn(Timecode());
    EXPECT_TRUE(event.hasFlaw(0));
    event.setSrcOut(time);
    EXPECT_TRUE(event.hasFlaw(0));
    event.setDstIn(time);
    EXPECT_TRUE(event.isValid());
}

TEST(EventBase, AllZeroTimecodesAreValid)
{
    const auto event = makeEvent("A", "00:00:00:00", "00:00:00:00", "00:00:00:00", "00:00:00:00");

    EXPECT_TRUE(event->isValid());
}

TEST(EventBase, AReversedRangeOnEitherSideIsFlawTwelveAndAnEmptyOneIsNot)
{
    const auto event = makeEvent("A", "00:00:10:00", "00:00:05:00", "00:00:20:00", "00:00:30:00");
    EXPECT_EQ(event->flaws(), Flaws{12});

    event->setSrc(Timecode("00:00:05:00"), Timecode("00:00:05:00"));
    EXPECT_EQ(event->flaws(), Flaws());

    event->setDst(Timecode("00:00:30:00"), Timecode("00:00:29:24"));
    EXPECT_EQ(event->flaws(), Flaws{12});

    event->setDst(Timecode("00:00:30:00"), Timecode("00:00:30:00"));
    EXPECT_EQ(event->flaws(), Flaws());
}

TEST(EventBase, SwappingItsOwnTimecodesRemovesFlawTwelve)
{
    const auto event = makeEvent("A", "00:00:10:00", "00:00:05:00", "00:00:30:00", "00:00:20:00");

    event->setSrc(event->srcOut(), event->srcIn());
    event->setDst(event->dstOut(), event->dstIn());

    EXPECT_EQ(timecodesOf(*event), "00:00:05:00 00:00:10:00 00:00:20:00 00:00:30:00");
    EXPECT_EQ(event->flaws(), Flaws());
}

TEST(EventBase, TakesItsOwnTimecodesInAnyPlace)
{
    const auto event = makeEvent("A", "00:00:01:00", "00:00:02:00", "00:00:03:00", "00:00:04:00");

    event->setTimecodes(event->dstIn(), event->dstOut(), event->srcIn(), event->srcOut());
    EXPECT_EQ(timecodesOf(*event), "00:00:03:00 00:00:04:00 00:00:01:00 00:00:02:00");

    event->setIn(event->dstIn(), event->srcIn());
    EXPECT_EQ(timecodesOf(*event), "00:00:01:00 00:00:04:00 00:00:03:00 00:00:02:00");

    event->setOut(event->dstOut(), event->srcOut());
    EXPECT_EQ(timecodesOf(*event), "00:00:01:00 00:00:02:00 00:00:03:00 00:00:04:00");
}

TEST(EventBase, AnInvalidTimecodeIsFlawElevenUntilItIsPutRight)
{
    const auto event = makeEvent("A", "00:00:00:25", "00:00:05:00", "00:00:20:00", "00:00:30:00");
    EXPECT_EQ(event->flaws(), Flaws{11});

    event->setSrcIn(Timecode("00:00:00:24"));
    EXPECT_EQ(event->flaws(), Flaws());
}

TEST(EventBase, EachOfTheFourTimecodesCanBeTheInvalidOne)
{
    const char* const good = "00:00:05:00";
    const char* const bad = "00:00:05:25";

    EXPECT_TRUE(makeEvent("A", bad, good, good, good)->hasFlaw(11));
    EXPECT_TRUE(makeEvent("A", good, bad, good, good)->hasFlaw(11));
    EXPECT_TRUE(makeEvent("A", good, good, bad, good)->hasFlaw(11));
    EXPECT_TRUE(makeEvent("A", good, good, good, bad)->hasFlaw(11));
}

TEST(EventBase, FlawTwelveStaysAsItWasWhileATimecodeIsInvalid)
{
    const auto reversed = makeEvent("A", "00:00:10:00", "00:00:05:00", "00:00:20:00", "00:00:30:00");
    const auto straight = makeEvent("A", "00:00:05:00", "00:00:10:00", "00:00:20:00", "00:00:30:00");

    reversed->setTimecodes(Timecode("00:00:05:00"), Timecode("00:00:10:00"), Timecode("00:00:20:00"),
                           Timecode("00:00:30:25"));
    straight->setTimecodes(Timecode("00:00:10:00"), Timecode("00:00:05:00"), Timecode("00:00:20:00"),
                           Timecode("00:00:30:25"));

    EXPECT_EQ(reversed->flaws(), (Flaws{11, 12}));
    EXPECT_EQ(straight->flaws(), Flaws{11});
}

TEST(EventBase, UnsetTimecodesAreFlawZeroBesideAnInvalidOne)
{
    EventBase event;

    event.setSrcIn(Timecode("00:00:00:25"));
    EXPECT_EQ(event.flaws(), (Flaws{0, 11}));

    event.setTimecodes(Timecode("00:00:00:25"), Timecode(), Timecode(), Timecode());
    EXPECT_EQ(event.flaws(), Flaws{11});
}

TEST(EventBase, RevalidatingUnderALowerRateFindsTheInvalidFrameAndKeepsTheRest)
{
    TestProject project(Framerate(30, 0));
    const auto fast = makeEvent("A", "00:00:01:29", "00:00:03:29", "00:00:04:00", "00:00:05:00");
    const auto reversed = makeEvent("A", "00:00:03:29", "00:00:01:29", "00:00:04:00", "00:00:05:00");
    ASSERT_EQ(fast->motionSpeed(), 2.0);

    project.framerate = Framerate(25, 0);
    fast->revalidate();
    reversed->revalidate();

    EXPECT_EQ(fast->flaws(), Flaws{11});
    EXPECT_EQ(fast->motionSpeed(), 2.0);
    EXPECT_EQ(reversed->flaws(), (Flaws{11, 12}));
    EXPECT_EQ(reversed->motionSpeed(), -2.0);

    project.framerate = Framerate(30, 0);
    fast->revalidate();
    EXPECT_TRUE(fast->isValid());
}

TEST(EventBase, SettingTimecodesNeedsAProviderAndMakingAnEventDoesNot)
{
    const NoProject none;
    EventBase event;

    EXPECT_EQ(thrownBy([&] { event.setSrcIn(Timecode("00:00:01:00")); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { event.revalidate(); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { event.setRollName("A"); }), Result::Ok);
}

TEST(EventBase, FlawsAreASetInAscendingOrder)
{
    const auto event = doubleSpeedEvent();

    event->addFlaw(EventFlaw::DstOutUnreadable);
    event->addFlaw(EventFlaw::EventNumberNotNumeric);
    event->addFlaw(EventFlaw::NotVideoEvent);
    event->addFlaw(EventFlaw::EventNumberNotNumeric);
    EXPECT_EQ(event->flaws(), (Flaws{2, 4, 10}));
    EXPECT_TRUE(event->hasFlaw(4));
    EXPECT_FALSE(event->hasFlaw(3));
    EXPECT_FALSE(event->isValid());

    event->removeFlaw(EventFlaw::EventNumberNotNumeric);
    event->removeFlaw(EventFlaw::RollNameInvalid);
    EXPECT_EQ(event->flaws(), (Flaws{4, 10}));
}

TEST(EventBase, FlawsOfTheReaderOutliveAChangeOfTheTimecodes)
{
    EventBase event;
    for (std::int32_t flaw = 1; flaw <= 10; ++flaw)
        event.addFlaw(flaw);

    event.setTimecodes(Timecode(0), Timecode(1), Timecode(0), Timecode(1));

    EXPECT_EQ(event.flaws(), (Flaws{1, 2, 3, 4, 5, 6, 7, 8, 9, 10}));
}

TEST(EventBase, OnlyTheFlawsOneToTenAreFormatFlaws)
{
    for (std::int32_t flaw = 0; flaw <= 12; ++flaw) {
        const auto event = doubleSpeedEvent();
        event->addFlaw(flaw);
        EXPECT_EQ(event->hasFormatFlaw(), flaw >= 1 && flaw <= 10) << flaw;
    }
    EXPECT_FALSE(doubleSpeedEvent()->hasFormatFlaw());
}

RC_GTEST_PROP(EventBase, AnEventOfValidTimecodesHasFlawTwelveExactlyWhenARangeIsReversed, ())
{
    const auto frame = rc::gen::inRange<std::int32_t>(0, 2160000);
    const Timecode srcIn(*frame);
    const Timecode srcOut(*frame);
    const Timecode dstIn(*frame);
    const Timecode dstOut(*frame);
    EventBase event;

    event.setTimecodes(srcIn, srcOut, dstIn, dstOut);

    RC_ASSERT(event.flaws() == (srcIn > srcOut || dstIn > dstOut ? Flaws{12} : Flaws()));
}

const std::vector<std::pair<std::int32_t, std::string>> FlawMessages = {
    {0, "Detected uninitialized timecode."},
    {2, "Event Number is not a number."},
    {3, "Roll name contains non-alphanumeric characters."},
    {4, "Not a video event."},
    {5, "Not a valid transition duration."},
    {6, "Found unsupported transition type."},
    {7, "SRC IN format cannot be read."},
    {8, "SRC OUT format cannot be read."},
    {9, "DST IN format cannot be read."},
    {10, "DST OUT format cannot be read."},
    {11, "Detected invalid timecode. Mismatch between timecode and project frame rate?"},
    {12, "Detected invalid timecode range."},
};

TEST(EventFlaw, HasNoMessageOutsideTheTable)
{
    EXPECT_EQ(EventFlaw::text(1), L"");
    EXPECT_EQ(EventFlaw::text(12), L"Detected invalid timecode range.");
    EXPECT_EQ(EventFlaw::text(13), L"");
    EXPECT_EQ(EventFlaw::text(-1), L"");
}

TEST(EventBase, EachFlawHasItsMessageInALineOfItsOwn)
{
    for (const auto& [flaw, message] : FlawMessages) {
        const auto event = doubleSpeedEvent();
        event->addFlaw(flaw);
        EXPECT_EQ(event->flawsText(), flaw == 0 ? message + "\n\n" : message + "\n");
    }
}

TEST(EventBase, AnEventWithoutFlawsHasNoFlawsText)
{
    EXPECT_EQ(doubleSpeedEvent()->flawsText(), "");
}

TEST(EventBase, AnEmptyLineFollowsTheMessageOfFlawZero)
{
    EventBase event;
    event.addFlaw(EventFlaw::NotVideoEvent);

    EXPECT_EQ(event.flawsText(), "Detected uninitialized timecode.\n\nNot a video event.\n");
}

TEST(EventBase, MessagesComeInAscendingOrder)
{
    EventBase event;
    std::string expected;
    for (const auto& [flaw, message] : FlawMessages) {
        event.addFlaw(flaw);
        expected += message + (flaw == 0 ? "\n\n" : "\n");
    }

    EXPECT_EQ(event.flawsText(), expected);
}

TEST(EventBase, TheFreeTextIsShownInItsPlaceWhetherOrNotFlawOneIsSet)
{
    const auto event = fullEvent();
    ASSERT_EQ(event->flaws(), Flaws{1});
    EXPECT_EQ(event->flawsText(), "odd\n");

    event->removeFlaw(1);
    EXPECT_EQ(event->flawsText(), "odd\n");

    event->addFlaw(4);
    EXPECT_EQ(event->flawsText(), "odd\nNot a video event.\n");

    event->addFlaw(0);
    EXPECT_EQ(event->flawsText(), "Detected uninitialized timecode.\nodd\nNot a video event.\n");
}

TEST(EventBase, AFlawOneWithoutATextAddsNothing)
{
    const auto event = doubleSpeedEvent();
    event->addFlaw(1);

    EXPECT_EQ(event->flawsText(), "");
}

class GermanConverter : public util::StringConverter {
public:
    std::wstring translate(const std::wstring& text) const override
    {
        return text == L"Not a video event." ? L"Kein Bild f\u00FCr uns." : text;
    }
};

TEST(EventBase, MessagesAreTranslated)
{
    const GermanConverter converter;
    util::StringUtil::setConverter(&converter);
    const auto event = doubleSpeedEvent();
    event->addFlaw(4);

    EXPECT_EQ(event->flawsText(), "Kein Bild f\xC3\xBCr uns.\n");
}

TEST(EventBase, MessagesNeedAConverter)
{
    util::StringUtil::setConverter(nullptr);
    const EventBase event;

    EXPECT_EQ(thrownBy([&] { event.flawsText(); }), Result::NotAvailable);
}

TEST(EventBase, MotionSpeedIsSourceOverDestination)
{
    EXPECT_EQ(speedOf(50, 50), 1.0);
    EXPECT_EQ(speedOf(50, 25), 2.0);
    EXPECT_EQ(speedOf(25, 50), 0.5);
    EXPECT_EQ(speedOf(25, 100), 0.25);
}

TEST(EventBase, AFreezeFrameHasSpeedZeroAndAnEmptyEventSpeedOne)
{
    EXPECT_EQ(speedOf(0, 50), 0.0);
    EXPECT_EQ(speedOf(0, 0), 1.0);
}

TEST(EventBase, AnEmptyDestinationCountsAsOneFrame)
{
    // Two seconds of 25 frames over one frame.
    EXPECT_DOUBLE_EQ(speedOf(50, 0), 50.0);
}

TEST(EventBase, AReversedRangeHasANegativeSpeedAndRaisesNothing)
{
    EXPECT_EQ(speedOf(-50, 50), -1.0);
    EXPECT_EQ(speedOf(50, -25), -2.0);
    EXPECT_EQ(speedOf(-50, -50), 1.0);
    EXPECT_DOUBLE_EQ(speedOf(-50, 0), -50.0);
}

TEST(EventBase, MotionSpeedStaysWhileATimecodeIsInvalid)
{
    const auto event = doubleSpeedEvent();

    event->setSrcOut(Timecode("00:00:10:25"));
    EXPECT_EQ(event->motionSpeed(), 2.0);

    event->setSrcOut(Timecode("00:00:05:00"));
    EXPECT_EQ(event->motionSpeed(), 4.0);
}

TEST(EventBase, MotionSpeedStaysWhileTheRateDoesNotCountFramesAndTheFlawsFollow)
{
    TestProject project;
    const auto event = doubleSpeedEvent();
    project.framerate = Framerate(24, -1);

    event->setTimecodes(Timecode("00:00:03:00"), Timecode("00:00:01:00"), Timecode("00:00:04:00"),
                        Timecode("00:00:05:00"));
    EXPECT_EQ(event->flaws(), Flaws{12});
    EXPECT_EQ(event->motionSpeed(), 2.0);

    event->setTimecodes(Timecode("00:00:01:00"), Timecode("00:00:05:00"), Timecode("00:00:04:00"),
                        Timecode("00:00:05:24"));
    EXPECT_EQ(event->flaws(), (Flaws{11, 12}));
    EXPECT_EQ(event->motionSpeed(), 2.0);

    event->setTimecodes(Timecode("00:00:01:00"), Timecode("00:00:05:00"), Timecode("00:00:04:00"),
                        Timecode("00:00:05:00"));
    EXPECT_EQ(event->flaws(), Flaws());
    EXPECT_EQ(event->motionSpeed(), 2.0);

    event->setSrcOut(Timecode("00:00:01:00"));
    EXPECT_EQ(event->flaws(), Flaws());
    EXPECT_EQ(event->motionSpeed(), 2.0);
}

RC_GTEST_PROP(EventBase, MotionSpeedDoesNotDependOnWhereTheEventStands, ())
{
    const TestProject project(Framerate::fromLabel("29.97 dfps"));
    const std::int32_t last = Timecode::framerate().lastFrame;
    const auto sourceLength = *rc::gen::inRange<std::int32_t>(1, 10000);
    const auto destinationLength = *rc::gen::inRange<std::int32_t>(1, 10000);
    const auto source = *rc::gen::inRange<std::int32_t>(0, last - sourceLength);
    const auto destination = *rc::gen::inRange<std::int32_t>(0, last - destinationLength);
    EventBase atZero;
    EventBase elsewhere;

    atZero.setTimecodes(Timecode(0), Timecode(sourceLength), Timecode(0), Timecode(destinationLength));
    elsewhere.setTimecodes(Timecode(source), Timecode(source + sourceLength), Timecode(destination),
                           Timecode(destination + destinationLength));

    RC_ASSERT(elsewhere.motionSpeed() == atZero.motionSpeed());
    RC_ASSERT((sourceLength == destinationLength) == (elsewhere.motionSpeed() == 1.0));
}

TEST(EventBase, ASpeedIsNormalWhenItIsCloserThanAHundredthToOne)
{
    EventBase exactlyAboveByAHundredth;
    exactlyAboveByAHundredth.setTimecodes(Timecode(0), Timecode(101), Timecode(0), Timecode(100));
    EventBase above;
    above.setTimecodes(Timecode(0), Timecode(10099), Timecode(0), Timecode(10000));
    EventBase below;
    below.setTimecodes(Timecode(0), Timecode(9901), Timecode(0), Timecode(10000));
    EventBase belowByAHundredth;
    belowByAHundredth.setTimecodes(Timecode(0), Timecode(99), Timecode(0), Timecode(100));

    EXPECT_EQ(exactlyAboveByAHundredth.motionSpeed(), 1.01);
    EXPECT_FALSE(exactlyAboveByAHundredth.isNormalSpeed());
    EXPECT_TRUE(above.isNormalSpeed());
    EXPECT_TRUE(below.isNormalSpeed());
    EXPECT_FALSE(belowByAHundredth.isNormalSpeed());
    EXPECT_TRUE(EventBase().isNormalSpeed());
}

TEST(EventBase, HasASpeedThatIsCloserThanAHundredth)
{
    const auto event = doubleSpeedEvent();

    EXPECT_TRUE(event->hasSpeed(2.0));
    EXPECT_TRUE(event->hasSpeed(2.0099));
    EXPECT_FALSE(event->hasSpeed(2.011));
    EXPECT_TRUE(event->hasSpeed(1.9901));
    EXPECT_FALSE(event->hasSpeed(1.989));
    EXPECT_FALSE(event->hasSpeed(-2.0));
}

TEST(EventBase, EachSetterStoresItsFields)
{
    EventBase event;

    event.setRollName("A001");
    event.setClipName("shot");
    event.setEdlFileName("reel.edl");
    event.setTransitionType(core::TransitionType::Wipe);
    event.setTransitionDuration(12);
    event.setVfx(true);
    event.setEventNumber(4294967295U);
    event.setComment("a\nb");
    event.setSrcIn(Timecode("00:00:00:01"));
    event.setSrcOut(Timecode("00:00:00:02"));
    event.setDstIn(Timecode("00:00:00:03"));
    event.setDstOut(Timecode("00:00:00:04"));

    EXPECT_EQ(event.rollName(), "A001");
    EXPECT_EQ(event.clipName(), "shot");
    EXPECT_EQ(event.edlFileName(), "reel.edl");
    EXPECT_EQ(event.transitionType(), 2);
    EXPECT_EQ(event.transitionDuration(), 12);
    EXPECT_TRUE(event.vfx());
    EXPECT_EQ(event.eventNumber(), 4294967295U);
    EXPECT_EQ(event.comment(), "a\nb");
    EXPECT_EQ(timecodesOf(event), "00:00:00:01 00:00:00:02 00:00:00:03 00:00:00:04");
}

TEST(EventBase, TheCombinedSettersStoreTheirTimecodes)
{
    const auto event = makeEvent("A", "00:00:00:00", "00:00:00:00", "00:00:00:00", "00:00:00:00");

    event->setSrc(Timecode("00:00:00:01"), Timecode("00:00:00:02"));
    EXPECT_EQ(timecodesOf(*event), "00:00:00:01 00:00:00:02 00:00:00:00 00:00:00:00");
    event->setDst(Timecode("00:00:00:03"), Timecode("00:00:00:04"));
    EXPECT_EQ(timecodesOf(*event), "00:00:00:01 00:00:00:02 00:00:00:03 00:00:00:04");
    event->setIn(Timecode("00:00:00:00"), Timecode("00:00:00:02"));
    EXPECT_EQ(timecodesOf(*event), "00:00:00:00 00:00:00:02 00:00:00:02 00:00:00:04");
    event->setOut(Timecode("00:00:00:10"), Timecode("00:00:00:12"));
    EXPECT_EQ(timecodesOf(*event), "00:00:00:00 00:00:00:10 00:00:00:02 00:00:00:12");
    EXPECT_EQ(event->motionSpeed(), 1.0);
}

TEST(EventBase, EachSetterNotifiesOnceBehindTheChange)
{
    const Timecode one("00:00:00:01");
    const Timecode two("00:00:00:02");
    struct Setter {
        const char* name;
        std::function<void(EventBase&)> set;
        std::function<bool(const EventBase&)> isSet;
    };
    const Setter setters[] = {
        {"setRollName", [](auto& e) { e.setRollName("x"); }, [](auto& e) { return e.rollName() == "x"; }},
        {"setClipName", [](auto& e) { e.setClipName("x"); }, [](auto& e) { return e.clipName() == "x"; }},
        {"setEdlFileName", [](auto& e) { e.setEdlFileName("x"); }, [](auto& e) { return e.edlFileName() == "x"; }},
        {"setTransitionType", [](auto& e) { e.setTransitionType(2); }, [](auto& e) { return e.transitionType() == 2; }},
        {"setTransitionDuration", [](auto& e) { e.setTransitionDuration(9); },
         [](auto& e) { return e.transitionDuration() == 9; }},
        {"setVfx", [](auto& e) { e.setVfx(true); }, [](auto& e) { return e.vfx(); }},
        {"setSrcIn", [&](auto& e) { e.setSrcIn(one); }, [&](auto& e) { return e.srcIn() == one; }},
        {"setSrcOut", [&](auto& e) { e.setSrcOut(one); }, [&](auto& e) { return e.srcOut() == one; }},
        {"setDstIn", [&](auto& e) { e.setDstIn(one); }, [&](auto& e) { return e.dstIn() == one; }},
        {"setDstOut", [&](auto& e) { e.setDstOut(one); }, [&](auto& e) { return e.dstOut() == one; }},
        {"setSrc", [&](auto& e) { e.setSrc(one, two); },
         [&](auto& e) { return e.srcIn() == one && e.srcOut() == two; }},
        {"setDst", [&](auto& e) { e.setDst(one, two); },
         [&](auto& e) { return e.dstIn() == one && e.dstOut() == two; }},
        {"setIn", [&](auto& e) { e.setIn(one, two); }, [&](auto& e) { return e.srcIn() == one && e.dstIn() == two; }},
        {"setOut", [&](auto& e) { e.setOut(one, two); },
         [&](auto& e) { return e.srcOut() == one && e.dstOut() == two; }},
        {"setTimecodes", [&](auto& e) { e.setTimecodes(one, two, one, two); }, [](auto& e) { return e.isValid(); }},
        {"revalidate", [](auto& e) { e.revalidate(); }, [](auto&) { return true; }},
    };

    class Watcher : public RecordingListener {
    public:
        Watcher(const EventBase& event, const std::function<bool(const EventBase&)>& isSet)
            : m_event(event), m_isSet(isSet)
        {
        }
        void onChange(const ChangeContext& context) override
        {
            RecordingListener::onChange(context);
            changedBefore = m_isSet(m_event);
        }
        bool changedBefore = false;

    private:
        const EventBase& m_event;
        const std::function<bool(const EventBase&)>& m_isSet;
    };

    for (const Setter& setter : setters) {
        EventBase event;
        Watcher watcher(event, setter.isSet);
        event.addListener(&watcher);

        setter.set(event);

        EXPECT_EQ(watcher.types, std::vector<std::int32_t>{ChangeContext::EventChanged}) << setter.name;
        EXPECT_TRUE(watcher.changedBefore) << setter.name;
    }
}

TEST(EventBase, NumberCommentAndFlawsChangeInSilence)
{
    EventBase event;
    RecordingListener listener;
    event.addListener(&listener);

    event.setEventNumber(5);
    event.setComment("note");
    event.addFlaw(4);
    event.removeFlaw(4);

    EXPECT_TRUE(listener.types.empty());
}

TEST(EventBase, SendsTheOneContextThatItOwns)
{
    EventBase event;
    EventBase other;
    RecordingListener listener;
    event.addListener(&listener);
    other.addListener(&listener);

    event.setRollName("a");
    event.setRollName("b");
    other.setRollName("c");

    ASSERT_EQ(listener.contexts.size(), 3U);
    EXPECT_EQ(listener.contexts[0], listener.contexts[1]);
    EXPECT_NE(listener.contexts[0], listener.contexts[2]);
    EXPECT_NE(dynamic_cast<const core::EventChangeContext*>(listener.contexts[0]), nullptr);
}

TEST(EventBase, HasTheSameTimecodesWhenAllFourAreEqual)
{
    const auto event = makeEvent("A", "00:00:01:00", "00:00:02:00", "00:00:03:00", "00:00:04:00", 1);

    const auto same = makeEvent("B", "00:00:01:00", "00:00:02:00", "00:00:03:00", "00:00:04:00", 2);
    EXPECT_TRUE(event->hasSameTimecodes(*same));
    EXPECT_TRUE(event->hasSameTimecodes(*event));

    EXPECT_FALSE(
        event->hasSameTimecodes(*makeEvent("A", "00:00:01:01", "00:00:02:00", "00:00:03:00", "00:00:04:00", 1)));
    EXPECT_FALSE(
        event->hasSameTimecodes(*makeEvent("A", "00:00:01:00", "00:00:02:01", "00:00:03:00", "00:00:04:00", 1)));
    EXPECT_FALSE(
        event->hasSameTimecodes(*makeEvent("A", "00:00:01:00", "00:00:02:00", "00:00:03:01", "00:00:04:00", 1)));
    EXPECT_FALSE(
        event->hasSameTimecodes(*makeEvent("A", "00:00:01:00", "00:00:02:00", "00:00:03:00", "00:00:04:01", 1)));
}

} // namespace
} // namespace cadrel::tests
