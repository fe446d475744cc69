// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace standin {

class JsonValue;

/// A JSON text that has been read (RFC 8259). All its values are in one list, one after the other, each container
/// before what it holds, so that even a large text costs little more than its own size, and no depth can exhaust the
/// stack.
class JsonDocument {
public:
    /// No text is larger than this, in bytes.
    static constexpr std::size_t LargestSize = std::size_t{1} << 31U;

    /// Throws FileFault, which gives line and column: for text that isn't JSON or UTF-8, that is larger than LargestSize, or in which lists and objects
    /// lie in one another more than `deepest` levels.
    JsonDocument(std::string_view text, std::size_t deepest);

    /// As long as the document lives.
    JsonValue root() const;

private:
    friend class JsonValue;
    class Builder;

    enum class Kind : std::uint8_t { Null, Boolean, Integer, LargeInteger, Number, Text, List, Object };

    struct TextPlace {
        std::uint32_t offset;
        std::uint32_t size;
    };
    struct Item {
        Kind kind;
        std::uint32_t key; ///< of a member of an object: the index of its key
        std::uint32_t end; ///< the index of the item after this one and all that it holds
        union {
            bool boolean;
            std::int64_t integer;
            std::uint64_t largeInteger;
            double number;
            TextPlace text;
        };
    };

    std::deque<Item> m_items;        ///< which never needs room for its former self, as a growing vector does
    std::vector<std::string> m_keys; ///< each once
    std::string m_texts;
};

/// A value in a document. It is copied at will, and used no longer than the document.
class JsonValue {
public:
    bool isBoolean() const { return kind() == Kind::Boolean; }
    bool isNumber() const { return kind() >= Kind::Integer && kind() <= Kind::Number; }
    bool isText() const { return kind() == Kind::Text; }
    bool isList() const { return kind() == Kind::List; }
    bool isObject() const { return kind() == Kind::Object; }
    /// "a number", "a list" and so on.
    const char* kindName() const;

    bool boolean() const { return item().boolean; }
    double number() const;
    /// Nothing for a number with a fraction or an exponent, and for one of more than 64 bits.
    std::optional<std::int64_t> integer() const;
    /// UTF-8.
    std::string_view text() const;

    /// What a list or object holds, in order.
    class Children;
    Children children() const;
    /// Of a member of an object.
    const std::string& key() const { return m_document->m_keys[item().key]; }
    /// A member of the object that has the key of one before it; nothing when there is none.
    std::optional<JsonValue> doubledMember() const;

    /// How many levels of lists and objects it is made of; 0 for any other value.
    std::size_t depth() const;
    /// The value as JSON text in one line. Numbers keep their value, if not their digits.
    void appendTo(std::string& json) const;

private:
    friend class JsonDocument;
    using Kind = JsonDocument::Kind;

    JsonValue(const JsonDocument& document, std::uint32_t index) : m_document(&document), m_index(index) {}

    const JsonDocument::Item& item() const { return m_document->m_items[m_index]; }
    Kind kind() const { return item().kind; }

    const JsonDocument* m_document;
    std::uint32_t m_index;
};

class JsonValue::Children {
public:
    class Iterator {
    public:
        explicit Iterator(JsonValue value) : m_value(value) {}

        const JsonValue& operator*() const { return m_value; }
        const JsonValue* operator->() const { return &m_value; }
        Iterator& operator++()
        {
            m_value.m_index = m_value.item().end;
            return *this;
        }
        bool operator==(const Iterator& other) const { return m_value.m_index == other.m_value.m_index; }

    private:
        JsonValue m_value;
    };

    explicit Children(JsonValue parent) : m_parent(parent) {}

    Iterator begin() const { return Iterator(JsonValue(*m_parent.m_document, m_parent.m_index + 1)); }
    Iterator end() const { return Iterator(JsonValue(*m_parent.m_document, m_parent.item().end)); }

private:
    JsonValue m_parent;
};

inline JsonValue::Children JsonValue::children() const
{
    return Children(*this);
}

} // namespace standin
