// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/conform/SnippetAlgorithm.h"

#include "core/cut/CadrelPreviewState.h"
#include "core/cut/CutList.h"
#include "core/settings/Settings.h"

#include <algorithm>
#include <cmath>
#include <cstddef>

namespace cadrel::core {

using util::Result;

namespace {

/// Whether a length in seconds is less than an instant.
bool isNothing(double length)
{
    return length < SameInstant;
}

/// Whether a piece of a clip is short enough to be left out or taken along. Lengths in seconds.
bool isSnippet(double length, double clipLength, const CadrelPreviewState& state)
{
    const Settings& settings = *state.settings;
    if (isNothing(length))
        return false;
    const double frames = length * state.framerate.rate;
    const double threshold = settings.snippetThreshold();
    if (threshold <= frames && std::abs(threshold - frames) >= SameInstant)
        return false;
    return !settings.snippetUsesPercentage() || !(length / clipLength * 100.0 > settings.snippetMaxPercentage());
}

/// A short piece before the range comes along, a short piece at its start stays out.
void adjustStart(CutEventBase& range, const CadrelPreviewState& state)
{
    const SecondsRange clip = range.update(range.srcIn()).across;
    if (isNothing(clip.end - clip.start))
        return;
    const double outside = range.srcIn() - clip.start;
    const double inside = clip.end - range.srcIn();
    if (isSnippet(outside, clip.end - clip.start, state)) {
        range.setSrcIn(clip.start);
        range.setDstIn(range.dstIn() - outside);
    } else if (isSnippet(inside, clip.end - clip.start, state)) {
        range.setSrcIn(clip.end);
        range.setDstIn(range.dstIn() + inside);
    }
}

/// A short piece after the range comes along, a short piece at its end stays out. Returns whether the range has grown.
bool adjustEnd(CutEventBase& range, const CadrelPreviewState& state)
{
    const SecondsRange clip = range.update(range.srcOut()).across;
    if (isNothing(clip.end - clip.start))
        return false;
    const double outside = clip.end - range.srcOut();
    const double inside = range.srcOut() - clip.start;
    if (isSnippet(outside, clip.end - clip.start, state)) {
        range.setSrcOut(clip.end);
        range.setDstOut(range.dstOut() + outside);
        return true;
    }
    if (isSnippet(inside, clip.end - clip.start, state)) {
        range.setSrcOut(clip.start);
        range.setDstOut(range.dstOut() - inside);
    }
    return false;
}

/// The end of a range has grown over the cuts from `next` on: makes them give way on that track.
///
///     grown     |---------------|
///     next              |-|            swallowed
///     next                 |-----|     loses its start
void makeRoom(const CutEventBase& grown, const CutList& cuts, std::size_t next, std::size_t track)
{
    for (; next < cuts.size() && track < cuts.cutAt(next)->cutEvents().size(); ++next) {
        CutEventBase& follower = *cuts.cutAt(next)->cutEvents()[track];
        if (!isNothing(grown.dstIn() - follower.dstIn()))
            continue;
        if (isNothing(grown.dstOut() - follower.dstIn()))
            return;
        if (isNothing(grown.dstOut() - follower.dstOut())) {
            const double start = std::min(grown.dstOut(), follower.dstOut());
            follower.setSrcIn(follower.srcIn() + (start - follower.dstIn()));
            follower.setDstIn(start);
            return;
        }
        follower.setDstIn(follower.dstOut());
        follower.setSrcIn(follower.srcOut());
    }
}

} // namespace

Result::Type SnippetAlgorithm::process(CutList& cuts, const CadrelPreviewState& state) const
{
    if (!state.settings->includeOverhangingAudioEvents())
        return Result::Ok;
    for (std::size_t i = 0; i < cuts.size(); ++i) {
        const Cut::CutEvents& ranges = cuts.cutAt(i)->cutEvents();
        for (std::size_t track = 0; track < ranges.size(); ++track) {
            adjustStart(*ranges[track], state);
            if (adjustEnd(*ranges[track], state))
                makeRoom(*ranges[track], cuts, i + 1, track);
        }
    }
    return Result::Ok;
}

} // namespace cadrel::core
