// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "tests/ardour/ArdourProgram.h"

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace cadrel::tests {

/// How a film and its session count.
struct FilmClock {
    int sampleRate = 48000;
    const char* format = "timecode_25"; ///< as a session names the frame rate
    int nominalRate = 25;               ///< in whole frames a second
    bool isDropFrame = false;           ///< and pulled down
    int firstFrame = 0;                 ///< by timecode, at the session's first sample

    /// The nearest sample.
    std::int64_t sampleOf(int frame) const;
    std::string timecode(int frame) const;
};

/// A film in which some shots change their places.
struct Recut {
    /// Of each shot of the new cut, in frames: where it stood, or nowhere for a new one, and how long it is.
    struct Shot {
        int from; ///< below 0 for a new one
        int length;
    };

    int oldLength;
    std::vector<Shot> shots;
    FilmClock clock{};

    int newLength() const;
    /// Where a sample of the new programme stood; below 0 where it is new.
    std::int64_t sourceOf(std::int64_t sample) const;
    /// Where two shots meet in the new programme, in samples, with begin and end.
    std::vector<std::int64_t> edges() const;

    /// The next cut that this one becomes by another, as shots of the first programme.
    Recut followedBy(const Recut& next) const;

    std::string oldEdl() const;
    std::string newEdl() const;
};

/// How to make a session.
struct SessionPlan {
    int tracks = 1;
    int regionsATrack = 1;
    /// Where the regions stand; at random, and over one another, without them. Each has the name "take TRACK.NUMBER".
    struct Place {
        std::int64_t position;
        std::int64_t length;
    };
    std::vector<Place> places{};
    int loudest = 4000;    ///< of the noise, of 32,768
    bool isVaried = false; ///< some regions are muted, and some have a gain or are turned upside down
    bool withBus = false;
    std::string drawn{};  ///< as ArdourProgram::draw takes it
    std::string points{}; ///< as ArdourProgram::automate takes it
};

/// A session that Ardour has made and saved, with regions of noise on its tracks, and what `cadrel apply` makes of it.
class ConformedSession {
public:
    ConformedSession(const std::string& name, const Recut& recut, const SessionPlan& plan);
    ConformedSession(const ConformedSession&) = delete;
    ConformedSession& operator=(const ConformedSession&) = delete;
    ~ConformedSession();

    const std::filesystem::path& folder() const { return m_folder; }
    /// Carries it over, to a session of that name beside it.
    void conform(const std::string& name) const { apply(m_folder, Name, m_recut.oldEdl(), m_recut.newEdl(), name); }
    /// Likewise what was carried over, by the next cut.
    void conformAgain(const std::string& from, const Recut& next, const std::string& name) const
    {
        apply(m_folder, from, m_recut.newEdl(), m_recut.followedBy(next).newEdl(), name);
    }
    std::filesystem::path file(const std::string& name) const { return m_folder / (name + ".ardour"); }

    static constexpr const char* Name = "film";

    /// Likewise any session of a folder.
    static void apply(const std::filesystem::path& folder, const std::string& from, const std::string& oldEdl,
                      const std::string& newEdl, const std::string& name);

private:
    void addRegions(const SessionPlan& plan) const;

    Recut m_recut;
    std::filesystem::path m_folder;
};

} // namespace cadrel::tests
