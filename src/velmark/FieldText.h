// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <algorithm>
#include <cstddef>
#include <string_view>

namespace Velmark {

/// Puts a text into a field of a record, up to its first zero. A text that fills the field is cut so that the field ends
/// with a zero; the rest of the field is zero.
template <class Unit, std::size_t Size>
void putText(std::basic_string_view<Unit> text, Unit (&field)[Size])
{
    static_assert(Size > 0);
    text = text.substr(0, std::min(text.find(Unit{}), Size - 1));
    Unit* const end = std::copy(text.begin(), text.end(), field);
    std::fill(end, field + Size, Unit{});
}

/// The text of a field, which may lack its zero.
template <class Unit, std::size_t Size>
std::basic_string_view<Unit> textOf(const Unit (&field)[Size])
{
    return {field, static_cast<std::size_t>(std::find(field, field + Size, Unit{}) - field)};
}

} // namespace Velmark
