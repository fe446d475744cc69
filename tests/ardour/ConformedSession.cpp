// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/ardour/ConformedSession.h"

#include <pugixml.hpp>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <random>
#include <stdexcept>

namespace cadrel::tests {

namespace fs = std::filesystem;

namespace {

/// A list of shots, each of which has a source of its own that runs with the old programme.
std::string edlOf(const std::string& title, const std::vector<Recut::Shot>& shots, const FilmClock& clock)
{
    std::string text = "TITLE: " + title + "\nFCM: " + (clock.isDropFrame ? "DROP FRAME" : "NON-DROP FRAME") + "\n\n";
    const int hours = 10 * 3600 * clock.nominalRate;
    int record = clock.firstFrame;
    for (std::size_t index = 0; index < shots.size(); ++index) {
        const auto& [from, length] = shots[index];
        const std::string reel = from < 0 ? "NEW" + std::to_string(index) : "CAM001";
        const int source = from < 0 ? 0 : hours + from;
        char line[160];
        std::snprintf(line, sizeof line, "%03zu  %-8s V     C        %s %s %s %s\n", index + 1, reel.c_str(),
                      clock.timecode(source).c_str(), clock.timecode(source + length).c_str(),
                      clock.timecode(record).c_str(), clock.timecode(record + length).c_str());
        text += line;
        record += length;
    }
    return text;
}

void writeNoise(const fs::path& file, std::int64_t samples, int sampleRate, int loudest, unsigned seed)
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
    put(static_cast<std::uint32_t>(sampleRate));
    put(static_cast<std::uint32_t>(sampleRate * 2));
    put(std::uint16_t{2});
    put(std::uint16_t{16});
    stream << "data";
    put(bytes);
    std::minstd_rand noise(seed);
    for (std::int64_t sample = 0; sample < samples; ++sample)
        put(static_cast<std::int16_t>(static_cast<int>(noise() % static_cast<unsigned>(2 * loudest + 1)) - loudest));
}

} // namespace

std::int64_t FilmClock::sampleOf(int frame) const
{
    const double seconds = static_cast<double>(frame) / nominalRate * (isDropFrame ? 1.001 : 1.0);
    return std::llround(seconds * sampleRate);
}

std::string FilmClock::timecode(int frame) const
{
    // Frame numbers 0 and 1 are skipped at the start of every minute but each tenth.
    if (isDropFrame) {
        const int tens = frame / 17982;
        const int rest = frame % 17982;
        frame += 18 * tens + (rest >= 2 ? 2 * ((rest - 2) / 1798) : 0);
    }
    char text[16];
    std::snprintf(text, sizeof text, isDropFrame ? "%02d:%02d:%02d;%02d" : "%02d:%02d:%02d:%02d",
                  frame / nominalRate / 3600 % 24, frame / nominalRate / 60 % 60, frame / nominalRate % 60,
                  frame % nominalRate);
    return text;
}

int Recut::newLength() const
{
    int length = 0;
    for (const Shot& shot : shots)
        length += shot.length;
    return length;
}

std::int64_t Recut::sourceOf(std::int64_t sample) const
{
    int begin = 0;
    for (const Shot& shot : shots) {
        if (sample < clock.sampleOf(begin + shot.length))
            return shot.from < 0 ? -1 : sample - clock.sampleOf(begin) + clock.sampleOf(shot.from);
        begin += shot.length;
    }
    return -1;
}

std::vector<std::int64_t> Recut::edges() const
{
    std::vector<std::int64_t> edges{0};
    int end = 0;
    for (const Shot& shot : shots)
        edges.push_back(clock.sampleOf(end += shot.length));
    return edges;
}

Recut Recut::followedBy(const Recut& next) const
{
    Recut all{oldLength, {}, clock};
    for (const Shot& shot : next.shots) {
        if (shot.from < 0)
            all.shots.push_back(shot);
        int begin = 0;
        for (const Shot& part : shots) {
            const int from = std::max(shot.from, begin);
            const int to = std::min(shot.from + shot.length, begin + part.length);
            if (shot.from >= 0 && from < to)
                all.shots.push_back({part.from < 0 ? -1 : part.from + from - begin, to - from});
            begin += part.length;
        }
    }
    return all;
}

std::string Recut::oldEdl() const
{
    return edlOf("OLD", {{0, oldLength}}, clock);
}

std::string Recut::newEdl() const
{
    return edlOf("NEW", shots, clock);
}

