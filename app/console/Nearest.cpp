// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Nearest.h"

#include <algorithm>
#include <cstddef>

namespace cadrel::app {

namespace {

constexpr std::size_t MostSlips = 2;

/// How many letters have to be added, removed, replaced or exchanged with the next one to make one word of the other.
std::size_t slipsBetween(const std::string& a, const std::string& b)
{
    std::vector<std::vector<std::size_t>> slips(a.size() + 1, std::vector<std::size_t>(b.size() + 1));
    for (std::size_t i = 0; i <= a.size(); ++i) {
        for (std::size_t j = 0; j <= b.size(); ++j) {
            if (i == 0 || j == 0) {
                slips[i][j] = i + j;
                continue;
            }
            const std::size_t other = a[i - 1] == b[j - 1] ? 0 : 1;
            slips[i][j] = std::min({slips[i - 1][j] + 1, slips[i][j - 1] + 1, slips[i - 1][j - 1] + other});
            if (i > 1 && j > 1 && a[i - 1] == b[j - 2] && a[i - 2] == b[j - 1])
                slips[i][j] = std::min(slips[i][j], slips[i - 2][j - 2] + 1);
        }
    }
    return slips[a.size()][b.size()];
}

} // namespace

std::string nearestWord(const std::string& typed, const std::vector<std::string>& words)
{
    std::string nearest;
    std::size_t fewest = MostSlips + 1;
    for (const std::string& word : words) {
        // Words of very different length aren't compared, since the user may have typed a whole file there.
        const std::size_t longer = std::max(word.size(), typed.size());
        if (longer - std::min(word.size(), typed.size()) > MostSlips)
            continue;
        const std::size_t slips = slipsBetween(typed, word);
        // Of a short word something has to be left.
        if (slips < fewest && 2 * slips < longer) {
            fewest = slips;
            nearest = word;
        }
    }
    return nearest;
}

} // namespace cadrel::app
