// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "core/fileio/FileRemarks.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/EdlReading.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/core/TreeEdls.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <set>
#include <sstream>
#include <string>
#include <string_view>
#include <vector>

namespace cadrel::tests {
namespace {

using namespace std::string_literals;

using core::EventList;
using core::Framerate;
using core::fileio::CmxParser;
using core::fileio::FileRemarks;
using core::fileio::SourceLine;
using util::Result;

using Lines = std::vector<std::string>;

const std::string Timecodes = "01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:00";
const std::string Cut = "001 AX V C " + Timecodes;

/// What a thorough reading makes of a text.
struct Reading {
    explicit Reading(const std::string& text)
    {
        const TempFolder folder;
        const std::wstring path = widePath(folder.write("reel.edl", text));
        CmxParser parser;
        parser.readThoroughly();
        EXPECT_EQ(parser.parse(path, events, framerate, false), Result::Ok);
        remarks = parser.remarks();
        Framerate detected;
        EXPECT_EQ(parser.detect(path, detected), Result::Ok);
        EXPECT_EQ(detected.framesPerSecond, framerate.framesPerSecond);
    }

    /// Each as "12: misses a field".
    Lines unread() const
    {
        Lines lines;
        for (const auto& [line, problem] : remarks.unreadLines)
            lines.push_back(std::to_string(line.number) + ": " + problem);
        return lines;
    }

    /// The roll of each event, with "-" in front of a reversed one.
    Lines rolls() const
    {
        Lines rolls;
        for (const auto& event : events.events())
            rolls.push_back((event->isReversed() ? "-" : "") + event->rollName());
        return rolls;
    }

