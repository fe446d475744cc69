// SPDX-License-Identifier: GPL-3.0-or-later

// Files that are no projects. Each fault is one line that names the file, the place in it and what is wrong there.

#include "standin/file/ProjectFile.h"

#include "standin/project/Project.h"
#include "tests/standin/file/ProjectText.h"
#include "tests/support/NoPrivileges.h"
#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <sys/stat.h>

namespace standin::tests {

namespace {

namespace fs = std::filesystem;

using cadrel::tests::NoPrivileges;
using cadrel::tests::TempFolder;

std::string faultOf(std::string_view text)
{
    return ProjectTexts().faultOf(text);
}

/// Of one event on an audio track, or on a track of another kind.
std::string faultOfEvent(const std::string& event, const std::string& kind = "audio")
{
    return faultOf(projectWithEvent(event, kind));
}

/// Of one point of a curve.
std::string faultOfPoint(const std::string& point)
{
    return faultOf(projectWithTrack("audio", R"("curves": [{"number": 1, "points": [)" + point + "]}]"));
}

/// Of members of the project itself, which has no more than it needs.
std::string faultOfProject(const std::string& members)
{
    return faultOf(R"({"format": "stage", "version": 1, "framesPerSecond": 24, )" + members + "}");
}

/// So many of the opening one, each in the one before, around the middle.
std::string nested(int levels, const std::string& opening, const std::string& middle, const std::string& closing)
{
    std::string text = middle;
    for (int level = 0; level < levels; ++level)
        text = opening + text + closing;
    return text;
}

TEST(ProjectFileFault, IsTextThatIsNoJson)
{
    EXPECT_EQ(faultOf("CMX 3600\n"), "reel.stage: line 1, column 1: broken JSON while parsing value - invalid literal");
    EXPECT_EQ(faultOf("{\n  \"format\": \"stage\",\n}"),
              "reel.stage: line 3, column 1: broken JSON while parsing object key - "
              "unexpected '}'; expected string literal");
    EXPECT_EQ(faultOf(""),
              "reel.stage: line 1, column 1: broken JSON while parsing value - unexpected end of input; expected "
              "'[', '{', or a literal");
}

TEST(ProjectFileFault, IsATextThatIsCutOffAnywhere)
{
    const std::string text = projectWithEvent(R"({"kind": "clip", "start": 1.5, "end": 2, "clip": 1})");
    ASSERT_EQ(faultOf(text), "none");

    for (std::size_t size = 0; size < text.size(); ++size) {
        const std::string fault = faultOf(text.substr(0, size));
        EXPECT_TRUE(fault.starts_with("reel.stage: line 1, column ")) << size << ": " << fault;
    }
}

TEST(ProjectFileFault, IsAnotherFormat)
{
    EXPECT_EQ(faultOf("[1, 2]"), "reel.stage: is a list, not a project");
    EXPECT_EQ(faultOf("7"), "reel.stage: is a number, not a project");
    EXPECT_EQ(faultOf("{}"), "reel.stage: format: isn't \"stage\": this is no project");
    EXPECT_EQ(faultOf(R"({"format": "scene"})"), "reel.stage: format: isn't \"stage\": this is no project");
    EXPECT_EQ(faultOf(R"({"format": 1})"), "reel.stage: format: isn't \"stage\": this is no project");
}

TEST(ProjectFileFault, IsAnotherVersion)
{
    EXPECT_EQ(faultOf(R"({"format": "stage"})"), "reel.stage: version: is missing");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 2, "tracks": 5})"),
              "reel.stage: version: is 2: written by a newer version than this one, which knows 1");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 0})"), "reel.stage: version: is 0, not from 1 to 2147483647");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 1.5})"), "reel.stage: version: is 1.5, not a whole number");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 1.0})"), "reel.stage: version: is 1.0, not a whole number");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": "1"})"), "reel.stage: version: is a text, not a number");
}

