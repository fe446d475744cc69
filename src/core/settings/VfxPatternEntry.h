// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/serialize/Serializable.h"

#include <string>

namespace cadrel::core {

/// One row of the VFX handling table: the texts around the version number of a VFX shot's name.
class VfxPatternEntry : public serialize::Serializable {
public:
    VfxPatternEntry();
    VfxPatternEntry(std::string prefix, std::string postfix, bool enabled);

    bool operator==(const VfxPatternEntry& other) const;

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;

    std::string prefix;
    std::string postfix;
    bool enabled = false;
};

} // namespace cadrel::core
