// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/SessionClock.h"

#include "standin/base/Times.h"
#include "standin/project/FileFault.h"

#include <pugixml.hpp>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <optional>

namespace standin {

namespace {

/// No clock of sound runs slower or faster.
constexpr std::int64_t LowestSampleRate = 8000;
constexpr std::int64_t HighestSampleRate = 768000;
/// The first version whose times have units.
constexpr int FirstVersionWithUnits = 7000;
/// How many steps a ramp of the tempo is drawn in.
constexpr int StepsOfARamp = 64;

template <class Number>
std::optional<Number> numberIn(std::string_view text)
{
    Number number{};
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

[[noreturn]] void refuseTime(std::string_view time)
{
    throw FileFault(quoted(time) + " is no time in a session");
}

} // namespace

SessionClock::SessionClock(const pugi::xml_node& session)
{
    const char* const rate = session.attribute("sample-rate").value();
    const auto sampleRate = numberIn<std::int64_t>(rate);
    if (!sampleRate || *sampleRate < LowestSampleRate || *sampleRate > HighestSampleRate)
        throw FileFault("sample-rate", "is " + quoted(rate) + ", at which no session runs");
    m_sampleRate = *sampleRate;
    m_hasUnits = session.attribute("version").as_int() >= FirstVersionWithUnits;
    if (m_hasUnits)
        readTempos(session);
}

void SessionClock::readTempos(const pugi::xml_node& session)
{
    bool continues = false;
    for (const pugi::xml_node& tempo : session.child("TempoMap").child("Tempos").children("Tempo")) {
        const double notesPerMinute = tempo.attribute("npm").as_double();
        const double endNotesPerMinute = tempo.attribute("enpm").as_double(notesPerMinute);
        const double noteType = tempo.attribute("note-type").as_double(4.0);
        const auto superclock = numberIn<std::int64_t>(tempo.attribute("sclock").value());
        const std::string_view place = tempo.attribute("quarters").value();
        const std::size_t colon = place.find(':');
        const auto quarters = numberIn<std::int64_t>(place.substr(0, colon));
        const auto ticks = numberIn<std::int64_t>(colon == place.npos ? "" : place.substr(colon + 1));
        const bool isValid = notesPerMinute > 0.0 && endNotesPerMinute > 0.0 && noteType > 0.0 && superclock &&
                             quarters && ticks && std::isfinite(notesPerMinute) && std::isfinite(endNotesPerMinute);
        if (!isValid)
            throw FileFault("TempoMap", "has a tempo that can't be read");
        const double at = static_cast<double>(*quarters) * TicksPerQuarter + static_cast<double>(*ticks);
        const double seconds = static_cast<double>(*superclock) / SuperclocksPerSecond;
        if (!m_tempos.empty()) {
            Tempo& before = m_tempos.back();
            if (at <= before.ticks || seconds <= before.seconds)
                throw FileFault("TempoMap", "has tempos that don't follow one another");
            // One that continues goes on to the tempo of the next, whatever end it tells.
            if (continues)
                before.growth = std::log(before.secondsPerQuarter / (60.0 / notesPerMinute * noteType / 4.0));
            before.growth /= seconds - before.seconds;
        }
        // Between here and the next tempo the logarithm of the tempo grows evenly with time.
        m_tempos.push_back(
            {at, seconds, 60.0 / notesPerMinute * noteType / 4.0, std::log(endNotesPerMinute / notesPerMinute)});
        continues = tempo.attribute("continuing").as_bool();
    }
    if (!m_tempos.empty())
        m_tempos.back().growth = 0.0;
}

double SessionClock::secondsAtTicks(double ticks) const
{
    if (m_tempos.empty())
        throw FileFault("TempoMap", "is missing, but there are times in beats");
    const auto after = std::ranges::upper_bound(m_tempos, ticks, {}, &Tempo::ticks);
    const Tempo& tempo = after == m_tempos.begin() ? *after : *std::prev(after);
    const double steady = (ticks - tempo.ticks) / TicksPerQuarter * tempo.secondsPerQuarter;
    const double elapsed = tempo.growth == 0.0 ? steady : std::log1p(tempo.growth * steady) / tempo.growth;
    return tempo.seconds + elapsed;
}

double SessionClock::ticksAt(double seconds) const
{
    const auto after = std::ranges::upper_bound(m_tempos, seconds, {}, &Tempo::seconds);
    const Tempo& tempo = after == m_tempos.begin() ? *after : *std::prev(after);
    const double elapsed = seconds - tempo.seconds;
    const double steady = tempo.growth == 0.0 ? elapsed : std::expm1(tempo.growth * elapsed) / tempo.growth;
    return tempo.ticks + steady / tempo.secondsPerQuarter * TicksPerQuarter;
}

double SessionClock::seconds(std::string_view time) const
{
    double result = 0.0;
    if (m_hasUnits) {
        const auto count = numberIn<std::int64_t>(time.empty() ? time : time.substr(1));
        if (!count || (time.front() != 'a' && time.front() != 'b'))
            refuseTime(time);
        result = isMusical(time) ? secondsAtTicks(static_cast<double>(*count))
                                 : static_cast<double>(*count) / SuperclocksPerSecond;
    } else {
        const auto count = numberIn<double>(time);
        if (!count)
            refuseTime(time);
        result = *count / static_cast<double>(m_sampleRate);
    }
    if (!(result >= 0.0 && result <= FurthestTime))
        refuseTime(time);
    return result;
}

std::int64_t SessionClock::samples(std::string_view time) const
{
    if (m_hasUnits && !isMusical(time)) {
        seconds(time);
        const std::int64_t count = *numberIn<std::int64_t>(time.substr(1));
        // Exact for the rates that divide it; others have so many digits that 64 bits don't hold the product.
        if (SuperclocksPerSecond % m_sampleRate == 0)
            return count / (SuperclocksPerSecond / m_sampleRate);
    }
    return samplesAt(seconds(time));
}

std::int64_t SessionClock::lengthInSamples(std::string_view time, std::string_view length) const
{
    if (!isMusical(length))
        return samples(length);
    const double start = seconds(time);
    const double end = secondsAtTicks(ticksAt(start) + ticksAt(seconds(length)));
    if (!(end >= start && end <= FurthestTime))
        refuseTime(length);
    return samplesAt(end - start);
}

std::int64_t SessionClock::samplesAt(double seconds) const
{
    // What is a sample but for rounding is that sample.
    return static_cast<std::int64_t>(std::floor(seconds * static_cast<double>(m_sampleRate) + 1e-6));
}

std::int64_t SessionClock::samplesOf(double seconds) const
{
    return static_cast<std::int64_t>(std::floor(seconds * static_cast<double>(m_sampleRate) + 0.5 + 1e-6));
}

std::string SessionClock::timeText(std::int64_t samples, bool isBefore) const
{
    if (!m_hasUnits)
        return std::to_string(samples - (isBefore ? 1 : 0));
    const std::int64_t whole = samples / m_sampleRate * SuperclocksPerSecond;
    // Rounded up, since Ardour rounds down to the sample.
    const std::int64_t rest = (samples % m_sampleRate * SuperclocksPerSecond + m_sampleRate - 1) / m_sampleRate;
    return std::string("a").append(std::to_string(whole + rest - (isBefore ? 1 : 0)));
}

std::vector<double> SessionClock::bendsBetween(double start, double end) const
{
    std::vector<double> bends;
    const auto add = [&](double seconds) {
        if (seconds > start && seconds < end)
            bends.push_back(seconds);
    };
    for (std::size_t index = 0; index < m_tempos.size(); ++index) {
        const Tempo& tempo = m_tempos[index];
        add(tempo.seconds);
        if (tempo.growth == 0.0)
            continue;
        const double length = m_tempos[index + 1].seconds - tempo.seconds;
        for (int step = 1; step < StepsOfARamp; ++step)
            add(tempo.seconds + length * step / StepsOfARamp);
    }
    return bends;
}

} // namespace standin
