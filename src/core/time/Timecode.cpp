// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/time/Timecode.h"

#include "core/serialize/ByteArchive.h"
#include "core/time/FramerateProvider.h"
#include "util/Result.h"

#include <array>
#include <cmath>
#include <limits>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 2;

constexpr std::int32_t DropFrameRate = 30;
constexpr std::int32_t DropFramesPerTenMinutes = 17982;
constexpr std::int32_t DropFramesPerMinute = 1798;

const FramerateProvider* provider = nullptr;

bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

/// Takes one or two digits off the front of `text`; -1 when there is none.
std::int32_t takeField(std::string_view& text)
{
    if (text.empty() || !isDigit(text.front()))
        return -1;
    std::int32_t value = text.front() - '0';
    text.remove_prefix(1);
    if (!text.empty() && isDigit(text.front())) {
        value = value * 10 + (text.front() - '0');
        text.remove_prefix(1);
    }
    return value;
}

void appendField(std::string& text, std::int32_t value)
{
    const std::string digits = std::to_string(value);
    if (digits.size() < 2)
        text += '0';
    text += digits;
}

} // namespace

Timecode::Timecode() : Serializable(PersistenceVersion) {}

Timecode::Timecode(std::int32_t hours, std::int32_t minutes, std::int32_t seconds, std::int32_t frames)
    : Serializable(PersistenceVersion), m_hours(hours), m_minutes(minutes), m_seconds(seconds), m_frames(frames),
      m_initialized(true)
{
}

Timecode::Timecode(const char* text) : Timecode()
{
    const std::optional<Timecode> parsed = parse(text);
    if (!parsed)
        throw Result::InvalidArgument;
    *this = *parsed;
}

Timecode::Timecode(double seconds) : Timecode()
{
    setSeconds(seconds);
}

Timecode::Timecode(std::int32_t frameCount) : Timecode()
{
    setFrameCount(frameCount);
}

Timecode& Timecode::operator=(const Timecode& other)
{
    set(other.m_hours, other.m_minutes, other.m_seconds, other.m_frames);
    return *this;
}

std::optional<Timecode> Timecode::parse(std::string_view text)
{
    std::array<std::int32_t, 4> fields{};
    for (std::size_t index = 0; index < fields.size(); ++index) {
        if (index > 0) {
            const bool mayBeSemicolon = index == 3;
            if (text.empty() || !(text.front() == ':' || (mayBeSemicolon && text.front() == ';')))
                return std::nullopt;
            text.remove_prefix(1);
        }
        fields[index] = takeField(text);
        if (fields[index] < 0)
            return std::nullopt;
    }
    if (!text.empty())
        return std::nullopt;
    return Timecode(fields[0], fields[1], fields[2], fields[3]);
}

void Timecode::setFramerateProvider(const FramerateProvider* newProvider)
{
    provider = newProvider;
}

const FramerateProvider* Timecode::framerateProvider()
{
    return provider;
}

Framerate Timecode::framerate()
{
    if (provider == nullptr)
        throw Result::NotAvailable;
    return provider->getFramerate();
}

Timecode Timecode::minTimecode()
{
    return {0, 0, 0, 0};
}

Timecode Timecode::maxTimecode()
{
    return {23, 59, 59, framerate().framesPerSecond - 1};
}

bool Timecode::isValidFrameCount(std::int32_t frameCount)
{
    return isValidFrameCount(frameCount, framerate());
}

bool Timecode::isValidFrameCount(std::int32_t frameCount, const Framerate& framerate)
{
    return frameCount >= 0 && frameCount <= framerate.lastFrame;
}

bool Timecode::isValidSeconds(double seconds)
{
    const Framerate current = framerate();
    const double rounded = std::floor(current.rate * seconds + 0.5);
    // NaN fails both comparisons.
    return rounded >= 0.0 && rounded <= static_cast<double>(current.lastFrame);
}

std::int32_t Timecode::secondsToFrames(const Framerate& framerate, double seconds)
{
    const double rounded = std::floor(framerate.rate * seconds + 0.5);
    const bool fits =
        rounded >= std::numeric_limits<std::int32_t>::min() && rounded <= std::numeric_limits<std::int32_t>::max();
    if (!fits)
        throw Result::OutOfRange;
    return static_cast<std::int32_t>(rounded);
}

void Timecode::set(std::int32_t hours, std::int32_t minutes, std::int32_t seconds, std::int32_t frames)
{
    m_hours = hours;
    m_minutes = minutes;
    m_seconds = seconds;
    m_frames = frames;
    m_initialized = true;
}

void Timecode::get(std::int32_t& hours, std::int32_t& minutes, std::int32_t& seconds, std::int32_t& frames) const
{
    hours = m_hours;
    minutes = m_minutes;
    seconds = m_seconds;
    frames = m_frames;
}

bool Timecode::isValid() const
{
    return isValid(framerate());
}

bool Timecode::isValid(const Framerate& framerate) const
{
    const auto isBelow = [](std::int32_t value, std::uint32_t limit) {
        return static_cast<std::uint32_t>(value) < limit;
    };
    if (!isBelow(m_hours, 24) || !isBelow(m_minutes, 60) || !isBelow(m_seconds, 60))
        return false;
    if (m_frames < 0 || m_frames >= framerate.framesPerSecond)
        return false;
    const bool isDropped = m_minutes % 10 != 0 && m_seconds == 0 && m_frames < 2;
    return framerate.dropFrame != 1 || !isDropped;
}

