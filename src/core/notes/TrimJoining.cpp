// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/StepChanges.h"
#include "core/notes/StepMaker.h"

#include <algorithm>
#include <utility>

namespace cadrel::core {

namespace {

bool isTrim(const NoteStep& step)
{
    return step.action == StepAction::Replace &&
           std::all_of(step.changes.begin(), step.changes.end(), [](const PictureChange& change) {
               return change.kind == ChangeKind::HeadTrimmed || change.kind == ChangeKind::TailTrimmed;
           });
}

/// Takes a kept stretch into a step that ends where it begins.
void extendOver(NoteStep& step, const KeptStretch& kept, const StepChanges& changes)
{
    step.removed += kept.length;
    step.inserted.start = step.inserted.length == 0 ? kept.newStart : step.inserted.start;
    step.inserted.length = kept.newEnd() - step.inserted.start;
    step.removedFrames.push_back({kept.oldStart, kept.length});
    const std::vector<PictureChange> between = changes.ofReplacedByItself(kept);
    step.changes.insert(step.changes.end(), between.begin(), between.end());
}

void extendOver(NoteStep& step, const NoteStep& next)
{
    step.removed += next.removed;
    step.inserted.length += next.inserted.length;
    step.removedFrames.insert(step.removedFrames.end(), next.removedFrames.begin(), next.removedFrames.end());
    step.changes.insert(step.changes.end(), next.changes.begin(), next.changes.end());
    step.joined += next.joined;
}

/// The first row from `row` on that is no new version of the shots before it, or the number of rows.
std::size_t nextAfterVersions(const std::vector<NoteRow>& rows, std::size_t row)
{
    const auto isVersion = [](const NoteRow& each) {
        const auto* const step = std::get_if<NoteStep>(&each);
        return step != nullptr && step->action == StepAction::Relabel;
    };
    while (row < rows.size() && isVersion(rows[row]))
        ++row;
    return row;
}

/// The place after the last of the rows from `first` on that make one step together, which goes to `joined`; `first` when
/// there is none.
std::size_t joinFrom(const std::vector<NoteRow>& rows, std::size_t first, std::int32_t frames,
                     const StepChanges& changes, NoteStep& joined)
{
    const auto* const begin = std::get_if<NoteStep>(&rows[first]);
    if (begin == nullptr || !isTrim(*begin) || begin->lengthChange() == 0)
        return first;
    NoteStep step = *begin;
    std::int32_t between = 0;
    std::size_t end = first;
    for (std::size_t row = first + 1; row < rows.size(); ++row) {
        const auto* const kept = std::get_if<KeptStretch>(&rows[row]);
        row = nextAfterVersions(rows, row + 1);
        const auto* const next = row < rows.size() ? std::get_if<NoteStep>(&rows[row]) : nullptr;
        if (kept == nullptr || next == nullptr || !isTrim(*next))
            break;
        between += kept->length;
        if (between > frames)
            break;
        extendOver(step, *kept, changes);
        extendOver(step, *next);
        if (step.lengthChange() == 0) {
            end = row + 1;
            joined = step;
            break;
        }
        between += next->inserted.length;
    }
    return end;
}

} // namespace

void joinTrims(std::vector<NoteRow>& rows, std::int32_t frames, const StepChanges& changes)
{
    if (frames <= 0)
        return;
    std::vector<NoteRow> joinedRows;
    for (std::size_t row = 0; row < rows.size();) {
        NoteStep joined;
        const std::size_t end = joinFrom(rows, row, frames, changes, joined);
        if (end == row) {
            joinedRows.push_back(std::move(rows[row++]));
        } else {
            joinedRows.emplace_back(std::move(joined));
            row = end;
        }
    }
    rows = std::move(joinedRows);
}

} // namespace cadrel::core
