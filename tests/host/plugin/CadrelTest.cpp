// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/Cadrel.h"

#include "gui/main/MainGui.h"
#include "standin/Application.h"
#include "standin/edit/ActionManager.h"
#include "standin/module/ModuleLoader.h"
#include "standin/project/Project.h"
#include "standin/services/MenuRegistry.h"
#include "standin/services/Translations.h"
#include "standin/services/WindowFactoryRegistry.h"
#include "standin/window/HostWindow.h"
#include "standin/window/ViewManager.h"
#include "velmark/Context.h"
#include "velmark/ModuleState.h"
#include "velmark/Project.h"

#include "tests/host/plugin/WatchedPictures.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThisProcess.h"
#include "tests/support/TreePaths.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/x11/HostLoop.h"
#include "tests/support/x11/VirtualScreen.h"
#include "tests/support/x11/XWindows.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::gui::VideoProviderBase;
using cadrel::host::Cadrel;
using cadrel::host::tests::AlteredContext;
using cadrel::tests::isMapped;
using cadrel::tests::PictureWatch;
using cadrel::tests::ProcessResources;

namespace {

/// Of the band of the change EDL.
constexpr unsigned long Band = 0x565d63;

class OtherHostInfo : public Implements<OtherHostInfo, FObject, IHostInfo> {
public:
    static constexpr const char* ClassName = "OtherHostInfo";

    const char* getName() override { return name; }

    const char* name = "Studio";
};

/// Menus, actions and window factories of a host that refuses one of them, and counts what is taken back.
class Registries : public Implements<Registries, FObject, IMenuRegistry, IActionManager, IWindowFactoryRegistry> {
public:
    static constexpr const char* ClassName = "Registries";

    enum class Step { Command, Handler, Factory, None };

    explicit Registries(Step refused) : m_refused(refused) {}

    int32 addCommand(BundleHandle, const char*, const char16_t*, int32, const char*, const char*) override
    {
        return answer(Step::Command);
    }
    int32 removeCommands(BundleHandle) override { return note("command"); }
    int32 addHandler(IActionHandler*) override { return answer(Step::Handler); }
    int32 removeHandler(IActionHandler*) override { return note("handler"); }
    int32 invoke(const char*, const char*, int32) override { return ResultFalse; }
    int32 addFactory(IPlugWindowFactory*) override { return answer(Step::Factory); }
    int32 removeFactory(IPlugWindowFactory*) override { return note("factory"); }

    std::vector<std::string> removed;

private:
    int32 answer(Step step) const { return step == m_refused ? ResultFalse : ResultOk; }
    int32 note(const char* what)
    {
        removed.push_back(what);
        return ResultOk;
    }

    Step m_refused;
};

/// Opens windows that can't come on the screen.
class BrokenViews : public Implements<BrokenViews, FObject, IViewManager> {
public:
    static constexpr const char* ClassName = "BrokenViews";

    class Window : public Implements<Window, FObject, IHostWindow> {
    public:
        static constexpr const char* ClassName = "Window";

        int32 open() override
        {
            if (throwsAtOpen)
                throw std::runtime_error("open");
            return opens ? ResultOk : 7;
        }
        int32 setCloseNotification(ICloseWindowNotification* given) override
        {
            listener = given;
            return ResultOk;
        }
        int32 show(bool) override { throw std::runtime_error("window"); }

        bool opens = false;
        bool throwsAtOpen = false;
        ICloseWindowNotification* listener = nullptr;
        Counted<IPlugView> view;
    };

    int32 loadSkin(BundleHandle, const char*) override { return ResultOk; }
    int32 openWindow(const char* name, IViewBuilder* builder, IHostWindow** out) override
    {
        window = makeCounted<Window>();
        window->opens = opens;
        window->throwsAtOpen = throwsAtOpen;
        if (throws)
            throw std::runtime_error("views");
        builder->createView(name, nullptr, window->view.out());
        if (failsAfterTheView)
            return ResultFalse;
        *out = Counted<Window>(window).detach();
        return ResultOk;
    }

