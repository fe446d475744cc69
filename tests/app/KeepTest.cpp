// SPDX-License-Identifier: GPL-3.0-or-later

// What the picture didn't change stays: the laws of a run through the whole program.

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/StoredProjects.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <gtest/gtest.h>
#include <map>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

using Words = std::vector<std::string>;

constexpr double Hour = 3600.0;

/// Seconds as a timecode at 24 frames a second.
std::string timecode(double seconds)
{
    const int frames = static_cast<int>(std::lround(seconds * 24));
    std::array<char, 40> text{};
    std::snprintf(text.data(), text.size(), "%02d:%02d:%02d:%02d", frames / 86400, frames / 1440 % 60, frames / 24 % 60,
                  frames % 24);
    return text.data();
}

/// A cut that is put together shot by shot, in seconds of the day.
class Reel {
public:
    explicit Reel(double start) : m_end(start) {}

    Reel& shot(const std::string& roll, double source, double length)
    {
        add(roll, source, source + length, length);
        return *this;
    }
    Reel& freeze(const std::string& roll, double source, double length)
    {
        add(roll, source, source, length);
        return *this;
    }
    Reel& at(double seconds)
    {
        m_end = seconds;
        return *this;
    }
    const std::string& text() const { return m_text; }

private:
    void add(const std::string& roll, double in, double out, double length)
    {
        std::array<char, 16> number{};
        std::snprintf(number.data(), number.size(), "%03d", ++m_count);
        m_text += cut(number.data(), roll, timecode(in) + " " + timecode(out),
                      timecode(m_end) + " " + timecode(m_end + length));
        m_end += length;
    }

    std::string m_text = "TITLE: REEL\n";
    double m_end;
    int m_count = 0;
};

json clip(const std::string& name, double start, double end)
{
    return {{"kind", "clip"}, {"start", start}, {"end", end}, {"clip", 1}, {"name", name}};
}

json audioTrack(const std::string& name, const std::vector<json>& events)
{
    return {{"kind", "audio"}, {"name", name}, {"events", events}};
}

/// A project at 24 frames a second with those tracks.
std::string projectOf(const json& tracks, double origin = 0.0)
{
    const json pool =
        json::array({{{"number", 1}, {"kind", "audio"}, {"name", "take"}, {"path", "take.wav"}, {"length", 90000}}});
    const json project{{"format", "stage"},   {"version", 1},         {"framesPerSecond", 24}, {"dropFrame", false},
                       {"pulledDown", false}, {"timeOrigin", origin}, {"end", 90000},          {"position", 0},
                       {"leftLocator", 0},    {"rightLocator", 0},    {"cycleStart", 0},       {"cycleEnd", 0},
                       {"pool", pool},        {"tracks", tracks}};
    return project.dump();
}

bool tells(const std::string& text, const std::string& piece)
{
    return text.find(piece) != std::string::npos;
}

/// "name start-end" of what lies on a track.
Words placesOn(const std::string& track, const std::filesystem::path& project)
{
    Words places;
    for (const json& event : trackIn(project, track).value("events", json::array())) {
        std::array<char, 80> text{};
        std::snprintf(text.data(), text.size(), " %g-%g", event.at("start").get<double>(),
                      event.value("end", event.at("start").get<double>()));
        places.push_back(event.value("name", std::string()) + text.data());
    }
    return places;
}

/// The files of a run.
struct Job {
    Job(const Reel& oldReel, const Reel& newReel, const json& tracks, double origin = 0.0)
        : oldFile(folder.write("old.edl", oldReel.text())), newFile(folder.write("new.edl", newReel.text())),
          project(folder.write("job.stage", projectOf(tracks, origin))), result(folder / "result.stage")
    {
    }

    Outcome run(const Words& more = {}) const
    {
        Words words{"apply", project, "--old", oldFile, "--new", newFile, "-o", result, "--overwrite"};
        words.insert(words.end(), more.begin(), more.end());
        return runCadrel(words);
    }
    json report(Words more = {}) const
    {
        more.insert(more.end(), {"--json", "-"});
        const Outcome outcome = run(more);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return outcome.status == 0 ? json::parse(outcome.out) : json();
    }

    const TempFolder folder;
    const std::string oldFile;
    const std::string newFile;
    const std::string project;
    const std::string result;
};

/// Three shots of ten seconds from 01:00:00:00 on.
Reel threeShots()
{
    return Reel(Hour).shot("A", 100, 10).shot("B", 200, 10).shot("C", 300, 10);
}

/// The same after four seconds of a new shot between A and B.
Reel withInsert()
{
    return Reel(Hour).shot("A", 100, 10).shot("N", 50, 4).shot("B", 200, 10).shot("C", 300, 10);
}

/// Sound under all of it, with a pop before and a tail behind.
json soundOfThreeShots()
{
    return json::array({audioTrack("DIA", {clip("pop", Hour - 2, Hour - 1), clip("a", Hour, Hour + 10),
                                           clip("b", Hour + 10, Hour + 20), clip("c", Hour + 20, Hour + 30),
                                           clip("tail", Hour + 31, Hour + 33)})});
}

TEST(Keep, ACutOntoItselfStoresTheModelAlone)
{
    for (std::uint64_t seed = 100; seed < 130; ++seed) {
        SCOPED_TRACE(seed);
        const Job job(threeShots(), threeShots(), json::array());
        writeFile(job.project, randomProjectText(seed, cadrel::core::Framerate(24, 0)));

        // A random project may hold what no run has stored.
        const Outcome outcome = job.run({"--force", "--fresh"});

        ASSERT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_TRUE(tells(outcome.out, "Applied     nothing, since no track has to change\n")) << outcome.out;
        EXPECT_EQ(tracksIn(job.result), tracksIn(job.project));
        EXPECT_NE(contentOf(job.result), contentOf(job.project));
    }
}

