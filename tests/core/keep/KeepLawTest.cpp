// SPDX-License-Identifier: GPL-3.0-or-later

// Laws of a plan, on random films and on every EDL of the tree.

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/fileio/CmxParser.h"
#include "core/keep/ChangeStretch.h"
#include "core/keep/KeepPlanner.h"
#include "core/settings/Settings.h"
#include "tests/core/keep/FrameModel.h"
#include "tests/core/keep/KeepFilm.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <filesystem>
#include <optional>
#include <set>
#include <string>
#include <utility>

namespace cadrel::tests {
namespace {

namespace fs = std::filesystem;

using core::CarriedFrom;
using core::CarriedStretch;
using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::FrameRange;
using core::Framerate;
using core::KeepContext;
using core::KeepPlan;
using core::KeepPlanner;
using core::KeptEvent;
using core::SecondsRange;

/// A number from `low` up to the one before `high`.
int number(int low, int high)
{
    return *rc::gen::inRange(low, high);
}

/// Adds one event of any kind, or black. Speeds are odd ninths, so that no two pictures differ by just half a step.
void addAnything(Film& film)
{
    const std::string roll(1, static_cast<char>('A' + number(0, 4)));
    const int src = 20 + number(0, 15);
    const int length = number(1, 12);
    switch (number(0, 10)) {
    case 0:
        film.black(length);
        return;
    case 1:
        film.black(number(50, 75));
        return;
    case 2:
        film.freeze(roll, src, length);
        return;
    case 3:
        film.retimed(roll, src, 2 * number(0, 4) + 1, 9);
        return;
    case 4:
        film.retimed(roll, src, -length, length);
        return;
    case 5: {
        const int end = film.cursor();
        film.at(std::max(5, end - number(1, 12))).shot(roll, src, length);
        film.at(std::max(end, film.cursor()));
        return;
    }
    case 6:
        film.shot(roll, src, length).flawed();
        return;
    default:
        film.shot(roll, src, length);
    }
}

/// Shots that stand in both films come from one list, so that they have much in common.
std::pair<Film, Film> twoFilms()
{
    Film oldFilm;
    Film newFilm;
    oldFilm.at(number(15, 30));
    newFilm.at(number(15, 30));
    const int steps = number(1, 12);
    for (int step = 0; step < steps; ++step) {
        switch (number(0, 6)) {
        case 0:
            addAnything(oldFilm);
            break;
        case 1:
            addAnything(newFilm);
            break;
        default: {
            Film part = Film().at(20);
            addAnything(part);
            oldFilm.append(part, 20);
            newFilm.append(part, 20);
        }
        }
    }
    return {oldFilm, newFilm};
}

std::vector<SecondsRange> anyMaterial()
{
    std::vector<SecondsRange> material;
    const int count = number(0, 6);
    for (int index = 0; index < count; ++index) {
        const int start = number(0, 400);
        const int longest = number(0, 4) == 0 ? 400 : 30;
        material.push_back({static_cast<double>(start), static_cast<double>(start + number(0, longest))});
    }
    return material;
}

std::vector<CarriedStretch> partsOf(const KeepPlan& plan)
{
    std::vector<CarriedStretch> parts;
    for (const auto* events : {&plan.untouched, &plan.events}) {
        for (const KeptEvent& event : *events)
            parts.insert(parts.end(), event.parts.begin(), event.parts.end());
    }
    return parts;
}

std::int32_t carriedLength(const KeepPlan& plan)
{
    std::int32_t length = 0;
    for (const CarriedStretch& part : partsOf(plan))
        length += part.destination.length();
    return length;
}

KeepPlan planOf(const EventList& oldEvents, const EventList& newEvents, const EventList& changes,
                const std::vector<SecondsRange>& material, const Framerate& framerate, std::int32_t matchBy = 0)
{
    KeepContext context;
    context.framerate = framerate;
    context.matchBy = matchBy;
    context.material = material;
    return KeepPlanner(context).plan(oldEvents, newEvents, changes);
}

/// What of a plan stands at each frame of the new programme.
class CarriedFrames {
public:
    explicit CarriedFrames(const KeepPlan& plan) : m_frames(FrameModel::Length, nullptr), m_parts(partsOf(plan))
    {
        for (const CarriedStretch& part : m_parts) {
            for (std::int32_t frame = part.destination.start; frame < part.destination.end; ++frame) {
                m_isUnique = m_isUnique && at(frame) == nullptr;
                m_frames.at(static_cast<std::size_t>(frame)) = &part;
            }
        }
    }

