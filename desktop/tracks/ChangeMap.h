// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/PictureNames.h"
#include "core/settings/MatchBy.h"
#include "desktop/tracks/SpanIndex.h"

#include <cstddef>
#include <optional>
#include <vector>

namespace cadrel::core {
class EventList;
struct Framerate;
} // namespace cadrel::core

namespace desktop {

/// Where the stretches of a programme stood before its picture was recut, and where they are now. In seconds of the project.
class ChangeMap {
public:
    /// Whether the tracks still fit the old cut, or the new one already.
    enum class State { Planned, Carried };

    ChangeMap() = default;
    /// The events of the change EDL and of both cuts. Events that aren't valid, or not at this rate, are left out. `names` tells by
    /// what the same picture is known. `origin` is what the clock of the project shows at its time 0.
    ChangeMap(const cadrel::core::EventList& change, const cadrel::core::EventList& oldCut,
              const cadrel::core::EventList& newCut, const cadrel::core::Framerate& framerate, double origin,
              State state, cadrel::core::PictureNames names = {cadrel::core::MatchBy::RollName, {}});

    bool isEmpty() const { return m_stretches.empty(); }
    State state() const { return m_state; }

    using Span = SpanIndex::Span;

    /// The event that moves most of a stretch of the old programme (Planned), or has moved it to there in the new one (Carried):
    /// its index in the change EDL.
    std::optional<std::size_t> eventOf(const Span& stretch, State programme) const;
    /// From where to where an event takes the beginning of its stretch. Nothing for one that isn't valid.
    struct Move {
        double source;
        double destination;

        bool operator==(const Move&) const = default;
    };
    std::optional<Move> moveOf(std::size_t event) const;
    /// Where an event puts its stretch. Nothing for one that isn't valid.
    std::optional<Span> placeOf(std::size_t event) const { return placeOf(event, m_state); }
    /// Where its stretch stands in the old programme (Planned) or in the new one.
    std::optional<Span> placeOf(std::size_t event, State programme) const;
    /// Where the pieces of a stretch stood that the change has moved, in the order of the new programme. Empty while nothing
    /// was carried over.
    std::vector<Span> formerPlaces(const Span& stretch) const;
    /// The new picture, black aside, that no event brings sound for, in order and without overlaps. Before the first event and
    /// after the last one the sound hasn't been touched, so that picture which is the same there isn't new. Empty while nothing
    /// was carried over.
    const std::vector<Span>& withoutSound() const { return m_withoutSound; }
    /// Where the shots of the old (Planned) or of the new cut begin, in order.
    const std::vector<double>& cuts(State programme) const
    {
        return programme == State::Carried ? m_newCuts : m_oldCuts;
    }

private:
    struct Stretch {
        std::size_t event;
        Span former;
        Span present;
        bool isReversed;
    };

    const Stretch* find(std::size_t event) const;

    State m_state = State::Planned;
    std::vector<Stretch> m_stretches;       ///< in the order of their present places
    std::vector<std::size_t> m_formerOrder; ///< their indexes in the order of their former places
    SpanIndex m_byPresent;
    SpanIndex m_byFormer;
    std::vector<Span> m_withoutSound;
    std::vector<double> m_oldCuts;
    std::vector<double> m_newCuts;
};

} // namespace desktop
