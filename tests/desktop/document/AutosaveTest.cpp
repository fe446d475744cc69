// SPDX-License-Identifier: GPL-3.0-or-later

// Unsaved work: when it is written beside the file, when it goes, and what becomes of it after a crash.

#include "desktop/document/Autosave.h"

#include "desktop/document/DocumentError.h"
#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/ChildProcess.h"
#include "tests/support/FileSizeLimit.h"

#include <fstream>

namespace desktop::tests {

namespace fs = std::filesystem;

using cadrel::tests::ChildProcess;
using cadrel::tests::FileSizeLimit;
using std::chrono::milliseconds;
using std::chrono::seconds;

class AutosaveTest : public DocumentTest {
protected:
    OpenDocument& opened(Work work = Work::Keep) { return documents.open(file, work); }

    /// Leaves what a program leaves that ended with the track renamed and nothing saved.
    std::string crash(const char16_t* name = u"FX 1")
    {
        OpenDocument& document = opened();
        renameTrack(document, name);
        idle();
        std::string left = contentOf(autosave);
        documents.close(document);
        writeFile(autosave, left);
        return left;
    }

    fs::path file = fs::canonical(writeProject("reel3.stage"));
    fs::path autosave = file.parent_path() / "reel3.stage.autosave";
};

// When it is written.

TEST_F(AutosaveTest, HasTheBytesOfTheProjectAndSaysWhoseTheyAre)
{
    OpenDocument& document = opened();
    const ContentPrint stored = ContentPrint::of(contentOf(file));
    renameTrack(document, u"FX 1");
    module->models[&document.project()] = "settings";
    const auto before = std::chrono::system_clock::now() - seconds(1);
    idle();

    const auto written = Autosave::read(file);
    ASSERT_TRUE(written);
    EXPECT_EQ(written->content, bytesOf(document));
    EXPECT_EQ(written->path, file);
    EXPECT_EQ(written->form, "stage");
    EXPECT_EQ(written->filePrint, stored);
    EXPECT_GE(written->time, before);
    EXPECT_LE(written->time, std::chrono::system_clock::now());
    EXPECT_EQ(contentOf(file).find("FX 1"), std::string::npos);
}

TEST_F(AutosaveTest, IsNotWrittenWithoutUnsavedWork)
{
    OpenDocument& document = opened();
    idle();
    renameTrack(document, u"FX 1");
    application.edits().undo(document.project());
    idle();

    EXPECT_FALSE(fs::exists(autosave));
}

TEST_F(AutosaveTest, IsWrittenAtMostOnceInItsIntervalAndOnlyAfterAChange)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle(seconds(0));
    ASSERT_TRUE(fs::exists(autosave));
    const std::string first = contentOf(autosave);

    renameTrack(document, u"B");
    idle(seconds(29));
    EXPECT_EQ(contentOf(autosave), first);
    idle(milliseconds(999));
    EXPECT_EQ(contentOf(autosave), first);
    idle(milliseconds(1));
    EXPECT_NE(contentOf(autosave), first);

    fs::remove(autosave);
    idle();
    EXPECT_FALSE(fs::exists(autosave));
    renameTrack(document, u"C");
    idle();
    EXPECT_TRUE(fs::exists(autosave));
}

TEST_F(AutosaveTest, DoesNotWaitForItsIntervalWhereThereWasNothingToWrite)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    renameTrack(document, u"DIA 1"); // as it was, by another way
    idle();
    EXPECT_FALSE(document.isUnsaved());
    ASSERT_FALSE(fs::exists(autosave));

    renameTrack(document, u"B");
    idle(seconds(1));
    EXPECT_TRUE(fs::exists(autosave));
}

TEST_F(AutosaveTest, IsNotWrittenWithinATransactionOrWhileIdleCallsAreBlocked)
{
    OpenDocument& document = opened();
    edit(document.project(), u"Rename", [&] {
        trackOf(document).setName(u"FX 1");
        idle();
    });
    application.idleManager().setIdleBlocked(true);
    idle();
    application.idleManager().setIdleBlocked(false);
    EXPECT_FALSE(fs::exists(autosave));
    idle();
    EXPECT_TRUE(fs::exists(autosave));
}

