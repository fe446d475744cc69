// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/CmxWriter.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

namespace fs = std::filesystem;

using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::Framerate;
using core::Timecode;
using core::TransitionType;
using core::fileio::CmxParser;
using core::fileio::CmxWriter;
using util::Result;

using Names = std::vector<std::string>;

const std::string Timecodes = "01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:00";

std::shared_ptr<EventBase> makeCut(const std::string& roll = "AX")
{
    return makeEvent(roll, "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:00:05:00");
}

EventList listOfCuts(std::size_t count)
{
    EventList events;
    for (std::size_t index = 0; index < count; ++index)
        events.add(makeCut());
    return events;
}

Result::Type write(const fs::path& path, const EventList& events)
{
    return CmxWriter().write(widePath(path), events);
}

/// What the writer makes of a list that fits into one file.
std::string textOf(const EventList& events)
{
    const TempFolder folder;
    EXPECT_EQ(write(folder / "reel.edl", events), Result::Ok);
    return contentOf(folder / "reel.edl");
}

std::string titleOf(const std::string& fileName)
{
    const TempFolder folder;
    EXPECT_EQ(write(folder / fileName, listOfCuts(1)), Result::Ok);
    const std::string text = contentOf(folder / fileName);
    return text.substr(0, text.find('\n'));
}

std::size_t linesOf(const std::string& text)
{
    return static_cast<std::size_t>(std::count(text.begin(), text.end(), '\n'));
}

TEST(CmxWriter, WritesATitleAndALineForEachCut)
{
    EventList events;
    events.add(makeEvent("A001C003", "10:00:00:00", "10:00:04:00", "01:00:00:00", "01:00:04:00", 77));
    events.add(makeEvent("abc", "1:2:3:4", "1:2:3:5", "23:59:59:23", "23:59:59:24"));

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n"
                              "001  A001C003 V     C        10:00:00:00 10:00:04:00 01:00:00:00 01:00:04:00\n"
                              "002  ABC      V     C        01:02:03:04 01:02:03:05 23:59:59:23 23:59:59:24\n");
}

TEST(CmxWriter, WritesTheLetterOfATransitionWithoutItsDuration)
{
    EventList events = listOfCuts(3);
    events.at(0).setTransitionType(TransitionType::Dissolve);
    events.at(0).setTransitionDuration(24);
    events.at(1).setTransitionType(TransitionType::Wipe);
    events.at(2).setTransitionType(3);

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n"
                              "001  AX       V     D        " +
                                  Timecodes +
                                  "\n"
                                  "002  AX       V     W        " +
                                  Timecodes +
                                  "\n"
                                  "003  AX       V     C        " +
                                  Timecodes + "\n");
}

TEST(CmxWriter, WritesNeitherClipNamesNorComments)
{
    EventList events = listOfCuts(1);
    events.at(0).setClipName("CLIP");
    events.at(0).setComment("* NOTE");
    events.at(0).setEdlFileName("other.edl");

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n001  AX       V     C        " + Timecodes + "\n");
}

TEST(CmxWriter, KeepsAFileThatStandsThereWhereThatIsAskedFor)
{
    const TempFolder folder;
    const EventList events = listOfCuts(1000);
    folder.write("reel_2.edl", "of another program");
    const auto write = [&](const EventList& list, CmxWriter::Existing existing) {
        return CmxWriter(CmxWriter::FrameCountMode::Unsaid, existing).write(widePath(folder / "reel.edl"), list);
    };

    EXPECT_EQ(write(events, CmxWriter::Existing::Kept), Result::Refused);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"reel_2.edl"}));
    EXPECT_EQ(contentOf(folder / "reel_2.edl"), "of another program");
    EXPECT_EQ(write(listOfCuts(1), CmxWriter::Existing::Kept), Result::Ok);
    EXPECT_EQ(write(listOfCuts(2), CmxWriter::Existing::Kept), Result::Refused);
    EXPECT_EQ(contentOf(folder / "reel.edl"), textOf(listOfCuts(1)));
    EXPECT_EQ(write(events, CmxWriter::Existing::Replaced), Result::Ok);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"reel.edl", "reel_1.edl", "reel_2.edl"}));
}

