// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/ProjectFile.h"

#include "standin/base/AttributeList.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Envelope.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Track.h"
#include "tests/standin/file/ProjectText.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>
#include <vector>

using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::makeCounted;

namespace standin::tests {

namespace {

class ProjectFileForm : public testing::Test {
protected:
    Counted<Project> newProject() { return makeCounted<Project>(m_texts.log()); }
    Counted<Project> parse(std::string_view text) { return m_texts.parse(text); }
    std::string textAgain(std::string_view text) { return m_texts.textAgain(text); }

private:
    ProjectTexts m_texts;
};

/// The only track of the project.
Track& trackOf(const Project& project)
{
    return static_cast<Track&>(*project.firstChild());
}

template <class Kind>
Kind& firstOf(const Container& container)
{
    return dynamic_cast<Kind&>(*container.firstChild());
}

Counted<Track> addTrack(Container& parent, Track::Kind kind, const char16_t* name)
{
    auto track = Track::create(kind);
    track->setName(name);
    track->insertInto(parent);
    return track;
}

template <class Kind, class... Arguments>
Counted<Kind> addEvent(Container& container, double start, double end, Arguments... arguments)
{
    auto event = makeCounted<Kind>(arguments...);
    event->setSpan(start, end);
    event->insertInto(container);
    return event;
}

void addPoint(Envelope& curve, double time, double value)
{
    const auto point = makeCounted<AutomationPoint>();
    point->setSpan(time, time);
    point->setValue(value);
    point->insertInto(curve);
}

Counted<Velmark::FUnknown> asObject(Counted<Velmark::FObject> object)
{
    return object;
}

bool contains(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

TEST_F(ProjectFileForm, OfAnEmptyProjectIsItsClock)
{
    EXPECT_EQ(ProjectFile::toText(*newProject()), R"({
  "format": "stage",
  "version": 1,
  "framesPerSecond": 24,
  "dropFrame": false,
  "pulledDown": false,
  "timeOrigin": 0,
  "end": 0,
  "position": 0,
  "leftLocator": 0,
  "rightLocator": 0,
  "cycleStart": 0,
  "cycleEnd": 0,
  "pool": [],
  "tracks": []
}
)");
}

TEST_F(ProjectFileForm, HasAnEventAPointAndAClipOfThePoolOnALineEach)
{
    const auto project = newProject();
    project->setName(u"Reel 3");
    project->setFrameRate({30000.0 / 1001.0, FrameRateInfo::Flag::DropFrame | FrameRateInfo::Flag::PulledDown});
    project->setTimeOrigin(3600.0);
    project->setProjectEnd(1200.5);
    project->position().setValue(0, -1.0);
    project->locatorLeft().setValue(0, 1.0);
    project->locatorRight().setValue(0, 2.0);
    project->cycleLeft().setValue(0, 3.0);
    project->cycleRight().setValue(0, 4.25);
    project->setAttribute("CaDs", Attribute{Velmark::int64{-5}, true});
    const auto list = makeCounted<AttributeList>();
    list->set("CaDrData", {'f', 'o', 'o', 'b'});
    project->setAttribute("CaDr", Attribute{asObject(list), true});
    const auto door = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"/fx/door.wav", 2.5);
    project->pool().add(door, 4);
    const auto folder = addTrack(*project, Track::Kind::Folder, u"FX");
    const auto track = addTrack(*folder, Track::Kind::Audio, u"FX 1");
    track->setLocked(true);
    track->setSelected(true);
    track->setAttribute("Cadrel:LockState", Attribute{Velmark::int64{1}, true});
    Envelope& volume = track->curve(Envelope::Curve::Volume);
    addPoint(volume, 0.5, 1.0);
    addPoint(volume, 2.0, 0.75);
    const auto clip = addEvent<ClipEvent>(*track, 1.0, 1.1);
    clip->setClip(door);
    clip->setSourceOffset(0.25);
    clip->setName(u"Door, \"slam\"");
    clip->setSelected(true);
    const auto part = addEvent<Part>(*track, 5.0, 9.0);
    part->setName(u"Steps");
    addEvent<ClipEvent>(*part, 0.0, 0.0)->setAttribute("take", Attribute{std::string("7b"), true});
    const auto markers = addTrack(*project, Track::Kind::Marker, u"");
    addEvent<Marker>(*markers, 3.0, 3.0, false)->setName(u"here");
    addEvent<Marker>(*markers, 4.0, 4.0, true);

