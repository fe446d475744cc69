// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/Project.h"
#include "standin/services/Translations.h"

#include "tests/module/LoadedModule.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <functional>
#include <optional>
#include <string>
#include <vector>

using namespace Velmark;
using cadrel::core::DataModel;
using cadrel::host::tests::AlteredContext;
using cadrel::tests::bytesOf;
using cadrel::tests::makeEvent;
using cadrel::tests::StoredModel;

namespace fs = std::filesystem;

namespace {

const std::string NewerAlert = "The project was created with a newer Cadrel version. The data cannot be loaded.\n";
const std::string UnsupportedAlert =
    "The project was created with an unsupported Cadrel version. The data cannot be loaded.\n";
const std::string LoadingAlert = "An error occurred while loading the Cadrel data. The data will be ignored.\n";
const std::string SavingAlert = "An error occurred while saving the Cadrel data.\n";

/// A list of binary values that takes none.
class StubbornList : public Implements<StubbornList, FObject, IAttributeData> {
public:
    static constexpr const char* ClassName = "StubbornList";

    int32 setBinary(const char*, const void*, int32, bool) override { return ResultFalse; }
    int32 getBinary(const char*, void*, int32) override { return ResultFalse; }
    int32 getBinarySize(const char*) override { return -1; }
};

/// Project files that the loaded module opens and saves.
class LoadedStorageTest : public cadrel::tests::LoadedModule {
protected:
    /// A file of a project into which a host without the module has put what `change` puts there.
    fs::path writeProject(const std::function<void(standin::Project&)>& change)
    {
        standin::tests::TestHost host;
        change(host.project);
        const fs::path file = m_folder / "Film.stage";
        host.application.saveProject(host.project, file);
        return file;
    }
    fs::path writeProject(const StoredModel& stored)
    {
        return writeProject([&](standin::Project& project) { stored.putInto(project); });
    }

    /// What the user is told when the module meets the file.
    std::string openedWith(const fs::path& file)
    {
        m_project = &m_application.openProject(file);
        m_application.activateProject(m_project);
        return messages();
    }
    /// What the user is told when the project is saved in its file, and what that has then.
    std::string savedWith(const fs::path& file)
    {
        m_application.saveProject(*m_project, file);
        return messages();
    }
    /// Opens the file, saves it and closes it.
    std::string openedAndSavedWith(const fs::path& file)
    {
        std::string told = openedWith(file);
        told += savedWith(file);
        m_application.closeProject(*m_project);
        return told;
    }

    StoredModel filledModel()
    {
        const cadrel::tests::TestProject timecodes;
        DataModel model;
        model.oldEdl().add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
        model.newEdl().add(makeEvent("A", "00:10:02:00", "00:10:10:00", "01:00:00:00", "01:00:08:00", 1));
        model.changeEdl().add(makeEvent("A", "01:00:02:00", "01:00:10:00", "01:00:00:00", "01:00:08:00", 1));
        return StoredModel::of(model);
    }
    StoredModel emptyModel() { return StoredModel::of(DataModel()); }

    cadrel::tests::TempFolder m_folder;
    standin::Project* m_project = nullptr;
};

} // namespace

TEST_F(LoadedStorageTest, OpensAProjectSilentlyInWhichNothingIsStored)
{
    const fs::path file = writeProject([](standin::Project&) {});
    ASSERT_EQ(StoredModel::inFile(file), std::nullopt);
    load();

    EXPECT_EQ(openedWith(file), "");
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), emptyModel());
}

TEST_F(LoadedStorageTest, ReadsWhatItHasStored)
{
    const fs::path file = writeProject(filledModel());
    load();

    EXPECT_EQ(openedWith(file), "");
    // From the model: what stands in the project is taken away first.
    m_project->removeAttribute(AttributeKey::Storage);
    m_project->removeAttribute(AttributeKey::StorageChecksum);
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), filledModel());
}

TEST_F(LoadedStorageTest, ReadsProjectsThatAreOpenWhenItIsLoaded)
{
    StoredModel damaged = filledModel();
    damaged.block.back() ^= 1U;
    EXPECT_EQ(openedWith(writeProject(damaged)), "");

    load();
    EXPECT_EQ(messages(), LoadingAlert);
}