TEST(Keep, BeforeOneChangeNothingMovesAndAfterItEverythingByTheSame)
{
    for (const double origin : {0.0, Hour - 10, -17.25}) {
        SCOPED_TRACE(origin);
        const double film = Hour - origin;
        json sound = audioTrack("DIA", {clip("pop", film - 2, film - 1), clip("a", film, film + 9.7),
                                        clip("b", film + 10.3, film + 20), clip("tail", film + 30.5, film + 31.1)});
        sound["events"].push_back({{"kind", "part"},
                                   {"name", "outer"},
                                   {"start", film + 21.3},
                                   {"end", film + 28},
                                   {"events", json::array({{{"kind", "part"},
                                                            {"name", "inner"},
                                                            {"start", 1.5},
                                                            {"end", 4},
                                                            {"events", json::array({clip("deep", 0.25, 1)})}}})}});
        std::swap(sound["events"][3], sound["events"][4]);
        sound["curves"] = json::array({{{"number", 1},
                                        {"automates", "volume"},
                                        {"points", json::array({{{"time", film + 1}, {"value", 0.25}},
                                                                {{"time", film + 8}, {"value", 0.75}},
                                                                {{"time", film + 13}, {"value", 0.5}},
                                                                {{"time", film + 25}, {"value", 0.125}}})}}});
        json locked = audioTrack("Guide", {clip("guide", film, film + 30)});
        locked["locked"] = true;
        const json memos{
            {"kind", "marker"},
            {"name", "Notes"},
            {"events",
             json::array({{{"kind", "point"}, {"start", film + 3}, {"name", "here"}},
                          {{"kind", "range"}, {"start", film + 14}, {"end", film + 16}, {"name", "there"}}})}};
        const Job job(threeShots(), withInsert(), json::array({sound, locked, memos}), origin);

        const json report = job.report();

        EXPECT_TRUE(report.at("runNeeded").get<bool>());
        const json before = trackIn(job.project, "DIA");
        const json after = trackIn(job.result, "DIA");
        ASSERT_EQ(after.at("events").size(), 5U);
        for (const std::size_t index : {0U, 1U})
            EXPECT_EQ(after["events"][index], json::parse(contentOf(job.project))["tracks"][0]["events"][index]);
        for (const std::size_t index : {2U, 3U, 4U}) {
            const json& was = before["events"][index];
            const json& now = after["events"][index];
            EXPECT_EQ(now.at("name"), was.at("name"));
            EXPECT_NEAR(now.at("start").get<double>(), was.at("start").get<double>() + 4, 1.0 / 384000);
            EXPECT_NEAR(now.at("end").get<double>(), was.at("end").get<double>() + 4, 1.0 / 384000);
        }
        const json& inner = after["events"][3]["events"][0];
        EXPECT_NEAR(inner.at("start").get<double>(), 1.5, 1.0 / 384000);
        EXPECT_EQ(inner["events"][0].at("name"), "deep");
        const json& wasCurve = before["curves"][0]["points"];
        const json& nowCurve = after["curves"][0]["points"];
        for (const double time : {0.0, 1.0, 4.5, 8.0, 9.5})
            EXPECT_NEAR(valueAt(nowCurve, film + time), valueAt(wasCurve, film + time), 1e-6) << time;
        for (const double time : {10.5, 13.0, 19.0, 25.0, 29.0, 31.0})
            EXPECT_NEAR(valueAt(nowCurve, film + time + 4), valueAt(wasCurve, film + time), 1e-6) << time;
        EXPECT_EQ(trackIn(job.result, "Guide"), trackIn(job.project, "Guide"));
        const json notes = trackIn(job.result, "Notes");
        EXPECT_EQ(notes["events"][0], trackIn(job.project, "Notes")["events"][0]);
        EXPECT_NEAR(notes["events"][1].at("start").get<double>(), film + 18, 1.0 / 384000);
    }
}

/// A curve of those points, in seconds from the start of the film and values.
json curveOf(const std::vector<std::pair<double, double>>& places)
{
    json points = json::array();
    for (const auto& [time, value] : places)
        points.push_back({{"time", Hour + time}, {"value", value}});
    return json::array({{{"number", 1}, {"automates", "volume"}, {"points", points}}});
}

const json& pointsOf(const json& track)
{
    return track["curves"][0]["points"];
}

/// Whether the curves of two tracks have the same value at those times, in seconds from the start of the film.
void expectSameLevel(const json& was, double time, const json& now, double newTime)
{
    EXPECT_NEAR(valueAt(pointsOf(now), Hour + newTime), valueAt(pointsOf(was), Hour + time), 1e-6)
        << time << " to " << newTime;
}

TEST(Keep, OverPictureThatWasReplacedTheAutomationKeepsTheLevelFromBefore)
{
    const Reel replaced = Reel(Hour).shot("A", 100, 10).shot("N", 50, 10).shot("C", 300, 10);
    json sound = soundOfThreeShots();
    sound[0]["curves"] = curveOf({{1, 0.25}, {8, 0.75}, {13, 0.5}, {25, 0.1}, {200, 0.9}});
    const Job job(threeShots(), replaced, sound);

    ASSERT_EQ(job.run().status, 0);

    const json was = trackIn(job.project, "DIA");
    const json now = trackIn(job.result, "DIA");
    for (const double time : {0.0, 5.0, 9.9, 20.1, 24.0, 30.0, 150.0, 300.0})
        expectSameLevel(was, time, now, time);
    for (const double time : {10.1, 15.0, 19.9})
        EXPECT_NEAR(valueAt(pointsOf(now), Hour + time), 0.65, 1e-6) << time;
}

TEST(Keep, OverGrownPictureTheAutomationKeepsTheLevelFromBefore)
{
    // B has lost its first two seconds, and four of a new shot stand before it.
    const Reel grown = Reel(Hour).shot("A", 100, 10).shot("N", 50, 4).shot("B", 202, 8).shot("C", 300, 10);
    json sound = soundOfThreeShots();
    sound[0]["curves"] = curveOf({{9, 0.25}, {11, 0.75}, {13, 0.5}});
    const Job job(threeShots(), grown, sound);

    ASSERT_EQ(job.run().status, 0);

    const json now = trackIn(job.result, "DIA");
    for (const double time : {9.99, 10.01, 12.0, 13.99})
        EXPECT_NEAR(valueAt(pointsOf(now), Hour + time), 0.5, 0.01) << time;
    EXPECT_NEAR(valueAt(pointsOf(now), Hour + 14.01), 0.625, 0.01);
    expectSameLevel(trackIn(job.project, "DIA"), 12.5, now, 14.5);
}

