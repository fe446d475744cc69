// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourForm.h"

#include "standin/ardour/XmlText.h"

#include "standin/project/AutomationPoint.h"
#include "standin/project/Marker.h"
#include "standin/project/MediaClip.h"
#include "standin/project/ProjectForm.h"
#include "tests/standin/ardour/SessionText.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

#include <filesystem>
#include <fstream>
#include <limits>
#include <set>
#include <tuple>
#include <utility>

namespace standin::tests {

namespace {

using testing::TestInfo;

bool contains(const std::string& text, const std::string& part)
{
    return text.find(part) != std::string::npos;
}

/// The points of a curve as text.
std::string pointsOf(const Track& track, int number)
{
    std::string text;
    const auto found = track.curves().find(number);
    if (found == track.curves().end())
        return text;
    for (const Node* point = found->second->firstChild(); point; point = found->second->childBehind(*point)) {
        char words[64];
        std::snprintf(words, sizeof words, "%.4g:%.4g ", point->start(),
                      static_cast<const AutomationPoint&>(*point).value());
        text += words;
    }
    return text;
}

/// The elements of a name in a text, as attribute lists.
std::vector<pugi::xml_node> elementsIn(const pugi::xml_document& document, const std::string& path)
{
    std::vector<pugi::xml_node> nodes;
    for (const pugi::xpath_node& node : document.select_nodes(path.c_str()))
        nodes.push_back(node.node());
    return nodes;
}

class Parsed {
public:
    explicit Parsed(const std::string& text) { EXPECT_TRUE(m_document.load_string(text.c_str())); }

