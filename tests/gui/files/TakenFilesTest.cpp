// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/TakenFiles.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "gui/files/EdlFile.h"
#include "tests/gui/files/EdlTexts.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::EventList;
using core::Framerate;
using core::ListKind;
using core::ListSide;
using core::Timecode;
using core::TimecodeRange;
using gui::EdlFile;
using gui::EdlOffset;
using gui::TakenFiles;
using util::Result;

EdlOffset later(const char* amount)
{
    return {Timecode(amount), true};
}

EdlOffset earlier(const char* amount)
{
    return {Timecode(amount), false};
}

std::string textOf(const std::optional<TimecodeRange>& range)
{
    return range ? range->start.toString() + " " + range->end.toString() : "none";
}

std::string textOf(const EdlOffset& offset)
{
    std::string text(1, offset.isForward ? '+' : '-');
    return text += offset.amount.toString();
}

class TakenFilesTest : public testing::Test {
protected:
    void take(const std::string& name, const std::string& text)
    {
        m_taken.take(EdlFile(m_folder.write(name, text).string(), m_taken.listKind(), true));
    }
    void startFor(std::int32_t listKind) { m_taken = TakenFiles(listKind); }

    std::string range(ListSide side) const { return textOf(m_taken.range(side)); }

    static std::vector<std::string> timecodesOfAll(const EventList& list)
    {
        std::vector<std::string> texts;
        for (const auto& event : list.events())
            texts.push_back(timecodesOf(*event));
        return texts;
    }

    using Texts = std::vector<std::string>;

    TestProject m_project;
    TempFolder m_folder;
    RecordingUndo m_undo;
    DataModel m_model;
    TakenFiles m_taken{ListKind::Old};
};

TEST_F(TakenFilesTest, HasNoRangeWithoutAFile)
{
    EXPECT_TRUE(m_taken.isEmpty());
    EXPECT_EQ(range(ListSide::Destination), "none");
    EXPECT_EQ(range(ListSide::Source), "none");
    EXPECT_EQ(m_taken.summary(), L"");
}

TEST_F(TakenFilesTest, UnitesTheRangesOfItsFiles)
{
    take("a.edl", tenSecondsEdl());
    EXPECT_EQ(range(ListSide::Destination), "01:00:05:00 01:00:15:00");
    EXPECT_EQ(range(ListSide::Source), "12:00:00:00 12:00:10:00");

    take("b.edl", fiveSecondsEdl());
    EXPECT_EQ(range(ListSide::Destination), "01:00:00:00 01:00:15:00");
    EXPECT_EQ(range(ListSide::Source), "10:00:00:00 12:00:10:00");
}

TEST_F(TakenFilesTest, LeavesAListWithoutAValidEventOutOfTheUnion)
{
    take("a.edl", invalidEdl());
    EXPECT_FALSE(m_taken.isEmpty());
    EXPECT_EQ(range(ListSide::Destination), "none");

    take("b.edl", fiveSecondsEdl());
    EXPECT_EQ(range(ListSide::Destination), "01:00:00:00 01:00:05:00");
    EXPECT_EQ(range(ListSide::Source), "10:00:00:00 10:00:05:00");
}

TEST_F(TakenFilesTest, HasTheRangeOfAnEventAtTheStartOfTheDay)
{
    take("a.edl", edlLine("001", "00:00:00:00 00:00:00:00 00:00:00:00 00:00:00:00"));

    EXPECT_EQ(range(ListSide::Destination), "00:00:00:00 00:00:00:00");
}

TEST_F(TakenFilesTest, ReplacesAFileThatIsTakenAgain)
{
    take("a.edl", fiveSecondsEdl());
    take("a.edl", tenSecondsEdl());

    EXPECT_EQ(range(ListSide::Destination), "01:00:05:00 01:00:15:00");
    EXPECT_EQ(m_taken.summary(), L"DST IN: 01:00:05:00 DST OUT: 01:00:15:00     File: a.edl\n");
}

