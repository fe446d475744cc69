// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/keep/PastRuns.h"

#include "core/change/ChangeEdlGenerator.h"
#include "core/edl/EventBase.h"
#include "core/keep/ChangeStretch.h"
#include "core/picture/PictureComparison.h"
#include "core/picture/PictureLine.h"
#include "core/picture/PictureNames.h"
#include "core/picture/Reels.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

/// The stretches of a change EDL, in order; those that go on alike are one.
std::vector<ChangeStretch> stretchesOf(const EventList& changes, const Framerate& framerate)
{
    std::vector<ChangeStretch> joined;
    for (const ChangeStretch& stretch : unhealedStretches(changes, framerate)) {
        const bool goesOn = !joined.empty() && joined.back().shift == stretch.shift &&
                            joined.back().destination.end == stretch.destination.start;
        if (goesOn)
            joined.back().destination.end = stretch.destination.end;
        else
            joined.push_back(stretch);
    }
    return joined;
}

bool isSame(const ChangeStretch& a, const ChangeStretch& b)
{
    return a.destination == b.destination && a.shift == b.shift;
}

FrameRanges hullOf(const EventList& changes, const Framerate& framerate)
{
    FrameRanges all;
    for (const ChangeStretch& stretch : stretchesOf(changes, framerate)) {
        all.push_back(stretch.source());
        all.push_back(stretch.destination);
    }
    all = united(std::move(all));
    if (all.empty())
        return {};
    return {{all.front().start, all.back().end}};
}

FrameRanges both(FrameRanges a, const FrameRanges& b)
{
    a.insert(a.end(), b.begin(), b.end());
    return united(std::move(a));
}

using SharedEvents = std::shared_ptr<const EventList>;

SharedEvents readEvents(ByteArchive& archive)
{
    const auto events = std::make_shared<EventList>();
    archive >> *events;
    return events;
}

/// The events as a project stores them, which keeps neither comments, and so not the text of what can't be read, nor whether a
/// shot runs backwards.
SharedEvents asStored(const EventList& events)
{
    ByteArchive archive;
    archive << events;
    return readEvents(archive);
}

/// The same for comparing pictures. The events that a project stores with all that makes up their picture are shared.
SharedEvents comparableTo(const EventList& events)
{
    const auto isStoredWhole = [](const EventBase& event) { return event.isValid() && !event.isReversed(); };
    EventList others;
    for (const auto& event : events.events()) {
        if (!isStoredWhole(*event))
            others.add(event);
    }
    const SharedEvents stored = asStored(others);
    std::vector<std::shared_ptr<EventBase>> all = events.events();
    auto next = stored->events().begin();
    for (std::shared_ptr<EventBase>& event : all) {
        if (!isStoredWhole(*event))
            event = *next++;
    }
    const auto comparable = std::make_shared<EventList>();
    comparable->append(std::move(all));
    return comparable;
}

FrameRanges reelsOf(const FrameRanges& lit, const Framerate& framerate)
{
    return joinedWithin(partingGap(framerate), lit);
}

/// The first frame of a reel at which `standing` and `given` differ, if the given cut is the one that the run began with.
/// `began` is called for that one only where they do.
template <class Began>
std::optional<std::int32_t> differenceOfRepeatedRun(const Began& began, const PictureLine& standing,
                                                    const PictureLine& given, const FrameRange& reel)
{
    const FrameRanges differences = PictureComparison(standing, given).differencesUnder(0, reel);
    if (differences.empty() || within(reel, given.lit()).empty())
        return std::nullopt;
    const bool isGivenAgain = PictureComparison(began(), given).differencesUnder(0, reel).empty();
    return isGivenAgain ? std::optional(differences.front().start) : std::nullopt;
}

FrameRanges common(const FrameRanges& a, const FrameRanges& b)
{
    return without(a, without(a, b));
}

std::optional<std::int32_t> firstDifferenceIn(const FrameRanges& ranges, const PictureLine& standing,
                                              const PictureLine& given)
{
    const PictureComparison comparison(standing, given);
    for (const FrameRange& range : ranges) {
        const FrameRanges differences = comparison.differencesUnder(0, range);
        if (!differences.empty())
            return differences.front().start;
    }
    return std::nullopt;
}

/// What the bytes begin with: that they are of this class, and how they are written.
constexpr std::uint32_t BytesVersion = 0x52550001;

} // namespace

void PastRuns::add(const EventList& oldCut, const EventList& newCut, const EventList& changes,
                   const FrameRange& allowed)
{
    Run run = runOf(asStored(oldCut), asStored(newCut), asStored(changes), allowed);
    if (!run.isOfCuts() && run.changes->isEmpty())
        return;
    forgetWithin(run.extent);
    m_runs.push_back(std::move(run));
}

void PastRuns::forgetWithin(const FrameRanges& extent)
{
    std::erase_if(m_runs, [&extent](const Run& run) { return without(run.left, extent).empty(); });
}

PastRuns::Run PastRuns::runOf(SharedEvents oldCut, SharedEvents newCut, SharedEvents changes,
                              const FrameRange& allowed) const
{
    const Framerate& framerate = m_context.framerate;
    Run run{std::move(oldCut), std::move(newCut), std::move(changes), allowed, {}, {}};
    if (!run.isOfCuts()) {
        run.extent = within(allowed, hullOf(*run.changes, framerate));
        run.left = run.extent;
        return run;
    }
    // The cuts make their changes.
    run.changes = std::make_shared<EventList>();
    const FrameRanges oldLit = litFrames(*run.oldCut, framerate);
    const FrameRanges newLit = litFrames(*run.newCut, framerate);
    run.extent = within(allowed, reelsOf(both(oldLit, newLit), framerate));
    run.left = both(within(allowed, reelsOf(newLit, framerate)), without(reelsOf(oldLit, framerate), {allowed}));
    if (run.left.empty())
        run.left = run.extent;
    return run;
}

