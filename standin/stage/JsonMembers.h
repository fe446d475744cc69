// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/stage/JsonDocument.h"
#include "standin/stage/ProjectKeys.h"

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <optional>
#include <string>
#include <string_view>

namespace standin {

/// A place in a file, as steps from the one around it. It is put into words only when there is a fault.
class JsonPlace {
public:
    /// The file itself.
    JsonPlace() = default;
    /// Both are used as long as the place.
    JsonPlace(const JsonPlace& around, std::string_view key) : m_around(&around), m_key(key) {}
    JsonPlace(const JsonPlace& around, std::size_t index) : m_around(&around), m_index(index) {}

    [[noreturn]] void refuse(const std::string& fault) const;

private:
    std::string words() const;

    const JsonPlace* m_around = nullptr;
    std::string_view m_key;
    std::optional<std::size_t> m_index;
};

/// The members of an object in a file. All that they give is checked; what is wrong is thrown as a FileFault that names
/// the place.
class JsonMembers {
public:
    /// Refuses what isn't an object, and one with two members of the same key. The place is used as long as the members.
    JsonMembers(JsonValue object, const JsonPlace& place);

    const JsonPlace& place() const { return m_place; }
    bool has(std::string_view key) const { return find(key).has_value(); }
    std::optional<JsonValue> find(std::string_view key) const;
    /// Refuses an object without the member.
    JsonValue get(std::string_view key) const;

    // A value of the kind, for each. Those with another value for a member that isn't there don't refuse its absence.

    double number(std::string_view key, double least, double most) const;
    double number(std::string_view key, double least, double most, double otherwise) const;
    int wholeNumber(std::string_view key, int least, int most) const;
    /// False when it isn't there.
    bool flag(std::string_view key) const;
    std::string_view text(std::string_view key) const;
    /// Calls `read(JsonValue, const JsonPlace&)` for each element of a list; for none when it isn't there.
    template <class Read>
    void forEach(std::string_view key, Read read) const
    {
        const std::optional<JsonValue> list = find(key);
        if (!list)
            return;
        const JsonPlace listPlace(m_place, key);
        if (!list->isList())
            refuseKind(listPlace, *list, "a list");
        std::size_t index = 0;
        for (const JsonValue& element : list->children())
            read(element, JsonPlace(listPlace, index++));
    }
    /// The same for the members of an object, whose places have their keys.
    template <class Read>
    void forEachMember(std::string_view key, Read read) const
    {
        const std::optional<JsonValue> object = find(key);
        if (!object)
            return;
        const JsonPlace objectPlace(m_place, key);
        const JsonMembers members(*object, objectPlace);
        for (const JsonValue& member : object->children())
            read(member, JsonPlace(objectPlace, member.key()));
    }

    /// The other members, as the text of a JSON object; empty when there are none.
    std::string unknown(KnownKeys known) const;

    [[noreturn]] void refuse(std::string_view key, const std::string& fault) const;
    /// Refuses an object that has any of the members.
    void forbid(std::initializer_list<std::string_view> keys, const std::string& fault) const;
    /// "is a text, not a number".
    [[noreturn]] static void refuseKind(const JsonPlace& place, JsonValue value, const std::string& wanted);

private:
    double checkedNumber(std::string_view key, JsonValue value, double least, double most) const;

    JsonValue m_object;
    const JsonPlace& m_place;
};

/// A text that a zero-ended one can hold. Refuses any other value.
std::string_view textOf(JsonValue value, const JsonPlace& place);

} // namespace standin