TEST(ProjectFileFault, IsAClockThatIsNone)
{
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 1})"), "reel.stage: framesPerSecond: is missing");
    EXPECT_EQ(faultOf(R"({"format": "stage", "version": 1, "framesPerSecond": 0})"),
              "reel.stage: framesPerSecond: is 0, not from 1 to 1000");
    EXPECT_EQ(faultOfProject(R"("dropFrame": 1)"), "reel.stage: dropFrame: is a number, not true or false");
    EXPECT_EQ(faultOfProject(R"("end": -1)"), "reel.stage: end: is -1, not from 0 to 1000000000");
    EXPECT_EQ(faultOfProject(R"("timeOrigin": 1e10)"),
              "reel.stage: timeOrigin: is 10000000000, not from -1000000000 to 1000000000");
    EXPECT_EQ(faultOfProject(R"("cycleEnd": null)"), "reel.stage: cycleEnd: is null, not a number");
    EXPECT_EQ(faultOfProject(R"("position": 1e999)"), "reel.stage: line 1, column 74: a number beyond all bounds");
}

TEST(ProjectFileFault, IsDropFrameAtARateThatHasNone)
{
    const auto faultAt = [](const std::string& framesPerSecond) {
        return faultOf(R"({"format": "stage", "version": 1, "dropFrame": true, "framesPerSecond": )" + framesPerSecond +
                       "}");
    };
    const std::string fault =
        "reel.stage: dropFrame: is true, but timecode is drop-frame at 30 frames per second (29.97) alone";

    for (const char* rate : {"1", "23.976", "24", "25", "29.4", "30.6", "59.94", "60", "1000"})
        EXPECT_EQ(faultAt(rate), fault) << rate;
    for (const char* rate : {"29.97", "29.97002997002997", "30", "30.0"})
        EXPECT_EQ(faultAt(rate), "none") << rate;
}

TEST(ProjectFileFault, IsAValueOfTheWrongType)
{
    EXPECT_EQ(faultOfProject(R"("tracks": {})"), "reel.stage: tracks: is an object, not a list");
    EXPECT_EQ(faultOfProject(R"("tracks": [3])"), "reel.stage: tracks[0]: is a number, not an object");
    EXPECT_EQ(faultOfProject(R"("pool": "none")"), "reel.stage: pool: is a text, not a list");
    EXPECT_EQ(faultOfProject(R"("name": true)"), "reel.stage: name: is true or false, not a text");
    EXPECT_EQ(faultOfProject(R"("attributes": [])"), "reel.stage: attributes: is a list, not an object");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": "1", "end": 2})"),
              "reel.stage: tracks[0].events[0].start: is a text, not a number");
    EXPECT_EQ(faultOfEvent(R"({"kind": 1})"), "reel.stage: tracks[0].events[0].kind: is a number, not a text");
}

TEST(ProjectFileFault, IsAMemberThatIsMissing)
{
    EXPECT_EQ(faultOfProject(R"("tracks": [{}])"), "reel.stage: tracks[0].kind: is missing");
    EXPECT_EQ(faultOfProject(R"("pool": [{"number": 1, "kind": "audio", "length": 1}])"),
              "reel.stage: pool[0].path: is missing");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "end": 2})"), "reel.stage: tracks[0].events[0].start: is missing");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 2})"), "reel.stage: tracks[0].events[0].end: is missing");
    EXPECT_EQ(faultOfPoint(R"({"time": 2})"), "reel.stage: tracks[0].curves[0].points[0].value: is missing");
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("curves": [{}])")),
              "reel.stage: tracks[0].curves[0].number: is missing");
}

TEST(ProjectFileFault, IsANegativeLength)
{
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1}, {"kind": "clip", "start": 3, "end": 2.5})"),
              "reel.stage: tracks[0].events[1].end: lies before the start: the length is negative");
    EXPECT_EQ(faultOfProject(R"("pool": [{"number": 1, "kind": "audio", "path": "a.wav", "length": -1}])"),
              "reel.stage: pool[0].length: is -1, not from 0 to 1000000000");
}

