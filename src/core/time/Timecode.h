// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/serialize/Serializable.h"
#include "core/time/Framerate.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <tuple>

namespace cadrel::core {

class FramerateProvider;

/// A SMPTE-style timecode in a 24-hour day: the four written fields but no frame rate. The same value means a different
/// instant at a different rate, so each operation takes the rate as an argument or from the one process-wide
/// FramerateProvider. Every operation without a Framerate argument throws Result::NotAvailable when no provider is
/// installed, except where it says otherwise. A setter that throws leaves the value as it was.
class Timecode : public serialize::Serializable {
public:
    /// All fields 0, not initialized.
    Timecode();
    /// Takes the numbers without any range check.
    Timecode(std::int32_t hours, std::int32_t minutes, std::int32_t seconds, std::int32_t frames);
    /// Reads HH:MM:SS:FF or HH:MM:SS;FF, each field of one or two digits, without any range check. Throws
    /// Result::InvalidArgument for any other text.
    explicit Timecode(const char* text);
    /// As setSeconds.
    explicit Timecode(double seconds);
    /// As setFrameCount.
    explicit Timecode(std::int32_t frameCount);

    /// An exact copy, `isInitialized` included.
    Timecode(const Timecode& other) = default;
    /// Copies the fields; the target counts as initialized whatever the source is. That is deliberate: a value is only
    /// uninitialized as long as nobody has given it one.
    Timecode& operator=(const Timecode& other);
    ~Timecode() override = default;

    /// The value that the constructor from text gives; nothing where that throws.
    static std::optional<Timecode> parse(std::string_view text);

    /// Installs the source of the project's rate, or removes it with null. Not owned.
    static void setFramerateProvider(const FramerateProvider* provider);
    /// The installed source; null when there is none.
    static const FramerateProvider* framerateProvider();
    /// The provider's current rate.
    static Framerate framerate();

    /// 00:00:00:00; needs no provider.
    static Timecode minTimecode();
    /// 23:59:59 and the last frame of the provider's rate.
    static Timecode maxTimecode();

    static bool isValidFrameCount(std::int32_t frameCount);
    static bool isValidFrameCount(std::int32_t frameCount, const Framerate& framerate);
    /// Whether the seconds, rounded to a frame of the provider's rate, lie within the day.
    static bool isValidSeconds(double seconds);
    /// The one rounding rule of the system: floor(rate x seconds + 0.5), so that half a frame rounds up. Throws
    /// Result::OutOfRange when the result doesn't fit.
    static std::int32_t secondsToFrames(const Framerate& framerate, double seconds);

    void set(std::int32_t hours, std::int32_t minutes, std::int32_t seconds, std::int32_t frames);
    void get(std::int32_t& hours, std::int32_t& minutes, std::int32_t& seconds, std::int32_t& frames) const;
    std::int32_t hours() const { return m_hours; }
    std::int32_t minutes() const { return m_minutes; }
    std::int32_t seconds() const { return m_seconds; }
    std::int32_t frames() const { return m_frames; }
    /// False only for a default-constructed value that nothing has been assigned to.
    bool isInitialized() const { return m_initialized; }

    /// Whether the fields name a frame of the day, drop-frame's left-out numbers (SMPTE ST 12-1) included. The form
    /// with a rate never throws.
    bool isValid() const;
    bool isValid(const Framerate& framerate) const;

    /// Frames since 00:00:00:00. Throws Result::FrameOutOfRate when the frames field exceeds the nominal rate,
    /// Result::OutOfRange for a value that isn't valid, Result::NotSupported for drop-frame at a nominal rate other
    /// than 30.
    std::int32_t toFrameCount() const;
    std::int32_t toFrameCount(const Framerate& framerate) const;
    /// The frame count divided by the real rate; throws as toFrameCount. The form without a rate gives 0.0 for
    /// 00:00:00:00 also without a provider.
    double toSeconds() const;
    double toSeconds(const Framerate& framerate) const;

    /// Throws Result::InvalidArgument under a rate of unknown drop-frame state, Result::OutOfRange outside the day,
    /// Result::NotSupported for drop-frame at a nominal rate other than 30.
    void setFrameCount(std::int32_t frameCount);
    void setFrameCount(std::int32_t frameCount, const Framerate& framerate);
    /// Rounds by secondsToFrames. Throws Result::OutOfRange unless isValidSeconds. Both forms test under the
    /// provider's rate; the second converts under its own.
    void setSeconds(double seconds);
    void setSeconds(double seconds, const Framerate& framerate);
    /// A negative argument moves back. Throws Result::OutOfRange outside the day.
    void addSeconds(double seconds);

    /// Re-expresses the same instant under another rate; a value that isn't valid under `fromRate` stays as it is.
    /// Throws Result::OutOfRange when the instant lies outside the provider's day.
    void convert(const Framerate& fromRate, const Framerate& toRate);

    /// HH:MM:SS:FF with at least two digits a field, always with ":".
    std::string toString() const;

    /// The comparisons look at the four fields alone and never throw. There is deliberately no `<=`.
    bool operator==(const Timecode& other) const { return fields() == other.fields(); }
    bool operator<(const Timecode& other) const { return fields() < other.fields(); }
    bool operator>(const Timecode& other) const { return fields() > other.fields(); }
    bool operator>=(const Timecode& other) const { return fields() >= other.fields(); }

    /// Throw Result::FrameOutOfRate as toFrameCount, and Result::OutOfRange when the result leaves the day.
    Timecode operator+(const Timecode& other) const;
    Timecode operator-(const Timecode& other) const;

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    std::tuple<std::int32_t, std::int32_t, std::int32_t, std::int32_t> fields() const
    {
        return {m_hours, m_minutes, m_seconds, m_frames};
    }

    std::int32_t m_hours = 0;
    std::int32_t m_minutes = 0;
    std::int32_t m_seconds = 0;
    std::int32_t m_frames = 0;
    bool m_initialized = false;
};

} // namespace cadrel::core
