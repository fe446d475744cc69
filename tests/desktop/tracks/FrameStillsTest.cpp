// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/FrameStills.h"

#include "standin/Application.h"
#include "standin/project/MediaPool.h"
#include "standin/project/Project.h"
#include "standin/video/Videos.h"
#include "tests/support/TempFolder.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/video/TestVideos.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <optional>

using desktop::FrameStills;
using standin::MediaClip;

namespace {

/// A host that draws the names of frames, and a video of 100 seconds in a project of 24 frames a second.
class FrameStillsTest : public testing::Test {
protected:
    bool waitForOne()
    {
        for (int milliseconds = 0; milliseconds < 10000; ++milliseconds) {
            if (m_stills->poll())
                return true;
            juce::Thread::sleep(1);
        }
        return false;
    }
    void makeStills(std::size_t capacity) { m_stills.emplace(m_host.context(), capacity); }
    /// How often something was to be seen that wasn't before.
    int pollForAWhile()
    {
        int count = 0;
        for (int milliseconds = 0; milliseconds < 300; ++milliseconds) {
            count += m_stills->poll() ? 1 : 0;
            juce::Thread::sleep(1);
        }
        return count;
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    standin::tests::TestHost m_host;
    MediaClip& m_clip = m_host.addVideo(u"/reel.mov", 100.0);
    std::optional<FrameStills> m_stills{std::in_place, m_host.context()};
};

} // namespace

TEST_F(FrameStillsTest, HaveAPictureOnceItIsDrawn)
{
    EXPECT_TRUE(m_stills->still(m_clip, 24, 40).isNull());
    ASSERT_TRUE(waitForOne());
    EXPECT_EQ(m_stills->still(m_clip, 24, 40).getHeight(), 40);
    EXPECT_EQ(m_stills->wantedCount(), 0U);
}

TEST_F(FrameStillsTest, WantAFrameOnceHoweverOftenItIsAskedFor)
{
    for (int time = 0; time < 3; ++time)
        m_stills->still(m_clip, 24, 40);
    EXPECT_EQ(m_stills->wantedCount(), 1U);
    m_stills->poll();
    m_stills->still(m_clip, 24, 40);
    EXPECT_EQ(m_stills->wantedCount(), 0U);
}

TEST_F(FrameStillsTest, WantNothingThatThereIsNot)
{
    m_stills->still(m_clip, 2400, 40);
    m_stills->still(m_clip, 0, 0);
    EXPECT_EQ(m_stills->wantedCount(), 0U);
    m_stills->still(m_clip, 2399, 1);
    EXPECT_EQ(m_stills->wantedCount(), 1U);
}

TEST_F(FrameStillsTest, DrawWhatWasAskedForLastFirst)
{
    for (const std::uint32_t frame : {1U, 2U, 3U})
        m_stills->still(m_clip, frame, 40);
    ASSERT_TRUE(waitForOne());
    m_stills->startAsking();
    EXPECT_FALSE(m_stills->still(m_clip, 3, 40).isNull());
    EXPECT_EQ(m_stills->keptCount(), 1U);
}

TEST_F(FrameStillsTest, ForgetWhatIsNotSeenAnyMore)
{
    m_stills->still(m_clip, 1, 40);
    m_stills->startAsking();
    EXPECT_FALSE(m_stills->poll());
    EXPECT_EQ(m_stills->wantedCount(), 0U);
}

TEST_F(FrameStillsTest, KeepWhatWasUsedLastWhereThereIsNoRoomForAll)
{
    // Each is 160 by 40 pixels of four bytes.
    makeStills(std::size_t{2} * 160 * 40 * 4);
    for (const std::uint32_t frame : {1U, 2U}) {
        m_stills->still(m_clip, frame, 40);
        ASSERT_TRUE(waitForOne());
    }
    EXPECT_FALSE(m_stills->still(m_clip, 1, 40).isNull());
    m_stills->still(m_clip, 3, 40);
    ASSERT_TRUE(waitForOne());
    EXPECT_EQ(m_stills->keptCount(), 2U);
    EXPECT_FALSE(m_stills->still(m_clip, 1, 40).isNull());
    EXPECT_FALSE(m_stills->still(m_clip, 3, 40).isNull());
    EXPECT_TRUE(m_stills->still(m_clip, 2, 40).isNull());
}

TEST_F(FrameStillsTest, KeepTheLastOneWithoutAnyRoom)
{
    makeStills(0);
    m_stills->still(m_clip, 1, 40);
    ASSERT_TRUE(waitForOne());
    EXPECT_FALSE(m_stills->still(m_clip, 1, 40).isNull());
}

TEST_F(FrameStillsTest, CanGoWhileAPictureIsDrawn)
{
    m_stills->still(m_clip, 1, 4000);
    m_stills->poll();
    m_stills.reset();
}

TEST_F(FrameStillsTest, AskAgainForAPictureOfAFileThatHasComeBack)
{
    const cadrel::tests::TempFolder folder;
    const auto file = folder / "reel.mov";
    standin::Videos videos;
    standin::Application host({}, &videos);
    standin::Project& project = host.createProject();
    const auto clip = Velmark::makeCounted<MediaClip>(MediaClip::Kind::Video, file.u16string(), 10.0);
    project.pool().add(clip);
    m_stills.emplace(host.context(), FrameStills::Capacity, std::chrono::milliseconds(0));
    m_stills->still(*clip, 1, 40);
    m_stills->still(*clip, 2, 40);
    ASSERT_TRUE(waitForOne());
    ASSERT_TRUE(waitForOne());
    EXPECT_EQ(m_stills->still(*clip, 1, 40).getWidth(), 160) << "It says why there is no picture.";
    EXPECT_EQ(pollForAWhile(), 0) << "It says the same again.";

    std::filesystem::create_symlink(
        standin::tests::videoOf(
            {.name = "frame_stills.mov", .frames = 240, .rate = "24", .options = "", .width = 320, .height = 192}),
        file);
    ASSERT_TRUE(waitForOne());
    for (const std::uint32_t frame : {1U, 2U}) {
        if (m_stills->still(*clip, frame, 40).isNull()) {
            EXPECT_TRUE(waitForOne());
        }
        EXPECT_EQ(m_stills->still(*clip, frame, 40).getWidth(), 67) << "It is 320 by 192, and 40 high.";
    }
    EXPECT_EQ(m_stills->keptCount(), 2U);
    EXPECT_EQ(pollForAWhile(), 0) << "A picture isn't asked for again.";
    m_stills.reset();
}
