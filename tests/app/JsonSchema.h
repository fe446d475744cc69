// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <nlohmann/json.hpp>
#include <string>

namespace cadrel::tests {

/// Holds JSON against a schema (JSON Schema, draft 2020-12), of which it knows the words that the schemas in docs use. A
/// word that it doesn't know is an error, so that no rule is passed over.
class JsonSchema {
public:
    explicit JsonSchema(nlohmann::json schema) : m_schema(std::move(schema)) {}

    /// What is wrong first, and where; empty when nothing is.
    std::string faultOf(const nlohmann::json& value) const { return faultOf(value, m_schema, "#"); }

private:
    std::string faultOf(const nlohmann::json& value, const nlohmann::json& rules, const std::string& where) const;

    nlohmann::json m_schema;
};

} // namespace cadrel::tests
