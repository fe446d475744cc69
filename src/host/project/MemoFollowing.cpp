// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoFollowing.h"

#include "host/project/MemoMark.h"
#include "host/project/MemoNote.h"
#include "host/project/MemoPlaces.h"
#include "host/project/PlacedMemos.h"
#include "host/project/ShownMemos.h"
#include "host/track/CoveredRanges.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "host/track/Track.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <optional>
#include <set>
#include <tuple>
#include <utility>
#include <vector>

using cadrel::core::SecondsRange;
using Velmark::IEditTransaction;
using Velmark::IHostContext;

namespace cadrel::host {

namespace {

std::set<std::int64_t> idsOf(const std::vector<PlacedMemo>& memos)
{
    std::set<std::int64_t> ids;
    for (const PlacedMemo& memo : memos)
        ids.insert(memo.id);
    return ids;
}

/// Since it was marked. What isn't marked may have been edited in each way.
EditedSides editedSinceMark(const HostEvent& copy)
{
    const auto mark = MemoMark::keptBy(*copy.node());
    const MemoMark now = MemoMark::of(*copy.node());
    return {!mark || mark->name != now.name, !mark || mark->place != now.place};
}

/// The new ids that are given to memos of a track one after the other.
class NewIds {
public:
    /// They are above all that are on the track and above `taken`.
    NewIds(const Track& memos, std::int64_t taken) : m_memos(memos), m_taken(taken) {}

    std::int64_t next()
    {
        m_last = m_last ? idAfter(*m_last) : std::max(m_memos.nextUserId(), idAfter(m_taken));
        return *m_last;
    }

private:
    static std::int64_t idAfter(std::int64_t id)
    {
        if (id == std::numeric_limits<std::int64_t>::max())
            throw util::Result::OutOfRange;
        return id + 1;
    }

    const Track& m_memos;
    std::int64_t m_taken;
    std::optional<std::int64_t> m_last;
};

/// The copies in a stretch as they were, of which those are found that aren't there any more.
class CopiesThatWere {
public:
    explicit CopiesThatWere(const MemoNote::Copies& copies) : m_copies(copies) {}

    /// Whether the copy is one of them as it was.
    bool isStillThere(const MemoState& copy)
    {
        const auto found = m_copies.find(copy);
        if (found == m_copies.end())
            return false;
        m_present.insert(&*found);
        return true;
    }
    /// To be called once all that are still there were asked for. From then on the others are given.
    void settle()
    {
        if (m_present.size() == m_copies.size())
            return;
        for (const MemoState& copy : m_copies) {
            if (!m_present.contains(&copy))
                m_gone.insert(m_gone.end(), copy);
        }
    }
    /// What an edited copy was like, once; one of its name before others. Nothing where that isn't known.
    std::optional<MemoState> take(const MemoState& edited)
    {
        auto found = m_gone.lower_bound(MemoState::firstOf(edited.id, edited.name));
        if (found == m_gone.end() || found->id != edited.id || found->name != edited.name)
            found = m_gone.lower_bound(MemoState::firstOf(edited.id));
        if (found == m_gone.end() || found->id != edited.id)
            return std::nullopt;
        return std::move(m_gone.extract(found).value());
    }
    const MemoNote::Copies& rest() const { return m_gone; }

private:
    const MemoNote::Copies& m_copies;
    std::set<const MemoState*> m_present;
    MemoNote::Copies m_gone;
};

/// What the memos do when the user has edited their copies.
class Following {
public:
    Following(IHostContext* context, const MemoNote& note, const Track& memos, const ShownMemos& preview,
              IEditTransaction& transaction)
        : m_hostContext(context), m_note(note), m_memos(memos), m_preview(preview), m_adrift(idsOf(preview.adrift)),
          m_transaction(transaction), m_newIds(memos, note.knownIds.empty() ? 0 : *note.knownIds.rbegin())
    {
    }

