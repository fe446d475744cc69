// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/notes/SharedChain.h"

#include "core/notes/PrefixTrees.h"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <limits>
#include <span>
#include <utility>

namespace cadrel::core {

namespace {

constexpr std::size_t None = std::numeric_limits<std::size_t>::max();
/// Of the uses of one old run so many are looked at for an overlap.
constexpr std::size_t MostUsesLookedAt = 32;

/// The worth of a chain, and its last stretch. A frame is worth more than all the ends that there can be.
struct Chain {
    static constexpr std::int64_t FrameWorth = std::int64_t{1} << 24;
    static constexpr std::int64_t EndWorth = -1;

    std::int64_t worth = 0;
    std::size_t last = None;

    bool operator<(const Chain& other) const { return worth < other.worth; }
};

/// The frames of the old programme where stretches end, each counted once.
class OldEnds {
public:
    explicit OldEnds(const std::vector<SharedPicture>& shared)
    {
        std::int32_t last = 0;
        for (const SharedPicture& stretch : shared)
            last = std::max(last, stretch.oldEnd());
        m_words.resize(wordOf(last) + 1);
        for (const SharedPicture& stretch : shared)
            m_words[wordOf(stretch.oldEnd())].ends |= bitOf(stretch.oldEnd());
        for (Word& word : m_words) {
            word.before = m_count;
            m_count += static_cast<std::size_t>(std::popcount(word.ends));
        }
    }

    std::size_t count() const { return m_count; }
    /// How many stand at the frame or before it.
    std::size_t countUpTo(std::int32_t frame) const
    {
        const Word& word = m_words[wordOf(frame)];
        const std::uint64_t upToFrame = bitOf(frame) | (bitOf(frame) - 1);
        return word.before + static_cast<std::size_t>(std::popcount(word.ends & upToFrame));
    }

private:
    struct Word {
        std::uint64_t ends = 0; ///< of 64 frames, a bit each
        std::size_t before = 0; ///< in the words before
    };

    static std::size_t wordOf(std::int32_t frame) { return static_cast<std::size_t>(frame) / 64; }
    static std::uint64_t bitOf(std::int32_t frame) { return std::uint64_t{1} << static_cast<std::size_t>(frame) % 64; }

    std::vector<Word> m_words;
    std::size_t m_count = 0;
};

/// What of an old run a stretch uses.
struct Use {
    std::int32_t oldStart;
    std::int32_t oldEnd;
    std::size_t index; ///< of the stretch
};

/// The last uses of each old run. They are small and lie together in memory, as they are looked at over and over.
class LastUses {
public:
    explicit LastUses(const std::vector<SharedPicture>& shared)
    {
        std::size_t runs = 0;
        for (const SharedPicture& stretch : shared)
            runs = std::max(runs, stretch.oldRun + 1);
        m_ofRuns.resize(runs);
    }

    std::span<const Use> of(std::size_t oldRun) const { return m_ofRuns[oldRun].uses; }
    void add(const SharedPicture& stretch, std::size_t index)
    {
        OfRun& run = m_ofRuns[stretch.oldRun];
        if (run.uses.size() < MostUsesLookedAt)
            run.uses.push_back({stretch.oldStart, stretch.oldEnd(), index});
        else
            run.uses[run.next++ % MostUsesLookedAt] = {stretch.oldStart, stretch.oldEnd(), index};
    }

private:
    struct OfRun {
        std::vector<Use> uses;
        std::size_t next = 0; ///< the oldest one, once there are as many as there may be
    };

    std::vector<OfRun> m_ofRuns;
};

class ChainSearch {
public:
    explicit ChainSearch(const std::vector<SharedPicture>& shared)
        : m_shared(shared), m_chains(shared.size()), m_before(shared.size(), None), m_oldEnds(shared),
          m_byOldEnd(m_oldEnds.count(), Chain()), m_uses(shared)
    {
    }

