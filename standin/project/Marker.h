// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Event.h"

namespace standin {

/// A marker at an instant or over a range. Its kind is chosen when it is made; a range marker may have no length.
class Marker : public Velmark::Implements<Marker, Event> {
public:
    static constexpr const char* ClassName = "Marker";

    explicit Marker(bool isRange) : m_isRange(isRange) {}

    bool isType(const char* word) override;
    bool isRange() const { return m_isRange; }

protected:
    Extent extent() const override { return m_isRange ? Extent::Stretch : Extent::Instant; }
    Velmark::Counted<Event> makePiece(double offset, double length) const override;
    bool sourceRunsOn(const Event& next) const override;

private:
    bool m_isRange;
};

} // namespace standin
