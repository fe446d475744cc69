// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/serialize/Serializable.h"

#include <cstdint>
#include <string>

namespace cadrel::core {

/// A small typed value of the data model's property map. All numbers live in one double; a text has the number 0, and a
/// number an empty text.
class Variant : public serialize::Serializable {
public:
    enum Type : std::int32_t { None = -1, Bool = 0, Integer = 1, Float = 2, String = 3, Double = 4 };

    Variant();
    explicit Variant(bool value);
    explicit Variant(std::int32_t value);
    explicit Variant(float value);
    explicit Variant(const std::string& value);
    explicit Variant(const char* value);
    explicit Variant(double value);

    std::int32_t valueType() const { return m_valueType; }

    /// The conversions don't look at the type: a string gives 0 as a number, a number an empty text.
    bool toBool() const;
    /// Truncates; a number beyond 32 bits gives the nearest that fits, and NaN gives 0.
    std::int32_t toInt() const;
    float toFloat() const;
    double toDouble() const;
    const std::string& toText() const;

    /// An unknown type is taken as a string.
    void readCurrent(serialize::ByteArchive& archive) override;
    /// An integer keeps only the 24 bits of a 32-bit float's mantissa.
    void write(serialize::ByteArchive& archive) const override;
    void readOlder(serialize::ByteArchive& archive, std::uint32_t version) override;

private:
    std::int32_t m_valueType = None;
    double m_number = 0.0;
    std::string m_text;
};

} // namespace cadrel::core