std::optional<std::int32_t> PastRuns::firstDifference(const EventList& oldCut, const FrameRanges& asked) const
{
    const Framerate& framerate = m_context.framerate;
    PictureNames names(m_context.matchBy, m_context.vfxPatterns);
    const PictureLine given(*comparableTo(oldCut), names, framerate);
    const FrameRanges givenReels = common(reelsOf(given.lit(), framerate), asked);
    FrameRanges hidden;
    for (auto run = m_runs.rbegin(); run != m_runs.rend(); ++run) {
        if (run->isOfCuts()) {
            std::optional<PictureLine> oldLine;
            // Mostly nobody asks for it.
            const auto began = [&]() -> const PictureLine& {
                return oldLine ? *oldLine : oldLine.emplace(*run->oldCut, names, framerate);
            };
            const PictureLine standing(*run->newCut, names, framerate);
            const FrameRanges changed = common(within(run->allowed, reelsOf(standing.lit(), framerate)), givenReels);
            const FrameRanges unchanged =
                run->allowed == AllTime
                    ? FrameRanges()
                    : common(without(reelsOf(began().lit(), framerate), {run->allowed}), givenReels);
            if (const auto difference = firstDifferenceIn(without(changed, hidden), standing, given))
                return difference;
            // Where a run could change nothing, an earlier one may have.
            FrameRanges elsewhere = hidden;
            for (auto earlier = std::next(run); earlier != m_runs.rend(); ++earlier)
                elsewhere = both(std::move(elsewhere), earlier->extent);
            if (const auto difference =
                    unchanged.empty() ? std::nullopt : firstDifferenceIn(without(unchanged, elsewhere), began(), given))
                return difference;
            for (const FrameRange& reel : common(without(run->extent, hidden), asked)) {
                if (const auto difference = differenceOfRepeatedRun(began, standing, given, reel))
                    return difference;
            }
        }
        hidden = both(std::move(hidden), run->extent);
    }
    return std::nullopt;
}

std::vector<ChangeStretch> PastRuns::stretchesOf(const Run& run) const
{
    if (!run.isOfCuts())
        return core::stretchesOf(*run.changes, m_context.framerate);
    EventList changes;
    try {
        ChangeEdlGenerator generator;
        configure(generator);
        generator.generate(*run.oldCut, *run.newCut, changes);
    } catch (Result::Type) {
        changes.clear();
    }
    return core::stretchesOf(changes, m_context.framerate);
}

/// Versions of VFX shots are different shots where the patterns can't be used.
void PastRuns::configure(ChangeEdlGenerator& generator) const
{
    try {
        generator.configure(m_context.matchBy, m_context.vfxPatterns);
    } catch (Result::Type) {
        generator.configure(m_context.matchBy, {});
    }
}

bool PastRuns::haveCarriedOut(const EventList& changes, bool isGiven, const FrameRange& allowed) const
{
    const std::vector<ChangeStretch> stretches = core::stretchesOf(changes, m_context.framerate);
    const FrameRanges hull = within(allowed, hullOf(changes, m_context.framerate));
    const bool movesAnything = std::any_of(stretches.begin(), stretches.end(),
                                           [](const ChangeStretch& stretch) { return stretch.shift != 0; });
    if (!movesAnything)
        return false;
    FrameRanges hidden;
    for (auto run = m_runs.rbegin(); run != m_runs.rend() && without(hull, hidden) == hull; ++run) {
        const bool isComparable = (isGiven || !run->isOfCuts()) && !within(allowed, run->extent).empty();
        const std::vector<ChangeStretch> others = isComparable ? stretchesOf(*run) : std::vector<ChangeStretch>();
        if (std::equal(stretches.begin(), stretches.end(), others.begin(), others.end(), isSame))
            return true;
        hidden = both(std::move(hidden), run->extent);
    }
    return false;
}

std::string PastRuns::toBytes() const
{
    ByteArchive archive;
    archive << BytesVersion;
    archive.writeCount(m_runs.size());
    for (const Run& run : m_runs)
        archive << *run.oldCut << *run.newCut << *run.changes << run.allowed.start << run.allowed.end;
    return {archive.data(), archive.data() + archive.size()};
}

bool PastRuns::read(const std::string& bytes)
{
    ByteArchive archive;
    archive.assign(reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size());
    m_runs.clear();
    try {
        std::uint32_t version = 0;
        archive >> version;
        if (version != BytesVersion)
            return false;
        for (std::size_t count = archive.readCount(); count > 0; --count) {
            SharedEvents oldCut = readEvents(archive);
            SharedEvents newCut = readEvents(archive);
            SharedEvents changes = readEvents(archive);
            FrameRange allowed;
            archive >> allowed.start >> allowed.end;
            m_runs.push_back(runOf(std::move(oldCut), std::move(newCut), std::move(changes), allowed));
        }
    } catch (Result::Type) {
        m_runs.clear();
        return false;
    }
    return true;
}

} // namespace cadrel::core
