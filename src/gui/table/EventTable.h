// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

class EventTableModel;

/// The table of an event list, with the columns of EventColumn and several rows selected. An EventTableModel fills it. Return
/// and a double click edit, Delete deletes, the Menu key and Shift+F10 open the menu, and Control+A selects all rows without
/// scrolling. Rows and cells have their texts for screen readers.
class EventTable : public juce::TableListBox {
public:
    explicit EventTable(const juce::String& name);

    juce::Component* refreshComponentForRow(int row, bool isSelected, juce::Component* existing) override;
    bool keyPressed(const juce::KeyPress& key) override;
    bool keyStateChanged(bool isKeyDown) override;
    void focusGained(FocusChangeType cause) override;
    void focusLost(FocusChangeType cause) override;
    void paintOverChildren(juce::Graphics& graphics) override;
    void enablementChanged() override;
    /// The menu is closed. A key may have gone up while it had the keys.
    void menuClosed();

private:
    /// Null without an EventTableModel.
    EventTableModel* eventModel() const;
    juce::String getNameForRow(int row) override;
    bool handleKey(const juce::KeyPress& key);
    bool isMenuKeyDown() const;
    void readMenuKey() { m_wasMenuKeyDown = isMenuKeyDown(); }

    bool m_wasMenuKeyDown = false;
};

} // namespace cadrel::gui
