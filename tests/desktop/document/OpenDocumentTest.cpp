// SPDX-License-Identifier: GPL-3.0-or-later

// Saving, and the mark of unsaved work.

#include "tests/desktop/document/DocumentHost.h"

#include "desktop/document/DocumentError.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/NoPrivileges.h"

#include <fcntl.h>
#include <sys/stat.h>

namespace desktop::tests {

namespace fs = std::filesystem;

using cadrel::tests::FileSizeLimit;
using cadrel::tests::NoPrivileges;

class OpenDocumentTest : public DocumentTest {
protected:
    OpenDocument& opened() { return documents.open(file); }

    /// As another program does it that keeps size and time.
    void writeUnnoticeably(const std::string& content)
    {
        struct stat state {};
        ASSERT_EQ(::stat(file.c_str(), &state), 0);
        ASSERT_EQ(static_cast<std::size_t>(state.st_size), content.size());
        writeFile(file, content);
        const timespec times[2] = {state.st_atim, state.st_mtim};
        ASSERT_EQ(::utimensat(AT_FDCWD, file.c_str(), times, 0), 0);
    }

    fs::path file = fs::canonical(writeProject("reel3.stage"));
};

// The mark.

TEST_F(OpenDocumentTest, IsSavedAfterOpeningThoughItsModuleHasNeverStoredInIt)
{
    OpenDocument& document = opened();

    EXPECT_FALSE(document.isUnsaved());
    idle();
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_FALSE(document.settleUnsaved());
}

TEST_F(OpenDocumentTest, IsUnsavedAtOnceAfterAnEditAndSavedAtOnceAfterItsUndo)
{
    OpenDocument& document = opened();

    renameTrack(document, u"FX 1");
    EXPECT_TRUE(document.isUnsaved());
    ASSERT_TRUE(application.edits().undo(document.project()));
    EXPECT_FALSE(document.isUnsaved());
    ASSERT_TRUE(application.edits().redo(document.project()));
    EXPECT_TRUE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, IsSavedWhereTheUndoComesBackToTheStateThatWasSaved)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    renameTrack(document, u"FX 2");
    ASSERT_TRUE(documents.save(document).isSaved());
    renameTrack(document, u"FX 3");

    EXPECT_TRUE(document.isUnsaved());
    application.edits().undo(document.project());
    EXPECT_FALSE(document.isUnsaved());
    application.edits().undo(document.project());
    EXPECT_TRUE(document.isUnsaved());
    application.edits().redo(document.project());
    EXPECT_FALSE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, IsUnsavedWhereTheSavedStateWasUndoneAndAnotherOneTookItsPlace)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    ASSERT_TRUE(documents.save(document).isSaved());
    application.edits().undo(document.project());
    renameTrack(document, u"FX 2");

    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(document.settleUnsaved());
    application.edits().undo(document.project());
    EXPECT_TRUE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, IsUnsavedAfterAChangeThatNoUndoTakesBack)
{
    OpenDocument& document = opened();

    trackOf(document).setSelected(true);
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(document.settleUnsaved());
    trackOf(document).setSelected(false);
    EXPECT_FALSE(document.settleUnsaved());
    EXPECT_FALSE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, IsSavedAgainSomeTimeAfterTheUserHasTakenAnEditBackByAnotherEdit)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    renameTrack(document, u"DIA 1");

    EXPECT_TRUE(document.isUnsaved());
    idle();
    idle();
    EXPECT_FALSE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, ShowsWhatAModuleHasChangedOfItsOwnAfterAnIdleCall)
{
    OpenDocument& document = opened();
    module->models[&document.project()] = "settings";

    idle();
    EXPECT_TRUE(document.isUnsaved());
    module->models[&document.project()] = "";
    idle();
    EXPECT_FALSE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, DoesNotCountTheMovedPlayheadAsWork)
{
    OpenDocument& document = opened();
    document.project().position().setValue(0, 3.5);

    idle();
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_FALSE(document.settleUnsaved());
    EXPECT_EQ(document.project().position().getValue(), 3.5);

    renameTrack(document, u"FX 1");
    application.edits().undo(document.project());
    EXPECT_FALSE(document.settleUnsaved()) << "The rest is as it was.";

    renameTrack(document, u"FX 1");
    EXPECT_TRUE(document.settleUnsaved());
    EXPECT_TRUE(documents.save(document).isSaved());
    EXPECT_NE(contentOf(document.path()).find("\"position\": 3.5"), std::string::npos) << "It is stored with the work.";
    EXPECT_FALSE(document.settleUnsaved());
    document.project().position().setValue(0, 0.0);
    EXPECT_FALSE(document.settleUnsaved());
}

