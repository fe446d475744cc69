#include "core/Variant.h"

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

Variant::Variant(bool value) : Serializable(PersistenceVersion), valueType_(Bool), number_(value ? 1.0 : 0.0) {}

Variant::Variant(std::int32_t value) : Serializable(PersistenceVersion), valueType_(Integer), number_(value) {}

Variant::Variant(float value) : Serializable(PersistenceVersion), valueType_(Float), number_(value) {}

Variant::Variant(const std::string& value) : Serializable(PersistenceVersion), valueType_(String), text_(value) {}

Variant::Variant(const char* value) : Variant(std::string(value)) {}

Variant::Variant(double value) : Serializable(PersistenceVersion), valueType_(Double), number_(value) {}

bool Variant::toBool() const
{
    return number_ != 0.0;
}

std::int32_t Variant::toInt() const
{
    if (std::isnan(number_))
        return 0;
    constexpr double Lowest = std::numeric_limits<std::int32_t>::min();
    constexpr double Highest = std::numeric_limits<std::int32_t>::max();
    return static_cast<std::int32_t>(std::clamp(number_, Lowest, Highest));
}

float Variant::toFloat() const
{
    return static_cast<float>(number_);
}

double Variant::toDouble() const
{
    return number_;
}

const std::string& Variant::toText() const
{
    return text_;
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

    valueType_ = type;
    number_ = number;
    text_ = std::move(text);
}

void Variant::write(ByteArchive& archive) const
{
    archive << valueType_;
    if (valueType_ == String)
        archive << text_;
    else if (valueType_ == Double)
        archive << number_;
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
