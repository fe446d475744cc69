// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepChanges.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/notes/EventPicture.h"

#include <algorithm>
#include <cstddef>
#include <cstdlib>
#include <initializer_list>
#include <utility>

namespace cadrel::core {

namespace {

/// The frames of one event among those that a step removes or inserts; of a gap, too.
struct ShotPiece {
    std::int32_t event = ShownRun::NoEvent;
    FrameSpan frames;
    bool hasTransition = false;
    std::int32_t name = 0;        ///< that of its run
    std::int32_t eventLength = 0; ///< likewise
    bool isTold = false;          ///< as a part of another change
};

std::vector<ShotPiece> piecesOf(const Programme& programme, const FrameSpan& frames)
{
    std::vector<ShotPiece> pieces;
    if (frames.length == 0)
        return pieces;
    const auto& runs = programme.runs();
    for (std::size_t index = programme.runAt(frames.start); index < runs.size() && runs[index].start < frames.end();
         ++index) {
        const ShownRun& run = runs[index];
        const std::int32_t start = std::max(run.start, frames.start);
        const std::int32_t length = std::min(run.end(), frames.end()) - start;
        if (!pieces.empty() && pieces.back().event == run.event) {
            pieces.back().frames.length += length;
            pieces.back().hasTransition |= run.isTransition;
        } else {
            pieces.push_back({run.event, {start, length}, run.isTransition, run.name, run.eventLength});
        }
    }
    return pieces;
}

/// How many shots there are; a gap is none.
std::int32_t shotsIn(const Programme& programme, const FrameSpan& frames)
{
    const std::vector<ShotPiece> pieces = piecesOf(programme, frames);
    const auto shots = std::count_if(pieces.begin(), pieces.end(),
                                     [](const ShotPiece& piece) { return piece.event != ShownRun::NoEvent; });
    return std::max<std::int32_t>(1, static_cast<std::int32_t>(shots));
}

std::int32_t eventAt(const Programme& programme, std::int32_t frame)
{
    return programme.runs()[programme.runAt(frame)].event;
}

const EventBase* shotOf(const Programme& programme, std::int32_t event)
{
    return event == ShownRun::NoEvent ? nullptr : &programme.events().at(static_cast<std::size_t>(event));
}

/// Null where there are only gaps.
const EventBase* firstShotOf(const Programme& programme, const FrameSpan& frames)
{
    const auto& runs = programme.runs();
    for (std::size_t run = programme.runAt(frames.start); run < runs.size() && runs[run].start < frames.end(); ++run) {
        if (!runs[run].isGap())
            return programme.eventOf(runs[run]);
    }
    return nullptr;
}

/// The frames of a programme that an event is seen in around a frame of it.
bool isWhole(const Programme& programme, const ShotPiece& piece)
{
    const bool goesOnBefore = piece.frames.start > 0 && eventAt(programme, piece.frames.start - 1) == piece.event;
    const bool goesOnAfter =
        piece.frames.end() < programme.length() && eventAt(programme, piece.frames.end()) == piece.event;
    return !goesOnBefore && !goesOnAfter;
}

/// What a step has left of a shot at its head or tail, and what it has put there.
struct Trim {
    std::int32_t removed = 0;
    std::int32_t inserted = 0;
    std::int32_t fromTransition = 0; ///< what a transition of another length lets it win
    const EventBase* oldShot = nullptr;
    const EventBase* newShot = nullptr;
    std::optional<FrameSpan> inOld;
    std::optional<FrameSpan> inNew;