TEST_F(AutosaveTest, GoesWithASaveWithClosingAndWithTheUndoOfAllThatIsUnsaved)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle();
    ASSERT_TRUE(fs::exists(autosave));
    ASSERT_TRUE(documents.save(document).isSaved());
    EXPECT_FALSE(fs::exists(autosave));

    renameTrack(document, u"B");
    idle();
    ASSERT_TRUE(fs::exists(autosave));
    application.edits().undo(document.project());
    idle();
    EXPECT_FALSE(fs::exists(autosave));

    application.edits().redo(document.project());
    idle();
    ASSERT_TRUE(fs::exists(autosave));
    documents.close(document);
    EXPECT_FALSE(fs::exists(autosave));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"reel3.stage"}));
}

TEST_F(AutosaveTest, StaysWhenASaveFails)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle();
    writeProject("reel3.stage", 2);

    EXPECT_EQ(documents.save(document).state, State::Changed);
    EXPECT_TRUE(fs::exists(autosave));
}

TEST_F(AutosaveTest, GoesWithTheDocumentToItsNewFile)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle();
    ASSERT_TRUE(documents.saveAs(document, folder / "reel4.stage").isSaved());
    EXPECT_FALSE(fs::exists(autosave));

    renameTrack(document, u"B");
    idle();
    EXPECT_FALSE(fs::exists(autosave));
    EXPECT_TRUE(fs::exists(folder / "reel4.stage.autosave"));
}

TEST_F(AutosaveTest, OnAFullDiskIsToldAndLeavesTheFormerOne)
{
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle();
    const std::string first = contentOf(autosave);
    renameTrack(document, u"B");
    const std::vector<std::string> names = folder.names();
    {
        const FileSizeLimit full(10);
        idle();
    }
    EXPECT_EQ(document.autosaveFault(), autosave.string() + ": the autosave can't be written");
    EXPECT_EQ(contentOf(autosave), first);
    EXPECT_EQ(folder.names(), names);

    idle(seconds(29));
    EXPECT_EQ(contentOf(autosave), first);
    idle(seconds(1)); // the disk has room again, and the user does nothing
    EXPECT_EQ(document.autosaveFault(), "");
    EXPECT_NE(contentOf(autosave), first);
}

TEST_F(AutosaveTest, NeverReplacesOrRemovesAnotherFileOfItsName)
{
    writeFile(autosave, "my notes");
    OpenDocument& document = opened();
    renameTrack(document, u"A");
    idle();

    EXPECT_EQ(document.autosaveFault(), autosave.string() + ": is in the way of the autosave; give it another name");
    ASSERT_TRUE(documents.save(document).isSaved());
    documents.close(document);
    EXPECT_EQ(contentOf(autosave), "my notes");
}

TEST_F(AutosaveTest, FollowsNoLink)
{
    const std::string left = crash();
    fs::remove(autosave);
    writeFile(folder / "elsewhere", left);
    fs::create_symlink(folder / "elsewhere", autosave);

    EXPECT_FALSE(documents.look(file).unsavedWork);
    OpenDocument& document = opened();
    renameTrack(document, u"B");
    idle();
    documents.close(document);
    EXPECT_EQ(contentOf(folder / "elsewhere"), left);
    EXPECT_TRUE(fs::is_symlink(autosave));
}

TEST_F(AutosaveTest, IsNeverTakenForAProject)
{
    crash();

    EXPECT_THROW(documents.open(autosave), DocumentError);
    EXPECT_EQ(documents.size(), 0U);
}

TEST_F(AutosaveTest, OfAFileWithTheLongestNameHasAHashInItsName)
{
    const std::string longest = std::string(249, 'x').append(".stage");
    const fs::path longFile = fs::canonical(writeProject(longest));
    const fs::path path = Autosave::pathFor(longFile);

    EXPECT_EQ(path.filename().string().size(), 255U);
    EXPECT_TRUE(path.string().ends_with(".autosave"));
    OpenDocument& document = documents.open(longFile);
    renameTrack(document, u"A");
    idle();
    EXPECT_EQ(document.autosaveFault(), "");
    EXPECT_TRUE(Autosave::read(longFile));
}