    // Nodes live no longer than their document: what is made only for a loop can't be asked for them.
    std::vector<pugi::xml_node> all(const std::string& path) const& { return elementsIn(m_document, path); }
    std::vector<pugi::xml_node> all(const std::string& path) && = delete;
    pugi::xml_node one(const std::string& path) const
    {
        const auto nodes = all(path);
        EXPECT_EQ(nodes.size(), 1U) << path;
        return nodes.empty() ? pugi::xml_node() : nodes.front();
    }

private:
    pugi::xml_document m_document;
};

ClipEvent& eventAt(Track& track, int index)
{
    Node* node = track.firstChild();
    for (; index > 0; --index)
        node = track.childBehind(*node);
    return static_cast<ClipEvent&>(*node);
}

// Cuts the region of the first two seconds at 1 s, and puts its halves at `headStart` and `tailStart` seconds.
void cutInTwo(Track& track, double headStart, double tailStart)
{
    ClipEvent& whole = eventAt(track, 0);
    const auto head = whole.cutOut(0.0, 1.0);
    const auto tail = whole.cutOut(1.0, 2.0);
    whole.remove();
    head->setSpan(headStart, headStart + 1.0);
    tail->setSpan(tailStart, tailStart + 1.0);
    head->insertInto(track);
    tail->insertInto(track);
}

// ---------------------------------------------------------------------------------------------------------- recognising

TEST(ArdourForm, IsToldByItsContent)
{
    EXPECT_TRUE(ArdourForm::recognises("<?xml version=\"1.0\"?><Session/>"));
    EXPECT_TRUE(ArdourForm::recognises("\xEF\xBB\xBF \n<Session/>"));
    EXPECT_FALSE(ArdourForm::recognises("{\"format\": \"stage\"}"));
    EXPECT_FALSE(ArdourForm::recognises(""));
}

// -------------------------------------------------------------------------------------------------------------- reading

TEST(ArdourForm, ReadsTheClock)
{
    const SessionProject session(SessionText{.timecode = "timecode_2997drop"});
    EXPECT_DOUBLE_EQ(session.project->frameRate().framesPerSecond, 30000.0 / 1001.0);
    EXPECT_EQ(session.project->frameRate().flags,
              Velmark::FrameRateInfo::Flag::DropFrame | Velmark::FrameRateInfo::Flag::PulledDown);
    EXPECT_EQ(session.project->name(), u"reel");
}

TEST(ArdourForm, ReadsEachRate)
{
    const std::vector<std::pair<std::string, double>> rates{{"timecode_23976", 24000.0 / 1001},
                                                            {"timecode_24", 24},
                                                            {"timecode_24976", 25000.0 / 1001},
                                                            {"timecode_25", 25},
                                                            {"timecode_30", 30},
                                                            {"timecode_2997", 30000.0 / 1001},
                                                            {"timecode_30drop", 30},
                                                            {"timecode_60", 60},
                                                            {"timecode_5994", 60000.0 / 1001},
                                                            {"timecode_2997000", 29.97},
                                                            {"timecode_2997000drop", 29.97}};
    for (const auto& [format, rate] : rates) {
        const SessionProject session(SessionText{.timecode = format});
        EXPECT_DOUBLE_EQ(session.project->frameRate().framesPerSecond, rate) << format;
    }
}

TEST(ArdourForm, ReadsWhereTimecodeBegins)
{
    EXPECT_EQ(SessionProject(SessionText{.timecodeOffset = "172800000", .offsetIsNegative = "1"}).project->timeOrigin(),
              3600.0);
    EXPECT_EQ(SessionProject(SessionText{.timecodeOffset = "48000", .offsetIsNegative = "0"}).project->timeOrigin(),
              -1.0);
}

TEST(ArdourForm, ReadsRegionsAsClips)
{
    const SessionProject session(SessionText{.regions = region(51, 48000, 96000, 24000) + region(52, 240000, 1)});
    Track& track = session.track("Dia");
    ASSERT_EQ(track.childCount(), 2U);
    const ClipEvent& first = eventAt(track, 0);
    EXPECT_EQ(first.name(), u"r51");
    EXPECT_EQ(first.start(), 1.0);
    EXPECT_EQ(first.end(), 3.0);
    EXPECT_EQ(first.sourceOffset(), 0.5);
    EXPECT_EQ(first.clip()->path(), u"/film/interchange/film/audiofiles/door.wav");
    EXPECT_EQ(first.clip()->seconds(), 2.5);
}

TEST(ArdourForm, ReadsRegionsThatStandAtBeats)
{
    // Two quarters a second.
    const SessionProject session(SessionText{
        .regions = R"(<Region name="r" start="a0" length="b1920@b3840" id="51" type="audio" source-0="11"/>)"});
    EXPECT_EQ(eventAt(session.track("Dia"), 0).start(), 1.0);
    EXPECT_EQ(eventAt(session.track("Dia"), 0).end(), 1.5);
}

TEST(ArdourForm, ReadsALengthInBeatsDownToTheSample)
{
    // A tick lasts 12.5 samples, so that what begins at 12.5 and ends at 25 begins at 12 and is 12 long.
    const SessionProject session(
        SessionText{.regions = R"(<Region name="r" start="a0" length="b1@b1" id="51" type="audio" source-0="11"/>)"});
    EXPECT_DOUBLE_EQ(eventAt(session.track("Dia"), 0).start(), 12.0 / 48000);
    EXPECT_DOUBLE_EQ(eventAt(session.track("Dia"), 0).end(), 24.0 / 48000);
}

TEST(ArdourForm, ReadsSessionsOfVersion6000)
{
    const SessionProject session(SessionText{
        .version = "6000",
        .regions =
            R"(<Region name="r" start="24000" position="48000" length="96000" id="51" type="audio" source-0="11"/>)"});
    EXPECT_EQ(eventAt(session.track("Dia"), 0).start(), 1.0);
    EXPECT_EQ(eventAt(session.track("Dia"), 0).end(), 3.0);
    EXPECT_EQ(eventAt(session.track("Dia"), 0).sourceOffset(), 0.5);
}

TEST(ArdourForm, ReadsTheFadersCurveAsVolume)
{
    const SessionProject session(SessionText{.route = gain("a282240000 2 a564480000 0")});
    EXPECT_EQ(pointsOf(session.track("Dia"), Envelope::Curve::Volume), "1:1 2:0 ");
}

TEST(ArdourForm, ReadsAListThatHoldsAsSteps)
{
    const SessionProject session(SessionText{.route = list("mute", "Discrete", "a0 0 a282240000 1 a564480000 0")});
    EXPECT_EQ(pointsOf(session.track("Dia"), Envelope::Curve::Mute), "0:0 1:0 1:1 2:1 2:0 ");
}

TEST(ArdourForm, ReadsAListOverBeatsThatBendsWithTheTempo)
{
    // Two quarters up to 1 s, then one a second: from 0 to 4 quarters lie 3 s, and half way is 1 s.
    const SessionProject session(
        SessionText{.route = list("pan-azimuth", "Linear", "b0 0 b7680 1", "BeatTime"),
                    .tempos = R"(<Tempo npm="120" enpm="120" note-type="4" sclock="0" quarters="0:0"/>)"
                              R"(<Tempo npm="60" enpm="60" note-type="4" sclock="282240000" quarters="2:0"/>)"});
    EXPECT_EQ(pointsOf(session.track("Dia"), Envelope::Curve::Pan), "0:0 1:0.5 3:1 ");
}

TEST(ArdourForm, GivesListsWithoutAFixedPlaceNumbersOfTheirOwn)
{
    const SessionProject session(
        SessionText{.route = list("trim", "Logarithmic", "a0 0.5 a282240000 2") + R"(<Processor type="plugin">)" +
                             list("parameter-1", "Linear", "a0 20 a282240000 40") + "</Processor>"});
    std::set<std::string> points;
    for (const auto& [number, curve] : session.track("Dia").curves()) {
        if (number > 100)
            points.insert(pointsOf(session.track("Dia"), number));
    }
    EXPECT_EQ(points, (std::set<std::string>{"0:0 1:1 "}));
    EXPECT_EQ(session.track("Dia").curves().size(), 5U);
}

TEST(ArdourForm, ReadsABusThatHasAutomation)
{
    const std::string bus = R"(<Route id="22" name="Bus" default-type="audio">)";
    EXPECT_EQ(SessionProject(SessionText{.routes = bus + gain("a0 1") + "</Route>"}).project->allTracks().size(), 2U);
    EXPECT_EQ(SessionProject(SessionText{.routes = bus + "</Route>"}).project->allTracks().size(), 1U);
}

TEST(ArdourForm, ReadsAndWritesAVcaAsABus)
{
    std::string text = SessionText();
    const std::string vca = "<VCAManager><VCA name=\"VCA 1\" number=\"1\">" +
                            list("gain", "Exponential", "a0 1 a282240000 0.5") + "</VCA></VCAManager>";
    text.insert(text.find("  <Playlists>"), vca);
    const SessionProject session(text);
    EXPECT_EQ(session.text(), text);
    Envelope& curve = session.track("VCA 1").curve(Envelope::Curve::Volume);
    ASSERT_EQ(curve.childCount(), 2U);
    curve.lastChild()->setSpan(2.0, 2.0);
    EXPECT_TRUE(contains(session.text(), "a0 1\na564480000 0.5\n"));
}

TEST(ArdourForm, ReadsACombinedRegion)
{
    const std::string nested =
        R"(<NestedSource><Source name="comp" type="audio" id="77" playlist="78"/></NestedSource>)";
    const std::string combined =
        R"(<Region name="r" start="a0" length="a282240000@a0" id="51" type="audio" source-0="77">)" + nested +
        "</Region>";
    const std::string text = SessionText{.regions = combined};
    const SessionProject session(text);
    EXPECT_EQ(session.track("Dia").childCount(), 1U);
    EXPECT_EQ(session.text(), text);
}

TEST(ArdourForm, LeavesMidiTracksAlone)
{
    const SessionProject session(SessionText{
        .routes = R"(<Route id="22" name="Piano" default-type="midi" midi-playlist="32"/>)",
        .playlists = R"(<Playlist id="32" name="Piano" type="midi"><Region id="53" type="midi"/></Playlist>)"});
    EXPECT_EQ(session.project->allTracks().size(), 1U);
}

TEST(ArdourForm, ReadsAPlaylistThatTracksShareOnce)
{
    const SessionProject session(
        SessionText{.regions = region(51, 0, 48000),
                    .routes = R"(<Route id="22" name="Twin" default-type="audio" audio-playlist="31"/>)"});
    EXPECT_EQ(session.track("Dia").childCount(), 1U);
    EXPECT_EQ(session.track("Twin").childCount(), 0U);
}

TEST(ArdourForm, ReadsMarksAndRangesAsMarkers)
{
    const SessionProject session(SessionText{.locations = location(61, "session", 0, 480000, "IsSessionRange") +
                                                          location(62, "loop", 48000, 96000, "IsAutoLoop,IsHidden") +
                                                          location(63, "punch", 48000, 96000, "IsAutoPunch") +
                                                          location(66, "start", 0, 0, "IsMark,IsClockOrigin") +
                                                          location(64, "scene 4", 144000, 144000, "IsMark") +
                                                          location(65, "music", 96000, 192000, "IsRangeMarker")});
    Track& markers = session.track("Markers");
    ASSERT_EQ(markers.childCount(), 2U);
    EXPECT_EQ(markers.firstChild()->name(), u"music");
    EXPECT_EQ(markers.firstChild()->end(), 4.0);
    EXPECT_EQ(markers.lastChild()->start(), 3.0);
    EXPECT_FALSE(static_cast<Marker&>(*markers.lastChild()).isRange());
    EXPECT_EQ(session.project->setEndTime(), 10.0);
    EXPECT_EQ(session.project->cycleLeft().getValue(), 1.0);
    EXPECT_EQ(session.project->cycleRight().getValue(), 2.0);
}

TEST(ArdourForm, ReadsTheVideoOfTheTimelineAsTheOldPicture)
{
    const auto videoAt = [](const std::string& attributes) {
        return SessionText{.locations = location(61, "session", 0, 480000, "IsSessionRange"),
                           .extra = "<Extra><Videotimeline " + attributes + "/></Extra>"};
    };
    const SessionProject session(videoAt(R"(Filename="reel.mov" LocalFile="1" VideoOffset="96000")"));
    const Track& track = session.track("Video");
    EXPECT_EQ(track.kind(), Track::Kind::Video);
    EXPECT_TRUE(track.isLocked());
    const auto& later = static_cast<const ClipEvent&>(*track.firstChild());
    EXPECT_EQ(later.clip()->path(), u"/film/videofiles/reel.mov");
    EXPECT_EQ(later.start(), 2.0);
    EXPECT_EQ(later.end(), 10.0);
    EXPECT_EQ(later.sourceOffset(), 0.0);
    EXPECT_EQ(session.project->form()->staying(), std::vector<std::string>{"the video \"reel.mov\""});

    const SessionProject before(videoAt(R"(Filename="/pix/reel.mov" VideoOffset="-48000")"));
    const auto& sooner = static_cast<const ClipEvent&>(*before.track("Video").firstChild());
    EXPECT_EQ(sooner.clip()->path(), u"/pix/reel.mov");
    EXPECT_EQ(sooner.start(), 0.0);
    EXPECT_EQ(sooner.sourceOffset(), 1.0);
    EXPECT_EQ(sooner.clip()->seconds(), 11.0);

    for (const std::string none : {R"(Height="3")", R"(Filename="")", R"(Filename="a.mov" VideoOffset="480000")"})
        EXPECT_EQ(SessionProject(videoAt(none)).project->allTracks().size(), 1U) << none;
    for (const std::string offset : {"x", "--1", "9223372036854775807"})
        EXPECT_TRUE(contains(faultOf(videoAt("Filename=\"a.mov\" VideoOffset=\"" + offset + "\"")), "Videotimeline"));
}

TEST(ArdourForm, LeavesTheVideoWhereTheSessionHasIt)
{
    const std::string text =
        SessionText{.locations = location(61, "session", 0, 480000, "IsSessionRange"),
                    .extra = R"(<Extra><Videotimeline Filename="reel.mov" VideoOffset="0"/></Extra>)"};
    const SessionProject session(text);
    EXPECT_EQ(session.text(), text);
    session.project->setAttribute("CaDs", Attribute{Velmark::int64{42}, true});
    const std::string written = session.text();
    EXPECT_FALSE(contains(written, "Form:Video"));
    EXPECT_EQ(SessionProject(written).track("Video").childCount(), 1U);
}

TEST(ArdourForm, RefusesWhatItCannotRead)
{
    const auto saysOf = [](const SessionText& text, const std::string& words) {
        EXPECT_TRUE(contains(faultOf(text), words)) << faultOf(text);
    };
    EXPECT_TRUE(contains(faultOf("<Session>"), "isn't XML"));
    EXPECT_TRUE(contains(faultOf("<Playlist/>"), "no session of Ardour"));
    EXPECT_TRUE(contains(faultOf("<!DOCTYPE x [<!ENTITY a \"b\">]><Session version=\"7002\" sample-rate=\"48000\"/>"),
                         "document type"));
    saysOf({.version = "7004"}, "newer Ardour");
    saysOf({.version = "8000"}, "8000");
    saysOf({.version = "5999"}, "older than Ardour 6");
    saysOf({.version = "x"}, "older than Ardour 6");
    saysOf({.sampleRate = "0"}, "sample-rate");
    saysOf({.timecode = "timecode_17"}, "timecode-format");
    saysOf({.timecodeOffset = "x"}, "timecode-offset");
    saysOf({.regions = region(51, 0, 1) + region(51, 2, 1)}, "another region's");
    saysOf({.sources = "", .regions = region(51, 0, 1)}, "source");
    saysOf({.regions = R"(<Region name="r" start="a0" length="a1" id="51" type="audio" source-0="11"/>)"}, "length");
    saysOf({.regions = R"(<Region name="r" start="a0" length="a1@x" id="51" type="audio" source-0="11"/>)"}, "no time");
    saysOf({.regions = R"(<Region name="r" start="a0" length="a1@a0" id="x" type="audio" source-0="11"/>)"}, "id");
    saysOf({.route = gain("a0")}, "without a value");
    saysOf({.route = gain("a0 x")}, "without a value");
    saysOf({.route = gain("a0 inf")}, "no number");
    saysOf({.route = gain("a5880 1 a0 1")}, "follow");
    saysOf({.locations = location(61, "m", 5, 4, "IsRangeMarker")}, "ends before");
    saysOf({.locations = location(61, "m", 0, 0, "IsMark") + location(61, "m", 0, 0, "IsMark")}, "two");
    saysOf({.routes = R"(<Route id="22" name="T" default-type="audio" audio-playlist="99"/>)"}, "99");
    saysOf({.playlists = R"(<Playlist id="31" type="audio"/>)"}, "two playlists");
    saysOf({.sources = R"(<Source name="a" type="audio" id="11"/><Source name="b" type="audio" id="11"/>)"},
           "two sources");
    saysOf({.idCounter = "9223372036854775807"}, "id");
}

TEST(ArdourForm, ReadsTheOldestAndTheNewestVersionThatItKnows)
{
    EXPECT_EQ(faultOf(SessionText{.version = "7003"}), "none");
    EXPECT_EQ(faultOf(SessionText{.version = "6000"}), "none");
}

TEST(ArdourForm, RefusesATextThatIsNotUtf8)
{
    const auto declared = [](const std::string& encoding) {
        std::string text = SessionText();
        text.replace(text.find("UTF-8"), 5, encoding);
        return text;
    };
    EXPECT_EQ(faultOf(declared("utf-8")), "none");
    EXPECT_EQ(faultOf(declared("US-ASCII")), "none");
    EXPECT_TRUE(contains(faultOf(declared("ISO-8859-1")), "the file is \"ISO-8859-1\", but Ardour writes UTF-8"));
    EXPECT_TRUE(contains(faultOf(declared("UTF-16")), "UTF-16"));
    std::string wide("\xFF\xFE");
    for (const char letter : std::string(SessionText()))
        wide.append(1, letter).append(1, '\0');
    EXPECT_TRUE(contains(faultOf(wide), "UTF-16"));
    std::string without = SessionText();
    EXPECT_EQ(faultOf(without.erase(0, without.find("<Session"))), "none");
}

TEST(ArdourForm, RefusesWhatStandsAfterTheSession)
{
    EXPECT_TRUE(contains(faultOf(std::string(SessionText()) + "<Session/>"), "after the end of the session"));
    EXPECT_EQ(faultOf(std::string(SessionText()) + "<!-- kept -->\n"), "none");
}

TEST(ArdourForm, TellsWhatToDoAboutASessionThatItRefuses)
{
    const auto remedyOf = [](const std::string& text) {
        try {
            SessionProject read(text);
        } catch (const ProjectFileError& error) {
            return error.remedy();
        }
        return std::string("none");
    };
    EXPECT_EQ(remedyOf(SessionText{.version = "8000"}), "take a copy that Ardour 7 has saved");
    EXPECT_EQ(remedyOf(SessionText{.version = "3001"}), "open the session in Ardour 7 and save it there");
    EXPECT_EQ(remedyOf(SessionText{.sampleRate = "0"}),
              "open the session in Ardour and save it there, or take an intact copy");
}

TEST(ArdourForm, RefusesElementsThatLieTooDeep)
{
    std::string deep;
    for (int level = 0; level < 100000; ++level)
        deep += "<a>";
    for (int level = 0; level < 100000; ++level)
        deep += "</a>";
    EXPECT_TRUE(contains(faultOf(SessionText{.route = deep}), "too deep"));
}

// -------------------------------------------------------------------------------------------------------------- writing

TEST(ArdourForm, WritesAnUnchangedSessionToTheByte)
{
    const std::string text =
        SessionText{.locations = location(61, "session", 0, 480000, "IsSessionRange") +
                                 location(64, "a &amp; b", 144000, 144000, "IsMark"),
                    .route = gain("a0 1\na282240000 0.7071067811865476\n") + list("mute", "Discrete", "a0 0 a5880 1"),
                    .regions = region(51, 48000, 96000) + "<!-- kept -->" + region(52, 44000, 7, 3),
                    .routes = R"(<Route id="22" name="Piano" default-type="midi" midi-playlist="32"/>)",
                    .extra = "<Extra><Other x='1'/></Extra>"};
    EXPECT_EQ(SessionProject(text).text(), text);
}

TEST(ArdourForm, WritesARegionThatHasMoved)
{
    const SessionProject session(SessionText{.regions = region(51, 48000, 96000, 24000)});
    eventAt(session.track("Dia"), 0).setSpan(5.0, 7.0);
    const Parsed written(session.text());
    const pugi::xml_node moved = written.one("//Playlist/Region");
    EXPECT_STREQ(moved.attribute("length").value(), "a564480000@a1411200000");
    EXPECT_STREQ(moved.attribute("start").value(), "a141120000");
    EXPECT_STREQ(moved.attribute("id").value(), "51");
    EXPECT_STREQ(moved.attribute("fade-in-active").value(), "1");
    EXPECT_STREQ(written.one("/Session").attribute("id-counter").value(), "2000");
}

TEST(ArdourForm, ChangesNothingButThePlaceOfARegionThatHasMoved)
{
    const auto textAt = [](const std::string& place) {
        return SessionText{.regions =
                               "<Region id = '51'\n  note=\"length='a7@a7' &lt;\" start=\"a5880\" length=" + place +
                               " type=\"audio\"\tsource-0=\"11\" sync-position=\"a0\" whole-file=\"1\"><!-- kept "
                               "--><FadeIn/>\n</Region>"};
    };
    const std::string second = "282240000";
    const SessionProject session(textAt("'a" + second + "@a" + second + "'"));
    eventAt(session.track("Dia"), 0).setSpan(5.0, 6.0);
    EXPECT_EQ(session.text(), std::string(textAt("'a" + second + "@a1411200000'")));
}

TEST(ArdourForm, ChangesNothingButThePlaceOfARegionOfVersion6000)
{
    const auto textAt = [](const std::string& place) {
        return SessionText{.version = "6000",
                           .regions = R"(<Region id="51" start="7" length="48000" type="audio" source-0="11" )" +
                                      place + R"(/>)",
                           .tempos = ""};
    };
    const SessionProject session(textAt(R"(position="48000" positional-lock-style="MusicTime")"));
    eventAt(session.track("Dia"), 0).setSpan(5.0, 6.0);
    EXPECT_EQ(session.text(), std::string(textAt(R"(position="240000" positional-lock-style="AudioTime")")));
}

TEST(ArdourForm, WritesARegionThatStoodAtBeatsInSamplesOnceItHasMoved)
{
    const SessionProject session(SessionText{
        .regions = R"(<Region name="r" start="b960" length="b1920@b3840" id="51" type="audio" source-0="11"/>)"});
    eventAt(session.track("Dia"), 0).setSpan(5.0, 5.5);
    const Parsed written(session.text());
    const pugi::xml_node moved = written.one("//Playlist/Region");
    EXPECT_STREQ(moved.attribute("length").value(), "a141120000@a1411200000");
    EXPECT_STREQ(moved.attribute("start").value(), "a70560000");
}

TEST(ArdourForm, GivesOnlyTheFurtherPiecesOfARegionNewIds)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000)});
    Track& track = session.track("Dia");
    ClipEvent& whole = eventAt(track, 0);
    const auto tail = whole.cutOut(1.0, 2.0);
    tail->setSpan(10.0, 11.0);
    whole.cutOut(0.0, 1.0)->takePlaceOf(whole);
    tail->insertInto(track);
    const Parsed written(session.text());
    const auto regions = written.all("//Playlist/Region");
    ASSERT_EQ(regions.size(), 2U);
    EXPECT_STREQ(regions[0].attribute("id").value(), "51");
    EXPECT_STREQ(regions[0].attribute("length").value(), "a282240000@a0");
    EXPECT_STREQ(regions[1].attribute("id").value(), "2001");
    EXPECT_STREQ(regions[1].attribute("length").value(), "a282240000@a2822400000");
    EXPECT_STREQ(regions[1].attribute("start").value(), "a282240000");
    EXPECT_STREQ(written.one("/Session").attribute("id-counter").value(), "2002");
}

