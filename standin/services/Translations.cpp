// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/Translations.h"

#include "standin/base/Text.h"
#include "standin/base/Utf16.h"

#include <filesystem>
#include <pugixml.hpp>
#include <string_view>
#include <system_error>
#include <vector>

namespace standin {

using namespace Velmark;

namespace {

/// Thrown for a table that isn't written as one.
struct BrokenTable {};

void require(bool condition)
{
    if (!condition)
        throw BrokenTable();
}

std::u16string checkedUtf16(std::string_view text)
{
    require(isWellFormed(text));
    return toUtf16(text);
}

bool isBlank(const pugi::xml_node& node)
{
    return node.type() == pugi::node_pcdata &&
           std::string_view(node.value()).find_first_not_of(" \t\r\n") == std::string_view::npos;
}

/// The children of a node, all of which have to be elements of that name, with nothing but blanks between them.
std::vector<pugi::xml_node> childrenNamed(std::string_view name, const pugi::xml_node& node)
{
    std::vector<pugi::xml_node> children;
    for (const pugi::xml_node& child : node.children()) {
        if (isBlank(child))
            continue;
        require(child.name() == name);
        children.push_back(child);
    }
    return children;
}

const char* requiredAttribute(const char* name, const pugi::xml_node& node)
{
    const char* const value = node.attribute(name).value();
    require(*value != '\0');
    return value;
}

std::u16string textOf(const pugi::xml_node& node)
{
    std::u16string text;
    for (const pugi::xml_node& piece : node.children()) {
        require(piece.type() != pugi::node_element);
        text += checkedUtf16(piece.value());
    }
    return text;
}

} // namespace

int32 Translations::addTable(BundleHandle bundle, const char* file, const char* /*domain*/)
{
    if (!bundle || !file)
        return ResultFalse;
    const std::filesystem::path path = std::filesystem::path(static_cast<const char*>(bundle)) / file;
    std::error_code ignored;
    pugi::xml_document document;
    // Blanks that stand alone may be part of a translation.
    constexpr unsigned Options = pugi::parse_default | pugi::parse_ws_pcdata;
    // A folder can be opened too, but has no size that could be read.
    if (!std::filesystem::is_regular_file(path, ignored) ||
        !document.load_file(path.c_str(), Options, pugi::encoding_utf8))
        return ResultFalse;
    try {
        for (auto& [language, table] : read(document))
            m_tables[language].merge(table);
    } catch (const BrokenTable&) {
        return ResultFalse;
    }
    return ResultOk;
}

Translations::Tables Translations::read(const pugi::xml_document& document)
{
    Tables tables;
    for (const pugi::xml_node& root : childrenNamed("translations", document)) {
        for (const pugi::xml_node& language : childrenNamed("language", root)) {
            Table& table = tables[requiredAttribute("name", language)];
            for (const pugi::xml_node& text : childrenNamed("text", language)) {
                const std::u16string source = checkedUtf16(requiredAttribute("source", text));
                const std::u16string translated = textOf(text);
                if (!translated.empty())
                    table.try_emplace(source, translated);
            }
        }
    }
    return tables;
}

const char16_t* Translations::translate(const char16_t* text)
{
    const auto table = m_tables.find(m_language);
    if (!text || table == m_tables.end())
        return text;
    const auto found = table->second.find(std::u16string_view(text));
    return found == table->second.end() ? text : found->second.c_str();
}

} // namespace standin
