// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/Project.h"

#include "host/border/HostFailure.h"
#include "host/undo/DataModelEditStep.h"
#include "standin/base/AttributeList.h"
#include "tests/host/project/AlteredDocument.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/HostedModel.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <filesystem>
#include <map>
#include <memory>
#include <string>
#include <vector>

using namespace Velmark;
using cadrel::core::serialize::ByteArchive;
using cadrel::tests::archiveOf;
using cadrel::tests::bytesOf;
using cadrel::tests::makeEvent;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace cadrel::host {

using tests::AlteredContext;
using tests::AlteredDocument;
using tests::FakeProject;
using tests::TrackHost;

namespace {

using Bytes = std::vector<std::uint8_t>;

Bytes contentOf(const core::DataModel& model)
{
    return bytesOf(DataModelEditStep::snapshotOf(model));
}

/// A list of binary values that takes nothing and gives nothing.
class StubbornList : public Implements<StubbornList, FObject, IAttributeData> {
public:
    static constexpr const char* ClassName = "StubbornList";

    int32 setBinary(const char*, const void*, int32, bool) override { return ResultFalse; }
    int32 getBinary(const char*, void*, int32) override { return ResultFalse; }
    int32 getBinarySize(const char*) override { return 4; }
};

/// A project of a host that gives for attributes what it likes, and refuses to keep one.
struct UnreliableProject : FakeProject {
    UnreliableProject() : FakeProject(0.0) {}

    /// What is stored under all keys.
    FVariant value;
    bool isReadable = false; ///< whether it says so of all keys
    int32 readResult = ResultOk;
    std::string refusedKey; ///< once
    std::map<std::string, FVariant> kept;

    int32 hasAttribute(const char* key) override { return isReadable || kept.contains(key) ? ResultOk : ResultFalse; }
    int32 getAttribute(const char* key, FVariant& out) override
    {
        out = kept.contains(key) ? kept.at(key) : value;
        return readResult;
    }
    int32 setAttribute(const char* key, const FVariant& attribute, bool) override
    {
        if (key == refusedKey) {
            refusedKey.clear();
            return ResultFalse;
        }
        kept[key] = attribute;
        return ResultOk;
    }
    int32 removeAttribute(const char* key) override { return kept.erase(key) == 1 ? ResultOk : ResultFalse; }
};

/// A project with a track that isn't to be had as one. What is stored is that of another.
class UnusableTrackBesideStorage : public FakeProject {
public:
    explicit UnusableTrackBesideStorage(IProjectNode& stored) : FakeProject(0.0), m_stored(&stored)
    {
        children = withoutUsableTrack()->children;
        isTrack = false;
    }

    int32 setAttribute(const char* key, const FVariant& value, bool flag) override
    {
        return m_stored->setAttribute(key, value, flag);
    }
    int32 getAttribute(const char* key, FVariant& value) override { return m_stored->getAttribute(key, value); }
    int32 hasAttribute(const char* key) override { return m_stored->hasAttribute(key); }
    int32 removeAttribute(const char* key) override { return m_stored->removeAttribute(key); }

private:
    IProjectNode* m_stored;
};

class ProjectStorageTest : public testing::Test {
protected:
    void SetUp() override
    {
        core::DataModel& model = host.adapter.model();
        model.oldEdl().add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
        model.newEdl().add(makeEvent("A", "00:10:02:00", "00:10:10:00", "01:00:00:00", "01:00:08:00", 1));
        model.changeEdl().add(makeEvent("A", "01:00:02:00", "01:00:10:00", "01:00:00:00", "01:00:08:00", 1));
        model.setProperty(core::PropertyKey::PreviewOffset, core::Variant(86400.0));
        model.settings().setHealMode(core::HealMode::GapsWithInserts);
        model.videoList().add(
            core::VideoList::Entry("/video/reel.mov", core::Timecode("01:00:00:00"), core::Timecode("00:20:00:00")),
            false);
    }

    FVariant stored(const char* key)
    {
        FVariant value;
        host.root()->getAttribute(key, value);
        return value;
    }
    Bytes storedBlock()
    {
        const FVariant storage = stored(AttributeKey::Storage);
        const auto* const list = dynamic_cast<standin::AttributeList*>(storage.asObject());
        return list ? list->values().at(AttributeKey::StorageData) : Bytes();
    }

    void store(const Bytes& block) { store(block, archiveOf(block).crc32()); }
    void store(const Bytes& block, std::int64_t checksum)
    {
        const auto list = makeCounted<standin::AttributeList>();
        list->set(AttributeKey::StorageData, block);
        requireOk(host.root()->setAttribute(AttributeKey::Storage, FVariant::object(query<IAttributeData>(list).get()),
                                            true));
        requireOk(host.root()->setAttribute(AttributeKey::StorageChecksum, FVariant::integer(checksum), true));
    }

    /// What a project that the host opens throws at loading, with its model empty in any case.
    Result::Type loadFailure()
    {
        Project opened(host.context(), host.document());
        const Bytes fresh = contentOf(opened.model());
        const Result::Type failure = thrownBy([&] { opened.load(); });
        EXPECT_EQ(contentOf(opened.model()), fresh);
        return failure;
    }

    /// Stands for the project that is active meanwhile.
    cadrel::tests::TestProject timecodes;
    TrackHost host{0.0};
};

} // namespace

TEST_F(ProjectStorageTest, AProjectWithoutStoredDataStartsEmpty)
{
    EXPECT_EQ(loadFailure(), Result::Ok);
}

TEST_F(ProjectStorageTest, StoresTheModelAndItsChecksumUnderTheirKeys)
{
    host.adapter.save();

    EXPECT_EQ(storedBlock(), contentOf(host.adapter.model()));
    EXPECT_EQ(stored(AttributeKey::StorageChecksum).asInteger(), archiveOf(storedBlock()).crc32());
    const auto& attributes = host.project.attributes();
    EXPECT_TRUE(attributes.at(AttributeKey::Storage).isPersistent);
    EXPECT_TRUE(attributes.at(AttributeKey::StorageChecksum).isPersistent);
}

TEST_F(ProjectStorageTest, ReadsBackWhatItHasStored)
{
    host.adapter.save();

    Project opened(host.context(), host.document());
    opened.load();

    EXPECT_EQ(contentOf(opened.model()), contentOf(host.adapter.model()));
    EXPECT_EQ(opened.previewOffset(), 86400.0);
}

TEST_F(ProjectStorageTest, WhatItHasStoredIsInTheProjectFile)
{
    const cadrel::tests::TempFolder folder;
    const std::filesystem::path file = folder / "reel.stage";
    host.adapter.save();
    host.application.saveProject(host.project, file);

    standin::Project& reopened = host.application.openProject(file);
    Project opened(host.context(), &reopened);
    opened.load();

    EXPECT_EQ(contentOf(opened.model()), contentOf(host.adapter.model()));
}

TEST_F(ProjectStorageTest, ASaveReplacesWhatWasStored)
{
    host.adapter.save();
    host.adapter.model().changeEdl().clear();

    host.adapter.save();

    EXPECT_EQ(storedBlock(), contentOf(host.adapter.model()));
    EXPECT_EQ(stored(AttributeKey::StorageChecksum).asInteger(), archiveOf(storedBlock()).crc32());
}

TEST_F(ProjectStorageTest, EveryFlippedBitOfTheBlockIsFound)
{
    Bytes block = contentOf(host.adapter.model());
    const std::uint32_t checksum = archiveOf(block).crc32();
    for (std::size_t bit = 0; bit < 8 * block.size(); ++bit) {
        const auto mask = static_cast<std::uint8_t>(1U << (bit % 8));
        block[bit / 8] ^= mask;
        store(block, checksum);
        ASSERT_EQ(loadFailure(), Result::ChecksumMismatch) << "bit " << bit;
        block[bit / 8] ^= mask;
    }
}

TEST_F(ProjectStorageTest, EveryFlippedBitOfTheChecksumIsFound)
{
    const Bytes block = contentOf(host.adapter.model());
    const std::uint32_t checksum = archiveOf(block).crc32();
    for (int bit = 0; bit < 32; ++bit) {
        store(block, checksum ^ (std::uint32_t{1} << bit));
        ASSERT_EQ(loadFailure(), Result::ChecksumMismatch) << "bit " << bit;
    }
}

TEST_F(ProjectStorageTest, OnlyTheLow32BitsOfTheChecksumCount)
{
    const Bytes block = contentOf(host.adapter.model());
    for (const std::int64_t above : {std::int64_t{1} << 32, std::int64_t{-1} << 32}) {
        store(block, above | archiveOf(block).crc32());

        Project opened(host.context(), host.document());
        opened.load();

        EXPECT_EQ(contentOf(opened.model()), block);
    }
}

TEST_F(ProjectStorageTest, ASaveAfterAFailedLoadReplacesWhatWasStored)
{
    store(contentOf(host.adapter.model()), 0);
    Project opened(host.context(), host.document());
    EXPECT_EQ(thrownBy([&] { opened.load(); }), Result::ChecksumMismatch);

    opened.model().newEdl().add(makeEvent("B", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
    opened.save();

    EXPECT_EQ(storedBlock(), contentOf(opened.model()));
    EXPECT_EQ(stored(AttributeKey::StorageChecksum).asInteger(), archiveOf(storedBlock()).crc32());
}

TEST_F(ProjectStorageTest, ANewerVersionIsRefused)
{
    store(bytesOf("02 00 00 00"));

    EXPECT_EQ(loadFailure(), Result::NewerVersion);
}

TEST_F(ProjectStorageTest, TheFirstSaveAfterANewerVersionPutsThatAside)
{
    const Bytes newer = bytesOf("02 00 00 00");
    store(newer);
    const std::int64_t checksum = stored(AttributeKey::StorageChecksum).asInteger();
    Project opened(host.context(), host.document());
    EXPECT_EQ(thrownBy([&] { opened.load(); }), Result::NewerVersion);
    EXPECT_EQ(host.root()->hasAttribute(AttributeKey::OtherStorage), ResultFalse);

    opened.save();
    const auto list = query<IAttributeData>(stored(AttributeKey::OtherStorage).asObject());
    ASSERT_TRUE(list);
    Bytes kept(static_cast<std::size_t>(list->getBinarySize(AttributeKey::StorageData)));
    ASSERT_EQ(list->getBinary(AttributeKey::StorageData, kept.data(), static_cast<int32>(kept.size())), ResultOk);
    EXPECT_EQ(kept, newer);
    EXPECT_EQ(stored(AttributeKey::OtherStorageChecksum).asInteger(), checksum);
    EXPECT_EQ(storedBlock(), contentOf(opened.model()));

    // What was put aside isn't replaced by what this program has written.
    opened.model().newEdl().add(makeEvent("B", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
    opened.save();
    EXPECT_EQ(stored(AttributeKey::OtherStorageChecksum).asInteger(), checksum);
}

TEST_F(ProjectStorageTest, ASaveAfterAnyOtherFailurePutsNothingAside)
{
    store(contentOf(host.adapter.model()), 0);
    Project opened(host.context(), host.document());
    EXPECT_EQ(thrownBy([&] { opened.load(); }), Result::ChecksumMismatch);

    opened.save();

    EXPECT_EQ(host.root()->hasAttribute(AttributeKey::OtherStorage), ResultFalse);
    EXPECT_EQ(host.root()->hasAttribute(AttributeKey::OtherStorageChecksum), ResultFalse);
}

TEST_F(ProjectStorageTest, ANewerVersionWithinIsRefused)
{
    // The model in its version, the old EDL in one to come.
    store(bytesOf("01 00 00 00  01 00 00 00  00 00 00 00"));

    EXPECT_EQ(loadFailure(), Result::NewerVersion);
}

TEST_F(ProjectStorageTest, AnOlderVersionIsRead)
{
    Bytes block = contentOf(host.adapter.model());
    // The list of videos is what version 0 has not got: version and count of the list, and in the one entry its own version,
    // 4 + 15 bytes of path and two timecodes of 9 bytes each.
    block.resize(block.size() - (4 + 4 + 4 + 4 + 15 + 9 + 9));
    block[0] = 0;
    store(block);

    Project opened(host.context(), host.document());
    opened.load();

    EXPECT_EQ(opened.model().changeEdl().size(), 1U);
    EXPECT_EQ(opened.model().settings().healMode(), core::HealMode::GapsWithInserts);
    EXPECT_TRUE(opened.model().videoList().isEmpty());
}

TEST_F(ProjectStorageTest, AnOlderVersionThatBreaksOffIsUnknown)
{
    store(bytesOf("00 00 00 00  00 00 00 00"));

    EXPECT_EQ(loadFailure(), Result::UnknownVersion);
}

TEST_F(ProjectStorageTest, ABlockThatBreaksOffGivesAnEmptyModel)
{
    const Bytes block = contentOf(host.adapter.model());
    for (std::size_t size = 0; size < block.size(); ++size) {
        store(Bytes(block.begin(), block.begin() + static_cast<std::ptrdiff_t>(size)));
        ASSERT_EQ(loadFailure(), Result::EndOfData) << "after " << size << " bytes";
    }
}

TEST_F(ProjectStorageTest, ABlockThatBreaksOffLeavesNoVfxPatternBehind)
{
    host.adapter.model().settings().setVfxPattern(core::VfxPatternEntry("VFX_", "_comp", true), 1);
    const Bytes block = contentOf(host.adapter.model());
    for (std::size_t size = 0; size < block.size(); ++size) {
        store(Bytes(block.begin(), block.begin() + static_cast<std::ptrdiff_t>(size)));
        ASSERT_EQ(loadFailure(), Result::EndOfData) << "after " << size << " bytes";
    }
}

TEST_F(ProjectStorageTest, AChecksumThatIsMissingCannotBeRead)
{
    store(contentOf(host.adapter.model()));
    host.root()->removeAttribute(AttributeKey::StorageChecksum);

    EXPECT_EQ(loadFailure(), Result::HostCallFailed);
}

TEST_F(ProjectStorageTest, AChecksumThatIsNoNumberCountsAsZero)
{
    store(contentOf(host.adapter.model()));
    host.root()->setAttribute(AttributeKey::StorageChecksum, FVariant::string("12"), true);
    EXPECT_EQ(loadFailure(), Result::ChecksumMismatch);

    // The checksum of no bytes is zero.
    store({});
    host.root()->setAttribute(AttributeKey::StorageChecksum, FVariant::string("12"), true);
    EXPECT_EQ(loadFailure(), Result::EndOfData);
}

TEST_F(ProjectStorageTest, WhatIsStoredHasToBeAList)
{
    for (const FVariant& value : {FVariant(), FVariant::integer(1), FVariant::string("CaDrData"),
                                  FVariant::object(nullptr), FVariant::object(host.document())}) {
        const auto project = makeCounted<UnreliableProject>();
        project->value = value;
        project->isReadable = true;
        EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).load(); }), Result::HostObjectMissing);
    }
}

TEST_F(ProjectStorageTest, TheListHasToHoldTheBlock)
{
    const auto list = makeCounted<standin::AttributeList>();
    host.root()->setAttribute(AttributeKey::Storage, FVariant::object(query<IAttributeData>(list).get()), true);
    host.root()->setAttribute(AttributeKey::StorageChecksum, FVariant::integer(0), true);

    EXPECT_EQ(loadFailure(), Result::HostCallFailed);
}

TEST_F(ProjectStorageTest, FailsWhereTheHostGivesNothing)
{
    const auto project = makeCounted<UnreliableProject>();
    project->isReadable = true;
    project->value = FVariant::object(query<IAttributeData>(makeCounted<StubbornList>()).get());
    EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).load(); }), Result::HostCallFailed);

    project->readResult = ResultFalse;
    EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).load(); }), Result::HostCallFailed);

    project->isNode = false;
    EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).load(); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).save(); }), Result::HostObjectMissing);
}

