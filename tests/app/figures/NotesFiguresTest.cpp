// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"
#include "tests/app/figures/EdlFrames.h"
#include "tests/app/figures/NotesReplay.h"
#include "tests/app/figures/PrintedNotes.h"
#include "tests/support/TreePaths.h"

#include <algorithm>
#include <cstddef>
#include <functional>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <regex>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;
using nlohmann::json;

/// Two cuts, and how their notes are taken.
struct Recut {
    std::vector<std::string> oldFiles;
    std::vector<std::string> newFiles;
    std::vector<std::string> options;
    FrameRules rules;
};

Recut example()
{
    return {{treePath("examples/reel3/reel3_v07.edl")},
            {treePath("examples/reel3/reel3_v12.edl")},
            {"--vfx", "VFX_****_v,_comp"},
            {false, std::regex("(VFX_...._v)[0-9]*(_comp)")}};
}

Recut realReel(const TempFolder& cuts)
{
    return {{treePath("tests/data/edl/speed_effects.edl")},
            {cuts / "speed_effects_v2.edl"},
            {"--match", "clip", "--vfx", "Z68*_*****LAY,*"},
            {true, std::regex("(Z68._.....LAY)[0-9]*(.)")}};
}

Recut film(const TempFolder& cuts)
{
    Recut recut{{}, {}, {}, {false, std::regex("()().^")}};
    for (int reel = 1; reel <= 20; ++reel) {
        const std::string number = std::to_string(100 + reel).substr(1).append(".edl");
        recut.oldFiles.push_back(cuts / ("film_v03_r" + number));
        recut.newFiles.push_back(cuts / ("film_v04_r" + number));
    }
    return recut;
}

/// ONE ends five frames earlier, FOUR begins as much earlier, and FIVE is gone.
Recut nudged(const TempFolder& cuts)
{
    const std::string before = cut("001", "ONE", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") +
                               cut("002", "TWO", "10:00:00:00 10:00:03:00", "01:00:10:00 01:00:13:00") +
                               cut("003", "THREE", "10:00:00:00 10:00:01:00", "01:00:13:00 01:00:14:00") +
                               cut("004", "FOUR", "10:00:01:00 10:00:11:00", "01:00:14:00 01:00:24:00") +
                               cut("005", "FIVE", "10:00:00:00 10:00:05:00", "01:00:24:00 01:00:29:00");
    const std::string after = cut("001", "ONE", "10:00:00:00 10:00:09:19", "01:00:00:00 01:00:09:19") +
                              cut("002", "TWO", "10:00:00:00 10:00:03:00", "01:00:09:19 01:00:12:19") +
                              cut("003", "THREE", "10:00:00:00 10:00:01:00", "01:00:12:19 01:00:13:19") +
                              cut("004", "FOUR", "10:00:00:19 10:00:11:00", "01:00:13:19 01:00:24:00");
    return {{cuts.write("nudged_v1.edl", before)},
            {cuts.write("nudged_v2.edl", after)},
            {"--rate", "24 fps"},
            {false, std::regex("()().^")}};
}

class NotesFigures : public testing::Test {
protected:
    void SetUp() override
    {
        const Outcome made =
            runProgram(programPath("make_cuts"), {treePath("tests/data/edl/speed_effects.edl"), cuts.path()});
        ASSERT_EQ(made.status, 0) << made.err;
    }

    std::vector<Recut> all() const { return {example(), realReel(cuts), film(cuts)}; }

    const TempFolder cuts;
};

std::string outputOf(const char* command, const Recut& recut, const char* output, const std::string& file,
                     const std::vector<std::string>& more = {})
{
    const TempFolder folder;
    std::vector<std::string> arguments{command, "--old"};
    arguments.insert(arguments.end(), recut.oldFiles.begin(), recut.oldFiles.end());
    arguments.emplace_back("--new");
    arguments.insert(arguments.end(), recut.newFiles.begin(), recut.newFiles.end());
    arguments.insert(arguments.end(), recut.options.begin(), recut.options.end());
    arguments.insert(arguments.end(), more.begin(), more.end());
    arguments.insert(arguments.end(), {output, folder / file});
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return file.ends_with(".pdf") ? textOfPdf(folder / file) : contentOf(folder / file);
}

json notesOf(const Recut& recut, const std::vector<std::string>& more = {})
{
    return json::parse(outputOf("notes", recut, "-o", "notes.json", more));
}

std::vector<std::string> linesOf(const std::string& text)
{
    std::vector<std::string> lines;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);)
        lines.push_back(line);
    return lines;
}