TEST(ProjectFileFault, IsATimeBeyondAllBounds)
{
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": -0.5, "end": 2})"),
              "reel.stage: tracks[0].events[0].start: is -0.5, not from 0 to 1000000000");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 1, "end": 1000000000.1})"),
              "reel.stage: tracks[0].events[0].end: is 1000000000.1, not from 0 to 1000000000");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 1, "end": 1e300})"),
              "reel.stage: tracks[0].events[0].end: is 1e+300, not from 0 to 1000000000");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 1, "end": 2, "offset": -1})"),
              "reel.stage: tracks[0].events[0].offset: is -1, not from 0 to 1000000000");
    EXPECT_EQ(faultOfPoint(R"({"time": 99999999999999999999, "value": 1})"),
              "reel.stage: tracks[0].curves[0].points[0].time: is 1e+20, not from 0 to 1000000000");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 1000000000, "end": 1000000000})"), "none");
}

TEST(ProjectFileFault, IsAValueThatIsNoPartOfTheWhole)
{
    EXPECT_EQ(faultOfPoint(R"({"time": 0, "value": 1.0001})"),
              "reel.stage: tracks[0].curves[0].points[0].value: is 1.0001, not from 0 to 1");
    EXPECT_EQ(faultOfPoint(R"({"time": 0, "value": -1e-9})"),
              "reel.stage: tracks[0].curves[0].points[0].value: is -1e-09, not from 0 to 1");
    EXPECT_EQ(faultOfPoint(R"({"time": 0, "value": 0}, {"time": 0, "value": 1})"), "none");
}

TEST(ProjectFileFault, IsAReferenceToNothing)
{
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "clip": 2})"),
              "reel.stage: tracks[0].events[0].clip: is 2, but the pool has no clip of that number");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "clip": 0})"),
              "reel.stage: tracks[0].events[0].clip: is 0, not from 1 to 1000000000");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "clip": 1.5})"),
              "reel.stage: tracks[0].events[0].clip: is 1.5, not a whole number");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "clip": "1"})"),
              "reel.stage: tracks[0].events[0].clip: is a text, not a number");
}

TEST(ProjectFileFault, IsANumberThatIsThereTwice)
{
    EXPECT_EQ(faultOfProject(R"("pool": [{"number": 3, "kind": "audio", "path": "a", "length": 1},
                                         {"number": 3, "kind": "audio", "path": "b", "length": 1}])"),
              "reel.stage: pool[1].number: is 3, which is another clip's");
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("curves": [{"number": 4}, {"number": 4}])")),
              "reel.stage: tracks[0].curves[1].number: is 4, which is another curve's");
}

TEST(ProjectFileFault, IsANumberThatCountsNothing)
{
    EXPECT_EQ(faultOfProject(R"("pool": [{"number": -1, "kind": "audio", "path": "a", "length": 1}])"),
              "reel.stage: pool[0].number: is -1, not from 1 to 1000000000");
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("curves": [{"number": 9223372036854775807}])")),
              "reel.stage: tracks[0].curves[0].number: is 9223372036854775808, not from 1 to 1000000000");
}

TEST(ProjectFileFault, IsAMemberThatIsThereTwice)
{
    EXPECT_EQ(faultOfProject(R"("version": 1)"), "reel.stage: version: is there twice");
    EXPECT_EQ(faultOfProject(R"("x-y": 1, "x-y": 1)"), "reel.stage: [\"x-y\"]: is there twice");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "start": 0})"),
              "reel.stage: tracks[0].events[0].start: is there twice");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": 1, "a": 2})"), "reel.stage: attributes.a: is there twice");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": {"b": "", "b": ""}})"),
              "reel.stage: attributes.a.b: is there twice");
}

