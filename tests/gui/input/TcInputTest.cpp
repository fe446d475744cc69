// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/input/TcInput.h"

#include "tests/support/core/TestProject.h"
#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/WindowOnScreen.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

using cadrel::core::Framerate;
using cadrel::core::Timecode;
using cadrel::gui::TcInput;
using cadrel::tests::NoProject;
using cadrel::tests::RecordingAlerts;
using cadrel::tests::TestProject;
using cadrel::tests::WindowOnScreen;
using cadrel::util::Result;

namespace {

class Listener : public TcInput::Listener {
public:
    void timecodeChanged(TcInput& input) override
    {
        heard.push_back(input.getValue().toString().insert(0, 1, input.isPositive() ? '+' : '-'));
        if (meanwhile)
            meanwhile();
    }

    std::vector<std::string> heard;
    std::function<void()> meanwhile;
};

using Heard = std::vector<std::string>;

/// Beneath the input: notes the keys that go on to it.
class SheetBeneath : public juce::Component {
public:
    bool keyPressed(const juce::KeyPress& key) override
    {
        keys.push_back(key.getTextDescription().toStdString());
        return true;
    }
    void mouseWheelMove(const juce::MouseEvent&, const juce::MouseWheelDetails&) override { ++wheels; }

    std::vector<std::string> keys;
    int wheels = 0;
};

class TcInputTest : public testing::Test {
protected:
    void open(bool isSigned)
    {
        input = std::make_unique<TcInput>(isSigned);
        input->addListener(&listener);
        input->setTopLeftPosition(20, 20);
        sheet.setBounds(0, 0, 300, 200);
        sheet.addAndMakeVisible(*input);
        other.setBounds(20, 100, 100, 22);
        sheet.addAndMakeVisible(other);
        window.show(sheet);
    }

    juce::TextEditor& editor(const char* name)
    {
        for (juce::Component* const child : input->getChildren()) {
            if (child->getName() == name)
                return dynamic_cast<juce::TextEditor&>(*child);
        }
        throw std::logic_error(name);
    }
    juce::TextEditor& hours() { return editor("Hours Edit"); }
    juce::TextEditor& minutes() { return editor("Minutes Edit"); }
    juce::TextEditor& seconds() { return editor("Seconds Edit"); }
    juce::TextEditor& frames() { return editor("FramesEdit"); }
    juce::TextEditor& sign() { return editor("Sign"); }

    std::string shown()
    {
        return (sign().getText() + hours().getText() + ":" + minutes().getText() + ":" + seconds().getText() + ":" +
                frames().getText())
            .toStdString();
    }
    void focus(juce::Component& component)
    {
        component.grabKeyboardFocus();
        window.serve();
        ASSERT_TRUE(component.hasKeyboardFocus(false));
    }
    std::string focused()
    {
        const auto* const component = juce::Component::getCurrentlyFocusedComponent();
        return component ? component->getName().toStdString() : "";
    }

    TestProject project;
    RecordingAlerts alerts;
    WindowOnScreen window;
    SheetBeneath sheet;
    juce::TextEditor other{"other"};
    Listener listener;
    std::unique_ptr<TcInput> input;
};

} // namespace

TEST_F(TcInputTest, HasItsControlsAtTheirPlaces)
{
    open(true);
    input->setSize(128, 24);

    EXPECT_EQ(frames().getBounds(), juce::Rectangle<int>(74, 1, 24, 22));
    EXPECT_EQ(seconds().getBounds(), juce::Rectangle<int>(54, 1, 24, 22));
    EXPECT_EQ(minutes().getBounds(), juce::Rectangle<int>(34, 1, 24, 22));
    EXPECT_EQ(hours().getBounds(), juce::Rectangle<int>(14, 1, 24, 22));
    EXPECT_EQ(sign().getBounds(), juce::Rectangle<int>(0, 1, 15, 22));
    ASSERT_EQ(input->getNumChildComponents(), 9);
    EXPECT_EQ(input->getChildComponent(5)->getBounds(), juce::Rectangle<int>(71, 1, 10, 22));
    EXPECT_EQ(input->getChildComponent(6)->getBounds(), juce::Rectangle<int>(51, 1, 10, 22));
    EXPECT_EQ(input->getChildComponent(7)->getBounds(), juce::Rectangle<int>(31, 1, 10, 22));
    EXPECT_EQ(input->getChildComponent(8)->getBounds(), juce::Rectangle<int>(0, 0, 128, 24));
    EXPECT_EQ(input->getChildComponent(8)->getName(), "m_disableOverlay");
}

