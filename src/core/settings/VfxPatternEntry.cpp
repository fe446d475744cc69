// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/settings/VfxPatternEntry.h"

#include "core/serialize/ByteArchive.h"

#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;

namespace {

constexpr std::uint32_t PersistenceVersion = 0;

} // namespace

VfxPatternEntry::VfxPatternEntry() : Serializable(PersistenceVersion) {}

VfxPatternEntry::VfxPatternEntry(std::string newPrefix, std::string newPostfix, bool isEnabled)
    : Serializable(PersistenceVersion), prefix(std::move(newPrefix)), postfix(std::move(newPostfix)), enabled(isEnabled)
{
}

bool VfxPatternEntry::operator==(const VfxPatternEntry& other) const
{
    return prefix == other.prefix && postfix == other.postfix && enabled == other.enabled;
}

void VfxPatternEntry::readCurrent(ByteArchive& archive)
{
    archive >> prefix >> postfix >> enabled;
}

void VfxPatternEntry::write(ByteArchive& archive) const
{
    archive << prefix << postfix << enabled;
}

} // namespace cadrel::core