    EventList events;
    Framerate framerate;
    FileRemarks remarks;
};

Lines unreadOf(const std::string& text)
{
    return Reading(text).unread();
}

class ThoroughReading : public testing::Test {
protected:
    const TestProject project;
};

const std::string MissesAField = "misses a field and isn't read";
const std::string LacksDuration = "has a dissolve or wipe without a duration and isn't read";
const std::string HasNoNumber = "begins with no event number and isn't read";
const std::string HoldsASecond = "holds a second event, which isn't read";
const std::string StandsInAComment = "holds an event in a comment, which isn't read";
const std::string ComesAfterALineEnd = "comes after a line end of another kind than the first and isn't read";
const std::string IsUtf16 = "is UTF-16 text and isn't read";

TEST_F(ThoroughReading, TakesTabsForSeparatorsWhereAFieldWouldBeMissingWithoutThem)
{
    const Reading tabbed("001\tAX\tV\tC\t01:00:00:00\t01:00:05:00\t02:00:00:00\t02:00:05:00\n* FROM CLIP NAME: ONE\n");

    ASSERT_EQ(tabbed.events.size(), 1U);
    EXPECT_TRUE(tabbed.events.at(0).isValid());
    EXPECT_EQ(tabbed.events.at(0).rollName(), "AX");
    EXPECT_EQ(tabbed.events.at(0).clipName(), "ONE");
    EXPECT_EQ(tabbed.unread(), Lines{});

    // No field is missing here, so a tab belongs to its field.
    const Reading complete("001 A\tX V C " + Timecodes);
    ASSERT_EQ(complete.events.size(), 1U);
    EXPECT_TRUE(complete.events.at(0).hasFlaw(core::EventFlaw::RollNameInvalid));
}

TEST_F(ThoroughReading, TakesALineAfterAByteOrderMark)
{
    const Reading reading("\xEF\xBB\xBF" + Cut + "\n");

    EXPECT_EQ(reading.rolls(), Lines{"AX"});
    EXPECT_EQ(reading.unread(), Lines{});
    EXPECT_EQ(Reading("\xEF\xBB\xBF"
                      "FCM: DROP FRAME\n" +
                      Cut)
                  .remarks.dropFrame,
              1);
}

TEST_F(ThoroughReading, APlainReadingTellsTheLinesThatAThoroughOneTakes)
{
    const TempFolder folder;
    CmxParser parser;
    EventList events;

    ASSERT_EQ(
        parser.parse(widePath(folder.write("a.edl", "\xEF\xBB\xBF" + Cut + "\n002\tAX V C " + Timecodes)), events),
        Result::Ok);

    EXPECT_TRUE(events.isEmpty());
    EXPECT_EQ(parser.remarks().unreadLines.size(), 2U);
}

TEST_F(ThoroughReading, TellsAnEventLineThatMissesAField)
{
    EXPECT_EQ(unreadOf(Cut), Lines{});
    EXPECT_EQ(unreadOf("TITLE: X\n001 AX V C 01:00:00:00 01:00:05:00 02:00:00:00\n"), Lines{"2: " + MissesAField});
    EXPECT_EQ(unreadOf("\n\n001\n"), Lines{"3: " + MissesAField});
    EXPECT_EQ(unreadOf("001AX V C " + Timecodes), Lines{"1: " + MissesAField});
    EXPECT_EQ(unreadOf("001 AX V D 024 01:00:00:00"), Lines{"1: " + MissesAField});
    EXPECT_EQ(unreadOf("001 AX V D"), Lines{"1: " + MissesAField});

    const Reading two("002 AX V C " + Timecodes.substr(12) + "\n" + Cut + "\n003 AX C " + Timecodes);
    EXPECT_EQ(two.unread(), (Lines{"1: " + MissesAField, "3: " + MissesAField}));
    EXPECT_EQ(two.remarks.unreadLines[0].line, (SourceLine{1, "002 AX V C " + Timecodes.substr(12)}));
    EXPECT_EQ(two.rolls(), Lines{"AX"});
}

TEST_F(ThoroughReading, TellsATransitionWithoutADuration)
{
    EXPECT_EQ(unreadOf("001 AX V D " + Timecodes), Lines{"1: " + LacksDuration});
    EXPECT_EQ(unreadOf("001 AX V W001 " + Timecodes), Lines{"1: " + LacksDuration});
    EXPECT_EQ(unreadOf("001 AX V D 024 " + Timecodes), Lines{});
}

TEST_F(ThoroughReading, TellsAnEventLineThatBeginsWithNoNumber)
{
    EXPECT_EQ(unreadOf("O01 AX V C " + Timecodes), Lines{"1: " + HasNoNumber});
    EXPECT_EQ(unreadOf("AX V C " + Timecodes), Lines{"1: " + HasNoNumber});
    EXPECT_EQ(unreadOf("AX V C 01.00:00:00 01:00:05:00 02:00:00;00 02:00:05:00"), Lines{"1: " + HasNoNumber})
        << "one of the timecodes may be broken";
    EXPECT_EQ(unreadOf("TITLE: X" + Cut), Lines{"1: " + HasNoNumber});
    EXPECT_EQ(unreadOf("FCM: NON-DROP FRAME" + Cut), Lines{"1: " + HasNoNumber});
    const Lines hidden{"1: begins with a character that can't be read"};
    EXPECT_EQ(unreadOf("\xC2\xA0" + Cut), hidden);
    EXPECT_EQ(unreadOf("\0"s + Cut), hidden);
    EXPECT_EQ(unreadOf("\f" + Cut), hidden);
}

TEST_F(ThoroughReading, TellsNothingOfLinesThatHoldNoEvent)
{
    EXPECT_EQ(unreadOf("TITLE: 01:00:00:00 TO 02:00:00:00\n" + Cut +
                       "\nM2   AX       048.0                01:00:00:00\nAUD  3 4\n>>> SOURCE AX 01:00:00:00\n" +
                       "SPLIT:    AUDIO DELAY=  00:00:00:05\n* LOC: 01:00:00:00 RED 10:00:00:00\n*\n* 01:00:00:00\n"),
              Lines{});
}

TEST_F(ThoroughReading, TellsAnEventAfterAnotherOneInItsLine)
{
    EXPECT_EQ(unreadOf(Cut + " 002 BX V C " + Timecodes), Lines{"1: " + HoldsASecond});
    EXPECT_EQ(unreadOf(Cut + "002 BX V C " + Timecodes), Lines{"1: " + HoldsASecond});
    EXPECT_EQ(unreadOf(Cut + " 00:00:05:00 EXTRA"), Lines{});
}

TEST_F(ThoroughReading, TellsAnEventInACommentUnlessItWasMadeACommentOnPurpose)
{
    EXPECT_EQ(unreadOf("* FROM CLIP NAME: A" + Cut), Lines{"1: " + StandsInAComment});
    EXPECT_EQ(unreadOf("* 74-12.WAV" + Cut), Lines{"1: " + StandsInAComment});
    EXPECT_EQ(unreadOf("*" + Cut), Lines{});
    EXPECT_EQ(unreadOf("** " + Cut), Lines{});
}

TEST_F(ThoroughReading, TellsTheEventsAfterALineEndThatTheReaderDoesNotTakeForOne)
{
    // The first line ends with CR, so that all others make up one line.
    const Reading mixed("TITLE: X\rFCM: NON-DROP FRAME\n" + Cut + "\n* FROM CLIP NAME: A\n002 BX V C " + Timecodes);
    EXPECT_EQ(mixed.unread(), (Lines{"3: " + ComesAfterALineEnd, "5: " + ComesAfterALineEnd}));
    EXPECT_EQ(mixed.remarks.unreadLines[1].line.text, "002 BX V C " + Timecodes);
    EXPECT_TRUE(mixed.events.isEmpty());

    const Reading afterEvent("TITLE: X\r" + Cut + "\n002 BX V C " + Timecodes + "\n");
    EXPECT_EQ(afterEvent.unread(), Lines{"3: " + ComesAfterALineEnd});
    EXPECT_EQ(afterEvent.events.size(), 1U);

    // A CR within a line separates nothing.
    EXPECT_EQ(unreadOf("TITLE: X\n001 AX V C 01:00:00:00\r 01:00:05:00 02:00:00:00 02:00:05:00\n"), Lines{});
}

std::string utf16(std::string_view text, bool isLittle, bool hasMark)
{
    std::string units = hasMark ? (isLittle ? "\xFF\xFE" : "\xFE\xFF") : "";
    for (const char character : text)
        units += isLittle ? std::string{character, '\0'} : std::string{'\0', character};
    return units;
}

TEST_F(ThoroughReading, TellsTheEventLinesOfUtf16)
{
    for (const bool isLittle : {true, false}) {
        for (const bool hasMark : {true, false}) {
            for (const char* const end : {"\n", "\r\n", "\r"}) {
                const Reading reading(
                    utf16("TITLE: X" + std::string(end) + Cut + end + "* A" + end + "002 B", isLittle, hasMark));
                EXPECT_EQ(reading.unread(), (Lines{"2: " + IsUtf16, "4: " + IsUtf16}));
                EXPECT_EQ(reading.remarks.unreadLines.front().line.text, Cut);
                EXPECT_TRUE(reading.events.isEmpty());
            }
        }
    }
    EXPECT_EQ(unreadOf("\xFF\xFE"), Lines{});
    EXPECT_EQ(unreadOf("\xFF"), Lines{});
}

TEST_F(ThoroughReading, AShotOfANegativeSpeedIsReversed)
{
    EXPECT_EQ(Reading(Cut + "\nM2   AX       -25.0    01:00:00:00\n").rolls(), Lines{"-AX"});
    EXPECT_EQ(Reading(Cut + "\n* FROM CLIP NAME: A\nM2 AX -025 \n").rolls(), Lines{"-AX"});
    EXPECT_EQ(Reading(Cut + "\nM2\tAX\t-25.0\t01:00:00:00\n").rolls(), Lines{"-AX"});
    EXPECT_EQ(Reading(Cut + "\nM2   -25.0    01:00:00:00\n").rolls(), Lines{"-AX"}) << "no roll is told";
    EXPECT_EQ(Reading(Cut + "\nM2   AX       025.0    01:00:00:00\n").rolls(), Lines{"AX"});
    EXPECT_EQ(Reading(Cut + "\nM2   AX       -00.0    01:00:00:00\n").rolls(), Lines{"AX"});
    EXPECT_EQ(Reading(Cut + "\n002 BX V C " + Timecodes + "\nM2 BX -25.0 01:00:00:00").rolls(), (Lines{"AX", "-BX"}));
}

TEST_F(ThoroughReading, AMotionLineOfAnotherRollReversesNothing)
{
    const Reading reading(Cut + "\nM2 BX -25.0 01:00:00:00");

    EXPECT_EQ(reading.rolls(), Lines{"AX"});
    EXPECT_EQ(reading.unread(), Lines{"2: plays no event backwards, since none of its roll stands before it"});
}

TEST_F(ThoroughReading, WhatFollowsAnEventThatIsNotReadBelongsToNoOther)
{
    const std::string own = "\n* FROM CLIP NAME: ONE\n";
    const std::string further = "\n* FROM CLIP NAME: TWO\nM2 AX -25.0 01:00:00:00\n";
    const std::string next = "003 CX V C " + Timecodes + "\n* FROM CLIP NAME: THREE\n";
    const std::string line = "002 AX V C " + Timecodes;
    const std::string missing = line.substr(0, line.rfind(' '));
    for (const std::string& unread : Lines{"O" + line, missing, "\x01 " + line, "* REMARK " + line}) {
        SCOPED_TRACE(unread);

        const Reading reading(Cut + own + unread + further + next);

        EXPECT_EQ(reading.rolls(), (Lines{"AX", "CX"}));
        EXPECT_EQ(reading.events.at(0).clipName(), "ONE");
        EXPECT_EQ(reading.events.at(1).clipName(), "THREE");
        ASSERT_EQ(reading.unread().size(), 2U);
        EXPECT_EQ(reading.unread().back(), "5: plays no event backwards, since none of its roll stands before it");
    }
}

TEST_F(ThoroughReading, WhatFollowsASecondEventInALineBelongsToNone)
{
    const Reading reading(Cut + " 002 AX V C " + Timecodes + "\n* FROM CLIP NAME: TWO\nM2 AX -25.0");

    EXPECT_EQ(reading.rolls(), Lines{"AX"});
    EXPECT_EQ(reading.events.at(0).clipName(), "");
    EXPECT_EQ(reading.unread(), (Lines{"1: holds a second event, which isn't read",
                                       "3: plays no event backwards, since none of its roll stands before it"}));
}

TEST_F(ThoroughReading, AnEventAfterACommentInItsLineSpoilsTheName)
{
    const Reading reading(Cut + "\n* FROM CLIP NAME: ONE002 BX V C " + Timecodes + "\n* FROM CLIP NAME: TWO");

    EXPECT_EQ(reading.rolls(), Lines{"AX"});
    EXPECT_EQ(reading.events.at(0).clipName(), "");
    EXPECT_EQ(reading.unread(), Lines{"2: holds an event in a comment, which isn't read"});
}

TEST_F(ThoroughReading, AnEventLineThatWasMadeACommentTakesNoLines)
{
    const Reading reading(Cut + "\n* 002 BX V C " + Timecodes + "\n* FROM CLIP NAME: ONE\n");

    EXPECT_EQ(reading.events.at(0).clipName(), "ONE");
    EXPECT_EQ(reading.unread(), Lines{});
}

TEST_F(ThoroughReading, TellsANameOrAMotionAfterTheEventInItsLine)
{
    const Lines told{"1: holds a clip name or a motion after the event, which isn't read"};

    EXPECT_EQ(unreadOf(Cut + " * FROM CLIP NAME: ONE"), told);
    EXPECT_EQ(unreadOf(Cut + " M2 AX -25.0 01:00:00:00"), told);
    EXPECT_EQ(unreadOf(Cut + " * SOURCE FILE: ONE"), Lines{});
    EXPECT_EQ(unreadOf(Cut + " M25"), Lines{});
}

TEST_F(ThoroughReading, InATransitionTheRollTellsWhichShotIsReversed)
{
    const auto dissolve = [](const std::string& incoming) {
        return "001 AX V C 01:00:00:00 01:00:00:00 02:00:00:00 02:00:00:00\n001 " + incoming +
               " V D 012 03:00:00:00 03:00:05:00 02:00:00:00 02:00:05:00\n";
    };

    EXPECT_EQ(Reading(dissolve("BX") + "M2 AX -25.0 01:00:00:00").rolls(), (Lines{"-AX", "BX"}));
    EXPECT_EQ(Reading(dissolve("BX") + "M2 AX 25.0 01:00:00:00\nM2 BX -25.0 03:00:00:00").rolls(),
              (Lines{"AX", "-BX"}));
    EXPECT_EQ(Reading(dissolve("AX") + "M2 AX -25.0 01:00:00:00").rolls(), (Lines{"-AX", "AX"}));
    EXPECT_EQ(Reading(dissolve("AX") + "M2 AX -25.0 03:00:00:00").rolls(), (Lines{"AX", "-AX"}));
    EXPECT_EQ(Reading(dissolve("AX") + "M2 AX -25.0").rolls(), (Lines{"AX", "-AX"}));

    const Reading unknown(dissolve("BX") + "M2 CX -25.0 01:00:00:00");
    EXPECT_EQ(unknown.rolls(), (Lines{"AX", "BX"}));
    EXPECT_EQ(unknown.unread(), Lines{"3: plays no event backwards, since none of its roll stands before it"});
}

TEST_F(ThoroughReading, TellsAMotionLineThatCannotBeRead)
{
    const Lines unreadable{"2: is a motion line whose speed can't be read"};

    for (const char* const motion :
         {"M2 AX", "M2 AX 01:00:00:00", "M2 AX -2x.0 01:00:00:00", "M2 AX - 01:00:00:00", "M2 AX 1.2.3 01:00:00:00"})
        EXPECT_EQ(unreadOf(Cut + "\n" + motion), unreadable) << motion;
    EXPECT_EQ(unreadOf("M2 AX -25.0\n" + Cut),
              Lines{"1: plays no event backwards, since none of its roll stands before it"});
    EXPECT_EQ(unreadOf(Cut + "\nM22 AX\nM2"), Lines{});
}

TEST_F(ThoroughReading, TellsTheDropFrameStateAndWhereItStands)
{
    const auto remarksOf = [](const std::string& text) { return Reading(text).remarks; };
    const std::string marked = "001 AX V C 01:00:00:00 01:00:05:00 02:00:00;00 02:00:05;00";

    EXPECT_EQ(remarksOf(Cut).dropFrame, -1);
    EXPECT_EQ(remarksOf(Cut).dropFrameLine, std::nullopt);
    EXPECT_EQ(remarksOf("FCM: NON-DROP FRAME\n" + Cut).dropFrame, 0);
    EXPECT_EQ(remarksOf("FCM: NON-DROP FRAME\n" + Cut).dropFrameLine, (SourceLine{1, "FCM: NON-DROP FRAME"}));
    EXPECT_EQ(remarksOf(Cut + "\nFCM: DROP FRAME").dropFrameLine, (SourceLine{2, "FCM: DROP FRAME"}));
    EXPECT_EQ(remarksOf(Cut + "\n" + marked).dropFrame, 1);
    EXPECT_EQ(remarksOf(Cut + "\n" + marked).dropFrameLine, (SourceLine{2, marked}));
    EXPECT_EQ(remarksOf("FCM: NON-DROP FRAME\n" + marked).dropFrame, 0);
    // A camera may count drop-frame although the programme doesn't.
    EXPECT_EQ(remarksOf("001 AX V C 01:00:00;00 01:00:05;00 02:00:00:00 02:00:05:00").dropFrame, -1);
}

TEST_F(ThoroughReading, CountsTheTimecodesThatShowTheRate)
{
    const FileRemarks remarks = Reading(Cut + "\n002 AX V C 01:00:00:23 01:00:05:99 x 02:00:05:22\n").remarks;

    EXPECT_EQ(remarks.timecodeCount, 6U);
    EXPECT_EQ(remarks.highestFrame, 23);
}

TEST_F(ThoroughReading, KeepsOnlyABeginningOfALongLine)
{
    const std::string text = "001 " + std::string(10'000'000, 'x');

    const Reading reading(text);

    ASSERT_EQ(reading.unread(), Lines{"1: " + MissesAField});
    EXPECT_EQ(reading.remarks.unreadLines[0].line.text, text.substr(0, 512));
}

TEST_F(ThoroughReading, TellsEachOfManyLines)
{
    std::string text;
    for (int line = 0; line < 100'000; ++line)
        text += "001 AX V C\n";

    const Reading reading(text);

    ASSERT_EQ(reading.remarks.unreadLines.size(), 100'000U);
    EXPECT_EQ(reading.remarks.unreadLines.back().line.number, 100'000U);
}

TEST_F(ThoroughReading, TheRealEdlsHoldNoLineThatIsNotRead)
{
    for (const std::string& edl : treeEdls()) {
        CmxParser parser;
        parser.readThoroughly();
        EventList events;
        ASSERT_EQ(parser.parse(widePath(treePath(edl)), events), Result::Ok) << edl;
        EXPECT_EQ(parser.remarks().unreadLines.size(), 0U)
            << edl << ":" << parser.remarks().unreadLines.front().line.number << " "
            << parser.remarks().unreadLines.front().problem;
    }
}

TEST_F(ThoroughReading, TheReversedShotsOfTheRealEdlsAreKnown)
{
    const auto reversedIn = [](const std::string& edl) {
        CmxParser parser;
        parser.readThoroughly();
        EventList events;
        EXPECT_EQ(parser.parse(widePath(treePath("tests/data/edl/" + edl)), events), Result::Ok);
        std::vector<std::uint32_t> numbers;
        for (const auto& event : events.events()) {
            if (event->isReversed())
                numbers.push_back(event->eventNumber());
        }
        return numbers;
    };
    using Numbers = std::vector<std::uint32_t>;

    EXPECT_EQ(reversedIn("test_24psf.edl"), (Numbers{9, 10}));
    EXPECT_EQ(reversedIn("adobe_dai109_test.txt"), (Numbers{1526, 1528, 1529, 1530}));
    EXPECT_EQ(reversedIn("speed_effects.edl"), Numbers{});
}

/// What an EDL is made of, in any order.
std::string anyText()
{
    static const std::vector<std::string> Parts{"001",     "002 ",     "AX ",  "BX ",          "V ",
                                                "C ",      "D ",       "012 ", "01:00:00:00 ", "01:00:05:12",
                                                " ",       "\t",       "\n",   "\n",           "\n*",
                                                "FCM: ",   "\0\0"s,    "M2 ",  "-25.0 ",       "\xEF\xBB\xBF",
                                                Timecodes, Cut + "\n", Cut,    "\n" + Cut};
    std::string text;
    for (const std::string& part : *rc::gen::container<std::vector<std::string>>(rc::gen::elementOf(Parts)))
        text += part;
    return text;
}

RC_GTEST_PROP(ThoroughReadingLaw, ALineThatBeginsWithANumberIsAnEventOrIsTold, ())
{
    const TestProject project;
    const std::string text = anyText();

    const Reading reading(text);

    std::set<std::uint32_t> known;
    for (const auto& event : reading.events.events())
        known.insert(event->sourceLine());
    for (const auto& unread : reading.remarks.unreadLines)
        known.insert(unread.line.number);
    std::istringstream lines(text);
    std::uint32_t number = 0;
    for (std::string line; std::getline(lines, line);) {
        ++number;
        line = util::StringUtil::trim(line);
        if (!line.empty() && line.front() >= '0' && line.front() <= '9')
            RC_ASSERT(known.contains(number));
    }
}

RC_GTEST_PROP(ThoroughReadingLaw, AThoroughReadingTakesEveryLineThatAPlainOneTakes, ())
{
    const TestProject project;
    const std::string text = anyText();
    const EdlReading plain(text);

    const Reading thorough(text);

    std::set<std::string> lines;
    for (const auto& event : thorough.events.events())
        lines.insert(std::to_string(event->sourceLine()) + " " + timecodesOf(*event));
    for (const auto& event : plain.events.events())
        RC_ASSERT(lines.contains(std::to_string(event->sourceLine()) + " " + timecodesOf(*event)));
}

} // namespace
} // namespace cadrel::tests
