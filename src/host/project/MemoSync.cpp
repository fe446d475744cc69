// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "core/edl/EventBase.h"
#include "host/project/MemoPlaces.h"
#include "host/project/PlacedMemos.h"
#include "host/track/CoveredRanges.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "host/track/Track.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <functional>
#include <limits>
#include <optional>
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

/// The new ids that are given to memos of a track one after the other.
class NewIds {
public:
    explicit NewIds(const Track& memos) : m_memos(memos) {}

    std::int64_t next()
    {
        if (m_last == std::numeric_limits<std::int64_t>::max())
            throw util::Result::OutOfRange;
        m_last = m_last ? *m_last + 1 : m_memos.nextUserId();
        return *m_last;
    }

private:
    const Track& m_memos;
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
        if (event.hasFlaw(core::EventFlaw::TimecodeInvalid) || !(event.srcIn() < event.srcOut()) ||
            !(event.dstIn() < event.dstOut()))
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
                shown.push_back({*next, {source, *piece}, {}});
        }
    }
    std::ranges::reverse(shown);
    return shown;
}

MemoSync::Memo MemoSync::memoOf(const HostEvent& event)
{
    return {event.getUserId(), event.getName(), event.getStart(), event.getEnd()};
}

void MemoSync::Remembered::add(Memo memo)
{
    byId.emplace(memo.id, memo);
    copies.insert(std::move(memo));
}

const MemoSync::Memo* MemoSync::Remembered::find(std::int64_t id) const
{
    const auto found = byId.find(id);
    return found != byId.end() ? &found->second : nullptr;
}

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
    Following(IHostContext* context, const Track& memos, const Preview& preview, IEditTransaction& transaction)
        : m_hostContext(context), m_memos(memos), m_preview(preview), m_adrift(idsOf(preview.adrift)),
          m_transaction(transaction), m_newIds(memos)
    {
    }

    /// The memos have stood as placed. What the copies were like is null where that isn't known.
    void follow(PlacedMemos placed, const std::function<const Remembered*(const Shown&)>& rememberedOf)
    {
        for (const Shown& shown : m_preview.shown) {
            if (hasChanged(shown.stretch.source)) {
                placed = PlacedMemos(m_memos);
                m_changed = CoveredRanges();
            }
            followStretch(placed, shown, rememberedOf(shown));
        }
    }

