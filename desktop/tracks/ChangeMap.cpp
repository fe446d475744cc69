// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/ChangeMap.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/edl/ProgrammePlace.h"
#include "core/picture/PictureComparison.h"
#include "core/picture/PictureLine.h"
#include "host/track/CoveredRanges.h"
#include "standin/base/Times.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <numeric>

namespace desktop {

using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::core::Framerate;
using standin::SameInstant;
using Span = ChangeMap::Span;

namespace {

struct Shot {
    Span place;
    bool isBlack;
};

std::vector<Shot> shotsOf(const EventList& cut, const Framerate& framerate, double origin)
{
    std::vector<Shot> shots;
    for (const auto& event : cut.events()) {
        if (cadrel::core::fillsProgramme(*event, framerate))
            shots.push_back(
                {{event->dstIn().toSeconds(framerate) - origin, event->dstOut().toSeconds(framerate) - origin},
                 cadrel::core::isBlack(*event)});
    }
    return shots;
}

std::vector<double> startsOf(const std::vector<Shot>& shots)
{
    std::vector<double> starts;
    for (const Shot& shot : shots)
        starts.push_back(shot.place.start);
    std::ranges::sort(starts);
    starts.erase(std::unique(starts.begin(), starts.end()), starts.end());
    return starts;
}

/// Whether the timecodes exist at the rate, which may be another than that of the lists.
bool hasTimes(const EventBase& event, const Framerate& framerate)
{
    return event.srcIn().isValid(framerate) && event.srcOut().isValid(framerate) && event.dstIn().isValid(framerate) &&
           event.dstOut().isValid(framerate);
}

/// The picture before `first` and after `last` that is the same at the same time in both cuts.
std::vector<Span> unchangedOutside(const EventList& oldCut, const EventList& newCut, cadrel::core::PictureNames& names,
                                   const Framerate& framerate, double origin, double first, double last)
{
    const cadrel::core::PictureLine oldLine(oldCut, names, framerate);
    const cadrel::core::PictureLine newLine(newCut, names, framerate);
    const cadrel::core::PictureComparison comparison(oldLine, newLine);
    std::vector<Span> spans;
    for (const cadrel::core::FrameRange& lit : newLine.lit()) {
        for (const auto& piece : comparison.equalUnder(0, lit)) {
            const Span span{piece.frames.start / framerate.rate - origin, piece.frames.end / framerate.rate - origin};
            if (span.start < first)
                spans.push_back({span.start, std::min(span.end, first)});
            if (span.end > last)
                spans.push_back({std::max(span.start, last), span.end});
        }
    }
    return spans;
}

double overlapOf(const Span& a, const Span& b)
{
    return std::min(a.end, b.end) - std::max(a.start, b.start);
}

} // namespace

ChangeMap::ChangeMap(const EventList& change, const EventList& oldCut, const EventList& newCut,
                     const Framerate& framerate, double origin, State state, cadrel::core::PictureNames names)
    : m_state(state)
{
    for (std::size_t index = 0; index < change.size(); ++index) {
        const EventBase& event = change.at(index);
        if (!event.isValid() || !hasTimes(event, framerate))
            continue;
        const auto span = [&](const auto& in, const auto& out) {
            return Span{in.toSeconds(framerate) - origin, out.toSeconds(framerate) - origin};
        };
        m_stretches.push_back(
            {index, span(event.srcIn(), event.srcOut()), span(event.dstIn(), event.dstOut()), event.isReversed()});
    }
    std::ranges::stable_sort(m_stretches, {}, [](const Stretch& stretch) { return stretch.present.start; });
    m_formerOrder.resize(m_stretches.size());
    std::iota(m_formerOrder.begin(), m_formerOrder.end(), std::size_t{0});
    std::ranges::stable_sort(m_formerOrder, {}, [this](std::size_t at) { return m_stretches[at].former.start; });

    std::vector<Span> present;
    std::vector<Span> former;
    for (std::size_t at = 0; at < m_stretches.size(); ++at) {
        present.push_back(m_stretches[at].present);
        former.push_back(m_stretches[m_formerOrder[at]].former);
    }

    if (m_state == State::Carried) {
        cadrel::host::CoveredRanges covered;
        double first = std::numeric_limits<double>::infinity();
        double last = -first;
        for (const Span& span : present) {
            covered.add({span.start, span.end});
            first = std::min(first, span.start);
            last = std::max(last, span.end);
        }
        for (const Span& span : unchangedOutside(oldCut, newCut, names, framerate, origin, first, last))
            covered.add({span.start, span.end});
        // Two shots in one dissolve overlap: what is new of both is new once.
        for (const auto& [place, isBlack] : shotsOf(newCut, framerate, origin)) {
            if (isBlack)
                continue;
            for (const auto& range : covered.add({place.start, place.end}))
                m_withoutSound.push_back({range.start, range.end});
        }
        std::ranges::sort(m_withoutSound, {}, &Span::start);
    }
    m_oldCuts = startsOf(shotsOf(oldCut, framerate, origin));
    m_newCuts = startsOf(shotsOf(newCut, framerate, origin));
    m_byPresent = SpanIndex(std::move(present));
    m_byFormer = SpanIndex(std::move(former));
}

std::optional<std::size_t> ChangeMap::eventOf(const Span& stretch, State programme) const
{
    const SpanIndex& index = programme == State::Carried ? m_byPresent : m_byFormer;
    std::optional<std::size_t> found;
    double most = -std::numeric_limits<double>::infinity();
    index.visitTouching(stretch.start, stretch.end, [&](std::size_t at) {
        const double overlap = overlapOf(index[at], stretch);
        // What ends where the stretch begins has nothing of it. A stretch without length lies where the next one begins.
        const bool isOutside = index[at].end - stretch.start < SameInstant || overlap <= most;
        if (isOutside)
            return;
        most = overlap;
        found = m_stretches[programme == State::Carried ? at : m_formerOrder[at]].event;
    });
    return found;
}

const ChangeMap::Stretch* ChangeMap::find(std::size_t event) const
{
    const auto found = std::ranges::find(m_stretches, event, &Stretch::event);
    return found == m_stretches.end() ? nullptr : &*found;
}

std::optional<ChangeMap::Move> ChangeMap::moveOf(std::size_t event) const
{
    const Stretch* const found = find(event);
    return found ? std::optional(Move{found->former.start, found->present.start}) : std::nullopt;
}

std::optional<Span> ChangeMap::placeOf(std::size_t event, State programme) const
{
    const Stretch* const found = find(event);
    if (!found)
        return std::nullopt;
    return programme == State::Carried ? found->present : found->former;
}

std::vector<Span> ChangeMap::formerPlaces(const Span& stretch) const
{
    std::vector<Span> places;
    if (m_state != State::Carried)
        return places;
    m_byPresent.visitTouching(stretch.start, stretch.end, [&](std::size_t at) {
        const Span& former = m_stretches[at].former;
        const Span& present = m_stretches[at].present;
        const bool isReversed = m_stretches[at].isReversed;
        const Span piece{std::max(stretch.start, present.start), std::min(stretch.end, present.end)};
        const bool hasLength = stretch.end - stretch.start >= SameInstant;
        if (hasLength ? piece.end - piece.start < SameInstant : present.end - piece.start < SameInstant)
            return;
        const double speed = (former.end - former.start) / (present.end - present.start);
        const auto before = [&](double time) {
            return isReversed ? former.end - (time - present.start) * speed
                              : former.start + (time - present.start) * speed;
        };
        Span place{before(piece.start), before(piece.end)};
        if (isReversed)
            std::swap(place.start, place.end);
        if (std::abs(place.start - piece.start) < SameInstant && std::abs(place.end - piece.end) < SameInstant)
            return;
        // Two events may have carried on what one event was.
        if (!places.empty() && std::abs(places.back().end - place.start) < SameInstant)
            places.back().end = place.end;
        else
            places.push_back(place);
    });
    return places;
}

} // namespace desktop
