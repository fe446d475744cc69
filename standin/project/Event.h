// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Container.h"
#include "velmark/Events.h"

#include <cstdint>
#include <optional>

namespace standin {

/// What lies on a track or in a part: a clip event, a marker, or a part. Only a part has children.
class Event : public Velmark::Implements<Event, Container, Velmark::IEventNode> {
public:
    static constexpr const char* ClassName = "Event";

    /// Answers to the kind of its track.
    bool isType(const char* word) override;
    Velmark::IEventNode* getOwner() override;
    bool accepts(const Node& /*child*/) const override { return false; }
    bool holdsChildren() const override { return false; }

    /// A stretch of the event, in seconds of its container.
    struct Stretch {
        double start;
        double end;
    };
    /// What it has in a range; nothing when it reaches less far in than to another instant (SameInstant). When it is too
    /// short to be cut, all of it is there where it begins.
    std::optional<Stretch> stretchIn(double start, double end) const;
    /// A new event, not inserted: this one cut to `start` to `end`, which are seconds in its container and lie within it. It
    /// stands at `start`. All travels with it: name, attributes, selection, source offset, the content of a part.
    Velmark::Counted<Event> cutOut(double start, double end) const;
    /// Where a piece of an event begins or ends: in its container, and in the event before it was cut, in seconds. The
    /// origin is the same number for all pieces of one event, and for them alone.
    struct Seam {
        std::uint64_t origin;
        double time;
        double offset;
    };
    Seam head() const { return {m_origin, start(), m_originOffset}; }
    Seam tail() const { return {m_origin, end(), m_originOffset + length()}; }
    /// Whether `next`, which has to begin where this one ends, is a piece of the same event and the one that followed in it,
    /// with equal name and attributes.
    bool isContinuedBy(const Event& next) const;
    /// Takes the length and the content of a piece that continues this one, and removes it.
    void join(Event& next);

protected:
    /// An event that was never cut.
    Event();

    Extent extent() const override { return Extent::Stretch; }

    /// A new event of the same class that has what cutOut can't copy: all but name, attributes, selection and span.
    /// `offset` is how far into this event it begins, in seconds.
    virtual Velmark::Counted<Event> makePiece(double offset, double length) const = 0;
    /// Whether the source runs on from the end of this one into `next`, which is of the same class and was a piece of the
    /// same event.
    virtual bool sourceRunsOn(const Event& next) const = 0;
    /// Takes the content of a piece that begins `offset` seconds after this event's start; called before `next` is
    /// removed.
    virtual void takeContent(Event& next, double offset);

private:
    // What all pieces of one event have in common, and how far into that event this piece begins. It isn't stored with the
    // project: after loading, each event is one.
    std::uint64_t m_origin;
    double m_originOffset = 0.0;
};

} // namespace standin
