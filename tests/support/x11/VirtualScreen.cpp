// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/x11/VirtualScreen.h"

#include <X11/Xatom.h>
#include <X11/Xlib.h>

#include <csignal>
#include <cstdlib>
#include <stdexcept>

#include <fcntl.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

namespace cadrel::tests {

namespace {

/// Names a server that can't exist, so that nothing reaches one by chance: without a name JUCE takes the first of the machine,
/// which may be that of another test.
bool hideOtherScreens()
{
    return setenv("DISPLAY", ":65000", 1) == 0;
}
const bool areOthersHidden = hideOtherScreens();

/// The server writes its number when it is ready.
std::string readLine(int descriptor)
{
    std::string line;
    char character = 0;
    while (read(descriptor, &character, 1) == 1 && character != '\n')
        line += character;
    return line;
}

} // namespace

NoScreen::NoScreen()
{
    hideOtherScreens();
}

VirtualScreen::VirtualScreen(int width, int height)
{
    int ends[2];
    if (pipe(ends) != 0)
        throw std::runtime_error("no pipe");
    const std::string number = std::to_string(ends[1]);
    const std::string size = std::to_string(width) + "x" + std::to_string(height) + "x24";
    m_server = fork();
    if (m_server == 0) {
        prctl(PR_SET_PDEATHSIG, SIGTERM);
        close(ends[0]);
        const int nothing = open("/dev/null", O_WRONLY);
        dup2(nothing, STDERR_FILENO);
        execlp("Xvfb", "Xvfb", "-displayfd", number.c_str(), "-screen", "0", size.c_str(), "-nolisten", "tcp",
               "-noreset", static_cast<char*>(nullptr));
        _exit(127);
    }
    close(ends[1]);
    const std::string display = readLine(ends[0]);
    close(ends[0]);
    if (m_server < 0 || display.empty())
        throw std::runtime_error("no X server; Xvfb has to be installed");
    setenv("DISPLAY", (":" + display).c_str(), 1);
}

VirtualScreen::~VirtualScreen()
{
    hideOtherScreens();
    kill(m_server, SIGTERM);
    waitpid(m_server, nullptr, 0);
}

void VirtualScreen::introduceNames()
{
    Display* const display = XOpenDisplay(nullptr);
    for (const char* const name :
         {"WM_PROTOCOLS", "WM_TAKE_FOCUS", "WM_DELETE_WINDOW", "_NET_WM_PING", "WM_CHANGE_STATE", "WM_STATE",
          "_NET_WM_WINDOW_TYPE", "_NET_WM_STATE", "_NET_WM_STATE_HIDDEN", "_NET_WM_NAME", "_MOTIF_WM_HINTS"})
        XInternAtom(display, name, False);
    XCloseDisplay(display);
}

void VirtualScreen::setDpi(const std::string& dpi)
{
    Display* const display = XOpenDisplay(nullptr);
    const std::string resources = "Xft.dpi:\t" + dpi + "\n";
    XChangeProperty(display, DefaultRootWindow(display), XA_RESOURCE_MANAGER, XA_STRING, 8, PropModeReplace,
                    reinterpret_cast<const unsigned char*>(resources.data()), static_cast<int>(resources.size()));
    XCloseDisplay(display);
}

} // namespace cadrel::tests