    Counted<Window> window;
    bool opens = false;
    bool throws = false;
    bool throwsAtOpen = false;
    bool failsAfterTheView = false;
};

class CadrelTest : public testing::Test, protected cadrel::tests::HostLoop {
protected:
    CadrelTest()
    {
        m_application.views().setWindowSystem(&m_windows);
        ModuleState::get().enter(m_bundle.data());
    }
    ~CadrelTest() override
    {
        m_cadrel.reset();
        m_application.views().setWindowSystem(nullptr);
        ModuleState::get().exit();
    }

    /// A host that has a JUCE of its own serves it too.
    void work() override
    {
        m_windows.serve();
        m_application.idle();
        cadrel::host::JuceLayer::serve();
    }

    /// In the context with what is replaced.
    int32 initialize() { return m_cadrel->initialize(static_cast<IHostContext*>(m_context.get())); }
    bool isRegistered()
    {
        return !m_application.menus().commands().empty() || !m_application.windowFactories().factories().empty() ||
               m_application.actions().invoke("Cadrel", "ShowDialog", 0) == ResultOk;
    }

    std::string m_bundle = cadrel::tests::treePath("resources");
    cadrel::tests::VirtualScreen m_screen;
    cadrel::tests::XWindows m_windows;
    standin::Application m_application;
    Counted<AlteredContext> m_context = makeCounted<AlteredContext>(m_application.context());
    Counted<Cadrel> m_cadrel = makeCounted<Cadrel>();
};

} // namespace

TEST_F(CadrelTest, AnswersForAllThatAHostAsksAndKeepsTheRestToItself)
{
    EXPECT_TRUE(query<IPluginBase>(m_cadrel));
    EXPECT_TRUE(query<IActionHandler>(m_cadrel));
    EXPECT_TRUE(query<IViewBuilder>(m_cadrel));
    EXPECT_TRUE(query<IPlugController>(m_cadrel));
    EXPECT_TRUE(query<IPlugWindowFactory>(m_cadrel));
    EXPECT_FALSE(query<IIdleHandler>(m_cadrel));
    EXPECT_TRUE(m_cadrel->isA("Cadrel", false));
    EXPECT_FALSE(m_cadrel->isA("FObject", false));
    EXPECT_TRUE(m_cadrel->isA("FObject", true));
}

TEST_F(CadrelTest, WorksInNoOtherHost)
{
    EXPECT_EQ(m_cadrel->initialize(nullptr), 1);
    const auto info = makeCounted<OtherHostInfo>();
    m_context->replace(IHostInfo::iid, info);
    for (const char* const name : {"Studio", "stagio", "Stagio 2", "", static_cast<const char*>(nullptr)}) {
        info->name = name;
        EXPECT_EQ(initialize(), 1);
    }
    EXPECT_FALSE(isRegistered());
    EXPECT_EQ(m_cadrel->terminate(), ResultOk);

    info->name = "Stagio";
    EXPECT_EQ(initialize(), ResultOk);
}

TEST_F(CadrelTest, WorksInNoHostWithoutAName)
{
    m_context->hide(IHostInfo::iid);

    EXPECT_EQ(initialize(), 1);
    EXPECT_FALSE(isRegistered());
}

TEST_F(CadrelTest, TakesEachStepBackOnceWhenALaterOneFails)
{
    using Step = Registries::Step;
    const std::vector<std::pair<Step, std::vector<std::string>>> expected = {
        {Step::Command, {}},
        {Step::Handler, {"command"}},
        {Step::Factory, {"handler", "command"}},
    };
    for (const auto& [refused, removed] : expected) {
        const auto registries = makeCounted<Registries>(refused);
        const auto context = makeCounted<AlteredContext>(m_application.context());
        context->replace(IMenuRegistry::iid, registries);
        context->replace(IActionManager::iid, registries);
        context->replace(IWindowFactoryRegistry::iid, registries);

        EXPECT_NE(m_cadrel->initialize(static_cast<IHostContext*>(context.get())), ResultOk);
        EXPECT_EQ(registries->removed, removed);
        EXPECT_EQ(m_cadrel->terminate(), ResultOk);
        EXPECT_EQ(registries->removed, removed);
    }
    EXPECT_EQ(m_cadrel->initialize(m_application.context()), ResultOk);
    EXPECT_TRUE(isRegistered());
}

