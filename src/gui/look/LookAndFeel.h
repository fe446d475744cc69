// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/look/TextShortening.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// How the controls of the window look. While it lives it is the default of the process, so that popups and tooltips have it
/// too. Each window holds one `juce::SharedResourcePointer<LookAndFeel>`: all share one look and feel, which goes with the
/// last of them.
class LookAndFeel : public juce::LookAndFeel_V2 {
public:
    LookAndFeel();
    ~LookAndFeel() override;

    /// The bundled family, for its own name and for the default sans serif.
    juce::Typeface::Ptr getTypefaceForFont(const juce::Font& font) override;

private:
    void setColours();

    juce::Typeface::Ptr m_regular;
    juce::Typeface::Ptr m_bold;
    juce::SharedResourcePointer<TextShortening> m_shortening; ///< keeps what drawText remembers
};

} // namespace cadrel::gui
