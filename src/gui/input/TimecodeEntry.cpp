// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/TimecodeEntry.h"

#include "core/time/Framerate.h"
#include "core/time/FramerateProvider.h"

#include <charconv>
#include <cstdint>
#include <cstdlib>
#include <optional>

namespace cadrel::gui {

using core::Framerate;
using core::Timecode;

namespace {

constexpr std::int64_t SecondsOfADay = 24 * 60 * 60;

std::optional<Framerate> projectRate()
{
    const core::FramerateProvider* const provider = Timecode::framerateProvider();
    return provider ? std::optional(provider->getFramerate()) : std::nullopt;
}

/// Nothing for a text that is no number.
std::optional<std::int32_t> read(const std::string& text)
{
    if (text.empty())
        return 0;
    std::int32_t number = 0;
    const char* const end = text.data() + text.size();
    const auto [stop, failure] = std::from_chars(text.data(), end, number);
    return failure == std::errc() && stop == end ? std::optional(number) : std::nullopt;
}

std::optional<Timecode> read(const std::array<std::string, TimecodeEntry::FieldCount>& fields)
{
    std::array<std::int32_t, TimecodeEntry::FieldCount> numbers{};
    for (std::size_t field = 0; field < fields.size(); ++field) {
        const std::optional<std::int32_t> number = read(fields[field]);
        if (!number)
            return std::nullopt;
        numbers[field] = *number;
    }
    return Timecode(numbers[0], numbers[1], numbers[2], numbers[3]);
}

std::string twoDigits(std::int32_t number)
{
    std::string digits = std::to_string(number);
    if (digits.size() < 2)
        digits.insert(0, 1, '0');
    return digits;
}

/// As if no frame number were left out.
std::int64_t countOf(const Timecode& timecode, std::int64_t framesPerSecond)
{
    return ((timecode.hours() * std::int64_t{60} + timecode.minutes()) * 60 + timecode.seconds()) * framesPerSecond +
           timecode.frames();
}

Timecode timecodeOf(std::int64_t count, std::int64_t framesPerSecond)
{
    const auto part = [](std::int64_t number) { return static_cast<std::int32_t>(number); };
    const std::int64_t seconds = count / framesPerSecond;
    return {part(seconds / 3600), part(seconds / 60 % 60), part(seconds % 60), part(count % framesPerSecond)};
}

std::int64_t framesOf(TimecodeEntry::Field field, std::int64_t framesPerSecond)
{
    switch (field) {
    case TimecodeEntry::Hours:
        return framesPerSecond * 3600;
    case TimecodeEntry::Minutes:
        return framesPerSecond * 60;
    case TimecodeEntry::Seconds:
        return framesPerSecond;
    case TimecodeEntry::Frames:
        break;
    }
    return 1;
}

} // namespace

TimecodeEntry::Texts TimecodeEntry::texts() const
{
    return {{twoDigits(m_value.hours()), twoDigits(m_value.minutes()), twoDigits(m_value.seconds()),
             twoDigits(m_value.frames())},
            m_isPositive ? "+" : "-"};
}

bool TimecodeEntry::set(const Timecode& timecode, bool isPositive)
{
    if (!timecode.isInitialized())
        return accept({0, 0, 0, 0}, isPositive);
    const std::optional<Framerate> rate = projectRate();
    return rate && timecode.isValid(*rate) && accept(timecode, isPositive);
}

bool TimecodeEntry::commit(const Texts& typed)
{
    const std::optional<Timecode> timecode = read(typed.fields);
    return timecode && set(*timecode, typed.sign != "-");
}

bool TimecodeEntry::step(Field field, bool isUp)
{
    const std::optional<Framerate> rate = projectRate();
    if (!rate || !m_value.isValid(*rate))
        return false;
    const std::int64_t framesPerSecond = rate->framesPerSecond;
    const std::int64_t count = countOf(m_value, framesPerSecond);
    const std::int64_t signedStep = isUp ? framesOf(field, framesPerSecond) : -framesOf(field, framesPerSecond);
    const std::int64_t result = (m_isPositive ? count : -count) + signedStep;
    if (result < 0 && !m_isSigned)
        return false;

    // The way goes on over numbers that don't exist; zero always does.
    const std::int64_t onwards = (result >= 0) == isUp ? 1 : -1;
    for (std::int64_t size = std::abs(result); size < SecondsOfADay * framesPerSecond; size += onwards) {
        const Timecode timecode = timecodeOf(size, framesPerSecond);
        if (timecode.isValid(*rate))
            return accept(timecode, result >= 0);
    }
    return false;
}

bool TimecodeEntry::flipSign()
{
    return m_isSigned && accept(m_value, !m_isPositive);
}

bool TimecodeEntry::accept(const Timecode& timecode, bool isPositive)
{
    const bool positive = isPositive || !m_isSigned;
    if (timecode == m_value && positive == m_isPositive)
        return false;
    m_value = timecode;
    m_isPositive = positive;
    return true;
}

} // namespace cadrel::gui
