// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ChangeNotes.h"

#include "core/edl/EventBase.h"
#include "core/edl/HealedEvent.h"
#include "core/notes/KeptStretches.h"
#include "core/notes/StepChanges.h"
#include "core/notes/StepMaker.h"

#include <algorithm>
#include <cmath>
#include <map>
#include <set>
#include <utility>

namespace cadrel::core {

namespace {

std::int32_t lengthOf(const Programme& programme, const std::optional<std::size_t>& reel)
{
    return reel ? programme.reels()[*reel].length : 0;
}

} // namespace

ChangeNotes::ChangeNotes(const EventList& oldEvents, const EventList& newEvents, const PictureRules& rules,
                         std::int32_t simplify)
    : m_framerate(rules.framerate), m_oldCut(oldEvents, rules, m_numbers), m_newCut(newEvents, rules, m_numbers)
{
    const StepChanges changes(m_oldCut, m_newCut);
    StepList list = makeSteps(m_oldCut, m_newCut, findKeptStretches(m_oldCut, m_newCut), m_framerate);
    m_isOverfull = list.isOverfull;
    for (std::size_t reel = 0; reel < list.reels.size(); ++reel) {
        joinTrims(list.rows[reel], simplify, changes);
        ReelNotes notes;
        notes.pair = list.reels[reel];
        notes.before = lengthOf(m_oldCut, notes.pair.oldReel);
        notes.after = lengthOf(m_newCut, notes.pair.newReel);
        for (NoteRow& row : list.rows[reel])
            notes.entries.push_back({std::move(row)});
        m_reels.push_back(std::move(notes));
    }
    number();
    count();
}

/// Numbers the steps and adds up what each reel wins and loses.
void ChangeNotes::number()
{
    std::vector<std::int32_t> offsets(m_reels.size(), 0);
    std::map<std::int32_t, std::size_t> betweenReels; // the numbers of moves, by their old places
    for (std::size_t reel = 0; reel < m_reels.size(); ++reel) {
        for (NoteEntry& entry : m_reels[reel].entries) {
            if (const NoteStep* const step = entry.step()) {
                entry.number = ++m_totals.steps;
                entry.lengthChange = step->lengthChange();
                if (step->place.reel != reel)
                    tellWhoMoved(m_reels[step->place.reel], entry);
                if (step->action == StepAction::Move && step->from.reel != step->place.reel) {
                    const std::size_t other = step->from.reel == reel ? step->place.reel : step->from.reel;
                    entry.lengthChange = step->place.reel == reel ? step->moved : -step->moved;
                    offsets[other] -= entry.lengthChange;
                    betweenReels[step->changes.front().inOld->start] = entry.number;
                }
                offsets[reel] += entry.lengthChange;
                m_totals.moved += step->moved;
            }
            if (auto* const end = std::get_if<MoveEnd>(&entry.row))
                end->step = betweenReels.at(end->move.inOld->start);
            entry.runningOffset = offsets[reel];
        }
    }
}

/// Of a reel into or with which a step of an earlier one has moved picture.
void ChangeNotes::tellWhoMoved(ReelNotes& reel, const NoteEntry& entry)
{
    const bool isOutOfTheWay = entry.step()->changes.front().isOutOfTheWay;
    if (entry.step()->action == StepAction::MoveReel) {
        reel.movedBy = isOutOfTheWay ? 0 : entry.number;
        reel.asideSince = isOutOfTheWay ? entry.number : 0;
    } else if (isOutOfTheWay && reel.asideSince == 0) {
        reel.asideSince = entry.number;
    }
}

void ChangeNotes::count()
{
    m_totals.before = m_oldCut.length();
    m_totals.after = m_newCut.length();
    for (const ReelNotes& reel : m_reels) {
        for (const NoteEntry& entry : reel.entries) {
            m_totals.kept += entry.kept() != nullptr ? entry.kept()->length : 0;
            if (entry.step() == nullptr)
                continue;
            for (const PictureChange& change : entry.step()->changes)
                m_totals.doubled += change.kind == ChangeKind::Doubled ? change.frames : 0;
        }
    }
    m_totals.lifted = m_totals.before - m_totals.kept;
    m_totals.inserted = m_totals.after - m_totals.kept - m_totals.doubled;
}

bool ReelNotes::isUnchanged() const
{
    return before == after && movedBy == 0 &&
           std::all_of(entries.begin(), entries.end(), [](const NoteEntry& entry) { return entry.kept() != nullptr; });
}

std::vector<const NoteEntry*> ChangeNotes::largestSteps() const
{
    std::vector<const NoteEntry*> steps;
    for (const ReelNotes& reel : m_reels) {
        for (const NoteEntry& entry : reel.entries) {
            if (entry.step() != nullptr)
                steps.push_back(&entry);
        }
    }
    const auto end = steps.begin() + static_cast<std::ptrdiff_t>(std::min(steps.size(), LargestCount));
    std::partial_sort(steps.begin(), end, steps.end(), [](const NoteEntry* a, const NoteEntry* b) {
        return std::pair(-extentOf(*a->step()), a->number) < std::pair(-extentOf(*b->step()), b->number);
    });
    steps.erase(end, steps.end());
    return steps;
}

std::size_t ChangeNotes::joinedSteps() const
{
    std::size_t joined = 0;
    for (const ReelNotes& reel : m_reels) {
        for (const NoteEntry& entry : reel.entries)
            joined += entry.step() != nullptr && entry.step()->joined > 1 ? entry.step()->joined : 0;
    }
    return joined;
}

std::int32_t ChangeNotes::oldTimecode(std::int32_t frame) const
{
    return m_oldCut.timecodeOf(frame, m_oldCut.reelAt(frame));
}

std::int32_t ChangeNotes::newTimecode(std::int32_t frame) const
{
    return m_newCut.timecodeOf(frame, m_newCut.reelAt(frame));
}

std::optional<Timecode> ChangeNotes::sourceOf(const PictureChange& change) const
{
    const bool isNewPicture = change.kind == ChangeKind::Inserted || change.kind == ChangeKind::Replaced ||
                              change.kind == ChangeKind::Retimed;
    if (!isNewPicture || change.newShot == nullptr || !change.inNew)
        return {};
    const EventBase& shot = *change.newShot;
    if (!shot.isValid())
        return shot.srcIn();
    constexpr double Rounding = 1e-6; // a speed is no whole number of frames
    const double speed = shot.isNormalSpeed() ? 1.0 : shot.motionSpeed();
    const std::int32_t before = newTimecode(change.inNew->start) - shot.dstIn().toFrameCount(m_framerate);
    const std::int32_t first = shot.firstSource().toFrameCount(m_framerate);
    const double frame = shot.isReversed() ? first - speed * (before + change.inNew->length) : first + speed * before;
    Timecode source;
    source.setFrameCount(std::clamp(static_cast<std::int32_t>(std::floor(frame + Rounding)), 0, m_framerate.lastFrame),
                         m_framerate);
    return source;
}

HealingNotes notesOfHealing(const EventList& changeEdl)
{
    HealingNotes notes;
    for (const auto& event : changeEdl.events()) {
        const auto* const healed = dynamic_cast<const HealedEvent*>(event.get());
        if (healed == nullptr)
            continue;
        const auto& members = healed->healedEvents().events();
        ++notes.events;
        notes.members += members.size();
        for (std::size_t member = 1; member < members.size(); ++member)
            notes.bridgedGaps += members[member - 1]->dstOut() < members[member]->dstIn() ? 1U : 0U;
    }
    return notes;
}

std::int32_t extentOf(const NoteStep& step)
{
    switch (step.action) {
    case StepAction::Move:
        return step.moved;
    case StepAction::Relabel:
    case StepAction::MoveReel:
        return 0; // all of the picture stays
    case StepAction::Replace:
        break;
    }
    return std::max(step.removed, step.inserted.length);
}

std::size_t otherShots(const NoteStep& step, const PictureChange& named)
{
    std::set<const EventBase*> seen{nullptr};
    const auto isAnother = [&seen](const PictureChange& change) {
        const EventBase* const shot = change.newShot != nullptr ? change.newShot : change.oldShot;
        // What a new shot replaces is another shot.
        const bool isSameInOld = change.oldShot != nullptr && change.kind != ChangeKind::Replaced;
        const EventBase* const inOld = isSameInOld ? change.oldShot : shot;
        const bool isSeen = seen.contains(shot) || seen.contains(inOld);
        seen.insert({shot, inOld});
        return !isSeen;
    };
    isAnother(named);
    std::size_t others = 0;
    for (const PictureChange& change : step.changes) {
        if (&change != &named && change.kind != ChangeKind::Unchanged && isAnother(change))
            others += static_cast<std::size_t>(change.shots);
    }
    return others;
}

} // namespace cadrel::core
