// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/sheet/Sheet.h"

#include "gui/guard/Guard.h"
#include "gui/look/Text.h"

#include <algorithm>
#include <utility>

namespace cadrel::gui {

Sheet::Sheet(const juce::String& name) : Component(name)
{
    setVisible(false);
    setWantsKeyboardFocus(true);
    setFocusContainerType(FocusContainerType::keyboardFocusContainer);
}

Sheet::~Sheet()
{
    guardSystem([this] { giveBack(); });
}

void Sheet::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        graphics.fillAll(toColour(Palette::sheetShade));
        graphics.setColour(toColour(Palette::sheet));
        graphics.fillRect(panel());
    });
}

bool Sheet::keyPressed(const juce::KeyPress& key)
{
    const bool isReturn = key == juce::KeyPress(juce::KeyPress::returnKey);
    const bool isEscape = key == juce::KeyPress(juce::KeyPress::escapeKey);
    if (!isReturn && !isEscape)
        return false;
    guardUser([&] { isReturn ? confirm() : cancel(); });
    return true;
}

void Sheet::visibilityChanged()
{
    guardSystem([this] { isVisible() ? showOver() : giveBack(); });
}

void Sheet::showOver()
{
    m_isOver = true;
    const Component* const parent = getParentComponent();
    m_formerFocus = parent && parent->hasKeyboardFocus(true) ? getCurrentlyFocusedComponent() : nullptr;
    if (m_beneath) {
        m_beneath->setEnabled(false);
        m_beneath->setInterceptsMouseClicks(false, false);
    }
    toFront(false);
    if (isShowing())
        takeFocus();
}

void Sheet::takeFocus()
{
    Component* const first = firstFocus();
    (first ? first : this)->grabKeyboardFocus();
}

void Sheet::giveBack()
{
    if (!std::exchange(m_isOver, false) || !m_beneath || isCoveredByAnother())
        return;
    m_beneath->setEnabled(true);
    m_beneath->setInterceptsMouseClicks(true, true);
    // JUCE has passed the focus on to the parent when the sheet had it.
    const Component* const parent = getParentComponent();
    if (parent && parent->hasKeyboardFocus(true) && m_formerFocus && m_formerFocus->isShowing())
        m_formerFocus->grabKeyboardFocus();
}

/// Whether another sheet shows over the same component.
bool Sheet::isCoveredByAnother() const
{
    const Component* const parent = getParentComponent();
    if (!parent)
        return false;
    const auto& siblings = parent->getChildren();
    return std::any_of(siblings.begin(), siblings.end(), [this](const Component* sibling) {
        const auto* const other = dynamic_cast<const Sheet*>(sibling);
        return other && other != this && other->m_isOver && other->m_beneath == m_beneath.getComponent();
    });
}

} // namespace cadrel::gui
