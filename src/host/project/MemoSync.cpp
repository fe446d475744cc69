// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "core/edl/EventBase.h"
#include "host/track/CoveredRanges.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "host/track/Track.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <limits>
#include <span>
#include <utility>

using cadrel::core::SecondsRange;
using Velmark::IEditTransaction;

namespace cadrel::host {

/// A memo where it stands, in seconds of the project's clock.
struct PlacedMemo {
    HostEvent event;
    SecondsRange span;
};

/// The memos of a track where they stood when they were read, in the order of their starts.
class PlacedMemos {
public:
    explicit PlacedMemos(const Track& track)
    {
        for (HostEvent& event : track.clipEvents()) {
            const SecondsRange span{event.getStart(), event.getEnd()};
            m_memos.push_back({std::move(event), span});
        }
        std::ranges::stable_sort(m_memos, {}, [](const PlacedMemo& memo) { return memo.span.start; });
        double latest = std::numeric_limits<double>::lowest();
        for (const PlacedMemo& memo : m_memos)
            m_latestEnds.push_back(latest = std::max(latest, memo.span.end));
    }

    const std::vector<PlacedMemo>& all() const { return m_memos; }
    /// Those that may have something in a range, and perhaps some before it.
    std::span<const PlacedMemo> touching(const SecondsRange& range) const
    {
        const auto first =
            std::ranges::partition_point(m_latestEnds, [&range](double end) { return isBefore(end, range.start); });
        const auto last = std::ranges::partition_point(
            m_memos, [&range](const PlacedMemo& memo) { return isBefore(memo.span.start, range.end); });
        const auto from = m_memos.begin() + (first - m_latestEnds.begin());
        return from < last ? std::span(from, last) : std::span<const PlacedMemo>();
    }

private:
    std::vector<PlacedMemo> m_memos;
    std::vector<double> m_latestEnds; ///< of each memo and those before it
};

namespace {

bool isEmpty(const SecondsRange& range)
{
    return !isBefore(range.start, range.end);
}

bool reachesInto(const SecondsRange& memo, const SecondsRange& range)
{
    return isBefore(memo.start, range.end) && isBefore(range.start, memo.end);
}

/// A range doesn't hold its end, and what is copied doesn't either.
bool liesIn(const SecondsRange& memo, const SecondsRange& range)
{
    return countsAsIn(memo, range) && isBefore(memo.start, range.end);
}

bool hasId(const std::vector<HostEvent>& memos, std::int64_t id)
{
    return std::ranges::any_of(memos, [id](const HostEvent& memo) { return memo.getUserId() == id; });
}

/// Takes the memo of that id out of the list; an empty handle when there is none.
HostEvent takeById(std::vector<HostEvent>& memos, std::int64_t id)
{
    const auto found = std::ranges::find_if(memos, [id](const HostEvent& memo) { return memo.getUserId() == id; });
    if (found == memos.end())
        return {};
    const HostEvent memo = *found;
    memos.erase(found);
    return memo;
}

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

const MemoSync::Memo* MemoSync::findById(const Memos& memos, std::int64_t id)
{
    const auto found = std::ranges::find(memos, id, &Memo::id);
    return found != memos.end() ? &*found : nullptr;
}

MemoSync::Preview MemoSync::previewOf(const PlacedMemos& memos, const Previewed& previewed)
{
    Preview preview{stretchesOf(previewed), {}};
    // They don't overlap.
    std::vector<Shown*> inOrder;
    for (Shown& shown : preview.shown)
        inOrder.push_back(&shown);
    std::ranges::sort(inOrder, {}, [](const Shown* shown) { return shown->stretch.preview.start; });

    const double offset = previewed.offset + previewed.moved;
    std::vector<std::pair<Shown*, HostEvent>> reaching;
    for (const PlacedMemo& memo : memos.all()) {
        if (isBefore(memo.span.end, offset))
            continue;
        Shown* inside = nullptr;
        Shown* touched = nullptr;
        const auto first = std::ranges::partition_point(
            inOrder, [&](const Shown* shown) { return isBefore(shown->stretch.preview.end, memo.span.start); });
        for (auto next = first; next != inOrder.end() && !isBefore(memo.span.end, (*next)->stretch.preview.start);
             ++next) {
            const SecondsRange& stretch = (*next)->stretch.preview;
            if (liesIn(memo.span, stretch) && (!inside || *next < inside))
                inside = *next;
            if (reachesInto(memo.span, stretch) && (!touched || *next < touched))
                touched = *next;
        }
        if (inside)
            inside->copies.push_back(memo.event);
        else if (touched)
            reaching.emplace_back(touched, memo.event);
        else
            preview.adrift.push_back(memo.event);
    }
    for (const auto& [shown, memo] : reaching)
        shown->copies.push_back(memo);
    return preview;
}

void MemoSync::remember(const Track& memos, const Previewed& previewed)
{
    // After a failure nothing is known. What is known in part would look as if the user had written the rest.
    m_remembered.clear();
    std::map<std::shared_ptr<core::EventBase>, Memos> found;
    for (const auto& event : previewed.events)
        found.try_emplace(event);
    const PlacedMemos placed(memos);
    if (!placed.all().empty()) {
        for (const Shown& shown : previewOf(placed, previewed).shown)
            std::ranges::transform(shown.copies, std::back_inserter(found[shown.event]), memoOf);
    }
    m_remembered = std::move(found);
}

std::vector<HostEvent> MemoSync::adrift(const Track& memos, const Previewed& previewed)
{
    return previewOf(PlacedMemos(memos), previewed).adrift;
}

void MemoSync::follow(const Track& memos, const Previewed& previewed, IEditTransaction& transaction)
{
    PlacedMemos placed(memos);
    if (placed.all().empty())
        return;
    const Preview preview = previewOf(placed, previewed);
    for (const Shown& shown : preview.shown) {
        const auto remembered = m_remembered.find(shown.event);
        if (followStretch(placed, memos, transaction, shown, preview.adrift,
                          remembered != m_remembered.end() ? &remembered->second : nullptr))
            placed = PlacedMemos(memos);
    }
}

bool MemoSync::followStretch(const PlacedMemos& placed, const Track& memos, IEditTransaction& transaction,
                             const Shown& shown, const std::vector<HostEvent>& adrift, const Memos* remembered)
{
    const Stretch& stretch = shown.stretch;
    std::vector<HostEvent> copies = shown.copies;
    std::vector<HostEvent> sources = sourcesOf(placed, stretch, copies);
    if (remembered)
        keepEdited(copies, sources, *remembered);
    if (copies.empty() && sources.empty())
        return false;
    const std::size_t copyCount = copies.size();
    const std::size_t sourceCount = sources.size();

    std::erase_if(copies, [&](const HostEvent& copy) {
        HostEvent memo = takeById(sources, copy.getUserId());
        if (memo)
            carryOver(transaction, copy, memo, stretch, remembered ? findById(*remembered, memo.getUserId()) : nullptr);
        return static_cast<bool>(memo);
    });
    std::erase_if(sources, [&](const HostEvent& memo) { return hasId(adrift, memo.getUserId()); });
    // What is left has no partner. As long as nothing is known of what the user has done, the numbers tell whether he has
    // removed or written something.
    if (remembered || sourceCount > copyCount) {
        for (HostEvent& memo : sources)
            memo.remove(transaction);
    }
    if (remembered || copyCount > sourceCount) {
        for (HostEvent& copy : copies) {
            copy.setUserId(memos.nextUserId());
            Marker{stretch.toSource(copy.getStart()),
                   stretch.toSource(copy.getEnd()),
                   copy.getName(),
                   {},
                   copy.getUserId()}
                .insertInto(m_hostContext, transaction, memos);
        }
    }
    return true;
}

std::vector<HostEvent> MemoSync::sourcesOf(const PlacedMemos& memos, const Stretch& stretch,
                                           const std::vector<HostEvent>& copies)
{
    std::vector<HostEvent> found;
    std::vector<HostEvent> reaching;
    for (const PlacedMemo& memo : memos.touching(stretch.source)) {
        if (liesIn(memo.span, stretch.source))
            found.push_back(memo.event);
        else if (reachesInto(memo.span, stretch.source))
            reaching.push_back(memo.event);
    }
    // A memo that only reaches into the stretch has its copy there, too.
    for (HostEvent& memo : reaching) {
        const std::int64_t id = memo.getUserId();
        if (hasId(copies, id) && !hasId(found, id))
            found.push_back(std::move(memo));
    }
    return found;
}

void MemoSync::keepEdited(std::vector<HostEvent>& copies, std::vector<HostEvent>& sources, const Memos& remembered)
{
    // Another copy of the same memo may have been edited, or the memo itself.
    std::erase_if(copies, [&](const HostEvent& copy) {
        const bool isUntouched = std::ranges::find(remembered, memoOf(copy)) != remembered.end();
        if (isUntouched)
            takeById(sources, copy.getUserId());
        return isUntouched;
    });
    // What the user has written in the real programme meanwhile has no copy that he could have removed.
    std::erase_if(sources, [&](const HostEvent& memo) {
        const std::int64_t id = memo.getUserId();
        return !hasId(copies, id) && !findById(remembered, id);
    });
}

void MemoSync::carryOver(IEditTransaction& transaction, const HostEvent& copy, HostEvent& memo, const Stretch& stretch,
                         const Memo* remembered)
{
    // The memo may have been edited itself, or by another copy.
    const Memo edited = memoOf(copy);
    const bool isRenamed = !remembered || edited.name != remembered->name;
    if (isRenamed && memo.getName() != edited.name)
        memo.setName(transaction, edited.name);
    if (remembered && edited.start == remembered->start && edited.end == remembered->end)
        return;

    // What hangs over an edge of the stretch isn't in the preview, and stays.
    const auto followed = [&stretch](double own, double inPreview) {
        const double mapped = stretch.toSource(inPreview);
        return std::abs(stretch.clamped(own) - mapped) < core::SameInstant ? own : mapped;
    };
    const double ownStart = memo.getStart();
    const double ownEnd = memo.getEnd();
    const double start = followed(ownStart, edited.start);
    const double end = followed(ownEnd, edited.end);
    if (start != ownStart || (memo.isRange() && end != ownEnd)) {
        memo.setStart(transaction, start);
        if (memo.isRange())
            memo.setLength(transaction, end - start);
    }
}

} // namespace cadrel::host
