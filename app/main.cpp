// SPDX-License-Identifier: GPL-3.0-or-later

// `cadrel`: carries a sound project over to a new picture cut. This file decides the exit status; the command line and
// the commands are in the other files.

#include "app/CommandLine.h"
#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/PlainStringConverter.h"
#include "app/console/Terminal.h"
#include "app/project/ProjectAccess.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <csignal>
#include <cstdlib>
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
    }
}

bool isOutOfMemory = false;

/// Much is caught on the way up and becomes a failure of another kind, so that it has to be known here what was the cause.
void rememberLackOfMemory()
{
    isOutOfMemory = true;
    throw std::bad_alloc();
}

Failure lackOfMemory()
{
    return {"memory", "there is not enough of it", "split the files or close other programs"};
}

/// Reports why the work stopped.
void report(Terminal& terminal, const Failure& failure)
{
    terminal.report(isOutOfMemory ? lackOfMemory() : failure);
}

/// An exception in a place that none may leave ends the program at once. That happens only where memory runs out.
[[noreturn]] void endForLackOfMemory()
{
    if (!isOutOfMemory)
        std::abort();
    Terminal().report(lackOfMemory());
    std::_Exit(WorkStopped);
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
        report(terminal, failure);
    } catch (const app::Interruption::Requested&) {
        terminal.clearProgress();
    } catch (const util::Result::Type& result) {
        report(terminal, Failure{"internal", "failure " + std::to_string(result), "report it with the files"});
    } catch (const std::exception& exception) {
        report(terminal, Failure{"internal", exception.what(), "report it with the files"});
    }
    return WorkStopped;
}

} // namespace

int main(int argc, char** argv)
{
    std::ios::sync_with_stdio(false);
    std::set_new_handler(rememberLackOfMemory);
    std::set_terminate(endForLackOfMemory);
    // Where a file may not grow any further, the write fails instead, and what is half written is removed.
    std::signal(SIGXFSZ, SIG_IGN);
    const app::PlainStringConverter converter;
    util::StringUtil::setConverter(&converter);
    Terminal terminal;
    const int status = runToStatus(argc, argv, terminal);
    util::StringUtil::setConverter(nullptr);
    return status;
}
