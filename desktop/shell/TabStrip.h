// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

namespace desktop {

/// A tab for each open project. A dot before the name marks unsaved work; the cross closes the project.
class TabStrip : public juce::Component, public juce::SettableTooltipClient {
public:
    struct Tab {
        std::uint64_t id = 0; ///< of the document
        std::string name;     ///< UTF-8
        std::string path;
        bool isUnsaved = false;

        bool operator==(const Tab&) const = default;
    };

    static constexpr int Height = 28;

    TabStrip() : Component("Tabs") {}

    // They are told the tab's id.
    std::function<void(std::uint64_t)> onChosen;
    std::function<void(std::uint64_t)> onClosed;

    void setTabs(std::vector<Tab> tabs, std::size_t active);
    /// The tab so many places after the active one, round and round. Nothing without tabs.
    std::optional<std::uint64_t> tabAfter(int steps) const;
    /// Of a tab, and of its cross.
    juce::Rectangle<int> tabArea(std::size_t index) const;
    juce::Rectangle<int> crossArea(std::size_t index) const;

    void paint(juce::Graphics& graphics) override;
    void mouseDown(const juce::MouseEvent& event) override;
    void mouseMove(const juce::MouseEvent& event) override;
    void mouseExit(const juce::MouseEvent& event) override;

private:
    int tabWidth() const;
    /// The number of tabs for none.
    std::size_t tabAt(juce::Point<int> place) const;

    std::vector<Tab> m_tabs;
    std::size_t m_active = 0;
    juce::Point<int> m_mouse{-1, -1};
};

} // namespace desktop