TEST(Keep, ACurveThatGoesOnBeyondTheChangeHasNoStrayPoints)
{
    const Reel lifted = Reel(Hour).shot("A", 100, 10).shot("C", 300, 10);
    const Reel replaced = Reel(Hour).shot("A", 100, 10).shot("N", 50, 10).shot("C", 300, 10);
    const std::vector<std::vector<std::pair<double, double>>> curves{
        {{1, 0.25}, {8, 0.75}, {13, 0.5}, {25, 0.3}},
        {{1, 0.1}, {25, 0.3}, {100, 0.7}},
        {{200, 0.9}, {4000, 0.3}},
        {{-3000, 0.2}, {-100, 0.6}},
        {{8, 0.75}, {15, 0.75}, {15, 0.2}, {25, 0.1}, {80000, 0.7}}};
    for (const Reel& changed : {withInsert(), lifted, replaced}) {
        for (const auto& curve : curves) {
            SCOPED_TRACE(testing::Message() << changed.text() << json(curve));
            json sound = soundOfThreeShots();
            sound[0]["curves"] = curveOf(curve);
            const Job job(threeShots(), changed, sound);

            ASSERT_EQ(job.run().status, 0);

            const json was = pointsOf(trackIn(job.project, "DIA"));
            const json now = pointsOf(trackIn(job.result, "DIA"));
            for (const json& point : was) {
                if (point.at("time") < Hour + 10 || point.at("time") > Hour + 100) {
                    EXPECT_NE(std::find(now.begin(), now.end(), point), now.end()) << point;
                }
            }
            for (const json& point : now) {
                const double time = point.at("time");
                const bool isChanged = Hour + 10 <= time && time <= Hour + 40;
                EXPECT_TRUE(isChanged || std::find(was.begin(), was.end(), point) != was.end()) << point;
            }
        }
    }
}

TEST(Keep, TellsOfSoundThatWouldStandBeforeTheProjectBegins)
{
    const Reel earlier = Reel(Hour - 4).shot("A", 100, 10).shot("B", 200, 10).shot("C", 300, 10);
    // So many seconds after the time origin.
    const auto sound = [](double start) {
        return json::array({audioTrack("DIA", {clip("a", start, start + 10), clip("b", start + 10, start + 20)})});
    };

    const Outcome cut = Job(threeShots(), earlier, sound(0), Hour).run();
    EXPECT_EQ(cut.status, 0) << cut.err;
    EXPECT_TRUE(
        tells(cut.err, "Left out, as it would stand before the project or its day begins: material of event 1."))
        << cut.err;

    const Outcome whole = Job(threeShots(), earlier, sound(4), Hour - 4).run();
    EXPECT_EQ(whole.status, 0) << whole.err;
    EXPECT_FALSE(tells(whole.err, "left out")) << whole.err;
}

TEST(Keep, InRandomProjectsOneChangeLeavesWhatIsBeforeItAndShiftsWhatIsAfter)
{
    constexpr double Change = 40;
    constexpr double Added = 4;
    const Reel before = Reel(Hour).shot("A", 100, Change).shot("B", 1000, 200);
    const Reel after = Reel(Hour).shot("A", 100, Change).shot("N", 50, Added).shot("B", 1000, 200);
    std::size_t stayed = 0;
    std::size_t moved = 0;
    for (std::uint64_t seed = 200; seed < 320; ++seed) {
        SCOPED_TRACE(seed);
        const Job job(before, after, json::array());
        json project = json::parse(randomProjectText(seed, cadrel::core::Framerate(24, 0)));
        project["timeOrigin"] = Hour;
        writeFile(job.project, project.dump());

        const Outcome outcome = job.run({"--force", "--fresh"});

        if (tells(outcome.err, "has no tracks that a run could change"))
            continue;
        ASSERT_EQ(outcome.status, 0) << outcome.err;
        const std::vector<json> tracksBefore = changeableTracks(tracksIn(job.project));
        const std::vector<json> tracksAfter = changeableTracks(tracksIn(job.result));
        ASSERT_GE(tracksAfter.size(), tracksBefore.size());
        for (std::size_t index = 0; index < tracksBefore.size(); ++index) {
            const json& was = tracksBefore[index];
            const json now = tracksAfter[index].value("events", json::array());
            if (was.value("locked", false)) {
                EXPECT_EQ(tracksAfter[index], was);
                continue;
            }
            for (const json& event : was.value("events", json::array())) {
                if (endOf(event) < Change) {
                    EXPECT_TRUE(holds(now, event, 0.0)) << event;
                    ++stayed;
                } else if (event.at("start").get<double>() > Change) {
                    EXPECT_TRUE(holds(now, event, Added)) << event;
                    ++moved;
                }
            }
        }
    }
    EXPECT_GT(stayed, 100U);
    EXPECT_GT(moved, 100U);
}

TEST(Keep, PopAndTailFollowTheirOwnReelAndOtherReelsStay)
{
    // The first reel gets four seconds longer; the second begins at its own hour and is trimmed at its head.
    Reel oldReels = threeShots();
    oldReels.at(2 * Hour).shot("D", 400, 10).shot("E", 500, 10);
    Reel newReels = withInsert();
    newReels.at(2 * Hour).shot("D", 402, 8).shot("E", 500, 10);
    json sound = soundOfThreeShots();
    for (const json& more : {clip("pop 2", 2 * Hour - 2, 2 * Hour - 1), clip("d", 2 * Hour + 2, 2 * Hour + 10),
                             clip("e", 2 * Hour + 10, 2 * Hour + 20), clip("tail 2", 2 * Hour + 21, 2 * Hour + 22),
                             clip("reel 3", 3 * Hour, 3 * Hour + 5)})
        sound[0]["events"].push_back(more);
    const Job job(oldReels, newReels, sound);

    EXPECT_EQ(job.run().status, 0);

    EXPECT_EQ(placesOn("DIA", job.result),
              (Words{"pop 3598-3599", "a 3600-3610", "b 3614-3624", "c 3624-3634", "tail 3635-3637", "pop 2 7198-7199",
                     "d 7200-7208", "e 7208-7218", "tail 2 7219-7220", "reel 3 10800-10805"}));
}

TEST(Keep, OfTheSmallExampleEachReelMovesWithItsPopAndItsTail)
{
    const TempFolder folder;
    const std::string example = treePath("examples/tworeels/");
    const auto result = folder / "result.stage";

    const Outcome outcome = runCadrel({"apply", example + "tworeels.stage", "--old", example + "old.edl", "--new",
                                       example + "new.edl", "-o", result, "--clips"});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_EQ(outcome.err, "");
    // In seconds from 00:59:00:00 on.
    EXPECT_EQ(placesOn("FX", result),
              (Words{"leader 52-57", "2-pop 58-58.5", "pier 60-70", "lamp 74-84", "lamp goes out 84.5-85.5",
                     "boat 86-96", "tail pop 98-98.5", "leader 2 3652-3657", "2-pop 2 3658-3658.5", "stairs 3660-3670",
                     "door 3670-3678", "tail pop 2 3680-3680.5"}));
    // Its page shows the report as it is.
    const std::string moves = outcome.out.substr(outcome.out.find("FX (audio)\n  was in"));
    EXPECT_TRUE(tells(contentOf(example + "README.md"), moves.substr(0, moves.find("\n\n")))) << moves;
}

