// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/TempFolder.h"
#include "tests/support/standin/TestHost.h"

#include "standin/file/ProjectFile.h"
#include "velmark/Attributes.h"
#include "velmark/Media.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using cadrel::tests::contentOf;
using cadrel::tests::TempFolder;
using Calls = std::vector<std::string>;

} // namespace

TEST(Application, SavesWhatTheStorageListenersHaveAdded)
{
    TestHost host;
    const TempFolder folder;
    Calls calls;
    const auto listener = makeCounted<Recorder>(calls);
    host.document()->addStorageNotification(listener.get());
    listener->whenCalled = [&](const std::string&) { host.root()->setAttribute("CaDs", FVariant::integer(77), true); };

    host.application.saveProject(host.project, folder / "reel3.stage");

    EXPECT_EQ(calls, Calls{"storing"});
    EXPECT_EQ(contentOf(folder / "reel3.stage"), host.dump());
    EXPECT_NE(host.dump().find("CaDs"), std::string::npos);
    host.document()->removeStorageNotification(listener.get());
}

TEST(Application, AProjectThatIsSavedElsewhereIsRenamed)
{
    TestHost host;
    const TempFolder folder;
    Calls calls;
    const auto listener = makeCounted<Recorder>(calls);
    const auto manager = service<IProjectManager>(host.context());
    manager->addNotification(listener.get());

    host.application.saveProject(host.project, folder / "a.stage");
    host.application.saveProject(host.project, folder / "a.stage");
    host.application.saveProject(host.project, folder / "b.stage");

    EXPECT_EQ(calls, (Calls{"renamed", "renamed"}));
    EXPECT_EQ(host.project.path(), (folder / "b.stage").u16string());
    manager->removeNotification(listener.get());
}

TEST(Application, AFailedSaveLeavesTheProjectWhereItWas)
{
    TestHost host;
    const TempFolder folder;
    host.application.saveProject(host.project, folder / "a.stage");

    EXPECT_THROW(host.application.saveProject(host.project, folder / "none" / "b.stage"), ProjectFileError);

    EXPECT_EQ(host.project.path(), (folder / "a.stage").u16string());
}

TEST(Application, OpensWhatItHasSaved)
{
    TestHost host;
    const TempFolder folder;
    const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
    host.addClip(track, u"line", 1.0, 2.0);
    host.application.saveProject(host.project, folder / "a.stage");
    Calls calls;
    const auto listener = makeCounted<Recorder>(calls);
    const auto manager = service<IProjectManager>(host.context());
    manager->addNotification(listener.get());

    Project& opened = host.application.openProject(folder / "a.stage");

    EXPECT_EQ(calls, Calls{"opened"});
    EXPECT_EQ(ProjectFile::toText(opened), host.dump());
    EXPECT_FALSE(opened.hasChanges());
    EXPECT_FALSE(opened.undoList().canUndo());
    const auto file = Counted<IFilePath>::adopt(opened.getProjectFile(&opened));
    char16_t path[IFilePath::Capacity] = {};
    file->getPath(path);
    EXPECT_EQ(std::u16string(path), (folder / "a.stage").u16string());
    manager->removeNotification(listener.get());
}

TEST(Application, AFileThatCannotBeReadOpensNothing)
{
    TestHost host;
    const TempFolder folder;

    EXPECT_THROW(host.application.openProject(folder / "none.stage"), ProjectFileError);

    EXPECT_EQ(service<IProjectManager>(host.context())->projectCount(), 1);
}

TEST(Application, AFileWhoseNameIsNoTextIsNeitherOpenedNorSaved)
{
    TestHost host;
    const TempFolder folder;
    host.application.saveProject(host.project, folder / "a.stage");
    const std::filesystem::path path = folder.write("caf\xe9.stage", contentOf(folder / "a.stage"));

    EXPECT_THROW(host.application.openProject(path), ProjectFileError);
    EXPECT_THROW(host.application.saveProject(host.project, folder / "caf\xe8.stage"), ProjectFileError);
    EXPECT_THROW(host.application.saveProject(host.project, ""), ProjectFileError);

    EXPECT_EQ(service<IProjectManager>(host.context())->projectCount(), 1);
    EXPECT_EQ(host.project.path(), (folder / "a.stage").u16string());
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"a.stage", "caf\xe9.stage"}));
}

TEST(Application, OpensAContentThatIsNotThatOfTheFile)
{
    TestHost host;
    const TempFolder folder;
    host.addTrack(TypeWord::Audio, u"DX 1");
    const std::string written = host.application.saveProject(host.project, folder / "a.stage");
    EXPECT_EQ(written, contentOf(folder / "a.stage"));

    Project& opened = host.application.openProject(folder / "none.stage", written);

    EXPECT_EQ(opened.path(), (folder / "none.stage").u16string());
    EXPECT_EQ(ProjectFile::toText(opened), written);
    EXPECT_EQ(folder.names(), std::vector<std::string>{"a.stage"});
    EXPECT_THROW(host.application.openProject(folder / "none.stage", "{"), ProjectFileError);
    EXPECT_EQ(service<IProjectManager>(host.context())->projectCount(), 2);
}

TEST(Application, WhatIsOpenedWithinATransactionIsNoEdit)
{
    TestHost host;
    const TempFolder folder;
    host.addTrack(TypeWord::Audio, u"DX 1");
    host.application.saveProject(host.project, folder / "a.stage");
    host.transaction()->begin(true);

    Project& opened = host.application.openProject(folder / "a.stage");

    host.transaction()->commit(host.document(), u"Nothing");
    EXPECT_EQ(opened.undoList().size(), 0U);
    EXPECT_EQ(host.project.undoList().size(), 1U);
}

} // namespace standin::tests
