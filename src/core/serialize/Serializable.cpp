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
    archive << version_;
    write(archive);
}

void Serializable::deserialize(ByteArchive& archive)
{
    std::uint32_t streamVersion = 0;
    archive >> streamVersion;
    if (streamVersion > version_)
        throw Result::NewerVersion;
    if (streamVersion == version_)
        readCurrent(archive);
    else
        readOlder(archive, streamVersion);
}

} // namespace cadrel::core::serialize