std::vector<std::string> matchesIn(const std::string& text, const std::regex& pattern, int group = 0)
{
    std::vector<std::string> matches;
    for (std::sregex_iterator match(text.begin(), text.end(), pattern), end; match != end; ++match)
        matches.push_back((*match)[static_cast<std::size_t>(group)]);
    return matches;
}

/// A line a row, so that a difference is easy to see.
std::vector<std::string> joinedRows(const std::vector<std::vector<std::string>>& rows)
{
    std::vector<std::string> lines;
    for (const auto& row : rows) {
        std::string line = std::to_string(lines.size());
        for (const std::string& time : row)
            line.append(" ").append(time);
        lines.push_back(line);
    }
    return lines;
}

/// The first row that is another, or nothing.
std::string differenceOf(const std::vector<std::vector<std::string>>& shown,
                         const std::vector<std::vector<std::string>>& expected)
{
    const std::vector<std::string> a = joinedRows(shown);
    const std::vector<std::string> b = joinedRows(expected);
    const auto [inA, inB] = std::mismatch(a.begin(), a.end(), b.begin(), b.end());
    if (inA == a.end() && inB == b.end())
        return {};
    return (inA == a.end() ? "nothing" : *inA) + " instead of " + (inB == b.end() ? "nothing" : *inB);
}

/// The timecodes of a row; the sign is a part of them, and zero has none.
std::vector<std::string> timesIn(const std::string& line)
{
    static const std::regex Time("[-+]?[0-9]{2}:[0-9]{2}:[0-9]{2}:[0-9]{2}");
    return matchesIn(line, Time);
}

/// The rows that are expected, without the blank that stands for the sign of zero.
std::vector<std::vector<std::string>> rowsOf(const NotesReplay& replay)
{
    std::vector<std::vector<std::string>> rows = replay.rows();
    for (auto& row : rows) {
        for (std::string& time : row)
            time.erase(0, time.starts_with(' ') ? 1 : 0);
    }
    return rows;
}

/// The rows of a text, or of a PDF as text.
std::vector<std::vector<std::string>> rowsInText(const std::string& text)
{
    static const std::regex Row("^\\s*[0-9]*\\s+[0-9]{2}:[0-9]{2}:[0-9]{2}:[0-9]{2}\\s+"
                                "(kept|delete|insert|replace|move|moved|new version)[ ,].*");
    std::vector<std::vector<std::string>> rows;
    for (const std::string& line : linesOf(text)) {
        if (std::regex_match(line, Row))
            rows.push_back(timesIn(line));
    }
    return rows;
}

/// The rows of the tables of steps, without the cell that says what changes.
std::vector<std::vector<std::string>> rowsInPage(const std::string& page)
{
    static const std::regex Cell("<td[^>]*>(.*?)</td>");
    std::vector<std::vector<std::string>> rows;
    for (const std::string& line : linesOf(page)) {
        if (!line.starts_with("<tr id="))
            continue;
        std::string text;
        const std::vector<std::string> cells = matchesIn(line, Cell, 1);
        for (std::size_t cell = 0; cell < cells.size(); ++cell)
            text.append(cell == 3 ? std::string() : cells[cell]).append(" ");
        rows.push_back(timesIn(text));
    }
    return rows;
}

std::vector<int> numbersIn(const std::vector<std::string>& texts)
{
    std::vector<int> numbers;
    for (const std::string& text : texts)
        numbers.push_back(std::stoi(text));
    return numbers;
}

/// What stands in a text between two others.
std::string between(const std::string& text, const std::string& start, const std::string& end)
{
    const std::size_t first = text.find(start);
    return first == std::string::npos ? "" : text.substr(first, text.find(end, first) - first);
}