// After a crash.

TEST_F(AutosaveTest, IsOfferedWithItsTimeAfterACrash)
{
    const auto before = std::chrono::system_clock::now() - seconds(1);
    crash();

    const Opening opening = documents.look(file);

    ASSERT_TRUE(opening.unsavedWork);
    EXPECT_GE(opening.unsavedWork->time, before);
    EXPECT_FALSE(opening.unsavedWork->isOfFormerFile);
    EXPECT_FALSE(opening.openElsewhere);
}

TEST_F(AutosaveTest, OpensAsUnsavedWorkOfItsFile)
{
    crash(u"FX 1");
    const std::string stored = contentOf(file);

    OpenDocument& document = opened(Work::Recover);

    EXPECT_EQ(document.path(), file);
    EXPECT_EQ(trackOf(document).name(), u"FX 1");
    EXPECT_TRUE(document.isUnsaved());
    EXPECT_TRUE(document.settleUnsaved());
    EXPECT_EQ(contentOf(file), stored);
    EXPECT_TRUE(fs::exists(autosave));
    EXPECT_TRUE(documents.save(document).isSaved());
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_EQ(contentOf(file), bytesOf(document));
    EXPECT_FALSE(fs::exists(autosave));
}

TEST_F(AutosaveTest, StaysAsLongAsTheRecoveredWorkIsUnsaved)
{
    const std::string left = crash();
    OpenDocument& document = opened(Work::Recover);
    idle();
    idle();
    EXPECT_EQ(contentOf(autosave), left);
    documents.close(document);
    EXPECT_FALSE(fs::exists(autosave));
}

TEST_F(AutosaveTest, IsKeptUnderAnotherNameWhenTheUserDoesNotWantIt)
{
    const std::string first = crash(u"A");
    documents.close(opened(Work::Keep));
    EXPECT_FALSE(documents.look(file).unsavedWork);
    const std::string second = crash(u"B");
    documents.close(opened(Work::Keep));

    EXPECT_FALSE(fs::exists(autosave));
    EXPECT_EQ(contentOf(folder / "reel3.stage.autosave-1"), first);
    EXPECT_EQ(contentOf(folder / "reel3.stage.autosave-2"), second);
}

TEST_F(AutosaveTest, IsRemovedWhenTheUserSaysSo)
{
    crash();
    OpenDocument& document = opened(Work::Remove);

    EXPECT_EQ(trackOf(document).name(), u"DIA 1");
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_EQ(folder.names(), (std::vector<std::string>{".reel3.stage.cadrel-lock", "reel3.stage"}));
}

TEST_F(AutosaveTest, WithTheContentOfTheFileIsNotOfferedAndGoes)
{
    // The program ended between the save and the removal.
    const std::string stored = contentOf(file);
    Autosave::write(file, ContentPrint::of("what was there before"), stored, std::chrono::system_clock::now());

    EXPECT_FALSE(documents.look(file).unsavedWork);
    EXPECT_TRUE(fs::exists(autosave));
    OpenDocument& document = opened(Work::Recover);
    EXPECT_FALSE(document.isUnsaved());
    EXPECT_FALSE(fs::exists(autosave));
}

TEST_F(AutosaveTest, SaysThatTheFileHasChangedSinceThen)
{
    crash();
    writeProject("reel3.stage", 2);

    const Opening opening = documents.look(file);
    ASSERT_TRUE(opening.unsavedWork);
    EXPECT_TRUE(opening.unsavedWork->isOfFormerFile);
    OpenDocument& document = opened(Work::Recover);
    EXPECT_EQ(document.project().allTracks().size(), 1U);
    EXPECT_TRUE(document.isUnsaved());

    const std::string foreign = contentOf(file);
    EXPECT_EQ(documents.save(document).state, State::Changed);
    EXPECT_EQ(contentOf(file), foreign);
    EXPECT_EQ(documents.save(document).message,
              file.string() + ": has been changed since the time of the recovered work");
    EXPECT_TRUE(documents.overwrite(document).isSaved());
    renameTrack(document, u"B");
    EXPECT_TRUE(documents.save(document).isSaved()) << "From then on the file is its own.";
}

