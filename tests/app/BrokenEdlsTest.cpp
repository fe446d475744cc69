// SPDX-License-Identifier: GPL-3.0-or-later

// The real EDLs of the tree, each broken in one place: no event is lost without a word.

#include "tests/app/ProgramRun.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include <algorithm>
#include <array>
#include <cstddef>
#include <functional>
#include <iterator>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using namespace std::string_literals;
using nlohmann::json;

using Lines = std::vector<std::string>;

constexpr std::array Files{"tests/data/edl/ISSUE_14_conform_edl_issue_03.edl",
                           "tests/data/edl/ISSUE_19_unusual01.edl",
                           "tests/data/edl/cdl_example01.edl",
                           "tests/data/edl/dissolve_test_4.edl",
                           "tests/data/edl/screening_example.edl",
                           "tests/data/edl/speed_effects.edl",
                           "tests/data/edl/wipe_test.edl",
                           "examples/reel3/reel3_v07.edl"};

Lines linesOf(const std::string& text)
{
    Lines lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line.ends_with('\r') ? line.substr(0, line.size() - 1) : line);
    return lines;
}

std::string textOf(const Lines& lines)
{
    std::string text;
    for (const std::string& line : lines)
        text += line + "\n";
    return text;
}

Lines columnsOf(const std::string& line)
{
    std::istringstream stream(line);
    Lines columns;
    for (std::string column; stream >> column;)
        columns.push_back(column);
    return columns;
}

std::string lineOf(const Lines& columns, const std::string& separator = "  ")
{
    std::string line;
    for (const std::string& column : columns)
        line += (line.empty() ? "" : separator) + column;
    return line;
}

/// Changes a text whose event stands in the line of that index.
using Break = std::function<std::string(Lines lines, std::size_t event)>;

/// Changes the event's line alone, by its columns.
template <class Change>
Break inColumns(Change change)
{
    return [change](Lines lines, std::size_t event) {
        Lines columns = columnsOf(lines[event]);
        change(columns);
        lines[event] = lineOf(columns);
        return textOf(lines);
    };
}

/// Changes the event's line alone.
template <class Change>
Break inLine(Change change)
{
    return [change](Lines lines, std::size_t event) {
        lines[event] = change(lines[event]);
        return textOf(lines);
    };
}

Break without(std::size_t column)
{
    return inColumns(
        [column](Lines& columns) { columns.erase(columns.begin() + static_cast<std::ptrdiff_t>(column)); });
}

/// `column` counts from the last one.
Break withoutLast(std::size_t column)
{
    return inColumns(
        [column](Lines& columns) { columns.erase(columns.end() - 1 - static_cast<std::ptrdiff_t>(column)); });
}

Break after(const std::string& bytes)
{
    return inLine([bytes](const std::string& line) { return bytes + line; });
}

std::string replaced(std::string text, char from, char to)
{
    std::replace(text.begin(), text.end(), from, to);
    return text;
}

std::string utf16(const std::string& text)
{
    std::string units = "\xFF\xFE";
    for (const char character : text)
        units += {character, '\0'};
    return units;
}

struct Row {
    const char* what;
    Break breakText;
};

const std::array Breaks{
    Row{"the number is missing", without(0)},
    Row{"the roll is missing", without(1)},
    Row{"the channel is missing", without(2)},
    Row{"the transition is missing", without(3)},
    Row{"SRC IN is missing", withoutLast(3)},
    Row{"SRC OUT is missing", withoutLast(2)},
    Row{"DST IN is missing", withoutLast(1)},
    Row{"DST OUT is missing", withoutLast(0)},
    Row{"the number begins with a letter",
        inLine([](const std::string& line) { return std::string("O").append(line.substr(1)); })},
    Row{"the number ends in a letter", inColumns([](Lines& columns) { columns[0] += "x"; })},
    Row{"SRC IN ends in a letter", inColumns([](Lines& columns) { (columns.end() - 4)->back() = 'x'; })},
    Row{"DST OUT has another separator", inColumns([](Lines& columns) { columns.back()[2] = '.'; })},
    Row{"DST IN has a blank for a separator", inColumns([](Lines& columns) { (*(columns.end() - 2))[5] = ' '; })},
    Row{"the blank between two timecodes is missing", inColumns([](Lines& columns) {
            const std::string last = columns.back();
            columns.pop_back();
            columns.back() += last;
        })},
    Row{"the blank after the number is missing", inColumns([](Lines& columns) {
            columns[1] = columns[0] + columns[1];
            columns.erase(columns.begin());
        })},
    Row{"tabs stand for blanks", inLine([](const std::string& line) { return replaced(line, ' ', '\t'); })},
    Row{"commas stand for blanks", inLine([](const std::string& line) { return lineOf(columnsOf(line), ","); })},
    Row{"the line end before the event is missing",
        [](Lines lines, std::size_t event) {
            lines[event - 1] += lines[event];
            lines.erase(lines.begin() + static_cast<std::ptrdiff_t>(event));
            return textOf(lines);
        }},
    Row{"the line end after the event is missing",
        [](Lines lines, std::size_t event) {
            if (event + 1 < lines.size()) {
                lines[event] += lines[event + 1];
                lines.erase(lines.begin() + static_cast<std::ptrdiff_t>(event) + 1);
            }
            return textOf(lines);
        }},
    Row{"the line is broken in two", inLine([](std::string line) {
            line[line.size() / 2] = '\n';
            return line;
        })},
    Row{"a zero byte stands before it", after("\0"s)},
    Row{"a byte order mark stands before it", after("\xEF\xBB\xBF")},
    Row{"a no-break space stands before it", after("\xC2\xA0")},
    Row{"a quote stands before it", after("\"")},
    Row{"it is a dissolve without a duration", inColumns([](Lines& columns) {
            columns[3] = "D";
            columns.erase(columns.begin() + 4, columns.end() - 4);
        })},
    Row{"the transition is unknown", inColumns([](Lines& columns) { columns[3] = "K"; })},
    Row{"the first line ends with CR",
        [](Lines lines, std::size_t) {
            lines.front() += "\r";
            return textOf(lines);
        }},
    Row{"all is UTF-16", [](const Lines& lines, std::size_t) { return utf16(textOf(lines)); }},
    Row{"the file ends within the event",
        [](Lines lines, std::size_t event) {
            lines.resize(event + 1);
            lines.back().resize(lines.back().size() / 2);
            return textOf(lines);
        }},
};

