// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "core/edl/EventBase.h"
#include "host/border/HostFailure.h"
#include "host/project/HostFramerate.h"
#include "host/project/MemoMark.h"
#include "host/project/MemoPlaces.h"
#include "host/project/PlacedMemos.h"
#include "host/project/PreviewRecord.h"
#include "host/track/CoveredRanges.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "host/track/Track.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <optional>
#include <tuple>
#include <utility>

using cadrel::core::SecondsRange;
using Velmark::IEditTransaction;
using Velmark::IHostContext;

namespace cadrel::host {

namespace {

bool isEmpty(const SecondsRange& range)
{
    return !isBefore(range.start, range.end);
}

std::set<std::int64_t> idsOf(const std::vector<PlacedMemo>& memos)
{
    std::set<std::int64_t> ids;
    for (const PlacedMemo& memo : memos)
        ids.insert(memo.id);
    return ids;
}

/// Which sides of a copy the user has edited.
struct Edited {
    bool name;
    bool place;
};

template <class Memo>
Edited differencesOf(const Memo& one, const Memo& other)
{
    return {one.name != other.name, one.start != other.start || one.end != other.end};
}

/// Since it was marked. What isn't marked may have been edited in each way.
Edited editedSinceMark(const HostEvent& copy)
{
    const auto mark = MemoMark::keptBy(*copy.node());
    const MemoMark now = MemoMark::of(*copy.node());
    return {!mark || mark->name != now.name, !mark || mark->place != now.place};
}

/// Whether its timecodes are frames under that rate, which needn't be that of the project.
bool isValidUnder(const core::Framerate& framerate, const core::EventBase& event)
{
    return event.srcIn().isValid(framerate) && event.srcOut().isValid(framerate) && event.dstIn().isValid(framerate) &&
           event.dstOut().isValid(framerate);
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

} // namespace

double MemoSync::Stretch::clamped(double sourceTime) const
{
    return std::clamp(sourceTime, source.start, source.end);
}

double MemoSync::Stretch::toSource(double previewTime) const
{
    return clamped(previewTime - preview.start + source.start);
}

//     copy     preview  |=== material ===|--- nothing ---|
//                                            |-- loud --|
//     memo     source   |================|
//                             |-- loud --|
SecondsRange MemoSync::Stretch::toSource(const SecondsRange& copy) const
{
    const SecondsRange memo{toSource(copy.start), toSource(copy.end)};
    return isBefore(memo.start, memo.end) ? memo : SecondsRange{clamped(memo.end - (copy.end - copy.start)), memo.end};
}

bool MemoSync::Stretch::isSlower() const
{
    return isBefore(source.end - source.start, preview.end - preview.start);
}

//     event i           preview  |=================|
//     event i + 1                         |=============|      written later
//     stretch of i      preview  |========|
//                       source   |========|--------|
std::vector<MemoSync::Shown> MemoSync::stretchesOf(const Previewed& previewed)
{
    const core::Framerate framerate = previewed.framerate;
    const double moved = previewed.moved;
    const double offset = previewed.offset + moved;
    std::vector<Shown> shown;
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

MemoSync::Memo MemoSync::memoOf(const HostEvent& event)
{
    return {event.getUserId(), event.getName(), event.getStart(), event.getEnd()};
}

/// Below all of its id and name.
MemoSync::Memo MemoSync::firstOf(std::int64_t id, std::wstring name)
{
    constexpr double First = std::numeric_limits<double>::lowest();
    return {id, std::move(name), First, First};
}

/// The copies in a stretch as they were, of which those are found that aren't there any more.
class MemoSync::CopiesThatWere {
public:
    explicit CopiesThatWere(const Remembered& remembered) : m_copies(remembered.copies) {}

    /// Whether the copy is one of them as it was.
    bool isStillThere(const Memo& copy)
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
        for (const Memo& copy : m_copies) {
            if (!m_present.contains(&copy))
                m_gone.insert(m_gone.end(), copy);
        }
    }
    /// What an edited copy was like, once; one of its name before others. Nothing where that isn't known.
    std::optional<Memo> take(const Memo& edited)
    {
        auto found = m_gone.lower_bound(firstOf(edited.id, edited.name));
        if (found == m_gone.end() || found->id != edited.id || found->name != edited.name)
            found = m_gone.lower_bound(firstOf(edited.id));
        if (found == m_gone.end() || found->id != edited.id)
            return std::nullopt;
        return std::move(m_gone.extract(found).value());
    }
    const std::set<Memo>& rest() const { return m_gone; }

private:
    const std::set<Memo>& m_copies;
    std::set<const Memo*> m_present;
    std::set<Memo> m_gone;
};

MemoSync::Preview MemoSync::previewOf(const PlacedMemos& memos, const Previewed& previewed)
{
    Preview preview{stretchesOf(previewed), {}};
    std::vector<SecondsRange> stretches;
    for (const Shown& shown : preview.shown)
        stretches.push_back(shown.stretch.preview);
    const MemoPlaces places(stretches);

    const double offset = previewed.offset + previewed.moved;
    std::vector<std::pair<Shown*, PlacedMemo>> reaching;
    for (const PlacedMemo& memo : memos.all()) {
        if (isBefore(memo.span.end, offset))
            continue;
        const auto [inside, touched] = places.find(memo.span);
        if (inside)
            preview.shown[*inside].copies.push_back(memo);
        else if (touched)
            reaching.emplace_back(&preview.shown[*touched], memo);
        else
            preview.adrift.push_back(memo);
    }
    for (const auto& [shown, memo] : reaching)
        shown->copies.push_back(memo);
    return preview;
}

/// What the memos do when the user has edited their copies.
class MemoSync::Following {
public:
    Following(const MemoSync& sync, const Track& memos, const Preview& preview, IEditTransaction& transaction)
        : m_sync(sync), m_memos(memos), m_preview(preview), m_adrift(idsOf(preview.adrift)), m_transaction(transaction),
          m_newIds(memos, sync.m_knownIds.empty() ? 0 : *sync.m_knownIds.rbegin())
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
        for (const Shown& shown : m_preview.shown)
            edits.push_back(editsOf(shown, m_sync.rememberedOf(shown)));
        findTaken(edits, placed, previewStart);
        for (std::size_t index = 0; index < edits.size(); ++index) {
            const Shown& shown = m_preview.shown[index];
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
        const Remembered* remembered; ///< null where nothing is known; then the rest is empty
        CopiesThatWere gone;
        std::vector<PlacedMemo> untouched;
        std::vector<PlacedMemo> edited;
    };
    /// A copy that has left its stretch, as it was, and its memo: of several of its id the nearest to where the copy was.
    struct Taken {
        Memo before;
        PlacedMemo memo;
        double distance; ///< in seconds
    };

