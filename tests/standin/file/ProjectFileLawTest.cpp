// SPDX-License-Identifier: GPL-3.0-or-later

// What holds for every project and its file.

#include "standin/file/ProjectFile.h"

#include "standin/base/AttributeList.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Track.h"
#include "tests/standin/file/ProjectText.h"
#include "tests/support/standin/RandomProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <string>
#include <typeinfo>
#include <vector>

using Velmark::Counted;
using Velmark::makeCounted;

namespace standin::tests {

namespace {

bool areStoredAlike(const Node& a, const Node& b)
{
    Attributes stored = a.attributes();
    std::erase_if(stored, [](const auto& attribute) { return !attribute.second.isPersistent; });
    return a.start() == b.start() && a.end() == b.end() && a.name() == b.name() && a.selected() == b.selected() &&
           stored == b.attributes();
}

int numberOf(const MediaClip* clip)
{
    return clip ? clip->number() : 0;
}

bool areAlike(const Node& a, const Node& b);

bool areChildrenAlike(const Container& a, const Container& b)
{
    const Node* childA = a.firstChild();
    const Node* childB = b.firstChild();
    while (childA && childB && areAlike(*childA, *childB)) {
        childA = a.childBehind(*childA);
        childB = b.childBehind(*childB);
    }
    return !childA && !childB;
}

bool areTracksAlike(const Track& a, const Track& b)
{
    return a.kind() == b.kind() && a.isLocked() == b.isLocked() &&
           std::ranges::equal(a.curves(), b.curves(), [](const auto& curveA, const auto& curveB) {
               return curveA.first == curveB.first && areAlike(*curveA.second, *curveB.second);
           });
}

/// Whether two nodes are of one class and have the same in them, down to the last.
bool areAlike(const Node& a, const Node& b)
{
    if (typeid(a) != typeid(b) || !areStoredAlike(a, b))
        return false;
    if (const auto* const track = dynamic_cast<const Track*>(&a);
        track && !areTracksAlike(*track, dynamic_cast<const Track&>(b)))
        return false;
    if (const auto* const clipA = dynamic_cast<const ClipEvent*>(&a)) {
        const auto& clipB = dynamic_cast<const ClipEvent&>(b);
        return numberOf(clipA->clip()) == numberOf(clipB.clip()) && clipA->sourceOffset() == clipB.sourceOffset();
    }
    if (const auto* const marker = dynamic_cast<const Marker*>(&a))
        return marker->isRange() == dynamic_cast<const Marker&>(b).isRange();
    if (const auto* const point = dynamic_cast<const AutomationPoint*>(&a))
        return point->value() == dynamic_cast<const AutomationPoint&>(b).value();
    const auto* const container = dynamic_cast<const Container*>(&a);
    return !container || areChildrenAlike(*container, dynamic_cast<const Container&>(b));
}

bool areClocksAlike(const Project& a, const Project& b)
{
    return a.frameRate().framesPerSecond == b.frameRate().framesPerSecond &&
           a.frameRate().flags == b.frameRate().flags && a.timeOrigin() == b.timeOrigin() &&
           a.setEndTime() == b.setEndTime() && a.position().getValue() == b.position().getValue() &&
           a.locatorLeft().getValue() == b.locatorLeft().getValue() &&
           a.locatorRight().getValue() == b.locatorRight().getValue() &&
           a.cycleLeft().getValue() == b.cycleLeft().getValue() &&
           a.cycleRight().getValue() == b.cycleRight().getValue();
}

bool arePoolsAlike(const MediaPool& a, const MediaPool& b)
{
    return std::ranges::equal(a.clips(), b.clips(), [](const auto& clipA, const auto& clipB) {
        return clipA.first == clipB.first && areAlike(*clipA.second, *clipB.second) &&
               clipA.second->kind() == clipB.second->kind() && clipA.second->path() == clipB.second->path();
    });
}

RC_GTEST_PROP(ProjectFileLaw, ASavedProjectLoadsToTheSameBytes, ())
{
    ProjectTexts texts;
    CheckedChance chance;
    const std::string text = ProjectFile::toText(*randomProject(chance, texts.log()));

    RC_ASSERT(texts.textAgain(text) == text);
}

RC_GTEST_PROP(ProjectFileLaw, ASavedProjectLoadsToTheSameProject, ())
{
    ProjectTexts texts;
    CheckedChance chance;
    const auto project = randomProject(chance, texts.log());

    const auto again = texts.parse(ProjectFile::toText(*project));

    RC_ASSERT(areClocksAlike(*project, *again));
    RC_ASSERT(arePoolsAlike(project->pool(), again->pool()));
    RC_ASSERT(areAlike(*project, *again));
}

TEST(ProjectFileLaw, HoldsForLargeProjects)
{
    for (std::uint64_t seed = 0; seed < 5; ++seed) {
        ProjectTexts texts;
        SeededChance chance(seed);
        const ProjectScale scale{.clips = 50, .tracks = 12, .events = 50, .points = 50, .seconds = 3600.0};
        const auto project = randomProject(chance, texts.log(), scale);
        const std::string text = ProjectFile::toText(*project);

        const auto again = texts.parse(text);

        EXPECT_TRUE(ProjectFile::toText(*again) == text) << seed;
        EXPECT_TRUE(areAlike(*project, *again)) << seed;
    }
}

RC_GTEST_PROP(ProjectFileLaw, AnyTimeReadsBackExactly, ())
{
    ProjectTexts texts;
    const auto project = makeCounted<Project>(texts.log());
    const auto track = Track::create(Track::Kind::Audio);
    // Every double from 0 to the furthest time is as likely as its exponent.
    const double start =
        std::ldexp(*rc::gen::inRange<std::int64_t>(0, std::int64_t{1} << 53), *rc::gen::inRange(-90, -24));
    const double end =
        std::ldexp(*rc::gen::inRange<std::int64_t>(0, std::int64_t{1} << 53), *rc::gen::inRange(-90, -24));
    RC_PRE(start <= end);
    const auto event = makeCounted<ClipEvent>();
    event->setSpan(start, end);
    event->insertInto(*track);
    track->insertInto(*project);

    const auto again = texts.parse(ProjectFile::toText(*project));

    const auto& trackAgain = dynamic_cast<const Track&>(*again->firstChild());
    RC_ASSERT(trackAgain.firstChild()->start() == start);
    RC_ASSERT(trackAgain.firstChild()->end() == end);
}

RC_GTEST_PROP(ProjectFileLaw, AFileWithOneByteChangedIsReadOrRefused, ())
{
    ProjectTexts texts;
    CheckedChance chance;
    std::string text = ProjectFile::toText(*randomProject(chance, texts.log()));
    text[chance.below(text.size())] = static_cast<char>(chance.below(256));

    const std::string fault = texts.faultOf(text);

    if (fault == "none")
        RC_ASSERT(texts.textAgain(texts.textAgain(text)) == texts.textAgain(text));
    else
        RC_ASSERT(fault.starts_with("reel.stage: ") && fault.find('\n') == std::string::npos);
}

} // namespace

} // namespace standin::tests
