// SPDX-License-Identifier: GPL-3.0-or-later

// Ardour itself opens what `cadrel apply` has made of its sessions, and is asked what stands where and how it sounds.

#include "tests/ardour/ArdourProgram.h"
#include "tests/ardour/ConformedSession.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

#include <algorithm>
#include <array>
#include <cmath>
#include <filesystem>
#include <fstream>
#include <limits>
#include <random>
#include <set>

namespace cadrel::tests {

namespace {

constexpr const char* New = "conformed";

constexpr const char* Old = ConformedSession::Name;

/// Moves, trims, a new shot and a doubled one.
const Recut Film{250, {{100, 40}, {0, 37}, {-1, 25}, {37, 60}, {150, 100}, {20, 15}}};
/// The same and its way back, where no shot is lost.
const Recut Swapped{250, {{90, 160}, {0, 90}}};
const Recut SwappedBack{250, {{160, 90}, {0, 160}}};

/// A WAV file of two channels of floats whose header tells `size` bytes of sound.
std::string waveOf(std::uint32_t size, const std::vector<float>& samples)
{
    const auto number = [](auto value) { return std::string(reinterpret_cast<const char*>(&value), sizeof value); };
    std::string wave = "RIFF" + number(std::uint32_t{8}) + "WAVEfmt " + number(std::uint32_t{16});
    wave += number(std::uint16_t{3}) + number(std::uint16_t{2}) + number(std::uint32_t{48000});
    wave += number(std::uint32_t{384000}) + number(std::uint16_t{8}) + number(std::uint16_t{32});
    wave += "data" + number(size);
    for (const float sample : samples)
        wave += number(sample);
    return wave;
}

TEST(ArdourProgram, ReadsAMixToTheEndOfAFileWhoseHeaderWasLeftWithoutALength)
{
    const TempFolder folder;
    const auto read = [&](const std::string& wave) {
        std::ofstream(folder / "mix.wav", std::ios::binary) << wave;
        const ArdourMix mix = ArdourProgram::mixIn(folder / "mix.wav");
        return std::pair(mix.left, mix.isWhole);
    };
    const std::vector<float> sound{0.5F, 0.0F, 0.25F, 0.0F};
    const std::vector<float> left{0.5F, 0.25F};
    EXPECT_EQ(read(waveOf(16, sound)), std::pair(left, true));
    EXPECT_EQ(read(waveOf(16, sound) + "LIST"), std::pair(left, true));
    EXPECT_EQ(read(waveOf(0, sound)), std::pair(left, false));
    EXPECT_EQ(read(waveOf(24, sound)), std::pair(left, false));
    EXPECT_EQ(read("").second, false);
}

class InArdour : public testing::Test {
protected:
    void SetUp() override
    {
        if (!ArdourProgram::isInstalled())
            FAIL() << "the package ardour is missing; cmake/install-packages.sh tests installs it";
    }
};

/// The region and its sample that each region of a track plays at a sample of the programme.
std::vector<std::pair<std::string, std::int64_t>> playedAt(const ArdourDump& dump, const std::string& track,
                                                           std::int64_t sample)
{
    std::vector<std::pair<std::string, std::int64_t>> played;
    for (const ArdourDump::Region& region : dump.regions) {
        if (region.track == track && region.position <= sample && sample < region.position + region.length)
            played.emplace_back(region.name, region.start + sample - region.position);
    }
    std::ranges::sort(played);
    return played;
}

/// The samples at which something may begin or end in a programme, and those so far beside them.
std::set<std::int64_t> samplesToTry(const ArdourDump& dump, const Recut& recut,
                                    const std::vector<std::int64_t>& besides = {-1, 0, 1, 500})
{
    std::set<std::int64_t> samples;
    const auto add = [&](std::int64_t sample) {
        for (const std::int64_t beside : besides)
            samples.insert(std::max<std::int64_t>(sample + beside, 0));
    };
    for (const ArdourDump::Region& region : dump.regions) {
        add(region.position);
        add(region.position + region.length);
    }
    for (const std::int64_t edge : recut.edges())
        add(edge);
    std::erase_if(samples, [&](std::int64_t sample) { return sample >= recut.edges().back(); });
    return samples;
}

/// Before the conform the pan's list counts in beats, and Ardour rounds a sample to one of 1,920 ticks of a quarter.
constexpr double OfATick = 5e-5;

/// Samples of a new programme and where they stood in the old one.
struct Samples {
    std::vector<std::int64_t> fresh;
    std::vector<std::int64_t> former;

