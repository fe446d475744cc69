// SPDX-License-Identifier: GPL-3.0-or-later

// What the window shows, and how it follows what it is told.

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/notify/ChangeContext.h"
#include "gui/guard/Guard.h"
#include "gui/main/CutCommands.h"
#include "gui/main/EmptyListHint.h"
#include "gui/main/EngineAnswers.h"
#include "gui/main/MainCommands.h"
#include "gui/main/MainGui.h"
#include "gui/main/ShownFrames.h"
#include "util/Result.h"

#include <initializer_list>
#include <utility>

namespace cadrel::gui {

using core::ActionChangeContext;
using core::ChangeContext;
using core::ListKind;
using util::Result;

void MainGui::handle(const ChangeContext& context)
{
    switch (context.type) {
    case ChangeContext::DataModelChanged:
        return setModel(static_cast<const core::DataModelChangeContext&>(context).dataModel);
    case ChangeContext::SettingsChanged:
        m_settingsDialog.setSettings(m_model ? &m_model->settings() : nullptr);
        return showCommands();
    case ChangeContext::EventListChanged:
        return listReplaced(static_cast<const core::EventListChangeContext&>(context).listKind);
    case ChangeContext::VideoListChanged:
        return m_videosDialog.refresh(m_engine ? m_engine->getMediaPool() : nullptr);
    case ChangeContext::PreviewStateChanged:
        return showPreviewState();
    case ChangeContext::ActionFinished:
        return actionEnded(static_cast<const ActionChangeContext&>(context));
    default:
        return;
    }
}

// ---- Models --------------------------------------------------------------------------------------------------------

void MainGui::setModel(core::DataModel* model)
{
    const juce::ScopedValueSetter<bool> changing(m_isModelChanging, true);
    m_isRunRequested = false;
    m_isPreviewTold = false;
    guardSystem([this] { m_editDialog.modelChanged(); });
    if (model != m_model || !model) {
        closeSheets();
        letGoOfModel();
    }
    m_model = model;
    guardSystem([this] { m_fileDialog.setModel(m_model, projectPath()); });
    guardSystem([this] { m_settingsDialog.setSettings(m_model ? &m_model->settings() : nullptr); });
    guardSystem([this] { showVideoList(); });
    if (m_model)
        guardSystem([this] { showModel(); });
    guardSystem([this] { showPreviewState(); });
    updateEnablement();
}

std::wstring MainGui::projectPath()
{
    std::wstring path;
    if (m_model && m_engine)
        guardSystem([&] { path = m_engine->getProjectName(); });
    return path;
}

/// What was begun isn't stored in a model that goes.
void MainGui::closeSheets()
{
    guardSystem([] { juce::PopupMenu::dismissAllActiveMenus(); });
    guardSystem([this] {
        m_settingsDialog.setSettings(nullptr);
        m_settingsDialog.setVisible(false);
    });
    guardSystem([this] { m_videosDialog.setVisible(false); });
}

/// Without a project there is no frame rate either.
void MainGui::letGoOfModel()
{
    m_model = nullptr;
    m_controls.forEachPanel([this](ListPanel& panel) { guardSystem([&] { panel.forget(this); }); });
    guardSystem([this] { m_controls.timeline().setEvents(core::EventList()); });
    guardSystem([this] { m_controls.video().setActive(false); });
    m_controls.setOn(MainButton::Source, true);
}

void MainGui::showModel()
{
    for (const std::int32_t listKind : {ListKind::Old, ListKind::New, ListKind::Change})
        m_controls.panel(listKind).show(*m_model, m_engine, this);
    guardSystem([this] { m_controls.timeline().setEvents(m_model->changeEdl()); });
    core::Variant atDestination;
    if (m_model->isPreviewActive()) {
        m_model->getProperty(core::PropertyKey::PreviewAtDestination, atDestination);
        m_controls.setOn(atDestination.toBool() ? MainButton::Destination : MainButton::Source, true);
    }
    resized();
    for (const std::int32_t listKind : {ListKind::Change, ListKind::Old, ListKind::New}) {
        m_controls.panel(listKind).restoreSelection();
        m_controls.panel(listKind).updateSelected();
    }
    showSelection();
}

void MainGui::updateEnablement()
{
    const bool wasEnabled = isEnabled();
    setEnabled(m_model && !m_isRunRequested);
    // A window that is disabled has no keyboard focus.
    if (!wasEnabled && isEnabled() && !getCurrentlyFocusedComponent() && getPeer() && getPeer()->isFocused())
        focusChangeTable();
}

// ---- Lists ---------------------------------------------------------------------------------------------------------

void MainGui::listReplaced(std::int32_t listKind)
{
    if (!m_model || listKind < ListKind::Old || listKind > ListKind::Change)
        return;
    if (listKind == ListKind::Change && m_engine && m_model->isPreviewActive() &&
        m_controls.isOn(MainButton::Preview)) {
        const core::DataModel* const model = m_model;
        // It shows events of the list as it was. The window's own commands end it before they change the list.
        guardSystem([this] { m_engine->setPreviewActive(false); });
        if (m_model != model)
            return;
    }
    showList(listKind);
}

void MainGui::showList(std::int32_t listKind)
{
    ListPanel& panel = m_controls.panel(listKind);
    panel.reload();
    panel.updateCounters();
    panel.storeSelection();
    m_editDialog.listChanged(core::listOf(*m_model, listKind));
    if (listKind == ListKind::Change)
        guardSystem([this] { m_controls.timeline().setEvents(m_model->changeEdl()); });
    showPreviewState();
    showSelection();
}

EventTableModel::Events MainGui::selectedChanges()
{
    const EventTableModel* const table = changeTable();
    return table ? table->getSelectedEvents() : EventTableModel::Events();
}

void MainGui::showSelection()
{
    const EventTableModel::Events selected = selectedChanges();
    const auto highlight = [&](std::int32_t listKind, auto eventsBehind) {
        guardSystem([&] {
            EventTableModel::Events related;
            if (m_model)
                guardSystem([&] { related = (m_model->*eventsBehind)(selected); });
            if (EventTableModel* const table = m_controls.panel(listKind).model())
                table->setHighlight(related);
        });
    };
    highlight(ListKind::Old, &core::DataModel::oldEventsBehind);
    highlight(ListKind::New, &core::DataModel::newEventsBehind);
    guardSystem([&] { m_controls.timeline().highlightEvents(selected); });
    showVideo();
}

void MainGui::showVideo()
{
    VideoDisplay& display = m_controls.video();
    const auto frames = ShownFrames::of(selectedChanges(), m_controls.isOn(MainButton::Out));
    guardSystem([&] {
        display.setActive(frames.has_value());
        if (frames)
            display.setFrames(frames->oldTime, frames->newTime, frames->isLast);
    });
}

void MainGui::showVideoList()
{
    core::MediaPoolInterface* const pool = m_model && m_engine ? m_engine->getMediaPool() : nullptr;
    m_videosDialog.setVideoList(m_model ? &m_model->videoList() : nullptr, pool);
    if (m_model && m_engine)
        m_videosDialog.setTimeOrigin(m_engine->getTimeOrigin());
}

// ---- The preview, and runs -----------------------------------------------------------------------------------------

void MainGui::showPreviewState()
{
    const bool isActive = m_model && m_model->isPreviewActive();
    m_controls.setOn(MainButton::Preview, isActive);
    showCommands();
}

void MainGui::showCommands()
{
    const MainCommands commands(m_model);
    for (std::size_t index = 0; index < MainButtonCount; ++index) {
        const auto which = static_cast<MainButton>(index);
        juce::Button& button = m_controls.button(which);
        const bool isUsable = commands.allows(which) || !m_model;
        // A button that is disabled loses the keyboard, and nobody gets it.
        if (!isUsable && button.hasKeyboardFocus(true))
            focusChangeTable();
        button.setEnabled(isUsable);
        const juce::String tooltip(commands.tooltip(which).c_str());
        if (button.getTooltip() != tooltip)
            button.setTooltip(tooltip);
    }
    m_controls.setListOutdated(commands.isListOutdated());
    for (const std::int32_t listKind : {ListKind::Old, ListKind::New, ListKind::Change})
        m_controls.setHint(listKind, emptyListHint(m_model, listKind));
}

void MainGui::actionEnded(const ActionChangeContext& end)
{
    const std::wstring told = EngineAnswers::ofEnd(end);
    if (end.action == ActionChangeContext::Run) {
        m_isRunRequested = false;
        updateEnablement();
        if (std::exchange(m_hadFocus, false) && getPeer() && getPeer()->isFocused())
            focusChangeTable();
        Guard::tell(told);
        return;
    }
    // The keyboard was with the host's own windows, and has come back to nobody.
    const bool isNobodys = !getCurrentlyFocusedComponent() && getPeer() && getPeer()->isFocused();
    if (hasKeyboardFocus(true) || isNobodys)
        focusChangeTable();
    if (!std::exchange(m_isPreviewTold, m_isPreviewTold || !told.empty()))
        Guard::tell(told);
}

void MainGui::focusChangeTable()
{
    if (isEnabled() && m_controls.isEnabled())
        m_controls.panel(ListKind::Change).table().grabKeyboardFocus();
}

} // namespace cadrel::gui
