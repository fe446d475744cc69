// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::host {

/// Whoever has one of these can use JUCE's windows: the first starts this module's JUCE, and the last ends it. JUCE has no
/// message loop of its own here; the host's idle calls drive it through serve(). For the main thread.
class JuceLayer {
public:
    JuceLayer();
    JuceLayer(const JuceLayer&) = delete;
    JuceLayer& operator=(const JuceLayer&) = delete;
    ~JuceLayer();

    /// Lets JUCE deal with what has come: each descriptor that JUCE listens to is served once, which deals with all events of
    /// its windows that are there, the timers that are due and one message. False for a call from within another, which does
    /// nothing. Throws what the components throw; what is left is dealt with at the next call.
    static bool serve();

    /// Physical pixels for each of JUCE's, as the user has set them for all programs: "Xft.dpi" of the X server's resources
    /// by 96, in steps of a quarter, and 1 to 4.
    static double screenScale();
};

} // namespace cadrel::host
