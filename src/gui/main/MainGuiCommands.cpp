// SPDX-License-Identifier: GPL-3.0-or-later

// What the user asks the model and the engine for.

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/notify/ChangeContext.h"
#include "core/protect/ProtectedRun.h"
#include "core/protect/RunRecord.h"
#include "core/time/Timecode.h"
#include "gui/files/EdlFolder.h"
#include "gui/guard/Guard.h"
#include "gui/look/ShownText.h"
#include "gui/main/CutCommands.h"
#include "gui/main/EngineAnswers.h"
#include "gui/main/KeepQuestion.h"
#include "gui/main/MainCommands.h"
#include "gui/main/MainGui.h"
#include "gui/main/RepeatQuestion.h"
#include "gui/main/SavedChangeEdl.h"
#include "gui/services/AlertWindowBase.h"
#include "gui/services/FileBrowserDialogBase.h"
#include "util/StringUtil.h"

#include <cstddef>
#include <utility>

namespace cadrel::gui {

using core::ActionChangeContext;
using core::ListKind;
using util::Result;

// ---- Lists ---------------------------------------------------------------------------------------------------------

void MainGui::addFiles(std::int32_t listKind)
{
    if (!m_notifier || !m_model)
        return;
    if (listKind == ListKind::Old)
        m_fileDialog.showForOldList();
    else if (listKind == ListKind::New)
        m_fileDialog.showForNewList();
    else
        m_fileDialog.showForChangeList();
}

void MainGui::takeDroppedFiles(std::int32_t listKind, const std::vector<std::string>& paths)
{
    if (!isEnabled())
        return;
    addFiles(listKind);
    if (m_fileDialog.isVisible())
        m_fileDialog.takeFiles(paths);
}

void MainGui::generate()
{
    if (!MainCommands(m_model).allows(MainButton::Generate) || !stopPreview())
        return;
    m_controls.panel(ListKind::Change).table().deselectAllRows();
    Guard::tell(CutCommands::generate(*m_model));
}

void MainGui::clear(std::int32_t listKind)
{
    if (!m_notifier || !m_model || (listKind == ListKind::Change && !stopPreview()))
        return;
    CutCommands::clear(*m_model, listKind);
}

void MainGui::save()
{
    const juce::Component::SafePointer<MainGui> self(this);
    const core::DataModel* const model = m_model;
    const auto mayGoOn = [&] {
        return self && m_model == model && m_model && MainCommands(m_model).allows(MainButton::Save);
    };
    std::vector<std::string> chosen;
    FileBrowserDialogBase::instance().browse(translated(L"Save Change EDL as..."), m_saveFolder, L"edl",
                                             translated(L"Edit Decision List"), true, chosen);
    if (chosen.empty() || !mayGoOn())
        return;
    const std::wstring path = util::StringUtil::toWide(chosen.back());
    const SavedChangeEdl saved(m_model->changeEdl(), path);
    const std::wstring question = saved.question();
    if (!question.empty()) {
        constexpr std::int32_t Overwrite = 1;
        if (AlertWindowBase::instance().show(question, L"Overwrite", L"Cancel", {}) != Overwrite || !mayGoOn())
            return;
    }
    saved.write();
    m_saveFolder = folderOfFile(path);
}

// ---- The run -------------------------------------------------------------------------------------------------------

void MainGui::start()
{
    if (!m_engine || m_isRunRequested)
        return;
    const Result::Type ready = m_engine->canStart();
    if (ready != Result::Ok) {
        Guard::tell(EngineAnswers::ofReadiness(ready, ActionChangeContext::Run));
        return;
    }
    m_hadFocus = hasKeyboardFocus(true);
    const bool wasPreview = m_model->isPreviewActive();
    if (!stopPreview())
        return;
    if (wasPreview)
        m_controls.setOn(MainButton::Source, true);
    if (!mayRepeat())
        return;
    core::ProtectedRun run = plannedRun();
    const Protection protection = askForProtection(run);
    if (protection != Protection::None)
        requestRun(protection, run);
}

core::ProtectedRun MainGui::plannedRun() const
{
    return {*m_model, m_engine->getMaterial(), core::ProtectedRun::sourceOf(*m_model)};
}

MainGui::Protection MainGui::askForProtection(core::ProtectedRun& run)
{
    Protection answer = Protection::Plain;
    std::wstring asked;
    for (;;) {
        const KeepQuestion question(run, core::Timecode::framerate());
        const std::wstring text = question.text();
        if (!question.isNeeded())
            return Protection::Plain;
        // The user has answered what is to be asked now.
        if (text == asked)
            return answer;
        answer = answerTo(question);
        if (answer == Protection::None)
            return answer;
        asked = text;
        // List and material may have changed while he was asked.
        run = plannedRun();
    }
}

MainGui::Protection MainGui::answerTo(const KeepQuestion& question)
{
    // The first button is the one that Return presses.
    using Answers = std::vector<std::pair<const wchar_t*, Protection>>;
    const Answers answers =
        question.canKeep()
            ? Answers{{L"Keep", Protection::Kept}, {L"Don't Keep", Protection::Plain}, {L"Cancel", Protection::None}}
            : Answers{{L"Cancel", Protection::None}, {L"Don't Keep", Protection::Plain}};
    std::vector<const wchar_t*> buttons;
    for (const auto& [button, protection] : answers)
        buttons.push_back(button);
    const std::int32_t pressed = askBeforeRun(question.text(), buttons);
    return pressed == 0 ? Protection::None : answers[static_cast<std::size_t>(pressed) - 1].second;
}

bool MainGui::mayRepeat()
{
    const std::wstring question = RepeatQuestion::text(*m_model);
    if (question.empty())
        return true;
    constexpr std::int32_t StartAnyway = 2;
    return askBeforeRun(question, {L"Cancel", L"Start Anyway"}) == StartAnyway;
}

std::int32_t MainGui::askBeforeRun(const std::wstring& question, const std::vector<const wchar_t*>& buttons)
{
    const juce::Component::SafePointer<MainGui> self(this);
    const core::DataModel* const model = m_model;
    const std::int32_t pressed = AlertWindowBase::instance().show(question, buttons[0], buttons[1],
                                                                  buttons.size() > 2 ? buttons[2] : std::wstring());
    const bool isSame = self && m_model == model && m_model && isEnabled() && m_controls.isEnabled();
    const bool isButton = pressed >= 1 && pressed <= static_cast<std::int32_t>(buttons.size());
    return isSame && isButton && m_engine->canStart() == Result::Ok ? pressed : 0;
}

/// The sound stands in the new cut as it is.
void MainGui::noteRun()
{
    const auto command = core::createDataModelCommand(translated(L"Apply Cadrel"));
    core::RunRecord::addRun(*m_model, core::RunRecord::allowedBy(m_model->settings()));
}

void MainGui::requestRun(Protection protection, const core::ProtectedRun& run)
{
    const bool isKept = protection == Protection::Kept;
    if (isKept && !run.needsRun()) {
        noteRun();
        Guard::tell(translated(L"Everything stands where the new cut has it. Nothing has to change."));
        return;
    }
    const Result::Type answer = isKept ? requestKeptRun(run) : m_engine->startCadrel();
    if (answer != Result::Ok) {
        Guard::tell(EngineAnswers::ofRequest(answer, ActionChangeContext::Run));
        return;
    }
    m_isRunRequested = true;
    updateEnablement();
}

/// The run begins later. So the list changes only when there will be a run.
Result::Type MainGui::requestKeptRun(const core::ProtectedRun& run)
{
    const Result::Type answer = m_engine->startCadrelWithin(run.bounds());
    if (answer != Result::Ok || run.source() == core::ProtectedRun::Source::Given)
        return answer;
    try {
        const auto command = core::createDataModelCommand(translated(L"Keep Sound outside of the Change EDL"));
        run.putStartableListInto(*m_model);
    } catch (...) {
        // That drops what is requested.
        m_engine->setPreviewActive(false);
        throw;
    }
    return answer;
}

// ---- The preview ---------------------------------------------------------------------------------------------------

bool MainGui::stopPreview()
{
    const core::DataModel* const model = m_model;
    if (m_engine && m_model && m_model->isPreviewActive())
        m_engine->setPreviewActive(false);
    if (m_model != model || !m_model)
        return false;
    showPreviewState();
    return true;
}

void MainGui::switchPreview(bool isOn)
{
    const core::DataModel* const model = m_model;
    m_isPreviewTold = false;
    try {
        if (m_engine && m_model->isPreviewActive() != isOn)
            m_engine->setPreviewActive(isOn);
    } catch (...) {
        showPreviewState();
        throw;
    }
    if (m_model != model)
        return;
    showPreviewState();
    showPreview();
}

void MainGui::showPreview()
{
    tellOfPreview([this]() -> std::wstring {
        const EventTableModel* const table = changeTable();
        if (!table || !m_engine || !m_model || !m_model->isPreviewActive())
            return {};
        const Result::Type ready = m_engine->canStart();
        if (ready != Result::Ok)
            return EngineAnswers::ofReadiness(ready, ActionChangeContext::Preview);
        std::size_t before = 1;
        std::size_t after = 1;
        const auto shown = table->getSelectionWithNeighbours(table->getSelectedEvents(), before, after);
        const Result::Type answer =
            shown.empty() ? m_engine->endPreview()
                          : m_engine->startPreview(EventRows::listOf(shown), before, after, previewOptions());
        return EngineAnswers::ofRequest(answer, ActionChangeContext::Preview);
    });
}

void MainGui::cycleToSelection()
{
    tellOfPreview([this]() -> std::wstring {
        const EventTableModel* const table = changeTable();
        if (!table || !m_engine || !m_controls.isOn(MainButton::Preview))
            return {};
        std::size_t before = 0;
        std::size_t after = 0;
        const auto shown = table->getSelectionWithNeighbours(table->getSelectedEvents(), before, after);
        if (shown.empty())
            return {};
        return EngineAnswers::ofRequest(
            m_engine->cycleToEvents(EventRows::listOf(shown), before, after, previewOptions()),
            ActionChangeContext::Preview);
    });
}

void MainGui::tellOfPreview(const std::function<std::wstring()>& request)
{
    std::wstring told;
    try {
        told = request();
    } catch (...) {
        told = translated(Guard::messageOfFailure());
    }
    if (told.empty() || std::exchange(m_isPreviewTold, true))
        return;
    Guard::tell(told);
}

} // namespace cadrel::gui
