// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/SessionEnd.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/ProtectedRun.h"
#include "core/time/Timecode.h"
#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/project/Project.h"
#include "velmark/Attributes.h"
#include "velmark/ProjectNode.h"

#include <algorithm>
#include <cmath>
#include <cstdint>

using namespace Velmark;

namespace cadrel::host {

namespace {

constexpr double NanosecondsPerSecond = 1e9;
/// No project reaches further, and what is stored may be damaged.
constexpr int64 Furthest = 4'000'000'000'000'000'000;

std::optional<int64> endIn(IProjectNode& root)
{
    FVariant end;
    if (root.getAttribute(AttributeKey::SessionEnd, end) != ResultOk || !end.isInteger())
        return std::nullopt;
    const int64 time = end.asInteger();
    return time >= 0 && time <= Furthest ? std::optional(time) : std::nullopt;
}

/// The frame at which the last event of a cut ends.
std::int32_t endOf(const core::EventList& cut)
{
    std::int32_t end = 0;
    for (std::size_t index = 0; index < cut.size(); ++index) {
        if (cut.at(index).isValid())
            end = std::max(end, cut.at(index).dstOut().toFrameCount(core::Timecode::framerate()));
    }
    return end;
}

} // namespace

SessionEnd::SessionEnd(Project& project)
    : m_project(project), m_end(endIn(*required(query<IProjectNode>(project.document()))))
{
    if (m_end)
        m_soundEnd = soundEnd();
}

void SessionEnd::follow(const core::FrameRange& allowed) const
{
    if (!m_end)
        return;
    const auto moved = static_cast<double>(*m_end) + std::round(shift(allowed) * NanosecondsPerSecond);
    const auto end = static_cast<int64>(std::clamp(moved, 0.0, static_cast<double>(Furthest)));
    if (end != *m_end)
        requireOk(required(query<IProjectNode>(m_project.document()))
                      ->setAttribute(AttributeKey::SessionEnd, FVariant::integer(end), false));
}

double SessionEnd::shift(const core::FrameRange& allowed) const
{
    const core::DataModel& model = m_project.model();
    if (core::ProtectedRun::sourceOf(model) == core::ProtectedRun::Source::Given)
        return soundEnd() - m_soundEnd;
    const std::int32_t before = endOf(model.oldEdl());
    const std::int32_t after = endOf(model.newEdl());
    if (std::max(before, after) > allowed.end)
        return 0.0;
    return (after - before) / core::Timecode::framerate().rate;
}

double SessionEnd::soundEnd() const
{
    const double preview = m_project.previewOffset() - m_project.timeOrigin();
    double end = 0.0;
    for (const Track& track : m_project.tracksOfType(TypeWord::Audio)) {
        for (const Counted<IProjectNode>& clip : childrenOf(*required(query<IProjectNode>(track.node())))) {
            if (clip->getStart(nullptr) < preview)
                end = std::max(end, clip->getEnd(nullptr));
        }
    }
    return end;
}

} // namespace cadrel::host
