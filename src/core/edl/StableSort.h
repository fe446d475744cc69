// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <algorithm>

namespace cadrel::core {

/// Sorts what is mostly in order already. Equal elements keep their order.
template <typename Range, typename Less>
void sortStably(Range& range, Less less)
{
    if (!std::is_sorted(range.begin(), range.end(), less))
        std::stable_sort(range.begin(), range.end(), less);
}

} // namespace cadrel::core
