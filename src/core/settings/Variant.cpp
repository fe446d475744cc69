// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/Variant.h"

#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;

namespace {

constexpr std::uint32_t PersistenceVersion = 1;

} // namespace

Variant::Variant() : Serializable(PersistenceVersion) {}

Variant::Variant(bool value) : Serializable(PersistenceVersion), m_valueType(Bool), m_number(value ? 1.0 : 0.0) {}

Variant::Variant(std::int32_t value) : Serializable(PersistenceVersion), m_valueType(Integer), m_number(value) {}

Variant::Variant(float value) : Serializable(PersistenceVersion), m_valueType(Float), m_number(value) {}

Variant::Variant(const std::string& value) : Serializable(PersistenceVersion), m_valueType(String), m_text(value) {}

Variant::Variant(const char* value) : Variant(std::string(value)) {}

Variant::Variant(double value) : Serializable(PersistenceVersion), m_valueType(Double), m_number(value) {}

bool Variant::toBool() const
{
    return m_number != 0.0;
}

std::int32_t Variant::toInt() const
{
    if (std::isnan(m_number))
        return 0;
    constexpr double Lowest = std::numeric_limits<std::int32_t>::min();
    constexpr double Highest = std::numeric_limits<std::int32_t>::max();
    return static_cast<std::int32_t>(std::clamp(m_number, Lowest, Highest));
}

float Variant::toFloat() const
{
    return static_cast<float>(m_number);
}

double Variant::toDouble() const
{
    return m_number;
}

const std::string& Variant::toText() const
{
    return m_text;
}

void Variant::readCurrent(ByteArchive& archive)
{
    std::int32_t type = None;
    archive >> type;
    if (type < None || type > Double)
        type = String;

    float narrow = 0.0F;
    double number = 0.0;
    std::string text;
    if (type == String) {
        archive >> text;
    } else if (type == Double) {
        archive >> number;
    } else {
        archive >> narrow;
        number = narrow;
    }

    m_valueType = type;
    m_number = number;
    m_text = std::move(text);
}

void Variant::write(ByteArchive& archive) const
{
    archive << m_valueType;
    if (m_valueType == String)
        archive << m_text;
    else if (m_valueType == Double)
        archive << m_number;
    else
        archive << toFloat();
}

void Variant::readOlder(ByteArchive& archive, std::uint32_t version)
{
    if (version != 0)
        throw Result::UnknownVersion;
    readCurrent(archive);
}

} // namespace cadrel::core
