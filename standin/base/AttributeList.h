// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Attributes.h"
#include "velmark/Implements.h"

#include <map>
#include <string>
#include <vector>

namespace standin {

using Bytes = std::vector<Velmark::uint8>;

/// A list of binary values under keys.
class AttributeList : public Velmark::Implements<AttributeList, Velmark::FObject, Velmark::IAttributeData> {
public:
    static constexpr const char* ClassName = "AttributeList";

    Velmark::int32 setBinary(const char* key, const void* bytes, Velmark::int32 size, bool copy) override;
    Velmark::int32 getBinary(const char* key, void* buffer, Velmark::int32 size) override;
    Velmark::int32 getBinarySize(const char* key) override;

    const std::map<std::string, Bytes>& values() const { return m_values; }
    void set(const std::string& key, Bytes bytes) { m_values[key] = std::move(bytes); }

private:
    std::map<std::string, Bytes> m_values;
};

} // namespace standin