ConformedSession::ConformedSession(const std::string& name, const Recut& recut, const SessionPlan& plan)
    : m_recut(recut),
      m_folder(fs::temp_directory_path() / ("cadrel-" + name + "-" + std::to_string(std::random_device()())))
{
    ArdourProgram::make(m_folder, Name, plan.tracks, recut.clock.sampleRate, plan.withBus);
    addRegions(plan);
    ArdourProgram::automate(m_folder, Name, plan.points);
    if (!plan.drawn.empty())
        ArdourProgram::draw(m_folder, Name, plan.drawn);
}

ConformedSession::~ConformedSession()
{
    std::error_code ignored;
    fs::remove_all(m_folder, ignored);
}

void ConformedSession::addRegions(const SessionPlan& plan) const
{
    const fs::path file = this->file(Name);
    const FilmClock& clock = m_recut.clock;
    const auto time = [&clock](std::int64_t samples) {
        return std::string("a").append(std::to_string(samples * 282'240'000 / clock.sampleRate));
    };
    pugi::xml_document document;
    if (!document.load_file(file.c_str()))
        throw std::runtime_error("Ardour's session can't be read");
    pugi::xml_node session = document.document_element();
    long id = session.attribute("id-counter").as_llong() + 1;
    const auto option = [&session](const char* name) {
        return session.child("Config").find_child_by_attribute("Option", "name", name).attribute("value");
    };
    option("timecode-format") = clock.format;
    option("timecode-offset") = std::to_string(clock.sampleOf(clock.firstFrame)).c_str();
    option("timecode-offset-negative") = "1";
    const std::int64_t end = clock.sampleOf(m_recut.oldLength);
    std::mt19937 chance(7);
    const auto below = [&chance](std::int64_t limit) {
        return static_cast<std::int64_t>(chance() % static_cast<std::uint64_t>(limit));
    };

    auto playlist = session.child("Playlists").child("Playlist");
    for (int track = 0; track < plan.tracks; ++track, playlist = playlist.next_sibling("Playlist")) {
        const std::string wave = "noise" + std::to_string(track) + ".wav";
        const fs::path folder = m_folder / "interchange" / m_folder.filename() / "audiofiles";
        fs::create_directories(folder);
        writeNoise(folder / wave, end, clock.sampleRate, plan.loudest, static_cast<unsigned>(track + 1));
        const long source = id++;
        pugi::xml_node element = session.child("Sources").append_child("Source");
        element.append_attribute("name") = wave.c_str();
        element.append_attribute("type") = "audio";
        element.append_attribute("id") = std::to_string(source).c_str();
        element.append_attribute("channel") = "0";
        for (int index = 0; index < plan.regionsATrack; ++index) {
            const bool isPlaced = !plan.places.empty();
            const auto place = static_cast<std::size_t>(index);
            const std::int64_t length =
                std::min(isPlaced ? plan.places.at(place).length : 1000 + below(2 * end / plan.regionsATrack), end - 1);
            const std::int64_t position = isPlaced ? plan.places.at(place).position : below(end - length);
            const std::int64_t start = below(end - length);
            pugi::xml_node region = playlist.append_child("Region");
            const auto set = [&region](const char* attribute, const std::string& value) {
                region.append_attribute(attribute) = value.c_str();
            };
            set("name", "take " + std::to_string(track) + "." + std::to_string(index));
            set("start", time(start));
            set("length", time(length) + "@" + time(position));
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
            if (plan.isVaried && index % 5 == 4)
                region.attribute("muted") = "1";
            if (plan.isVaried && index % 3 == 1)
                region.attribute("scale-amplitude") = index % 2 == 0 ? "0.5" : "-1.25";
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

void ConformedSession::apply(const fs::path& folder, const std::string& from, const std::string& oldEdl,
                             const std::string& newEdl, const std::string& name)
{
    std::ofstream(folder / "old.edl") << oldEdl;
    std::ofstream(folder / "new.edl") << newEdl;
    const auto quoted = [&folder](const std::string& file) {
        return std::string("'").append((folder / file).string()).append("'");
    };
    const std::string command = std::string("'") + CADREL_PROGRAM + "' apply " + quoted(from + ".ardour") + " --old " +
                                quoted("old.edl") + " --new " + quoted("new.edl") + " -o " + quoted(name + ".ardour") +
                                " --overwrite --summary > " + quoted("report.txt");
    if (std::system(command.c_str()) != 0)
        throw std::runtime_error("not conformed: " + command);
}

} // namespace cadrel::tests