TEST(ArdourForm, RemovesARegionThatIsGone)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000) + region(52, 96000, 96000)});
    eventAt(session.track("Dia"), 0).remove();
    const Parsed written(session.text());
    EXPECT_STREQ(written.one("//Playlist/Region").attribute("id").value(), "52");
}

TEST(ArdourForm, LeavesARegionAloneThatPlaysTheSameAtTheSamePlace)
{
    // Ardour plays it from the sample before.
    const std::string text = SessionText{
        .regions = R"(<Region name="r" start="a5881" length="a5881@a5881" id="51" type="audio" source-0="11"/>)"};
    EXPECT_EQ(SessionProject(text).text(), text);
}

TEST(ArdourForm, SwitchesTheFadesOffWhereALaterRunJoinsWhatAnEarlierOneHasCut)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000)});
    cutInTwo(session.track("Dia"), 0.0, 6.0);
    const std::string apart = session.text();
    const auto fadesIn = [](const std::string& text) {
        const Parsed written(text);
        std::string fades;
        for (const pugi::xml_node& node : written.all("//Playlist/Region"))
            fades.append(node.attribute("fade-in-active").value()).append(node.attribute("fade-out-active").value());
        return fades;
    };
    EXPECT_EQ(fadesIn(apart), "1111");
    const SessionProject second(apart);
    EXPECT_EQ(second.text(), apart);
    eventAt(second.track("Dia"), 1).setSpan(1.0, 2.0);
    const std::string together = second.text();
    EXPECT_EQ(fadesIn(together), "1001");
    // And a third run that pulls them apart again.
    const SessionProject third(together);
    EXPECT_EQ(third.text(), together);
    eventAt(third.track("Dia"), 1).setSpan(3.0, 4.0);
    EXPECT_EQ(fadesIn(third.text()), "1111");
}

