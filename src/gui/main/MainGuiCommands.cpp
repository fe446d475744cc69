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
    if (!question.empty() && (!AlertWindowBase::instance().confirm(question, L"Overwrite") || !mayGoOn()))
        return;
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
    Answers answers;
    // The host may let everything change while a box is open, so all is looked at again after each.
    bool isDone = false;
    while (!isDone)
        isDone = !endPreviewForRun() || askOrRequestRun(answers);
}

/// After a preview the source is chosen again.
bool MainGui::endPreviewForRun()
{
    const bool wasPreview = m_model->isPreviewActive();
    if (!stopPreview())
        return false;
    if (wasPreview)
        m_controls.setOn(MainButton::Source, true);
    return true;
}

bool MainGui::askOrRequestRun(Answers& answers)
{
    const std::wstring obstacle = CutCommands::obstacleOfRun(*m_model);
    if (!obstacle.empty()) {
        Guard::tell(obstacle);
        return true;
    }
    const std::wstring repetition = answers.planned.repetition(*m_model);
    if (!repetition.empty() && repetition != answers.repetition) {
        answers.repetition = repetition;
        return !mayRepeat(answers.planned, repetition);
    }
    const core::ProtectedRun& run = answers.planned.run(*m_model, m_engine->getMaterial());
    const KeepQuestion question(run, core::Timecode::framerate());
    const std::wstring loss = question.isNeeded() ? question.text() : std::wstring();
    if (!loss.empty() && loss != answers.loss) {
        answers.loss = loss;
        answers.protection = answerTo(answers.planned, loss, question.canKeep());
        return answers.protection == Protection::None;
    }
    requestRun(loss.empty() ? Protection::Plain : answers.protection, run);
    return true;
}

MainGui::Protection MainGui::answerTo(PlannedRun& planned, const std::wstring& question, bool canKeep)
{
    constexpr std::int32_t Keep = 1;
    constexpr std::int32_t DontKeep = 2;
    Protection answer = Protection::None;
    const bool mayStart = askBeforeRun(planned, [&](AlertWindowBase& alerts) {
        if (!canKeep)
            answer = alerts.confirm(question, L"Don't Keep") ? Protection::Plain : Protection::None;
        else if (const std::int32_t pressed = alerts.show(question, L"Keep", L"Don't Keep", L"Cancel"); pressed == Keep)
            answer = Protection::Kept;
        else if (pressed == DontKeep)
            answer = Protection::Plain;
    });
    return mayStart ? answer : Protection::None;
}

bool MainGui::mayRepeat(PlannedRun& planned, const std::wstring& question)
{
    bool isWanted = false;
    const bool mayStart =
        askBeforeRun(planned, [&](AlertWindowBase& alerts) { isWanted = alerts.confirm(question, L"Start Anyway"); });
    return mayStart && isWanted;
}

bool MainGui::askBeforeRun(PlannedRun& planned, const std::function<void(AlertWindowBase& alerts)>& ask)
{
    const juce::Component::SafePointer<MainGui> self(this);
    const core::DataModel* const model = m_model;
    planned.remember(*m_model);
    ask(AlertWindowBase::instance());
    const bool isSame = self && m_model == model && m_model && isEnabled() && m_controls.isEnabled();
    if (!isSame || m_engine->canStart() != Result::Ok)
        return false;
    planned.lookAgain(*m_model);
    return true;
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

/// A generated list changes with the run, so that both are one entry of the undo list.
Result::Type MainGui::requestKeptRun(const core::ProtectedRun& run)
{
    if (run.source() == core::ProtectedRun::Source::Given)
        return m_engine->startCadrelWithin(run.bounds());
    return m_engine->startCadrelWithin(run.bounds(), run.startableList(*m_model));
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
