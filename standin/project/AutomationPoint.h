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

protected:
    Extent extent() const override { return Extent::Instant; }

private:
    double exchangeValue(double value);

    double m_value = 0.0;
};

} // namespace standin
