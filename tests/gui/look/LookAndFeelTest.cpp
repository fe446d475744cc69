// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/LookAndFeel.h"

#include "gui/look/Text.h"

#include <gtest/gtest.h>

#include <optional>

using namespace cadrel::gui;

namespace {

class LookAndFeelTest : public testing::Test {
protected:
    juce::ScopedJuceInitialiser_GUI m_juce;
};

using Shared = juce::SharedResourcePointer<LookAndFeel>;

bool isDefault(const juce::LookAndFeel& look)
{
    return &juce::LookAndFeel::getDefaultLookAndFeel() == &look;
}

} // namespace

TEST_F(LookAndFeelTest, IsTheDefaultOfTheProcessWhileItLives)
{
    {
        const LookAndFeel look;
        EXPECT_TRUE(isDefault(look));
        const juce::Component any;
        EXPECT_EQ(&any.getLookAndFeel(), &look);
    }

    EXPECT_EQ(dynamic_cast<LookAndFeel*>(&juce::LookAndFeel::getDefaultLookAndFeel()), nullptr);
}

TEST_F(LookAndFeelTest, IsSharedByWindowsAndGoesWithTheLast)
{
    std::optional<Shared> first(std::in_place);
    std::optional<Shared> second(std::in_place);
    EXPECT_EQ(&first->get(), &second->get());
    EXPECT_TRUE(isDefault(first->get()));

    first.reset();
    EXPECT_TRUE(isDefault(second->get()));
    second.reset();

    EXPECT_EQ(dynamic_cast<LookAndFeel*>(&juce::LookAndFeel::getDefaultLookAndFeel()), nullptr);
}

TEST_F(LookAndFeelTest, DrawsInTheBundledFamilyWhateverIsInstalled)
{
    const LookAndFeel look;

    EXPECT_EQ(getFont(0).getTypefacePtr()->getName(), "Roboto Condensed");
    EXPECT_EQ(getFont(0).getTypefacePtr()->getStyle(), "Regular");
    EXPECT_EQ(getFont(1).getTypefacePtr()->getStyle(), "Bold");
    EXPECT_EQ(juce::Font(14.0F).getTypefacePtr()->getName(), "Roboto Condensed");
    EXPECT_EQ(juce::Font(14.0F, juce::Font::bold).getTypefacePtr()->getStyle(), "Bold");
}

TEST_F(LookAndFeelTest, GivesTheFamilyToFontsThatWereAskedForBefore)
{
    juce::Font(14.0F).getTypefacePtr();
    getFont(0).getTypefacePtr();
    const LookAndFeel look;

    EXPECT_EQ(getFont(0).getTypefacePtr()->getStyle(), "Regular");
    EXPECT_EQ(juce::Font(14.0F).getTypefacePtr()->getName(), "Roboto Condensed");
}

TEST_F(LookAndFeelTest, HasDigitsOfOneWidth)
{
    const LookAndFeel look;

    for (const int index : {0, 1}) {
        const float width = getFont(index).getStringWidthFloat("0");
        for (const char* const digit : {"1", "2", "3", "4", "5", "6", "7", "8", "9"})
            EXPECT_FLOAT_EQ(getFont(index).getStringWidthFloat(digit), width) << digit;
    }
}

TEST_F(LookAndFeelTest, HasItsColours)
{
    const LookAndFeel look;
    const auto colour = [&look](int id) { return look.findColour(id).getARGB(); };

    EXPECT_EQ(colour(juce::ListBox::backgroundColourId), 0xff171c24U);
    EXPECT_EQ(colour(juce::ScrollBar::thumbColourId), 0xffffffffU);
    EXPECT_EQ(colour(juce::ScrollBar::trackColourId), 0xff8d8f90U);
    EXPECT_EQ(colour(juce::Slider::textBoxTextColourId), 0xffffffffU);
    EXPECT_EQ(colour(juce::Slider::textBoxBackgroundColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::Slider::textBoxHighlightColourId), 0xffffffffU);
    EXPECT_EQ(colour(juce::Slider::textBoxOutlineColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::TextEditor::textColourId), 0xffffffffU);
    EXPECT_EQ(colour(juce::TextEditor::backgroundColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::TextEditor::focusedOutlineColourId) >> 24U, 0U);
    EXPECT_EQ(colour(juce::TextEditor::highlightColourId), 0xff87c17aU);
    EXPECT_EQ(colour(juce::TextEditor::highlightedTextColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::CaretComponent::caretColourId), 0xff87c17aU);
    EXPECT_EQ(colour(juce::ComboBox::textColourId), 0xffffffffU);
    EXPECT_EQ(colour(juce::ComboBox::backgroundColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::ComboBox::outlineColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::ComboBox::buttonColourId), 0xff797a7bU);
    EXPECT_EQ(colour(juce::ComboBox::arrowColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::TooltipWindow::backgroundColourId), 0xffeff0f6U);
    EXPECT_EQ(colour(juce::TooltipWindow::textColourId), 0xff5a5a5aU);
    EXPECT_EQ(colour(juce::TooltipWindow::outlineColourId), 0xff767676U);
    EXPECT_EQ(colour(juce::ProgressBar::backgroundColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::ProgressBar::foregroundColourId), 0xff98b1c9U);
    EXPECT_EQ(colour(juce::PopupMenu::backgroundColourId), 0xfff0f0f0U);
    EXPECT_EQ(colour(juce::PopupMenu::highlightedBackgroundColourId), 0x66a3ccffU);
    EXPECT_EQ(colour(juce::PopupMenu::highlightedTextColourId), 0xff000000U);
    EXPECT_EQ(colour(juce::TextButton::buttonOnColourId), 0xffa3ccffU);
}