/// Whether the phrases stand there, one after the other.
testing::AssertionResult stand(const std::vector<std::string>& phrases, const std::string& text)
{
    std::size_t at = 0;
    for (const std::string& phrase : phrases) {
        at = text.find(phrase, at);
        if (at == std::string::npos)
            return testing::AssertionFailure() << phrase << " is missing";
        at += phrase.size();
    }
    return testing::AssertionSuccess();
}

/// The lines of the list of reels: start, lengths, change of length, steps.
std::vector<std::string> reelLines(const json& notes)
{
    std::vector<std::string> lines;
    for (const json& reel : notes.at("reels")) {
        const auto framesOf = [&reel](const char* side) {
            return reel.at(side).is_null() ? 0 : reel.at(side).at("frames").get<int>();
        };
        const auto steps = std::count_if(reel.at("rows").begin(), reel.at("rows").end(),
                                         [](const json& row) { return row.at("row") == "step"; });
        const std::string change = signedTimecode(framesOf("new") - framesOf("old"));
        lines.push_back(reel.at(reel.at("new").is_null() ? "old" : "new").at("start").get<std::string>() + " " +
                        timecodeOfFrames(framesOf("old")) + " " + timecodeOfFrames(framesOf("new")) + " " +
                        (change.front() == ' ' ? change.substr(1) : change) + " " + std::to_string(steps));
    }
    return lines;
}

/// A text with one blank for any number of them, and for the tags of a page.
std::string plain(const std::string& text)
{
    std::string result;
    bool isInTag = false;
    for (const char letter : text) {
        isInTag = isInTag || letter == '<';
        const bool isBlank = isInTag || letter == ' ' || letter == '\n' || letter == '\f';
        if (!isBlank)
            result += letter;
        else if (!result.ends_with(' '))
            result += ' ';
        isInTag = isInTag && letter != '>';
    }
    return result;
}

TEST_F(NotesFigures, AreThoseOfTheFramesOfBothCuts)
{
    std::size_t movesBetweenReels = 0;
    for (const Recut& recut : all()) {
        const EdlFrames oldCut(recut.oldFiles, recut.rules);
        const EdlFrames newCut(recut.newFiles, recut.rules);
        const json notes = notesOf(recut, {"--feet"});

        const NotesReplay replay(notes, oldCut, newCut);

        EXPECT_EQ(replay.faults(), std::vector<std::string>()) << recut.newFiles.front();
        EXPECT_GT(replay.rows().size(), 80U);
        movesBetweenReels += replay.movesBetweenReels();
    }
    EXPECT_GT(movesBetweenReels, 0U);
}

TEST_F(NotesFigures, OfJoinedTrimsAreThoseOfTheFrames)
{
    // Five frames go before TWO and THREE, and come after them; the two have 96.
    for (const auto& [simplify, expected] : {std::pair{"95", 0}, std::pair{"96", 1}}) {
        Recut recut = nudged(cuts);
        recut.options.insert(recut.options.end(), {"--simplify", simplify});
        const json notes = notesOf(recut, {"--feet"});

        const NotesReplay replay(notes, EdlFrames(recut.oldFiles, recut.rules), EdlFrames(recut.newFiles, recut.rules));

        EXPECT_EQ(replay.faults(), std::vector<std::string>()) << simplify;
        EXPECT_EQ(replay.unchanged(), expected);
        EXPECT_EQ(notes.at("totals").at("steps"), expected == 0 ? 3 : 2);
        EXPECT_EQ(notes.at("totals").at("liftedFrames"), 5 * 24 + (expected == 0 ? 5 : 101));
        EXPECT_EQ(notes.at("totals").at("insertedFrames"), expected == 0 ? 5 : 101);
    }
}

