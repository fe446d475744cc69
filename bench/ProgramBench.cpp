// SPDX-License-Identifier: GPL-3.0-or-later

// Measures the whole program, from start to exit, against the bounds that it has to keep, in seconds of a processor, which
// other programs on the machine change the least. Takes the path of `cadrel` and a folder for its files; fails when a bound
// is missed.

#include "bench/BenchEdls.h"

#include <fcntl.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <exception>
#include <fstream>
#include <iomanip>
#include <numeric>
#include <random>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using namespace cadrel::bench;

struct Measured {
    double seconds; ///< of a processor
    double megabytes;
};

/// Runs a command with its output thrown away.
Measured measure(const std::vector<std::string>& command)
{
    std::vector<char*> arguments;
    for (const std::string& argument : command)
        arguments.push_back(const_cast<char*>(argument.c_str()));
    arguments.push_back(nullptr);

    const pid_t child = fork();
    if (child == 0) {
        const int nowhere = open("/dev/null", O_WRONLY);
        dup2(nowhere, STDOUT_FILENO);
        execvp(arguments[0], arguments.data());
        _exit(127);
    }
    int status = 0;
    rusage usage{};
    if (child < 0 || wait4(child, &status, 0, &usage) != child || status != 0)
        throw std::runtime_error("Cannot measure " + command[0] + " " + command[1]);
    const auto secondsOf = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
    };
    return {secondsOf(usage.ru_utime) + secondsOf(usage.ru_stime), static_cast<double>(usage.ru_maxrss) * 1024 / 1e6};
}

constexpr std::size_t Runs = 7;

double median(std::array<double, Runs> values)
{
    std::sort(values.begin(), values.end());
    return values[Runs / 2];
}

double medianSeconds(const std::vector<std::string>& command)
{
    std::array<double, Runs> seconds{};
    for (double& run : seconds)
        run = measure(command).seconds;
    return median(seconds);
}

/// The median times of two commands that take turns, so that a change of the machine's speed meets both.
std::array<double, 2> compare(const std::vector<std::string>& a, const std::vector<std::string>& b)
{
    std::array<double, Runs> secondsA{};
    std::array<double, Runs> secondsB{};
    for (std::size_t run = 0; run < Runs; ++run) {
        secondsA[run] = measure(a).seconds;
        secondsB[run] = measure(b).seconds;
    }
    return {median(secondsA), median(secondsB)};
}

/// Prints a row; true when the bound is kept.
bool report(const char* what, double value, double bound, const char* unit)
{
    const bool kept = value <= bound;
    std::printf("%-60s %9.2f %-4s %9.2f %-4s %s\n", what, value, unit, bound, unit, kept ? "kept" : "MISSED");
    return kept;
}