    std::int32_t change() const { return inserted - removed + fromTransition; }
};

/// Works out the changes of one step.
class Description {
public:
    Description(const StepChanges& tellers, const Programme& oldCut, const Programme& newCut, const NoteStep& step,
                const StepSurroundings& around, const std::vector<KeptStretch>& doubled)
        : m_tellers(tellers), m_oldCut(oldCut), m_newCut(newCut), m_around(around)
    {
        for (const FrameSpan& frames : step.removedFrames) {
            const auto pieces = piecesOf(oldCut, frames);
            m_old.insert(m_old.end(), pieces.begin(), pieces.end());
        }
        std::int32_t frame = step.inserted.start;
        for (const KeptStretch& stretch : doubled) {
            addNew({frame, stretch.newStart - frame});
            m_doubled.push_back(stretch);
            frame = stretch.newEnd();
        }
        addNew({frame, step.inserted.end() - frame});
    }

    std::vector<PictureChange> make()
    {
        findTrims();
        tellTransition();
        tellTrim(ChangeKind::TailTrimmed, m_tail);
        tellTrim(ChangeKind::TailTrimmed, m_otherTail);
        tellRetimes();
        tellReplacements();
        tellRest();
        tellTrim(ChangeKind::HeadTrimmed, m_otherHead);
        tellTrim(ChangeKind::HeadTrimmed, m_head);
        if (m_changes.empty())
            tellRecut();
        return std::move(m_changes);
    }

private:
    void addNew(const FrameSpan& frames)
    {
        const auto pieces = piecesOf(m_newCut, frames);
        m_new.insert(m_new.end(), pieces.begin(), pieces.end());
    }

    bool isLastOf(const Programme& programme, const std::optional<KeptStretch>& before, std::int32_t end,
                  const ShotPiece& piece) const
    {
        return before && piece.event != ShownRun::NoEvent && eventAt(programme, end - 1) == piece.event;
    }

    void findTrims()
    {
        findOldTrims();
        if (!m_new.empty() && m_around.beforeInNew &&
            isLastOf(m_newCut, m_around.beforeInNew, m_around.beforeInNew->newEnd(), m_new.front()) &&
            m_new.front().frames.start == m_around.beforeInNew->newEnd())
            addInserted(m_tail, m_new.front());
        if (!m_new.empty() && !m_new.back().isTold && m_around.afterInNew &&
            m_new.back().event == eventAt(m_newCut, m_around.afterInNew->newStart) &&
            m_new.back().event != ShownRun::NoEvent && m_new.back().frames.end() == m_around.afterInNew->newStart)
            addInserted(m_head, m_new.back());
    }

    void findOldTrims()
    {
        if (m_old.empty())
            return;
        ShotPiece& first = m_old.front();
        const bool endsShotBefore = m_around.beforeInOld && m_around.beforeInOld->oldEnd() == first.frames.start &&
                                    isLastOf(m_oldCut, m_around.beforeInOld, m_around.beforeInOld->oldEnd(), first);
        ShotPiece& last = m_old.back();
        const bool beginsShotAfter = m_around.afterInOld && m_around.afterInOld->oldStart == last.frames.end() &&
                                     last.event != ShownRun::NoEvent &&
                                     eventAt(m_oldCut, m_around.afterInOld->oldStart) == last.event;
        if (&first == &last && endsShotBefore && beginsShotAfter)
            return; // a part out of the middle of a shot
        if (endsShotBefore)
            addRemoved(beginsAlike() ? m_tail : m_otherTail, first);
        if (beginsShotAfter)
            addRemoved(endsAlike() ? m_head : m_otherHead, last);
    }

    void addRemoved(Trim& trim, ShotPiece& piece)
    {
        trim.removed = piece.frames.length;
        trim.oldShot = shotOf(m_oldCut, piece.event);
        trim.inOld = piece.frames;
        m_oldTransition |= piece.hasTransition;
        piece.isTold = true;
    }

    void addInserted(Trim& trim, ShotPiece& piece)
    {
        trim.inserted = piece.frames.length;
        trim.newShot = shotOf(m_newCut, piece.event);
        trim.inNew = piece.frames;
        m_newTransition |= piece.hasTransition;
        piece.isTold = true;
    }

