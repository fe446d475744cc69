// SPDX-License-Identifier: GPL-3.0-or-later

// The law of a run that keeps what the picture didn't change, through the whole program: for every EDL of the tree, and
// random projects with parts in parts, markers, curves, locked tracks and an origin.

#include "core/edl/EventBase.h"
#include "core/edl/ProgrammePlace.h"
#include "core/picture/FrameRange.h"
#include "core/picture/Reels.h"
#include "core/time/Timecode.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/StoredProjects.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TreeEdls.h"

#include <gtest/gtest.h>
#include <rapidcheck.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <numeric>
#include <optional>
#include <regex>
#include <set>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventList;
using core::FrameRange;
using core::FrameRanges;
using core::Framerate;
using core::Timecode;
using nlohmann::json;

std::string anyEdl()
{
    static const std::vector<std::string> All = treeEdls();
    return *rc::gen::elementOf(All);
}

std::uint64_t anySeed()
{
    return *rc::gen::noShrink(rc::gen::resize(rc::kNominalSize, rc::gen::arbitrary<std::uint64_t>()));
}

/// Where the picture of an EDL stands, black left out.
FrameRanges pictureOf(const EventList& events, const Framerate& framerate)
{
    FrameRanges frames;
    for (const auto& event : events.events()) {
        if (fillsProgramme(*event, framerate) && !isBlack(*event))
            frames.push_back({event->dstIn().toFrameCount(framerate), event->dstOut().toFrameCount(framerate)});
    }
    return united(std::move(frames));
}

/// The cuts of an EDL at which something could be put in: an event begins there where another ends, and none stands across.
std::vector<std::int32_t> cutsOf(const EventList& events, const Framerate& framerate)
{
    FrameRanges all;
    for (const auto& event : events.events()) {
        if (fillsProgramme(*event, framerate))
            all.push_back({event->dstIn().toFrameCount(framerate), event->dstOut().toFrameCount(framerate)});
    }
    std::vector<std::int32_t> cuts;
    for (const FrameRange& range : all) {
        const std::int32_t place = range.start;
        const bool isCut =
            std::any_of(all.begin(), all.end(), [place](const FrameRange& other) { return other.end == place; }) &&
            std::none_of(all.begin(), all.end(),
                         [place](const FrameRange& other) { return other.start < place && place < other.end; });
        if (isCut)
            cuts.push_back(place);
    }
    return cuts;
}

/// The lines of a text, each with its ending.
std::vector<std::string> linesOf(const std::string& text)
{
    std::vector<std::string> lines;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find('\n', start), text.size() - 1) + 1;
        lines.push_back(text.substr(start, end - start));
        start = end;
    }
    return lines;
}

/// A line of an EDL with its four timecodes, which can be moved. All else in it is left as it is.
class TimecodeLine {
public:
    enum Column { SrcIn, SrcOut, DstIn, DstOut };

    /// Nothing for a line of another kind.
    static std::optional<TimecodeLine> parse(const std::string& line, const Framerate& framerate)
    {
        static const std::regex Timecodes(R"(\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d)");
        static const std::regex Four(R"((\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d\s+){3}\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d)");
        // A comment can be as long as the file, for which regular expressions have no stack.
        constexpr std::size_t LongestEvent = 300;
        std::smatch four;
        if (line.size() > LongestEvent || !std::regex_search(line, four, Four))
            return std::nullopt;
        TimecodeLine found(line, framerate);
        auto place = std::sregex_iterator(line.begin() + four.position(), line.end(), Timecodes);
        for (std::size_t& start : found.m_starts)
            start = static_cast<std::size_t>(four.position() + (place++)->position());
        return found;
    }

    /// Nothing for a timecode that doesn't exist at the rate.
    std::optional<std::int32_t> frame(Column column) const
    {
        const std::string digits = m_line.substr(m_starts[column], 11);
        const Timecode timecode(std::stoi(digits.substr(0, 2)), std::stoi(digits.substr(3, 2)),
                                std::stoi(digits.substr(6, 2)), std::stoi(digits.substr(9, 2)));
        return timecode.isValid(m_framerate) ? std::optional(timecode.toFrameCount(m_framerate)) : std::nullopt;
    }