TEST_F(NotesFigures, AWrongFigureIsFound)
{
    const Recut recut = example();
    const EdlFrames oldCut(recut.oldFiles, recut.rules);
    const EdlFrames newCut(recut.newFiles, recut.rules);
    const json notes = notesOf(recut, {"--feet"});
    ASSERT_EQ(NotesReplay(notes, oldCut, newCut).faults(), std::vector<std::string>());
    int changed = 0;
    const auto expectFault = [&](const json::json_pointer& place) {
        json wrong = notes;
        wrong[place] = wrong[place].get<int>() + 1;
        ++changed;
        try {
            EXPECT_NE(NotesReplay(wrong, oldCut, newCut).faults().size(), 0U) << place;
        } catch (const std::exception&) {
            // It can't even be carried out.
        }
    };

    for (const char* const key : {"framesBefore", "framesAfter", "keptFrames", "liftedFrames", "insertedFrames",
                                  "doubledFrames", "movedFrames", "steps", "reels"})
        expectFault(json::json_pointer("/totals") / key);
    expectFault(json::json_pointer("/largest/9"));
    expectFault(json::json_pointer("/old/events"));
    expectFault(json::json_pointer("/reels/0/new/frames"));
    const json& rows = notes.at("reels")[0].at("rows");
    for (std::size_t row = 0; row < rows.size(); row += 3) {
        const json::json_pointer place = json::json_pointer("/reels/0/rows") / row;
        for (const char* const key :
             {"frames", "offsetFrames", "deleteFrames", "insertFrames", "moveFrames", "lengthChangeFrames", "number"}) {
            const bool isTheVersionsLength = rows[row].contains("action") && rows[row].at("action") == "relabel" &&
                                             std::string(key) != "offsetFrames" && std::string(key) != "number";
            if (rows[row].contains(key) && !isTheVersionsLength)
                expectFault(place / key);
        }
        if (rows[row].contains("at"))
            expectFault(place / "at" / "frame");
    }
    EXPECT_GT(changed, 120);
}

TEST_F(NotesFigures, ThoseOfHealingAreThoseOfTheChangeEdl)
{
    for (const Recut& recut : all()) {
        const json change = json::parse(outputOf("generate", recut, "--json", "change.json"));
        int events = 0;
        int members = 0;
        int gaps = 0;
        for (const json& event : change.at("events")) {
            const json& parts = event.at("members");
            events += parts.empty() ? 0 : 1;
            members += static_cast<int>(parts.size());
            for (std::size_t part = 1; part < parts.size(); ++part)
                gaps += parts[part - 1].at("dstOut") < parts[part].at("dstIn") ? 1 : 0;
        }

        EXPECT_EQ(notesOf(recut).at("healed"), (json{{"events", events}, {"members", members}, {"bridgedGaps", gaps}}));
        EXPECT_GT(events, 0);
    }
}

TEST_F(NotesFigures, KeepAllThatTheChangeEdlKeeps)
{
    for (const Recut& recut : all()) {
        const EdlFrames newCut(recut.newFiles, recut.rules);
        std::vector<bool> isKept(static_cast<std::size_t>(newCut.length()), false);
        const auto mark = [&isKept](int first, int count) { std::fill_n(isKept.begin() + first, count, true); };
        const json notes = notesOf(recut);
        for (const json& reel : notes.at("reels")) {
            for (const json& row : reel.at("rows")) {
                if (row.at("row") == "kept") {
                    mark(newCut.frameAt(framesOfTimecode(row.at("newIn"))), row.at("frames"));
                    continue;
                }
                if (row.at("row") == "moved")
                    continue;
                for (const json& entry : row.at("changes")) {
                    if (entry.at("kind") == "doubled")
                        mark(newCut.frameAt(framesOfTimecode(entry.at("new").at("in"))), entry.at("frames"));
                }
            }
        }
        const json change = json::parse(outputOf("generate", recut, "--json", "change.json", {"--heal", "none"}));
        int missing = 0;
        for (const json& event : change.at("events")) {
            const int end = framesOfTimecode(event.at("dstOut"));
            for (int timecode = framesOfTimecode(event.at("dstIn")); timecode < end; ++timecode)
                missing += isKept[static_cast<std::size_t>(newCut.frameAt(timecode))] ? 0 : 1;
        }

        EXPECT_EQ(missing, 0) << recut.newFiles.front();
        EXPECT_GT(change.at("events").size(), 80U);
    }
}

