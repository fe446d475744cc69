// SPDX-License-Identifier: GPL-3.0-or-later

// `cadrel`: carries a sound project over to a new picture cut. This file decides the exit status; the command line and
// the commands are in the other files.

#include "app/CommandLine.h"
#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/PlainStringConverter.h"
#include "app/console/Terminal.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <exception>
#include <iostream>
#include <new>
#include <optional>
#include <string>

namespace {

using namespace cadrel;
using app::CommandLine;
using app::Failure;
using app::Terminal;
using app::UsageError;

enum ExitStatus : int { Done = 0, WorkStopped = 1, WrongUsage = 2 };

void run(int argc, char** argv, Terminal& terminal)
{
    const std::optional<CommandLine> line = CommandLine::parse(argc, argv);
    if (!line)
        return;
    switch (line->command) {
    case CommandLine::Command::Generate:
        app::runGenerate(line->generate, terminal);
        break;
    case CommandLine::Command::Apply:
        app::runApply(line->apply, terminal);
        break;
    case CommandLine::Command::Notes:
        app::runNotes(line->notes, terminal);
        break;
    case CommandLine::Command::List:
        app::runList(line->list, terminal);
        break;
    case CommandLine::Command::Show:
        app::runShow(line->show, terminal);
        break;
    }
}

/// Every exception ends the program with a message.
int runToStatus(int argc, char** argv, Terminal& terminal)
{
    try {
        run(argc, argv, terminal);
        return Done;
    } catch (const UsageError& error) {
        terminal.report(error);
        return WrongUsage;
    } catch (const Failure& failure) {
        terminal.report(failure);
    } catch (const app::Interruption::Requested&) {
        terminal.clearProgress();
    } catch (const std::bad_alloc&) {
        terminal.report(Failure{"memory", "there is not enough of it", "split the files or close other programs"});
    } catch (const util::Result::Type& result) {
        terminal.report(Failure{"internal", "failure " + std::to_string(result), "report it with the files"});
    } catch (const std::exception& exception) {
        terminal.report(Failure{"internal", exception.what(), "report it with the files"});
    }
    return WorkStopped;
}

} // namespace

int main(int argc, char** argv)
{
    std::ios::sync_with_stdio(false);
    const app::PlainStringConverter converter;
    util::StringUtil::setConverter(&converter);
    Terminal terminal;
    const int status = runToStatus(argc, argv, terminal);
    util::StringUtil::setConverter(nullptr);
    return status;
}
