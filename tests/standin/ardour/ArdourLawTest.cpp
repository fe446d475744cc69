// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/Application.h"
#include "standin/base/ObjectList.h"
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/project/AutomationPoint.h"
#include "tests/standin/ardour/SessionText.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <set>
#include <sstream>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr double Frame = 1001.0 / 30000.0;
constexpr double SampleRate = 48000.0;

/// Fades that a user may have drawn, or none, which don't overlap.
std::string someFades(int firstId, long length)
{
    if (length < 2 || *rc::gen::arbitrary<bool>())
        return std::string();
    const auto fade = [&firstId](const std::string& name, long samples, const std::string& from,
                                 const std::string& to) {
        return "<" + name + "><AutomationList id=\"" + std::to_string(firstId++) +
               "\" interpolation-style=\"Curved\"><events>a0 " + from + "\na" + std::to_string(samples * 5880) + " " +
               to + "</events></AutomationList></" + name + ">";
    };
    const long in = *rc::gen::inRange(1L, length);
    return fade("FadeIn", in, "0", "1") + fade("FadeOut", length - in, "1", "0");
}

/// A session with regions that may overlap, with automation, marks and ranges, none of them at a frame.
SessionText someSession()
{
    SessionText text{.timecode = "timecode_2997"};
    const int count = *rc::gen::inRange(0, 6);
    for (int id = 0; id < count; ++id) {
        const long length = *rc::gen::inRange(1, 200000);
        text.regions += region(100 + id, *rc::gen::inRange(0, 400000), length, *rc::gen::inRange(0, 5000),
                               someFades(300 + 4 * id, length));
    }
    long time = *rc::gen::inRange(0, 1000);
    std::string points;
    std::string steps;
    for (int point = *rc::gen::inRange(0, 6); point > 0; --point) {
        const std::string at = std::string("a").append(std::to_string(time * 5880)).append(" ");
        points.append(at).append(std::to_string(*rc::gen::inRange(0, 8) * 0.25)).append("\n");
        steps.append(at).append(std::to_string(*rc::gen::inRange(0, 3))).append("\n");
        time += *rc::gen::inRange(2000, 100000);
    }
    if (!points.empty())
        text.route = gain(points) + list("mute", "Discrete", steps);
    for (int id = *rc::gen::inRange(0, 4); id > 0; --id) {
        const long start = *rc::gen::inRange(0, 400000);
        const bool isRange = *rc::gen::arbitrary<bool>();
        text.locations +=
            location(200 + id, std::string("m").append(std::to_string(id)), start,
                     isRange ? start + *rc::gen::inRange(1, 100000) : start, isRange ? "IsRangeMarker" : "IsMark");
    }
    return text;
}

/// A host in which a session is open and its ranges are copied.
class EditedSession {
public:
    explicit EditedSession(const std::string& text)
        : project(application.projects().add(ProjectFile::parse(text, "/film/reel.ardour", application.edits().log())))
    {
    }

    /// Copies some ranges of all tracks, at frames, as one step.
    void edit()
    {
        application.edits().begin(true);
        for (int copies = *rc::gen::inRange(1, 4); copies > 0; --copies) {
            const int start = *rc::gen::inRange(0, 400);
            const int length = *rc::gen::inRange(1, 200);
            const int destination = *rc::gen::inRange(0, 400);
            const auto tracks = create<IObjectList>(application.context());
            for (Track* const track : project.allTracks())
                tracks->add(static_cast<ITrackNode*>(track), 0);
            RC_ASSERT(application.edits().copyRange(&project, tracks.get(), 0, start * Frame, (start + length) * Frame,
                                                    destination * Frame) == ResultOk);
        }
        application.edits().commit(&project, u"Copy");
    }
    std::string text() const { return ProjectFile::toText(project); }

    Application application;
    Project& project;
};

/// Which sample of which region a track plays at a sample, with how far the truth lies beside it, in samples.
struct Played {
    std::u16string name;
    double source;
};

std::vector<Played> playedAt(const Track& track, long sample)
{
    std::vector<Played> played;
    for (const Node* node = track.firstChild(); node; node = track.childBehind(*node)) {
        const auto& event = static_cast<const ClipEvent&>(*node);
        const auto edge = [](double seconds) { return std::floor(seconds * SampleRate + 0.5 + 1e-6); };
        const auto at = static_cast<double>(sample);
        if (edge(event.start()) <= at && at < edge(event.end()))
            played.push_back({event.name(), at - event.start() * SampleRate + event.sourceOffset() * SampleRate});
    }
    std::ranges::sort(played, [](const Played& a, const Played& b) {
        return std::tie(a.name, a.source) < std::tie(b.name, b.source);
    });
    return played;
}

