// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/AlertService.h"

#include <algorithm>
#include <array>

namespace standin {

using namespace Velmark;

int32 AlertService::show(const char16_t* message, const char16_t* button1, const char16_t* button2,
                         const char16_t* button3)
{
    constexpr int32 NoButton = 0;
    constexpr int32 FirstButton = 1;
    if (!message)
        return NoButton;
    const std::array<const char16_t*, 3> labels{button1, button2, button3};
    const auto used = std::find_if(labels.begin(), labels.end(), [](const char16_t* label) { return label; });
    if (used == labels.end()) {
        m_terminal.writeMessage(message);
        return FirstButton;
    }
    m_terminal.writeMessage(std::u16string(message) + u" [" + *used + u"]");
    return FirstButton + static_cast<int32>(used - labels.begin());
}

} // namespace standin
