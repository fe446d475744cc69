// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/ActionManager.h"
#include "standin/edit/ProjectManager.h"
#include "standin/project/Project.h"
#include "standin/services/IdleManager.h"
#include "standin/services/WindowFactoryRegistry.h"
#include "velmark/UserInterface.h"

#include "tests/module/LoadedModule.h"
#include "tests/support/ThisProcess.h"
#include "tests/support/TreePaths.h"
#include "tests/support/host/AlteredContext.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <set>
#include <string>

#include <X11/Xlib.h>

#include <unistd.h>

using namespace Velmark;
using cadrel::tests::isModuleMapped;
using cadrel::tests::ModuleFunctions;
using cadrel::tests::modulePath;
using cadrel::tests::ProcessResources;

namespace {

using LoadedModuleTest = cadrel::tests::LoadedModule;

class OtherHost : public Implements<OtherHost, FObject, IHostInfo> {
public:
    static constexpr const char* ClassName = "OtherHost";

    const char* getName() override { return "Studio"; }
};

} // namespace

TEST(ModuleObject, ExportsThreeFunctionsAndNothingElse)
{
    const std::string command = "nm -D --defined-only '" + modulePath().string() + "'";
    FILE* const pipe = popen(command.c_str(), "r");
    ASSERT_NE(pipe, nullptr);
    std::set<std::string> names;
    char line[512];
    while (std::fgets(line, sizeof line, pipe)) {
        std::string text(line);
        text.erase(text.find_last_not_of('\n') + 1);
        names.insert(text.substr(text.rfind(' ') + 1));
    }
    EXPECT_EQ(pclose(pipe), 0);

    EXPECT_EQ(names, (std::set<std::string>{"GetPluginFactory", "bundleEntry", "bundleExit"}));
}

TEST_F(LoadedModuleTest, NamesItsMakerAndItsOneClass)
{
    load();
    auto& factory = m_module->factory();

    PFactoryInfo maker;
    ASSERT_EQ(factory.getFactoryInfo(maker), ResultOk);
    EXPECT_STREQ(maker.vendor, "Cadrel");
    EXPECT_EQ(maker.flags, 16);

    EXPECT_EQ(factory.countClasses(), 1);
    const auto second = query<IPluginFactory2>(&factory);
    ASSERT_TRUE(second);
    PClassInfo2 info;
    ASSERT_EQ(second->getClassInfo2(0, info), ResultOk);
    EXPECT_EQ(info.cid, Identifier("F61C1C254C9D4D68A782F7FBF56B9068"));
    EXPECT_EQ(info.cardinality, 1);
    EXPECT_STREQ(info.category, "Service");
    EXPECT_STREQ(info.name, "Cadrel");
    EXPECT_EQ(info.classFlags, 0U);
    EXPECT_STREQ(info.subCategories, "");
    EXPECT_STREQ(info.vendor, "");
    EXPECT_STREQ(info.version, "1.0.3.820");
    EXPECT_STREQ(info.sdkVersion, "QMI 4.0.0");
}

TEST_F(LoadedModuleTest, GivesTheSameFactoryUntilItsLastRelease)
{
    const ModuleFunctions module;

    IPluginFactory* const first = module.getFactory();
    IPluginFactory* const second = module.getFactory();
    EXPECT_EQ(first, second);
    EXPECT_EQ(first->countClasses(), 1);
    EXPECT_EQ(first->release(), 1);
    EXPECT_EQ(first->release(), 0);

    IPluginFactory* const third = module.getFactory();
    ASSERT_NE(third, nullptr);
    EXPECT_EQ(third->countClasses(), 1);
    EXPECT_EQ(third->release(), 0);
}

TEST_F(LoadedModuleTest, TakesItsResourcesFromTheFirstEntrySinceItWasOutOfUse)
{
    const ModuleFunctions module;
    std::string resources = cadrel::tests::treePath("resources");
    std::string elsewhere = "/nowhere";
    EXPECT_TRUE(module.enter(nullptr));
    EXPECT_TRUE(module.enter(resources.data()));
    EXPECT_TRUE(module.enter(elsewhere.data()));
    EXPECT_TRUE(module.leave());
    auto controller = module.makeController();
    const auto canOpen = [&] {
        EXPECT_EQ(controller->initialize(m_application.context()), ResultOk);
        const bool isOpen = openWindow();
        controller->terminate();
        return isOpen;
    };
    EXPECT_TRUE(canOpen());

    EXPECT_TRUE(module.leave());
    EXPECT_TRUE(module.leave()) << "One too many.";
    EXPECT_TRUE(module.enter(elsewhere.data()));
    EXPECT_FALSE(canOpen());

    EXPECT_TRUE(module.leave());
    EXPECT_TRUE(module.enter(resources.data()));
    EXPECT_TRUE(canOpen());
    EXPECT_TRUE(module.leave());
    controller.reset();
}

