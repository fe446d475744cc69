// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Part.h"

#include "standin/project/ClipEvent.h"
#include "standin/project/Seams.h"

#include <algorithm>
#include <limits>
#include <string_view>

using namespace Velmark;

namespace standin {

bool Part::isType(const char* word)
{
    return word && (std::string_view(word) == TypeWord::Part || Event::isType(word));
}

bool Part::accepts(const Node& child) const
{
    for (const Container* around = this; around; around = around->parent()) {
        if (around == &child)
            return false;
    }
    return dynamic_cast<const ClipEvent*>(&child) || dynamic_cast<const Part*>(&child);
}

//     this part   |-- a --|------ b ------|--- c ---|
//     the piece        |-a|------ b ------|- c-|             from `offset`, `length` long
Counted<Event> Part::makePiece(double offset, double length) const
{
    auto piece = makeCounted<Part>();
    // When the end of a part is moved, what is after it is heard again. So the last piece keeps all of it.
    const bool isLast = offset + length > this->length() - SameInstant;
    const double end = isLast ? std::numeric_limits<double>::infinity() : offset + length;
    visitTouching(offset - SameInstant, end, [&](const Node& child) {
        const auto& event = static_cast<const Event&>(child);
        const std::optional<Stretch> stretch = event.stretchIn(offset, end);
        if (!stretch)
            return;
        const Counted<Event> cut = event.cutOut(stretch->start, stretch->end);
        const double start = std::max(stretch->start - offset, 0.0);
        cut->setSpan(start, std::max(stretch->end - offset, start));
        cut->insertInto(*piece);
    });
    return piece;
}

bool Part::sourceRunsOn(const Event& /*next*/) const
{
    return true;
}

void Part::takeContent(Event& next, double offset)
{
    Seams ends;
    visitTouching(offset - SameInstant, offset + SameInstant, [&](Node& child) {
        auto& event = static_cast<Event&>(child);
        ends.add(event.tail(), event);
    });
    while (Node* const child = next.firstChild()) {
        auto& event = static_cast<Event&>(*child);
        event.insertInto(*this);
        event.setSpan(offset + event.start(), offset + event.end());
        Event* const before = ends.take(event.head(), [&](const Event& end) { return end.isContinuedBy(event); });
        if (!before)
            continue;
        before->join(event);
        ends.add(before->tail(), *before);
    }
}

} // namespace standin
