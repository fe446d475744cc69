// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Terminal.h"

#include "app/console/Printable.h"

#include <algorithm>
#include <cstdlib>
#include <iostream>
#include <string_view>
#include <sys/ioctl.h>
#include <unistd.h>

namespace cadrel::app {

namespace {

/// Where the width of the terminal isn't known, and on a wider one.
constexpr std::size_t LongestLine = 79;

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

std::size_t Terminal::lineLength()
{
    winsize size{};
    const bool isKnown = ioctl(STDERR_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 1;
    return isKnown ? std::min<std::size_t>(size.ws_col - 1U, LongestLine) : LongestLine;
}

void Terminal::showProgress(const std::string& what)
{
    if (m_showsProgress) {
        clearProgress();
        std::cerr << toPrintable(what, lineLength()).text << std::flush;
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
