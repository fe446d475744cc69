// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Event.h"

#include <algorithm>
#include <cmath>
#include <string_view>
#include <typeinfo>

using namespace Velmark;

namespace standin {

namespace {

std::uint64_t nextOrigin()
{
    static std::uint64_t last = 0;
    return ++last;
}

} // namespace

Event::Event() : m_origin(nextOrigin()) {}

bool Event::isType(const char* word)
{
    Node* const track = this->track();
    return word && std::string_view(word) != TypeWord::Track && track && track->isType(word);
}

IEventNode* Event::getOwner()
{
    return dynamic_cast<Event*>(parent());
}

std::optional<Event::Stretch> Event::stretchIn(double start, double end) const
{
    if (length() < 2.0 * SameInstant) {
        const bool begins = this->start() > start - SameInstant && this->start() <= end - SameInstant;
        return begins ? std::optional(Stretch{this->start(), this->end()}) : std::nullopt;
    }
    const Stretch common{std::max(this->start(), start), std::min(this->end(), end)};
    return common.end - common.start >= SameInstant ? std::optional(common) : std::nullopt;
}

Counted<Event> Event::cutOut(double start, double end) const
{
    const double offset = start - this->start();
    Counted<Event> piece = makePiece(offset, end - start);
    piece->m_origin = m_origin;
    piece->m_originOffset = m_originOffset + offset;
    piece->setSpan(start, end);
    piece->setName(name());
    for (const auto& [key, attribute] : attributes())
        piece->setAttribute(key, attribute);
    piece->setSelected(selected());
    piece->setUnknownMembers(unknownMembers());
    return piece;
}

bool Event::isContinuedBy(const Event& next) const
{
    const auto isSame = [](double a, double b) { return std::abs(a - b) < SameInstant; };
    const Seam end = tail();
    const Seam begin = next.head();
    return end.origin == begin.origin && typeid(*this) == typeid(next) && isSame(end.time, begin.time) &&
           isSame(end.offset, begin.offset) && name() == next.name() && attributes() == next.attributes() &&
           sourceRunsOn(next);
}

void Event::join(Event& next)
{
    const double end = next.end();
    takeContent(next, next.start() - start());
    next.remove();
    setSpan(start(), end);
}

void Event::takeContent(Event& /*next*/, double /*offset*/) {}

} // namespace standin
