// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventTable.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/table/EventColumn.h"
#include "gui/table/EventTableModel.h"

#include <utility>

namespace cadrel::gui {

namespace {

constexpr int HeaderHeight = 20;
/// Narrow enough for all columns beside it in the smallest window.
constexpr int ScrollBarWidth = 12;
constexpr float FocusCorner = 2.0F;

#if JUCE_LINUX || JUCE_BSD
/// The Menu key, XK_Menu of X11. JUCE has no name for it, and doesn't send it as a pressed key. The upper bits are those of
/// all keys without a letter.
const int MenuKey = (juce::KeyPress::F10Key & ~0xff) | 0x67;
#endif

} // namespace

EventTable::EventTable(const juce::String& name) : juce::TableListBox(name)
{
    setMultipleSelectionEnabled(true);
    setHeaderHeight(HeaderHeight);
    getViewport()->setScrollBarThickness(ScrollBarWidth);
    // The columns can't be resized.
    setAutoSizeMenuOptionShown(false);
    juce::TableHeaderComponent& columns = getHeader();
    for (const EventColumn& column : EventColumn::all()) {
        columns.addColumn(EventTableModel::getColumnName(column.id), column.id, column.width, column.width,
                          column.maximumWidth,
                          juce::TableHeaderComponent::visible | juce::TableHeaderComponent::appearsOnColumnMenu |
                              juce::TableHeaderComponent::sortable);
    }
    columns.setStretchToFitActive(true);
}

EventTableModel* EventTable::eventModel() const
{
    return dynamic_cast<EventTableModel*>(getModel());
}

juce::String EventTable::getNameForRow(int row)
{
    juce::String name;
    guardSystem([&] {
        if (const EventTableModel* const events = eventModel())
            name = events->getSpokenRow(row);
    });
    return name;
}

juce::Component* EventTable::refreshComponentForRow(int row, bool isSelected, juce::Component* existing)
{
    juce::Component* const component = juce::TableListBox::refreshComponentForRow(row, isSelected, existing);
    guardSystem([&] {
        const EventTableModel* const events = eventModel();
        if (events == nullptr)
            return;
        // A row has a component for each column that is shown, in their order.
        for (int index = 0; index < component->getNumChildComponents(); ++index)
            component->getChildComponent(index)->setTitle(
                events->getSpokenCell(row, getHeader().getColumnIdOfIndex(index, true)));
    });
    return component;
}

bool EventTable::keyPressed(const juce::KeyPress& key)
{
    bool isUsed = false;
    // A window that gets the keyboard back may give it to a table that is beneath a sheet by now.
    if (isEnabled())
        guardUser([&] { isUsed = handleKey(key); });
    return isUsed;
}

bool EventTable::handleKey(const juce::KeyPress& key)
{
    EventTableModel* const events = eventModel();
    if (events != nullptr && key == juce::KeyPress(juce::KeyPress::F10Key, juce::ModifierKeys::shiftModifier, 0)) {
        events->openMenu();
        return true;
    }
    if (events != nullptr && key == juce::KeyPress('a', juce::ModifierKeys::commandModifier, 0)) {
        events->selectAll();
        return true;
    }
    return juce::TableListBox::keyPressed(key);
}

bool EventTable::keyStateChanged(bool isKeyDown)
{
    bool isUsed = false;
    guardUser([&] {
        const bool wasDown = std::exchange(m_wasMenuKeyDown, isMenuKeyDown());
        EventTableModel* const events = eventModel();
        if (m_wasMenuKeyDown && !wasDown && events != nullptr) {
            isUsed = true;
            events->openMenu();
            return;
        }
        isUsed = juce::TableListBox::keyStateChanged(isKeyDown);
    });
    return isUsed;
}

void EventTable::focusGained(FocusChangeType cause)
{
    guardSystem([&] {
        juce::TableListBox::focusGained(cause);
        readMenuKey();
        repaint();
    });
}

void EventTable::focusLost(FocusChangeType cause)
{
    guardSystem([&] {
        juce::TableListBox::focusLost(cause);
        repaint();
    });
}

void EventTable::paintOverChildren(juce::Graphics& graphics)
{
    guardSystem([&] {
        juce::TableListBox::paintOverChildren(graphics);
        if (hasKeyboardFocus(false))
            drawFocusRing(graphics, getLocalBounds().toFloat(), FocusCorner);
        if (!isEnabled())
            graphics.fillAll(findColour(backgroundColourId).withAlpha(DisabledOpacity));
    });
}

void EventTable::enablementChanged()
{
    guardSystem([&] {
        juce::TableListBox::enablementChanged();
        repaint();
    });
}

void EventTable::menuClosed()
{
    readMenuKey();
}

bool EventTable::isMenuKeyDown() const
{
#if JUCE_LINUX || JUCE_BSD
    return getPeer() != nullptr && juce::KeyPress::isKeyCurrentlyDown(MenuKey);
#else
    return false;
#endif
}

} // namespace cadrel::gui
