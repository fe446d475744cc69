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
#include <optional>
#include <regex>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

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

/// The text of an EDL in which all that begins at a frame or after it stands later. All else is left as it is.
std::string movedFrom(std::int32_t place, std::int32_t frames, const std::string& text, const Framerate& framerate)
{
    static const std::regex Line(
        R"(^(.*\s)(\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d)(\s+)(\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d)(.*)$)");
    static const std::regex Four(R"((\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d\s+){3}\d\d[:;.]\d\d[:;.]\d\d[:;.]\d\d)");
    const auto frameOf = [&framerate](const std::string& digits) -> std::optional<std::int32_t> {
        const Timecode timecode(std::stoi(digits.substr(0, 2)), std::stoi(digits.substr(3, 2)),
                                std::stoi(digits.substr(6, 2)), std::stoi(digits.substr(9, 2)));
        return timecode.isValid(framerate) ? std::optional(timecode.toFrameCount(framerate)) : std::nullopt;
    };
    const auto moved = [&](std::string digits) {
        if (const auto frame = frameOf(digits)) {
            Timecode timecode;
            timecode.setFrameCount(*frame + frames, framerate);
            const std::string later = timecode.toString();
            for (const std::size_t at : {0U, 3U, 6U, 9U})
                digits.replace(at, 2, later, at, 2);
        }
        return digits;
    };
    std::string result;
    for (std::size_t start = 0; start < text.size();) {
        const std::size_t end = std::min(text.find('\n', start), text.size() - 1) + 1;
        std::string line = text.substr(start, end - start);
        start = end;
        const std::string ending = line.substr(std::min(line.find_last_not_of("\r\n") + 1, line.size()));
        line.resize(line.size() - ending.size());
        std::smatch parts;
        // A comment can be as long as the file, for which regular expressions have no stack.
        constexpr std::size_t LongestEvent = 300;
        if (line.size() <= LongestEvent && std::regex_search(line, Four) && std::regex_match(line, parts, Line)) {
            const auto in = frameOf(parts[2]);
            if (in && *in >= place)
                line = parts[1].str() + moved(parts[2]) + parts[3].str() + moved(parts[4]) + parts[5].str();
        }
        result += line + ending;
    }
    return result;
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

RC_GTEST_PROP(KeepLaw, OneChangeOfAnyEdlLeavesWhatIsBeforeItAndShiftsWhatIsAfter, ())
{
    constexpr std::int32_t Length = 37;
    const std::string path = anyEdl();
    RC_LOG(path);
    const TreeEdl edl(path);
    const Framerate framerate = edl.framerate();
    const std::vector<std::int32_t> cuts = cutsOf(edl.events(), framerate);
    const FrameRanges picture = pictureOf(edl.events(), framerate);
    RC_PRE(!cuts.empty() && !picture.empty() && refusalOf(path).empty());
    RC_PRE(picture.back().end + 60 * 60 < framerate.lastFrame);
    const std::int32_t place = *rc::gen::elementOf(cuts);
    const std::string text = contentOf(treePath(path));
    const LawRun run(text, movedFrom(place, Length, text, framerate), projectFor(picture, framerate), {"--force"});

    RC_LOG(std::to_string(place) + run.outcome.err);
    RC_ASSERT(run.outcome.status == 0);
    FrameRange reel;
    for (const FrameRange& other : joinedWithin(core::partingGap(framerate), picture)) {
        if (other.contains(place))
            reel = other;
    }
    const json project = json::parse(contentOf(run.project));
    const double origin = project.at("timeOrigin");
    const double change = place / framerate.rate - origin;
    const double end = reel.end / framerate.rate - origin;
    const double shift = Length / framerate.rate;
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
        const json now = after[index].value("events", json::array());
        for (const json& event : before[index].value("events", json::array())) {
            if (endOf(event) < change)
                RC_ASSERT(holds(now, event, 0.0));
            else if (event.at("start").get<double>() > change && event.at("start").get<double>() < end)
                RC_ASSERT(holds(now, event, shift));
        }
        const json curves = before[index].value("curves", json::array());
        for (std::size_t curve = 0; curve < curves.size(); ++curve) {
            const json& was = pointsOf(curves[curve]);
            if (was.empty())
                continue;
            const json& is = pointsOf(after[index].at("curves").at(curve));
            for (const json& point : was) {
                if (point.at("time").get<double>() < change)
                    RC_ASSERT(std::find(is.begin(), is.end(), point) != is.end());
            }
            RC_ASSERT(!is.empty());
            RC_ASSERT(is.back().at("time").get<double>() <
                      std::max(end, was.back().at("time").get<double>()) + shift + 1.0);
            for (double part = 0.01; part < 1.0; part += 0.07) {
                const double early = change * part;
                const double late = change + (end - change) * part;
                if (!isBesideAPoint(was, early))
                    RC_ASSERT(std::abs(valueAt(is, early) - valueAt(was, early)) < 1e-6);
                if (!isBesideAPoint(was, late))
                    RC_ASSERT(std::abs(valueAt(is, late + shift) - valueAt(was, late)) < 1e-6);
            }
        }
    }
}

} // namespace cadrel::tests