TEST_F(CadrelTest, WritesNothingIntoProjectsOfAHostThatItDoesNotWorkIn)
{
    const cadrel::tests::TempFolder folder;
    auto& project = m_application.createProject();
    m_application.activateProject(&project);
    const auto registries = makeCounted<Registries>(Registries::Step::Factory);
    m_context->replace(IWindowFactoryRegistry::iid, registries);
    ASSERT_NE(initialize(), ResultOk);

    m_application.saveProject(project, folder.path() / "Film.stagio");
    EXPECT_NE(project.hasAttribute("CaDr"), ResultOk);

    ASSERT_EQ(m_cadrel->initialize(m_application.context()), ResultOk);
    m_application.saveProject(project, folder.path() / "Film.stagio");
    EXPECT_EQ(project.hasAttribute("CaDr"), ResultOk);
}

TEST_F(CadrelTest, KeepsWhatItHasOfProjectsWhenALaterInitialisationFails)
{
    const cadrel::tests::TempFolder folder;
    auto& project = m_application.createProject();
    m_cadrel->initialize(m_application.context());
    m_cadrel->terminate();
    const auto registries = makeCounted<Registries>(Registries::Step::Factory);
    m_context->replace(IWindowFactoryRegistry::iid, registries);
    ASSERT_NE(initialize(), ResultOk);

    m_application.saveProject(project, folder.path() / "Film.stagio");
    EXPECT_EQ(project.hasAttribute("CaDr"), ResultOk);
}

TEST_F(CadrelTest, NeedsTheProjectsOfTheHost)
{
    m_context->hide(IProjectManager::iid);

    EXPECT_NE(initialize(), ResultOk);
    EXPECT_FALSE(isRegistered());
}

