// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <string>

namespace cadrel::gui {

/// A text on the panel of a sheet: black, in one line, at the left.
class SheetLabel : public juce::Label {
public:
    /// The text is translated. `fontIndex` as gui::getFont takes it.
    SheetLabel(const juce::String& name, const std::wstring& label, int fontIndex);
};

/// A line across the panel of a sheet, without a text.
class SheetRule : public juce::Label {
public:
    explicit SheetRule(const juce::String& name);
};

} // namespace cadrel::gui
