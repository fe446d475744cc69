// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/ardour/ArdourProgram.h"

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace cadrel::tests {

/// A film of 25 frames a second in which some shots change their places.
struct Recut {
    /// Of each shot of the new cut, in frames: where it stood, or nowhere for a new one, and how long it is.
    struct Shot {
        int from; ///< below 0 for a new one
        int length;
    };

    static constexpr std::int64_t SamplesAFrame = 1920;

    int oldLength;
    std::vector<Shot> shots;

    int newLength() const;
    /// Where a sample of the new programme stood; below 0 where it is new.
    std::int64_t sourceOf(std::int64_t sample) const;
    /// Where two shots meet in the new programme, in samples, with begin and end.
    std::vector<std::int64_t> edges() const;

    std::string oldEdl() const;
    std::string newEdl() const;
};

/// A session that Ardour has made and saved, with regions of noise on its tracks, and what `cadrel apply` makes of it.
class ConformedSession {
public:
    /// `points` as ArdourProgram::automate takes them.
    ConformedSession(const std::string& name, const Recut& recut, int tracks, int regionsATrack,
                     const std::string& points);
    ConformedSession(const ConformedSession&) = delete;
    ConformedSession& operator=(const ConformedSession&) = delete;
    ~ConformedSession();

    const std::filesystem::path& folder() const { return m_folder; }
    /// Carries it over, to a session of that name beside it.
    void conform(const std::string& name) const;

    static constexpr const char* Name = "film";

private:
    void addRegions(int tracks, int regionsATrack) const;

    Recut m_recut;
    std::filesystem::path m_folder;
};

} // namespace cadrel::tests