    bool isUnique() const { return m_isUnique; }
    const CarriedStretch* at(std::int32_t frame) const { return m_frames.at(static_cast<std::size_t>(frame)); }
    bool isInPlace(std::int32_t frame) const { return at(frame) != nullptr && at(frame)->shift == 0; }
    const std::vector<CarriedStretch>& parts() const { return m_parts; }

    /// The nearest picture that is carried, from a frame in steps of `step` within a reel; null for none.
    const CarriedStretch* nearestPicture(std::int32_t frame, std::int32_t step, const FrameRange& reel) const
    {
        for (; reel.contains(frame); frame += step) {
            if (at(frame) != nullptr && at(frame)->from != CarriedFrom::Black)
                return at(frame);
        }
        return nullptr;
    }

private:
    std::vector<const CarriedStretch*> m_frames;
    std::vector<CarriedStretch> m_parts;
    bool m_isUnique = true;
};

bool holdsFrame(const std::vector<FrameRange>& ranges, std::int32_t frame)
{
    return std::any_of(ranges.begin(), ranges.end(),
                       [frame](const FrameRange& range) { return range.contains(frame); });
}

bool holdsMaterial(const std::vector<SecondsRange>& material, std::int32_t frame)
{
    return std::any_of(material.begin(), material.end(), [frame](const SecondsRange& range) {
        return range.start <= frame && frame < std::max(range.end, range.start + 1);
    });
}

/// A film of which each shot shows something that no other shows, with short black between.
Film filmOfStrangers(int shots, const std::string& rolls = "R")
{
    Film film;
    film.at(number(5, 30));
    for (int shot = 0; shot < shots; ++shot) {
        const std::string roll = rolls + std::to_string(shot);
        const int kind = number(0, 6);
        if (kind == 0)
            film.freeze(roll, 30, number(1, 20));
        else if (kind == 1)
            film.retimed(roll, 30, 2 * number(0, 4) + 1, 9);
        else
            film.shot(roll, 30, number(4, 20));
        if (number(0, 4) == 0)
            film.black(number(1, 12));
    }
    return film;
}

struct OneChange {
    Film changed;
    std::int32_t oldPlace; ///< the first old frame after the change
    std::int32_t newPlace;
};

/// Lifts, trims or inserts at one place that isn't the end.
OneChange changeOnce(const Film& film, int shots)
{
    const auto index = static_cast<std::size_t>(number(0, shots - 1));
    switch (number(0, 4)) {
    case 0: {
        // A film that begins later moves what leads into it.
        const std::size_t lifted = std::max<std::size_t>(index, 1);
        const auto [start, end] = film.framesOf(lifted);
        return {film.withoutShot(lifted), end, start};
    }
    case 1: {
        const int length = number(1, 20);
        const std::int32_t start = film.framesOf(index).start;
        return {film.withInsertBefore(index, "X", length), start, start + length};
    }
    default: {
        const auto [start, end] = film.framesOf(index);
        const int trim = film.isPlain(index) ? number(1, end - start) : 0;
        if (number(0, 2) == 0)
            return {film.trimmedAtHead(index, trim), start + trim, start};
        return {film.trimmedAtTail(index, trim), end, end - trim};
    }
    }
}

/// Every EDL of the tree.
std::vector<fs::path> edlFiles()
{
    std::vector<fs::path> files;
    for (const char* folder : {"tests/data/edl", "examples/reel3"}) {
        for (const auto& entry : fs::directory_iterator(treePath(folder))) {
            const std::string name = entry.path().filename().string();
            if (name.ends_with(".edl") || name.ends_with("_test.txt"))
                files.push_back(entry.path());
        }
    }
    std::sort(files.begin(), files.end());
    return files;
}

Framerate rateOf(const fs::path& file)
{
    Framerate shown;
    core::fileio::CmxParser().detect(widePath(file), shown);
    return {shown.framesPerSecond == 0 ? 24 : shown.framesPerSecond, shown.dropFrame == 1 ? 1 : 0};
}

EventList listOf(const fs::path& file, bool acceptAudio)
{
    EventList events;
    Framerate shown;
    events.load(widePath(file), false, shown, true, acceptAudio);
    return events;
}

bool stands(const EventBase& event, const Framerate& framerate)
{
    return event.dstIn().isValid(framerate) && event.dstOut().isValid(framerate) && !(event.dstIn() > event.dstOut());
}

FrameRange destinationOf(const EventBase& event, const Framerate& framerate)
{
    return {event.dstIn().toFrameCount(framerate), event.dstOut().toFrameCount(framerate)};
}

/// Where an event begins right behind another and none stands across.
std::vector<std::int32_t> cutsOf(const EventList& events, const Framerate& framerate)
{
    std::set<std::int32_t> ends;
    std::set<std::int32_t> starts;
    std::vector<FrameRange> all;
    for (const auto& event : events.events()) {
        if (!stands(*event, framerate) || event->hasFlaw(EventFlaw::NotVideoEvent))
            continue;
        all.push_back(destinationOf(*event, framerate));
        if (all.back().isEmpty())
            continue;
        starts.insert(all.back().start);
        ends.insert(all.back().end);
    }
    std::vector<std::int32_t> cuts;
    for (const std::int32_t start : starts) {
        const bool isCut =
            ends.contains(start) && std::none_of(all.begin(), all.end(), [start](const FrameRange& range) {
                return range.start < start && start < range.end;
            });
        if (isCut)
            cuts.push_back(start);
    }
    return cuts;
}

EventList withBlackAt(const EventList& events, std::int32_t place, std::int32_t length, const Framerate& framerate)
{
    EventList changed;
    changed.copyFrom(events);
    for (const auto& event : changed.events()) {
        if (!stands(*event, framerate))
            continue;
        const FrameRange frames = destinationOf(*event, framerate);
        if (frames.start >= place)
            event->setDst(core::Timecode(frames.start + length), core::Timecode(frames.end + length));
    }
    return changed;
}

} // namespace

RC_GTEST_PROP(KeepLaw, AnyCutOntoItselfNeedsNoRun, ())
{
    const TestProject project(FrameASecond);
    const Film film = twoFilms().first;
    const EventList events = film.list();
    const EventList changes = generatedChanges(events, events, 0, number(0, 4), FrameASecond);

    const KeepPlan plan = planOf(events, events, changes, anyMaterial(), FrameASecond);

    RC_ASSERT(!plan.needsRun());
    RC_ASSERT(plan.events.empty());
    RC_ASSERT(plan.lost.empty());
}

RC_GTEST_PROP(KeepLaw, NoFrameIsGivenAwayTwiceAndBlackNeitherTakenNorGivenTwice, ())
{
    const TestProject project(FrameASecond);
    const auto [oldFilm, newFilm] = twoFilms();
    const std::vector<SecondsRange> material = anyMaterial();
    const FrameModel model(oldFilm.list(), newFilm.list());

    const KeepPlan plan = planFor(oldFilm, newFilm, material);

    const CarriedFrames carried(plan);
    RC_ASSERT(carried.isUnique());
    std::set<std::int32_t> blackSources;
    for (const CarriedStretch& part : carried.parts()) {
        RC_ASSERT(!part.destination.isEmpty());
        for (std::int32_t frame = part.destination.start; frame < part.destination.end; ++frame) {
            const std::int32_t source = frame - part.shift;
            const bool isBlack = part.from == CarriedFrom::Black;
            RC_ASSERT(model.isOldBlack(source) == isBlack);
            RC_ASSERT(model.isNewBlack(frame) == isBlack);
            RC_ASSERT(!isBlack || blackSources.insert(source).second);
        }
    }
    for (std::int32_t frame = 0; frame < FrameModel::Length; ++frame) {
        const bool isInBlack = holdsMaterial(material, frame) && model.isOldBlack(frame);
        RC_ASSERT(holdsFrame(plan.lost, frame) == (isInBlack && !blackSources.contains(frame)));
    }
}

namespace {

/// How long the stretch around a frame is on which something holds.
template <typename Condition>
std::int32_t lengthAround(std::int32_t frame, const Condition& holds)
{
    std::int32_t length = 0;
    for (std::int32_t at = frame; at >= 0 && holds(at); --at)
        ++length;
    for (std::int32_t at = frame + 1; at < FrameModel::Length && holds(at); ++at)
        ++length;
    return length;
}

/// Whether a frame has gone along with a stretch of the change EDL that is longer than what is the same in place around it.
bool goesAlongWithALongerStretch(std::int32_t frame, const CarriedFrames& carried, const FrameModel& model,
                                 const EventList& changes)
{
    const CarriedStretch* const now = carried.at(frame);
    if (now == nullptr || !model.isEqual(frame, now->shift))
        return false;
    const std::vector<core::ChangeStretch> stretches = core::unhealedStretches(changes, FrameASecond);
    const auto isInStretch = [&](std::int32_t other) {
        return std::any_of(stretches.begin(), stretches.end(), [&](const core::ChangeStretch& stretch) {
            return stretch.shift == now->shift && stretch.destination.contains(other);
        });
    };
    return lengthAround(frame, isInStretch) >
           lengthAround(frame, [&model](std::int32_t other) { return model.isEqual(other, 0); });
}

} // namespace

RC_GTEST_PROP(KeepLaw, EqualPictureStaysAndGoesOnAsThePictureBesideIt, ())
{
    const TestProject project(FrameASecond);
    const auto [oldFilm, newFilm] = twoFilms();
    const FrameModel model(oldFilm.list(), newFilm.list());

    const EventList changes =
        generatedChanges(oldFilm.list(), newFilm.list(), core::MatchBy::RollName, core::HealMode::Normal, FrameASecond);

    const KeepPlan plan = planFor(oldFilm, newFilm, anyMaterial());

    const CarriedFrames carried(plan);
    for (const FrameRange& reel : model.newReels()) {
        for (std::int32_t frame = reel.start; frame < reel.end; ++frame) {
            if (model.isEqual(frame, 0))
                RC_ASSERT(carried.isInPlace(frame) || model.goesAlongWithAnEnd(frame) ||
                          goesAlongWithALongerStretch(frame, carried, model, changes));
            if (model.isNewBlack(frame) || carried.at(frame) != nullptr)
                continue;
            for (const std::int32_t step : {-1, 1}) {
                const CarriedStretch* const beside = carried.nearestPicture(frame, step, reel);
                const bool isLeftOut = beside != nullptr && model.isEqual(frame, beside->shift);
                RC_ASSERT(!isLeftOut);
            }
        }
    }
}

RC_GTEST_PROP(KeepLaw, OutsideOfTheHullNothingChanges, ())
{
    const TestProject project(FrameASecond);
    const auto [oldFilm, newFilm] = twoFilms();
    const std::vector<SecondsRange> material = anyMaterial();
    const FrameModel model(oldFilm.list(), newFilm.list());

    const KeepPlan plan = planFor(oldFilm, newFilm, material);

    const CarriedFrames carried(plan);
    for (std::int32_t frame = 0; frame < FrameModel::Length; ++frame) {
        if (plan.hull && plan.hull->contains(frame))
            continue;
        const bool isConcerned = !model.isOldBlack(frame) || !model.isNewBlack(frame) || holdsMaterial(material, frame);
        RC_ASSERT(!isConcerned || carried.isInPlace(frame));
        RC_ASSERT(carried.at(frame) == nullptr || carried.isInPlace(frame));
    }
    for (const KeptEvent& event : plan.events) {
        RC_ASSERT(plan.hull->start <= event.destination.start);
        RC_ASSERT(event.destination.end <= plan.hull->end);
    }
}

RC_GTEST_PROP(KeepLaw, AfterOneChangeAllMovesByOneShiftAndNothingBefore, ())
{
    const TestProject project(FrameASecond);
    const int shots = number(3, 8);
    const Film film = filmOfStrangers(shots);
    const OneChange change = changeOnce(film, shots);
    const int tail = number(0, 10);
    const std::int32_t oldEnd = film.framesOf(static_cast<std::size_t>(shots - 1)).end + tail;
    const std::int32_t shift = change.newPlace - change.oldPlace;
    std::vector<SecondsRange> material{{0.0, static_cast<double>(oldEnd)}};

    const KeepPlan plan = planFor(film, change.changed, material);

    RC_ASSERT(plan.questions.empty() && !plan.refusal);
    if (shift == 0) {
        RC_ASSERT(!plan.needsRun());
        return;
    }
    RC_ASSERT(plan.needsRun());
    RC_ASSERT(plan.hull->start >= std::min(change.oldPlace, change.newPlace));
    const FrameRange rest{change.newPlace, oldEnd + shift};
    if (rest.isEmpty()) {
        RC_ASSERT(plan.events.empty());
        return;
    }
    RC_ASSERT(plan.events.size() == 1U);
    RC_ASSERT(plan.events.front().shift == shift);
    RC_ASSERT(plan.events.front().destination == rest);
}

namespace {

/// Two reels, the second at a time of its own, of which one changes at one place.
struct TwoReels {
    TwoReels()
    {
        const int shots = number(3, 8);
        const Film first = filmOfStrangers(shots);
        const Film second = filmOfStrangers(shots, "S");
        const bool isFirst = number(0, 2) == 0;
        const Film changed = changeOnce(isFirst ? first : second, shots).changed;
        const auto put = [this, &second](const Film& reel1, const Film& reel2) {
            return Film(reel1).at(secondStart).append(reel2, second.framesOf(0).start);
        };
        before = put(first, second);
        after = isFirst ? put(changed, second) : put(first, changed);
    }

