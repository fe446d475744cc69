// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/VideoList.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using cadrel::core::ChangeContext;
using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::core::serialize::ByteArchive;
using cadrel::tests::archiveOf;
using cadrel::tests::bytesOf;
using cadrel::tests::NoProject;
using cadrel::tests::RecordingListener;
using cadrel::tests::TestProject;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

using Entry = cadrel::core::VideoList::Entry;
using Paths = std::vector<std::string>;
using Types = std::vector<std::int32_t>;

namespace {

/// A video of ten seconds.
Entry video(const std::string& path, const char* start)
{
    return Entry(path, Timecode(start), Timecode("00:00:10:00"));
}

class VideoList : public testing::Test {
protected:
    Paths paths() const
    {
        Paths found;
        for (const Entry& entry : list.entries())
            found.push_back(entry.path);
        return found;
    }
    /// Three videos, added out of order.
    void addThree()
    {
        list.add(video("/v/two.mov", "02:00:00:00"), false);
        list.add(video("/v/one.mov", "01:00:00:00"), false);
        list.add(video("/v/three.mov", "03:00:00:00"), false);
    }

    TestProject project;
    cadrel::core::VideoList list;
};

// /a/x.mov at 01:00:00:00 and /a/y.mov at 02:00:00:00, each of ten seconds, framed as entries.
const std::string EntryX = "00000000 08000000 2F612F782E6D6F76 02000000 01000000 01 02000000 00000A00 01 ";
const std::string EntryY = "00000000 08000000 2F612F792E6D6F76 02000000 02000000 01 02000000 00000A00 01 ";

} // namespace

TEST_F(VideoList, BeginsEmpty)
{
    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(list.size(), 0U);
}

TEST_F(VideoList, KeepsTheOrderOfTheStarts)
{
    addThree();

    EXPECT_FALSE(list.isEmpty());
    EXPECT_EQ(list.size(), 3U);
    EXPECT_EQ(paths(), (Paths{"/v/one.mov", "/v/two.mov", "/v/three.mov"}));
    EXPECT_EQ(list.at(0).path, "/v/one.mov");
    EXPECT_EQ(list.at(2).path, "/v/three.mov");
}

