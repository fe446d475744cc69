// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoDisplay.h"

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"
#include "gui/video/VideoFrames.h"

#include <utility>

namespace cadrel::gui {

using core::Timecode;

namespace {

constexpr int DefaultWidth = 300;
constexpr int DefaultHeight = 272;
constexpr int TitleFont = 3;
constexpr int BlockFont = 1;
constexpr int TimeFont = 7;
constexpr int BlockTop = 75;
constexpr int TitleHeight = 20;
constexpr int TimeWidth = 150;
constexpr int TimeHeight = 24;
constexpr float CornerSize = 8.0F;
constexpr float OutlineThickness = 2.0F;
const juce::Colour Background(7, 12, 16);

juce::Image placeholder()
{
    const juce::Image image(juce::Image::RGB, 888, 500, false);
    juce::Graphics(image).fillAll(toColour(Palette::band).darker(0.4F));
    return image;
}

/// How many pixels of the screen make one of the component's.
double pixelsForEachOf(const juce::Component& component)
{
    // JUCE leaves out the scale that all its windows share.
    const double scale = juce::Component::getApproximateScaleFactorForComponent(&component) *
                         juce::Desktop::getInstance().getGlobalScaleFactor();
    const juce::ComponentPeer* const peer = component.getPeer();
    return peer ? scale * peer->getPlatformScaleFactor() : scale;
}

/// Half of what is left of the height.
int halfWithout(int height, int rest)
{
    return (height - rest) / 2;
}

} // namespace

VideoDisplay::Hint::Hint(const juce::String& text)
{
    setTooltip(text);
    setTitle(text);
}

VideoDisplay::VideoDisplay()
    : m_oldImage("Old Image"), m_newImage("New Image"), m_newTimeLabel("new time", "00:00:00:00"),
      m_oldTimeLabel("old time", "00:00:00:00"), m_resultHint(translatedText(L"The picture of the old edit version"))
{
    addPicture(m_oldImage, m_oldTimeLabel);
    addPicture(m_newImage, m_newTimeLabel);
    m_oldImage.setTitle(m_resultHint.getTitle());
    m_newImage.setTitle(translatedText(L"The picture of the new edit version"));
    // A label is read as its text.
    m_oldTimeLabel.setDescription(m_oldImage.getTitle());
    m_newTimeLabel.setDescription(m_newImage.getTitle());
    addAndMakeVisible(m_resultHint);
    m_resultHint.setAccessible(false);
    setSize(DefaultWidth, DefaultHeight);
    const juce::Image image = placeholder();
    m_oldImage.setImage(image);
    m_newImage.setImage(image);
}

VideoDisplay::~VideoDisplay()
{
    if (m_provider)
        m_provider->removeListener(this);
}

void VideoDisplay::addPicture(juce::ImageComponent& picture, juce::Label& time)
{
    addAndMakeVisible(picture);
    addAndMakeVisible(time);
    time.setFont(gui::getFont(TimeFont));
    time.setJustificationType(juce::Justification::centred);
    time.setColour(juce::Label::textColourId, juce::Colours::white);
}

void VideoDisplay::setProvider(std::shared_ptr<VideoProviderBase> provider)
{
    if (m_provider)
        m_provider->removeListener(this);
    m_provider = std::move(provider);
    show();
    if (!m_provider)
        return;
    m_provider->addListener(this);
    updatePictureSize();
    requestFrames();
}

void VideoDisplay::setActive(bool active)
{
    if (active == m_active)
        return;
    m_active = active;
    show();
}

void VideoDisplay::setFrames(const Timecode& oldTime, const Timecode& newTime, bool lastFrame)
{
    m_oldTimeLabel.setText(oldTime.toString(), juce::dontSendNotification);
    m_newTimeLabel.setText(newTime.toString(), juce::dontSendNotification);
    m_oldTime = oldTime;
    m_newTime = newTime;
    m_lastFrame = lastFrame;
    requestFrames();
}

void VideoDisplay::imageChanged(std::size_t side)
{
    guardSystem([&] {
        if (!m_active || !m_provider)
            return;
        imageOf(side).setImage(m_provider->getImage(side));
    });
}

void VideoDisplay::requestFrames()
{
    if (!m_provider)
        return;
    m_provider->setLastFrame(m_lastFrame);
    requestFrame(VideoProviderBase::OldSide, m_oldTime);
    requestFrame(VideoProviderBase::NewSide, m_newTime);
}

/// Where there is none, the former picture would be one of another time.
void VideoDisplay::requestFrame(std::size_t side, const Timecode& time)
{
    if (!guardSystem([&] { m_provider->setTime(side, m_lastFrame ? VideoFrames::lastBefore(time) : time); }))
        imageOf(side).setImage(placeholder());
}

void VideoDisplay::show()
{
    if (!m_active || !m_provider) {
        showPlaceholders();
        return;
    }
    imageChanged(VideoProviderBase::OldSide);
    imageChanged(VideoProviderBase::NewSide);
}

void VideoDisplay::showPlaceholders()
{
    const juce::Image image = placeholder();
    for (juce::ImageComponent* const picture : {&m_oldImage, &m_newImage})
        picture->setImage(image);
    for (juce::Label* const time : {&m_oldTimeLabel, &m_newTimeLabel})
        time->setText("--:--:--:--", juce::dontSendNotification);
}

// ---- Layout --------------------------------------------------------------------------------------------------------

juce::Rectangle<int> VideoDisplay::blockAt(int top) const
{
    return {3, top, getWidth() - 6, halfWithout(getHeight(), 115)};
}

void VideoDisplay::resized()
{
    guardSystem([this] {
        const int width = getWidth();
        const int half = halfWithout(getHeight(), 155);
        const int timeX = width / 2 - TimeWidth / 2;
        m_oldImage.setBounds(8, 95, width - 16, half - 20);
        m_newImage.setBounds(8, half + 135, width - 16, half - 20);
        m_oldTimeLabel.setBounds(timeX, half + 75, TimeWidth, TimeHeight);
        m_newTimeLabel.setBounds(timeX, getHeight() - 40, TimeWidth, TimeHeight);
        m_resultHint.setBounds(blockAt(BlockTop));
        updatePictureSize();
    });
}

void VideoDisplay::enablementChanged()
{
    guardSystem([this] {
        for (juce::ImageComponent* const picture : {&m_oldImage, &m_newImage})
            picture->setAlpha(opacityOf(*this));
        repaint();
    });
}

void VideoDisplay::parentHierarchyChanged()
{
    updatePictureSize();
}

void VideoDisplay::updatePictureSize()
{
    guardSystem([this] {
        if (!m_provider)
            return;
        const PixelSize size =
            VideoFrames::pixelsOf(m_oldImage.getWidth(), m_oldImage.getHeight(), pixelsForEachOf(*this));
        m_provider->setImageSize(size.width, size.height);
    });
}

void VideoDisplay::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        // Of a window that is enlarged as a whole, JUCE tells its children nothing else.
        updatePictureSize();
        graphics.fillAll(Background);
        const auto panel = getLocalBounds().reduced(2).toFloat();
        graphics.setColour(toColour(Palette::panel));
        graphics.fillRoundedRectangle(panel, CornerSize);
        graphics.setColour(toColour(Palette::frame));
        graphics.drawRoundedRectangle(panel, CornerSize, OutlineThickness);
        const auto width = static_cast<float>(getWidth());
        drawText(graphics, translatedText(L"Video"), 0.0F, 2.0F, width, TitleHeight, juce::Justification::centred,
                 getFont(TitleFont), toColour(Palette::frame).withAlpha(opacityOf(*this)), true);
        graphics.setColour(toColour(Palette::band));
        graphics.fillRect(3, 22, getWidth() - 6, 35);
        paintBlock(graphics, blockAt(BlockTop), L"Result");
        paintBlock(graphics, blockAt(blockAt(BlockTop).getBottom() + 20), L"New");
    });
}

void VideoDisplay::paintBlock(juce::Graphics& graphics, juce::Rectangle<int> block, const wchar_t* name) const
{
    graphics.setColour(toColour(Palette::band));
    graphics.fillRect(block);
    drawText(graphics, translatedText(name), 0.0F, static_cast<float>(block.getY()), static_cast<float>(getWidth()),
             TitleHeight, juce::Justification::centred, getFont(BlockFont),
             juce::Colours::black.withAlpha(opacityOf(*this)), true);
}

} // namespace cadrel::gui