    std::int32_t secondStart = number(900, 1000);
    Film before;
    Film after;
};

/// Where the black at a frame of the old programme goes.
std::optional<std::int32_t> shiftOfBlack(std::int32_t frame, const CarriedFrames& carried)
{
    for (const CarriedStretch& part : carried.parts()) {
        if (part.from == CarriedFrom::Black && part.source().contains(frame))
            return part.shift;
    }
    return std::nullopt;
}

} // namespace

RC_GTEST_PROP(KeepLaw, TailsAndPopsGoWithTheirReelsWhateverClipsSpanThem, ())
{
    const TestProject project(FrameASecond);
    const TwoReels films;
    const FrameModel model(films.before.list(), films.after.list());
    const std::vector<FrameRange> was = model.oldReels();
    const std::vector<FrameRange> is = model.newReels();
    RC_ASSERT(was.size() == 2U);
    RC_ASSERT(is.size() == 2U);
    const std::int32_t tail = was[0].end + number(0, 55);
    const std::int32_t pop = was[1].start - number(1, 55);
    const std::int32_t secondTail = was[1].end + number(0, 55);
    std::vector<SecondsRange> material;
    for (const std::int32_t frame : {tail, pop, secondTail})
        material.push_back({static_cast<double>(frame), frame + 1.0});
    bool isFilled = false;
    const int clips = number(1, 4);
    for (int clip = 0; clip < clips; ++clip) {
        const std::int32_t start = number(0, was[0].end + 60);
        const std::int32_t end = number(was[1].start - 59, 1900);
        isFilled = isFilled || (start <= was[0].end && end >= was[1].start);
        material.insert(material.begin() + number(0, 3), {static_cast<double>(start), static_cast<double>(end)});
    }

    const KeepPlan plan = planFor(films.before, films.after, material);

    const CarriedFrames carried(plan);
    const std::int32_t growth = is[0].end - was[0].end;
    RC_ASSERT(shiftOfBlack(tail, carried) == growth);
    RC_ASSERT(shiftOfBlack(pop, carried) == 0);
    RC_ASSERT(shiftOfBlack(secondTail, carried) == is[1].end - was[1].end);
    const std::int32_t lost = lengthOf(core::within({was[0].end, was[1].start}, plan.lost));
    RC_ASSERT(lost <= std::max(growth, 0));
    RC_ASSERT(!isFilled || lost == std::max(growth, 0));
}

TEST(KeepLaw, EveryEdlOfTheTreeOntoItselfNeedsNoRun)
{
    std::size_t pictures = 0;
    for (const fs::path& file : edlFiles()) {
        const Framerate framerate = rateOf(file);
        const TestProject project(framerate);
        for (const bool acceptAudio : {false, true}) {
            const EventList events = listOf(file, acceptAudio);
            for (const std::int32_t matchBy : {0, 1}) {
                const EventList changes = generatedChanges(events, events, matchBy, core::HealMode::Normal, framerate);

                const KeepPlan plan =
                    planOf(events, events, changes, {{10, 20}, {3000, 4000}, {86300, 90000}}, framerate, matchBy);

                EXPECT_FALSE(plan.needsRun()) << file << " " << acceptAudio << " " << matchBy << " " << hullOf(plan);
                EXPECT_TRUE(plan.questions.empty() && !plan.refusal) << file;
                pictures += plan.untouched.size();
            }
        }
    }
    EXPECT_GT(pictures, 100U);
}

TEST(KeepLaw, BlackThatIsPutIntoAnyEdlOfTheTreeMovesAllAfterItAndNothingBefore)
{
    constexpr std::int32_t Length = 37;
    std::size_t checked = 0;
    for (const fs::path& file : edlFiles()) {
        const Framerate framerate = rateOf(file);
        const TestProject project(framerate);
        const EventList events = listOf(file, false);
        const std::vector<std::int32_t> cuts = cutsOf(events, framerate);
        if (cuts.empty())
            continue;
        const std::int32_t place = cuts[cuts.size() / 2];
        const EventList changed = withBlackAt(events, place, Length, framerate);
        const EventList changes = generatedChanges(events, changed, 0, core::HealMode::Normal, framerate);

        const KeepPlan plan = planOf(events, changed, changes, {}, framerate);

        EXPECT_TRUE(plan.needsRun()) << file;
        for (const CarriedStretch& part : partsOf(plan)) {
            const bool isBefore = part.destination.end <= place;
            const bool isAfter = part.destination.start >= place + Length;
            EXPECT_TRUE(isBefore || isAfter) << file;
            EXPECT_EQ(part.shift, isBefore ? 0 : Length) << file;
            ++checked;
        }
        EXPECT_EQ(carriedLength(plan), carriedLength(planOf(events, events, EventList(), {}, framerate))) << file;
    }
    EXPECT_GT(checked, 100U);
}

} // namespace cadrel::tests