TEST(Keep, OfTheSmallExampleEachReelMovesWithItsPopAndItsTailThoughAClipSpansBoth)
{
    const TempFolder folder;
    const std::string example = treePath("examples/tworeels/");
    json project = json::parse(contentOf(example + "tworeels.stage"));
    project["tracks"].push_back(audioTrack("Old video", {clip("old video", 60, 3680)}));
    const std::string file = folder.write("spanned.stage", project.dump());
    const auto result = folder / "result.stage";

    const Outcome outcome =
        runCadrel({"apply", file, "--old", example + "old.edl", "--new", example + "new.edl", "-o", result});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(placesOn("FX", result),
              (Words{"leader 52-57", "2-pop 58-58.5", "pier 60-70", "lamp 74-84", "lamp goes out 84.5-85.5",
                     "boat 86-96", "tail pop 98-98.5", "leader 2 3652-3657", "2-pop 2 3658-3658.5", "stairs 3660-3670",
                     "door 3670-3678", "tail pop 2 3680-3680.5"}));
    // Reel 1 has grown by four seconds, for which the gap has no room; reel 2 has lost two seconds.
    EXPECT_EQ(placesOn("Old video", result),
              (Words{"old video 60-70", "old video 74-3652", "old video 3652-3670", "old video 3670-3678"}));
    EXPECT_TRUE(tells(outcome.out, "01:59:48:00")) << outcome.out;
    EXPECT_TRUE(tells(outcome.out, "01:59:52:00")) << outcome.out;
}

TEST(Keep, TheReportHoldsWhereEachStretchOfTheListIsFrom)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());

    const json report = job.report();

    ASSERT_EQ(report.at("events").size(), 1U);
    EXPECT_EQ(report["events"][0].at("srcIn"), "01:00:10:00");
    EXPECT_EQ(report["events"][0].at("dstIn"), "01:00:14:00");
    Words from;
    for (const json& part : report["events"][0].at("parts"))
        from.push_back(part.at("srcIn").get<std::string>() + " " + part.at("from").get<std::string>());
    ASSERT_GE(from.size(), 2U);
    EXPECT_EQ(from.front(), "01:00:10:00 cut");
    EXPECT_EQ(from.back(), "01:00:30:00 black");
    // What stays is covered, though it stands in no event: 30 of 34 seconds.
    EXPECT_EQ(report.at("programmeFrames"), 34 * 24);
    EXPECT_EQ(report.at("coveredFrames"), 30 * 24);
    EXPECT_EQ(report.at("lost"), json::array());
}

TEST(Keep, AReplacedShotLosesItsSoundThoughTheListToCarryOutIsEmpty)
{
    const Reel replaced = Reel(Hour).shot("A", 100, 10).shot("N", 50, 10).shot("C", 300, 10);
    const Job job(threeShots(), replaced, soundOfThreeShots());

    const json report = job.report();

    EXPECT_TRUE(report.at("runNeeded").get<bool>());
    EXPECT_EQ(report.at("events"), json::array());
    EXPECT_EQ(report.at("applied"), 0);
    EXPECT_EQ(placesOn("DIA", job.result), (Words{"pop 3598-3599", "a 3600-3610", "c 3620-3630", "tail 3631-3633"}));
    ASSERT_EQ(report.at("markers").size(), 1U) << report.at("markers");
    EXPECT_EQ(report["markers"][0].at("kind"), "Insert");
    EXPECT_EQ(report["markers"][0].at("in").at("timecode"), "01:00:10:00");
    EXPECT_EQ(report["markers"][0].at("out").at("timecode"), "01:00:20:00");
}

TEST(Keep, AFilmOfFreezesIsKeptThoughTheChangeEdlIsEmpty)
{
    const Reel stills = Reel(Hour).freeze("A", 100, 10).freeze("B", 200, 10);
    const Job job(stills, stills, json::array({audioTrack("DIA", {clip("a", Hour, Hour + 20)})}));

    const json report = job.report();

    EXPECT_FALSE(report.at("runNeeded").get<bool>());
    EXPECT_EQ(tracksIn(job.result), tracksIn(job.project));
    const Outcome cutAlone = job.run({"--keep", "cut"});
    EXPECT_EQ(cutAlone.status, 1);
    EXPECT_TRUE(tells(cutAlone.err, "nothing of the old cut survives in the new one")) << cutAlone.err;
}

TEST(Keep, TheChangeEdlAloneCountsWhereThatIsAskedFor)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());

    EXPECT_EQ(job.run({"--keep", "cut"}).status, 0);

    EXPECT_EQ(placesOn("DIA", job.result), (Words{"a 3600-3610", "b 3614-3624", "c 3624-3634"}));
}

TEST(Keep, TheRangeThatTheUserPreservesIsStoredAndNotThatOfTheRun)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());

    const Outcome without = job.run();
    EXPECT_TRUE(tells(without.out, "--no-preserve")) << without.out;
    const Outcome again = runCadrel({"apply", job.result, "--old", job.newFile, "--new", job.newFile});
    EXPECT_TRUE(tells(again.out, "--no-preserve")) << again.out << again.err;

    const Outcome with = job.run({"--preserve", "01:00:00:00", "01:00:20:00"});
    EXPECT_TRUE(tells(with.out, "Settings    command line  --preserve 01:00:00:00 01:00:20:00\n")) << with.out;
    // Up to 20 the run changes what has moved; "c" stays where it was.
    EXPECT_EQ(placesOn("DIA", job.result),
              (Words{"pop 3598-3599", "a 3600-3610", "b 3614-3620", "c 3620-3630", "tail 3631-3633"}));
}