TEST_F(NotesFigures, AreTheSameInEveryForm)
{
    std::vector<Recut> recuts = all();
    recuts.push_back(nudged(cuts));
    recuts.back().options.insert(recuts.back().options.end(), {"--simplify", "100"});
    for (const Recut& recut : recuts) {
        const json notes = notesOf(recut);
        const json& totals = notes.at("totals");
        const NotesReplay replay(notes, EdlFrames(recut.oldFiles, recut.rules), EdlFrames(recut.newFiles, recut.rules));
        const std::string text = outputOf("notes", recut, "-o", "notes.txt");
        const std::string page = outputOf("notes", recut, "-o", "notes.html");
        const std::string paper = outputOf("notes", recut, "-o", "notes.pdf");
        const auto time = [&totals](const char* key) { return timecodeOfFrames(totals.at(key).get<int>()); };
        const std::string change =
            signedTimecode(totals.at("framesAfter").get<int>() - totals.at("framesBefore").get<int>());

        EXPECT_EQ(differenceOf(rowsInText(text), rowsOf(replay)), "");
        EXPECT_EQ(differenceOf(rowsInText(paper), rowsOf(replay)), "");
        EXPECT_EQ(differenceOf(rowsInPage(page), rowsOf(replay)), "");

        const std::string end = "Reel 1, ";
        EXPECT_EQ(
            numbersIn(matchesIn(between(text, "The largest changes", end), std::regex("\n +([0-9]+)  [dirm]"), 1)),
            replay.largest());
        EXPECT_EQ(numbersIn(matchesIn(between(paper, "The largest changes", end), std::regex("step ([0-9]+):"), 1)),
                  replay.largest());
        EXPECT_EQ(numbersIn(matchesIn(page, std::regex("<li><a href=\"#s[0-9]+\">step ([0-9]+)</a>"), 1)),
                  replay.largest());

        EXPECT_TRUE(
            stand({time("framesBefore") + " before, " + time("framesAfter") + " after, " + change,
                   time("keptFrames") + " kept, " + time("liftedFrames") + " lifted",
                   time("insertedFrames") + " inserted, " + time("doubledFrames") + " doubled",
                   "Moved " + time("movedFrames"), "Steps " + std::to_string(totals.at("steps").get<int>()) + " in "},
                  plain(text)));
        EXPECT_TRUE(stand({std::to_string(totals.at("steps").get<int>()) + " steps", time("framesBefore") + " before",
                           time("framesAfter") + " after", change + " change of length",
                           time("liftedFrames") + " lifted", time("insertedFrames") + " inserted",
                           time("movedFrames") + " moved", time("doubledFrames") + " doubled"},
                          plain(page)));
        EXPECT_TRUE(stand({time("framesBefore") + " before, " + time("framesAfter") + " after, " + change + ", " +
                               std::to_string(totals.at("steps").get<int>()) + " steps",
                           time("liftedFrames") + " lifted, " + time("insertedFrames") + " inserted, " +
                               time("movedFrames") + " moved, " + time("doubledFrames") + " doubled"},
                          plain(paper)));

        EXPECT_TRUE(stand(replay.phrases(), plain(text)));
        EXPECT_TRUE(stand(replay.phrases(), plain(paper)));
        if (notes.at("reels").size() > 1) {
            for (const std::string& form : {text, page, paper})
                EXPECT_TRUE(stand(reelLines(notes), plain(form)));
        }
    }
}

TEST_F(NotesFigures, OfTheCsvAreThoseOfTheSteps)
{
    for (const Recut& recut : all()) {
        std::vector<std::string> expected;
        const json notes = notesOf(recut);
        for (const json& reel : notes.at("reels")) {
            for (const json& row : reel.at("rows")) {
                if (row.at("row") != "step")
                    continue;
                const auto number = [&row](const char* key) { return row.value(key, 0); };
                const auto time = [&](const char* key) {
                    return number(key) == 0 ? "" : timecodeOfFrames(number(key));
                };
                std::ostringstream line;
                line << number("number") << ',' << reel.at("reel") << ',' << row.at("action").get<std::string>() << ','
                     << row.at("at").at("timecode").get<std::string>() << ','
                     << (row.contains("from") ? row.at("from").at("timecode").get<std::string>() : "") << ','
                     << time("deleteFrames") << ',' << time("insertFrames") << ',' << time("moveFrames") << ','
                     << number("deleteFrames") << ',' << number("insertFrames") << ',' << number("moveFrames") << ','
                     << number("lengthChangeFrames") << ',' << number("offsetFrames") << ',';
                expected.push_back(line.str());
            }
        }
        const std::vector<std::string> lines = linesOf(outputOf("notes", recut, "-o", "notes.csv"));

        ASSERT_EQ(lines.size(), expected.size() + 1);
        for (std::size_t step = 0; step < expected.size(); ++step)
            EXPECT_TRUE(lines[step + 1].starts_with(expected[step])) << lines[step + 1] << "\n" << expected[step];
    }
}

