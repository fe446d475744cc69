// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Event.h"

namespace standin {

/// A group of events on a track, which moves and is cut as one. It may hold parts, too.
class Part : public Velmark::Implements<Part, Event> {
public:
    static constexpr const char* ClassName = "Part";

    bool isType(const char* word) override;
    bool accepts(const Node& child) const override;
    bool holdsChildren() const override { return true; }

protected:
    /// With the content cut as the part is.
    Velmark::Counted<Event> makePiece(double offset, double length) const override;
    bool sourceRunsOn(const Event& next) const override;
    void takeContent(Event& next, double offset) override;
};

} // namespace standin
