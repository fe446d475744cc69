// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/JsonSchema.h"

#include <algorithm>
#include <regex>
#include <set>

namespace cadrel::tests {

using nlohmann::json;

namespace {

bool isOfType(const json& value, const std::string& type)
{
    return type == "object"    ? value.is_object()
           : type == "array"   ? value.is_array()
           : type == "string"  ? value.is_string()
           : type == "integer" ? value.is_number_integer()
           : type == "number"  ? value.is_number()
           : type == "null"    ? value.is_null()
                               : false;
}

} // namespace

std::string JsonSchema::faultOf(const json& value, const json& rules, const std::string& where) const
{
    static const std::set<std::string> Known{
        "$schema", "$defs", "$ref",    "title",   "description",          "type",  "required", "properties",
        "items",   "enum",  "pattern", "minimum", "additionalProperties", "const", "anyOf"};
    for (const auto& [word, rule] : rules.items()) {
        if (!Known.contains(word))
            return where + ": the schema has the unknown word " + word;
    }
    if (rules.contains("$ref")) {
        const std::string path = rules.at("$ref").get<std::string>().substr(1);
        return faultOf(value, m_schema.at(json::json_pointer(path)), where);
    }
    if (rules.contains("anyOf")) {
        std::string faults;
        for (const json& choice : rules.at("anyOf")) {
            const std::string fault = faultOf(value, choice, where);
            if (fault.empty())
                return {};
            faults += fault + "; ";
        }
        return faults;
    }
    if (rules.contains("const") && value != rules.at("const"))
        return where + ": " + value.dump() + " is not " + rules.at("const").dump();
    if (rules.contains("enum") &&
        std::find(rules.at("enum").begin(), rules.at("enum").end(), value) == rules.at("enum").end())
        return where + ": " + value.dump() + " is none of the words";
    if (rules.contains("type") && !isOfType(value, rules.at("type")))
        return where + ": " + value.dump() + " is no " + rules.at("type").get<std::string>();
    if (rules.contains("minimum") && value < rules.at("minimum"))
        return where + ": " + value.dump() + " is too small";
    if (rules.contains("pattern") &&
        !std::regex_search(value.get<std::string>(), std::regex(rules.at("pattern").get<std::string>())))
        return where + ": " + value.dump() + " has not the form";
    if (rules.contains("items")) {
        for (std::size_t index = 0; index < value.size(); ++index) {
            const std::string fault = faultOf(value[index], rules.at("items"), where + "/" + std::to_string(index));
            if (!fault.empty())
                return fault;
        }
    }
    for (const json& key : rules.value("required", json::array())) {
        if (!value.contains(key.get<std::string>()))
            return where + ": " + key.dump() + " is missing";
    }
    if (!rules.contains("properties"))
        return {};
    for (const auto& [key, entry] : value.items()) {
        if (rules.at("properties").contains(key)) {
            const std::string fault = faultOf(entry, rules.at("properties").at(key), where + "/" + key);
            if (!fault.empty())
                return fault;
        } else if (rules.value("additionalProperties", json(true)) == json(false)) {
            return where + ": " + key + " stands in no rule";
        }
    }
    return {};
}

} // namespace cadrel::tests
