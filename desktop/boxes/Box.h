// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/sheet/Sheet.h"

#include <juce_gui_basics/juce_gui_basics.h>

namespace desktop {

/// A box in front of the user: a panel with a title in the middle of the window, over everything else.
class Box : public cadrel::gui::Sheet {
public:
    Box(const juce::String& name, const juce::String& title);

    /// To be told over and over what has the keyboard in the window, or null. Where that isn't one of the box's controls, as after
    /// a click beside them, the control gets it back that had it last.
    void keepFocus(juce::Component* focused);

    /// Whether the user is done with it.
    bool isDone() const { return m_isDone; }

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void parentSizeChanged() override;
    void parentHierarchyChanged() override;

protected:
    static constexpr int Margin = 18;
    static constexpr int ButtonHeight = 26;

    void setDone() { m_isDone = true; }
    /// Of the panel, when the window has room for it.
    void setPanelSize(int width, int height);
    juce::Rectangle<int> panel() const override;
    /// What is left of the panel below the title.
    juce::Rectangle<int> content() const;
    /// Places the buttons at the right end of the area, the last one outermost.
    static void layOutButtons(juce::Rectangle<int> area, const std::vector<juce::Button*>& buttons);
    static int buttonWidth(const juce::Button& button);
    virtual void layOut() = 0;

private:
    void fillParent();

    juce::String m_title;
    int m_panelWidth = 480;
    int m_panelHeight = 200;
    bool m_isDone = false;
    SafePointer<Component> m_lastFocus; ///< among the controls
};

} // namespace desktop
