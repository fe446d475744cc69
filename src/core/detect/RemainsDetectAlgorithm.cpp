// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/RemainsDetectAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cmath>
#include <optional>

namespace cadrel::core {

namespace {

bool isRemainder(double length, double longest)
{
    return length > SameInstant && (length < longest || std::abs(length - longest) < SameInstant);
}

/// The short piece of a clip at the start of the range, as a range of the destination.
std::optional<SecondsRange> remainderAtStart(CutEventBase& cutEvent, double longest)
{
    const SecondsRange clip = cutEvent.update(cutEvent.srcIn()).across;
    if (clip.start == clip.end)
        return std::nullopt;
    const double length = std::min(clip.end, cutEvent.srcOut()) - cutEvent.srcIn();
    if (!isRemainder(length, longest))
        return std::nullopt;
    return SecondsRange{cutEvent.dstIn(), cutEvent.dstIn() + length};
}

std::optional<SecondsRange> remainderAtEnd(CutEventBase& cutEvent, double longest)
{
    const SecondsRange clip = cutEvent.update(cutEvent.srcOut()).across;
    if (clip.start == clip.end)
        return std::nullopt;
    const double length = cutEvent.srcOut() - std::max(clip.start, cutEvent.srcIn());
    if (!isRemainder(length, longest))
        return std::nullopt;
    return SecondsRange{cutEvent.dstOut() - length, cutEvent.dstOut()};
}

bool areSame(const SecondsRange& a, const SecondsRange& b)
{
    return std::abs(a.start - b.start) < SameInstant && std::abs(a.end - b.end) < SameInstant;
}

/// Only one range if a piece fills the whole cut event.
std::vector<SecondsRange> remaindersOf(CutEventBase& cutEvent, double longest)
{
    std::vector<SecondsRange> remainders;
    if (const auto atStart = remainderAtStart(cutEvent, longest))
        remainders.push_back(*atStart);
    if (const auto atEnd = remainderAtEnd(cutEvent, longest)) {
        if (remainders.empty() || !areSame(remainders.front(), *atEnd))
            remainders.push_back(*atEnd);
    }
    return remainders;
}

} // namespace

std::vector<MarkerEntry> RemainsDetectAlgorithm::detect(const CutList& cuts, const CadrelRunState& state,
                                                        ProgressHandlerBase* progress) const
{
    const double longest = m_threshold / state.framerate.rate;
    std::vector<MarkerEntry> entries;
    for (const auto& cut : inTimeOrder(cuts)) {
        for (const auto& cutEvent : cut->cutEvents()) {
            if (cutEvent->isAudio()) {
                for (const SecondsRange& remainder : remaindersOf(*cutEvent, longest)) {
                    entries.push_back({remainder.start, remainder.end,
                                       util::StringUtil::toUtf8(L"Audio snippet in " + cutEvent->getTrackName()),
                                       MarkerKind::AudioSnippet});
                }
            }
            report(progress, 1);
            stopIfCancelled(progress);
        }
    }
    return entries;
}

std::uint64_t RemainsDetectAlgorithm::estimateSteps(std::uint64_t eventCount, std::uint64_t trackCount) const
{
    return eventCount * trackCount;
}

} // namespace cadrel::core