TEST_F(ProjectStorageTest, ASaveThatFailsLeavesWhatWasStored)
{
    host.adapter.save();
    const Bytes before = storedBlock();
    AlteredContext altered(host.context());
    Project project(&altered, host.document());

    altered.hide(IAttributeData::iid);
    EXPECT_EQ(thrownBy([&] { project.save(); }), Result::HostObjectMissing);
    EXPECT_EQ(storedBlock(), before);
    AlteredContext stubborn(host.context());
    stubborn.replace(IAttributeData::iid, makeCounted<StubbornList>());
    EXPECT_EQ(thrownBy([&] { Project(&stubborn, host.document()).save(); }), Result::HostCallFailed);
    EXPECT_EQ(storedBlock(), before);
    project.model().changeEdl().add(std::make_shared<tests::UnwritableEvent>());
    EXPECT_EQ(thrownBy([&] { project.save(); }), Result::OutOfRange);
    EXPECT_EQ(storedBlock(), before);

    Project opened(host.context(), host.document());
    opened.load();
    EXPECT_EQ(contentOf(opened.model()), before);
}

TEST_F(ProjectStorageTest, PreviewedEventsThatCannotBeStoredKeepTheModelFromNothing)
{
    host.adapter.model().setPreviewActive(true);
    host.adapter.previewEvents().add(std::make_shared<tests::UnwritableEvent>());

    EXPECT_EQ(thrownBy([&] { host.adapter.save(); }), Result::OutOfRange) << "It is told all the same.";

    EXPECT_EQ(storedBlock(), contentOf(host.adapter.model()));
    Project opened(host.context(), host.document());
    opened.load();
    EXPECT_EQ(contentOf(opened.model()), contentOf(host.adapter.model()));
    EXPECT_TRUE(opened.previewEvents().isEmpty());
}

