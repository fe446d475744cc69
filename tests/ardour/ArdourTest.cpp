// SPDX-License-Identifier: GPL-3.0-or-later

// Ardour itself opens what `cadrel apply` has made of its sessions, and is asked what stands where and how it sounds.

#include "tests/ardour/ArdourProgram.h"
#include "tests/ardour/ConformedSession.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <set>

namespace cadrel::tests {

namespace {

constexpr const char* New = "conformed";

/// Moves, trims, a new shot and a doubled one.
const Recut Film{250, {{100, 40}, {0, 37}, {-1, 25}, {37, 60}, {150, 100}, {20, 15}}};

class InArdour : public testing::Test {
protected:
    void SetUp() override
    {
        if (!ArdourProgram::isInstalled())
            FAIL() << "the package ardour is missing; cmake/install-packages.sh tests installs it";
    }
};

/// The region and its sample that each region of a track plays at a sample of the programme.
std::vector<std::pair<std::string, std::int64_t>> playedAt(const ArdourDump& dump, const std::string& track,
                                                           std::int64_t sample)
{
    std::vector<std::pair<std::string, std::int64_t>> played;
    for (const ArdourDump::Region& region : dump.regions) {
        if (region.track == track && region.position <= sample && sample < region.position + region.length)
            played.emplace_back(region.name, region.start + sample - region.position);
    }
    std::ranges::sort(played);
    return played;
}

/// The samples at which something may begin or end in a programme, and those beside them.
std::set<std::int64_t> samplesToTry(const ArdourDump& dump, const Recut& recut)
{
    std::set<std::int64_t> samples;
    const auto add = [&](std::int64_t sample) {
        for (const std::int64_t beside : {-1, 0, 1, 500})
            samples.insert(std::max<std::int64_t>(sample + beside, 0));
    };
    for (const ArdourDump::Region& region : dump.regions) {
        add(region.position);
        add(region.position + region.length);
    }
    for (const std::int64_t edge : recut.edges())
        add(edge);
    std::erase_if(samples, [&](std::int64_t sample) { return sample >= recut.edges().back(); });
    return samples;
}

/// Before the conform the pan's list counts in beats, and Ardour rounds a sample to one of 1,920 ticks of a quarter.
constexpr double OfATick = 5e-5;

TEST_F(InArdour, EachRegionAndEachValueStandsWhereItsPictureWent)
{
    const ConformedSession session("law", Film, 8, 25,
                                   "gain:0:1 gain:100000:0.25 gain:200000:1 gain:300000:0.7 gain:400000:0 "
                                   "pan:50000:0.1 pan:250000:0.9 mute:0:0 mute:150000:1 mute:190000:0");
    session.conform(New);

    std::vector<std::int64_t> newSamples;
    std::vector<std::int64_t> oldSamples;
    for (std::int64_t sample = 7; sample < Film.edges().back(); sample += 2977) {
        if (Film.sourceOf(sample) >= 0) {
            newSamples.push_back(sample);
            oldSamples.push_back(Film.sourceOf(sample));
        }
    }
    for (const std::int64_t edge : Film.edges()) {
        for (const std::int64_t sample : {edge - 1, edge}) {
            if (sample >= 0 && Film.sourceOf(sample) >= 0) {
                newSamples.push_back(sample);
                oldSamples.push_back(Film.sourceOf(sample));
            }
        }
    }
    const ArdourDump before = ArdourProgram::dump(session.folder(), ConformedSession::Name, oldSamples);
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, newSamples);

    EXPECT_EQ(after.complaints, before.complaints);
    ASSERT_EQ(before.regions.size(), 200U);
    std::set<std::string> tracks;
    for (const ArdourDump::Region& region : before.regions)
        tracks.insert(region.track);
    ASSERT_EQ(tracks.size(), 8U);
    for (const std::string& track : tracks) {
        for (const std::int64_t sample : samplesToTry(after, Film)) {
            const std::int64_t source = Film.sourceOf(sample);
            const auto expected = source < 0 ? playedAt(after, "", 0) : playedAt(before, track, source);
            ASSERT_EQ(playedAt(after, track, sample), expected) << track << " at " << sample;
        }
        for (std::size_t index = 0; index < newSamples.size(); ++index) {
            for (const std::string what : {"gain", "pan", "mute"}) {
                ASSERT_NEAR(after.values.at({track, what, newSamples[index]}),
                            before.values.at({track, what, oldSamples[index]}), what == "pan" ? OfATick : 1e-5)
                    << track << " " << what << " at " << newSamples[index] << " from " << oldSamples[index];
            }
        }
    }
}

TEST_F(InArdour, MarksMoveAndTheSessionEndsWithTheProgramme)
{
    const ConformedSession session("marks", Film, 1, 20, "gain:0:1");
    session.conform(New);
    const ArdourDump before = ArdourProgram::dump(session.folder(), ConformedSession::Name, {});
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, {});
    std::multiset<std::pair<std::string, std::int64_t>> expected;
    std::int64_t begin = 0;
    for (const Recut::Shot& shot : Film.shots) {
        for (const auto& [name, start, end] : before.locations) {
            const std::int64_t from = shot.from * Recut::SamplesAFrame;
            if (name.starts_with("mark") && shot.from >= 0 && start >= from &&
                start < from + shot.length * Recut::SamplesAFrame)
                expected.emplace(name, begin + start - from);
        }
        begin += shot.length * Recut::SamplesAFrame;
    }
    std::multiset<std::pair<std::string, std::int64_t>> found;
    for (const auto& [name, start, end] : after.locations) {
        if (name.starts_with("mark"))
            found.emplace(name, start);
    }
    EXPECT_EQ(found, expected);
    EXPECT_FALSE(found.empty());
}

TEST_F(InArdour, TheNewMixIsTheOldOneAtItsSourcePlace)
{
    const ConformedSession session("mix", Film, 4, 6, "pan:0:0.5");
    session.conform(New);
    const std::vector<float> before = ArdourProgram::mix(session.folder(), ConformedSession::Name);
    const std::vector<float> after = ArdourProgram::mix(session.folder(), New);
    const std::vector<std::int64_t> edges = Film.edges();
    constexpr std::int64_t Beside = 48000 * 30 / 1000;
    std::int64_t compared = 0;
    double loudest = 0.0;
    for (std::int64_t sample = 0; sample < std::ssize(after) && sample < edges.back(); ++sample) {
        const bool isNearEdge =
            std::ranges::any_of(edges, [&](std::int64_t edge) { return std::abs(sample - edge) < Beside; });
        const std::int64_t source = Film.sourceOf(sample);
        if (isNearEdge || source >= std::ssize(before))
            continue;
        const float expected = source < 0 ? 0.0F : before[static_cast<std::size_t>(source)];
        ASSERT_NEAR(after[static_cast<std::size_t>(sample)], expected, 1e-6) << sample << " from " << source;
        loudest = std::max<double>(loudest, std::abs(expected));
        ++compared;
    }
    EXPECT_GT(compared, edges.back() / 2);
    EXPECT_GT(loudest, 0.01);
}

} // namespace

} // namespace cadrel::tests
