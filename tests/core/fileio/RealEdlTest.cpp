// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "core/time/Framerate.h"
#include "core/time/Timecode.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/EdlReading.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/core/TreeEdls.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <filesystem>
#include <iostream>
#include <map>
#include <set>
#include <stdexcept>
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
using util::Result;

/// What stands in a file, counted in its text.
struct Content {
    std::string_view file;
    std::int32_t cuts;
    std::int32_t dissolves;
    std::int32_t wipes;
    std::int32_t withoutVideo;         ///< with neither "V" nor "B" in the column of the channel
    std::int32_t withoutVideoAndAudio; ///< nor "A"
    std::int32_t reversed;             ///< with an end before its start
    ShownRate rate;                    ///< by the highest frame of all, and the FCM lines
};

constexpr ShownRate Unknown24{24, -1};
constexpr ShownRate Unknown25{25, -1};
constexpr ShownRate NonDrop24{24, 0};
constexpr ShownRate NonDrop25{25, 0};
constexpr ShownRate NonDrop60{60, 0};

constexpr std::array<Content, 31> Contents{{
    {"25fps.edl", 4, 0, 0, 0, 0, 0, NonDrop25},
    {"ISSUE_14_conform_edl_issue_01.edl", 3, 0, 0, 0, 0, 0, NonDrop24},
    {"ISSUE_14_conform_edl_issue_02.edl", 10, 0, 0, 0, 0, 0, NonDrop24},
    {"ISSUE_14_conform_edl_issue_03.edl", 42, 0, 0, 0, 0, 0, NonDrop24},
    {"ISSUE_19_unusual01.edl", 38, 0, 0, 0, 0, 0, Unknown24},
    {"TEST.edl", 120, 28, 0, 148, 0, 0, NonDrop24},
    // All is audio, or "NONE". One timecode ends in frame 42, at 24 frames; the black of 126 events ends at 00:00:00:00.
    {"adobe_dai109_test.txt", 2839, 0, 888, 3727, 1295, 126, NonDrop60},
    {"avid_example.edl", 2, 0, 0, 0, 0, 0, Unknown24},
    {"cdl.edl", 2, 0, 0, 0, 0, 0, Unknown24},
    {"cdl_example01.edl", 39, 0, 0, 0, 0, 0, NonDrop24},
    {"cdl_frmc_example01.edl", 1, 0, 0, 0, 0, 0, NonDrop24},
    {"cdl_frmc_example02.edl", 25, 0, 0, 0, 0, 0, NonDrop24},
    {"dissolve_test.edl", 3, 1, 0, 0, 0, 0, NonDrop24},
    {"dissolve_test_2.edl", 3, 1, 0, 0, 0, 0, NonDrop24},
    {"dissolve_test_3.edl", 3, 1, 0, 0, 0, 0, NonDrop24},
    {"dissolve_test_4.edl", 6, 2, 0, 0, 0, 0, NonDrop24},
    {"dissolve_test_fail.edl", 3, 1, 0, 0, 0, 0, NonDrop24},
    {"gap_test.edl", 3, 0, 0, 0, 0, 0, NonDrop24},
    {"multi_audio.edl", 1, 0, 0, 1, 0, 0, NonDrop24},
    {"no_spaces_test.edl", 9, 0, 0, 0, 0, 0, NonDrop24},
    {"nucoda_example.edl", 2, 0, 0, 0, 0, 0, Unknown24},
    {"premiere_example.edl", 2, 0, 0, 0, 0, 0, Unknown24},
    {"screening_example.edl", 9, 0, 0, 0, 0, 0, NonDrop24},
    {"speed_effects.edl", 548, 0, 0, 0, 0, 0, Unknown24},
    {"speed_effects_small.edl", 5, 0, 0, 0, 0, 0, Unknown24},
    {"test_24psf.edl", 10, 0, 1, 4, 0, 0, Unknown25},
    {"test_25.edl", 11, 1, 1, 5, 0, 0, Unknown25},
    {"test_edl_cdl.edl", 3, 0, 0, 0, 0, 0, NonDrop24},
    {"timecode_mismatch.edl", 20, 0, 0, 0, 0, 0, NonDrop25},
    {"transition_duration.edl", 4, 1, 0, 0, 0, 0, NonDrop24},
    {"wipe_test.edl", 3, 0, 1, 0, 0, 0, NonDrop24},
}};

const fs::path Folder = treePath("tests/data/edl");

std::int32_t countOf(const EventList& events, TransitionType::Type type)
{
    return static_cast<std::int32_t>(
        std::count_if(events.events().begin(), events.events().end(),
                      [type](const auto& event) { return event->transitionType() == type; }));
}

