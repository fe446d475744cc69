// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/AlertService.h"

#include <cstddef>
#include <string>
#include <vector>

namespace standin {

using namespace Velmark;

int32 AlertService::show(const char16_t* message, const char16_t* button1, const char16_t* button2,
                         const char16_t* button3)
{
    constexpr int32 NoButton = 0;
    constexpr int32 FirstButton = 1;
    constexpr const char16_t* DefaultLabel = u"OK";
    if (!message)
        return NoButton;
    std::vector<std::u16string> labels;
    std::vector<int32> numbers;
    for (int32 number = FirstButton; const char16_t* const label : {button1, button2, button3}) {
        if (label) {
            labels.emplace_back(label);
            numbers.push_back(number);
        }
        ++number;
    }
    if (m_boxes && labels.empty()) {
        m_boxes->ask(message, {DefaultLabel});
        return FirstButton;
    }
    if (labels.empty()) {
        m_terminal.writeMessage(message);
        return FirstButton;
    }
    const std::size_t byReturn = button1 ? 0 : labels.size() - 1;
    if (m_boxes)
        return numbers[m_boxes->ask(message, labels, byReturn)];
    m_terminal.writeMessage(std::u16string(message) + u" [" + labels[byReturn] + u"]");
    return numbers[byReturn];
}

} // namespace standin
