// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/KeepQuestion.h"

#include "core/protect/ProtectedRun.h"
#include "core/time/Timecode.h"
#include "gui/look/ShownText.h"
#include "util/FilledText.h"
#include "util/StringUtil.h"

#include <algorithm>

namespace cadrel::gui {

using core::FrameRanges;
using core::KeepRefusal;

namespace {

const wchar_t* const FallsOut =
    L"%s of sound, markers or automation would be taken away, as the Change EDL doesn't carry it.";

/// The length as a timecode, as far as one can name it.
std::wstring lengthText(const FrameRanges& ranges, const core::Framerate& framerate)
{
    core::Timecode length;
    length.setFrameCount(std::min(core::lengthOf(ranges), framerate.lastFrame), framerate);
    return util::StringUtil::toWide(length.toString());
}

std::wstring amountText(const wchar_t* sentence, const FrameRanges& ranges, const core::Framerate& framerate)
{
    return util::filled(translated(sentence), lengthText(ranges, framerate));
}

} // namespace

bool KeepQuestion::isNeeded() const
{
    return !m_run.protectedMaterial().empty();
}

bool KeepQuestion::canKeep() const
{
    return !m_run.plan().refusal && (!m_run.needsRun() || m_run.isStartable());
}

std::wstring KeepQuestion::text() const
{
    const std::wstring start =
        amountText(FallsOut, m_run.protectedMaterial(), m_framerate) + L"\n" +
        translated(L"It stands outside of the cuts, under black or under picture that is the same.");
    if (canKeep())
        return start + doubts() + changeOfList();
    const FrameRanges material = m_run.plan().refusal ? m_run.plan().refusal->material : FrameRanges();
    return start + L"\n" +
           (material.empty()
                ? translated(L"It can't be kept, since nothing of the old cut is left.")
                : amountText(L"It can't be kept: %s would have to move out of the day.", material, m_framerate));
}

std::wstring KeepQuestion::changeOfList() const
{
    if (m_run.source() == core::ProtectedRun::Source::Given || !m_run.needsRun())
        return {};
    return L"\n" + translated(L"If you keep it, the Change EDL is written anew: what stays in its place leaves it.");
}

std::wstring KeepQuestion::doubts() const
{
    std::wstring text;
    for (const KeepRefusal& question : m_run.plan().questions) {
        if (question.reason == KeepRefusal::UnequalReels)
            text +=
                L"\n" + translated(L"The cuts have different reels. What stands around them would stay in its place.");
        else
            text += L"\n" + amountText(L"%s of it stands where picture has grown, and can't be kept.",
                                       question.material, m_framerate);
    }
    if (!m_run.plan().lost.empty())
        text += L"\n" +
                amountText(L"%s finds no room in the new cut and goes in any case.", m_run.plan().lost, m_framerate);
    return text;
}

} // namespace cadrel::gui