TEST(ProjectFileFault, IsAKindThatIsUnknown)
{
    EXPECT_EQ(faultOfProject(R"("tracks": [{"kind": "midi"}])"),
              "reel.stage: tracks[0].kind: is \"midi\", which is no kind of track");
    EXPECT_EQ(faultOfEvent(R"({"kind": "note", "start": 0, "end": 1})"),
              "reel.stage: tracks[0].events[0].kind: is \"note\", which is no kind of event");
    EXPECT_EQ(faultOfProject(R"("pool": [{"number": 1, "kind": "marker", "path": "a", "length": 1}])"),
              "reel.stage: pool[0].kind: is \"marker\", which is no kind of clip");
}

TEST(ProjectFileFault, IsAnEventThatLiesOnTheWrongTrack)
{
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1})", "marker"),
              "reel.stage: tracks[0].events[0].kind: is \"clip\", which can't lie here");
    EXPECT_EQ(faultOfEvent(R"({"kind": "point", "start": 0})"),
              "reel.stage: tracks[0].events[0].kind: is \"point\", which can't lie here");
    EXPECT_EQ(
        faultOfEvent(R"({"kind": "part", "start": 0, "end": 1, "events": [{"kind": "range", "start": 0, "end": 0}]})"),
        "reel.stage: tracks[0].events[0].events[0].kind: is \"range\", which can't lie here");
}

TEST(ProjectFileFault, IsAMemberOfAnotherKind)
{
    EXPECT_EQ(faultOfEvent(R"({"kind": "point", "start": 0, "end": 0})", "marker"),
              "reel.stage: tracks[0].events[0].end: a point has none");
    EXPECT_EQ(faultOfEvent(R"({"kind": "range", "start": 0, "end": 0, "clip": 1})", "marker"),
              "reel.stage: tracks[0].events[0].clip: only a clip has it");
    EXPECT_EQ(faultOfEvent(R"({"kind": "part", "start": 0, "end": 0, "offset": 1})"),
              "reel.stage: tracks[0].events[0].offset: only a clip has it");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 0, "events": []})"),
              "reel.stage: tracks[0].events[0].events: only a part has events");
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("tracks": [])")),
              "reel.stage: tracks[0].tracks: only a folder has tracks");
    EXPECT_EQ(faultOf(projectWithTrack("folder", R"("events": [])")),
              "reel.stage: tracks[0].events: a folder has none");
    EXPECT_EQ(faultOf(projectWithTrack("folder", R"("curves": [])")),
              "reel.stage: tracks[0].curves: a folder has none");
    EXPECT_EQ(faultOf(projectWithTrack("marker", R"("curves": [])")),
              "reel.stage: tracks[0].curves: this kind of track has none");
}

TEST(ProjectFileFault, IsACurveUnderAnotherName)
{
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("curves": [{"number": 2, "automates": "volume"}])")),
              "reel.stage: tracks[0].curves[0].automates: is \"volume\", but curve 2 is \"pan\"");
    EXPECT_EQ(faultOf(projectWithTrack("audio", R"("curves": [{"number": 2, "automates": 2}])")),
              "reel.stage: tracks[0].curves[0].automates: is a number, not a text");
}

TEST(ProjectFileFault, IsAnAttributeThatNoneCanBe)
{
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": 1.5})"),
              "reel.stage: attributes.a: isn't a whole number of 64 bits");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": 9223372036854775808})"),
              "reel.stage: attributes.a: isn't a whole number of 64 bits");
    EXPECT_EQ(faultOfProject(R"("attributes": {"Cadrel:Type": true})"),
              "reel.stage: attributes[\"Cadrel:Type\"]: is true or false, not a number, a text or an object of binary "
              "values");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": {"b": "Zg"}})"), "reel.stage: attributes.a.b: isn't base64");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": {"b": 1}})"),
              "reel.stage: attributes.a.b: is a number, not a text");
}

