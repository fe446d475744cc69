// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/AlertWindowBase.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The alerts of the process while it lives. Writes down what the user is told, and answers with the first button or as a
/// test says, by button or by key.
class RecordingAlerts {
public:
    RecordingAlerts() { gui::AlertWindowBase::install(std::make_unique<Alerts>(*this)); }
    RecordingAlerts(const RecordingAlerts&) = delete;
    RecordingAlerts& operator=(const RecordingAlerts&) = delete;
    ~RecordingAlerts() { gui::AlertWindowBase::uninstall(); }

    std::vector<std::wstring> messages;
    std::vector<std::vector<std::wstring>> buttons; ///< of each message, without the empty texts
    std::int32_t answer = 1;                        ///< the button that is pressed, counted from 1
    enum class Key { Return, Escape };
    std::optional<Key> key;          ///< pressed instead of a button, when it is set
    std::function<void()> meanwhile; ///< called once, while the next alert is open

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
            return m_owner.key ? buttonOf(*m_owner.key, {&button1, &button2, &button3}) : m_owner.answer;
        }

    private:
        /// Return uses the first button, and the last one where the first is left out; Escape the last one.
        static std::int32_t buttonOf(Key key, const std::array<const std::wstring*, 3>& texts)
        {
            std::int32_t last = 1;
            for (std::size_t index = 0; index < texts.size(); ++index)
                last = texts.at(index)->empty() ? last : static_cast<std::int32_t>(index) + 1;
            return key == Key::Return && !texts.front()->empty() ? 1 : last;
        }

        RecordingAlerts& m_owner;
    };
};

} // namespace cadrel::tests
