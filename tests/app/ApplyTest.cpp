// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/SoundProject.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <gtest/gtest.h>
#include <map>
#include <nlohmann/json.hpp>
#include <stdexcept>
#include <string_view>
#include <sys/resource.h>
#include <utility>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

using Words = std::vector<std::string>;
/// By the names of the clips: where the pieces of each lie, as "in-out", or "in-out from" behind the start of its file.
using Places = std::map<std::string, Words>;

/// Where 01:00:00:00 stands in the project: at its very start, or an hour behind.
enum class Origin { AtTheFilm, AtMidnight };
constexpr std::array Origins{Origin::AtTheFilm, Origin::AtMidnight};

std::string number(double value)
{
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%.17g", value);
    return text.data();
}

/// The sound of the film of Film.h as it fits the old cut, its times in seconds behind 01:00:00:00. TWO has lost 10 to 12, and
/// four seconds have come in before THREE:
///
///     old cut   0--- ONE ---10----- TWO ----20----- THREE ----30
///                |       |   \xx\      \      \           |
///     new cut   0--- ONE ---10-- TWO --18-- NEW --22----- THREE ----32
class Scene {
public:
    explicit Scene(Origin origin = Origin::AtTheFilm)
        : oldFile(folder.write("old.edl", oldCut())), newFile(folder.write("new.edl", newCut())),
          m_film(origin == Origin::AtTheFilm ? 0.0 : 3600.0)
    {
        project = folder.write("scene.stage", text());
    }

    Words arguments(const Words& more = {}) const
    {
        Words words{"apply", project, "--old", oldFile, "--new", newFile};
        words.insert(words.end(), more.begin(), more.end());
        return words;
    }
    Outcome apply(const Words& more = {}) const { return runCadrel(arguments(more)); }
    json applyAsJson(Words more = {}) const
    {
        more.insert(more.end(), {"--json", "-"});
        const Outcome outcome = apply(more);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return json::parse(outcome.out);
    }

    const TempFolder folder;
    const std::string oldFile;
    const std::string newFile;
    std::string project;

private:
    std::string at(double seconds) const { return number(m_film + seconds); }
    std::string clip(const std::string& name, double start, double end, int file = 1) const
    {
        return R"({"kind": "clip", "start": )" + at(start) + R"(, "end": )" + at(end) + R"(, "clip": )" +
               std::to_string(file) + R"(, "name": ")" + name + R"("})";
    }
    std::string memo(const std::string& name, double start) const
    {
        return R"({"kind": "point", "start": )" + at(start) + R"(, "name": ")" + name + R"("})";
    }
    std::string text() const
    {
        return R"({"format": "stage", "version": 1, "framesPerSecond": 24, "dropFrame": false, "pulledDown": false,
          "timeOrigin": )" +
               number(3600.0 - m_film) + R"(, "end": )" + at(60) + R"(, "position": 0, "leftLocator": 0,
          "rightLocator": 0, "cycleStart": 0, "cycleEnd": 0,
          "pool": [
            {"number": 1, "kind": "audio", "name": "boom", "path": "boom.wav", "length": 100},
            {"number": 2, "kind": "audio", "name": "step", "path": "step.wav", "length": 10}
          ],
          "tracks": [
            {"kind": "folder", "name": "Dialogue", "tracks": [
              {"kind": "audio", "name": "DIA", "selected": true,
               "curves": [{"number": 1, "automates": "volume", "points": [{"time": )" +
               at(13) + R"(, "value": 0.25}, {"time": )" + at(16) + R"(, "value": 0.75}]}],
               "events": [)" +
               clip("hello", 1, 4) + "," + clip("long line", 8, 14) + "," + clip("lost line", 10.5, 11.5) + "," +
               clip("answer", 13, 16) + "," + clip("over the cut", 18, 21) + "," + clip("goodbye", 24, 26) +
               R"(]}
            ]},
            {"kind": "audio", "name": "FX", "events": [)" +
               clip("step", 12.5, 13, 2) + "," + clip("step", 14.5, 15, 2) + R"(,
              {"kind": "part", "name": "door", "start": )" +
               at(24) + R"(, "end": )" + at(28) + R"(, "events": [
                {"kind": "clip", "start": 1, "end": 2, "clip": 2, "name": "latch"}]}]},
            {"kind": "audio", "name": "Guide", "locked": true, "events": [)" +
               clip("guide", 0, 30) + R"(]},
            {"kind": "marker", "name": "Memos", "attributes": {"Cadrel:MarkerType": 7}, "events": [)" +
               memo("too soft", 2) + "," + memo("cut it?", 11) + "," + memo("again", 13) + R"(]}
          ]})";
    }

    double m_film;
};

/// Seconds behind 01:00:00:00 of a timecode of that hour, at 24 frames a second.
double secondsOf(const json& time)
{
    const auto timecode = time.at("timecode").get<std::string>();
    return 60 * std::stoi(timecode.substr(3, 2)) + std::stoi(timecode.substr(6, 2)) +
           std::stoi(timecode.substr(9, 2)) / 24.0 + 3600.0 * (std::stoi(timecode.substr(0, 2)) - 1);
}

std::string brief(double seconds)
{
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%g", seconds);
    return text.data();
}

std::string spanOf(const json& start, const json& end)
{
    return brief(secondsOf(start)) + "-" + brief(secondsOf(end));
}

void addPlaces(const json& events, Places& places)
{
    for (const json& event : events) {
        if (event.contains("events")) {
            addPlaces(event.at("events"), places);
            continue;
        }
        std::string place = spanOf(event.at("start"), event.at("end"));
        if (event.contains("sourceOffset") && event.at("sourceOffset").at("seconds") != 0.0)
            place += " from " + brief(event.at("sourceOffset").at("seconds").get<double>());
        places[event.at("name")].push_back(place);
    }
}

json show(const std::filesystem::path& project)
{
    const Outcome outcome = runCadrel({"show", project, "--json", "-"});
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return json::parse(outcome.out);
}

const json& named(const json& list, const std::string& name)
{
    const auto found = std::find_if(list.begin(), list.end(), [&](const json& entry) { return entry["name"] == name; });
    if (found == list.end())
        throw std::runtime_error("there is no " + name);
    return *found;
}

/// What lies on a track of a project file.
Places placesOn(const std::string& track, const std::filesystem::path& project)
{
    Places places;
    addPlaces(named(show(project).at("tracks"), track).at("events"), places);
    return places;
}

/// "was -> now, now" for all that a report tells of a track, with "nothing" for what fell out.
Words changesOf(const json& report, const std::string& track)
{
    Words changes;
    for (const json& change : named(report.at("tracks"), track).at("changes")) {
        std::string now;
        for (const json& piece : change.at("now"))
            now += (now.empty() ? "" : ", ") + spanOf(piece.at("in"), piece.at("out"));
        changes.push_back(change.at("name").get<std::string>() + ": " +
                          spanOf(change.at("was").at("in"), change.at("was").at("out")) + " -> " +
                          (now.empty() ? "nothing" : now));
    }
    return changes;
}

/// "in-out name" of the markers of a kind.
Words markersOf(const json& report, const std::string& kind)
{
    Words markers;
    for (const json& marker : report.at("markers")) {
        if (marker.at("kind") == kind)
            markers.push_back(spanOf(marker.at("in"), marker.at("out")) + " " + marker.at("name").get<std::string>());
    }
    return markers;
}

/// Without the time that the run took, the only thing that isn't the same every time.
std::string withoutTime(std::string text)
{
    const std::size_t start = text.find(" in ", text.find("Applied"));
    return text.erase(start, text.find('\n', start) - start);
}

/// Whether a piece stands somewhere in the text.
bool tells(const std::string& text, std::string_view piece)
{
    return text.find(piece) != std::string::npos;
}

TEST(Apply, MaterialGoesWhereItsPictureHasGone)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const auto result = scene.folder / "result.stage";

        const Outcome outcome = scene.apply({"-o", result});

        EXPECT_EQ(outcome.status, 0);
        EXPECT_EQ(outcome.err, "");
        EXPECT_EQ(placesOn("DIA", result), (Places{{"hello", {"1-4"}},
                                                   {"long line", {"8-10", "10-12 from 4"}},
                                                   {"answer", {"11-14"}},
                                                   {"over the cut", {"16-18", "22-23 from 2"}},
                                                   {"goodbye", {"26-28"}}}));
        EXPECT_EQ(placesOn("FX", result), (Places{{"step", {"10.5-11", "12.5-13"}}, {"latch", {"27-28"}}}));
        EXPECT_EQ(placesOn("Guide", result), (Places{{"guide", {"0-30"}}}));
        EXPECT_EQ(placesOn("Memos", result), (Places{{"too soft", {"2-2"}}, {"again", {"11-11"}}}));
    }
}

