// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/AlertWindowBase.h"

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

/// Shows alerts through the host, in the user's language.
class AlertWindow : public gui::AlertWindowBase {
public:
    /// Makes this the alerts of the process. Throws Result::NotAvailable when there are some already, which stay. The
    /// context isn't owned.
    static void install(Velmark::IHostContext* context);

    explicit AlertWindow(Velmark::IHostContext* context) : m_context(context) {}

    /// 0 when the host shows no alerts.
    std::int32_t show(const std::wstring& message, const std::wstring& button1, const std::wstring& button2,
                      const std::wstring& button3) override;

private:
    Velmark::IHostContext* m_context;
};

} // namespace cadrel::host
