// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/KeptStretches.h"

#include "core/notes/Programme.h"
#include "core/notes/SharedChain.h"
#include "core/notes/SharedPicture.h"

#include <algorithm>
#include <cstddef>
#include <functional>
#include <map>
#include <tuple>

namespace cadrel::core {

namespace {

/// A part of a shared stretch that may be kept.
struct Offer {
    std::int32_t length; ///< at most so many frames are free
    std::int32_t newStart;
    std::int32_t oldStart;
    std::size_t shared;

    /// Of equal length, the earliest comes first.
    bool operator<(const Offer& other) const
    {
        return std::tie(other.newStart, other.oldStart) < std::tie(newStart, oldStart);
    }
};

/// Offers, of which the longest is taken first. Those of one length are only put in order when their turn comes, so that a
/// million of them need no heap that fills the memory.
class Offers {
public:
    bool isEmpty() const { return m_byLength.empty(); }

    /// Of an empty offer nothing is kept.
    void add(const Offer& offer)
    {
        if (offer.length == 0)
            return;
        OfLength& equals = m_byLength[offer.length];
        equals.offers.push_back(offer);
        if (equals.isHeap)
            std::push_heap(equals.offers.begin(), equals.offers.end());
    }

    Offer takeLongest()
    {
        const auto longest = m_byLength.begin();
        auto& [offers, isHeap] = longest->second;
        if (!isHeap)
            std::make_heap(offers.begin(), offers.end());
        isHeap = true;
        std::pop_heap(offers.begin(), offers.end());
        const Offer best = offers.back();
        offers.pop_back();
        if (offers.empty())
            m_byLength.erase(longest);
        return best;
    }

private:
    struct OfLength {
        std::vector<Offer> offers;
        bool isHeap = false;
    };

    std::map<std::int32_t, OfLength, std::greater<>> m_byLength;
};

/// Gives the frames of the new programme to those of the old one, one choice after the other.
class Assignment {
public:
    Assignment(const Programme& oldCut, const Programme& newCut)
        : m_oldCut(oldCut), m_newCut(newCut), m_takenOld(oldCut.length()), m_takenNew(newCut.length())
    {
        const SharedPictureSearch search(oldCut);
        for (std::size_t index = 0; index < newCut.runs().size(); ++index) {
            const auto found = search.sharedWith(newCut.runs()[index], index);
            m_shared.insert(m_shared.end(), found.begin(), found.end());
        }
    }

    std::vector<KeptStretch> make()
    {
        for (const SharedPicture& stretch : longestChain(m_shared))
            keep(stretch.oldStart, stretch.newStart, stretch.length, false);
        keepLongest(false);
        keepGapsBesideMoves();
        keepLongest(true);
        return joined();
    }

private:
    void keep(std::int32_t oldStart, std::int32_t newStart, std::int32_t length, bool isDoubled)
    {
        m_takenNew.add(newStart, newStart + length);
        if (!isDoubled)
            m_takenOld.add(oldStart, oldStart + length);
        m_kept.push_back({oldStart, newStart, length, isDoubled});
    }

    /// The longest part of a shared stretch whose frames are free; of length 0 when there is none.
    Offer offerOf(std::size_t index, bool isDoubled) const
    {
        const SharedPicture& shared = m_shared[index];
        const std::int32_t shift = shared.oldStart - shared.newStart;
        Offer longest{0, shared.newStart, shared.oldStart, index};
        for (std::int32_t frame = shared.newStart; frame < shared.newEnd();) {
            const std::int32_t freeInNew = m_takenNew.nextOut(frame, shared.newEnd());
            const std::int32_t free =
                isDoubled ? freeInNew : std::max(freeInNew, m_takenOld.nextOut(frame + shift, shared.oldEnd()) - shift);
            if (free != frame) {
                frame = free;
                continue;
            }
            std::int32_t end = m_takenNew.nextIn(frame, shared.newEnd());
            if (!isDoubled)
                end = m_takenOld.nextIn(frame + shift, end + shift) - shift;
            if (end - frame > longest.length)
                longest = {end - frame, frame, frame + shift, index};
            frame = end;
        }
        return longest;
    }

