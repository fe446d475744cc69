// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MainView.h"

#include "desktop/shell/ShellLayout.h"
#include "desktop/shell/Shortcuts.h"
#include "gui/look/Text.h"

namespace desktop {

namespace {

using cadrel::gui::Palette;
using cadrel::gui::toColour;

juce::PopupMenu menuOf(const std::vector<MenuItem>& items)
{
    juce::PopupMenu menu;
    for (const MenuItem& item : items) {
        const juce::String text = juce::String::fromUTF8(item.text.c_str());
        if (!item.items.empty() || (item.command == 0 && !item.text.empty())) {
            menu.addSubMenu(text, menuOf(item.items), item.isEnabled);
            continue;
        }
        if (item.command == 0) {
            menu.addSeparator();
            continue;
        }
        juce::PopupMenu::Item entry(text);
        entry.setID(item.command).setEnabled(item.isEnabled).setTicked(item.isTicked);
        entry.shortcutKeyDescription = item.shortcut;
        menu.addItem(entry);
    }
    return menu;
}

} // namespace

/// Dragged by the user; a double click puts it back.
class MainView::Divider : public juce::Component {
public:
    explicit Divider(std::function<void(int tracksHeight)> moved) : Component("Divider"), m_moved(std::move(moved))
    {
        setMouseCursor(juce::MouseCursor::UpDownResizeCursor);
    }

