// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/Workspace.h"

#include "standin/base/Utf16.h"
#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/standin/FakeBoxes.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>

namespace desktop::tests {
namespace {

namespace fs = std::filesystem;

using standin::tests::FakeBoxes;

/// A user at the desk, who answers boxes as he has decided beforehand.
class WorkspaceTest : public testing::Test, protected DocumentHost {
protected:
    OpenDocument& opened(const char* name = "reel.stage")
    {
        EXPECT_TRUE(workspace.open(writeProject(name)));
        return *documents.active();
    }
    OpenDocument& edited()
    {
        OpenDocument& document = opened();
        renameTrack(document, u"Edited");
        return document;
    }
    /// What he was told or asked last.
    std::string lastMessage() const { return boxes.messages.empty() ? "" : standin::toUtf8(boxes.messages.back()); }

    FakeBoxes boxes;
    Workspace workspace{documents, boxes};
};

TEST_F(WorkspaceTest, OpensAProjectAndAsksNothing)
{
    EXPECT_EQ(opened().name(), "reel.stage");
    EXPECT_EQ(lastMessage(), "");
}

TEST_F(WorkspaceTest, TellsWhyAProjectCannotBeOpened)
{
    EXPECT_FALSE(workspace.open(folder / "missing.stage"));
    EXPECT_NE(lastMessage().find("missing.stage"), std::string::npos) << lastMessage();
    EXPECT_FALSE(workspace.open(folder.write("broken.stage", "{")));
    EXPECT_NE(lastMessage().find("broken.stage"), std::string::npos) << lastMessage();
    EXPECT_EQ(documents.size(), 0U);
}

TEST_F(WorkspaceTest, TakesARecentProjectThatIsNotThereOffTheListWhereTheUserWantsThat)
{
    RecentFiles recent(folder / "recent.json");
    const fs::path there = writeProject("there.stage");
    const fs::path gone = folder / "gone.stage";
    recent.add(there);
    recent.add(gone);
    EXPECT_TRUE(workspace.openRecent(recent, there));
    EXPECT_EQ(lastMessage(), "");

    boxes.answers = {u"Cancel", u"Take It off the List"};
    EXPECT_FALSE(workspace.openRecent(recent, gone));
    EXPECT_NE(lastMessage().find(gone.string()), std::string::npos) << lastMessage();
    EXPECT_EQ(recent.paths(), (std::vector<fs::path>{gone, there}));
    EXPECT_FALSE(workspace.openRecent(recent, gone));
    EXPECT_EQ(recent.paths(), std::vector<fs::path>{there});
}

TEST_F(WorkspaceTest, OpensEachOfTheProjectsThatAreChosen)
{
    boxes.choices = {
        {standin::toUtf16(writeProject("a.stage").string()), standin::toUtf16(writeProject("b.stage").string())}};
    workspace.chooseAndOpen();
    EXPECT_EQ(documents.size(), 2U);
    ASSERT_EQ(boxes.questions.size(), 1U);
    EXPECT_FALSE(boxes.questions[0].isSave);
    workspace.chooseAndOpen();
    EXPECT_EQ(documents.size(), 2U) << "The second box was cancelled.";
}

TEST_F(WorkspaceTest, ClosesWithoutAQuestionWhatIsSaved)
{
    EXPECT_TRUE(workspace.close(opened()));
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_EQ(lastMessage(), "");
}

TEST_F(WorkspaceTest, SavesBeforeItClosesWhereTheUserWantsThat)
{
    boxes.answers = {u"Save"};
    EXPECT_TRUE(workspace.close(edited()));
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_NE(contentOf(folder / "reel.stage").find("Edited"), std::string::npos);
}

TEST_F(WorkspaceTest, ClosesWithoutSavingWhereTheUserWantsThat)
{
    boxes.answers = {u"Close without Saving"};
    EXPECT_TRUE(workspace.close(edited()));
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_EQ(contentOf(folder / "reel.stage").find("Edited"), std::string::npos);
}

TEST_F(WorkspaceTest, StaysOpenWhereTheUserCancels)
{
    boxes.answers = {u"Cancel"};
    EXPECT_FALSE(workspace.close(edited()));
    EXPECT_EQ(documents.size(), 1U);
    EXPECT_NE(lastMessage().find("reel.stage"), std::string::npos);
}

TEST_F(WorkspaceTest, ClosesNoneOfAllWhereOneIsToStayOpen)
{
    edited();
    opened("other.stage");
    renameTrack(opened("third.stage"), u"Edited");
    boxes.answers = {u"Close without Saving", u"Cancel"};
    EXPECT_FALSE(workspace.closeAll());
    EXPECT_EQ(documents.size(), 3U);
    ASSERT_EQ(boxes.messages.size(), 2U);
    EXPECT_NE(standin::toUtf8(boxes.messages[0]).find("third.stage"), std::string::npos) << "It is in front.";
    EXPECT_NE(standin::toUtf8(boxes.messages[1]).find("reel.stage"), std::string::npos);

    boxes.answers = {u"Save", u"Close without Saving"};
    EXPECT_TRUE(workspace.closeAll());
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_NE(contentOf(folder / "third.stage").find("Edited"), std::string::npos);
    EXPECT_EQ(contentOf(folder / "reel.stage").find("Edited"), std::string::npos);
}

TEST_F(WorkspaceTest, NeverOverwritesInSilenceWhatAnotherProgramHasWritten)
{
    OpenDocument& document = edited();
    const std::string foreign = contentOf(writeProject("foreign.stage", 3));
    for (const char16_t* const answer : {u"Cancel", u"Save As..."}) {
        folder.write("reel.stage", foreign);
        boxes.answers = {answer};
        EXPECT_FALSE(workspace.save(document)) << "The box for another name is cancelled, too.";
        EXPECT_EQ(contentOf(folder / "reel.stage"), foreign);
    }
    boxes.answers = {u"Overwrite"};
    EXPECT_TRUE(workspace.save(document));
    EXPECT_NE(contentOf(folder / "reel.stage").find("Edited"), std::string::npos);
}

TEST_F(WorkspaceTest, SavesAgainWhatIsGoneFromTheDisk)
{
    OpenDocument& document = edited();
    fs::remove(folder / "reel.stage");
    boxes.answers = {u"Save It There Again"};
    EXPECT_TRUE(workspace.save(document));
    EXPECT_TRUE(fs::exists(folder / "reel.stage"));
}

TEST_F(WorkspaceTest, SavesUnderAnotherNameWithTheExtensionOfItsForm)
{
    OpenDocument& document = edited();
    const std::string former = document.name();
    boxes.choices = {{standin::toUtf16((folder / "new.stage").string())}};
    EXPECT_TRUE(workspace.saveAs(document));
    EXPECT_EQ(document.name(), "new.stage");
    ASSERT_EQ(boxes.questions.size(), 1U);
    EXPECT_EQ(boxes.questions[0].name, standin::toUtf16(former)) << "to be changed";
    EXPECT_TRUE(boxes.questions[0].isSave);
    ASSERT_EQ(boxes.questions[0].filters.size(), 1U);
    EXPECT_EQ(boxes.questions[0].filters[0].extension, "stage");
}

TEST_F(WorkspaceTest, TellsOnceThatTheFileWasChangedByAnotherProgram)
{
    opened();
    workspace.lookAtFile();
    EXPECT_EQ(lastMessage(), "");
    folder.write("reel.stage", contentOf(writeProject("foreign.stage", 3)));
    boxes.answers = {u"Keep What Is Here"};
    workspace.lookAtFile();
    workspace.lookAtFile();
    EXPECT_EQ(boxes.messages.size(), 1U);
    EXPECT_EQ(documents.active()->project().allTracks().size(), 1U);
}

TEST_F(WorkspaceTest, ReloadsAChangedFileWhereTheUserWantsThat)
{
    opened();
    folder.write("reel.stage", contentOf(writeProject("foreign.stage", 3)));
    boxes.answers = {u"Reload"};
    workspace.lookAtFile();
    EXPECT_EQ(documents.size(), 1U);
    EXPECT_EQ(documents.active()->project().allTracks().size(), 3U);
}

TEST_F(WorkspaceTest, AsksOnceWhetherAFileIsReloadedThatCannotBeRead)
{
    opened();
    folder.write("reel.stage", "{");
    boxes.answers = {u"Reload"};
    workspace.lookAtFile();
    const std::size_t told = boxes.messages.size();
    EXPECT_EQ(told, 2U) << "The question, and why it can't be done.";
    workspace.lookAtFile();
    EXPECT_EQ(boxes.messages.size(), told);
}

TEST_F(WorkspaceTest, KeepsUnsavedWorkAsAFileThatItNamesWhenAChangedFileIsReloaded)
{
    edited();
    folder.write("reel.stage", contentOf(writeProject("foreign.stage", 3)));
    boxes.answers = {u"Reload"};
    workspace.lookAtFile();
    EXPECT_NE(lastMessage().find("is kept in the file \"reel.stage.autosave-1\""), std::string::npos) << lastMessage();
    EXPECT_EQ(documents.active()->project().allTracks().size(), 3U);
    EXPECT_NE(contentOf(folder / "reel.stage.autosave-1").find("Edited"), std::string::npos);
}

TEST_F(WorkspaceTest, AsksBeforeItSavesAsItsOwnFileThatAnotherProgramHasWritten)
{
    OpenDocument& document = edited();
    const std::string foreign = contentOf(writeProject("reel.stage", 3));
    const std::u16string path = standin::toUtf16(document.path().string());
    boxes.choices = {{path}, {path}};
    boxes.answers = {u"Cancel"};
    EXPECT_FALSE(workspace.saveAs(document));
    EXPECT_EQ(contentOf(document.path()), foreign);
    boxes.answers = {u"Overwrite"};
    EXPECT_TRUE(workspace.saveAs(document));
    EXPECT_NE(contentOf(document.path()).find("Edited"), std::string::npos);
}

// Whoever presses a key just when a box comes up.

TEST_F(WorkspaceTest, KeepsUnsavedWorkOfAChangedFileWhenReturnOrEscapeIsPressed)
{
    for (const char16_t* const key : {FakeBoxes::Return, FakeBoxes::Escape}) {
        OpenDocument& document = opened(key == FakeBoxes::Return ? "a.stage" : "b.stage");
        renameTrack(document, u"Edited");
        writeProject(document.name(), 3);
        boxes.answers = {key};
        workspace.lookAtFile();
        EXPECT_TRUE(boxes.answers.empty()) << "It was asked.";
        ASSERT_EQ(documents.active(), &document);
        EXPECT_EQ(trackOf(document).name(), u"Edited");
        EXPECT_TRUE(document.isUnsaved());
    }
}

TEST_F(WorkspaceTest, OverwritesNothingOfAnotherProgramWhenReturnOrEscapeIsPressed)
{
    OpenDocument& document = edited();
    const std::string foreign = contentOf(writeProject("foreign.stage", 3));
    folder.write("reel.stage", foreign);
    for (const char16_t* const key : {FakeBoxes::Return, FakeBoxes::Escape}) {
        boxes.answers = {key};
        EXPECT_FALSE(workspace.save(document));
        EXPECT_EQ(contentOf(folder / "reel.stage"), foreign);
    }
    EXPECT_TRUE(document.isUnsaved());
}

TEST_F(WorkspaceTest, OpensNothingThatIsOpenElsewhereWhenReturnOrEscapeIsPressed)
{
    const fs::path file = fs::canonical(writeProject("reel.stage"));
    const DocumentLock lock(file);
    for (const char16_t* const key : {FakeBoxes::Return, FakeBoxes::Escape}) {
        boxes.answers = {key};
        EXPECT_FALSE(workspace.open(file));
    }
    EXPECT_EQ(documents.size(), 0U);
    boxes.answers = {u"Open All the Same"};
    EXPECT_TRUE(workspace.open(file));
}

TEST_F(WorkspaceTest, LosesNothingWhenReturnOrEscapeIsPressedBeforeClosing)
{
    boxes.answers = {FakeBoxes::Escape};
    EXPECT_FALSE(workspace.close(edited()));
    boxes.answers = {FakeBoxes::Return};
    EXPECT_TRUE(workspace.close(*documents.active()));
    EXPECT_NE(contentOf(folder / "reel.stage").find("Edited"), std::string::npos) << "It was saved.";
}

TEST_F(WorkspaceTest, KeepsTheWorkOfAProgramThatHasEndedWhenReturnOrEscapeIsPressed)
{
    const fs::path file = fs::canonical(writeProject("crashed.stage"));
    Autosave::write(file, ContentPrint::of(contentOf(file)), contentOf(writeProject("unsaved.stage", 2)),
                    Autosave::Time::clock::now());
    boxes.answers = {FakeBoxes::Escape};
    EXPECT_FALSE(workspace.open(file));
    EXPECT_TRUE(fs::exists(Autosave::pathFor(file)));
    boxes.answers = {FakeBoxes::Return};
    EXPECT_TRUE(workspace.open(file));
    EXPECT_EQ(documents.active()->project().allTracks().size(), 2U);
}

TEST_F(WorkspaceTest, OffersTheWorkOfAProgramThatHasEndedWithoutSaving)
{
    for (const bool isRecovered : {true, false}) {
        const fs::path file = writeProject("crashed.stage");
        Autosave::write(fs::canonical(file), ContentPrint::of(contentOf(file)),
                        contentOf(writeProject("unsaved.stage", 2)), Autosave::Time::clock::now());
        boxes.answers = {isRecovered ? u"Recover It" : u"Open without It"};
        EXPECT_TRUE(workspace.open(file));
        EXPECT_EQ(documents.active()->project().allTracks().size(), isRecovered ? 2U : 1U);
        EXPECT_NE(lastMessage().find("crashed.stage"), std::string::npos);
        documents.close(*documents.active());
    }
}

TEST_F(WorkspaceTest, OpensNothingWhereTheUserCancelsTheOffer)
{
    const fs::path file = writeProject("crashed.stage");
    Autosave::write(fs::canonical(file), ContentPrint::of(contentOf(file)), contentOf(writeProject("unsaved.stage", 2)),
                    Autosave::Time::clock::now());
    boxes.answers = {u"Cancel"};
    EXPECT_FALSE(workspace.open(file));
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_TRUE(fs::exists(Autosave::pathFor(fs::canonical(file)))) << "It is offered again the next time.";
}

TEST_F(WorkspaceTest, ClosesNoOtherTabWhenOneIsClosedTwice)
{
    const std::uint64_t first = opened("a.stage").id();
    const std::uint64_t second = opened("b.stage").id();
    workspace.closeTab(first);
    workspace.closeTab(first);
    workspace.activateTab(first);
    ASSERT_EQ(documents.size(), 1U);
    EXPECT_EQ(documents.active()->name(), "b.stage");
    workspace.closeTab(second);
    workspace.closeTab(second);
    EXPECT_EQ(documents.size(), 0U);
}

TEST_F(WorkspaceTest, GivesATabThatIsOpenedLaterAnotherIdAndAReloadedOneTheSame)
{
    const std::uint64_t first = opened("a.stage").id();
    workspace.closeTab(first);
    OpenDocument& document = opened("a.stage");
    EXPECT_NE(document.id(), first);
    const std::uint64_t id = document.id();
    EXPECT_EQ(documents.reload(document).id(), id);
    EXPECT_EQ(documents.withId(id), documents.active());
    EXPECT_THROW(documents.at(1), std::out_of_range);
}

TEST_F(WorkspaceTest, KeepsTheMediaOfAProjectThatIsSavedInAnotherFolder)
{
    const auto project = [](const char* path) {
        return std::string(R"({"format": "stage", "version": 1, "framesPerSecond": 24, "tracks": [], "pool": [)"
                           R"({"number": 1, "kind": "audio", "name": "a", "path": ")")
            .append(path)
            .append(R"(", "length": 2}]})");
    };
    const fs::path top = fs::canonical(folder / "");
    fs::create_directories(top / "film/Audio");
    fs::create_directories(top / "out");
    folder.write("film/Audio/beside.wav", "");
    struct Case {
        const char* path;
        const char* target;
        std::string stored;
    };
    // Without the trailing slash that canonical leaves where the folder had one.
    const std::string film = (top / "film").string();
    for (const Case& each :
         {Case{"Audio/a.wav", "out/x.stage", film + "/Audio/a.wav"},
          Case{"../lib/a.wav", "out/x.stage", (top / "lib/a.wav").string()},
          Case{"Audio/a.wav", "x.stage", "film/Audio/a.wav"}, Case{"Audio/a.wav", "film/Audio/x.stage", "a.wav"},
          Case{"Audio/a.wav", "film/x.stage", "Audio/a.wav"}, Case{"/fx/a.wav", "out/x.stage", "/fx/a.wav"},
          Case{"C:\\\\fx\\\\a.wav", "out/x.stage", "C:\\fx\\a.wav"}, Case{"", "out/x.stage", ""}}) {
        folder.write("film/reel.stage", project(each.path));
        ASSERT_TRUE(workspace.open(folder / "film/reel.stage")) << lastMessage();
        OpenDocument& document = *documents.active();
        const auto pathNow = [&] { return standin::toUtf8(document.project().pool().clipWith(1)->path()); };
        const std::string before = pathNow();
        boxes.choices = {{standin::toUtf16((top / "missing/x.stage").string())}};
        EXPECT_FALSE(workspace.saveAs(document));
        EXPECT_EQ(pathNow(), before) << "Nothing was stored.";

        boxes.choices = {{standin::toUtf16((top / each.target).string())}};
        ASSERT_TRUE(workspace.saveAs(document)) << lastMessage();
        EXPECT_EQ(pathNow(), each.stored);
        EXPECT_FALSE(document.settleUnsaved());
        documents.close(document);
        ASSERT_TRUE(workspace.open(top / each.target));
        EXPECT_EQ(standin::toUtf8(documents.active()->project().pool().clipWith(1)->path()), each.stored);
        documents.close(*documents.active());
        fs::remove(top / each.target);
    }
}

