// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/XmlText.h"

#include <pugixml.hpp>

#include <algorithm>

namespace standin {

namespace {

constexpr std::string_view Blanks = " \t\r\n";
constexpr std::size_t IndentWidth = 2;
/// What stands further right has been set so by hand.
constexpr std::size_t DeepestIndent = 20;

/// Where what begins with `open` at `begin` ends.
std::size_t endAfter(std::string_view text, std::size_t begin, std::string_view close)
{
    const std::size_t found = text.find(close, begin);
    return found == std::string_view::npos ? text.size() : found + close.size();
}

/// Where the tag at `begin` ends, whose attributes may hold any ">".
std::size_t endOfTag(std::string_view text, std::size_t begin)
{
    char quote = 0;
    for (std::size_t at = begin; at < text.size(); ++at) {
        const char character = text[at];
        if (quote != 0) {
            if (character == quote)
                quote = 0;
        } else if (character == '"' || character == '\'') {
            quote = character;
        } else if (character == '>') {
            return at + 1;
        }
    }
    return text.size();
}

class StringWriter : public pugi::xml_writer {
public:
    void write(const void* data, std::size_t size) override { text.append(static_cast<const char*>(data), size); }

    std::string text;
};

} // namespace

TextRange rangeOf(const pugi::xml_node& node, std::string_view text)
{
    // The offset is that of the name.
    const std::size_t begin = static_cast<std::size_t>(node.offset_debug()) - 1;
    std::size_t depth = 0;
    for (std::size_t at = begin; at < text.size();) {
        const std::string_view rest = text.substr(at);
        if (rest.starts_with("<!--")) {
            at = endAfter(text, at, "-->");
        } else if (rest.starts_with("<![CDATA[")) {
            at = endAfter(text, at, "]]>");
        } else if (rest.starts_with("<?")) {
            at = endAfter(text, at, "?>");
        } else {
            const std::size_t end = endOfTag(text, at);
            if (rest.starts_with("</"))
                --depth;
            else if (text[end - 2] != '/')
                ++depth;
            at = end;
        }
        if (depth == 0)
            return {begin, at};
        at = std::min(text.find('<', at), text.size());
    }
    return {begin, text.size()};
}

TextRange startTagOf(const TextRange& element, std::string_view text)
{
    return {element.begin, endOfTag(text, element.begin)};
}

void visitAttributes(const TextRange& startTag, std::string_view text,
                     const std::function<void(std::string_view, const TextRange&)>& visit)
{
    std::size_t at = text.find_first_of(Blanks, startTag.begin);
    while (at < startTag.end) {
        const std::size_t first = text.find_first_not_of(Blanks, at);
        const std::size_t equals = text.find('=', first);
        const std::size_t open = text.find_first_of("\"'", equals);
        if (open >= startTag.end)
            return;
        const std::size_t close = text.find(text[open], open + 1);
        const std::size_t last = text.find_last_not_of(Blanks, equals - 1);
        visit(text.substr(first, last + 1 - first), {open + 1, close});
        at = close + 1;
    }
}

std::optional<TextRange> valueIn(const TextRange& startTag, std::string_view name, std::string_view text)
{
    std::optional<TextRange> value;
    visitAttributes(startTag, text, [&](std::string_view found, const TextRange& range) {
        if (found == name)
            value = range;
    });
    return value;
}

unsigned depthOf(const TextRange& element, std::string_view text)
{
    const std::size_t before = text.substr(0, element.begin).find_last_not_of(' ');
    const std::size_t blanks = element.begin - (before == std::string_view::npos ? 0 : before + 1);
    return static_cast<unsigned>(std::min<std::size_t>(blanks / IndentWidth, DeepestIndent));
}

std::string printed(const pugi::xml_node& node, unsigned depth)
{
    StringWriter writer;
    node.print(writer, "  ", pugi::format_default, pugi::encoding_utf8, depth);
    // The element stands where the blanks before it are already written.
    const std::size_t first = writer.text.find_first_not_of(Blanks);
    const std::size_t last = writer.text.find_last_not_of(Blanks);
    return first == std::string::npos ? std::string() : writer.text.substr(first, last + 1 - first);
}

void set(pugi::xml_node& element, const char* name, const std::string& value)
{
    pugi::xml_attribute attribute = element.attribute(name);
    if (!attribute)
        attribute = element.append_attribute(name);
    attribute.set_value(value.c_str());
}

bool isOn(const pugi::xml_node& element, const char* name)
{
    return std::string_view(element.attribute(name).value()) == "1";
}

std::string withoutForbidden(std::string text)
{
    constexpr std::string_view Replacement = "\xEF\xBF\xBD";
    std::string allowed;
    allowed.reserve(text.size());
    for (std::size_t at = 0; at < text.size();) {
        const std::string_view rest = std::string_view(text).substr(at);
        const auto byte = static_cast<unsigned char>(rest.front());
        const bool isControl = byte < 0x20U && Blanks.find(rest.front()) == std::string_view::npos;
        const bool isNoCharacter = rest.starts_with("\xEF\xBF\xBE") || rest.starts_with("\xEF\xBF\xBF");
        if (isControl || isNoCharacter)
            allowed += Replacement;
        else
            allowed += rest.front();
        at += isNoCharacter ? 3 : 1;
    }
    return allowed;
}

void TextPatch::remove(TextRange range)
{
    while (range.begin > 0 && Blanks.find(m_text[range.begin - 1]) != std::string_view::npos)
        --range.begin;
    replace(range, std::string());
}

std::string TextPatch::result()
{
    std::ranges::stable_sort(m_edits, {}, [](const Edit& edit) { return edit.range.begin; });
    std::size_t size = m_text.size();
    for (const Edit& edit : m_edits)
        size += edit.text.size() - (edit.range.end - edit.range.begin);
    std::string result;
    result.reserve(size);
    std::size_t at = 0;
    for (Edit& edit : m_edits) {
        // A long session is there in memory once, and not in pieces as well.
        const std::string text = std::move(edit.text);
        result.append(m_text.substr(at, edit.range.begin - at)).append(text);
        at = edit.range.end;
    }
    result.append(m_text.substr(at));
    return result;
}

} // namespace standin
