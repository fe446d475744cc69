// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/ButtonTile.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/PictureButton.h"
#include "gui/look/Text.h"
#include "gui/table/EventColumn.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/WindowOnScreen.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <functional>
#include <initializer_list>

using namespace cadrel::gui;

namespace {

/// What an operation of the look and feel draws on white.
class LookAndFeelDrawingTest : public testing::Test {
protected:
    juce::Image drawn(int width, int height, const std::function<void(juce::Graphics&)>& draw)
    {
        juce::Image image(juce::Image::RGB, width, height, true);
        juce::Graphics graphics(image);
        graphics.fillAll(juce::Colours::white);
        draw(graphics);
        return image;
    }

    juce::Image drawnButton(juce::Button& button, bool isDown)
    {
        button.setSize(40, 20);
        return drawn(40, 20, [&](juce::Graphics& graphics) {
            m_look.drawButtonBackground(graphics, button, {}, false, isDown);
        });
    }

    /// The first and the last row of the inner field, in the middle.
    static void expectShade(const juce::Image& image, juce::Colour top, juce::Colour bottom)
    {
        expectNear(image.getPixelAt(20, 0), juce::Colours::black);
        expectNear(image.getPixelAt(0, 10), juce::Colours::black);
        expectNear(image.getPixelAt(20, 1), top);
        expectNear(image.getPixelAt(20, 18), bottom);
        expectNear(image.getPixelAt(20, 19), juce::Colours::black);
    }

    static void expectNear(juce::Colour colour, juce::Colour expected)
    {
        EXPECT_NEAR(colour.getRed(), expected.getRed(), 4) << colour.toString();
        EXPECT_NEAR(colour.getGreen(), expected.getGreen(), 4) << colour.toString();
        EXPECT_NEAR(colour.getBlue(), expected.getBlue(), 4) << colour.toString();
    }

    static int countOf(const juce::Image& image, juce::Colour colour)
    {
        int count = 0;
        for (int y = 0; y < image.getHeight(); ++y) {
            for (int x = 0; x < image.getWidth(); ++x)
                count += image.getPixelAt(x, y) == colour ? 1 : 0;
        }
        return count;
    }

    /// From the first to the last column in which the two are not the same.
    static juce::Range<int> columnsThatDiffer(const juce::Image& one, const juce::Image& other)
    {
        juce::Range<int> columns;
        for (int y = 0; y < one.getHeight(); ++y) {
            for (int x = 0; x < one.getWidth(); ++x) {
                if (one.getPixelAt(x, y) != other.getPixelAt(x, y))
                    columns = columns.isEmpty() ? juce::Range<int>(x, x + 1) : columns.getUnionWith({x, x + 1});
            }
        }
        return columns;
    }