    void move(Column column, std::int32_t frames)
    {
        const auto was = frame(column);
        if (!was)
            return;
        Timecode timecode;
        timecode.setFrameCount(*was + frames, m_framerate);
        const std::string digits = timecode.toString();
        for (const std::size_t at : {0U, 3U, 6U, 9U})
            m_line.replace(m_starts[column] + at, 2, digits, at, 2);
    }

    const std::string& text() const { return m_line; }

private:
    TimecodeLine(const std::string& line, const Framerate& framerate) : m_line(line), m_framerate(framerate) {}

    std::string m_line;
    Framerate m_framerate;
    std::array<std::size_t, 4> m_starts{};
};

/// The text of an EDL in which all that begins at a frame or after it stands later.
std::string movedFrom(std::int32_t place, std::int32_t frames, const std::string& text, const Framerate& framerate)
{
    std::string result;
    for (const std::string& line : linesOf(text)) {
        auto event = TimecodeLine::parse(line, framerate);
        const auto in = event ? event->frame(TimecodeLine::DstIn) : std::nullopt;
        if (!in || *in < place) {
            result += line;
            continue;
        }
        event->move(TimecodeLine::DstIn, frames);
        event->move(TimecodeLine::DstOut, frames);
        result += event->text();
    }
    return result;
}

/// The text of an EDL without the events that begin in a stretch, and without their comments.
std::string withoutEventsIn(const FrameRange& stretch, const std::string& text, const Framerate& framerate)
{
    std::string result;
    bool isLifted = false;
    for (const std::string& line : linesOf(text)) {
        if (const auto event = TimecodeLine::parse(line, framerate)) {
            const auto in = event->frame(TimecodeLine::DstIn);
            isLifted = in && stretch.contains(*in);
        }
        const bool isOfTheFile = line.starts_with("TITLE") || line.starts_with("FCM");
        if (!isLifted || isOfTheFile)
            result += line;
    }
    return result;
}

/// What one change of a cut does: a stretch of the old programme goes, and so much comes in its place.
struct OneChange {
    FrameRange removed; ///< can be empty
    std::int32_t inserted;
    std::string text; ///< of the new cut

    std::int32_t shift() const { return inserted - removed.length(); }
};

/// Where a stretch can be lifted from cut to cut, or a shot be trimmed, so that it can be told from the cuts what has gone.
class Trimming {
public:
    Trimming(const EventList& events, const Framerate& framerate) : m_framerate(framerate)
    {
        for (const auto& event : events.events()) {
            if (fillsProgramme(*event, framerate))
                m_shots.push_back(
                    {{event->dstIn().toFrameCount(framerate), event->dstOut().toFrameCount(framerate)}, event.get()});
        }
        for (const std::int32_t cut : cutsOf(events, framerate)) {
            if (isCutOfPicture(cut))
                m_cuts.push_back(cut);
        }
        std::sort(m_cuts.begin(), m_cuts.end());
    }

    /// Between two shots, in order; a lift goes from one to a further one.
    const std::vector<std::int32_t>& cuts() const { return m_cuts; }
    bool canBeLifted(const FrameRange& stretch) const
    {
        return !stretch.isEmpty() && !hasReelEndIn(stretch) && canBeTold(stretch);
    }

    /// Shots at normal speed with nothing above or below them.
    std::vector<const EventBase*> trimmableShots() const
    {
        std::vector<const EventBase*> found;
        for (const Shot& shot : m_shots) {
            const EventBase& event = *shot.event;
            const bool isPlain = event.isValid() && !event.isTransition() && event.isNormalSpeed() &&
                                 !event.isReversed() && !isBlack(event) &&
                                 event.srcOut().toFrameCount(m_framerate) - event.srcIn().toFrameCount(m_framerate) ==
                                     shot.frames.length();
            if (isPlain && isAlone(shot) && !isTransitionAt(shot.frames.end) && shot.frames.length() > 1)
                found.push_back(&event);
        }
        return found;
    }

    /// Whether the picture around the stretch shows where it began and where it ended: a shot that is there twice in a
    /// row could have lost either.
    bool canBeTold(const FrameRange& stretch) const
    {
        return pictureAt(stretch.start) != pictureAt(stretch.end) &&
               pictureAt(stretch.start - 1) != pictureAt(stretch.end - 1);
    }

private:
    struct Shot {
        FrameRange frames;
        const EventBase* event;
    };