TEST_F(VideoList, HasNoEntryAtItsSize)
{
    EXPECT_EQ(thrownBy([&] { list.at(0); }), Result::InvalidArgument);

    addThree();

    EXPECT_EQ(thrownBy([&] { list.at(list.size()); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { list.at(static_cast<std::size_t>(-1)); }), Result::InvalidArgument);
}

TEST_F(VideoList, EntriesAreEqualWithoutTheirFolder)
{
    const Entry entry("/a/x.mov", Timecode("01:00:00:00"), Timecode("00:00:10:00"));

    EXPECT_TRUE(entry == Entry("/b/x.mov", Timecode("01:00:00:00"), Timecode("00:00:10:00")));
    EXPECT_TRUE(entry == Entry("C:\\x.mov", Timecode("01:00:00:00"), Timecode("00:00:10:00")));
    EXPECT_FALSE(entry == Entry("/a/y.mov", Timecode("01:00:00:00"), Timecode("00:00:10:00")));
    EXPECT_FALSE(entry == Entry("/a/x.mov", Timecode("01:00:00:01"), Timecode("00:00:10:00")));
    EXPECT_FALSE(entry == Entry("/a/x.mov", Timecode("01:00:00:00"), Timecode("00:00:10:01")));
}

TEST_F(VideoList, FindsAFileByItsPathOrItsName)
{
    addThree();

    EXPECT_TRUE(list.containsFile("/v/one.mov"));
    EXPECT_TRUE(list.containsFile("/elsewhere/one.mov"));
    EXPECT_TRUE(list.containsFile("one.mov"));
    EXPECT_FALSE(list.containsFile("/v/four.mov"));
    EXPECT_FALSE(list.containsFile("/v/one.MOV"));
    EXPECT_TRUE(list.contains(video("two.mov", "23:00:00:00")));
    EXPECT_FALSE(list.contains(video("four.mov", "01:00:00:00")));
}

TEST_F(VideoList, FindsTheFirstOfTwoEntriesThatFit)
{
    // Only a stream can hold a file twice.
    ByteArchive archive = archiveOf("00000000 02000000 " + EntryX +
                                    // /a/x.mov at 03:00:00:00
                                    "00000000 08000000 2F612F782E6D6F76 02000000 03000000 01 02000000 00000A00 01");
    archive >> list;

    EXPECT_EQ(list.find("/a/x.mov")->start, Timecode("01:00:00:00"));
}

TEST_F(VideoList, FindsNothingForAFileThatIsNotListed)
{
    addThree();

    EXPECT_EQ(list.find("/v/four.mov"), list.entries().end());
    EXPECT_EQ(list.find("one.mov")->path, "/v/one.mov");
}

TEST_F(VideoList, NamesFilesByTheirWideName)
{
    list.add(video("/v/R\xC3\xB6lle.mov", "01:00:00:00"), false);

    EXPECT_EQ(list.at(0).fileName(), L"R\u00F6lle.mov");
    EXPECT_TRUE(list.containsFile("R\xC3\xB6lle.mov"));
}

TEST_F(VideoList, RefusesAPathThatIsNoText)
{
    EXPECT_EQ(thrownBy([&] { list.add(video("/v/\xFF.mov", "01:00:00:00"), false); }), Result::InvalidArgument);
    EXPECT_TRUE(list.isEmpty());
}

TEST(VideoListWithoutAProject, FailsWithoutAConverter)
{
    const NoProject none;
    const cadrel::core::VideoList list;

    EXPECT_EQ(thrownBy([&] { list.containsFile("/v/one.mov"); }), Result::NotAvailable);
}

TEST_F(VideoList, AddsAVideoAndTellsOfIt)
{
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.add(video("/a/x.mov", "01:00:00:00"), false), Result::Ok);

    EXPECT_EQ(paths(), Paths{"/a/x.mov"});
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, RefusesAFileThatIsListedFromAnotherFolder)
{
    list.add(video("/b/x.mov", "01:00:00:00"), false);
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.add(video("/a/x.mov", "02:00:00:00"), false), Result::Refused);
    EXPECT_EQ(list.add(video("/a/x.mov", "02:00:00:00"), true), Result::Refused);
    EXPECT_EQ(list.add(video("/a/x.mov", "01:00:00:00"), true), Result::Refused);

    EXPECT_EQ(paths(), Paths{"/b/x.mov"});
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, RefusesASecondVideoAtAStart)
{
    list.add(video("/a/x.mov", "01:00:00:00"), false);
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.add(video("/a/y.mov", "01:00:00:00"), false), Result::Refused);

    EXPECT_EQ(paths(), Paths{"/a/x.mov"});
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, ReplacesTheVideoAtAStartWhenAsked)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.add(video("/a/y.mov", "02:00:00:00"), true), Result::Ok);

    EXPECT_EQ(paths(), (Paths{"/v/one.mov", "/a/y.mov", "/v/three.mov"}));
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, ChecksThatTheStartIsFree)
{
    addThree();

    EXPECT_EQ(list.checkAdd(video("/v/four.mov", "02:00:00:00")), Result::PositionOccupied);
    EXPECT_EQ(list.checkAdd(video("/v/four.mov", "02:00:00:01")), Result::Ok);
}

TEST_F(VideoList, ChecksThatAVideoEndsWithinTheDay)
{
    // The last frame of the day has the number 2159999, one second is 25 frames.
    const Timecode start("00:00:01:00");

    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", start, Timecode("23:59:59:24"))), Result::FrameOutOfRate);
    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", start, Timecode("23:59:59:00"))), Result::FrameOutOfRate);
    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", start, Timecode("23:59:58:24"))), Result::Ok);
    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", Timecode("00:00:00:00"), Timecode("23:59:59:24"))), Result::Ok);
    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", Timecode("23:59:59:24"), Timecode("23:59:59:24"))),
              Result::FrameOutOfRate);
}

TEST_F(VideoList, ChecksTheDayInDroppedFrames)
{
    project.framerate = Framerate(30, true, 1);
    // 23:59:59:29 is frame 2589407 of the day, 00:10:00:00 frame 17982; 2589407 - 17982 = 2571425 is 23:49:59:29.
    const Timecode start("00:10:00:00");

    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", start, Timecode("23:49:59:29"))), Result::Ok);
    EXPECT_EQ(list.checkAdd(Entry("/v/x.mov", start, Timecode("23:50:00:00"))), Result::FrameOutOfRate);
}

