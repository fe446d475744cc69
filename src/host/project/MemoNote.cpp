// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoNote.h"

#include <algorithm>

namespace cadrel::host {

MemoBehind MemoBehind::laterThan(const MemoBehind& last, MemoBehind now)
{
    const auto isNew = [&last](const MemoState& copy, bool EditedSides::*side) {
        return std::ranges::all_of(last.copies,
                                   [&](const MemoState& other) { return differencesOf(copy, other).*side; });
    };
    const auto isEdited = [&](bool EditedSides::*side) {
        return !(differencesOf(now.memo, last.memo).*side) &&
               std::ranges::any_of(now.copies, [&](const MemoState& copy) { return isNew(copy, side); });
    };
    if (!isEdited(&EditedSides::name))
        now.before.name = last.before.name;
    if (!isEdited(&EditedSides::place)) {
        now.before.start = last.before.start;
        now.before.end = last.before.end;
    }
    return now;
}

const MemoNote::Copies* MemoNote::copiesIn(const ShownStretch& shown) const
{
    static const Copies NoCopies;
    const auto ofEvent = remembered.find(shown.event);
    if (ofEvent == remembered.end())
        return nullptr;
    const auto ofPiece = ofEvent->second.find(shown.piece);
    return ofPiece != ofEvent->second.end() ? &ofPiece->second : &NoCopies;
}

} // namespace cadrel::host
