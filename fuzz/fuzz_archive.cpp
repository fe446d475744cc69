// SPDX-License-Identifier: GPL-3.0-or-later

// The archive reading a data model of any version from any bytes.

#include "core/edl/EventBase.h"
#include "core/edl/HealedEvent.h"
#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "fuzz/Check.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/TestProject.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace {

using namespace cadrel;
using fuzz::check;
using Bytes = std::vector<std::uint8_t>;

core::serialize::ByteArchive archiveOf(const Bytes& bytes)
{
    core::serialize::ByteArchive archive;
    archive.assign(bytes.data(), bytes.size());
    return archive;
}

Bytes write(const core::serialize::Serializable& object)
{
    core::serialize::ByteArchive archive;
    archive << object;
    return Bytes(archive.data(), archive.data() + archive.size());
}

util::Result::Type read(const Bytes& bytes, core::DataModel& model)
{
    core::serialize::ByteArchive archive = archiveOf(bytes);
    return tests::thrownBy([&] { archive >> model; });
}

/// Whether the single bytes of the current version can hold a timecode; those of old versions are wider.
bool fitsIntoBytes(const core::Timecode& timecode)
{
    const auto fits = [](std::int32_t field) { return field >= 0 && field <= 255; };
    return fits(timecode.hours()) && fits(timecode.minutes()) && fits(timecode.seconds()) && fits(timecode.frames());
}

bool fitsIntoBytes(const core::EventList& events)
{
    return std::all_of(events.events().begin(), events.events().end(), [](const auto& event) {
        const auto* healed = dynamic_cast<const core::HealedEvent*>(event.get());
        return fitsIntoBytes(event->srcIn()) && fitsIntoBytes(event->srcOut()) && fitsIntoBytes(event->dstIn()) &&
               fitsIntoBytes(event->dstOut()) && (healed == nullptr || fitsIntoBytes(healed->healedEvents()));
    });
}

bool fitsIntoBytes(const core::DataModel& model)
{
    const auto& videos = model.videoList().entries();
    return fitsIntoBytes(model.oldEdl()) && fitsIntoBytes(model.newEdl()) && fitsIntoBytes(model.changeEdl()) &&
           std::all_of(videos.begin(), videos.end(),
                       [](const auto& video) { return fitsIntoBytes(video.start) && fitsIntoBytes(video.length); });
}

void checkReadAgain(const core::DataModel& model)
{
    const Bytes first = write(model);
    core::DataModel again;
    check(read(first, again) == util::Result::Ok, "what was written can be read");
    const Bytes second = write(again);
    check(first == second || !fitsIntoBytes(model), "a model survives the archive byte for byte");

    core::DataModel last;
    check(read(second, last) == util::Result::Ok, "what was written twice can be read");
    check(write(last) == second, "a model of the current version survives the archive byte for byte");
}

void checkEmpty(const core::DataModel& model)
{
    check(model.oldEdl().isEmpty() && model.newEdl().isEmpty() && model.changeEdl().isEmpty(),
          "a failed read leaves no events");
    check(model.videoList().isEmpty(), "a failed read leaves no videos");
    core::DataModel fresh;
    for (std::size_t row = 0; row < core::Settings::VfxRowCount; ++row)
        fresh.settings().setVfxPattern(model.settings().vfxPattern(row), row);
    check(write(model) == write(fresh), "a failed read leaves a fresh model, but for the pattern rows");
}

/// A snapshot brings back everything but the settings.
void checkRestore(const Bytes& bytes, util::Result::Type readResult)
{
    core::DataModel model;
    model.settings().setMatchBy(core::MatchBy::ClipName);
    model.settings().setCreateOverlapMarkers(false);
    const Bytes settings = write(model.settings());

    core::serialize::ByteArchive archive = archiveOf(bytes);
    const util::Result::Type result = tests::thrownBy([&] { model.restore(archive); });

    check(result == readResult, "a snapshot is read like a stored model");
    check(write(model.settings()) == settings, "a snapshot leaves the settings alone");
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    static const tests::TestProject project{core::Framerate(25, 0)};
    const Bytes bytes(data, data + size);

    core::DataModel model;
    const util::Result::Type result = read(bytes, model);
    if (result == util::Result::Ok)
        checkReadAgain(model);
    else
        checkEmpty(model);
    checkRestore(bytes, result);
    return 0;
}
