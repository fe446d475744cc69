// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"
#include "gui/picture/VideoProviderBase.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <memory>

namespace cadrel::gui {

/// The two pictures of the selected change: one frame of the old version above the matching frame of the new one. It asks the
/// provider for them, in the pixels that they cover on the screen, and shows placeholders while it isn't active.
class VideoDisplay : public juce::Component, public VideoProviderBase::Listener {
public:
    VideoDisplay();
    ~VideoDisplay() override;

    /// Null for none. It is asked for the pictures of the present times at once.
    void setProvider(std::shared_ptr<VideoProviderBase> provider);
    /// Starts inactive. An active display shows the last pictures of the provider until newer ones come.
    void setActive(bool active);
    bool isActive() const { return m_active; }
    /// Shows the times, and asks for their pictures. With `lastFrame` they are OUT points, and the pictures are those of the
    /// frames before them. Where a picture can't be asked for, its placeholder shows.
    void setFrames(const core::Timecode& oldTime, const core::Timecode& newTime, bool lastFrame);

    void imageChanged(std::size_t side) override;

    void paint(juce::Graphics& graphics) override;
    void resized() override;
    void enablementChanged() override;
    /// The display may have come to a screen with another scale.
    void parentHierarchyChanged() override;

private:
    /// Lies over a block, and tells about it.
    class Hint : public juce::Component, public juce::SettableTooltipClient {
    public:
        explicit Hint(const juce::String& text);
    };

    void addPicture(juce::ImageComponent& picture, juce::Label& time);
    juce::Rectangle<int> blockAt(int top) const;
    void paintBlock(juce::Graphics& graphics, juce::Rectangle<int> block, const wchar_t* name) const;
    void updatePictureSize();
    void requestFrames();
    void requestFrame(std::size_t side, const core::Timecode& time);
    juce::ImageComponent& imageOf(std::size_t side)
    {
        return side == VideoProviderBase::NewSide ? m_newImage : m_oldImage;
    }
    void show();
    void showPlaceholders();

    std::shared_ptr<VideoProviderBase> m_provider;
    core::Timecode m_oldTime;
    core::Timecode m_newTime;
    bool m_lastFrame = false;
    bool m_active = false;
    juce::ImageComponent m_oldImage;
    juce::ImageComponent m_newImage;
    juce::Label m_newTimeLabel;
    juce::Label m_oldTimeLabel;
    Hint m_resultHint;
};

} // namespace cadrel::gui
