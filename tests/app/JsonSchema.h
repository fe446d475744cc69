// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <memory>
#include <nlohmann/json.hpp>
#include <string>

namespace cadrel::tests {

/// A JSON schema in docs. The words that these schemas use mean the same in the drafts from 7 on.
class JsonSchema {
public:
    /// The one of `docs/NAME.schema.json`, with those that it refers to. Throws std::runtime_error for a schema that can't
    /// be one.
    explicit JsonSchema(const std::string& name);
    ~JsonSchema();

    /// What is wrong with a document, and where; empty when nothing is.
    std::string faultOf(const nlohmann::json& document) const;

private:
    struct Rules;
    std::unique_ptr<Rules> m_rules;
};

} // namespace cadrel::tests
