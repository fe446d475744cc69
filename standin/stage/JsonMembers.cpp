// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/JsonMembers.h"

#include "standin/project/FileFault.h"
#include "standin/project/Project.h"
#include "util/JsonText.h"

#include <algorithm>

using cadrel::util::appendJsonNumber;
using cadrel::util::appendJsonText;

namespace standin {

namespace {

std::string digitsOf(double number)
{
    std::string digits;
    appendJsonNumber(digits, number);
    return digits;
}

/// A number that has a point in the file has one here, too.
std::string digitsOf(JsonValue number)
{
    std::string digits;
    number.appendTo(digits);
    return digits;
}

} // namespace

void JsonPlace::refuse(const std::string& fault) const
{
    throw FileFault(words(), fault);
}

std::string JsonPlace::words() const
{
    if (!m_around)
        return {};
    std::string words = m_around->words();
    if (m_index)
        appendElement(words, *m_index);
    else
        appendMember(words, m_key);
    return words;
}

JsonMembers::JsonMembers(JsonValue object, const JsonPlace& place) : m_object(object), m_place(place)
{
    if (!object.isObject())
        refuseKind(place, object, "an object");
    if (const std::optional<JsonValue> doubled = object.doubledMember())
        refuse(doubled->key(), "is there twice");
}

std::optional<JsonValue> JsonMembers::find(std::string_view key) const
{
    for (const JsonValue& member : m_object.children()) {
        if (member.key() == key)
            return member;
    }
    return std::nullopt;
}

JsonValue JsonMembers::get(std::string_view key) const
{
    const std::optional<JsonValue> member = find(key);
    if (!member)
        refuse(key, "is missing");
    return *member;
}

double JsonMembers::number(std::string_view key, double least, double most) const
{
    return checkedNumber(key, get(key), least, most);
}

double JsonMembers::number(std::string_view key, double least, double most, double otherwise) const
{
    const std::optional<JsonValue> member = find(key);
    return member ? checkedNumber(key, *member, least, most) : otherwise;
}

double JsonMembers::checkedNumber(std::string_view key, JsonValue value, double least, double most) const
{
    if (!value.isNumber())
        refuseKind(JsonPlace(m_place, key), value, "a number");
    const double number = value.number();
    if (number < least || number > most)
        refuse(key, "is " + digitsOf(number) + ", not from " + digitsOf(least) + " to " + digitsOf(most));
    return number;
}

int JsonMembers::wholeNumber(std::string_view key, int least, int most) const
{
    const JsonValue value = get(key);
    number(key, least, most);
    const std::optional<std::int64_t> integer = value.integer();
    if (!integer)
        refuse(key, "is " + digitsOf(value) + ", not a whole number");
    return static_cast<int>(*integer);
}

bool JsonMembers::flag(std::string_view key) const
{
    const std::optional<JsonValue> member = find(key);
    if (member && !member->isBoolean())
        refuseKind(JsonPlace(m_place, key), *member, "true or false");
    return member && member->boolean();
}

std::string_view JsonMembers::text(std::string_view key) const
{
    return textOf(get(key), JsonPlace(m_place, key));
}

std::string JsonMembers::unknown(KnownKeys known) const
{
    std::string json;
    for (const JsonValue& member : m_object.children()) {
        if (std::ranges::find(known, member.key()) != known.end())
            continue;
        if (member.depth() > Project::DeepestNesting)
            refuse(member.key(), "nested deeper than " + std::to_string(Project::DeepestNesting) + " levels");
        json += json.empty() ? "{" : ", ";
        appendJsonText(json, member.key());
        json += ": ";
        member.appendTo(json);
    }
    return json.empty() ? json : json + "}";
}

void JsonMembers::refuse(std::string_view key, const std::string& fault) const
{
    JsonPlace(m_place, key).refuse(fault);
}

void JsonMembers::forbid(std::initializer_list<std::string_view> keys, const std::string& fault) const
{
    for (const std::string_view key : keys) {
        if (has(key))
            refuse(key, fault);
    }
}

void JsonMembers::refuseKind(const JsonPlace& place, JsonValue value, const std::string& wanted)
{
    place.refuse(std::string("is ") + value.kindName() + ", not " + wanted);
}

std::string_view textOf(JsonValue value, const JsonPlace& place)
{
    if (!value.isText())
        JsonMembers::refuseKind(place, value, "a text");
    const std::string_view text = value.text();
    if (text.find('\0') != std::string_view::npos)
        place.refuse("holds a zero character");
    return text;
}

} // namespace standin
