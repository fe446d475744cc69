// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/SpinBox.h"

#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/WindowOnScreen.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

using cadrel::gui::SpinBox;
using cadrel::tests::RecordingAlerts;
using cadrel::tests::WindowOnScreen;

namespace {

class Listener : public SpinBox::Listener {
public:
    void valueChanged(SpinBox& spinBox) override
    {
        heard.push_back(spinBox.getValue());
        if (meanwhile)
            meanwhile();
    }

    std::vector<double> heard;
    std::function<void()> meanwhile;
};

using Heard = std::vector<double>;

/// Counts the turns of the wheel that go on to it.
class SheetBeneath : public juce::Component {
public:
    void mouseWheelMove(const juce::MouseEvent&, const juce::MouseWheelDetails&) override { ++wheels; }

    int wheels = 0;
};

class SpinBoxTest : public testing::Test {
protected:
    SpinBoxTest() { open(); }

    void open()
    {
        spinBox = std::make_unique<SpinBox>();
        spinBox->setBounds(20, 20, 70, 20);
        spinBox->setRange(5.0, 60.0, 5.0);
        spinBox->setSuffix("%");
        spinBox->setValue(50.0, juce::dontSendNotification);
        spinBox->addListener(&listener);
        other.setBounds(20, 100, 100, 22);
        window.show(other);
        beneath.setBounds(0, 0, 300, 80);
        window.show(beneath);
        window.show(*spinBox);
    }

    juce::Label& display() { return dynamic_cast<juce::Label&>(*spinBox->getChildComponent(0)); }
    juce::Component& up() { return *spinBox->getChildComponent(1); }
    juce::Component& down() { return *spinBox->getChildComponent(2); }
    std::string shown() { return display().getText().toStdString(); }

    void edit(const char* text)
    {
        window.click(display());
        ASSERT_TRUE(display().isBeingEdited());
        window.press(juce::KeyPress(juce::KeyPress::deleteKey));
        window.type(text);
    }

    RecordingAlerts alerts;
    WindowOnScreen window;
    juce::TextEditor other{"other"};
    SheetBeneath beneath;
    Listener listener;
    std::unique_ptr<SpinBox> spinBox;
};

} // namespace

TEST_F(SpinBoxTest, HasItsControlsAtTheirPlaces)
{
    EXPECT_EQ(display().getName(), "m_valueDisplay");
    EXPECT_EQ(display().getBounds(), juce::Rectangle<int>(0, 0, 50, 20));
    EXPECT_EQ(up().getName(), "m_upButton");
    EXPECT_EQ(up().getBounds(), juce::Rectangle<int>(59, 1, 10, 8));
    EXPECT_EQ(down().getName(), "m_downButton");
    EXPECT_EQ(down().getBounds(), juce::Rectangle<int>(59, 11, 10, 8));
}

