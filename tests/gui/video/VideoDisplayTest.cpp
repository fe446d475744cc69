// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoDisplay.h"

#include "gui/look/LookAndFeel.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/GermanTexts.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/TestVideo.h"

#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Timecode;
using gui::VideoDisplay;
using gui::VideoProviderBase;

constexpr std::size_t Old = VideoProviderBase::OldSide;
constexpr std::size_t New = VideoProviderBase::NewSide;

class VideoDisplayTest : public testing::Test {
protected:
    juce::Component& named(const std::string& name) const
    {
        for (juce::Component* const component : m_display->getChildren()) {
            if (component->getName() == juce::String(name))
                return *component;
        }
        throw std::runtime_error("there is no " + name);
    }
    const juce::Image& imageOf(const std::string& name) const
    {
        return dynamic_cast<juce::ImageComponent&>(named(name)).getImage();
    }
    std::string textOf(const std::string& name) const
    {
        return dynamic_cast<juce::Label&>(named(name)).getText().toStdString();
    }
    std::string times() const { return textOf("old time") + " " + textOf("new time"); }
    bool showsPlaceholders() const
    {
        const juce::Colour expected = gui::toColour(gui::Palette::band).darker(0.4F);
        for (const char* const name : {"Old Image", "New Image"}) {
            const juce::Image& image = imageOf(name);
            if (image.getBounds() != juce::Rectangle<int>(0, 0, 888, 500) || image.getFormat() != juce::Image::RGB ||
                image.getPixelAt(0, 0) != expected || image.getPixelAt(887, 499) != expected)
                return false;
        }
        return true;
    }
    bool showsPicturesOf(TestVideo& video) const
    {
        return imageOf("Old Image") == video.getImage(Old) && imageOf("New Image") == video.getImage(New);
    }
    /// As the window does for a selected change.
    void showFrames(const char* oldTime, const char* newTime, bool lastFrame)
    {
        m_display->setActive(true);
        m_display->setFrames(Timecode(oldTime), Timecode(newTime), lastFrame);
    }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    TestProject m_project;
    RecordingAlerts m_alerts;
    std::shared_ptr<TestVideo> m_video = std::make_shared<TestVideo>();
    std::unique_ptr<VideoDisplay> m_display = std::make_unique<VideoDisplay>();
};

TEST_F(VideoDisplayTest, StartsInactiveAtZero)
{
    EXPECT_FALSE(m_display->isActive());
    EXPECT_EQ(times(), "00:00:00:00 00:00:00:00");
    EXPECT_TRUE(showsPlaceholders());
}

TEST_F(VideoDisplayTest, HasItsPlacesAtItsOwnSizeAndAtOthers)
{
    // Width, height; old image, new image, old time, new time.
    struct Case {
        int width;
        int height;
        juce::Rectangle<int> places[4];
    };
    const std::vector<Case> cases{
        {300, 272, {{8, 95, 284, 38}, {8, 193, 284, 38}, {75, 133, 150, 24}, {75, 232, 150, 24}}},
        {204, 349, {{8, 95, 188, 77}, {8, 232, 188, 77}, {27, 172, 150, 24}, {27, 309, 150, 24}}},
        {404, 574, {{8, 95, 388, 189}, {8, 344, 388, 189}, {127, 284, 150, 24}, {127, 534, 150, 24}}},
    };
    EXPECT_EQ(m_display->getLocalBounds(), juce::Rectangle<int>(0, 0, 300, 272));
    for (const Case& size : cases) {
        m_display->setSize(size.width, size.height);
        const char* const names[4] = {"Old Image", "New Image", "old time", "new time"};
        for (std::size_t index = 0; index < std::size(names); ++index)
            EXPECT_EQ(named(names[index]).getBounds().toString(), size.places[index].toString())
                << names[index] << " at " << size.height;
    }
}

TEST_F(VideoDisplayTest, AsksForThePicturesOfAnInPoint)
{
    m_display->setProvider(m_video);

    showFrames("01:00:10:00", "01:00:08:12", false);

    EXPECT_EQ(m_video->request(Old).time, 3610.0);
    EXPECT_EQ(m_video->request(New).time, 3608.48);
    EXPECT_FALSE(m_video->request(Old).lastFrame);
    EXPECT_EQ(times(), "01:00:10:00 01:00:08:12");
}

TEST_F(VideoDisplayTest, AsksForTheFramesBeforeAnOutPointAndShowsTheOutPoint)
{
    m_display->setProvider(m_video);

    showFrames("01:00:10:00", "01:00:08:12", true);

    EXPECT_EQ(m_video->request(Old).time, 3609.96);
    EXPECT_EQ(m_video->request(New).time, 3608.44);
    EXPECT_TRUE(m_video->request(Old).lastFrame);
    EXPECT_TRUE(m_video->request(New).lastFrame);
    EXPECT_EQ(times(), "01:00:10:00 01:00:08:12");
}

TEST_F(VideoDisplayTest, AnOutPointAtZeroStaysOnItsDay)
{
    m_display->setProvider(m_video);

    showFrames("00:00:00:00", "00:00:00:01", true);

    EXPECT_EQ(m_video->request(Old).time, 0.0);
    EXPECT_EQ(m_video->request(New).time, 0.0);
}