    /// The memos have stood as placed.
    void follow(PlacedMemos placed, double previewStart)
    {
        readMarks(placed, previewStart);
        for (const PlacedMemo& memo : placed.all()) {
            if (isBefore(memo.span.start, previewStart))
                ++m_counts[memo.id];
        }
        std::vector<Edits> edits;
        for (const ShownStretch& shown : m_preview.shown)
            edits.push_back(editsOf(shown, m_note.copiesIn(shown)));
        findTaken(edits, placed, previewStart);
        for (std::size_t index = 0; index < edits.size(); ++index) {
            const ShownStretch& shown = m_preview.shown[index];
            if (hasChanged(shown.stretch.source)) {
                placed = PlacedMemos(m_memos);
                m_changed = CoveredRanges();
            }
            followStretch(placed, shown, edits[index]);
        }
    }

private:
    /// An id, and a MemoMark's place and name.
    using MarkOfId = std::tuple<std::int64_t, std::uint32_t, std::uint32_t>;
    /// What the user has done to the copies of a stretch.
    struct Edits {
        const MemoNote::Copies* remembered; ///< null where nothing is known; then the rest is empty
        CopiesThatWere gone;
        std::vector<PlacedMemo> untouched;
        std::vector<PlacedMemo> edited;
    };
    /// A copy that has left its stretch, as it was, and its memo: of several of its id the nearest to where the copy was.
    struct Taken {
        MemoState before;
        PlacedMemo memo;
        double distance; ///< in seconds
    };

    static Edits editsOf(const ShownStretch& shown, const MemoNote::Copies* remembered)
    {
        static const MemoNote::Copies NoCopies;
        Edits edits{remembered, CopiesThatWere(remembered ? *remembered : NoCopies), {}, {}};
        if (!remembered)
            return edits;
        for (const PlacedMemo& copy : shown.copies)
            (edits.gone.isStillThere(MemoState::of(copy.event)) ? edits.untouched : edits.edited).push_back(copy);
        edits.gone.settle();
        return edits;
    }

    /// Finds the memos that go with their copies to the source of another stretch. Of each id one copy has gone from a stretch
    /// and one has come to a stretch.
    void findTaken(const std::vector<Edits>& edits, const PlacedMemos& placed, double previewStart)
    {
        std::map<std::int64_t, int> goneCounts;
        std::map<std::int64_t, int> editedCounts;
        for (const Edits& each : edits) {
            for (const MemoState& copy : each.gone.rest())
                ++goneCounts[copy.id];
            for (const PlacedMemo& copy : each.edited)
                editedCounts[copy.id] += m_note.notFollowed.contains(MemoState::of(copy.event)) ? 0 : 1;
        }
        for (std::size_t index = 0; index < edits.size(); ++index) {
            std::map<std::int64_t, MemoState> left;
            for (const MemoState& copy : edits[index].gone.rest()) {
                if (goneCounts[copy.id] == 1 && editedCounts[copy.id] == 1)
                    left.emplace(copy.id, copy);
            }
            if (!left.empty())
                findTaken(left, placed, m_preview.shown[index], edits[index].remembered, previewStart);
        }
    }
    /// Of the copies that have left a stretch.
    void findTaken(const std::map<std::int64_t, MemoState>& left, const PlacedMemos& placed, const ShownStretch& shown,
                   const MemoNote::Copies* remembered, double previewStart)
    {
        for (const PlacedMemo& memo : sourcesOf(placed, shown, remembered)) {
            const auto found = left.find(memo.id);
            if (found == left.end() || !isBefore(memo.span.start, previewStart))
                continue;
            const MemoState& before = found->second;
            const double distance = std::abs(memo.span.start - shown.stretch.toSource(before.start));
            const auto [taken, isFirst] = m_taken.try_emplace(memo.id, Taken{before, memo, distance});
            if (!isFirst && distance < taken->second.distance)
                taken->second = {before, memo, distance};
        }
    }

    void followStretch(const PlacedMemos& placed, const ShownStretch& shown, Edits& edits)
    {
        MemosById sources(sourcesOf(placed, shown, edits.remembered), shown.stretch.source);
        if (edits.remembered)
            followEdits(shown.stretch, sources, edits);
        else
            compare(shown, sources);
    }