    EXPECT_EQ(ProjectFile::toText(*project), R"({
  "format": "stage",
  "version": 1,
  "name": "Reel 3",
  "framesPerSecond": 29.97002997002997,
  "dropFrame": true,
  "pulledDown": true,
  "timeOrigin": 3600,
  "end": 1200.5,
  "position": -1,
  "leftLocator": 1,
  "rightLocator": 2,
  "cycleStart": 3,
  "cycleEnd": 4.25,
  "attributes": {
    "CaDr": {
      "CaDrData": "Zm9vYg=="
    },
    "CaDs": -5
  },
  "pool": [
    {"number": 4, "kind": "audio", "name": "door", "path": "/fx/door.wav", "length": 2.5}
  ],
  "tracks": [
    {
      "kind": "folder",
      "name": "FX",
      "tracks": [
        {
          "kind": "audio",
          "name": "FX 1",
          "locked": true,
          "selected": true,
          "attributes": {
            "Cadrel:LockState": 1
          },
          "curves": [
            {
              "number": 1,
              "automates": "volume",
              "points": [
                {"time": 0.5, "value": 1},
                {"time": 2, "value": 0.75}
              ]
            }
          ],
          "events": [
            {"kind": "clip", "start": 1, "end": 1.1, "clip": 4, "offset": 0.25, "name": "Door, \"slam\"", "selected": true},
            {
              "kind": "part",
              "start": 5,
              "end": 9,
              "name": "Steps",
              "events": [
                {"kind": "clip", "start": 0, "end": 0, "attributes": {"take": "7b"}}
              ]
            }
          ]
        }
      ]
    },
    {
      "kind": "marker",
      "events": [
        {"kind": "point", "start": 3, "name": "here"},
        {"kind": "range", "start": 4, "end": 4}
      ]
    }
  ]
}
)");
}

TEST_F(ProjectFileForm, GivesTheClockBack)
{
    const auto project =
        parse(R"({"format": "stage", "version": 1, "name": "Reel 3", "framesPerSecond": 29.97, "pulledDown": true,
                  "dropFrame": true, "timeOrigin": 36000, "end": 90, "position": 7, "leftLocator": 1, "rightLocator": 2,
                  "cycleStart": 3, "cycleEnd": 4, "selected": true})");

    EXPECT_EQ(project->name(), u"Reel 3");
    EXPECT_EQ(project->frameRate().framesPerSecond, 29.97);
    EXPECT_EQ(project->frameRate().flags, FrameRateInfo::Flag::DropFrame | FrameRateInfo::Flag::PulledDown);
    EXPECT_EQ(project->timeOrigin(), 36000.0);
    EXPECT_EQ(project->setEndTime(), 90.0);
    EXPECT_EQ(project->position().getValue(), 7.0);
    EXPECT_EQ(project->locatorLeft().getValue(), 1.0);
    EXPECT_EQ(project->locatorRight().getValue(), 2.0);
    EXPECT_EQ(project->cycleLeft().getValue(), 3.0);
    EXPECT_EQ(project->cycleRight().getValue(), 4.0);
    EXPECT_TRUE(project->isSelected());
    EXPECT_TRUE(project->allTracks().empty());
    EXPECT_TRUE(project->pool().clips().empty());
}

