// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/serialize/Serializable.h"

#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

namespace cadrel::core::serialize {

using util::Result;

void Serializable::readOlder(ByteArchive&, std::uint32_t)
{
    throw Result::NotSupported;
}

void Serializable::serialize(ByteArchive& archive) const
{
    archive << m_version;
    write(archive);
}

void Serializable::deserialize(ByteArchive& archive)
{
    std::uint32_t streamVersion = 0;
    archive >> streamVersion;
    if (streamVersion > m_version)
        throw Result::NewerVersion;
    if (streamVersion == m_version)
        readCurrent(archive);
    else
        readOlder(archive, streamVersion);
}

} // namespace cadrel::core::serialize
