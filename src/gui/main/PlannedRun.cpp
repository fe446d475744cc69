// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/PlannedRun.h"

#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "gui/main/RepeatQuestion.h"

#include <algorithm>
#include <tuple>

namespace cadrel::gui {

using core::DataModel;
using core::serialize::ByteArchive;

namespace {

ByteArchive stateOf(const DataModel& model)
{
    ByteArchive state;
    state << model;
    return state;
}

bool areSame(const ByteArchive& a, const ByteArchive& b)
{
    return std::equal(a.data(), a.data() + a.size(), b.data(), b.data() + b.size());
}

bool areSame(const core::Framerate& a, const core::Framerate& b)
{
    return std::tie(a.rate, a.framesPerSecond, a.dropFrame) == std::tie(b.rate, b.framesPerSecond, b.dropFrame);
}

} // namespace

void PlannedRun::remember(const DataModel& model)
{
    m_framerate = core::Timecode::framerate();
    if (m_state.size() == 0)
        m_state = stateOf(model);
}

void PlannedRun::lookAgain(const DataModel& model)
{
    if (!areSame(core::Timecode::framerate(), m_framerate) || !areSame(stateOf(model), m_state))
        forget();
}

void PlannedRun::forget()
{
    m_state.clear();
    m_repetition.reset();
    m_run.reset();
}

const std::wstring& PlannedRun::repetition(const DataModel& model)
{
    if (!m_repetition)
        m_repetition = RepeatQuestion::text(model);
    return *m_repetition;
}

const core::ProtectedRun& PlannedRun::run(const DataModel& model, const std::vector<core::SecondsRange>& material)
{
    if (!m_run || material != m_material) {
        m_run.emplace(model, material, core::ProtectedRun::sourceOf(model));
        m_material = material;
    }
    return *m_run;
}

} // namespace cadrel::gui
