// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/FlashTextButton.h"
#include "gui/look/PictureButton.h"
#include "gui/look/Text.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/WindowOnScreen.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

using namespace cadrel::gui;
using cadrel::tests::expectPicture;
using cadrel::tests::WindowOnScreen;

namespace {

using Symbol = ButtonPicture::Symbol;

/// What a button looks like in one of its states, by the name of the state.
struct ButtonState {
    const char* name;
    bool isOn;
    bool isDown;
    bool isEnabled;
};
constexpr ButtonState ButtonStates[] = {
    {"normal", false, false, true},
    {"pressed", false, true, true},
    {"on", true, false, true},
    {"disabled", false, false, false},
};

/// Controls in rows, on the ground that they have in the window.
class Sheet : public juce::Component {
public:
    explicit Sheet(juce::Colour ground) : m_ground(ground) { setOpaque(true); }

    void paint(juce::Graphics& graphics) override { graphics.fillAll(m_ground); }

    template <class Control, class... Arguments>
    Control& add(juce::Rectangle<int> place, Arguments&&... arguments)
    {
        auto control = std::make_unique<Control>(std::forward<Arguments>(arguments)...);
        Control& added = *control;
        added.setBounds(place);
        addAndMakeVisible(added);
        m_controls.push_back(std::move(control));
        return added;
    }

private:
    juce::Colour m_ground;
    std::vector<std::unique_ptr<juce::Component>> m_controls;
};

void put(juce::Button& button, const ButtonState& state)
{
    button.setClickingTogglesState(state.isOn);
    button.setToggleState(state.isOn, juce::dontSendNotification);
    button.setEnabled(state.isEnabled);
    if (state.isDown)
        button.setState(juce::Button::buttonDown);
}

class ControlPicturesTest : public testing::Test {
protected:
    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
};

} // namespace

TEST_F(ControlPicturesTest, TextButtons)
{
    Sheet sheet(toColour(Palette::band));
    sheet.setSize(560, 90);
    int x = 10;
    for (const ButtonState& state : ButtonStates) {
        put(sheet.add<juce::TextButton>({x, 10, 80, 24}, "Generate"), state);
        auto& preview = sheet.add<FlashTextButton>({x, 50, 90, 24}, "Preview");
        preview.setColour(juce::TextButton::buttonOnColourId, toColour(Palette::orange));
        put(preview, state);
        x += 110;
    }
    put(sheet.add<juce::TextButton>({x, 10, 40, 24}, "SRC"), ButtonStates[2]);
    put(sheet.add<juce::TextButton>({x + 38, 10, 40, 24}, "DST"), ButtonStates[0]);
    put(sheet.add<juce::TextButton>({x, 50, 78, 24}, "A text far too long"), ButtonStates[0]);

    expectPicture(sheet, "text-buttons");
}

TEST_F(ControlPicturesTest, PictureButtons)
{
    Sheet sheet(toColour(Palette::band));
    sheet.setSize(560, 150);
    int y = 10;
    for (const ButtonState& state : ButtonStates) {
        if (state.isOn)
            continue;
        int x = 10;
        for (const Symbol symbol : {Symbol::Plus, Symbol::Bin, Symbol::Cog, Symbol::Floppy, Symbol::In, Symbol::Out}) {
            put(sheet.add<PictureButton>({x, y, 32, 24}, "", symbol), state);
            x += 45;
        }
        put(sheet.add<PictureButton>({x, y, 80, 24}, "", Symbol::Folder), state);
        x += 100;
        put(sheet.add<PictureButton>({x, y + 2, 10, 8}, "", Symbol::Up), state);
        put(sheet.add<PictureButton>({x, y + 12, 10, 8}, "", Symbol::Down), state);
        put(sheet.add<PictureButton>({x + 40, y - 5, 57, 43}, "", Symbol::Cog), state);
        y += 46;
    }

    expectPicture(sheet, "picture-buttons");
}

TEST_F(ControlPicturesTest, Toggles)
{
    Sheet sheet(toColour(Palette::sheet));
    sheet.setSize(440, 70);
    int x = 10;
    for (const bool isEnabled : {true, false}) {
        int y = 10;
        for (const bool isOn : {false, true}) {
            auto& toggle = sheet.add<juce::ToggleButton>({x, y, 210, 20}, "Create Destination Markers");
            toggle.setColour(juce::ToggleButton::textColourId, juce::Colour(0xff2e352f));
            toggle.setToggleState(isOn, juce::dontSendNotification);
            toggle.setEnabled(isEnabled);
            y += 26;
        }
        x += 215;
    }

    expectPicture(sheet, "toggles");
}

TEST_F(ControlPicturesTest, Labels)
{
    Sheet sheet(toColour(Palette::panel));
    sheet.setSize(330, 100);
    const auto label = [&](juce::Rectangle<int> place, const char* text) -> juce::Label& {
        auto& added = sheet.add<juce::Label>(place, "", text);
        added.setFont(getFont(1));
        added.setColour(juce::Label::textColourId, toColour(Palette::text));
        return added;
    };
    label({10, 10, 100, 24}, "Destination");
    label({120, 10, 80, 24}, "A label that is far too long");
    label({220, 10, 100, 24}, "Disabled").setEnabled(false);
    label({10, 40, 100, 24}, "Centred").setJustificationType(juce::Justification::centred);
    label({120, 40, 80, 24}, "0123456789").setJustificationType(juce::Justification::centredRight);
    auto& framed = label({220, 40, 100, 24}, "Framed");
    framed.setColour(juce::Label::outlineColourId, toColour(Palette::frame));
    framed.setColour(juce::Label::backgroundColourId, juce::Colours::black);
    label({10, 70, 100, 24}, "").setText(juce::String::fromUTF8("Zurücksetzen"), juce::dontSendNotification);

    expectPicture(sheet, "labels");
}