    explicit Samples(const Recut& recut)
    {
        const auto add = [&](std::int64_t sample) {
            if (sample < 0 || recut.sourceOf(sample) < 0)
                return;
            fresh.push_back(sample);
            former.push_back(recut.sourceOf(sample));
        };
        for (std::int64_t sample = 7; sample < recut.edges().back(); sample += 2977)
            add(sample);
        for (const std::int64_t edge : recut.edges()) {
            add(edge - 1);
            add(edge);
        }
    }
};

void expectTheSameValues(const ArdourDump& after, const ArdourDump& before, const Samples& samples)
{
    std::set<std::pair<std::string, std::string>> lists;
    for (const auto& [key, value] : before.values)
        lists.emplace(std::get<0>(key), std::get<1>(key));
    for (const auto& [track, what] : lists) {
        for (std::size_t index = 0; index < samples.fresh.size(); ++index) {
            ASSERT_NEAR(after.values.at({track, what, samples.fresh[index]}),
                        before.values.at({track, what, samples.former[index]}), what == "pan" ? OfATick : 1e-5)
                << track << " " << what << " at " << samples.fresh[index] << " from " << samples.former[index];
        }
    }
}

void expectTheSameRegions(const ArdourDump& after, const ArdourDump& before, const Recut& recut)
{
    std::set<std::string> tracks;
    for (const ArdourDump::Region& region : before.regions)
        tracks.insert(region.track);
    for (const std::string& track : tracks) {
        for (const std::int64_t sample : samplesToTry(after, recut)) {
            const std::int64_t source = recut.sourceOf(sample);
            const auto expected = source < 0 ? playedAt(after, "", 0) : playedAt(before, track, source);
            ASSERT_EQ(playedAt(after, track, sample), expected) << track << " at " << sample;
        }
    }
}

/// How far two mixes may differ.
constexpr double Inaudible = 1e-6;

/// So much on both sides of an edge a new fade may change the sound.
constexpr std::int64_t BesideEdges = 48000 * 30 / 1000;
/// And so much after a change of automation, to which Ardour's gain comes step by step.
constexpr std::int64_t BesideChanges = 48000 * 70 / 1000;

bool isNear(std::int64_t sample, const std::vector<std::int64_t>& places, std::int64_t beside)
{
    return std::ranges::any_of(places, [&](std::int64_t place) { return std::abs(sample - place) < beside; });
}

/// Compares how a session sounds that was carried over with how the former one sounded there, but for so many samples on both
/// sides of each edge, and near `changes` of automation in the former one.
void expectTheSameMix(const ConformedSession& session, const std::string& name, const Recut& recut, std::int64_t beside,
                      const std::vector<std::int64_t>& changes = {}, double inaudible = Inaudible)
{
    const std::vector<float> before = ArdourProgram::mix(session.folder(), Old);
    const std::vector<float> after = ArdourProgram::mix(session.folder(), name);
    const std::vector<std::int64_t> edges = recut.edges();
    std::int64_t compared = 0;
    double loudest = 0.0;
    for (std::int64_t sample = 0; sample < std::ssize(after) && sample < edges.back(); ++sample) {
        const std::int64_t source = recut.sourceOf(sample);
        if (source >= std::ssize(before) || isNear(sample, edges, beside) || isNear(source, changes, BesideChanges))
            continue;
        const float expected = source < 0 ? 0.0F : before[static_cast<std::size_t>(source)];
        ASSERT_NEAR(after[static_cast<std::size_t>(sample)], expected, inaudible) << sample << " from " << source;
        loudest = std::max<double>(loudest, std::abs(expected));
        ++compared;
    }
    EXPECT_GT(compared, edges.back() / 2);
    EXPECT_GT(loudest, 0.001);
}

/// Fades of all shapes for most regions, a gain envelope for every fourth.
std::string someDrawing(int tracks, int regionsATrack)
{
    constexpr std::array Shapes{"FadeLinear", "FadeConstantPower", "FadeSymmetric", "FadeSlow", "FadeFast"};
    std::mt19937 chance(19);
    std::string drawn;
    for (int region = 0; region < tracks * regionsATrack; ++region) {
        const std::string name =
            "take " + std::to_string(region / regionsATrack) + "." + std::to_string(region % regionsATrack) + ":";
        for (const char* const end : {"in", "out"}) {
            if (chance() % 4 != 0)
                drawn += name + end + ":" + Shapes.at(chance() % Shapes.size()) + ":0." +
                         std::to_string(10 + chance() % 35) + ";";
        }
        for (int point = 0; region % 4 == 1 && point < 4; ++point)
            drawn += name + "envelope:0." + std::to_string(10 + 25 * point) + ":" +
                     std::to_string(0.25 * static_cast<double>(1 + chance() % 5)) + ";";
    }
    return drawn;
}

TEST_F(InArdour, EachRegionAndEachValueStandsAndSoundsAsWhereItsPictureWas)
{
    const ConformedSession session(
        "law", Film,
        {.tracks = 8,
         .regionsATrack = 25,
         .loudest = 500,
         .isVaried = true,
         .drawn = someDrawing(8, 25),
         .points = "gain:0:1 gain:100000:1 gain:100001:0.25 gain:250000:0.25 gain:250001:0.7 gain:420000:0.7 "
                   "gain:440000:0 pan:0:0.1 pan:170000:0.1 pan:170001:0.9 mute:0:0 mute:340000:1 mute:370000:0"});
    session.conform(New);
    const Samples samples(Film);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, samples.former);
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, samples.fresh);
    EXPECT_EQ(after.complaints, before.complaints);
    ASSERT_EQ(before.regions.size(), 200U);
    expectTheSameRegions(after, before, Film);
    expectTheSameValues(after, before, samples);
    // The last of the gain's changes takes 20,000 samples. Each of the tracks may differ a little.
    expectTheSameMix(session, New, Film, BesideChanges,
                     {100000, 170000, 250000, 340000, 370000, 420000, 425000, 430000, 435000, 440000}, 8 * Inaudible);
}

