// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/AutomationPoint.h"

namespace cadrel::host::tests {

/// A point of a host whose points have no attributes.
class UnmarkedPoint : public standin::AutomationPoint {
public:
    using AutomationPoint::setAttribute;

    Velmark::int32 setAttribute(const char*, const Velmark::FVariant&, bool) override { return Velmark::ResultFalse; }
    Velmark::int32 removeAttribute(const char*) override { return Velmark::ResultFalse; }
};

} // namespace cadrel::host::tests