TEST_F(ProjectStorageTest, PutsBackWhatWasStoredWhereTheHostTakesHalfOfIt)
{
    const auto project = makeCounted<UnreliableProject>();
    const auto storedAfterRefusalOf = [&](const char* key) {
        project->refusedKey = key;
        EXPECT_EQ(thrownBy([&] { Project(host.context(), project.get()).save(); }), Result::HostCallFailed);
        return project->kept;
    };
    using Kept = std::map<std::string, FVariant>;
    EXPECT_TRUE(storedAfterRefusalOf(AttributeKey::Storage).empty());
    EXPECT_TRUE(storedAfterRefusalOf(AttributeKey::StorageChecksum).empty()) << "A block alone would count as damaged.";

    project->refusedKey = "";
    Project(host.context(), project.get()).save();
    const Kept stored = project->kept;
    ASSERT_EQ(stored.size(), 2U);
    for (const char* const key : {AttributeKey::Storage, AttributeKey::StorageChecksum}) {
        const Kept after = storedAfterRefusalOf(key);
        ASSERT_EQ(after.size(), 2U) << key;
        EXPECT_EQ(after.at(AttributeKey::Storage).asObject(), stored.at(AttributeKey::Storage).asObject()) << key;
        EXPECT_EQ(after.at(AttributeKey::StorageChecksum).asInteger(),
                  stored.at(AttributeKey::StorageChecksum).asInteger())
            << key;
    }
}