TEST_F(InArdour, TrimSendsBussesAndVcasFollowThePictureThroughChangesOfTheTempo)
{
    const ConformedSession session(
        "routes", Film,
        {.tracks = 2,
         .regionsATrack = 3,
         .withBus = true,
         .points = "gain:0:1 gain:170000:0.25 trim:30000:0.2 trim:180000:4 trim:390000:1 send:0:0.3 send:200000:1 "
                   "pan:20000:0.2 pan:130000:0.9 pan:380000:0.1 bus:0:1 bus:250000:0.1 vca:60000:0.2 vca:300000:1"});
    session.conform(New);
    const Samples samples(Film);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, samples.former);
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, samples.fresh);
    EXPECT_EQ(after.complaints, before.complaints);
    for (const auto& [track, what] :
         {std::pair("Dia 1", "send"), std::pair("Bus 1", "gain"), std::pair("VCA", "gain")}) {
        ASSERT_TRUE(before.values.contains({track, what, samples.former.front()})) << track << " " << what;
        EXPECT_NE(before.values.at({track, what, samples.former.front()}),
                  before.values.at({track, what, samples.former.back()}));
    }
    expectTheSameValues(after, before, samples);
}

TEST_F(InArdour, TracksThatShareAPlaylistStillShareItAndItMovesOnce)
{
    const ConformedSession session("shared", Film, {.tracks = 2, .regionsATrack = 10});
    const std::filesystem::path file = session.file(Old);
    pugi::xml_document document;
    ASSERT_TRUE(document.load_file(file.c_str()));
    const auto routeOf = [&](const char* name) {
        return document.document_element().child("Routes").find_child_by_attribute("Route", "name", name);
    };
    routeOf("Dia 2").attribute("audio-playlist") = routeOf("Dia 1").attribute("audio-playlist").value();
    document.document_element()
        .child("Playlists")
        .find_child_by_attribute("Playlist", "id", routeOf("Dia 1").attribute("audio-playlist").value())
        .attribute("shared-with-ids") = routeOf("Dia 2").attribute("id").value();
    document.save_file(file.c_str());
    ArdourProgram::resave(session.folder(), Old);
    session.conform(New);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, {});
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, {});
    EXPECT_EQ(after.complaints, before.complaints);
    ASSERT_EQ(before.regions.size(), 20U);
    expectTheSameRegions(after, before, Film);
}