TEST(ProjectFileFault, IsATextThatEndsTooEarly)
{
    EXPECT_EQ(faultOfProject(R"("name": "a\u0000b")"), "reel.stage: name: holds a zero character");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": "\u0000"})"), "reel.stage: attributes.a: holds a zero character");
    EXPECT_EQ(faultOfProject(R"("attributes": {"\u0000": 1})"),
              "reel.stage: attributes[\"\\u0000\"]: has a key with a zero character");
    EXPECT_EQ(faultOfProject(R"("attributes": {"a": {"\u0000": ""}})"),
              "reel.stage: attributes.a[\"\\u0000\"]: has a key with a zero character");
}

TEST(ProjectFileFault, IsTextThatIsNoUtf8)
{
    EXPECT_EQ(faultOfProject("\"name\": \"\xff\""),
              "reel.stage: line 1, column 67: broken JSON while parsing value - invalid string: ill-formed UTF-8 byte");
    EXPECT_TRUE(faultOfProject("\"name\": \"\\ud800\"").starts_with("reel.stage: line 1, column 7"));
}

TEST(ProjectFileFault, IsNestingWithoutAnEnd)
{
    const std::string folders = nested(100, R"({"kind": "folder", "tracks": [)", "", "]}");
    const std::string parts = nested(99, R"({"kind": "part", "start": 0, "end": 1, "events": [)", "", "]}");
    const std::string lists = nested(101, "[", "", "]");
    const std::string countless(1000000, '[');

    EXPECT_TRUE(
        faultOf(projectWith("\"tracks\": [" + folders + "]")).ends_with(".tracks[0]: nested deeper than 100 levels"));
    EXPECT_TRUE(faultOfEvent(parts).ends_with(".events[0]: nested deeper than 100 levels"));
    EXPECT_EQ(faultOfProject("\"x\": " + lists), "reel.stage: x: nested deeper than 100 levels");
    EXPECT_EQ(faultOfProject("\"x\": " + lists.substr(1, 200)), "none");
    EXPECT_EQ(faultOfEvent(R"({"kind": "clip", "start": 0, "end": 1, "x": )" + lists + "}"),
              "reel.stage: tracks[0].events[0].x: nested deeper than 100 levels");
    EXPECT_EQ(faultOf(countless), "reel.stage: line 1, column 305: nested deeper than 304 levels");
    EXPECT_EQ(faultOfProject("\"x\": " + countless), "reel.stage: line 1, column 366: nested deeper than 304 levels");
}

TEST(ProjectFileFault, IsToldInOneShortLine)
{
    const std::string longText(1000000, 'k');

    EXPECT_EQ(faultOfProject(R"("tracks": [{"kind": "a\nb\u001b[31m"}])"),
              "reel.stage: tracks[0].kind: is \"a\\nb\\u001b[31m\", which is no kind of track");
    EXPECT_EQ(faultOfProject(R"("tracks": [{"kind": ")" + longText + "\"}]"),
              "reel.stage: tracks[0].kind: is \"" + longText.substr(0, 40) + "\"..., which is no kind of track");
    EXPECT_EQ(faultOfProject("\"attributes\": {\"" + longText + "\": true}"),
              "reel.stage: attributes[\"" + longText.substr(0, 40) +
                  "\"...]: is true or false, not a number, a text or an object of binary values");
    EXPECT_EQ(ProjectTexts().faultOf(longText),
              "reel.stage: line 1, column 1: broken JSON while parsing value - invalid literal");
    EXPECT_LT(faultOf("[\"" + longText).size(), 200U);
}

TEST(ProjectFileFault, CutsALongTextBetweenItsCharacters)
{
    // The 40th byte is the second of the three of the last character.
    const std::string kind = std::string(38, 'k') + "\xe5\xa3\xb0\xe9\x9f\xb3";

    EXPECT_EQ(faultOfProject(R"("tracks": [{"kind": ")" + kind + "\"}]"),
              "reel.stage: tracks[0].kind: is \"" + kind.substr(0, 38) + "\"..., which is no kind of track");
}