TEST(Apply, TheAutomationGoesAlong)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const auto result = scene.folder / "result.stage";

        ASSERT_EQ(scene.apply({"-o", result}).status, 0);

        const json shown = show(result);
        std::map<double, double> points;
        for (const json& point : named(shown.at("tracks"), "DIA").at("automation").at(0).at("points"))
            points[secondsOf(point)] = point.at("value");
        EXPECT_DOUBLE_EQ(points.at(11), 0.25);
        EXPECT_DOUBLE_EQ(points.at(14), 0.75);
    }
}

TEST(Apply, AProjectInAnotherFolderLeadsToTheSameMedia)
{
    const Scene scene(Origins[0]);
    const std::filesystem::path folder = scene.folder / "";
    std::filesystem::create_directory(folder / "out");

    ASSERT_EQ(scene.apply({"-o", folder / "result.stage"}).status, 0);
    ASSERT_EQ(scene.apply({"-o", folder / "out/result.stage"}).status, 0);

    EXPECT_EQ(named(json::parse(contentOf(folder / "result.stage")).at("pool"), "boom").at("path"), "boom.wav");
    EXPECT_EQ(named(json::parse(contentOf(folder / "out/result.stage")).at("pool"), "boom").at("path"),
              (folder / "boom.wav").string());
}

TEST(Apply, TheReportTellsWhatBecameOfEachClip)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);

        const json report = scene.applyAsJson();

        EXPECT_EQ(changesOf(report, "DIA"),
                  (Words{"long line: 8-14 -> 8-10, 10-12", "lost line: 10.5-11.5 -> nothing", "answer: 13-16 -> 11-14",
                         "over the cut: 18-21 -> 16-18, 22-23", "goodbye: 24-26 -> 26-28"}));
        EXPECT_EQ(changesOf(report, "FX"),
                  (Words{"step: 12.5-13 -> 10.5-11", "step: 14.5-15 -> 12.5-13", "latch: 25-26 -> 27-28"}));
        EXPECT_EQ(changesOf(report, "Guide"), Words());
        EXPECT_EQ(changesOf(report, "Memos"), (Words{"cut it?: 11-11 -> nothing", "again: 13-13 -> 11-11"}));
    }
}

TEST(Apply, TheReportTellsHowEachClipHasChanged)
{
    const Scene scene;

    const json changes = named(scene.applyAsJson().at("tracks"), "DIA").at("changes");

    const json& longLine = named(changes, "long line");
    EXPECT_TRUE(longLine.at("moved"));
    EXPECT_TRUE(longLine.at("split"));
    EXPECT_FALSE(longLine.at("doubled"));
    EXPECT_EQ(longLine.at("trimmed").at("middle").at("timecode"), "00:00:02:00");
    EXPECT_EQ(longLine.at("trimmed").at("start").at("seconds"), 0.0);
    EXPECT_EQ(longLine.at("clip"), "boom");
    EXPECT_EQ(longLine.at("now").at(1).at("shift").at("timecode"), "-00:00:02:00");
    const json& lostLine = named(changes, "lost line");
    EXPECT_FALSE(lostLine.at("moved"));
    EXPECT_EQ(lostLine.at("now"), json::array());
}

TEST(Apply, ThePageForPeople)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);

        const Outcome outcome = scene.apply({"--clips"});

        EXPECT_EQ(outcome.status, 0);
        EXPECT_EQ(withoutTime(outcome.out),
                  R"(Project     scene.stage
Old cut     old.edl: 3 events, all valid
New cut     new.edl: 4 events, all valid
Frame rate  24 fps, as the project has it
Change EDL  2 events
Covered     00:00:28:00 of 00:00:32:00, 87.5 %
Settings    default       --tracks all --match roll --heal normal --vfx none --no-overhang --overhang-percent 50
                          --remains 5 --no-virgin-territories --no-preserve --destination-markers --insert-markers
                          --dissolve-wipe-markers --automation-markers --snippet-markers --overlap-markers --b-roll
                          --keep all
Applied     2 events
Clips       10: 2 stay, 7 moved, 1 trimmed, 2 split, 1 fell out
Own markers 3: 1 stay, 1 moved, 1 fell out
New markers 2 Destination, 1 Insert
Written     no project; give -o PROJECT.stage or --in-place

Length      00:00:30:00 before, 00:00:32:00 after, +00:00:02:00
Old picture 00:00:28:00 kept, 00:00:02:00 lifted
New picture 00:00:04:00 inserted, 00:00:00:00 doubled
Moved       00:00:00:00
Steps       2 in 1 reel

The largest changes
   2  insert 00:00:04:00                 NEW
      sound: 1 split, on 1 track
   1  delete 00:00:02:00                 TWO
      sound: 1 split, 2 fell out, on 2 tracks

Clip by clip

track                              holds  stay  moved  trimmed  split  doubled  fell out  new
DIA (audio, in Dialogue)               6     1      4        1      2                  1
FX (audio)                             3            3
Guide (audio, locked)                  1     1
Memos (marker, in Cadrel Markers)      3     1      1                                  1

DIA (audio, in Dialogue)
  was in       was out      now in       now out      shift         clip or marker   became
  01:00:08:00  01:00:14:00  01:00:08:00  01:00:10:00                long line        moved, trimmed by 00:00:02:00 in the middle, split
                            01:00:10:00  01:00:12:00  -00:00:02:00  long line
  01:00:10:12  01:00:11:12                                          lost line        fell out
  01:00:13:00  01:00:16:00  01:00:11:00  01:00:14:00  -00:00:02:00  answer           moved
  01:00:18:00  01:00:21:00  01:00:16:00  01:00:18:00  -00:00:02:00  over the cut     moved, split
                            01:00:22:00  01:00:23:00  +00:00:02:00  over the cut
  01:00:24:00  01:00:26:00  01:00:26:00  01:00:28:00  +00:00:02:00  goodbye          moved

FX (audio)
  was in       was out      now in       now out      shift         clip or marker   became
  01:00:12:12  01:00:13:00  01:00:10:12  01:00:11:00  -00:00:02:00  step             moved
  01:00:14:12  01:00:15:00  01:00:12:12  01:00:13:00  -00:00:02:00  step             moved
  01:00:25:00  01:00:26:00  01:00:27:00  01:00:28:00  +00:00:02:00  latch (in door)  moved

Memos (marker, in Cadrel Markers)
  was in       was out      now in       now out      shift         clip or marker   became
  01:00:11:00                                                       cut it?          fell out
  01:00:13:00               01:00:11:00               -00:00:02:00  again            moved

Destination, 2 markers
  in           out          length       marker
  01:00:10:00  01:00:18:00  00:00:08:00  Event: 1 - A002
  01:00:22:00  01:00:32:00  00:00:10:00  Event: 2 - A003

Insert, 1 marker
  in           out          length       marker
  01:00:18:00  01:00:22:00  00:00:04:00  Insert: B009
)");
    }
}

TEST(Apply, TheSummaryIsTheFirstParagraph)
{
    const Scene scene;

    const std::string whole = withoutTime(scene.apply().out);

    EXPECT_EQ(withoutTime(scene.apply({"--summary"}).out), whole.substr(0, whole.find("\n\n") + 1));
}

TEST(Apply, TheReportHasTheEventsAndWhatTheCutsHold)
{
    const Scene scene;

    const json report = scene.applyAsJson();

    EXPECT_EQ(report.at("project"), "scene.stage");
    EXPECT_EQ(report.at("rate"), "24 fps");
    EXPECT_EQ(report.at("old"),
              (json{{"files", {"old.edl"}}, {"events", 3}, {"invalid", 0}, {"unread", json::array()}}));
    EXPECT_EQ(report.at("events").size(), 2U);
    EXPECT_EQ(report.at("applied"), 2);
    EXPECT_EQ(report.at("passedOver"), json::array());
    EXPECT_EQ(report.at("inserts").at(0).at("dstIn"), "01:00:18:00");
    EXPECT_EQ(report.at("written"), json());
    EXPECT_GE(report.at("seconds").get<double>(), 0.0);
}

TEST(Apply, WithoutAnOutputNothingIsWritten)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);

    EXPECT_EQ(scene.apply().status, 0);

    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_EQ(scene.folder.names(), (Words{"new.edl", "old.edl", "scene.stage"}));
}

TEST(Apply, TheProjectStaysBesideAnOutput)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);
    const auto result = scene.folder / "result.stage";
    const auto document = scene.folder / "report.json";
    EXPECT_TRUE(tells(scene.apply({"--json", document}).out,
                      "Written     " + document.string() + ", no project; give -o PROJECT.stage or --in-place\n"));

    const Outcome outcome = scene.apply({"-o", result, "--json", document, "--overwrite", "--summary"});

    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_EQ(json::parse(contentOf(document)).at("written"), result.string());
    EXPECT_TRUE(tells(outcome.out, "Written     " + result.string() + ", " + document.string() + "\n")) << outcome.out;
}

TEST(Apply, InPlaceTheProjectIsReplaced)
{
    const Scene scene;
    const auto result = scene.folder / "result.stage";
    ASSERT_EQ(scene.apply({"-o", result}).status, 0);

    EXPECT_EQ(scene.apply({"--in-place"}).status, 0);

    EXPECT_EQ(contentOf(scene.project), contentOf(result));
}

