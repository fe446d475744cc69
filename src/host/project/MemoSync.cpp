// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "core/edl/EventBase.h"
#include "host/track/Instant.h"
#include "host/track/Marker.h"
#include "host/track/Track.h"

#include <algorithm>
#include <cmath>
#include <iterator>
#include <utility>

using cadrel::core::SecondsRange;
using Velmark::IEditTransaction;

namespace cadrel::host {

namespace {

bool isEmpty(const SecondsRange& range)
{
    return !isBefore(range.start, range.end);
}

/// What a later event has left of ranges on which it was written.
std::vector<SecondsRange> without(const std::vector<SecondsRange>& ranges, const SecondsRange& written)
{
    std::vector<SecondsRange> left;
    for (const SecondsRange& range : ranges) {
        for (const SecondsRange& piece : {SecondsRange{range.start, std::min(range.end, written.start)},
                                          SecondsRange{std::max(range.start, written.end), range.end}}) {
            if (!isEmpty(piece))
                left.push_back(piece);
        }
    }
    return left;
}

bool reachesInto(const HostEvent& memo, const SecondsRange& range)
{
    return isBefore(memo.getStart(), range.end) && isBefore(range.start, memo.getEnd());
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
std::vector<MemoSync::Stretch> MemoSync::stretchesOf(const Previewed& previewed, std::size_t index)
{
    const Events& events = previewed.events;
    const core::Framerate framerate = previewed.framerate;
    const double moved = previewed.moved;
    const double offset = previewed.offset + moved;
    const auto isWritten = [](const core::EventBase& event) {
        return !event.hasFlaw(core::EventFlaw::TimecodeInvalid) && event.srcIn() < event.srcOut() &&
               event.dstIn() < event.dstOut();
    };
    const auto previewOf = [&](const core::EventBase& event) {
        return SecondsRange{event.dstIn().toSeconds(framerate) + offset, event.dstOut().toSeconds(framerate) + offset};
    };

    const core::EventBase& event = *events[index];
    if (!isWritten(event))
        return {};
    const SecondsRange whole = previewOf(event);
    std::vector<SecondsRange> pieces{whole};
    for (std::size_t later = index + 1; later < events.size(); ++later) {
        if (isWritten(*events[later]))
            pieces = without(pieces, previewOf(*events[later]));
    }

    const double srcIn = event.srcIn().toSeconds(framerate) + moved;
    const double srcOut = event.srcOut().toSeconds(framerate) + moved;
    std::vector<Stretch> stretches;
    for (const SecondsRange& piece : pieces) {
        const SecondsRange source{srcIn + (piece.start - whole.start),
                                  std::min(srcIn + (piece.end - whole.start), srcOut)};
        if (!isEmpty(source))
            stretches.push_back({source, piece});
    }
    return stretches;
}

std::vector<HostEvent> MemoSync::memosIn(const Track& memos, const SecondsRange& range)
{
    const double origin = memos.timeOrigin();
    std::vector<HostEvent> found = memos.eventsInRange(range.start - origin, range.end - origin);
    // A range doesn't hold its end, and what is copied doesn't either.
    std::erase_if(found, [&range](const HostEvent& memo) { return !isBefore(memo.getStart(), range.end); });
    return found;
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

MemoSync::Preview MemoSync::previewOf(const Track& memos, const Previewed& previewed)
{
    Preview preview;
    for (std::size_t index = 0; index < previewed.events.size(); ++index) {
        for (const Stretch& stretch : stretchesOf(previewed, index))
            preview.shown.push_back({previewed.events[index], stretch, {}});
    }

    preview.adrift = memos.clipEvents();
    std::erase_if(preview.adrift, [offset = previewed.offset + previewed.moved](const HostEvent& memo) {
        return isBefore(memo.getEnd(), offset);
    });
    const auto give = [&preview](Shown& shown, const auto& belongs) {
        std::erase_if(preview.adrift, [&](const HostEvent& memo) {
            if (!belongs(memo))
                return false;
            shown.copies.push_back(memo);
            return true;
        });
    };
    for (Shown& shown : preview.shown) {
        const std::vector<HostEvent> inside = memosIn(memos, shown.stretch.preview);
        give(shown, [&](const HostEvent& memo) { return std::ranges::find(inside, memo) != inside.end(); });
    }
    for (Shown& shown : preview.shown)
        give(shown, [&](const HostEvent& memo) { return reachesInto(memo, shown.stretch.preview); });
    return preview;
}

void MemoSync::remember(const Track& memos, const Previewed& previewed)
{
    // After a failure nothing is known. What is known in part would look as if the user had written the rest.
    m_remembered.clear();
    std::map<std::shared_ptr<core::EventBase>, Memos> found;
    for (const Shown& shown : previewOf(memos, previewed).shown)
        std::ranges::transform(shown.copies, std::back_inserter(found[shown.event]), memoOf);
    m_remembered = std::move(found);
}

void MemoSync::follow(const Track& memos, const Previewed& previewed, IEditTransaction& transaction)
{
    const Preview preview = previewOf(memos, previewed);
    for (const Shown& shown : preview.shown) {
        const auto remembered = m_remembered.find(shown.event);
        followStretch(memos, transaction, shown, preview.adrift,
                      remembered != m_remembered.end() ? &remembered->second : nullptr);
    }
}

void MemoSync::followStretch(const Track& memos, IEditTransaction& transaction, const Shown& shown,
                             const std::vector<HostEvent>& adrift, const Memos* remembered)
{
    const Stretch& stretch = shown.stretch;
    std::vector<HostEvent> copies = shown.copies;
    std::vector<HostEvent> sources = sourcesOf(memos, stretch, copies);
    if (remembered)
        keepEdited(copies, sources, *remembered);
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
}

std::vector<HostEvent> MemoSync::sourcesOf(const Track& memos, const Stretch& stretch,
                                           const std::vector<HostEvent>& copies)
{
    std::vector<HostEvent> found = memosIn(memos, stretch.source);
    // A memo that only reaches into the stretch has its copy there, too.
    for (HostEvent& memo : memos.clipEvents()) {
        const std::int64_t id = memo.getUserId();
        if (reachesInto(memo, stretch.source) && hasId(copies, id) && !hasId(found, id))
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
