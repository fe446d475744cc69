// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/shell/EmbeddedView.h"
#include "desktop/shell/MenuBarLook.h"
#include "desktop/shell/Menus.h"
#include "desktop/shell/TabStrip.h"
#include "desktop/x11/ManagedScreen.h"
#include "gui/look/LookAndFeel.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <functional>
#include <vector>

namespace desktop {

/// All that is in the window: the menus, the tabs of the projects, the tracks of one of them, and the module's window below a divider.
/// Boxes are children of it, over its desk.
class MainView : public juce::Component,
                 public juce::FileDragAndDropTarget,
                 private juce::MenuBarModel,
                 private juce::KeyListener {
public:
    MainView();
    ~MainView() override;

    /// What the menus show, asked whenever one is opened.
    std::function<MenuState()> menuState;
    std::function<void(int command)> onCommand;
    std::function<void(std::uint64_t id)> onTabChosen;
    std::function<void(std::uint64_t id)> onTabClosed;
    /// The place is in this view.
    std::function<void(const std::vector<std::filesystem::path>& files, juce::Point<int> place)> onFilesDropped;
    /// Whether commands are refused now, because a box is open.
    std::function<bool()> isBlocked;

    void setTabs(std::vector<TabStrip::Tab> tabs, std::size_t active) { m_tabs.setTabs(std::move(tabs), active); }
    /// Not owned; null for none.
    void setTracks(juce::Component* tracks);
    EmbeddedView& embedded() { return m_embedded; }
    /// The height to which the user has dragged the tracks; below 0 for none.
    int tracksHeight() const { return m_wantedTracks; }
    void setTracksHeight(int height);
    /// All but the boxes.
    juce::Component& desk() { return m_desk; }

    /// Gives the keyboard to the tracks where the program has it, but nothing in it, as after a menu or a box.
    void keepKeyboard();
    /// Takes the keys that nothing else in the window uses.
    void listenToKeysOf(juce::Component& window) { window.addKeyListener(this); }
    void stopListeningTo(juce::Component& window) { window.removeKeyListener(this); }

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void mouseDown(const juce::MouseEvent& event) override;
    bool isInterestedInFileDrag(const juce::StringArray& files) override;
    void filesDropped(const juce::StringArray& files, int x, int y) override;

private:
    class Divider;

    juce::StringArray getMenuBarNames() override;
    juce::PopupMenu getMenuForIndex(int index, const juce::String& name) override;
    void menuItemSelected(int command, int index) override;
    using juce::Component::keyPressed;
    bool keyPressed(const juce::KeyPress& key, juce::Component* origin) override;
    /// Keys that need no command of the menus.
    bool moveByKey(const juce::KeyPress& key);
    void moveKeyboard();
    void layOut();

    juce::SharedResourcePointer<cadrel::gui::LookAndFeel> m_look;
    juce::Component m_desk;
    MenuBarLook m_menuBarLook;
    juce::MenuBarComponent m_menuBar;
    TabStrip m_tabs;
    std::unique_ptr<Divider> m_divider;
    EmbeddedView m_embedded;
    ManagedScreen m_screen;
    juce::Component* m_tracks = nullptr;
    int m_wantedTracks = -1;
};

} // namespace desktop
