// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace pugi {
class xml_node;
} // namespace pugi

namespace standin {

/// A stretch of a text, in bytes.
struct TextRange {
    std::size_t begin = 0;
    std::size_t end = 0;

    std::string_view in(std::string_view text) const { return text.substr(begin, end - begin); }
};

/// What an element of a well-formed XML text takes, from its "<" to its last ">". `node` was read from that text.
TextRange rangeOf(const pugi::xml_node& node, std::string_view text);
/// The start tag alone.
TextRange startTagOf(const TextRange& element, std::string_view text);
/// Calls `visit` with each attribute's name and where its value stands, without its quotes.
void visitAttributes(const TextRange& startTag, std::string_view text,
                     const std::function<void(std::string_view, const TextRange&)>& visit);
/// The value of an attribute in a start tag, without its quotes; nothing for one that isn't there.
std::optional<TextRange> valueIn(const TextRange& startTag, std::string_view name, std::string_view text);
/// How deep an element stands, by the blanks before it in its line.
unsigned depthOf(const TextRange& element, std::string_view text);
/// An element as text, to be put where one stands so deep; without the blanks before it.
std::string printed(const pugi::xml_node& node, unsigned depth);

/// Also adds an attribute that isn't there.
void set(pugi::xml_node& element, const char* name, const std::string& value);
/// Whether an attribute is "1".
bool isOn(const pugi::xml_node& element, const char* name);

/// A text as XML can hold it: with U+FFFD for each character that no XML 1.0 text may have (section 2.2). It has to be UTF-8.
std::string withoutForbidden(std::string text);

/// A text in which some stretches are put in place of others, so that all else stays as it was, to the byte.
class TextPatch {
public:
    explicit TextPatch(std::string_view text) : m_text(text) {}

    /// The ranges of all calls must not overlap.
    void replace(const TextRange& range, std::string text)
    {
        // There may be hundreds of thousands.
        text.shrink_to_fit();
        m_edits.push_back({range, std::move(text)});
    }
    /// Also takes the blanks before it.
    void remove(TextRange range);
    /// What is inserted at one place stands there in the order of the calls.
    void insert(std::size_t at, std::string text) { m_edits.push_back({{at, at}, std::move(text)}); }

    std::string result();

private:
    struct Edit {
        TextRange range;
        std::string text;
    };

    std::string_view m_text;
    std::vector<Edit> m_edits;
};

} // namespace standin
