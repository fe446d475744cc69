// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/KeyTable.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>

namespace desktop::tests {
namespace {

TEST(KeyTable, HasTheRowsOfTheManualInTheirOrder)
{
    std::istringstream page(cadrel::tests::contentOf(cadrel::tests::treePath("docs/window.md")));
    std::string rows;
    for (std::string line; std::getline(page, line);) {
        if (line.starts_with("| ") && line != "| key | what it does |")
            rows.append(line).append("\n");
    }
    std::string expected;
    for (const KeyRow& row : keyTable())
        expected.append("| ").append(row.keys).append(" | ").append(row.meaning).append(" |\n");
    EXPECT_EQ(rows, expected);
}

TEST(KeyTable, IsALineForEachRowInTheHelp)
{
    const std::string text = keyTableText();
    EXPECT_TRUE(text.starts_with("Up, Down  go through the events"));
    EXPECT_NE(text.find("\nF6  moves the keyboard"), std::string::npos);
    EXPECT_FALSE(text.ends_with("\n"));
}

} // namespace
} // namespace desktop::tests
