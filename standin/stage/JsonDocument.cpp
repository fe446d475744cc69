// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/JsonDocument.h"

#include "standin/project/FileFault.h"
#include "util/JsonText.h"

#include <nlohmann/json.hpp>

#include <algorithm>
#include <cmath>
#include <limits>
#include <unordered_map>
#include <utility>

using cadrel::util::appendJsonNumber;
using cadrel::util::appendJsonText;

namespace standin {

namespace {

using nlohmann::json;

std::string placeIn(std::string_view text, std::size_t offset)
{
    const std::string_view before = text.substr(0, offset);
    const std::size_t line = 1 + static_cast<std::size_t>(std::count(before.begin(), before.end(), '\n'));
    const std::size_t lineStart = before.rfind('\n') + 1; // npos + 1 is 0
    const auto isCharacter = [](char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) != 0x80U; };
    const auto column =
        1 + std::count_if(before.begin() + static_cast<std::ptrdiff_t>(lineStart), before.end(), isCharacter);
    return "line " + std::to_string(line) + ", column " + std::to_string(column);
}

/// Where lists and objects lie in one another more than `deepest` levels, in text that is JSON up to there.
std::size_t offsetOfDepth(std::string_view text, std::size_t deepest)
{
    std::size_t depth = 0;
    bool isInText = false;
    for (std::size_t offset = 0; offset < text.size(); ++offset) {
        const char byte = text[offset];
        if (byte == '"')
            isInText = !isInText;
        else if (isInText && byte == '\\')
            ++offset;
        else if (!isInText && (byte == '[' || byte == '{') && ++depth > deepest)
            return offset;
        else if (!isInText && (byte == ']' || byte == '}'))
            --depth;
    }
    return text.size();
}

/// Without what the parser says of itself, of the place, and of the text that it stands in.
std::string faultIn(std::string_view message)
{
    constexpr std::string_view Before = "syntax error ";
    if (const std::size_t found = message.find(Before); found != std::string_view::npos)
        message.remove_prefix(found + Before.size());
    return "broken JSON " + std::string(message.substr(0, message.find("; last read")));
}

} // namespace

/// Takes the values of the text in their order.
class JsonDocument::Builder : public nlohmann::json_sax<json> {
public:
    Builder(JsonDocument& document, std::string_view text, std::size_t deepest)
        : m_document(document), m_text(text), m_deepest(deepest)
    {
    }

    void build()
    {
        if (m_text.size() > LargestSize)
            throw FileFault("larger than " + std::to_string(LargestSize >> 30U) + " GiB");
        json::sax_parse(m_text.begin(), m_text.end(), this);
    }

    bool null() override
    {
        add(Kind::Null);
        return true;
    }
    bool boolean(bool value) override
    {
        add(Kind::Boolean).boolean = value;
        return true;
    }
    bool number_integer(std::int64_t value) override
    {
        add(Kind::Integer).integer = value;
        return true;
    }
    bool number_unsigned(std::uint64_t value) override
    {
        if (value <= static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()))
            return number_integer(static_cast<std::int64_t>(value));
        add(Kind::LargeInteger).largeInteger = value;
        return true;
    }
    bool number_float(double value, const std::string& /*digits*/) override
    {
        add(Kind::Number).number = value;
        return true;
    }
    bool string(std::string& value) override
    {
        const auto offset = static_cast<std::uint32_t>(m_document.m_texts.size());
        add(Kind::Text).text = {offset, static_cast<std::uint32_t>(value.size())};
        m_document.m_texts += value;
        return true;
    }
    bool binary(json::binary_t& /*value*/) override { return false; }
    bool start_object(std::size_t /*size*/) override { return open(Kind::Object); }
    bool end_object() override { return close(); }
    bool start_array(std::size_t /*size*/) override { return open(Kind::List); }
    bool end_array() override { return close(); }
    bool key(std::string& value) override
    {
        const auto [found, isNew] = m_keys.try_emplace(value, static_cast<std::uint32_t>(m_keys.size()));
        if (isNew)
            m_document.m_keys.push_back(value);
        m_key = found->second;
        return true;
    }
    bool parse_error(std::size_t position, const std::string& /*token*/, const json::exception& error) override
    {
        constexpr int NumberTooLarge = 406;
        const std::string fault = error.id == NumberTooLarge ? "a number beyond all bounds" : faultIn(error.what());
        throw FileFault(placeIn(m_text, position == 0 ? 0 : position - 1), fault);
    }

