// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/services/UserBoxes.h"

#include <algorithm>
#include <deque>
#include <stdexcept>
#include <string>
#include <vector>

namespace standin::tests {

/// A user who has decided beforehand what he answers.
class FakeBoxes : public UserBoxes {
public:
    using UserBoxes::ask;

    /// For a key that he presses instead.
    static constexpr const char16_t* Return = u"\r";
    static constexpr const char16_t* Escape = u"\x1B";

    /// Labels of the buttons that he uses in the next alerts; Return in an alert for which there is none left.
    std::deque<std::u16string> answers;
    /// What he takes in the next file boxes; nothing when there is none left.
    std::deque<std::vector<std::u16string>> choices;
    bool cancels = false;

    std::vector<std::u16string> messages;
    std::vector<FileQuestion> questions;
    std::vector<Progress> shown;
    int ended = 0;

    std::size_t ask(const std::u16string& message, const std::vector<std::u16string>& buttons,
                    std::size_t byReturn) override
    {
        messages.push_back(message);
        const std::u16string answer = answers.empty() ? Return : answers.front();
        if (!answers.empty())
            answers.pop_front();
        if (answer == Return)
            return byReturn;
        if (answer == Escape)
            return buttons.size() - 1;
        const auto found = std::find(buttons.begin(), buttons.end(), answer);
        if (found == buttons.end())
            throw std::logic_error("the alert has no such button");
        return static_cast<std::size_t>(found - buttons.begin());
    }
    std::vector<std::u16string> chooseFiles(const FileQuestion& question) override
    {
        questions.push_back(question);
        if (choices.empty())
            return {};
        const std::vector<std::u16string> files = choices.front();
        choices.pop_front();
        return files;
    }
    bool showProgress(const Progress& progress) override
    {
        shown.push_back(progress);
        return cancels;
    }
    void endProgress() override { ++ended; }
};

} // namespace standin::tests
