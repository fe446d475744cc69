// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/serialize/ByteArchive.h"

#include "core/serialize/Serializable.h"
#include "util/Result.h"

#include <array>
#include <bit>
#include <limits>

namespace cadrel::core::serialize {

using util::Result;

namespace {

constexpr std::array<std::uint32_t, 256> makeCrcTable()
{
    std::array<std::uint32_t, 256> table{};
    for (std::uint32_t index = 0; index < table.size(); ++index) {
        std::uint32_t value = index;
        for (int bit = 0; bit < 8; ++bit)
            value = (value & 1U) != 0 ? (value >> 1U) ^ 0xEDB88320U : value >> 1U;
        table[index] = value;
    }
    return table;
}

} // namespace

void ByteArchive::clear()
{
    m_bytes.clear();
    m_readPosition = 0;
}

void ByteArchive::rewind()
{
    m_readPosition = 0;
}

void ByteArchive::assign(const std::uint8_t* bytes, std::size_t size)
{
    m_bytes = size == 0 ? std::vector<std::uint8_t>() : std::vector<std::uint8_t>(bytes, bytes + size);
    m_readPosition = 0;
}

std::uint32_t ByteArchive::crc32() const
{
    static constexpr auto Table = makeCrcTable();
    if (m_bytes.empty())
        return 0;
    std::uint32_t crc = 0xFFFFFFFFU;
    for (const std::uint8_t byte : m_bytes)
        crc = Table[(crc ^ byte) & 0xFFU] ^ (crc >> 8U);
    return ~crc;
}

void ByteArchive::ensureBytes(std::size_t count) const
{
    if (!hasBytes(count))
        throw Result::EndOfData;
}

void ByteArchive::appendBytes(std::uint64_t value, std::size_t byteCount)
{
    // At once, as a model has millions of numbers.
    std::array<std::uint8_t, sizeof value> bytes{};
    for (std::size_t index = 0; index < bytes.size(); ++index)
        bytes[index] = static_cast<std::uint8_t>(value >> (8 * index));
    m_bytes.insert(m_bytes.end(), bytes.data(), bytes.data() + byteCount);
}

std::uint64_t ByteArchive::takeBytes(std::size_t byteCount)
{
    ensureBytes(byteCount);
    std::uint64_t value = 0;
    for (std::size_t index = 0; index < byteCount; ++index)
        value |= static_cast<std::uint64_t>(m_bytes[m_readPosition + index]) << (8 * index);
    m_readPosition += byteCount;
    return value;
}

ByteArchive& ByteArchive::operator<<(std::uint8_t value)
{
    m_bytes.push_back(value);
    return *this;
}

ByteArchive& ByteArchive::operator<<(bool value)
{
    m_bytes.push_back(value ? 1 : 0);
    return *this;
}

ByteArchive& ByteArchive::operator<<(std::int32_t value)
{
    return *this << static_cast<std::uint32_t>(value);
}

ByteArchive& ByteArchive::operator<<(std::uint32_t value)
{
    appendBytes(value, 4);
    return *this;
}

ByteArchive& ByteArchive::operator<<(float value)
{
    return *this << std::bit_cast<std::uint32_t>(value);
}

ByteArchive& ByteArchive::operator<<(double value)
{
    appendBytes(std::bit_cast<std::uint64_t>(value), 8);
    return *this;
}

ByteArchive& ByteArchive::operator<<(const std::string& text)
{
    writeCount(text.size());
    m_bytes.insert(m_bytes.end(), text.begin(), text.end());
    return *this;
}

ByteArchive& ByteArchive::operator<<(const Serializable& object)
{
    object.serialize(*this);
    return *this;
}

ByteArchive& ByteArchive::operator>>(std::uint8_t& value)
{
    value = static_cast<std::uint8_t>(takeBytes(1));
    return *this;
}

ByteArchive& ByteArchive::operator>>(bool& value)
{
    value = takeBytes(1) != 0;
    return *this;
}

ByteArchive& ByteArchive::operator>>(std::int32_t& value)
{
    value = static_cast<std::int32_t>(static_cast<std::uint32_t>(takeBytes(4)));
    return *this;
}

ByteArchive& ByteArchive::operator>>(std::uint32_t& value)
{
    value = static_cast<std::uint32_t>(takeBytes(4));
    return *this;
}

ByteArchive& ByteArchive::operator>>(float& value)
{
    value = std::bit_cast<float>(static_cast<std::uint32_t>(takeBytes(4)));
    return *this;
}

ByteArchive& ByteArchive::operator>>(double& value)
{
    value = std::bit_cast<double>(takeBytes(8));
    return *this;
}

ByteArchive& ByteArchive::operator>>(std::string& text)
{
    std::int32_t count = 0;
    *this >> count;
    if (count < 0)
        throw Result::EndOfData;
    const auto length = static_cast<std::size_t>(count);
    ensureBytes(length);
    const auto first = m_bytes.begin() + static_cast<std::ptrdiff_t>(m_readPosition);
    text.assign(first, first + count);
    m_readPosition += length;
    return *this;
}

ByteArchive& ByteArchive::operator>>(Serializable& object)
{
    object.deserialize(*this);
    return *this;
}

void ByteArchive::writeCount(std::size_t count)
{
    if (count > static_cast<std::size_t>(std::numeric_limits<std::int32_t>::max()))
        throw Result::OutOfRange;
    *this << static_cast<std::uint32_t>(count);
}

std::size_t ByteArchive::readCount()
{
    std::int32_t count = 0;
    *this >> count;
    return count < 1 ? 0 : static_cast<std::size_t>(count);
}

} // namespace cadrel::core::serialize