TEST_F(ProjectFileForm, GivesThePoolBackUnderItsNumbers)
{
    const auto project = parse(projectWith(R"("tracks": [])"));
    MediaClip* const door = project->pool().clipWith(1);
    MediaClip* const reel = project->pool().clipWith(7);

    ASSERT_EQ(project->pool().clips().size(), 2U);
    ASSERT_TRUE(door && reel);
    EXPECT_EQ(door->kind(), MediaClip::Kind::Audio);
    EXPECT_EQ(door->path(), u"/fx/door.wav");
    EXPECT_EQ(door->name(), u"door");
    EXPECT_EQ(door->seconds(), 2.0);
    EXPECT_EQ(reel->kind(), MediaClip::Kind::Video);
    EXPECT_EQ(reel->name(), u"reel 3");
}

TEST_F(ProjectFileForm, GivesTracksBackInTheirFolders)
{
    const auto project = parse(projectWith(R"("tracks": [
        {"kind": "folder", "name": "a", "tracks": [
            {"kind": "folder", "name": "b", "tracks": []},
            {"kind": "audio", "name": "c", "locked": true},
            {"kind": "video", "name": "d", "selected": true}]},
        {"kind": "marker", "name": "e"},
        {"kind": "ruler", "name": "f"}])"));

    std::vector<std::u16string> names;
    std::vector<std::string> kinds;
    for (const Track* const track : project->allTracks()) {
        names.push_back(track->name());
        kinds.emplace_back(Track::wordOf(track->kind()));
    }
    const std::vector<Track*> tracks = project->allTracks();
    EXPECT_EQ(names, (std::vector<std::u16string>{u"a", u"b", u"c", u"d", u"e", u"f"}));
    EXPECT_EQ(kinds, (std::vector<std::string>{"folder", "folder", "audio", "video", "marker", "ruler"}));
    EXPECT_EQ(tracks[3]->parent(), tracks[0]);
    EXPECT_TRUE(tracks[2]->isLocked());
    EXPECT_FALSE(tracks[3]->isLocked());
    EXPECT_TRUE(tracks[3]->isSelected());
    EXPECT_FALSE(tracks[2]->isSelected());
    EXPECT_EQ(project->defaultMarkerTrack(), tracks[4]);
}

TEST_F(ProjectFileForm, GivesAClipBack)
{
    const auto project = parse(projectWithEvent(
        R"({"kind": "clip", "start": 1.5, "end": 3, "clip": 7, "offset": 0.25, "name": "slam", "selected": true})"));
    const auto& event = firstOf<ClipEvent>(trackOf(*project));

    EXPECT_EQ(event.start(), 1.5);
    EXPECT_EQ(event.end(), 3.0);
    EXPECT_EQ(event.clip(), project->pool().clipWith(7));
    EXPECT_EQ(event.sourceOffset(), 0.25);
    EXPECT_EQ(event.name(), u"slam");
    EXPECT_TRUE(event.selected());
}

TEST_F(ProjectFileForm, GivesBackWhatLiesInAPart)
{
    const auto project = parse(projectWithEvent(R"({"kind": "part", "start": 10, "end": 20, "events": [
        {"kind": "part", "start": 1, "end": 5, "name": "inner", "events": [{"kind": "clip", "start": 2, "end": 3}]}]})"));
    auto& outer = firstOf<Part>(trackOf(*project));
    auto& inner = firstOf<Part>(outer);

    EXPECT_EQ(outer.childCount(), 1U);
    EXPECT_EQ(inner.name(), u"inner");
    EXPECT_EQ(firstOf<ClipEvent>(inner).absoluteStart(), 13.0);
    EXPECT_EQ(firstOf<ClipEvent>(inner).clip(), nullptr);
}

TEST_F(ProjectFileForm, GivesBothKindsOfMarkersBack)
{
    const auto project = parse(projectWithEvent(
        R"({"kind": "point", "start": 1, "name": "in"}, {"kind": "range", "start": 2, "end": 4, "name": "loop"})",
        "marker"));
    auto& point = firstOf<Marker>(trackOf(*project));
    auto& range = dynamic_cast<Marker&>(*trackOf(*project).lastChild());

    EXPECT_FALSE(point.isRange());
    EXPECT_EQ(point.end(), 1.0);
    EXPECT_TRUE(range.isRange());
    EXPECT_EQ(range.end(), 4.0);
    EXPECT_EQ(range.name(), u"loop");
}