    static Edits editsOf(const Shown& shown, const Remembered* remembered)
    {
        static const Remembered NoCopies;
        Edits edits{remembered, CopiesThatWere(remembered ? *remembered : NoCopies), {}, {}};
        if (!remembered)
            return edits;
        for (const PlacedMemo& copy : shown.copies)
            (edits.gone.isStillThere(memoOf(copy.event)) ? edits.untouched : edits.edited).push_back(copy);
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
            for (const Memo& copy : each.gone.rest())
                ++goneCounts[copy.id];
            for (const PlacedMemo& copy : each.edited)
                editedCounts[copy.id] += m_sync.m_notFollowed.contains(memoOf(copy.event)) ? 0 : 1;
        }
        for (std::size_t index = 0; index < edits.size(); ++index) {
            std::map<std::int64_t, Memo> left;
            for (const Memo& copy : edits[index].gone.rest()) {
                if (goneCounts[copy.id] == 1 && editedCounts[copy.id] == 1)
                    left.emplace(copy.id, copy);
            }
            if (!left.empty())
                findTaken(left, placed, m_preview.shown[index], edits[index].remembered, previewStart);
        }
    }
    /// Of the copies that have left a stretch.
    void findTaken(const std::map<std::int64_t, Memo>& left, const PlacedMemos& placed, const Shown& shown,
                   const Remembered* remembered, double previewStart)
    {
        for (const PlacedMemo& memo : sourcesOf(placed, shown, remembered)) {
            const auto found = left.find(memo.id);
            if (found == left.end() || !isBefore(memo.span.start, previewStart))
                continue;
            const Memo& before = found->second;
            const double distance = std::abs(memo.span.start - shown.stretch.toSource(before.start));
            const auto [taken, isFirst] = m_taken.try_emplace(memo.id, Taken{before, memo, distance});
            if (!isFirst && distance < taken->second.distance)
                taken->second = {before, memo, distance};
        }
    }

