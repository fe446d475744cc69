// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/HeldPoint.h"

#include "host/border/HostFailure.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"

#include <bit>
#include <cstdint>

using namespace Velmark;

namespace cadrel::host {

namespace {

int64 bitsOf(float value)
{
    return std::bit_cast<std::uint32_t>(value);
}

} // namespace

Counted<IProjectNode> makePoint(IHostContext* context, IProjectNode& curve, double time, float value)
{
    const auto point = required(create<IAutomationPoint>(context, ClassId::AutomationPoint));
    auto node = required(query<IProjectNode>(point));
    requireOk(point->setValue(value));
    requireOk(node->setStart(&curve, 0, time));
    return node;
}

void markAsHeld(IProjectNode& point, float value)
{
    // The curve is right without the mark, too.
    point.setAttribute(AttributeKey::HeldValue, FVariant::integer(bitsOf(value)), true);
}

bool isHeld(IProjectNode& point, float value)
{
    FVariant held;
    return point.getAttribute(AttributeKey::HeldValue, held) == ResultOk && held.isInteger() &&
           held.asInteger() == bitsOf(value);
}

} // namespace cadrel::host