/// With one blank for any number of them and of line ends, and none before a colon or a comma.
std::string joinedWords(const std::string& text)
{
    std::istringstream words(text);
    std::string all;
    for (std::string word; words >> word;)
        all.append(all.empty() || word == ":" || word.starts_with(",") ? "" : " ").append(word);
    return all;
}

/// Where two texts part, with what stands around there; empty where they are the same.
std::string partingOf(const std::string& actual, const std::string& expected)
{
    if (actual == expected)
        return {};
    const auto place =
        std::mismatch(actual.begin(), actual.end(), expected.begin(), expected.end()).first - actual.begin();
    const auto from = static_cast<std::size_t>(std::max<std::ptrdiff_t>(0, place - 60));
    const auto around = [from](const std::string& text) { return text.substr(std::min(from, text.size()), 160); };
    return "is:     " + around(actual) + "\nbut for: " + around(expected);
}

std::string from(const std::string& text, const std::string& start)
{
    const std::size_t first = text.find(start);
    return first == std::string::npos ? "" : text.substr(first);
}

std::string without(const std::string& page, const std::string& start, const std::string& end)
{
    std::string rest;
    std::size_t at = 0;
    for (std::size_t first = 0; (first = page.find(start, at)) != std::string::npos;) {
        rest += page.substr(at, first - at);
        at = page.find(end, first) + end.size();
    }
    return rest + page.substr(at);
}

/// What a person reads on a page, without the picture.
std::string wordsOfPage(std::string page)
{
    for (const auto& [start, end] :
         {std::pair{"<style>", "</style>"}, {"<script>", "</script>"}, {"<svg", "</svg>"}, {"<title>", "</title>"}})
        page = without(page, start, end);
    std::string text = plain(page);
    for (const auto& [entity, letter] : {std::pair{"&lt;", "<"}, {"&gt;", ">"}, {"&quot;", "\""}, {"&amp;", "&"}}) {
        for (std::size_t at = 0; (at = text.find(entity, at)) != std::string::npos; ++at)
            text.replace(at, std::string(entity).size(), letter);
    }
    return joinedWords(text);
}

/// The numbers of the reels of both strips, where there are several.
std::vector<std::string> reelNumbers(const json& notes, const char* side)
{
    std::vector<std::string> numbers;
    const json& reels = notes.at("reels");
    for (std::size_t reel = 0; reels.size() > 1 && reel < reels.size(); ++reel) {
        if (!reels[reel].at(side).is_null())
            numbers.push_back(std::to_string(reel + 1));
    }
    return numbers;
}

/// What is printed between the head of a page and its list of the largest changes.
std::string stripsOfPage(const json& notes, const EdlFrames& oldCut, const EdlFrames& newCut)
{
    const auto times = [](const EdlFrames& cut) {
        const FrameReel& last = cut.reels().back();
        return timecodeOfFrames(cut.reels().front().timecode) + " to " +
               timecodeOfFrames(last.timecode + static_cast<int>(last.frames.size()));
    };
    std::string text = "old cut " + times(oldCut);
    for (const char* const side : {"old", "new"}) {
        for (const std::string& number : reelNumbers(notes, side))
            text += " " + number;
    }
    return text + " new cut " + times(newCut);
}