/// What is said of a file that can't be read; "none" for one that can.
std::string faultOfReading(const fs::path& file)
{
    ChangeLog log;
    try {
        ProjectFile::read(file, log);
        return "none";
    } catch (const ProjectFileError& error) {
        return error.what();
    }
}

TEST(ProjectFileReading, NamesTheFileInEveryFault)
{
    const TempFolder folder;
    const fs::path path = folder.write("reel.stage", "{}");

    EXPECT_EQ(faultOfReading(path), path.string() + ": format: isn't \"stage\": this is no project");
}

TEST(ProjectFileReading, ReadsAFile)
{
    const TempFolder folder;

    EXPECT_EQ(faultOfReading(folder.write("reel.stage", projectWith(R"("tracks": [])"))), "none");
}

TEST(ProjectFileReading, RefusesAFileThatIsNotThere)
{
    const TempFolder folder;

    EXPECT_EQ(faultOfReading(folder / "reel.stage"), (folder / "reel.stage").string() + ": there is no such file");
    EXPECT_EQ(faultOfReading(folder / "no/reel.stage"),
              (folder / "no/reel.stage").string() + ": there is no such file");
    EXPECT_EQ(faultOfReading(""), ": there is no such file");
}

TEST(ProjectFileReading, RefusesAFolder)
{
    const TempFolder folder;

    EXPECT_EQ(faultOfReading(folder.path()), folder.path().string() + ": is a folder");
}

TEST(ProjectFileReading, RefusesAPipeWithoutWaitingForIt)
{
    const TempFolder folder;
    ASSERT_EQ(mkfifo((folder / "pipe").c_str(), 0600), 0);

    EXPECT_EQ(faultOfReading(folder / "pipe"), (folder / "pipe").string() + ": is no ordinary file");
    EXPECT_EQ(faultOfReading("/dev/zero"), "/dev/zero: is no ordinary file");
}

TEST(ProjectFileReading, RefusesAFileThatItMayNotRead)
{
    const TempFolder folder;
    const fs::path path = folder.write("reel.stage", projectWith(R"("tracks": [])"));
    fs::create_directory(folder / "closed");
    fs::permissions(path, fs::perms::none);
    fs::permissions(folder / "closed", fs::perms::none);
    fs::permissions(folder.path(), fs::perms::all);

    const NoPrivileges user;
    EXPECT_EQ(faultOfReading(path), path.string() + ": can't be read");
    EXPECT_EQ(faultOfReading(folder / "closed/reel.stage"),
              (folder / "closed/reel.stage").string() + ": Permission denied");
}

TEST(ProjectFileReading, RefusesAFileThatIsTooLarge)
{
    const TempFolder folder;
    const fs::path path = folder.write("reel.stage", "{");
    // Almost all of it is a hole, which takes no room on the disk.
    fs::resize_file(path, (std::uintmax_t{1} << 31U) + 1);

    EXPECT_EQ(faultOfReading(path), path.string() + ": is too large for a project");
}

TEST(ProjectFileReading, RefusesALinkToItself)
{
    const TempFolder folder;
    fs::create_symlink("reel.stage", folder / "reel.stage");

    EXPECT_TRUE(faultOfReading(folder / "reel.stage").starts_with((folder / "reel.stage").string() + ": "));
}

TEST(ProjectFileReading, PutsAnyNameOnOneLine)
{
    const TempFolder folder;
    const fs::path path = folder.write("re\nel\x1b.stage", "{}");

    EXPECT_EQ(faultOfReading(path),
              (folder / "re?el?.stage").string() + ": format: isn't \"stage\": this is no project");
}

} // namespace

} // namespace standin::tests