TEST_F(WorkspaceTest, TellsOnceThatUnsavedWorkHasNoAutosave)
{
    folder.write("reel.stage.autosave", "my notes");
    OpenDocument& document = opened();
    workspace.lookAtAutosaves();
    EXPECT_EQ(lastMessage(), "") << "There is nothing to be lost yet.";
    for (const char16_t* const name : {u"A", u"B"}) {
        renameTrack(document, name);
        idle();
        workspace.lookAtAutosaves();
        EXPECT_EQ(boxes.messages.size(), 1U);
        EXPECT_NE(lastMessage().find("reel.stage.autosave: is in the way"), std::string::npos) << lastMessage();
    }
}

TEST_F(WorkspaceTest, TellsAgainThatUnsavedWorkHasNoAutosaveAfterItHadOne)
{
    const fs::path inTheWay = folder.write("reel.stage.autosave", "my notes");
    OpenDocument& document = opened();
    const auto edit = [&](const char16_t* name) {
        renameTrack(document, name);
        idle();
        workspace.lookAtAutosaves();
    };
    edit(u"A");
    EXPECT_EQ(boxes.messages.size(), 1U);
    fs::remove(inTheWay);
    edit(u"B");
    EXPECT_EQ(boxes.messages.size(), 1U);
    fs::remove(inTheWay);
    folder.write("reel.stage.autosave", "my notes");
    edit(u"C");
    EXPECT_EQ(boxes.messages.size(), 2U);
}