    void followStretch(const PlacedMemos& placed, const Shown& shown, Edits& edits)
    {
        MemosById sources(sourcesOf(placed, shown, edits.remembered), shown.stretch.source);
        if (edits.remembered)
            followEdits(shown.stretch, sources, edits);
        else
            compare(shown, sources);
    }

    /// Several memos may have the same id, as attributes travel with what is pasted. Then each follows the copy that stood
    /// where the memo is shown.
    void followEdits(const Stretch& stretch, MemosById& sources, Edits& edits)
    {
        // Another copy of the same memo may have been edited, or the memo itself.
        for (const PlacedMemo& copy : edits.untouched)
            sources.take(copy.id, stretch.toSource(copy.span.start));
        CopiesThatWere& gone = edits.gone;
        std::erase_if(edits.edited, [&](const PlacedMemo& copy) {
            // One that was there already isn't another that has gone since.
            const Memo now = memoOf(copy.event);
            const bool wasThere = m_sync.m_notFollowed.contains(now);
            const bool isOfMemo = hasOneMemo(copy) && !isPasted(copy, wasThere);
            if (wasThere)
                return isOfMemo && !m_sync.m_orphans.contains(copy.id) &&
                       carryOver(copy, sources, stretch, std::nullopt);
            const auto before = gone.take(now);
            return (before || isOfMemo) ? carryOver(copy, sources, stretch, before) : takeAlong(copy, stretch);
        });
        // What the user has written in the real programme meanwhile has no copy that he could have removed, and the memos of
        // those adrift stay.
        for (const Memo& removed : gone.rest()) {
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
    void compare(const Shown& shown, MemosById& sources)
    {
        const Stretch& stretch = shown.stretch;
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
        return count != m_counts.end() && count->second == 1 && !m_sync.m_knownIds.contains(copy.id) &&
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
        for (const Shown& shown : m_preview.shown) {
            for (const PlacedMemo& copy : shown.copies) {
                if (m_sync.m_notFollowed.contains(memoOf(copy.event)))
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
        const bool isOrphan = !m_counts.contains(copy.id) || m_sync.m_orphans.contains(copy.id);
        return isOrphan && MemoMark::keptBy(*copy.event.node()) && m_sync.m_notFollowed.contains(memoOf(copy.event));
    }

    /// The memos that a stretch shows. What was there is null where that isn't known.
    static std::vector<PlacedMemo> sourcesOf(const PlacedMemos& memos, const Shown& shown, const Remembered* remembered)
    {
        const Stretch& stretch = shown.stretch;
        std::vector<PlacedMemo> found;
        std::vector<PlacedMemo> reaching;
        const auto wasHere = [remembered](const PlacedMemo& memo) {
            if (!remembered)
                return false;
            const auto copy = remembered->copies.lower_bound(firstOf(memo.id));
            return copy != remembered->copies.end() && copy->id == memo.id;
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
    bool carryOver(const PlacedMemo& copy, MemosById& sources, const Stretch& stretch,
                   const std::optional<Memo>& before)
    {
        std::optional<PlacedMemo> memo =
            sources.take(copy.id, stretch.toSource(before ? before->start : copy.span.start));
        if (memo) {
            carryOver(copy.event, *memo, stretch, before);
            markFollowed(copy.event);
        }
        return memo.has_value();
    }

    /// Whether the copy has come from another stretch, with its memo.
    bool takeAlong(const PlacedMemo& copy, const Stretch& stretch)
    {
        const auto taken = m_taken.find(copy.id);
        if (taken == m_taken.end() || !MemoMark::keptBy(*copy.event.node()))
            return false;
        auto& [before, memo, distance] = taken->second;
        const Memo edited = memoOf(copy.event);
        if (edited.name != before.name)
            memo.event.setName(m_transaction, edited.name);
        place(memo, stretch.toSource(copy.span));
        markFollowed(copy.event);
        return true;
    }

    void carryOver(const HostEvent& copy, PlacedMemo& placed, const Stretch& stretch, const std::optional<Memo>& before)
    {
        HostEvent& memo = placed.event;
        const Memo edited = memoOf(copy);
        const Edited sides = before ? differencesOf(edited, *before) : editedWhereUnknown(copy, memoOf(memo));
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
    Edited editedWhereUnknown(const HostEvent& copy, const Memo& memo) const
    {
        Edited edited = editedSinceMark(copy);
        if (const auto last = m_sync.m_behind.find(memo.id); last != m_sync.m_behind.end()) {
            const Behind now = laterThan(last->second, {memo, memo, {memoOf(copy)}});
            const Edited later = differencesOf(memo, now.before);
            edited = {edited.name && !later.name, edited.place && !later.place};
        }
        return edited;
    }

    void writeMemoOf(const PlacedMemo& written, const Stretch& stretch)
    {
        HostEvent copy = written.event;
        copy.setUserId(m_newIds.next());
        const SecondsRange span = stretch.toSource(written.span);
        noteChange(span);
        Marker{span.start, span.end, copy.getName(), {}, copy.getUserId()}.insertInto(m_sync.m_hostContext,
                                                                                      m_transaction, m_memos);
        markFollowed(copy);
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

    const MemoSync& m_sync;
    const Track& m_memos;
    const Preview& m_preview;
    std::set<std::int64_t> m_adrift;
    std::set<MarkOfId> m_adriftMarks;
    std::set<MarkOfId> m_otherMarks;              ///< of memos, and of copies with an edit that they haven't followed
    std::map<std::int64_t, Taken> m_taken;        ///< by their ids
    std::map<std::int64_t, std::size_t> m_counts; ///< of the memos in the real programme, by their ids
    IEditTransaction& m_transaction;
    NewIds m_newIds;
    CoveredRanges m_changed; ///< since the memos were placed
};

void MemoSync::forget()
{
    forgetCopies({});
    m_orphans.clear();
    m_behind.clear();
    m_wereBehind.clear();
}

void MemoSync::forgetCopies(const Events& events)
{
    m_noted.reset();
    m_remembered.clear();
    m_knownIds.clear();
    m_notFollowed.clear();
    for (const auto& event : events)
        m_remembered.try_emplace(event);
}

void MemoSync::remember(const Track& memos, const Previewed& previewed)
{
    // What is known in part would look as if the user had written the rest.
    auto lastBehind = std::exchange(m_behind, {});
    // A memo that comes to an orphan is the later edit.
    for (const std::int64_t id : std::exchange(m_orphans, {}))
        lastBehind.try_emplace(id, Behind{firstOf(id), firstOf(id), {}});
    forgetCopies(previewed.events);
    if (memos.isAlive())
        note(PlacedMemos(memos), memos, previewed, lastBehind);
    m_noted = Noted{Velmark::Counted<Velmark::ITrackNode>::share(memos.node()), previewed.events, previewed.framerate,
                    timesOf(previewed)};
}

void MemoSync::note(const PlacedMemos& placed, const Track& memos, const Previewed& previewed,
                    const std::map<std::int64_t, Behind>& lastBehind)
{
    if (placed.all().empty())
        return;
    auto found = m_remembered;
    std::set<std::int64_t> ids;
    std::set<Memo> notFollowed;
    std::map<std::int64_t, std::set<Memo>> ahead;
    const Preview preview = previewOf(placed, previewed);
    const auto edited = editedSince(memos, preview.shown);
    for (const Shown& shown : preview.shown) {
        for (const PlacedMemo& copy : shown.copies) {
            const Memo memo = memoOf(copy.event);
            if (edited.contains(copy.event.node())) {
                notFollowed.insert(memo);
                // What was written there has no memo yet.
                if (MemoMark::keptBy(*copy.event.node()))
                    ahead[copy.id].insert(memo);
                continue;
            }
            found[shown.event][shown.piece].copies.insert(memo);
            ids.insert(copy.id);
        }
    }
    const double end = previewed.offset + previewed.moved;
    std::set<std::int64_t> orphans;
    for (const auto& [id, copies] : ahead)
        orphans.insert(id);
    for (const PlacedMemo& memo : placed.all()) {
        if (isBefore(memo.span.start, end))
            orphans.erase(memo.id);
    }
    for (const auto& [id, memo] : onlyOnes(placed, end, ahead)) {
        Behind behind{memo, memo, ahead.at(id)};
        if (const auto last = lastBehind.find(id); last != lastBehind.end())
            behind = laterThan(last->second, std::move(behind));
        // An undo or redo brings back what was.
        behind.before = m_wereBehind.try_emplace({memo, behind.copies}, behind.before).first->second;
        m_behind.emplace(id, std::move(behind));
    }
    m_notFollowed = std::move(notFollowed);
    m_orphans = std::move(orphans);
    m_remembered = std::move(found);
    m_knownIds = std::move(ids);
}

MemoSync::Behind MemoSync::laterThan(const Behind& last, Behind now)
{
    const auto isNew = [&last](const Memo& copy, bool Edited::*side) {
        return std::ranges::all_of(last.copies, [&](const Memo& other) { return differencesOf(copy, other).*side; });
    };
    const auto isEdited = [&](bool Edited::*side) {
        return !(differencesOf(now.memo, last.memo).*side) &&
               std::ranges::any_of(now.copies, [&](const Memo& copy) { return isNew(copy, side); });
    };
    if (!isEdited(&Edited::name))
        now.before.name = last.before.name;
    if (!isEdited(&Edited::place)) {
        now.before.start = last.before.start;
        now.before.end = last.before.end;
    }
    return now;
}

std::map<std::int64_t, MemoSync::Memo> MemoSync::onlyOnes(const PlacedMemos& memos, double end,
                                                          const std::map<std::int64_t, std::set<Memo>>& ids)
{
    std::map<std::int64_t, Memo> found;
    std::set<std::int64_t> shared;
    for (const PlacedMemo& memo : memos.all()) {
        if (isBefore(memo.span.start, end) && ids.contains(memo.id) &&
            !found.try_emplace(memo.id, memoOf(memo.event)).second)
            shared.insert(memo.id);
    }
    for (const std::int64_t id : shared)
        found.erase(id);
    return found;
}

void MemoSync::markFollowed(const HostEvent& copy)
{
    MemoMark::of(*copy.node()).keepOn(*copy.node());
}

bool MemoSync::isFollowed(const HostEvent& copy)
{
    const auto mark = MemoMark::keptBy(*copy.node());
    return mark && *mark == MemoMark::of(*copy.node());
}

std::vector<PreviewRecord::Node> MemoSync::othersThan(const PreviewRecord& record,
                                                      std::vector<PreviewRecord::Node> events)
{
    const auto firstEdited = std::stable_partition(events.begin(), events.end(), [](const PreviewRecord::Node& event) {
        const auto mark = MemoMark::keptBy(*event);
        return !mark || *mark == MemoMark::of(*event);
    });
    const std::vector<PreviewRecord::Node> edited(firstEdited, events.end());
    events.erase(firstEdited, events.end());
    events = record.others(std::move(events));
    events.insert(events.end(), edited.begin(), edited.end());
    return events;
}

std::set<const Velmark::IProjectNode*> MemoSync::editedSince(const Track& memos, const std::vector<Shown>& shown)
{
    std::vector<PreviewRecord::Node> copies;
    for (const Shown& each : shown) {
        for (const PlacedMemo& copy : each.copies) {
            if (!isFollowed(copy.event))
                copies.push_back(PreviewRecord::Node::share(copy.event.node()));
        }
    }
    if (copies.empty())
        return {};
    if (const auto record = PreviewRecord::keptBy(memos))
        copies = othersThan(*record, std::move(copies));
    std::set<const Velmark::IProjectNode*> edited;
    for (const PreviewRecord::Node& copy : copies)
        edited.insert(copy.get());
    return edited;
}

void MemoSync::follow(const Track& memos, const Previewed& previewed, IEditTransaction& transaction)
{
    PlacedMemos placed(memos);
    if (placed.all().empty())
        return;
    const Preview preview = previewOf(placed, previewed);
    Following(*this, memos, preview, transaction).follow(std::move(placed), previewed.offset + previewed.moved);
}

bool MemoSync::hasNoted(const Track& memos, const Previewed& previewed) const
{
    return m_noted && m_noted->track.get() == memos.node() && m_noted->events == previewed.events &&
           areSame(m_noted->framerate, previewed.framerate) && m_noted->times == timesOf(previewed);
}

std::array<double, 3> MemoSync::timesOf(const Previewed& previewed)
{
    return {previewed.offset, previewed.begin, previewed.moved};
}

const MemoSync::Remembered* MemoSync::rememberedOf(const Shown& shown) const
{
    static const Remembered NoCopies;
    const auto ofEvent = m_remembered.find(shown.event);
    if (ofEvent == m_remembered.end())
        return nullptr;
    const auto ofPiece = ofEvent->second.find(shown.piece);
    return ofPiece != ofEvent->second.end() ? &ofPiece->second : &NoCopies;
}

} // namespace cadrel::host