TEST_F(LoadedModuleTest, MakesNothingOfAnotherClass)
{
    load();
    void* out = this;

    EXPECT_NE(m_module->factory().createInstance(IPluginBase::iid, IPluginBase::iid, &out), ResultOk);
    EXPECT_EQ(out, nullptr);
    EXPECT_NE(m_module->factory().createInstance(Identifier("F61C1C254C9D4D68A782F7FBF56B9068"), IHostInfo::iid, &out),
              ResultOk);
    EXPECT_EQ(out, nullptr);
}

TEST_F(LoadedModuleTest, WorksInNoHostOfAnotherName)
{
    const auto context = makeCounted<cadrel::host::tests::AlteredContext>(m_application.context());
    context->replace(IHostInfo::iid, makeCounted<OtherHost>());

    EXPECT_THROW(load(context.get()), standin::ModuleError);
    EXPECT_TRUE(m_application.menus().commands().empty());
    EXPECT_TRUE(m_application.windowFactories().factories().empty());
    EXPECT_TRUE(m_application.idleManager().handlers().empty());
    EXPECT_FALSE(isModuleMapped());
}

TEST_F(LoadedModuleTest, EntersItsCommandAndItsWindowAndTakesThemBack)
{
    load();
    ASSERT_EQ(m_application.menus().commands().size(), 1U);
    const auto& command = m_application.menus().commands().front();
    EXPECT_EQ(command.menu, "Project");
    EXPECT_EQ(command.title, u"Cadrel");
    EXPECT_EQ(command.flags, 4);
    EXPECT_EQ(command.category, "Cadrel");
    EXPECT_EQ(command.action, "ShowDialog");
    ASSERT_EQ(m_application.windowFactories().factories().size(), 1U);
    EXPECT_STREQ(m_application.windowFactories().factories().front()->getWindowName(), "CadrelWindow");

    EXPECT_EQ(m_module->controller().terminate(), ResultOk);
    EXPECT_TRUE(m_application.menus().commands().empty());
    EXPECT_TRUE(m_application.windowFactories().factories().empty());
    EXPECT_NE(m_application.actions().invoke("Cadrel", "ShowDialog", 0), ResultOk);
    EXPECT_EQ(m_module->controller().terminate(), ResultOk);

    EXPECT_EQ(m_module->controller().initialize(m_application.context()), ResultOk);
    EXPECT_EQ(m_application.menus().commands().size(), 1U);
}

TEST_F(LoadedModuleTest, OpensItsWindowAndDrawsIt)
{
    load();
    ASSERT_TRUE(openWindow());

    EXPECT_TRUE(turnUntil([this] { return isDrawn(); }));
}

TEST_F(LoadedModuleTest, BringsTheWindowToTheFrontThatIsOpen)
{
    load();
    ASSERT_TRUE(openWindow());
    const auto* const first = window();

    EXPECT_TRUE(openWindow());
    EXPECT_EQ(window(), first);
    EXPECT_EQ(m_application.views().windows().size(), 1U);
    EXPECT_EQ(m_application.windowFactories().factories().front()->getWindow(), first);
    EXPECT_TRUE(m_application.windowFactories().factories().front()->hasWindow(window()));
    EXPECT_FALSE(m_application.windowFactories().factories().front()->hasWindow(nullptr));
}

TEST_F(LoadedModuleTest, OpensAgainAfterTheUserHasClosedIt)
{
    load();
    for (int round = 0; round < 3; ++round) {
        ASSERT_TRUE(openWindow());
        ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
        window()->show(false);
        EXPECT_EQ(window(), nullptr);
    }
}

TEST_F(LoadedModuleTest, IsUnmappedAfterEachOfTwentyRounds)
{
    // What the first round opens for good, fonts for one, is the system's.
    load();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
    unload();
    ASSERT_FALSE(isModuleMapped());
    const ProcessResources before;

    for (int round = 0; round < 20; ++round) {
        load();
        ASSERT_TRUE(isModuleMapped()) << round;
        ASSERT_TRUE(openWindow()) << round;
        ASSERT_TRUE(turnUntil([this] { return isDrawn(); })) << round;
        unload();
        ASSERT_FALSE(isModuleMapped()) << round;
        EXPECT_EQ(ProcessResources(), before) << round;
    }
}

