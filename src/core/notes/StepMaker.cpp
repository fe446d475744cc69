// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepMaker.h"

#include "core/notes/PrefixTrees.h"
#include "core/notes/ReelMoves.h"
#include "core/notes/StayingBlocks.h"
#include "core/notes/StepChanges.h"

#include <algorithm>
#include <cstddef>
#include <limits>
#include <utility>

namespace cadrel::core {

namespace {

/// What can stand at one place of a reel at one time or another. All of them stand in one order that holds through all
/// steps; a step only makes some of them empty and gives others their frames.
struct Slot {
    enum class Kind {
        Lifted,   ///< old frames that go
        Origin,   ///< a block that is moved to elsewhere
        Inserted, ///< new frames
        Block,    ///< where a block begins; no frames
        Kept,     ///< a kept stretch
        End,      ///< of the reel; no frames
    };

    Kind kind;
    std::size_t reel;       ///< place in the list of pairs
    FrameSpan frames;       ///< of the old programme, or the new one for Inserted
    std::size_t index = 0;  ///< of the block for Origin and Block, of the kept stretch for Kept
    bool isInBlock = false; ///< frames that go from within a block
};

class StepMaker {
public:
    StepMaker(const Programme& oldCut, const Programme& newCut, const std::vector<KeptStretch>& kept)
        : m_oldCut(oldCut), m_newCut(newCut), m_changes(oldCut, newCut)
    {
        for (const KeptStretch& stretch : kept)
            (stretch.isDoubled ? m_doubled : m_kept).push_back(stretch);
        m_list.reels = pairReels(oldCut, newCut, m_kept);
        m_list.rows.resize(m_list.reels.size());
        m_blocks = findBlocks(oldCut, newCut, m_kept, m_list.reels);
        sortByOldPlaces();
        for (std::size_t reel = 0; reel < m_list.reels.size(); ++reel)
            addSlots(reel);
    }

    StepList make()
    {
        PrefixSum frames(m_slots.size());
        m_frames = &frames;
        for (std::size_t slot = 0; slot < m_slots.size(); ++slot)
            frames.set(slot, framesAtFirst(m_slots[slot]));
        for (std::size_t slot = 0; slot < m_slots.size(); ++slot)
            carryOut(slot);
        m_frames = nullptr;
        return std::move(m_list);
    }

private:
    void sortByOldPlaces()
    {
        for (std::size_t index = 0; index < m_kept.size(); ++index)
            m_keptByOld.push_back(index);
        std::sort(m_keptByOld.begin(), m_keptByOld.end(),
                  [this](std::size_t a, std::size_t b) { return m_kept[a].oldStart < m_kept[b].oldStart; });
        m_blockOf.resize(m_kept.size());
        for (std::size_t block = 0; block < m_blocks.size(); ++block) {
            for (std::size_t index = m_blocks[block].first; index <= m_blocks[block].last; ++index)
                m_blockOf[index] = block;
        }
        m_originOf.resize(m_blocks.size());
        m_slotOfBlock.resize(m_blocks.size());
        m_slotOfKept.resize(m_kept.size());
        m_isInPlace.resize(m_blocks.size());
        for (std::size_t block = 0; block < m_blocks.size(); ++block)
            m_isInPlace[block] = m_blocks[block].stays;
    }

    void addSlot(Slot::Kind kind, std::size_t reel, FrameSpan frames, std::size_t index = 0, bool isInBlock = false)
    {
        m_slots.push_back({kind, reel, frames, index, isInBlock});
    }

    void addSlots(std::size_t reel)
    {
        m_firstSlots.push_back(m_slots.size());
        const ReelChange& pair = m_list.reels[reel];
        OldWalk walk = walkOf(pair);
        if (pair.newReel)
            addNewReel(*pair.newReel, reel, walk);
        else
            addWhatGoes(walk, reel);
        addSlot(Slot::Kind::End, reel, {});
    }

    /// A walk through an old reel.
    struct OldWalk {
        std::int32_t frame = 0;
        std::int32_t end = 0;
        std::size_t next = 0; ///< kept stretch in the order of the old programme
    };

    OldWalk walkOf(const ReelChange& pair) const
    {
        if (!pair.oldReel)
            return {};
        const Reel& reel = m_oldCut.reels()[*pair.oldReel];
        const auto next = std::partition_point(m_keptByOld.begin(), m_keptByOld.end(),
                                               [&](std::size_t index) { return m_kept[index].oldStart < reel.start; }) -
                          m_keptByOld.begin();
        return {reel.start, reel.end(), static_cast<std::size_t>(next)};
    }