TEST(Keep, AChangeOutsideOfTheStretchThatMayChangeIsToldAsSuch)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());

    const Outcome outcome = job.run({"--preserve", "01:00:00:00", "01:00:10:00"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_TRUE(tells(outcome.out,
                      "Applied     nothing, since all that would change lies outside of the stretch that may change\n"))
        << outcome.out;
    EXPECT_EQ(tracksIn(job.result), tracksIn(job.project));
}

TEST(Keep, OutsideOfTheHullOfAGivenChangeEdlNothingIsTouched)
{
    // The two halves of B change places.
    const Job job(threeShots(), threeShots(), soundOfThreeShots());
    const auto change = job.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "B", "01:00:15:00 01:00:20:00", "01:00:10:00 01:00:15:00") +
                          cut("002", "B", "01:00:10:00 01:00:15:00", "01:00:15:00 01:00:20:00"));

    const Outcome outcome = runCadrel({"apply", job.project, "--change", change, "-o", job.result, "--overwrite"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_EQ(placesOn("DIA", job.result),
              (Words{"pop 3598-3599", "a 3600-3610", "b 3610-3615", "b 3615-3620", "c 3620-3630", "tail 3631-3633"}));
    const json events = trackIn(job.result, "DIA").at("events");
    EXPECT_EQ(events[2].at("offset"), 5.0);
    EXPECT_EQ(events[1], trackIn(job.project, "DIA").at("events")[1]);
}

TEST(Keep, WhatStandsInTheWayOfAGivenChangeEdlIsRefusedWithItsAmount)
{
    const Job job(threeShots(), threeShots(), soundOfThreeShots());
    const auto change = job.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "B", "01:00:10:00 01:00:20:00", "01:00:14:00 01:00:24:00"));

    const Outcome refused = runCadrel({"apply", job.project, "--change", change, "-o", job.result, "--overwrite"});

    EXPECT_EQ(refused.status, 1);
    EXPECT_EQ(refused.err, "cadrel: " + change.string() +
                               ": 00:00:04:00 of sound or markers, from 01:00:20:00 on, stand where the change EDL "
                               "puts its stretches; make room for them, or give --force to let the cut win\n");
    EXPECT_FALSE(std::filesystem::exists(job.result));
    const Outcome forced =
        runCadrel({"apply", job.project, "--change", change, "--force", "-o", job.result, "--overwrite"});
    EXPECT_EQ(forced.status, 0) << forced.err;
    EXPECT_EQ(forced.err, "cadrel: " + change.string() +
                              ": warning: 00:00:04:00 of sound or markers, from 01:00:20:00 on, stand where the change "
                              "EDL puts its stretches; --force goes on all the same\n");
    EXPECT_TRUE(tells(forced.out, "Lost        01:00:20:00 - 01:00:24:00, which the change EDL carries nowhere\n"))
        << forced.out;
    EXPECT_EQ(placesOn("DIA", job.result),
              (Words{"pop 3598-3599", "a 3600-3610", "b 3614-3624", "c 3624-3630", "tail 3631-3633"}));
}

TEST(Keep, UnequalNumbersOfReelsAreAQuestion)
{
    Reel oldReels = threeShots();
    oldReels.at(2 * Hour).shot("D", 400, 10);
    const Job job(oldReels, threeShots(), json::array({audioTrack("DIA", {clip("all", Hour, 2 * Hour + 10)})}));

    const std::string question = "the old cut has 2 reels (01:00:00:00 - 01:00:30:00, 02:00:00:00 - 02:00:10:00), and "
                                 "the new cut has 1 reel (01:00:00:00 - 01:00:30:00); ";
    const Outcome outcome = job.run();

    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(tells(outcome.err, question)) << outcome.err;
    EXPECT_FALSE(std::filesystem::exists(job.result));
    const Outcome forced = job.run({"--force"});
    EXPECT_EQ(forced.status, 0);
    EXPECT_TRUE(tells(forced.err, "warning: " + question + "--force goes on all the same\n")) << forced.err;
}

