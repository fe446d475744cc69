// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/NewVideosDialog.h"

#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "gui/video/VideoListTableModel.h"
#include "util/Result.h"

#include <initializer_list>

namespace cadrel::gui {

using Mode = VideoTrackHandlerBase::Mode;

namespace {

constexpr int DefaultWidth = 1000;
constexpr int DefaultHeight = 750;
constexpr int TitleFont = 11;
constexpr int TextFont = 10;
constexpr int LineHeight = 24;
const juce::Colour TrackRule(0xff8f8f8f);

} // namespace

NewVideosDialog::Channel::Channel(const char* oldName, const char* newName)
    : name("videoTrackLabel1", {}, TextFont), oldSelect(oldName), newSelect(newName)
{
    name.setColour(juce::Label::textColourId, juce::Colours::white);
}

NewVideosDialog::NewVideosDialog()
    : Sheet("m_videosDialog"), m_poolTitle("Unused Videos", L"Available Videos in Pool", TextFont),
      m_videosTitle("New Videos", L"New Video Track Configuration", TitleFont), m_videosLine("HLine1"),
      m_table("VideosTable"),
      m_videosDescription(
          "descriptionNewVideo",
          L"Select the video file(s) for the new edit version. This ensures a correct result of the video preview.",
          TextFont),
      m_tracksTitle("trackAssignmentTitle", L"Video Track Assignment", TitleFont), m_tracksLine("HLine1"),
      m_tracksDescription("descriptionNewVideo", L"Specify which video track contains the old/new edit version.",
                          TextFont),
      m_channels{Channel("videoTrack1OldSelect", "videoTrack1NewSelect"),
                 Channel("videoTrack2OldSelect", "videoTrack2NewSelect")},
      m_nameHeader("videoTrackLabel1", L"Video Track Name", TextFont),
      m_oldHeader("videoTrackOldTitle", L"Old Edit Version", TextFont),
      m_newHeader("videoTrackOldTitle", L"New Edit Version", TextFont)
{
    setTitle(translatedText(L"Video Preview Settings"));
    for (juce::Component* const component : std::initializer_list<juce::Component*>{
             &m_poolTitle, &m_videosTitle, &m_videosLine, &m_table, &m_videosDescription, &m_tracksTitle, &m_tracksLine,
             &m_tracksDescription, &m_nameHeader, &m_oldHeader, &m_newHeader})
        addAndMakeVisible(component);
    for (Channel& channel : m_channels) {
        addAndMakeVisible(channel.name);
        for (juce::Button* const select : {&channel.oldSelect, &channel.newSelect}) {
            addAndMakeVisible(select);
            select->addListener(this);
        }
    }
    m_table.setTitle(m_poolTitle.getText());
    setEnabled(false);
    showTracks();
    setSize(DefaultWidth, DefaultHeight);
}

NewVideosDialog::~NewVideosDialog()
{
    if (m_tracks)
        m_tracks->removeListener(this);
}

// ---- Layout --------------------------------------------------------------------------------------------------------

juce::Rectangle<int> NewVideosDialog::fromCorner(int x, int y, int width, int height) const
{
    return {getWidth() - x, getHeight() - y, width, height};
}

juce::Rectangle<int> NewVideosDialog::panel() const
{
    return fromCorner(1096, 630, 892, 591);
}

void NewVideosDialog::resized()
{
    guardSystem([this] {
        m_tracksTitle.setBounds(fromCorner(1080, 613, 472, LineHeight));
        m_tracksLine.setBounds(fromCorner(1082, 587, 862, 1));
        m_tracksDescription.setBounds(fromCorner(1080, 573, 853, LineHeight));
        m_nameHeader.setBounds(fromCorner(1075, 530, 150, LineHeight));
        m_oldHeader.setBounds(fromCorner(506, 529, 150, LineHeight));
        m_newHeader.setBounds(fromCorner(364, 529, 150, LineHeight));
        m_channels[0].name.setBounds(fromCorner(1067, 496, 543, LineHeight));
        m_channels[0].oldSelect.setBounds(fromCorner(502, 496, 112, LineHeight));
        m_channels[0].newSelect.setBounds(fromCorner(359, 496, 113, LineHeight));
        m_channels[1].name.setBounds(fromCorner(1067, 464, 543, LineHeight));
        m_channels[1].oldSelect.setBounds(fromCorner(502, 460, 112, LineHeight));
        m_channels[1].newSelect.setBounds(fromCorner(359, 460, 113, LineHeight));
        m_videosTitle.setBounds(fromCorner(1080, 393, 472, LineHeight));
        m_videosLine.setBounds(fromCorner(1082, 367, 862, 1));
        m_videosDescription.setBounds(fromCorner(1080, 350, 853, LineHeight));
        m_poolTitle.setBounds(fromCorner(1081, 312, 342, LineHeight));
        m_table.setBounds(fromCorner(1080, 281, 860, 210));
    });
}

void NewVideosDialog::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        Sheet::paint(graphics);
        graphics.setColour(juce::Colours::black);
        graphics.fillRect(fromCorner(1080, 534, 860, 100));
        graphics.setColour(toColour(Palette::band));
        graphics.fillRect(fromCorner(1078, 532, 567, 27));
        graphics.fillRect(fromCorner(507, 532, 138, 27));
        graphics.fillRect(fromCorner(365, 532, 143, 27));
        graphics.setColour(TrackRule);
        graphics.fillRect(fromCorner(1072, 468, 844, 1));
    });
}

