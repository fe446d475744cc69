// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoTable.h"

#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "gui/video/VideoListTableModel.h"
#include "gui/video/VideoRows.h"

namespace cadrel::gui {

namespace {

constexpr int RowHeight = 30;
/// Names are cut where there is less room for them than they want.
constexpr int SmallestName = 100;

} // namespace

VideoTable::VideoTable(const juce::String& name) : juce::TableListBox(name)
{
    setRowHeight(RowHeight);
    setMultipleSelectionEnabled(true);
    setColour(juce::ListBox::backgroundColourId, juce::Colours::black);
    setAutoSizeMenuOptionShown(false);
    juce::TableHeaderComponent& columns = getHeader();
    for (const VideoColumn& column : VideoColumn::all()) {
        const int smallest = column.id == VideoColumn::Name ? SmallestName : column.width;
        columns.addColumn(translatedText(column.header), column.id, column.width, smallest, column.maximumWidth,
                          juce::TableHeaderComponent::visible);
    }
    columns.setStretchToFitActive(true);
    columns.setPopupMenuActive(false);
}

VideoListTableModel* VideoTable::videoModel() const
{
    return dynamic_cast<VideoListTableModel*>(getModel());
}

juce::String VideoTable::getNameForRow(int row)
{
    juce::String name;
    guardSystem([&] {
        if (const VideoListTableModel* const videos = videoModel())
            name = videos->getSpokenCell(row, VideoColumn::Name);
    });
    return name;
}

juce::Component* VideoTable::refreshComponentForRow(int row, bool isSelected, juce::Component* existing)
{
    juce::Component* const component = juce::TableListBox::refreshComponentForRow(row, isSelected, existing);
    guardSystem([&] {
        const VideoListTableModel* const videos = videoModel();
        for (int index = 0; videos != nullptr && index < component->getNumChildComponents(); ++index) {
            // A row has a component for each column, in their order.
            const int column = getHeader().getColumnIdOfIndex(index, true);
            component->getChildComponent(index)->setTitle(videos->getSpokenCell(row, column));
        }
    });
    return component;
}

bool VideoTable::keyPressed(const juce::KeyPress& key)
{
    bool isUsed = false;
    guardUser([&] {
        if (key == juce::KeyPress(juce::KeyPress::returnKey))
            return;
        VideoListTableModel* const videos = videoModel();
        isUsed = true;
        if (videos != nullptr && key == juce::KeyPress(juce::KeyPress::spaceKey))
            videos->toggleSelected();
        else
            isUsed = juce::TableListBox::keyPressed(key);
    });
    return isUsed;
}

} // namespace cadrel::gui
