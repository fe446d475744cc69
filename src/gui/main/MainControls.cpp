// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainControls.h"

#include "core/edl/EventList.h"
#include "gui/files/FilePaths.h"
#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/FlashTextButton.h"
#include "gui/look/PictureButton.h"
#include "gui/look/Text.h"
#include "gui/main/MainCommands.h"

#include <initializer_list>
#include <stdexcept>

namespace cadrel::gui {

using core::ListKind;
using Symbol = ButtonPicture::Symbol;

namespace {

constexpr int TitleFont = 3;
constexpr int HintFont = 10;
constexpr float PanelCorner = 8.0F;
constexpr float FrameThickness = 2.0F;
const juce::Colour Background(0xff070c10);
constexpr float DotSize = 6.0F;
constexpr float DotMargin = 4.0F;
/// How much space there is beside a hint.
constexpr int HintMargin = 20;
constexpr std::array Lists{ListKind::Old, ListKind::New, ListKind::Change};

/// The buttons of a radio group are switched off by each other.
constexpr int PictureGroup = 1;
constexpr int PreviewGroup = 2;

const wchar_t* titleOf(std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return L"Old EDL";
    case ListKind::New:
        return L"New EDL";
    default:
        return L"Change EDL";
    }
}

std::unique_ptr<ListPanel> makePanel(std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return std::make_unique<ListPanel>(
            listKind, "Old Table List Box", titleOf(listKind),
            std::array<ListPanel::CounterNames, 3>{{{"oldEdlNoEventsLabel", "oldEdlNoEventsValue"},
                                                    {"oldEdlSelectedEventsLabel", "oldEdlSelectedEventsValue"},
                                                    {"oldEdlInvaldEventsLabel", "oldEdlInvalidEventsValue"}}});
    case ListKind::New:
        return std::make_unique<ListPanel>(
            listKind, "New Table List Box", titleOf(listKind),
            std::array<ListPanel::CounterNames, 3>{{{"newEdlNoEventsLabel", "newEdlNoEventsValue"},
                                                    {"newEdlSelectedEventsLabel", "newEdlSelectedEventsValue"},
                                                    {"newEdlInvaldEventsLabel", "newEdlInvalidEventsValue"}}});
    default:
        return std::make_unique<ListPanel>(
            listKind, "Change Table List Box", titleOf(listKind),
            std::array<ListPanel::CounterNames, 3>{{{"changeEdlNoEventsLabel", "changeEdlNoEventsValue"},
                                                    {"changeEdlSelectedEventsLabel", "changeEdlSelectedEventsValue"},
                                                    {"changeEdlInvaldEventsLabel", "changeEdlInvalidEventsValue"}}});
    }
}

std::unique_ptr<juce::Button> withText(std::unique_ptr<juce::Button> button, const std::wstring& label)
{
    button->setButtonText(translatedText(label));
    return button;
}

std::unique_ptr<juce::Button> makeButton(MainButton button)
{
    const auto picture = [](const char* name, Symbol symbol) { return std::make_unique<PictureButton>(name, symbol); };
    const auto text = [](const char* name, const std::wstring& label) {
        return withText(std::make_unique<juce::TextButton>(name), label);
    };
    switch (button) {
    case MainButton::AddChange:
        return picture("Load Change Edl Button", Symbol::Plus);
    case MainButton::Start:
        return text("Cadrel Button", L"Start Cadrel");
    case MainButton::AddOld:
        return picture("Load Old Edl Button", Symbol::Plus);
    case MainButton::AddNew:
        return picture("Load New Edl Button", Symbol::Plus);
    case MainButton::Generate:
        return text("Generate Button", L"Generate");
    case MainButton::ClearOld:
        return picture("Clear Old Edl Button", Symbol::Bin);
    case MainButton::ClearNew:
        return picture("Clear New Edl Button", Symbol::Bin);
    case MainButton::ClearChange:
        return picture("Clear Change Edl Button", Symbol::Bin);
    case MainButton::Settings:
        return picture("Settings Button", Symbol::Cog);
    case MainButton::Save:
        return picture("Save Change Edl Button", Symbol::Floppy);
    case MainButton::Source:
        return text("Source Toggle", L"SRC");
    case MainButton::Destination:
        return text("Destination Toggle", L"DST");
    case MainButton::Videos:
        return picture("m_showNewVideosDialogButton", Symbol::Cog);
    case MainButton::In:
        return text("m_videoLeftToggle", L"IN");
    case MainButton::Out:
        return text("m_videoRightToggle", L"OUT");
    case MainButton::Preview:
        return withText(std::make_unique<FlashTextButton>("new component"), L"Preview");
    }
    throw std::out_of_range("no such button");
}

