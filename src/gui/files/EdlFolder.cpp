// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/EdlFolder.h"

#include "core/model/DataModel.h"
#include "core/settings/Variant.h"
#include "util/FilePath.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <filesystem>
#include <optional>
#include <system_error>

namespace cadrel::gui {

using util::Result;
using util::StringUtil;

namespace fs = std::filesystem;

namespace {

/// The stored folder, where there is one and the file system has it.
std::optional<std::wstring> storedFolder(const core::DataModel& model)
try {
    core::Variant stored;
    if (model.getProperty(core::PropertyKey::LastEdlFolder, stored) != Result::Ok)
        return std::nullopt;
    const std::wstring folder = StringUtil::toWide(stored.toText());
    std::error_code error;
    return fs::is_directory(util::toFilePath(folder), error) ? std::optional(folder) : std::nullopt;
} catch (Result::Type) {
    return std::nullopt;
}

} // namespace

std::wstring folderOfFile(const std::wstring& path)
{
    return StringUtil::toWide(util::toFilePath(path).parent_path().string());
}

std::wstring edlFolderOf(const core::DataModel& model, const std::wstring& projectPath)
{
    const std::optional<std::wstring> stored = storedFolder(model);
    return stored ? *stored : folderOfFile(projectPath);
}

} // namespace cadrel::gui
