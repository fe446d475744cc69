// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ListText.h"

#include "standin/ardour/SessionClock.h"
#include "standin/project/FileFault.h"

#include <pugixml.hpp>

#include <charconv>
#include <optional>
#include <string_view>

namespace standin {

namespace {

constexpr std::string_view Blanks = " \t\r\n";

/// Takes the next word from the front of a text; empty after the last.
std::string_view takeWord(std::string_view& text)
{
    text.remove_prefix(std::min(text.find_first_not_of(Blanks), text.size()));
    const std::string_view word = text.substr(0, text.find_first_of(Blanks));
    text.remove_prefix(word.size());
    return word;
}

std::optional<double> numberIn(std::string_view text)
{
    double number = 0.0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    if (text.empty() || error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return number;
}

void appendNumber(std::string& text, double number)
{
    char digits[32];
    const auto [end, error] = std::to_chars(std::begin(digits), std::end(digits), number);
    text.append(std::begin(digits), end);
}

} // namespace

std::vector<ListPoint> readPoints(const pugi::xml_node& list, const SessionClock& clock)
{
    const char* const name = list.attribute("automation-id").value();
    std::string_view text = list.child("events").text().get();
    std::vector<ListPoint> points;
    for (std::string_view time = takeWord(text); !time.empty(); time = takeWord(text)) {
        const std::optional<double> value = numberIn(takeWord(text));
        if (!value)
            throw FileFault(quoted(std::string_view(name)), "has a point without a value");
        const double seconds = clock.seconds(time);
        if (!points.empty() && seconds < points.back().seconds)
            throw FileFault(quoted(std::string_view(name)), "has points that don't follow one another");
        points.push_back({seconds, *value, SessionClock::isMusical(time)});
    }
    return points;
}

void writePoints(pugi::xml_node& list, const std::vector<ListPoint>& points, const SessionClock& clock)
{
    std::string events;
    const auto append = [&](const std::string& time, double value) {
        events.append(time).append(" ");
        appendNumber(events, value);
        events += '\n';
    };
    std::int64_t former = -1;
    for (std::size_t first = 0; first < points.size();) {
        const std::int64_t samples = clock.samplesOf(points[first].seconds);
        std::size_t last = first;
        while (last + 1 < points.size() && clock.samplesOf(points[last + 1].seconds) == samples)
            ++last;
        const bool hasRoom = samples > 0 && (clock.hasUnits() || samples - 1 > former);
        if (points[first].value != points[last].value && hasRoom)
            append(clock.timeText(samples, true), points[first].value);
        former = samples;
        append(clock.timeText(samples), points[last].value);
        first = last + 1;
    }
    list.remove_child("events");
    if (!events.empty())
        list.append_child("events").text().set(events.c_str());
    if (list.attribute("time-domain"))
        list.attribute("time-domain").set_value("AudioTime");
}

} // namespace standin