/// The list that the picture of a button doesn't tell.
std::optional<std::int32_t> listOf(MainButton button)
{
    switch (button) {
    case MainButton::AddOld:
    case MainButton::ClearOld:
        return ListKind::Old;
    case MainButton::AddNew:
    case MainButton::ClearNew:
        return ListKind::New;
    case MainButton::AddChange:
    case MainButton::ClearChange:
        return ListKind::Change;
    default:
        return std::nullopt;
    }
}

/// What a screen reader calls a button without a text.
juce::String spokenNameOf(MainButton button)
{
    const juce::String purpose(MainCommands::purpose(button).c_str());
    const std::optional<std::int32_t> listKind = listOf(button);
    return listKind ? translatedText(titleOf(*listKind)) + ", " + purpose : purpose;
}

juce::Rectangle<int> toRectangle(const MainLayout::Box& box)
{
    return {box.x, box.y, box.width, box.height};
}

juce::Rectangle<float> toRectangle(const MainLayout::Area& area)
{
    return {area.x, area.y, area.width, area.height};
}

} // namespace

MainControls::MainControls(FilesDropped filesDropped) : m_filesDropped(std::move(filesDropped))
{
    for (const std::int32_t listKind : Lists)
        m_panels.at(static_cast<std::size_t>(listKind)) = makePanel(listKind);
    makeButtons();
    addInOrder();
    setUpToggles();
    m_timeline.setName("timelineView");
    m_video.setName("videodisplay");
    setOpaque(true);
}

void MainControls::makeButtons()
{
    for (std::size_t index = 0; index < m_buttons.size(); ++index) {
        const auto which = static_cast<MainButton>(index);
        m_buttons.at(index) = makeButton(which);
        if (dynamic_cast<PictureButton*>(m_buttons.at(index).get()))
            m_buttons.at(index)->setTitle(spokenNameOf(which));
    }
}

/// The order in which the controls are drawn.
void MainControls::addInOrder()
{
    const auto addButtons = [this](MainButton first, MainButton last) {
        for (auto index = static_cast<std::size_t>(first); index <= static_cast<std::size_t>(last); ++index)
            addAndMakeVisible(*m_buttons.at(index));
    };
    const auto addCounters = [this](std::initializer_list<std::size_t> counters) {
        for (const std::int32_t listKind : Lists) {
            for (const std::size_t counter : counters)
                addAndMakeVisible(panel(listKind).label(counter));
            for (const std::size_t counter : counters)
                addAndMakeVisible(panel(listKind).value(counter));
        }
    };
    addAndMakeVisible(panel(ListKind::Change).table());
    addButtons(MainButton::AddChange, MainButton::Start);
    addAndMakeVisible(panel(ListKind::Old).table());
    addAndMakeVisible(panel(ListKind::New).table());
    addButtons(MainButton::AddOld, MainButton::Settings);
    addCounters({ListPanel::Total, ListPanel::Invalid});
    addAndMakeVisible(m_timeline);
    addButtons(MainButton::Save, MainButton::Save);
    addCounters({ListPanel::Selected});
    addAndMakeVisible(m_video);
    addButtons(MainButton::Source, MainButton::Preview);
}

void MainControls::setUpToggles()
{
    for (const MainButton toggle :
         {MainButton::Preview, MainButton::In, MainButton::Out, MainButton::Source, MainButton::Destination})
        button(toggle).setClickingTogglesState(true);
    for (const MainButton toggle : {MainButton::In, MainButton::Out})
        button(toggle).setRadioGroupId(PictureGroup, juce::dontSendNotification);
    for (const MainButton toggle : {MainButton::Source, MainButton::Destination}) {
        button(toggle).setRadioGroupId(PreviewGroup, juce::dontSendNotification);
        button(toggle).setEnabled(false);
    }
    setOn(MainButton::In, true);
    setOn(MainButton::Source, true);
    button(MainButton::Preview).setColour(juce::TextButton::buttonOnColourId, toColour(Palette::orange));
}

ListPanel* MainControls::panelOf(const EventTableModel& model)
{
    for (const auto& panel : m_panels) {
        if (panel->isOf(model))
            return panel.get();
    }
    return nullptr;
}

MainButton MainControls::which(const juce::Button& button) const
{
    for (std::size_t index = 0; index < m_buttons.size(); ++index) {
        if (m_buttons.at(index).get() == &button)
            return static_cast<MainButton>(index);
    }
    throw std::out_of_range("no such button");
}

void MainControls::setHint(std::int32_t listKind, const std::wstring& hint)
{
    juce::String& shown = m_hints.at(static_cast<std::size_t>(listKind));
    const juce::String text(hint.c_str());
    if (shown == text)
        return;
    shown = text;
    panel(listKind).table().setHelpText(text);
    repaint();
}

void MainControls::setListOutdated(bool flag)
{
    if (m_isListOutdated == flag)
        return;
    m_isListOutdated = flag;
    repaint(button(MainButton::Generate).getBounds());
}