TEST_F(LoadedStorageTest, WritesNothingBeforeTheProjectIsStored)
{
    const fs::path file = writeProject([](standin::Project&) {});
    load();
    openedWith(file);
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
    EXPECT_NE(m_project->hasAttribute(AttributeKey::Storage), ResultOk);
    EXPECT_NE(m_project->hasAttribute(AttributeKey::StorageChecksum), ResultOk);

    unload();
    EXPECT_NE(m_project->hasAttribute(AttributeKey::Storage), ResultOk);
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), std::nullopt);
}

TEST_F(LoadedStorageTest, TellsOfAFlippedByteAndReplacesTheBlockAtTheNextSave)
{
    const StoredModel whole = filledModel();
    load();
    constexpr std::size_t Steps = 16;
    for (std::size_t step = 0; step < Steps; ++step) {
        // From the first byte to the last.
        const std::size_t index = step * (whole.block.size() - 1) / (Steps - 1);
        StoredModel damaged = whole;
        damaged.block[index] ^= 0x10U;
        const fs::path file = writeProject(damaged);

        ASSERT_EQ(openedAndSavedWith(file), LoadingAlert) << "byte " << index;
        ASSERT_EQ(StoredModel::inFile(file), emptyModel()) << "byte " << index;
        ASSERT_EQ(StoredModel::asideInFile(file), std::nullopt) << "byte " << index;
        ASSERT_EQ(openedAndSavedWith(file), "") << "byte " << index;
    }
}

TEST_F(LoadedStorageTest, TellsOfABlockThatBreaksOff)
{
    const StoredModel whole = filledModel();
    load();
    for (const std::size_t size : {std::size_t{0}, std::size_t{3}, whole.block.size() / 2, whole.block.size() - 1}) {
        const fs::path file = writeProject(
            StoredModel::ofBlock({whole.block.begin(), whole.block.begin() + static_cast<std::ptrdiff_t>(size)}));

        EXPECT_EQ(openedAndSavedWith(file), LoadingAlert) << size << " bytes";
        EXPECT_EQ(StoredModel::inFile(file), emptyModel()) << size << " bytes";
    }
}

TEST_F(LoadedStorageTest, TellsOfHalfOfWhatBelongsTogether)
{
    load();
    const auto expectTold = [&](const char* what, const std::function<void(standin::Project&)>& change) {
        const fs::path file = writeProject([&](standin::Project& project) {
            filledModel().putInto(project);
            change(project);
        });
        EXPECT_EQ(openedAndSavedWith(file), LoadingAlert) << what;
        EXPECT_EQ(StoredModel::inFile(file), emptyModel()) << what;
    };
    expectTold("no checksum", [](auto& project) { project.removeAttribute(AttributeKey::StorageChecksum); });
    expectTold("a checksum that is a text",
               [](auto& project) { project.setAttribute(AttributeKey::StorageChecksum, FVariant::string("1"), true); });
    expectTold("no list",
               [](auto& project) { project.setAttribute(AttributeKey::Storage, FVariant::string("CaDrData"), true); });
    expectTold("a list without a block", [](auto& project) {
        const auto list = makeCounted<standin::AttributeList>();
        project.setAttribute(AttributeKey::Storage, FVariant::object(query<IAttributeData>(list).get()), true);
    });
}

TEST_F(LoadedStorageTest, PutsTheWorkOfANewerVersionAsideAtTheFirstSave)
{
    const StoredModel newer = StoredModel::ofBlock(bytesOf("02 00 00 00  AB CD EF"));
    const fs::path file = writeProject(newer);
    load();

    EXPECT_EQ(openedWith(file), NewerAlert);
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), emptyModel());
    EXPECT_EQ(StoredModel::asideInFile(file), newer);

    // What is put aside isn't replaced by what this program has written.
    EXPECT_EQ(savedWith(file), "");
    m_application.closeProject(*m_project);
    EXPECT_EQ(openedAndSavedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), emptyModel());
    EXPECT_EQ(StoredModel::asideInFile(file), newer);
}