/// What the program says of a file.
struct Listing {
    Listing(const std::string& file, const std::string& givenRate)
    {
        std::vector<std::string> arguments{"list", file, "--json", "-"};
        if (!givenRate.empty())
            arguments.insert(arguments.end(), {"--rate", givenRate});
        const Outcome outcome = runCadrel(arguments);
        error = outcome.err;
        if (outcome.status == 0)
            read(json::parse(outcome.out));
        else
            countUnreadIn(outcome.err);
    }

    std::multiset<std::string> valid;
    std::multiset<std::string> told; ///< of the valid events: their clip names, and which are reversed
    std::size_t flawed = 0;
    std::size_t unread = 0;
    std::string rate;
    std::string error;

private:
    void read(const json& document)
    {
        rate = document.at("rate");
        unread = document.at("unread").size();
        for (const json& event : document.at("events")) {
            if (!event.at("flaws").empty()) {
                ++flawed;
                continue;
            }
            std::string text = std::to_string(event.at("number").get<int>());
            for (const char* const key : {"roll", "srcIn", "srcOut", "dstIn", "dstOut"})
                text.append(" ").append(event.at(key).get<std::string>());
            valid.insert(text);
            const auto clip = event.at("clip").get<std::string>();
            const auto speed = event.at("speed").get<double>();
            if (!clip.empty())
                told.insert(text + " is " + clip);
            if (speed < 0)
                told.insert(text + " is reversed");
        }
    }

    /// "line 3 ... isn't read: ..., and 4 more lines like that"
    void countUnreadIn(const std::string& text)
    {
        unread = text.find("isn't read") == std::string::npos ? 0 : 1;
        std::smatch match;
        if (std::regex_search(text, match, std::regex("and ([0-9]+) more line")))
            unread += std::stoul(match[1]);
    }
};

class BrokenEdls : public testing::TestWithParam<const char*> {};

TEST_P(BrokenEdls, LoseNoEventWithoutAWord)
{
    const TempFolder folder;
    const Lines lines = linesOf(contentOf(treePath(GetParam())));
    const Listing whole(folder.write("whole.edl", textOf(lines)), {});
    ASSERT_EQ(whole.unread, 0U);
    std::vector<std::size_t> events;
    for (std::size_t line = 0; line < lines.size(); ++line) {
        if (!lines[line].empty() && lines[line].front() >= '0' && lines[line].front() <= '9')
            events.push_back(line);
    }
    ASSERT_GE(events.size(), 3U);

    std::size_t losses = 0;
    for (const auto& [what, breakText] : Breaks) {
        SCOPED_TRACE(what);
        // The file that ends within an event has all others.
        const bool isLast = what == "the file ends within the event"s;
        const std::size_t event = isLast ? events.back() : events[events.size() / 2];
        const std::string text = breakText(lines, event);

        const Listing broken(folder.write("broken.edl", text), whole.rate);

        EXPECT_NE(text, textOf(lines));
        std::vector<std::string> missing;
        std::set_difference(whole.valid.begin(), whole.valid.end(), broken.valid.begin(), broken.valid.end(),
                            std::back_inserter(missing));
        const std::size_t told = broken.unread + (broken.flawed > whole.flawed ? broken.flawed - whole.flawed : 0);
        EXPECT_LE(missing.size(), told) << (missing.empty() ? "" : missing.front()) << "\n" << broken.error;
        losses += missing.empty() ? 0U : 1U;
        const auto firstOnlyIn = [](const auto& some, const auto& others) {
            std::vector<std::string> only;
            std::set_difference(some.begin(), some.end(), others.begin(), others.end(), std::back_inserter(only));
            return only.empty() ? std::string() : only.front();
        };
        EXPECT_EQ(firstOnlyIn(broken.told, whole.told), "") << "an event has what is told of another";
        if (told == 0) {
            EXPECT_EQ(firstOnlyIn(whole.told, broken.told), "") << "is lost without a word";
        }
    }
    EXPECT_GE(losses, Breaks.size() / 2) << "most breaks cost an event";
}

TEST(BrokenEdlsTable, HoldsAtLeast200)
{
    EXPECT_GE(Files.size() * Breaks.size(), 200U);
}

INSTANTIATE_TEST_SUITE_P(OfTheTree, BrokenEdls, testing::ValuesIn(Files));

} // namespace