    /// A column of a table's header without a name.
    juce::Image bandOfAHeader()
    {
        return drawn(80, 20, [](juce::Graphics& graphics) {
            graphics.setColour(toColour(Palette::band));
            graphics.fillRect(2, 2, 76, 16);
        });
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    LookAndFeel m_look;
};

} // namespace

TEST_F(LookAndFeelDrawingTest, ShadesAButtonThatIsNeitherOnNorPressed)
{
    juce::TextButton button;

    expectShade(drawnButton(button, false), {155, 159, 162}, {116, 121, 125});
}

TEST_F(LookAndFeelDrawingTest, LightsAPressedButtonThatDoesNotToggle)
{
    juce::TextButton button;

    // 231, 232 and 233, each divided by 1.4.
    expectShade(drawnButton(button, true), {231, 232, 233}, {165, 166, 166});
}

TEST_F(LookAndFeelDrawingTest, ShadesAButtonThatIsOnInItsOnColour)
{
    juce::TextButton button;
    button.setClickingTogglesState(true);
    button.setToggleState(true, juce::dontSendNotification);

    // 163, 204 and 255, each divided by 1.4.
    expectShade(drawnButton(button, false), {163, 204, 255}, {116, 146, 182});
    expectShade(drawnButton(button, true), {163, 204, 255}, {116, 146, 182});
    button.setColour(juce::TextButton::buttonOnColourId, juce::Colour(255, 173, 0));
    expectShade(drawnButton(button, false), {255, 173, 0}, {182, 124, 0});
}

TEST_F(LookAndFeelDrawingTest, MarksAButtonThatIsOnWithADarkBarBesideItsColour)
{
    juce::TextButton button;
    button.setClickingTogglesState(true);
    const juce::Image off = drawnButton(button, false);
    button.setToggleState(true, juce::dontSendNotification);
    const juce::Image on = drawnButton(button, false);

    for (const int y : {16, 17}) {
        EXPECT_EQ(on.getPixelAt(20, y), juce::Colours::black);
        EXPECT_GT(off.getPixelAt(20, y).getBrightness(), 0.4F);
    }
    EXPECT_GT(on.getPixelAt(20, 15).getBrightness(), 0.4F);
    EXPECT_GT(on.getPixelAt(20, 18).getBrightness(), 0.4F);
    button.setEnabled(false);
    const juce::Image disabled = drawnButton(button, false);
    EXPECT_GT(disabled.getPixelAt(20, 16).getBrightness(), disabled.getPixelAt(20, 15).getBrightness() + 0.2F);
}

TEST_F(LookAndFeelDrawingTest, ShadesAPressedToggleInItsOnColour)
{
    juce::TextButton button;
    button.setClickingTogglesState(true);

    expectShade(drawnButton(button, true), {163, 204, 255}, {116, 146, 182});
}

TEST_F(LookAndFeelDrawingTest, DrawsTheButtonOfAComboBoxInItsColour)
{
    juce::ComboBox box;
    juce::TextButton button;
    box.addAndMakeVisible(button);
    box.setColour(juce::ComboBox::buttonColourId, juce::Colour(10, 200, 30));

    const juce::Image image = drawnButton(button, true);

    EXPECT_EQ(image.getPixelAt(0, 0), juce::Colours::black);
    EXPECT_EQ(image.getPixelAt(39, 19), juce::Colours::black);
    EXPECT_EQ(image.getPixelAt(1, 1), juce::Colour(10, 200, 30));
    EXPECT_EQ(image.getPixelAt(38, 18), juce::Colour(10, 200, 30));
}

TEST_F(LookAndFeelDrawingTest, SinksADisabledButton)
{
    juce::TextButton button;
    button.setEnabled(false);

    const juce::Image image = drawnButton(button, false);

    // Half of the frame's colour and half of black, on white.
    expectNear(image.getPixelAt(20, 0), {187, 188, 189});
    for (const int y : {1, 10, 18})
        expectNear(image.getPixelAt(20, y), {128, 128, 128});
}

/// As WCAG 2 defines it: from 1 for the same colour to 21.
double contrastOf(juce::Colour a, juce::Colour b)
{
    const auto linear = [](float channel) {
        return channel <= 0.04045F ? channel / 12.92 : std::pow((channel + 0.055) / 1.055, 2.4);
    };
    const auto luminance = [&](juce::Colour colour) {
        return 0.2126 * linear(colour.getFloatRed()) + 0.7152 * linear(colour.getFloatGreen()) +
               0.0722 * linear(colour.getFloatBlue());
    };
    const double low = std::min(luminance(a), luminance(b));
    const double high = std::max(luminance(a), luminance(b));
    return (high + 0.05) / (low + 0.05);
}

TEST_F(LookAndFeelDrawingTest, LetsTheTextOfADisabledButtonBeReadOnEachGround)
{
    juce::TextButton button("Generate");
    button.setSize(80, 24);
    button.setEnabled(false);
    for (const PaletteColour ground : {Palette::band, Palette::panel, Palette::sheet, opaque(7, 12, 16)}) {
        juce::Image image(juce::Image::RGB, 80, 24, false);
        juce::Graphics graphics(image);
        graphics.fillAll(toColour(ground));
        button.paintEntireComponent(graphics, true);
        const juce::Colour tile = image.getPixelAt(6, 12);

        EXPECT_GE(contrastOf(tile, tile.overlaidWith(disabledInk(false))), 3.0) << tile.toString();
    }
}

TEST_F(LookAndFeelDrawingTest, DimsButtonsMoreWhereAllAroundThemIsDisabled)
{
    juce::Component parent;
    parent.setSize(80, 24);
    juce::TextButton text("HHHHH");
    PictureButton picture("bin", ButtonPicture::Symbol::Bin);
    for (juce::Button* const button : std::initializer_list<juce::Button*>{&text, &picture}) {
        parent.addAndMakeVisible(*button);
        button->setBounds(parent.getLocalBounds());
        button->setEnabled(false);
        const auto lightest = [&] {
            const juce::Image image = parent.createComponentSnapshot(parent.getLocalBounds());
            float light = 0.0F;
            for (int x = 4; x < 76; ++x) {
                for (int y = 4; y < 20; ++y)
                    light = std::max(light, image.getPixelAt(x, y).getBrightness());
            }
            return light;
        };
        const float alone = lightest();
        parent.setEnabled(false);
        EXPECT_LT(lightest(), alone - 0.1F);
        parent.setEnabled(true);
        parent.removeChildComponent(button);
    }
}

TEST_F(LookAndFeelDrawingTest, WritesButtonsInTheColourOfTheirStateAndDisabledOnesInALightOne)
{
    juce::TextButton button("HHHHH");
    button.setSize(80, 20);
    button.setColour(juce::TextButton::textColourOffId, juce::Colours::red);
    button.setColour(juce::TextButton::textColourOnId, juce::Colours::blue);
    const auto darkest = [&] {
        const juce::Image image =
            drawn(80, 20, [&](juce::Graphics& graphics) { m_look.drawButtonText(graphics, button, false, false); });
        juce::Colour found = juce::Colours::white;
        for (int y = 0; y < 20; ++y) {
            for (int x = 0; x < 80; ++x) {
                const juce::Colour pixel = image.getPixelAt(x, y);
                if (pixel.getPerceivedBrightness() < found.getPerceivedBrightness())
                    found = pixel;
            }
        }
        return found;
    };

    expectNear(darkest(), juce::Colours::red);
    button.setToggleState(true, juce::dontSendNotification);
    expectNear(darkest(), juce::Colours::blue);
    button.setEnabled(false);
    // 70 % of 201, 211, 220 on white.
    expectNear(darkest(), {217, 224, 231});
    EXPECT_EQ(m_look.getTextButtonFont(button, 20), getFont(6));
}

TEST_F(LookAndFeelDrawingTest, DrawsATickBoxWithATickOnlyWhereItIsTicked)
{
    juce::ToggleButton button;
    const auto box = [&](bool isTicked) {
        return drawn(30, 30, [&](juce::Graphics& graphics) {
            m_look.drawTickBox(graphics, button, 5.0F, 5.0F, 20.0F, 20.0F, isTicked, true, false, false);
        });
    };

    // 16 x 16 at 5, 7.
    EXPECT_EQ(countOf(box(false), juce::Colours::black), 16 * 16);
    EXPECT_EQ(box(false).getPixelAt(5, 7), juce::Colours::black);
    EXPECT_EQ(box(false).getPixelAt(20, 22), juce::Colours::black);
    // The tick turns at 35 % and 70 %.
    EXPECT_EQ(box(true).getPixelAt(12, 18), toColour(Palette::sheet));
    EXPECT_EQ(box(true).getPixelAt(5, 7), juce::Colours::black);
}

TEST_F(LookAndFeelDrawingTest, HasATickTwiceAsWideAsHigh)
{
    const juce::Rectangle<float> tick = m_look.getTickShape(9.0F).getBounds();

    EXPECT_NEAR(tick.getWidth(), 18.0F, 0.01F);
    EXPECT_NEAR(tick.getHeight(), 9.0F, 0.01F);
}

TEST_F(LookAndFeelDrawingTest, DrawsAComboBoxWithItsArrowWhereItIsEnabled)
{
    juce::ComboBox box;
    const auto drawnBox = [&](bool isDown) {
        return drawn(60, 20, [&](juce::Graphics& graphics) {
            m_look.drawComboBox(graphics, 60, 20, isDown, 40, 0, 20, 20, box);
        });
    };

    // The triangle is below the middle of the button's upper half.
    const juce::Image enabled = drawnBox(false);
    EXPECT_EQ(enabled.getPixelAt(20, 10), juce::Colours::black);
    EXPECT_EQ(enabled.getPixelAt(42, 15), juce::Colour(121, 122, 123));
    EXPECT_EQ(enabled.getPixelAt(50, 9), juce::Colours::black);
    EXPECT_EQ(enabled.getPixelAt(59, 10), juce::Colours::black);
    // 255 less 121 is 134, which is 95.7 when it is divided by 1.4.
    EXPECT_NEAR(drawnBox(true).getPixelAt(42, 15).getRed(), 159, 1);
    box.setEnabled(false);
    EXPECT_NE(drawnBox(false).getPixelAt(50, 9), juce::Colours::black);
    EXPECT_EQ(m_look.getComboBoxFont(box), getFont(2));
}

TEST_F(LookAndFeelDrawingTest, DrawsTheGroundOfAMenuWithAnOutline)
{
    const juce::Image image =
        drawn(50, 40, [&](juce::Graphics& graphics) { m_look.drawPopupMenuBackground(graphics, 50, 40); });

    EXPECT_EQ(image.getPixelAt(1, 1), juce::Colour(240, 240, 240));
    // 240 under black at 60 %.
    expectNear(image.getPixelAt(0, 20), {96, 96, 96});
    expectNear(image.getPixelAt(49, 39), {96, 96, 96});
    EXPECT_EQ(m_look.getPopupMenuFont().getHeight(), 16.0F);
    EXPECT_FALSE(m_look.getPopupMenuFont().isBold());
}

TEST_F(LookAndFeelDrawingTest, HighlightsAnItemOfAMenuAndFadesADisabledOne)
{
    const auto item = [&](bool isActive, bool isHighlighted) {
        return drawn(100, 20, [&](juce::Graphics& graphics) {
            m_look.drawPopupMenuItem(graphics, {100, 20}, false, isActive, isHighlighted, false, false, "HHHHHH", {},
                                     nullptr, nullptr);
        });
    };
    const auto darkest = [](const juce::Image& image) {
        int found = 255;
        for (int y = 0; y < 20; ++y) {
            for (int x = 0; x < 100; ++x)
                found = std::min<int>(found, image.getPixelAt(x, y).getGreen());
        }
        return found;
    };

    EXPECT_EQ(item(true, false).getPixelAt(5, 5), juce::Colours::white);
    // 163, 204 and 255 at 40 % on white.
    expectNear(item(true, true).getPixelAt(5, 2), {218, 235, 255});
    EXPECT_LT(darkest(item(true, false)), 20);
    EXPECT_NEAR(darkest(item(false, false)), 178, 10);
}

TEST_F(LookAndFeelDrawingTest, DrawsASeparatorAsADarkAndALightLine)
{
    const juce::Image image = drawn(40, 10, [&](juce::Graphics& graphics) {
        graphics.fillAll(juce::Colours::grey);
        m_look.drawPopupMenuItem(graphics, {40, 10}, true, true, false, false, false, {}, {}, nullptr, nullptr);
    });

    const juce::Colour ground = juce::Colours::grey;
    expectNear(image.getPixelAt(20, 4), ground.overlaidWith(juce::Colour(0x33000000)));
    expectNear(image.getPixelAt(20, 5), ground.overlaidWith(juce::Colour(0x66ffffff)));
    EXPECT_EQ(image.getPixelAt(20, 3), ground);
    EXPECT_EQ(image.getPixelAt(20, 6), ground);
}

TEST_F(LookAndFeelDrawingTest, DrawsALabelsGroundAndOutlineAndItsTextWhileNobodyEditsIt)
{
    juce::Label label({}, "HHHH");
    label.setSize(80, 20);
    label.setFont(getFont(1));
    label.setColour(juce::Label::backgroundColourId, juce::Colours::black);
    label.setColour(juce::Label::outlineColourId, juce::Colours::red);
    label.setColour(juce::Label::textColourId, juce::Colours::lime);
    const auto greenest = [&] {
        const juce::Image image = drawn(80, 20, [&](juce::Graphics& graphics) { m_look.drawLabel(graphics, label); });
        EXPECT_EQ(image.getPixelAt(0, 0), juce::Colours::red);
        EXPECT_EQ(image.getPixelAt(79, 19), juce::Colours::red);
        EXPECT_EQ(image.getPixelAt(1, 1), juce::Colours::black);
        int found = 0;
        for (int y = 1; y < 19; ++y) {
            for (int x = 1; x < 79; ++x)
                found = std::max<int>(found, image.getPixelAt(x, y).getGreen());
        }
        return found;
    };

    EXPECT_GT(greenest(), 240);
    label.setEnabled(false);
    EXPECT_NEAR(greenest(), 128, 8);
    label.setEnabled(true);
    cadrel::tests::FocusedWindow window(80, 20);
    window.addAndMakeVisible(label);
    label.showEditor();
    EXPECT_EQ(greenest(), 0);
}

TEST_F(LookAndFeelDrawingTest, FillsAProgressBarUpToTheProgress)
{
    double progress = 0.0;
    juce::ProgressBar bar(progress);
    const juce::Colour done(152, 177, 201);
    const auto filled = [&](double part) {
        const juce::Image image =
            drawn(100, 10, [&](juce::Graphics& graphics) { m_look.drawProgressBar(graphics, bar, 100, 10, part, {}); });
        EXPECT_EQ(countOf(image, done) + countOf(image, juce::Colours::black), 1000);
        return countOf(image, done);
    };

    EXPECT_EQ(filled(0.0), 0);
    EXPECT_EQ(filled(0.3), 300);
    EXPECT_EQ(filled(1.0), 1000);
    for (const double unknown : {-0.1, 1.1, std::nan("")}) {
        // At some time the moving block is there as a whole.
        const auto end = juce::Time::getMillisecondCounter() + 5000;
        int block = filled(unknown);
        while (block != 250 && juce::Time::getMillisecondCounter() < end) {
            EXPECT_LE(block, 250) << unknown;
            block = filled(unknown);
        }
        EXPECT_EQ(block, 250) << unknown;
    }
}

TEST_F(LookAndFeelDrawingTest, MovesABlockWhereTheProgressIsUnknown)
{
    double progress = -1.0;
    juce::ProgressBar bar(progress);
    const auto picture = [&] {
        return drawn(100, 10,
                     [&](juce::Graphics& graphics) { m_look.drawProgressBar(graphics, bar, 100, 10, -1.0, {}); });
    };
    const auto startOf = [](const juce::Image& image) {
        int x = 0;
        while (x < 100 && image.getPixelAt(x, 5) == juce::Colours::black)
            ++x;
        return x;
    };

    const int first = startOf(picture());
    const auto end = juce::Time::getMillisecondCounter() + 5000;
    while (startOf(picture()) == first && juce::Time::getMillisecondCounter() < end)
        juce::Thread::yield();

    EXPECT_NE(startOf(picture()), first);
}

TEST_F(LookAndFeelDrawingTest, DrawsATableHeaderAsABandWithItsName)
{
    juce::TableHeaderComponent header;
    const juce::Image image = drawn(80, 20, [&](juce::Graphics& graphics) {
        m_look.drawTableHeaderColumn(graphics, header, {}, 1, 80, 20, false, false, 0);
    });

    EXPECT_EQ(countOf(image, toColour(Palette::band)), 76 * 16);
    EXPECT_EQ(image.getPixelAt(2, 2), toColour(Palette::band));
    EXPECT_EQ(image.getPixelAt(77, 17), toColour(Palette::band));
    EXPECT_EQ(image.getPixelAt(1, 1), juce::Colours::white);
}

TEST_F(LookAndFeelDrawingTest, WritesTheNameOfATableColumnSixPixelsFromTheLeft)
{
    juce::TableHeaderComponent header;
    const juce::Image image = drawn(80, 20, [&](juce::Graphics& graphics) {
        m_look.drawTableHeaderColumn(graphics, header, "HHHH", 1, 80, 20, false, false, 0);
    });
    const juce::Image expected = drawn(80, 20, [](juce::Graphics& graphics) {
        graphics.setColour(toColour(Palette::band));
        graphics.fillRect(2, 2, 76, 16);
        drawText(graphics, "HHHH", 6.0F, 0.0F, 76.0F, 20.0F, juce::Justification::centredLeft, getFont(7),
                 juce::Colours::black, false);
    });

    EXPECT_EQ(columnsThatDiffer(image, expected), (juce::Range<int>()));
    const juce::Range<int> written = columnsThatDiffer(image, bandOfAHeader());
    EXPECT_GE(written.getStart(), 6);
    EXPECT_LE(written.getStart(), 8);
}

TEST_F(LookAndFeelDrawingTest, EndsTheNameOfATableColumnBeforeItsArrow)
{
    juce::TableHeaderComponent header;
    const auto withName = [&](const juce::String& name) {
        return drawn(80, 20, [&](juce::Graphics& graphics) {
            m_look.drawTableHeaderColumn(graphics, header, name, 1, 80, 20, false, false,
                                         juce::TableHeaderComponent::sortedForwards);
        });
    };
    const juce::Range<int> arrow = columnsThatDiffer(withName({}), bandOfAHeader());

    // A letter of a few pixels after the other, so that some name nearly fills its room.
    for (int letters = 1; letters < 40; ++letters) {
        const auto name = juce::String::repeatedString("i", letters) + "H";
        EXPECT_LE(columnsThatDiffer(withName(name), withName({})).getEnd(), arrow.getStart()) << name;
    }
    EXPECT_GT(columnsThatDiffer(withName("HHHHHHHHHHHHHHHHHHHH"), withName({})).getEnd(), 50);
}

TEST_F(LookAndFeelDrawingTest, HasRoomForTheNameOfEachSortedColumnAtItsLeastWidth)
{
    juce::TableHeaderComponent header;
    const auto drawnIn = [&](int width, const juce::String& name) {
        return drawn(300, 20, [&](juce::Graphics& graphics) {
            m_look.drawTableHeaderColumn(graphics, header, name, 1, width, 20, false, false,
                                         juce::TableHeaderComponent::sortedForwards);
        });
    };
    const auto expectRoom = [&](const juce::String& name, int width) {
        const juce::Range<int> whole = columnsThatDiffer(drawnIn(300, name), drawnIn(300, {}));
        EXPECT_EQ(columnsThatDiffer(drawnIn(width, name), drawnIn(width, {})), whole) << name;
    };

    for (const EventColumn& column : EventColumn::all())
        expectRoom(juce::String(EventColumn::name(column.id).c_str()), column.width);
    expectRoom("Bl.", EventColumn::all()[EventColumn::Transition - 1].width);
}

TEST_F(LookAndFeelDrawingTest, PointsUpWhereValuesRiseDownTheTable)
{
    juce::TableHeaderComponent header;
    const auto widthOfArrowAt = [&](int flags, int y) {
        const juce::Image image = drawn(80, 20, [&](juce::Graphics& graphics) {
            m_look.drawTableHeaderColumn(graphics, header, {}, 1, 80, 20, false, false, flags);
        });
        int width = 0;
        for (int x = 60; x < 78; ++x)
            width += image.getPixelAt(x, y) != toColour(Palette::band) ? 1 : 0;
        return width;
    };

    EXPECT_LT(widthOfArrowAt(juce::TableHeaderComponent::sortedBackwards, 8),
              widthOfArrowAt(juce::TableHeaderComponent::sortedBackwards, 12));
    EXPECT_GT(widthOfArrowAt(juce::TableHeaderComponent::sortedForwards, 8),
              widthOfArrowAt(juce::TableHeaderComponent::sortedForwards, 12));
    EXPECT_EQ(widthOfArrowAt(0, 10), 0);
}

TEST_F(LookAndFeelDrawingTest, GivesTooltipsItsLook)
{
    juce::TooltipWindow tooltips;

    EXPECT_EQ(&tooltips.getLookAndFeel(), &m_look);
}

TEST(LookAndFeelOnScreen, GivesMenusItsLook)
{
    cadrel::tests::WindowOnScreen window;
    juce::PopupMenu menu;
    menu.addItem(1, "Harbour");
    const int before = juce::Desktop::getInstance().getNumComponents();

    menu.showMenuAsync(juce::PopupMenu::Options().withTargetComponent(window.content()));
    window.serve();

    auto& desktop = juce::Desktop::getInstance();
    ASSERT_EQ(desktop.getNumComponents(), before + 1);
    juce::Component* shown = nullptr;
    for (int i = 0; i < desktop.getNumComponents(); ++i) {
        if (desktop.getComponent(i) != &window.content())
            shown = desktop.getComponent(i);
    }
    ASSERT_NE(shown, nullptr);
    EXPECT_NE(dynamic_cast<LookAndFeel*>(&shown->getLookAndFeel()), nullptr);
    EXPECT_EQ(&shown->getLookAndFeel(), &window.content().getLookAndFeel());
    juce::PopupMenu::dismissAllActiveMenus();
    window.serve();
}
