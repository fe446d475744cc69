// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/CmxParser.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EdlReading.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <limits>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <vector>

namespace cadrel::tests {
namespace {

namespace fs = std::filesystem;
using namespace std::string_literals;

using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::Framerate;
using core::TransitionType;
using core::fileio::CmxParser;
using util::Result;

using Flaws = std::vector<std::int32_t>;

const std::string Timecodes = "01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:00";
const std::string Cut = "001 AX V C " + Timecodes;

/// The one event of a text.
class OnlyEvent {
public:
    explicit OnlyEvent(const std::string& text, bool acceptAudio = false) : m_reading(text, acceptAudio)
    {
        EXPECT_EQ(m_reading.events.size(), 1U) << text;
        if (m_reading.events.isEmpty())
            m_reading.events.add(std::make_shared<EventBase>());
    }

    const EventBase* operator->() const { return &m_reading.events.at(0); }
    const EventBase& operator*() const { return m_reading.events.at(0); }
    Flaws flaws() const { return flawsOf(m_reading.events.at(0)); }

private:
    EdlReading m_reading;
};

std::size_t countOf(const std::string& text)
{
    return EdlReading(text).events.size();
}

/// What parsing detects, and detecting alone too.
ShownRate rateOf(const std::string& text)
{
    const TempFolder folder;
    Framerate detected;
    EXPECT_EQ(CmxParser().detect(widePath(folder.write("reel.edl", text)), detected), Result::Ok);
    const ShownRate parsed = shown(EdlReading(text).framerate);
    EXPECT_EQ(shown(detected), parsed) << text;
    return parsed;
}

std::string cutWithFrames(const std::string& frames)
{
    return "001 AX V C 01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:" + frames + "\n";
}

TEST(CmxParser, ReadsNoEventsFromAnEmptyFile)
{
    const EdlReading reading("");

    EXPECT_EQ(reading.result, Result::Ok);
    EXPECT_TRUE(reading.events.isEmpty());
    EXPECT_EQ(shown(reading.framerate), (ShownRate{0, -1}));
}

TEST(CmxParser, ReadsNoEventsFromATitleAndAFrameCountMode)
{
    const EdlReading reading("TITLE: REEL 1\nFCM: NON-DROP FRAME\n");

    EXPECT_EQ(reading.result, Result::Ok);
    EXPECT_TRUE(reading.events.isEmpty());
    EXPECT_EQ(shown(reading.framerate), (ShownRate{0, 0}));
}

TEST(CmxParser, ReadsAllFieldsOfACut)
{
    const OnlyEvent event("017  A001_C.3-x V     C        1:2:3:4 01:02:05:24 02:00:00:00 02:00:05:00");

    EXPECT_EQ(event->eventKind(), core::EventKind::Plain);
    EXPECT_EQ(event->eventNumber(), 17U);
    EXPECT_EQ(event->rollName(), "A001_C.3-x");
    EXPECT_EQ(event->clipName(), "");
    EXPECT_EQ(event->transitionType(), TransitionType::Cut);
    EXPECT_EQ(event->transitionDuration(), 0);
    EXPECT_EQ(timecodesOf(*event), "01:02:03:04 01:02:05:24 02:00:00:00 02:00:05:00");
    EXPECT_EQ(event->edlFileName(), "reel.edl");
    EXPECT_EQ(event->comment(), "017  A001_C.3-x V     C        1:2:3:4 01:02:05:24 02:00:00:00 02:00:05:00");
    EXPECT_TRUE(event->isValid());
}

TEST(CmxParser, AddsTheEventsBehindThosePresentInTheOrderOfTheFile)
{
    const TempFolder folder;
    const auto path = folder.write("reel.edl", "007 AX V C " + Timecodes + "\n003 AX V C " + Timecodes + "\n");
    EventList events;
    events.add(makeEvent("", "00:00:00:00", "00:00:00:00", "00:00:00:00", "00:00:00:00", 9));

    const Result::Type result = CmxParser().parse(widePath(path), events);

    EXPECT_EQ(result, Result::Ok);
    ASSERT_EQ(events.size(), 3U);
    EXPECT_EQ(events.at(0).eventNumber(), 9U);
    EXPECT_EQ(events.at(1).eventNumber(), 7U);
    EXPECT_EQ(events.at(2).eventNumber(), 3U);
}

TEST(CmxParser, MakesTheListListenToItsNewEvents)
{
    EdlReading reading(Cut);
    RecordingListener listener;
    reading.events.addListener(&listener);

    reading.events.at(0).setRollName("BX");

    EXPECT_EQ(listener.types, std::vector<std::int32_t>{core::ChangeContext::EventListChanged});
    reading.events.removeListener(&listener);
}

TEST(CmxParser, TakesAnyLineThatOpensWithADigitForAnEvent)
{
    EXPECT_EQ(OnlyEvent("2 AX V C " + Timecodes)->eventNumber(), 2U);
    EXPECT_EQ(OnlyEvent("000042 AX V C " + Timecodes)->eventNumber(), 42U);
    EXPECT_EQ(OnlyEvent(" \t7 AX V C " + Timecodes + " \t")->comment(), "7 AX V C " + Timecodes);
}

TEST(CmxParser, SkipsEveryOtherLine)
{
    EXPECT_EQ(countOf("TITLE: 1\nM2 AX 024.0 01:00:00:00\n# " + Cut + "\n>>>" + Cut + "\n-" + Cut + "\nfcm\n"), 0U);
}

TEST(CmxParser, IgnoresPiecesBehindTheLastField)
{
    EXPECT_TRUE(OnlyEvent(Cut + " 00:00:00:00 anything")->isValid());
}

TEST(CmxParser, ReadsTheSameEventsFromFilesOfAnyDelimiter)
{
    const std::string lineFeeds = "TITLE: X\n\nFCM: NON-DROP FRAME\n" + Cut + "\n* FROM CLIP NAME: A 1\n\n002 BX V C " +
                                  Timecodes + "\n* TO CLIP NAME: B";

    for (const std::string delimiter : {"\n", "\r", "\r\n"}) {
        std::string text;
        for (const char character : lineFeeds)
            text += character == '\n' ? delimiter : std::string(1, character);
        const EdlReading reading(text);

        SCOPED_TRACE(testing::PrintToString(delimiter));
        ASSERT_EQ(reading.events.size(), 2U);
        EXPECT_EQ(reading.events.at(0).rollName(), "AX");
        EXPECT_EQ(reading.events.at(0).clipName(), "A 1");
        EXPECT_EQ(reading.events.at(0).comment(), Cut + "\n* FROM CLIP NAME: A 1");
        EXPECT_EQ(reading.events.at(1).rollName(), "BX");
        EXPECT_EQ(reading.events.at(1).clipName(), "B");
        EXPECT_EQ(shown(reading.framerate).dropFrame, 0);
    }
}

TEST(CmxParser, CutsAtCarriageReturnsWhereOneComesBeforeTheFirstLineFeed)
{
    // The line feed is then no more than a character of the line, and here of its last timecode.
    const OnlyEvent event("TITLE: X\r" + Cut + "\n002 AX V C");

    EXPECT_EQ(event->comment(), Cut + "\n002 AX V C");
    EXPECT_TRUE(event->hasFlaw(EventFlaw::DstOutUnreadable));
}

TEST(CmxParser, CutsAtLineFeedsWhereOneComesBeforeTheFirstCarriageReturn)
{
    const EdlReading reading("TITLE: X\n" + Cut + "\r\n002 AX V C " + Timecodes + "\r003 AX V C " + Timecodes);

    ASSERT_EQ(reading.events.size(), 2U);
    EXPECT_TRUE(reading.events.at(0).isValid());
    EXPECT_TRUE(reading.events.at(1).hasFlaw(EventFlaw::DstOutUnreadable));
}

TEST(CmxParser, ReadsALastLineWithoutADelimiter)
{
    EXPECT_EQ(countOf("TITLE: X\n" + Cut), 1U);
    EXPECT_EQ(countOf("TITLE: X\r\n" + Cut), 1U);
    EXPECT_EQ(countOf(Cut), 1U);
}

TEST(CmxParser, KeepsZerosAndBytesThatAreNoUtf8)
{
    const std::string name = "\xE4\xFF\0\x80Z"s;

    const OnlyEvent event("\0garbage\n"s + Cut + "\n* NAME: " + name + "\n");

    EXPECT_EQ(event->clipName(), name);
    EXPECT_EQ(event->comment(), Cut + "\n* NAME: " + name);
}

TEST(CmxParser, ReadsLinesOfAnyLength)
{
    // Longer than any buffer to start with, and each of another length.
    const std::string first(3000000, 'x');
    const std::string second(1000001, 'y');

    const EdlReading reading("TITLE: " + first + "\n" + Cut + " " + first + "\n* NAME: " + second + "\n002 BX V C " +
                             Timecodes + "\n");

    ASSERT_EQ(reading.events.size(), 2U);
    EXPECT_EQ(reading.events.at(0).comment(), Cut + " " + first + "\n* NAME: " + second);
    EXPECT_EQ(reading.events.at(0).clipName(), second);
    EXPECT_EQ(reading.events.at(1).rollName(), "BX");
}

TEST(CmxParser, FindsADelimiterFarFromTheStart)
{
    const std::string title = "TITLE: " + std::string(3000000, 'x');

    EXPECT_EQ(OnlyEvent(title + "\r" + Cut + "\r* NAME: A\r")->clipName(), "A");
    EXPECT_EQ(OnlyEvent(title + "\n" + Cut + "\n* NAME: A\n")->clipName(), "A");
}

TEST(CmxParser, LosesNoLineAtTheEndsOfItsBuffer)
{
    constexpr std::uint32_t Count = 20000;
    std::string text;
    for (std::uint32_t number = 1; number <= Count; ++number)
        text += std::to_string(number) + " AX V C " + Timecodes + "\n";

    const EdlReading reading(text);

    ASSERT_EQ(reading.events.size(), Count);
    for (std::uint32_t number = 1; number <= Count; ++number) {
        const EventBase& event = reading.events.at(number - 1);
        ASSERT_EQ(event.comment(), std::to_string(number) + " AX V C " + Timecodes);
        ASSERT_TRUE(event.isValid());
    }
}

TEST(CmxParser, FlagsAnEventNumberWithAnyOtherCharacter)
{
    const OnlyEvent event("001A AX V C " + Timecodes);

    EXPECT_EQ(event.flaws(), Flaws{EventFlaw::EventNumberNotNumeric});
    EXPECT_EQ(event->eventNumber(), 0U);
    EXPECT_EQ(event->rollName(), "AX");
}

TEST(CmxParser, TakesTheGreatestNumberForOneThatIsTooLarge)
{
    constexpr std::uint32_t GreatestNumber = std::numeric_limits<std::uint32_t>::max();
    constexpr std::int32_t GreatestDuration = std::numeric_limits<std::int32_t>::max();

    EXPECT_EQ(OnlyEvent("4294967295 AX V C " + Timecodes)->eventNumber(), GreatestNumber);
    EXPECT_EQ(OnlyEvent("4294967296 AX V C " + Timecodes)->eventNumber(), GreatestNumber);
    EXPECT_EQ(OnlyEvent("99999999999999999999999999 AX V C " + Timecodes)->eventNumber(), GreatestNumber);
    EXPECT_EQ(OnlyEvent("0000000000000000000000000007 AX V C " + Timecodes)->eventNumber(), 7U);
    EXPECT_EQ(OnlyEvent("1 AX V D 2147483647 " + Timecodes)->transitionDuration(), GreatestDuration);
    EXPECT_EQ(OnlyEvent("1 AX V D 2147483648 " + Timecodes)->transitionDuration(), GreatestDuration);
    EXPECT_TRUE(OnlyEvent("1 AX V D 99999999999999999999999999 " + Timecodes)->isValid());
}

TEST(CmxParser, TakesLettersDigitsDotsDashesAndUnderscoresInARollName)
{
    const OnlyEvent event("001 .-_azAZ09 V C " + Timecodes);

    EXPECT_EQ(event->rollName(), ".-_azAZ09");
    EXPECT_TRUE(event->isValid());
}

TEST(CmxParser, FlagsARollNameWithAnyOtherCharacter)
{
    for (const std::string name : {"A/1", "A:1", "A*", "A@", "[A", "`A", "{A", "A,1", "\xC3\x84"}) {
        const OnlyEvent event("001 " + name + " V C " + Timecodes);

        EXPECT_EQ(event.flaws(), Flaws{EventFlaw::RollNameInvalid}) << name;
        EXPECT_EQ(event->rollName(), "") << name;
    }
}

TEST(CmxParser, TakesVideoChannels)
{
    for (const std::string channel : {"V", "B", "AA/V", "V1", "xV", "NONEB"})
        EXPECT_TRUE(OnlyEvent("001 AX " + channel + " C " + Timecodes)->isValid()) << channel;
}

TEST(CmxParser, FlagsAudioChannelsUnlessTheyAreAccepted)
{
    for (const std::string channel : {"A", "A2", "AA"}) {
        const std::string line = "001 AX " + channel + " C " + Timecodes;

        EXPECT_EQ(OnlyEvent(line, false).flaws(), Flaws{EventFlaw::NotVideoEvent}) << channel;
        EXPECT_TRUE(OnlyEvent(line, true)->isValid()) << channel;
    }
}

TEST(CmxParser, FlagsAnyOtherChannelAlsoWhereAudioIsAccepted)
{
    for (const std::string channel : {"NONE", "a", "v", "b", "1"}) {
        EXPECT_EQ(OnlyEvent("001 AX " + channel + " C " + Timecodes, true).flaws(), Flaws{EventFlaw::NotVideoEvent})
            << channel;
    }
}

TEST(CmxParser, LeavesAudioOutInTheShortForm)
{
    const TempFolder folder;
    const auto path = folder.write("reel.edl", "001 AX A C " + Timecodes);
    EventList events;

    CmxParser().parse(widePath(path), events);

    ASSERT_EQ(events.size(), 1U);
    EXPECT_TRUE(events.at(0).hasFlaw(EventFlaw::NotVideoEvent));
}

TEST(CmxParser, ReadsATransitionAndItsDuration)
{
    const OnlyEvent dissolve("001 AX V D 024 " + Timecodes);
    EXPECT_EQ(dissolve->transitionType(), TransitionType::Dissolve);
    EXPECT_EQ(dissolve->transitionDuration(), 24);
    EXPECT_EQ(timecodesOf(*dissolve), Timecodes);
    EXPECT_TRUE(dissolve->isValid());

    const OnlyEvent wipe("001 AX V W 008 " + Timecodes);
    EXPECT_EQ(wipe->transitionType(), TransitionType::Wipe);
    EXPECT_EQ(wipe->transitionDuration(), 8);
    EXPECT_TRUE(wipe->isValid());
}

TEST(CmxParser, LooksAtTheFirstLetterOfATransitionOnly)
{
    EXPECT_EQ(OnlyEvent("001 AX V W001 010 " + Timecodes)->transitionType(), TransitionType::Wipe);
    EXPECT_EQ(OnlyEvent("001 AX V W001 010 " + Timecodes)->transitionDuration(), 10);
    EXPECT_EQ(OnlyEvent("001 AX V Dxyz 010 " + Timecodes)->transitionType(), TransitionType::Dissolve);
    EXPECT_EQ(OnlyEvent("001 AX V CUT " + Timecodes)->transitionType(), TransitionType::Cut);
}

TEST(CmxParser, UsesUpADurationThatIsNoNumber)
{
    const OnlyEvent event("001 AX V D 24f " + Timecodes);

    EXPECT_EQ(event.flaws(), Flaws{EventFlaw::TransitionDurationInvalid});
    EXPECT_EQ(event->transitionType(), TransitionType::Dissolve);
    EXPECT_EQ(event->transitionDuration(), 0);
    EXPECT_EQ(timecodesOf(*event), Timecodes);
}

TEST(CmxParser, ReadsTheTimecodesBehindAnUnknownTransitionAsThoseOfACut)
{
    for (const std::string transition : {"K", "c", "KB", "1"}) {
        const OnlyEvent event("001 AX V " + transition + " " + Timecodes);

        EXPECT_EQ(event.flaws(), Flaws{EventFlaw::TransitionTypeUnsupported}) << transition;
        EXPECT_EQ(event->transitionType(), TransitionType::Cut) << transition;
        EXPECT_EQ(timecodesOf(*event), Timecodes) << transition;
    }
}

TEST(CmxParser, TakesTimecodesWithOneDigitFieldsAndWithASemicolon)
{
    const OnlyEvent event("001 AX V C 1:2:3;4 01:00:05:00 02:00:00;00 2:0:05:0");

    EXPECT_EQ(timecodesOf(*event), "01:02:03:04 01:00:05:00 02:00:00:00 02:00:05:00");
}

TEST(CmxParser, FlagsEachTimecodeThatCannotBeRead)
{
    const std::string good = "01:00:00:00";

    for (const std::string bad : {"101:00:00:00", "01:00:00:00A", "01:00:00", "01:00:00:00:00", "01;00:00:00",
                                  "01:00:00.00", "-1:00:00:00", "01::00:00", "abc"}) {
        SCOPED_TRACE(bad);
        const std::string start = "001 AX V C ";
        EXPECT_EQ(OnlyEvent(start + bad + " " + good + " " + good + " " + good).flaws(),
                  (Flaws{0, EventFlaw::SrcInUnreadable}));
        // A start that is read stands behind the 00:00:00:00 of an end that is not.
        EXPECT_EQ(OnlyEvent(start + good + " " + bad + " " + good + " " + good).flaws(),
                  (Flaws{0, EventFlaw::SrcOutUnreadable, EventFlaw::TimecodeRangeInvalid}));
        EXPECT_EQ(OnlyEvent(start + good + " " + good + " " + bad + " " + good).flaws(),
                  (Flaws{0, EventFlaw::DstInUnreadable}));
        EXPECT_EQ(OnlyEvent(start + good + " " + good + " " + good + " " + bad).flaws(),
                  (Flaws{0, EventFlaw::DstOutUnreadable, EventFlaw::TimecodeRangeInvalid}));
        EXPECT_EQ(OnlyEvent(start + bad + " " + bad + " " + bad + " " + bad).flaws(),
                  (Flaws{0, EventFlaw::SrcInUnreadable, EventFlaw::SrcOutUnreadable, EventFlaw::DstInUnreadable,
                         EventFlaw::DstOutUnreadable}));
    }
}

TEST(CmxParser, KeepsAnEventWithEveryFlawOfItsFields)
{
    const OnlyEvent event("0x1 A/X N D 2f a b c d");

    EXPECT_EQ(event.flaws(), (Flaws{0, 2, 3, 4, 5, 7, 8, 9, 10}));
    EXPECT_EQ(event->comment(), "0x1 A/X N D 2f a b c d");
}

TEST(CmxParser, LeavesTheTestOfTimecodesToTheEvent)
{
    EXPECT_EQ(OnlyEvent("001 AX V C 01:00:05:00 01:00:00:00 02:00:00:00 02:00:05:00").flaws(),
              Flaws{EventFlaw::TimecodeRangeInvalid});
    EXPECT_EQ(OnlyEvent("001 AX V C 01:00:00:25 01:00:05:00 02:00:00:00 02:00:05:00").flaws(),
              Flaws{EventFlaw::TimecodeInvalid});
}

TEST(CmxParser, KeepsTheRangeFlawOfTheTimecodesReadBeforeAnInvalidOne)
{
    // While SRC OUT is still 00:00:00:00, SRC IN lies behind it. The invalid SRC OUT leaves that flaw where it is.
    EXPECT_EQ(OnlyEvent("001 AX V C 01:00:00:00 99:99:99:99 02:00:00:00 02:00:05:00").flaws(),
              (Flaws{EventFlaw::TimecodeInvalid, EventFlaw::TimecodeRangeInvalid}));
    EXPECT_EQ(OnlyEvent("001 AX V C 99:99:99:99 01:00:00:00 02:00:00:00 02:00:05:00").flaws(),
              Flaws{EventFlaw::TimecodeInvalid});
}

TEST(CmxParser, DropsALineWithTooFewPieces)
{
    EXPECT_EQ(countOf("001"), 0U);
    EXPECT_EQ(countOf("001 AX"), 0U);
    EXPECT_EQ(countOf("001 AX V"), 0U);
    EXPECT_EQ(countOf("001 AX V C"), 0U);
    EXPECT_EQ(countOf("001 AX V D"), 0U);
    EXPECT_EQ(countOf("001 AX V D 024 01:00:00:00"), 0U);
    EXPECT_EQ(countOf("001 AX V C 01:00:00:00 01:00:00:00 01:00:00:00"), 0U);
    EXPECT_EQ(countOf("001 AX V D 024 01:00:00:00 01:00:00:00 01:00:00:00"), 0U);
}

TEST(CmxParser, TakesTheFirstTimecodeForTheDurationThatAWipeLacks)
{
    EXPECT_EQ(countOf("001 AX V W " + Timecodes), 0U);
    EXPECT_EQ(OnlyEvent("001 AX V W " + Timecodes + " 02:00:06:00").flaws(),
              (Flaws{EventFlaw::TransitionDurationInvalid}));
    EXPECT_EQ(OnlyEvent("001 AX V W " + Timecodes + " 02:00:06:00")->srcIn().toString(), "01:00:05:00");
}

TEST(CmxParser, CutsFieldsAtBlanksOnly)
{
    // A tab between two fields makes them one, which is a roll name with a tab in it here.
    EXPECT_EQ(OnlyEvent("001 A\tX V C " + Timecodes).flaws(), Flaws{EventFlaw::RollNameInvalid});
    EXPECT_EQ(countOf("001\tAX V C " + Timecodes), 0U);
}

TEST(CmxParser, TrimsEachField)
{
    const OnlyEvent event("001\t \tAX\t V\t \tC 01:00:00:00\t \t01:00:05:00 02:00:00:00 02:00:05:00");

    EXPECT_EQ(event->eventNumber(), 1U);
    EXPECT_EQ(event->rollName(), "AX");
    EXPECT_TRUE(event->isValid());
}

TEST(CmxParser, CountsAFieldOfMereTabs)
{
    EXPECT_EQ(OnlyEvent("001 \t V C " + Timecodes)->rollName(), "");
    EXPECT_TRUE(OnlyEvent("001 \t V C " + Timecodes)->isValid());
    EXPECT_EQ(OnlyEvent("001 AX \t C " + Timecodes).flaws(), Flaws{EventFlaw::NotVideoEvent});
    EXPECT_EQ(OnlyEvent("001 AX V \t " + Timecodes).flaws(), Flaws{EventFlaw::TransitionTypeUnsupported});
    EXPECT_EQ(OnlyEvent("001 AX V D \t " + Timecodes)->transitionDuration(), 0);
    EXPECT_TRUE(OnlyEvent("001 AX V D \t " + Timecodes)->isValid());
}

TEST(CmxParser, TakesTheClipNameFromAComment)
{
    EXPECT_EQ(OnlyEvent(Cut + "\n* FROM CLIP NAME:  SHOT_12 A \t\n")->clipName(), "SHOT_12 A");
    EXPECT_EQ(OnlyEvent(Cut + "\n*NAME:x")->clipName(), "x");
    EXPECT_EQ(OnlyEvent(Cut + "\n* NAME: first NAME: second")->clipName(), "first NAME: second");
}

TEST(CmxParser, TakesNoClipNameFromOtherLines)
{
    EXPECT_EQ(OnlyEvent(Cut + "\n* from clip name: a\n* FROM CLIP: b\n* SOURCE FILE: c\nFROM CLIP NAME: d")->clipName(),
              "");
}

TEST(CmxParser, CollectsTheCommentLinesOfAnEvent)
{
    EXPECT_EQ(OnlyEvent(Cut + "\n  * FROM CLIP NAME: A  \nTITLE: X\n*\n\n* LOC: 01:00:00:00 RED\n")->comment(),
              Cut + "\n* FROM CLIP NAME: A\n*\n* LOC: 01:00:00:00 RED");
}

TEST(CmxParser, GivesTheLaterOfTwoClipNamesToAnEventOfOneLine)
{
    const OnlyEvent event(Cut + "\n* FROM CLIP NAME: A\n* TO CLIP NAME: B\n");

    EXPECT_EQ(event->clipName(), "B");
    EXPECT_EQ(event->comment(), Cut + "\n* FROM CLIP NAME: A\n* TO CLIP NAME: B");
}

TEST(CmxParser, IgnoresACommentWithAnEmptyName)
{
    const OnlyEvent event(Cut + "\n* FROM CLIP NAME: A\n* SOURCE: NAME: \t\n* SOURCE: NAME:");

    EXPECT_EQ(event->clipName(), "A");
    EXPECT_EQ(event->comment(), Cut + "\n* FROM CLIP NAME: A");
}

TEST(CmxParser, DividesTheCommentsOfATransitionInTwoLines)
{
    const std::string first = "002 AX V C 01:00:00:00 01:00:00:00 02:00:00:00 02:00:00:00";
    const std::string second = "002 BX V D 024 " + Timecodes;

    const EdlReading reading(Cut + "\n" + first + "\n" + second +
                             "\n* BLEND\n* FROM CLIP NAME: A\n* TO CLIP NAME: B\n* FROM CLIP: C\n* SOURCE FILE: D\n"
                             "* KEY NAME: E\n* FROM CLIP TO CLIP\n");

    ASSERT_EQ(reading.events.size(), 3U);
    EXPECT_EQ(reading.events.at(0).comment(), Cut);
    EXPECT_EQ(reading.events.at(1).clipName(), "A");
    EXPECT_EQ(reading.events.at(1).comment(), first + "\n* FROM CLIP NAME: A\n* FROM CLIP: C\n* FROM CLIP TO CLIP");
    EXPECT_EQ(reading.events.at(2).clipName(), "B");
    EXPECT_EQ(reading.events.at(2).comment(), second + "\n* TO CLIP NAME: B");
}

TEST(CmxParser, GivesCommentsBetweenTheLinesOfATransitionToTheFirst)
{
    const EdlReading reading(Cut + "\n002 AX V C " + Timecodes + "\n* NOTE\n002 BX V D 024 " + Timecodes +
                             "\n* FROM CLIP NAME: A\n003 CX V C " + Timecodes + "\n* FROM CLIP NAME: C\n");

    ASSERT_EQ(reading.events.size(), 4U);
    EXPECT_EQ(reading.events.at(1).comment(), "002 AX V C " + Timecodes + "\n* NOTE\n* FROM CLIP NAME: A");
    EXPECT_EQ(reading.events.at(2).comment(), "002 BX V D 024 " + Timecodes);
    EXPECT_EQ(reading.events.at(3).clipName(), "C");
}

TEST(CmxParser, TakesAFirstEventOfNumberZeroForTheSecondLineOfATransition)
{
    const OnlyEvent event("000 AX V C " + Timecodes + "\n* FROM CLIP NAME: A\n* NOTE NAME: B\n* TO CLIP NAME: C\n");

    EXPECT_EQ(event->clipName(), "C");
    EXPECT_EQ(event->comment(), "000 AX V C " + Timecodes + "\n* TO CLIP NAME: C");
}

TEST(CmxParser, TakesTwoEventsWithoutAReadableNumberForATransition)
{
    const EdlReading reading("1a AX V C " + Timecodes + "\n2b BX V C " + Timecodes + "\n* FROM CLIP NAME: A\n");

    ASSERT_EQ(reading.events.size(), 2U);
    EXPECT_EQ(reading.events.at(0).clipName(), "A");
    EXPECT_EQ(reading.events.at(1).clipName(), "");
}

TEST(CmxParser, IgnoresTheCommentsBehindADroppedLine)
{
    const OnlyEvent event(Cut + "\n001 AX V D 024 01:00:00:00\n* FROM CLIP NAME: A\n");

    EXPECT_EQ(event->clipName(), "");
    EXPECT_EQ(event->comment(), Cut);
}

TEST(CmxParser, ComparesNumbersWithTheEventBeforeADroppedLine)
{
    // The event before the dropped one went into the list when the dropped one began, and "previous" it still is.
    const EdlReading reading("005 AX V C " + Timecodes + "\n006 AX\n005 BX V D 010 " + Timecodes +
                             "\n* FROM CLIP NAME: A\n* TO CLIP NAME: B\n");

    ASSERT_EQ(reading.events.size(), 2U);
    EXPECT_EQ(reading.events.at(0).clipName(), "A");
    EXPECT_EQ(reading.events.at(1).clipName(), "B");
}

TEST(CmxParser, IgnoresCommentsBeforeTheFirstEvent)
{
    EXPECT_EQ(OnlyEvent("* FROM CLIP NAME: A\n" + Cut)->comment(), Cut);
}

TEST(CmxParser, LetsAFrameCountModeStandBetweenAnEventAndItsComments)
{
    const OnlyEvent event(Cut + "\nFCM: NON-DROP FRAME\n* FROM CLIP NAME: A");

    EXPECT_EQ(event->clipName(), "A");
    EXPECT_EQ(event->comment(), Cut + "\n* FROM CLIP NAME: A");
}

TEST(CmxParser, ReadsTheFrameCountMode)
{
    EXPECT_EQ(rateOf("FCM: NON-DROP FRAME\n" + cutWithFrames("10")), (ShownRate{24, 0}));
    EXPECT_EQ(rateOf("FCM: DROP FRAME\n" + cutWithFrames("10")), (ShownRate{30, 1}));
    EXPECT_EQ(rateOf("FCM: SOMETHING\n" + cutWithFrames("10")), (ShownRate{24, -1}));
    EXPECT_EQ(rateOf("FCM\n" + cutWithFrames("10")), (ShownRate{24, -1}));
    EXPECT_EQ(rateOf("FCMxDROP FRAMEx\n" + cutWithFrames("10")), (ShownRate{30, 1}));
    EXPECT_EQ(rateOf("FCM: drop frame\n" + cutWithFrames("10")), (ShownRate{24, -1}));
    EXPECT_EQ(rateOf("fcm: DROP FRAME\n" + cutWithFrames("10")), (ShownRate{24, -1}));
    EXPECT_EQ(rateOf("* FCM: DROP FRAME\n" + cutWithFrames("10")), (ShownRate{24, -1}));
    EXPECT_EQ(rateOf(cutWithFrames("10")), (ShownRate{24, -1}));
}

TEST(CmxParser, LetsALaterFrameCountModeHoldForTheWholeFile)
{
    EXPECT_EQ(rateOf("FCM: DROP FRAME\n" + cutWithFrames("10") + "FCM: NON-DROP FRAME\n"), (ShownRate{24, 0}));
    EXPECT_EQ(rateOf("FCM: NON-DROP FRAME\n" + cutWithFrames("10") + "FCM: DROP FRAME\n"), (ShownRate{30, 1}));
    EXPECT_EQ(rateOf("FCM: DROP FRAME\n" + cutWithFrames("10") + "FCM: SOMETHING\n"), (ShownRate{30, 1}));
}

TEST(CmxParser, DetectsTheLeastRateThatHoldsTheHighestFrame)
{
    const auto rateForFrames = [](const std::string& frames) { return rateOf(cutWithFrames(frames)).framesPerSecond; };

    EXPECT_EQ(rateForFrames("00"), 0);
    EXPECT_EQ(rateForFrames("01"), 24);
    EXPECT_EQ(rateForFrames("23"), 24);
    EXPECT_EQ(rateForFrames("24"), 25);
    EXPECT_EQ(rateForFrames("25"), 30);
    EXPECT_EQ(rateForFrames("29"), 30);
    EXPECT_EQ(rateForFrames("30"), 60);
    EXPECT_EQ(rateForFrames("59"), 60);
}

TEST(CmxParser, CountsNoFramesOfSixtyOrMore)
{
    EXPECT_EQ(rateOf(cutWithFrames("60")), (ShownRate{0, -1}));
    EXPECT_EQ(rateOf(cutWithFrames("60") + cutWithFrames("99") + cutWithFrames("12")), (ShownRate{24, -1}));
    EXPECT_TRUE(OnlyEvent(cutWithFrames("60"))->hasFlaw(EventFlaw::TimecodeInvalid));
}

TEST(CmxParser, CountsEachOfTheFourTimecodes)
{
    EXPECT_EQ(rateOf("001 AX V C 01:00:00:29 01:00:05:00 02:00:00:00 02:00:05:00").framesPerSecond, 30);
    EXPECT_EQ(rateOf("001 AX V C 01:00:00:00 01:00:05:29 02:00:00:00 02:00:05:00").framesPerSecond, 30);
    EXPECT_EQ(rateOf("001 AX V C 01:00:00:00 01:00:05:00 02:00:00:29 02:00:05:00").framesPerSecond, 30);
    EXPECT_EQ(rateOf("001 AX V C 01:00:00:00 01:00:05:00 02:00:00:00 02:00:05;29").framesPerSecond, 30);
}

TEST(CmxParser, CountsTheTimecodesOfADroppedLineUpToItsEnd)
{
    EXPECT_EQ(rateOf("001 AX V C 01:00:00:00 01:00:05:24").framesPerSecond, 25);
    EXPECT_EQ(rateOf("001 AX V D 01:00:05:24 01:00:05:12").framesPerSecond, 24);
}

TEST(CmxParser, GoesOnCountingInASecondFileButForgetsTheFrameCountMode)
{
    const TempFolder folder;
    const auto first = folder.write("first.edl", "FCM: DROP FRAME\n" + cutWithFrames("29"));
    const auto second = folder.write("second.edl", cutWithFrames("10"));
    CmxParser parser;
    EventList events;
    EXPECT_EQ(shown(parser.detectedFramerate()), (ShownRate{0, -1}));

    parser.parse(widePath(first), events);
    EXPECT_EQ(shown(parser.detectedFramerate()), (ShownRate{30, 1}));

    parser.parse(widePath(second), events);
    EXPECT_EQ(shown(parser.detectedFramerate()), (ShownRate{30, -1}));
}

TEST(CmxParser, DetectsTheRateWithoutAProject)
{
    const NoProject none;
    const TempFolder folder;
    const PlainConverter converter;
    util::StringUtil::setConverter(&converter);
    const auto path = folder.write("reel.edl", "FCM: NON-DROP FRAME\n" + cutWithFrames("24"));
    Framerate framerate;

    const Result::Type result = CmxParser().detect(widePath(path), framerate);

    util::StringUtil::setConverter(nullptr);
    EXPECT_EQ(result, Result::Ok);
    EXPECT_EQ(shown(framerate), (ShownRate{25, 0}));
}

TEST(CmxParser, DropsEveryEventWithoutAProject)
{
    const NoProject none;
    const TempFolder folder;
    const PlainConverter converter;
    util::StringUtil::setConverter(&converter);
    const auto path = folder.write("reel.edl", Cut);
    EventList events;

    const Result::Type result = CmxParser().parse(widePath(path), events);

    util::StringUtil::setConverter(nullptr);
    EXPECT_EQ(result, Result::Ok);
    EXPECT_TRUE(events.isEmpty());
}

/// Reads `path` in every way, and expects it to be refused with nothing changed.
void expectRefused(const std::wstring& path, Result::Type expected)
{
    EventList events;
    events.add(std::make_shared<EventBase>());
    RecordingListener listener;
    events.addListener(&listener);
    Framerate framerate(60, 0);

    EXPECT_EQ(CmxParser().parse(path, events, framerate, false), expected);
    EXPECT_EQ(CmxParser().parse(path, events), expected);
    EXPECT_EQ(CmxParser().detect(path, framerate), expected);

    EXPECT_EQ(events.size(), 1U);
    EXPECT_TRUE(listener.types.empty());
    EXPECT_EQ(shown(framerate), (ShownRate{60, 0}));
    events.removeListener(&listener);
}

TEST(CmxParser, RefusesWhatCannotBeOpened)
{
    const TempFolder folder;

    expectRefused(widePath(folder / "missing.edl"), Result::FileAccessFailed);
    expectRefused(widePath(folder / "missing/reel.edl"), Result::FileAccessFailed);
    expectRefused(L"", Result::FileAccessFailed);
}

TEST(CmxParser, RefusesWhatIsNoRegularFile)
{
    const TempFolder folder;
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);

