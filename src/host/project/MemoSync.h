// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"
#include "host/project/PreviewRecord.h"
#include "host/track/HostEvent.h"
#include "velmark/Counted.h"
#include "velmark/Tracks.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <utility>
#include <vector>

namespace Velmark {
class IEditTransaction;
class IHostContext;
class IProjectNode;
} // namespace Velmark

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::host {

class PlacedMemos;
struct PlacedMemo;
class Track;

/// Lets the memos of the real programme follow what the user does to their copies in the preview stretch. A memo and its
/// copy have the same user id. What the user doesn't touch stays as it is, also where two events show the same memo. A copy
/// that is taken over an edge of its stretch is followed to the edge, and a range that is taken past what the old cut has of
/// a slower event ends there and keeps its length; one that is taken out of all stretches leaves its memo as it was.
class MemoSync {
public:
    using Events = std::vector<std::shared_ptr<core::EventBase>>;
    /// What is shown in the preview stretch.
    struct Previewed {
        const Events& events;
        core::Framerate framerate; ///< of their timecodes
        double offset;             ///< how much later than its destination each one stands, in seconds
        double begin;              ///< of the host's timeline, before which nothing stands, on the project's clock
        double moved = 0.0;        ///< how far the time origin has moved since they were written, in seconds
    };

    /// The context outlives this object.
    explicit MemoSync(Velmark::IHostContext* context) : m_hostContext(context) {}

    /// Applies the edits of the copies to their memos. A copy that wasn't remembered is compared with what it is marked as and,
    /// where it isn't marked, with its memo. What the user has done to the memo itself since the last note counts more than
    /// what was done to such a copy.
    /// Throws Result::HostObjectMissing and Result::HostCallFailed.
    void follow(const Track& memos, const Previewed& previewed, Velmark::IEditTransaction& transaction);
    /// Notes the copies as they are. To be done whenever they may have changed, by the user, an undo or otherwise. One that
    /// was edited and that its memo hasn't followed is followed the next time. But if the user has removed the memo by then, it
    /// is written anew only once he edits the copy again. After a failure nothing is noted.
    void remember(const Track& memos, const Previewed& previewed);
    /// Whether the last note was of that track and of that preview. It holds for as long as nothing on the track changes.
    bool hasNoted(const Track& memos, const Previewed& previewed) const;
    /// From now on the copies are compared with their memos, and their number tells what the user has removed or written.
    void forget();
    /// The same, but none counts as removed. What is known of memos that haven't followed stays for the next note.
    void forgetCopies(const Events& events);
    /// Notes on a copy what it is like now. To be done when it is written.
    static void markFollowed(const HostEvent& copy);
    /// Whether a copy is as it was when it was written or its memo followed it last.
    static bool isFollowed(const HostEvent& copy);
    /// Those of the events that aren't as the system has written them. A copy that its memo has followed elsewhere is one of
    /// them once it was edited again, also where it is as it was written.
    static std::vector<PreviewRecord::Node> othersThan(const PreviewRecord& record,
                                                       std::vector<PreviewRecord::Node> events);

private:
    /// Where a previewed event, or what later ones have left of it, comes from and stands, in seconds of the project's
    /// clock.
    struct Stretch {
        core::SecondsRange source;
        core::SecondsRange preview;

        double clamped(double sourceTime) const;
        double toSource(double previewTime) const;
        /// Where the memo of a copy stands.
        core::SecondsRange toSource(const core::SecondsRange& copy) const;
        /// Whether the preview goes on where nothing is left of the source.
        bool isSlower() const;
    };
    struct Memo {
        std::int64_t id;
        std::wstring name;
        double start;
        double end;

        auto operator<=>(const Memo&) const = default;
    };
    /// A memo in the real programme that shares its id with no other one, and the copies with an edit that it hasn't followed.
    struct Behind {
        Memo before; ///< with the name and the place that it had when the copies got theirs
        Memo memo;
        std::set<Memo> copies;
    };
    /// The copies in a stretch as they were.
    struct Remembered {
        std::set<Memo> copies;
    };
    class CopiesThatWere;
    /// A stretch with the copies that belong to it.
    struct Shown {
        std::shared_ptr<core::EventBase> event;
        std::size_t piece; ///< of what is left of the event
        Stretch stretch;
        std::vector<PlacedMemo> copies;
    };
    /// Each memo after the preview offset belongs to the first stretch in which most of it lies or, where there is
    /// none, to the first into which it reaches.
    struct Preview {
        std::vector<Shown> shown;       ///< in the order of the events
        std::vector<PlacedMemo> adrift; ///< in no stretch
    };
    class Following;
    /// What the last note was of.
    struct Noted {
        Velmark::Counted<Velmark::ITrackNode> track;
        Events events;
        core::Framerate framerate;
        std::array<double, 3> times;
    };

    static std::array<double, 3> timesOf(const Previewed& previewed);
    /// Null where nothing is known of the event.
    const Remembered* rememberedOf(const Shown& shown) const;
    static std::vector<Shown> stretchesOf(const Previewed& previewed);
    static Preview previewOf(const PlacedMemos& memos, const Previewed& previewed);
    static Memo memoOf(const HostEvent& event);
    static Memo firstOf(std::int64_t id, std::wstring name = {});
    void note(const PlacedMemos& placed, const Track& memos, const Previewed& previewed,
              const std::map<std::int64_t, Behind>& lastBehind);
    /// Of the memos before a time, in seconds of the project's clock, those of the ids that no other one has.
    static std::map<std::int64_t, Memo> onlyOnes(const PlacedMemos& memos, double end,
                                                 const std::map<std::int64_t, std::set<Memo>>& ids);
    /// The same of what was behind at the last note, and is now. What memo and copy have got at one go counts as the memo's.
    static Behind laterThan(const Behind& last, Behind now);
    /// Of the copies those that their memos haven't followed and that aren't as they were written.
    static std::set<const Velmark::IProjectNode*> editedSince(const Track& memos, const std::vector<Shown>& shown);

    Velmark::IHostContext* m_hostContext;
    /// By event and piece.
    std::map<std::shared_ptr<core::EventBase>, std::map<std::size_t, Remembered>> m_remembered;
    std::set<std::int64_t> m_knownIds;       ///< of those copies
    std::set<Memo> m_notFollowed;            ///< the other copies
    std::set<std::int64_t> m_orphans;        ///< of those, where no memo is there
    std::map<std::int64_t, Behind> m_behind; ///< by their ids
    /// In all of the preview: what a memo had been like, by what it and its copies were like.
    std::map<std::pair<Memo, std::set<Memo>>, Memo> m_wereBehind;
    std::optional<Noted> m_noted;
};

} // namespace cadrel::host
