// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/Node.h"
#include "velmark/Automation.h"

namespace standin {

/// A point of an automation curve.
class AutomationPoint : public Velmark::Implements<AutomationPoint, Node, Velmark::IAutomationPoint> {
public:
    static constexpr const char* ClassName = "AutomationPoint";

    float getValue() override;
    Velmark::int32 setValue(float value) override;

    /// From 0 to 1. Held in double precision, so that a point that is only put where a curve runs doesn't move it.
    double value() const { return m_value; }
    void setValue(double value);

    /// Whether it only holds the curve at the edge of a range that was edited. It goes again as soon as another edit of a
    /// range finds that it changes nothing, which no point that somebody has set does.
    bool isHolding() const { return m_isHolding; }
    void setHolding(bool flag) { m_isHolding = flag; }

protected:
    Extent extent() const override { return Extent::Instant; }

private:
    double exchangeValue(double value);

    double m_value = 0.0;
    bool m_isHolding = false;
};

} // namespace standin