TEST_F(TcInputTest, IsAHundredByTwentyTwoPixels)
{
    open(false);

    EXPECT_EQ(input->getWidth(), 100);
    EXPECT_EQ(input->getHeight(), 22);
    EXPECT_EQ(frames().getY(), 0);
}

TEST_F(TcInputTest, StartsAtZeroAndShowsASignWhereItHasOne)
{
    open(false);
    EXPECT_EQ(shown(), "+00:00:00:00");
    EXPECT_FALSE(sign().isVisible());

    open(true);
    EXPECT_TRUE(sign().isVisible());
}

TEST_F(TcInputTest, LeavesNoWayToTheColons)
{
    open(false);

    for (int child = 5; child <= 7; ++child) {
        auto& colon = dynamic_cast<juce::TextEditor&>(*input->getChildComponent(child));
        EXPECT_EQ(colon.getText(), ":");
        EXPECT_TRUE(colon.isReadOnly());
        EXPECT_FALSE(colon.getWantsKeyboardFocus());
        EXPECT_NE(input->getComponentAt(colon.getBounds().getCentre()), &colon);
    }
}

TEST_F(TcInputTest, TakesDigitsAndSignsAlone)
{
    open(true);
    focus(minutes());
    window.type("x:7");
    EXPECT_EQ(minutes().getText(), "7");

    focus(sign());
    window.type("7x-");
    EXPECT_EQ(sign().getText(), "-");
}

TEST_F(TcInputTest, IsTypedFromTheLeft)
{
    open(false);
    focus(hours());

    window.type("0102");
    EXPECT_EQ(focused(), "Seconds Edit");
    EXPECT_TRUE(listener.heard.empty());
    window.type("0304");

    EXPECT_EQ(listener.heard, Heard{"+01:02:03:04"});
    EXPECT_EQ(focused(), "FramesEdit");
    EXPECT_EQ(frames().getHighlightedText(), "04");
}

TEST_F(TcInputTest, TypesOverTheDigitsOfAFieldThatIsClickedAgain)
{
    open(false);
    hours().grabKeyboardFocus();
    for (int time = 0; time < 2; ++time) {
        window.click(hours());
        EXPECT_EQ(hours().getHighlightedRegion(), (juce::Range<int>(0, 2)));
    }

    window.type("02");
    EXPECT_EQ(shown(), "+02:00:00:00");
}

TEST_F(TcInputTest, IsTypedFromTheLeftOverNumbersThatDropFrameLeavesOut)
{
    project.framerate = Framerate(30, true, 1);
    open(false);
    focus(hours());

    window.type("00010002");

    EXPECT_EQ(listener.heard, Heard{"+00:01:00:02"});
}

TEST_F(TcInputTest, TakesWhatIsPastedFromTheMenuAsItTakesWhatIsTyped)
{
    open(false);
    juce::SystemClipboard::copyTextToClipboard("12");
    focus(seconds());

    seconds().performPopupMenuAction(juce::StandardApplicationCommandIDs::paste);
    EXPECT_EQ(focused(), "FramesEdit");
    EXPECT_TRUE(listener.heard.empty());
    frames().performPopupMenuAction(juce::StandardApplicationCommandIDs::paste);

    EXPECT_EQ(listener.heard, Heard{"+00:00:12:12"});
    EXPECT_EQ(frames().getHighlightedText(), "12");
}

