// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "host/project/MemoNote.h"
#include "host/project/MemoState.h"
#include "host/project/PreviewRecord.h"
#include "host/project/ShownMemos.h"
#include "velmark/Counted.h"
#include "velmark/Tracks.h"

#include <array>
#include <cstdint>
#include <map>
#include <optional>
#include <set>
#include <utility>
#include <vector>

namespace Velmark {
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

class PlacedMemos;
class Track;

/// Lets the memos of the real programme follow what the user does to their copies in the preview stretch. A memo and its
/// copy have the same user id. What the user doesn't touch stays as it is, also where two events show the same memo. A copy
/// that is taken over an edge of its stretch is followed to the edge, and a range that is taken past what the old cut has of
/// a slower event ends there and keeps its length; one that is taken out of all stretches leaves its memo as it was.
class MemoSync {
public:
    using Events = PreviewedEvents::Events;

    /// The context outlives this object.
    explicit MemoSync(Velmark::IHostContext* context) : m_hostContext(context) {}

    /// Applies the edits of the copies to their memos. A copy that wasn't remembered is compared with what it is marked as and,
    /// where it isn't marked, with its memo. What the user has done to the memo itself since the last note counts more than
    /// what was done to such a copy.
    /// Throws Result::HostObjectMissing and Result::HostCallFailed.
    void follow(const Track& memos, const PreviewedEvents& previewed, Velmark::IEditTransaction& transaction);
    /// Notes the copies as they are. To be done whenever they may have changed, by the user, an undo or otherwise. One that
    /// was edited and that its memo hasn't followed is followed the next time. But if the user has removed the memo by then, it
    /// is written anew only once he edits the copy again. After a failure nothing is noted.
    void remember(const Track& memos, const PreviewedEvents& previewed);
    /// Whether the last note was of that track and of that preview. It holds for as long as nothing on the track changes.
    bool hasNoted(const Track& memos, const PreviewedEvents& previewed) const;
    /// From now on the copies are compared with their memos, and their number tells what the user has removed or written.
    void forget();
    /// The same, but none counts as removed. What is known of memos that haven't followed stays for the next note.
    void forgetCopies(const Events& events);
    /// Those of the events that aren't as the system has written them. A copy that its memo has followed elsewhere is one of
    /// them once it was edited again, also where it is as it was written.
    static std::vector<PreviewRecord::Node> othersThan(const PreviewRecord& record,
                                                       std::vector<PreviewRecord::Node> events);

private:
    /// What the last note was of.
    struct Noted {
        Velmark::Counted<Velmark::ITrackNode> track;
        Events events;
        core::Framerate framerate;
        std::array<double, 3> times;
    };

    static std::array<double, 3> timesOf(const PreviewedEvents& previewed);
    void note(const PlacedMemos& placed, const Track& memos, const PreviewedEvents& previewed,
              const std::map<std::int64_t, MemoBehind>& lastBehind);

    Velmark::IHostContext* m_hostContext;
    MemoNote m_note;
    /// In all of the preview: what a memo had been like, by what it and its copies were like.
    std::map<std::pair<MemoState, std::set<MemoState>>, MemoState> m_wereBehind;
    std::optional<Noted> m_noted;
};

} // namespace cadrel::host
