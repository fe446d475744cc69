// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Envelope.h"

using namespace Velmark;

namespace standin {

namespace {

const AutomationPoint* asPoint(const Node* node)
{
    return static_cast<const AutomationPoint*>(node);
}

/// The value at a time between two points, or beside the one that there is.
std::optional<double> valueBetween(const AutomationPoint* left, const AutomationPoint* right, double time)
{
    if (!left || !right) {
        const AutomationPoint* const only = left ? left : right;
        return only ? std::optional(only->value()) : std::nullopt;
    }
    const double share = (time - left->start()) / (right->start() - left->start());
    return left->value() + (right->value() - left->value()) * share;
}

} // namespace

std::string_view Envelope::Curve::nameOf(int32 number)
{
    switch (number) {
    case Volume:
        return "volume";
    case Pan:
        return "pan";
    case Mute:
        return "mute";
    case Send:
        return "send";
    case Filter:
        return "filter";
    case Equalizer:
        return "equalizer";
    default:
        return {};
    }
}

Envelope::Envelope(Node& track, int32 number) : m_track(&track), m_number(number) {}

int32 Envelope::curveNumber()
{
    return m_number;
}

IProjectNode* Envelope::getParent()
{
    return m_track;
}

ProjectLink* Envelope::link() const
{
    return m_track ? m_track->link() : nullptr;
}

Node* Envelope::track()
{
    return m_track;
}

bool Envelope::accepts(const Node& child) const
{
    return dynamic_cast<const AutomationPoint*>(&child) != nullptr;
}

AutomationPoint* Envelope::pointBehind(const AutomationPoint& point) const
{
    return static_cast<AutomationPoint*>(childBehind(point));
}

std::optional<double> Envelope::valueBefore(double time) const
{
    const AutomationPoint* const right = asPoint(firstChildFrom(time));
    if (right && right->start() == time)
        return right->value();
    return valueBetween(asPoint(right ? childBefore(*right) : lastChild()), right, time);
}

std::optional<double> Envelope::valueBehind(double time) const
{
    const AutomationPoint* const right = asPoint(firstChildAfter(time));
    const AutomationPoint* const left = asPoint(right ? childBefore(*right) : lastChild());
    if (left && left->start() == time)
        return left->value();
    return valueBetween(left, right, time);
}

} // namespace standin
