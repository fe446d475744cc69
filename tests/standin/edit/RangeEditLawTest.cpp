// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Track.h"
#include "tests/standin/edit/RangeEditHost.h"
#include "tests/support/standin/Heard.h"
#include "tests/support/standin/RandomProject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <optional>
#include <tuple>

using namespace Velmark;

namespace standin::tests {

namespace {

using Tracks = std::vector<Track*>;

/// A film takes hundreds of decisions, and one seed can't come down to a simpler one.
std::uint64_t someSeed()
{
    return *rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>()));
}

/// A host with a random project, in a transaction.
struct RandomFilm {
    explicit RandomFilm(Chance& chance)
        : project(application.projects().add(randomProject(chance, application.edits().log())))
    {
        application.edits().begin(true);
    }

    void copyRange(const Tracks& tracks, double start, double end, double destination)
    {
        const auto list = create<IObjectList>(application.context());
        for (Track* const track : tracks)
            list->add(static_cast<ITrackNode*>(track), 0);
        RC_ASSERT(application.edits().copyRange(&project, list.get(), 0, start, end, destination) == ResultOk);
    }
    void deleteRange(double start, double end)
    {
        RC_ASSERT(application.edits().deleteRange(&project, 0, start, end) == ResultOk);
    }

    std::string dump() const { return ProjectFile::toText(project); }
    Tracks allButFolders() const
    {
        Tracks tracks = project.allTracks();
        std::erase_if(tracks, [](const Track* track) { return track->isFolder(); });
        return tracks;
    }

    Application application;
    Project& project;
};

Tracks someOf(Chance& chance, const Tracks& tracks)
{
    Tracks some;
    for (Track* const track : tracks) {
        if (!chance.oneIn(3))
            some.push_back(track);
    }
    return some;
}

/// One of the times, or a round or any other one.
double someTime(Chance& chance, const std::vector<double>& times)
{
    const std::uint64_t kind = chance.below(3);
    if (kind == 0 && !times.empty())
        return chance.oneOf(times);
    const double most = 120.0;
    return kind == 1 ? static_cast<double>(chance.below(120))
                     : most * static_cast<double>(chance.below(1U << 30U)) / (1U << 30U);
}

/// Whether no event has anything in the range, and no curve a point; at the end a curve may have one.
bool isEmptyIn(const Tracks& tracks, double start, double end)
{
    for (const Track* const track : tracks) {
        for (const Node* child = track->firstChild(); child; child = track->childBehind(*child)) {
            if (child->end() > start - SameInstant && child->start() < end - SameInstant &&
                (child->length() < 2.0 * SameInstant || child->end() > start + SameInstant))
                return false;
        }
        for (const auto& [number, curve] : track->curves()) {
            int atEnd = 0;
            for (const Node* point = curve->firstChild(); point; point = curve->childBehind(*point)) {
                if (std::abs(point->start() - end) < SameInstant)
                    ++atEnd;
                else if (point->start() > start - SameInstant && point->start() < end)
                    return false;
            }
            if (atEnd > 1)
                return false;
        }
    }
    return true;
}

/// Of the stretches between two times that follow one another, or from the last time on, one in which all the tracks are
/// empty; often all of it.
std::pair<double, double> someEmptyStretch(Chance& chance, const Tracks& tracks)
{
    std::vector<double> times = timesOf(tracks);
    times.push_back(0.0);
    std::ranges::sort(times);
    times.push_back(times.back() + 200.0);
    std::vector<std::pair<double, double>> stretches;
    for (std::size_t index = 1; index < times.size(); ++index) {
        const double start = times[index - 1];
        const double end = times[index];
        for (const double inside : {0.0, (end - start) / 4.0}) {
            if (end - start > 1e-3 && isEmptyIn(tracks, start + inside, end))
                stretches.emplace_back(start + inside, end);
        }
    }
    const auto [start, end] = chance.oneOf(stretches);
    return {start, chance.oneIn(2) ? end : (start + end) / 2.0};
}

/// A film on a grid of 1/16 s, so that no time or value is rounded, with clips, range markers and parts that may overlap and
/// begin together, cuts in continuous material, and curves.
class GridFilm : public RangeEditHost {
public:
    explicit GridFilm(Chance& chance) : m_chance(chance)
    {
        for (const char* const word : {TypeWord::Audio, TypeWord::Audio, TypeWord::Marker}) {
            const Node node = addTrack(word, u"track");
            nodes.push_back(node);
            auto& track = dynamic_cast<Track&>(*node);
            for (std::uint64_t count = m_chance.below(5); count > 0; --count)
                addEvent(track, word == TypeWord::Marker, 0.0, 32.0);
            if (word == TypeWord::Audio)
                addPoints(track.curve(Envelope::Curve::Volume));
        }
        project.clearChanges();
    }

    /// A multiple of 1/16 from 0 up to `limit`.
    double time(double limit)
    {
        return static_cast<double>(m_chance.below(static_cast<std::uint64_t>(16.0 * limit) + 1)) / 16.0;
    }

    std::vector<Node> nodes;

private:
    void addEvent(Container& container, bool isMarker, double start, double end)
    {
        Counted<Event> event;
        if (isMarker)
            event = makeCounted<standin::Marker>(m_chance.oneIn(2));
        else if (m_chance.oneIn(4))
            event = makeCounted<Part>();
        else
            event = makeCounted<ClipEvent>();
        const double a = start + time(end - start - 1.0);
        const double b = a + 0.5 + time(end - a - 0.5);
        const auto* const marker = dynamic_cast<standin::Marker*>(event.get());
        event->setSpan(a, marker && !marker->isRange() ? a : b);
        if (m_chance.oneIn(2))
            event->setName(u"other");
        event->insertInto(container);
        if (dynamic_cast<Part*>(event.get()) && b - a > 2.0) {
            for (std::uint64_t count = m_chance.below(4); count > 0; --count)
                addEvent(*event, false, 0.0, b - a);
        }
        if (auto* const clip = dynamic_cast<ClipEvent*>(event.get()); clip && m_chance.oneIn(3)) {
            // A cut that the user made.
            const auto next = makeCounted<ClipEvent>();
            next->setSourceOffset(clip->sourceOffset() + clip->length());
            next->setSpan(b, b + 1.0);
            next->setName(event->name());
            if (b + 1.0 <= end)
                next->insertInto(container);
        }
    }

