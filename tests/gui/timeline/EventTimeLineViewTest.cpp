// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/timeline/EventTimeLineView.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/Text.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/Pictures.h"

#include <gtest/gtest.h>

using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::core::Timecode;
using cadrel::gui::EventTimeLineView;
using cadrel::gui::Palette;
using cadrel::tests::expectPicture;
using cadrel::tests::makeEvent;

namespace {

class EventTimeLineViewTest : public testing::Test {
protected:
    EventTimeLineViewTest()
    {
        // That of the window at 1300 pixels, on its panel.
        m_panel.addAndMakeVisible(m_view);
        m_panel.setBounds(0, 0, 1056, 80);
        m_view.setBounds(0, 0, 1056, 80);
    }

    /// An event of frames from the start of the programme at one hour.
    std::shared_ptr<EventBase> add(int source, int destination, int length)
    {
        auto event = std::make_shared<EventBase>();
        event->setTimecodes(Timecode(90000 + source), Timecode(90000 + source + length), Timecode(90000 + destination),
                            Timecode(90000 + destination + length));
        m_list.add(event);
        return event;
    }
    juce::Image drawn() { return m_view.createComponentSnapshot(m_view.getLocalBounds(), true, 1.0F); }

    class Panel : public juce::Component {
        void paint(juce::Graphics& graphics) override { graphics.fillAll(cadrel::gui::toColour(Palette::panel)); }
    };

    cadrel::tests::TestProject m_project;
    juce::ScopedJuceInitialiser_GUI m_juce;
    juce::SharedResourcePointer<cadrel::gui::LookAndFeel> m_look;
    EventList m_list;
    Panel m_panel;
    EventTimeLineView m_view;
};

juce::Colour colour(cadrel::gui::PaletteColour colour)
{
    return cadrel::gui::toColour(colour);
}

} // namespace

TEST_F(EventTimeLineViewTest, HasNothingButTheNamesOfTheLanesWithoutEvents)
{
    m_view.setEvents(m_list);
    ASSERT_EQ(m_view.getNumChildComponents(), 2);
    const auto label = [&](int index) { return dynamic_cast<juce::Label*>(m_view.getChildComponent(index)); };
    EXPECT_EQ(label(0)->getName(), "SourceLabel");
    EXPECT_EQ(label(0)->getText(), "Source");
    EXPECT_EQ(label(0)->getBounds(), juce::Rectangle<int>(0, 0, 100, 35));
    EXPECT_EQ(label(1)->getName(), "DestinationLabel");
    EXPECT_EQ(label(1)->getText(), "Destination");
    EXPECT_EQ(label(1)->getBounds(), juce::Rectangle<int>(0, 45, 100, 35));
    EXPECT_EQ(label(1)->getFont(), cadrel::gui::getFont(1));
    EXPECT_FALSE(label(0)->isEditable());
    const juce::Image image = drawn();
    for (int x = 100; x < 1056; ++x)
        EXPECT_TRUE(image.getPixelAt(x, 17).isTransparent());
    expectPicture(m_panel, "timeline-empty");
}

TEST_F(EventTimeLineViewTest, DrawsAnEventOnBothLanes)
{
    // 956 pixels for 95.6 seconds.
    add(0, 1195, 1195);
    m_view.setEvents(m_list);
    const juce::Image image = drawn();
    EXPECT_EQ(image.getPixelAt(110, 17), colour(Palette::eventBlue));
    EXPECT_EQ(image.getPixelAt(100 + 477, 17), colour(Palette::eventBlue));
    EXPECT_TRUE(image.getPixelAt(100 + 478, 17).isTransparent());
    EXPECT_TRUE(image.getPixelAt(100 + 477, 60).isTransparent());
    EXPECT_EQ(image.getPixelAt(100 + 478, 60), colour(Palette::eventBlue));
    EXPECT_EQ(image.getPixelAt(1050, 60), colour(Palette::eventBlue));
    // The lanes are 35 high, and there are ten pixels between them.
    EXPECT_EQ(image.getPixelAt(300, 34), colour(Palette::eventBlue));
    EXPECT_TRUE(image.getPixelAt(300, 35).isTransparent());
    EXPECT_TRUE(image.getPixelAt(800, 44).isTransparent());
    EXPECT_EQ(image.getPixelAt(800, 45), colour(Palette::eventBlue));
    EXPECT_EQ(image.getPixelAt(800, 79), colour(Palette::eventBlue));
    expectPicture(m_panel, "timeline-one");
}