/// The slowest form of the notes of 20,000 events with 2,000 changes, in seconds; the median of its runs.
double slowestNotes(const std::string& program, const std::filesystem::path& folder)
{
    const std::string stem = (folder / "notes").string();
    const Cut oldCut = makeCut(20'000);
    writeEdl(stem + "_old.edl", oldCut);
    writeEdl(stem + "_new.edl", recut(oldCut, 2'000));
    double slowest = 0;
    for (const char* const extension : {".txt", ".csv", ".json", ".html", ".pdf"}) {
        const double seconds = medianSeconds({program, "notes", "--old", stem + "_old.edl", "--new", stem + "_new.edl",
                                              "-o", stem + extension, "--overwrite"});
        slowest = std::max(slowest, seconds);
    }
    return slowest;
}

/// Shots of one roll from anywhere in an hour of it, so that much of it is used over and over.
Cut makeCutOfOneRoll(std::size_t shotCount, std::uint32_t seed)
{
    std::mt19937 random(seed);
    Cut cut;
    for (std::size_t shot = 0; shot < shotCount; ++shot) {
        const auto source = static_cast<std::uint32_t>(random() % 86'400);
        cut.push_back({1, source, static_cast<std::uint32_t>(12 + random() % 49)});
    }
    return cut;
}

/// The notes of two cuts of 20,000 such shots, in seconds.
double notesOfOneRoll(const std::string& program, const std::filesystem::path& folder, const std::string& extension)
{
    const std::string stem = (folder / "roll").string();
    writeEdl(stem + "_old.edl", makeCutOfOneRoll(20'000, 1));
    writeEdl(stem + "_new.edl", makeCutOfOneRoll(20'000, 2));
    return medianSeconds({program, "notes", "--old", stem + "_old.edl", "--new", stem + "_new.edl", "-o",
                          stem + extension, "--overwrite"});
}

std::vector<std::string> generateCommand(const std::string& program, const std::filesystem::path& folder,
                                         std::size_t shotCount)
{
    const std::string stem = (folder / std::to_string(shotCount)).string();
    const Cut oldCut = makeCut(shotCount);
    writeEdl(stem + "_old.edl", oldCut);
    writeEdl(stem + "_new.edl", recut(oldCut, shotCount / 100));
    return {program, "generate",           "--old",      stem + "_old.edl", "--new", stem + "_new.edl",
            "-o",    stem + "_change.edl", "--overwrite"};
}

/// A project whose one track has so many clips, each half as long as all of them together.
void writeStackedProject(const std::string& path, int clipCount)
{
    constexpr double Length = 1000.0;
    std::ofstream file(path);
    file << R"({"format": "stage", "version": 1, "framesPerSecond": 24, "dropFrame": false, "pulledDown": false,
"timeOrigin": 0, "end": 0, "position": 0, "leftLocator": 0, "rightLocator": 0, "cycleStart": 0, "cycleEnd": 0,
"pool": [{"number": 1, "kind": "audio", "name": "take", "path": "take.wav", "length": 1000}],
"tracks": [{"kind": "audio", "name": "DIA", "events": [)";
    for (int index = 0; index < clipCount; ++index) {
        const double start = Length / 2 * index / clipCount;
        file << (index == 0 ? "\n" : ",\n") << R"({"kind": "clip", "clip": 1, "start": )" << start << R"(, "end": )"
             << start + Length / 2 << "}";
    }
    file << "]}]}\n";
    if (!file.flush())
        throw std::runtime_error("Cannot write " + path);
}

/// Carries such a project over to a cut of 40 shots with a few changes.
std::vector<std::string> applyCommand(const std::string& program, const std::filesystem::path& folder, int clipCount)
{
    const std::string stem = (folder / ("stacked_" + std::to_string(clipCount))).string();
    const Cut oldCut = makeCut(40);
    writeEdl(stem + "_old.edl", oldCut);
    writeEdl(stem + "_new.edl", recut(oldCut, 4));
    writeStackedProject(stem + ".stage", clipCount);
    return {program,           "apply", stem + ".stage",     "--old",       stem + "_old.edl", "--new",
            stem + "_new.edl", "-o",    stem + "_new.stage", "--overwrite", "--summary"};
}

/// A project of 200 tracks: clips end to end through the film, and a curve with as many points.
void writeWideProject(const std::string& path, double seconds, int clipCount)
{
    constexpr int TrackCount = 200;
    std::ofstream file(path);
    file << std::setprecision(17) << R"({"format": "stage", "version": 1, "framesPerSecond": 24, "dropFrame": false,
"pulledDown": false, "timeOrigin": 0, "end": 0, "position": 0, "leftLocator": 0, "rightLocator": 0, "cycleStart": 0,
"cycleEnd": 0, "pool": [{"number": 1, "kind": "audio", "name": "take", "path": "take.wav", "length": 90000}],
"tracks": [)";
    for (int track = 0; track < TrackCount; ++track) {
        file << (track == 0 ? "\n" : ",\n") << R"({"kind": "audio", "name": "T)" << track << R"(", "events": [)";
        for (int clip = 0; clip < clipCount; ++clip)
            file << (clip == 0 ? "" : ",\n") << R"({"kind": "clip", "clip": 1, "start": )" << seconds * clip / clipCount
                 << R"(, "end": )" << seconds * (clip + 1) / clipCount << "}";
        file << R"(], "curves": [{"number": 1, "automates": "volume", "points": [)";
        for (int point = 0; point < clipCount; ++point)
            file << (point == 0 ? "" : ", ") << R"({"time": )" << seconds * point / clipCount << R"(, "value": )"
                 << 0.125 * (point % 7) << "}";
        file << "]}]}";
    }
    file << "]}\n";
    if (!file.flush())
        throw std::runtime_error("Cannot write " + path);
}

double secondsOf(const Cut& cut)
{
    return std::accumulate(cut.begin(), cut.end(), 0.0,
                           [](double sum, const Shot& shot) { return sum + shot.length; }) /
           24.0;
}

/// Carries a million clips on 200 tracks over to a cut with 2,000 changes, in seconds. `more` says which notes are
/// written.
double applyToManyClips(const std::string& program, const std::filesystem::path& folder,
                        const std::vector<std::string>& more)
{
    const std::string stem = (folder / "many").string();
    const Cut oldCut = makeCut(20'000);
    writeEdl(stem + "_old.edl", oldCut);
    writeEdl(stem + "_new.edl", recut(oldCut, 2'000));
    writeWideProject(stem + ".stage", secondsOf(oldCut), 5'000);
    std::vector<std::string> command{
        program,           "apply", stem + ".stage",     "--old",       stem + "_old.edl", "--new",
        stem + "_new.edl", "-o",    stem + "_new.stage", "--overwrite", "--summary"};
    command.insert(command.end(), more.begin(), more.end());
    return measure(command).seconds;
}

/// Plans a run of 100,000 events and 200 tracks; onto itself, so that the plan is all there is to do.
std::vector<std::string> planCommand(const std::string& program, const std::filesystem::path& folder)
{
    const std::string stem = (folder / "wide").string();
    const Cut cut = makeCut(100'000);
    writeEdl(stem + ".edl", cut);
    writeWideProject(stem + ".stage", secondsOf(cut), 500);
    return {program,       "apply", stem + ".stage",     "--old",       stem + ".edl", "--new",
            stem + ".edl", "-o",    stem + "_new.stage", "--overwrite", "--summary"};
}

/// 200 tracks of 2,000 regions in two hours, with all that Ardour writes of each.
void writeLargeSession(const std::string& path)
{
    constexpr int TrackCount = 200;
    constexpr int RegionCount = 2000;
    constexpr long Frame = 48'000 / 24;
    constexpr long Distance = 90 * Frame;
    constexpr long Length = 80 * Frame;
    const auto time = [](long samples) { return std::string("a").append(std::to_string(samples * 5880)); };
    std::ofstream file(path);
    file << R"(<?xml version="1.0" encoding="UTF-8"?>
<Session version="7002" name="large" sample-rate="48000" id-counter="9000000">
  <Config>
    <Option name="timecode-format" value="timecode_24"/>
  </Config>
  <Sources>
)";
    for (int track = 0; track < TrackCount; ++track)
        file << "    <Source name=\"a" << track << R"(.wav" type="audio" id=")" << 100 + track
             << "\" channel=\"0\"/>\n";
    file << "  </Sources>\n  <Locations>\n    <Location id=\"5\" name=\"session\" start=\"a0\" end=\""
         << time(RegionCount * Distance) << "\" flags=\"IsSessionRange\"/>\n  </Locations>\n  <Routes>\n";
    for (int track = 0; track < TrackCount; ++track)
        file << "    <Route id=\"" << 1000 + track << "\" name=\"T" << track
             << R"(" default-type="audio" audio-playlist=")" << 2000 + track << "\"/>\n";
    file << "  </Routes>\n  <Playlists>\n";
    int id = 10'000;
    for (int track = 0; track < TrackCount; ++track) {
        file << "    <Playlist id=\"" << 2000 + track << "\" name=\"T" << track << "\" type=\"audio\">\n";
        for (int region = 0; region < RegionCount; ++region) {
            const std::string start = time(region % 50 * 100L);
            file << "      <Region name=\"r" << track << "." << region
                 << R"(" muted="0" opaque="1" locked="0" video-locked="0" automatic="0" whole-file="0" import="0" )"
                    R"(external="0" sync-marked="0" left-of-split="0" right-of-split="0" hidden="0" )"
                    R"(position-locked="0" valid-transients="0" start=")"
                 << start << R"(" length=")" << time(Length) << "@" << time(region * Distance + track * 77L)
                 << R"(" sync-position=")" << start
                 << R"(" ancestral-start="a0" ancestral-length="a0@a0" stretch="1" shift="1" layering-index=")"
                 << region
                 << R"(" tags="" contents="0" envelope-active="0" default-fade-in="1" default-fade-out="1" )"
                    R"(fade-in-active="1" fade-out-active="1" scale-amplitude="1" id=")"
                 << id++ << R"(" type="audio" first-edit="nothing" source-0=")" << 100 + track
                 << R"(" master-source-0=")" << 100 + track << R"(" channels="1">
        <Envelope default="yes"/>
        <FadeIn default="yes"/>
        <FadeOut default="yes"/>
      </Region>
)";
        }
        file << "    </Playlist>\n";
    }
    file << "  </Playlists>\n</Session>\n";
    if (!file.flush())
        throw std::runtime_error("Cannot write " + path);
}

/// Carries such a session over to a cut in which a quarter of the shots have changed places.
Measured applyToLargeSession(const std::string& program, const std::filesystem::path& folder)
{
    const std::string stem = (folder / "large").string();
    std::mt19937 random(1);
    Cut oldCut;
    for (std::uint32_t frames = 0; frames < 2000 * 90; frames += oldCut.back().length)
        oldCut.push_back(
            {static_cast<std::uint32_t>(oldCut.size()), 86'400, static_cast<std::uint32_t>(60 + random() % 340)});
    Cut newCut = oldCut;
    for (std::size_t change = 0; change < oldCut.size() / 4; ++change) {
        const std::size_t shot = random() % (oldCut.size() - 1);
        std::swap(newCut[shot], newCut[shot + 1]);
    }
    newCut.erase(newCut.begin() + 5, newCut.begin() + 9);
    writeEdl(stem + "_old.edl", oldCut);
    writeEdl(stem + "_new.edl", newCut);
    writeLargeSession(stem + ".ardour");
    const Measured measured = measure({program, "apply", stem + ".ardour", "--old", stem + "_old.edl", "--new",
                                       stem + "_new.edl", "-o", stem + "_new.ardour", "--overwrite", "--summary"});
    std::filesystem::remove(stem + ".ardour");
    std::filesystem::remove(stem + "_new.ardour");
    return measured;
}

bool run(const std::string& program, const std::filesystem::path& folder)
{
    std::filesystem::create_directories(folder);
    const std::vector<std::string> small = generateCommand(program, folder, 10'000);
    const std::vector<std::string> large = generateCommand(program, folder, 100'000);
    const std::string listed = (folder / "100000_old.edl").string();
    const std::string million = (folder / "1000000.edl").string();
    writeEdl(million, makeCut(1'000'000));

    const auto [listSeconds, wcSeconds] = compare({program, "list", listed, "--summary"}, {"wc", listed});
    const auto [largeSeconds, smallSeconds] = compare(large, small);
    const auto [manySeconds, fewSeconds] =
        compare(applyCommand(program, folder, 20'000), applyCommand(program, folder, 5'000));
    const double megabytes = measure({program, "list", million, "--summary"}).megabytes;
    std::filesystem::remove(million);

    std::printf("%-60s %14s %14s\n", "the whole program, medians of processor seconds", "measured", "bound");
    std::printf("%-60s %9.3f s\n", "wc of 100,000 events", wcSeconds);
    std::printf("%-60s %9.3f s\n", "list --summary of 100,000 events", listSeconds);
    std::printf("%-60s %9.3f s\n", "generate, 10,000 events, 100 changes", smallSeconds);
    bool kept = report("list --summary against wc", listSeconds / wcSeconds, 3, "x");
    kept &= report("generate, 100,000 events, 1,000 changes", largeSeconds, 1, "s");
    kept &= report("generate, 100,000 events against 10,000", largeSeconds / smallSeconds, 14, "x");
    kept &= report("apply, 20,000 clips that overlap on one track", manySeconds, 8, "s");
    kept &= report("apply, 20,000 such clips against 5,000", manySeconds / fewSeconds, 7, "x");
    kept &= report("apply, 100,000 events onto themselves, 200 tracks", medianSeconds(planCommand(program, folder)), 6,
                   "s");
    kept &= report("notes of 20,000 events, 2,000 changes, slowest form", slowestNotes(program, folder), 2, "s");
    for (const std::string extension : {".txt", ".csv", ".json", ".html", ".pdf"}) {
        const std::string what = "notes of 20,000 events of one roll, " + extension;
        kept &= report(what.c_str(), notesOfOneRoll(program, folder, extension), 2, "s");
    }
    const double withoutNotes = applyToManyClips(program, folder, {});
    std::printf("%-60s %9.3f s\n", "apply, 1,000,000 clips, 2,000 changes", withoutNotes);
    for (const std::string extension : {".txt", ".json"}) {
        const std::string what = "the same with " + extension + " notes, against that";
        const double withNotes =
            applyToManyClips(program, folder, {"--notes", (folder / ("many" + extension)).string()});
        kept &= report(what.c_str(), withNotes / withoutNotes, 1.3, "x");
    }
    const Measured session = applyToLargeSession(program, folder);
    kept &= report("apply, a session of 200 tracks of 2,000 regions", session.seconds, 15, "s");
    kept &= report("the same, most memory", session.megabytes, 2000, "MB");
    kept &= report("list --summary of 1,000,000 events, most memory", megabytes, 900, "MB");
    return kept;
}

} // namespace

int main(int argc, char** argv)
{
    if (argc != 3) {
        std::fprintf(stderr, "Usage: %s CADREL FOLDER\n", argv[0]);
        return 2;
    }
    try {
        return run(argv[1], argv[2]) ? EXIT_SUCCESS : EXIT_FAILURE;
    } catch (const std::exception& failure) {
        std::fprintf(stderr, "%s\n", failure.what());
        return EXIT_FAILURE;
    }
}
