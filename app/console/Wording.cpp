// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Wording.h"

namespace cadrel::app {

std::string counted(std::size_t count, const std::string& word)
{
    return std::to_string(count) + " " + word + (count == 1 ? "" : "s");
}

std::string quoted(const std::string& text)
{
    return std::string("\"").append(text).append("\"");
}

std::string joined(const std::vector<std::string>& texts)
{
    std::string all;
    for (const std::string& text : texts)
        all += (all.empty() ? "" : ", ") + text;
    return all;
}

} // namespace cadrel::app