using FlawCounts = std::map<std::int32_t, std::int32_t>;

/// How many events have each flaw.
FlawCounts flawCountsOf(const EventList& events)
{
    FlawCounts counts;
    for (const auto& event : events.events()) {
        for (const std::int32_t flaw : flawsOf(*event))
            ++counts[flaw];
    }
    return counts;
}

/// Of the flaws that a file of readable fields can have.
FlawCounts flawCounts(std::int32_t withoutVideo, std::int32_t reversed)
{
    FlawCounts counts;
    if (withoutVideo > 0)
        counts[EventFlaw::NotVideoEvent] = withoutVideo;
    if (reversed > 0)
        counts[EventFlaw::TimecodeRangeInvalid] = reversed;
    return counts;
}

TEST(RealEdl, EveryFileOfTheFolderIsKnown)
{
    std::set<std::string_view> known{"README.md", "LICENSE-Apache-2.0.txt", "LICENSE-MIT.txt"};
    for (const Content& content : Contents)
        known.insert(content.file);

    for (const auto& entry : fs::directory_iterator(Folder))
        EXPECT_TRUE(known.contains(entry.path().filename().string())) << entry.path();
}

TEST(RealEdl, EachFileGivesTheEventsThatStandInIt)
{
    for (const Content& content : Contents) {
        SCOPED_TRACE(content.file);
        const TestProject project(Framerate(content.rate.framesPerSecond, 0));
        const std::wstring path = widePath(Folder / content.file);
        Framerate framerate;
        EventList video;
        EventList videoAndAudio;

        ASSERT_EQ(CmxParser().parse(path, video, framerate, false), Result::Ok);
        ASSERT_EQ(CmxParser().parse(path, videoAndAudio, framerate, true), Result::Ok);

        EXPECT_EQ(shown(framerate), content.rate);
        EXPECT_EQ(countOf(video, TransitionType::Cut), content.cuts);
        EXPECT_EQ(countOf(video, TransitionType::Dissolve), content.dissolves);
        EXPECT_EQ(countOf(video, TransitionType::Wipe), content.wipes);
        EXPECT_EQ(flawCountsOf(video), flawCounts(content.withoutVideo, content.reversed));
        EXPECT_EQ(flawCountsOf(videoAndAudio), flawCounts(content.withoutVideoAndAudio, content.reversed));
    }
}

TEST(RealEdl, EachFileShowsItsRateWithoutAProject)
{
    const NoProject none;
    const PlainConverter converter;
    util::StringUtil::setConverter(&converter);
    for (const Content& content : Contents) {
        Framerate framerate;
        EXPECT_EQ(CmxParser().detect(widePath(Folder / content.file), framerate), Result::Ok) << content.file;
        EXPECT_EQ(shown(framerate), content.rate) << content.file;
    }
    util::StringUtil::setConverter(nullptr);
}

TEST(RealEdl, EveryFileWithPictureIsAnEdlOfTheTree)
{
    std::vector<std::string> paths{"examples/reel3/reel3_v07.edl", "examples/reel3/reel3_v12.edl",
                                   "examples/tworeels/new.edl", "examples/tworeels/old.edl"};
    for (const Content& content : Contents) {
        if (content.file.ends_with(".edl"))
            paths.push_back("tests/data/edl/" + std::string(content.file));
    }

    EXPECT_EQ(treeEdls(), paths);
}

TEST(RealEdl, AnEdlOfTheTreeIsReadUnderTheRateThatItShows)
{
    for (const Content& content : Contents) {
        SCOPED_TRACE(content.file);
        const TreeEdl edl("tests/data/edl/" + std::string(content.file));

        EXPECT_EQ(Timecode::framerate().framesPerSecond, content.rate.framesPerSecond);
        EXPECT_EQ(Timecode::framerate().dropFrame, 0);
        EXPECT_EQ(edl.framerate().framesPerSecond, content.rate.framesPerSecond);
        EXPECT_EQ(countOf(edl.events(), TransitionType::Cut), content.cuts);
        EXPECT_EQ(flawCountsOf(edl.events()), flawCounts(content.withoutVideo, content.reversed));
    }
}

TEST(RealEdl, AnEdlThatIsNotInTheTreeCannotBeRead)
{
    EXPECT_THROW(TreeEdl("tests/data/edl/none.edl"), std::runtime_error);
    EXPECT_EQ(Timecode::framerate().framesPerSecond, 25) << "The project from before is open again.";
}

} // namespace
} // namespace cadrel::tests
