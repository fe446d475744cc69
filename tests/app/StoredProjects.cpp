// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/StoredProjects.h"

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "tests/support/TempFolder.h"

#include <algorithm>
#include <cmath>

namespace cadrel::tests {

using nlohmann::json;

json tracksIn(const std::filesystem::path& project)
{
    return json::parse(contentOf(project)).at("tracks");
}

json trackIn(const std::filesystem::path& project, const std::string& name)
{
    for (const json& track : tracksIn(project)) {
        if (track.at("name") == name)
            return track;
    }
    return {};
}

std::string randomProjectText(std::uint64_t seed, const core::Framerate& framerate,
                              const standin::tests::ProjectScale& scale)
{
    standin::ChangeLog log;
    standin::tests::SeededChance chance(seed);
    json project = json::parse(standin::ProjectFile::toText(*standin::tests::randomProject(chance, log, scale)));
    project["framesPerSecond"] = framerate.framesPerSecond;
    project["dropFrame"] = framerate.dropFrame == 1;
    project["pulledDown"] = framerate.pulledDown;
    return project.dump();
}

double valueAt(const json& points, double time)
{
    const json* before = nullptr;
    for (const json& point : points) {
        const double at = point.at("time");
        if (at >= time) {
            if (!before)
                return point.at("value");
            const double from = before->at("time");
            const double share = at > from ? (time - from) / (at - from) : 1.0;
            return before->at("value").get<double>() +
                   share * (point.at("value").get<double>() - before->at("value").get<double>());
        }
        before = &point;
    }
    return before ? before->at("value").get<double>() : 0.0;
}

std::vector<json> changeableTracks(const json& tracks)
{
    std::vector<json> found;
    for (const json& track : tracks) {
        if (track.at("kind") == "folder") {
            for (const json& inner : changeableTracks(track.value("tracks", json::array())))
                found.push_back(inner);
        } else if (track.at("kind") != "ruler" && track.value("name", std::string()) != "Destination" &&
                   track.value("name", std::string()) != "Insert") {
            found.push_back(track);
        }
    }
    return found;
}

double endOf(const json& event)
{
    return event.value("end", event.at("start").get<double>());
}

bool holds(const json& events, const json& event, double shift)
{
    const auto isSame = [&](const json& other) {
        if (shift == 0.0)
            return other == event;
        json moved = other;
        moved["start"] = event.at("start");
        if (event.contains("end"))
            moved["end"] = event.at("end");
        constexpr double SameInstant = 1.0 / 384000;
        return moved == event &&
               std::abs(other.at("start").get<double>() - event.at("start").get<double>() - shift) < SameInstant &&
               std::abs(endOf(other) - endOf(event) - shift) < SameInstant;
    };
    return std::any_of(events.begin(), events.end(), isSame);
}

} // namespace cadrel::tests
