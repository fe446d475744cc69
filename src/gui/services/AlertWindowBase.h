// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/ProcessService.h"

#include <cstdint>
#include <string>

namespace cadrel::gui {

/// Alert boxes. In a question Return presses the first button, and Escape the last one, so neither may lose anything.
class AlertWindowBase : public ProcessService<AlertWindowBase> {
public:
    virtual ~AlertWindowBase() = default;

    /// Waits for the user and answers which button was pressed, counted from 1. An empty text leaves its button out.
    virtual std::int32_t show(const std::wstring& message, const std::wstring& button1, const std::wstring& button2,
                              const std::wstring& button3) = 0;

    /// Asks before something that may lose or spoil work. True only when the user presses `button` itself; Return and Escape
    /// press "Cancel".
    bool confirm(const std::wstring& question, const std::wstring& button)
    {
        // Without a first button, Return presses the last one.
        constexpr std::int32_t SecondButton = 2;
        return show(question, {}, button, L"Cancel") == SecondButton;
    }
};

} // namespace cadrel::gui