TEST(ArdourForm, KeepsAFadeThatTheUserHasDrawnWhereAnEarlierRunHadCut)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000)});
    cutInTwo(session.track("Dia"), 0.0, 6.0);
    std::string text = session.text();
    const std::size_t second = text.rfind("default-fade-in=\"1\"");
    text.replace(second, 19, "default-fade-in=\"0\"");
    text.insert(text.find('>', second) + 1,
                "<FadeIn><AutomationList interpolation-style=\"Curved\"><events>a0 0 a58800000 1</events>"
                "</AutomationList></FadeIn>");
    const SessionProject again(text);
    eventAt(again.track("Dia"), 1).setSpan(1.0, 2.0);
    const Parsed written(again.text());
    EXPECT_STREQ(written.all("//Playlist/Region").at(0).attribute("fade-out-active").value(), "1");
    EXPECT_STREQ(written.all("//Playlist/Region").at(1).attribute("fade-in-active").value(), "1");
    EXPECT_EQ(written.all("//Playlist/Region/FadeIn").size(), 1U);
}

TEST(ArdourForm, SwitchesTheFadesOffWhereTwoPiecesFollow)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000)});
    cutInTwo(session.track("Dia"), 5.0, 6.0);
    const Parsed written(session.text());
    const auto regions = written.all("//Playlist/Region");
    ASSERT_EQ(regions.size(), 2U);
    const auto fadesOf = [](const pugi::xml_node& node) {
        return std::string(node.attribute("fade-in-active").value()) + node.attribute("fade-out-active").value();
    };
    EXPECT_EQ(fadesOf(regions[0]), "10");
    EXPECT_EQ(fadesOf(regions[1]), "01");
}