    bool isCutOfPicture(std::int32_t cut) const
    {
        const auto isPicture = [this](std::int32_t frame) {
            return std::any_of(m_shots.begin(), m_shots.end(), [frame](const Shot& shot) {
                return shot.frames.contains(frame) && !isBlack(*shot.event);
            });
        };
        return isPicture(cut - 1) && isPicture(cut) && !isTransitionAt(cut);
    }

    bool isTransitionAt(std::int32_t cut) const
    {
        return std::any_of(m_shots.begin(), m_shots.end(),
                           [cut](const Shot& shot) { return shot.frames.start == cut && shot.event->isTransition(); });
    }

    bool isAlone(const Shot& shot) const
    {
        return std::all_of(m_shots.begin(), m_shots.end(), [&shot](const Shot& other) {
            return other.event == shot.event || intersect(other.frames, shot.frames).isEmpty();
        });
    }

    bool hasReelEndIn(const FrameRange& stretch) const
    {
        FrameRanges picture;
        for (const Shot& shot : m_shots)
            picture.push_back(shot.frames);
        const FrameRanges reels = joinedWithin(core::partingGap(m_framerate), std::move(picture));
        return std::none_of(reels.begin(), reels.end(), [&stretch](const FrameRange& reel) {
            return reel.start <= stretch.start && stretch.end <= reel.end;
        });
    }

    /// What is seen in a frame.
    std::set<std::string> pictureAt(std::int32_t frame) const
    {
        std::set<std::string> picture;
        for (const Shot& shot : m_shots) {
            if (!shot.frames.contains(frame))
                continue;
            const std::int32_t in = shot.event->srcIn().toFrameCount(m_framerate);
            const double length = shot.event->srcOut().toFrameCount(m_framerate) - in;
            const double source = in + (frame - shot.frames.start) * length / shot.frames.length();
            picture.insert(shot.event->rollName() + "\n" + std::to_string(source));
        }
        return picture;
    }

    Framerate m_framerate;
    std::vector<Shot> m_shots;
    std::vector<std::int32_t> m_cuts;
};

/// Whether a motion line is about the event in a line, which is numbered from 1.
bool hasMotionLine(std::uint32_t number, const std::string& text, const Framerate& framerate)
{
    const std::vector<std::string> lines = linesOf(text);
    const auto isOfAnother = [&](const std::string& line) { return TimecodeLine::parse(line, framerate).has_value(); };
    const auto end = std::find_if(lines.begin() + number, lines.end(), isOfAnother);
    return std::any_of(lines.begin() + number, end, [](const std::string& line) { return line.starts_with("M2"); });
}

/// The EDL without a stretch from cut to cut; what is after it moves up.
OneChange lifted(const FrameRange& stretch, const std::string& text, const Framerate& framerate)
{
    const std::string rest = withoutEventsIn(stretch, text, framerate);
    return {stretch, 0, movedFrom(stretch.end, -stretch.length(), rest, framerate)};
}

/// The EDL with so many frames less at the head or the tail of a shot; what is after it moves up.
OneChange trimmed(const EventBase& shot, bool isAtHead, std::int32_t frames, const std::string& text,
                  const Framerate& framerate)
{
    const FrameRange was{shot.dstIn().toFrameCount(framerate), shot.dstOut().toFrameCount(framerate)};
    std::vector<std::string> lines = linesOf(movedFrom(was.end, -frames, text, framerate));
    std::string& line = lines.at(shot.sourceLine() - 1);
    auto event = TimecodeLine::parse(line, framerate);
    event->move(isAtHead ? TimecodeLine::SrcIn : TimecodeLine::SrcOut, isAtHead ? frames : -frames);
    event->move(TimecodeLine::DstOut, -frames);
    line = event->text();
    const FrameRange removed =
        isAtHead ? FrameRange{was.start, was.start + frames} : FrameRange{was.end - frames, was.end};
    return {removed, 0, std::accumulate(lines.begin(), lines.end(), std::string())};
}

void forgetRoles(json& tracks)
{
    for (json& track : tracks) {
        if (track.contains("attributes")) {
            track["attributes"].erase("Cadrel:MarkerType");
            if (track["attributes"].empty())
                track.erase("attributes");
        }
        if (track.contains("tracks"))
            forgetRoles(track["tracks"]);
    }
}