TEST_F(VideoList, CheckFailsForTimecodesThatAreNotValid)
{
    EXPECT_EQ(thrownBy([&] { list.checkAdd(video("/v/x.mov", "00:00:00:26")); }), Result::FrameOutOfRate);
    EXPECT_EQ(thrownBy([&] { list.checkAdd(video("/v/x.mov", "24:00:00:00")); }), Result::OutOfRange);
    EXPECT_EQ(thrownBy([&] { list.checkAdd(Entry("/v/x.mov", Timecode("00:00:00:00"), Timecode("00:60:00:00"))); }),
              Result::OutOfRange);
}

TEST(VideoListWithoutAProject, CheckFailsWithoutAFrameRate)
{
    const NoProject none;
    const cadrel::core::VideoList list;

    EXPECT_EQ(thrownBy([&] { list.checkAdd(video("/v/x.mov", "00:00:00:00")); }), Result::NotAvailable);
}

TEST_F(VideoList, CheckChangesNothing)
{
    RecordingListener listener;
    list.addListener(&listener);

    list.checkAdd(video("/v/x.mov", "01:00:00:00"));

    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, RemovesAFileByItsName)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.remove("/elsewhere/two.mov"), Result::Ok);

    EXPECT_EQ(paths(), (Paths{"/v/one.mov", "/v/three.mov"}));
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, RefusesToRemoveAFileThatIsNotListed)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    EXPECT_EQ(list.remove("/v/four.mov"), Result::Refused);

    EXPECT_EQ(list.size(), 3U);
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, FollowsANewStart)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    list.setStart("/elsewhere/one.mov", Timecode("02:30:00:00"));

    EXPECT_EQ(paths(), (Paths{"/v/two.mov", "/v/one.mov", "/v/three.mov"}));
    EXPECT_EQ(list.at(1).start, Timecode("02:30:00:00"));
    EXPECT_EQ(list.at(1).length, Timecode("00:00:10:00"));
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, KeepsAVideoThatMovesOntoAnother)
{
    addThree();

    list.setStart("/v/one.mov", Timecode("02:00:00:00"));

    EXPECT_EQ(paths(), (Paths{"/v/one.mov", "/v/three.mov"}));
    EXPECT_EQ(list.at(0).start, Timecode("02:00:00:00"));
}

TEST_F(VideoList, TakesPathAndStartOfItsOwnEntriesForAMove)
{
    addThree();

    list.setStart(list.at(0).path, list.at(2).start);

    EXPECT_EQ(paths(), (Paths{"/v/two.mov", "/v/one.mov"}));
    EXPECT_EQ(list.at(1).start, Timecode("03:00:00:00"));
}

TEST_F(VideoList, KeepsAVideoThatMovesToItsOwnStart)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    list.setStart("/v/two.mov", Timecode("02:00:00:00"));

    EXPECT_EQ(paths(), (Paths{"/v/one.mov", "/v/two.mov", "/v/three.mov"}));
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, MovesNothingForAFileThatIsNotListed)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    list.setStart("/v/four.mov", Timecode("01:00:00:00"));

    EXPECT_EQ(list.size(), 3U);
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, TellsOfEveryClearing)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    list.clear();
    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types.size(), 1U);

    list.clear();
    EXPECT_EQ(listener.types, (Types{ChangeContext::VideoListChanged, ChangeContext::VideoListChanged}));
}

TEST_F(VideoList, ShowsTheLastVideoThatHasStarted)
{
    addThree();

    EXPECT_EQ(list.entryAt(Timecode("02:00:00:00")).path, "/v/two.mov");
    EXPECT_EQ(list.entryAt(Timecode("01:59:59:24")).path, "/v/one.mov");
    EXPECT_EQ(list.entryAt(Timecode("02:00:00:01")).path, "/v/two.mov");
    EXPECT_EQ(list.entryAt(Timecode("23:59:59:24")).path, "/v/three.mov");
}

TEST_F(VideoList, ShowsAVideoBeyondItsLength)
{
    addThree();

    EXPECT_EQ(list.entryAt(Timecode("01:30:00:00")).path, "/v/one.mov");
}

TEST_F(VideoList, ShowsNothingBeforeTheFirstVideo)
{
    addThree();

    const Entry entry = list.entryAt(Timecode("00:59:59:24"));

    EXPECT_EQ(entry.path, "");
    EXPECT_FALSE(entry.start.isInitialized());
    EXPECT_FALSE(entry.length.isInitialized());
}

