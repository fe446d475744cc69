// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/HostKeys.h"

#include "velmark/PlugView.h"

#include <X11/keysym.h>

#include <algorithm>
#include <vector>

namespace cadrel::host {

using namespace Velmark;

namespace {

struct NamedKey {
    int32 virtualKey;
    int juceCode;
    unsigned long symbol;
};

/// Those of JUCE's codes that aren't characters are only known while the program runs.
const std::vector<NamedKey>& namedKeys()
{
    using juce::KeyPress;
    static const std::vector<NamedKey> keys = [] {
        std::vector<NamedKey> all = {
            {VirtualKey::Backspace, KeyPress::backspaceKey, XK_BackSpace},
            {VirtualKey::Tab, KeyPress::tabKey, XK_Tab},
            {VirtualKey::Return, KeyPress::returnKey, XK_Return},
            {VirtualKey::Escape, KeyPress::escapeKey, XK_Escape},
            {VirtualKey::Insert, KeyPress::insertKey, XK_Insert},
            {VirtualKey::Delete, KeyPress::deleteKey, XK_Delete},
            {VirtualKey::Home, KeyPress::homeKey, XK_Home},
            {VirtualKey::End, KeyPress::endKey, XK_End},
            {VirtualKey::PageUp, KeyPress::pageUpKey, XK_Page_Up},
            {VirtualKey::PageDown, KeyPress::pageDownKey, XK_Page_Down},
            {VirtualKey::Left, KeyPress::leftKey, XK_Left},
            {VirtualKey::Right, KeyPress::rightKey, XK_Right},
            {VirtualKey::Up, KeyPress::upKey, XK_Up},
            {VirtualKey::Down, KeyPress::downKey, XK_Down},
        };
        constexpr int32 FunctionKeys = VirtualKey::F12 - VirtualKey::F1 + 1;
        for (int32 index = 0; index < FunctionKeys; ++index)
            all.push_back({VirtualKey::F1 + index, KeyPress::F1Key + index, static_cast<unsigned long>(XK_F1 + index)});
        return all;
    }();
    return keys;
}

template <class Value>
const NamedKey* find(Value NamedKey::*field, Value value)
{
    const auto found = std::ranges::find(namedKeys(), value, field);
    return found == namedKeys().end() ? nullptr : &*found;
}

/// Latin-1 characters are their own symbols, all others are marked.
unsigned long symbolOf(juce::juce_wchar character)
{
    constexpr juce::juce_wchar LastOfLatin1 = 0xff;
    constexpr unsigned long UnicodeMark = 0x01000000;
    const auto value = static_cast<unsigned long>(character);
    return character <= LastOfLatin1 ? value : value | UnicodeMark;
}

} // namespace

std::optional<juce::KeyPress> toKeyPress(char16_t character, int32 virtualKey, int32 modifiers)
{
    int flags = 0;
    if ((modifiers & KeyModifier::Shift) != 0)
        flags |= juce::ModifierKeys::shiftModifier;
    if ((modifiers & KeyModifier::Control) != 0)
        flags |= juce::ModifierKeys::ctrlModifier;
    if ((modifiers & KeyModifier::Alt) != 0)
        flags |= juce::ModifierKeys::altModifier;
    const auto text = static_cast<juce::juce_wchar>(character);
    if (const NamedKey* const named = find(&NamedKey::virtualKey, virtualKey))
        return juce::KeyPress(named->juceCode, flags, text);
    if (character == 0)
        return std::nullopt;
    return juce::KeyPress(static_cast<int>(character), flags, text);
}

XKey toXKey(const juce::KeyPress& key)
{
    const juce::ModifierKeys modifiers = key.getModifiers();
    const NamedKey* const named = find(&NamedKey::juceCode, key.getKeyCode());
    return {named ? named->symbol : symbolOf(static_cast<juce::juce_wchar>(key.getKeyCode())), modifiers.isShiftDown(),
            modifiers.isCtrlDown(), modifiers.isAltDown()};
}

} // namespace cadrel::host