    /// Several memos may have the same id, as attributes travel with what is pasted. Then each follows the copy that stood
    /// where the memo is shown.
    void followEdits(const PreviewStretch& stretch, MemosById& sources, Edits& edits)
    {
        // Another copy of the same memo may have been edited, or the memo itself.
        for (const PlacedMemo& copy : edits.untouched)
            sources.take(copy.id, stretch.toSource(copy.span.start));
        CopiesThatWere& gone = edits.gone;
        std::erase_if(edits.edited, [&](const PlacedMemo& copy) {
            // One that was there already isn't another that has gone since.
            const MemoState now = MemoState::of(copy.event);
            const bool wasThere = m_note.notFollowed.contains(now);
            const bool isOfMemo = hasOneMemo(copy) && !isPasted(copy, wasThere);
            if (wasThere)
                return isOfMemo && !m_note.orphans.contains(copy.id) && carryOver(copy, sources, stretch, std::nullopt);
            const auto before = gone.take(now);
            return (before || isOfMemo) ? carryOver(copy, sources, stretch, before) : takeAlong(copy, stretch);
        });
        // What the user has written in the real programme meanwhile has no copy that he could have removed, and the memos of
        // those adrift stay.
        for (const MemoState& removed : gone.rest()) {
            if (m_adrift.contains(removed.id) || m_taken.contains(removed.id))
                continue;
            if (const auto memo = sources.take(removed.id, stretch.toSource(removed.start)))
                remove(*memo);
        }
        for (const PlacedMemo& copy : edits.edited) {
            if (!isLeftOfRemoved(copy))
                writeMemoOf(copy, stretch);
        }
    }

    /// As long as nothing is known of what the user has done, the numbers tell whether he has removed or written something.
    void compare(const ShownStretch& shown, MemosById& sources)
    {
        const PreviewStretch& stretch = shown.stretch;
        std::vector<PlacedMemo> copies = shown.copies;
        const std::size_t copyCount = copies.size();
        const std::size_t sourceCount = sources.size();
        std::erase_if(copies, [&](const PlacedMemo& copy) { return carryOver(copy, sources, stretch, std::nullopt); });
        if (sourceCount > copyCount) {
            for (const PlacedMemo& memo : sources.rest()) {
                if (!m_adrift.contains(memo.id))
                    remove(memo);
            }
        }
        if (copyCount > sourceCount) {
            for (const PlacedMemo& copy : copies)
                writeMemoOf(copy, stretch);
        }
    }

    /// Whether a copy that has come to a stretch was edited while nobody followed, or comes back to it. One that was pasted or
    /// comes from another stretch is a memo of its own.
    bool hasOneMemo(const PlacedMemo& copy) const
    {
        const auto count = m_counts.find(copy.id);
        return count != m_counts.end() && count->second == 1 && !m_note.knownIds.contains(copy.id) &&
               MemoMark::keptBy(*copy.event.node()); // what was pasted from the real programme has none
    }

    /// Whether the user has pasted it from a copy that is there, adrift or with an edit that its memo hasn't followed, or from a
    /// memo that was pasted itself. Of two such copies the one that was there before is no other's.
    bool isPasted(const PlacedMemo& copy, bool wasThere) const
    {
        const auto mark = markOf(copy);
        return mark && (m_adriftMarks.contains(*mark) || (!wasThere && m_otherMarks.contains(*mark)));
    }

    /// What is pasted keeps the mark. Two copies of one memo have marks of two places.
    static std::optional<MarkOfId> markOf(const PlacedMemo& copy)
    {
        const auto mark = MemoMark::keptBy(*copy.event.node());
        return mark ? std::optional(MarkOfId{copy.id, mark->place, mark->name}) : std::nullopt;
    }
    void readMarks(const PlacedMemos& placed, double previewStart)
    {
        for (const PlacedMemo& memo : placed.all()) {
            if (isBefore(memo.span.start, previewStart))
                insertMark(m_otherMarks, memo);
        }
        for (const PlacedMemo& copy : m_preview.adrift)
            insertMark(m_adriftMarks, copy);
        for (const ShownStretch& shown : m_preview.shown) {
            for (const PlacedMemo& copy : shown.copies) {
                if (m_note.notFollowed.contains(MemoState::of(copy.event)))
                    insertMark(m_otherMarks, copy);
            }
        }
    }
    static void insertMark(std::set<MarkOfId>& marks, const PlacedMemo& copy)
    {
        if (const auto mark = markOf(copy))
            marks.insert(*mark);
    }

