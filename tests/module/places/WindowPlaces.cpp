// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainGui.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <iostream>

// Prints where everything stands in Cadrel's window in its smallest size, for tests that use the window as it is loaded into a
// host. A line holds, with tabs between them, the name of the sheet, none for the window itself; the name of the control; the text
// by which the user knows it; and its left, top, width and height in pixels of the window. The box for one event stands at the
// corner of the window here.

namespace {

juce::String textOf(const juce::Component& component)
{
    if (component.getTitle().isNotEmpty())
        return component.getTitle();
    if (const auto* const button = dynamic_cast<const juce::Button*>(&component))
        return button->getButtonText();
    return {};
}

class Places {
public:
    explicit Places(juce::Component& window) : m_window(window) {}

    void print() const
    {
        for (juce::Component* const child : m_window.getChildren()) {
            print(child->getName(), {}, {}, *child, child->getLocalBounds());
            printAllIn(*child, child->getName());
        }
    }

private:
    void printAllIn(const juce::Component& parent, const juce::String& sheet) const
    {
        for (juce::Component* const child : parent.getChildren()) {
            const juce::String& name = child->getName();
            if (auto* const table = dynamic_cast<juce::TableListBox*>(child))
                printTable(*table, sheet);
            else if (name.isEmpty())
                printAllIn(*child, sheet);
            if (name.isNotEmpty())
                print(sheet, name, textOf(*child), *child, child->getLocalBounds());
        }
    }
    /// The titles of the columns, and the first row.
    void printTable(juce::TableListBox& table, const juce::String& sheet) const
    {
        juce::TableHeaderComponent& header = table.getHeader();
        for (int index = 0; index < header.getNumColumns(true); ++index)
            print(sheet, table.getName() + " Column", header.getColumnName(header.getColumnIdOfIndex(index, true)),
                  header, header.getColumnPosition(index));
        print(sheet, table.getName() + " Row", {}, table,
              {0, header.getHeight(), table.getWidth(), table.getRowHeight()});
    }
    void print(const juce::String& sheet, const juce::String& name, const juce::String& text,
               const juce::Component& component, const juce::Rectangle<int>& bounds) const
    {
        const juce::Rectangle<int> place = m_window.getLocalArea(&component, bounds);
        std::cout << sheet << '\t' << name << '\t' << text << '\t' << place.toString() << '\n';
    }

    juce::Component& m_window;
};

} // namespace

int main()
{
    const juce::ScopedJuceInitialiser_GUI juce;
    cadrel::gui::MainGui window;
    Places(window).print();
    return 0;
}