    bool beginsAlike() const { return m_around.beforeInOld == m_around.beforeInNew; }
    bool endsAlike() const { return m_around.afterInOld == m_around.afterInNew; }

    /// Of a transition into a shot that stays. What the trims on both sides of it take from each other comes from the
    /// transition alone.
    void tellTransition()
    {
        if (!m_oldTransition && !m_newTransition)
            return;
        PictureChange change;
        change.kind = !m_oldTransition   ? ChangeKind::TransitionAdded
                      : !m_newTransition ? ChangeKind::TransitionRemoved
                                         : ChangeKind::TransitionChanged;
        const Trim& oldHead = m_head.oldShot != nullptr ? m_head : m_otherHead;
        change.oldShot = oldHead.oldShot != nullptr ? oldHead.oldShot : oldShotAfter();
        change.newShot = m_head.newShot != nullptr ? m_head.newShot : newShotAfter();
        change.inOld = oldHead.inOld;
        change.inNew = m_head.inNew;
        if (m_newTransition && change.newShot != nullptr)
            change.frames = change.newShot->transitionDuration();
        m_changes.push_back(change);
        moveCutsToCentres(change);
    }

    /// Whether the shot before the step goes out in the transition of the last of the pieces.
    static bool goesOutOfShotBefore(const std::vector<ShotPiece>& pieces)
    {
        return pieces.size() == 1 || (pieces.size() == 2 && pieces.front().isTold);
    }

    /// The shots of a transition are taken to meet in the middle of it.
    void moveCutsToCentres(const PictureChange& transition)
    {
        const std::int32_t oldDuration = m_oldTransition ? durationOf(transition.oldShot) : 0;
        const std::int32_t newDuration = m_newTransition ? durationOf(transition.newShot) : 0;
        if (m_oldTransition && m_around.afterInOld && (m_old.size() > 1 || m_around.beforeInOld)) {
            const std::int32_t half = oldDuration / 2;
            (endsAlike() ? m_head : m_otherHead).fromTransition += half;
            if (m_around.beforeInOld && goesOutOfShotBefore(m_old))
                (beginsAlike() ? m_tail : m_otherTail).fromTransition -= half;
            else
                lengthenOutgoing(m_old, half);
        }
        if (m_newTransition && m_around.afterInNew && (m_new.size() > 1 || m_around.beforeInNew)) {
            const std::int32_t half = newDuration / 2;
            m_head.fromTransition -= half;
            if (m_around.beforeInNew && goesOutOfShotBefore(m_new))
                m_tail.fromTransition += half;
            else
                lengthenOutgoing(m_new, half);
        }
        const bool isOneCut = !m_oldTransition || (beginsAlike() && endsAlike());
        // The cut of the one cut lies within the transition of the other.
        const bool isThere = std::abs(m_tail.change()) <= (std::max(oldDuration, newDuration) + 1) / 2;
        if (isOneCut && isThere && !isSameTransition(transition) && m_tail.change() == -m_head.change()) {
            m_tail = {};
            m_head = {};
            return;
        }
        nameTrims();
    }

    static std::int32_t durationOf(const EventBase* shot) { return shot != nullptr ? shot->transitionDuration() : 0; }

    /// Of a shot that comes or goes and is seen in the first half of the transition after it.
    static void lengthenOutgoing(std::vector<ShotPiece>& pieces, std::int32_t half)
    {
        if (pieces.size() < 2)
            return;
        const ShotPiece& incoming = pieces.back();
        ShotPiece& outgoing = pieces[pieces.size() - 2];
        if (incoming.isTold && incoming.hasTransition && half <= incoming.frames.length && !outgoing.isTold &&
            outgoing.event != ShownRun::NoEvent && outgoing.frames.end() == incoming.frames.start)
            outgoing.frames.length += half;
    }

