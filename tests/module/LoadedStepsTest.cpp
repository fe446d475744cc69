// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "standin/edit/ActionManager.h"
#include "standin/edit/ProjectManager.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "standin/services/IdleManager.h"
#include "velmark/UserInterface.h"

#include "tests/module/LoadedModule.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <stdexcept>
#include <string>
#include <vector>

using namespace Velmark;
using cadrel::core::CadrelerBase;
using cadrel::core::DataModel;
using cadrel::core::EventList;
using cadrel::tests::isModuleMapped;
using cadrel::tests::makeEvent;
using cadrel::tests::ModuleFunctions;
using cadrel::tests::StoredModel;
using cadrel::util::Result;

namespace fs = std::filesystem;

namespace {

/// Runs and previews of the loaded module. Each is an entry of the undo list that holds steps of the module's own classes,
/// so that taking it back calls into the module.
class LoadedStepsTest : public cadrel::tests::LoadedModule {
protected:
    void start()
    {
        load();
        m_project = &openFilm("Film.stage");
    }

    /// A sound on a film whose first ten seconds go: it is stored with its change list, as an earlier session has left it.
    fs::path writeFilm(const char* name)
    {
        standin::tests::TestHost host;
        host.setClock(3600.0);
        host.addClip(host.addTrack(TypeWord::Audio, u"Dialogue"), u"Hello", 12.0, 15.0);
        host.project.undoList().clear();
        const cadrel::tests::TestProject timecodes;
        DataModel model;
        model.changeEdl().add(makeEvent("A001", "01:00:10:00", "01:00:30:00", "01:00:00:00", "01:00:20:00", 1));
        StoredModel::of(model).putInto(host.project);
        host.project.undoList().clear();
        const fs::path file = m_folder / name;
        host.application.saveProject(host.project, file);
        return file;
    }
    standin::Project& openFilm(const char* name)
    {
        standin::Project& project = m_application.openProject(writeFilm(name));
        m_application.activateProject(&project);
        return project;
    }

    /// What the module's window asks for runs and previews.
    CadrelerBase& engine()
    {
        for (IIdleHandler* const handler : m_application.idleManager().handlers()) {
            if (auto* const found = dynamic_cast<CadrelerBase*>(handler))
                return *found;
        }
        throw std::runtime_error("the module has no engine");
    }
    void conform()
    {
        ASSERT_EQ(engine().startCadrel(), Result::Ok);
        m_application.idle();
    }
    void preview()
    {
        const cadrel::tests::TestProject timecodes;
        EventList events(cadrel::core::ListKind::Change);
        events.add(makeEvent("A001", "01:00:10:00", "01:00:30:00", "01:00:00:00", "01:00:20:00", 1));
        engine().setPreviewActive(true);
        ASSERT_EQ(engine().startPreview(events, 0, 0, 1), Result::Ok);
        m_application.idle();
    }

    bool undo() { return invoke(IActionManager::Undo); }
    bool redo() { return invoke(IActionManager::Redo); }
    std::vector<std::u16string> entries(standin::Project& project)
    {
        std::vector<std::u16string> names;
        for (std::size_t index = 0; index < project.undoList().size(); ++index)
            names.push_back(project.undoList().nameAt(index));
        return names;
    }
    static std::string contentOf(const standin::Project& project) { return standin::ProjectFile::toText(project); }

    standin::Project* m_project = nullptr;
    cadrel::tests::TempFolder m_folder;

private:
    bool invoke(const char* action)
    {
        return m_application.actions().invoke(IActionManager::EditCategory, action, 0) == ResultOk;
    }
};

using Entries = std::vector<std::u16string>;

} // namespace

TEST_F(LoadedStepsTest, AreTakenBackAndMadeAgainWhileItIsLoaded)
{
    start();
    conform();
    ASSERT_EQ(entries(*m_project), Entries{u"Apply Cadrel"});
    const std::string after = contentOf(*m_project);

    EXPECT_TRUE(undo());
    EXPECT_NE(contentOf(*m_project), after);
    EXPECT_TRUE(redo());
    EXPECT_EQ(contentOf(*m_project), after);
}

TEST_F(LoadedStepsTest, AreDroppedBeforeItIsUnloaded)
{
    start();
    conform();
    ASSERT_EQ(entries(*m_project), Entries{u"Apply Cadrel"});
    const std::string after = contentOf(*m_project);

    unload();
    EXPECT_FALSE(isModuleMapped());
    EXPECT_EQ(entries(*m_project), Entries());
    EXPECT_FALSE(undo());
    EXPECT_FALSE(redo());
    turn();
    EXPECT_EQ(contentOf(*m_project), after);
}

TEST_F(LoadedStepsTest, AreDroppedWhereTheyCouldBeMadeAgain)
{
    start();
    conform();
    ASSERT_TRUE(undo());
    const std::string before = contentOf(*m_project);

    unload();
    EXPECT_FALSE(isModuleMapped());
    EXPECT_FALSE(redo());
    EXPECT_EQ(contentOf(*m_project), before);
}

TEST_F(LoadedStepsTest, AreDroppedFromEachProject)
{
    start();
    conform();
    standin::Project& second = openFilm("Second.stage");
    conform();
    ASSERT_EQ(entries(*m_project), Entries{u"Apply Cadrel"});
    ASSERT_EQ(entries(second), Entries{u"Apply Cadrel"});

    unload();
    EXPECT_FALSE(isModuleMapped());
    EXPECT_FALSE(undo());
    m_application.activateProject(m_project);
    EXPECT_FALSE(undo());
}

TEST_F(LoadedStepsTest, OfAPreviewAreDroppedWithItsWindowOpen)
{
    start();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
    preview();
    ASSERT_EQ(entries(*m_project), Entries{u"Preview"});
    ASSERT_TRUE(undo());
    ASSERT_TRUE(redo());

    unload();
    EXPECT_FALSE(isModuleMapped());
    EXPECT_FALSE(undo());
    turn();
}

TEST_F(LoadedStepsTest, RefuseOnceItsObjectHasGone)
{
    // As a host that releases the object, and keeps the module and its undo lists.
    const ModuleFunctions module;
    std::string resources = cadrel::tests::treePath("resources");
    ASSERT_TRUE(module.enter(resources.data()));
    Counted<IPluginBase> controller = module.makeController();
    ASSERT_EQ(controller->initialize(m_application.context()), ResultOk);
    m_project = &openFilm("Film.stage");
    const std::string before = contentOf(*m_project);
    conform();
    ASSERT_EQ(entries(*m_project), Entries{u"Apply Cadrel"});
    const std::string after = contentOf(*m_project);

    EXPECT_EQ(controller->terminate(), ResultOk);
    ASSERT_EQ(controller->release(), 0);
    static_cast<void>(controller.detach());
    undo();
    EXPECT_EQ(contentOf(*m_project), before);
    redo();
    EXPECT_EQ(contentOf(*m_project), after);

    m_project->undoList().clear();
    EXPECT_TRUE(module.leave());
}