TEST_F(WorkspaceTest, TellsOnceWhereTheWorkOfAnotherProgramIsThatHasEnded)
{
    const fs::path file = fs::canonical(writeProject("reel.stage"));
    auto lock = std::make_unique<DocumentLock>(file);
    boxes.answers = {u"Open All the Same"};
    ASSERT_TRUE(workspace.open(file));
    Autosave::write(file, ContentPrint::of(contentOf(file)), "its work", std::chrono::system_clock::now());
    const std::size_t asked = boxes.messages.size();
    idle();
    workspace.lookAtAutosaves();
    EXPECT_EQ(boxes.messages.size(), asked) << "It still works.";

    lock.reset();
    idle();
    workspace.lookAtAutosaves();
    workspace.lookAtAutosaves();
    EXPECT_EQ(boxes.messages.size(), asked + 1);
    EXPECT_NE(lastMessage().find("\"reel.stage.autosave-1\""), std::string::npos) << lastMessage();
    EXPECT_TRUE(fs::exists(folder / "reel.stage.autosave-1"));
}

TEST_F(WorkspaceTest, SaysThatAFileIsNoVideo)
{
    OpenDocument& document = opened();
    EXPECT_FALSE(workspace.addVideo(document, folder.write("text.mov", "no film")));
    EXPECT_NE(lastMessage().find("text.mov"), std::string::npos);
    EXPECT_TRUE(document.project().pool().clips().empty());
}

} // namespace
} // namespace desktop::tests