TEST(CmxWriter, LeavesAnInvalidEventOutButCountsIt)
{
    EventList events = listOfCuts(3);
    events.at(1).addFlaw(EventFlaw::NotVideoEvent);

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n"
                              "001  AX       V     C        " +
                                  Timecodes +
                                  "\n"
                                  "003  AX       V     C        " +
                                  Timecodes + "\n");
}

TEST(CmxWriter, WritesATitleAloneForReadableEventsThatAreAllInvalid)
{
    EventList events = listOfCuts(1);
    events.at(0).addFlaw(EventFlaw::TimecodeRangeInvalid);

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n");
}

TEST(CmxWriter, WritesDropFrameTimecodesWithColons)
{
    const TestProject project(Framerate(30, 1));
    EventList events;
    events.add(makeEvent("AX", "00:00:59;28", "00:01:00;02", "01:00:00;00", "01:00:00;02"));

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n"
                              "001  AX       V     C        00:00:59:28 00:01:00:02 01:00:00:00 01:00:00:02\n");
}

TEST(CmxWriter, CutsTheTitleToSeventyCharacters)
{
    const std::string seventy(70, 'n');

    EXPECT_EQ(titleOf(seventy), "TITLE:   " + seventy);
    EXPECT_EQ(titleOf(seventy + "x"), "TITLE:   " + seventy);
}

TEST(CmxWriter, SaysDropFrameAfterEachTitleWhereItIsAskedFor)
{
    const TestProject project(Framerate(30, 1));
    const TempFolder folder;

    EXPECT_EQ(CmxWriter(CmxWriter::FrameCountMode::DropFrame).write(widePath(folder / "reel.edl"), listOfCuts(1000)),
              Result::Ok);

    for (const char* const part : {"reel_1.edl", "reel_2.edl"}) {
        const std::string beginning = std::string("TITLE:   ") + part + "\nFCM: DROP FRAME\n001  AX ";
        EXPECT_TRUE(contentOf(folder / part).starts_with(beginning)) << part;
        EventList events;
        Framerate shown;
        EXPECT_EQ(CmxParser().parse(widePath(folder / part), events, shown, false), Result::Ok);
        EXPECT_EQ(shown.dropFrame, 1);
        EXPECT_EQ(shown.framesPerSecond, 30);
    }
    EXPECT_EQ(textOf(listOfCuts(1)).find("FCM"), std::string::npos);
}

TEST(CmxWriter, WritesAPrintableTitle)
{
    EXPECT_EQ(titleOf("a\tb\x7F"
                      "c d~.edl"),
              "TITLE:   a?b?c d~.edl");
    // One "?" for each of the two bytes of the letter.
    EXPECT_EQ(titleOf("\xC3\xA4.edl"), "TITLE:   ??.edl");
}

TEST(CmxWriter, TakesTheTitleBehindABackslashOnlyWhereThePathHasOne)
{
    EXPECT_EQ(titleOf("C:\\films\\reel.edl"), "TITLE:   reel.edl");
}

TEST(CmxWriter, FillsTheColumnOfTheRollName)
{
    EventList events;
    for (const std::string roll : {"", "abc", "        ", "ABCDEFGHIJ"})
        events.add(makeCut(roll));

    EXPECT_EQ(textOf(events), "TITLE:   reel.edl\n"
                              "001  UNKNOWN  V     C        " +
                                  Timecodes +
                                  "\n"
                                  "002  ABC      V     C        " +
                                  Timecodes +
                                  "\n"
                                  "003  ________ V     C        " +
                                  Timecodes +
                                  "\n"
                                  "004  ABCDEFGH V     C        " +
                                  Timecodes + "\n");
}

TEST(CmxWriterRollName, IsCutToEightCapitals)
{
    EXPECT_EQ(CmxWriter::normalizedRollName("abc"), "ABC");
    EXPECT_EQ(CmxWriter::normalizedRollName("AbCdEfGh"), "ABCDEFGH");
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCDEFGHIJ"), "ABCDEFGH");
    EXPECT_EQ(CmxWriter::normalizedRollName("A1B2C3D4"), "A1B2C3D4");
    EXPECT_EQ(CmxWriter::normalizedRollName("12345678X"), "12345678");
}