TEST_F(TcInputTest, GoesOnWhenTheMenuTakesADigitBack)
{
    open(false);
    focus(minutes());
    window.type("1");
    ASSERT_EQ(minutes().getText(), "1");

    minutes().performPopupMenuAction(juce::StandardApplicationCommandIDs::undo);

    EXPECT_EQ(minutes().getText(), "00");
    EXPECT_EQ(focused(), "Seconds Edit");
}

TEST_F(TcInputTest, TakesWhatAnInputMethodWrites)
{
    open(false);
    focus(frames());

    dynamic_cast<juce::TextInputTarget&>(frames()).insertTextAtCaret("07");

    EXPECT_EQ(listener.heard, Heard{"+00:00:00:07"});
}

TEST_F(TcInputTest, GoesOnAfterADigitThatLeavesTheTextAsItWas)
{
    open(false);
    input->setValue(Timecode(0, 12, 0, 0), juce::dontSendNotification);
    focus(minutes());
    minutes().setHighlightedRegion({1, 2});

    window.type("2");

    EXPECT_EQ(minutes().getText(), "12");
    EXPECT_EQ(focused(), "Seconds Edit");
}

TEST_F(TcInputTest, StaysInTheFieldAfterAKeyThatBringsNoDigit)
{
    open(false);
    focus(minutes());
    minutes().setCaretPosition(0);

    window.press(juce::KeyPress::backspaceKey);
    window.type("x");

    EXPECT_EQ(minutes().getText(), "00");
    EXPECT_EQ(focused(), "Minutes Edit");
}

TEST_F(TcInputTest, HasTitlesThatScreenReadersRead)
{
    open(true);

    EXPECT_EQ(hours().getTitle(), "Hours");
    EXPECT_EQ(minutes().getTitle(), "Minutes");
    EXPECT_EQ(seconds().getTitle(), "Seconds");
    EXPECT_EQ(frames().getTitle(), "Frames");
    EXPECT_EQ(sign().getTitle(), "Sign");
}

TEST_F(TcInputTest, KeepsEachDigitWhenTheyComeFast)
{
    open(false);
    focus(hours());

    // No message is delivered between the keys.
    for (const char digit : std::string("11121314"))
        window.content().getPeer()->handleKeyPress(juce::KeyPress(digit, {}, static_cast<juce::juce_wchar>(digit)));
    window.serve();

    EXPECT_EQ(listener.heard, Heard{"+11:12:13:14"});
}

TEST_F(TcInputTest, BringsBackTheFormerFramesForFramesOverTheRate)
{
    open(false);
    input->setValue(Timecode(1, 2, 3, 4), juce::dontSendNotification);
    focus(frames());

    window.type("99");

    EXPECT_EQ(shown(), "+01:02:03:04");
    EXPECT_EQ(frames().getHighlightedText(), "04");
    EXPECT_TRUE(listener.heard.empty());
    EXPECT_TRUE(alerts.messages.empty());
}

TEST_F(TcInputTest, TakesWhatWasTypedWhenTheFocusLeaves)
{
    open(true);
    focus(seconds());
    window.type("7");
    focus(minutes());
    EXPECT_TRUE(listener.heard.empty());

    focus(other);

    EXPECT_EQ(listener.heard, Heard{"+00:00:07:00"});
    EXPECT_EQ(shown(), "+00:00:07:00");
    EXPECT_TRUE(seconds().getHighlightedRegion().isEmpty());
}

TEST_F(TcInputTest, SelectsTheFieldThatHasTheFocusAlone)
{
    open(false);
    focus(hours());
    EXPECT_EQ(hours().getHighlightedText(), "00");

    focus(minutes());

    EXPECT_EQ(minutes().getHighlightedText(), "00");
    EXPECT_TRUE(hours().getHighlightedRegion().isEmpty());
}