TEST_F(CadrelTest, DoesWithoutMenusActionsWindowsAndTranslations)
{
    m_context->hide(IMenuRegistry::iid);
    m_context->hide(IActionManager::iid);
    m_context->hide(IWindowFactoryRegistry::iid);
    m_context->hide(ITranslationService::iid);
    m_context->hide(IViewManager::iid);

    EXPECT_EQ(initialize(), ResultOk);
    EXPECT_FALSE(isRegistered());
    EXPECT_NE(m_cadrel->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
    EXPECT_EQ(m_cadrel->terminate(), ResultOk);
}

TEST_F(CadrelTest, IsInitialisedOnceAtATime)
{
    EXPECT_EQ(m_cadrel->initialize(m_application.context()), ResultOk);
    EXPECT_NE(m_cadrel->initialize(m_application.context()), ResultOk);

    EXPECT_EQ(m_application.menus().commands().size(), 1U);
    EXPECT_EQ(m_application.windowFactories().factories().size(), 1U);
}

TEST_F(CadrelTest, TakesItsRegistrationsBackAtItsEnd)
{
    m_cadrel->initialize(m_application.context());
    ASSERT_TRUE(isRegistered());
    m_cadrel.reset();

    EXPECT_FALSE(isRegistered());
}

TEST_F(CadrelTest, OpensAWindowWithTheProjectThatIsActive)
{
    m_application.activateProject(&m_application.createProject());
    m_cadrel->initialize(m_application.context());

    EXPECT_EQ(m_cadrel->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    ASSERT_EQ(m_application.views().windows().size(), 1U);
    EXPECT_EQ(m_cadrel->getWindow(), m_application.views().windows().front().get());
}

TEST_F(CadrelTest, ShowsTheModelOfTheProjectThatIsActiveFromTheStart)
{
    auto& first = m_application.createProject();
    m_application.activateProject(&first);
    m_cadrel->initialize(m_application.context());
    m_cadrel->handleAction("Cadrel", "ShowDialog", true);
    ASSERT_EQ(m_application.views().windows().size(), 1U);
    auto* const view = dynamic_cast<juce::Component*>(m_application.views().windows().front()->view());
    ASSERT_NE(view, nullptr);
    const auto* const content = dynamic_cast<cadrel::gui::MainGui*>(view->getChildComponent(0));
    ASSERT_NE(content, nullptr);

    const auto* const model = content->model();
    EXPECT_NE(model, nullptr);
    auto& second = m_application.createProject();
    m_application.activateProject(&second);
    EXPECT_NE(content->model(), nullptr);
    EXPECT_NE(content->model(), model);
    m_application.closeProject(second);
    EXPECT_EQ(content->model(), nullptr);
    m_application.activateProject(&first);
    EXPECT_EQ(content->model(), model);
    m_application.closeProject(first);
    EXPECT_EQ(content->model(), nullptr);
}

TEST_F(CadrelTest, ForgetsAWindowThatDoesNotOpen)
{
    const auto views = makeCounted<BrokenViews>();
    m_context->replace(IViewManager::iid, views);
    initialize();

    EXPECT_EQ(m_cadrel->handleAction("Cadrel", "ShowDialog", true), 7);
    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
    EXPECT_EQ(views->window->listener, nullptr);
    EXPECT_FALSE(m_cadrel->hasWindow(views->window.get()));
    EXPECT_EQ(m_cadrel->windowClosed(views->window.get()), ResultOk);
}

TEST_F(CadrelTest, EndsAViewThatTheHostHasFoundNoWindowFor)
{
    const auto views = makeCounted<BrokenViews>();
    views->failsAfterTheView = true;
    m_context->replace(IViewManager::iid, views);
    initialize();
    ASSERT_NE(m_cadrel->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    ASSERT_TRUE(views->window->view);

    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
    Counted<IPlugView> next;
    EXPECT_EQ(m_cadrel->createView("CadrelWindow", nullptr, next.out()), ResultOk);
}

TEST_F(CadrelTest, EndsItsViewAlsoWhereAWindowOfTheHostThrows)
{
    const auto views = makeCounted<BrokenViews>();
    views->opens = true;
    m_context->replace(IViewManager::iid, views);
    initialize();
    ASSERT_EQ(m_cadrel->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    auto* const view = dynamic_cast<juce::Component*>(views->window->view.get());
    ASSERT_NE(view, nullptr);
    ASSERT_EQ(view->getNumChildComponents(), 1);

    EXPECT_EQ(m_cadrel->terminate(), ResultOk);
    EXPECT_EQ(view->getNumChildComponents(), 0);
    EXPECT_FALSE(m_cadrel->hasWindow(views->window.get()));
    EXPECT_FALSE(isRegistered());
}

TEST_F(CadrelTest, LetsNoExceptionOfTheWindowsOfAHostOut)
{
    const auto views = makeCounted<BrokenViews>();
    m_context->replace(IViewManager::iid, views);
    initialize();
    const auto show = [this] { return m_cadrel->handleAction("Cadrel", "ShowDialog", true); };

    views->throws = true;
    EXPECT_NE(show(), ResultOk);
    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
    views->throws = false;
    views->throwsAtOpen = true;
    EXPECT_NE(show(), ResultOk);
    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
    EXPECT_EQ(views->window->listener, nullptr);

    views->throwsAtOpen = false;
    views->opens = true;
    EXPECT_EQ(show(), ResultOk);
    EXPECT_NE(show(), ResultOk) << "It is there, and throws when it is shown.";
    EXPECT_TRUE(m_cadrel->hasWindow(views->window.get()));
}

TEST_F(CadrelTest, TakesItsRegistrationsBackOnceTheLastOneFirst)
{
    const auto registries = makeCounted<Registries>(Registries::Step::None);
    m_context->replace(IMenuRegistry::iid, registries);
    m_context->replace(IActionManager::iid, registries);
    m_context->replace(IWindowFactoryRegistry::iid, registries);
    ASSERT_EQ(initialize(), ResultOk);

    EXPECT_EQ(m_cadrel->terminate(), ResultOk);
    EXPECT_EQ(registries->removed, (std::vector<std::string>{"factory", "handler", "command"}));
    EXPECT_EQ(m_cadrel->terminate(), ResultOk);
    m_cadrel.reset();
    EXPECT_EQ(registries->removed.size(), 3U);
}

TEST_F(CadrelTest, DrawsNoPicturesAfterItsEndWhenProjectsChange)
{
    m_cadrel->initialize(m_application.context());
    const auto pictures = cadrel::tests::picturesOf(m_application);
    ASSERT_NE(pictures, nullptr);
    const auto isDrawn = [&](std::size_t side) { return pictures->getImage(side).getPixelAt(0, 0).isOpaque(); };
    {
        // A window has it drawn that there is no video.
        PictureWatch window(*pictures);
        pictures->setImageSize(16, 9);
        m_application.idle();
        EXPECT_TRUE(isDrawn(VideoProviderBase::OldSide));
        pictures->setImageSize(32, 18);
    }

    // The Host lives on, and JUCE doesn't.
    m_cadrel->terminate();
    m_application.activateProject(&m_application.createProject());
    m_application.idle();
    m_application.idle();
    EXPECT_FALSE(isDrawn(VideoProviderBase::OldSide));
    EXPECT_FALSE(isDrawn(VideoProviderBase::NewSide));

    m_cadrel->initialize(m_application.context());
    const PictureWatch window(*pictures);
    m_application.idle();
    EXPECT_TRUE(isDrawn(VideoProviderBase::OldSide));
    EXPECT_TRUE(isDrawn(VideoProviderBase::NewSide));
}

TEST_F(CadrelTest, MakesNoViewBeforeItIsInitialised)
{
    Counted<IPlugView> view;
    EXPECT_EQ(m_cadrel->createView("CadrelWindow", nullptr, view.out()), 4);
    EXPECT_FALSE(view);
    EXPECT_NE(m_cadrel->handleAction("Cadrel", "ShowDialog", true), ResultOk);
    EXPECT_EQ(m_cadrel->getWindow(), nullptr);
}

TEST_F(CadrelTest, TitlesItsCommandInTheLanguageThatTheHostKnowsBefore)
{
    m_application.translations().setLanguage("de");
    m_cadrel->initialize(m_application.context());

    EXPECT_EQ(m_application.menus().commands().front().title, u"Cadrel");
    EXPECT_EQ(m_application.translations().translate(u"Preview"), std::u16string(u"Vorschau"));
}

TEST_F(CadrelTest, IsUnmappedAsAModuleOfAHostWithAJuceOfItsOwn)
{
    const cadrel::host::JuceLayer ofTheHost;
    const auto module = std::filesystem::path(cadrel::tests::programPath("../lib/Cadrel.so")).lexically_normal();
    const auto loadAndUnload = [&] {
        const standin::ModuleLoader loader(m_application, module, m_bundle);
        ASSERT_TRUE(isMapped("Cadrel.so"));
        ASSERT_TRUE(m_application.choose(m_application.menus().commands().front()));
        ASSERT_TRUE(turnUntil([this] { return m_windows.colourAt(400, 425) == Band; }));
    };
    // What the first round opens for good, fonts for one, is the system's.
    loadAndUnload();
    ASSERT_FALSE(isMapped("Cadrel.so"));
    const ProcessResources before;
    for (int round = 0; round < 20; ++round) {
        loadAndUnload();
        ASSERT_FALSE(isMapped("Cadrel.so")) << round;
        EXPECT_EQ(ProcessResources(), before) << round;
    }
}