TEST_F(VideoList, ShowsNothingWithoutVideos)
{
    EXPECT_EQ(list.entryAt(Timecode("01:00:00:00")).path, "");
    EXPECT_FALSE(list.entryAt(Timecode("01:00:00:00")).start.isInitialized());
}

TEST_F(VideoList, CopiesWithoutListeners)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);

    cadrel::core::VideoList copy = list;
    copy.clear();

    EXPECT_EQ(list.size(), 3U);
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, IsAssignedOtherVideosWithOneNotification)
{
    cadrel::core::VideoList other;
    other.add(video("/a/x.mov", "01:00:00:00"), false);
    other.add(video("/a/y.mov", "02:00:00:00"), false);
    RecordingListener listener;
    list.addListener(&listener);

    list = other;

    EXPECT_EQ(paths(), (Paths{"/a/x.mov", "/a/y.mov"}));
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, StaysAsItIsWhenAssignedAnEqualList)
{
    list.add(video("/a/x.mov", "01:00:00:00"), false);
    cadrel::core::VideoList other;
    other.add(video("/b/x.mov", "01:00:00:00"), false);
    RecordingListener listener;
    list.addListener(&listener);

    list = other;

    EXPECT_EQ(paths(), Paths{"/a/x.mov"});
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, IsAssignedAListThatDiffersInALengthOrASize)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);
    cadrel::core::VideoList longer = list;
    longer.remove("/v/one.mov");
    longer.add(Entry("/v/one.mov", Timecode("01:00:00:00"), Timecode("00:00:10:01")), false);

    list = longer;
    EXPECT_EQ(list.at(0).length, Timecode("00:00:10:01"));
    EXPECT_EQ(listener.types.size(), 1U);

    longer.remove("/v/three.mov");
    list = longer;
    EXPECT_EQ(list.size(), 2U);
    EXPECT_EQ(listener.types.size(), 2U);

    list = cadrel::core::VideoList();
    EXPECT_TRUE(list.isEmpty());
    EXPECT_EQ(listener.types.size(), 3U);
}

TEST_F(VideoList, WritesItsEntriesInTheOrderOfTheirStarts)
{
    list.add(video("/a/y.mov", "02:00:00:00"), false);
    list.add(video("/a/x.mov", "01:00:00:00"), false);
    ByteArchive archive;

    archive << list;

    EXPECT_EQ(bytesOf(archive), bytesOf("00000000 02000000 " + EntryX + EntryY));
}

TEST_F(VideoList, WritesEightZeroBytesWhenEmpty)
{
    ByteArchive archive;

    archive << list;

    EXPECT_EQ(bytesOf(archive), bytesOf("00000000 00000000"));
}

TEST_F(VideoList, ReadsItsEntriesInPlaceOfTheFormer)
{
    addThree();
    RecordingListener listener;
    list.addListener(&listener);
    ByteArchive archive = archiveOf("00000000 02000000 " + EntryY + EntryX);

    archive >> list;

    EXPECT_EQ(paths(), (Paths{"/a/x.mov", "/a/y.mov"}));
    EXPECT_EQ(list.at(0).start, Timecode("01:00:00:00"));
    EXPECT_EQ(list.at(0).length, Timecode("00:00:10:00"));
    EXPECT_EQ(archive.bytesLeft(), 0U);
    EXPECT_EQ(listener.types, Types{ChangeContext::VideoListChanged});
}

TEST_F(VideoList, ReadsUninitializedTimecodesAsSuch)
{
    ByteArchive archive = archiveOf("00000000 01000000 00000000 00000000 02000000 00000000 00 02000000 00000000 00");

    archive >> list;

    ASSERT_EQ(list.size(), 1U);
    EXPECT_FALSE(list.at(0).start.isInitialized());
    EXPECT_FALSE(list.at(0).length.isInitialized());
}

TEST_F(VideoList, ReadsTheFirstOfTwoEntriesAtOneStart)
{
    // /b/z.mov at 01:00:00:00
    const std::string entryZ = "00000000 08000000 2F622F7A2E6D6F76 02000000 01000000 01 02000000 00000A00 01 ";
    ByteArchive archive = archiveOf("00000000 02000000 " + EntryX + entryZ);

    archive >> list;

    EXPECT_EQ(paths(), Paths{"/a/x.mov"});
}

// NoText at 00:30:00:00, of ten seconds.
const std::string EntryNoText = "00000000 08000000 2F762FFF2E6D6F76 02000000 00001E00 01 02000000 00000A00 01 ";

