// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoSync.h"

#include "host/project/HostFramerate.h"
#include "host/project/MemoFollowing.h"
#include "host/project/MemoMark.h"
#include "host/project/PlacedMemos.h"
#include "host/track/Instant.h"
#include "host/track/Track.h"

#include <algorithm>
#include <utility>

using Velmark::IEditTransaction;

namespace cadrel::host {

namespace {

/// Of the memos before a time, in seconds of the project's clock, those of the ids that no other one has.
std::map<std::int64_t, MemoState> onlyOnes(const PlacedMemos& memos, double end,
                                           const std::map<std::int64_t, std::set<MemoState>>& ids)
{
    std::map<std::int64_t, MemoState> found;
    std::set<std::int64_t> shared;
    for (const PlacedMemo& memo : memos.all()) {
        if (isBefore(memo.span.start, end) && ids.contains(memo.id) &&
            !found.try_emplace(memo.id, MemoState::of(memo.event)).second)
            shared.insert(memo.id);
    }
    for (const std::int64_t id : shared)
        found.erase(id);
    return found;
}

/// Of the copies those that their memos haven't followed and that aren't as they were written.
std::set<const Velmark::IProjectNode*> editedSince(const Track& memos, const std::vector<ShownStretch>& shown)
{
    std::vector<PreviewRecord::Node> copies;
    for (const ShownStretch& each : shown) {
        for (const PlacedMemo& copy : each.copies) {
            if (!MemoMark::isUpToDateOn(*copy.event.node()))
                copies.push_back(PreviewRecord::Node::share(copy.event.node()));
        }
    }
    if (copies.empty())
        return {};
    if (const auto record = PreviewRecord::keptBy(memos))
        copies = MemoSync::othersThan(*record, std::move(copies));
    std::set<const Velmark::IProjectNode*> edited;
    for (const PreviewRecord::Node& copy : copies)
        edited.insert(copy.get());
    return edited;
}

} // namespace

void MemoSync::follow(const Track& memos, const PreviewedEvents& previewed, IEditTransaction& transaction)
{
    followCopies(m_hostContext, m_note, memos, previewed, transaction);
}

void MemoSync::forget()
{
    forgetCopies({});
    m_note.orphans.clear();
    m_note.behind.clear();
    m_wereBehind.clear();
}

void MemoSync::forgetCopies(const Events& events)
{
    m_noted.reset();
    m_note.remembered.clear();
    m_note.knownIds.clear();
    m_note.notFollowed.clear();
    for (const auto& event : events)
        m_note.remembered.try_emplace(event);
}

void MemoSync::remember(const Track& memos, const PreviewedEvents& previewed)
{
    // What is known in part would look as if the user had written the rest.
    auto lastBehind = std::exchange(m_note.behind, {});
    // A memo that comes to an orphan is the later edit.
    for (const std::int64_t id : std::exchange(m_note.orphans, {}))
        lastBehind.try_emplace(id, MemoBehind{MemoState::firstOf(id), MemoState::firstOf(id), {}});
    forgetCopies(previewed.events);
    if (memos.isAlive())
        note(PlacedMemos(memos), memos, previewed, lastBehind);
    m_noted = Noted{Velmark::Counted<Velmark::ITrackNode>::share(memos.node()), previewed.events, previewed.framerate,
                    timesOf(previewed)};
}

void MemoSync::note(const PlacedMemos& placed, const Track& memos, const PreviewedEvents& previewed,
                    const std::map<std::int64_t, MemoBehind>& lastBehind)
{
    if (placed.all().empty())
        return;
    MemoNote now;
    now.remembered = m_note.remembered;
    std::map<std::int64_t, std::set<MemoState>> ahead;
    const ShownMemos preview(placed, previewed);
    const auto edited = editedSince(memos, preview.shown);
    for (const ShownStretch& shown : preview.shown) {
        for (const PlacedMemo& copy : shown.copies) {
            const MemoState memo = MemoState::of(copy.event);
            if (edited.contains(copy.event.node())) {
                now.notFollowed.insert(memo);
                // What was written there has no memo yet.
                if (MemoMark::keptBy(*copy.event.node()))
                    ahead[copy.id].insert(memo);
                continue;
            }
            now.remembered[shown.event][shown.piece].insert(memo);
            now.knownIds.insert(copy.id);
        }
    }
    const double end = previewed.start();
    for (const auto& [id, copies] : ahead)
        now.orphans.insert(id);
    for (const PlacedMemo& memo : placed.all()) {
        if (isBefore(memo.span.start, end))
            now.orphans.erase(memo.id);
    }
    for (const auto& [id, memo] : onlyOnes(placed, end, ahead)) {
        MemoBehind behind{memo, memo, ahead.at(id)};
        if (const auto last = lastBehind.find(id); last != lastBehind.end())
            behind = MemoBehind::laterThan(last->second, std::move(behind));
        // An undo or redo brings back what was.
        behind.before = m_wereBehind.try_emplace({memo, behind.copies}, behind.before).first->second;
        now.behind.emplace(id, std::move(behind));
    }
    m_note = std::move(now);
}

std::vector<PreviewRecord::Node> MemoSync::othersThan(const PreviewRecord& record,
                                                      std::vector<PreviewRecord::Node> events)
{
    const auto firstEdited = std::stable_partition(events.begin(), events.end(), [](const PreviewRecord::Node& event) {
        return !MemoMark::keptBy(*event) || MemoMark::isUpToDateOn(*event);
    });
    const std::vector<PreviewRecord::Node> edited(firstEdited, events.end());
    events.erase(firstEdited, events.end());
    events = record.others(std::move(events));
    events.insert(events.end(), edited.begin(), edited.end());
    return events;
}

bool MemoSync::hasNoted(const Track& memos, const PreviewedEvents& previewed) const
{
    return m_noted && m_noted->track.get() == memos.node() && m_noted->events == previewed.events &&
           areSame(m_noted->framerate, previewed.framerate) && m_noted->times == timesOf(previewed);
}

std::array<double, 3> MemoSync::timesOf(const PreviewedEvents& previewed)
{
    return {previewed.offset, previewed.begin, previewed.moved};
}

} // namespace cadrel::host