TEST_F(TakenFilesTest, KnowsAFileByAllWaysToWriteItsPath)
{
    take("a.edl", fiveSecondsEdl());
    m_taken.take(EdlFile(m_folder.path().string() + "/./x/../a.edl", ListKind::Old, true));

    EXPECT_EQ(m_taken.summary(), L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: a.edl\n");
}

TEST_F(TakenFilesTest, ForgetsItsRangesWithTheLastFile)
{
    startFor(ListKind::Change);
    take("a.edl", fiveSecondsEdl());
    take("a.edl", edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00", "A001", "V     D    012"));

    EXPECT_TRUE(m_taken.isEmpty());
    EXPECT_EQ(range(ListSide::Destination), "none");
    EXPECT_EQ(range(ListSide::Source), "none");
    EXPECT_EQ(m_taken.summary(), L"");
}

TEST_F(TakenFilesTest, TakesOnlyTheCutsForTheChangeEdl)
{
    const std::string dissolve = edlLine("002", "12:00:00:00 12:00:10:00 01:00:05:00 01:00:15:00", "A001", "V  D 012");
    startFor(ListKind::Change);
    take("a.edl", fiveSecondsEdl() + dissolve);
    m_taken.appendTo(m_model, {}, {}, L"/reels");
    EXPECT_EQ(timecodesOfAll(m_model.changeEdl()), Texts{"10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00"});

    startFor(ListKind::New);
    take("a.edl", fiveSecondsEdl() + dissolve);
    m_taken.appendTo(m_model, {}, {}, L"/reels");
    EXPECT_EQ(m_model.newEdl().size(), 2U);
}

TEST_F(TakenFilesTest, ListsItsFilesInTheOrderOfTheirPaths)
{
    take("b.edl", fiveSecondsEdl());
    take("B.edl", fiveSecondsEdl());
    take("a.edl", tenSecondsEdl());

    EXPECT_EQ(m_taken.summary(), L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: B.edl\n"
                                 L"DST IN: 01:00:05:00 DST OUT: 01:00:15:00     File: a.edl\n"
                                 L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: b.edl\n");
}

TEST_F(TakenFilesTest, ListsTheSourceRangesForTheChangeEdl)
{
    startFor(ListKind::Change);
    take("reel 1.edl", fiveSecondsEdl());

    EXPECT_EQ(m_taken.summary(), L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     "
                                 L"SRC IN: 10:00:00:00 SRC OUT: 10:00:05:00     File: reel 1.edl\n");
}

TEST_F(TakenFilesTest, ListsTheLinesThatCouldNotBeRead)
{
    take("a.edl", fiveSecondsEdl() + "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n");
    take("b.edl", fiveSecondsEdl());

    EXPECT_EQ(m_taken.summary(),
              L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: a.edl\n"
              L"     Line 2 misses a field and isn't read: \"002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\"\n"
              L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: b.edl\n");
}

TEST_F(TakenFilesTest, CountsTheLinesThatCouldNotBeReadFromTheEleventhOn)
{
    std::string text = fiveSecondsEdl();
    for (int line = 0; line < 12; ++line)
        text += "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n";
    take("a.edl", text);

    const std::wstring summary = m_taken.summary();
    EXPECT_NE(summary.find(L"Line 11 "), std::wstring::npos);
    EXPECT_EQ(summary.find(L"Line 12 "), std::wstring::npos);
    EXPECT_TRUE(summary.ends_with(L"\n     and 2 more\n")) << testing::PrintToString(summary);
}

// ---- Offsets -------------------------------------------------------------------------------------------------------

TEST_F(TakenFilesTest, StopsAnOffsetAtTheStartOfTheDay)
{
    take("a.edl", fiveSecondsEdl());

    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("00:59:59:24"))), "-00:59:59:24");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("01:00:00:00"))), "-01:00:00:00");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("01:00:00:01"))), "-01:00:00:00");
    EXPECT_EQ(textOf(m_taken.shifted(ListSide::Destination, earlier("01:00:00:00"))), "00:00:00:00 00:00:05:00");
}

TEST_F(TakenFilesTest, StopsAnOffsetAtTheEndOfTheDay)
{
    take("a.edl", fiveSecondsEdl());

    // 23:59:59:24 less 01:00:05:00.
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, later("22:59:54:23"))), "+22:59:54:23");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, later("22:59:54:24"))), "+22:59:54:24");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, later("22:59:55:00"))), "+22:59:54:24");
    EXPECT_EQ(textOf(m_taken.shifted(ListSide::Destination, later("22:59:54:24"))), "23:59:54:24 23:59:59:24");
}

TEST_F(TakenFilesTest, BoundsTheSourceOffsetByTheSourceRange)
{
    take("a.edl", fiveSecondsEdl());

    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Source, earlier("11:00:00:00"))), "-10:00:00:00");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Source, later("23:00:00:00"))), "+13:59:54:24");
}