TEST(ArdourForm, WritesAListInSamplesOnceItHasMoved)
{
    const SessionProject session(SessionText{.route = list("pan-azimuth", "Linear", "b0 0.25 b3840 0.75", "BeatTime")});
    Envelope& curve = session.track("Dia").curve(Envelope::Curve::Pan);
    curve.lastChild()->setSpan(2.0, 2.0);
    const Parsed written(session.text());
    const pugi::xml_node list = written.one("//AutomationList");
    EXPECT_STREQ(list.attribute("time-domain").value(), "AudioTime");
    EXPECT_STREQ(list.attribute("state").value(), "Play");
    EXPECT_STREQ(list.child("events").text().get(), "a0 0.25\na564480000 0.75\n");
}

TEST(ArdourForm, WritesAStepAHairBeforeTheSampleFromWhichTheNewValueHolds)
{
    const SessionProject session(SessionText{.route = gain("a0 1 a282240000 1")});
    Envelope& curve = session.track("Dia").curve(Envelope::Curve::Volume);
    const auto step = Velmark::makeCounted<AutomationPoint>();
    step->setSpan(1.0, 1.0);
    step->setValue(0.0);
    step->insertInto(curve);
    EXPECT_STREQ(Parsed(session.text()).one("//AutomationList/events").text().get(),
                 "a0 1\na282239999 1\na282240000 0\n");
}

TEST(ArdourForm, WritesAListThatHoldsWithoutItsSteps)
{
    const SessionProject session(SessionText{.route = list("mute", "Discrete", "a0 0 a282240000 1 a564480000 0")});
    Envelope& curve = session.track("Dia").curve(Envelope::Curve::Mute);
    for (Node* point = curve.lastChild(); point->start() == 2.0; point = curve.lastChild()) {
        point->setSpan(2.5, 2.5);
        if (curve.childBefore(*point)->start() == 2.0)
            curve.childBefore(*point)->setSpan(2.5, 2.5);
    }
    EXPECT_STREQ(Parsed(session.text()).one("//AutomationList/events").text().get(),
                 "a0 0\na282240000 1\na705600000 0\n");
}

TEST(ArdourForm, WritesMarkersThatMovedDoubledAndWent)
{
    const SessionProject session(SessionText{.locations = location(64, "a", 48000, 48000, "IsMark") +
                                                          location(65, "b", 96000, 192000, "IsRangeMarker") +
                                                          location(66, "c", 240000, 240000, "IsMark")});
    Track& markers = session.track("Markers");
    markers.lastChild()->remove();
    markers.firstChild()->setSpan(8.0, 8.0);
    auto& range = static_cast<Event&>(*markers.firstChild());
    const auto again = range.cutOut(2.0, 3.0);
    again->setSpan(9.0, 10.0);
    again->insertInto(markers);
    const Parsed parsed(session.text());
    const auto written = parsed.all("//Location");
    ASSERT_EQ(written.size(), 3U);
    EXPECT_STREQ(written[0].attribute("start").value(), "a2257920000");
    EXPECT_STREQ(written[0].attribute("end").value(), "a2257920000");
    EXPECT_STREQ(written[1].attribute("id").value(), "65");
    EXPECT_STREQ(written[2].attribute("id").value(), "2001");
    EXPECT_STREQ(written[2].attribute("name").value(), "b");
    EXPECT_STREQ(written[2].attribute("flags").value(), "IsRangeMarker");
    EXPECT_STREQ(written[2].attribute("end").value(), "a2822400000");
}