TEST_F(TcInputTest, TakesAChangedTextOnReturnAndLeavesTheNextReturnToTheSheet)
{
    open(false);
    focus(seconds());
    window.type("7");

    window.press(juce::KeyPress::returnKey);
    EXPECT_EQ(listener.heard, Heard{"+00:00:07:00"});
    EXPECT_TRUE(sheet.keys.empty());
    EXPECT_EQ(shown(), "+00:00:07:00");

    window.press(juce::KeyPress::returnKey);
    EXPECT_EQ(sheet.keys, Heard{"return"});
    EXPECT_EQ(listener.heard.size(), 1U);
}

TEST_F(TcInputTest, RestoresAChangedTextOnEscapeAndLeavesTheNextEscapeToTheSheet)
{
    open(true);
    input->setValue(Timecode(1, 2, 3, 4), false, juce::dontSendNotification);
    focus(sign());
    window.type("+");
    focus(seconds());
    window.type("9");

    window.press(juce::KeyPress::escapeKey);
    EXPECT_EQ(shown(), "-01:02:03:04");
    EXPECT_TRUE(sheet.keys.empty());

    window.press(juce::KeyPress::escapeKey);
    EXPECT_EQ(sheet.keys, Heard{"escape"});
    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(TcInputTest, LeavesOtherKeysToTheSheet)
{
    open(false);
    focus(hours());

    window.press(juce::KeyPress::F2Key);

    EXPECT_EQ(sheet.keys, Heard{"F2"});
}

TEST_F(TcInputTest, TakesAnEmptySignAsPositive)
{
    open(true);
    input->setValue(Timecode(0, 0, 1, 0), false, juce::dontSendNotification);
    focus(sign());
    window.press(juce::KeyPress::deleteKey);
    EXPECT_EQ(sign().getText(), "");

    focus(other);

    EXPECT_EQ(listener.heard, Heard{"+00:00:01:00"});
    EXPECT_EQ(shown(), "+00:00:01:00");
}

TEST_F(TcInputTest, ShowsTheValueThatItIsGiven)
{
    open(true);

    input->setValue(Timecode(9, 8, 7, 6), false, juce::dontSendNotification);
    EXPECT_EQ(shown(), "-09:08:07:06");
    EXPECT_TRUE(listener.heard.empty());
    input->setValue(Timecode(10, 11, 12, 13), juce::sendNotification);
    EXPECT_EQ(listener.heard, Heard{"+10:11:12:13"});
    input->setValue(Timecode(10, 11, 12, 13), juce::sendNotification);
    EXPECT_EQ(listener.heard.size(), 1U);
}

TEST_F(TcInputTest, ShowsZerosForAnUninitialisedValue)
{
    open(false);
    input->setValue(Timecode(9, 8, 7, 6), juce::dontSendNotification);

    input->setValue(Timecode(), juce::dontSendNotification);

    EXPECT_EQ(shown(), "+00:00:00:00");
    EXPECT_EQ(input->getValue(), Timecode(0, 0, 0, 0));
}

TEST_F(TcInputTest, RevertsSilentlyWithoutAProject)
{
    open(false);
    input->setValue(Timecode(9, 8, 7, 6), juce::dontSendNotification);
    const NoProject none;
    focus(frames());

    window.type("12");
    EXPECT_EQ(shown(), "+09:08:07:06");
    window.wheel(frames(), 1.0F);

    EXPECT_EQ(shown(), "+09:08:07:06");
    EXPECT_TRUE(listener.heard.empty());
    EXPECT_TRUE(alerts.messages.empty());
}

TEST_F(TcInputTest, StepsTheFieldUnderTheMouseWhenItHasTheFocus)
{
    open(false);
    input->setValue(Timecode(0, 59, 59, 24), juce::dontSendNotification);
    focus(hours());

    window.wheel(frames(), 0.5F);
    EXPECT_EQ(shown(), "+01:00:00:00");
    EXPECT_EQ(focused(), "FramesEdit");
    EXPECT_EQ(frames().getHighlightedText(), "00");
    window.wheel(minutes(), -0.5F);
    EXPECT_EQ(shown(), "+00:59:00:00");
    EXPECT_EQ(focused(), "Minutes Edit");

    EXPECT_EQ(listener.heard, (Heard{"+01:00:00:00", "+00:59:00:00"}));
    EXPECT_EQ(sheet.wheels, 0);
}

TEST_F(TcInputTest, LeavesTheWheelToTheSheetWithoutTheFocus)
{
    open(false);
    focus(other);

    window.wheel(frames(), 1.0F);

    EXPECT_EQ(shown(), "+00:00:00:00");
    EXPECT_EQ(sheet.wheels, 1);
}

TEST_F(TcInputTest, StaysAtZeroWithoutASignWhateverTheWheelSays)
{
    open(false);
    input->setValue(Timecode(0, 0, 0, 5), juce::dontSendNotification);
    focus(frames());

    window.wheel(seconds(), -1.0F);
    EXPECT_EQ(shown(), "+00:00:00:05");
    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(TcInputTest, FlipsTheSignByTheWheel)
{
    open(true);
    input->setValue(Timecode(0, 0, 1, 0), juce::dontSendNotification);
    focus(frames());

    window.wheel(sign(), 1.0F);
    window.wheel(sign(), 1.0F);

    EXPECT_EQ(listener.heard, (Heard{"-00:00:01:00", "+00:00:01:00"}));
}

TEST_F(TcInputTest, StepsFromWhatWasTyped)
{
    open(false);
    focus(seconds());
    window.type("7");

    window.wheel(seconds(), 1.0F);

    EXPECT_EQ(listener.heard, Heard{"+00:00:08:00"});
}

TEST_F(TcInputTest, StepsByTheUpAndDownKeys)
{
    open(false);
    focus(minutes());

    window.press(juce::KeyPress::upKey);
    window.press(juce::KeyPress::upKey);
    window.press(juce::KeyPress::downKey);

    EXPECT_EQ(listener.heard, (Heard{"+00:01:00:00", "+00:02:00:00", "+00:01:00:00"}));
    EXPECT_TRUE(sheet.keys.empty());
}

TEST_F(TcInputTest, IgnoresTheWheelAndIsCoveredWhileItIsNotActive)
{
    open(false);
    focus(frames());
    input->setActive(false);

    juce::Component& overlay = *input->getChildComponent(input->getNumChildComponents() - 1);
    EXPECT_EQ(overlay.getName(), "m_disableOverlay");
    EXPECT_TRUE(overlay.isVisible());
    EXPECT_FALSE(input->isEnabled());
    window.wheel(frames(), 1.0F);
    EXPECT_EQ(shown(), "+00:00:00:00");
    EXPECT_EQ(sheet.wheels, 1);

    input->setActive(true);
    EXPECT_FALSE(overlay.isVisible());
    EXPECT_TRUE(input->isEnabled());
}

TEST_F(TcInputTest, IsCoveredAlsoWhenWhatItLiesOnIsDisabled)
{
    open(false);
    const juce::Component& overlay = *input->getChildComponent(input->getNumChildComponents() - 1);

    input->getParentComponent()->setEnabled(false);
    EXPECT_TRUE(overlay.isVisible());
    input->getParentComponent()->setEnabled(true);
    EXPECT_FALSE(overlay.isVisible());
}

TEST_F(TcInputTest, IsCoveredWhenItIsPutOnSomethingDisabled)
{
    juce::Component disabled;
    disabled.setEnabled(false);
    TcInput added(false);
    const juce::Component& overlay = *added.getChildComponent(added.getNumChildComponents() - 1);

    disabled.addAndMakeVisible(added);
    EXPECT_TRUE(overlay.isVisible());
    disabled.removeChildComponent(&added);
    EXPECT_FALSE(overlay.isVisible());
}

TEST_F(TcInputTest, LeavesAWheelThatStepsNothingToTheSheet)
{
    open(false);
    focus(frames());

    window.wheel(frames(), 0.0F);

    EXPECT_EQ(shown(), "+00:00:00:00");
    EXPECT_EQ(sheet.wheels, 1);
}

TEST_F(TcInputTest, TellsTheOthersWhenAListenerRemovesItself)
{
    open(false);
    Listener leaving;
    leaving.meanwhile = [&] { input->removeListener(&leaving); };
    input->addListener(&leaving);
    Listener last;
    input->addListener(&last);

    input->setValue(Timecode(1, 0, 0, 0), juce::sendNotification);
    input->setValue(Timecode(2, 0, 0, 0), juce::sendNotification);

    EXPECT_EQ(last.heard.size(), 2U);
    EXPECT_EQ(leaving.heard, Heard{"+01:00:00:00"});
    EXPECT_EQ(listener.heard.size(), 2U);
}

TEST_F(TcInputTest, TakesWhatWasTypedBeforeItIsDisabled)
{
    open(false);
    focus(seconds());
    window.type("7");

    input->setActive(false);

    EXPECT_EQ(listener.heard, Heard{"+00:00:07:00"});
    EXPECT_FALSE(input->isEnabled());
    EXPECT_FALSE(input->hasKeyboardFocus(true));
}

TEST_F(TcInputTest, TellsTheLastListenerFirstAndEachOnce)
{
    open(false);
    Listener second;
    std::vector<int> order;
    listener.meanwhile = [&] { order.push_back(1); };
    second.meanwhile = [&] { order.push_back(2); };
    input->addListener(&second);
    input->addListener(&second);
    input->addListener(nullptr);

    input->setValue(Timecode(1, 0, 0, 0), juce::sendNotification);
    EXPECT_EQ(order, (std::vector<int>{2, 1}));

    input->removeListener(&listener);
    input->setValue(Timecode(2, 0, 0, 0), juce::sendNotification);
    EXPECT_EQ(listener.heard.size(), 1U);
}

TEST_F(TcInputTest, MayBeDeletedByAListenerOnEveryRoad)
{
    const std::vector<std::function<void()>> roads = {
        [&] {
            focus(frames());
            window.type("12");
        },
        [&] {
            focus(seconds());
            window.type("7");
            window.press(juce::KeyPress::returnKey);
        },
        [&] {
            focus(seconds());
            window.type("7");
            focus(other);
        },
        [&] {
            focus(frames());
            window.wheel(frames(), 1.0F);
        },
        [&] {
            focus(frames());
            window.press(juce::KeyPress::upKey);
        },
        [&] {
            focus(seconds());
            window.type("7");
            input->setActive(false);
        },
        [&] {
            juce::SystemClipboard::copyTextToClipboard("12");
            focus(frames());
            frames().performPopupMenuAction(juce::StandardApplicationCommandIDs::paste);
        },
        [&] { input->setValue(Timecode(1, 0, 0, 0), juce::sendNotification); },
    };
    for (const auto& road : roads) {
        listener.heard.clear();
        listener.meanwhile = nullptr;
        open(false);
        Listener deleting;
        deleting.meanwhile = [&] { input.reset(); };
        input->addListener(&deleting);

        road();

        EXPECT_EQ(input, nullptr);
        EXPECT_TRUE(listener.heard.empty());
        window.serve();
    }
}

TEST_F(TcInputTest, TellsNobodyOfWhatWasTypedWhenItGoes)
{
    open(false);
    focus(seconds());
    window.type("7");

    input.reset();

    EXPECT_TRUE(listener.heard.empty());
}

TEST_F(TcInputTest, TellsTheUserOfAListenerThatFails)
{
    open(false);
    listener.meanwhile = [] { throw Result::OutOfRange; };
    focus(frames());

    window.type("12");

    EXPECT_EQ(alerts.messages.size(), 1U);
    EXPECT_EQ(input->getValue(), Timecode(0, 0, 0, 12));
}
