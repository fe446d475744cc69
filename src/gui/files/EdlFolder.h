// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// The folder of the EDLs that were taken last into the model, if it still is there; otherwise that of the project, whose
/// file is named with its folder.
std::wstring edlFolderOf(const core::DataModel& model, const std::wstring& projectPath);

/// The folder of a file. Throws what util::toFilePath throws.
std::wstring folderOfFile(const std::wstring& path);

} // namespace cadrel::gui