TEST(ArdourForm, ReadsAnEdgeJustOutsideOfAFrameAsOneAtTheFrame)
{
    // 37 and 91 frames of 29.97 a second at 48 kHz are 59,259.2 and 145,745.6 samples.
    const SessionProject session(SessionText{.timecode = "timecode_2997", .regions = region(51, 59259, 86487, 100)});
    const auto& event = static_cast<const ClipEvent&>(*session.track("Dia").firstChild());
    EXPECT_NEAR(event.start() * 48000.0, 59259.2, 1e-6);
    EXPECT_NEAR(event.end() * 48000.0, 145745.6, 1e-6);
    EXPECT_NEAR(event.sourceOffset() * 48000.0, 100.2, 1e-6);
    const auto edgesOf = [](const std::string& timecode, long position, long length) {
        const SessionProject read(SessionText{.timecode = timecode, .regions = region(51, position, length)});
        const Node& only = *read.track("Dia").firstChild();
        return std::pair(only.start() * 48000.0, only.end() * 48000.0);
    };
    // Inside of the frames, two samples outside, at frames of whole samples.
    for (const auto& [timecode, position, length] :
         {std::tuple("timecode_2997", 59260L, 86485L), std::tuple("timecode_2997", 59257L, 86491L),
          std::tuple("timecode_25", 1919L, 1922L), std::tuple("timecode_2997", 59258L, 4L)}) {
        const auto [start, end] = edgesOf(timecode, position, length);
        EXPECT_NEAR(start, static_cast<double>(position), 1e-6);
        EXPECT_NEAR(end, static_cast<double>(position + length), 1e-6);
    }
}

TEST(ArdourForm, WritesARegionThatEndsTwoSamplesAfterAFrameAsItWas)
{
    // 255 frames of 29.97 a second are 408,408 samples.
    for (const long end : {408409L, 408410L, 408411L}) {
        const std::string text = SessionText{.timecode = "timecode_2997", .regions = region(51, 313288, end - 313288)};
        EXPECT_EQ(SessionProject(text).text(), text) << end;
    }
}

TEST(ArdourForm, KeepsARegionThatIsShorterThanASample)
{
    std::string text = SessionText{.regions = region(51, 48000, 1)};
    text.replace(text.find("length=\"a5880@"), 14, "length=\"a5000@");
    EXPECT_EQ(SessionProject(text).text(), text);
}

TEST(ArdourForm, ReadsManyRoutesInTimeThatGrowsWithThem)
{
    cadrel::tests::expectNotQuadratic(1500, [](int routes) {
        SessionText text;
        for (int route = 0; route < routes; ++route) {
            const std::string id = std::to_string(100000 + 2 * route);
            const std::string list = std::to_string(100001 + 2 * route);
            text.routes += "<Route id=\"" + id + R"(" name="t" default-type="audio" audio-playlist=")" + list + "\"/>";
            text.playlists += "<Playlist id=\"" + list + R"(" name="t" type="audio"/>)";
        }
        return cadrel::tests::secondsOf([&] {
            const SessionProject session(text);
            EXPECT_EQ(session.project->allTracks().size(), static_cast<std::size_t>(routes) + 1);
        });
    });
}

/// A session whose range is from 1 s to 10 s.
class SessionRange : public testing::Test {
protected:
    /// What is written of it when its end is said to be there, in nanoseconds.
    std::string endAt(Velmark::int64 nanoseconds)
    {
        session.project->setAttribute(Velmark::AttributeKey::SessionEnd, Attribute{nanoseconds, false});
        return Parsed(session.text()).one("//Location").attribute("end").value();
    }

    const std::string text = SessionText{.locations = location(61, "session", 48000, 480000, "IsSessionRange"),
                                         .regions = region(51, 0, 480000)};
    const SessionProject session{text};
};