TEST(Apply, ChangeEdlsThatWereMadeBeforeDoTheSame)
{
    const Scene scene;
    const auto change = scene.folder / "change.edl";
    ASSERT_EQ(
        runCadrel({"generate", "--old", scene.oldFile, "--new", scene.newFile, "-o", change, "--json", "/dev/null"})
            .status,
        0);
    const auto result = scene.folder / "result.stage";
    ASSERT_EQ(scene.apply({"--keep", "cut", "-o", result}).status, 0);
    const auto other = scene.folder / "other.stage";

    const Outcome outcome = runCadrel({"apply", scene.project, "--change", change, "--keep", "cut", "-o", other});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_TRUE(tells(outcome.out, "Change EDL  change.edl: 3 events, all valid\n")) << outcome.out;
    for (const char* const track : {"DIA", "FX", "Guide", "Memos", "Destination"})
        EXPECT_EQ(placesOn(track, other), placesOn(track, result)) << track;
    // Without the new cut nobody knows of new picture.
    EXPECT_EQ(placesOn("Insert", other), Places());
}

TEST(Apply, EventsAreToldThatArePassedOver)
{
    const Scene scene;
    const std::string change = scene.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "A001", "01:00:00:00 01:00:10:00", "01:00:00:00 01:00:10:00") +
                          cut("002", "A002", "01:00:12:00 01:00:20:30", "01:00:10:00 01:00:18:00") +
                          cut("003", "A003", "01:00:20:00 01:00:20:00", "01:00:22:00 01:00:32:00"));

    const Outcome outcome = runCadrel({"apply", scene.project, "--change", change, "--summary"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    EXPECT_TRUE(tells(outcome.out, "Applied     1 event in")) << outcome.out;
    EXPECT_TRUE(tells(outcome.out,
                      "Passed over 2 events\n"
                      "            002  01:00:10:00  01:00:18:00  A002: has a timecode that doesn't exist at 24 fps\n"
                      "            003  01:00:22:00  01:00:32:00  A003: nothing of the old programme goes there\n"))
        << outcome.out;
    // What the file warns of is told as it is of every EDL.
    EXPECT_TRUE(tells(outcome.err, "check the file and the frame rate of the project\n")) << outcome.err;
}

TEST(Apply, OfManyEventsThatArePassedOverTenAreListedAndTheRestIsCounted)
{
    const Scene scene;
    const auto reportWith = [&scene](int count, const Words& more = {}) {
        std::string text = "TITLE: CHANGE\n" + cut("001", "A001", "01:00:00:00 01:00:10:00", "01:00:00:00 01:00:10:00");
        // No frame has the number 30 at 24 fps.
        for (int index = 0; index < count; ++index)
            text +=
                cut(std::to_string(101 + index).c_str(), "A002", "01:00:12:00 01:00:20:30", "01:00:10:00 01:00:18:00");
        Words words{"apply", scene.project, "--change", scene.folder.write("change.edl", text), "--summary"};
        words.insert(words.end(), more.begin(), more.end());
        const Outcome outcome = runCadrel(words);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return outcome.out;
    };
    const auto listOf = [](int first, int last) {
        std::string lines;
        for (int number = first; number <= last; ++number)
            lines += "            " + std::to_string(number) +
                     "  01:00:10:00  01:00:18:00  A002: has a timecode that doesn't exist at 24 fps\n";
        return lines;
    };

    EXPECT_TRUE(tells(reportWith(9), "Passed over 9 events\n" + listOf(101, 109) + "Clips "));
    EXPECT_TRUE(tells(reportWith(10), "Passed over 10 events\n" + listOf(101, 110) + "Clips "));
    EXPECT_TRUE(tells(reportWith(11), "Passed over 11 events\n" + listOf(101, 110) +
                                          "            and 1 more; --json lists them all\nClips "));
    EXPECT_TRUE(tells(reportWith(200), "Passed over 200 events\n" + listOf(101, 110) +
                                           "            and 190 more; --json lists them all\nClips "));
    EXPECT_EQ(json::parse(reportWith(200, {"--json", "-"})).at("passedOver").size(), 200U);
}

TEST(Apply, WhereStretchesOverlapTheLastOneHolds)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const std::string change = scene.folder.write(
            "change.edl", "TITLE: CHANGE\n" + cut("001", "A001", "01:00:00:00 01:00:12:00", "01:00:00:00 01:00:12:00") +
                              cut("002", "A001", "01:00:00:00 01:00:05:00", "01:00:09:00 01:00:14:00"));

        const Outcome outcome = runCadrel({"apply", scene.project, "--change", change, "--keep", "cut", "--json", "-"});

        EXPECT_EQ(changesOf(json::parse(outcome.out), "DIA"),
                  (Words{"hello: 1-4 -> 1-4, 10-13", "long line: 8-14 -> 8-9", "lost line: 10.5-11.5 -> nothing",
                         "answer: 13-16 -> nothing", "over the cut: 18-21 -> nothing", "goodbye: 24-26 -> nothing"}));
        const json changes = named(json::parse(outcome.out).at("tracks"), "DIA").at("changes");
        EXPECT_TRUE(named(changes, "hello").at("doubled"));
        EXPECT_FALSE(named(changes, "hello").at("split"));
        EXPECT_EQ(named(changes, "long line").at("trimmed").at("end").at("timecode"), "00:00:05:00");
    }
}

TEST(Apply, ARunThatWouldOnlyEmptyTheTracksIsRefused)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);
    const std::string change = scene.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "A001", "01:00:00:00 01:00:00:00", "01:00:00:00 01:00:10:00"));

    const Outcome outcome = runCadrel({"apply", scene.project, "--change", change, "--in-place"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.err, "cadrel: " + change +
                               ": no change event can be applied (the first: nothing of the old programme goes there); "
                               "check the timecodes and the frame rate of the project\n");
    EXPECT_EQ(contentOf(scene.project), before);
}

TEST(Apply, OnlySelectedTracksChangeWhereTheyAreAskedFor)
{
    const Scene scene;

    const json report = scene.applyAsJson({"--tracks", "selected"});

    EXPECT_EQ(changesOf(report, "DIA").size(), 5U);
    EXPECT_EQ(changesOf(report, "FX"), Words());
}

TEST(Apply, WithoutASelectedTrackThereIsNothingToDo)
{
    const Scene scene;
    std::string text = contentOf(scene.project);
    text.replace(text.find("\"selected\": true"), 16, "\"selected\": false");
    writeFile(scene.project, text);

    const Outcome outcome = scene.apply({"--tracks", "selected", "--in-place"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.err,
              "cadrel: " + scene.project + ": no track is selected; select the tracks in it, or give --tracks all\n");
    EXPECT_EQ(contentOf(scene.project), text);
}

/// How many markers of each kind a report has.
std::map<std::string, std::size_t> kindsIn(const json& report)
{
    std::map<std::string, std::size_t> kinds;
    for (const json& marker : report.at("markers"))
        ++kinds[marker.at("kind")];
    return kinds;
}

TEST(Apply, EachKindOfMarkerCanBeSwitchedOff)
{
    // Two stretches that want 9 to 10 of DIA, where the long line lies in both.
    const Scene scene;
    const std::string change = scene.folder.write(
        "change.edl", "TITLE: CHANGE\n" + cut("001", "A001", "01:00:00:00 01:00:10:00", "01:00:00:00 01:00:10:00") +
                          cut("002", "A002", "01:00:08:00 01:00:14:00", "01:00:09:00 01:00:15:00"));
    const auto overlapsWith = [&](const std::string& option) {
        const Outcome outcome =
            runCadrel({"apply", scene.project, "--change", change, "--keep", "cut", option, "--json", "-"});
        return kindsIn(json::parse(outcome.out))["Overlap"];
    };
    EXPECT_EQ(overlapsWith("--overlap-markers"), 1U);
    EXPECT_EQ(overlapsWith("--no-overlap-markers"), 0U);

    const std::string folder = treePath("examples/reel3/");
    const auto kindsWith = [&](const std::string& option) {
        const Outcome outcome =
            runCadrel({"apply", folder + "reel3.stage", "--old", folder + "reel3_v07.edl", "--new",
                       folder + "reel3_v12.edl", "--vfx", "VFX_****_v,_comp", option, "--json", "-"});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return kindsIn(json::parse(outcome.out));
    };
    auto expected = kindsWith("--destination-markers");
    ASSERT_EQ(expected.size(), 5U);
    for (const auto& [option, kind] :
         std::map<std::string, std::string>{{"--no-destination-markers", "Destination"},
                                            {"--no-insert-markers", "Insert"},
                                            {"--no-dissolve-wipe-markers", "Dissolve/Wipe"},
                                            {"--no-automation-markers", "Automation Warning"},
                                            {"--no-snippet-markers", "Audio Snippet"}}) {
        auto without = expected;
        without.erase(kind);
        EXPECT_EQ(kindsWith(option), without) << option;
    }
}

TEST(Apply, TheLastOfTwoOppositeOptionsHolds)
{
    const Scene scene;

    EXPECT_EQ(kindsIn(scene.applyAsJson({"--no-insert-markers", "--insert-markers"}))["Insert"], 1U);
    EXPECT_EQ(kindsIn(scene.applyAsJson({"--insert-markers", "--no-insert-markers"}))["Insert"], 0U);
}

TEST(Apply, OverhangsGoAlongUpToTheirThreshold)
{
    const Scene scene;
    const std::string whole = "over the cut: 18-21 -> 16-19";
    const std::string inTwo = "over the cut: 18-21 -> 16-18, 22-23";
    // A second, 24 frames and a third of the clip, hangs over the end of TWO.
    const auto becomes = [&](const Words& options) { return changesOf(scene.applyAsJson(options), "DIA").at(3); };

    EXPECT_EQ(becomes({}), inTwo);
    EXPECT_EQ(becomes({"--overhang", "23"}), inTwo);
    EXPECT_EQ(becomes({"--overhang", "24"}), whole);
    EXPECT_EQ(becomes({"--overhang", "24", "--overhang-percent", "33"}), inTwo);
    EXPECT_EQ(becomes({"--overhang", "24", "--overhang-percent", "34"}), whole);
    EXPECT_EQ(becomes({"--overhang", "24", "--no-overhang-percent"}), whole);
    EXPECT_EQ(becomes({"--no-overhang"}), inTwo);
}

TEST(Apply, SliversAreMarkedUpToTheirThreshold)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);

        EXPECT_EQ(markersOf(scene.applyAsJson({"--remains", "24"}), "Audio Snippet"),
                  (Words{"22-23 Audio snippet in DIA"}));
        EXPECT_EQ(markersOf(scene.applyAsJson({"--remains", "23"}), "Audio Snippet"), Words());
    }
}

