// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/SpinBox.h"
#include "gui/input/TcInput.h"
#include "gui/look/FlashTextButton.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/PictureButton.h"
#include "gui/look/Text.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/Pictures.h"

#include <gtest/gtest.h>

#include <memory>
#include <utility>
#include <vector>

using namespace cadrel::gui;
using cadrel::core::Timecode;
using cadrel::tests::expectPicture;
using cadrel::tests::TestProject;

namespace {

using Symbol = ButtonPicture::Symbol;

/// A sheet with each control, to the right the same controls disabled.
class AllControls : public juce::Component {
public:
    AllControls()
    {
        setOpaque(true);
        setSize(560, 330);
        for (const bool isEnabled : {true, false})
            addControls(isEnabled);
    }

    void paint(juce::Graphics& graphics) override
    {
        graphics.fillAll(juce::Colour(0xff070c10));
        graphics.setColour(toColour(Palette::sheet));
        graphics.fillRoundedRectangle(getLocalBounds().reduced(10).toFloat(), 8.0F);
    }

private:
    template <class Control, class... Arguments>
    Control& add(int x, int y, int width, int height, Arguments&&... arguments)
    {
        auto control = std::make_unique<Control>(std::forward<Arguments>(arguments)...);
        Control& added = *control;
        added.setBounds(x, y, width, height);
        addAndMakeVisible(added);
        m_controls.push_back(std::move(control));
        return added;
    }

    void addControls(bool isEnabled)
    {
        const std::size_t before = m_controls.size();
        const int x = isEnabled ? 30 : 300;
        const juce::Colour dark(0xff2e352f);
        auto& title = add<juce::Label>(x, 22, 220, 20, "", isEnabled ? "Enabled" : "Disabled");
        title.setFont(getFont(9));
        title.setColour(juce::Label::textColourId, dark);
        int y = 54;
        for (const bool isOn : {true, false}) {
            auto& toggle = add<juce::ToggleButton>(x, y, 220, 20, "Create Destination Markers");
            toggle.setColour(juce::ToggleButton::textColourId, dark);
            toggle.setToggleState(isOn, juce::dontSendNotification);
            y += 24;
        }
        auto& box = add<juce::ComboBox>(x, 110, 160, 22);
        box.addItem("Gaps without Inserts", 1);
        box.setSelectedId(1, juce::dontSendNotification);
        auto& spinBox = add<SpinBox>(x, 144, 70, 20);
        spinBox.setSuffix("%");
        spinBox.setValue(50.0, juce::dontSendNotification);
        spinBox.setBackgroundColour(toColour(Palette::sheet));
        auto& timecode = add<TcInput>(x + 100, 143, 100, 22, true);
        timecode.setValue(Timecode(1, 0, 12, 5), false, juce::dontSendNotification);
        auto& text = add<juce::TextEditor>(x, 178, 200, 22);
        text.setFont(getFont(7));
        text.setJustification(juce::Justification::centredLeft);
        text.setIndents(4, 0);
        text.setText("VFX_****_v,_comp", false);
        int buttonX = x;
        for (const Symbol symbol : {Symbol::Plus, Symbol::Bin, Symbol::Cog, Symbol::Floppy}) {
            add<PictureButton>(buttonX, 214, 32, 24, "", symbol);
            buttonX += 40;
        }
        add<PictureButton>(buttonX, 214, 60, 24, "", Symbol::Folder);
        add<juce::TextButton>(x, 252, 40, 24, "SRC").setToggleState(true, juce::dontSendNotification);
        add<juce::TextButton>(x + 38, 252, 40, 24, "DST");
        auto& preview = add<FlashTextButton>(x + 90, 252, 90, 24, "Preview");
        preview.setColour(juce::TextButton::buttonOnColourId, toColour(Palette::orange));
        preview.setToggleState(true, juce::dontSendNotification);
        add<juce::TextButton>(x + 60, 288, 80, 24, "Cancel");
        add<juce::TextButton>(x + 146, 288, 80, 24, "OK");
        for (std::size_t i = before; i < m_controls.size(); ++i)
            m_controls[i]->setEnabled(isEnabled);
        timecode.setActive(isEnabled);
    }

    std::vector<std::unique_ptr<juce::Component>> m_controls;
};

} // namespace

TEST(SheetPicture, HasEachControl)
{
    const TestProject project;
    const juce::ScopedJuceInitialiser_GUI juce;
    const cadrel::gui::LookAndFeel look;
    AllControls sheet;

    expectPicture(sheet, "all-controls");
}
