// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/MediaPoolInterface.h"
#include "gui/input/TcInput.h"
#include "gui/video/VideoRows.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <memory>
#include <string>
#include <vector>

namespace cadrel::gui {

/// The model of the table of the new videos. It paints the rows of VideoRows, gives each its tick box and its input, and passes
/// on what the user does with them. The table owns these inputs, as it asks for them anew when it scrolls.
///
/// It listens to the pool, and not to the list: whoever does calls `setMediaPool` after each change. It outlives neither of the
/// two; the table may go before it.
class VideoListTableModel : public juce::TableListBoxModel,
                            public core::MediaPoolInterface::Listener,
                            public TcInput::Listener,
                            public juce::Button::Listener {
public:
    /// Becomes the table's model. The pool may be null.
    VideoListTableModel(juce::TableListBox& table, core::VideoList& list, core::MediaPoolInterface* pool);
    VideoListTableModel(const VideoListTableModel&) = delete;
    VideoListTableModel& operator=(const VideoListTableModel&) = delete;
    ~VideoListTableModel() override;

    /// Shows pool and list as they are now. What is selected and what has the keyboard stays with its video.
    void setMediaPool(core::MediaPoolInterface* pool);
    /// As VideoRows::setTimeOrigin.
    void setTimeOrigin(double seconds);
    /// Uses all selected videos, or stops using them where all are used.
    void toggleSelected();
    /// What a screen reader says.
    juce::String getSpokenCell(int row, int column) const;

    void mediaPoolChanged() override;
    void timecodeChanged(TcInput& input) override;
    void buttonClicked(juce::Button* button) override;

    int getNumRows() override { return static_cast<int>(m_rows.count()); }
    void paintRowBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected) override;
    void paintCell(juce::Graphics& graphics, int row, int column, int width, int height, bool isSelected) override;
    juce::Component* refreshComponentForCell(int row, int column, bool isSelected, juce::Component* existing) override;
    juce::String getCellTooltip(int row, int column) override;
    /// Of the selected rows the first stays selected.
    void sortOrderChanged(int column, bool forwards) override;

private:
    class UseBox;
    class StartInput;

    /// An input in the table.
    struct Cell {
        std::string path;
        int column = 0; ///< 0 where there is none
    };

    /// Carries out what the user has done, and shows what has become of it. Call it in a guard, which tells of a failure.
    template <class Edit>
    void edit(const Edit& change);
    void reload();
    /// Shows the rows after a change of their order.
    void showRows(const std::vector<std::string>& selected);
    juce::SparseSet<int> rowsOf(const std::vector<std::string>& paths) const;
    std::vector<std::string> selectedPaths() const;
    Cell focusedCell() const;
    void keepFocus(const Cell& cell);
    template <class Input>
    std::unique_ptr<Input> takeOrMake(juce::Component*& existing);

    std::shared_ptr<const char> m_life = std::make_shared<const char>();
    juce::Component::SafePointer<juce::TableListBox> m_table;
    core::MediaPoolInterface* m_pool;
    VideoRows m_rows;
};

} // namespace cadrel::gui
