// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/WindowDescription.h"

#include "standin/base/Text.h"

#include <pugixml.hpp>

#include <algorithm>
#include <string_view>
#include <system_error>

namespace standin {

namespace {

/// Nothing for an element that isn't a window, or lacks something.
std::optional<WindowDescription> readWindow(const pugi::xml_node& node)
{
    const std::string_view resizable = node.attribute("resizable").as_string("false");
    WindowDescription window{node.attribute("name").value(), node.attribute("title").value(), resizable == "true"};
    const bool isWhole = std::string_view(node.name()) == "window" && !node.first_child() && !window.name.empty() &&
                         isWellFormed(window.name) && isWellFormed(window.title) &&
                         (resizable == "true" || resizable == "false");
    return isWhole ? std::optional(window) : std::nullopt;
}

} // namespace

std::optional<std::vector<WindowDescription>> readWindowDescriptions(const std::filesystem::path& file)
{
    std::error_code ignored;
    pugi::xml_document document;
    // A folder can be opened too, but has no size that could be read.
    if (!std::filesystem::is_regular_file(file, ignored) ||
        !document.load_file(file.c_str(), pugi::parse_default, pugi::encoding_utf8))
        return std::nullopt;
    const pugi::xml_node root = document.document_element();
    if (std::string_view(root.name()) != "windows" || root.next_sibling())
        return std::nullopt;
    std::vector<WindowDescription> windows;
    for (const pugi::xml_node& node : root.children()) {
        const auto window = readWindow(node);
        if (!window || std::ranges::count(windows, window->name, &WindowDescription::name) > 0)
            return std::nullopt;
        windows.push_back(*window);
    }
    return windows;
}

} // namespace standin
