// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/CutCommands.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/model/ListOfKind.h"
#include "core/protect/ProtectedRun.h"
#include "core/settings/VfxNameMatcher.h"
#include "gui/guard/Guard.h"
#include "gui/look/ShownText.h"
#include "gui/main/GenerationSettings.h"
#include "util/FilledText.h"
#include "util/Result.h"
#include "util/Utf8Text.h"

#include <cstddef>

namespace cadrel::gui {

using core::DataModel;
using core::EventList;
using core::FailureAnswer;
using core::GenerationFailure;
using core::ListKind;
using util::Result;

namespace {

const wchar_t* nameOfClearing(std::int32_t listKind)
{
    switch (listKind) {
    case ListKind::Old:
        return L"Delete Old EDL";
    case ListKind::New:
        return L"Delete New EDL";
    default:
        return L"Delete Change EDL";
    }
}

/// "5, A012C004 (reel3.edl)"; nothing where the failure names no event.
std::wstring eventText(const GenerationFailure& failure)
{
    const auto& event = failure.newEvent ? failure.newEvent : failure.oldEvent;
    if (!event)
        return {};
    std::wstring text = std::to_wstring(event->eventNumber()) + L", " + util::toShownLine(event->rollName());
    if (!event->edlFileName().empty())
        text += L" (" + util::toShownLine(event->edlFileName()) + L")";
    return text;
}

std::wstring failureText(Result::Type result, const DataModel& model)
{
    const std::wstring start = translated(L"No Change EDL could be made.") + L"\n";
    const std::wstring obstacle = CutCommands::obstacleOfNames(model);
    if (!obstacle.empty())
        return start + obstacle;
    try {
        throw result;
    } catch (...) {
        return start + translated(Guard::messageOfFailure());
    }
}

std::wstring passedOverText(std::size_t count, const GenerationFailure& first)
{
    return util::filled(translated(L"Events that can't be matched, since a timecode would lie outside of the day: %s"),
                        std::to_wstring(count)) +
           L"\n" + util::filled(translated(L"The first is event %s."), eventText(first));
}

} // namespace

void CutCommands::clear(DataModel& model, std::int32_t listKind)
{
    EventList& list = core::listOf(model, listKind);
    const auto command = core::createDataModelCommand(translated(nameOfClearing(listKind)));
    list.clear();
}

std::wstring CutCommands::generate(DataModel& model)
{
    GenerationFailure first;
    std::size_t passedOver = 0;
    const auto passOver = [&](const GenerationFailure& failure) {
        if (passedOver++ == 0)
            first = failure;
        return FailureAnswer::PassOver;
    };
    const auto command = core::createDataModelCommand(translated(L"Generate Change EDL"));
    GenerationSettings::keep(model);
    const Result::Type result = model.generateChangeEdl(passOver);
    if (result != Result::Ok)
        return failureText(result, model);
    std::wstring told;
    if (model.changeEdl().isEmpty())
        told = translated(L"Nothing of the old cut survives in the new one. See that both are of one reel.");
    if (passedOver > 0)
        told += (told.empty() ? L"" : L"\n") + passedOverText(passedOver, first);
    return told;
}

std::wstring CutCommands::obstacleOfNames(const DataModel& model)
{
    try {
        core::VfxNameMatcher().compileEnabled(model.settings().vfxPatterns());
        return {};
    } catch (Result::Type) {
        return translated(L"A VFX name of the settings can't be used. Correct it there.");
    }
}

std::wstring CutCommands::obstacleOfRun(const DataModel& model)
{
    const bool isGiven = core::ProtectedRun::sourceOf(model) == core::ProtectedRun::Source::Given;
    return isGiven ? std::wstring() : obstacleOfNames(model);
}

} // namespace cadrel::gui
