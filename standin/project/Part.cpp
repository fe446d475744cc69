#include "standin/project/Part.h"

#include "standin/project/ClipEvent.h"

#include <algorithm>
#include <string_view>
#include <vector>

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
    const double end = offset + length;
    visitTouching(offset, end, [&](const Node& child) {
        const double from = std::max(child.start(), offset);
        const double to = std::min(child.end(), end);
        // What only touches the edges, or reaches less far in than to another instant, stays behind; but an event without a
        // length is there where it begins.
        if (child.length() > 0.0 ? to - from < SameInstant : child.start() >= end)
            return;
        const Counted<Event> part = static_cast<const Event&>(child).cutOut(from, to);
        part->setSpan(from - offset, to - offset);
        part->insertInto(*piece);
    });
    return piece;
}

bool Part::sourceRunsOn(const Event& /*next*/) const
{
    return true;
}

void Part::takeContent(Event& next, double offset)
{
    std::vector<Event*> ends;
    visitTouching(offset - SameInstant, offset + SameInstant,
                  [&](Node& child) { ends.push_back(static_cast<Event*>(&child)); });
    while (Node* const child = next.firstChild()) {
        auto& event = static_cast<Event&>(*child);
        event.insertInto(*this);
        event.setSpan(offset + event.start(), offset + event.end());
        const auto before =
            std::find_if(ends.begin(), ends.end(), [&](const Event* end) { return end->isContinuedBy(event); });
        if (before != ends.end())
            (*before)->join(event);
    }
}

} // namespace standin
