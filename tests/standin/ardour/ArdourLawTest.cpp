// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/Application.h"
#include "standin/base/ObjectList.h"
#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/edit/RangeEdits.h"
#include "standin/project/AutomationPoint.h"
#include "tests/standin/ardour/SomeSession.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <cmath>
#include <map>
#include <numeric>
#include <set>
#include <sstream>
#include <tuple>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr double Frame = 1001.0 / 30000.0;
constexpr double SampleRate = 48000.0;

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

/// Which sample of which region a track plays at a sample, in samples.
struct Played {
    std::u16string name;
    double source;
    bool
        isAtCut; ///< so near to an edge of the piece at a frame that the piece may begin or end beside it when it is written
};

/// Where a frame is no whole number of samples, an edge at it is written at the nearest sample.
constexpr double BesideFrame = 2.5;

bool isAtFrame(double edge)
{
    return std::abs(edge - std::round(edge / Frame) * Frame) * SampleRate < BesideFrame;
}

std::vector<Played> playedAt(const Track& track, long sample)
{
    std::vector<Played> played;
    for (const Node* node = track.firstChild(); node; node = track.childBehind(*node)) {
        const auto& event = static_cast<const ClipEvent&>(*node);
        const auto edge = [](double seconds) { return std::floor(seconds * SampleRate + 0.5 + 1e-6); };
        const auto at = static_cast<double>(sample);
        if (edge(event.start()) > at || at >= edge(event.end()))
            continue;
        const auto isCut = [&](double seconds) {
            return isAtFrame(seconds) && std::abs(seconds * SampleRate - at) < BesideFrame;
        };
        played.push_back({event.name(), at - event.start() * SampleRate + event.sourceOffset() * SampleRate,
                          isCut(event.start()) || isCut(event.end())});
    }
    return played;
}

/// Whether all that is played is among others, but for what may begin or end beside a cut.
bool areAmong(const std::vector<Played>& played, const std::vector<Played>& others)
{
    return std::ranges::all_of(played, [&](const Played& each) {
        return each.isAtCut || std::ranges::any_of(others, [&](const Played& other) {
                   return other.name == each.name && std::abs(other.source - each.source) <= 0.5 + 1e-4;
               });
    });
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
        RC_ASSERT(areAmong(expected, written));
        RC_ASSERT(areAmong(written, expected));
        const bool isSharp =
            std::ranges::none_of(expected, &Played::isAtCut) && std::ranges::none_of(written, &Played::isAtCut);
        RC_ASSERT(!isSharp || written.size() == expected.size());
    }
}

/// A film of shots with frames that may be no whole number of samples, one region to each shot and one over all of them.
class ShotsAtARate {
public:
    ShotsAtARate()
    {
        struct Rate {
            std::string format;
            double framesPerSecond;
        };
        const auto rate = *rc::gen::elementOf(std::vector<Rate>{{"timecode_23976", 24000.0 / 1001.0},
                                                                {"timecode_24", 24.0},
                                                                {"timecode_25", 25.0},
                                                                {"timecode_2997", 30000.0 / 1001.0},
                                                                {"timecode_30", 30.0},
                                                                {"timecode_5994", 60000.0 / 1001.0}});
        samplesPerSecond = *rc::gen::elementOf(std::vector<long>{44100, 48000, 96000});
        frame = 1.0 / rate.framesPerSecond;
        // Rounded as one editor or another does it.
        const double upwards = *rc::gen::elementOf(std::vector<double>{0.0, 0.5, 1.0 - 1e-6});
        const auto lengths = *rc::gen::container<std::vector<int>>(rc::gen::inRange(2, 40));
        cuts.push_back(0);
        for (const int length : lengths)
            cuts.push_back(cuts.back() + length);
        SessionText text{.sampleRate = std::to_string(samplesPerSecond), .timecode = rate.format};
        const auto sampleAt = [&](int cut) {
            return static_cast<long>(std::floor(cut * frame * static_cast<double>(samplesPerSecond) + upwards + 1e-7));
        };
        for (std::size_t shot = 0; shot + 1 < cuts.size(); ++shot)
            text.regions += regionAt(100 + static_cast<int>(shot), sampleAt(cuts[shot]), sampleAt(cuts[shot + 1]));
        if (!lengths.empty())
            text.regions += regionAt(99, 0, sampleAt(cuts.back()));
        session = text;
    }

