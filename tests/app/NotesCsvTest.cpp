// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"

#include <algorithm>
#include <gtest/gtest.h>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;

/// The cells of a CSV, row by row, as a spreadsheet reads them.
std::vector<std::vector<std::string>> cellsOf(const std::string& csv)
{
    std::vector<std::vector<std::string>> rows{{""}};
    bool isQuoted = false;
    for (std::size_t at = 0; at < csv.size(); ++at) {
        const char letter = csv[at];
        std::string& cell = rows.back().back();
        if (letter == '"' && isQuoted && at + 1 < csv.size() && csv[at + 1] == '"')
            cell += csv[++at];
        else if (letter == '"')
            isQuoted = !isQuoted;
        else if (letter == ',' && !isQuoted)
            rows.back().emplace_back();
        else if (letter == '\n' && !isQuoted)
            rows.push_back({""});
        else if (letter != '\r' || isQuoted)
            cell += letter;
    }
    rows.pop_back();
    return rows;
}

bool isNumber(const std::string& cell)
{
    return cell.find_first_not_of("0123456789", cell.starts_with('-') ? 1 : 0) == std::string::npos;
}

TEST(NotesCsv, NoNameIsAFormulaForASpreadsheet)
{
    // The last four are letters of a Japanese keyboard, which some spreadsheets take for the same.
    for (const std::string start : {"=", "+", "-", "@", "＝", "＋", "－", "＠"}) {
        const std::string formula = start + "SUM(1,\"2\")";
        const std::string roll = start + "1";
        const Cuts film(oldCut(), oldCut() + cut("004", roll, "05:00:00:00 05:00:04:00", "01:00:30:00 01:00:34:00") +
                                      clipName(formula));

        const auto rows = cellsOf(film.file(".csv"));

        ASSERT_EQ(rows.size(), 2U) << formula;
        ASSERT_EQ(rows[1].size(), 25U) << formula;
        // Most of these are no rolls, and are left out.
        EXPECT_TRUE(rows[1][14].empty() || rows[1][14] == "'" + roll) << rows[1][14];
        EXPECT_EQ(rows[1][15], "'" + formula);
        EXPECT_TRUE(rows[1][18].starts_with("'" + formula + ": inserted 00:00:04:00")) << rows[1][18];
        for (const std::string& cell : rows[1])
            EXPECT_TRUE(std::string("=+-@").find(cell.empty() ? 'x' : cell.front()) == std::string::npos ||
                        isNumber(cell))
                << cell;
    }
}

TEST(NotesCsv, AShotThatHasLostFramesCountsThemAsANumber)
{
    const Cuts film(oldCut(), newCut());

    const auto rows = cellsOf(film.file(".csv"));

    ASSERT_EQ(rows.size(), 3U);
    EXPECT_EQ(rows[1][11], "-48");
    EXPECT_EQ(rows[1][12], "-48");
}

/// The cell of a row below a title.
std::string cellOf(const std::vector<std::vector<std::string>>& rows, std::size_t row, const std::string& title)
{
    const auto& titles = rows.at(0);
    return rows.at(row).at(static_cast<std::size_t>(std::find(titles.begin(), titles.end(), title) - titles.begin()));
}

TEST(NotesCsv, AMoveBetweenReelsNamesTheReelOfEachPlace)
{
    const std::string first = cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00");
    const std::string second = cut("002", "A002", "11:00:00:00 11:00:10:00", "02:00:00:00 02:00:10:00");
    const std::string inFirst = cut("003", "A003", "12:00:00:00 12:00:04:00", "01:00:10:00 01:00:14:00");
    const std::string inSecond = cut("003", "A003", "12:00:00:00 12:00:04:00", "02:00:10:00 02:00:14:00");
    const std::vector<std::string> rate{"--rate", "24 fps"};

    const auto toFirst = cellsOf(Cuts(first + second + inSecond, first + inFirst + second).file(".csv", rate));
    const auto toSecond = cellsOf(Cuts(first + inFirst + second, first + second + inSecond).file(".csv", rate));

    ASSERT_EQ(toFirst.size(), 2U);
    EXPECT_EQ(cellOf(toFirst, 1, "action"), "move");
    EXPECT_EQ(cellOf(toFirst, 1, "reel"), "1");
    EXPECT_EQ(cellOf(toFirst, 1, "at_reel"), "1");
    EXPECT_EQ(cellOf(toFirst, 1, "from_reel"), "2");
    ASSERT_EQ(toSecond.size(), 2U);
    EXPECT_EQ(cellOf(toSecond, 1, "action"), "move");
    EXPECT_EQ(cellOf(toSecond, 1, "reel"), "1");
    EXPECT_EQ(cellOf(toSecond, 1, "at_reel"), "2");
    EXPECT_EQ(cellOf(toSecond, 1, "from_reel"), "1");
}