TEST_F(EventTimeLineViewTest, LeavesAPixelBetweenBlocksThatMeetUnlessTheyAreTooNarrow)
{
    // 956 pixels: the first event has ten, the second four, the third five.
    int at = 0;
    for (const int length : {10, 4, 5, 937}) {
        add(at, at, length);
        at += length;
    }
    m_view.setEvents(m_list);
    const juce::Image image = drawn();
    EXPECT_EQ(image.getPixelAt(108, 17), colour(Palette::eventBlue));
    EXPECT_TRUE(image.getPixelAt(109, 17).isTransparent());
    EXPECT_EQ(image.getPixelAt(110, 17), colour(Palette::eventBlue));
    EXPECT_EQ(image.getPixelAt(113, 17), colour(Palette::eventBlue));
    EXPECT_EQ(image.getPixelAt(117, 17), colour(Palette::eventBlue));
    EXPECT_TRUE(image.getPixelAt(118, 17).isTransparent());
    EXPECT_EQ(image.getPixelAt(119, 17), colour(Palette::eventBlue));
}

TEST_F(EventTimeLineViewTest, PlacesTheEventsAnewWhenItIsResized)
{
    add(0, 1000, 1000);
    m_view.setEvents(m_list);
    drawn();
    m_view.setSize(300, 80);
    const juce::Image image = drawn();
    EXPECT_EQ(image.getPixelAt(199, 17), colour(Palette::eventBlue));
    EXPECT_TRUE(image.getPixelAt(200, 17).isTransparent());
    EXPECT_EQ(image.getPixelAt(295, 60), colour(Palette::eventBlue));
}

TEST_F(EventTimeLineViewTest, DrawsNoEventWhereThereIsNoRoom)
{
    add(0, 1000, 1000);
    for (const int width : {100, 99, 1}) {
        m_view.setSize(width, 80);
        m_view.setEvents(EventList());
        const juce::Image empty = drawn();
        m_view.setEvents(m_list);
        const juce::Image image = drawn();
        for (int y = 0; y < 80; ++y) {
            for (int x = 0; x < width; ++x)
                ASSERT_EQ(image.getPixelAt(x, y), empty.getPixelAt(x, y)) << width << ": " << x << ", " << y;
        }
    }
    m_view.setSize(101, 80);
    EXPECT_EQ(drawn().getPixelAt(100, 17), colour(Palette::eventBlue));
}

TEST_F(EventTimeLineViewTest, TellsHighlightedAndVfxEventsApartByColourAndShape)
{
    add(0, 0, 1000)->setVfx(true);
    const auto selected = add(1000, 1000, 1000);
    add(2000, 2000, 390);
    m_view.setEvents(m_list);
    m_view.highlightEvents({selected});
    const juce::Image image = drawn();
    EXPECT_EQ(image.getPixelAt(300, 17), colour(Palette::eventTeal));
    EXPECT_EQ(image.getPixelAt(300, 27), colour(Palette::panel));
    EXPECT_EQ(image.getPixelAt(700, 17), colour(Palette::selection));
    EXPECT_EQ(image.getPixelAt(700, 0), colour(Palette::light));
    EXPECT_EQ(image.getPixelAt(700, 34), colour(Palette::light));
    EXPECT_EQ(image.getPixelAt(1000, 17), colour(Palette::eventBlue));
    m_view.highlightEvents({});
    EXPECT_EQ(drawn().getPixelAt(700, 17), colour(Palette::eventBlue));
}

TEST_F(EventTimeLineViewTest, ShowsNothingWithoutAFrameRate)
{
    add(0, 0, 1000);
    m_view.setEvents(m_list);
    const cadrel::tests::NoProject none;
    EXPECT_EQ(cadrel::tests::thrownBy([&] { m_view.setEvents(m_list); }), cadrel::util::Result::NotAvailable);
    EXPECT_TRUE(drawn().getPixelAt(300, 17).isTransparent());
}

namespace {

/// The lengths in frames of shots of a reel, as they come again and again.
constexpr int Lengths[] = {60, 34, 112, 25, 48, 205, 18, 77, 40, 150, 31, 9};

} // namespace

TEST_F(EventTimeLineViewTest, ShowsManyEvents)
{
    int at = 0;
    for (int index = 0; index < 60; ++index) {
        const int length = Lengths[index % 12];
        // A scene has moved to the end, and some shots are gone.
        const int source = index < 20 ? at + 1300 : (index < 40 ? at - 1200 : at + 200);
        add(source, at, length)->setVfx(index % 9 == 4);
        at += length + (index % 7 == 3 ? 50 : 0);
    }
    m_view.setEvents(m_list);
    expectPicture(m_panel, "timeline-many");
    m_view.highlightEvents({m_list.eventAt(4), m_list.eventAt(5), m_list.eventAt(45)});
    expectPicture(m_panel, "timeline-highlighted");
}

TEST_F(EventTimeLineViewTest, ShowsMoreEventsThanPixels)
{
    int at = 0;
    for (int index = 0; index < 5000; ++index) {
        const int length = Lengths[index % 12];
        add(at, at + (index > 2000 ? 3000 : 0), length)->setVfx(index > 3000 && index < 3300);
        at += length;
    }
    m_view.setEvents(m_list);
    m_view.highlightEvents({m_list.eventAt(1000)});
    expectPicture(m_panel, "timeline-dense");
}