TEST_F(TakenFilesTest, AllowsEveryOffsetWithoutAValidEvent)
{
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("05:00:00:00"))), "-05:00:00:00");
    EXPECT_EQ(textOf(m_taken.shifted(ListSide::Destination, earlier("05:00:00:00"))), "none");

    take("a.edl", invalidEdl());
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("05:00:00:00"))), "-05:00:00:00");
    EXPECT_EQ(textOf(m_taken.shifted(ListSide::Destination, earlier("05:00:00:00"))), "none");
}

TEST_F(TakenFilesTest, LeavesAnOffsetOfNothingAsItIs)
{
    take("a.edl", edlLine("001", "00:00:00:00 23:59:59:24 00:00:00:00 23:59:59:24"));

    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, later("00:00:00:00"))), "+00:00:00:00");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("00:00:00:00"))), "-00:00:00:00");
}

TEST_F(TakenFilesTest, CountsAnOffsetInFramesOfDropFrameTimecode)
{
    const TestProject project(Framerate(30, true, 1));
    take("a.edl", "FCM: DROP FRAME\n" + edlLine("001", "01:00:00;00 01:00:10;00 00:01:00;02 00:01:10;02"));

    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("00:01:00:02"))), "-00:01:00:02");
    EXPECT_EQ(textOf(m_taken.bounded(ListSide::Destination, earlier("00:01:00:03"))), "-00:01:00:02");
    EXPECT_EQ(textOf(m_taken.shifted(ListSide::Destination, earlier("00:00:00:01"))), "00:00:59:29 00:01:10:01");
}

RC_GTEST_FIXTURE_PROP(TakenFilesTest, ABoundedOffsetIsAlwaysCarriedOut, (bool isForward))
{
    const TestProject project(*rc::gen::element(Framerate(25, 0), Framerate(24, true, 0), Framerate(30, true, 1)));
    const std::int32_t latest = Timecode::maxTimecode().toFrameCount();
    const auto place = [&] { return *rc::gen::inRange(0, latest + 1); };
    const std::int32_t a = place();
    const std::int32_t b = place();
    const std::string range = Timecode(std::min(a, b)).toString() + " " + Timecode(std::max(a, b)).toString();
    take("a.edl", edlLine("001", range + " " + range));
    const EdlOffset wanted{Timecode(place()), isForward};

    const EdlOffset offset = m_taken.bounded(ListSide::Destination, wanted);

    RC_ASSERT(m_taken.bounded(ListSide::Destination, offset) == offset);
    m_taken.appendTo(m_model, offset, offset, L"/reels");
    const TimecodeRange moved = *m_taken.shifted(ListSide::Destination, offset);
    RC_ASSERT(m_model.oldEdl().at(0).dstIn() == moved.start);
    RC_ASSERT(m_model.oldEdl().at(0).dstOut() == moved.end);
    RC_ASSERT(m_model.oldEdl().at(0).srcIn() == moved.start);
}

// ---- Appending -----------------------------------------------------------------------------------------------------

TEST_F(TakenFilesTest, AppendsAllFilesInOneNamedUndoEntryAndOneNotification)
{
    m_model.oldEdl().add(makeEvent("FIRST", "00:00:00:00", "00:00:01:00", "00:00:00:00", "00:00:01:00"));
    take("b.edl", tenSecondsEdl());
    take("a.edl", fiveSecondsEdl());
    RecordingListener heard;
    m_model.oldEdl().addListener(&heard);

    m_taken.appendTo(m_model, {}, {}, L"/reels");

    EXPECT_EQ(timecodesOfAll(m_model.oldEdl()), (Texts{"00:00:00:00 00:00:01:00 00:00:00:00 00:00:01:00",
                                                       "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00",
                                                       "12:00:00:00 12:00:10:00 01:00:05:00 01:00:15:00"}));
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Load Old EDL"});
    EXPECT_EQ(heard.listKinds, std::vector<std::int32_t>{ListKind::Old});
    m_model.oldEdl().removeListener(&heard);
}

TEST_F(TakenFilesTest, NamesTheUndoEntryAfterTheList)
{
    for (const std::int32_t listKind : {ListKind::New, ListKind::Change}) {
        startFor(listKind);
        take("a.edl", fiveSecondsEdl());
        m_taken.appendTo(m_model, {}, {}, L"/reels");
    }

    EXPECT_EQ(m_undo.entries, (std::vector<std::wstring>{L"Load New EDL", L"Load Change EDL"}));
    EXPECT_EQ(m_model.oldEdl().size(), 0U);
    EXPECT_EQ(m_model.newEdl().size(), 1U);
    EXPECT_EQ(m_model.changeEdl().size(), 1U);
}