TEST(Apply, VirginTerritoriesLeadTheAutomationOverWhatHasNoOldSound)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const auto result = scene.folder / "result.stage";
        const auto volumeWith = [&](const std::string& option) {
            EXPECT_EQ(scene.apply({"-o", result, "--overwrite", option}).status, 0);
            const json shown = show(result);
            Words points;
            for (const json& point : named(shown.at("tracks"), "DIA").at("automation").at(0).at("points"))
                points.push_back(brief(secondsOf(point)) + ": " + brief(point.at("value").get<double>()));
            // What comes in before the film is none of this.
            points.erase(points.begin(), std::find(points.begin(), points.end(), "11: 0.25"));
            return points;
        };

        // Where TWO ends, and where THREE begins, the volume is what it has been since 16.
        EXPECT_EQ(volumeWith("--virgin-territories"), (Words{"11: 0.25", "14: 0.75", "18: 0.75", "22: 0.75"}));
        EXPECT_EQ(volumeWith("--no-virgin-territories"), (Words{"11: 0.25", "14: 0.75"}));
    }
}

TEST(Apply, VirginTerritoriesWriteTheNumbersThatStandInTheProject)
{
    const Scene scene;
    std::string text = contentOf(scene.project);
    for (const auto& [former, value] :
         {std::pair{"\"value\": 0.25", "\"value\": 0.1"}, std::pair{"\"value\": 0.75", "\"value\": 0.7"}})
        text.replace(text.find(former), std::string(former).size(), value);
    writeFile(scene.project, text);
    const auto result = scene.folder / "result.stage";

    ASSERT_EQ(scene.apply({"-o", result, "--virgin-territories"}).status, 0);

    std::size_t count = 0;
    const json shown = show(result);
    for (const json& point : named(shown.at("tracks"), "DIA").at("automation").at(0).at("points")) {
        const double value = point.at("value");
        EXPECT_TRUE(value == 0.1 || value == 0.7) << value;
        ++count;
    }
    EXPECT_GE(count, 4U);
}

/// The value of a curve of `show` at a time in seconds behind 01:00:00:00, at which no point stands.
double valueAt(const json& curve, double time)
{
    double leftTime = 0.0;
    double leftValue = -1.0;
    for (const json& point : curve.at("points")) {
        const double pointTime = secondsOf(point);
        const auto value = point.at("value").get<double>();
        if (pointTime > time)
            return leftValue < 0.0 ? value
                                   : leftValue + (value - leftValue) * (time - leftTime) / (pointTime - leftTime);
        leftTime = pointTime;
        leftValue = value;
    }
    return leftValue;
}

//     old cut   0.5 --------------------18\19 0.25 --------------28\30 0.0      the volume, with a fade-out at the end
//               0--- ONE ---10----- TWO ----20----- THREE ----30
TEST(Apply, AFadeAtTheEndOfTheReelIsHeardInNoInsert)
{
    const TempFolder folder;
    const auto project = folder.write("fade.stage", projectWith(R"({"kind": "audio", "name": "DIA", "curves": [
        {"number": 1, "automates": "volume", "points": [
          {"time": 3600, "value": 0.5}, {"time": 3618, "value": 0.5}, {"time": 3619, "value": 0.25},
          {"time": 3628, "value": 0.25}, {"time": 3630, "value": 0}]}]})"));
    const auto result = folder / "result.stage";
    const auto oldFile = folder.write("old.edl", oldCut());
    const auto applied = [&](const std::string& newFile) {
        const Outcome outcome = runCadrel({"apply", project, "--old", oldFile, "--new", newFile, "--keep", "cut",
                                           "--force", "-o", result, "--overwrite", "--json", "-"});
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        return json::parse(outcome.out);
    };
    const auto expectValues = [&](const std::vector<std::pair<double, double>>& values) {
        const json curve = named(show(result).at("tracks"), "DIA").at("automation").at(0);
        for (const auto& [time, value] : values)
            EXPECT_NEAR(valueAt(curve, time), value, 1e-6) << time;
    };

    // The insert stands at 18 to 22, and the fade at 30 to 32.
    EXPECT_EQ(markersOf(applied(folder.write("new.edl", newCut())), "Automation Warning"), Words());
    expectValues({{-1000.0, 0.5},
                  {5.0, 0.5},
                  {15.0, 0.5},
                  {17.5, 0.25},
                  {18.5, 0.25},
                  {21.5, 0.25},
                  {31.0, 0.125},
                  {33.0, 0.0}});

    // ONE begins four seconds later, and an insert takes the place of TWO.
    const json report = applied(folder.write(
        "later.edl", "TITLE: LATER\n" + cut("001", "B009", "05:00:00:00 05:00:04:00", "01:00:00:00 01:00:04:00") +
                         clipName("NEW") + cut("002", "A001", "10:00:00:00 10:00:10:00", "01:00:04:00 01:00:14:00") +
                         clipName("ONE") + cut("003", "B010", "06:00:00:00 06:00:06:00", "01:00:14:00 01:00:20:00") +
                         clipName("NEWER") + cut("004", "A003", "12:00:00:00 12:00:10:00", "01:00:20:00 01:00:30:00") +
                         clipName("THREE")));
    expectValues(
        {{-1000.0, 0.5}, {2.0, 0.5}, {9.0, 0.5}, {14.5, 0.5}, {19.5, 0.5}, {20.5, 0.25}, {29.0, 0.125}, {31.0, 0.0}});
    EXPECT_EQ(markersOf(report, "Automation Warning"), Words{"20-20 Automation warning in DIA "});
}

TEST(Apply, OutsideOfAPreservedStretchNothingChanges)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const auto result = scene.folder / "result.stage";

        const Outcome outcome =
            scene.apply({"--preserve", "01:00:10:00", "01:00:20:00", "-o", result, "--json", "/dev/null"});

        EXPECT_EQ(outcome.status, 0) << outcome.err;
        EXPECT_TRUE(tells(outcome.out, "Settings    command line  --preserve 01:00:10:00 01:00:20:00\n"))
            << outcome.out;
        EXPECT_TRUE(
            tells(outcome.out, "002  01:00:22:00  01:00:32:00  A003: lies outside of the stretch that may change\n"))
            << outcome.out;
        EXPECT_EQ(placesOn("DIA", result), (Places{{"hello", {"1-4"}},
                                                   {"long line", {"8-10", "10-12 from 4"}},
                                                   {"answer", {"11-14"}},
                                                   {"over the cut", {"16-18", "20-21 from 2"}},
                                                   {"goodbye", {"24-26"}}}));
    }
}

TEST(Apply, APreservedStretchHasToBeOne)
{
    const Scene scene;
    const auto refusal = [&](const std::string& before, const std::string& after) {
        const Outcome outcome = scene.apply({"--preserve", before, after});
        EXPECT_EQ(outcome.status, 2);
        return outcome.err;
    };

    EXPECT_TRUE(tells(refusal("01:00:20:00", "01:00:10:00"), "the second timecode has to be after the first"));
    EXPECT_TRUE(tells(refusal("01:00:10:24", "01:00:20:00"), "\"01:00:10:24\" is no timecode of the project"));
    EXPECT_TRUE(tells(refusal("10", "20"), "\"10\" is no timecode of the project"));
    EXPECT_EQ(scene.apply({"--preserve", "-00:00:10:00", "01:00:20:00"}).status, 0);
}

