// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/FlashTextButton.h"

#include "gui/look/LookAndFeel.h"
#include "gui/look/Text.h"

#include <gtest/gtest.h>

using namespace cadrel::gui;

namespace {

class FlashTextButtonTest : public testing::Test {
protected:
    FlashTextButtonTest() { m_button.setColour(juce::TextButton::buttonOnColourId, toColour(Palette::orange)); }

    juce::Colour onColour() const { return m_button.findColour(juce::TextButton::buttonOnColourId); }

    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
    FlashTextButton m_button{"Preview"};
};

} // namespace

TEST_F(FlashTextButtonTest, FlashesWhileItIsOn)
{
    EXPECT_FALSE(m_button.isTimerRunning());

    m_button.setToggleState(true, juce::dontSendNotification);
    EXPECT_TRUE(m_button.isTimerRunning());
    EXPECT_EQ(m_button.getTimerInterval(), 800);
    EXPECT_EQ(onColour(), toColour(Palette::orange));

    m_button.timerCallback();
    // 255 and 173, each divided by 1.4.
    EXPECT_NEAR(onColour().getRed(), 182, 1);
    EXPECT_NEAR(onColour().getGreen(), 123, 1);
    EXPECT_EQ(onColour().getBlue(), 0);
    EXPECT_EQ(onColour().getAlpha(), 255);
    m_button.timerCallback();
    EXPECT_EQ(onColour(), toColour(Palette::orange));
}

TEST_F(FlashTextButtonTest, EndsWithTheSteadyColourWhenItIsTurnedOffDimmed)
{
    m_button.setToggleState(true, juce::dontSendNotification);
    m_button.timerCallback();

    m_button.setToggleState(false, juce::dontSendNotification);

    EXPECT_FALSE(m_button.isTimerRunning());
    EXPECT_EQ(onColour(), toColour(Palette::orange));
}

TEST_F(FlashTextButtonTest, FlashesAgainInTheSameColours)
{
    for (int round = 0; round < 3; ++round) {
        m_button.setToggleState(true, juce::sendNotification);
        m_button.timerCallback();
        m_button.setToggleState(false, juce::sendNotification);
    }

    EXPECT_EQ(onColour(), toColour(Palette::orange));
}

TEST_F(FlashTextButtonTest, KeepsItsSteadyColourWhenTheMouseComesWhileItIsDimmed)
{
    m_button.setToggleState(true, juce::dontSendNotification);
    m_button.timerCallback();

    m_button.setState(juce::Button::buttonOver);
    m_button.setState(juce::Button::buttonNormal);
    m_button.setToggleState(false, juce::dontSendNotification);

    EXPECT_EQ(onColour(), toColour(Palette::orange));
}