TEST_F(ProjectFileForm, GivesCurvesBackWithTheirPointsInOrder)
{
    const auto project = parse(projectWithTrack("audio", R"("curves": [{"number": 5, "automates": "filter", "points": [
        {"time": 2, "value": 0.5}, {"time": 1, "value": 0}, {"time": 2, "value": 1, "name": "up", "selected": true}]}])"));
    const Envelope& curve = *trackOf(*project).curves().at(Envelope::Curve::Filter);
    const AutomationPoint* const first = curve.firstPoint();
    const AutomationPoint* const second = curve.pointBehind(*first);
    const AutomationPoint* const third = curve.pointBehind(*second);

    EXPECT_EQ(first->start(), 1.0);
    EXPECT_EQ(first->value(), 0.0);
    EXPECT_EQ(second->value(), 0.5);
    EXPECT_EQ(third->value(), 1.0);
    EXPECT_EQ(third->name(), u"up");
    EXPECT_TRUE(third->selected());
    EXPECT_EQ(curve.pointBehind(*third), nullptr);
}

TEST_F(ProjectFileForm, SaysOfAPointWhetherItOnlyHoldsACurve)
{
    const auto project = parse(projectWithTrack("audio", R"("curves": [{"number": 5, "automates": "filter", "points": [
        {"time": 1, "value": 0, "holding": true}, {"time": 2, "value": 1}]}])"));
    const Envelope& curve = *trackOf(*project).curves().at(Envelope::Curve::Filter);

    EXPECT_TRUE(curve.firstPoint()->isHolding());
    EXPECT_FALSE(curve.pointBehind(*curve.firstPoint())->isHolding());
    const std::string text = ProjectFile::toText(*project);
    EXPECT_NE(text.find(R"({"time": 1, "value": 0, "holding": true})"), std::string::npos) << text;
    EXPECT_NE(text.find(R"({"time": 2, "value": 1})"), std::string::npos) << text;
}

TEST_F(ProjectFileForm, GivesAttributesOfEveryKindBack)
{
    const auto project = parse(projectWith(
        R"("attributes": {"a": -9223372036854775808, "b": "T\u00f6ne", "c": {"x": "AAH/", "y": ""}, "": "no key"})"));
    const Attributes& attributes = project->attributes();
    const auto* const list =
        dynamic_cast<AttributeList*>(std::get<Counted<Velmark::FUnknown>>(attributes.at("c").value).get());

    ASSERT_EQ(attributes.size(), 4U);
    EXPECT_EQ(std::get<Velmark::int64>(attributes.at("a").value), std::numeric_limits<Velmark::int64>::min());
    EXPECT_EQ(std::get<std::string>(attributes.at("b").value), "T\xc3\xb6ne");
    EXPECT_EQ(std::get<std::string>(attributes.at("").value), "no key");
    ASSERT_TRUE(list);
    EXPECT_EQ(list->values(), (std::map<std::string, Bytes>{{"x", {0, 1, 255}}, {"y", {}}}));
    for (const auto& [key, attribute] : attributes)
        EXPECT_TRUE(attribute.isPersistent) << key;
}

TEST_F(ProjectFileForm, LeavesOutAttributesThatGoWithTheSession)
{
    const auto project = newProject();
    project->setAttribute("session", Attribute{Velmark::int64{1}, false});
    project->setAttribute("object", Attribute{asObject(newProject()), true});

    EXPECT_FALSE(contains(ProjectFile::toText(*project), "attributes"));

    project->setAttribute("stored", Attribute{Velmark::int64{1}, true});
    EXPECT_TRUE(contains(ProjectFile::toText(*project), "\"attributes\": {\n    \"stored\": 1\n  },"));
}

