// SPDX-License-Identifier: GPL-3.0-or-later

// Several documents: which is active, and which file is the same.

#include "desktop/document/DocumentError.h"
#include "desktop/document/RecentFiles.h"
#include "tests/desktop/document/DocumentHost.h"
#include "tests/support/FileSizeLimit.h"

#include "standin/edit/ProjectManager.h"
#include "tests/standin/ardour/SessionText.h"

namespace desktop::tests {

namespace fs = std::filesystem;

using standin::tests::SessionText;

class OpenDocumentsTest : public DocumentTest {
protected:
    /// The names in the order of the tabs, the active one in brackets.
    std::string tabs()
    {
        std::string text;
        for (std::size_t index = 0; index < documents.size(); ++index) {
            OpenDocument& document = documents.at(index);
            const bool isActive = &document == documents.active();
            EXPECT_EQ(isActive, application.projects().active() == &document.project());
            text += std::string(index > 0 ? " " : "").append(isActive ? "[" : "").append(document.name());
            text += isActive ? "]" : "";
        }
        EXPECT_EQ(documents.size(), application.projects().projects().size());
        return text;
    }
    OpenDocument& opened(const std::string& name) { return documents.open(writeProject(name)); }
};

TEST_F(OpenDocumentsTest, ActivatesTheOneThatWasOpenedLast)
{
    EXPECT_EQ(documents.active(), nullptr);
    opened("a");
    OpenDocument& b = opened("b");
    EXPECT_EQ(tabs(), "a [b]");
    documents.activate(documents.at(0));
    EXPECT_EQ(tabs(), "[a] b");
    documents.activate(b);
    EXPECT_EQ(tabs(), "a [b]");
}

TEST_F(OpenDocumentsTest, ActivatesTheNextOneWhenTheActiveOneIsClosedAndElseTheOneBefore)
{
    for (const char* const name : {"a", "b", "c"})
        opened(name);
    documents.activate(documents.at(1));
    documents.close(documents.at(1));
    EXPECT_EQ(tabs(), "a [c]");
    documents.close(documents.at(1));
    EXPECT_EQ(tabs(), "[a]");
    documents.close(documents.at(0));
    EXPECT_EQ(tabs(), "");
    EXPECT_EQ(documents.active(), nullptr);
}

TEST_F(OpenDocumentsTest, KeepsTheActiveOneWhenAnotherIsClosed)
{
    for (const char* const name : {"a", "b", "c"})
        opened(name);
    documents.close(documents.at(0));
    EXPECT_EQ(tabs(), "b [c]");
}

TEST_F(OpenDocumentsTest, OpensAFileOnceHoweverItIsNamed)
{
    const fs::path file = writeProject("a.stage");
    OpenDocument& document = documents.open(file);
    opened("b");
    fs::create_symlink(file, folder / "link.stage");
    fs::create_directory_symlink(folder.path(), folder / "film");

    for (const fs::path& name : {file, folder / "link.stage", folder / "film" / "a.stage",
                                 folder / "film" / ".." / folder.path().filename() / "a.stage", fs::relative(file)}) {
        documents.activate(documents.at(1));
        EXPECT_EQ(documents.look(name).open, &document) << name;
        EXPECT_EQ(&documents.open(name), &document) << name;
        EXPECT_EQ(tabs(), "[a.stage] b");
    }
}

TEST_F(OpenDocumentsTest, SavesThroughALinkIntoTheFileItself)
{
    const fs::path file = writeProject("a.stage");
    fs::create_symlink(file, folder / "link.stage");
    OpenDocument& document = documents.open(folder / "link.stage");
    EXPECT_EQ(document.path(), fs::canonical(file));
    renameTrack(document, u"FX 1");

    EXPECT_TRUE(documents.save(document).isSaved());
    EXPECT_TRUE(fs::is_symlink(folder / "link.stage"));
    EXPECT_EQ(contentOf(file), bytesOf(document));
}

TEST_F(OpenDocumentsTest, RefusesToSaveAsAFileThatIsOpenInAnotherTab)
{
    OpenDocument& a = opened("a.stage");
    OpenDocument& b = opened("b.stage");
    renameTrack(b, u"FX 1");
    const std::string before = contentOf(a.path());
    fs::create_symlink(a.path(), folder / "link.stage");

    for (const fs::path& name : {a.path(), folder / "link.stage"}) {
        const SaveAnswer answer = documents.saveAs(b, name);
        EXPECT_EQ(answer.state, State::Failed);
        EXPECT_EQ(answer.message, a.path().string() + ": is open in another tab");
    }
    EXPECT_EQ(contentOf(a.path()), before);
}

TEST_F(OpenDocumentsTest, SavesAsItsOwnFileByAnyNameOfIt)
{
    OpenDocument& a = opened("a.stage");
    renameTrack(a, u"FX 1");
    fs::create_symlink(a.path(), folder / "link.stage");

    EXPECT_TRUE(documents.saveAs(a, folder / "link.stage").isSaved());
    EXPECT_EQ(a.name(), "a.stage");
    EXPECT_EQ(contentOf(a.path()), bytesOf(a));
    EXPECT_TRUE(fs::is_symlink(folder / "link.stage"));
}

TEST_F(OpenDocumentsTest, TellsWhatIsWrongWithAFileAndOpensNothing)
{
    const fs::path real = fs::canonical(folder.path());
    fs::create_directory(folder / "empty");
    folder.write("broken.stage", "{");
    fs::create_symlink("circle", folder / "circle");
    for (const char* const name : {"nothing", "empty", "broken.stage", "circle"}) {
        try {
            documents.open(folder / name);
            ADD_FAILURE() << name;
        } catch (const DocumentError& error) {
            EXPECT_NE(std::string(error.what()).find(name), std::string::npos) << error.what();
        }
    }
    EXPECT_THROW(documents.look(folder / "nothing"), DocumentError);
    EXPECT_EQ(documents.size(), 0U);
    EXPECT_EQ(fs::exists(DocumentLock::pathFor(real / "broken.stage")), false);
}

TEST_F(OpenDocumentsTest, OpensTheSessionOfAFolder)
{
    fs::create_directory(folder / "film");
    writeFile(folder / "film" / "film.ardour", std::string(SessionText()));

    OpenDocument& document = documents.open(folder / "film");

    EXPECT_EQ(document.path(), fs::canonical(folder / "film" / "film.ardour"));
    EXPECT_FALSE(document.isUnsaved());
    document.project().setProjectEnd(10.0);
    module->models[&document.project()] = "settings";
    idle();
    const auto autosave = Autosave::read(document.path());
    ASSERT_TRUE(autosave);
    EXPECT_EQ(autosave->form, "ardour");
    // The folder still has one session.
    EXPECT_EQ(documents.look(folder / "film").open, &document);
    const SaveAnswer outside = documents.saveAs(document, folder / "film.ardour");
    EXPECT_EQ(outside.state, State::Failed);
    EXPECT_NE(outside.message.find("lies outside of the session's folder"), std::string::npos) << outside.message;
    EXPECT_TRUE(documents.save(document).isSaved());
}

TEST_F(OpenDocumentsTest, RecoversTheWorkOnASession)
{
    fs::create_directory(folder / "film");
    const fs::path file = folder / "film" / "film.ardour";
    writeFile(file, std::string(SessionText()));
    OpenDocument& document = documents.open(folder / "film");
    module->models[&document.project()] = "settings";
    idle();
    const std::string bytes = bytesOf(document);
    const std::string left = contentOf(Autosave::pathFor(document.path()));
    documents.close(document);
    writeFile(Autosave::pathFor(file), left);

    ASSERT_TRUE(documents.look(folder / "film").unsavedWork);
    OpenDocument& recovered = documents.open(folder / "film", Work::Recover);
    EXPECT_TRUE(recovered.isUnsaved());
    EXPECT_EQ(module->models[&recovered.project()], "settings");
    EXPECT_EQ(bytesOf(recovered), bytes);
    EXPECT_TRUE(documents.save(recovered).isSaved());
    EXPECT_EQ(contentOf(file), bytes);
}

TEST_F(OpenDocumentsTest, ReloadsAFileInTheSameTab)
{
    OpenDocument& a = opened("a.stage");
    opened("b.stage");
    renameTrack(a, u"FX 1");
    idle();
    ASSERT_TRUE(fs::exists(Autosave::pathFor(a.path())));
    writeProject("a.stage", 2);

    OpenDocument& reloaded = documents.reload(a);

    EXPECT_EQ(tabs(), "[a.stage] b.stage");
    EXPECT_EQ(reloaded.project().allTracks().size(), 2U);
    EXPECT_FALSE(reloaded.isUnsaved());
    EXPECT_EQ(reloaded.undoNames().size(), 0U);
    EXPECT_FALSE(fs::exists(Autosave::pathFor(reloaded.path())));
    EXPECT_TRUE(DocumentLock::holderOf(reloaded.path()));
    renameTrack(reloaded, u"FX 2");
    EXPECT_TRUE(documents.save(reloaded).isSaved());
}

TEST_F(OpenDocumentsTest, KeepsADocumentWhoseFileCannotBeReloaded)
{
    OpenDocument& a = opened("a.stage");
    renameTrack(a, u"FX 1");
    writeFile(a.path(), "{");
    EXPECT_THROW(documents.reload(a), DocumentError);
    fs::remove(a.path());
    EXPECT_THROW(documents.reload(a), DocumentError);

    EXPECT_EQ(tabs(), "[a.stage]");
    EXPECT_TRUE(a.isUnsaved());
    EXPECT_EQ(trackOf(a).name(), u"FX 1");
    EXPECT_TRUE(DocumentLock::holderOf(a.path()));
}

TEST_F(OpenDocumentsTest, RemembersWhatWasOpenedAndSaved)
{
    RecentFiles recent(folder / "state" / "recent.json");
    OpenDocuments remembered(application, &recent);
    OpenDocument& a = remembered.open(writeProject("a.stage"));
    OpenDocument& b = remembered.open(writeProject("b.stage"));
    ASSERT_TRUE(remembered.saveAs(b, folder / "c.stage").isSaved());
    remembered.open(a.path());
    EXPECT_THROW(remembered.open(folder / "nothing"), DocumentError);

    std::vector<std::string> names;
    for (const RecentFiles::Entry& entry : recent.entries())
        names.push_back(entry.path.filename().string());
    EXPECT_EQ(names, (std::vector<std::string>{"a.stage", "c.stage", "b.stage"}));
}

TEST_F(OpenDocumentsTest, TellWhatCanBeDoneWhereASessionCannotBeOpened)
{
    fs::create_directory(folder / "film");
    for (const char* const name : {"a.ardour", "b.ardour"})
        writeFile(folder / "film" / name, std::string(SessionText()));
    writeFile(folder / "film" / "a.pending", "<Session/>");
    const auto messageOf = [&](const fs::path& path) -> std::string {
        try {
            documents.open(path);
        } catch (const DocumentError& error) {
            return error.what();
        }
        return "none";
    };
    EXPECT_TRUE(messageOf(folder / "film").ends_with("holds several sessions; name one of them"))
        << messageOf(folder / "film");
    EXPECT_NE(messageOf(folder / "film" / "a.ardour").find("; open the session in Ardour and save it, or remove"),
              std::string::npos)
        << messageOf(folder / "film" / "a.ardour");
}

TEST_F(OpenDocumentsTest, LeaveNoLockAndNoAutosaveWhenAllAreClosed)
{
    OpenDocuments others(application);
    for (const char* const name : {"a.stage", "b.stage"}) {
        renameTrack(others.open(writeProject(name)), u"FX 1");
        others.idle();
    }
    EXPECT_EQ(folder.names().size(), 6U);
    while (others.size() > 0)
        others.close(others.at(0));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"a.stage", "b.stage"}));
    EXPECT_TRUE(application.projects().projects().empty());
}

