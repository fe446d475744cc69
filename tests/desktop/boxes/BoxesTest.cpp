// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/Boxes.h"

#include "gui/look/LookAndFeel.h"
#include "standin/base/Utf16.h"
#include "tests/support/TempFolder.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <functional>
#include <stdexcept>
#include <string>
#include <thread>
#include <utility>
#include <vector>

namespace desktop::tests {
namespace {

using cadrel::tests::FocusedWindow;
using Files = std::vector<std::u16string>;

/// Boxes over a window with one button. What the user does while a box waits is done one by one in its idle time.
class BoxesTest : public testing::Test {
protected:
    BoxesTest()
    {
        m_window.addAndMakeVisible(m_desk);
        m_desk.setBounds(m_window.getLocalBounds());
        m_desk.addAndMakeVisible(m_button);
        m_button.setBounds(0, 0, 40, 20);
        m_button.onClick = [this] { ++m_clicks; };
        m_boxes.setOpenChanged([this](bool isOpen) { m_opened.push_back(isOpen); });
        m_loop.setIdle([this](bool isWaiting) {
            if (std::chrono::steady_clock::now() > m_end)
                throw std::runtime_error("no key ends the box");
            m_waitings.push_back(isWaiting);
            if (m_acts.empty() || m_isActing)
                return;
            const juce::ScopedValueSetter<bool> acting(m_isActing, true);
            const auto act = m_acts.front();
            m_acts.erase(m_acts.begin());
            act();
        });
    }

    void will(std::function<void()> act) { m_acts.push_back(std::move(act)); }
    void willPress(int key)
    {
        // A box that the key opens is waited for elsewhere.
        will([this, key] { m_window.getPeer()->handleKeyPress(juce::KeyPress(key)); });
    }
    void willType(const std::string& text)
    {
        for (const char character : text)
            will([this, character] {
                m_window.getPeer()->handleKeyPress(
                    juce::KeyPress(character, {}, static_cast<juce::juce_wchar>(character)));
            });
    }
    void willClickOnTheDesk()
    {
        will([this] { m_window.FocusedWindow::click(juce::Point<int>(20, 10)); });
    }
    /// Presses Return, which brings up a message over the file box, and then Return in that one.
    void willBeTold(const std::string& message)
    {
        will([this, message] {
            const auto laterActs = std::exchange(m_acts, {});
            will([this, message] { EXPECT_EQ(shownMessage(), message); });
            willPress(juce::KeyPress::returnKey);
            m_acts.insert(m_acts.end(), laterActs.begin(), laterActs.end());
            m_isActing = false;
            m_window.getPeer()->handleKeyPress(juce::KeyPress(juce::KeyPress::returnKey));
        });
    }
    std::string shownMessage() const
    {
        for (const juce::Component* const box : m_window.getChildren()) {
            for (juce::Component* const child : box->getChildren()) {
                if (const auto* const editor = dynamic_cast<juce::TextEditor*>(child);
                    editor && editor->getName() == "Alert Message")
                    return editor->getText().toStdString();
            }
        }
        return {};
    }
    Files save(const std::string& extension = "edl")
    {
        return m_boxes.chooseFiles(
            {u"Save", {{extension, "A list"}}, standin::toUtf16((m_folder / "").string()), true});
    }
    Files open()
    {
        return m_boxes.chooseFiles({u"Open", {{"edl", "A list"}}, standin::toUtf16((m_folder / "").string()), false});
    }
    std::u16string pathOf(const char* name) const { return standin::toUtf16((m_folder / name).string()); }

