// SPDX-License-Identifier: GPL-3.0-or-later

// What happens in the window: buttons, keys, what the tables tell.

#include "gui/main/MainGui.h"

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "core/time/Timecode.h"
#include "gui/guard/Guard.h"
#include "gui/main/CutCommands.h"
#include "gui/picture/VideoProviderBase.h"

namespace cadrel::gui {

using core::ListKind;

namespace {

constexpr int TooltipDelay = 700;
const juce::Colour Background(0xff070c10);

} // namespace

MainGui::MainGui()
    : m_saveFolder(juce::File::getSpecialLocation(juce::File::userHomeDirectory).getFullPathName().toWideCharPointer()),
      m_controls(
          [this](std::int32_t listKind, const std::vector<std::string>& paths) { takeDroppedFiles(listKind, paths); }),
      m_tooltips(this, TooltipDelay)
{
    setOpaque(true);
    setWantsKeyboardFocus(true);
    // Clicks come to the window itself only beside a sheet, which keeps the keyboard.
    setMouseClickGrabsKeyboardFocus(false);
    addAndMakeVisible(m_controls);
    for (Sheet* const sheet : sheets()) {
        sheet->setBeneath(&m_controls);
        addChildComponent(sheet);
    }
    m_fileDialog.setBeforeChange([this] { return stopPreview(); });
    m_editDialog.setBeforeChange([this] { return stopPreview(); });
    m_controls.addComponentListener(this);
    m_settingsDialog.addComponentListener(this);
    m_fileDialog.addComponentListener(this);
    for (std::size_t index = 0; index < MainButtonCount; ++index)
        m_controls.button(static_cast<MainButton>(index)).addListener(this);
    setSize(Width, Height);
    setModel(nullptr);
}

MainGui::~MainGui()
{
    guardSystem([this] { stopPreview(); });
    if (m_notifier)
        m_notifier->removeListener(this);
    m_controls.removeComponentListener(this);
    m_settingsDialog.removeComponentListener(this);
    m_fileDialog.removeComponentListener(this);
    closeSheets();
    guardSystem([this] { letGoOfModel(); });
    // A child that goes with the keyboard hands it to its parent, which would look for the table that is to have it.
    giveAwayKeyboardFocus();
    removeAllChildren();
}

void MainGui::setNotifier(core::ChangeContextNotificationBase* notifier)
{
    if (m_notifier)
        m_notifier->removeListener(this);
    m_notifier = notifier;
    if (m_notifier)
        m_notifier->addListener(this);
    else
        onChange(core::DataModelChangeContext(nullptr));
}

void MainGui::setVideoSource(const std::shared_ptr<VideoProviderBase>& provider)
{
    // The tracks go with the last provider that has them.
    guardSystem([&] { m_videosDialog.setTrackHandler(provider ? &provider->getTrackHandler() : nullptr); });
    guardSystem([&] { m_controls.video().setProvider(provider); });
}

void MainGui::onChange(const core::ChangeContext& context)
{
    // How a run or a preview ends is told to the user, who has asked for it.
    if (context.type == core::ChangeContext::ActionFinished)
        guardUser([&] { handle(context); });
    else
        guardSystem([&] { handle(context); });
}

void MainGui::paint(juce::Graphics& graphics)
{
    guardSystem([&] { graphics.fillAll(Background); });
}

void MainGui::resized()
{
    guardSystem([this] {
        m_controls.setBounds(getLocalBounds());
        m_settingsDialog.setBounds(getLocalBounds());
        m_videosDialog.setBounds(getLocalBounds());
        m_fileDialog.setBounds(getLocalBounds());
    });
}

void MainGui::focusGained(FocusChangeType)
{
    guardSystem([this] {
        focusChangeTable();
        for (Sheet* const sheet : sheets()) {
            if (sheet->isVisible())
                sheet->takeFocus();
        }
    });
}

/// A window that gets the keyboard back gives it to what had it before, even if a sheet has come up over it since.
void MainGui::focusOfChildComponentChanged(FocusChangeType)
{
    guardSystem([this] {
        if (!m_controls.hasKeyboardFocus(true) || m_controls.isEnabled())
            return;
        for (Sheet* const sheet : sheets()) {
            if (sheet->isVisible())
                sheet->takeFocus();
        }
    });
}

bool MainGui::keyPressed(const juce::KeyPress& key)
{
    const bool isLeft = key == juce::KeyPress(juce::KeyPress::leftKey);
    const bool isRight = key == juce::KeyPress(juce::KeyPress::rightKey);
    if ((!isLeft && !isRight) || !isEnabled() || !m_controls.isEnabled())
        return false;
    guardUser([&] {
        m_controls.button(isLeft ? MainButton::In : MainButton::Out).setToggleState(true, juce::sendNotification);
    });
    return true;
}

void MainGui::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        if (m_model)
            carryOut(m_controls.which(*button));
    });
}