/// The film at other rates of picture and sound, from an hour of timecode on.
class AtRate : public InArdour, public testing::WithParamInterface<int> {};

TEST_P(AtRate, EachRegionStandsAtTheSampleThatIsNearestToItsPicture)
{
    constexpr int AnHour = 107892;
    const Recut film{250, Film.shots, {GetParam(), "timecode_2997drop", 30, true, AnHour}};
    const ConformedSession session("rate", film, {.tracks = 2, .regionsATrack = 20});
    session.conform(New);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, {});
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, {});
    EXPECT_EQ(after.complaints, before.complaints);
    ASSERT_EQ(before.regions.size(), 40U);
    // A frame needn't begin at a sample, so that an edge may lie one sample beside, and what is played, too.
    for (const std::string track : {"Dia 1", "Dia 2"}) {
        for (const std::int64_t sample : samplesToTry(after, film, {-3, 3, 500})) {
            const std::int64_t source = film.sourceOf(sample);
            const auto played = playedAt(after, track, sample);
            const auto expected = source < 0 ? playedAt(after, "", 0) : playedAt(before, track, source);
            const bool isNearEdge = playedAt(before, track, source - 2) != playedAt(before, track, source + 2) &&
                                    playedAt(before, track, source - 2).size() != expected.size();
            if (isNearEdge || playedAt(before, track, source + 2).size() != expected.size())
                continue;
            ASSERT_EQ(played.size(), expected.size()) << track << " at " << sample;
            for (std::size_t index = 0; index < played.size(); ++index) {
                ASSERT_EQ(played[index].first, expected[index].first) << track << " at " << sample;
                ASSERT_NEAR(static_cast<double>(played[index].second), static_cast<double>(expected[index].second), 1.0)
                    << track << " at " << sample;
            }
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Sound, AtRate, testing::Values(44100, 48000, 96000),
                         [](const auto& rate) { return "Of" + std::to_string(rate.param); });

TEST_F(InArdour, MarksMoveAndTheSessionEndsWithTheProgramme)
{
    const ConformedSession session("marks", Film, {.regionsATrack = 20, .points = "gain:0:1"});
    session.conform(New);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, {});
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, {});
    std::multiset<std::pair<std::string, std::int64_t>> expected;
    int begin = 0;
    for (const Recut::Shot& shot : Film.shots) {
        const std::int64_t from = Film.clock.sampleOf(shot.from);
        for (const auto& [name, start, end] : before.locations) {
            if (name.starts_with("mark") && shot.from >= 0 && start >= from &&
                start < from + Film.clock.sampleOf(shot.length))
                expected.emplace(name, Film.clock.sampleOf(begin) + start - from);
        }
        begin += shot.length;
    }
    std::multiset<std::pair<std::string, std::int64_t>> found;
    std::int64_t end = 0;
    for (const auto& [name, start, last] : after.locations) {
        if (name.starts_with("mark"))
            found.emplace(name, start);
        if (name == "session")
            end = last;
    }
    EXPECT_EQ(found, expected);
    EXPECT_FALSE(found.empty());
    EXPECT_EQ(end, Film.edges().back());
}

/// A long region below, another one over it whose fades are so long that most cuts of the film lie in them, and two that
/// follow one another in a crossfade, one of them with a gain envelope.
const SessionPlan Drawn{.regionsATrack = 4,
                        .places = {{0, 479000}, {20000, 420000}, {100000, 150000}, {230000, 200000}},
                        .loudest = 500,
                        .drawn = "take 0.1:in:FadeConstantPower:200000;take 0.1:out:FadeSlow:150000;"
                                 "take 0.2:out:FadeLinear:20000;take 0.3:in:FadeSymmetric:20000;"
                                 "take 0.2:envelope:0:1;take 0.2:envelope:60000:0.25;take 0.2:envelope:150000:1.5;"};