TEST(Keep, MaterialPastTheDayThatWouldHaveToMoveIsRefusedUnlessItsTrackStays)
{
    const double late = 24 * Hour - 40;
    const Reel before = Reel(late).shot("A", 100, 10).shot("B", 200, 20);
    const Reel after = Reel(late).shot("A", 100, 10).shot("N", 50, 4).shot("B", 200, 20);
    json sound = audioTrack("DIA", {clip("a", late, late + 30), clip("tail", late + 35, late + 45)});
    const Job job(before, after, json::array({sound}));

    const Outcome outcome = job.run({"--force"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(
        tells(outcome.err, "no timecode of a day names their place; move them into the day, or lock their tracks"))
        << outcome.err;
    sound["locked"] = true;
    writeFile(job.project, projectOf(json::array({sound, audioTrack("FX", {clip("b", late, late + 30)})})));
    EXPECT_EQ(job.run().status, 0);
    EXPECT_EQ(trackIn(job.result, "DIA"), trackIn(job.project, "DIA"));
}

TEST(Keep, OfTracksThatAreNotSelectedNothingCounts)
{
    const double late = 24 * Hour - 40;
    const Reel before = Reel(late).shot("A", 100, 10).shot("B", 200, 20);
    const Reel after = Reel(late).shot("A", 100, 10).shot("N", 50, 4).shot("B", 200, 20);
    json selected = audioTrack("DIA", {clip("a", late, late + 30)});
    selected["selected"] = true;
    const json other = audioTrack("FX", {clip("tail", late + 35, late + 45)});
    const Job job(before, after, json::array({selected, other}));

    EXPECT_EQ(job.run({"--tracks", "selected"}).status, 0);

    EXPECT_EQ(trackIn(job.result, "FX"), trackIn(job.project, "FX"));
}

TEST(Keep, ATailThatFindsNoRoomIsToldAsLost)
{
    // The tail of the first reel fills the gap to the second, which gets ten seconds shorter.
    const Reel before = Reel(Hour).shot("A", 100, 10).at(Hour + 80).shot("B", 200, 10);
    const Reel after = Reel(Hour).shot("A", 100, 10).at(Hour + 70).shot("B", 200, 10);
    const Job job(before, after, json::array({audioTrack("DIA", {clip("a", Hour, Hour + 90)})}));

    const json report = job.report();

    ASSERT_EQ(report.at("lost").size(), 1U);
    EXPECT_EQ(report["lost"][0].at("in").at("timecode"), "01:01:10:00");
    EXPECT_EQ(report["lost"][0].at("out").at("timecode"), "01:01:20:00");
}

TEST(Keep, OfManyStretchesThatAreLostTenAreListedAndTheRestIsCounted)
{
    const auto lossesOf = [](int count) {
        // Of each shot a part is named by the change EDL, and the clips between those parts go.
        std::string change = "TITLE: CHANGE\n";
        std::vector<json> clips;
        for (int index = 0; index <= count; ++index) {
            const double start = Hour + 10 * index;
            change += cut("001", "A", timecode(start) + " " + timecode(start + 5),
                          timecode(start + 3600) + " " + timecode(start + 3605));
            clips.push_back(clip("a", start + 6, start + 8));
        }
        clips.pop_back();
        const Job job(threeShots(), threeShots(), json::array({audioTrack("DIA", clips)}));
        const Outcome outcome =
            runCadrel({"apply", job.project, "--change", job.folder.write("change.edl", change), "--force"});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return outcome.out;
    };

    EXPECT_FALSE(tells(lossesOf(10), "--json lists them all"));
    EXPECT_TRUE(
        tells(lossesOf(11), "which the change EDL carries nowhere\n            and 1 more; --json lists them all\n"));
}

/// Whether a run is refused with those words, writes nothing, and goes on when it is forced.
void expectDoubt(const Job& job, const std::string& words)
{
    const Outcome outcome = job.run();
    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_TRUE(tells(outcome.err, words)) << outcome.err;
    EXPECT_FALSE(std::filesystem::exists(job.result));
    const Outcome forced = job.run({"--force"});
    EXPECT_EQ(forced.status, 0) << forced.err;
    EXPECT_TRUE(tells(forced.err, "warning: " + words.substr(0, words.find(';')))) << forced.err;
    EXPECT_TRUE(tells(forced.err, "; --force goes on all the same\n")) << forced.err;
}

/// Runs, and puts the result in the place of the project.
void carryOver(const Job& job, const Words& words)
{
    Words all{"apply", job.project, "--in-place"};
    all.insert(all.end(), words.begin(), words.end());
    const Outcome outcome = runCadrel(all);
    ASSERT_EQ(outcome.status, 0) << outcome.err;
}

void expectRefusedAgain(const Job& job, const Words& words, const std::string& why)
{
    Words all{"apply", job.project};
    all.insert(all.end(), words.begin(), words.end());
    const Outcome outcome = runCadrel(all);
    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(tells(outcome.err, why)) << outcome.err;
    all.emplace_back("--force");
    EXPECT_EQ(runCadrel(all).status, 0);
}

TEST(Plausibility, TheSameRunTwiceIsRefusedWhereverTheChangeIs)
{
    const Reel longer = threeShots().shot("D", 400, 10);
    const Reel shorter = Reel(Hour).shot("A", 100, 10).shot("B", 200, 10);
    const Reel trimmed = Reel(Hour).shot("A", 100, 10).shot("B", 200, 10).shot("C", 300, 9);
    const Reel lifted = Reel(Hour).shot("A", 100, 10).at(Hour + 20).shot("C", 300, 10);
    const Reel later = Reel(Hour + 2).shot("A", 102, 8).shot("B", 200, 10).shot("C", 300, 10);
    const std::vector<std::pair<Reel, std::string>> changes{{withInsert(), "01:00:10:00"}, {longer, "01:00:30:00"},
                                                            {shorter, "01:00:20:00"},      {trimmed, "01:00:29:00"},
                                                            {lifted, "01:00:10:00"},       {later, "01:00:00:00"}};
    for (const auto& [changed, place] : changes) {
        SCOPED_TRACE(place);
        const Job job(threeShots(), changed, soundOfThreeShots());
        const Words words{"--old", job.oldFile, "--new", job.newFile};
        carryOver(job, words);

        expectRefusedAgain(
            job, words, "was last carried over to another cut than the old one given; they differ first at " + place);
    }
}

TEST(Plausibility, ReelOneAgainAfterReelTwoIsRefused)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());
    json project = json::parse(contentOf(job.project));
    project["tracks"][0]["events"].push_back(clip("d", 2 * Hour, 2 * Hour + 20));
    writeFile(job.project, project.dump());
    const auto oldFile = job.folder.write("old2.edl", Reel(2 * Hour).shot("D", 400, 10).shot("E", 500, 10).text());
    const auto newFile = job.folder.write("new2.edl", Reel(2 * Hour).shot("D", 400, 10).shot("E", 502, 8).text());
    const auto next = job.folder.write("next.edl", Reel(Hour).shot("A", 100, 10).shot("N", 50, 4).text());
    const Words first{"--old", job.oldFile, "--new", job.newFile};
    const Words second{"--old", oldFile, "--new", newFile};
    carryOver(job, first);
    carryOver(job, second);

    expectRefusedAgain(job, first, "they differ first at 01:00:10:00");
    expectRefusedAgain(job, second, "they differ first at 02:00:10:00");
    // From where it is now it goes on.
    carryOver(job, {"--old", job.newFile, "--new", next, "--force"});
    carryOver(job, {"--old", next, "--new", job.newFile});
}

TEST(Plausibility, APartOfTheCutThatTheProjectHasIsNoDoubt)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());
    carryOver(job, {"--old", job.oldFile, "--new", job.newFile});
    const auto part = job.folder.write("part.edl", Reel(Hour + 14).shot("B", 200, 10).text());
    const auto shorter = job.folder.write("shorter.edl", Reel(Hour + 14).shot("B", 200, 8).text());

    carryOver(job, {"--old", part, "--new", shorter});
}

TEST(Plausibility, EventsThatAreFlawedCompareEqualWithThoseThatTheProjectStores)
{
    Reel flawed = threeShots();
    const Job job(flawed, flawed, soundOfThreeShots());
    writeFile(job.oldFile, flawed.text() + cut("004", "D", "xx:00:00:00 00:00:10:00", "01:00:30:00 01:00:35:00") +
                               cut("005", "E", "00:00:99:00 00:01:00:00", "01:00:35:00 01:00:40:00"));
    const Words words{"--old", job.oldFile, "--new", job.oldFile};
    carryOver(job, words);

    carryOver(job, words);
}

TEST(Plausibility, TheSameChangeEdlTwiceIsRefused)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());
    const auto change = job.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "B", "01:00:15:00 01:00:20:00", "01:00:10:00 01:00:15:00") +
                          cut("002", "B", "01:00:10:00 01:00:15:00", "01:00:15:00 01:00:20:00"));
    const auto other = job.folder.write(
        "other.edl", "TITLE: CHANGE\n" + cut("001", "C", "01:00:20:00 01:00:25:00", "01:00:25:00 01:00:30:00") +
                         cut("002", "C", "01:00:25:00 01:00:30:00", "01:00:20:00 01:00:25:00"));
    const std::string why = "has been carried out in the project already";
    carryOver(job, {"--change", change});

    expectRefusedAgain(job, {"--change", change}, why);
    carryOver(job, {"--change", other});
    expectRefusedAgain(job, {"--change", change}, why);
    expectRefusedAgain(job, {"--change", other}, why);
}

TEST(Plausibility, TheChangeEdlOfTwoCutsAndTheCutsThemselvesAreTheSameRun)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());
    const std::string change = job.folder / "change.edl";
    const Words cuts{"--old", job.oldFile, "--new", job.newFile};
    Words generate{"generate", "--rate", "24 fps", "-o", change};
    generate.insert(generate.end(), cuts.begin(), cuts.end());
    ASSERT_EQ(runCadrel(generate).status, 0);
    const std::string untouched = contentOf(job.project);
    const std::string why = "has been carried out in the project already";

    carryOver(job, cuts);
    expectRefusedAgain(job, {"--change", change}, why);
    writeFile(job.project, untouched);
    carryOver(job, {"--change", change, "--force"});
    expectRefusedAgain(job, cuts, why);
}

