// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "standin/base/AttributeList.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"

#include <cstdint>
#include <filesystem>
#include <memory>
#include <optional>
#include <vector>

namespace cadrel::tests {

/// What a module has stored in a project: its block, and the checksum beside it.
struct StoredModel {
    std::vector<std::uint8_t> block;
    std::int64_t checksum = 0;

    bool operator==(const StoredModel&) const = default;

    /// With the checksum that belongs to it.
    static StoredModel ofBlock(std::vector<std::uint8_t> block)
    {
        const std::uint32_t checksum = archiveOf(block).crc32();
        return {std::move(block), checksum};
    }
    static StoredModel of(const core::DataModel& model)
    {
        core::serialize::ByteArchive archive;
        archive << model;
        return ofBlock(bytesOf(archive));
    }

    /// Nothing where one of the two attributes isn't there.
    static std::optional<StoredModel> in(Velmark::IProjectNode& project,
                                         const char* key = Velmark::AttributeKey::Storage,
                                         const char* checksumKey = Velmark::AttributeKey::StorageChecksum)
    {
        Velmark::FVariant value;
        Velmark::FVariant checksum;
        if (project.getAttribute(key, value) != Velmark::ResultOk ||
            project.getAttribute(checksumKey, checksum) != Velmark::ResultOk)
            return std::nullopt;
        const auto* const list = dynamic_cast<standin::AttributeList*>(value.asObject());
        return StoredModel{list ? list->values().at(Velmark::AttributeKey::StorageData) : std::vector<std::uint8_t>(),
                           checksum.asInteger()};
    }
    static std::optional<StoredModel> inFile(const std::filesystem::path& file)
    {
        standin::Application host;
        return in(host.openProject(file));
    }
    /// What was put aside of another version.
    static std::optional<StoredModel> asideInFile(const std::filesystem::path& file)
    {
        standin::Application host;
        return in(host.openProject(file), Velmark::AttributeKey::OtherStorage,
                  Velmark::AttributeKey::OtherStorageChecksum);
    }

    void putInto(Velmark::IProjectNode& project) const
    {
        const auto list = Velmark::makeCounted<standin::AttributeList>();
        list->set(Velmark::AttributeKey::StorageData, block);
        project.setAttribute(Velmark::AttributeKey::Storage,
                             Velmark::FVariant::object(Velmark::query<Velmark::IAttributeData>(list).get()), true);
        project.setAttribute(Velmark::AttributeKey::StorageChecksum, Velmark::FVariant::integer(checksum), true);
    }
};

} // namespace cadrel::tests