    /// Whether the user has removed the memo of a copy that he had edited before, while nobody followed. It comes back only
    /// if he edits the copy again.
    bool isLeftOfRemoved(const PlacedMemo& copy) const
    {
        const bool isOrphan = !m_counts.contains(copy.id) || m_note.orphans.contains(copy.id);
        return isOrphan && MemoMark::keptBy(*copy.event.node()) &&
               m_note.notFollowed.contains(MemoState::of(copy.event));
    }

    /// The memos that a stretch shows. What was there is null where that isn't known.
    static std::vector<PlacedMemo> sourcesOf(const PlacedMemos& memos, const ShownStretch& shown,
                                             const MemoNote::Copies* remembered)
    {
        const PreviewStretch& stretch = shown.stretch;
        std::vector<PlacedMemo> found;
        std::vector<PlacedMemo> reaching;
        const auto wasHere = [remembered](const PlacedMemo& memo) {
            if (!remembered)
                return false;
            const auto copy = remembered->lower_bound(MemoState::firstOf(memo.id));
            return copy != remembered->end() && copy->id == memo.id;
        };
        // The memo of a copy that stands where nothing is left of the source stands at its end.
        const double end = stretch.source.end + (stretch.isSlower() ? 2.0 * core::SameInstant : 0.0);
        memos.visitTouching({stretch.source.start, end}, [&](const PlacedMemo& memo) {
            if (liesIn(memo.span, stretch.source))
                found.push_back(memo);
            else if (!isBefore(memo.span.start, stretch.source.end) && wasHere(memo))
                found.push_back(memo);
            else if (reachesInto(memo.span, stretch.source) || !isBefore(memo.span.start, stretch.source.end))
                reaching.push_back(memo);
        });
        if (reaching.empty())
            return found;
        // A memo that only reaches into the stretch has its copy there, too.
        const std::set<std::int64_t> copied = idsOf(shown.copies);
        std::set<std::int64_t> taken = idsOf(found);
        for (PlacedMemo& memo : reaching) {
            if (copied.contains(memo.id) && (remembered || taken.insert(memo.id).second))
                found.push_back(std::move(memo));
        }
        return found;
    }

    /// False when the copy has no memo. What it was like is nothing where that isn't known.
    bool carryOver(const PlacedMemo& copy, MemosById& sources, const PreviewStretch& stretch,
                   const std::optional<MemoState>& before)
    {
        std::optional<PlacedMemo> memo =
            sources.take(copy.id, stretch.toSource(before ? before->start : copy.span.start));
        if (memo) {
            carryOver(copy.event, *memo, stretch, before);
            MemoMark::renewOn(*copy.event.node());
        }
        return memo.has_value();
    }

    /// Whether the copy has come from another stretch, with its memo.
    bool takeAlong(const PlacedMemo& copy, const PreviewStretch& stretch)
    {
        const auto taken = m_taken.find(copy.id);
        if (taken == m_taken.end() || !MemoMark::keptBy(*copy.event.node()))
            return false;
        auto& [before, memo, distance] = taken->second;
        const MemoState edited = MemoState::of(copy.event);
        if (edited.name != before.name)
            memo.event.setName(m_transaction, edited.name);
        place(memo, stretch.toSource(copy.span));
        MemoMark::renewOn(*copy.event.node());
        return true;
    }