/// The lines of a report that tell the settings, without their indentation.
std::string settingsIn(const std::string& report)
{
    std::string lines;
    const std::string title = "Settings    ";
    for (std::size_t start = report.find(title); start != std::string::npos;) {
        const std::size_t end = report.find('\n', start);
        lines += report.substr(start + title.size(), end + 1 - start - title.size());
        start =
            report.compare(end + 1, title.size(), std::string(title.size(), ' ')) == 0 ? end + 1 : std::string::npos;
    }
    return lines;
}

TEST(Apply, TheReportTellsEachSettingAndWhereItIsFrom)
{
    const Scene scene;
    const auto result = scene.folder / "result.stage";

    EXPECT_EQ(
        settingsIn(scene.apply({"--vfx", "V*_,", "--remains", "5", "-o", result}).out),
        "command line  --vfx 'V*_,' --remains 5\n"
        "default       --tracks all --match roll --heal normal --no-overhang --overhang-percent 50\n"
        "              --no-virgin-territories --no-preserve --destination-markers --insert-markers\n"
        "              --dissolve-wipe-markers --automation-markers --snippet-markers --overlap-markers --b-roll\n"
        "              --keep all\n");

    const Outcome later = runCadrel({"apply", result, "--change", scene.folder.write("change.edl", newCut()), "--force",
                                     "--no-b-roll", "--overhang", "3", "--summary"});
    // A change EDL that is there isn't made by the VFX patterns.
    EXPECT_EQ(settingsIn(later.out),
              "command line  --overhang 3 --no-b-roll --force\n"
              "default       --tracks all --match roll --overhang-percent 50 --remains 5 --no-virgin-territories\n"
              "              --no-preserve --destination-markers --insert-markers --dissolve-wipe-markers\n"
              "              --automation-markers --snippet-markers --overlap-markers --keep all\n")
        << later.err;
}

TEST(Apply, TheJsonTellsEachSettingAndWhereItIsFrom)
{
    const Scene scene;
    const Words given{"--no-destination-markers",
                      "--preserve",
                      "01:00:00:00",
                      "01:00:30:00",
                      "--overhang",
                      "3",
                      "--no-overhang-percent",
                      "--remains",
                      "7",
                      "--virgin-territories",
                      "--tracks",
                      "selected",
                      "--match",
                      "clip",
                      "--no-b-roll",
                      "--vfx",
                      "A,B",
                      "--vfx",
                      "C,"};
    const auto settingsOf = [&](const std::string& from, bool isForced) {
        return json{{"tracks", {{"value", "selected"}, {"from", from}}},
                    {"match", {{"value", "clip"}, {"from", from}}},
                    {"heal", {{"value", "normal"}, {"from", "default"}}},
                    {"vfx", {{"value", {"A,B", "C,"}}, {"from", from}}},
                    {"overhang", {{"value", 3}, {"from", from}}},
                    {"overhang-percent", {{"value", nullptr}, {"from", from}}},
                    {"remains", {{"value", 7}, {"from", from}}},
                    {"virgin-territories", {{"value", true}, {"from", from}}},
                    {"preserve", {{"value", {"01:00:00:00", "01:00:30:00"}}, {"from", from}}},
                    {"destination-markers", {{"value", false}, {"from", from}}},
                    {"insert-markers", {{"value", true}, {"from", "default"}}},
                    {"dissolve-wipe-markers", {{"value", true}, {"from", "default"}}},
                    {"automation-markers", {{"value", true}, {"from", "default"}}},
                    {"snippet-markers", {{"value", true}, {"from", "default"}}},
                    {"overlap-markers", {{"value", true}, {"from", "default"}}},
                    {"b-roll", {{"value", false}, {"from", from}}},
                    {"keep", {{"value", "all"}, {"from", "default"}}},
                    {"force", {{"value", isForced}, {"from", isForced ? "command line" : "default"}}}};
    };
    Words inPlace = given;
    inPlace.emplace_back("--in-place");

    EXPECT_EQ(scene.applyAsJson(inPlace).at("settings"), settingsOf("command line", false));
    EXPECT_EQ(scene.applyAsJson({"--force"}).at("settings"), settingsOf("project", true));
}

TEST(Apply, AChangeEdlBesideACutIsNamedAsTheMistake)
{
    const Scene scene;
    for (const char* const cut : {"--old", "--new"}) {
        const Outcome outcome = runCadrel({"apply", scene.project, "--change", scene.newFile, cut, scene.newFile});
        EXPECT_EQ(outcome.status, 2);
        EXPECT_EQ(outcome.err, "cadrel: apply: --change stands instead of --old and --new; give the two cuts, or the "
                               "change EDL alone\n");
    }
}

TEST(Apply, TheReportTellsWhatWasToBeKept)
{
    const Scene scene;

    EXPECT_TRUE(tells(settingsIn(scene.apply({"--keep", "cut"}).out), "command line  --keep cut\n"));
    EXPECT_TRUE(tells(settingsIn(scene.apply({"--keep", "all"}).out), "command line  --keep all\n"));
    EXPECT_EQ(scene.applyAsJson({"--keep", "cut"}).at("settings").at("keep"),
              (json{{"value", "cut"}, {"from", "command line"}}));
}

TEST(Apply, WhatIsNotGivenIsAsInTheLastRun)
{
    const Scene scene;
    const auto result = scene.folder / "result.stage";
    ASSERT_EQ(scene
                  .apply({"-o", result, "--no-destination-markers", "--preserve", "01:00:00:00", "01:00:30:00",
                          "--overhang", "3", "--remains", "7", "--virgin-territories", "--tracks", "selected",
                          "--match", "clip", "--no-b-roll", "--vfx", "A,B"})
                  .status,
              0);
    const auto projectsWith = [&](const Words& more) {
        Words words{"apply", result, "--old", scene.oldFile, "--new", scene.newFile, "--summary", "--force"};
        words.insert(words.end(), more.begin(), more.end());
        const Outcome outcome = runCadrel(words);
        EXPECT_EQ(outcome.status, 0) << outcome.err;
        const std::size_t start = outcome.out.find("project       ");
        return start == std::string::npos
                   ? std::string()
                   : outcome.out.substr(start + 14, outcome.out.find("default", start) - start - 14);
    };

    EXPECT_EQ(projectsWith({}),
              "--tracks selected --match clip --vfx A,B --overhang 3 --remains 7 --virgin-territories\n"
              "                          --preserve 01:00:00:00 01:00:30:00 "
              "--no-destination-markers --no-b-roll\n            ");
    EXPECT_EQ(
        projectsWith({"--destination-markers", "--no-preserve", "--no-overhang", "--remains", "5",
                      "--no-virgin-territories", "--tracks", "all", "--match", "roll", "--b-roll", "--vfx", "none"}),
        "");
    EXPECT_EQ(projectsWith({"--fresh"}), "");
}

TEST(Apply, NoneForgetsTheVfxPatterns)
{
    const Scene scene;
    const auto patternsWith = [&](const Words& options) {
        return scene.applyAsJson(options).at("settings").at("vfx").at("value");
    };

    EXPECT_EQ(patternsWith({"--vfx", "A,", "--in-place"}), json::array({"A,"}));
    EXPECT_EQ(patternsWith({"--force"}), json::array({"A,"}));
    EXPECT_EQ(patternsWith({"--force", "--vfx", "none", "--in-place"}), json::array());
    EXPECT_EQ(patternsWith({"--force"}), json::array());
    const Outcome both = scene.apply({"--vfx", "none", "--vfx", "A,"});
    EXPECT_EQ(both.status, 2);
    EXPECT_EQ(both.err, "cadrel: --vfx: give none alone; see --help\n");
}

TEST(Apply, ASecondRunPutsItsMarkersInThePlaceOfThoseOfTheFirst)
{
    for (const Origin origin : Origins) {
        const Scene scene(origin);
        const Places once{
            {"Event: 1 - A001 ", {"0-10"}}, {"Event: 2 - A002 ", {"10-18"}}, {"Event: 3 - A003 ", {"22-32"}}};
        const Places inserts{{"Insert: B009", {"18-22"}}};
        for (const Words& options : {Words{}, Words{"--tracks", "selected"}, Words{"--tracks", "all"}}) {
            Words words{"--in-place", "--keep", "cut", "--force"};
            words.insert(words.end(), options.begin(), options.end());
            ASSERT_EQ(scene.apply(words).status, 0);

            EXPECT_EQ(placesOn("Destination", scene.project), once);
            EXPECT_EQ(placesOn("Insert", scene.project), inserts);
        }

        ASSERT_EQ(scene.apply({"--in-place", "--keep", "cut", "--force", "--no-destination-markers"}).status, 0);
        EXPECT_EQ(placesOn("Destination", scene.project), Places());
        EXPECT_EQ(placesOn("Insert", scene.project), inserts);
    }
}