TEST_F(LoadedStorageTest, PutsTheWorkOfAVersionThatIsNoLongerReadAsideAtTheFirstSave)
{
    const StoredModel older = StoredModel::ofBlock(bytesOf("00 00 00 00  00 00 00 00"));
    const fs::path file = writeProject(older);
    load();

    EXPECT_EQ(openedAndSavedWith(file), UnsupportedAlert);
    EXPECT_EQ(StoredModel::inFile(file), emptyModel());
    EXPECT_EQ(StoredModel::asideInFile(file), older);
}

TEST_F(LoadedStorageTest, LeavesTheWorkOfANewerVersionWhereNothingIsSaved)
{
    const StoredModel newer = StoredModel::ofBlock(bytesOf("02 00 00 00"));
    const fs::path file = writeProject(newer);
    load();
    EXPECT_EQ(openedWith(file), NewerAlert);
    m_application.closeProject(*m_project);
    unload();

    EXPECT_EQ(StoredModel::inFile(file), newer);
    EXPECT_EQ(StoredModel::asideInFile(file), std::nullopt);
}

TEST_F(LoadedStorageTest, TellsOfASaveThatFailsAndLeavesWhatWasStored)
{
    const fs::path file = writeProject(filledModel());
    const auto context = makeCounted<AlteredContext>(m_application.context());
    load(context.get());
    ASSERT_EQ(openedWith(file), "");

    context->hide(IAttributeData::iid);
    EXPECT_EQ(savedWith(file), SavingAlert);
    EXPECT_EQ(StoredModel::inFile(file), filledModel());

    context->unhide(IAttributeData::iid);
    context->replace(IAttributeData::iid, makeCounted<StubbornList>());
    EXPECT_EQ(savedWith(file), SavingAlert);
    EXPECT_EQ(StoredModel::inFile(file), filledModel());

    context->unhide(IAttributeData::iid);
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::inFile(file), filledModel());
}

TEST_F(LoadedStorageTest, KeepsTheWorkOfANewerVersionOverASaveThatFails)
{
    const StoredModel newer = StoredModel::ofBlock(bytesOf("02 00 00 00"));
    const fs::path file = writeProject(newer);
    const auto context = makeCounted<AlteredContext>(m_application.context());
    load(context.get());
    ASSERT_EQ(openedWith(file), NewerAlert);

    context->hide(IAttributeData::iid);
    EXPECT_EQ(savedWith(file), SavingAlert);
    EXPECT_EQ(StoredModel::inFile(file), newer);
    context->unhide(IAttributeData::iid);
    EXPECT_EQ(savedWith(file), "");
    EXPECT_EQ(StoredModel::asideInFile(file), newer);
}

TEST_F(LoadedStorageTest, TellsInTheLanguageOfTheHost)
{
    m_application.translations().setLanguage("de");
    load();

    EXPECT_EQ(openedWith(writeProject(StoredModel::ofBlock(bytesOf("02 00 00 00")))),
              "Das Projekt stammt von einer neueren Version von Cadrel. Die Daten können nicht geladen werden.\n");
}

TEST_F(LoadedStorageTest, KeepsTheProjectsOfAHostApart)
{
    const fs::path first = writeProject(filledModel());
    const fs::path second = m_folder / "Second.stage";
    fs::copy_file(writeProject(StoredModel::ofBlock(bytesOf("02 00 00 00"))), second);
    writeProject(filledModel());
    load();

    EXPECT_EQ(openedWith(first), "");
    standin::Project* const ofFirst = m_project;
    EXPECT_EQ(openedWith(second), NewerAlert);
    EXPECT_EQ(savedWith(second), "");
    m_project = ofFirst;
    EXPECT_EQ(savedWith(first), "");
    EXPECT_EQ(StoredModel::inFile(first), filledModel());
    EXPECT_EQ(StoredModel::inFile(second), emptyModel());
    EXPECT_EQ(StoredModel::asideInFile(first), std::nullopt);
}