    /// Walks up to the next block that stays.
    void addWhatGoes(OldWalk& walk, std::size_t reel)
    {
        while (walk.frame < walk.end) {
            const bool hasNext = walk.next < m_keptByOld.size() && m_kept[m_keptByOld[walk.next]].oldStart < walk.end;
            const std::int32_t start = hasNext ? m_kept[m_keptByOld[walk.next]].oldStart : walk.end;
            if (walk.frame < start)
                addSlot(Slot::Kind::Lifted, reel, {walk.frame, start - walk.frame});
            walk.frame = start;
            if (!hasNext)
                return;
            const std::size_t block = m_blockOf[m_keptByOld[walk.next]];
            walk.next += m_blocks[block].last - m_blocks[block].first + 1;
            walk.frame = m_blocks[block].inOld.end();
            if (m_blocks[block].stays)
                return;
            m_originOf[block] = m_slots.size();
            addSlot(Slot::Kind::Origin, reel, m_blocks[block].inOld, block);
        }
    }

    void addNewReel(std::size_t newReel, std::size_t reel, OldWalk& walk)
    {
        const Reel& frames = m_newCut.reels()[newReel];
        std::int32_t frame = frames.start;
        const auto addInserted = [&](std::int32_t end) {
            if (frame < end)
                addSlot(Slot::Kind::Inserted, reel, {frame, end - frame});
        };
        std::size_t cut = cutWithInsert(frame, frames);
        for (; m_nextBlock < m_blocks.size() && m_blocks[m_nextBlock].newReel == newReel; ++m_nextBlock) {
            const KeptBlock& block = m_blocks[m_nextBlock];
            if (cut == m_nextBlock)
                addWhatGoes(walk, reel);
            addInserted(m_kept[block.first].newStart);
            m_slotOfBlock[m_nextBlock] = m_slots.size();
            addSlot(Slot::Kind::Block, reel, {}, m_nextBlock);
            for (std::size_t index = block.first; index <= block.last; ++index) {
                const KeptStretch& kept = m_kept[index];
                if (index > block.first) {
                    const std::int32_t oldEnd = m_kept[index - 1].oldEnd();
                    if (oldEnd < kept.oldStart)
                        addSlot(Slot::Kind::Lifted, reel, {oldEnd, kept.oldStart - oldEnd}, m_nextBlock, true);
                    addInserted(kept.newStart);
                }
                m_slotOfKept[index] = m_slots.size();
                addSlot(Slot::Kind::Kept, reel, {kept.oldStart, kept.length}, index);
                frame = kept.newEnd();
            }
            if (block.stays) {
                ++m_nextBlock;
                cut = cutWithInsert(frame, frames);
                --m_nextBlock;
            }
        }
        if (cut == m_nextBlock)
            addWhatGoes(walk, reel);
        addInserted(frames.end());
    }

    /// Old frames that go between two blocks that stay can go before any block that is moved in between. This is the first
    /// one with new frames before it, so that one step does both; the next one when there is none. `frame` is the end of
    /// the block before.
    std::size_t cutWithInsert(std::int32_t frame, const Reel& newReel) const
    {
        for (std::size_t block = m_nextBlock;; ++block) {
            const bool isInReel = block < m_blocks.size() && m_kept[m_blocks[block].first].newStart < newReel.end();
            if (frame < (isInReel ? m_kept[m_blocks[block].first].newStart : newReel.end()))
                return block;
            if (!isInReel || m_blocks[block].stays)
                return m_nextBlock;
            frame = m_kept[m_blocks[block].last].newEnd();
        }
    }

    std::int32_t framesAtFirst(const Slot& slot) const
    {
        switch (slot.kind) {
        case Slot::Kind::Lifted:
            return !slot.isInBlock || m_blocks[slot.index].stays ? slot.frames.length : 0;
        case Slot::Kind::Origin:
            return slot.frames.length;
        case Slot::Kind::Kept:
            return m_blocks[m_blockOf[slot.index]].stays ? slot.frames.length : 0;
        case Slot::Kind::Inserted:
        case Slot::Kind::Block:
        case Slot::Kind::End:
            break;
        }
        return 0;
    }