    static bool isSameTransition(const PictureChange& change)
    {
        return change.kind == ChangeKind::TransitionChanged && change.oldShot != nullptr && change.newShot != nullptr &&
               change.oldShot->transitionType() == change.newShot->transitionType() &&
               change.oldShot->transitionDuration() == change.newShot->transitionDuration();
    }

    /// Those that have nothing but what a transition lets them win.
    void nameTrims()
    {
        const auto isNameless = [](const Trim& trim) { return trim.oldShot == nullptr && trim.newShot == nullptr; };
        if (isNameless(m_tail) && m_around.beforeInNew)
            m_tail.newShot = shotOf(m_newCut, eventAt(m_newCut, m_around.beforeInNew->newEnd() - 1));
        if (isNameless(m_head) && m_around.afterInNew)
            m_head.newShot = shotOf(m_newCut, eventAt(m_newCut, m_around.afterInNew->newStart));
        if (isNameless(m_otherTail) && m_around.beforeInOld)
            m_otherTail.oldShot = shotOf(m_oldCut, eventAt(m_oldCut, m_around.beforeInOld->oldEnd() - 1));
    }

    const EventBase* oldShotAfter() const
    {
        return m_around.afterInOld   ? shotOf(m_oldCut, eventAt(m_oldCut, m_around.afterInOld->oldStart))
               : m_around.afterInNew ? shotOf(m_oldCut, eventAt(m_oldCut, m_around.afterInNew->oldStart))
                                     : nullptr;
    }

    /// Of a transition that is removed it is the shot that had it, wherever it stands now.
    const EventBase* newShotAfter() const
    {
        const std::optional<KeptStretch>& after =
            m_newTransition || !m_around.afterInOld ? m_around.afterInNew : m_around.afterInOld;
        return after ? shotOf(m_newCut, eventAt(m_newCut, after->newStart)) : nullptr;
    }

    void tellTrim(ChangeKind kind, const Trim& trim)
    {
        if (trim.change() == 0)
            return;
        PictureChange change;
        change.kind = kind;
        change.frames = trim.change();
        change.oldShot = trim.oldShot;
        change.newShot = trim.newShot;
        change.inOld = trim.inOld;
        change.inNew = trim.inNew;
        m_changes.push_back(change);
    }

    void tellBoth(ChangeKind kind, ShotPiece& oldPiece, ShotPiece& newPiece)
    {
        PictureChange change;
        change.kind = kind;
        change.frames = newPiece.frames.length;
        change.oldShot = shotOf(m_oldCut, oldPiece.event);
        change.newShot = shotOf(m_newCut, newPiece.event);
        change.inOld = oldPiece.frames;
        change.inNew = newPiece.frames;
        change.hasOldTransition = oldPiece.hasTransition;
        change.hasNewTransition = newPiece.hasTransition;
        oldPiece.isTold = true;
        newPiece.isTold = true;
        m_changes.push_back(change);
    }

    bool isRetime(const ShotPiece& oldPiece, const ShotPiece& newPiece) const
    {
        const EventBase* const oldShot = shotOf(m_oldCut, oldPiece.event);
        const EventBase* const newShot = shotOf(m_newCut, newPiece.event);
        return oldShot != nullptr && newShot != nullptr && oldShot->isValid() && newShot->isValid() &&
               oldPiece.name == newPiece.name &&
               !canBeSameSpeed(oldShot->signedSpeed(), oldPiece.eventLength, newShot->signedSpeed(),
                               newPiece.eventLength) &&
               (oldShot->srcIn() < newShot->srcOut() || oldShot->srcIn() == newShot->srcIn()) &&
               (newShot->srcIn() < oldShot->srcOut() || oldShot->srcIn() == newShot->srcIn());
    }

