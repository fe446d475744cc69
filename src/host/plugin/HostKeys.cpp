// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/HostKeys.h"

#include "velmark/PlugView.h"

#include <algorithm>
#include <vector>

namespace cadrel::host {

using namespace Velmark;

namespace {

struct NamedKey {
    int32 virtualKey;
    int juceCode;
};

/// Those of JUCE's codes that aren't characters are only known while the program runs.
const std::vector<NamedKey>& namedKeys()
{
    using juce::KeyPress;
    static const std::vector<NamedKey> keys = [] {
        std::vector<NamedKey> all = {
            {VirtualKey::Backspace, KeyPress::backspaceKey},
            {VirtualKey::Tab, KeyPress::tabKey},
            {VirtualKey::Return, KeyPress::returnKey},
            {VirtualKey::Escape, KeyPress::escapeKey},
            {VirtualKey::Insert, KeyPress::insertKey},
            {VirtualKey::Delete, KeyPress::deleteKey},
            {VirtualKey::Home, KeyPress::homeKey},
            {VirtualKey::End, KeyPress::endKey},
            {VirtualKey::PageUp, KeyPress::pageUpKey},
            {VirtualKey::PageDown, KeyPress::pageDownKey},
            {VirtualKey::Left, KeyPress::leftKey},
            {VirtualKey::Right, KeyPress::rightKey},
            {VirtualKey::Up, KeyPress::upKey},
            {VirtualKey::Down, KeyPress::downKey},
        };
        constexpr int32 FunctionKeys = VirtualKey::F12 - VirtualKey::F1 + 1;
        for (int32 index = 0; index < FunctionKeys; ++index)
            all.push_back({VirtualKey::F1 + index, KeyPress::F1Key + index});
        return all;
    }();
    return keys;
}

const NamedKey* find(int32 virtualKey)
{
    const auto found = std::ranges::find(namedKeys(), virtualKey, &NamedKey::virtualKey);
    return found == namedKeys().end() ? nullptr : &*found;
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
    if (const NamedKey* const named = find(virtualKey))
        return juce::KeyPress(named->juceCode, flags, text);
    if (character == 0)
        return std::nullopt;
    return juce::KeyPress(static_cast<int>(character), flags, text);
}

} // namespace cadrel::host
