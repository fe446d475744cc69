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
#include <vector>

using namespace Velmark;
using cadrel::core::serialize::ByteArchive;
using cadrel::util::Result;

namespace cadrel::host {

// What is stored with the host's project:
//
//     "CaDr"   list of binary values
//                  "CaDrData"   the model
//     "CaDs"   the CRC-32 of those bytes

namespace {

ByteArchive readBlock(IProjectNode& project)
{
    FVariant list;
    requireOk(project.getAttribute(AttributeKey::Storage, list));
    const auto data = required(query<IAttributeData>(list.asObject()));
    const int32 size = data->getBinarySize(AttributeKey::StorageData);
    if (size < 0)
        throw Result::HostCallFailed;
    std::vector<std::uint8_t> bytes(static_cast<std::size_t>(size));
    requireOk(data->getBinary(AttributeKey::StorageData, bytes.data(), size));
    ByteArchive block;
    block.assign(bytes.data(), bytes.size());
    return block;
}

std::uint32_t readChecksum(IProjectNode& project)
{
    FVariant checksum;
    requireOk(project.getAttribute(AttributeKey::StorageChecksum, checksum));
    return static_cast<std::uint32_t>(checksum.asInteger());
}

} // namespace

void Project::load()
{
    findLockedTracks();
    FirstFailure failure;
    failure.ofStep([this] { readModel(); });
    if (!m_model.isPreviewActive()) {
        // There is no preview that the user could switch off. If a track can't be unlocked here, the next run unlocks
        // it.
        for (Track& track : m_lockedTracks)
            resultOf([&] { track.setLock(false); });
        std::erase_if(m_lockedTracks, [](const Track& track) { return !track.hasLockState(); });
    }
    failure.raise();
}

void Project::readModel()
{
    const auto project = root();
    if (project->hasAttribute(AttributeKey::Storage) != ResultOk)
        return;
    ByteArchive block = readBlock(*project);
    if (readChecksum(*project) != block.crc32())
        throw Result::ChecksumMismatch;

    // The timecodes in the block are those of this project.
    const FramerateScope ownRate(*this);
    block >> m_model;
}

void Project::save()
{
    const auto project = root();
    project->removeAttribute(AttributeKey::Storage);
    project->removeAttribute(AttributeKey::StorageChecksum);

    ByteArchive block;
    block << m_model;
    if (block.size() > static_cast<std::size_t>(std::numeric_limits<int32>::max()))
        throw Result::OutOfRange;
    const auto list = required(create<IAttributeData>(m_hostContext));
    requireOk(list->setBinary(AttributeKey::StorageData, block.data(), static_cast<int32>(block.size()), true));
    requireOk(project->setAttribute(AttributeKey::Storage, FVariant::object(list.get()), true));
    const int32 result = project->setAttribute(AttributeKey::StorageChecksum, FVariant::integer(block.crc32()), true);
    // A block without a checksum would count as damaged.
    if (result != ResultOk)
        project->removeAttribute(AttributeKey::Storage);
    requireOk(result);
}

} // namespace cadrel::host