TEST(Apply, ASecondRunReplacesMarkersInAPreservedStretchAlone)
{
    const Scene scene;
    ASSERT_EQ(scene.apply({"--in-place", "--keep", "cut"}).status, 0);

    for (int time = 0; time < 2; ++time) {
        ASSERT_EQ(
            scene.apply({"--in-place", "--keep", "cut", "--force", "--preserve", "01:00:10:00", "01:00:20:00"}).status,
            0);

        EXPECT_EQ(
            placesOn("Destination", scene.project),
            (Places{{"Event: 1 - A001 ", {"0-10"}}, {"Event: 2 - A002 ", {"10-18"}}, {"Event: 3 - A003 ", {"22-32"}}}));
        // Of the new one the stretch takes its part, and of the old one what lies outside stays.
        EXPECT_EQ(placesOn("Insert", scene.project), (Places{{"Insert: B009", {"18-20", "20-22"}}}));
    }
}

TEST(Apply, ASecondRunTellsItsOwnMarkersAlone)
{
    const Scene scene;
    ASSERT_EQ(scene.apply({"--in-place", "--keep", "cut"}).status, 0);

    const json report = scene.applyAsJson({"--keep", "cut", "--force"});

    EXPECT_EQ(markersOf(report, "Destination"),
              (Words{"0-10 Event: 1 - A001 ", "10-18 Event: 2 - A002 ", "22-32 Event: 3 - A003 "}));
    EXPECT_EQ(markersOf(report, "Insert"), (Words{"18-22 Insert: B009"}));

    const json ofStretch = scene.applyAsJson({"--keep", "cut", "--force", "--preserve", "01:00:10:00", "01:00:20:00"});
    EXPECT_EQ(markersOf(ofStretch, "Destination"), Words{"10-18 Event: 2 - A002 "});
    EXPECT_EQ(markersOf(ofStretch, "Insert"), Words{"18-20 Insert: B009"});
}

TEST(Apply, EventsOfTheNewCutThatStandNowhereDoNotStopARun)
{
    const Scene scene;
    const auto newFile = scene.folder.write(
        "faulty.edl", newCut() + "005  B010  V  D 012  05:00:00:00 05:00:01:00 01:00:40:00 01:00:39:00\n" +
                          cut("006", "B011", "05:00:00:00 05:00:01:00", "01:00:70:00 01:00:80:00") +
                          cut("007", "B012", "05:00:00:00 05:00:00:00", "01:00:45:00 01:00:45:00"));

    const Outcome outcome =
        runCadrel({"apply", scene.project, "--old", scene.oldFile, "--new", newFile, "--json", "-"});

    ASSERT_EQ(outcome.status, 0) << outcome.err;
    const json report = json::parse(outcome.out);
    EXPECT_EQ(markersOf(report, "Insert"), (Words{"18-22 Insert: B009"}));
    EXPECT_EQ(markersOf(report, "Dissolve/Wipe"), Words());
}

/// How many clips of one take lie: one after the other and in sync, or all on top of one another.
enum class Layout { InSync, Stacked };

/// A project with one track on which so many clips of one take lie, from the first half second of the film on.
std::string manyClips(int count, Layout layout)
{
    std::string events;
    for (int index = 0; index < count; ++index) {
        const double place = layout == Layout::Stacked ? 0.0 : 29.0 * index / count;
        const double length = layout == Layout::Stacked ? 29.0 : 29.0 / count;
        events += std::string(index == 0 ? "" : ",\n") + R"({"kind": "clip", "start": )" + number(3600.5 + place) +
                  R"(, "end": )" + number(3600.5 + place + length) + R"(, "clip": 1, "offset": )" + number(place) +
                  R"(, "name": "take"})";
    }
    std::string text = projectWith(R"({"kind": "audio", "name": "DIA", "events": [)" + events + "]}");
    const std::string noPool = R"("pool": [])";
    return text.replace(
        text.find(noPool), noPool.size(),
        R"("pool": [{"number": 1, "kind": "audio", "name": "take", "path": "take.wav", "length": 60}])");
}

TEST(Apply, NoRunIsQuadraticInClipsOfOneTake)
{
    const TempFolder folder;
    const auto oldFile = folder.write("old.edl", oldCut());
    const auto newFile = folder.write("new.edl", newCut());
    // Of the processor, so that other programs don't count.
    const auto secondsOfChildren = [] {
        rusage usage{};
        getrusage(RUSAGE_CHILDREN, &usage);
        return static_cast<double>(usage.ru_utime.tv_sec) + 1e-6 * static_cast<double>(usage.ru_utime.tv_usec);
    };
    for (const Layout layout : {Layout::InSync, Layout::Stacked}) {
        const auto secondsToApply = [&](int count) {
            const std::string project = folder.write("many.stage", manyClips(count, layout));
            const double before = secondsOfChildren();
            EXPECT_EQ(runCadrel({"apply", project, "--old", oldFile, "--new", newFile, "--summary"}).status, 0);
            return secondsOfChildren() - before;
        };

        const double few = std::max(secondsToApply(4000), secondsToApply(4000));
        const double many = std::min(secondsToApply(16000), secondsToApply(16000));

        EXPECT_LT(many, 8.0 * few) << static_cast<int>(layout);
    }
}

/// Puts another block into a project that a run has stored one in; a checksum that fits it goes along.
void replaceStored(const std::string& project, const std::string& base64, std::uint32_t checksum)
{
    json document = json::parse(contentOf(project));
    document.at("attributes").at("CaDr").at("CaDrData") = base64;
    document.at("attributes").at("CaDs") = checksum;
    writeFile(project, document.dump());
}

