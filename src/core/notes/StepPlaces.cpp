// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepPlaces.h"

#include <algorithm>
#include <cstdint>
#include <utility>

namespace cadrel::core {

namespace {

SecondsRange rangeOf(const Programme& cut, const Framerate& framerate, const FrameSpan& span)
{
    const std::int32_t start = cut.timecodeOf(span.start, cut.reelAt(span.start));
    return {start / framerate.rate, (start + span.length) / framerate.rate};
}

/// Of stretches in the order of their starts, the last that ends by `start` and the first that starts from `end` on; null
/// where there is none.
template <typename StartOf>
std::pair<const KeptStretch*, const KeptStretch*> around(const std::vector<const KeptStretch*>& sorted, StartOf startOf,
                                                         const FrameSpan& span)
{
    const auto after = std::partition_point(sorted.begin(), sorted.end(),
                                            [&](const KeptStretch* kept) { return startOf(*kept) < span.end(); });
    const auto inside = std::partition_point(sorted.begin(), sorted.end(),
                                             [&](const KeptStretch* kept) { return startOf(*kept) < span.start; });
    return {inside == sorted.begin() ? nullptr : *(inside - 1), after == sorted.end() ? nullptr : *after};
}

/// The kept stretch after each row; null after the last one.
std::vector<const KeptStretch*> nextKept(const std::vector<NoteEntry>& entries)
{
    std::vector<const KeptStretch*> next(entries.size(), nullptr);
    for (std::size_t index = entries.size(); index > 1; --index) {
        const KeptStretch* const kept = entries[index - 1].kept();
        next[index - 2] = kept != nullptr ? kept : next[index - 1];
    }
    return next;
}

} // namespace

StepPlaces::StepPlaces(const ChangeNotes& notes) : m_notes(notes), m_inOld(notes.totals().steps)
{
    const Kept kept = keptOf();
    for (const ReelNotes& reel : notes.reels()) {
        const std::vector<const KeptStretch*> next = nextKept(reel.entries);
        const KeptStretch* before = nullptr;
        for (std::size_t index = 0; index < reel.entries.size(); ++index) {
            const NoteEntry& entry = reel.entries[index];
            if (entry.kept() != nullptr)
                before = entry.kept();
            else if (entry.step() == nullptr)
                continue;
            else if (entry.step()->action == StepAction::Move)
                addMove(entry, kept);
            else if (entry.step()->action == StepAction::Replace)
                addReplace(entry, before, next[index]);
            else if (entry.step()->action == StepAction::Relabel)
                m_inOld[entry.number - 1].push_back(oldRange(*entry.step()->changes.front().inOld));
        }
    }
    m_old.sort();
    m_new.sort();
    std::sort(m_moves.begin(), m_moves.end(),
              [](const Move& a, const Move& b) { return a.inOld.start < b.inOld.start; });
}

StepPlaces::Kept StepPlaces::keptOf() const
{
    Kept kept;
    for (const ReelNotes& reel : m_notes.reels()) {
        for (const NoteEntry& entry : reel.entries) {
            if (entry.kept() != nullptr)
                kept.byOld.push_back(entry.kept());
        }
    }
    kept.byNew = kept.byOld;
    std::sort(kept.byOld.begin(), kept.byOld.end(),
              [](const KeptStretch* a, const KeptStretch* b) { return a->oldStart < b->oldStart; });
    std::sort(kept.byNew.begin(), kept.byNew.end(),
              [](const KeptStretch* a, const KeptStretch* b) { return a->newStart < b->newStart; });
    return kept;
}

void StepPlaces::addReplace(const NoteEntry& entry, const KeptStretch* before, const KeptStretch* after)
{
    const NoteStep& step = *entry.step();
    for (const FrameSpan& removed : step.removedFrames) {
        m_old.add(oldRange(removed), entry.number);
        m_inOld[entry.number - 1].push_back(oldRange(removed));
    }
    if (step.inserted.length > 0)
        m_new.add(newRange(step.inserted), entry.number);
    addBetween(entry.number, before, after);
    if (!step.removedFrames.empty())
        return;
    const double frame = 1.0 / m_notes.framerate().rate;
    if (before != nullptr)
        m_inOld[entry.number - 1].push_back({oldRange(*before).end - frame, oldRange(*before).end});
    if (after != nullptr)
        m_inOld[entry.number - 1].push_back({oldRange(*after).start, oldRange(*after).start + frame});
}

void StepPlaces::addMove(const NoteEntry& entry, const Kept& kept)
{
    const PictureChange& move = entry.step()->changes.front();
    const SecondsRange inOld = oldRange(*move.inOld);
    m_moves.push_back({inOld, entry.number});
    m_inOld[entry.number - 1].push_back(inOld);
    addEnds(m_old, inOld, entry.number);
    addEnds(m_new, newRange(*move.inNew), entry.number);
    const auto atOrigin = around(
        kept.byOld, [](const KeptStretch& stretch) { return stretch.oldStart; }, *move.inOld);
    addBetween(entry.number, atOrigin.first, atOrigin.second);
    const auto atTarget = around(
        kept.byNew, [](const KeptStretch& stretch) { return stretch.newStart; }, *move.inNew);
    addBetween(entry.number, atTarget.first, atTarget.second);
}

/// What stands on both sides of a step. Where the two did not meet in the old cut, another step has parted the second one
/// from what was before it there.
void StepPlaces::addBetween(std::size_t step, const KeptStretch* before, const KeptStretch* after)
{
    const auto addInstant = [step](StepStretches& stretches, double time) { stretches.add({time, time}, step); };
    if (before != nullptr) {
        addInstant(m_old, oldRange(*before).end);
        addInstant(m_new, newRange(*before).end);
    }
    if (after != nullptr) {
        if (before == nullptr || before->oldEnd() == after->oldStart)
            addInstant(m_old, oldRange(*after).start);
        addInstant(m_new, newRange(*after).start);
    }
}

void StepPlaces::addEnds(StepStretches& stretches, const SecondsRange& range, std::size_t step)
{
    stretches.add({range.start, range.start}, step);
    stretches.add({range.end, range.end}, step);
}

std::size_t StepPlaces::moveOf(double oldTime) const
{
    const auto after = std::partition_point(m_moves.begin(), m_moves.end(),
                                            [oldTime](const Move& move) { return move.inOld.start <= oldTime; });
    return after == m_moves.begin() || (after - 1)->inOld.end <= oldTime ? 0 : (after - 1)->step;
}

SecondsRange StepPlaces::oldRange(const FrameSpan& span) const
{
    return rangeOf(m_notes.oldCut(), m_notes.framerate(), span);
}

SecondsRange StepPlaces::newRange(const FrameSpan& span) const
{
    return rangeOf(m_notes.newCut(), m_notes.framerate(), span);
}

} // namespace cadrel::core
