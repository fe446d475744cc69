// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/SpinBox.h"
#include "gui/input/TcInput.h"
#include "gui/look/Text.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/WindowOnScreen.h"

#include <gtest/gtest.h>

#include <string>

using namespace cadrel::gui;
using cadrel::core::Timecode;
using cadrel::tests::expectPicture;
using cadrel::tests::TestProject;
using cadrel::tests::WindowOnScreen;

namespace {

/// A component on the ground of a sheet.
class Ground : public juce::Component {
public:
    Ground(juce::Component& content, int width, int height)
    {
        setOpaque(true);
        setSize(width + 20, height + 20);
        content.setBounds(10, 10, width, height);
        addAndMakeVisible(content);
    }

    void paint(juce::Graphics& graphics) override { graphics.fillAll(toColour(Palette::sheet)); }
};

class InputPicturesTest : public testing::Test {
protected:
    TestProject m_project;
    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
};

/// With a screen, for the focus.
class FocusedInputPicturesTest : public testing::Test {
protected:
    TestProject m_project;
    WindowOnScreen m_window;
};

} // namespace

TEST_F(InputPicturesTest, Timecodes)
{
    TcInput input(false);
    Ground ground(input, 128, 24);
    input.setValue(Timecode(1, 2, 33, 24), juce::dontSendNotification);

    expectPicture(ground, "timecode");
}

TEST_F(InputPicturesTest, TimecodesWithASign)
{
    TcInput input(true);
    Ground ground(input, 100, 22);
    input.setValue(Timecode(0, 0, 10, 5), false, juce::dontSendNotification);

    expectPicture(ground, "timecode-signed");
}

TEST_F(InputPicturesTest, TimecodesThatAreNotActive)
{
    TcInput input(true);
    Ground ground(input, 100, 22);
    input.setValue(Timecode(23, 59, 59, 24), juce::dontSendNotification);
    input.setActive(false);

    expectPicture(ground, "timecode-inactive");
}

TEST_F(InputPicturesTest, SpinBoxes)
{
    SpinBox spinBox;
    Ground ground(spinBox, 70, 20);
    spinBox.setSuffix("%");
    spinBox.setValue(50.0, juce::dontSendNotification);
    expectPicture(ground, "spin-box");

    spinBox.setEnabled(false);
    expectPicture(ground, "spin-box-disabled");
}

TEST_F(FocusedInputPicturesTest, TimecodesThatAreTypedInto)
{
    TcInput input(true);
    Ground ground(input, 100, 22);
    input.setValue(Timecode(1, 2, 3, 4), juce::dontSendNotification);
    m_window.show(ground);
    input.getChildComponent(2)->grabKeyboardFocus();

    expectPicture(ground, "timecode-focus");
}

TEST_F(FocusedInputPicturesTest, SpinBoxesThatAreTypedInto)
{
    SpinBox spinBox;
    Ground ground(spinBox, 70, 20);
    spinBox.setSuffix("%");
    spinBox.setValue(50.0, juce::dontSendNotification);
    m_window.show(ground);
    spinBox.grabKeyboardFocus();
    expectPicture(ground, "spin-box-focus");

    m_window.type("7");
    expectPicture(ground, "spin-box-typing");
}