TEST_F(ProjectFileForm, LeavesOutACurveThatHasNothingButAttributesThatGoWithTheSession)
{
    const auto project = newProject();
    const auto track = Track::create(Track::Kind::Audio);
    track->insertInto(*project);
    track->curve(Envelope::Curve::Pan).setAttribute("session", Attribute{Velmark::int64{1}, false});

    EXPECT_FALSE(contains(ProjectFile::toText(*project), "curves"));
}

TEST_F(ProjectFileForm, CanHaveItsMembersInAnyOrder)
{
    const std::string text =
        R"({"tracks": [{"events": [{"clip": 3, "end": 2, "start": 1, "kind": "clip"}], "kind": "audio"}],
            "pool": [{"length": 9, "path": "x.wav", "kind": "audio", "number": 3}],
            "framesPerSecond": 24, "version": 1, "format": "stage"})";

    const std::string ordered = textAgain(text);

    EXPECT_TRUE(contains(ordered, "{\"kind\": \"clip\", \"start\": 1, \"end\": 2, \"clip\": 3}"));
    EXPECT_EQ(textAgain(ordered), ordered);
}

TEST_F(ProjectFileForm, KeepsTheOrderOfEventsThatBeginTogether)
{
    const auto project = parse(projectWithEvent(R"(
        {"kind": "clip", "start": 2, "end": 3, "name": "c"}, {"kind": "clip", "start": 1, "end": 9, "name": "a"},
        {"kind": "clip", "start": 1, "end": 2, "name": "b"})"));

    std::u16string names;
    for (const Node* child = trackOf(*project).firstChild(); child; child = trackOf(*project).childBehind(*child))
        names += child->name();
    EXPECT_EQ(names, u"abc");
}

TEST_F(ProjectFileForm, NamesAClipOfThePoolAfterItsFileWhenItHasNoName)
{
    const std::string text = R"({"format": "stage", "version": 1, "framesPerSecond": 24, "pool": [
        {"number": 1, "kind": "audio", "path": "/fx/Door.wav", "length": 1},
        {"number": 2, "kind": "audio", "name": "", "path": "/fx/Door.wav", "length": 1}]})";

    const auto project = parse(text);

    EXPECT_EQ(project->pool().clipWith(1)->name(), u"Door");
    EXPECT_EQ(project->pool().clipWith(2)->name(), u"");
    EXPECT_EQ(textAgain(ProjectFile::toText(*project)), ProjectFile::toText(*project));
}

TEST_F(ProjectFileForm, HasNoneOfTheCurvesThatANewTrackHasAnyway)
{
    const auto project = newProject();
    const auto track = addTrack(*project, Track::Kind::Audio, u"DX");
    EXPECT_FALSE(contains(ProjectFile::toText(*project), "curves"));

    track->curve(9);
    track->curve(Envelope::Curve::Pan).setSelected(true);

    const auto again = parse(ProjectFile::toText(*project));
    EXPECT_TRUE(
        contains(ProjectFile::toText(*project), "{\n          \"number\": 9,\n          \"points\": []\n        }"));
    EXPECT_TRUE(trackOf(*again).curves().contains(9));
    EXPECT_TRUE(trackOf(*again).curves().at(Envelope::Curve::Pan)->selected());
    EXPECT_EQ(trackOf(*again).curves().size(), track->curves().size());
}