TEST_F(SpinBoxTest, ShowsTheNumberFollowedByItsSuffix)
{
    EXPECT_EQ(shown(), "50%");

    spinBox->setSuffix(" fr");

    EXPECT_EQ(shown(), "50 fr");
    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(SpinBoxTest, TellsTheClampedValue)
{
    spinBox->setValue(61.0, juce::sendNotification);
    spinBox->setValue(4.0, juce::sendNotification);

    EXPECT_EQ(listener.heard, (Heard{60.0, 5.0}));
    EXPECT_EQ(shown(), "5%");
}

TEST_F(SpinBoxTest, SetsItsValueAnewWithOtherBounds)
{
    spinBox->setRange(0.0, 20.0, 1.0);

    EXPECT_EQ(spinBox->getValue(), 20.0);
    EXPECT_EQ(shown(), "20%");
    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(SpinBoxTest, StepsByItsArrows)
{
    window.click(up());
    window.click(down());
    window.click(down());

    EXPECT_EQ(listener.heard, (Heard{55.0, 50.0, 45.0}));
    EXPECT_EQ(shown(), "45%");
}

TEST_F(SpinBoxTest, StepsByTheWheelOnceANotch)
{
    window.wheel(display(), 0.3F);
    window.wheel(up(), -0.3F);
    window.wheel(display(), 0.0F);

    EXPECT_EQ(listener.heard, (Heard{55.0, 50.0}));
}

TEST_F(SpinBoxTest, StepsByTheUpAndDownKeys)
{
    spinBox->grabKeyboardFocus();

    EXPECT_TRUE(window.press(juce::KeyPress::upKey));
    EXPECT_TRUE(window.press(juce::KeyPress::downKey));
    EXPECT_FALSE(window.press(juce::KeyPress::returnKey));

    EXPECT_EQ(listener.heard, (Heard{55.0, 50.0}));
}

TEST_F(SpinBoxTest, HasArrowsThatScreenReadersCanTellApart)
{
    EXPECT_EQ(up().getTitle(), "Up");
    EXPECT_EQ(down().getTitle(), "Down");
}

TEST_F(SpinBoxTest, IgnoresEverythingWhileItIsDisabled)
{
    spinBox->setEnabled(false);

    window.click(display());
    window.click(up());

    EXPECT_TRUE(listener.heard.empty());
    EXPECT_FALSE(display().isBeingEdited());
}

TEST_F(SpinBoxTest, LeavesTheWheelToTheSheetWhileItIsDisabled)
{
    beneath.addAndMakeVisible(*spinBox);
    // Its middle lies between the number and the arrows.
    spinBox->setSize(40, 20);
    window.wheel(*spinBox, 1.0F);
    ASSERT_EQ(listener.heard, Heard{55.0});

    spinBox->setEnabled(false);
    window.wheel(*spinBox, 1.0F);
    window.wheel(display(), 1.0F);

    EXPECT_EQ(listener.heard.size(), 1U);
    EXPECT_EQ(beneath.wheels, 2);
}

TEST_F(SpinBoxTest, LeavesAWheelThatOnlyGoesSidewaysToTheSheet)
{
    beneath.addAndMakeVisible(*spinBox);

    window.wheel(display(), 0.0F);

    EXPECT_TRUE(listener.heard.empty());
    EXPECT_EQ(beneath.wheels, 1);
}

TEST_F(SpinBoxTest, OpensAnEditorForTheBareNumberAtAClick)
{
    window.click(display());

    ASSERT_TRUE(display().isBeingEdited());
    EXPECT_EQ(display().getCurrentTextEditor()->getText(), "50");
    window.type("x2-5");
    EXPECT_EQ(display().getCurrentTextEditor()->getText(), "25");
}

TEST_F(SpinBoxTest, TakesWhatWasTypedOnReturn)
{
    edit("25");
    window.press(juce::KeyPress::returnKey);

    EXPECT_FALSE(display().isBeingEdited());
    EXPECT_FALSE(display().isEditable());
    EXPECT_EQ(listener.heard, Heard{25.0});
    EXPECT_EQ(shown(), "25%");
}

TEST_F(SpinBoxTest, TakesWhatWasTypedWhenTheFocusLeaves)
{
    edit("25");
    other.grabKeyboardFocus();
    window.serve();

    EXPECT_FALSE(display().isBeingEdited());
    EXPECT_FALSE(display().isEditable());
    EXPECT_EQ(listener.heard, Heard{25.0});
    EXPECT_EQ(shown(), "25%");
}

TEST_F(SpinBoxTest, TakesWhatWasTypedWhenTheUserClicksElsewhere)
{
    edit("25");
    window.click(other);

    EXPECT_FALSE(display().isEditable());
    EXPECT_EQ(listener.heard, Heard{25.0});
    EXPECT_EQ(shown(), "25%");
}

TEST_F(SpinBoxTest, RestoresTheNumberOnEscape)
{
    edit("25");
    window.press(juce::KeyPress::escapeKey);

    EXPECT_FALSE(display().isBeingEdited());
    EXPECT_FALSE(display().isEditable());
    EXPECT_TRUE(listener.heard.empty());
    EXPECT_EQ(shown(), "50%");
}

TEST_F(SpinBoxTest, TellsOfTheSameNumberAlikeOnEachRoadAndWithEachSuffix)
{
    const std::vector<std::function<void()>> roads = {
        [&] { window.press(juce::KeyPress::returnKey); },
        [&] { window.click(other); },
        [&] {
            other.grabKeyboardFocus();
            window.serve();
        },
    };
    for (const char* const suffix : {"%", " frames", ""}) {
        spinBox->setSuffix(suffix);
        for (std::size_t road = 0; road < roads.size(); ++road) {
            listener.heard.clear();
            edit("50");

            roads[road]();

            EXPECT_EQ(listener.heard, Heard{50.0}) << suffix << road;
            EXPECT_FALSE(display().isEditable()) << suffix << road;
            EXPECT_EQ(shown(), std::string("50") + suffix) << road;
        }
    }
}

TEST_F(SpinBoxTest, TellsNobodyOfTheSameNumberAtEscape)
{
    for (const char* const suffix : {"%", ""}) {
        spinBox->setSuffix(suffix);
        edit("50");

        window.press(juce::KeyPress::escapeKey);

        EXPECT_FALSE(display().isEditable()) << suffix;
        EXPECT_EQ(shown(), std::string("50") + suffix);
    }
    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(SpinBoxTest, DropsWhatWasTypedWhenItIsDisabled)
{
    edit("25");
    listener.meanwhile = [&] { spinBox.reset(); };

    spinBox->setEnabled(false);
    window.serve();

    ASSERT_NE(spinBox, nullptr);
    EXPECT_FALSE(display().isBeingEdited());
    EXPECT_TRUE(listener.heard.empty());
    EXPECT_EQ(shown(), "50%");
}

TEST_F(SpinBoxTest, ReadsAnEmptyTextAsZeroWithinTheBounds)
{
    edit("");
    window.press(juce::KeyPress::returnKey);

    EXPECT_EQ(listener.heard, Heard{5.0});
    EXPECT_EQ(shown(), "5%");
}

TEST_F(SpinBoxTest, ClampsWhatIsTyped)
{
    edit("999");
    window.press(juce::KeyPress::returnKey);

    EXPECT_EQ(listener.heard, Heard{60.0});
    EXPECT_EQ(shown(), "60%");
}

TEST_F(SpinBoxTest, OpensTheEditorWithTheDigitThatIsTyped)
{
    spinBox->grabKeyboardFocus();

    window.type("15");
    window.press(juce::KeyPress::returnKey);

    EXPECT_EQ(listener.heard, Heard{15.0});
}

TEST_F(SpinBoxTest, StepsFromWhatWasTypedAndTellsOnce)
{
    for (const char* const suffix : {"%", ""}) {
        spinBox->setSuffix(suffix);
        listener.heard.clear();
        edit("20");

        window.wheel(display(), 1.0F);

        EXPECT_EQ(listener.heard, Heard{25.0});
        EXPECT_EQ(shown(), std::string("25") + suffix);
    }
}

TEST_F(SpinBoxTest, StepsOnceFromAnEditorThatNobodyHasTypedInto)
{
    for (const char* const suffix : {"%", ""}) {
        spinBox->setSuffix(suffix);
        spinBox->setValue(50.0, juce::dontSendNotification);
        listener.heard.clear();
        window.click(display());
        window.wheel(display(), -1.0F);
        EXPECT_EQ(listener.heard, Heard{45.0});

        window.click(display());
        window.click(up());
        // The click ends the typing first.
        EXPECT_EQ(listener.heard, (Heard{45.0, 45.0, 50.0}));
    }
}

TEST_F(SpinBoxTest, IsEditedAgainAfterEachRoad)
{
    edit("20");
    window.press(juce::KeyPress::escapeKey);
    edit("30");
    window.press(juce::KeyPress::returnKey);
    edit("40");
    other.grabKeyboardFocus();
    window.serve();

    EXPECT_EQ(listener.heard, (Heard{30.0, 40.0}));
}

TEST_F(SpinBoxTest, TellsTheLastListenerFirst)
{
    Listener second;
    std::vector<int> order;
    listener.meanwhile = [&] { order.push_back(1); };
    second.meanwhile = [&] { order.push_back(2); };
    spinBox->addListener(&second);
    spinBox->addListener(nullptr);

    spinBox->setValue(10.0, juce::sendNotification);

    EXPECT_EQ(order, (std::vector<int>{2, 1}));
}

TEST_F(SpinBoxTest, TellsTheOthersWhenAListenerRemovesItself)
{
    Listener leaving;
    leaving.meanwhile = [&] { spinBox->removeListener(&leaving); };
    spinBox->addListener(&leaving);
    Listener last;
    spinBox->addListener(&last);

    spinBox->setValue(10.0, juce::sendNotification);
    spinBox->setValue(15.0, juce::sendNotification);

    EXPECT_EQ(last.heard, (Heard{10.0, 15.0}));
    EXPECT_EQ(leaving.heard, Heard{10.0});
    EXPECT_EQ(listener.heard, (Heard{10.0, 15.0}));
}

TEST_F(SpinBoxTest, TellsNobodyOfWhatWasTypedWhenItGoes)
{
    edit("25");

    spinBox.reset();

    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(SpinBoxTest, MayBeDeletedByAListenerOnEveryRoad)
{
    const std::vector<std::function<void()>> roads = {
        [&] { window.click(up()); },
        [&] { window.wheel(display(), 1.0F); },
        [&] {
            spinBox->grabKeyboardFocus();
            window.press(juce::KeyPress::upKey);
        },
        [&] {
            edit("25");
            window.press(juce::KeyPress::returnKey);
        },
        [&] {
            edit("25");
            other.grabKeyboardFocus();
            window.serve();
        },
        [&] {
            edit("25");
            window.click(other);
        },
        [&] {
            edit("25");
            window.wheel(display(), 1.0F);
        },
        [&] { spinBox->setValue(10.0, juce::sendNotification); },
    };
    listener.meanwhile = [&] { spinBox.reset(); };
    for (const auto& road : roads) {
        road();

        EXPECT_EQ(spinBox, nullptr);
        window.serve();
        open();
    }
}