/// The words of all pages but for their feet and the titles of columns, which are looked at here.
std::string wordsOfPaper(const std::string& paper, const PrintedNotes& printed)
{
    static const std::regex Columns("\\s*step +at +what to do, and what changes +length +offset");
    static const std::regex Continued("Reel ([0-9]+), continued");
    static const std::regex Heading("Reel ([0-9]+), [0-9]{2}:.*");
    std::vector<std::vector<std::string>> pages(1);
    for (std::string line : linesOf(paper)) {
        const bool isNext = line.starts_with('\f');
        if (isNext && line.size() > 1)
            pages.emplace_back();
        line.erase(0, isNext ? 1 : 0);
        if (!joinedWords(line).empty())
            pages.back().push_back(line);
    }
    std::string text;
    std::string reel;
    for (std::size_t page = 0; page < pages.size(); ++page) {
        EXPECT_EQ(joinedWords(pages[page].back()),
                  printed.cuts() + " page " + std::to_string(page + 1) + " of " + std::to_string(pages.size()));
        pages[page].pop_back();
        for (const std::string& line : pages[page]) {
            std::smatch match;
            if (std::regex_match(line, match, Continued)) {
                EXPECT_EQ(match[1], reel);
                continue;
            }
            reel = std::regex_match(line, match, Heading) ? match[1].str() : reel;
            if (!std::regex_match(line, Columns))
                text += line + "\n";
        }
    }
    return joinedWords(text);
}

/// The numbers that stand in a text, in order of their digits.
std::vector<std::string> sortedNumbers(const std::string& text)
{
    std::vector<std::string> numbers = matchesIn(text, std::regex("[0-9]+"));
    std::sort(numbers.begin(), numbers.end());
    return numbers;
}

/// A form of the notes, by the extension of its file; the JSON is that of the same run.
using FormOf = std::function<std::string(const std::string& extension)>;

/// Looks at all that the notes of two cuts print in each form but the table.
void expectPrinted(const FormOf& formOf, const EdlFrames& oldCut, const EdlFrames& newCut)
{
    using Form = PrintedNotes::Form;
    const std::string order = "The steps are carried out";
    const std::string start = "The largest changes";
    const json notes = json::parse(formOf(".json"));
    ASSERT_EQ(NotesReplay(notes, oldCut, newCut).faults(), std::vector<std::string>());
    // What is doubted in broken cuts has tests of its own.
    for (const char* const side : {"old", "new"})
        ASSERT_TRUE(notes.at(side).at("doubts").empty() && notes.at(side).at("unread").empty() &&
                    notes.at(side).at("overlappingFiles").empty());
    const PrintedNotes printed(notes);
    const std::string text = joinedWords(formOf(".txt"));
    const std::string html = formOf(".html");
    const std::string page = wordsOfPage(html);
    const std::string paper = wordsOfPaper(formOf(".pdf"), printed);

    EXPECT_EQ(partingOf(from(text, start), printed.body(Form::Text)), "");
    EXPECT_EQ(partingOf(from(page, start), printed.body(Form::Page)), "");
    EXPECT_EQ(partingOf(from(paper, start), printed.body(Form::Paper)), "");

    const std::string simplified = "--simplify " + std::to_string(notes.at("simplifyFrames").get<int>()) + " ";
    EXPECT_EQ(partingOf(between(text, "Old cut", " Settings "), printed.headBeforeSettings(Form::Text)), "");
    EXPECT_EQ(partingOf(between(text, "Length ", " " + order), printed.headAfterSettings(Form::Text)), "");
    EXPECT_EQ(partingOf(between(page, "Old cut:", " Settings "), printed.headBeforeSettings(Form::Page)), "");
    EXPECT_EQ(partingOf(between(paper, "Old cut:", " Settings "), printed.headBeforeSettings(Form::Paper)), "");
    EXPECT_NE(between(text, " Settings ", "Length ").find(simplified), std::string::npos);
    EXPECT_NE(between(page, " Settings ", order).find(simplified), std::string::npos);
    EXPECT_NE(between(paper, " Settings ", order).find(simplified), std::string::npos);

    const std::string strips = stripsOfPage(notes, oldCut, newCut);
    EXPECT_NE(between(page, order, start).find(strips), std::string::npos) << between(page, order, start);
    EXPECT_EQ(sortedNumbers(between(page, order, start)), sortedNumbers(strips));
    std::vector<std::string> numbers = reelNumbers(notes, "old");
    const std::vector<std::string> newNumbers = reelNumbers(notes, "new");
    numbers.insert(numbers.end(), newNumbers.begin(), newNumbers.end());
    std::sort(numbers.begin(), numbers.end());
    EXPECT_EQ(sortedNumbers(between(paper, order, start)), numbers);

    const std::regex title("data-rows=\"s([0-9]+)[^>]*><title>([^<]*)</title>");
    std::size_t titles = 0;
    for (std::sregex_iterator match(html.begin(), html.end(), title), end; match != end; ++match, ++titles)
        EXPECT_EQ((*match)[2], printed.action(std::stoi((*match)[1])));
    EXPECT_EQ(matchesIn(html, std::regex("<title>")).size(), titles + 1);
    EXPECT_GT(titles, 0U);
}

