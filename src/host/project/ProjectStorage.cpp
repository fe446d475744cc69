// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/serialize/ByteArchive.h"
#include "host/border/FirstFailure.h"
#include "host/border/HostFailure.h"
#include "host/project/FramerateScope.h"
#include "host/project/Project.h"
#include "util/Result.h"
#include "velmark/Attributes.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"

#include <cstdint>
#include <limits>
#include <optional>
#include <string>
#include <vector>

using namespace Velmark;
using cadrel::core::serialize::ByteArchive;
using cadrel::util::Result;

namespace cadrel::host {

// What is stored with the host's project:
//
//     "CaDr"   list of binary values
//                  "CaDrData"      the model
//                  "CaDrPreview"   while a preview is on: the CRC-32 of the previewed events, and as a text their bytes
//     "CaDs"   the CRC-32 of those bytes

namespace {

/// In the same list, so that both are replaced at one go.
constexpr const char* StoragePreview = "CaDrPreview";

Counted<IAttributeData> readList(IProjectNode& project)
{
    FVariant list;
    requireOk(project.getAttribute(AttributeKey::Storage, list));
    return required(query<IAttributeData>(list.asObject()));
}

ByteArchive readBlock(IAttributeData& list, const char* key)
{
    const int32 size = list.getBinarySize(key);
    if (size < 0)
        throw Result::HostCallFailed;
    std::vector<std::uint8_t> bytes(static_cast<std::size_t>(size));
    requireOk(list.getBinary(key, bytes.data(), size));
    ByteArchive block;
    block.assign(bytes.data(), bytes.size());
    return block;
}

void writeBlock(IAttributeData& list, const char* key, const ByteArchive& block)
{
    if (block.size() > static_cast<std::size_t>(std::numeric_limits<int32>::max()))
        throw Result::OutOfRange;
    requireOk(list.setBinary(key, block.data(), static_cast<int32>(block.size()), true));
}

std::uint32_t readChecksum(IProjectNode& project)
{
    FVariant checksum;
    requireOk(project.getAttribute(AttributeKey::StorageChecksum, checksum));
    return static_cast<std::uint32_t>(checksum.asInteger());
}

/// The two attributes, which belong together.
struct Stored {
    FVariant list;
    FVariant checksum;
};

/// Nothing where one of them isn't there or can't be one that was stored.
std::optional<Stored> storedIn(IProjectNode& project)
{
    Stored stored;
    if (project.hasAttribute(AttributeKey::Storage) != ResultOk ||
        project.hasAttribute(AttributeKey::StorageChecksum) != ResultOk ||
        project.getAttribute(AttributeKey::Storage, stored.list) != ResultOk ||
        project.getAttribute(AttributeKey::StorageChecksum, stored.checksum) != ResultOk || !stored.list.isObject() ||
        !stored.checksum.isInteger())
        return std::nullopt;
    return stored;
}

bool isKept(IProjectNode& project, const Stored& stored)
{
    return project.setAttribute(AttributeKey::Storage, stored.list, true) == ResultOk &&
           project.setAttribute(AttributeKey::StorageChecksum, stored.checksum, true) == ResultOk;
}

/// Puts what is stored aside, for the program of another version that wrote it. Throws Result::HostCallFailed when the host
/// doesn't keep both.
void keepAside(IProjectNode& project)
{
    if (const std::optional<Stored> stored = storedIn(project)) {
        requireOk(project.setAttribute(AttributeKey::OtherStorage, stored->list, true));
        requireOk(project.setAttribute(AttributeKey::OtherStorageChecksum, stored->checksum, true));
    }
}

/// Throws Result::HostCallFailed when the host doesn't keep both.
void replaceStored(IProjectNode& project, const Stored& stored)
{
    const std::optional<Stored> before = storedIn(project);
    if (isKept(project, stored))
        return;
    // A list with the checksum of another would count as damaged.
    if (!before || !isKept(project, *before)) {
        project.removeAttribute(AttributeKey::Storage);
        project.removeAttribute(AttributeKey::StorageChecksum);
    }
    throw Result::HostCallFailed;
}

} // namespace

void Project::load()
{
    FirstFailure failure;
    // First, so that a track that can't be handled doesn't let the next save replace what nobody has read.
    failure.ofStep([this] {
        const Result::Type result = resultOf([this] { readModel(); });
        m_hasReadModel = result == Result::Ok;
        m_isOfOtherVersion = result == Result::NewerVersion || result == Result::UnknownVersion;
        // The model has emptied itself, but for the VFX patterns that it has read.
        if (result != Result::Ok)
            m_model.settings() = core::Settings();
        requireSuccess(result);
    });
    failure.ofStep([this] { findLockedTracks(); });
    if (m_model.isPreviewActive()) {
        failure.ofStep([this] { findPreviewedTracks(); });
    } else {
        // There is no preview that the user could switch off. If a track can't be unlocked here, the next run unlocks
        // it.
        for (Track& track : m_lockedTracks)
            resultOf([&] { track.setLock(false); });
        std::erase_if(m_lockedTracks, [](const Track& track) { return !track.hasLockState(); });
        resultOf([this] { m_end.putBack(); });
    }
    failure.raise();
}

void Project::readModel()
{
    const auto project = root();
    if (project->hasAttribute(AttributeKey::Storage) != ResultOk)
        return;
    const auto list = readList(*project);
    ByteArchive block = readBlock(*list, AttributeKey::StorageData);
    if (readChecksum(*project) != block.crc32())
        throw Result::ChecksumMismatch;

    // The timecodes in the block are those of this project.
    const FramerateScope ownRate(*this);
    block >> m_model;
    if (!isPreviewing())
        return;
    if (resultOf([&] { readPreviewEvents(*list); }) != Result::Ok)
        m_previewEvents->clear();
    // Where nothing is known of the copies, they are compared with their memos.
    resultOf([this] { rememberMemos(); });
}

void Project::readPreviewEvents(IAttributeData& list)
{
    ByteArchive stored = readBlock(list, StoragePreview);
    std::uint32_t checksum = 0;
    std::string bytes;
    stored >> checksum >> bytes;
    ByteArchive events;
    events.assign(reinterpret_cast<const std::uint8_t*>(bytes.data()), bytes.size());
    if (events.crc32() != checksum)
        throw Result::ChecksumMismatch;
    events >> *m_previewEvents;
}

void Project::writePreviewEvents(IAttributeData& list) const
{
    if (!isPreviewing() || m_previewEvents->isEmpty())
        return;
    ByteArchive events;
    events << *m_previewEvents;
    ByteArchive stored;
    stored << events.crc32() << std::string(events.data(), events.data() + events.size());
    writeBlock(list, StoragePreview, stored);
}

void Project::save()
{
    const auto project = root();
    ByteArchive block;
    block << m_model;
    const auto list = required(create<IAttributeData>(m_hostContext));
    writeBlock(*list, AttributeKey::StorageData, block);
    if (m_isOfOtherVersion)
        keepAside(*project);
    m_isOfOtherVersion = false;
    FirstFailure failure;
    failure.ofStep([&] { writePreviewEvents(*list); });
    failure.ofStep([&] { replaceStored(*project, {FVariant::object(list.get()), FVariant::integer(block.crc32())}); });
    failure.raise();
}

} // namespace cadrel::host