TEST_F(VideoDisplayTest, ShowsThePicturesWhenTheyCome)
{
    m_display->setProvider(m_video);
    showFrames("01:00:10:00", "01:00:08:12", false);

    m_video->deliver();

    EXPECT_TRUE(showsPicturesOf(*m_video));
}

TEST_F(VideoDisplayTest, ShowsNoPicturesWhileItIsInactive)
{
    m_display->setProvider(m_video);

    m_video->deliver();
    EXPECT_TRUE(showsPlaceholders());

    m_display->setActive(true);
    EXPECT_TRUE(showsPicturesOf(*m_video)) << "those that have come meanwhile";
}

TEST_F(VideoDisplayTest, GoesBackToPlaceholdersAndDashes)
{
    m_display->setProvider(m_video);
    showFrames("01:00:10:00", "01:00:08:12", false);
    m_video->deliver();

    m_display->setActive(false);

    EXPECT_TRUE(showsPlaceholders());
    EXPECT_EQ(times(), "--:--:--:-- --:--:--:--");
}

TEST_F(VideoDisplayTest, DoesNothingWhenItIsAsItShouldBe)
{
    m_display->setActive(false);
    EXPECT_EQ(times(), "00:00:00:00 00:00:00:00");

    showFrames("01:00:10:00", "01:00:08:12", false);
    m_display->setActive(true);
    EXPECT_EQ(times(), "01:00:10:00 01:00:08:12");
}

TEST_F(VideoDisplayTest, ShowsPlaceholdersWithoutAProvider)
{
    showFrames("01:00:10:00", "01:00:08:12", false);

    EXPECT_TRUE(showsPlaceholders());
    m_display->imageChanged(Old);
    EXPECT_TRUE(showsPlaceholders());
}

TEST_F(VideoDisplayTest, PassesItsTimesOnToANewProvider)
{
    m_display->setProvider(m_video);
    showFrames("01:00:10:00", "01:00:08:12", true);
    const auto other = std::make_shared<TestVideo>();

    m_display->setProvider(other);
    EXPECT_EQ(other->request(Old).time, 3609.96);
    EXPECT_TRUE(other->request(New).lastFrame);
    EXPECT_EQ(other->request(Old).width, 284);
    other->deliver();
    EXPECT_TRUE(showsPicturesOf(*other));

    m_video->deliver();
    EXPECT_TRUE(showsPicturesOf(*other)) << "the first has been left";

    m_display->setProvider(nullptr);
    EXPECT_TRUE(showsPlaceholders());
    EXPECT_EQ(times(), "--:--:--:-- --:--:--:--");
}

TEST_F(VideoDisplayTest, LeavesItsProviderWhenItGoes)
{
    m_display->setProvider(m_video);
    m_display->setActive(true);
    m_display.reset();

    // Nobody is there to be told; under the sanitizer a call would show.
    m_video->deliver();

    EXPECT_EQ(m_video.use_count(), 1);
}

TEST_F(VideoDisplayTest, AsksForPicturesOfTheSizeOfItsImages)
{
    m_display->setProvider(m_video);
    m_display->setSize(204, 349);

    EXPECT_EQ(m_video->request(Old).width, 188);
    EXPECT_EQ(m_video->request(Old).height, 77);
    EXPECT_EQ(m_video->request(New).width, 188);
    EXPECT_EQ(m_video->request(New).height, 77);
}

TEST_F(VideoDisplayTest, AsksForThePixelsOfTheScreen)
{
    m_display->setProvider(m_video);
    juce::Component window;
    window.setTransform(juce::AffineTransform::scale(2.0F));

    window.addAndMakeVisible(*m_display);

    EXPECT_EQ(m_video->request(Old).width, 568);
    EXPECT_EQ(m_video->request(Old).height, 76);
    m_display->setSize(204, 349);
    EXPECT_EQ(m_video->request(Old).width, 376);
    EXPECT_EQ(m_video->request(Old).height, 154);
}

TEST_F(VideoDisplayTest, AsksForThePixelsAnewWhenAWindowAroundItIsEnlargedAsAWhole)
{
    m_display->setProvider(m_video);
    juce::Component window;
    window.addAndMakeVisible(*m_display);
    window.setSize(300, 272);
    const auto enlarge = [&](float scale) {
        window.setTransform(juce::AffineTransform::scale(scale));
        // The screen does so then.
        window.createComponentSnapshot(window.getLocalBounds());
    };

    enlarge(0.5F);
    EXPECT_EQ(m_video->request(Old).width, 142);
    EXPECT_EQ(m_video->request(New).height, 19);
    enlarge(1.0F);
    EXPECT_EQ(m_video->request(Old).width, 284);
    EXPECT_EQ(m_video->request(New).height, 38);
    const int before = m_video->requestCount;
    enlarge(1.0F);
    EXPECT_EQ(m_video->requestCount, before);
}