TEST_F(OpenDocumentsTest, LeaveTheAutosavesOfThoseThatNobodyHasClosed)
{
    try {
        OpenDocuments others(application);
        renameTrack(others.open(writeProject("a.stage")), u"FX 1");
        others.idle();
        throw std::runtime_error("a fault of the program");
    } catch (const std::runtime_error&) {
        EXPECT_EQ(folder.names(), (std::vector<std::string>{"a.stage", "a.stage.autosave"}));
    }
    EXPECT_TRUE(application.projects().projects().empty());
    EXPECT_TRUE(documents.look(folder / "a.stage").unsavedWork);
}

// What was unsaved when a file is loaded anew.

TEST_F(OpenDocumentsTest, KeepUnsavedWorkUnderANameOfItsOwnWhenItsFileIsReloaded)
{
    OpenDocument& a = opened("a.stage");
    renameTrack(a, u"FX 1");
    idle();
    renameTrack(a, u"FX 2");
    const std::string bytes = bytesOf(a);
    const fs::path aside = Autosave::asidePathFor(a.path());
    EXPECT_EQ(aside.filename(), "a.stage.autosave-1");
    writeProject("a.stage", 2);

    OpenDocument& reloaded = documents.reload(a);

    EXPECT_EQ(folder.names(), (std::vector<std::string>{".a.stage.cadrel-lock", "a.stage", "a.stage.autosave-1"}));
    EXPECT_EQ(Autosave::asidePathFor(reloaded.path()).filename(), "a.stage.autosave-2");
    // As the user can do by hand.
    fs::rename(aside, Autosave::pathFor(reloaded.path()));
    EXPECT_EQ(Autosave::read(reloaded.path())->content, bytes);
}