    /// One old piece and one new piece, in order, that belong together.
    template <typename Belong>
    void tellPairs(ChangeKind kind, const Belong& belong)
    {
        auto from = m_old.begin();
        for (ShotPiece& newPiece : m_new) {
            if (newPiece.isTold || newPiece.event == ShownRun::NoEvent)
                continue;
            const auto found = std::find_if(from, m_old.end(), [&](const ShotPiece& oldPiece) {
                return !oldPiece.isTold && oldPiece.event != ShownRun::NoEvent && belong(oldPiece, newPiece);
            });
            if (found == m_old.end())
                continue;
            tellBoth(kind, *found, newPiece);
            from = found + 1;
        }
    }

    void tellRetimes()
    {
        tellPairs(ChangeKind::Retimed, [this](const ShotPiece& oldPiece, const ShotPiece& newPiece) {
            return isRetime(oldPiece, newPiece);
        });
    }

    void tellReplacements()
    {
        tellPairs(ChangeKind::Replaced, [](const ShotPiece& oldPiece, const ShotPiece& newPiece) {
            return oldPiece.frames.length == newPiece.frames.length;
        });
    }

    void tellRest()
    {
        for (const ShotPiece& piece : m_old) {
            if (piece.isTold)
                continue;
            PictureChange change;
            change.kind = ChangeKind::Lifted;
            change.frames = piece.frames.length;
            change.oldShot = shotOf(m_oldCut, piece.event);
            change.inOld = piece.frames;
            change.isPart = !isWhole(m_oldCut, piece);
            change.hasOldTransition = piece.hasTransition;
            m_changes.push_back(change);
        }
        auto doubled = m_doubled.begin();
        for (const ShotPiece& piece : m_new) {
            for (; doubled != m_doubled.end() && doubled->newStart < piece.frames.start; ++doubled)
                tellDoubled(*doubled);
            if (piece.isTold)
                continue;
            PictureChange change;
            change.kind = ChangeKind::Inserted;
            change.frames = piece.frames.length;
            change.newShot = shotOf(m_newCut, piece.event);
            change.inNew = piece.frames;
            change.isPart = !isWhole(m_newCut, piece);
            change.hasNewTransition = piece.hasTransition;
            m_changes.push_back(change);
        }
        for (; doubled != m_doubled.end(); ++doubled)
            tellDoubled(*doubled);
    }

    /// A shot of another version than in the old cut is a change of its own.
    void tellDoubled(const KeptStretch& stretch)
    {
        std::int32_t frame = stretch.newStart;
        const auto tellUpTo = [&](std::int32_t end) {
            if (frame < end)
                tellDoubled({frame + stretch.oldStart - stretch.newStart, end - frame}, {frame, end - frame});
            frame = end;
        };
        for (const PictureChange& version : m_tellers.ofVersions(stretch)) {
            tellUpTo(version.inNew->start);
            tellUpTo(version.inNew->end());
        }
        tellUpTo(stretch.newEnd());
    }

    void tellDoubled(const FrameSpan& inOld, const FrameSpan& inNew)
    {
        PictureChange change;
        change.kind = ChangeKind::Doubled;
        change.frames = inNew.length;
        change.oldShot = shotOf(m_oldCut, eventAt(m_oldCut, inOld.start));
        change.newShot = shotOf(m_newCut, eventAt(m_newCut, inNew.start));
        change.inOld = inOld;
        change.inNew = inNew;
        change.shots = shotsIn(m_newCut, inNew);
        m_changes.push_back(change);
    }

    /// The same shots as before in other frames: the one at the cut has slipped.
    void tellRecut()
    {
        for (const Trim* const trim : {&m_tail, &m_head}) {
            if (trim->removed == 0 && trim->inserted == 0)
                continue;
            PictureChange change;
            change.kind = ChangeKind::Replaced;
            change.frames = trim->inserted;
            change.oldShot = trim->oldShot;
            change.newShot = trim->newShot;
            change.inOld = trim->inOld;
            change.inNew = trim->inNew;
            m_changes.push_back(change);
        }
    }

