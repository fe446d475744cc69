// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/window/WindowSystem.h"

#include <filesystem>
#include <map>
#include <string>
#include <vector>

// Xlib's macros and other headers don't go together, so that this one names nothing of Xlib's.
struct _XDisplay;

namespace cadrel::tests {

/// The windows of a host in plain Xlib. An X error ends the process, as it does in any program that installs no handler.
class XWindows : public standin::WindowSystem {
public:
    XWindows();
    XWindows(const XWindows&) = delete;
    XWindows& operator=(const XWindows&) = delete;
    ~XWindows() override;

    const char* parentType() const override;
    std::unique_ptr<standin::NativeWindow> createWindow(const std::string& title, std::int32_t width,
                                                        std::int32_t height,
                                                        standin::NativeWindow::Listener& listener) override;

    /// Tells what has come from the server.
    void serve();

    /// The keys that were pressed in a window of the host, by the symbols that they have without another key held.
    const std::vector<unsigned long>& keys() const { return m_keys; }
    /// The same keys as the user reads them, and when they came up: "press plus", "release plus".
    const std::vector<std::string>& keyEvents() const { return m_keyEvents; }
    /// Ends a window behind the back of whoever has it.
    void destroy(standin::NativeWindow& window);
    /// What the screen shows at a place, as 0xRRGGBB.
    unsigned long colourAt(int x, int y) const;
    /// The windows on the screen that lie in no other, menus included.
    int windowCount() const;
    /// What the screen shows of a window of the host, menus included, as the server keeps it: to be compared.
    std::vector<char> pixelsOf(standin::NativeWindow& window) const;
    /// The same as a PNG file. Throws std::runtime_error when it can't be written.
    void writePicture(standin::NativeWindow& window, const std::filesystem::path& file) const;
    /// The same of any window that lies in no other, by its number.
    std::vector<char> pixelsOf(unsigned long window) const;
    void writePicture(unsigned long window, const std::filesystem::path& file) const;

private:
    class XWindow;
    class Picture;

    _XDisplay* m_display;
    std::map<unsigned long, XWindow*> m_windows;
    std::vector<unsigned long> m_keys;
    std::vector<std::string> m_keyEvents;
};

} // namespace cadrel::tests
