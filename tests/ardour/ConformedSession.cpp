// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/ardour/ConformedSession.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>
#include <stdexcept>

namespace cadrel::tests {

namespace fs = std::filesystem;

namespace {

constexpr int FrameRate = 25;

std::string timecode(int frames)
{
    char text[16];
    std::snprintf(text, sizeof text, "%02d:%02d:%02d:%02d", frames / FrameRate / 3600 % 24,
                  frames / FrameRate / 60 % 60, frames / FrameRate % 60, frames % FrameRate);
    return text;
}

/// A list of shots, each of which has a source of its own that runs with the old programme.
std::string edlOf(const std::string& title, const std::vector<Recut::Shot>& shots)
{
    std::string text = "TITLE: " + title + "\nFCM: NON-DROP FRAME\n\n";
    int record = 0;
    for (std::size_t index = 0; index < shots.size(); ++index) {
        const auto& [from, length] = shots[index];
        const std::string reel = from < 0 ? "NEW" + std::to_string(index) : "CAM001";
        const int source = from < 0 ? 0 : 10 * 3600 * FrameRate + from;
        char line[160];
        std::snprintf(line, sizeof line, "%03zu  %-8s V     C        %s %s %s %s\n", index + 1, reel.c_str(),
                      timecode(source).c_str(), timecode(source + length).c_str(), timecode(record).c_str(),
                      timecode(record + length).c_str());
        text += line;
        record += length;
    }
    return text;
}

void writeNoise(const fs::path& file, std::int64_t samples, unsigned seed)
{
    std::ofstream stream(file, std::ios::binary);
    const auto put = [&stream](auto number) { stream.write(reinterpret_cast<const char*>(&number), sizeof number); };
    const auto bytes = static_cast<std::uint32_t>(samples * 2);
    stream << "RIFF";
    put(bytes + 36);
    stream << "WAVEfmt ";
    put(std::uint32_t{16});
    put(std::uint16_t{1});
    put(std::uint16_t{1});
    put(std::uint32_t{48000});
    put(std::uint32_t{96000});
    put(std::uint16_t{2});
    put(std::uint16_t{16});
    stream << "data";
    put(bytes);
    std::minstd_rand noise(seed);
    for (std::int64_t sample = 0; sample < samples; ++sample)
        put(static_cast<std::int16_t>(static_cast<int>(noise() % 8001) - 4000));
}

std::string time(std::int64_t samples)
{
    return std::string("a").append(std::to_string(samples * 5880));
}

} // namespace

int Recut::newLength() const
{
    int length = 0;
    for (const Shot& shot : shots)
        length += shot.length;
    return length;
}

std::int64_t Recut::sourceOf(std::int64_t sample) const
{
    std::int64_t begin = 0;
    for (const Shot& shot : shots) {
        const std::int64_t end = begin + shot.length * SamplesAFrame;
        if (sample < end)
            return shot.from < 0 ? -1 : sample - begin + shot.from * SamplesAFrame;
        begin = end;
    }
    return -1;
}

std::vector<std::int64_t> Recut::edges() const
{
    std::vector<std::int64_t> edges{0};
    for (const Shot& shot : shots)
        edges.push_back(edges.back() + shot.length * SamplesAFrame);
    return edges;
}

std::string Recut::oldEdl() const
{
    return edlOf("OLD", {{0, oldLength}});
}

std::string Recut::newEdl() const
{
    return edlOf("NEW", shots);
}

ConformedSession::ConformedSession(const std::string& name, const Recut& recut, int tracks, int regionsATrack,
                                   const std::string& points)
    : m_recut(recut),
      m_folder(fs::temp_directory_path() / ("cadrel-" + name + "-" + std::to_string(std::random_device()())))
{
    ArdourProgram::make(m_folder, Name, tracks);
    addRegions(tracks, regionsATrack);
    ArdourProgram::automate(m_folder, Name, points);
    std::ofstream(m_folder / "old.edl") << recut.oldEdl();
    std::ofstream(m_folder / "new.edl") << recut.newEdl();
}

ConformedSession::~ConformedSession()
{
    std::error_code ignored;
    fs::remove_all(m_folder, ignored);
}

void ConformedSession::addRegions(int tracks, int regionsATrack) const
{
    const fs::path file = m_folder / (std::string(Name) + ".ardour");
    pugi::xml_document document;
    if (!document.load_file(file.c_str()))
        throw std::runtime_error("Ardour's session can't be read");
    pugi::xml_node session = document.document_element();
    long id = session.attribute("id-counter").as_llong() + 1;
    session.child("Config").find_child_by_attribute("Option", "name", "timecode-format").attribute("value") =
        "timecode_25";
    const std::int64_t end = m_recut.oldLength * Recut::SamplesAFrame;
    std::mt19937 chance(7);
    const auto below = [&chance](std::int64_t limit) {
        return static_cast<std::int64_t>(chance() % static_cast<std::uint64_t>(limit));
    };

    auto playlist = session.child("Playlists").child("Playlist");
    for (int track = 0; track < tracks; ++track, playlist = playlist.next_sibling("Playlist")) {
        const std::string wave = "noise" + std::to_string(track) + ".wav";
        const fs::path folder = m_folder / "interchange" / m_folder.filename() / "audiofiles";
        fs::create_directories(folder);
        writeNoise(folder / wave, end, static_cast<unsigned>(track + 1));
        const long source = id++;
        pugi::xml_node element = session.child("Sources").append_child("Source");
        element.append_attribute("name") = wave.c_str();
        element.append_attribute("type") = "audio";
        element.append_attribute("id") = std::to_string(source).c_str();
        element.append_attribute("channel") = "0";
        for (int index = 0; index < regionsATrack; ++index) {
            const std::int64_t length = 1000 + below(2 * end / regionsATrack);
            const std::int64_t position = below(end - std::min(length, end - 1));
            const std::int64_t start = below(end - std::min(length, end - 1));
            pugi::xml_node region = playlist.append_child("Region");
            const auto set = [&region](const char* attribute, const std::string& value) {
                region.append_attribute(attribute) = value.c_str();
            };
            set("name", "take " + std::to_string(track) + "." + std::to_string(index));
            set("start", time(start));
            set("length", time(std::min(length, end - 1)) + "@" + time(position));
            set("sync-position", time(start));
            set("ancestral-start", "a0");
            set("ancestral-length", "a0@a0");
            set("layering-index", std::to_string(index));
            set("id", std::to_string(id++));
            set("type", "audio");
            set("source-0", std::to_string(source));
            set("master-source-0", std::to_string(source));
            set("channels", "1");
            for (const char* const flag : {"opaque", "default-fade-in", "default-fade-out", "fade-in-active",
                                           "fade-out-active", "scale-amplitude", "stretch", "shift"})
                set(flag, "1");
            for (const char* const flag : {"muted", "locked", "whole-file", "hidden", "envelope-active", "sync-marked",
                                           "automatic", "import", "external", "position-locked", "valid-transients"})
                set(flag, "0");
        }
    }
    pugi::xml_node locations = session.child("Locations");
    const auto addLocation = [&](const char* name, std::int64_t from, std::int64_t to, const char* flags) {
        pugi::xml_node location = locations.append_child("Location");
        location.append_attribute("id") = std::to_string(id++).c_str();
        location.append_attribute("name") = name;
        location.append_attribute("start") = time(from).c_str();
        location.append_attribute("end") = time(to).c_str();
        location.append_attribute("flags") = flags;
    };
    addLocation("session", 0, end, "IsSessionRange");
    for (int mark = 0; mark < 8; ++mark) {
        const std::int64_t at = below(end);
        addLocation(("mark " + std::to_string(mark)).c_str(), at, at, "IsMark");
    }
    session.attribute("id-counter") = std::to_string(id).c_str();
    document.save_file(file.c_str());
}

void ConformedSession::conform(const std::string& name) const
{
    const std::string command = std::string("'") + CADREL_PROGRAM + "' apply '" + (m_folder / Name).string() +
                                ".ardour' --old '" + (m_folder / "old.edl").string() + "' --new '" +
                                (m_folder / "new.edl").string() + "' -o '" + (m_folder / name).string() +
                                ".ardour' --summary > '" + (m_folder / "report.txt").string() + "'";
    if (std::system(command.c_str()) != 0)
        throw std::runtime_error("not conformed: " + command);
}

} // namespace cadrel::tests