TEST_F(OpenDocumentTest, StaysUnsavedWhereAnUndoIsFollowedBySettingsThatNoUndoTakesBack)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    module->models[&document.project()] = "settings";
    idle();

    application.edits().undo(document.project());
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(document.settleUnsaved());
}

TEST_F(OpenDocumentTest, AsksAModuleThatCannotStoreOnceAndThenOnlyWhenItIsSaved)
{
    OpenDocument& document = opened();
    module->canStore = false;
    const int before = module->storings;

    idle();
    idle();
    idle();
    EXPECT_EQ(module->storings, before + 1);
    documents.save(document);
    EXPECT_EQ(module->storings, before + 2);
}

TEST_F(OpenDocumentTest, IsUnsavedBeforeClosingAsLongAsAModuleCannotStore)
{
    OpenDocument& document = opened();
    EXPECT_FALSE(document.settleUnsaved());
    module->canStore = false;
    idle();
    const int before = module->storings;
    EXPECT_TRUE(document.settleUnsaved());
    EXPECT_EQ(module->storings, before + 1) << "It is asked again, and tells the user.";

    module->canStore = true;
    EXPECT_FALSE(document.settleUnsaved());
    module->models[&document.project()] = "settings";
    EXPECT_TRUE(document.settleUnsaved());
}

TEST_F(OpenDocumentTest, LeavesModulesAloneWithinATransaction)
{
    OpenDocument& document = opened();
    const int before = module->storings;

    edit(document.project(), u"Rename", [&] {
        trackOf(document).setName(u"FX 1");
        idle();
        EXPECT_EQ(documents.save(document).state, State::Failed);
    });

    EXPECT_EQ(module->storings, before);
    EXPECT_EQ(document.undoNames(), std::vector<std::u16string>{u"Rename"});
}

TEST_F(OpenDocumentTest, LeavesModulesAloneWhileIdleCallsAreBlocked)
{
    opened();
    const int before = module->storings;

    application.idleManager().setIdleBlocked(true);
    idle();
    application.idleManager().setIdleBlocked(false);

    EXPECT_EQ(module->storings, before);
}

// Saving.

TEST_F(OpenDocumentTest, StoresTheBytesWithWhatTheModuleHas)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    module->models[&document.project()] = "settings";

    const SaveAnswer answer = documents.save(document);

    EXPECT_EQ(answer.state, State::Saved);
    EXPECT_EQ(answer.message, "");
    EXPECT_EQ(contentOf(file), bytesOf(document));
    EXPECT_NE(contentOf(file).find("settings"), std::string::npos);
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_EQ(document.fileState(), StoredFile::State::AsStored);
}

TEST_F(OpenDocumentTest, SavesAgainAndAgain)
{
    OpenDocument& document = opened();
    for (const char16_t* const name : {u"A", u"B", u"C"}) {
        renameTrack(document, name);
        EXPECT_TRUE(documents.save(document).isSaved());
    }
    EXPECT_EQ(contentOf(file), bytesOf(document));
}

TEST_F(OpenDocumentTest, TellsThatAnotherProgramHasChangedTheFileAndLeavesItAlone)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    writeProject("reel3.stage", 2);
    const std::string others = contentOf(file);

    EXPECT_EQ(document.fileState(), StoredFile::State::Changed);
    const SaveAnswer answer = documents.save(document);

    EXPECT_EQ(answer.state, State::Changed);
    EXPECT_EQ(answer.message, file.string() + ": another program has changed it since it was opened or saved here");
    EXPECT_EQ(contentOf(file), others);
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_EQ(documents.save(document).state, State::Changed);
}

TEST_F(OpenDocumentTest, NoticesAChangeThatLeavesSizeAndTimeAsTheyWere)
{
    OpenDocument& document = opened();
    std::string others = contentOf(file);
    others.replace(others.find("DIA"), 3, "MUS");
    writeUnnoticeably(others);

    EXPECT_EQ(documents.save(document).state, State::Changed);
    EXPECT_EQ(contentOf(file), others);
}

