// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <vector>

namespace standin {

/// A window that a module has described. Texts are UTF-8.
struct WindowDescription {
    std::string name;
    std::string title;
    bool isResizable = false;
};

/// The windows of a file, in the form that docs/window-descriptions.md tells; nothing for one that is missing or broken.
std::optional<std::vector<WindowDescription>> readWindowDescriptions(const std::filesystem::path& file);

} // namespace standin