TEST_F(OpenDocumentsTest, KeepNothingAsideWhenAFileIsReloadedWithoutUnsavedWork)
{
    OpenDocument& a = opened("a.stage");
    writeProject("a.stage", 2);
    documents.reload(a);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{".a.stage.cadrel-lock", "a.stage"}));
}

TEST_F(OpenDocumentsTest, ReloadNothingWhereUnsavedWorkCannotBeKept)
{
    OpenDocument& a = opened("a.stage");
    renameTrack(a, u"FX 1");
    writeProject("a.stage", 2);
    {
        const cadrel::tests::FileSizeLimit full(10);
        EXPECT_THROW(documents.reload(a), DocumentError);
    }
    EXPECT_EQ(tabs(), "[a.stage]");
    EXPECT_EQ(trackOf(a).name(), u"FX 1");
    EXPECT_TRUE(a.isUnsaved());
    EXPECT_EQ(application.projects().projects().size(), 1U);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{".a.stage.cadrel-lock", "a.stage"}));
}

// When the system ends the program, and while a box is open.

TEST_F(OpenDocumentsTest, WriteAllUnsavedWorkAtOnceWhenTheProgramHasToEnd)
{
    for (const char* const name : {"a.stage", "b.stage", "c.stage"})
        opened(name);
    for (const std::size_t index : {0U, 1U})
        renameTrack(documents.at(index), u"FX 1");
    idle();
    renameTrack(documents.at(0), u"FX 2");
    const std::string kept = contentOf(Autosave::pathFor(documents.at(1).path()));
    module->models[&documents.at(2).project()] = "settings that nobody has stored";
    const int storings = module->storings;

    documents.leave(false);

    EXPECT_EQ(Autosave::read(documents.at(0).path())->content, standin::ProjectFile::toText(documents.at(0).project()));
    EXPECT_EQ(contentOf(Autosave::pathFor(documents.at(1).path())), kept);
    EXPECT_EQ(module->storings, storings) << "A module could open a box.";
    EXPECT_EQ(folder.names(),
              (std::vector<std::string>{"a.stage", "a.stage.autosave", "b.stage", "b.stage.autosave", "c.stage"}));
}