TEST(Plausibility, ARestrictedRunIsKnownForWhatItIs)
{
    const Reel changed =
        Reel(Hour).shot("N", 50, 2).shot("A", 102, 8).shot("B", 200, 10).shot("C", 300, 8).shot("M", 60, 2);
    const Job job(threeShots(), changed, soundOfThreeShots());
    const Words cuts{"--old", job.oldFile, "--new", job.newFile};
    const auto within = [&](const Words& range) {
        Words words = cuts;
        words.insert(words.end(), {"--preserve"});
        words.insert(words.end(), range.begin(), range.end());
        return words;
    };
    const auto later = job.folder.write(
        "later.edl",
        Reel(Hour).shot("N", 50, 2).shot("A", 102, 8).shot("B", 200, 9).shot("C", 300, 8).shot("M", 60, 2).text());
    carryOver(job, within({"01:00:00:00", "01:00:15:00"}));

    // Neither is the sound as it was before, nor all of it as it is to be.
    expectRefusedAgain(job, within({"01:00:00:00", "01:00:15:00"}), "they differ first at 01:00:00:00");
    expectRefusedAgain(job, {"--old", job.newFile, "--new", later, "--no-preserve"},
                       "they differ first at 01:00:28:00");
    // The rest of the change goes on from there, and then a further cut does.
    carryOver(job, within({"01:00:15:00", "01:00:30:00"}));
    EXPECT_EQ(placesOn("DIA", job.project),
              (Words{"pop 3598-3599", "a 3602-3610", "b 3610-3620", "c 3620-3628", "tail 3631-3633"}));
    carryOver(job, {"--old", job.newFile, "--new", later, "--no-preserve"});
}

TEST(Plausibility, ARunThatAppliedNothingUnderARestrictedRangeIsNoRunOfTheWholeChange)
{
    const Job job(threeShots(), withInsert(), soundOfThreeShots());
    const Words cuts{"--old", job.oldFile, "--new", job.newFile};
    Words restricted = cuts;
    restricted.insert(restricted.end(), {"--preserve", "01:00:00:00", "01:00:10:00"});
    carryOver(job, restricted);

    expectRefusedAgain(job, {"--old", job.newFile, "--new", job.oldFile, "--no-preserve"},
                       "they differ first at 01:00:10:00");
    Words whole = cuts;
    whole.emplace_back("--no-preserve");
    carryOver(job, whole);
    EXPECT_EQ(placesOn("DIA", job.project),
              (Words{"pop 3598-3599", "a 3600-3610", "b 3614-3624", "c 3624-3634", "tail 3635-3637"}));
}

TEST(Plausibility, ReelTwoAfterReelOneIsNoDoubt)
{
    json sound = soundOfThreeShots();
    sound[0]["events"].push_back(clip("d", 2 * Hour, 2 * Hour + 20));
    const Job job(threeShots(), withInsert(), sound);
    ASSERT_EQ(job.run().status, 0);
    const auto oldFile = job.folder.write("old2.edl", Reel(2 * Hour).shot("D", 400, 10).shot("E", 500, 10).text());
    const auto newFile = job.folder.write("new2.edl", Reel(2 * Hour).shot("D", 400, 10).shot("E", 502, 8).text());

    const Outcome outcome = runCadrel({"apply", job.result, "--old", oldFile, "--new", newFile});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
}

TEST(Plausibility, CutsWithoutACommonNameAreRefused)
{
    expectDoubt({threeShots(), Reel(Hour).shot("X", 100, 10).shot("Y", 200, 10), soundOfThreeShots()},
                "the old and the new cut have no name in common; see that both are of one reel, try --match or --vfx");
}

TEST(Plausibility, LessThanHalfThatSurvivesIsRefused)
{
    // 15 of 30 seconds are half, a frame less isn't.
    const auto half = Reel(Hour).shot("A", 100, 10).shot("B", 200, 5).shot("N", 0, 15);
    EXPECT_EQ(Job(threeShots(), half, soundOfThreeShots()).run().status, 0);

    const auto less = Reel(Hour).shot("A", 100, 10).shot("B", 200, 5 - 1.0 / 24).shot("N", 0, 15);
    expectDoubt({threeShots(), less, soundOfThreeShots()},
                "only 00:00:14:23 of the 00:00:30:00 of the old cut survive");
}

TEST(Plausibility, LessThanHalfWithSoundIsRefused)
{
    const auto soundUpTo = [](double end) { return json::array({audioTrack("DIA", {clip("a", Hour, Hour + end)})}); };

    EXPECT_EQ(Job(threeShots(), withInsert(), soundUpTo(15)).run().status, 0);
    expectDoubt({threeShots(), withInsert(), soundUpTo(15 - 1.0 / 24)},
                "has sound under 00:00:14:23 of the 00:00:30:00 of the old cut only");
}

TEST(Plausibility, NamesThatTellNothingAreWarnedOf)
{
    const auto film = [](const std::string& roll) {
        return Reel(Hour).shot(roll, 100, 10).shot(roll, 200, 10).shot(roll, 300, 10);
    };
    const Outcome outcome = Job(film("AX"), film("AX"), soundOfThreeShots()).run();

    EXPECT_EQ(outcome.status, 0);
    EXPECT_TRUE(tells(outcome.err, "6 of 6 events have the roll name AX, which doesn't tell one material from another; "
                                   "try --match clip\n"))
        << outcome.err;
    EXPECT_TRUE(tells(outcome.out, "Match       roll names that tell the material: 0 of 6 events, 0 %\n"))
        << outcome.out;
}

TEST(Plausibility, OneNameForAllOfThreeEventsIsWarnedOf)
{
    const json sound = json::array({audioTrack("DIA", {clip("a", Hour, Hour + 20)})});
    const Reel one = Reel(Hour).shot("SAME", 100, 10);
    const Reel two = Reel(Hour).shot("SAME", 100, 10).shot("SAME", 200, 10);

    EXPECT_TRUE(tells(Job(one, two, sound).run().err, "3 of 3 events have the roll name SAME"));
    EXPECT_EQ(Job(one, one, sound).run().err, "");
}