/// A random project for a film: its material begins half a minute before the film, more or less, and goes on for as long
/// after it. A locked track has sound all the way, so that the project looks as if it belonged to the film.
std::string projectFor(const FrameRanges& picture, const Framerate& framerate)
{
    const double start = picture.empty() ? 0.0 : picture.front().start / framerate.rate;
    const double end = picture.empty() ? 10.0 : picture.back().end / framerate.rate;
    const double origin = start - *rc::gen::element(30.0, 30.0173, 0.0);
    standin::tests::ProjectScale scale;
    scale.seconds = end - origin + 30.0;
    scale.events = 12;
    json project = json::parse(randomProjectText(anySeed(), framerate, scale));
    project["timeOrigin"] = origin;
    forgetRoles(project["tracks"]);
    project["tracks"].push_back(
        {{"kind", "audio"},
         {"name", "Guide"},
         {"locked", true},
         {"events", json::array({{{"kind", "clip"}, {"start", start - origin}, {"end", end - origin}}})}});
    project["tracks"].push_back(
        {{"kind", "audio"},
         {"name", "Room"},
         {"events", json::array({{{"kind", "clip"}, {"start", start - origin}, {"end", end - origin}}})}});
    return project.dump();
}

/// A run from one EDL to another on a project.
struct LawRun {
    LawRun(const std::string& oldText, const std::string& newText, const std::string& projectText,
           const std::vector<std::string>& more)
        : project(folder.write("film.stage", projectText)), result(folder / "result.stage")
    {
        // The project's attributes are invented, those of stored data too.
        std::vector<std::string> words{"apply",
                                       project,
                                       "--fresh",
                                       "--old",
                                       folder.write("old.edl", oldText),
                                       "--new",
                                       folder.write("new.edl", newText),
                                       "-o",
                                       result,
                                       "--json",
                                       "-",
                                       "--no-destination-markers",
                                       "--no-insert-markers",
                                       "--no-dissolve-wipe-markers",
                                       "--no-automation-markers",
                                       "--no-snippet-markers",
                                       "--no-overlap-markers"};
        words.insert(words.end(), more.begin(), more.end());
        outcome = runCadrel(words);
    }

    const TempFolder folder;
    const std::string project;
    const std::filesystem::path result;
    Outcome outcome;
};

/// Why an EDL is refused even onto itself; empty when it isn't. There are two that hold sound alone.
std::string refusalOf(const std::string& path)
{
    const bool isSound = path == "tests/data/edl/TEST.edl" || path == "tests/data/edl/multi_audio.edl";
    return isSound ? "holds no event that can be read (the first: Not a video event.)" : "";
}

const json& pointsOf(const json& curve)
{
    return curve.at("points");
}

/// Whether a point of the curve stands within a hundredth of a second.
bool isBesideAPoint(const json& points, double time)
{
    return std::any_of(points.begin(), points.end(),
                       [time](const json& point) { return std::abs(point.at("time").get<double>() - time) < 0.01; });
}

} // namespace

RC_GTEST_PROP(KeepLaw, AnyEdlOntoItselfChangesNoTrackOfItsFilmAndNeedsNoForce, ())
{
    const std::string path = anyEdl();
    const TreeEdl edl(path);
    const std::string text = contentOf(treePath(path));
    const LawRun run(text, text, projectFor(pictureOf(edl.events(), edl.framerate()), edl.framerate()), {});

    RC_LOG(path);
    if (!refusalOf(path).empty()) {
        RC_ASSERT(run.outcome.status == 1);
        RC_ASSERT(run.outcome.err.find(refusalOf(path)) != std::string::npos);
        return;
    }
    RC_LOG(run.outcome.err);
    RC_ASSERT(run.outcome.status == 0);
    RC_ASSERT(!json::parse(run.outcome.out).at("runNeeded").get<bool>());
    const bool isUnchanged = tracksIn(run.result) == tracksIn(run.project);
    RC_ASSERT(isUnchanged);
}