TEST(CmxWriterRollName, HasAnUnderscoreForEachCharacterThatIsNotAllowed)
{
    EXPECT_EQ(CmxWriter::normalizedRollName(".-_A Z/9"), ".-_A_Z_9");
    EXPECT_EQ(CmxWriter::normalizedRollName("\xC3\xA4\t{"), "____");
    EXPECT_EQ(CmxWriter::normalizedRollName("        "), "________");
}

TEST(CmxWriterRollName, IsUnknownWithoutAName)
{
    EXPECT_EQ(CmxWriter::normalizedRollName(""), "UNKNOWN");
}

TEST(CmxWriterRollName, KeepsTheEndingDigitsOfALongName)
{
    EXPECT_EQ(CmxWriter::normalizedRollName("SHOT_LONGNAME_12"), "SHOT_-12");
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCDEFGH1"), "ABCDEF-1");
    EXPECT_EQ(CmxWriter::normalizedRollName("shot_longname_007"), "SHOT-007");
    EXPECT_EQ(CmxWriter::normalizedRollName("A001C003_R1"), "A001C0-1");
}

TEST(CmxWriterRollName, LosesTheForemostDigitWhereTheyReachTheFirstFourCharacters)
{
    // The digits that count are 456789; the "-" takes the place of the 4.
    EXPECT_EQ(CmxWriter::normalizedRollName("A123456789"), "A1-56789");
    // Of ABCD12345 they are 12345, written to the end of ABCD1234; the "-" takes the place of the 1.
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCD12345"), "ABC-2345");
    // Eight digits fill the name.
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCD12345678"), "-2345678");
}

TEST(CmxWriterRollName, KeepsTheLastEightOfManyEndingDigits)
{
    // Eight digits behind a fifth letter, and then the "-" has no room.
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCDE12345678"), "12345678");
    EXPECT_EQ(CmxWriter::normalizedRollName("ABCDE123456789"), "23456789");
    EXPECT_EQ(CmxWriter::normalizedRollName("A123456789012345"), "89012345");
    EXPECT_EQ(CmxWriter::normalizedRollName("A" + std::string(100, '1') + "2"), "11111112");
}

TEST(CmxWriterRollName, IsCutWhereItIsAllDigits)
{
    EXPECT_EQ(CmxWriter::normalizedRollName("1234567890"), "12345678");
}

TEST(CmxWriter, WritesNineHundredNinetyNineEventsIntoOneFile)
{
    const TempFolder folder;

    EXPECT_EQ(write(folder / "reel.edl", listOfCuts(999)), Result::Ok);

    EXPECT_EQ(folder.names(), Names{"reel.edl"});
    const std::string text = contentOf(folder / "reel.edl");
    EXPECT_EQ(linesOf(text), 1000U);
    EXPECT_NE(text.find("\n999  AX"), std::string::npos);
}

TEST(CmxWriter, SplitsMoreEventsIntoSeveralFiles)
{
    const TempFolder folder;
    EventList events = listOfCuts(999);
    events.add(makeCut("LAST"));

    EXPECT_EQ(write(folder / "my.reel.edl", events), Result::Ok);

    EXPECT_EQ(folder.names(), (Names{"my.reel_1.edl", "my.reel_2.edl"}));
    const std::string first = contentOf(folder / "my.reel_1.edl");
    EXPECT_EQ(first.substr(0, first.find('\n')), "TITLE:   my.reel_1.edl");
    EXPECT_EQ(linesOf(first), 1000U);
    EXPECT_EQ(contentOf(folder / "my.reel_2.edl"),
              "TITLE:   my.reel_2.edl\n001  LAST     V     C        " + Timecodes + "\n");
}

