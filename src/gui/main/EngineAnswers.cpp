// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/EngineAnswers.h"

#include "core/notify/ChangeContext.h"
#include "gui/guard/Guard.h"
#include "gui/look/ShownText.h"

namespace cadrel::gui {

using core::ActionChangeContext;
using util::Result;

namespace {

/// As a failure that is thrown.
std::wstring reasonOf(Result::Type answer)
{
    try {
        throw answer;
    } catch (...) {
        return translated(Guard::messageOfFailure());
    }
}

const wchar_t* noneSelected(std::int32_t action)
{
    return action == ActionChangeContext::Run
               ? L"No tracks selected for Cadrel process.\nPlease select the tracks that you want to use."
               : L"No tracks selected for the preview.\nPlease select the tracks that you want to use.";
}

const wchar_t* noTracks(std::int32_t action)
{
    return action == ActionChangeContext::Run ? L"No tracks available for Cadrel process."
                                              : L"No tracks available for the preview.";
}

} // namespace

std::wstring EngineAnswers::ofReadiness(Result::Type answer, std::int32_t action)
{
    switch (answer) {
    case Result::Ok:
    case Result::NoProject:
        return {};
    case Result::ChangeEdlEmpty:
        return translated(L"No events in Change EDL.");
    case Result::NoTracksSelected:
        return translated(noneSelected(action));
    default:
        return translated(noTracks(action));
    }
}

std::wstring EngineAnswers::ofRequest(Result::Type answer, std::int32_t action)
{
    switch (answer) {
    case Result::Ok:
    case Result::ChangeEdlEmpty:
    case Result::NoTracksSelected:
    case Result::NoTracks:
        return ofReadiness(answer, action);
    default:
        return reasonOf(answer);
    }
}

std::wstring EngineAnswers::ofEnd(const ActionChangeContext& end)
{
    const std::wstring reason = end.isDropped ? std::wstring() : ofRequest(end.result, end.action);
    if (reason.empty())
        return {};
    const wchar_t* const what = end.action == ActionChangeContext::Run
                                    ? L"The run has ended before it was complete. Undo takes back what it has done."
                                    : L"The preview isn't complete.";
    return translated(what) + L"\n" + reason;
}

} // namespace cadrel::gui