    WorkPlace placeOf(std::size_t slot) const
    {
        const std::size_t reel = m_slots[slot].reel;
        return {reel, m_frames->ofFirst(slot) - m_frames->ofFirst(m_firstSlots[reel])};
    }

    void carryOut(std::size_t slot)
    {
        const Slot& what = m_slots[slot];
        auto& rows = m_list.rows[what.reel];
        switch (what.kind) {
        case Slot::Kind::Lifted:
        case Slot::Kind::Inserted:
            m_waiting.push_back(slot);
            break;
        case Slot::Kind::Origin:
            if (m_isInPlace[what.index]) {
                tellMoveEnd(what.index, slot);
                break;
            }
            if (const Slot& next = nextThatStays(slot); next.kind == Slot::Kind::Block)
                replaceWaiting(m_blocks[next.index].first);
            else if (next.kind == Slot::Kind::End)
                replaceWaiting(std::nullopt);
            rows.emplace_back(move(what.index));
            break;
        case Slot::Kind::Block:
            replaceWaiting(m_blocks[what.index].first);
            if (m_isInPlace[what.index])
                tellMoveEnd(what.index, slot);
            else
                rows.emplace_back(move(what.index));
            break;
        case Slot::Kind::Kept:
            replaceWaiting(what.index);
            keep(slot);
            break;
        case Slot::Kind::End:
            replaceWaiting(std::nullopt);
            m_lastKept.reset();
            break;
        }
    }

    /// The first slot after one that isn't the origin of a block. Where more is to be replaced there, what waits is
    /// replaced together with it, after the moves.
    const Slot& nextThatStays(std::size_t slot) const
    {
        while (m_slots[slot].kind == Slot::Kind::Origin)
            ++slot;
        return m_slots[slot];
    }

    void keep(std::size_t slot)
    {
        const KeptStretch& kept = m_kept[m_slots[slot].index];
        auto& rows = m_list.rows[m_slots[slot].reel];
        rows.emplace_back(kept);
        m_lastKept = m_slots[slot].index;
        for (const PictureChange& change : m_changes.ofVersions(kept)) {
            NoteStep step;
            step.action = StepAction::Relabel;
            step.place = placeOf(slot);
            step.place.frame += change.inNew->start - kept.newStart;
            step.inserted = *change.inNew;
            step.changes = {change};
            rows.emplace_back(step);
        }
    }

    NoteStep move(std::size_t block)
    {
        const KeptBlock& moved = m_blocks[block];
        NoteStep step;
        step.action = StepAction::Move;
        step.from = placeOf(m_originOf[block]);
        step.moved = moved.inOld.length;
        m_frames->set(m_originOf[block], 0);
        step.place = placeOf(m_slotOfBlock[block]);
        for (std::size_t slot = m_slotOfBlock[block] + 1; slot <= m_slotOfKept[moved.last]; ++slot) {
            if (m_slots[slot].kind != Slot::Kind::Inserted)
                m_frames->set(slot, m_slots[slot].frames.length);
        }
        m_isInPlace[block] = true;
        step.changes = {moveOf(moved)};
        return step;
    }

    PictureChange moveOf(const KeptBlock& moved) const
    {
        const std::int32_t newStart = m_kept[moved.first].newStart;
        return m_changes.ofMoving(moved.inOld, {newStart, m_kept[moved.last].newEnd() - newStart});
    }

    /// Of a block that a step of another reel has moved.
    void tellMoveEnd(std::size_t block, std::size_t slot)
    {
        if (m_blocks[block].stays)
            return;
        const std::size_t source = m_slots[m_originOf[block]].reel;
        const std::size_t target = m_slots[m_slotOfBlock[block]].reel;
        if (source == target)
            return;
        const bool isTarget = m_slots[slot].reel == target;
        m_list.rows[m_slots[slot].reel].emplace_back(
            MoveEnd{placeOf(slot), isTarget, isTarget ? source : target, moveOf(m_blocks[block])});
    }

