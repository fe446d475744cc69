// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

namespace cadrel::gui {

class VideoListTableModel;

/// The table of the new videos, with the columns of VideoColumn. A VideoListTableModel fills it. The space bar uses the selected
/// videos or stops using them, and Return goes on to the sheet. Rows and
/// cells have their texts for screen readers.
class VideoTable : public juce::TableListBox {
public:
    explicit VideoTable(const juce::String& name);

    juce::Component* refreshComponentForRow(int row, bool isSelected, juce::Component* existing) override;
    bool keyPressed(const juce::KeyPress& key) override;

private:
    /// Null without a VideoListTableModel.
    VideoListTableModel* videoModel() const;
    juce::String getNameForRow(int row) override;
};

} // namespace cadrel::gui
