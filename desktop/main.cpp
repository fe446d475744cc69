// SPDX-License-Identifier: GPL-3.0-or-later

// `cadrel-desktop [PROJECT...]`: the stand-in host with windows, into which it loads Cadrel. `cadrel open` starts it.

#include "desktop/shell/DesktopProgram.h"
#include "desktop/x11/XSession.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <filesystem>
#include <iostream>
#include <vector>

int main(int argc, char** argv)
{
    const desktop::XSession session;
    if (!session.isThere()) {
        std::cerr << "cadrel: there is no display; start it on a desktop, or set DISPLAY\n";
        return 1;
    }
    const std::vector<std::filesystem::path> projects(argv + 1, argv + argc);
    const juce::ScopedJuceInitialiser_GUI juce;
    juce::Desktop::getInstance().setGlobalScaleFactor(static_cast<float>(session.screenScale()));
    desktop::DesktopProgram(desktop::ModulePlaces::besideProgram(desktop::runningProgram())).run(projects);
    return 0;
}