    const StepChanges& m_tellers;
    const Programme& m_oldCut;
    const Programme& m_newCut;
    const StepSurroundings& m_around;
    std::vector<ShotPiece> m_old;
    std::vector<ShotPiece> m_new;
    std::vector<KeptStretch> m_doubled;
    Trim m_tail;      ///< of the shot before the step, in both cuts
    Trim m_head;      ///< of the shot after it
    Trim m_otherTail; ///< of the shot that stood before it in the old cut alone
    Trim m_otherHead;
    bool m_oldTransition = false;
    bool m_newTransition = false;
    std::vector<PictureChange> m_changes;
};

} // namespace

std::vector<PictureChange> StepChanges::ofReplacing(const NoteStep& step, const StepSurroundings& around,
                                                    const std::vector<KeptStretch>& doubled) const
{
    return Description(*this, m_oldCut, m_newCut, step, around, doubled).make();
}

PictureChange StepChanges::ofMoving(FrameSpan inOld, FrameSpan inNew) const
{
    return ofKept(ChangeKind::Moved, inOld, inNew);
}

std::vector<PictureChange> StepChanges::ofReplacedByItself(const KeptStretch& kept) const
{
    std::vector<PictureChange> changes;
    const std::int32_t shift = kept.oldStart - kept.newStart;
    std::int32_t frame = kept.newStart;
    const auto addUnchangedUpTo = [&](std::int32_t end) {
        if (frame < end)
            changes.push_back(ofKept(ChangeKind::Unchanged, {frame + shift, end - frame}, {frame, end - frame}));
    };
    for (const PictureChange& version : ofVersions(kept)) {
        addUnchangedUpTo(version.inNew->start);
        frame = version.inNew->end();
        changes.push_back(version);
    }
    addUnchangedUpTo(kept.newEnd());
    return changes;
}

PictureChange StepChanges::ofKept(ChangeKind kind, FrameSpan inOld, FrameSpan inNew) const
{
    PictureChange change;
    change.kind = kind;
    change.frames = inOld.length;
    change.inOld = inOld;
    change.inNew = inNew;
    change.oldShot = firstShotOf(m_oldCut, inOld);
    change.newShot = firstShotOf(m_newCut, inNew);
    change.shots = shotsIn(m_oldCut, inOld);
    return change;
}

std::vector<PictureChange> StepChanges::ofVersions(const KeptStretch& kept) const
{
    std::vector<PictureChange> changes;
    const auto& oldRuns = m_oldCut.runs();
    const auto& newRuns = m_newCut.runs();
    std::size_t oldRun = m_oldCut.runAt(kept.oldStart);
    std::size_t newRun = m_newCut.runAt(kept.newStart);
    const std::int32_t shift = kept.oldStart - kept.newStart;
    for (std::int32_t frame = kept.newStart; frame < kept.newEnd();) {
        const std::int32_t end = std::min({kept.newEnd(), newRuns[newRun].end(), oldRuns[oldRun].end() - shift});
        if (oldRuns[oldRun].version != newRuns[newRun].version && !newRuns[newRun].isGap()) {
            const EventBase* const newShot = m_newCut.eventOf(newRuns[newRun]);
            if (!changes.empty() && changes.back().newShot == newShot && changes.back().inNew->end() == frame) {
                changes.back().inNew->length += end - frame;
                changes.back().inOld->length += end - frame;
                changes.back().frames += end - frame;
            } else {
                PictureChange change;
                change.kind = ChangeKind::VersionChanged;
                change.frames = end - frame;
                change.oldShot = m_oldCut.eventOf(oldRuns[oldRun]);
                change.newShot = newShot;
                change.inOld = {frame + shift, end - frame};
                change.inNew = {frame, end - frame};
                changes.push_back(change);
            }
        }
        oldRun += oldRuns[oldRun].end() - shift == end ? 1 : 0;
        newRun += newRuns[newRun].end() == end ? 1 : 0;
        frame = end;
    }
    return changes;
}

} // namespace cadrel::core