std::set<long> edgesOf(const Track& track)
{
    std::set<long> edges{0};
    for (const Node* node = track.firstChild(); node; node = track.childBehind(*node)) {
        for (const double seconds : {node->start(), node->end(), (node->start() + node->end()) / 2.0}) {
            for (const long beside : {-1L, 0L, 1L})
                edges.insert(std::max(std::lround(seconds * SampleRate) + beside, 0L));
        }
    }
    return edges;
}

/// The values of the list "mute" of a session as they stand in its text, by samples.
std::map<long, double> mutesIn(const std::string& session)
{
    pugi::xml_document document;
    RC_ASSERT(static_cast<bool>(document.load_string(session.c_str())));
    std::istringstream events(
        document.select_node("//AutomationList[@automation-id='mute']/events").node().text().get());
    std::map<long, double> mutes;
    std::string time;
    for (double value = 0.0; events >> time >> value;)
        mutes[std::stol(time.substr(1)) / 5880] = value;
    return mutes;
}

/// What holds at a sample: the value of the last point up to there, or of the first.
double heldAt(const std::map<long, double>& mutes, long sample)
{
    const auto after = mutes.upper_bound(sample);
    return after == mutes.begin() ? after->second : std::prev(after)->second;
}

} // namespace

RC_GTEST_PROP(ArdourLaw, WhatIsWrittenPlaysTheSameSamplesAsTheProject, ())
{
    EditedSession session(someSession());
    session.edit();
    const SessionProject again(session.text());

    const Track& edited = *session.project.allTracks().front();
    const Track& read = again.track("Dia");
    std::set<long> samples = edgesOf(edited);
    samples.merge(edgesOf(read));
    for (const long sample : samples) {
        const std::vector<Played> expected = playedAt(edited, sample);
        const std::vector<Played> written = playedAt(read, sample);
        RC_ASSERT(written.size() == expected.size());
        for (std::size_t index = 0; index < expected.size(); ++index) {
            RC_ASSERT(written[index].name == expected[index].name);
            RC_ASSERT(std::abs(written[index].source - expected[index].source) <= 0.5 + 1e-4);
        }
    }
}

RC_GTEST_PROP(ArdourLaw, WhatIsWrittenHasTheAutomationOfTheProject, ())
{
    EditedSession session(someSession());
    session.edit();
    const SessionProject again(session.text());

    const Track& edited = *session.project.allTracks().front();
    for (const auto& [number, curve] : again.track("Dia").curves()) {
        const Envelope& expected = *edited.curves().at(number);
        RC_ASSERT((curve->firstChild() != nullptr) == (expected.firstChild() != nullptr));
        if (!curve->firstChild() || number != Envelope::Curve::Volume)
            continue;
        std::set<long> changes;
        for (const Envelope* const each : std::initializer_list<const Envelope*>{curve.get(), &expected}) {
            for (const Node* point = each->firstChild(); point; point = each->childBehind(*point))
                changes.insert(std::lround(point->start() * SampleRate));
        }
        for (const long change : changes) {
            // A point is moved to the nearest sample, so the value a sample beside is that of the project, but for slopes.
            for (const long sample : {change - 2, change + 2}) {
                if (sample < 0 || changes.contains(sample - 1) || changes.contains(sample) ||
                    changes.contains(sample + 1))
                    continue;
                const double seconds = static_cast<double>(sample) / SampleRate;
                RC_ASSERT(std::abs(*curve->valueBehind(seconds) - *expected.valueBehind(seconds)) < 2e-3);
            }
        }
    }
}

