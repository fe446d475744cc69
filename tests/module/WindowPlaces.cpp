// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/module/WindowPlaces.h"

#include "tests/support/TreePaths.h"

#include <array>
#include <cstdio>
#include <sstream>
#include <stdexcept>

namespace cadrel::tests {

namespace {

/// Of a program without arguments.
std::string outputOf(const std::string& program)
{
    std::string command = "exec '";
    command += program;
    command += '\'';
    std::string output;
    FILE* const pipe = popen(command.c_str(), "r");
    if (!pipe)
        throw std::runtime_error("can't start " + command);
    std::array<char, 4096> part{};
    while (const std::size_t size = std::fread(part.data(), 1, part.size(), pipe))
        output.append(part.data(), size);
    if (pclose(pipe) != 0)
        throw std::runtime_error(command + " has failed");
    return output;
}

} // namespace

WindowPlaces::WindowPlaces()
{
    std::istringstream lines(outputOf(programPath("window_places")));
    Control control;
    while (std::getline(lines, control.sheet, '\t') && std::getline(lines, control.name, '\t') &&
           std::getline(lines, control.text, '\t')) {
        Place& place = control.place;
        lines >> place.x >> place.y >> place.width >> place.height;
        // The end of the line; the next one may begin with a tab.
        lines.get();
        m_controls.push_back(control);
    }
}

WindowPlaces::Place WindowPlaces::at(const std::string& sheet, const std::string& name, const std::string& text) const
{
    const Control* found = nullptr;
    for (const Control& control : m_controls) {
        if (control.sheet != sheet || control.name != name || (!text.empty() && control.text != text))
            continue;
        if (found)
            throw std::runtime_error("two controls are " + sheet + " " + name + " " + text);
        found = &control;
    }
    if (!found)
        throw std::runtime_error("no control is " + sheet + " " + name + " " + text);
    return found->place;
}

std::vector<WindowPlaces::Place> WindowPlaces::all() const
{
    std::vector<Place> places;
    for (const Control& control : m_controls)
        places.push_back(control.place);
    return places;
}

} // namespace cadrel::tests
