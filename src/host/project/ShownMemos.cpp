// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/ShownMemos.h"

#include "core/edl/EventBase.h"
#include "host/project/MemoPlaces.h"
#include "host/track/CoveredRanges.h"
#include "host/track/Instant.h"

#include <algorithm>
#include <cmath>
#include <utility>

using cadrel::core::SecondsRange;

namespace cadrel::host {

namespace {

bool isEmpty(const SecondsRange& range)
{
    return !isBefore(range.start, range.end);
}

/// Whether its timecodes are frames under that rate, which needn't be that of the project.
bool isValidUnder(const core::Framerate& framerate, const core::EventBase& event)
{
    return event.srcIn().isValid(framerate) && event.srcOut().isValid(framerate) && event.dstIn().isValid(framerate) &&
           event.dstOut().isValid(framerate);
}

//     event i           preview  |=================|
//     event i + 1                         |=============|      written later
//     stretch of i      preview  |========|
//                       source   |========|--------|
std::vector<ShownStretch> stretchesOf(const PreviewedEvents& previewed)
{
    const core::Framerate framerate = previewed.framerate;
    const double moved = previewed.moved;
    const double offset = previewed.start();
    std::vector<ShownStretch> shown;
    CoveredRanges later;
    for (auto next = previewed.events.rbegin(); next != previewed.events.rend(); ++next) {
        const core::EventBase& event = **next;
        if (!isValidUnder(framerate, event) || !(event.srcIn() < event.srcOut()) || !(event.dstIn() < event.dstOut()))
            continue;
        const SecondsRange whole{event.dstIn().toSeconds(framerate) + offset,
                                 event.dstOut().toSeconds(framerate) + offset};
        const double srcIn = event.srcIn().toSeconds(framerate) + moved;
        const double srcOut = event.srcOut().toSeconds(framerate) + moved;
        const SecondsRange written{std::max(whole.start, previewed.begin + previewed.offset), whole.end};
        if (isEmpty(written))
            continue;
        const std::vector<SecondsRange> pieces = later.add(written);
        for (auto piece = pieces.rbegin(); piece != pieces.rend(); ++piece) {
            const SecondsRange source{srcIn + (piece->start - whole.start),
                                      std::min(srcIn + (piece->end - whole.start), srcOut)};
            if (!isEmpty(source))
                shown.push_back({*next, static_cast<std::size_t>(piece - pieces.rbegin()), {source, *piece}, {}});
        }
    }
    std::ranges::reverse(shown);
    return shown;
}

} // namespace

double PreviewStretch::clamped(double sourceTime) const
{
    return std::clamp(sourceTime, source.start, source.end);
}

double PreviewStretch::toSource(double previewTime) const
{
    return clamped(previewTime - preview.start + source.start);
}

//     copy     preview  |=== material ===|--- nothing ---|
//                                            |-- loud --|
//     memo     source   |================|
//                             |-- loud --|
SecondsRange PreviewStretch::toSource(const SecondsRange& copy) const
{
    const SecondsRange memo{toSource(copy.start), toSource(copy.end)};
    return isBefore(memo.start, memo.end) ? memo : SecondsRange{clamped(memo.end - (copy.end - copy.start)), memo.end};
}

bool PreviewStretch::isSlower() const
{
    return isBefore(source.end - source.start, preview.end - preview.start);
}

ShownMemos::ShownMemos(const PlacedMemos& memos, const PreviewedEvents& previewed) : shown(stretchesOf(previewed))
{
    std::vector<SecondsRange> stretches;
    for (const ShownStretch& each : shown)
        stretches.push_back(each.stretch.preview);
    const MemoPlaces places(stretches);

    std::vector<std::pair<ShownStretch*, PlacedMemo>> reaching;
    for (const PlacedMemo& memo : memos.all()) {
        if (isBefore(memo.span.end, previewed.start()))
            continue;
        const auto [inside, touched] = places.find(memo.span);
        if (inside)
            shown[*inside].copies.push_back(memo);
        else if (touched)
            reaching.emplace_back(&shown[*touched], memo);
        else
            adrift.push_back(memo);
    }
    for (const auto& [stretch, memo] : reaching)
        stretch->copies.push_back(memo);
}

} // namespace cadrel::host
