// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/HostContext.h"

#include "standin/services/AlertService.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Attributes.h"
#include "velmark/Automation.h"
#include "velmark/Events.h"
#include "velmark/Media.h"
#include "velmark/Transport.h"
#include "velmark/UserInterface.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace Velmark;

namespace standin::tests {

namespace {

class HostContextTest : public testing::Test {
protected:
    /// Whether both ways lead to one service, with a reference each.
    template <Identified T>
    bool offers()
    {
        const Counted<T> given = service<T>(context);
        const Counted<T> queried = query<T>(context);
        if (!given || !(given == queried))
            return false;
        // The context itself holds the third.
        return given->addRef() == 4 && given->release() == 3;
    }
    /// Whether there are two new objects that nobody else holds.
    template <Identified T>
    bool makes(const Identifier& classId)
    {
        const Counted<T> first = create<T>(context, classId);
        const Counted<T> second = create<T>(context, classId);
        return first && second && !(first == second) && first->addRef() == 2 && first->release() == 1;
    }

    Application application;
    IHostContext* context = application.context();
};

} // namespace

TEST_F(HostContextTest, OffersTheServicesThatItMakesForItselfBothWays)
{
    EXPECT_TRUE(offers<IHostInfo>());
    EXPECT_TRUE(offers<IObjectFactory>());
}

TEST_F(HostContextTest, OffersTheServicesOfTheApplicationBothWays)
{
    // One more reference is the application's.
    const auto offersShared = [this]<Identified T>(Counted<T> given) {
        const Counted<T> queried = query<T>(context);
        return given && given == queried && given->addRef() == 5 && given->release() == 4;
    };

    EXPECT_TRUE(offersShared(service<IActionManager>(context)));
    EXPECT_TRUE(offersShared(service<IAlertService>(context)));
    EXPECT_TRUE(offersShared(service<IDependencyManager>(context)));
    EXPECT_TRUE(offersShared(service<IEditService>(context)));
    EXPECT_TRUE(offersShared(service<IFileSelector>(context)));
    EXPECT_TRUE(offersShared(service<IIdleManager>(context)));
    EXPECT_TRUE(offersShared(service<IMenuRegistry>(context)));
    EXPECT_TRUE(offersShared(service<IProgressService>(context)));
    EXPECT_TRUE(offersShared(service<IProjectManager>(context)));
    EXPECT_TRUE(offersShared(service<IViewManager>(context)));
    EXPECT_TRUE(offersShared(service<ITranslationService>(context)));
    EXPECT_TRUE(offersShared(service<ITransportControl>(context)));
    EXPECT_TRUE(offersShared(service<IWindowFactoryRegistry>(context)));
}

TEST_F(HostContextTest, IsTheHostThatModulesInsistOn)
{
    EXPECT_STREQ(service<IHostInfo>(context)->getName(), "Stagio");
}

TEST_F(HostContextTest, IsFoundFromItself)
{
    EXPECT_EQ(query<IHostContext>(context), context);
    EXPECT_EQ(service<IHostContext>(context), context);
    EXPECT_EQ(query<FUnknown>(context), service<FUnknown>(context));
}

TEST_F(HostContextTest, MakesNewObjectsOfEachClass)
{
    EXPECT_TRUE(makes<IProjectNode>(ClassId::PointMarker));
    EXPECT_TRUE(makes<IEventNode>(ClassId::PointMarker));
    EXPECT_TRUE(makes<IProjectNode>(ClassId::RangeMarker));
    EXPECT_TRUE(makes<IEventNode>(ClassId::RangeMarker));
    EXPECT_TRUE(makes<IProjectNode>(ClassId::AutomationPoint));
    EXPECT_TRUE(makes<IAutomationPoint>(ClassId::AutomationPoint));
    EXPECT_TRUE(makes<IAttributeData>(ClassId::AttributeList));
    EXPECT_TRUE(makes<IClipEvent>(ClassId::ClipEvent));
    EXPECT_TRUE(makes<IFilePath>(ClassId::FilePath));
    EXPECT_TRUE(makes<IObjectList>(ClassId::ObjectList));
}

TEST_F(HostContextTest, MakesMarkersOfBothKinds)
{
    EXPECT_FALSE(create<IProjectNode>(context, ClassId::PointMarker)->isType(TypeWord::Range));
    EXPECT_TRUE(create<IProjectNode>(context, ClassId::RangeMarker)->isType(TypeWord::Range));
}

TEST_F(HostContextTest, MakesNoObjectsByQueryInterface)
{
    EXPECT_FALSE(query<IFilePath>(context));
    EXPECT_FALSE(query<IObjectList>(context));
    EXPECT_FALSE(query<IClipEvent>(context));
}

TEST_F(HostContextTest, RefusesWhatItDoesntKnow)
{
    void* out = this;
    EXPECT_NE(context->getInterface(Identifier(), &out), ResultOk);
    EXPECT_EQ(out, nullptr);

    out = this;
    EXPECT_EQ(context->queryInterface(Identifier(), &out), ResultNoInterface);
    EXPECT_EQ(out, nullptr);

    EXPECT_FALSE(service<IThumbnailFactory>(context));
    EXPECT_FALSE(service<IProjectDocument>(context));
    EXPECT_FALSE(service<IEditTransaction>(context)) << "It is asked of the edit service.";
    EXPECT_NE(context->getInterface(IHostInfo::iid, nullptr), ResultOk) << "There is nowhere to put it.";
    EXPECT_NE(context->getInterface(ClassId::FilePath, nullptr), ResultOk);
}

TEST_F(HostContextTest, SpeaksToTheUserThroughTheTerminalOfTheApplication)
{
    std::ostringstream out;
    volatile std::sig_atomic_t interrupted = SIGINT;
    Application onTerminal(Terminal(out, true, &interrupted));
    bool cancelled = false;

    const auto progress = service<IProgressService>(onTerminal.context());
    progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
    progress->setText(u"Completing");
    progress->show();
    service<IAlertService>(onTerminal.context())->show(u"Stop.", nullptr, nullptr, nullptr);
    progress->end();

    EXPECT_EQ(out.str(), "\r\033[KCadrel: Completing\r\033[KStop.\n") << "The alert took the place of the progress.";
    EXPECT_TRUE(cancelled);
}

TEST(ViewManager, AnswersThatThereAreNoWindows)
{
    Application application;
    const auto views = service<IViewManager>(application.context());
    char bundle[] = "resources";
    auto* window = reinterpret_cast<IHostWindow*>(bundle);

    EXPECT_NE(views->loadSkin(bundle, "skin.xml"), ResultOk);
    EXPECT_NE(views->loadSkin(nullptr, nullptr), ResultOk);
    EXPECT_NE(views->openWindow("CadrelWindow", nullptr, &window), ResultOk);
    EXPECT_EQ(window, nullptr);
    EXPECT_NE(views->openWindow(nullptr, nullptr, nullptr), ResultOk);
}

} // namespace standin::tests