void MainGui::carryOut(MainButton button)
{
    switch (button) {
    case MainButton::AddOld:
        return addFiles(ListKind::Old);
    case MainButton::AddNew:
        return addFiles(ListKind::New);
    case MainButton::AddChange:
        return addFiles(ListKind::Change);
    case MainButton::Generate:
        return generate();
    case MainButton::ClearOld:
        return clear(ListKind::Old);
    case MainButton::ClearNew:
        return clear(ListKind::New);
    case MainButton::ClearChange:
        return clear(ListKind::Change);
    case MainButton::Save:
        return save();
    case MainButton::Start:
        return start();
    case MainButton::Preview:
        return switchPreview(m_controls.isOn(button));
    // Of two buttons that switch each other, both tell of a click.
    case MainButton::Source:
    case MainButton::Destination:
        return m_controls.isOn(button) ? cycleToSelection() : void();
    case MainButton::In:
    case MainButton::Out:
        return m_controls.isOn(button) ? showVideo() : void();
    case MainButton::Videos:
        return m_videosDialog.setVisible(true);
    case MainButton::Settings:
        return m_settingsDialog.setVisible(true);
    }
}

void MainGui::componentEnablementChanged(juce::Component&)
{
    guardSystem([this] {
        // The window got the keyboard when nothing in it could have it.
        if (hasKeyboardFocus(false))
            focusChangeTable();
    });
}

bool MainGui::selectChange(const core::Timecode& srcIn, const core::Timecode& dstIn)
{
    bool isSelected = false;
    guardUser([&] {
        EventTableModel* const table = m_controls.panel(ListKind::Change).model();
        if (!m_model || !table || !isEnabled() || !m_controls.isEnabled())
            return;
        const auto& events = m_model->changeEdl().events();
        const auto found = std::ranges::find_if(
            events, [&](const auto& event) { return event->srcIn() == srcIn && event->dstIn() == dstIn; });
        isSelected = found != events.end() && table->selectEvent(*found);
    });
    return isSelected;
}

void MainGui::componentVisibilityChanged(juce::Component& component)
{
    if (&component == &m_controls || component.isVisible() || m_isModelChanging)
        return;
    // A change of the VFX names, or a list that has come, counts at once.
    guardUser([this] {
        if (!m_model)
            return;
        showCommands();
        const std::wstring obstacle = CutCommands::obstacleOfNames(*m_model);
        if (obstacle.empty())
            m_model->applyVfxHandling();
        else
            Guard::tell(obstacle);
    });
}

void MainGui::selectionChanged(EventTableModel& model)
{
    ListPanel* const panel = m_controls.panelOf(model);
    if (!panel || !m_model)
        return;
    m_controls.forEachPanel([](ListPanel& each) { each.updateSelected(); });
    panel->storeSelection();
    if (panel->listKind() != ListKind::Change)
        return;
    showPreview();
    showSelection();
}

void MainGui::sortChanged(EventTableModel& model)
{
    if (ListPanel* const panel = m_controls.panelOf(model)) {
        panel->storeSortKey();
        panel->storeSelection();
    }
}

void MainGui::editRequested(const std::shared_ptr<core::EventBase>& event, EventTableModel& model,
                            juce::Point<int> position)
{
    const ListPanel* const panel = m_controls.panelOf(model);
    if (!panel)
        return;
    const juce::Point<int> mouse = getLocalPoint(nullptr, position);
    m_editDialog.setSingleSelectionMode(panel->listKind() != ListKind::Change);
    m_editDialog.setEvent(event, panel->listKind());
    m_editDialog.setTopLeftPosition(MainLayout::besideMouse(mouse.x, m_editDialog.getWidth(), getWidth()),
                                    MainLayout::besideMouse(mouse.y, m_editDialog.getHeight(), getHeight()));
    m_editDialog.setVisible(true);
}

} // namespace cadrel::gui
