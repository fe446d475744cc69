// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/Text.h"

#include "gui/look/LookAndFeel.h"
#include "tests/support/ThrownResult.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <string>

using namespace cadrel::gui;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace {

class TextTest : public testing::Test {
protected:
    /// Where the text has left something: white on black, with 20 free pixels around the box.
    juce::Rectangle<int> drawnIn(const juce::String& text, float boxWidth, bool shorten,
                                 juce::Justification justification = juce::Justification::centredLeft,
                                 const juce::Font& font = getFont(5))
    {
        juce::Image image(juce::Image::RGB, 400, 60, true);
        juce::Graphics graphics(image);
        drawText(graphics, text, 20.0F, 20.0F, boxWidth, 20.0F, justification, font, juce::Colours::white, shorten);
        juce::Rectangle<int> drawn;
        for (int y = 0; y < image.getHeight(); ++y) {
            for (int x = 0; x < image.getWidth(); ++x) {
                if (image.getPixelAt(x, y) != juce::Colours::black)
                    drawn = drawn.getUnion({x, y, 1, 1});
            }
        }
        return drawn;
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
};

} // namespace

TEST_F(TextTest, HasTheFontsOfTheTableInOneFamily)
{
    const juce::Font title = getFont(9);

    EXPECT_EQ(title.getTypefaceName(), FontFamily);
    EXPECT_TRUE(title.isBold());
    EXPECT_FLOAT_EQ(title.getHeight(), 16.0F);
    EXPECT_FALSE(getFont(5).isBold());
    EXPECT_FLOAT_EQ(getFont(5).getHeight(), 12.0F);
}

TEST_F(TextTest, HasNoFontOfIndexEightOrOutsideOfTheTable)
{
    for (const int index : {-1, 8, 14})
        EXPECT_EQ(thrownBy([&] { getFont(index); }), Result::InvalidArgument) << index;
}

TEST_F(TextTest, MakesColoursOfThePalette)
{
    EXPECT_EQ(toColour(Palette::orange), juce::Colour::fromRGB(255, 173, 0));
    EXPECT_EQ(toColour(Palette::sheetShade), juce::Colour(0x3a899593));
}

TEST_F(TextTest, DrawsATextThatFitsAsItIs)
{
    const juce::String name = "Harbour";
    const int width = getFont(5).getStringWidth(name);

    EXPECT_EQ(drawnIn(name, 200.0F, true), drawnIn(name, 200.0F, false));
    EXPECT_GE(drawnIn(name, 200.0F, true).getWidth(), width - 3);
    EXPECT_LE(drawnIn(name, 200.0F, true).getWidth(), width + 1);
}

TEST_F(TextTest, DrawsOneLineInTheMiddleOfItsBox)
{
    const juce::Rectangle<int> drawn = drawnIn("HHH", 200.0F, false, juce::Justification::centred);

    EXPECT_NEAR(drawn.getCentreX(), 120, 2);
    EXPECT_NEAR(drawn.getCentreY(), 30, 2);
    EXPECT_LT(drawn.getHeight(), 12);
}

TEST_F(TextTest, CutsATextThatIsTooWideForItsBox)
{
    const juce::String name = "A clip name that is far too long for the box";

    EXPECT_GT(drawnIn(name, 70.0F, false).getRight(), 20 + 70);
    EXPECT_LE(drawnIn(name, 70.0F, true).getRight(), 20 + 70);
    EXPECT_GT(drawnIn(name, 70.0F, true).getRight(), 20 + 70 - 20);
}

TEST_F(TextTest, CutsEachFontForItself)
{
    const juce::String name = "A clip name that is too long";
    const juce::Font plain = getFont(5);
    const auto isCut = [&](const juce::Font& font) {
        const auto left = juce::Justification::centredLeft;
        return drawnIn(name, 100.0F, true, left, font) != drawnIn(name, 100.0F, false, left, font);
    };

    EXPECT_TRUE(isCut(plain));
    EXPECT_FALSE(isCut(plain.withHorizontalScale(0.5F)));
    EXPECT_FALSE(isCut(plain.withExtraKerningFactor(-0.2F)));
}

TEST_F(TextTest, DrawsTheDotsAloneInABoxOfTenPixels)
{
    EXPECT_EQ(drawnIn("Harbour", 10.0F, true), drawnIn("...", 100.0F, false));
}

TEST_F(TextTest, DrawsNothingForAnEmptyText)
{
    EXPECT_TRUE(drawnIn({}, 100.0F, true).isEmpty());
    EXPECT_TRUE(drawnIn({}, 5.0F, true).isEmpty());
}

TEST_F(TextTest, DrawsALongNameWithoutDelay)
{
    const juce::String name = juce::String::repeatedString("W", 1800);

    // Each box is another one, so that nothing is remembered.
    const double start = juce::Time::getMillisecondCounterHiRes();
    for (int paint = 0; paint < 20; ++paint)
        drawnIn(name, 60.0F + static_cast<float>(paint), true);
    const double onePaint = (juce::Time::getMillisecondCounterHiRes() - start) / 20.0;

    // A hundredth of what dropping letter after letter took.
    EXPECT_LT(onePaint, 25.0);
}
