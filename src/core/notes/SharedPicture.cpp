// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SharedPicture.h"

#include "core/notes/EventPicture.h"

#include <algorithm>
#include <bit>
#include <cmath>
#include <iterator>
#include <optional>

namespace cadrel::core {

namespace {

/// Of runs that use the same source, so many are looked at on each side of a place.
constexpr std::size_t MostLookedAt = 128;
constexpr std::size_t MostFound = 16;

constexpr std::size_t FramesOfAWord = 64;

/// How many frames later in the old run the picture of a frame of the new run stands. Of a slow shot the source is rounded
/// more than the programme, so that the starts or the ends of the events decide, whichever fit better.
std::int64_t shiftBetween(const ShownRun& oldRun, const ShownRun& newRun)
{
    if (oldRun.sourceStep == newRun.sourceStep)
        return std::llround((newRun.source - oldRun.source) / oldRun.sourceStep);
    const double speed = (oldRun.eventLength < newRun.eventLength ? newRun : oldRun).sourceStep;
    const auto startOf = [](const ShownRun& run) { return run.source - run.eventFrame * run.sourceStep; };
    const auto endOf = [&](const ShownRun& run) { return startOf(run) + run.eventLength * run.sourceStep; };
    const double atStart = startOf(newRun) - startOf(oldRun);
    const double atEnd = endOf(newRun) - endOf(oldRun);
    constexpr double SameFrame = 1e-6;
    const std::int64_t ofEvents = std::abs(atEnd) < std::abs(atStart) - SameFrame
                                      ? oldRun.eventLength - newRun.eventLength + std::llround(atEnd / speed)
                                      : std::llround(atStart / speed);
    return ofEvents + newRun.eventFrame - oldRun.eventFrame;
}

std::optional<SharedPicture> share(const ShownRun& oldRun, std::size_t oldIndex, const ShownRun& newRun,
                                   std::size_t newIndex)
{
    if (!canBeSameSpeed(oldRun.sourceStep, oldRun.eventLength, newRun.sourceStep, newRun.eventLength))
        return std::nullopt;
    const std::int64_t shift = shiftBetween(oldRun, newRun);
    const std::int64_t first = std::max<std::int64_t>(0, -shift);
    const std::int64_t end = std::min<std::int64_t>(newRun.length, oldRun.length - shift);
    if (first >= end)
        return std::nullopt;
    return SharedPicture{static_cast<std::int32_t>(oldRun.start + first + shift),
                         static_cast<std::int32_t>(newRun.start + first), static_cast<std::int32_t>(end - first),
                         oldIndex, newIndex};
}

double sourceTaken(const ShownRun& run)
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

std::vector<SharedPicture> SharedPictureSearch::sharedWith(const ShownRun& newRun, std::size_t newIndex) const
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

FrameSet::FrameSet(std::int32_t length) : m_words(static_cast<std::size_t>(length) / FramesOfAWord + 1, 0) {}

void FrameSet::add(std::int32_t start, std::int32_t end)
{
    for (auto frame = static_cast<std::size_t>(start); frame < static_cast<std::size_t>(end);) {
        const std::size_t word = frame / FramesOfAWord;
        const std::size_t wordEnd = std::min((word + 1) * FramesOfAWord, static_cast<std::size_t>(end));
        m_words[word] |= (~std::uint64_t{0} >> (FramesOfAWord - (wordEnd - frame))) << frame % FramesOfAWord;
        frame = wordEnd;
    }
}

/// `passedOver` is a word whose frames are all of the kind that isn't looked for.
std::int32_t FrameSet::next(std::int32_t frame, std::int32_t limit, std::uint64_t passedOver) const
{
    if (frame >= limit)
        return limit;
    std::size_t word = static_cast<std::size_t>(frame) / FramesOfAWord;
    const std::size_t lastWord = static_cast<std::size_t>(limit - 1) / FramesOfAWord;
    std::uint64_t wanted =
        (m_words[word] ^ passedOver) & (~std::uint64_t{0} << static_cast<std::size_t>(frame) % FramesOfAWord);
    while (wanted == 0 && word < lastWord)
        wanted = m_words[++word] ^ passedOver;
    if (wanted == 0)
        return limit;
    const std::size_t found = word * FramesOfAWord + static_cast<std::size_t>(std::countr_zero(wanted));
    return std::min(limit, static_cast<std::int32_t>(found));
}

} // namespace cadrel::core