TEST(NotesCsv, AMoveWithinAReelNamesThatReelTwiceAndAnyOtherStepNamesItOnce)
{
    // THREE goes before TWO, and loses its last second.
    const Cuts film(oldCut(), cut("001", "A001", "10:00:00:00 10:00:10:00", "01:00:00:00 01:00:10:00") +
                                  cut("002", "A003", "12:00:00:00 12:00:09:00", "01:00:10:00 01:00:19:00") +
                                  cut("003", "A002", "11:00:00:12 11:00:10:12", "01:00:19:00 01:00:29:00"));

    const auto rows = cellsOf(film.file(".csv"));

    ASSERT_EQ(rows.size(), 3U);
    for (const std::size_t row : {1U, 2U}) {
        EXPECT_EQ(cellOf(rows, row, "at_reel"), "1");
        EXPECT_EQ(cellOf(rows, row, "from_reel"), cellOf(rows, row, "action") == "move" ? "1" : "");
    }
}

TEST(NotesCsv, TheShotOfARowIsThatOfItsLargestChange)
{
    // ONE loses its last second; TWO, which is longer than that, has gone, and NEW of 12 seconds stands there.
    const Cuts film(oldCut(),
                    cut("001", "A001", "10:00:00:00 10:00:09:00", "01:00:00:00 01:00:09:00") + clipName("ONE") +
                        cut("002", "B009", "05:00:00:00 05:00:12:00", "01:00:09:00 01:00:21:00") + clipName("NEW") +
                        cut("003", "A003", "12:00:00:00 12:00:10:00", "01:00:21:00 01:00:31:00") + clipName("THREE"));
    const Cuts shorter(
        oldCut(), cut("001", "A001", "10:00:00:00 10:00:09:00", "01:00:00:00 01:00:09:00") + clipName("ONE") +
                      cut("003", "A003", "12:00:00:00 12:00:10:00", "01:00:09:00 01:00:19:00") + clipName("THREE"));

    const auto rows = cellsOf(film.file(".csv"));
    const auto lifted = cellsOf(shorter.file(".csv"));

    ASSERT_EQ(rows.size(), 2U);
    EXPECT_EQ(cellOf(rows, 1, "kinds"), "tail-trimmed lifted inserted");
    EXPECT_EQ(cellOf(rows, 1, "roll"), "B009");
    EXPECT_EQ(cellOf(rows, 1, "clip"), "NEW");
    EXPECT_EQ(cellOf(rows, 1, "old_in"), "");
    EXPECT_EQ(cellOf(rows, 1, "new_in"), "01:00:09:00");
    EXPECT_EQ(cellOf(rows, 1, "source_in"), "05:00:00:00");
    ASSERT_EQ(lifted.size(), 2U);
    EXPECT_EQ(cellOf(lifted, 1, "kinds"), "tail-trimmed lifted");
    EXPECT_EQ(cellOf(lifted, 1, "roll"), "A002");
    EXPECT_EQ(cellOf(lifted, 1, "clip"), "TWO");
    EXPECT_EQ(cellOf(lifted, 1, "old_in"), "01:00:10:00");
    EXPECT_EQ(cellOf(lifted, 1, "new_in"), "");
    EXPECT_EQ(cellOf(lifted, 1, "source_in"), "");
}

TEST(NotesCsv, EachRowNamesTheFrameRate)
{
    const Cuts film(oldCut(), newCut());

    for (const std::string rate : {"24 fps", "30 fps", "29.97 dfps"}) {
        const auto rows = cellsOf(film.file(".csv", {"--rate", rate, "--overwrite"}));

        ASSERT_EQ(rows.size(), 3U) << rate;
        EXPECT_EQ(cellOf(rows, 1, "rate"), rate);
        EXPECT_EQ(cellOf(rows, 2, "rate"), rate);
        EXPECT_EQ(cellOf(rows, 2, "source_in"), "05:00:00:00");
    }
}

} // namespace