TEST_F(OpenDocumentTest, ReadsAChangedFileNoSecondTimeUntilItIsSaved)
{
    OpenDocument& document = opened();
    const std::string content = contentOf(file);
    std::string others = content;
    others.replace(others.find("DIA"), 3, "MUS");
    writeFile(file, others);
    fs::last_write_time(file, fs::file_time_type::clock::now() + std::chrono::hours(1));
    EXPECT_EQ(document.fileState(), StoredFile::State::Changed);

    // Only who reads it sees that it is what it was.
    writeUnnoticeably(content);
    EXPECT_EQ(document.fileState(), StoredFile::State::Changed);
    EXPECT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(document.fileState(), StoredFile::State::AsStored);
}

TEST_F(OpenDocumentTest, SavesOverAFileThatWasOnlyTouchedOrWrittenWithTheSameContent)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    fs::last_write_time(file, fs::file_time_type::clock::now() + std::chrono::hours(1));
    EXPECT_EQ(document.fileState(), StoredFile::State::AsStored);
    const std::string content = contentOf(file);
    fs::remove(file);
    writeFile(file, content);
    EXPECT_EQ(document.fileState(), StoredFile::State::AsStored);

    EXPECT_TRUE(documents.save(document).isSaved());
}

TEST_F(OpenDocumentTest, OverwritesAChangedFileWhenTheUserSaysSo)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    writeProject("reel3.stage", 2);

    EXPECT_TRUE(documents.overwrite(document).isSaved());
    EXPECT_EQ(contentOf(file), bytesOf(document));
    EXPECT_TRUE(documents.save(document).isSaved());
}

TEST_F(OpenDocumentTest, TellsThatTheFileIsGoneAndSavesItThereAgainWhenTheUserSaysSo)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    fs::remove(file);

    EXPECT_EQ(document.fileState(), StoredFile::State::Missing);
    const SaveAnswer answer = documents.save(document);
    EXPECT_EQ(answer.state, State::Missing);
    EXPECT_EQ(answer.message, file.string() + ": is no longer there");
    EXPECT_FALSE(fs::exists(file));
    EXPECT_TRUE(document.isUnsaved());

    EXPECT_TRUE(documents.overwrite(document).isSaved());
    EXPECT_EQ(contentOf(file), bytesOf(document));
}

TEST_F(OpenDocumentTest, TellsThatTheFolderIsGone)
{
    fs::create_directory(folder / "film");
    file = fs::canonical(writeProject("film/reel3.stage"));
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    fs::remove_all(folder / "film");

    const SaveAnswer answer = documents.save(document);
    EXPECT_EQ(answer.state, State::Missing);
    EXPECT_EQ(answer.message, file.string() + ": its folder is no longer there");
    const SaveAnswer again = documents.overwrite(document);
    EXPECT_EQ(again.state, State::Failed);
    EXPECT_EQ(again.message, file.string() + ": the folder does not exist; make it or give another");
    EXPECT_TRUE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, TellsThatTheFileIsWriteProtected)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    const std::string before = contentOf(file);
    fs::permissions(folder.path(), fs::perms::all);
    fs::permissions(file, fs::perms::owner_read | fs::perms::group_read | fs::perms::others_read);
    const NoPrivileges user;

    const SaveAnswer answer = documents.save(document);

    EXPECT_EQ(answer.state, State::Failed);
    EXPECT_EQ(answer.message, file.string() + ": is protected against writing; give another name");
    EXPECT_EQ(contentOf(file), before);
    EXPECT_TRUE(document.isUnsaved());
}

TEST_F(OpenDocumentTest, TellsThatTheFolderIsWriteProtected)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    const std::string before = contentOf(file);
    fs::permissions(file, fs::perms::all);
    fs::permissions(folder.path(), fs::perms::owner_all | fs::perms::group_read | fs::perms::group_exec);
    const NoPrivileges user;

    const SaveAnswer answer = documents.save(document);

    EXPECT_EQ(answer.state, State::Failed);
    EXPECT_EQ(answer.message, file.string() + ": you may not write into the folder; give another folder");
    EXPECT_EQ(contentOf(file), before);
}

