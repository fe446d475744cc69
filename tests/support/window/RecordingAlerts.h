// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/AlertWindowBase.h"

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The alerts of the process while it lives. Writes down what the user is told, and answers with the first button or as a
/// test says.
class RecordingAlerts {
public:
    RecordingAlerts() { gui::AlertWindowBase::install(std::make_unique<Alerts>(*this)); }
    RecordingAlerts(const RecordingAlerts&) = delete;
    RecordingAlerts& operator=(const RecordingAlerts&) = delete;
    ~RecordingAlerts() { gui::AlertWindowBase::uninstall(); }

    std::vector<std::wstring> messages;
    std::vector<std::vector<std::wstring>> buttons; ///< of each message, without the empty texts
    std::int32_t answer = 1;                        ///< the button that is pressed, counted from 1
    std::function<void()> meanwhile;                ///< called once, while the next alert is open

private:
    class Alerts : public gui::AlertWindowBase {
    public:
        explicit Alerts(RecordingAlerts& owner) : m_owner(owner) {}

        std::int32_t show(const std::wstring& message, const std::wstring& button1, const std::wstring& button2,
                          const std::wstring& button3) override
        {
            m_owner.messages.push_back(message);
            std::vector<std::wstring>& shown = m_owner.buttons.emplace_back();
            for (const std::wstring& button : {button1, button2, button3}) {
                if (!button.empty())
                    shown.push_back(button);
            }
            if (const auto call = std::exchange(m_owner.meanwhile, nullptr))
                call();
            return m_owner.answer;
        }

    private:
        RecordingAlerts& m_owner;
    };
};

} // namespace cadrel::tests