namespace {

/// How many of the events begin between two times.
std::ptrdiff_t countBetween(double from, double to, const json& events)
{
    return std::count_if(events.begin(), events.end(), [&](const json& event) {
        return from < event.at("start").get<double>() && event.at("start").get<double>() < to;
    });
}

/// Whether a list holds the beginning of an event, as much later as `shift` and going on at least up to a time.
bool holdsBeginning(const json& events, const json& event, double shift, double until)
{
    const auto isBeginning = [&](json other) {
        const double start = other.at("start");
        const double end = endOf(other);
        json whole = event;
        for (json* const both : {&other, &whole}) {
            // Of a part that was cut, some of what lies in it is in the rest.
            for (const char* const key : {"start", "end", "events"})
                both->erase(key);
        }
        return other == whole && std::abs(start - event.at("start").get<double>() - shift) < 1e-4 && end > until - 1e-4;
    };
    return std::any_of(events.begin(), events.end(), isBeginning);
}

/// Runs from an EDL to the same with one change, on a random project, and looks at all that a run may change: what lies
/// before the change is as it was, what lies after it in its reel is as it was but moved, what lay in the place is gone.
void requireThatOnlyOnePlaceChanges(const std::string& path, const TreeEdl& edl, const OneChange& change)
{
    const Framerate framerate = edl.framerate();
    const FrameRanges picture = pictureOf(edl.events(), framerate);
    const std::string text = contentOf(treePath(path));
    const LawRun run(text, change.text, projectFor(picture, framerate), {"--force", "--no-b-roll"});

    RC_LOG(std::to_string(change.removed.start) + " to " + std::to_string(change.removed.end) + run.outcome.err);
    RC_ASSERT(run.outcome.status == 0);
    FrameRange reel;
    for (const FrameRange& other : joinedWithin(core::partingGap(framerate), picture)) {
        if (other.contains(change.removed.start))
            reel = other;
    }
    const json project = json::parse(contentOf(run.project));
    const double origin = project.at("timeOrigin");
    const double start = change.removed.start / framerate.rate - origin;
    const double resume = change.removed.end / framerate.rate - origin;
    const double end = reel.end / framerate.rate - origin;
    const double shift = change.shift() / framerate.rate;
    // The automation keeps its value where a later reel, with what belongs to it, begins and ends.
    const double programmeEnd = (picture.back().end + core::partingGap(framerate)) / framerate.rate - origin;
    constexpr double Instant = 1e-4;
    const std::vector<json> before = changeableTracks(project.at("tracks"));
    const std::vector<json> after = changeableTracks(tracksIn(run.result));
    RC_ASSERT(after.size() >= before.size());
    for (std::size_t index = 0; index < before.size(); ++index) {
        RC_LOG(before[index].value("name", std::string()));
        if (before[index].value("locked", false)) {
            const bool isUnchanged = after[index] == before[index];
            RC_ASSERT(isUnchanged);
            continue;
        }
        const json was = before[index].value("events", json::array());
        const json now = after[index].value("events", json::array());
        for (const json& event : was) {
            if (endOf(event) < start - Instant)
                RC_ASSERT(holds(now, event, 0.0));
            if (event.at("start").get<double>() <= resume + Instant || event.at("start").get<double>() >= end)
                continue;
            // What runs on for a minute after its reel may be cut where something stays.
            if (endOf(event) - end > 60.0 - 1.0 / framerate.rate)
                RC_ASSERT(holdsBeginning(now, event, shift, end + shift));
            else
                RC_ASSERT(holds(now, event, shift));
        }
        RC_ASSERT(countBetween(-1e9, start - Instant, now) == countBetween(-1e9, start - Instant, was));
        RC_ASSERT(countBetween(start + Instant, resume + shift - Instant, now) == 0);
        RC_ASSERT(countBetween(resume + shift + Instant, end + shift - Instant, now) ==
                  countBetween(resume + Instant, end - Instant, was));
        const json curves = before[index].value("curves", json::array());
        for (std::size_t curve = 0; curve < curves.size(); ++curve) {
            const json& old = pointsOf(curves[curve]);
            if (old.empty())
                continue;
            const json& is = pointsOf(after[index].at("curves").at(curve));
            for (const json& point : old) {
                if (point.at("time").get<double>() < start - Instant)
                    RC_ASSERT(std::find(is.begin(), is.end(), point) != is.end());
            }
            RC_ASSERT(!is.empty());
            const double oldEnd = std::max(end, old.back().at("time").get<double>()) + std::max(shift, 0.0) + 1.0;
            const double isEnd = is.back().at("time").get<double>();
            RC_ASSERT(isEnd < std::max(oldEnd, programmeEnd + std::max(shift, 0.0) + 1.0));
            // Nothing but the one edge lies after all that was there, and from there on the curve is as it was.
            for (const json& point : is)
                RC_ASSERT(point.at("time").get<double>() < oldEnd || point.at("time").get<double>() > isEnd - Instant);
            if (isEnd >= oldEnd)
                RC_ASSERT(std::abs(valueAt(is, isEnd + 1.0) - valueAt(old, isEnd + 1.0)) < 1e-6);
            for (double part = 0.01; part < 1.0; part += 0.07) {
                const double early = start * part;
                const double late = resume + (end - resume) * part;
                if (early < start - Instant && !isBesideAPoint(old, early))
                    RC_ASSERT(std::abs(valueAt(is, early) - valueAt(old, early)) < 1e-6);
                if (late > resume + Instant && !isBesideAPoint(old, late))
                    RC_ASSERT(std::abs(valueAt(is, late + shift) - valueAt(old, late)) < 1e-6);
            }
        }
    }
}

/// An EDL in which something can be changed and that a run takes; others are discarded.
std::string anyEdlWithPicture()
{
    const std::string path = anyEdl();
    const TreeEdl edl(path);
    const FrameRanges picture = pictureOf(edl.events(), edl.framerate());
    RC_PRE(!picture.empty() && refusalOf(path).empty());
    RC_PRE(picture.back().end + 60 * 60 < edl.framerate().lastFrame);
    return path;
}

} // namespace