std::int32_t Timecode::toFrameCount() const
{
    return toFrameCount(framerate());
}

std::int32_t Timecode::toFrameCount(const Framerate& framerate) const
{
    if (m_frames > framerate.framesPerSecond)
        throw Result::FrameOutOfRate;
    if (!isValid(framerate))
        throw Result::OutOfRange;
    const std::int32_t minutesOfDay = m_hours * 60 + m_minutes;
    const std::int64_t counted = (std::int64_t{minutesOfDay} * 60 + m_seconds) * framerate.framesPerSecond + m_frames;
    if (counted > std::numeric_limits<std::int32_t>::max())
        throw Result::OutOfRange;
    const auto written = static_cast<std::int32_t>(counted);
    if (framerate.dropFrame == 0)
        return written;
    if (framerate.framesPerSecond != DropFrameRate)
        throw Result::NotSupported;
    // SMPTE ST 12-1: the numbers 0 and 1 are left out at the start of every minute but each tenth.
    return written - 2 * (minutesOfDay - minutesOfDay / 10);
}

double Timecode::toSeconds() const
{
    if (m_hours == 0 && m_minutes == 0 && m_seconds == 0 && m_frames == 0)
        return 0.0;
    return toSeconds(framerate());
}

double Timecode::toSeconds(const Framerate& framerate) const
{
    return toFrameCount(framerate) / framerate.rate;
}

void Timecode::setFrameCount(std::int32_t frameCount)
{
    setFrameCount(frameCount, framerate());
}

void Timecode::setFrameCount(std::int32_t frameCount, const Framerate& framerate)
{
    if (framerate.dropFrame == -1)
        throw Result::InvalidArgument;
    if (!isValidFrameCount(frameCount, framerate))
        throw Result::OutOfRange;
    if (framerate.dropFrame == 0) {
        if (framerate.framesPerSecond == 0)
            throw Result::OutOfRange;
        const std::int32_t secondsOfDay = frameCount / framerate.framesPerSecond;
        set(secondsOfDay / 3600, secondsOfDay / 60 % 60, secondsOfDay % 60, frameCount % framerate.framesPerSecond);
        return;
    }
    if (framerate.dropFrame != 1 || framerate.framesPerSecond != DropFrameRate)
        throw Result::NotSupported;
    // SMPTE ST 12-1 read backwards: 18 numbers are left out in each whole ten minutes, and 2 in each further minute.
    const std::int32_t tenMinutes = frameCount / DropFramesPerTenMinutes;
    const std::int32_t rest = frameCount % DropFramesPerTenMinutes;
    const std::int32_t written = frameCount + 18 * tenMinutes + 2 * ((rest - 2) / DropFramesPerMinute);
    set(written / 108000 % 24, written / 1800 % 60, written / 30 % 60, written % 30);
}

void Timecode::setSeconds(double seconds)
{
    setSeconds(seconds, framerate());
}

void Timecode::setSeconds(double seconds, const Framerate& framerate)
{
    if (!isValidSeconds(seconds))
        throw Result::OutOfRange;
    setFrameCount(secondsToFrames(framerate, seconds), framerate);
}

void Timecode::addSeconds(double seconds)
{
    setSeconds(toSeconds() + seconds);
}

void Timecode::convert(const Framerate& fromRate, const Framerate& toRate)
{
    if (!isValid(fromRate))
        return;
    const double instant = toSeconds(fromRate);
    if (!isValidSeconds(instant))
        throw Result::OutOfRange;
    setFrameCount(secondsToFrames(toRate, instant), toRate);
}

std::string Timecode::toString() const
{
    std::string text;
    for (const std::int32_t field : {m_hours, m_minutes, m_seconds, m_frames}) {
        if (!text.empty())
            text += ':';
        appendField(text, field);
    }
    return text;
}

Timecode Timecode::operator+(const Timecode& other) const
{
    const Framerate current = framerate();
    const double left = toSeconds(current);
    const double right = other.toSeconds(current);
    Timecode sum;
    sum.setSeconds(left + right, current);
    return sum;
}

Timecode Timecode::operator-(const Timecode& other) const
{
    const Framerate current = framerate();
    const double left = toSeconds(current);
    const double right = other.toSeconds(current);
    Timecode difference;
    difference.setSeconds(left - right, current);
    return difference;
}

void Timecode::readCurrent(ByteArchive& archive)
{
    std::array<std::uint8_t, 4> fields{};
    bool initialized = false;
    for (std::uint8_t& field : fields)
        archive >> field;
    archive >> initialized;
    set(fields[0], fields[1], fields[2], fields[3]);
    m_initialized = initialized;
}

void Timecode::write(ByteArchive& archive) const
{
    // One byte each, written at once, as a model has hundreds of thousands of timecodes.
    std::uint32_t fields = 0;
    for (const std::int32_t field : {m_frames, m_seconds, m_minutes, m_hours})
        fields = fields << 8U | static_cast<std::uint8_t>(field);
    archive << fields << m_initialized;
}

void Timecode::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version > 1)
        throw Result::UnknownVersion;
    std::array<std::int32_t, 4> fields{};
    bool initialized = true;
    for (std::int32_t& field : fields)
        archive >> field;
    if (version == 1)
        archive >> initialized;
    set(fields[0], fields[1], fields[2], fields[3]);
    m_initialized = initialized;
}

} // namespace cadrel::core