    expectRefused(widePath(folder.path()), Result::FileAccessFailed);
    expectRefused(widePath(folder / "pipe"), Result::FileAccessFailed);
    expectRefused(L"/dev/null", Result::FileAccessFailed);
    expectRefused(L"/dev/zero", Result::FileAccessFailed);
}

TEST(CmxParser, RefusesAReadThatBreaksOff)
{
    // It opens as a regular file, and its first bytes can't be read.
    expectRefused(L"/proc/self/mem", Result::FileAccessFailed);
}

TEST(CmxParser, ReturnsWhatTheConversionOfThePathThrows)
{
    expectRefused(L"reel\xD800.edl", Result::InvalidArgument);
    util::StringUtil::setConverter(nullptr);
    expectRefused(L"reel.edl", Result::NotAvailable);
}

TEST(CmxParser, RefusesAPathWithAZeroInIt)
{
    const TempFolder folder;

    expectRefused(widePath(folder.write("reel.edl", Cut)) + L"\0.edl"s, Result::FileAccessFailed);
}

TEST(CmxParser, TakesTheFileNameBehindTheLastSeparator)
{
    const TempFolder folder;
    const auto fileNameOf = [&](const std::string& name) {
        EventList events;
        CmxParser().parse(widePath(folder.write(name, Cut)), events);
        return events.size() == 1 ? events.at(0).edlFileName() : "no event";
    };

    EXPECT_EQ(fileNameOf("Rolle 1 \xC3\xA4.edl"), "Rolle 1 \xC3\xA4.edl");
    // With a backslash anywhere, the slash is a character like any other.
    EXPECT_EQ(fileNameOf("C:\\films\\reel.edl"), "reel.edl");
    EXPECT_EQ(fileNameOf("back\\"), "");
}

/// Parts of EDLs, and what may stand in their place.
std::string anyEdlText()
{
    const auto part = rc::gen::element<std::string>(
        "001", "002", "0", "7x", "AX", "A/B", "V", "A", "B", "C", "D", "W001", "K", "024", "12f", "01:00:00:00",
        "01:00:05:12", "1:2:3;4", "02:00:00:24", "02:00:10:29", "02:00:10:59", "99:99:99:99", "10:00", " ", " ", " ",
        " ", " ", "\t", "\n", "\n", "\n", "\r", "\r\n", "* FROM CLIP NAME: A", "* TO CLIP NAME: B", "NAME:", "*",
        "FCM: DROP FRAME", "FCM: NON-DROP FRAME", "FCM", "\n001 AX V C 01:00:00:00 01:00:05:28 02:00:00:00 02:00:05:00",
        "\n002 BX V D 012 01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:23\n", "\n003 BX V C 01:00:00:00 01:00:05:47\n",
        std::string(1, '\0'), "\xFF");
    std::string text;
    for (const std::string& piece : *rc::gen::container<std::vector<std::string>>(part))
        text += piece;
    return text;
}

RC_GTEST_PROP(CmxParserLaw, DetectingGivesTheRateThatParsingGives, ())
{
    const TestProject project(*rc::gen::element(Framerate(), Framerate(24, 0), Framerate(25, 0), Framerate(30, 1),
                                                Framerate(60, 0), Framerate(30, true, 0)));
    const TempFolder folder;
    const std::wstring path = widePath(folder.write("reel.edl", anyEdlText()));
    EventList events;
    Framerate parsed;
    Framerate detected;

    RC_ASSERT(CmxParser().parse(path, events, parsed, false) == Result::Ok);
    RC_ASSERT(CmxParser().detect(path, detected) == Result::Ok);

    RC_ASSERT(shown(detected) == shown(parsed));
}

RC_GTEST_PROP(CmxParserLaw, EveryDelimiterGivesTheSameEvents, ())
{
    std::string text = anyEdlText();
    std::erase(text, '\r');
    std::string carriageReturns = text;
    std::replace(carriageReturns.begin(), carriageReturns.end(), '\n', '\r');
    std::string both;
    for (const char character : text)
        both += character == '\n' ? "\r\n" : std::string(1, character);

    const EdlReading expected(text);

    for (const std::string& variant : {carriageReturns, both}) {
        const EdlReading reading(variant);
        RC_ASSERT(reading.events.size() == expected.events.size());
        RC_ASSERT(shown(reading.framerate) == shown(expected.framerate));
        for (std::size_t index = 0; index < expected.events.size(); ++index) {
            RC_ASSERT(reading.events.at(index).comment() == expected.events.at(index).comment());
            RC_ASSERT(reading.events.at(index).clipName() == expected.events.at(index).clipName());
            RC_ASSERT(reading.events.at(index).hasSameTimecodes(expected.events.at(index)));
            RC_ASSERT(flawsOf(reading.events.at(index)) == flawsOf(expected.events.at(index)));
        }
    }
}

RC_GTEST_PROP(CmxParserLaw, EveryEventKeepsItsLineAsTheFirstOfItsComment, ())
{
    const EdlReading reading(anyEdlText());

    for (const auto& event : reading.events.events()) {
        RC_ASSERT(!event->comment().empty());
        RC_ASSERT(event->comment().front() >= '0' && event->comment().front() <= '9');
    }
}

/// The numbers of the lines that the events of a text come from.
std::vector<std::uint32_t> linesOf(const std::string& text)
{
    const EdlReading reading(text);
    std::vector<std::uint32_t> lines;
    for (const auto& event : reading.events.events())
        lines.push_back(event->sourceLine());
    return lines;
}

TEST(CmxParser, TellsTheLineOfEachEventWhateverEndsTheLines)
{
    const TestProject project;
    using Lines = std::vector<std::uint32_t>;
    // The comment is line 4, and line 5 is empty.
    for (const std::string end : {"\n", "\r", "\r\n"}) {
        EXPECT_EQ(linesOf("TITLE: X" + end + Cut + end + Cut + end + "* A" + end + end + Cut), (Lines{2, 3, 6}));
        EXPECT_EQ(linesOf(Cut + end), (Lines{1}));
        EXPECT_EQ(linesOf(end + end + Cut), (Lines{3}));
        EXPECT_EQ(linesOf("001 AX V C" + end + Cut), (Lines{2})) << "a dropped line counts";
    }
}

TEST(CmxParser, CountsLinesAsAnEditorDoesWhereTheEndsOfLinesAreMixed)
{
    const TestProject project;
    using Lines = std::vector<std::uint32_t>;

    EXPECT_EQ(linesOf("TITLE: X\n" + Cut + "\r\n" + Cut + "\n" + Cut), (Lines{2, 3, 4}));
    EXPECT_EQ(linesOf("TITLE: X\n" + Cut + "\r\r" + Cut + "\n" + Cut), (Lines{2, 5}));
    EXPECT_EQ(linesOf("TITLE: X\r\nFCM: NON-DROP FRAME\n\n* A\r\n" + Cut), (Lines{5}));
    EXPECT_EQ(linesOf("TITLE: X\n \r\r" + Cut), (Lines{4}));
}

TEST(CmxParser, TellsTheLineThatSaysDropFrame)
{
    const TestProject project;
    const TempFolder folder;
    const auto lineOf = [&](const std::string& text) {
        CmxParser parser;
        core::EventList events;
        const std::wstring path = widePath(folder.write("reel.edl", text));
        EXPECT_EQ(parser.parse(path, events), Result::Ok);
        const auto parsed = parser.rateLine();
        Framerate framerate;
        EXPECT_EQ(parser.detect(path, framerate), Result::Ok);
        EXPECT_EQ(parser.rateLine(), parsed);
        return parsed;
    };
    using core::fileio::SourceLine;

    EXPECT_EQ(lineOf("TITLE: X\n  FCM: DROP FRAME \n" + Cut), (SourceLine{2, "FCM: DROP FRAME"}));
    EXPECT_EQ(lineOf("FCM: DROP FRAME\n" + Cut + "\nFCM: DROP FRAME, STILL"), (SourceLine{1, "FCM: DROP FRAME"}));
    EXPECT_EQ(lineOf("FCM: DROP FRAME\nFCM: NON-DROP FRAME\nFCM: DROP FRAME\n"), (SourceLine{3, "FCM: DROP FRAME"}));
    EXPECT_EQ(lineOf("FCM: DROP FRAME\nFCM: NON-DROP FRAME\n"), std::nullopt);
    EXPECT_EQ(lineOf("FCM: SOMETHING\n" + cutWithFrames("29")), std::nullopt);
}

/// The lines of a text as an editor counts them.
std::vector<std::string> editorLines(const std::string& text)
{
    std::vector<std::string> lines(1);
    for (std::size_t place = 0; place < text.size(); ++place) {
        if (text[place] == '\n' || (text[place] == '\r' && text.substr(place + 1, 1) != "\n"))
            lines.emplace_back();
        else if (text[place] != '\r')
            lines.back() += text[place];
    }
    return lines;
}

RC_GTEST_PROP(CmxParserLaw, EveryEventBeginsInTheLineThatItTells, ())
{
    const TestProject project;
    std::string text = anyEdlText();
    for (char& character : text) {
        if (character == '\n' && *rc::gen::inRange(0, 4) == 0)
            character = '\r';
    }

    const EdlReading reading(text);

    const std::vector<std::string> lines = editorLines(text);
    for (const auto& event : reading.events.events()) {
        RC_ASSERT(event->sourceLine() >= 1U);
        RC_ASSERT(event->sourceLine() <= lines.size());
        const std::string line = util::StringUtil::trim(lines[event->sourceLine() - 1]);
        RC_ASSERT(!line.empty());
        RC_ASSERT(event->comment().starts_with(line));
    }
}

} // namespace
} // namespace cadrel::tests