TEST_F(InArdour, ACutInALongFadeOrAnEnvelopeLeavesTheSoundAsItWas)
{
    const ConformedSession session("fades", Film, Drawn);
    session.conform(New);
    expectTheSameMix(session, New, Film, BesideEdges);
}

TEST_F(InArdour, FadesThatOverlapInOneRegionSoundTheSameInItsPieces)
{
    SessionPlan plan{.places = {{1000, 470000}}, .loudest = 500};
    plan.drawn = "take 0.0:in:FadeConstantPower:300000;take 0.0:out:FadeLinear:300000;";
    const ConformedSession session("overlap", Film, plan);
    session.conform(New);
    expectTheSameMix(session, New, Film, BesideEdges);
}

TEST_F(InArdour, ASecondRunThatTakesTheCutBackLeavesNoFadeWhereThePiecesMeetAgain)
{
    const ConformedSession session("back", Swapped, Drawn);
    session.conform(New);
    ArdourProgram::resave(session.folder(), New);
    session.conformAgain(New, SwappedBack, "back");
    const ArdourDump once = ArdourProgram::dump(session.folder(), New, {});
    const ArdourDump twice = ArdourProgram::dump(session.folder(), "back", {});
    EXPECT_EQ(twice.complaints, once.complaints);
    // The markers of the first run are gone.
    const auto destinations = [](const ArdourDump& dump) {
        return std::ranges::count_if(dump.locations, [](const ArdourDump::Location& location) {
            return std::get<0>(location).starts_with("Destination");
        });
    };
    EXPECT_EQ(destinations(once), 2);
    EXPECT_EQ(destinations(twice), 2);
    expectTheSameMix(session, "back", {250, {{0, 250}}}, 0);
}

std::string versionOf(const std::filesystem::path& session)
{
    pugi::xml_document document;
    EXPECT_TRUE(document.load_file(session.c_str()));
    return document.document_element().attribute("version").value();
}

/// A session of the tree.
class KeptSession : public InArdour, public testing::WithParamInterface<const char*> {};

TEST_P(KeptSession, OpensThereAfterAnotherCutWithEachRegionAndEachValueInItsPlace)
{
    const std::string name = GetParam();
    // A cut of 5 s from an hour of timecode on, as one of the sessions was carried over.
    const Recut first{125, {{60, 40}, {0, 60}, {-1, 10}, {100, 25}}, {.firstFrame = 90000}};
    const bool isConformed = name == "conformed";
    const Recut next{isConformed ? 135 : 125, {{30, 80}, {0, 30}}, first.clock};
    const TempFolder folder;
    std::filesystem::copy_file(treePath("tests/data/ardour/" + name + ".ardour"), folder / (name + ".ardour"));
    const std::string version = versionOf(folder / (name + ".ardour"));
    ConformedSession::apply(folder.path(), name, isConformed ? first.newEdl() : first.oldEdl(),
                            isConformed ? first.followedBy(next).newEdl() : next.newEdl(), "next");
    EXPECT_EQ(versionOf(folder / "next.ardour"), version);
    const Samples samples(next);
    const ArdourDump before = ArdourProgram::dump(folder.path(), name, samples.former);
    const ArdourDump after = ArdourProgram::dump(folder.path(), "next", samples.fresh);
    EXPECT_EQ(after.complaints, before.complaints);
    EXPECT_GE(before.regions.size(), 4U);
    expectTheSameRegions(after, before, next);
    EXPECT_FALSE(before.values.empty());
    expectTheSameValues(after, before, samples);
}

INSTANTIATE_TEST_SUITE_P(Of, KeptSession, testing::Values("film", "conformed", "version6000"),
                         [](const auto& session) { return std::string(session.param); });