TEST(Plausibility, OneNameForHalfOfTheEventsIsWarnedOf)
{
    const auto film = [](int sameNames) {
        Reel reel(Hour);
        for (int shot = 0; shot < 4; ++shot)
            reel.shot(shot < sameNames ? std::string("SAME") : std::string("R").append(std::to_string(shot)),
                      100.0 * (shot + 1), 10);
        return reel;
    };
    const json sound = json::array({audioTrack("DIA", {clip("a", Hour, Hour + 40)})});

    const Outcome half = Job(film(2), film(2), sound).run();
    EXPECT_TRUE(tells(half.err, "4 of 8 events have the roll name SAME")) << half.err;
    EXPECT_TRUE(tells(half.out, "Match       roll names that tell the material: 4 of 8 events, 50 %\n")) << half.out;
    EXPECT_EQ(Job(film(2), film(1), sound).run().err, "");
}

/// Two files of one cut that both begin at 01:00:00:00.
struct TwoReels {
    const TempFolder folder;
    const std::string first = folder.write("r1.edl", Reel(Hour).shot("A", 100, 10).shot("B", 200, 10).text());
    const std::string second = folder.write("r2.edl", Reel(Hour).shot("C", 300, 10).shot("D", 400, 10).text());
    const std::string project = folder.write(
        "job.stage",
        projectOf(json::array({audioTrack("DIA", {clip("1", Hour, Hour + 20), clip("2", 2 * Hour, 2 * Hour + 20)})})));
};

TEST(Shift, FilesOfOneCutOnTheSameTimecodeAreRefusedWithTheShiftThatPartsThem)
{
    const TwoReels reels;
    Words words{"apply", reels.project, "--old", reels.first, reels.second, "--new", reels.first, reels.second};

    const Outcome refused = runCadrel(words);

    EXPECT_EQ(refused.status, 1);
    EXPECT_EQ(refused.err, "cadrel: " + reels.second +
                               ": lies on the same timecode as another file of its cut; give --shift " + reels.second +
                               "=+01:00:00:00\n");
    words.insert(words.end(), {"--shift", "r2.edl=+01:00:00:00"});
    const Outcome parted = runCadrel(words);
    EXPECT_EQ(parted.status, 0) << parted.err;
    EXPECT_EQ(parted.err, "");
}

TEST(Shift, AtTheEndOfTheDayFilesArePartedBackwards)
{
    const TempFolder folder;
    const auto first = folder.write("r1.edl", Reel(23 * Hour).shot("A", 100, 10).text());
    const auto second = folder.write("r2.edl", Reel(23 * Hour).shot("B", 100, 10).text());

    const Outcome outcome = runCadrel({"generate", "--rate", "24 fps", "--old", first, second, "--new", first});

    EXPECT_EQ(outcome.status, 0);
    EXPECT_TRUE(tells(outcome.err, "give --shift " + second.string() + "=-01:00:00:00")) << outcome.err;
}

TEST(Shift, FilesOfOneNameOnBothSidesArePartedByTheirPaths)
{
    const TempFolder folder;
    const std::string first = Reel(Hour).shot("A", 100, 10).text();
    const std::string second = Reel(Hour).shot("B", 100, 10).text();
    Words words{"generate", "--rate", "24 fps", "-o", folder / "change.edl"};
    Words shifts;
    for (const char* side : {"old", "new"}) {
        std::filesystem::create_directory(folder / side);
        const std::string name = folder / side;
        writeFile(name + "/r1.edl", first);
        writeFile(name + "/r2.edl", second);
        words.insert(words.end(), {std::string("--") + side, name + "/r1.edl", name + "/r2.edl"});
        shifts.insert(shifts.end(), {"--shift", name + "/r2.edl=+01:00:00:00"});
    }

    const Outcome warned = runCadrel(words);
    for (const std::size_t index : {1U, 3U})
        EXPECT_TRUE(tells(warned.err, "give --shift " + shifts[index] + "\n")) << warned.err;
    words.insert(words.end(), shifts.begin(), shifts.end());
    words.push_back("--overwrite");
    const Outcome parted = runCadrel(words);

    EXPECT_EQ(parted.status, 0);
    EXPECT_EQ(parted.err, "");
}

TEST(Shift, MovesTheTimecodesOfItsFileAloneInEveryCommand)
{
    const TwoReels reels;

    const Outcome list = runCadrel({"list", "--rate", "24 fps", reels.first, reels.second, "--shift",
                                    reels.second + "=-00:30:00:12", "--json", "-"});

    ASSERT_EQ(list.status, 0) << list.err;
    const json events = json::parse(list.out).at("events");
    EXPECT_EQ(events[0].at("dstIn"), "01:00:00:00");
    EXPECT_EQ(events[2].at("dstIn"), "00:29:59:12");
    EXPECT_EQ(events[2].at("srcIn"), "00:05:00:00");
    EXPECT_EQ(events[3].at("dstOut"), "00:30:19:12");
    const Outcome generate = runCadrel({"generate", "--rate", "24 fps", "--old", reels.first, "--new", reels.second,
                                        reels.first, "--shift", "r2.edl=+02:00:00:00", "--json", "-"});
    ASSERT_EQ(generate.status, 0) << generate.err;
    EXPECT_EQ(generate.err, "");
    const Outcome notes = runCadrel({"notes", "--rate", "24 fps", "--old", reels.first, reels.second, "--new",
                                     reels.first, reels.second, "--shift", "r2.edl=+02:00:00:00"});
    EXPECT_EQ(notes.status, 0);
    EXPECT_EQ(notes.err, "");
}

TEST(Shift, WhatIsNoShiftIsWrongUsage)
{
    const TwoReels reels;
    const auto refusal = [&](const std::string& shift) {
        const Outcome outcome = runCadrel({"list", "--rate", "24 fps", reels.first, reels.second, "--shift", shift});
        EXPECT_EQ(outcome.status, 2) << shift;
        return outcome.err;
    };

    EXPECT_TRUE(tells(refusal("r2.edl"), "has no timecode after the file"));
    EXPECT_TRUE(tells(refusal("r2.edl=01:00:00:00"), "has no + or - and timecode"));
    EXPECT_TRUE(tells(refusal("r2.edl=+1 hour"), "has no + or - and timecode"));
    EXPECT_TRUE(tells(refusal("r3.edl=+01:00:00:00"), "names no EDL of this run"));
    const Outcome beyond = runCadrel({"list", "--rate", "24 fps", reels.first, "--shift", "r1.edl=-01:00:00:01"});
    EXPECT_EQ(beyond.status, 1);
    EXPECT_TRUE(tells(beyond.err, "would leave the 24 hours of a day")) << beyond.err;
    EXPECT_EQ(runCadrel({"list", "--rate", "24 fps", reels.first, "--shift", "r1.edl=-01:00:00:00"}).status, 0);
}

} // namespace