    /// Carries out what has gathered between two kept stretches, as one step.
    void replaceWaiting(std::optional<std::size_t> nextKept)
    {
        if (m_waiting.empty())
            return;
        NoteStep step;
        step.place = placeOf(m_waiting.front());
        for (const std::size_t slot : m_waiting) {
            const FrameSpan& frames = m_slots[slot].frames;
            if (m_slots[slot].kind == Slot::Kind::Inserted) {
                step.inserted = frames;
            } else {
                step.removedFrames.push_back(frames);
                step.removed += frames.length;
            }
        }
        const std::vector<KeptStretch> doubled = doubledIn(step.inserted);
        step.changes = m_changes.ofReplacing(step, surroundingsOf(step, nextKept), doubled);
        for (const PictureChange& change : step.changes) {
            if (change.kind == ChangeKind::Doubled)
                step.doubledFrom.push_back(placeOfOld(change.inOld->start));
        }
        for (const std::size_t slot : m_waiting)
            m_frames->set(slot, m_slots[slot].kind == Slot::Kind::Inserted ? m_slots[slot].frames.length : 0);
        m_list.rows[m_slots[m_waiting.front()].reel].emplace_back(std::move(step));
        m_waiting.clear();
    }

    StepSurroundings surroundingsOf(const NoteStep& step, std::optional<std::size_t> nextKept) const
    {
        StepSurroundings around;
        if (m_lastKept)
            around.beforeInNew = m_kept[*m_lastKept];
        if (nextKept)
            around.afterInNew = m_kept[*nextKept];
        if (step.removedFrames.empty())
            return around;
        if (const auto before = keptAtOld(step.removedFrames.front().start - 1))
            around.beforeInOld = m_kept[*before];
        if (const auto after = keptAtOld(step.removedFrames.back().end()))
            around.afterInOld = m_kept[*after];
        return around;
    }

    /// The kept stretch that holds a frame of the old programme.
    std::optional<std::size_t> keptAtOld(std::int32_t frame) const
    {
        const auto after = std::partition_point(m_keptByOld.begin(), m_keptByOld.end(),
                                                [&](std::size_t index) { return m_kept[index].oldStart <= frame; });
        if (after == m_keptByOld.begin() || m_kept[*(after - 1)].oldEnd() <= frame)
            return std::nullopt;
        return *(after - 1);
    }

    std::vector<KeptStretch> doubledIn(const FrameSpan& inserted) const
    {
        const auto first = std::partition_point(m_doubled.begin(), m_doubled.end(), [&](const KeptStretch& stretch) {
            return stretch.newStart < inserted.start;
        });
        const auto end = std::partition_point(
            first, m_doubled.end(), [&](const KeptStretch& stretch) { return stretch.newStart < inserted.end(); });
        return {first, end};
    }

    /// Where a frame of the old programme that is kept stands now.
    WorkPlace placeOfOld(std::int32_t frame) const
    {
        const std::size_t kept = *keptAtOld(frame);
        const std::size_t block = m_blockOf[kept];
        const std::size_t slot = m_isInPlace[block] ? m_slotOfKept[kept] : m_originOf[block];
        WorkPlace place = placeOf(slot);
        place.frame += frame - m_slots[slot].frames.start;
        return place;
    }

    const Programme& m_oldCut;
    const Programme& m_newCut;
    const StepChanges m_changes;
    std::vector<KeptStretch> m_kept; ///< none of them doubled, in the order of the new programme
    std::vector<KeptStretch> m_doubled;
    std::vector<std::size_t> m_keptByOld; ///< places of kept stretches in the order of the old programme
    std::vector<KeptBlock> m_blocks;
    std::vector<std::size_t> m_blockOf;     ///< of each kept stretch
    std::vector<std::size_t> m_originOf;    ///< the slot of each block that moves
    std::vector<std::size_t> m_slotOfBlock; ///< where each block begins in the new reel
    std::vector<std::size_t> m_slotOfKept;
    std::vector<bool> m_isInPlace; ///< of each block
    std::vector<Slot> m_slots;
    std::vector<std::size_t> m_firstSlots; ///< of each pair of reels
    std::size_t m_nextBlock = 0;
    PrefixSum* m_frames = nullptr;         ///< how many each slot has now
    std::vector<std::size_t> m_waiting;    ///< slots that the next step replaces
    std::optional<std::size_t> m_lastKept; ///< in the reel in hand
    StepList m_list;
};

} // namespace

StepList makeSteps(const Programme& oldCut, const Programme& newCut, const std::vector<KeptStretch>& kept,
                   const Framerate& framerate)
{
    StepList list = StepMaker(oldCut, newCut, kept).make();
    moveReels(list, oldCut, newCut, framerate);
    return list;
}

} // namespace cadrel::core