    cadrel::tests::NoScreen m_noScreen;
    cadrel::tests::TempFolder m_folder;
    juce::ScopedJuceInitialiser_GUI m_juce;
    juce::SharedResourcePointer<cadrel::gui::LookAndFeel> m_look;
    FocusedWindow m_window{1000, 800};
    juce::Component m_desk;
    juce::TextButton m_button{"Beneath"};
    EventLoop m_loop;
    Boxes m_boxes{m_loop, m_window, m_desk, "/"};
    int m_clicks = 0;
    std::vector<bool> m_opened;
    std::vector<bool> m_waitings;
    std::vector<std::function<void()>> m_acts;
    bool m_isActing = false;
    std::chrono::steady_clock::time_point m_end = std::chrono::steady_clock::now() + std::chrono::seconds(60);
};

TEST_F(BoxesTest, AnswerTheFirstButtonOfAnAlertWithReturnAndTheLastWithEscape)
{
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Keep", u"Remove", u"Cancel"}), 0U);
    willPress(juce::KeyPress::escapeKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Keep", u"Remove", u"Cancel"}), 2U);
    EXPECT_EQ(m_opened, (std::vector<bool>{true, false, true, false}));
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Remove", u"Keep", u"Cancel"}, 1), 1U) << "The first one would lose something.";
    EXPECT_FALSE(m_boxes.isOpen());
}

TEST_F(BoxesTest, LetNothingBeneathThemTakeInput)
{
    willClickOnTheDesk();
    willPress(juce::KeyPress::escapeKey);
    m_boxes.ask(u"Start?", {u"OK"});
    EXPECT_EQ(m_clicks, 0);
    m_window.click(juce::Point<int>(20, 10));
    EXPECT_EQ(m_clicks, 1) << "Afterwards it does again.";
}

TEST_F(BoxesTest, LeaveTheKeyboardToTheButtonThatHasItAfterAClickBesideThem)
{
    const auto focused = [] { return juce::Component::getCurrentlyFocusedComponent(); };
    const juce::Component* second = nullptr;
    will([&] {
        focused()->moveKeyboardFocusToSibling(true);
        second = focused();
    });
    willClickOnTheDesk();
    will([] {});
    will([&] { EXPECT_EQ(focused(), second); });
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Keep", u"Remove", u"Cancel"}), 1U);
}

TEST_F(BoxesTest, TakeTheKeyboardFromWhatLiesBeneathThem)
{
    m_button.grabKeyboardFocus();
    // The window loses the keyboard; meanwhile a box comes up; then the window gets it back.
    m_window.getPeer()->handleFocusLoss();
    will([this] {
        m_window.getPeer()->handleFocusGain();
        EXPECT_TRUE(m_button.hasKeyboardFocus(true)) << "JUCE does so.";
    });
    will([] {});
    will([this] { EXPECT_FALSE(m_button.hasKeyboardFocus(true)); });
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Keep", u"Cancel"}), 0U);
}

TEST_F(BoxesTest, TakeTheKeyboardThatNothingInTheWindowHas)
{
    will([] { juce::Component::unfocusAllComponents(); });
    will([] {});
    will([] { EXPECT_TRUE(juce::Component::getCurrentlyFocusedComponent()); });
    willPress(juce::KeyPress::escapeKey);
    EXPECT_EQ(m_boxes.ask(u"Start?", {u"Keep", u"Cancel"}), 1U);
}

TEST_F(BoxesTest, TellTheIdleWorkWhetherItIsCalledFromWithinAnother)
{
    will([this] {
        willPress(juce::KeyPress::escapeKey);
        m_isActing = false;
        m_boxes.ask(u"Inner", {u"OK"});
    });
    will([] {});
    m_loop.runUntil([this] { return m_acts.empty(); });
    m_loop.runUntil([this] { return !m_waitings.back(); });
    EXPECT_FALSE(m_waitings.front());
    EXPECT_NE(std::find(m_waitings.begin(), m_waitings.end(), true), m_waitings.end());
    EXPECT_FALSE(m_loop.isTurning());
}

TEST_F(BoxesTest, OpenTheFileThatIsTyped)
{
    m_folder.write("cut.edl", "TITLE: x");
    willType("cut.edl");
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(open(), Files{pathOf("cut.edl")});
}

TEST_F(BoxesTest, StayOpenForAFileThatIsNotThere)
{
    willType("cut.edl");
    willBeTold("There is no file " + (m_folder / "cut.edl").string() + ".");
    willPress(juce::KeyPress::escapeKey);
    EXPECT_EQ(open(), Files());
}

TEST_F(BoxesTest, TellWhereAFileCannotBeSaved)
{
    std::filesystem::create_directory(m_folder / "cut.edl");
    willType("cut");
    willBeTold("\"cut.edl\" is a folder. Choose another name.");
    willPress(juce::KeyPress::escapeKey);
    EXPECT_EQ(save(), Files());

    willType("none/cut");
    willBeTold("There is no folder " + (m_folder / "none").string() + ".");
    willPress(juce::KeyPress::escapeKey);
    EXPECT_EQ(save(), Files());
}

TEST_F(BoxesTest, AddTheExtensionToANameToBeSaved)
{
    willType("cut");
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(save(), Files{pathOf("cut.edl")});
}

TEST_F(BoxesTest, AskBeforeAFileIsOverwritten)
{
    m_folder.write("cut.edl", "TITLE: x");
    willType("cut");
    // This is asked over the file box, which comes back when the answer is no.
    will([this] {
        willPress(juce::KeyPress::escapeKey);
        willPress(juce::KeyPress::escapeKey);
        m_isActing = false;
        m_window.getPeer()->handleKeyPress(juce::KeyPress(juce::KeyPress::returnKey));
    });
    EXPECT_EQ(save(), Files());

    willType("cut");
    will([this] {
        willPress(juce::KeyPress::returnKey);
        willPress(juce::KeyPress::escapeKey);
        m_isActing = false;
        m_window.getPeer()->handleKeyPress(juce::KeyPress(juce::KeyPress::returnKey));
    });
    EXPECT_EQ(save(), Files()) << "Return is no yes.";

    willType("cut");
    will([this] {
        will([] { juce::Component::getCurrentlyFocusedComponent()->moveKeyboardFocusToSibling(false); });
        willPress(juce::KeyPress::returnKey);
        m_isActing = false;
        m_window.getPeer()->handleKeyPress(juce::KeyPress(juce::KeyPress::returnKey));
    });
    EXPECT_EQ(save(), Files{pathOf("cut.edl")});
    EXPECT_EQ(cadrel::tests::contentOf(m_folder / "cut.edl"), "TITLE: x") << "The box itself writes nothing.";
}

TEST_F(BoxesTest, ProposeANameOfWhichAllButTheExtensionIsTypedOver)
{
    const auto saveAs = [this](const std::u16string& name) {
        return m_boxes.chooseFiles(
            {u"Save", {{"stage", "A project"}}, standin::toUtf16((m_folder / "").string()), true, name});
    };
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(saveAs(u"reel3.stage"), Files{pathOf("reel3.stage")});
    willType("film");
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(saveAs(u"reel.3.stage"), Files{pathOf("film.stage")});
    willPress(juce::KeyPress::endKey);
    willType("x");
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(saveAs(u"reel3"), Files{pathOf("reel3x.stage")});
}

TEST_F(BoxesTest, OpenInTheFolderOfTheLastFile)
{
    m_folder.write("cut.edl", "TITLE: x");
    willType("cut.edl");
    willPress(juce::KeyPress::returnKey);
    open();
    willType("cut.edl");
    willPress(juce::KeyPress::returnKey);
    EXPECT_EQ(m_boxes.chooseFiles({u"Open", {{"edl", "A list"}}, u"", false}), Files{pathOf("cut.edl")});
}

TEST_F(BoxesTest, ShowProgressOnlyWhenItTakesAMoment)
{
    EXPECT_FALSE(m_boxes.showProgress({u"Cadrel", u"Work", u"", 0, true}));
    EXPECT_FALSE(m_boxes.isOpen());
    std::this_thread::sleep_for(std::chrono::milliseconds(320));
    EXPECT_FALSE(m_boxes.showProgress({u"Cadrel", u"Work", u"", 50, true}));
    EXPECT_TRUE(m_boxes.isOpen());
    m_boxes.endProgress();
    EXPECT_FALSE(m_boxes.isOpen());
    EXPECT_FALSE(m_boxes.showProgress({u"Cadrel", u"Next", u"", 0, true})) << "The next one begins anew.";
    EXPECT_FALSE(m_boxes.isOpen());
    m_boxes.endProgress();
}

TEST_F(BoxesTest, CancelProgressWithEscapeWhereThatIsAllowed)
{
    for (const bool canCancel : {true, false}) {
        m_boxes.showProgress({u"Cadrel", u"Work", u"", 0, canCancel});
        std::this_thread::sleep_for(std::chrono::milliseconds(320));
        m_boxes.showProgress({u"Cadrel", u"Work", u"", 10, canCancel});
        m_window.getPeer()->handleKeyPress(juce::KeyPress(juce::KeyPress::escapeKey));
        std::this_thread::sleep_for(std::chrono::milliseconds(40));
        EXPECT_EQ(m_boxes.showProgress({u"Cadrel", u"Work", u"", 20, canCancel}), canCancel);
        m_boxes.endProgress();
    }
}

} // namespace
} // namespace desktop::tests
