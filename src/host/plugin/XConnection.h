// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

struct _XDisplay;

namespace cadrel::host {

/// A connection of our own to the X server, for what JUCE doesn't do. This header names nothing of Xlib's, whose macros and
/// JUCE's names don't go together.
class XConnection {
public:
    using Display = _XDisplay;
    using Window = unsigned long;

    /// To the display of the environment. Without a server it isn't open, and nothing else may be called.
    XConnection();
    XConnection(const XConnection&) = delete;
    XConnection& operator=(const XConnection&) = delete;
    ~XConnection();

    /// Whether it is the display of a connection of this class that is open.
    static bool isOurs(Display* display);

    bool isOpen() const { return m_display != nullptr; }
    /// Null while it isn't open.
    Display* display() const { return m_display; }

    /// Makes the names known to the server that JUCE looks up.
    void introduceNames() const;
    /// See JuceLayer::screenScale().
    double screenScale() const;
    /// Tells a window of ours to look at its place on the screen again.
    void tellPlace(Window window) const;

private:
    Display* m_display;
};

} // namespace cadrel::host