TEST_F(ProjectFileForm, KeepsUnknownMembersOfEveryObject)
{
    const std::string text = R"({
  "format": "stage",
  "version": 1,
  "framesPerSecond": 24,
  "dropFrame": false,
  "pulledDown": false,
  "timeOrigin": 0,
  "end": 0,
  "position": 0,
  "leftLocator": 0,
  "rightLocator": 0,
  "cycleStart": 0,
  "cycleEnd": 0,
  "x-project": {"deep": [1, 2.0, {"er": null}], "too": "\n"},
  "x-another": 1.5,
  "pool": [
    {"number": 2, "kind": "audio", "name": "", "path": "", "length": 0, "x-clip": true}
  ],
  "tracks": [
    {
      "kind": "folder",
      "x-folder": 1,
      "tracks": [
        {
          "kind": "audio",
          "x-track": [],
          "curves": [
            {
              "number": 1,
              "automates": "volume",
              "x-curve": {},
              "points": [
                {"time": 0, "value": 0, "x-point": -7}
              ]
            },
            {
              "number": 100,
              "automates": "wind",
              "points": []
            }
          ],
          "events": [
            {"kind": "clip", "start": 0, "end": 1, "x-event": "\"", "y-event": 18446744073709551615},
            {
              "kind": "part",
              "start": 2,
              "end": 3,
              "x-part": 1e+300,
              "events": []
            }
          ]
        }
      ]
    }
  ]
}
)";

    EXPECT_EQ(textAgain(text), text);
}

TEST_F(ProjectFileForm, IsOfAProjectInWhichNothingHasChanged)
{
    const auto project = parse(projectWithEvent(R"({"kind": "clip", "start": 1, "end": 2})"));

    EXPECT_FALSE(project->hasChanges());
    EXPECT_EQ(project->changeFlags(), 0U);
    EXPECT_EQ(trackOf(*project).changeFlags(), 0U);
}

TEST_F(ProjectFileForm, WritesBothZerosAsOne)
{
    const auto project = newProject();
    const auto track = addTrack(*project, Track::Kind::Audio, u"");
    addEvent<ClipEvent>(*track, -0.0, 0.0);

    EXPECT_TRUE(contains(ProjectFile::toText(*project), "{\"kind\": \"clip\", \"start\": 0, \"end\": 0}"));
}

TEST_F(ProjectFileForm, IsGivenBackFromTheFileItWasWrittenTo)
{
    const std::string text =
        textAgain(projectWithEvent(R"({"kind": "clip", "start": 0.1, "end": 0.30000000000000004})"));

    EXPECT_TRUE(contains(text, "\"start\": 0.1, \"end\": 0.30000000000000004"));
    EXPECT_EQ(textAgain(text), text);
}

TEST_F(ProjectFileForm, HoldsFoldersAndPartsAsDeepAsAProjectDoes)
{
    // The project, 49 folders and a track, and 49 parts.
    std::string text = R"({"kind": "clip", "start": 0, "end": 1})";
    for (int level = 0; level < 49; ++level)
        text = R"({"kind": "part", "start": 0, "end": 1, "events": [)" + text + "]}";
    text = R"({"kind": "audio", "events": [)" + text + "]}";
    for (int level = 0; level < 49; ++level)
        text = R"({"kind": "folder", "tracks": [)" + text + "]}";
    text = projectWith("\"tracks\": [" + text + "]");

    EXPECT_EQ(parse(text)->allTracks().size(), 50U);
    EXPECT_EQ(textAgain(textAgain(text)), textAgain(text));
}

/// Projects that no file can hold. No interface lets them come about.
class UnstorableProject : public ProjectFileForm {
protected:
    static std::string faultOf(const Counted<Project>& project)
    {
        try {
            ProjectFile::toText(*project);
            return "none";
        } catch (const ProjectFileError& error) {
            return error.what();
        }
    }
};

TEST_F(UnstorableProject, HasATimeBeyondAllBounds)
{
    for (const double time : {-1.0, 1.1e9, std::nan(""), std::numeric_limits<double>::infinity()}) {
        const auto project = newProject();
        addEvent<ClipEvent>(*addTrack(*project, Track::Kind::Audio, u""), 0.0, 1.0)->setSourceOffset(time);

        EXPECT_EQ(faultOf(project),
                  "this project can't be stored: tracks[0].events[0].offset: a number out of its bounds");
    }
}

TEST_F(UnstorableProject, HasAValueThatIsNoPartOfTheWhole)
{
    const auto project = newProject();
    Envelope& curve = addTrack(*project, Track::Kind::Audio, u"")->curve(2);
    addPoint(curve, 1.0, 0.5);
    addPoint(curve, 2.0, 1.5);

    EXPECT_EQ(faultOf(project),
              "this project can't be stored: tracks[0].curves[0].points[1].value: a number out of its bounds");
}

