// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/OverlapDetectAlgorithm.h"

#include "core/cut/CutList.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cstddef>
#include <limits>
#include <optional>

namespace cadrel::core {

namespace {

bool holdsMaterial(CutEventBase& cutEvent, double time)
{
    const SecondsRange clip = cutEvent.update(time).across;
    return clip.start != clip.end;
}

/// Whether both have material in the other's range.
bool collide(CutEventBase& p, CutEventBase& q)
{
    if (!(p.dstOut() > q.dstIn()))
        return false;
    const double overlap = p.dstOut() - q.dstIn();
    return holdsMaterial(p, p.srcOut() - overlap) && holdsMaterial(q, q.srcIn() + overlap);
}

/// One marker for all tracks on which one cut runs into the next; nothing if there is no such track.
std::optional<MarkerEntry> overlapOf(const Cut& previous, const Cut& current)
{
    MarkerEntry entry{std::numeric_limits<double>::max(), 0.0, util::StringUtil::toUtf8(L"Overlap in "),
                      MarkerKind::Overlap};
    bool isOverlap = false;
    const std::size_t trackCount = std::min(previous.cutEvents().size(), current.cutEvents().size());
    for (std::size_t track = 0; track < trackCount; ++track) {
        CutEventBase& p = *previous.cutEvents()[track];
        CutEventBase& q = *current.cutEvents()[track];
        if (!collide(p, q))
            continue;
        isOverlap = true;
        entry.start = std::min(entry.start, q.dstIn());
        entry.end = std::max(entry.end, p.dstOut());
        entry.name += util::StringUtil::toUtf8(p.getTrackName()) + " ";
    }
    if (!isOverlap)
        return std::nullopt;
    return entry;
}

} // namespace

std::vector<MarkerEntry> OverlapDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& /*state*/,
                                                        ProgressHandlerBase* progress) const
{
    const auto ordered = inTimeOrder(cuts);
    std::vector<MarkerEntry> entries;
    for (std::size_t i = 1; i < ordered.size(); ++i) {
        if (const auto entry = overlapOf(*ordered[i - 1], *ordered[i]))
            entries.push_back(*entry);
        report(progress, 1);
        stopIfCancelled(progress);
    }
    return entries;
}

std::uint64_t OverlapDetectAlgorithm::estimateSteps(std::uint64_t eventCount, std::uint64_t /*trackCount*/) const
{
    return eventCount;
}

} // namespace cadrel::core