    /// Name, position, length and start of each region in a session, in order.
    using Regions = std::multiset<std::tuple<std::string, long, long, long>>;
    Regions regionsOf(const std::string& text) const
    {
        pugi::xml_document document;
        RC_ASSERT(static_cast<bool>(document.load_string(text.c_str())));
        Regions regions;
        for (const pugi::xpath_node& found : document.select_nodes("//Playlist/Region")) {
            const std::string length = found.node().attribute("length").value();
            regions.emplace(found.node().attribute("name").value(), samplesIn(length.substr(length.find('@') + 1)),
                            samplesIn(length), samplesIn(found.node().attribute("start").value()));
        }
        return regions;
    }
    /// The session after frames from the first of `from` on have come to `to`, shot by shot.
    std::string moved(const std::string& text, const std::vector<int>& from, const std::vector<int>& to) const
    {
        EditedSession edited(text);
        edited.application.edits().begin(true);
        const auto tracks = create<IObjectList>(edited.application.context());
        for (Track* const track : edited.project.allTracks())
            tracks->add(static_cast<ITrackNode*>(track), 0);
        for (std::size_t shot = 0; shot < from.size(); ++shot) {
            const int length = cuts[shot + 1] - cuts[shot];
            RC_ASSERT(edited.application.edits().copyRange(&edited.project, tracks.get(), 0, from[shot] * frame,
                                                           (from[shot] + length) * frame,
                                                           to[shot] * frame) == ResultOk);
        }
        const int first = *std::ranges::min_element(from);
        clearRange(edited.project.allTracks(), first == 0 ? 0.0 : (first - 1) * frame,
                   first == 0 ? (cuts.back() + 1) * frame : (first + cuts.back() + 1) * frame);
        edited.application.edits().commit(&edited.project, u"Conform");
        return edited.text();
    }

    long samplesPerSecond;
    double frame;
    std::vector<int> cuts;
    std::string session;

private:
    std::string regionAt(int id, long from, long to) const
    {
        const auto time = [&](long samples) {
            return std::string("a").append(std::to_string(samples * (282240000 / samplesPerSecond)));
        };
        return "<Region name=\"r" + std::to_string(id) + "\" start=\"" + time(from) + "\" length=\"" + time(to - from) +
               "@" + time(from) + "\" id=\"" + std::to_string(id) + R"(" type="audio" source-0="11"/>)";
    }
    long samplesIn(const std::string& time) const { return std::stol(time.substr(1)) / (282240000 / samplesPerSecond); }
};

RC_GTEST_PROP(ArdourLaw, ShotsThatAreShuffledAndPutBackHaveTheirRegionsAtEveryRate, ())
{
    const ShotsAtARate film;
    RC_PRE(film.cuts.size() > 1);
    const std::size_t count = film.cuts.size() - 1;
    std::vector<std::size_t> order(count);
    std::iota(order.begin(), order.end(), 0);
    // The new programme lies behind the old one, the shots in another order.
    for (std::size_t shot = count; shot > 1; --shot)
        std::swap(order[shot - 1], order[*rc::gen::resize(100, rc::gen::inRange<std::size_t>(0, shot))]);
    const std::vector<int> old(film.cuts.begin(), film.cuts.end() - 1);
    std::vector<int> cut(count);
    int place = film.cuts.back() + *rc::gen::inRange(2, 40);
    for (const std::size_t shot : order) {
        cut[shot] = place;
        place += film.cuts[shot + 1] - film.cuts[shot];
    }
    const std::string there = film.moved(film.session, old, cut);
    const auto before = film.regionsOf(film.session);
    const auto between = film.regionsOf(there);
    // One for each shot and as many pieces of the one over all.
    RC_ASSERT(between.size() == 2 * count);
    for (const auto& [name, position, length, start] : between) {
        RC_ASSERT(length > 300);
        if (name == "r99")
            continue;
        const auto same = [&, named = name](const auto& region) { return std::get<0>(region) == named; };
        const auto found = std::ranges::find_if(before, same);
        RC_ASSERT(found != before.end());
        RC_ASSERT(std::get<2>(*found) == length);
        RC_ASSERT(std::get<3>(*found) == start);
    }
    long played = 0;
    for (const auto& [name, position, length, start] : film.regionsOf(film.moved(there, cut, old))) {
        RC_ASSERT(position == start);
        if (name == "r99") {
            RC_ASSERT(position == played);
            played = position + length;
        } else {
            RC_ASSERT(before.contains({name, position, length, start}));
        }
    }
    RC_ASSERT(before.contains({"r99", 0, played, 0}));
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