    std::vector<SharedPicture> find()
    {
        for (std::size_t first = 0; first < m_shared.size();) {
            std::size_t end = first;
            while (end < m_shared.size() && m_shared[end].newRun == m_shared[first].newRun)
                ++end;
            for (std::size_t index = first; index < end; ++index)
                chainUp(index, first);
            for (std::size_t index = first; index < end; ++index)
                enter(index);
            m_lastRun = {first, end};
            first = end;
        }
        return take();
    }

private:
    /// Stretches one after the other.
    struct Range {
        std::size_t first = 0;
        std::size_t end = 0;
    };

    /// `firstOfRun`: the first stretch of the same new run.
    void chainUp(std::size_t index, std::size_t firstOfRun)
    {
        const SharedPicture& stretch = m_shared[index];
        Chain best = m_byOldEnd.ofFirst(m_oldEnds.countUpTo(stretch.oldStart));
        best.worth += Chain::EndWorth;
        const auto consider = [&](const SharedPicture& earlier, std::size_t before) {
            if (earlier.oldStart >= stretch.oldStart || earlier.newStart >= stretch.newStart ||
                earlier.oldEnd() >= stretch.oldEnd() || earlier.newEnd() >= stretch.newEnd())
                return;
            const std::int32_t overlap =
                std::max({0, earlier.oldEnd() - stretch.oldStart, earlier.newEnd() - stretch.newStart});
            const bool goesOn = earlier.oldEnd() == stretch.oldStart && earlier.newEnd() == stretch.newStart;
            const Chain chain{m_chains[before].worth - overlap * Chain::FrameWorth + (goesOn ? 0 : Chain::EndWorth),
                              before};
            if (overlap < stretch.length && best < chain)
                best = chain;
        };
        // What is joined on without an end between stands in the run just before, as runs follow each other.
        for (std::size_t before = m_lastRun.first; before < m_lastRun.end; ++before) {
            if (m_shared[before].oldEnd() == stretch.oldStart && m_shared[before].newEnd() == stretch.newStart)
                consider(m_shared[before], before);
        }
        for (std::size_t before = firstOfRun; before < index; ++before)
            consider(m_shared[before], before);
        // Those that end where this one starts, or before it, have been asked for by their ends.
        for (const Use& use : m_uses.of(stretch.oldRun)) {
            if (use.oldStart < stretch.oldStart && stretch.oldStart < use.oldEnd && use.oldEnd < stretch.oldEnd())
                consider(m_shared[use.index], use.index);
        }
        m_before[index] = best.last;
        m_chains[index] = {best.worth + stretch.length * Chain::FrameWorth, index};
    }

    void enter(std::size_t index)
    {
        const SharedPicture& stretch = m_shared[index];
        m_byOldEnd.raise(m_oldEnds.countUpTo(stretch.oldEnd()) - 1, m_chains[index]);
        m_uses.add(stretch, index);
    }

    std::vector<SharedPicture> take() const
    {
        Chain best;
        for (const Chain& chain : m_chains) {
            if (best < chain)
                best = chain;
        }
        std::vector<SharedPicture> chain;
        for (std::size_t index = best.last; index != None; index = m_before[index])
            chain.push_back(m_shared[index]);
        std::reverse(chain.begin(), chain.end());
        for (std::size_t index = 1; index < chain.size(); ++index) {
            const SharedPicture& before = chain[index - 1];
            SharedPicture& stretch = chain[index];
            const std::int32_t overlap =
                std::max({0, before.oldEnd() - stretch.oldStart, before.newEnd() - stretch.newStart});
            stretch.oldStart += overlap;
            stretch.newStart += overlap;
            stretch.length -= overlap;
        }
        return chain;
    }

    const std::vector<SharedPicture>& m_shared;
    std::vector<Chain> m_chains;       ///< the best that ends with each stretch
    std::vector<std::size_t> m_before; ///< the stretch before it in that chain
    const OldEnds m_oldEnds;
    PrefixMaximum<Chain> m_byOldEnd;
    LastUses m_uses;
    Range m_lastRun; ///< of the new run before that in hand
};

} // namespace

std::vector<SharedPicture> longestChain(const std::vector<SharedPicture>& shared)
{
    return ChainSearch(shared).find();
}

} // namespace cadrel::core