TEST_F(ProjectStorageTest, KeepsThePreviewedEventsWhereTheMemosCannotBeRead)
{
    const auto memos = host.addTrack(TypeWord::Marker, u"Memos");
    host.handle(memos).setRole(TrackRole::Memos);
    host.addPointMarker(memos, u"memo", 86400.0 + 3601.0);
    host.adapter.model().setPreviewActive(true);
    host.adapter.previewEvents().add(host.adapter.model().changeEdl().eventAt(0));
    host.adapter.save();
    AlteredDocument document(host.document());
    document.hasContainers = false;

    Project opened(host.context(), &document);
    opened.load();

    EXPECT_EQ(opened.previewEvents().size(), 1U);
    EXPECT_EQ(contentOf(opened.model()), contentOf(host.adapter.model()));
}

TEST_F(ProjectStorageTest, ReadsTheTimecodesUnderTheRateOfItsOwnProject)
{
    // The 28th frame of a second is one of 30 frames, and none of 25.
    core::DataModel& model = host.adapter.model();
    timecodes.framerate = core::Framerate(30, 0);
    model.newEdl().clear();
    model.newEdl().add(makeEvent("B", "00:10:00:28", "00:10:10:28", "01:00:00:28", "01:00:10:28", 1));
    host.adapter.save();
    host.project.setFrameRate({30.0, 0});
    timecodes.framerate = core::Framerate(25, 0);

    Project opened(host.context(), host.document());
    opened.load();

    EXPECT_TRUE(opened.model().newEdl().at(0).isValid());
    EXPECT_EQ(core::Timecode::framerateProvider(), &timecodes);
}