TEST_F(AutosaveTest, SaysThatTheFileHasChangedAfterASecondCrashAsWell)
{
    crash();
    writeProject("reel3.stage", 2);
    OpenDocument& document = opened(Work::Recover);
    renameTrack(document, u"B");
    idle();
    const std::string left = contentOf(autosave);
    documents.close(document);
    writeFile(autosave, left);

    ASSERT_TRUE(documents.look(file).unsavedWork);
    EXPECT_TRUE(documents.look(file).unsavedWork->isOfFormerFile);
}

TEST_F(AutosaveTest, ThatIsNotWholeIsNeverOffered)
{
    const std::string whole = crash();
    std::vector<std::string> broken;
    for (std::size_t size = 0; size < whole.size(); ++size)
        broken.push_back(whole.substr(0, size));
    for (std::size_t index = 0; index < whole.size(); ++index) {
        std::string changed = whole;
        changed[index] = static_cast<char>(changed[index] ^ 1);
        broken.push_back(changed);
    }
    broken.push_back(whole + " ");
    for (const std::string& content : broken) {
        writeFile(autosave, content);
        const auto read = Autosave::read(file);
        // In its head a character of the path or the time may be another, and it is still whole.
        EXPECT_TRUE(!read || whole.ends_with(read->content)) << content;
        EXPECT_TRUE(!read || read->content == bytesOf(opened(Work::Recover))) << content;
        while (documents.size() > 0)
            documents.close(documents.at(0));
    }
}

TEST_F(AutosaveTest, WithAnAbsurdHeadIsNeverOffered)
{
    const std::string content = contentOf(file);
    const ContentPrint print = ContentPrint::of(content);
    const auto readWith = [this](const std::string& written) {
        writeFile(autosave, written);
        return Autosave::read(file).has_value();
    };
    for (const char* const head :
         {"", "null", "[]", "{}", "{\"path\":1}", R"({"path":"/a","form":"stage","fileSize":-1,"fileHash":"00"})"}) {
        writeFile(autosave, std::string("Cadrel autosave 1\n").append(head).append("\n").append(content));
        EXPECT_FALSE(Autosave::read(file)) << head;
    }
    writeFile(autosave, "Cadrel autosave 1\n" + std::string(100000, '[') + "\n" + content);
    EXPECT_FALSE(Autosave::read(file));

    Autosave::write(file, print, content, Autosave::Time(std::chrono::seconds(1000)));
    EXPECT_TRUE(Autosave::read(file));
    const std::string whole = contentOf(autosave);
    const std::string time = "\"time\":1000";
    const std::size_t place = whole.find(time);
    ASSERT_NE(place, std::string::npos) << whole.substr(0, 300);
    for (const char* const absurd : {"-1", "9223372037", "9223372036854775806", "1e300"})
        EXPECT_FALSE(readWith(std::string(whole).replace(place, time.size(), std::string("\"time\":").append(absurd))))
            << absurd;
    EXPECT_TRUE(readWith(std::string(whole).replace(place, time.size(), "\"time\":9223372036")));
    EXPECT_EQ(print.size, content.size());
}

TEST_F(AutosaveTest, ThatNoProgramCanOpenLeavesNothingOpenAndStays)
{
    const std::string content = "{ no project";
    Autosave::write(file, ContentPrint::of(contentOf(file)), content, std::chrono::system_clock::now());

    EXPECT_THROW(opened(Work::Recover), DocumentError);
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_TRUE(fs::exists(autosave));
    EXPECT_FALSE(documents.look(file).openElsewhere);
}

// While another process has the project open.

TEST_F(AutosaveTest, OfAnotherProcessThatHasTheProjectOpenIsNotOfferedButTold)
{
    const std::string left = crash();
    const DocumentLock lock(file); // as good as another process: of another descriptor
    ASSERT_TRUE(lock.isHeld());

    const Opening opening = documents.look(file);
    ASSERT_TRUE(opening.openElsewhere);
    EXPECT_EQ(opening.openElsewhere->process, ::getpid());
    EXPECT_NE(opening.openElsewhere->machine, "");
    EXPECT_FALSE(opening.unsavedWork);

    OpenDocument& document = opened(Work::Recover);
    EXPECT_TRUE(document.openElsewhere());
    EXPECT_EQ(trackOf(document).name(), u"DIA 1");
    renameTrack(document, u"B");
    idle();
    EXPECT_TRUE(documents.save(document).isSaved());
    documents.close(document);
    EXPECT_EQ(contentOf(autosave), left);
    EXPECT_TRUE(DocumentLock::holderOf(file));
}