// ---- Coming and going ----------------------------------------------------------------------------------------------

void NewVideosDialog::setVisible(bool shouldBeVisible)
{
    if (!shouldBeVisible)
        m_model.reset();
    Sheet::setVisible(shouldBeVisible);
    updateTable();
}

juce::Component* NewVideosDialog::firstFocus()
{
    for (Channel& channel : m_channels) {
        if (channel.oldSelect.isEnabled())
            return &channel.oldSelect;
    }
    return &m_table;
}

void NewVideosDialog::mouseDown(const juce::MouseEvent& event)
{
    guardUser([&] {
        const juce::Point<int> place = event.getEventRelativeTo(this).getPosition();
        const bool isInside = place.x >= getWidth() - 1092 && place.x <= getWidth() - 200 &&
                              place.y >= getHeight() - 631 && place.y <= getHeight() - 40;
        if (!isInside)
            setVisible(false);
    });
}

// ---- The videos ----------------------------------------------------------------------------------------------------

void NewVideosDialog::setVideoList(core::VideoList* list, core::MediaPoolInterface* pool)
{
    if (list != m_list)
        m_model.reset();
    m_list = list;
    setEnabled(list != nullptr);
    refresh(pool);
}

void NewVideosDialog::refresh(core::MediaPoolInterface* pool)
{
    m_pool = pool;
    updateTable();
    if (m_model)
        m_model->setMediaPool(pool);
}

void NewVideosDialog::setTimeOrigin(double seconds)
{
    m_timeOrigin = seconds;
    if (m_model)
        m_model->setTimeOrigin(seconds);
}

void NewVideosDialog::updateTable()
{
    if (!isVisible() || !m_list || !m_pool)
        m_model.reset();
    else if (!m_model) {
        m_model = std::make_shared<VideoListTableModel>(m_table, *m_list, m_pool);
        m_model->setTimeOrigin(m_timeOrigin);
    }
}

// ---- The tracks ----------------------------------------------------------------------------------------------------

void NewVideosDialog::setTrackHandler(VideoTrackHandlerBase* handler)
{
    if (m_tracks)
        m_tracks->removeListener(this);
    m_tracks = handler;
    if (m_tracks)
        m_tracks->addListener(this);
    showTracks();
}

void NewVideosDialog::tracksChanged()
{
    showTracks();
}

/// One that can't be read stays as it is shown, and keeps no other from being shown.
void NewVideosDialog::showTracks()
{
    for (std::size_t channel = 0; channel < ChannelCount; ++channel)
        guardSystem([&] { showTrack(channel); });
}

void NewVideosDialog::showTrack(std::size_t channel)
{
    if (channel >= ChannelCount)
        throw util::Result::InvalidArgument;
    Channel& shown = m_channels[channel];
    const bool isAvailable = m_tracks && m_tracks->isAvailable(channel);
    const juce::String name =
        isAvailable ? juce::String(m_tracks->getName(channel).c_str()) : translatedText(L"No track available.");
    const std::int32_t mode = isAvailable ? m_tracks->getMode(channel) : Mode::None;
    shown.name.setText(name, juce::dontSendNotification);
    shown.oldSelect.setTitle(m_oldHeader.getText() + ", " + name);
    shown.newSelect.setTitle(m_newHeader.getText() + ", " + name);
    shown.oldSelect.setToggleState(mode == Mode::Old, juce::dontSendNotification);
    shown.newSelect.setToggleState(mode == Mode::New, juce::dontSendNotification);
    for (juce::Button* const select : {&shown.oldSelect, &shown.newSelect})
        select->setEnabled(isAvailable);
}

void NewVideosDialog::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        const SafePointer<NewVideosDialog> self(this);
        guardUser([&] { setMode(*button); });
        // A track that refuses is shown as it is.
        if (self)
            showTracks();
    });
}

void NewVideosDialog::setMode(juce::Button& button)
{
    const bool isOn = button.getToggleState();
    for (std::size_t channel = 0; m_tracks && channel < ChannelCount; ++channel) {
        if (&button == &m_channels[channel].oldSelect)
            return m_tracks->setMode(channel, isOn ? Mode::Old : Mode::OldOff);
        if (&button == &m_channels[channel].newSelect)
            return m_tracks->setMode(channel, isOn ? Mode::New : Mode::NewOff);
    }
}

} // namespace cadrel::gui