TEST_F(LoadedModuleTest, SurvivesProjectsThatComeAndGoUnderItsWindow)
{
    m_application.activateProject(&m_application.createProject());
    load();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));

    auto& second = m_application.createProject();
    m_application.activateProject(&second);
    turn();
    m_application.closeProject(second);
    turn();
    m_application.activateProject(m_application.projects().projects().front().get());
    turn();
    m_application.closeProject(*m_application.projects().projects().front());
    turn();

    EXPECT_TRUE(turnUntil([this] { return isDrawn(); }));
}

TEST_F(LoadedModuleTest, SurvivesAWindowOfTheHostThatGoesFirst)
{
    load();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));

    m_windows.destroy(*window()->native());
    turn(10);
    window()->show(false);

    ASSERT_TRUE(openWindow());
    EXPECT_TRUE(turnUntil([this] { return isDrawn(); }));
}

TEST_F(LoadedModuleTest, StaysInMemoryWhereSomebodyMayStillCallItsErrorHandler)
{
    // It can't be taken back, so a process of its own tries it.
    const auto isStillMapped = [this] {
        load();
        XSetErrorHandler([](Display*, XErrorEvent*) { return 0; });
        unload();
        return isModuleMapped();
    };
    EXPECT_EXIT(_exit(isStillMapped() ? 0 : 1), testing::ExitedWithCode(0), "");
}

TEST_F(LoadedModuleTest, LetsGoOfAViewThatTheHostKeeps)
{
    load();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));
    auto view = Counted<IPlugView>::share(window()->view());

    EXPECT_EQ(m_module->controller().terminate(), ResultOk);
    EXPECT_EQ(view->idle(), ResultOk);
    EXPECT_EQ(view->removed(), ResultOk);
    EXPECT_NE(view->attached(this, ParentType::X11Window), ResultOk);
    view.reset();
    unload();

    EXPECT_FALSE(isModuleMapped());
}

TEST_F(LoadedModuleTest, MakesItsViewForItsOwnWindowAndOnlyOnce)
{
    load();
    const auto builder = query<IViewBuilder>(&m_module->controller());
    ASSERT_TRUE(builder);
    Counted<IPlugView> view;

    EXPECT_EQ(builder->createView("Other", nullptr, view.out()), 4);
    EXPECT_FALSE(view);
    EXPECT_EQ(builder->createView(nullptr, nullptr, view.out()), 4);
    EXPECT_EQ(builder->createView("CadrelWindow", nullptr, nullptr), 4);

    ASSERT_EQ(builder->createView("CadrelWindow", nullptr, view.out()), ResultOk);
    ViewRect rect;
    EXPECT_EQ(view->getSize(rect), ResultOk);
    EXPECT_EQ(rect.right - rect.left, 1300);
    EXPECT_EQ(rect.bottom - rect.top, 750);
    Counted<IPlugView> other;
    EXPECT_EQ(builder->createView("CadrelWindow", nullptr, other.out()), 4);

    view.reset();
    EXPECT_EQ(builder->createView("CadrelWindow", nullptr, other.out()), ResultOk);
    other.reset();
    m_module->controller().terminate();
    EXPECT_EQ(builder->createView("CadrelWindow", nullptr, other.out()), 4);
}

TEST_F(LoadedModuleTest, RefusesActionsThatAreNotItsOwn)
{
    load();
    const auto actions = query<IActionHandler>(&m_module->controller());
    ASSERT_TRUE(actions);

    EXPECT_EQ(actions->handleAction("Cadrel", "Other", true), 1);
    EXPECT_EQ(actions->handleAction("Other", "ShowDialog", true), 1);
    EXPECT_EQ(actions->handleAction(nullptr, "ShowDialog", true), 1);
    EXPECT_EQ(actions->handleAction("Cadrel", nullptr, true), 1);
    EXPECT_EQ(actions->handleAction("Cadrel", "ShowDialog", false), ResultOk);
    EXPECT_EQ(window(), nullptr);
    EXPECT_EQ(actions->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    EXPECT_NE(window(), nullptr);
}

TEST_F(LoadedModuleTest, OpensNoWindowWhereTheHostHasNone)
{
    m_application.views().setWindowSystem(nullptr);
    load();

    EXPECT_FALSE(openWindow());
    EXPECT_EQ(m_application.windowFactories().factories().front()->getWindow(), nullptr);
}

TEST_F(LoadedModuleTest, SurvivesItsUnloadingWithTheWindowOpenAndUndoAfterwards)
{
    auto& project = m_application.createProject();
    m_application.activateProject(&project);
    load();
    ASSERT_TRUE(openWindow());
    ASSERT_TRUE(turnUntil([this] { return isDrawn(); }));

    unload();

    EXPECT_EQ(window(), nullptr);
    EXPECT_FALSE(isModuleMapped());
    m_application.actions().invoke(IActionManager::EditCategory, IActionManager::Undo, 0);
    turn();
}