TEST_F(UnstorableProject, HasAFrameRateOfZero)
{
    const auto project = newProject();
    project->setFrameRate({0.0, 0});

    EXPECT_EQ(faultOf(project), "this project can't be stored: framesPerSecond: a number out of its bounds");
}

TEST_F(UnstorableProject, IsDropFrameAtARateThatHasNone)
{
    const auto project = newProject();
    project->setFrameRate({25.0, FrameRateInfo::Flag::DropFrame});

    EXPECT_EQ(faultOf(project),
              "this project can't be stored: dropFrame: drop-frame at another rate than 30 frames per second");
}

TEST_F(UnstorableProject, HasACurveWithoutANumber)
{
    const auto project = newProject();
    addTrack(*project, Track::Kind::Audio, u"")->curve(-1);

    EXPECT_EQ(faultOf(project), "this project can't be stored: tracks[0].curves[0].number: a number out of its bounds");
}

TEST_F(UnstorableProject, PlaysAClipThatIsNotInItsPool)
{
    const auto other = newProject();
    const auto clip = makeCounted<MediaClip>(MediaClip::Kind::Audio, u"a.wav", 1.0);
    other->pool().add(clip);
    const auto project = newProject();
    project->pool().add(makeCounted<MediaClip>(MediaClip::Kind::Audio, u"b.wav", 1.0));
    addEvent<ClipEvent>(*addTrack(*project, Track::Kind::Audio, u""), 0.0, 1.0)->setClip(clip);

    EXPECT_EQ(faultOf(project),
              "this project can't be stored: tracks[0].events[0].clip: a clip that isn't in the pool");
}

TEST_F(UnstorableProject, HasTextThatIsNone)
{
    const auto named = newProject();
    named->setName(std::u16string(1, u'\xd800'));
    const auto cut = newProject();
    cut->setName(std::u16string(1, u'\0'));
    const auto attribute = newProject();
    attribute->setAttribute("reel", Attribute{std::string("A\xff"), true});
    const auto key = newProject();
    key->setAttribute("\xff", Attribute{Velmark::int64{1}, true});

    EXPECT_EQ(faultOf(named), "this project can't be stored: name: a text that isn't UTF-16");
    EXPECT_EQ(faultOf(cut), "this project can't be stored: name: a text that isn't UTF-16");
    EXPECT_EQ(faultOf(attribute), "this project can't be stored: attributes.reel: a text that isn't UTF-8");
    EXPECT_EQ(faultOf(key), "this project can't be stored: attributes: the key of an attribute that isn't UTF-8");
}

TEST_F(UnstorableProject, HasUnknownMembersThatAreKnownOrBroken)
{
    const auto known = newProject();
    known->setUnknownMembers(R"({"x": 1, "end": 5})");
    const auto list = newProject();
    list->setUnknownMembers("[1]");
    const auto broken = newProject();
    broken->setUnknownMembers("{");

    EXPECT_EQ(faultOf(known), "this project can't be stored: end: a member that isn't unknown");
    EXPECT_EQ(faultOf(list), "this project can't be stored: cycleEnd: unknown members that aren't those of an object");
    EXPECT_NE(faultOf(broken), "none");
}

TEST_F(UnstorableProject, IsNestedDeeperThanAFileCanBe)
{
    const auto project = newProject();
    Counted<Container> folder = project;
    for (int level = 1; level < Project::DeepestNesting; ++level)
        folder = addTrack(*folder, Track::Kind::Folder, u"");
    EXPECT_EQ(faultOf(project), "none");

    addTrack(*folder, Track::Kind::Folder, u"");

    EXPECT_TRUE(contains(faultOf(project), ".tracks[0]: nested deeper than 100 levels"));
}

} // namespace

} // namespace standin::tests
