// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <string>
#include <vector>

namespace standin {

/// Boxes in front of the user. A host with windows has them; without them the services speak on the terminal.
class UserBoxes {
public:
    struct FileFilter {
        std::string extension; ///< without the dot
        std::string description;
    };
    struct FileQuestion {
        std::u16string title;
        std::vector<FileFilter> filters; ///< without any, every file can be chosen
        std::u16string folder;           ///< where the box opens; empty for no wish
        bool isSave = false;             ///< one file that is written, or else those that are opened
        std::u16string name = {};        ///< proposed for the file that is written
    };
    struct Progress {
        std::u16string title;
        std::u16string text;
        std::u16string status; ///< a second line
        int percentage = 0;
        bool canCancel = false;
    };

    virtual ~UserBoxes() = default;

    /// Waits for the user. The index of the button that was used; there is at least one. Escape uses the last one, and Return
    /// that of index `byReturn`. Neither may be one that loses something.
    virtual std::size_t ask(const std::u16string& message, const std::vector<std::u16string>& buttons,
                            std::size_t byReturn) = 0;
    /// The same; Return uses the first one.
    std::size_t ask(const std::u16string& message, const std::vector<std::u16string>& buttons)
    {
        return ask(message, buttons, 0);
    }
    /// Waits for the user. The full paths; none when the user cancels.
    virtual std::vector<std::u16string> chooseFiles(const FileQuestion& question) = 0;
    /// Shows the progress of the one operation that goes on, anew in each call. Whether the user has cancelled it.
    virtual bool showProgress(const Progress& progress) = 0;
    virtual void endProgress() = 0;
};

} // namespace standin