TEST_F(VideoDisplayTest, AsksForThePixelsOfAScreenThatEnlargesAllWindows)
{
    juce::Desktop::getInstance().setGlobalScaleFactor(1.5F);
    {
        m_display->setProvider(m_video);
        FocusedWindow window(400, 400);

        window.addAndMakeVisible(*m_display);

        EXPECT_EQ(m_video->request(Old).width, 426);
        EXPECT_EQ(m_video->request(Old).height, 57);
        window.removeChildComponent(m_display.get());
    }
    juce::Desktop::getInstance().setGlobalScaleFactor(1.0F);
}

TEST_F(VideoDisplayTest, AsksForNothingNewWhileItsImagesHaveTheSameSize)
{
    m_display->setProvider(m_video);
    const int before = m_video->requestCount;

    m_display->setSize(300, 271);
    EXPECT_EQ(m_video->requestCount, before) << "the images are as high as before";

    m_display->setSize(300, 270);
    EXPECT_EQ(m_video->requestCount, before + 2);
}

TEST_F(VideoDisplayTest, AsksForAPixelWhereThereIsNoRoom)
{
    m_display->setProvider(m_video);

    m_display->setSize(10, 100);

    EXPECT_EQ(m_video->request(Old).width, 1);
    EXPECT_EQ(m_video->request(Old).height, 1);
}

TEST_F(VideoDisplayTest, ShowsPlaceholdersWhereTheProviderRefusesAPicture)
{
    m_display->setProvider(m_video);
    showFrames("01:00:10:00", "01:00:08:12", false);
    m_video->deliver();
    m_video->failure = util::Result::HostCallFailed;
    showFrames("01:00:20:00", "01:00:18:12", false);

    EXPECT_EQ(times(), "01:00:20:00 01:00:18:12");
    EXPECT_TRUE(showsPlaceholders());
    m_display->setSize(204, 349);
    EXPECT_TRUE(m_alerts.messages.empty());
}

/// Has no pictures of the old version.
class NewVideoAlone : public TestVideo {
protected:
    void requestImage(std::size_t side, int width, int height, bool lastFrame, double time) override
    {
        if (side == OldSide)
            throw util::Result::HostCallFailed;
        TestVideo::requestImage(side, width, height, lastFrame, time);
    }
};

TEST_F(VideoDisplayTest, AsksForTheNewPictureAlsoWhenTheOldOneIsRefused)
{
    const auto video = std::make_shared<NewVideoAlone>();
    m_display->setProvider(video);
    EXPECT_EQ(video->request(New).width, 284);
    showFrames("01:00:10:00", "01:00:08:12", false);

    EXPECT_EQ(video->request(New).time, 3608.48);
}

TEST_F(VideoDisplayTest, SaysOnceWhatEachPartIs)
{
    EXPECT_EQ(named("old time").getDescription(), "The picture of the old edit version");
    EXPECT_EQ(named("new time").getDescription(), "The picture of the new edit version");
    int readers = 0;
    for (const juce::Component* const component : m_display->getChildren())
        readers += component->isAccessible() && component->getTitle() == "The picture of the old edit version" ? 1 : 0;
    EXPECT_EQ(readers, 1);
}

TEST_F(VideoDisplayTest, TellsThatTheBlockResultHoldsTheOldPicture)
{
    m_display->setVisible(true);
    for (const juce::Point<int> place : {juce::Point<int>(150, 80), {150, 110}, {150, 140}}) {
        auto* const hint = dynamic_cast<juce::TooltipClient*>(m_display->getComponentAt(place));
        ASSERT_NE(hint, nullptr) << place.toString();
        EXPECT_EQ(hint->getTooltip(), "The picture of the old edit version") << place.toString();
    }
    EXPECT_EQ(named("Old Image").getTitle(), "The picture of the old edit version");
    EXPECT_EQ(named("New Image").getTitle(), "The picture of the new edit version");
}

TEST_F(VideoDisplayTest, HasNoTextThatIsCutInAnyLanguage)
{
    EXPECT_EQ(cutTextsOf(*m_display), std::vector<std::string>{});
    const GermanTexts german;
    const VideoDisplay display;
    EXPECT_EQ(cutTextsOf(display), std::vector<std::string>{});
}

TEST_F(VideoDisplayTest, LooksAsItDoesWithPictures)
{
    m_display->setProvider(m_video);
    m_display->setSize(204, 349);
    showFrames("01:00:10:00", "01:00:08:12", false);
    m_video->deliver();

    expectPicture(*m_display, "video-display");
}

TEST_F(VideoDisplayTest, LooksAsItDoesWhenItIsInactive)
{
    m_display->setProvider(m_video);
    m_display->setSize(204, 349);

    expectPicture(*m_display, "video-display-inactive");
}

TEST_F(VideoDisplayTest, LooksAsItDoesAtItsOwnSizeWithTheSharpPicturesOfAFineScreen)
{
    juce::Component window;
    window.setTransform(juce::AffineTransform::scale(2.0F));
    window.addAndMakeVisible(*m_display);
    m_display->setProvider(m_video);
    showFrames("01:00:10:00", "01:00:08:12", true);
    m_video->deliver();

    expectPicture(*m_display, "video-display-fine");
}

} // namespace
} // namespace cadrel::tests
