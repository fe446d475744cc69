// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

/// A dialog that lies over the window as a half-transparent sheet with a panel. While it shows, what is beneath it can't be
/// used and the Tab key stays within it; Return confirms it and Escape closes it. It has the keyboard focus as long as it
/// shows, and gives it back to what had it before.
class Sheet : public juce::Component {
public:
    explicit Sheet(const juce::String& name);
    ~Sheet() override;

    /// What can't be used while the sheet shows. Whether it is enabled and takes clicks is then up to the sheets alone.
    /// It isn't owned, and may go before the sheet.
    void setBeneath(juce::Component* component) { m_beneath = component; }

    /// Gives the keyboard to the first control of the sheet that wants it.
    void takeFocus();

    void paint(juce::Graphics& graphics) override;
    bool keyPressed(const juce::KeyPress& key) override;
    void visibilityChanged() override;

protected:
    /// What Return does.
    virtual void confirm() = 0;
    /// What Escape does. It leaves the sheet hidden.
    virtual void cancel() = 0;
    /// The opaque part of the sheet.
    virtual juce::Rectangle<int> panel() const = 0;
    /// What has the focus when the sheet comes up; the sheet itself when this is null.
    virtual juce::Component* firstFocus() { return nullptr; }

private:
    void showOver();
    void giveBack();
    bool isCoveredByAnother() const;

    juce::Component::SafePointer<juce::Component> m_beneath;
    juce::Component::SafePointer<juce::Component> m_formerFocus;
    bool m_isOver = false; ///< what is beneath was made unusable
};

} // namespace cadrel::gui