    void paint(juce::Graphics& graphics) override
    {
        graphics.fillAll(toColour(Palette::band));
        graphics.setColour(toColour(Palette::text).withAlpha(0.6F));
        graphics.fillRect(getLocalBounds().withSizeKeepingCentre(36, 1));
    }
    void mouseDown(const juce::MouseEvent& event) override { m_grip = event.y; }
    void mouseDrag(const juce::MouseEvent& event) override
    {
        m_moved(event.getEventRelativeTo(getParentComponent()).y - m_grip - ShellLayout::of(0, 0).tracksTop);
    }
    void mouseDoubleClick(const juce::MouseEvent& /*event*/) override { m_moved(-1); }

private:
    std::function<void(int)> m_moved;
    int m_grip = 0;
};

MainView::MainView()
    : Component("Main View"), m_menuBar(this),
      m_divider(std::make_unique<Divider>([this](int height) { setTracksHeight(height); })),
      m_embedded("Open a project with Ctrl+O, or drop one here.")
{
    m_menuBar.setLookAndFeel(&m_menuBarLook);
    m_tabs.onChosen = [this](std::uint64_t id) {
        if (onTabChosen)
            onTabChosen(id);
    };
    m_tabs.onClosed = [this](std::uint64_t id) {
        if (onTabClosed)
            onTabClosed(id);
    };
    for (juce::Component* const child :
         std::initializer_list<juce::Component*>{&m_menuBar, &m_tabs, m_divider.get(), &m_embedded})
        m_desk.addAndMakeVisible(child);
    addAndMakeVisible(m_desk);
    // A click into anything of ours takes the keyboard out of the module's window.
    addMouseListener(this, true);
    setOpaque(true);
}

MainView::~MainView()
{
    m_menuBar.setModel(nullptr);
    m_menuBar.setLookAndFeel(nullptr);
}

void MainView::setTracks(juce::Component* tracks)
{
    if (tracks == m_tracks)
        return;
    if (m_tracks)
        m_desk.removeChildComponent(m_tracks);
    m_tracks = tracks;
    if (tracks)
        m_desk.addAndMakeVisible(tracks);
    layOut();
}

void MainView::setTracksHeight(int height)
{
    m_wantedTracks = height < 0 ? height : std::max(height, ShellLayout::LeastTracksHeight);
    layOut();
}

void MainView::paint(juce::Graphics& graphics)
{
    graphics.fillAll(toColour(Palette::panel));
}

void MainView::resized()
{
    layOut();
}

void MainView::layOut()
{
    m_desk.setBounds(getLocalBounds());
    const int width = getWidth();
    m_menuBar.setBounds(0, 0, width, ShellLayout::MenuHeight);
    m_tabs.setBounds(0, ShellLayout::MenuHeight, width, ShellLayout::TabHeight);
    const ShellLayout layout = ShellLayout::of(getHeight(), m_wantedTracks);
    if (m_tracks)
        m_tracks->setBounds(0, layout.tracksTop, width, layout.tracksHeight);
    m_divider->setBounds(0, layout.dividerTop, width, ShellLayout::DividerHeight);
    m_embedded.setBounds(0, layout.moduleTop, width, layout.moduleHeight);
}

void MainView::mouseDown(const juce::MouseEvent& /*event*/)
{
    m_embedded.giveKeyboardAway();
}

bool MainView::isInterestedInFileDrag(const juce::StringArray& /*files*/)
{
    return !isBlocked || !isBlocked();
}

void MainView::filesDropped(const juce::StringArray& files, int x, int y)
{
    std::vector<std::filesystem::path> paths;
    for (const juce::String& file : files)
        paths.emplace_back(file.toStdString());
    if (onFilesDropped)
        onFilesDropped(paths, {x, y});
}

juce::StringArray MainView::getMenuBarNames()
{
    juce::StringArray names;
    for (const MenuItem& menu : menusOf({}))
        names.add(menu.text);
    return names;
}

juce::PopupMenu MainView::getMenuForIndex(int index, const juce::String& /*name*/)
{
    const std::vector<MenuItem> menus = menusOf(menuState ? menuState() : MenuState());
    juce::PopupMenu menu = menuOf(menus[static_cast<std::size_t>(index)].items);
    menu.setLookAndFeel(&*m_look);
    return menu;
}

void MainView::menuItemSelected(int command, int /*index*/)
{
    if (command != 0 && onCommand && (!isBlocked || !isBlocked()))
        onCommand(command);
}

void MainView::keepKeyboard()
{
    juce::ComponentPeer* const peer = getPeer();
    const bool isMenuOpen = juce::Component::getNumCurrentlyModalComponents() > 0;
    if (!m_tracks || !peer || isMenuOpen || juce::Component::getCurrentlyFocusedComponent() || m_embedded.hasKeyboard())
        return;
    if (peer->isFocused() || m_screen.hasLostKeyboard(windowOf(peer)))
        m_tracks->grabKeyboardFocus();
}

void MainView::moveKeyboard()
{
    if (!m_embedded.hasKeyboard())
        return m_embedded.takeKeyboard();
    m_embedded.giveKeyboardAway();
    if (m_tracks)
        m_tracks->grabKeyboardFocus();
}

bool MainView::moveByKey(const juce::KeyPress& key)
{
    if (key == juce::KeyPress(juce::KeyPress::F6Key)) {
        moveKeyboard();
        return true;
    }
    const juce::ModifierKeys modifiers = key.getModifiers();
    if (!key.isKeyCode(juce::KeyPress::tabKey) || !modifiers.isCtrlDown() || modifiers.isAltDown())
        return false;
    if (const auto tab = m_tabs.tabAfter(modifiers.isShiftDown() ? -1 : 1); tab && onTabChosen)
        onTabChosen(*tab);
    return true;
}

bool MainView::keyPressed(const juce::KeyPress& key, juce::Component* /*origin*/)
{
    if (isBlocked && isBlocked())
        return false;
    if (key.isKeyCode(juce::KeyPress::F10Key)) {
        // Or the keys that walk through the menus would go to the module's window.
        m_embedded.giveKeyboardAway();
        m_menuBar.showMenu(0);
        return true;
    }
    if (moveByKey(key))
        return true;
    const int command = commandOfKey(key);
    if (command == 0 || !onCommand)
        return false;
    onCommand(command);
    return true;
}

} // namespace desktop
