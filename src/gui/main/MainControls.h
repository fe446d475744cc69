// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/main/ListPanel.h"
#include "gui/main/MainButton.h"
#include "gui/timeline/EventTimeLineView.h"
#include "gui/video/VideoDisplay.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace cadrel::gui {

/// All controls of the window, and what is drawn around them. It lies beneath the sheets, and decides nothing: whoever owns
/// it listens to the buttons and fills the tables.
class MainControls : public juce::Component, public juce::FileDragAndDropTarget {
public:
    /// Which files were dropped on the panel of a list, a core::ListKind.
    using FilesDropped = std::function<void(std::int32_t listKind, const std::vector<std::string>& paths)>;

    explicit MainControls(FilesDropped filesDropped);

    /// `listKind` is a core::ListKind.
    ListPanel& panel(std::int32_t listKind) { return *m_panels.at(static_cast<std::size_t>(listKind)); }
    /// Null for the model of none of the tables.
    ListPanel* panelOf(const EventTableModel& model);
    template <class Action>
    void forEachPanel(const Action& action)
    {
        for (const auto& panel : m_panels)
            action(*panel);
    }

    juce::Button& button(MainButton button) { return *m_buttons.at(static_cast<std::size_t>(button)); }
    const juce::Button& button(MainButton button) const { return *m_buttons.at(static_cast<std::size_t>(button)); }
    /// Throws std::out_of_range for any other.
    MainButton which(const juce::Button& button) const;
    bool isOn(MainButton which) const { return button(which).getToggleState(); }
    /// Nobody hears of it.
    void setOn(MainButton which, bool isOn) { button(which).setToggleState(isOn, juce::dontSendNotification); }
    EventTimeLineView& timeline() { return m_timeline; }
    VideoDisplay& video() { return m_video; }

    /// A dot on the button that generates the list says that the settings have changed since.
    void setListOutdated(bool flag);
    /// What stands in the empty table of a list, in the user's language; empty for nothing.
    void setHint(std::int32_t listKind, const std::wstring& hint);

    void paint(juce::Graphics& graphics) override;
    void paintOverChildren(juce::Graphics& graphics) override;
    void resized() override;
    void enablementChanged() override;

    bool isInterestedInFileDrag(const juce::StringArray& files) override;
    void fileDragEnter(const juce::StringArray& files, int x, int y) override;
    void fileDragMove(const juce::StringArray& files, int x, int y) override;
    void fileDragExit(const juce::StringArray& files) override;
    void filesDropped(const juce::StringArray& files, int x, int y) override;

private:
    static constexpr std::size_t ListCount = 3;

    void makeButtons();
    void addInOrder();
    void setUpToggles();
    void paintPanel(juce::Graphics& graphics, std::int32_t listKind) const;
    bool isBeneathSheet() const;
    void paintDot(juce::Graphics& graphics) const;
    void setDropTarget(std::optional<std::int32_t> listKind);
    std::optional<std::int32_t> listAt(juce::Point<int> place) const;
    MainLayout layout() const { return {getWidth(), getHeight()}; }

    FilesDropped m_filesDropped;
    std::array<std::unique_ptr<ListPanel>, ListCount> m_panels;
    std::array<std::unique_ptr<juce::Button>, MainButtonCount> m_buttons;
    EventTimeLineView m_timeline;
    VideoDisplay m_video;
    bool m_isListOutdated = false;
    std::array<juce::String, ListCount> m_hints;
    std::optional<std::int32_t> m_dropTarget; ///< the list over which files are
};

} // namespace cadrel::gui