TEST_F(TakenFilesTest, MakesAnUndoEntryWithoutContentWhenNothingWasTaken)
{
    RecordingListener heard;
    m_model.oldEdl().addListener(&heard);

    m_taken.appendTo(m_model, later("01:00:00:00"), {}, L"/reels");

    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Load Old EDL"});
    EXPECT_TRUE(heard.types.empty());
    EXPECT_TRUE(m_model.oldEdl().isEmpty());
    m_model.oldEdl().removeListener(&heard);
}

TEST_F(TakenFilesTest, StoresTheFolderForTheNextTime)
{
    take("a.edl", fiveSecondsEdl());
    m_taken.appendTo(m_model, {}, {}, L"/films/L\u00f6we");

    core::Variant stored;
    ASSERT_EQ(m_model.getProperty(core::PropertyKey::LastEdlFolder, stored), Result::Ok);
    EXPECT_EQ(stored.toText(), "/films/L\xc3\xb6we");
}

TEST_F(TakenFilesTest, ShiftsBothSides)
{
    startFor(ListKind::Change);
    take("a.edl", fiveSecondsEdl());

    m_taken.appendTo(m_model, earlier("01:00:00:00"), later("00:00:00:12"), L"/reels");

    EXPECT_EQ(timecodesOfAll(m_model.changeEdl()), Texts{"10:00:00:12 10:00:05:12 00:00:00:00 00:00:05:00"});
}

TEST_F(TakenFilesTest, KeepsWhatWasTakenUnshifted)
{
    take("a.edl", fiveSecondsEdl());

    m_taken.appendTo(m_model, later("01:00:00:00"), {}, L"/reels");
    m_taken.appendTo(m_model, later("02:00:00:00"), {}, L"/reels");
    m_taken.appendTo(m_model, {}, later("01:00:00:00"), L"/reels");

    EXPECT_EQ(range(ListSide::Destination), "01:00:00:00 01:00:05:00");
    EXPECT_EQ(range(ListSide::Source), "10:00:00:00 10:00:05:00");
    EXPECT_EQ(timecodesOfAll(m_model.oldEdl()), (Texts{"10:00:00:00 10:00:05:00 02:00:00:00 02:00:05:00",
                                                       "10:00:00:00 10:00:05:00 03:00:00:00 03:00:05:00",
                                                       "11:00:00:00 11:00:05:00 01:00:00:00 01:00:05:00"}));
}

TEST_F(TakenFilesTest, ChangesNothingWhenOneListWouldLeaveTheDay)
{
    take("a.edl", tenSecondsEdl());
    take("b.edl", fiveSecondsEdl());

    // The first file could go, the second begins too early.
    EXPECT_EQ(thrownBy([&] { m_taken.appendTo(m_model, earlier("01:00:00:01"), {}, L"/reels"); }), Result::OutOfRange);

    EXPECT_TRUE(m_model.oldEdl().isEmpty());
    EXPECT_FALSE(m_model.hasProperty(core::PropertyKey::LastEdlFolder));
    EXPECT_TRUE(m_undo.begun.empty());
    EXPECT_EQ(m_taken.summary(), L"DST IN: 01:00:05:00 DST OUT: 01:00:15:00     File: a.edl\n"
                                 L"DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: b.edl\n");
}

TEST_F(TakenFilesTest, ChangesNothingWhenNoUndoEntryCanBeMade)
{
    take("a.edl", fiveSecondsEdl());
    m_undo.failure = Result::HostCallFailed;

    EXPECT_EQ(thrownBy([&] { m_taken.appendTo(m_model, {}, {}, L"/reels"); }), Result::HostCallFailed);

    EXPECT_TRUE(m_model.oldEdl().isEmpty());
    EXPECT_FALSE(m_model.hasProperty(core::PropertyKey::LastEdlFolder));
}

TEST_F(TakenFilesTest, LeavesAListWithoutAValidEventWhereItIs)
{
    take("a.edl", invalidEdl());
    take("b.edl", fiveSecondsEdl());

    m_taken.appendTo(m_model, earlier("00:30:00:00"), {}, L"/reels");

    EXPECT_EQ(timecodesOfAll(m_model.oldEdl()), (Texts{"10:00:00:00 10:00:05:00 01:00:00:00 01:61:05:00",
                                                       "10:00:00:00 10:00:05:00 00:30:00:00 00:30:05:00"}));
}

} // namespace
} // namespace cadrel::tests
