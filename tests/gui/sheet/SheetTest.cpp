// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/sheet/Sheet.h"

#include "gui/look/LookAndFeel.h"
#include "gui/sheet/TickBox.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/RecordingAlerts.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>

namespace cadrel::tests {
namespace {

using gui::Sheet;
using gui::TickBox;

/// Two text fields, a tick box and a button.
class SampleSheet : public Sheet {
public:
    explicit SampleSheet(const juce::String& name = "sample") : Sheet(name)
    {
        addAndMakeVisible(first);
        addAndMakeVisible(second);
        addAndMakeVisible(tick);
        addAndMakeVisible(button);
        for (juce::TextEditor* const editor : {&first, &second})
            editor->setEscapeAndReturnKeysConsumed(false);
        setBounds(0, 0, 200, 100);
        first.setBounds(10, 10, 50, 20);
        second.setBounds(70, 10, 50, 20);
        tick.setBounds(10, 40, 50, 20);
        button.setBounds(70, 40, 50, 20);
    }

    juce::TextEditor first{"first"};
    juce::TextEditor second{"second"};
    TickBox tick{"tick", {}};
    juce::TextButton button{"button"};
    int confirmed = 0;
    int cancelled = 0;
    bool fails = false;

private:
    void confirm() override
    {
        if (fails)
            throw util::Result::FileAccessFailed;
        ++confirmed;
    }
    void cancel() override
    {
        ++cancelled;
        setVisible(false);
    }
    juce::Rectangle<int> panel() const override { return {5, 5, 150, 80}; }
    juce::Component* firstFocus() override { return &first; }
};

class SheetTest : public testing::Test {
protected:
    SheetTest()
    {
        m_window.addAndMakeVisible(m_beneath);
        m_beneath.setBounds(m_window.getLocalBounds());
        m_beneath.addAndMakeVisible(m_field);
        m_field.setBounds(250, 150, 40, 20);
        m_window.addChildComponent(m_sheet);
        m_sheet.setBeneath(&m_beneath);
    }

