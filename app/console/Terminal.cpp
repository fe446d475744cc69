// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Terminal.h"

#include "app/console/Printable.h"

#include <cstdlib>
#include <iostream>
#include <string_view>
#include <unistd.h>

namespace cadrel::app {

namespace {

std::string sentence(const Failure& failure)
{
    return toPrintable(failure.problem).text + "; " + toPrintable(failure.remedy).text;
}

std::string environment(const char* name)
{
    const char* value = std::getenv(name);
    return value == nullptr ? std::string() : std::string(value);
}

} // namespace

Terminal::Terminal() : m_showsProgress(isatty(STDERR_FILENO) == 1 && environment("TERM") != "dumb") {}

Terminal::~Terminal()
{
    clearProgress();
}

void Terminal::showProgress(const std::string& what)
{
    if (m_showsProgress) {
        clearProgress();
        std::cerr << toPrintable(what, 70).text << std::flush;
        m_progressShown = true;
    }
}

void Terminal::clearProgress()
{
    if (m_progressShown) {
        std::cerr << "\r\033[K" << std::flush;
        m_progressShown = false;
    }
}

void Terminal::warn(const Failure& failure)
{
    const std::string warning = toPrintable(failure.file).text + ": warning: " + sentence(failure);
    if (m_warnings.insert(warning).second)
        writeLine(warning);
}

void Terminal::report(const Failure& failure)
{
    writeLine(toPrintable(failure.file).text + ": " + sentence(failure));
}

void Terminal::report(const UsageError& error)
{
    writeLine(toPrintable(error.problem).text + "; " + error.remedy);
}

bool Terminal::wantsColour()
{
    return isatty(STDOUT_FILENO) == 1 && environment("NO_COLOR").empty() && environment("TERM") != "dumb";
}

void Terminal::writeLine(const std::string& text)
{
    clearProgress();
    std::cerr << "cadrel: " + text + "\n" << std::flush;
}

} // namespace cadrel::app
