// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace cadrel::core::serialize {

class ByteArchive;

/// An object that can be written to a stream and read again. Its version number comes first, so that newer code can
/// read what older code wrote.
class Serializable {
public:
    virtual ~Serializable() = default;

    /// Reads a body of the running code's version.
    virtual void readCurrent(ByteArchive& archive) = 0;
    /// Appends the body in the running code's version.
    virtual void write(ByteArchive& archive) const = 0;
    /// Reads a body of an older version; the default throws Result::NotSupported. Throws Result::UnknownVersion for a
    /// version that the class doesn't handle.
    virtual void readOlder(ByteArchive& archive, std::uint32_t version);

    /// Appends the version number and the body.
    void serialize(ByteArchive& archive) const;
    /// Reads the version number and the body in that version. Throws Result::NewerVersion when the stream's version is
    /// greater than the code's.
    void deserialize(ByteArchive& archive);

    /// The version that the running code writes; reading doesn't change it.
    std::uint32_t version() const { return m_version; }

protected:
    explicit Serializable(std::uint32_t version) : m_version(version) {}
    Serializable(const Serializable&) = default;
    /// The version belongs to the class, not to the value.
    Serializable& operator=(const Serializable&) { return *this; }

private:
    std::uint32_t m_version;
};

} // namespace cadrel::core::serialize
