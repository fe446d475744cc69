// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/project/StoredModel.h"

#include "app/edl/ProjectFramerate.h"
#include "app/project/ProjectAccess.h"
#include "core/serialize/ByteArchive.h"
#include "standin/base/AttributeList.h"
#include "standin/project/Project.h"
#include "standin/project/ProjectForm.h"
#include "velmark/Attributes.h"

#include <cstdint>
#include <variant>

namespace cadrel::app {

using core::DataModel;
using core::serialize::ByteArchive;
using standin::Attribute;
using standin::AttributeList;
using util::Result;
using Velmark::AttributeKey;

namespace {

const Attribute* find(const standin::Project& project, const char* key)
{
    const auto found = project.attributes().find(key);
    return found == project.attributes().end() ? nullptr : &found->second;
}

/// Throws Result::CorruptData.
ByteArchive blockIn(const Attribute& storage)
{
    const auto* const object = std::get_if<Velmark::Counted<Velmark::FUnknown>>(&storage.value);
    const auto* const list = object ? dynamic_cast<const AttributeList*>(object->get()) : nullptr;
    if (!list || !list->values().contains(AttributeKey::StorageData))
        throw Result::CorruptData;
    const standin::Bytes& bytes = list->values().at(AttributeKey::StorageData);
    ByteArchive block;
    block.assign(bytes.data(), bytes.size());
    return block;
}

/// Throws Result::CorruptData.
std::uint32_t checksumIn(const standin::Project& project)
{
    const Attribute* const checksum = find(project, AttributeKey::StorageChecksum);
    if (!checksum)
        throw Result::CorruptData;
    const auto* const number = std::get_if<Velmark::int64>(&checksum->value);
    return number ? static_cast<std::uint32_t>(*number) : 0;
}

} // namespace

StoredModel::StoredModel(const standin::Project& project, const ProjectClock& clock)
{
    if (project.form() && project.form()->hasBrokenStorage()) {
        m_failure = Result::CorruptData;
        return;
    }
    const Attribute* const storage = find(project, AttributeKey::Storage);
    if (!storage)
        return;
    try {
        ByteArchive block = blockIn(*storage);
        if (checksumIn(project) != block.crc32())
            throw Result::ChecksumMismatch;
        const ProjectFramerate rate(clock.framerate());
        auto model = std::make_unique<DataModel>();
        block >> *model;
        m_model = std::move(model);
    } catch (Result::Type failure) {
        m_failure = failure;
    }
}

std::string StoredModel::fault() const
{
    const std::string data = "Cadrel's data in it ";
    switch (*m_failure) {
    case Result::NewerVersion:
        return data + "was written by a newer version";
    case Result::UnknownVersion:
        return data + "was written by a version that is too old";
    case Result::ChecksumMismatch:
        return data + "is damaged: its checksum doesn't fit";
    case Result::EndOfData:
        return data + "is damaged: it ends too early";
    default:
        return data + "is damaged";
    }
}

std::string StoredModel::remedy() const
{
    const bool isOfOtherVersion = isOfNewerVersion() || m_failure == Result::UnknownVersion;
    return std::string(isOfOtherVersion ? "use the version that wrote it" : "take an intact copy") +
           ", or begin anew with --fresh";
}

SettingsReport settingsIn(const DataModel& model, const standin::Project& project, const ProjectClock& clock)
{
    return {model.settings(), GivenSettings(), true, timeText(project, clock)};
}

} // namespace cadrel::app
