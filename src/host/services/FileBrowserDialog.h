// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/services/FileBrowserDialogBase.h"

namespace Velmark {
class IHostContext;
}

namespace cadrel::host {

/// Shows the host's file boxes.
class FileBrowserDialog : public gui::FileBrowserDialogBase {
public:
    /// Makes this the file boxes of the process. Throws Result::NotAvailable when there are some already, which stay. The
    /// context isn't owned.
    static void install(Velmark::IHostContext* context);

    explicit FileBrowserDialog(Velmark::IHostContext* context) : m_context(context) {}

    /// If the host can't use the folder, the box opens in a folder of the host's choice. Throws Result::NotAvailable
    /// when the host has no file boxes or its box fails, and what HostFailure.h tells when a chosen path can't be had;
    /// `results` stays as it was.
    void browse(const std::wstring& title, const std::wstring& startFolder, const std::wstring& extension,
                const std::wstring& description, bool saveMode, std::vector<std::string>& results) override;

private:
    Velmark::IHostContext* m_context;
};

} // namespace cadrel::host
