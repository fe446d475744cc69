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
    /// Labels of the buttons that he uses in the next alerts; the first one of an alert for which there is none left.
    std::deque<std::u16string> answers;
    /// What he takes in the next file boxes; nothing when there is none left.
    std::deque<std::vector<std::u16string>> choices;
    bool cancels = false;

    std::vector<std::u16string> messages;
    std::vector<FileQuestion> questions;
    std::vector<Progress> shown;
    int ended = 0;

    std::size_t ask(const std::u16string& message, const std::vector<std::u16string>& buttons) override
    {
        messages.push_back(message);
        if (answers.empty())
            return 0;
        const auto found = std::find(buttons.begin(), buttons.end(), answers.front());
        if (found == buttons.end())
            throw std::logic_error("the alert has no such button");
        answers.pop_front();
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