TEST_F(OpenDocumentsTest, AskTheModulesForWhatTheyHaveWhenTheProgramHasToEndWithoutABox)
{
    OpenDocument& a = opened("a.stage");
    idle();
    module->models[&a.project()] = "settings";

    documents.leave(true);

    ASSERT_TRUE(Autosave::read(a.path()));
    EXPECT_NE(Autosave::read(a.path())->content.find("settings"), std::string::npos);
}

TEST_F(OpenDocumentsTest, WriteNothingWithinATransactionWhenTheProgramHasToEnd)
{
    OpenDocument& a = opened("a.stage");
    edit(a.project(), u"Rename", [&] {
        trackOf(a).setName(u"half");
        documents.leave(true);
    });
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"a.stage"}));
}

TEST_F(OpenDocumentsTest, LeaveTheAutosaveOfAnotherProgramAsItIsWhenTheProgramHasToEnd)
{
    const fs::path file = fs::canonical(writeProject("a.stage"));
    const DocumentLock other(file);
    OpenDocument& a = documents.open(file);
    renameTrack(a, u"FX 1");

    documents.leave(true);

    EXPECT_FALSE(fs::exists(Autosave::pathFor(file)));
    EXPECT_TRUE(DocumentLock::holderOf(file));
}

TEST_F(OpenDocumentsTest, AutosaveBeneathABoxWithoutCallingAnyModule)
{
    OpenDocument& a = opened("a.stage");
    renameTrack(a, u"FX 1");
    const int storings = module->storings;

    documents.idleBeneathBox(now += std::chrono::minutes(1));

    ASSERT_TRUE(Autosave::read(a.path()));
    EXPECT_EQ(Autosave::read(a.path())->content, standin::ProjectFile::toText(a.project()));
    const std::string first = contentOf(Autosave::pathFor(a.path()));
    renameTrack(a, u"FX 2");
    documents.idleBeneathBox(now += std::chrono::seconds(29));
    EXPECT_EQ(contentOf(Autosave::pathFor(a.path())), first);
    edit(a.project(), u"FX 3", [&] { documents.idleBeneathBox(now += std::chrono::minutes(1)); });
    EXPECT_EQ(contentOf(Autosave::pathFor(a.path())), first);
    documents.idleBeneathBox(now += std::chrono::seconds(1));
    EXPECT_NE(contentOf(Autosave::pathFor(a.path())), first);
    EXPECT_EQ(module->storings, storings);
}

} // namespace desktop::tests
