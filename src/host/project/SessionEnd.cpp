// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/SessionEnd.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/protect/ProtectedRun.h"
#include "core/time/SecondsRange.h"
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

std::optional<int64> numberIn(IProjectNode& root, const char* key)
{
    FVariant value;
    if (root.getAttribute(key, value) != ResultOk || !value.isInteger())
        return std::nullopt;
    const int64 number = value.asInteger();
    return number >= 0 && number <= Furthest ? std::optional(number) : std::nullopt;
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
    : m_project(project), m_end(numberIn(*required(query<IProjectNode>(project.document())), AttributeKey::SessionEnd))
{
    if (m_end)
        m_sound = sound();
}

void SessionEnd::follow(const core::FrameRange& allowed) const
{
    if (!m_end)
        return;
    const std::optional<CutEnds> ends = cutEnds();
    if (!ends) {
        moveBy(sound().end - m_sound.end);
        return;
    }
    const auto standsWith = numberIn(*required(query<IProjectNode>(m_project.document())), AttributeKey::SessionCutEnd);
    if (std::max(ends->before, ends->after) > allowed.end || standsWith.value_or(ends->before) != ends->before)
        return;
    moveBy((ends->after - ends->before) / core::Timecode::framerate().rate);
    set(AttributeKey::SessionCutEnd, ends->after, true);
}

std::optional<SessionEnd::CutEnds> SessionEnd::cutEnds() const
{
    const core::DataModel& model = m_project.model();
    if (core::ProtectedRun::sourceOf(model) == core::ProtectedRun::Source::Given)
        return std::nullopt;
    const CutEnds ends{endOf(model.oldEdl()), endOf(model.newEdl())};
    const auto isBefore = [&](std::int32_t cutEnd, const Sound& sound) {
        return cutEnd / core::Timecode::framerate().rate - m_project.timeOrigin() < sound.lastStart + core::SameInstant;
    };
    // Another reel, which other lists carry.
    if (isBefore(ends.before, m_sound) && isBefore(ends.after, sound()))
        return std::nullopt;
    return ends;
}

void SessionEnd::moveBy(double seconds) const
{
    const auto moved = static_cast<double>(*m_end) + std::round(seconds * NanosecondsPerSecond);
    set(AttributeKey::SessionEnd, static_cast<int64>(std::clamp(moved, 0.0, static_cast<double>(Furthest))), false);
}

void SessionEnd::set(const char* key, int64 value, bool isStored) const
{
    IProjectNode& root = *required(query<IProjectNode>(m_project.document()));
    if (numberIn(root, key) != value)
        requireOk(root.setAttribute(key, FVariant::integer(value), isStored));
}

SessionEnd::Sound SessionEnd::sound() const
{
    const double preview = m_project.previewOffset() - m_project.timeOrigin();
    Sound found;
    for (const Track& track : m_project.tracksOfType(TypeWord::Audio)) {
        for (const Counted<IProjectNode>& clip : childrenOf(*required(query<IProjectNode>(track.node())))) {
            const double start = clip->getStart(nullptr);
            if (start < preview) {
                found.lastStart = std::max(found.lastStart, start);
                found.end = std::max(found.end, clip->getEnd(nullptr));
            }
        }
    }
    return found;
}

} // namespace cadrel::host
