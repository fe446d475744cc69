// SPDX-License-Identifier: GPL-3.0-or-later

// `cadrel`: carries a sound project over to a new picture cut. The command line and the commands are in the other files.

#include "app/CommandLine.h"
#include "app/console/Program.h"
#include "app/console/Terminal.h"
#include "app/project/ProjectAccess.h"

#include <optional>

namespace {

using namespace cadrel;
using app::CommandLine;
using app::Terminal;

void run(int argc, char** argv, Terminal& terminal)
{
    std::optional<CommandLine> line = CommandLine::parse(argc, argv);
    if (!line)
        return;
    switch (line->command) {
    case CommandLine::Command::Generate:
        app::runGenerate(line->generate, terminal);
        break;
    case CommandLine::Command::Apply:
        line->apply.projectFile = app::projectFileIn(line->apply.projectFile);
        app::runApply(line->apply, terminal);
        break;
    case CommandLine::Command::Notes:
        app::runNotes(line->notes, terminal);
        break;
    case CommandLine::Command::List:
        app::runList(line->list, terminal);
        break;
    case CommandLine::Command::Show:
        line->show.projectFile = app::projectFileIn(line->show.projectFile);
        app::runShow(line->show, terminal);
        break;
    case CommandLine::Command::Open:
        app::runOpen(line->open);
    }
}

} // namespace

int main(int argc, char** argv)
{
    return app::runProgram([argc, argv](Terminal& terminal) { run(argc, argv, terminal); });
}