TEST(Apply, ABrokenModelStopsTheRunUnlessItIsToBeginAnew)
{
    const Scene scene;
    ASSERT_EQ(scene.apply({"--in-place", "--vfx", "A,", "--match", "clip"}).status, 0);
    std::string text = contentOf(scene.project);
    const std::size_t checksum = text.find("\"CaDs\": ") + 8;
    text.replace(checksum, text.find_first_of(",\n", checksum) - checksum, std::string("1"));
    writeFile(scene.project, text);

    const Outcome outcome = scene.apply({"--in-place", "--force"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: " + scene.project +
                               ": Cadrel's data in it is damaged: its checksum doesn't fit; "
                               "take an intact copy, or begin anew with --fresh\n");
    EXPECT_EQ(contentOf(scene.project), text);

    const Outcome fresh = scene.apply({"--in-place", "--fresh"});
    EXPECT_EQ(fresh.status, 0);
    EXPECT_EQ(fresh.err, "");
    EXPECT_FALSE(tells(fresh.out, "project       ")) << fresh.out;
    EXPECT_EQ(scene.apply({"--force"}).status, 0);
}

TEST(Apply, AModelOfANewerVersionIsNeverOverwrittenInPlace)
{
    const Scene scene;
    ASSERT_EQ(scene.apply({"--in-place"}).status, 0);
    // The bytes 02 00 00 00, which are the number of a version to come.
    replaceStored(scene.project, "AgAAAA==", 0x8b4d1797);
    const std::string before = contentOf(scene.project);
    const auto result = scene.folder / "result.stage";

    const Outcome stopped = scene.apply({"-o", result});
    EXPECT_EQ(stopped.status, 1);
    EXPECT_EQ(stopped.err, "cadrel: " + scene.project +
                               ": Cadrel's data in it was written by a newer version; "
                               "use the version that wrote it, or begin anew with --fresh\n");
    const Outcome inPlace = scene.apply({"--in-place", "--fresh", "--force"});
    EXPECT_EQ(inPlace.status, 1);
    EXPECT_EQ(inPlace.err, "cadrel: " + scene.project +
                               ": Cadrel's data in it was written by a newer version, and is kept; "
                               "give -o to write the project elsewhere\n");
    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_FALSE(std::filesystem::exists(result));
    EXPECT_EQ(scene.apply({"-o", result, "--fresh"}).status, 0);
    EXPECT_EQ(show(result).at("lastRun").at("old").at("events"), 3);
}

TEST(Apply, BeginningAnewForgetsTheLastCut)
{
    const Scene scene;
    ASSERT_EQ(scene.apply({"--in-place"}).status, 0);

    EXPECT_TRUE(tells(scene.apply().err, "--force")) << scene.apply().err;
    EXPECT_EQ(scene.apply({"--fresh"}).status, 0);
}

TEST(Apply, AClipDecadesAfterTheFilmIsNamed)
{
    const Scene scene;
    // A project reaches to 1,000,000,000 seconds, nearly 32 years. The first whole day past this clip is past that.
    const std::string far = number(277777 * 3600.0);
    const std::string later = number(277777 * 3600.0 + 1.0);
    const auto failureOf = [&](const std::string& track) {
        const std::string project = scene.folder.write("far.stage", projectWith(track));
        const Outcome outcome =
            runCadrel({"apply", project, "--old", scene.oldFile, "--new", scene.newFile, "--force"});
        EXPECT_EQ(outcome.status, 1);
        EXPECT_EQ(outcome.out, "");
        return outcome.err.substr(std::string("cadrel: " + project + ": ").size());
    };
    const std::string near = R"({"kind": "clip", "start": 3611, "end": 3629, "name": "near"})";
    const std::string remedy = ", too far off for a run; move it to its place, or remove it\n";

    EXPECT_EQ(failureOf(R"({"kind": "audio", "name": "DIA", "events": [)" + near + R"(, {"kind": "clip", "start": )" +
                        far + R"(, "end": )" + later + R"(, "name": "far"}]})"),
              "the clip \"far\" on the track \"DIA\" stands at 277777:00:00:00" + remedy);
}

TEST(Apply, LinesThatCannotBeReadAreToldAndStrictWritesNothing)
{
    const Scene scene;
    scene.folder.write("new.edl", newCut() + "005  A005  V  C  10:00:00:00 10:00:01:00 01:00:32:00\n");
    const std::string what = "line 10 misses a field and isn't read: "
                             "\"005  A005  V  C  10:00:00:00 10:00:01:00 01:00:32:00\"; "
                             "correct the list, and save it as plain text\n";
    const std::string before = contentOf(scene.project);

    const Outcome warned = scene.apply();
    const Outcome strict = scene.apply({"--strict", "--in-place"});

    EXPECT_EQ(warned.status, 0);
    EXPECT_EQ(warned.err, "cadrel: " + scene.newFile + ": warning: " + what);
    EXPECT_TRUE(tells(warned.out, "New cut     new.edl: 4 events, all valid, 1 line not read\n")) << warned.out;
    EXPECT_EQ(scene.applyAsJson().at("new").at("unread").at(0).at("line"), 10);
    EXPECT_EQ(strict.status, 1);
    EXPECT_EQ(strict.err, "cadrel: " + scene.newFile + ": " + what);
    EXPECT_EQ(contentOf(scene.project), before);
}

TEST(Apply, AShotThatIsReversedNowTakesNoSoundAlong)
{
    const Scene scene;
    const std::string reversal = "M2   A002       -024.0                11:00:02:12\n";
    std::string reversed = newCut();
    reversed.insert(reversed.find("003  B009"), reversal);
    scene.folder.write("new.edl", reversed);

    const json report = scene.applyAsJson();

    for (const json& event : report.at("events"))
        EXPECT_NE(event.at("roll"), "A002") << event;
    EXPECT_EQ(report.at("inserts").at(0).at("dstIn"), "01:00:10:00");
}

TEST(Apply, AProjectWithReversedShotsIsKnownAgain)
{
    const Scene scene;
    std::string reversed = newCut();
    reversed.insert(reversed.find("003  B009"), "M2   A002       -024.0                11:00:02:12\n");
    scene.folder.write("new.edl", reversed);
    ASSERT_EQ(scene.apply({"--in-place"}).status, 0);
    const std::string next = scene.folder.write("next.edl", reversed);

    const Outcome outcome = runCadrel({"apply", scene.project, "--old", scene.newFile, "--new", next, "--summary"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
}

TEST(Apply, TheProjectHasToRunAtTheRateThatIsGiven)
{
    const Scene scene;

    EXPECT_EQ(scene.apply({"--rate", "24 fps"}).status, 0);
    const Outcome outcome = scene.apply({"--rate", "25 fps"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.err,
              "cadrel: " + scene.project +
                  ": runs at 24 fps and not at 25 fps; give the EDLs of this project, or correct its rate\n");
}

TEST(Apply, AnInputIsNeverOverwritten)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);
    const auto refuse = [&](const Words& options, const std::string& advice) {
        const Outcome outcome = scene.apply(options);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_EQ(outcome.out, "");
        EXPECT_TRUE(tells(outcome.err, advice)) << outcome.err;
    };

    refuse({"-o", scene.project}, "is the project itself; give --in-place to replace it");
    refuse({"-o", scene.oldFile}, "would overwrite another file of this run");
    refuse({"--json", scene.project}, "would overwrite another file of this run");
    refuse({"--json", scene.newFile}, "would overwrite another file of this run");
    refuse({"-o", scene.folder / "x", "--json", scene.folder / "x"}, "would overwrite another file of this run");
    refuse({"-o", scene.folder / "x", "--in-place"}, "--in-place");
    refuse({"-o", "-"}, "is no file name");
    refuse({"-o", ""}, "the name is empty");
    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_EQ(contentOf(scene.oldFile), oldCut());
    EXPECT_EQ(contentOf(scene.newFile), newCut());
    EXPECT_EQ(scene.folder.names(), (Words{"new.edl", "old.edl", "scene.stage"}));
}

TEST(Apply, BothCutsOrAChangeEdlAreNeeded)
{
    const Scene scene;
    const auto refuse = [](const Words& arguments, const std::string& what) {
        const Outcome outcome = runCadrel(arguments);
        EXPECT_EQ(outcome.status, 2);
        EXPECT_TRUE(tells(outcome.err, what)) << outcome.err;
    };

    refuse({"apply", scene.project}, "give the two cuts with --old and --new, or a change EDL with --change");
    refuse({"apply", scene.project, "--old", scene.oldFile}, "--new");
    refuse({"apply", scene.project, "--new", scene.newFile}, "--old");
    refuse(scene.arguments({"--change", scene.oldFile}), "--change");
    refuse({"apply", scene.project, "--change", scene.oldFile, "--heal", "gaps"}, "--heal");
    refuse({"apply", "--old", scene.oldFile, "--new", scene.newFile}, "PROJECT");
    refuse(scene.arguments({"--vfx", "no comma"}), "has no comma");
}

TEST(Apply, AFailureLeavesTheFilesAsTheyWere)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);
    const std::string document = scene.folder.write("report.json", "former report");
    const auto fail = [&](const Words& options, const std::string& line) {
        const Outcome outcome = scene.apply(options);
        EXPECT_EQ(outcome.status, 1);
        EXPECT_EQ(outcome.out, "");
        EXPECT_EQ(outcome.err, "cadrel: " + line + "\n");
    };
    const std::string lost = scene.folder / "none/result.stage";

    fail({"-o", lost, "--overwrite", "--json", document},
         lost + ": the folder does not exist; make it or give another");
    fail({"-o", "/dev/full", "--overwrite", "--json", document},
         "/dev/full: can't be written; see whether the disk is full");
    fail({"--in-place", "--json", "/dev/full"}, "/dev/full: can't be written; see whether the disk is full");
    writeFile(scene.newFile, "");
    fail({"--in-place", "--overwrite", "--json", document}, scene.newFile + ": holds no events; give a CMX EDL");

    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_EQ(contentOf(document), "former report");
    EXPECT_EQ(scene.folder.names(), (Words{"new.edl", "old.edl", "report.json", "scene.stage"}));
}

TEST(Apply, AProjectThatCantBeReadIsRefused)
{
    Scene scene;
    const auto refusal = [&](const std::string& project) {
        scene.project = project;
        const Outcome outcome = scene.apply();
        EXPECT_EQ(outcome.status, 1);
        return outcome.err;
    };

    const std::string none = scene.folder / "none.stage";
    EXPECT_EQ(refusal(none), "cadrel: " + none + ": no such file; check the name and the folder\n");
    EXPECT_EQ(refusal(scene.folder.path()), "cadrel: " + scene.folder.path().string() +
                                                ": is a folder without a session; give the project file in it\n");
    EXPECT_TRUE(tells(refusal(scene.oldFile), "take an intact copy, or the version of Cadrel that wrote it\n"));
    const std::string empty = scene.folder.write("empty.stage", projectAt(24, false, false, 3600));
    EXPECT_EQ(refusal(empty),
              "cadrel: " + empty + ": has no tracks that a run could change; give a project with sound\n");
}

/// A film of a hundred shots of a second, each six frames shorter in the new cut, and forty tracks of sound under it, so that
/// a run takes a while.
class LongScene {
public:
    LongScene()
    {
        std::string oldText;
        std::string newText;
        for (int shot = 0; shot < ShotCount; ++shot) {
            const std::string roll = std::string("R").append(std::to_string(100 + shot));
            oldText += cut("001", roll, "10:00:00:12 10:00:01:12", at(24 * shot) + " " + at(24 * (shot + 1)));
            newText += cut("001", roll, "10:00:00:12 10:00:01:06", at(18 * shot) + " " + at(18 * (shot + 1)));
        }
        std::string tracks;
        for (int track = 0; track < 40; ++track) {
            std::string events;
            for (int clip = 0; clip < 2 * ShotCount; ++clip)
                events += std::string(clip == 0 ? "" : ",") + R"({"kind": "clip", "start": )" +
                          std::to_string(clip * 0.5) + R"(, "end": )" + std::to_string(clip * 0.5 + 0.4) + "}";
            tracks +=
                std::string(track == 0 ? "" : ",") + R"({"kind": "audio", "name": "A", "events": [)" + events + "]}";
        }
        project = folder.write("long.stage", projectWith(tracks));
        oldFile = folder.write("old.edl", oldText);
        newFile = folder.write("new.edl", newText);
    }