TEST_F(ProjectStorageTest, PutsTheRateBackAfterAFailure)
{
    store(bytesOf("01 00 00 00"));

    EXPECT_EQ(loadFailure(), Result::EndOfData);

    EXPECT_EQ(core::Timecode::framerateProvider(), &timecodes);
}

TEST_F(ProjectStorageTest, FindsTheTracksThatItHeldLocked)
{
    const auto held = host.addTrack(TypeWord::Audio, u"FX");
    const auto lockedByTheUser = host.addTrack(TypeWord::Audio, u"Music");
    host.handle(held).setLock(true);
    requireOk(query<ITrackNode>(lockedByTheUser)->setFlag(TrackFlag::Lock, true));
    host.adapter.model().setPreviewActive(true);
    host.adapter.save();

    Project opened(host.context(), host.document());
    opened.load();
    EXPECT_TRUE(host.handle(held).hostLocked()) << "The preview goes on.";
    opened.setTracksLocked(false);

    EXPECT_FALSE(host.handle(held).hostLocked());
    EXPECT_TRUE(host.handle(lockedByTheUser).hostLocked());
}

TEST_F(ProjectStorageTest, UnlocksWhatItHeldForAPreviewThatIsGone)
{
    const auto held = host.addTrack(TypeWord::Audio, u"FX");
    const auto markers = host.addTrack(TypeWord::Marker, u"Insert");
    const auto lockedByTheUser = host.addTrack(TypeWord::Audio, u"Music");
    requireOk(query<ITrackNode>(lockedByTheUser)->setFlag(TrackFlag::Lock, true));
    host.adapter.model().setPreviewActive(true);
    const Bytes block = contentOf(host.adapter.model());
    const auto expectUnlocked = [&] {
        for (const auto& track : {held, markers}) {
            EXPECT_FALSE(host.handle(track).hostLocked());
            EXPECT_FALSE(host.handle(track).hasLockState());
        }
        EXPECT_TRUE(host.handle(lockedByTheUser).hostLocked());
    };
    const auto lock = [&] {
        for (const auto& track : {held, markers})
            host.handle(track).setLock(true);
    };

    lock();
    EXPECT_EQ(loadFailure(), Result::Ok) << "Nothing is stored.";
    expectUnlocked();

    lock();
    store(block, archiveOf(block).crc32() ^ 1U);
    EXPECT_EQ(loadFailure(), Result::ChecksumMismatch);
    expectUnlocked();
}

TEST_F(ProjectStorageTest, KeepsWhatIsStoredWhereTheTracksCannotBeRead)
{
    host.adapter.save();
    const Bytes before = storedBlock();
    const auto project = makeCounted<UnusableTrackBesideStorage>(*host.root());
    Project opened(host.context(), project.get());

    EXPECT_EQ(thrownBy([&] { opened.load(); }), Result::HostObjectMissing);
    EXPECT_EQ(contentOf(opened.model()), contentOf(host.adapter.model()));
    opened.save();

    EXPECT_EQ(storedBlock(), before);
}

TEST_F(ProjectStorageTest, GivesAnEmptyModelWhereTheTracksCannotBeRead)
{
    const auto project = FakeProject::withoutUsableTrack();
    Project opened(host.context(), project.get());

    EXPECT_EQ(thrownBy([&] { opened.load(); }), Result::HostObjectMissing);

    EXPECT_EQ(contentOf(opened.model()), contentOf(Project(host.context(), project.get()).model()));
}

} // namespace cadrel::host
