// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::core::serialize {

class Serializable;

/// A growable array of bytes with a read position: the flat form of the whole model.
///
/// All numbers are little-endian, without padding or alignment:
///
///     u8, bool       1 byte; a bool is written as 0 or 1 and read as true for any other byte than 0
///     i32, u32, f32  4 bytes, two's complement, IEEE 754
///     f64            8 bytes, IEEE 754
///     string         i32 byte count n, then n bytes, no terminator
///     object         u32 version of the writer's class, then the class's body
///
/// A read that needs more bytes than are left throws Result::EndOfData and leaves the position as it was, except that a
/// string's count has then been passed.
class ByteArchive {
public:
    /// Empties the bytes; the position is 0 again.
    void clear();
    /// The next read starts at the first byte.
    void rewind();
    std::size_t size() const { return m_bytes.size(); }
    /// Null when empty.
    const std::uint8_t* data() const { return m_bytes.empty() ? nullptr : m_bytes.data(); }
    /// Replaces the content with a copy of `size` bytes; the position is 0 again.
    void assign(const std::uint8_t* bytes, std::size_t size);

    /// The CRC-32 of IEEE 802.3 over all bytes; 0 when empty.
    std::uint32_t crc32() const;

    std::size_t bytesLeft() const { return m_readPosition < m_bytes.size() ? m_bytes.size() - m_readPosition : 0; }
    bool hasBytes(std::size_t count) const { return count <= bytesLeft(); }
    /// Throws Result::EndOfData when fewer than `count` bytes are left.
    void ensureBytes(std::size_t count) const;

    ByteArchive& operator<<(std::uint8_t value);
    ByteArchive& operator<<(bool value);
    ByteArchive& operator<<(std::int32_t value);
    ByteArchive& operator<<(std::uint32_t value);
    ByteArchive& operator<<(float value);
    ByteArchive& operator<<(double value);
    /// Throws Result::OutOfRange for a text of more than 2^31 - 1 bytes.
    ByteArchive& operator<<(const std::string& text);
    ByteArchive& operator<<(const Serializable& object);
    /// A pointer would turn into a bool.
    ByteArchive& operator<<(const void* pointer) = delete;

    ByteArchive& operator>>(std::uint8_t& value);
    ByteArchive& operator>>(bool& value);
    ByteArchive& operator>>(std::int32_t& value);
    ByteArchive& operator>>(std::uint32_t& value);
    ByteArchive& operator>>(float& value);
    ByteArchive& operator>>(double& value);
    ByteArchive& operator>>(std::string& text);
    /// Throws what Serializable::deserialize throws.
    ByteArchive& operator>>(Serializable& object);

    /// Writes the element count of a container. Throws Result::OutOfRange above 2^31 - 1.
    void writeCount(std::size_t count);
    /// Reads the element count of a container: a signed 32-bit number, of which all below 1 mean empty. The count is
    /// not to be trusted: reserve no more than `bytesLeft` could hold.
    std::size_t readCount();

private:
    void appendBytes(std::uint64_t value, std::size_t byteCount);
    std::uint64_t takeBytes(std::size_t byteCount);

    std::vector<std::uint8_t> m_bytes;
    std::size_t m_readPosition = 0;
};

} // namespace cadrel::core::serialize
