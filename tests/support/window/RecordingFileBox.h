// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/FileBrowserDialogBase.h"

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The file box of the process while it lives. Writes down what it was asked for, and chooses what a test says.
class RecordingFileBox {
public:
    struct Request {
        std::wstring title;
        std::wstring folder;
        std::wstring extension;
        std::wstring description;
        bool isForSaving;
    };

    RecordingFileBox() { gui::FileBrowserDialogBase::install(std::make_unique<Box>(*this)); }
    RecordingFileBox(const RecordingFileBox&) = delete;
    RecordingFileBox& operator=(const RecordingFileBox&) = delete;
    ~RecordingFileBox() { gui::FileBrowserDialogBase::uninstall(); }

    std::vector<Request> requests;
    std::vector<std::string> chosen; ///< what the user chooses; nothing where he cancels
    std::function<void()> meanwhile; ///< called once, while the next box is open

private:
    class Box : public gui::FileBrowserDialogBase {
    public:
        explicit Box(RecordingFileBox& owner) : m_owner(owner) {}

        void browse(const std::wstring& title, const std::wstring& startFolder, const std::wstring& extension,
                    const std::wstring& description, bool saveMode, std::vector<std::string>& results) override
        {
            m_owner.requests.push_back({title, startFolder, extension, description, saveMode});
            if (const auto call = std::exchange(m_owner.meanwhile, nullptr))
                call();
            results.insert(results.end(), m_owner.chosen.begin(), m_owner.chosen.end());
        }

    private:
        RecordingFileBox& m_owner;
    };
};

} // namespace cadrel::tests