    void addPoints(Envelope& curve)
    {
        double at = 0.0;
        for (std::uint64_t count = m_chance.below(6); count > 0; --count) {
            at += time(8.0);
            const auto point = makeCounted<AutomationPoint>();
            point->setSpan(at, at);
            point->setValue(static_cast<double>(m_chance.below(5)) / 4.0);
            // Of three points at one time the one in the middle doesn't count, nor does one of two with the same value. Such a
            // point is lost where a range begins or ends.
            if (!twoStandAt(curve, at) && !standsAt(curve, at, point->value()))
                point->insertInto(curve);
        }
    }

    static bool standsAt(const Envelope& curve, double time, double value)
    {
        const auto* const point = dynamic_cast<const AutomationPoint*>(curve.firstChildFrom(time));
        return point && point->start() == time && point->value() == value;
    }

    static bool twoStandAt(const Envelope& curve, double time)
    {
        const standin::Node* const first = curve.firstChildFrom(time);
        const standin::Node* const second = first ? curve.childBehind(*first) : nullptr;
        return second && second->start() == time;
    }

    Chance& m_chance;
};

} // namespace

RC_GTEST_PROP(RangeEditLaw, ACopyIntoAnEmptyStretchThatIsDeletedAgainLeavesTheBytesOfBefore, ())
{
    SeededChance chance(someSeed());
    RandomFilm film(chance);
    const Tracks tracks = film.allButFolders();
    const auto [destination, end] = someEmptyStretch(chance, tracks);
    const double start = someTime(chance, timesOf(tracks));
    const std::string before = film.dump();

    Tracks copied = someOf(chance, tracks);
    std::erase_if(copied, [](const Track* track) { return track->kind() == Track::Kind::Ruler; });
    film.copyRange(copied, start, start + (end - destination), destination);
    film.deleteRange(destination, end);

    RC_ASSERT(film.dump() == before);
}

RC_GTEST_PROP(RangeEditLaw, AfterACopyTheDestinationSoundsAsTheSourceDidAndAllElseAsBefore, ())
{
    SeededChance chance(someSeed());
    RandomFilm film(chance);
    const Tracks tracks = film.allButFolders();
    const Tracks copied = someOf(chance, tracks);
    std::vector<double> times = timesOf(tracks);
    const double start = someTime(chance, times);
    const double length = someTime(chance, times);
    const double destination = someTime(chance, times) - (chance.oneIn(3) ? 40.0 : 0.0);

    const double shift = destination - start;
    for (const double time : std::vector<double>(times))
        times.push_back(time + shift);
    times.insert(times.end(), {0.0, start, start + length, destination, destination + length, 500.0});
    std::erase_if(times, [](double time) { return time < 0.0; });
    const std::vector<double> instants = instantsBetween(times);
    std::vector<Heard> expected;
    for (const Track* const track : tracks) {
        const bool isCopied = std::ranges::find(copied, track) != copied.end();
        for (const double instant : instants) {
            const bool isInside = isCopied && instant > destination && instant < destination + length;
            expected.push_back(Heard::at(*track, isInside ? instant - shift : instant));
        }
    }

    film.copyRange(copied, start, start + length, destination);

    std::size_t index = 0;
    for (const Track* const track : tracks) {
        for (const double instant : instants)
            RC_ASSERT(Heard::at(*track, instant) == expected[index++]);
    }
}

RC_GTEST_PROP(RangeEditLaw, AfterADeletionTheRangeIsSilentAndAllElseSoundsAsBefore, ())
{
    SeededChance chance(someSeed());
    RandomFilm film(chance);
    const Tracks tracks = film.allButFolders();
    std::vector<double> times = timesOf(tracks);
    const double start = someTime(chance, times);
    const double end = start + someTime(chance, times);
    times.insert(times.end(), {0.0, start, end, 500.0});
    const std::vector<double> instants = instantsBetween(times);
    std::vector<Heard> expected;
    for (const Track* const track : tracks) {
        for (const double instant : instants)
            expected.push_back(Heard::at(*track, instant));
    }

    film.deleteRange(start, end);

    std::size_t index = 0;
    for (const Track* const track : tracks) {
        for (const double instant : instants) {
            const Heard& before = expected[index++];
            const Heard after = Heard::at(*track, instant);
            if (track->kind() != Track::Kind::Ruler && instant > start && instant < end)
                RC_ASSERT(after.sounding.empty());
            else
                RC_ASSERT(after == before);
        }
    }
}

RC_GTEST_PROP(RangeEditLaw, ClosingAfterCopiesOntoThemselvesLeavesTheBytesOfBefore, ())
{
    SeededChance chance(someSeed());
    GridFilm film(chance);
    const std::string before = film.dump();

    for (std::uint64_t count = 1 + chance.below(4); count > 0; --count) {
        const double start = film.time(32.0);
        film.copyRange({film.nodes[0], film.nodes[1], film.nodes[2]}, start, start + film.time(16.0), start);
    }
    film.closeRange({film.nodes[0], film.nodes[1], film.nodes[2]}, 0.0, 100.0);

    RC_ASSERT(film.dump() == before);
}

} // namespace standin::tests
