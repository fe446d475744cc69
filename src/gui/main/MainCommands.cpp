// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainCommands.h"

#include "core/model/DataModel.h"
#include "gui/look/ShownText.h"
#include "gui/main/GenerationSettings.h"
#include "util/Result.h"

namespace cadrel::gui {

using util::Result;

namespace {

const wchar_t* purposeOf(MainButton button)
{
    switch (button) {
    case MainButton::AddOld:
    case MainButton::AddNew:
    case MainButton::AddChange:
        return L"Add EDL";
    case MainButton::ClearOld:
    case MainButton::ClearNew:
    case MainButton::ClearChange:
        return L"Delete EDL";
    case MainButton::Start:
        return L"Start Cadrel";
    case MainButton::Generate:
        return L"Generate Change EDL";
    case MainButton::Settings:
        return L"Open Cadrel Settings";
    case MainButton::Save:
        return L"Save Change EDL";
    case MainButton::Source:
        return L"Show Source Preview";
    case MainButton::Destination:
        return L"Show Destination Preview";
    case MainButton::Videos:
        return L"Open Video Preview Settings";
    case MainButton::In:
        return L"Preview First Video Frame";
    case MainButton::Out:
        return L"Preview Last Video Frame";
    case MainButton::Preview:
        return L"Activate/Deactivate Preview";
    }
    throw Result::InvalidArgument;
}

} // namespace

bool MainCommands::allows(MainButton button) const
{
    return obstacle(button) == nullptr;
}

std::wstring MainCommands::purpose(MainButton button)
{
    return translated(purposeOf(button));
}

std::wstring MainCommands::tooltip(MainButton button) const
{
    const wchar_t* const reason = obstacle(button);
    if (reason)
        return translated(reason);
    if (button == MainButton::Generate && isListOutdated())
        return translated(L"The settings have changed since the Change EDL was generated. Press to generate it anew.");
    return purpose(button);
}

bool MainCommands::isListOutdated() const
{
    return m_model && GenerationSettings::haveChanged(*m_model);
}

const wchar_t* MainCommands::obstacle(MainButton button) const
{
    if (!m_model)
        return L"No project is open.";
    switch (button) {
    case MainButton::Generate:
        return obstacleOfGenerating();
    case MainButton::ClearOld:
        return m_model->oldEdl().isEmpty() ? L"The Old EDL is empty." : nullptr;
    case MainButton::ClearNew:
        return m_model->newEdl().isEmpty() ? L"The New EDL is empty." : nullptr;
    case MainButton::ClearChange:
        return m_model->changeEdl().isEmpty() ? L"The Change EDL is empty." : nullptr;
    case MainButton::Start:
        return m_model->changeEdl().isEmpty() ? L"No events in Change EDL." : nullptr;
    case MainButton::Save:
        if (m_model->changeEdl().isEmpty())
            return L"No events in Change EDL.";
        return m_model->changeEdl().hasReadableEvent() ? nullptr : L"No event of the Change EDL can be written.";
    case MainButton::Preview:
        return m_model->changeEdl().isEmpty() && !m_model->isPreviewActive() ? L"No events in Change EDL." : nullptr;
    case MainButton::Source:
    case MainButton::Destination:
        return m_model->isPreviewActive() ? nullptr : L"Switch the preview on first.";
    default:
        return nullptr;
    }
}

const wchar_t* MainCommands::obstacleOfGenerating() const
{
    if (m_model->oldEdl().isEmpty())
        return m_model->newEdl().isEmpty() ? L"Add an Old EDL and a New EDL first." : L"Add an Old EDL first.";
    return m_model->newEdl().isEmpty() ? L"Add a New EDL first." : nullptr;
}

} // namespace cadrel::gui
