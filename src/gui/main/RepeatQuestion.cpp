// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/RepeatQuestion.h"

#include "core/protect/RunRecord.h"
#include "core/time/Timecode.h"
#include "gui/look/ShownText.h"
#include "util/FilledText.h"
#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::gui {

namespace {

std::wstring timecodeText(std::int32_t frame)
{
    const core::Framerate framerate = core::Timecode::framerate();
    core::Timecode timecode;
    timecode.setFrameCount(std::clamp(frame, 0, framerate.lastFrame), framerate);
    return util::StringUtil::toWide(timecode.toString());
}

} // namespace

std::wstring RepeatQuestion::text(const core::DataModel& model)
{
    const auto runs = core::RunRecord::find(model);
    if (!runs)
        return {};
    const core::NextRun next(model, core::ProtectedRun::sourceOf(model));
    if (const auto difference = next.firstDifference(*runs))
        return util::filled(translated(L"The Old EDL isn't the cut of the last run. They differ first at %s."),
                            timecodeText(*difference)) +
               L"\n" + translated(L"If you start anyway, sound may come to stand in the wrong place.");
    if (next.hasBeenDone(*runs))
        return translated(L"This Change EDL has been carried out in the project already.") + L"\n" +
               translated(L"If you start anyway, sound may come to stand in the wrong place.");
    return {};
}

} // namespace cadrel::gui