TEST(CmxWriter, SplitsAtEveryNineHundredNinetyNineEvents)
{
    const TempFolder folder;

    EXPECT_EQ(write(folder / "two.edl", listOfCuts(1998)), Result::Ok);
    EXPECT_EQ(write(folder / "three.edl", listOfCuts(1999)), Result::Ok);

    EXPECT_EQ(folder.names(), (Names{"three_1.edl", "three_2.edl", "three_3.edl", "two_1.edl", "two_2.edl"}));
    EXPECT_EQ(linesOf(contentOf(folder / "three_3.edl")), 2U);
}

TEST(CmxWriter, NamesTheFilesOfAPathWithoutAnExtensionWithADotAtTheEnd)
{
    const TempFolder folder;

    EXPECT_EQ(write(folder / "reel", listOfCuts(1000)), Result::Ok);

    EXPECT_EQ(folder.names(), (Names{"reel_1.", "reel_2."}));
}

TEST(CmxWriter, AsksTheWholeListForAReadableEventBeforeItSplits)
{
    const TempFolder folder;
    EventList events = listOfCuts(1000);
    for (std::size_t index = 0; index < 999; ++index)
        events.at(index).addFlaw(EventFlaw::RollNameInvalid);

    EXPECT_EQ(write(folder / "reel.edl", events), Result::Ok);

    EXPECT_EQ(contentOf(folder / "reel_1.edl"), "TITLE:   reel_1.edl\n");
    EXPECT_EQ(linesOf(contentOf(folder / "reel_2.edl")), 2U);
}

TEST(CmxWriter, RefusesAnEmptyList)
{
    const TempFolder folder;

    EXPECT_EQ(write(folder / "reel.edl", EventList()), Result::InvalidArgument);
    EXPECT_TRUE(folder.names().empty());
}

TEST(CmxWriter, RefusesAListWithoutAReadableEvent)
{
    const TempFolder folder;
    EventList events = listOfCuts(1000);
    for (const auto& event : events.events())
        event->addFlaw(EventFlaw::DstOutUnreadable);

    EXPECT_EQ(write(folder / "reel.edl", events), Result::InvalidArgument);
    EXPECT_TRUE(folder.names().empty());
}

