// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/ProcessService.h"

#include <string>
#include <vector>

namespace cadrel::gui {

/// File boxes.
class FileBrowserDialogBase : public ProcessService<FileBrowserDialogBase> {
public:
    virtual ~FileBrowserDialogBase() = default;

    /// Waits for the user and appends the chosen paths, in UTF-8, to `results`, which stays as it is when he cancels. The
    /// extension is without a dot; an empty one lets every file be chosen.
    virtual void browse(const std::wstring& title, const std::wstring& startFolder, const std::wstring& extension,
                        const std::wstring& description, bool saveMode, std::vector<std::string>& results) = 0;
};

} // namespace cadrel::gui
