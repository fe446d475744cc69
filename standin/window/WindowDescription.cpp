// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/WindowDescription.h"

#include "standin/base/Text.h"

#include <pugixml.hpp>

#include <algorithm>
#include <initializer_list>
#include <iterator>
#include <string_view>
#include <system_error>

namespace standin {

namespace {

/// As a fragment, or a text beside the root would be passed over.
constexpr unsigned int ParseOptions = pugi::parse_default | pugi::parse_fragment;

/// Whether an element has none but these attributes, and each once at the most.
bool hasOnly(const pugi::xml_node& node, std::initializer_list<const char*> names)
{
    const auto attributes = node.attributes();
    const auto known = std::ranges::count_if(names, [&](const char* name) { return !node.attribute(name).empty(); });
    return std::distance(attributes.begin(), attributes.end()) == known;
}

/// Nothing for an element that isn't a window, lacks something or has anything else.
std::optional<WindowDescription> readWindow(const pugi::xml_node& node)
{
    const std::string_view resizable = node.attribute("resizable").as_string("false");
    WindowDescription window{node.attribute("name").value(), node.attribute("title").value(), resizable == "true"};
    const bool isWhole = std::string_view(node.name()) == "window" && !node.first_child() &&
                         hasOnly(node, {"name", "title", "resizable"}) && !window.name.empty() &&
                         isWellFormed(window.name) && isWellFormed(window.title) &&
                         (resizable == "true" || resizable == "false");
    return isWhole ? std::optional(window) : std::nullopt;
}

} // namespace

std::optional<std::vector<WindowDescription>> readWindowDescriptions(const std::filesystem::path& file)
{
    std::error_code ignored;
    pugi::xml_document document;
    // A folder can be opened too, but has no size that could be read; and a pipe may keep its reader waiting.
    if (!std::filesystem::is_regular_file(file, ignored) ||
        !document.load_file(file.c_str(), ParseOptions, pugi::encoding_utf8))
        return std::nullopt;
    const pugi::xml_node root = document.first_child();
    if (std::string_view(root.name()) != "windows" || root.next_sibling() || !hasOnly(root, {}))
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
