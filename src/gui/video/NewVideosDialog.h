// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/VideoTrackHandlerBase.h"
#include "gui/sheet/Sheet.h"
#include "gui/sheet/SheetLabel.h"
#include "gui/video/DarkTickBox.h"
#include "gui/video/VideoTable.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <memory>

namespace cadrel::core {
class MediaPoolInterface;
class VideoList;
} // namespace cadrel::core

namespace cadrel::gui {

class VideoListTableModel;

/// The sheet on which the user says which of the two video tracks carries which picture version, and which videos of the pool
/// make up the new one. All of it takes effect at once. It is laid out from its right and lower edges.
class NewVideosDialog : public Sheet, public juce::Button::Listener, public VideoTrackHandlerBase::Listener {
public:
    NewVideosDialog();
    ~NewVideosDialog() override;

    /// Neither is owned, and both may be null; without a list the sheet is disabled.
    void setVideoList(core::VideoList* list, core::MediaPoolInterface* pool);
    /// The list has changed, or the project has another pool.
    void refresh(core::MediaPoolInterface* pool);
    /// Where the project's clock begins, in seconds.
    void setTimeOrigin(double seconds);
    /// Not owned; null for none.
    void setTrackHandler(VideoTrackHandlerBase* handler);

    void tracksChanged() override;
    /// The table has its rows only while the sheet shows.
    void setVisible(bool shouldBeVisible) override;
    void paint(juce::Graphics& graphics) override;
    void resized() override;
    /// A click outside of the panel closes the sheet.
    void mouseDown(const juce::MouseEvent& event) override;
    void buttonClicked(juce::Button* button) override;

protected:
    void confirm() override { setVisible(false); }
    void cancel() override { setVisible(false); }
    juce::Rectangle<int> panel() const override;
    juce::Component* firstFocus() override;

private:
    static constexpr std::size_t ChannelCount = 2;

    /// One of the two video tracks.
    struct Channel {
        Channel(const char* oldName, const char* newName);

        SheetLabel name;
        DarkTickBox oldSelect;
        DarkTickBox newSelect;
    };

    /// Makes the rows of the table, or takes them away.
    void updateTable();
    void showTracks();
    /// Throws Result::InvalidArgument beyond the second channel.
    void showTrack(std::size_t channel);
    /// What a tick box says.
    void setMode(juce::Button& button);
    /// Places count from the right and lower edges.
    juce::Rectangle<int> fromCorner(int x, int y, int width, int height) const;

    core::VideoList* m_list = nullptr;
    core::MediaPoolInterface* m_pool = nullptr;
    VideoTrackHandlerBase* m_tracks = nullptr;
    double m_timeOrigin = 0.0;
    SheetLabel m_poolTitle;
    SheetLabel m_videosTitle;
    SheetRule m_videosLine;
    VideoTable m_table;
    SheetLabel m_videosDescription;
    SheetLabel m_tracksTitle;
    SheetRule m_tracksLine;
    SheetLabel m_tracksDescription;
    std::array<Channel, ChannelCount> m_channels;
    SheetLabel m_nameHeader;
    SheetLabel m_oldHeader;
    SheetLabel m_newHeader;
    std::shared_ptr<VideoListTableModel> m_model; ///< null while the sheet is closed
};

} // namespace cadrel::gui