RC_GTEST_PROP(KeepLaw, AnInsertInAnyEdlLeavesWhatIsBeforeItAndShiftsWhatIsAfter, ())
{
    constexpr std::int32_t Length = 37;
    const std::string path = anyEdlWithPicture();
    RC_LOG(path);
    const TreeEdl edl(path);
    const std::vector<std::int32_t> cuts = cutsOf(edl.events(), edl.framerate());
    RC_PRE(!cuts.empty());
    const std::int32_t place = *rc::gen::elementOf(cuts);

    requireThatOnlyOnePlaceChanges(
        path, edl, {{place, place}, Length, movedFrom(place, Length, contentOf(treePath(path)), edl.framerate())});
}

RC_GTEST_PROP(KeepLaw, ALiftInAnyEdlTakesTheSoundOfThatStretchAndNoOther, ())
{
    const std::string path = anyEdlWithPicture();
    RC_LOG(path);
    const TreeEdl edl(path);
    const Trimming trimming(edl.events(), edl.framerate());
    RC_PRE(!trimming.cuts().empty());
    const FrameRange stretch{*rc::gen::elementOf(trimming.cuts()), *rc::gen::elementOf(trimming.cuts())};
    RC_PRE(trimming.canBeLifted(stretch));

    requireThatOnlyOnePlaceChanges(path, edl, lifted(stretch, contentOf(treePath(path)), edl.framerate()));
}

RC_GTEST_PROP(KeepLaw, ATrimInAnyEdlTakesTheSoundOfItsFramesAndNoOther, ())
{
    const std::string path = anyEdlWithPicture();
    RC_LOG(path);
    const TreeEdl edl(path);
    const Framerate framerate = edl.framerate();
    const Trimming trimming(edl.events(), framerate);
    const auto shots = trimming.trimmableShots();
    RC_PRE(!shots.empty());
    const EventBase& shot = *shots.at(*rc::gen::inRange<std::size_t>(0, shots.size()));
    RC_LOG("event " + std::to_string(shot.eventNumber()) + " in line " + std::to_string(shot.sourceLine()) + "\n");
    const bool isAtHead = *rc::gen::arbitrary<bool>();
    const std::int32_t length = shot.dstOut().toFrameCount(framerate) - shot.dstIn().toFrameCount(framerate);
    const std::int32_t frames = *rc::gen::inRange(1, std::min(length, 200));
    const std::string text = contentOf(treePath(path));
    RC_PRE(!hasMotionLine(shot.sourceLine(), text, framerate));
    const OneChange change = trimmed(shot, isAtHead, frames, text, framerate);
    RC_PRE(trimming.canBeTold(change.removed));

    requireThatOnlyOnePlaceChanges(path, edl, change);
}

