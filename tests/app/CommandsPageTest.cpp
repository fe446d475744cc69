// SPDX-License-Identifier: GPL-3.0-or-later

// The page that describes the commands and their options.

#include "tests/app/ProgramRun.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <map>
#include <regex>
#include <set>
#include <sstream>
#include <string>
#include <vector>

namespace {

using namespace cadrel::tests;

using Names = std::set<std::string>;
using OptionsByCommand = std::map<std::string, Names>;

std::string helpOf(const std::vector<std::string>& command)
{
    std::vector<std::string> arguments = command;
    arguments.emplace_back("--help");
    return runCadrel(arguments).out;
}

void addMatches(const std::string& text, const char* pattern, Names& names)
{
    const std::regex expression(pattern);
    for (std::sregex_iterator match(text.begin(), text.end(), expression), end; match != end; ++match)
        names.insert((*match)[1]);
}

/// The commands that `cadrel --help` lists.
Names listedCommands()
{
    std::istringstream lines(helpOf({}));
    Names commands;
    bool isInList = false;
    for (std::string line; std::getline(lines, line);) {
        if (isInList && line.empty())
            break;
        if (isInList)
            addMatches(line, "^  ([a-z]+)", commands);
        isInList = isInList || line == "Subcommands:";
    }
    return commands;
}

/// The options that the help of a command lists, but for the help itself. Their names are what a line begins with:
/// "  -o,--output FILE", "  --b-roll,--no-b-roll{false} ...".
Names listedOptions(const std::string& command)
{
    std::istringstream lines(helpOf({command}));
    Names options;
    for (std::string line; std::getline(lines, line);) {
        if (line.starts_with("  -"))
            addMatches(line.substr(2, line.find(' ', 2) - 2), "(--?[a-z][a-z-]*)", options);
    }
    options.erase("-h");
    options.erase("--help");
    return options;
}

/// The options in the tables of the page, by the heading above them. Their names stand in the first column.
OptionsByCommand explainedOptions()
{
    std::istringstream lines(contentOf(treePath("docs/commands.md")));
    OptionsByCommand options;
    std::string command;
    for (std::string line; std::getline(lines, line);) {
        if (line.starts_with("## cadrel ")) {
            command = line.substr(std::string("## cadrel ").size());
            options[command];
        } else if (line.starts_with("| `-")) {
            addMatches(line.substr(0, line.find(" | ")), "`(--?[a-z][a-z-]*)", options[command]);
        }
    }
    return options;
}

TEST(CommandsPage, HasAHeadingForEveryCommand)
{
    Names headings;
    for (const auto& [command, options] : explainedOptions())
        headings.insert(command);

    EXPECT_EQ(headings, listedCommands());
    EXPECT_TRUE(headings.contains("apply"));
}

TEST(CommandsPage, ExplainsTheOptionsThatHelpListsAndNoOthers)
{
    for (const auto& [command, options] : explainedOptions()) {
        EXPECT_EQ(options, listedOptions(command)) << command;
        const bool hasNone = command == "open";
        EXPECT_TRUE(hasNone || options.contains("--rate") || options.contains("--track")) << command;
    }
}

} // namespace
