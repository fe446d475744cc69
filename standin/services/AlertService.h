// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/Terminal.h"
#include "standin/services/UserBoxes.h"
#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

namespace standin {

/// Alerts as boxes or, without these, as messages on the terminal. There nobody is asked: the button of Return counts as used,
/// and its label comes after the message.
class AlertService : public Velmark::Implements<AlertService, Velmark::FObject, Velmark::IAlertService> {
public:
    static constexpr const char* ClassName = "AlertService";

    explicit AlertService(Terminal& terminal) : m_terminal(terminal) {}

    /// Not owned; null for none.
    void setBoxes(UserBoxes* boxes) { m_boxes = boxes; }

    /// 0, no button, for an alert without a message.
    Velmark::int32 show(const char16_t* message, const char16_t* button1, const char16_t* button2,
                        const char16_t* button3) override;

private:
    Terminal& m_terminal;
    UserBoxes* m_boxes = nullptr;
};

} // namespace standin