    Words arguments(const Words& more) const
    {
        Words words{"apply", project, "--old", oldFile, "--new", newFile};
        words.insert(words.end(), more.begin(), more.end());
        return words;
    }

    const TempFolder folder;
    std::string project;
    std::string oldFile;
    std::string newFile;

private:
    static constexpr int ShotCount = 100;

    static std::string at(int frame)
    {
        std::array<char, 16> text{};
        std::snprintf(text.data(), text.size(), "00:%02d:%02d:%02d", frame / 24 / 60, frame / 24 % 60, frame % 24);
        return text.data();
    }
};

TEST(Apply, OnATerminalTheProgressOfTheRunIsShown)
{
    const Scene scene;

    const Outcome outcome = runCadrelOnTerminal(scene.arguments({"--summary"}));

    EXPECT_EQ(outcome.status, 0);
    EXPECT_TRUE(tells(outcome.out, "Processing Project")) << outcome.out;
    EXPECT_TRUE(tells(outcome.out, "Applied     2 events")) << outcome.out;
    EXPECT_EQ(scene.apply({"--summary"}).err, "");
}

TEST(Apply, TheProgressDoesntRunBack)
{
    const LongScene scene;

    const std::string shown = runCadrelOnTerminal(scene.arguments({"--summary", "--virgin-territories"})).out;

    int percent = 0;
    std::size_t count = 0;
    for (std::size_t at = shown.find("% ("); at != std::string::npos; at = shown.find("% (", at + 1)) {
        const int next = std::stoi(shown.substr(at - 3, 3));
        EXPECT_GE(next, percent) << shown.substr(at - 20, 60);
        percent = next;
        ++count;
    }
    EXPECT_GT(count, 10U);
}

TEST(Apply, AnInterruptionTakesTheRunBackAndLeavesTheFilesAsTheyWere)
{
    const LongScene scene;
    const std::string before = contentOf(scene.project);
    const std::string document = scene.folder.write("report.json", "former report");

    const Outcome outcome = runCadrelInterruptedAt("Processing Project",
                                                   scene.arguments({"--in-place", "--overwrite", "--json", document}));

    EXPECT_EQ(outcome.status, -1);
    EXPECT_FALSE(tells(outcome.out, "Applied")) << outcome.out;
    EXPECT_EQ(contentOf(scene.project), before);
    EXPECT_EQ(contentOf(document), "former report");
    EXPECT_EQ(scene.folder.names(), (Words{"long.stage", "new.edl", "old.edl", "report.json"}));
}

TEST(Apply, WhatAnotherProgramSavesDuringTheRunIsNotOverwritten)
{
    const LongScene scene;
    const std::string document = scene.folder / "report.json";
    const auto run = [&](const Words& options) {
        return runCadrelDisturbedAt("Processing Project", scene.arguments(options), [&] {
            scene.folder.write("other", "of another program");
            std::filesystem::rename(scene.folder / "other", scene.project);
        });
    };
    const std::string project = contentOf(scene.project);
    const std::string message =
        ": another program has written it meanwhile; look at what it has written, and run again";

    const Outcome outcome = run({"--in-place", "--backup", "--json", document});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(tells(outcome.out, scene.project + message)) << outcome.out;
    EXPECT_EQ(contentOf(scene.project), "of another program");
    EXPECT_EQ(scene.folder.names(), (Words{"long.stage", "new.edl", "old.edl"}));

    // Beside it there is nothing to lose.
    writeFile(scene.project, project);
    EXPECT_EQ(run({"-o", scene.folder / "result.stage", "--summary"}).status, 0);
}

TEST(Apply, AFileThatComesUpDuringTheRunIsNotOverwritten)
{
    const LongScene scene;
    const std::string result = scene.folder / "result.stage";
    const auto run = [&](const Words& options) {
        return runCadrelDisturbedAt("Processing Project", scene.arguments(options),
                                    [&] { writeFile(result, "of another program"); });
    };

    const Outcome outcome = run({"-o", result, "--summary"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_TRUE(tells(outcome.out, result + ": another program has written it meanwhile")) << outcome.out;
    EXPECT_EQ(contentOf(result), "of another program");
    EXPECT_EQ(run({"-o", result, "--overwrite", "--summary"}).status, 0);
    EXPECT_NE(contentOf(result), "of another program");
}

TEST(Apply, AProjectThatExistsIsReplacedOnlyWhenThatIsSaid)
{
    const Scene scene;
    const std::string result = scene.folder.write("result.stage", "former");

    const Outcome outcome = scene.apply({"-o", result});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: " + result + ": exists already; give --overwrite to replace it, or another name\n");
    EXPECT_EQ(contentOf(result), "former");
    EXPECT_EQ(scene.apply({"-o", result, "--overwrite"}).status, 0);
    EXPECT_EQ(placesOn("Guide", result), (Places{{"guide", {"0-30"}}}));
    EXPECT_EQ(scene.folder.names(), (Words{"new.edl", "old.edl", "result.stage", "scene.stage"}));
}

TEST(Apply, ABackupKeepsWhatIsReplacedUnderTheFirstFreeNumber)
{
    const Scene scene;
    const std::string before = contentOf(scene.project);
    const std::string first = scene.folder / "scene_backup_1.stage";
    const std::string second = scene.folder / "scene_backup_2.stage";

    const Outcome outcome = scene.apply({"--in-place", "--backup", "--summary"});

    EXPECT_TRUE(outcome.out.ends_with("Written     " + scene.project + "\nBackup      " + first + "\n")) << outcome.out;
    EXPECT_EQ(contentOf(first), before);
    const std::string after = contentOf(scene.project);
    EXPECT_NE(after, before);

    std::filesystem::create_symlink("scene.stage", scene.folder / "link.stage");
    const Outcome again = runCadrel({"apply", scene.folder / "link.stage", "--old", scene.oldFile, "--new",
                                     scene.newFile, "--in-place", "--backup", "--force", "--json", "-"});

    EXPECT_EQ(json::parse(again.out).at("backup"), second);
    EXPECT_EQ(contentOf(first), before);
    EXPECT_EQ(contentOf(second), after);
    EXPECT_TRUE(std::filesystem::is_symlink(scene.folder / "link.stage"));
    EXPECT_EQ(scene.applyAsJson({"--force", "--backup"}).at("backup"), json());
    EXPECT_EQ(scene.folder.names(), (Words{"link.stage", "new.edl", "old.edl", "scene.stage", "scene_backup_1.stage",
                                           "scene_backup_2.stage"}));
}

TEST(Apply, NothingIsPrintedOfAProjectThatCantBeWritten)
{
    const Scene scene;

    const Outcome outcome = scene.apply({"-o", "/dev/full", "--json", "-"});

    EXPECT_EQ(outcome.status, 1);
    EXPECT_EQ(outcome.out, "");
    EXPECT_EQ(outcome.err, "cadrel: /dev/full: can't be written; see whether the disk is full\n");
}

TEST(Apply, TheSoundOfAReelGoesOverToItsNewCut)
{
    const std::string folder = treePath("examples/reel3/");

    const Outcome outcome = runCadrel({"apply", folder + "reel3.stage", "--old", folder + "reel3_v07.edl", "--new",
                                       folder + "reel3_v12.edl", "--vfx", "VFX_****_v,_comp", "--json", "-"});

    EXPECT_EQ(outcome.status, 0) << outcome.err;
    const json tracks = json::parse(outcome.out).at("tracks");
    const auto fateOf = [&](const char* track, const char* clip) {
        const json& change = named(named(tracks, track).at("changes"), clip);
        std::string text = change.at("was").at("in").at("timecode");
        for (const json& piece : change.at("now"))
            text += " > " + piece.at("in").at("timecode").get<std::string>();
        return text;
    };
    // Scene 43 is out, and 44 has taken its place.
    EXPECT_EQ(fateOf("Scenes", "43 Stair"), "03:03:50:21");
    EXPECT_EQ(fateOf("Props", "hand on handle"), "03:04:04:14");
    // The wide shot of the weir, in the opening, is used a second time.
    EXPECT_TRUE(named(named(tracks, "Scenes").at("changes"), "41 Weir, dawn").at("doubled"));
    // Maren's line in scene 46 has gone before scene 45 with it: old 03:09:22:19, new 03:05:56:20.
    EXPECT_EQ(fateOf("DIA 1", "46A-2 Maren, low"), "03:09:35:05 > 03:06:09:06");
    // The picture and its sound are locked.
    EXPECT_EQ(named(tracks, "Old Video").at("stay"), 1);
    EXPECT_EQ(named(tracks, "Guide").at("stay"), 1);
}

} // namespace