    static std::string focus()
    {
        const juce::Component* const focused = juce::Component::getCurrentlyFocusedComponent();
        return focused ? focused->getName().toStdString() : "none";
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    FocusedWindow m_window{300, 200};
    juce::Component m_beneath;
    juce::TextEditor m_field{"field"};
    SampleSheet m_sheet;
};

TEST_F(SheetTest, ShowsNothingAtFirst)
{
    EXPECT_FALSE(m_sheet.isVisible());
    EXPECT_TRUE(m_field.isEnabled());
}

TEST_F(SheetTest, DisablesWhatIsBeneathWhileItShows)
{
    m_sheet.setVisible(true);
    EXPECT_FALSE(m_field.isEnabled());
    m_window.click(m_field);
    EXPECT_NE(focus(), "field");

    m_sheet.setVisible(false);
    EXPECT_TRUE(m_field.isEnabled());
    m_window.click(m_field);
    EXPECT_EQ(focus(), "field");
}

TEST_F(SheetTest, TakesTheFocusAndGivesItBack)
{
    m_field.grabKeyboardFocus();

    m_sheet.setVisible(true);
    EXPECT_EQ(focus(), "first");

    m_sheet.setVisible(false);
    EXPECT_EQ(focus(), "field");
}

TEST_F(SheetTest, GivesTheFocusBackToTheWindowItself)
{
    m_window.setName("window");
    m_window.grabKeyboardFocus();
    m_sheet.setVisible(true);

    m_sheet.setVisible(false);

    EXPECT_EQ(focus(), "window");
}

TEST_F(SheetTest, TakesNoFocusFromElsewhereWhenItGoes)
{
    m_field.grabKeyboardFocus();
    m_sheet.setVisible(true);
    FocusedWindow other(50, 50);
    other.setName("other");
    other.grabKeyboardFocus();

    m_sheet.setVisible(false);

    EXPECT_EQ(focus(), "other");
}

TEST_F(SheetTest, HoldsTheTabKey)
{
    m_sheet.setVisible(true);

    std::string walk = focus();
    for (int step = 0; step < 4; ++step) {
        m_window.press(juce::KeyPress::tabKey);
        walk += ' ';
        walk += focus();
    }
    EXPECT_EQ(walk, "first second tick button first");

    m_window.press(juce::KeyPress::tabKey, juce::ModifierKeys::shiftModifier);
    EXPECT_EQ(focus(), "button");
}

TEST_F(SheetTest, ConfirmsOnReturn)
{
    m_sheet.setVisible(true);

    EXPECT_TRUE(m_window.press(juce::KeyPress::returnKey));

    EXPECT_EQ(m_sheet.confirmed, 1);
    EXPECT_TRUE(m_sheet.isVisible());
}

TEST_F(SheetTest, ConfirmsOnReturnInATickBoxWhichTheSpaceBarTicks)
{
    m_sheet.setVisible(true);
    m_sheet.tick.grabKeyboardFocus();

    m_window.press(juce::KeyPress::returnKey);
    EXPECT_EQ(m_sheet.confirmed, 1);
    EXPECT_FALSE(m_sheet.tick.getToggleState());

    m_window.press(juce::KeyPress::spaceKey);
    EXPECT_EQ(m_sheet.confirmed, 1);
    EXPECT_TRUE(m_sheet.tick.getToggleState());
}

TEST_F(SheetTest, ClosesOnEscape)
{
    m_sheet.setVisible(true);

    EXPECT_TRUE(m_window.press(juce::KeyPress::escapeKey));

    EXPECT_EQ(m_sheet.cancelled, 1);
    EXPECT_FALSE(m_sheet.isVisible());
}

TEST_F(SheetTest, LetsOtherKeysGoOn)
{
    m_sheet.setVisible(true);
    m_sheet.grabKeyboardFocus();

    EXPECT_FALSE(m_window.press(juce::KeyPress::F3Key));
    EXPECT_FALSE(m_window.press(juce::KeyPress::returnKey, juce::ModifierKeys::ctrlModifier));
    EXPECT_FALSE(m_window.press(juce::KeyPress::escapeKey, juce::ModifierKeys::altModifier));
}

TEST_F(SheetTest, TellsOfAFailure)
{
    RecordingAlerts alerts;
    m_sheet.fails = true;
    m_sheet.setVisible(true);

    EXPECT_TRUE(m_window.press(juce::KeyPress::returnKey));

    EXPECT_EQ(alerts.messages.size(), 1U);
}

TEST_F(SheetTest, LeavesWhatIsBeneathUnusableUntilTheLastSheetHasGone)
{
    SampleSheet second("second sheet");
    m_window.addChildComponent(second);
    second.setBeneath(&m_beneath);
    m_sheet.setVisible(true);
    second.setVisible(true);

    m_sheet.setVisible(false);
    EXPECT_FALSE(m_field.isEnabled());
    second.setVisible(false);
    EXPECT_TRUE(m_field.isEnabled());
}

TEST_F(SheetTest, GivesBackWhatIsBeneathWhenItIsDestroyed)
{
    auto sheet = std::make_unique<SampleSheet>();
    m_window.addChildComponent(*sheet);
    sheet->setBeneath(&m_beneath);
    sheet->setVisible(true);

    sheet.reset();

    EXPECT_TRUE(m_field.isEnabled());
}

TEST_F(SheetTest, GoesWithoutWhatWasBeneath)
{
    auto beneath = std::make_unique<juce::Component>();
    m_window.addAndMakeVisible(*beneath);
    m_sheet.setBeneath(beneath.get());
    m_sheet.setVisible(true);

    beneath.reset();
    m_sheet.setVisible(false);

    EXPECT_FALSE(m_sheet.isVisible());
}

TEST_F(SheetTest, ComesBeforeEverythingElse)
{
    juce::Component later;
    m_window.addAndMakeVisible(later);

    m_sheet.setVisible(true);

    EXPECT_EQ(m_window.getChildComponent(m_window.getNumChildComponents() - 1), &m_sheet);
}

TEST_F(SheetTest, PaintsAShadeAndItsPanel)
{
    m_sheet.setVisible(true);

    const juce::Image image = m_sheet.createComponentSnapshot(m_sheet.getLocalBounds());

    // Rounding in the image of premultiplied colours may take a step.
    EXPECT_EQ(image.getPixelAt(2, 2).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(6, 6).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(154, 84).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(155, 84).getAlpha(), 0x3a);
}

} // namespace
} // namespace cadrel::tests