TEST(CmxWriter, ReportsAFileThatCannotBeOpened)
{
    const TempFolder folder;

    EXPECT_EQ(write(folder.path(), listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_EQ(write(folder / "", listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_EQ(write(folder / "missing/", listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_EQ(write(folder / "missing/reel.edl", listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_EQ(write(folder / "missing/reel.edl", listOfCuts(1000)), Result::FileAccessFailed);
    EXPECT_EQ(write("", listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_TRUE(folder.names().empty());
}

TEST(CmxWriter, RefusesAnEmptyLastComponentAndLeavesNoFile)
{
    const TempFolder folder;

    // The system takes a backslash for a letter of a name, so that this file can be opened.
    EXPECT_EQ(write(folder / "reel\\", listOfCuts(1)), Result::NotAvailable);
    EXPECT_TRUE(folder.names().empty());
}

TEST(CmxWriter, ReturnsWhatTheConversionOfThePathThrows)
{
    const EventList events = listOfCuts(1);

    EXPECT_EQ(CmxWriter().write(L"reel\xD800.edl", events), Result::InvalidArgument);
    util::StringUtil::setConverter(nullptr);
    EXPECT_EQ(CmxWriter().write(L"reel.edl", events), Result::NotAvailable);
}

TEST(CmxWriter, ReportsAFullDiskAndLeavesTheFormerFile)
{
    const TempFolder folder;
    folder.write("reel.edl", "former");
    folder.write("reel_1.edl", "former 1");
    const EventList one = listOfCuts(999);
    const EventList several = listOfCuts(1000);

    Result::Type resultOfOne = Result::Ok;
    Result::Type resultOfSeveral = Result::Ok;
    {
        const FileSizeLimit fullDisk(5000);
        resultOfOne = write(folder / "reel.edl", one);
        resultOfSeveral = write(folder / "reel.edl", several);
    }

    EXPECT_EQ(resultOfOne, Result::FileAccessFailed);
    EXPECT_EQ(resultOfSeveral, Result::FileAccessFailed);
    EXPECT_EQ(folder.names(), (Names{"reel.edl", "reel_1.edl"}));
    EXPECT_EQ(contentOf(folder / "reel.edl"), "former");
    EXPECT_EQ(contentOf(folder / "reel_1.edl"), "former 1");
}

TEST(CmxWriter, WritesADeviceItselfAndNeverRemovesIt)
{
    EXPECT_EQ(write("/dev/null", listOfCuts(1)), Result::Ok);
    EXPECT_EQ(write("/dev/full", listOfCuts(1)), Result::FileAccessFailed);
    EXPECT_TRUE(fs::is_character_file("/dev/null"));
    EXPECT_TRUE(fs::is_character_file("/dev/full"));
}

TEST(CmxWriter, PutsNoFileInPlaceWhenALaterOneCannotBeOpened)
{
    const TempFolder folder;
    folder.write("reel_1.edl", "former");
    fs::create_directory(folder / "reel_2.edl");

    EXPECT_EQ(write(folder / "reel.edl", listOfCuts(1000)), Result::FileAccessFailed);

    EXPECT_EQ(contentOf(folder / "reel_1.edl"), "former");
    EXPECT_EQ(folder.names(), (Names{"reel_1.edl", "reel_2.edl"}));
}

TEST(CmxWriter, LeavesTheFormerFilesWhenALaterOneCannotBeWritten)
{
    const TempFolder folder;
    folder.write("reel_1.edl", "former");
    fs::create_symlink("/dev/full", folder / "reel_2.edl");

    EXPECT_EQ(write(folder / "reel.edl", listOfCuts(1000)), Result::FileAccessFailed);

    EXPECT_EQ(contentOf(folder / "reel_1.edl"), "former");
    EXPECT_EQ(folder.names(), (Names{"reel_1.edl", "reel_2.edl"}));
    EXPECT_TRUE(fs::is_symlink(folder / "reel_2.edl"));
}

TEST(CmxWriter, ReplacesTheFilesOfAFormerSplit)
{
    const TempFolder folder;
    folder.write("reel_1.edl", "former 1");
    folder.write("reel_2.edl", "former 2");

    EXPECT_EQ(write(folder / "reel.edl", listOfCuts(1000)), Result::Ok);

    EXPECT_EQ(linesOf(contentOf(folder / "reel_1.edl")), 1000U);
    EXPECT_EQ(linesOf(contentOf(folder / "reel_2.edl")), 2U);
    EXPECT_EQ(folder.names(), (Names{"reel_1.edl", "reel_2.edl"}));
}

/// A list of `count` valid cuts at the rate of the project.
EventList anyCuts(std::size_t count)
{
    const std::int32_t lastFrame = Timecode::framerate().lastFrame;
    const auto anyRange = [lastFrame](Timecode& start, Timecode& end) {
        std::int32_t first = *rc::gen::inRange(0, lastFrame + 1);
        std::int32_t last = *rc::gen::inRange(0, lastFrame + 1);
        if (last < first)
            std::swap(first, last);
        start = Timecode(first);
        end = Timecode(last);
    };
    EventList events;
    for (std::size_t index = 0; index < count; ++index) {
        Timecode srcIn, srcOut, dstIn, dstOut;
        anyRange(srcIn, srcOut);
        anyRange(dstIn, dstOut);
        auto event = std::make_shared<EventBase>();
        event->setRollName(*rc::gen::arbitrary<std::string>());
        event->setTimecodes(srcIn, srcOut, dstIn, dstOut);
        events.add(event);
    }
    return events;
}

Framerate anyRate()
{
    return *rc::gen::element(Framerate(24, 0), Framerate(25, 0), Framerate(30, 0), Framerate(30, 1), Framerate(60, 0));
}

RC_GTEST_PROP(CmxWriterLaw, CutsReadBackWithTheSameTimecodes, ())
{
    const TestProject project(anyRate());
    const TempFolder folder;
    const EventList events = anyCuts(*rc::gen::inRange<std::size_t>(1, 30));

    RC_ASSERT(write(folder / "reel.edl", events) == Result::Ok);
    EventList back;
    Framerate framerate;
    const bool acceptAudio = *rc::gen::arbitrary<bool>();
    RC_ASSERT(CmxParser().parse(widePath(folder / "reel.edl"), back, framerate, acceptAudio) == Result::Ok);

    RC_ASSERT(back.size() == events.size());
    for (std::size_t index = 0; index < events.size(); ++index) {
        RC_ASSERT(back.at(index).isValid());
        RC_ASSERT(back.at(index).hasSameTimecodes(events.at(index)));
        RC_ASSERT(back.at(index).eventNumber() == index + 1);
        RC_ASSERT(back.at(index).rollName() == CmxWriter::normalizedRollName(events.at(index).rollName()));
    }
}

RC_GTEST_PROP(CmxWriterLaw, EachFileOfASplitListReadsBackWithTheSameTimecodes, ())
{
    const TestProject project(anyRate());
    const TempFolder folder;
    // Few different cuts, repeated, so that the list gets long in little time.
    const EventList some = anyCuts(*rc::gen::inRange<std::size_t>(1, 30));
    const std::size_t size = *rc::gen::element<std::size_t>(1000, 1500, 1998, 1999);
    EventList events;
    while (events.size() < size)
        events.add(some.eventAt(events.size() % some.size()));

    RC_ASSERT(write(folder / "reel.edl", events) == Result::Ok);
    EventList back;
    for (int file = 1; file <= static_cast<int>(folder.names().size()); ++file)
        RC_ASSERT(CmxParser().parse(widePath(folder / ("reel_" + std::to_string(file) + ".edl")), back) == Result::Ok);

    RC_ASSERT(back.size() == events.size());
    for (std::size_t index = 0; index < events.size(); ++index) {
        const bool isSame = back.at(index).hasSameTimecodes(events.at(index)) &&
                            back.at(index).eventNumber() == index % CmxWriter::MostEventsInAFile + 1;
        if (!isSame)
            RC_FAIL("event " + std::to_string(index) + " differs");
    }
}

TEST(CmxWriter, NamesTheFilesOfAListBeforeItWritesThem)
{
    using Paths = std::vector<std::wstring>;

    EXPECT_EQ(CmxWriter::filesOf(L"/a/reel.edl", 0), Paths{L"/a/reel.edl"});
    EXPECT_EQ(CmxWriter::filesOf(L"/a/reel.edl", 999), Paths{L"/a/reel.edl"});
    EXPECT_EQ(CmxWriter::filesOf(L"/a/reel.edl", 1000), (Paths{L"/a/reel_1.edl", L"/a/reel_2.edl"}));
    EXPECT_EQ(CmxWriter::filesOf(L"/a/reel.edl", 1998), (Paths{L"/a/reel_1.edl", L"/a/reel_2.edl"}));
    EXPECT_EQ(CmxWriter::filesOf(L"/a/reel.edl", 1999), (Paths{L"/a/reel_1.edl", L"/a/reel_2.edl", L"/a/reel_3.edl"}));
}

TEST(CmxWriter, SaysTheFrameCountModeOfDropFrameAlone)
{
    EXPECT_EQ(CmxWriter::modeFor(Framerate(30, true, 1)), CmxWriter::FrameCountMode::DropFrame);
    EXPECT_EQ(CmxWriter::modeFor(Framerate(30, true, 0)), CmxWriter::FrameCountMode::Unsaid);
    EXPECT_EQ(CmxWriter::modeFor(Framerate(25, 0)), CmxWriter::FrameCountMode::Unsaid);
}

RC_GTEST_PROP(CmxWriterLaw, ARollNameIsAlwaysReadable, (const std::string& name))
{
    const std::string normalized = CmxWriter::normalizedRollName(name);

    RC_ASSERT(!normalized.empty());
    RC_ASSERT(normalized.size() <= 8U);
    RC_ASSERT(normalized.find_first_not_of(".-_ABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789") == std::string::npos);
    RC_ASSERT(CmxWriter::normalizedRollName(normalized) == normalized);
}

} // namespace
} // namespace cadrel::tests