RC_GTEST_PROP(ArdourLaw, WhatIsWrittenHoldsTheValuesThatTheProjectHolds, ())
{
    const std::string text = someSession();
    const std::map<long, double> before = mutesIn(text);
    RC_PRE(!before.empty());
    EditedSession session(text);
    session.edit();
    const std::map<long, double> written = mutesIn(session.text());

    // On the track the values lie between the least and the largest of the list.
    const auto byValue = [](const auto& a, const auto& b) { return a.second < b.second; };
    const double least = std::ranges::min_element(before, byValue)->second;
    const double most = std::ranges::max_element(before, byValue)->second;
    const Envelope& expected = *session.project.allTracks().front()->curves().at(Envelope::Curve::Mute);
    for (const Node* point = expected.firstChild(); point; point = expected.childBehind(*point)) {
        for (const long beside : {-1L, 1L}) {
            const long sample = std::lround(point->start() * SampleRate) + beside;
            const double seconds = static_cast<double>(sample) / SampleRate;
            if (sample < 0 || expected.firstChildFrom(seconds - 1.0 / SampleRate) != expected.firstChildFrom(seconds))
                continue;
            const double share = *expected.valueBehind(seconds);
            RC_ASSERT(std::abs(heldAt(written, sample) - (least + share * (most > least ? most - least : 1.0))) < 1e-9);
        }
    }
}

RC_GTEST_PROP(ArdourLaw, NoFadesOfARegionOverlap, ())
{
    SessionText text = someSession();
    for (std::size_t at = 0; (at = text.regions.find("default-fade-", at)) != std::string::npos; at += 20)
        text.regions[text.regions.find('"', at) + 1] = '0';
    EditedSession session(text);
    session.edit();
    pugi::xml_document document;
    RC_ASSERT(static_cast<bool>(document.load_string(session.text().c_str())));
    const auto samplesOf = [](const std::string& time) { return std::stol(time.substr(1)) / 5880; };
    const auto lengthOf = [&](const pugi::xml_node& node) { return samplesOf(node.attribute("length").value()); };
    pugi::xml_document former;
    RC_ASSERT(static_cast<bool>(former.load_string(std::string(text).c_str())));
    std::map<std::string, long> whole;
    for (const pugi::xpath_node& found : former.select_nodes("//Playlist/Region"))
        whole[found.node().attribute("name").value()] = lengthOf(found.node());
    for (const pugi::xpath_node& found : document.select_nodes("//Playlist/Region")) {
        const pugi::xml_node node = found.node();
        const long length = lengthOf(node);
        // One that was moved whole has the fades that the user has given it.
        if (length == whole.at(node.attribute("name").value()))
            continue;
        const auto fadeOf = [&](const char* active, const char* isDefault, const char* name) {
            if (node.attribute(active).as_int() == 0)
                return 0L;
            const std::string events = node.child(name).child("AutomationList").child("events").text().get();
            if (node.attribute(isDefault).as_int() == 1 || events.empty())
                return 64L;
            std::istringstream words(events);
            std::string last;
            for (std::string time, value; words >> time >> value;)
                last = time;
            return samplesOf(last);
        };
        RC_ASSERT(fadeOf("fade-in-active", "default-fade-in", "FadeIn") +
                      fadeOf("fade-out-active", "default-fade-out", "FadeOut") <=
                  length);
    }
}

RC_GTEST_PROP(ArdourLaw, IdsStayUniqueAndReferencesWhole, ())
{
    EditedSession session(someSession());
    session.edit();
    pugi::xml_document document;
    RC_ASSERT(static_cast<bool>(document.load_string(session.text().c_str())));
    std::set<std::string> sources;
    for (const pugi::xpath_node& source : document.select_nodes("//Sources/Source"))
        sources.insert(source.node().attribute("id").value());
    const long long counter = document.document_element().attribute("id-counter").as_llong();
    std::set<std::string> ids;
    for (const pugi::xpath_node& node :
         document.select_nodes("//Playlist/Region | //Playlist//AutomationList | //Location")) {
        RC_ASSERT(ids.insert(node.node().attribute("id").value()).second);
        RC_ASSERT(node.node().attribute("id").as_llong() < counter);
        RC_ASSERT(std::string(node.node().name()) != "Region" ||
                  sources.contains(node.node().attribute("source-0").value()));
    }
}

RC_GTEST_PROP(ArdourLaw, UndoLeadsBackToEveryByte, ())
{
    const std::string text = someSession();
    EditedSession session(text);
    session.edit();
    session.application.edits().undo(session.project);
    RC_ASSERT(session.text() == text);
}

RC_GTEST_PROP(ArdourLaw, WhatIsWrittenIsReadAndWrittenToTheByte, ())
{
    EditedSession session(someSession());
    session.edit();
    const std::string text = session.text();
    RC_ASSERT(SessionProject(text).text() == text);
}

} // namespace standin::tests
