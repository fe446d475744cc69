// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/JsonSchema.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <valijson/adapters/nlohmann_json_adapter.hpp>
#include <valijson/schema.hpp>
#include <valijson/schema_parser.hpp>
#include <valijson/validator.hpp>

namespace cadrel::tests {

using nlohmann::json;
using valijson::adapters::NlohmannJsonAdapter;

namespace {

json documentOf(const std::string& file)
{
    return json::parse(contentOf(treePath(std::string("docs/").append(file))));
}

} // namespace

struct JsonSchema::Rules {
    valijson::Schema schema;
};

JsonSchema::JsonSchema(const std::string& name) : m_rules(std::make_unique<Rules>())
{
    const json document = documentOf(name + ".schema.json");
    valijson::SchemaParser(valijson::SchemaParser::kDraft7)
        .populateSchema(
            NlohmannJsonAdapter(document), m_rules->schema,
            [](const std::string& file) { return std::make_unique<json>(documentOf(file)).release(); },
            [](const json* fetched) { std::unique_ptr<const json>{fetched}; });
}

JsonSchema::~JsonSchema() = default;

std::string JsonSchema::faultOf(const json& document) const
{
    valijson::Validator validator(valijson::Validator::kStrongTypes);
    valijson::ValidationResults results;
    if (validator.validate(m_rules->schema, NlohmannJsonAdapter(document), &results))
        return {};
    std::string faults;
    for (valijson::ValidationResults::Error error; results.popError(error);) {
        for (const std::string& place : error.context)
            faults += place;
        faults.append(": ").append(error.description).append("\n");
    }
    return faults.empty() ? "no fault is told\n" : faults;
}

} // namespace cadrel::tests
