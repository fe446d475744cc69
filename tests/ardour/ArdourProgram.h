// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <filesystem>
#include <map>
#include <string>
#include <tuple>
#include <vector>

namespace cadrel::tests {

/// What Ardour itself says of a session.
struct ArdourDump {
    struct Region {
        std::string track;
        std::string name;
        std::int64_t position;
        std::int64_t length;
        std::int64_t start;

        auto operator<=>(const Region&) const = default;
    };
    using Location = std::tuple<std::string, std::int64_t, std::int64_t>; ///< name, start, end

    std::vector<Region> regions;
    std::vector<Location> locations;
    std::map<std::tuple<std::string, std::string, std::int64_t>, double> values; ///< by track, list and sample
    std::vector<std::string> complaints;                                         ///< warnings and errors of the load
};

/// The left channel of an exported file.
struct ArdourMix {
    std::vector<float> left;
    bool isWhole = false; ///< whether the file tells its length, and has it
};

/// The programs of Ardour, run without a display. Each call throws std::runtime_error with what the program said when it
/// fails.
class ArdourProgram {
public:
    static bool isInstalled();

    /// `name` is without extension, for all calls. With a bus each track sends to it and obeys a VCA, and the tempo changes.
    static void make(const std::filesystem::path& folder, const std::string& name, int tracks, int sampleRate,
                     bool withBus);
    /// `points` is a list of "what:sample:value", as scripts/automate.lua takes it. The session is saved by Ardour.
    static void automate(const std::filesystem::path& folder, const std::string& name, const std::string& points);
    /// `drawn` is a list of fades and envelopes, as scripts/draw.lua takes it. The session is saved by Ardour.
    static void draw(const std::filesystem::path& folder, const std::string& name, const std::string& drawn);
    /// Opens the session and saves it.
    static void resave(const std::filesystem::path& folder, const std::string& name);
    static ArdourDump dump(const std::filesystem::path& folder, const std::string& name,
                           const std::vector<std::int64_t>& samples);
    /// What a WAV file of floats holds, to the end of the file if its header tells no length.
    static ArdourMix mixIn(const std::filesystem::path& file);
    /// The left channel of the mix over the session range. Exported again once if the file isn't whole.
    static std::vector<float> mix(const std::filesystem::path& folder, const std::string& name);
};

} // namespace cadrel::tests
