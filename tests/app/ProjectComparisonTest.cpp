// SPDX-License-Identifier: GPL-3.0-or-later

// What the comparison of large projects costs by itself. For sixteen times as many clips it takes about twenty times as long;
// a step that is quadratic in clips would take 256 times as long.

#include "app/apply/ProjectComparison.h"

#include "core/cut/ProgrammeShift.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Track.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <ctime>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::app {
namespace {

using Velmark::Counted;

/// A stretch of the one take, and where it lies; in seconds.
struct Clip {
    double start;
    double offset;
    double length;
};
using Clips = std::vector<Clip>;

/// A project with one track, on which one take lies in many clips, and later in other places.
class Takes {
public:
    void lay(const Clips& clips)
    {
        for (const Counted<standin::ClipEvent>& event : m_events)
            event->remove();
        m_events.clear();
        for (const Clip& clip : clips) {
            const auto event = Velmark::makeCounted<standin::ClipEvent>();
            event->setClip(Counted<standin::MediaClip>::share(&m_take));
            event->setSourceOffset(clip.offset);
            event->setSpan(clip.start, clip.start + clip.length);
            event->insertInto(dynamic_cast<standin::Track&>(*m_track));
            m_events.push_back(event);
        }
    }
    const standin::Project& project() const { return m_host.project; }

private:
    standin::tests::TestHost m_host;
    standin::tests::TestHost::Node m_track = m_host.addTrack(Velmark::TypeWord::Audio, u"DIA");
    standin::MediaClip& m_take = m_host.addMedia(u"take.wav", 1000.0);
    std::vector<Counted<standin::ClipEvent>> m_events;
};

/// Of the processor, so that other programs don't count.
double secondsToCompare(const Clips& before, const Clips& after, const core::ProgrammeShift& shift)
{
    Takes takes;
    takes.lay(before);
    const ProjectState state = stateOf(takes.project());
    takes.lay(after);
    const std::clock_t begun = std::clock();
    const std::vector<TrackComparison> comparisons = compare(state, takes.project(), shift);
    const double seconds = static_cast<double>(std::clock() - begun) / CLOCKS_PER_SEC;
    // All was found again.
    EXPECT_EQ(comparisons.size(), 1U);
    EXPECT_TRUE(comparisons.front().added.empty());
    return seconds;
}

template <class Comparison>
void expectNotQuadratic(Comparison secondsFor)
{
    const double few = std::max(secondsFor(4000), secondsFor(4000));
    const double many = std::min(secondsFor(64000), secondsFor(64000));

    EXPECT_LT(many, 50.0 * few) << few;
}

//     before   |----------- long -----------|     many of these
//              |||||  short                       and many of these, in the first seconds
//     after        moved by 100, and of each long one four pieces, which begin after all short ones
TEST(ProjectComparison, ClipsThatBeginBetweenAPieceAndItsOriginAreNotWalkedOver)
{
    expectNotQuadratic([](int count) {
        Clips before;
        Clips after;
        for (int index = 0; index < count / 2; ++index) {
            const double step = 40.0 * index / count;
            before.push_back({step / 1000.0, step / 1000.0, 100.0});
            before.push_back({1.0 + step, 1.0 + step, 1e-3});
            for (int piece = 0; piece < 4; ++piece) {
                const double place = 50.0 + step + piece * 10.0 / count;
                after.push_back({100.0 + place, place, 1.0});
            }
            after.push_back({101.0 + step, 1.0 + step, 1e-3});
        }
        core::ProgrammeShift shift;
        shift.add(0.0, 1000.0, 100.0);
        return secondsToCompare(before, after, shift);
    });
}

//     before   clips from places of the take that are all out of sync with one another
//     after    much later than anybody says
TEST(ProjectComparison, ClipsThatAreInSyncWithNoOtherAreFoundWhereverTheyHaveGone)
{
    expectNotQuadratic([](int count) {
        Clips before;
        Clips after;
        for (int index = 0; index < count; ++index) {
            const double step = 100.0 * index / count;
            before.push_back({step, 200.0 - step, 100.0 / count});
            after.push_back({step + 500.0, 200.0 - step, 100.0 / count});
        }
        return secondsToCompare(before, after, core::ProgrammeShift());
    });
}

/// A clip of ten seconds, of which pieces stand there: from where in it, and how long.
Fate fateOf(const std::vector<std::pair<double, double>>& pieces)
{
    Fate fate;
    fate.before.start = 100.0;
    fate.before.end = 110.0;
    for (const auto& [from, length] : pieces) {
        Piece piece;
        piece.from = from;
        piece.now.start = 200.0;
        piece.now.end = 200.0 + length;
        fate.pieces.push_back(piece);
    }
    return fate;
}

/// "split 3-4".
std::vector<std::string> changesIn(const Fate& fate)
{
    constexpr std::array Words{"head", "tail", "split", "doubled", "fell out"};
    std::vector<std::string> words;
    for (const FateChange& change : changesOf(fate)) {
        std::ostringstream text;
        text << Words.at(static_cast<std::size_t>(change.kind)) << ' ' << change.from << '-' << change.to;
        words.push_back(text.str());
    }
    return words;
}

TEST(FateChanges, TellEachLossAndEachCut)
{
    using Words = std::vector<std::string>;

    EXPECT_EQ(changesIn(fateOf({{0, 10}})), Words());
    EXPECT_EQ(changesIn(fateOf({})), (Words{"fell out 0-10"}));
    EXPECT_EQ(changesIn(fateOf({{1, 7}})), (Words{"head 0-1", "tail 8-10"}));
    EXPECT_EQ(changesIn(fateOf({{0, 3}, {3, 7}})), (Words{"split 3-3"}));
    EXPECT_EQ(changesIn(fateOf({{4, 6}, {0, 3}})), (Words{"split 3-4"}));
    EXPECT_EQ(changesIn(fateOf({{0, 10}, {2, 3}})), (Words{"doubled 2-2"}));
    EXPECT_EQ(changesIn(fateOf({{0, 4}, {3, 3}, {8, 1}})), (Words{"doubled 3-3", "split 6-8", "tail 9-10"}));
    // Less than an instant is nothing.
    EXPECT_EQ(changesIn(fateOf({{1e-6, 4}, {4 + 1e-6, 6 - 2e-6}})), (Words{"split 4-4"}));
}

} // namespace
} // namespace cadrel::app