TEST_F(NotesFigures, EveryWordAndNumberThatIsPrintedIsThatOfAChange)
{
    std::vector<Recut> recuts = all();
    recuts.push_back(nudged(cuts));
    recuts.back().options.insert(recuts.back().options.end(), {"--simplify", "100"});
    for (const Recut& recut : recuts) {
        const auto formOf = [&recut](const std::string& extension) {
            return outputOf("notes", recut, "-o", "notes" + extension, {"--feet"});
        };
        expectPrinted(formOf, EdlFrames(recut.oldFiles, recut.rules), EdlFrames(recut.newFiles, recut.rules));
    }
}

/// The notes of a run that carries the sound of the example over.
std::string soundNotes(const std::string& extension, const std::vector<std::string>& more)
{
    const TempFolder folder;
    const std::string file = folder / ("notes" + extension);
    const Recut recut = example();
    std::vector<std::string> arguments{"apply",    treePath("examples/reel3/reel3.stage"),
                                       "--old",    recut.oldFiles.front(),
                                       "--new",    recut.newFiles.front(),
                                       "--notes",  file,
                                       "--summary"};
    arguments.insert(arguments.end(), recut.options.begin(), recut.options.end());
    arguments.insert(arguments.end(), more.begin(), more.end());
    const Outcome outcome = runCadrel(arguments);
    EXPECT_EQ(outcome.status, 0) << outcome.err;
    return extension == ".pdf" ? textOfPdf(file) : contentOf(file);
}

TEST_F(NotesFigures, EveryWordAndNumberOfTheSoundIsThatOfAChange)
{
    const Recut recut = example();
    // With "cut", the leader falls out where no picture changes.
    for (const std::vector<std::string>& more :
         std::vector<std::vector<std::string>>{{}, {"--feet"}, {"--keep", "cut"}, {"--heal", "none"}}) {
        const auto formOf = [&more](const std::string& extension) { return soundNotes(extension, more); };
        expectPrinted(formOf, EdlFrames(recut.oldFiles, recut.rules), EdlFrames(recut.newFiles, recut.rules));
    }
}

TEST_F(NotesFigures, WholeRowsOfTheSoundInTheCsvAreThoseOfTheChanges)
{
    const std::vector<std::string> expected = PrintedNotes(json::parse(soundNotes(".json", {}))).table();

    const std::vector<std::string> rows = linesOf(soundNotes(".csv", {}));

    ASSERT_EQ(rows.size(), expected.size() + 1);
    for (std::size_t row = 0; row < expected.size(); ++row)
        EXPECT_EQ(rows[row + 1], expected[row] + "\r");
}

TEST_F(NotesFigures, WholeRowsOfTheCsvAreThoseOfTheChanges)
{
    for (const Recut& recut : all()) {
        const std::vector<std::string> expected = PrintedNotes(notesOf(recut)).table();

        std::vector<std::string> rows = linesOf(outputOf("notes", recut, "-o", "notes.csv"));

        ASSERT_EQ(rows.size(), expected.size() + 1);
        for (std::size_t row = 0; row < expected.size(); ++row)
            EXPECT_EQ(rows[row + 1], expected[row] + "\r");
    }
}

} // namespace