/// Puts the regions of the first track into one that stands for them. Ardour opens this form; its scripts can't combine
/// regions.
void combineRegions(const std::filesystem::path& file)
{
    pugi::xml_document document;
    ASSERT_TRUE(document.load_file(file.c_str()));
    pugi::xml_node session = document.document_element();
    pugi::xml_node playlist = session.child("Playlists").child("Playlist");
    long long id = session.attribute("id-counter").as_llong();
    const auto newId = [&id] { return std::to_string(++id); };
    constexpr std::int64_t Sample = 5880;
    const auto text = [](std::int64_t samples) { return std::string("a").append(std::to_string(samples * Sample)); };
    std::int64_t first = std::numeric_limits<std::int64_t>::max();
    std::int64_t last = 0;
    const auto spanOf = [](const pugi::xml_node& region) {
        const std::string length = region.attribute("length").value();
        const std::int64_t position = std::stoll(length.substr(length.find('@') + 2)) / Sample;
        const std::int64_t samples = std::stoll(length.substr(1)) / Sample;
        return std::pair(position, position + samples);
    };
    for (const pugi::xml_node& region : playlist.children("Region")) {
        const auto [begin, end] = spanOf(region);
        first = std::min(first, begin);
        last = std::max(last, end);
    }
    const std::string source = newId();
    pugi::xml_node combined = playlist.append_copy(playlist.child("Region"));
    const auto set = [](pugi::xml_node& node, const char* name, const std::string& value) {
        pugi::xml_attribute attribute = node.attribute(name);
        if (!attribute)
            attribute = node.append_attribute(name);
        attribute.set_value(value.c_str());
    };
    set(combined, "name", "combined");
    set(combined, "id", newId());
    set(combined, "start", "a0");
    set(combined, "sync-position", "a0");
    set(combined, "length", text(last - first) + "@" + text(first));
    set(combined, "source-0", source);
    set(combined, "master-source-0", source);
    pugi::xml_node nested = combined.append_child("NestedSource").append_child("Source");
    pugi::xml_node inner = nested.append_child("Playlist");
    set(inner, "id", newId());
    for (const auto& [name, value] : {std::pair<const char*, std::string>{"name", "combined"},
                                      {"take-id", ""},
                                      {"type", "audio"},
                                      {"flags", ""},
                                      {"id", source},
                                      {"playlist", inner.attribute("id").value()},
                                      {"offset", "a0"},
                                      {"length", text(last - first)},
                                      {"original", combined.attribute("id").value()},
                                      {"channel", "0"},
                                      {"origin", ""}})
        set(nested, name, value);
    for (const auto& [name, value] : {std::pair<const char*, std::string>{"name", "combined"},
                                      {"type", "audio"},
                                      {"orig-track-id", playlist.attribute("orig-track-id").value()},
                                      {"shared-with-ids", ""},
                                      {"frozen", "0"},
                                      {"combine-ops", "0"}})
        set(inner, name, value);
    while (playlist.child("Region") != combined) {
        pugi::xml_node region = inner.append_move(playlist.child("Region"));
        const auto [begin, end] = spanOf(region);
        set(region, "length", text(end - begin) + "@" + text(begin - first));
    }
    set(session, "id-counter", newId());
    document.save_file(file.c_str());
}

TEST_F(InArdour, ACombinedRegionThatWasCutOpensAgainAndSoundsAsItDid)
{
    SessionPlan plan{.places = {{60000, 200000}, {220000, 220000}, {100000, 90000}}, .loudest = 500};
    plan.drawn = "take 0.1:in:FadeConstantPower:0.3;take 0.2:out:FadeLinear:0.4;";
    plan.regionsATrack = 3;
    const ConformedSession session("combined", Film, plan);
    combineRegions(session.file(Old));
    session.conform(New);
    const ArdourDump before = ArdourProgram::dump(session.folder(), Old, {});
    const ArdourDump after = ArdourProgram::dump(session.folder(), New, {});
    EXPECT_EQ(after.complaints, before.complaints);
    ASSERT_EQ(before.regions.size(), 1U);
    EXPECT_EQ(before.regions.front().name, "combined");
    EXPECT_GT(after.regions.size(), 3U);
    expectTheSameRegions(after, before, Film);
    expectTheSameMix(session, New, Film, BesideEdges);
}

} // namespace

} // namespace cadrel::tests