TEST_F(SessionRange, IsReadAsTheEndThatTheSessionHas)
{
    Velmark::FVariant end;
    ASSERT_EQ(session.project->getAttribute(Velmark::AttributeKey::SessionEnd, end), Velmark::ResultOk);
    EXPECT_TRUE(end.isInteger());
    EXPECT_EQ(end.asInteger(), 10'000'000'000);
}

TEST_F(SessionRange, IsNotReadFromASessionWithoutOne)
{
    const SessionProject other{SessionText{}};
    EXPECT_NE(other.project->hasAttribute(Velmark::AttributeKey::SessionEnd), Velmark::ResultOk);
}

TEST_F(SessionRange, EndsWhereItIsSaidToEndToTheSample)
{
    // 48,000 samples a second of 5,880 superclocks.
    EXPECT_EQ(endAt(12'000'000'000), "a3386880000");
    EXPECT_EQ(endAt(2'000'000'000), "a564480000");
    // Sample 480,001 begins after 10.000020833 s.
    EXPECT_EQ(endAt(10'000'020'833), "a2822405880");
}

TEST_F(SessionRange, DoesNotEndBeforeItBegins)
{
    EXPECT_EQ(endAt(1'000'000'000), "a282240000");
    EXPECT_EQ(endAt(0), "a282240000");
}

TEST_F(SessionRange, StaysWhereItsEndIsNoTimeOfAProject)
{
    for (const Velmark::int64 absurd :
         {std::numeric_limits<Velmark::int64>::min(), Velmark::int64{-1}, Velmark::int64{1'000'000'001'000'000'000},
          std::numeric_limits<Velmark::int64>::max()})
        EXPECT_EQ(endAt(absurd), "a2822400000") << absurd;
}

TEST_F(SessionRange, StaysWhenAClipAloneOrTheEndOfTheProjectMoves)
{
    eventAt(session.track("Dia"), 0).setSpan(0.0, 8.0);
    session.project->setProjectEnd(9.0);
    EXPECT_STREQ(Parsed(session.text()).one("//Location").attribute("end").value(), "a2822400000");
}

TEST_F(SessionRange, LeavesTheTextAsItIs)
{
    EXPECT_EQ(session.text(), text);
}

TEST(ArdourForm, RefusesAClipThatTheSessionDoesNotHave)
{
    const SessionProject session(SessionText{.regions = region(51, 0, 96000)});
    Velmark::makeCounted<ClipEvent>()->insertInto(session.track("Dia"));
    EXPECT_THROW(session.text(), ProjectFileError);
}

// ------------------------------------------------------------------------------------------------------- Cadrel's own

/// A project with a model, and with a marker on a track of Cadrel's.
class OwnContent : public testing::Test {
protected:
    OwnContent()
    {
        session.project->setAttribute("CaDs", Attribute{Velmark::int64{42}, true});
        track->setName(u"Insert");
        track->setAttribute("Cadrel:MarkerType", Attribute{Velmark::int64{3}, true});
        marker->setName(u"new shot");
        marker->setSpan(1.0, 2.0);
        marker->setAttribute("note", Attribute{std::string("kept"), true});
        marker->insertInto(*track);
        track->insertInto(*session.project);
    }

    SessionProject session{
        SessionText{.locations = location(64, "a", 48000, 48000, "IsMark"), .regions = region(51, 0, 96000)}};
    Velmark::Counted<Track> track = Track::create(Track::Kind::Marker);
    Velmark::Counted<Marker> marker = Velmark::makeCounted<Marker>(true);
};

TEST_F(OwnContent, ComesBackWithTheSession)
{
    const SessionProject again(session.text());
    EXPECT_EQ(std::get<Velmark::int64>(again.project->attributes().at("CaDs").value), 42);
    Track& own = again.track("Insert");
    EXPECT_EQ(std::get<Velmark::int64>(own.attributes().at("Cadrel:MarkerType").value), 3);
    ASSERT_EQ(own.childCount(), 1U);
    EXPECT_EQ(own.firstChild()->name(), u"new shot");
    EXPECT_EQ(own.firstChild()->start(), 1.0);
    EXPECT_EQ(own.firstChild()->end(), 2.0);
    EXPECT_EQ(std::get<std::string>(own.firstChild()->attributes().at("note").value), "kept");
    EXPECT_EQ(again.track("Markers").childCount(), 1U);
}

TEST_F(OwnContent, HasNoCharacterThatXmlCannotHold)
{
    marker->setName(u"a\x0001"
                    u"b\uFFFEc");
    session.project->setAttribute("text", Attribute{std::string("\x01\xEF\xBF\xBF"), true});
    const std::string text = session.text();
    EXPECT_EQ(withoutForbidden(text), text);
    EXPECT_FALSE(contains(text, "&#1;"));
    const SessionProject again(text);
    EXPECT_EQ(again.track("Insert").firstChild()->name(), u"a\uFFFDb\uFFFDc");
    EXPECT_EQ(std::get<std::string>(again.project->attributes().at("text").value), "\x01\xEF\xBF\xBF");
}

TEST_F(OwnContent, IsWrittenTheSameWhenNothingHasChanged)
{
    const std::string text = session.text();
    EXPECT_EQ(SessionProject(text).text(), text);
}

TEST_F(OwnContent, StandsAmongTheMarkersOfTheSession)
{
    const Parsed written(session.text());
    const auto locations = written.all("//Location");
    ASSERT_EQ(locations.size(), 2U);
    EXPECT_STREQ(locations[1].attribute("name").value(), "Insert: new shot");
    EXPECT_STREQ(locations[1].attribute("flags").value(), "IsRangeMarker");
}

TEST_F(OwnContent, FollowsWhatTheUserHasDoneToItInArdour)
{
    std::string text = session.text();
    const auto replace = [&](const std::string& from, const std::string& to) {
        const std::size_t at = text.find(from);
        ASSERT_NE(at, std::string::npos);
        text.replace(at, from.size(), to);
    };
    replace("Insert: new shot", "Insert: other");
    replace("start=\"a282240000\" end=\"a564480000\"", "start=\"a0\" end=\"a564480000\"");
    const SessionProject again(text);
    EXPECT_EQ(again.track("Insert").firstChild()->name(), u"other");
    EXPECT_EQ(again.track("Insert").firstChild()->start(), 0.0);
}

TEST_F(OwnContent, IsKnownByItsKindOrByItsPlace)
{
    const std::string text = session.text();
    // Name, start and end of the location; where it counts.
    struct Case {
        std::string location;
        const char* track;
    };
    for (const Case& each : {Case{R"(name="mine" start="a282240000" end="a564480000")", "Insert"},
                             Case{R"(name="INSERT 7" start="a0" end="a564480000")", "Insert"},
                             Case{R"(name="mine" start="a282234120" end="a564480000")", "Markers"},
                             Case{R"(name="mine" start="a282240000" end="a564485880")", "Markers"},
                             Case{R"(name="Inser" start="a0" end="a564480000")", "Markers"}}) {
        const std::string written = R"(name="Insert: new shot" start="a282240000" end="a564480000")";
        std::string edited = text;
        const std::size_t at = edited.find(written);
        ASSERT_NE(at, std::string::npos);
        edited.replace(at, written.size(), each.location);
        const SessionProject again(edited);
        const bool isOwn = std::string(each.track) == "Insert";
        EXPECT_EQ(again.track("Insert").childCount(), isOwn ? 1U : 0U) << each.location;
        EXPECT_EQ(again.track("Markers").childCount(), isOwn ? 1U : 2U) << each.location;
    }
}

TEST_F(OwnContent, LeavesAMarkOfTheUserAloneThatTheListOfItsMarkersNames)
{
    std::string text = session.text();
    const std::size_t list = text.find("markers=\"") + 9;
    text.replace(list, text.find('"', list) - list, "64");
    const SessionProject again(text);
    EXPECT_EQ(again.track("Insert").childCount(), 0U);
    // Its own counts as the user's, too, since nothing names it any more.
    EXPECT_EQ(again.track("Markers").childCount(), 2U);
}

TEST_F(OwnContent, IsGoneWhenTheUserHasRemovedItInArdour)
{
    std::string text = session.text();
    const std::size_t name = text.find("Insert: new shot");
    const std::size_t begin = text.rfind('<', name);
    text.erase(begin, text.find('>', name) + 1 - begin);
    const SessionProject again(text);
    EXPECT_EQ(again.track("Insert").childCount(), 0U);
    EXPECT_EQ(again.track("Markers").childCount(), 1U);
}

TEST_F(OwnContent, StandsBesideWhatOthersHaveInTheExtraElement)
{
    const std::string with = SessionText{.extra = "<Extra><Other x='1'/></Extra>"};
    const SessionProject other(with);
    other.project->setAttribute("CaDs", Attribute{Velmark::int64{42}, true});
    const std::string text = other.text();
    EXPECT_TRUE(contains(text, "<Extra><Other x='1'/>"));
    EXPECT_EQ(SessionProject(text).project->attributes().size(), 1U);
    EXPECT_STREQ(Parsed(text).one("//Extra").name(), "Extra");
}

TEST_F(OwnContent, GivesASessionWithoutLocationsSome)
{
    std::string text = SessionText();
    text.erase(text.find("<Locations></Locations>"), 23);
    text.insert(text.find(" name="), " note=\" id-counter=7\"");
    const SessionProject other(text);
    const auto own = Track::create(Track::Kind::Marker);
    Velmark::makeCounted<Marker>(false)->insertInto(*own);
    own->insertInto(*other.project);
    const Parsed written(other.text());
    EXPECT_EQ(written.all("/Session/Locations/Location").size(), 1U);
    EXPECT_STREQ(written.one("/Session").attribute("note").value(), " id-counter=7");
    EXPECT_STREQ(written.one("/Session").attribute("id-counter").value(), "2002");
}

TEST_F(OwnContent, LeavesAnEmptyExtraElementAndEmptyLocationsWhole)
{
    std::string text = SessionText{.extra = "<Extra/>"};
    text.replace(text.find("<Locations></Locations>"), 23, "<Locations/>");
    const SessionProject other(text);
    const auto own = Track::create(Track::Kind::Marker);
    Velmark::makeCounted<Marker>(false)->insertInto(*own);
    own->insertInto(*other.project);
    const Parsed written(other.text());
    EXPECT_EQ(written.all("/Session/Locations/Location").size(), 1U);
    EXPECT_EQ(written.all("/Session/Extra/Cadrel").size(), 1U);
}

TEST(ArdourForm, ReadsTheSoundWhereStoredContentIsBrokenAndReplacesThat)
{
    const SessionProject session(
        SessionText{.locations = location(64, "Insert: a", 48000, 48000, "IsMark"),
                    .regions = region(51, 0, 96000),
                    .extra = "<Extra><Cadrel version='1' markers='64'>{\"format\": 1}</Cadrel></Extra>"});
    EXPECT_TRUE(session.project->form()->hasBrokenStorage());
    EXPECT_EQ(session.track("Dia").childCount(), 1U);
    // What may be the user's stays.
    EXPECT_EQ(session.track("Markers").childCount(), 1U);
    session.project->setAttribute("CaDs", Attribute{Velmark::int64{42}, true});
    const SessionProject again(session.text());
    EXPECT_FALSE(again.project->form()->hasBrokenStorage());
    EXPECT_EQ(std::get<Velmark::int64>(again.project->attributes().at("CaDs").value), 42);
}

TEST_F(OwnContent, HasItsKindInTheNameOnlyOnce)
{
    marker->setName(u"insert of a shot ");
    const std::string text = session.text();
    const Parsed written(text);
    EXPECT_STREQ(written.all("//Location").at(1).attribute("name").value(), "insert of a shot");
    const SessionProject again(text);
    EXPECT_EQ(again.track("Insert").firstChild()->name(), u"insert of a shot ");
    EXPECT_EQ(again.text(), text);
}

// ------------------------------------------------------------------------------------------------------------- on disk

class SessionFolder : public testing::Test {
protected:
    SessionFolder()
    {
        std::filesystem::create_directories(folder);
        put("reel.ardour", SessionText{.regions = region(51, 0, 96000)});
    }
    ~SessionFolder() override { std::filesystem::remove_all(folder); }

    void put(const std::string& name, const std::string& text) const { std::ofstream(folder / name) << text; }

    const std::filesystem::path folder =
        std::filesystem::path(testing::TempDir()) /
        (std::string("session-") + testing::UnitTest::GetInstance()->current_test_info()->name());
    ChangeLog log;
};

TEST_F(SessionFolder, IsNotReadWhileArdourHasUnsavedWorkThere)
{
    put("reel.pending", "<Session/>");
    EXPECT_THROW(ProjectFile::read(folder / "reel.ardour", log), ProjectFileError);
}

TEST_F(SessionFolder, IsNotWrittenWhileArdourHasUnsavedWorkThere)
{
    const auto project = ProjectFile::read(folder / "reel.ardour", log);
    put("new.pending", "<Session/>");
    EXPECT_THROW(ProjectFile::write(*project, folder / "new.ardour"), ProjectFileError);
    EXPECT_FALSE(std::filesystem::exists(folder / "new.ardour"));
    ProjectFile::write(*project, folder / "other.ardour");
    EXPECT_TRUE(std::filesystem::exists(folder / "other.ardour"));
}

TEST_F(SessionFolder, IsTheOnlyPlaceForItsSessions)
{
    const auto project = ProjectFile::read(folder / "reel.ardour", log);
    EXPECT_THROW(ProjectFile::write(*project, folder.parent_path() / "elsewhere.ardour"), ProjectFileError);
    EXPECT_FALSE(std::filesystem::exists(folder.parent_path() / "elsewhere.ardour"));
    EXPECT_THROW(ProjectFile::write(*project, folder / "reel.stage"), ProjectFileError);
    ProjectFile::write(*project, folder / ".." / folder.filename() / "again.ardour");
    EXPECT_TRUE(std::filesystem::exists(folder / "again.ardour"));
}

TEST_F(SessionFolder, StandsForItsOnlySession)
{
    EXPECT_EQ(ProjectFile::fileIn(folder), folder / "reel.ardour");
    EXPECT_EQ(ProjectFile::fileIn(folder / "reel.ardour"), folder / "reel.ardour");
    EXPECT_EQ(ProjectFile::fileIn(folder / "missing.ardour"), folder / "missing.ardour");
    put("reel.ardour.bak", "<Session/>");
    EXPECT_EQ(ProjectFile::fileIn(folder), folder / "reel.ardour");
    put("reel_backup_1.ardour", "<Session/>");
    put("reel_backup_12.ardour", "<Session/>");
    EXPECT_EQ(ProjectFile::fileIn(folder), folder / "reel.ardour");
    put("other.ardour", "<Session/>");
    EXPECT_THROW(ProjectFile::fileIn(folder), ProjectFileError);
    // Of several the one counts that is named as the folder is, as Ardour names it at first.
    const std::string first = folder.filename().string() + ".ardour";
    put(first, "<Session/>");
    EXPECT_EQ(ProjectFile::fileIn(folder), folder / first);
    std::filesystem::remove(folder / first);
    std::filesystem::remove(folder / "other.ardour");
    std::filesystem::remove(folder / "reel.ardour");
    EXPECT_THROW(ProjectFile::fileIn(folder), ProjectFileError);
}

TEST(ArdourForm, TellsWhatNoEditMoves)
{
    const SessionProject session(
        SessionText{.routes = R"(<Route id="22" name="Piano" default-type="midi" midi-playlist="32"/>)",
                    .playlists = R"(<Playlist id="32" name="Piano" type="midi"/>)"
                                 R"(<Playlist id="33" name="Dia.1" type="audio"/>)"});
    EXPECT_EQ(session.project->form()->staying(),
              (std::vector<std::string>{"the MIDI track \"Piano\"", "the playlist \"Dia.1\""}));
    const SessionProject marked(SessionText{.locations = location(62, "Loop", 48000, 96000, "IsAutoLoop,IsHidden") +
                                                         location(66, "start", 0, 0, "IsMark,IsClockOrigin")});
    EXPECT_EQ(marked.project->form()->staying(),
              (std::vector<std::string>{"the range \"Loop\"", "the mark \"start\""}));
}

TEST_F(SessionFolder, PutsTheHistoryAsideWhoseRegionsMayBeOthersNow)
{
    put("reel.history", "undo");
    const auto project = ProjectFile::read(folder / "reel.ardour", log);
    ProjectFile::write(*project, folder / "reel.ardour");
    EXPECT_FALSE(std::filesystem::exists(folder / "reel.history"));
    EXPECT_TRUE(std::filesystem::exists(folder / "reel.history.old"));
}

} // namespace

} // namespace standin::tests
