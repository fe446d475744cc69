// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace desktop {

/// The display of the environment, readied for JUCE: it takes for granted that the names of a window manager are known. While this
/// lives, what the X server refuses ends nothing. Made before anything of JUCE's.
class XSession {
public:
    XSession();
    XSession(const XSession&) = delete;
    XSession& operator=(const XSession&) = delete;
    ~XSession();

    bool isThere() const { return m_isThere; }
    /// Physical pixels for each of JUCE's, as for the windows of modules.
    double screenScale() const { return m_scale; }

private:
    bool m_isThere = false;
    double m_scale = 1.0;
};

} // namespace desktop
