// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/AlertWindowBase.h"

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The alerts of the process while it lives. Writes down what the user is told, and answers with the first button.
class RecordingAlerts {
public:
    RecordingAlerts() { gui::AlertWindowBase::install(std::make_unique<Alerts>(*this)); }
    RecordingAlerts(const RecordingAlerts&) = delete;
    RecordingAlerts& operator=(const RecordingAlerts&) = delete;
    ~RecordingAlerts() { gui::AlertWindowBase::uninstall(); }

    std::vector<std::wstring> messages;
    std::function<void()> meanwhile; ///< called once, while the next alert is open

private:
    class Alerts : public gui::AlertWindowBase {
    public:
        explicit Alerts(RecordingAlerts& owner) : m_owner(owner) {}

        std::int32_t show(const std::wstring& message, const std::wstring&, const std::wstring&,
                          const std::wstring&) override
        {
            m_owner.messages.push_back(message);
            if (const auto call = std::exchange(m_owner.meanwhile, nullptr))
                call();
            return 1;
        }

    private:
        RecordingAlerts& m_owner;
    };
};

} // namespace cadrel::tests
