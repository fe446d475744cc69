// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

/// The clock of an Ardour session: what its times mean in seconds from the session's start.
///
/// Since version 7000 a time has its unit before it: "a" superclocks, "b" ticks of the tempo map. Before, it was a number of
/// samples.
class SessionClock {
public:
    static constexpr std::int64_t SuperclocksPerSecond = 282'240'000;
    static constexpr std::int64_t TicksPerQuarter = 1920;

    /// One that has to be replaced before it is used.
    SessionClock() = default;
    /// Reads the sample rate, the version and the tempo map. Throws FileFault.
    explicit SessionClock(const pugi::xml_node& session);

    std::int64_t sampleRate() const { return m_sampleRate; }
    bool hasUnits() const { return m_hasUnits; }

    /// Whether it is a time in ticks.
    static bool isMusical(std::string_view time) { return time.starts_with('b'); }
    /// Throws FileFault for what is no time from 0 to the furthest that there is.
    double seconds(std::string_view time) const;
    /// The same, down to the sample as Ardour plays it.
    std::int64_t samples(std::string_view time) const;
    /// How long what begins at a time is, when the length may be in other units than the time; down to the sample as Ardour
    /// plays it.
    std::int64_t lengthInSamples(std::string_view time, std::string_view length) const;
    double secondsOf(std::int64_t samples) const
    {
        return static_cast<double>(samples) / static_cast<double>(m_sampleRate);
    }
    /// The nearest sample; of two that are equally near the later one.
    std::int64_t samplesOf(double seconds) const;

    /// A time as it is written. `isBefore` is for the last time before the sample: a superclock earlier or, in a session that
    /// counts samples, a sample.
    std::string timeText(std::int64_t samples, bool isBefore = false) const;

    /// The times between two, in seconds, at which the tempo changes, and where a line over musical time bends.
    std::vector<double> bendsBetween(double start, double end) const;
    /// Musical time, for a session that has a tempo.
    double ticksAt(double seconds) const;

private:
    struct Tempo {
        double ticks;
        double seconds;
        double secondsPerQuarter;
        double growth; ///< of the tempo, as the exponent a second; 0 for a constant one
    };

    void readTempos(const pugi::xml_node& session);
    double secondsAtTicks(double ticks) const;
    /// Rounded down, as Ardour does.
    std::int64_t samplesAt(double seconds) const;

    std::int64_t m_sampleRate = 1;
    bool m_hasUnits = false;
    std::vector<Tempo> m_tempos;
};

} // namespace standin