class VideoListWithAPathThatIsNoText : public VideoList {
protected:
    VideoListWithAPathThatIsNoText()
    {
        ByteArchive archive = stored();
        archive >> list;
        list.addListener(&listener);
    }

    static ByteArchive stored() { return archiveOf("00000000 02000000 " + EntryNoText + EntryX); }

    const std::string NoText = "/v/\xFF.mov";
    RecordingListener listener;
};

TEST_F(VideoListWithAPathThatIsNoText, HoldsItAsItIs)
{
    ByteArchive archive;
    archive << list;

    EXPECT_EQ(paths(), (Paths{NoText, "/a/x.mov"}));
    EXPECT_EQ(list.find(NoText), list.entries().begin());
    EXPECT_EQ(list.entryAt(Timecode("00:30:00:00")).path, NoText);
    EXPECT_EQ(bytesOf(archive), bytesOf(stored()));
}

TEST_F(VideoListWithAPathThatIsNoText, FindsAddsAndRemovesOtherFiles)
{
    EXPECT_TRUE(list.containsFile("/elsewhere/x.mov"));
    EXPECT_FALSE(list.containsFile("/a/y.mov"));
    EXPECT_EQ(list.add(video("/a/y.mov", "02:00:00:00"), false), Result::Ok);
    EXPECT_EQ(list.add(video("/b/y.mov", "03:00:00:00"), false), Result::Refused);
    EXPECT_EQ(list.remove("x.mov"), Result::Ok);
    EXPECT_EQ(list.remove("x.mov"), Result::Refused);

    EXPECT_EQ(paths(), (Paths{NoText, "/a/y.mov"}));
    EXPECT_EQ(listener.types, (Types{ChangeContext::VideoListChanged, ChangeContext::VideoListChanged}));
}

TEST_F(VideoListWithAPathThatIsNoText, MovesAndRemovesItByItsOwnPath)
{
    EXPECT_EQ(list.add(video(NoText, "02:00:00:00"), false), Result::Refused);

    list.setStart(NoText, Timecode("02:00:00:00"));
    EXPECT_EQ(paths(), (Paths{"/a/x.mov", NoText}));

    EXPECT_EQ(list.remove(NoText), Result::Ok);
    EXPECT_EQ(paths(), Paths{"/a/x.mov"});
    EXPECT_EQ(listener.types, (Types{ChangeContext::VideoListChanged, ChangeContext::VideoListChanged}));
}

TEST_F(VideoListWithAPathThatIsNoText, StaysAsItIsWhenAssignedAnEqualList)
{
    cadrel::core::VideoList other;
    ByteArchive archive = stored();
    archive >> other;

    list = other;

    EXPECT_EQ(paths(), (Paths{NoText, "/a/x.mov"}));
    EXPECT_EQ(listener.types, Types());
}

TEST_F(VideoList, IsEmptyAfterACountBelowOne)
{
    for (const char* hex : {"00000000 00000000", "00000000 FFFFFFFF", "00000000 00000080"}) {
        addThree();
        ByteArchive archive = archiveOf(std::string_view(hex));

        archive >> list;

        EXPECT_TRUE(list.isEmpty()) << hex;
        EXPECT_EQ(archive.bytesLeft(), 0U) << hex;
    }
}

TEST_F(VideoList, FailsWhereverItsBytesEnd)
{
    std::vector<std::uint8_t> bytes = bytesOf("00000000 02000000 " + EntryX + EntryY);
    while (!bytes.empty()) {
        bytes.pop_back();
        ByteArchive archive = archiveOf(bytes);

        EXPECT_EQ(thrownBy([&] { archive >> list; }), Result::EndOfData) << bytes.size();
    }
}

TEST_F(VideoList, TrustsNoCountOfEntries)
{
    ByteArchive archive = archiveOf("00000000 FFFFFF7F " + EntryX);

    EXPECT_EQ(thrownBy([&] { archive >> list; }), Result::EndOfData);
}

TEST_F(VideoList, RefusesNewerVersions)
{
    ByteArchive ofTheList = archiveOf("01000000 00000000");
    ByteArchive ofAnEntry = archiveOf("00000000 01000000 01000000 00000000");

    EXPECT_EQ(thrownBy([&] { ofTheList >> list; }), Result::NewerVersion);
    EXPECT_EQ(thrownBy([&] { ofAnEntry >> list; }), Result::NewerVersion);
}
