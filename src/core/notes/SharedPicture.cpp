// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SharedPicture.h"

#include "core/edl/EventBase.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <optional>

namespace cadrel::core {

namespace {

/// Of runs that use the same source, so many are looked at on each side of a place.
constexpr std::size_t MostLookedAt = 128;
constexpr std::size_t MostFound = 16;

std::optional<SharedPicture> share(const PictureRun& oldRun, std::size_t oldIndex, const PictureRun& newRun,
                                   std::size_t newIndex)
{
    if (!EventBase::areSameSpeed(oldRun.sourceStep, newRun.sourceStep))
        return std::nullopt;
    const auto shift = static_cast<std::int64_t>(std::llround((newRun.source - oldRun.source) / oldRun.sourceStep));
    const std::int64_t first = std::max<std::int64_t>(0, -shift);
    const std::int64_t end = std::min<std::int64_t>(newRun.length, oldRun.length - shift);
    if (first >= end)
        return std::nullopt;
    return SharedPicture{static_cast<std::int32_t>(oldRun.start + first + shift),
                         static_cast<std::int32_t>(newRun.start + first), static_cast<std::int32_t>(end - first),
                         oldIndex, newIndex};
}

double sourceTaken(const PictureRun& run)
{
    return run.length * std::abs(run.sourceStep);
}

} // namespace

SharedPictureSearch::SharedPictureSearch(const Programme& oldCut) : m_oldCut(oldCut)
{
    const auto& runs = oldCut.runs();
    for (std::size_t index = 0; index < runs.size(); ++index) {
        Material& material = m_materials[runs[index].material];
        material.byTime.push_back(index);
        material.longestSource = std::max(material.longestSource, sourceTaken(runs[index]));
    }
    for (auto& [number, material] : m_materials) {
        material.bySource = material.byTime;
        std::stable_sort(material.bySource.begin(), material.bySource.end(),
                         [&](std::size_t a, std::size_t b) { return runs[a].source < runs[b].source; });
    }
}

std::vector<SharedPicture> SharedPictureSearch::sharedWith(const PictureRun& newRun, std::size_t newIndex) const
{
    std::vector<SharedPicture> found;
    const auto entry = m_materials.find(newRun.material);
    if (entry == m_materials.end())
        return found;
    const Material& material = entry->second;
    const auto& runs = m_oldCut.runs();
    /// Looks at the runs in turn until enough have been found or looked at.
    const auto look = [&](auto from, auto to) {
        std::size_t added = 0;
        for (std::size_t looked = 0; from != to && looked < MostLookedAt && added < MostFound; ++from, ++looked) {
            if (const auto shared = share(runs[*from], *from, newRun, newIndex)) {
                found.push_back(*shared);
                ++added;
            }
        }
    };

    const auto startsBefore = [&](double source) {
        return std::partition_point(material.bySource.begin(), material.bySource.end(),
                                    [&](std::size_t run) { return runs[run].source < source; });
    };
    const auto sourceEnd = startsBefore(newRun.source + sourceTaken(newRun) + 1);
    const auto sourceBegin = startsBefore(newRun.source - material.longestSource - 1);
    look(sourceBegin, sourceEnd);
    if (static_cast<std::size_t>(sourceEnd - sourceBegin) > MostFound) {
        const auto nearest = std::partition_point(material.byTime.begin(), material.byTime.end(),
                                                  [&](std::size_t run) { return runs[run].start < newRun.start; });
        look(std::make_reverse_iterator(sourceEnd), std::make_reverse_iterator(sourceBegin));
        look(nearest, material.byTime.end());
        look(std::make_reverse_iterator(nearest), material.byTime.rend());
    }
    const auto places = [](const SharedPicture& shared) { return std::pair(shared.newStart, shared.oldStart); };
    std::sort(found.begin(), found.end(),
              [&](const SharedPicture& a, const SharedPicture& b) { return places(a) < places(b); });
    found.erase(std::unique(found.begin(), found.end(),
                            [](const SharedPicture& a, const SharedPicture& b) { return a.oldRun == b.oldRun; }),
                found.end());
    return found;
}

void TakenFrames::take(std::int32_t start, std::int32_t end)
{
    auto next = m_endByStart.lower_bound(start);
    if (next != m_endByStart.end() && next->first == end) {
        end = next->second;
        next = m_endByStart.erase(next);
    }
    if (next != m_endByStart.begin() && std::prev(next)->second == start)
        std::prev(next)->second = end;
    else
        m_endByStart.emplace_hint(next, start, end);
}

std::int32_t TakenFrames::nextTaken(std::int32_t frame, std::int32_t limit) const
{
    const auto next = m_endByStart.upper_bound(frame);
    if (next != m_endByStart.begin() && std::prev(next)->second > frame)
        return frame;
    return next == m_endByStart.end() ? limit : std::min(limit, next->first);
}

std::int32_t TakenFrames::nextFree(std::int32_t frame) const
{
    const auto next = m_endByStart.upper_bound(frame);
    return next == m_endByStart.begin() ? frame : std::max(frame, std::prev(next)->second);
}

} // namespace cadrel::core
