// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EventTable.h"

#include "app/console/Printable.h"
#include "app/edl/ScreenTimecode.h"
#include "app/edl/TransitionFault.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cstdio>
#include <ostream>
#include <vector>

namespace cadrel::app {

using core::EventBase;
using core::EventFlaw;
using core::Timecode;
using core::TransitionType;

namespace {

/// Longer names are cut, so that one of them doesn't push the timecodes off the screen.
constexpr std::size_t MostCharactersOfAName = 40;
constexpr std::size_t MostCharactersOfANumber = 24;

constexpr std::string_view Red = "\033[31m";
constexpr std::string_view Green = "\033[32m";
constexpr std::string_view Plain = "\033[0m";

bool hasUsableTimecodes(const EventBase& event)
{
    return !event.hasFlaw(EventFlaw::TimecodeInvalid) && !event.hasFlaw(EventFlaw::TimecodeUninitialized);
}

std::string stateOf(const EventBase& event)
{
    if (event.isValid())
        return transitionFaultOf(event).empty() ? "ok" : "length";
    if (event.hasFormatFlaw())
        return "format";
    return hasUsableTimecodes(event) ? "range" : "timecode";
}

/// What is wrong with an event, a line each.
std::vector<std::string> faultsOf(const EventBase& event)
{
    std::vector<std::string> faults = util::StringUtil::split(event.flawsText(), '\n', true);
    std::string ofTransition = transitionFaultOf(event);
    if (!ofTransition.empty()) {
        ofTransition.front() = 'T';
        faults.push_back(ofTransition + '.');
    }
    return faults;
}

std::string padded(std::int64_t number)
{
    const std::string digits = std::to_string(number);
    return digits.size() < 3 ? std::string(3 - digits.size(), '0') + digits : digits;
}

std::string transitionOf(const EventBase& event)
{
    if (event.transitionType() == TransitionType::Cut)
        return "C";
    return (event.transitionType() == TransitionType::Dissolve ? "D " : "W ") + padded(event.transitionDuration());
}

std::string timecodeOf(const Timecode& timecode)
{
    return timecode.isInitialized() ? onScreen(timecode.toString(), Timecode::framerate()) : "--:--:--:--";
}

std::string speedOf(const EventBase& event)
{
    if (!hasUsableTimecodes(event) || event.hasFlaw(EventFlaw::TimecodeRangeInvalid))
        return "--";
    std::array<char, MostCharactersOfANumber> text{};
    std::snprintf(text.data(), text.size(), "%.2f", event.signedSpeed());
    return text.data();
}

} // namespace

const EventTable::Row EventTable::Titles{"state",  "event",   "roll",   "clip",    "file", "trans",
                                         "src in", "src out", "dst in", "dst out", "speed"};

EventTable::EventTable(Events events, bool colour) : m_events(events), m_colour(colour)
{
    std::transform(Titles.begin(), Titles.end(), m_columnWidths.begin(),
                   [](const std::string& title) { return title.size(); });
    Widths widths{};
    for (const auto& event : m_events) {
        rowOf(*event, widths);
        for (std::size_t column = 0; column < ColumnCount; ++column)
            m_columnWidths[column] = std::max(m_columnWidths[column], widths[column]);
    }
}

void EventTable::print(std::ostream& out) const
{
    Widths widths{};
    std::transform(Titles.begin(), Titles.end(), widths.begin(), [](const std::string& title) { return title.size(); });
    out << lineOf(Titles, widths) << '\n';
    for (const auto& event : m_events) {
        const Row row = rowOf(*event, widths);
        const std::string line = lineOf(row, widths);
        const std::vector<std::string> faults = faultsOf(*event);
        if (!m_colour) {
            out << line << '\n';
        } else {
            const std::size_t state = row.front().size();
            out << (faults.empty() ? Green : Red) << std::string_view(line).substr(0, state) << Plain
                << std::string_view(line).substr(state) << '\n';
        }
        for (const std::string& fault : faults)
            out << "          " << toPrintable(fault).text << '\n';
    }
}

EventTable::Row EventTable::rowOf(const EventBase& event, Widths& widths)
{
    const PrintableText roll = toPrintable(event.rollName(), MostCharactersOfAName);
    const PrintableText clip = toPrintable(event.clipName(), MostCharactersOfAName);
    const PrintableText file = toPrintable(event.edlFileName(), MostCharactersOfAName);
    Row row{stateOf(event),
            padded(event.eventNumber()),
            roll.text,
            clip.text,
            file.text,
            transitionOf(event),
            timecodeOf(event.srcIn()),
            timecodeOf(event.srcOut()),
            timecodeOf(event.dstIn()),
            timecodeOf(event.dstOut()),
            speedOf(event)};
    std::transform(row.begin(), row.end(), widths.begin(), [](const std::string& cell) { return cell.size(); });
    widths[2] = roll.width;
    widths[3] = clip.width;
    widths[4] = file.width;
    return row;
}

std::string EventTable::lineOf(const Row& row, const Widths& widths) const
{
    std::string line;
    for (std::size_t column = 0; column < ColumnCount; ++column) {
        const std::string fill(m_columnWidths[column] - widths[column], ' ');
        const bool last = column + 1 == ColumnCount;
        line += last ? fill + row[column] : row[column] + fill + "  ";
    }
    return line;
}

} // namespace cadrel::app