TEST_F(ControlPicturesTest, Inputs)
{
    Sheet sheet(toColour(Palette::sheet));
    sheet.setSize(420, 120);
    int x = 10;
    for (const bool isEnabled : {true, false}) {
        auto& box = sheet.add<juce::ComboBox>({x, 10, 180, 22});
        box.addItem("Gaps without Inserts", 1);
        box.setSelectedId(1, juce::dontSendNotification);
        box.setEnabled(isEnabled);
        auto& editor = sheet.add<juce::TextEditor>({x, 42, 180, 22});
        editor.setFont(getFont(0));
        editor.setText("VFX_****_v,_comp", false);
        editor.setEnabled(isEnabled);
        x += 200;
    }
    auto& pressed = sheet.add<juce::ComboBox>({10, 80, 180, 22});
    pressed.addItem("A choice that is too long for its box", 1);
    pressed.setSelectedId(1, juce::dontSendNotification);

    expectPicture(sheet, "inputs");
}

TEST_F(ControlPicturesTest, ProgressBars)
{
    Sheet sheet(toColour(Palette::sheet));
    sheet.setSize(220, 70);
    double none = 0.0;
    double most = 0.7;
    auto& first = sheet.add<juce::ProgressBar>({10, 10, 200, 20}, none);
    first.setTextToDisplay("Reading");
    auto& second = sheet.add<juce::ProgressBar>({10, 40, 200, 20}, most);
    second.setTextToDisplay("70 %");

    expectPicture(sheet, "progress-bars");
}

TEST_F(ControlPicturesTest, TableHeaders)
{
    juce::TableHeaderComponent header;
    header.addColumn("State", 1, 50);
    header.addColumn("ID", 2, 40);
    header.addColumn("Clip Name", 4, 90);
    header.addColumn("TR", 6, 30);
    header.addColumn("SRC OUT", 8, 65);
    header.addColumn("DST OUT", 10, 65);
    header.addColumn("A name that is too long", 11, 70);
    header.setSize(410, 20);
    expectPicture(header, "table-header");

    header.setSortColumnId(10, true);
    expectPicture(header, "table-header-falling");
    header.setSortColumnId(2, false);
    expectPicture(header, "table-header-rising");
}

TEST_F(ControlPicturesTest, Menu)
{
    class Menu : public juce::Component {
    public:
        void paint(juce::Graphics& graphics) override
        {
            auto& look = getLookAndFeel();
            look.drawPopupMenuBackground(graphics, getWidth(), getHeight());
            juce::Rectangle<int> rest = getLocalBounds().reduced(2);
            const auto item = [&](const char* text, bool isActive, bool isHighlighted, bool isTicked, bool hasSubMenu) {
                look.drawPopupMenuItem(graphics, rest.removeFromTop(22), false, isActive, isHighlighted, isTicked,
                                       hasSubMenu, text, {}, nullptr, nullptr);
            };
            item("Healing", true, false, false, true);
            look.drawPopupMenuItem(graphics, rest.removeFromTop(10), true, false, false, false, false, {}, {}, nullptr,
                                   nullptr);
            item("Extend Event", true, true, false, true);
            item("Until Previous Event", false, false, false, false);
            item("Normal", true, false, true, false);
            look.drawPopupMenuItem(graphics, rest.removeFromTop(22), false, true, false, false, false, "Delete",
                                   "delete", nullptr, nullptr);
        }
    };
    Menu menu;
    menu.setSize(220, 126);

    expectPicture(menu, "menu");
}

TEST_F(ControlPicturesTest, ScrollBars)
{
    Sheet sheet(toColour(Palette::panel));
    sheet.setSize(180, 130);
    for (const bool isVertical : {true, false}) {
        auto& bar = sheet.add<juce::ScrollBar>(
            isVertical ? juce::Rectangle<int>(10, 10, 12, 110) : juce::Rectangle<int>(40, 60, 130, 12), isVertical);
        bar.setAutoHide(false);
        bar.setRangeLimits(0.0, 100.0);
        bar.setCurrentRange(20.0, 30.0);
    }

    expectPicture(sheet, "scroll-bars");
}

TEST(FocusPictures, ControlsWithTheFocus)
{
    WindowOnScreen window;
    const auto pictureOf = [&](juce::Component& control, juce::Rectangle<int> place, const std::string& name) {
        Sheet sheet(toColour(Palette::sheet));
        sheet.setSize(place.getWidth() + 20, place.getHeight() + 20);
        control.setBounds(place.withPosition(10, 10));
        sheet.addAndMakeVisible(control);
        window.show(sheet);
        control.grabKeyboardFocus();
        ASSERT_TRUE(control.hasKeyboardFocus(true));
        expectPicture(sheet, "focus-" + name);
        window.content().grabKeyboardFocus();
    };

    juce::TextButton button("Cancel");
    pictureOf(button, {80, 24}, "text-button");
    PictureButton picture("", Symbol::Bin);
    pictureOf(picture, {32, 24}, "picture-button");
    juce::ToggleButton toggle("Create Destination Markers");
    toggle.setColour(juce::ToggleButton::textColourId, juce::Colour(0xff2e352f));
    toggle.setToggleState(true, juce::dontSendNotification);
    pictureOf(toggle, {210, 20}, "toggle");
    juce::ComboBox box;
    box.addItem("Normal", 1);
    box.setSelectedId(1, juce::dontSendNotification);
    pictureOf(box, {120, 22}, "combo-box");
}
