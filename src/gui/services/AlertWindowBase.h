// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/ProcessService.h"

#include <cstdint>
#include <string>

namespace cadrel::gui {

/// Alert boxes.
class AlertWindowBase : public ProcessService<AlertWindowBase> {
public:
    virtual ~AlertWindowBase() = default;

    /// Waits for the user and answers which button was pressed, counted from 1. An empty text leaves its button out.
    virtual std::int32_t show(const std::wstring& message, const std::wstring& button1, const std::wstring& button2,
                              const std::wstring& button3) = 0;
};

} // namespace cadrel::gui