    /// Keeps the longest free stretch again and again, until nothing is free.
    void keepLongest(bool isDoubled)
    {
        Offers offers;
        for (std::size_t index = 0; index < m_shared.size(); ++index) {
            if (!m_newCut.runs()[m_shared[index].newRun].isGap())
                offers.add(offerOf(index, isDoubled));
        }
        while (!offers.isEmpty()) {
            const Offer best = offers.takeLongest();
            const Offer now = offerOf(best.shared, isDoubled);
            if (now.length == best.length && now.newStart == best.newStart) {
                keep(now.oldStart, now.newStart, now.length, isDoubled);
                offers.add(offerOf(best.shared, isDoubled));
            } else {
                offers.add(now);
            }
        }
    }

    /// A gap that has come along with the shot before or after it.
    void keepGapsBesideMoves()
    {
        std::map<std::int32_t, std::int32_t> oldEnds; // by where they end in the new programme
        std::map<std::int32_t, std::int32_t> oldStarts;
        for (const KeptStretch& kept : m_kept) {
            oldEnds[kept.newEnd()] = kept.oldEnd();
            oldStarts[kept.newStart] = kept.oldStart;
        }
        for (const ShownRun& gap : m_newCut.runs()) {
            if (!gap.isGap())
                continue;
            if (const auto before = oldEnds.find(gap.start); before != oldEnds.end())
                keepGap(gap, before->second);
            if (const auto after = oldStarts.find(gap.end()); after != oldStarts.end())
                keepGap(gap, after->second - gap.length);
        }
    }

    /// Where the same gap stands there in the old programme, and both are free.
    void keepGap(const ShownRun& gap, std::int32_t oldStart)
    {
        if (oldStart < 0 || oldStart >= m_oldCut.length())
            return;
        const ShownRun& old = m_oldCut.runs()[m_oldCut.runAt(oldStart)];
        if (old.isGap() && old.start == oldStart && old.length == gap.length &&
            m_takenNew.nextIn(gap.start, gap.end()) == gap.end() &&
            m_takenOld.nextIn(old.start, old.end()) == old.end())
            keep(oldStart, gap.start, gap.length, false);
    }

    std::vector<KeptStretch> joined()
    {
        std::sort(m_kept.begin(), m_kept.end(),
                  [](const KeptStretch& a, const KeptStretch& b) { return a.newStart < b.newStart; });
        std::vector<KeptStretch> stretches;
        for (std::size_t index = 0; index < m_kept.size(); ++index) {
            const KeptStretch& kept = m_kept[index];
            if (isLongerEnd(index))
                continue;
            if (!stretches.empty() && goesOn(stretches.back(), kept))
                stretches.back().length += kept.length;
            else
                stretches.push_back(kept);
        }
        return stretches;
    }

    /// Whether a doubled stretch only makes a kept shot longer, at its head or its tail.
    bool isLongerEnd(std::size_t index) const
    {
        const KeptStretch& kept = m_kept[index];
        const auto isOfOneShot = [this](const KeptStretch& before, const KeptStretch& after) {
            return before.isDoubled != after.isDoubled && before.newEnd() == after.newStart &&
                   m_newCut.runAt(before.newStart + before.length - 1) == m_newCut.runAt(after.newStart);
        };
        return kept.isDoubled && ((index > 0 && isOfOneShot(m_kept[index - 1], kept)) ||
                                  (index + 1 < m_kept.size() && isOfOneShot(kept, m_kept[index + 1])));
    }

    bool goesOn(const KeptStretch& before, const KeptStretch& kept) const
    {
        return before.isDoubled == kept.isDoubled && before.newEnd() == kept.newStart &&
               before.oldEnd() == kept.oldStart && m_newCut.reelAt(before.newStart) == m_newCut.reelAt(kept.newStart) &&
               m_oldCut.reelAt(before.oldStart) == m_oldCut.reelAt(kept.oldStart);
    }

    const Programme& m_oldCut;
    const Programme& m_newCut;
    std::vector<SharedPicture> m_shared;
    FrameSet m_takenOld;
    FrameSet m_takenNew;
    std::vector<KeptStretch> m_kept;
};

} // namespace

std::vector<KeptStretch> findKeptStretches(const Programme& oldCut, const Programme& newCut)
{
    return Assignment(oldCut, newCut).make();
}

} // namespace cadrel::core