TEST_F(AutosaveTest, IsOfferedAgainOnceTheOtherProcessHasEndedInWhateverWay)
{
    crash();
    const int status = ChildProcess::statusOf([&] {
        const DocumentLock lock(file);
        ::_exit(lock.isHeld() ? 7 : 8); // without the destructor
        return 0;
    });
    ASSERT_EQ(status, 7);
    ASSERT_TRUE(fs::exists(DocumentLock::pathFor(file)));

    const Opening opening = documents.look(file);
    EXPECT_FALSE(opening.openElsewhere);
    EXPECT_TRUE(opening.unsavedWork);
    documents.close(opened());
    EXPECT_FALSE(fs::exists(DocumentLock::pathFor(file)));
}

TEST_F(AutosaveTest, IsWrittenOnceTheOtherProcessHasClosedTheProjectAndReplacesNothingOfIt)
{
    const std::string left = crash();
    auto lock = std::make_unique<DocumentLock>(file);
    OpenDocument& document = opened();
    renameTrack(document, u"B");
    idle();
    EXPECT_EQ(contentOf(autosave), left);

    lock.reset();
    idle();

    EXPECT_FALSE(document.openElsewhere());
    EXPECT_EQ(contentOf(folder / "reel3.stage.autosave-1"), left);
    EXPECT_EQ(Autosave::read(file)->content, bytesOf(document));
}

TEST_F(AutosaveTest, OfAFileThatIsSavedOverIsKept)
{
    const std::string left = crash();
    OpenDocument& other = documents.open(writeProject("reel4.stage"));
    ASSERT_TRUE(documents.saveAs(other, file).isSaved());
    renameTrack(other, u"B");
    idle();

    EXPECT_EQ(contentOf(folder / "reel3.stage.autosave-1"), left);
    EXPECT_EQ(Autosave::read(file)->content, bytesOf(other));
}

TEST_F(AutosaveTest, OfAFileThatCannotBeOpenedIsStillOffered)
{
    crash(u"FX 1");
    writeFile(file, "{ broken");

    EXPECT_THROW(opened(Work::Keep), DocumentError);
    EXPECT_THROW(opened(Work::Remove), DocumentError);
    ASSERT_TRUE(documents.look(file).unsavedWork);
    EXPECT_EQ(trackOf(opened(Work::Recover)).name(), u"FX 1");
}

TEST_F(AutosaveTest, RefusesToSaveAsAFileThatIsOpenInAnotherWindow)
{
    const fs::path other = fs::canonical(writeProject("reel4.stage"));
    const DocumentLock lock(other);
    OpenDocument& document = opened();
    const std::string before = contentOf(other);

    const SaveAnswer answer = documents.saveAs(document, other);

    EXPECT_EQ(answer.state, State::Failed);
    EXPECT_EQ(answer.message, other.string() + ": is open in another window");
    EXPECT_EQ(contentOf(other), before);
}

TEST_F(AutosaveTest, ReadsAnyLockFileWithoutTrust)
{
    for (const std::string content : {"", "\n", "-5 x\n", "99999999999999999999 x\n", "12", "12 ", "12 host\nmore"}) {
        writeFile(DocumentLock::pathFor(file), content);
        EXPECT_FALSE(DocumentLock::holderOf(file)) << content;
        EXPECT_TRUE(DocumentLock(file).isHeld()) << content;
    }
    fs::create_directory(DocumentLock::pathFor(file));
    EXPECT_FALSE(DocumentLock::holderOf(file));
    const DocumentLock lock(file);
    EXPECT_FALSE(lock.isHeld());
    EXPECT_FALSE(lock.holder());
}

} // namespace desktop::tests