    void carryOver(const HostEvent& copy, PlacedMemo& placed, const PreviewStretch& stretch,
                   const std::optional<MemoState>& before)
    {
        HostEvent& memo = placed.event;
        const MemoState edited = MemoState::of(copy);
        const EditedSides sides =
            before ? differencesOf(edited, *before) : editedWhereUnknown(copy, MemoState::of(memo));
        if (sides.name && memo.getName() != edited.name)
            memo.setName(m_transaction, edited.name);
        if (!sides.place)
            return;

        // What hangs over an edge of the stretch isn't in the preview, and stays.
        const auto followed = [&stretch](double own, double mapped) {
            return std::abs(stretch.clamped(own) - mapped) < core::SameInstant ? own : mapped;
        };
        const auto [ownStart, ownEnd] = placed.span;
        const SecondsRange mapped = stretch.toSource(SecondsRange{edited.start, edited.end});
        const double start = followed(ownStart, mapped.start);
        const double end = followed(ownEnd, mapped.end);
        if (start != ownStart || (memo.isRange() && end != ownEnd))
            place(placed, {start, end});
    }

    void place(const PlacedMemo& placed, const SecondsRange& span)
    {
        HostEvent memo = placed.event;
        noteChange(placed.span);
        memo.setStart(m_transaction, span.start);
        if (memo.isRange())
            memo.setLength(m_transaction, span.end - span.start);
        noteChange({span.start, std::max(span.start, memo.getEnd())});
    }

    /// What was done to the memo itself is the later edit.
    EditedSides editedWhereUnknown(const HostEvent& copy, const MemoState& memo) const
    {
        EditedSides edited = editedSinceMark(copy);
        if (const auto last = m_note.behind.find(memo.id); last != m_note.behind.end()) {
            const MemoBehind now = MemoBehind::laterThan(last->second, {memo, memo, {MemoState::of(copy)}});
            const EditedSides later = differencesOf(memo, now.before);
            edited = {edited.name && !later.name, edited.place && !later.place};
        }
        return edited;
    }

    void writeMemoOf(const PlacedMemo& written, const PreviewStretch& stretch)
    {
        HostEvent copy = written.event;
        copy.setUserId(m_newIds.next());
        const SecondsRange span = stretch.toSource(written.span);
        noteChange(span);
        Marker{span.start, span.end, copy.getName(), {}, copy.getUserId()}.insertInto(m_hostContext, m_transaction,
                                                                                      m_memos);
        MemoMark::renewOn(*copy.node());
    }

    void remove(const PlacedMemo& memo)
    {
        noteChange(memo.span);
        HostEvent(memo.event).remove(m_transaction);
    }

    /// Notes that a memo isn't there any more, or is from now on.
    void noteChange(const SecondsRange& span)
    {
        m_changed.add({span.start - 2.0 * core::SameInstant, span.end + 2.0 * core::SameInstant});
    }
    bool hasChanged(const SecondsRange& stretch) const
    {
        const SecondsRange around{stretch.start - core::SameInstant, stretch.end + core::SameInstant};
        const std::vector<SecondsRange> unchanged = m_changed.uncovered(around);
        return unchanged.size() != 1 || unchanged.front() != around;
    }

    IHostContext* m_hostContext;
    const MemoNote& m_note;
    const Track& m_memos;
    const ShownMemos& m_preview;
    std::set<std::int64_t> m_adrift;
    std::set<MarkOfId> m_adriftMarks;
    std::set<MarkOfId> m_otherMarks;              ///< of memos, and of copies with an edit that they haven't followed
    std::map<std::int64_t, Taken> m_taken;        ///< by their ids
    std::map<std::int64_t, std::size_t> m_counts; ///< of the memos in the real programme, by their ids
    IEditTransaction& m_transaction;
    NewIds m_newIds;
    CoveredRanges m_changed; ///< since the memos were placed
};

} // namespace

void followCopies(IHostContext* context, const MemoNote& note, const Track& memos, const PreviewedEvents& previewed,
                  IEditTransaction& transaction)
{
    PlacedMemos placed(memos);
    if (placed.all().empty())
        return;
    const ShownMemos preview(placed, previewed);
    Following(context, note, memos, preview, transaction).follow(std::move(placed), previewed.start());
}

} // namespace cadrel::host
