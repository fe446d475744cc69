// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/Film.h"
#include "tests/app/NotesOfCuts.h"
#include "tests/app/ProgramRun.h"

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
        ASSERT_EQ(rows[1].size(), 21U) << formula;
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

} // namespace
