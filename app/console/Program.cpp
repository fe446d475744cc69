// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Program.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/PlainStringConverter.h"
#include "app/console/Terminal.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <csignal>
#include <cstdlib>
#include <exception>
#include <iostream>
#include <new>
#include <string>

namespace cadrel::app {

namespace {

enum ExitStatus : int { Done = 0, WorkStopped = 1, WrongUsage = 2 };

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
int runToStatus(const std::function<void(Terminal&)>& work, Terminal& terminal)
{
    try {
        work(terminal);
        return Done;
    } catch (const UsageError& error) {
        terminal.report(error);
        return WrongUsage;
    } catch (const Failure& failure) {
        report(terminal, failure);
    } catch (const Interruption::Requested&) {
        terminal.clearProgress();
    } catch (const util::Result::Type& result) {
        report(terminal, Failure{"internal", "failure " + std::to_string(result), "report it with the files"});
    } catch (const std::exception& exception) {
        report(terminal, Failure{"internal", exception.what(), "report it with the files"});
    }
    return WorkStopped;
}

} // namespace

int runProgram(const std::function<void(Terminal&)>& work)
{
    std::ios::sync_with_stdio(false);
    std::set_new_handler(rememberLackOfMemory);
    std::set_terminate(endForLackOfMemory);
    // Where a file may not grow any further, the write fails instead, and what is half written is removed.
    std::signal(SIGXFSZ, SIG_IGN);
    const PlainStringConverter converter;
    util::StringUtil::setConverter(&converter);
    Terminal terminal;
    const int status = runToStatus(work, terminal);
    util::StringUtil::setConverter(nullptr);
    return status;
}

} // namespace cadrel::app