namespace {

constexpr std::int32_t Second = 24;

/// What happens to the small example: the second shot of a reel goes, or something comes before it. The other reel stays.
struct ChangeOfOneReel {
    ChangeOfOneReel()
    {
        const Framerate framerate(24, 0);
        const std::int32_t hour = 3600 * Second;
        const std::int32_t place = (isFirst ? 1 : 2) * hour + 10 * Second;
        const std::int32_t length = *rc::gen::inRange(1, 10 * Second);
        const std::string old = contentOf(treePath("examples/tworeels/old.edl"));
        const FrameRange shot{place, place + 10 * Second};
        const OneChange change = isLift ? lifted(shot, old, framerate)
                                        : OneChange{{place, place}, length, movedFrom(place, length, old, framerate)};
        const std::int32_t shiftOfSecond = isFirst ? -change.shift() : 0;
        text = movedFrom(2 * hour - 20 * Second, shiftOfSecond, change.text, framerate);
        shift = change.shift() / static_cast<double>(Second);
    }

    bool isFirst = *rc::gen::arbitrary<bool>();
    bool isLift = *rc::gen::arbitrary<bool>();
    double shift;
    std::string text;

    /// Where the change is, on the clock of the project.
    double place() const { return isFirst ? 70.0 : 3670.0; }
    bool takesAway(double time) const { return isLift && place() <= time && time < place() + 10; }
    bool moves(double time) const { return time >= place() && (!isFirst || time < 1800); }
};

double lengthOf(const json& events)
{
    double length = 0;
    for (const json& event : events)
        length += endOf(event) - event.at("start").get<double>();
    return length;
}

} // namespace

RC_GTEST_PROP(KeepLaw, AChangeOfOneReelLeavesTheOtherAndLosesNothingUntoldThoughClipsSpanBoth, ())
{
    const ChangeOfOneReel change;
    json project = json::parse(contentOf(treePath("examples/tworeels/tworeels.stage")));
    const json sound = project.at("tracks").at(0).at("events");
    const std::size_t first = project.at("tracks").size();
    const std::size_t spanning = *rc::gen::inRange<std::size_t>(1, 4);
    for (std::size_t track = 0; track < spanning; ++track) {
        const double start = *rc::gen::inRange(0, 92);
        const double end = *rc::gen::inRange(3661, 3760);
        project["tracks"].push_back(
            {{"kind", "audio"},
             {"name", "Span " + std::to_string(track)},
             {"events", json::array({{{"kind", "clip"}, {"start", start}, {"end", end}, {"name", "span"}}})}});
    }

    const LawRun run(contentOf(treePath("examples/tworeels/old.edl")), change.text, project.dump(), {"--force"});

    RC_LOG(run.outcome.err);
    RC_ASSERT(run.outcome.status == 0);
    const json tracks = tracksIn(run.result);
    for (const json& event : sound) {
        const double start = event.at("start").get<double>();
        if (change.takesAway(start))
            continue;
        RC_LOG(event.at("name").get<std::string>());
        RC_ASSERT(holds(tracks.at(0).at("events"), event, change.moves(start) ? change.shift : 0.0));
    }
    const json report = json::parse(run.outcome.out);
    double told = 0.0;
    for (const json& lost : report.at("lost"))
        told += lost.at("out").at("seconds").get<double>() - lost.at("in").at("seconds").get<double>();
    // The gap between the reels has no room for what the first one has grown by.
    RC_ASSERT(std::abs(told - (change.isFirst ? std::max(change.shift, 0.0) : 0.0)) < 1e-4);
    for (std::size_t track = first; track < first + spanning; ++track) {
        const json& was = project.at("tracks").at(track).at("events").at(0);
        const double takenFrom = std::max(change.place(), was.at("start").get<double>());
        const double takenTo = std::min(change.place() + 10, endOf(was));
        const double taken = change.isLift ? std::max(0.0, takenTo - takenFrom) : 0.0;
        const double left = endOf(was) - was.at("start").get<double>() - taken - told;
        RC_ASSERT(std::abs(lengthOf(tracks.at(track).at("events")) - left) < 1e-3);
    }
}

TEST(KeepLaw, ManyEdlsOfTheTreeHaveAPlaceToLiftAndOneToTrim)
{
    std::size_t withLift = 0;
    std::size_t withTrim = 0;
    for (const std::string& path : treeEdls()) {
        const TreeEdl edl(path);
        const Trimming trimming(edl.events(), edl.framerate());
        withLift += trimming.cuts().size() < 2 ? 0U : 1U;
        withTrim += trimming.trimmableShots().empty() ? 0U : 1U;
    }

    EXPECT_GT(withLift, 12U);
    EXPECT_GT(withTrim, 20U);
}

} // namespace cadrel::tests
