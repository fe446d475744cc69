// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/PictureButton.h"

#include "gui/look/LookAndFeel.h"

#include <gtest/gtest.h>

using namespace cadrel::gui;

namespace {

using Symbol = ButtonPicture::Symbol;
constexpr Symbol AllSymbols[] = {Symbol::Plus, Symbol::Bin,  Symbol::Cog, Symbol::Floppy, Symbol::Folder,
                                 Symbol::Up,   Symbol::Down, Symbol::In,  Symbol::Out};

class PictureButtonTest : public testing::Test {
protected:
    /// Of what the button shows, on black.
    static double brightness(PictureButton& button)
    {
        const juce::Image image = button.createComponentSnapshot(button.getLocalBounds());
        double sum = 0.0;
        for (int y = 0; y < image.getHeight(); ++y) {
            for (int x = 0; x < image.getWidth(); ++x)
                sum += juce::Colours::black.overlaidWith(image.getPixelAt(x, y)).getPerceivedBrightness();
        }
        return sum;
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
};

} // namespace

TEST_F(PictureButtonTest, KeepsTheTitleThatItHas)
{
    PictureButton button("Clear Old Edl Button", Symbol::Bin);
    button.setTooltip("Delete EDL");
    button.setTooltip("The Old EDL is empty.");
    EXPECT_EQ(button.getTitle(), "Delete EDL");

    button.setTitle("Old EDL, Delete EDL");
    button.setTooltip("Delete EDL");
    EXPECT_EQ(button.getTitle(), "Old EDL, Delete EDL");
}

TEST_F(PictureButtonTest, HasItsTooltipAsTitle)
{
    PictureButton button("Load Old Edl Button", Symbol::Plus);

    button.setTooltip("Add EDL");

    EXPECT_EQ(button.getTooltip(), "Add EDL");
    EXPECT_EQ(button.getTitle(), "Add EDL");
    EXPECT_EQ(button.getName(), "Load Old Edl Button");
}

TEST_F(PictureButtonTest, HasASymbolWithinItsTileForEachPicture)
{
    for (const Symbol symbol : AllSymbols) {
        const ButtonPicture picture(symbol);

        EXPECT_FALSE(picture.path().isEmpty());
        EXPECT_TRUE(picture.bounds().reduced(1.0F).contains(picture.path().getBounds()))
            << static_cast<int>(symbol) << picture.path().getBounds().toString();
        EXPECT_NEAR(picture.path().getBounds().getCentreX(), picture.bounds().getCentreX(), 0.6F)
            << static_cast<int>(symbol);
        EXPECT_NEAR(picture.path().getBounds().getCentreY(), picture.bounds().getCentreY(), 0.6F)
            << static_cast<int>(symbol);
    }
}

TEST_F(PictureButtonTest, IsLighterWhenItIsPressedAndFainterWhenItIsDisabled)
{
    for (const Symbol symbol : AllSymbols) {
        PictureButton button("", symbol);
        button.setSize(32, 24);
        const double normal = brightness(button);

        button.setState(juce::Button::buttonOver);
        EXPECT_EQ(brightness(button), normal);
        button.setState(juce::Button::buttonDown);
        EXPECT_GT(brightness(button), 1.2 * normal);
        button.setState(juce::Button::buttonNormal);
        button.setEnabled(false);
        EXPECT_LT(brightness(button), 0.8 * normal);
    }
}

TEST_F(PictureButtonTest, KeepsItsProportionsInAnyBox)
{
    PictureButton button("", Symbol::Plus);
    button.setSize(100, 43);
    const juce::Image image = button.createComponentSnapshot(button.getLocalBounds());

    // 57 wide, in the middle.
    EXPECT_EQ(image.getPixelAt(20, 21).getAlpha(), 0);
    EXPECT_EQ(image.getPixelAt(22, 21).getAlpha(), 255);
    EXPECT_EQ(image.getPixelAt(78, 21).getAlpha(), 255);
    EXPECT_EQ(image.getPixelAt(80, 21).getAlpha(), 0);
}