private:
    Item& add(Kind kind)
    {
        Item& item = m_document.m_items.emplace_back();
        item.kind = kind;
        item.key = m_key;
        item.end = static_cast<std::uint32_t>(m_document.m_items.size());
        return item;
    }

    bool open(Kind kind)
    {
        if (m_open.size() == m_deepest) {
            throw FileFault(placeIn(m_text, offsetOfDepth(m_text, m_deepest)) + ": nested deeper than " +
                            std::to_string(m_deepest) + " levels");
        }
        m_open.push_back(m_document.m_items.size());
        add(kind);
        return true;
    }

    bool close()
    {
        m_document.m_items[m_open.back()].end = static_cast<std::uint32_t>(m_document.m_items.size());
        m_open.pop_back();
        return true;
    }

    JsonDocument& m_document;
    const std::string_view m_text;
    const std::size_t m_deepest;
    std::uint32_t m_key = 0;
    std::vector<std::size_t> m_open; ///< the containers that haven't ended, by their indexes
    std::unordered_map<std::string, std::uint32_t> m_keys;
};

JsonDocument::JsonDocument(std::string_view text, std::size_t deepest)
{
    Builder(*this, text, deepest).build();
}

JsonValue JsonDocument::root() const
{
    return {*this, 0};
}

const char* JsonValue::kindName() const
{
    switch (kind()) {
    case Kind::Null:
        return "null";
    case Kind::Boolean:
        return "true or false";
    case Kind::Integer:
    case Kind::LargeInteger:
    case Kind::Number:
        return "a number";
    case Kind::Text:
        return "a text";
    case Kind::List:
        return "a list";
    case Kind::Object:
        return "an object";
    }
    return "";
}

double JsonValue::number() const
{
    switch (kind()) {
    case Kind::Integer:
        return static_cast<double>(item().integer);
    case Kind::LargeInteger:
        return static_cast<double>(item().largeInteger);
    default:
        return item().number;
    }
}

std::optional<std::int64_t> JsonValue::integer() const
{
    return kind() == Kind::Integer ? std::optional(item().integer) : std::nullopt;
}

std::string_view JsonValue::text() const
{
    return std::string_view(m_document->m_texts).substr(item().text.offset, item().text.size);
}

std::optional<JsonValue> JsonValue::doubledMember() const
{
    std::vector<std::pair<std::uint32_t, std::uint32_t>> members;
    for (const JsonValue& member : children())
        members.emplace_back(member.item().key, member.m_index);
    std::ranges::sort(members);
    const auto doubled = std::ranges::adjacent_find(members, {}, [](const auto& member) { return member.first; });
    return doubled != members.end() ? std::optional(JsonValue(*m_document, doubled[1].second)) : std::nullopt;
}

std::size_t JsonValue::depth() const
{
    // Each container that is still open, by where it ends.
    std::vector<std::uint32_t> open;
    std::size_t deepest = 0;
    for (std::uint32_t index = m_index; index < item().end; ++index) {
        const JsonDocument::Item& inner = m_document->m_items[index];
        while (!open.empty() && open.back() <= index)
            open.pop_back();
        if (inner.kind == Kind::List || inner.kind == Kind::Object)
            open.push_back(inner.end);
        deepest = std::max(deepest, open.size());
    }
    return deepest;
}

void JsonValue::appendTo(std::string& json) const
{
    const auto appendChildren = [&](char opening, char closing) {
        json += opening;
        const char* separator = "";
        for (const JsonValue& child : children()) {
            json += separator;
            if (isObject()) {
                appendJsonText(json, child.key());
                json += ": ";
            }
            child.appendTo(json);
            separator = ", ";
        }
        json += closing;
    };
    switch (kind()) {
    case Kind::Null:
        json += "null";
        break;
    case Kind::Boolean:
        json += boolean() ? "true" : "false";
        break;
    case Kind::Integer:
        json += std::to_string(item().integer);
        break;
    case Kind::LargeInteger:
        json += std::to_string(item().largeInteger);
        break;
    case Kind::Number: {
        std::string digits;
        appendJsonNumber(digits, item().number);
        // It is not an integer, even if nothing comes after the point.
        json += digits.find_first_of(".e") == std::string::npos ? digits + ".0" : digits;
        break;
    }
    case Kind::Text:
        appendJsonText(json, text());
        break;
    case Kind::List:
        appendChildren('[', ']');
        break;
    case Kind::Object:
        appendChildren('{', '}');
        break;
    }
}

} // namespace standin
