// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/ReelMoves.h"

#include "core/notes/ReelTimeline.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <iterator>
#include <utility>
#include <vector>

namespace cadrel::core {

namespace {

class ReelMover {
public:
    ReelMover(StepList& list, const Programme& oldCut, const Programme& newCut, const Framerate& framerate)
        : m_list(list), m_oldCut(oldCut), m_newCut(newCut), m_timeline(timelineAt(framerate))
    {
    }

    void addSteps()
    {
        for (std::size_t reel = 0; reel < m_list.rows.size(); ++reel) {
            std::vector<NoteRow> rows;
            for (const ReelShift& shift : m_timeline.makeRoomFor(reel))
                rows.emplace_back(stepOf(shift));
            for (NoteRow& row : m_list.rows[reel])
                tellStarts(row);
            rows.insert(rows.end(), std::make_move_iterator(m_list.rows[reel].begin()),
                        std::make_move_iterator(m_list.rows[reel].end()));
            m_list.rows[reel] = std::move(rows);
        }
        m_list.isOverfull = m_timeline.hasNoRoom();
    }

private:
    const Reel* oldReelOf(std::size_t reel) const
    {
        const auto& place = m_list.reels[reel].oldReel;
        return place ? &m_oldCut.reels()[*place] : nullptr;
    }

    const Reel* newReelOf(std::size_t reel) const
    {
        const auto& place = m_list.reels[reel].newReel;
        return place ? &m_newCut.reels()[*place] : nullptr;
    }

    std::vector<ReelCourse> coursesBeforeTheSteps() const
    {
        std::vector<ReelCourse> courses(m_list.reels.size());
        for (std::size_t reel = 0; reel < courses.size(); ++reel) {
            courses[reel].lengths.push_back({0, 0});
            if (const Reel* const was = oldReelOf(reel)) {
                courses[reel].oldStart = was->timecodeStart;
                courses[reel].lengths.front().frames = was->length;
            }
            if (const Reel* const is = newReelOf(reel))
                courses[reel].newStart = is->timecodeStart;
        }
        return courses;
    }

    ReelTimeline timelineAt(const Framerate& framerate) const
    {
        std::vector<ReelCourse> courses = coursesBeforeTheSteps();
        std::vector<std::size_t> turns;
        std::size_t moment = 0;
        const auto grow = [&](std::size_t reel, std::int32_t frames) {
            std::vector<ReelLength>& lengths = courses[reel].lengths;
            if (frames == 0)
                return;
            if (lengths.back().moment != moment)
                lengths.push_back({moment, lengths.back().frames});
            lengths.back().frames += frames;
        };
        for (const auto& rows : m_list.rows) {
            turns.push_back(moment++);
            for (const NoteRow& row : rows) {
                const auto* const step = std::get_if<NoteStep>(&row);
                if (step == nullptr)
                    continue;
                grow(step->from.reel, -step->moved);
                grow(step->place.reel, step->moved + step->lengthChange());
                ++moment;
            }
        }
        return ReelTimeline(std::move(courses), std::move(turns), framerate);
    }

    NoteStep stepOf(const ReelShift& shift) const
    {
        const Reel* const was = oldReelOf(shift.reel);
        const Reel* const is = newReelOf(shift.reel);
        PictureChange change;
        change.kind = ChangeKind::ReelMoved;
        change.frames = shift.to - shift.from;
        if (was != nullptr)
            change.inOld = {was->start, was->length};
        if (is != nullptr)
            change.inNew = {is->start, is->length};
        change.isOutOfTheWay = shift.isOutOfTheWay;
        NoteStep step;
        step.action = StepAction::MoveReel;
        step.place = {shift.reel, 0, shift.to};
        step.from = {shift.reel, 0, shift.from};
        step.changes = {change};
        return step;
    }

    void tellStarts(NoteRow& row) const
    {
        const auto tell = [this](WorkPlace& place) { place.reelStart = m_timeline.startOf(place.reel); };
        if (auto* const end = std::get_if<MoveEnd>(&row))
            tell(end->place);
        auto* const step = std::get_if<NoteStep>(&row);
        if (step == nullptr)
            return;
        tell(step->place);
        tell(step->from);
        for (WorkPlace& place : step->doubledFrom)
            tell(place);
        if (step->action == StepAction::Move)
            step->changes.front().isOutOfTheWay = m_timeline.isAside(step->place.reel);
    }

    StepList& m_list;
    const Programme& m_oldCut;
    const Programme& m_newCut;
    ReelTimeline m_timeline;
};

} // namespace

void moveReels(StepList& list, const Programme& oldCut, const Programme& newCut, const Framerate& framerate)
{
    ReelMover(list, oldCut, newCut, framerate).addSteps();
}

} // namespace cadrel::core
