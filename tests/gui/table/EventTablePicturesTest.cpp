// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/Text.h"
#include "gui/table/EventColumn.h"
#include "tests/gui/table/ShownTable.h"
#include "tests/support/window/MessagePump.h"
#include "tests/support/window/Pictures.h"

#include <gtest/gtest.h>

using cadrel::core::EventFlaw;
using cadrel::core::TransitionType;
using cadrel::gui::EventColumn;
using cadrel::gui::RowSet;
using cadrel::tests::expectPicture;
using cadrel::tests::pumpMessages;

namespace {

/// Ten events of a reel, on the table of the change list at 1300 pixels of window.
class EventTablePicturesTest : public cadrel::tests::ShownTable {
protected:
    void SetUp() override
    {
        const char* const clips[] = {"42A-1 Pier, wide",  "42A-3 Maren",      "43-2 Boat",  "43-5 Oars",
                                     "44-1 Reeds",        "44-2 Reeds, slow", "45-1 Gulls", "45-7 Gulls, high",
                                     "46-1 Maren, close", "46-3 Hands"};
        std::size_t index = 0;
        for (const char* const clip : clips) {
            const auto event = add(index % 2 == 0 ? "A017C004" : "B021C011");
            event->setClipName(clip);
            event->setEdlFileName("reel3_v12.edl");
            event->setTransitionType(index == 4 ? TransitionType::Dissolve : TransitionType::Cut);
            ++index;
        }
        m_table.setBounds(0, 0, 1056, 200);
    }

    void expectTable(const std::string& name)
    {
        pumpMessages();
        // What a component finds out of its width comes with the messages.
        EXPECT_FALSE(m_table.getHorizontalScrollBar().isVisible());
        expectPicture(m_table, name);
    }
};

} // namespace

TEST_F(EventTablePicturesTest, Loaded)
{
    show();
    expectTable("table-loaded");
}

TEST_F(EventTablePicturesTest, Empty)
{
    list().clear();
    show();
    expectTable("table-empty");
}

TEST_F(EventTablePicturesTest, Selected)
{
    show();
    list().at(2).setVfx(true);
    list().at(6).addFlaw(EventFlaw::NotVideoEvent);
    m_model->reload(list());
    m_model->selectRows(RowSet::parse("1;2;3;6", 10));
    expectTable("table-selected");
}

TEST_F(EventTablePicturesTest, Highlighted)
{
    show();
    m_model->selectRows(RowSet::parse("3", 10));
    m_model->setHighlight({list().eventAt(2), list().eventAt(3), list().eventAt(4)});
    expectTable("table-highlighted");
}

TEST_F(EventTablePicturesTest, Flawed)
{
    list().at(1).addFlaw(EventFlaw::NotVideoEvent);
    list().at(4).setDst({1, 0, 20, 99}, {1, 0, 25, 0});
    list().at(5).addFlaw(EventFlaw::RollNameInvalid);
    show();
    expectTable("table-flawed");
}

TEST_F(EventTablePicturesTest, Vfx)
{
    list().at(1).setVfx(true);
    list().at(2).setVfx(true);
    list().at(2).addFlaw(EventFlaw::NotVideoEvent);
    list().at(5).setVfx(true);
    show();
    m_model->setHighlight({list().eventAt(5)});
    expectTable("table-vfx");
}

TEST_F(EventTablePicturesTest, LongNames)
{
    list().at(0).setClipName(
        "The clip name of a shot that somebody has described at length, with the lens and the weather");
    list().at(1).setEdlFileName("the_name_of_the_list_with_the_date_and_all_of_the_initials_v12_final_final.edl");
    list().at(2).setRollName("A017C004_20261122_A_ROLL_WITH_A_LONG_NAME");
    list().at(3).setClipName("K\xfcste, two\nlines");
    list().at(4).setClipName("");
    list().at(5).setClipName("Küste – Möwen über der Brücke");
    list().at(6).setEventNumber(99999);
    show();
    // That of the old and the new list.
    m_table.setBounds(0, 0, 614, 200);
    expectTable("table-long-names");
}

TEST_F(EventTablePicturesTest, Sorted)
{
    show();
    m_model->selectRows(RowSet::parse("0;1", 10));
    m_model->applySort(EventColumn::Roll, true);
    expectTable("table-sorted");
}

TEST_F(EventTablePicturesTest, TheDotTellsTheStateByColourAndByAMark)
{
    using cadrel::gui::Palette;
    show();
    list().at(1).addFlaw(EventFlaw::NotVideoEvent);
    // A dot of fifty pixels from 25, 5 on, with a ring of one pixel.
    const auto pixel = [this](int row, int x, int y) {
        juce::Image image(juce::Image::ARGB, 100, 60, true);
        juce::Graphics graphics(image);
        m_model->paintCell(graphics, row, EventColumn::State, 100, 60, false);
        return image.getPixelAt(x, y);
    };
    const auto colour = [](cadrel::gui::PaletteColour ofPalette) { return cadrel::gui::toColour(ofPalette); };
    ASSERT_TRUE(m_model->getSpokenCell(0, EventColumn::State) == "Valid");
    for (const int row : {0, 1}) {
        EXPECT_EQ(pixel(row, 24, 30).getAlpha(), 0) << row;
        // The ring covers nearly all of this pixel.
        const juce::Colour ring = pixel(row, 25, 30);
        const juce::Colour dark = colour(row == 0 ? Palette::darkGreen : Palette::darkRed);
        EXPECT_NEAR(ring.getRed(), dark.getRed(), 2) << row;
        EXPECT_NEAR(ring.getGreen(), dark.getGreen(), 2) << row;
        EXPECT_NEAR(ring.getBlue(), dark.getBlue(), 2) << row;
        EXPECT_GT(ring.getAlpha(), 240) << row;
        EXPECT_EQ(pixel(row, 27, 30), colour(row == 0 ? Palette::green : Palette::red)) << row;
        EXPECT_EQ(pixel(row, 50, 35), colour(row == 0 ? Palette::green : Palette::red)) << row;
        // The stroke and the point of the exclamation mark.
        EXPECT_EQ(pixel(row, 50, 20), colour(row == 0 ? Palette::green : Palette::light)) << row;
        EXPECT_EQ(pixel(row, 50, 42), colour(row == 0 ? Palette::green : Palette::light)) << row;
    }
}