TEST_F(OpenDocumentTest, TellsThatTheDiskIsFullAndLeavesTheFormerFile)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    const std::string before = contentOf(file);
    const std::vector<std::string> names = folder.names();
    SaveAnswer answer;
    {
        const FileSizeLimit full(10);
        answer = documents.save(document);
    }
    EXPECT_EQ(answer.state, State::Failed);
    EXPECT_EQ(answer.message, file.string() +
                                  ": can't be written; see whether the disk is full, or save it on another disk "
                                  "with Save As");
    EXPECT_EQ(contentOf(file), before);
    EXPECT_EQ(folder.names(), names);
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(documents.save(document).isSaved());
}

TEST_F(OpenDocumentTest, TellsOnAFullDiskWhereTheWorkIsKept)
{
    OpenDocument& document = opened();
    const auto messageOnAFullDisk = [&] {
        const FileSizeLimit full(10);
        return documents.save(document).message;
    };
    const std::string kept = ". Until then the work is kept in " + file.string() + ".autosave";
    renameTrack(document, u"FX 1");
    idle();
    EXPECT_TRUE(messageOnAFullDisk().ends_with(kept));
    EXPECT_EQ(Autosave::read(file)->content, bytesOf(document));

    renameTrack(document, u"FX 2");
    EXPECT_FALSE(messageOnAFullDisk().ends_with(kept)) << "The autosave isn't that of the present work.";
}

TEST_F(OpenDocumentTest, IsNotSavedAsItsOwnFileInSilenceWhenAnotherProgramHasChangedThat)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    const std::string foreign = contentOf(writeProject("reel3.stage", 3));

    EXPECT_EQ(documents.saveAs(document, file).state, State::Changed);
    EXPECT_EQ(contentOf(file), foreign);

    fs::remove(file);
    EXPECT_TRUE(documents.saveAs(document, file).isSaved());
    EXPECT_EQ(contentOf(file), bytesOf(document));
}

TEST_F(OpenDocumentTest, SavesAsAnotherFileThatIsItsOwnFromThenOn)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");
    const std::string before = contentOf(file);

    const fs::path other = file.parent_path() / "reel4.stage";
    ASSERT_TRUE(documents.saveAs(document, other).isSaved());

    EXPECT_EQ(document.path(), other);
    EXPECT_EQ(document.name(), "reel4.stage");
    EXPECT_EQ(contentOf(other), bytesOf(document));
    EXPECT_EQ(contentOf(file), before);
    EXPECT_FALSE(document.isUnsaved());
    renameTrack(document, u"FX 2");
    EXPECT_TRUE(documents.save(document).isSaved());
    EXPECT_EQ(contentOf(file), before);
}

TEST_F(OpenDocumentTest, StaysWithItsFileWhenItCannotBeSavedAsAnother)
{
    OpenDocument& document = opened();
    renameTrack(document, u"FX 1");

    const SaveAnswer answer = documents.saveAs(document, folder / "nowhere" / "reel4.stage");

    EXPECT_EQ(answer.state, State::Failed);
    EXPECT_EQ(document.path(), file);
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(documents.save(document).isSaved());
}

// The undo list.

TEST_F(OpenDocumentTest, GoesToAnyPlaceOfItsUndoList)
{
    OpenDocument& document = opened();
    for (const char16_t* const name : {u"A", u"B", u"C"})
        renameTrack(document, name);
    EXPECT_EQ(document.undoNames(), (std::vector<std::u16string>{u"A", u"B", u"C"}));
    EXPECT_EQ(document.undoPosition(), 3U);

    EXPECT_TRUE(document.goToUndoPosition(1));
    EXPECT_EQ(trackOf(document).name(), u"A");
    EXPECT_EQ(document.undoPosition(), 1U);
    EXPECT_TRUE(document.goToUndoPosition(0));
    EXPECT_EQ(trackOf(document).name(), u"DIA 1");
    EXPECT_TRUE(document.goToUndoPosition(0));
    EXPECT_TRUE(document.goToUndoPosition(3));
    EXPECT_EQ(trackOf(document).name(), u"C");
    EXPECT_FALSE(document.goToUndoPosition(4));
    EXPECT_EQ(document.undoPosition(), 3U);
}

TEST_F(OpenDocumentTest, GoesNowhereInItsUndoListWithinATransaction)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");

    edit(document.project(), u"B", [&] { EXPECT_FALSE(document.goToUndoPosition(0)); });

    EXPECT_EQ(trackOf(document).name(), u"A");
}

} // namespace desktop::tests