void MainControls::resized()
{
    guardSystem([this] {
        const MainLayout places = layout();
        for (const auto& panel : m_panels)
            panel->place(places);
        for (std::size_t index = 0; index < m_buttons.size(); ++index)
            m_buttons.at(index)->setBounds(toRectangle(places.button(static_cast<MainButton>(index))));
        m_timeline.setBounds(toRectangle(places.timeline()));
        m_video.setBounds(toRectangle(places.video()));
    });
}

void MainControls::enablementChanged()
{
    // Titles and hints are dimmed.
    guardSystem([this] { repaint(); });
}

void MainControls::paint(juce::Graphics& graphics)
{
    guardSystem([&] {
        graphics.fillAll(Background);
        for (const std::int32_t listKind : Lists)
            paintPanel(graphics, listKind);
    });
}

void MainControls::paintPanel(juce::Graphics& graphics, std::int32_t listKind) const
{
    const MainLayout places = layout();
    const juce::Rectangle<float> panel = toRectangle(places.panel(listKind));
    graphics.setColour(toColour(Palette::panel));
    graphics.fillRoundedRectangle(panel, PanelCorner);
    graphics.setColour(toColour(Palette::frame));
    graphics.drawRoundedRectangle(panel, PanelCorner, FrameThickness);
    const MainLayout::Area title = places.title(listKind);
    drawText(graphics, translatedText(titleOf(listKind)), title.x, title.y, title.width, title.height,
             juce::Justification::centred, getFont(TitleFont), toColour(Palette::frame).withAlpha(opacityOf(*this)),
             true);
    if (listKind == ListKind::Change) {
        const MainLayout::Rule rule = places.rule();
        graphics.setColour(toColour(Palette::frame));
        graphics.drawLine(rule.left, rule.y, rule.right, rule.y, FrameThickness);
    }
    graphics.setColour(toColour(Palette::band));
    graphics.fillRect(toRectangle(places.band(listKind)));
}

/// The window around is enabled then.
bool MainControls::isBeneathSheet() const
{
    return !isEnabled() && getParentComponent() && getParentComponent()->isEnabled();
}

/// In the upper right corner of the button.
void MainControls::paintDot(juce::Graphics& graphics) const
{
    const juce::Rectangle<float> place = button(MainButton::Generate).getBounds().toFloat().reduced(DotMargin);
    graphics.setColour(toColour(Palette::orange).withAlpha(opacityOf(*this)));
    graphics.fillEllipse(place.getRight() - DotSize, place.getY(), DotSize, DotSize);
}

void MainControls::paintOverChildren(juce::Graphics& graphics)
{
    guardSystem([&] {
        if (m_isListOutdated)
            paintDot(graphics);
        for (const std::int32_t listKind : Lists) {
            const juce::String& hint = m_hints.at(static_cast<std::size_t>(listKind));
            const juce::Rectangle<int> table = toRectangle(layout().table(listKind));
            if (!hint.isEmpty() && !isBeneathSheet()) {
                graphics.setColour(toColour(Palette::text).withAlpha(opacityOf(*this)));
                graphics.setFont(getFont(HintFont));
                graphics.drawFittedText(hint, table.reduced(HintMargin, HintMargin), juce::Justification::centred, 3);
            }
            if (m_dropTarget == listKind) {
                graphics.setColour(toColour(Palette::lightBlue));
                graphics.drawRect(table.expanded(2), 2);
            }
        }
    });
}

// ---- Files from a file manager -------------------------------------------------------------------------------------

/// The panel of a list takes what is dropped on it.
std::optional<std::int32_t> MainControls::listAt(juce::Point<int> place) const
{
    for (const std::int32_t listKind : Lists) {
        if (toRectangle(layout().panel(listKind)).contains(place.toFloat()))
            return listKind;
    }
    return std::nullopt;
}

bool MainControls::isInterestedInFileDrag(const juce::StringArray& files)
{
    return isEnabled() && !files.isEmpty();
}

void MainControls::fileDragEnter(const juce::StringArray&, int x, int y)
{
    guardSystem([&] { setDropTarget(listAt({x, y})); });
}

void MainControls::fileDragMove(const juce::StringArray&, int x, int y)
{
    guardSystem([&] { setDropTarget(listAt({x, y})); });
}

void MainControls::fileDragExit(const juce::StringArray&)
{
    guardSystem([&] { setDropTarget(std::nullopt); });
}

void MainControls::filesDropped(const juce::StringArray& files, int x, int y)
{
    guardUser([&] {
        setDropTarget(std::nullopt);
        if (const auto listKind = listAt({x, y}); listKind && isEnabled())
            m_filesDropped(*listKind, pathsOf(files));
    });
}

void MainControls::setDropTarget(std::optional<std::int32_t> listKind)
{
    if (m_dropTarget == listKind)
        return;
    m_dropTarget = listKind;
    repaint();
}

} // namespace cadrel::gui