private:
    /// The memos of those adrift stay.
    void followStretch(const PlacedMemos& placed, const Shown& shown, const Remembered* remembered)
    {
        const Stretch& stretch = shown.stretch;
        std::vector<PlacedMemo> copies = shown.copies;
        MemosById sources(sourcesOf(placed, stretch, copies));
        if (remembered)
            keepEdited(copies, sources, *remembered);
        const std::size_t copyCount = copies.size();
        const std::size_t sourceCount = sources.size();

        std::erase_if(copies, [&](const PlacedMemo& copy) {
            std::optional<PlacedMemo> memo = sources.take(copy.id);
            if (memo)
                carryOver(copy.event, *memo, stretch, remembered ? remembered->find(memo->id) : nullptr);
            return memo.has_value();
        });
        // What is left has no partner. As long as nothing is known of what the user has done, the numbers tell whether he
        // has removed or written something.
        if (remembered || sourceCount > copyCount) {
            for (PlacedMemo& memo : sources.rest()) {
                if (m_adrift.contains(memo.id))
                    continue;
                noteChange(memo.span);
                memo.event.remove(m_transaction);
            }
        }
        if (remembered || copyCount > sourceCount) {
            for (const PlacedMemo& copy : copies)
                writeMemoOf(copy, stretch);
        }
    }

    /// The memos that a stretch shows.
    static std::vector<PlacedMemo> sourcesOf(const PlacedMemos& memos, const Stretch& stretch,
                                             const std::vector<PlacedMemo>& copies)
    {
        std::vector<PlacedMemo> found;
        std::vector<PlacedMemo> reaching;
        memos.visitTouching(stretch.source, [&](const PlacedMemo& memo) {
            if (liesIn(memo.span, stretch.source))
                found.push_back(memo);
            else if (reachesInto(memo.span, stretch.source))
                reaching.push_back(memo);
        });
        if (reaching.empty())
            return found;
        // A memo that only reaches into the stretch has its copy there, too.
        const std::set<std::int64_t> copied = idsOf(copies);
        std::set<std::int64_t> taken = idsOf(found);
        for (PlacedMemo& memo : reaching) {
            if (copied.contains(memo.id) && taken.insert(memo.id).second)
                found.push_back(std::move(memo));
        }
        return found;
    }

    /// Leaves those that the user has edited, and of the memos those whose copy he has edited or removed.
    static void keepEdited(std::vector<PlacedMemo>& copies, MemosById& sources, const Remembered& remembered)
    {
        // Another copy of the same memo may have been edited, or the memo itself.
        std::erase_if(copies, [&](const PlacedMemo& copy) {
            const bool isUntouched = remembered.copies.contains(memoOf(copy.event));
            if (isUntouched)
                sources.take(copy.id);
            return isUntouched;
        });
        // What the user has written in the real programme meanwhile has no copy that he could have removed.
        const std::set<std::int64_t> edited = idsOf(copies);
        for (const PlacedMemo& memo : sources.rest()) {
            if (!edited.contains(memo.id) && !remembered.find(memo.id))
                sources.take(memo.id);
        }
    }

    /// What the copy was like is null where that isn't known.
    void carryOver(const HostEvent& copy, PlacedMemo& placed, const Stretch& stretch, const Memo* remembered)
    {
        HostEvent& memo = placed.event;
        // The memo may have been edited itself, or by another copy.
        const Memo edited = memoOf(copy);
        const bool isRenamed = !remembered || edited.name != remembered->name;
        if (isRenamed && memo.getName() != edited.name)
            memo.setName(m_transaction, edited.name);
        if (remembered && edited.start == remembered->start && edited.end == remembered->end)
            return;

        // What hangs over an edge of the stretch isn't in the preview, and stays.
        const auto followed = [&stretch](double own, double inPreview) {
            const double mapped = stretch.toSource(inPreview);
            return std::abs(stretch.clamped(own) - mapped) < core::SameInstant ? own : mapped;
        };
        const auto [ownStart, ownEnd] = placed.span;
        const double start = followed(ownStart, edited.start);
        const double end = followed(ownEnd, edited.end);
        if (start == ownStart && (!memo.isRange() || end == ownEnd))
            return;
        noteChange(placed.span);
        memo.setStart(m_transaction, start);
        if (memo.isRange())
            memo.setLength(m_transaction, end - start);
        noteChange({start, std::max(start, memo.getEnd())});
    }

    void writeMemoOf(const PlacedMemo& written, const Stretch& stretch)
    {
        HostEvent copy = written.event;
        copy.setUserId(m_newIds.next());
        const SecondsRange span{stretch.toSource(copy.getStart()), stretch.toSource(copy.getEnd())};
        noteChange(span);
        Marker{span.start, span.end, copy.getName(), {}, copy.getUserId()}.insertInto(m_hostContext, m_transaction,
                                                                                      m_memos);
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
    const Track& m_memos;
    const Preview& m_preview;
    std::set<std::int64_t> m_adrift;
    IEditTransaction& m_transaction;
    NewIds m_newIds;
    CoveredRanges m_changed; ///< since the memos were placed
};

void MemoSync::remember(const Track& memos, const Previewed& previewed)
{
    // After a failure nothing is known. What is known in part would look as if the user had written the rest.
    m_remembered.clear();
    std::map<std::shared_ptr<core::EventBase>, Remembered> found;
    for (const auto& event : previewed.events)
        found.try_emplace(event);
    const PlacedMemos placed(memos);
    if (!placed.all().empty()) {
        for (const Shown& shown : previewOf(placed, previewed).shown) {
            for (const PlacedMemo& copy : shown.copies)
                found[shown.event].add(memoOf(copy.event));
        }
    }
    m_remembered = std::move(found);
}

std::vector<HostEvent> MemoSync::adrift(const Track& memos, const Previewed& previewed)
{
    std::vector<HostEvent> events;
    for (const PlacedMemo& memo : previewOf(PlacedMemos(memos), previewed).adrift)
        events.push_back(memo.event);
    return events;
}

void MemoSync::follow(const Track& memos, const Previewed& previewed, IEditTransaction& transaction)
{
    PlacedMemos placed(memos);
    if (placed.all().empty())
        return;
    const Preview preview = previewOf(placed, previewed);
    Following(m_hostContext, memos, preview, transaction).follow(std::move(placed), [this](const Shown& shown) {
        const auto remembered = m_remembered.find(shown.event);
        return remembered != m_remembered.end() ? &remembered->second : nullptr;
    });
}

} // namespace cadrel::host
