// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/edit/ProjectManager.h"

#include <gtest/gtest.h>

#include <limits>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

using Calls = std::vector<std::string>;

/// An application without projects, and a listener to them.
struct EmptyHost {
    EmptyHost() { manager->addNotification(listener.get()); }
    ~EmptyHost() { manager->removeNotification(listener.get()); }

    Application application;
    Counted<IProjectManager> manager = service<IProjectManager>(application.context());
    Calls calls;
    Counted<Recorder> listener = makeCounted<Recorder>(calls);
};

} // namespace

TEST(ProjectManager, HasTheOpenProjectsInTheOrderOfTheirOpening)
{
    EmptyHost host;
    EXPECT_EQ(host.manager->projectCount(), 0);

    Project& first = host.application.createProject();
    Project& second = host.application.createProject();

    EXPECT_EQ(host.manager->projectCount(), 2);
    EXPECT_EQ(host.manager->projectAt(0), &first);
    EXPECT_EQ(host.manager->projectAt(1), &second);
    for (const int32 index : {2, -1, std::numeric_limits<int32>::max(), std::numeric_limits<int32>::min()})
        EXPECT_EQ(host.manager->projectAt(index), nullptr) << index;
}

TEST(ProjectManager, TellsOfProjectsThatComeAndGo)
{
    EmptyHost host;

    Project& project = host.application.createProject();
    EXPECT_EQ(host.calls, Calls{"opened"});
    EXPECT_EQ(host.manager->activeProject(), nullptr);

    host.application.activateProject(&project);
    EXPECT_EQ(host.manager->activeProject(), &project);
    host.application.activateProject(&project);
    host.application.activateProject(nullptr);
    EXPECT_EQ(host.manager->activeProject(), nullptr);
    EXPECT_EQ(host.calls, (Calls{"opened", "activated", "deactivated"}));

    host.application.closeProject(project);
    EXPECT_EQ(host.calls, (Calls{"opened", "activated", "deactivated", "closing"}));
    EXPECT_EQ(host.manager->projectCount(), 0);
}

TEST(ProjectManager, TheActiveProjectIsDeactivatedBeforeAnotherIsActivated)
{
    EmptyHost host;
    Project& first = host.application.createProject();
    Project& second = host.application.createProject();
    host.application.activateProject(&first);
    host.calls.clear();
    std::vector<IProjectDocument*> active;
    host.listener->whenCalled = [&](const std::string&) { active.push_back(host.manager->activeProject()); };

    host.application.activateProject(&second);

    EXPECT_EQ(host.calls, (Calls{"deactivated", "activated"}));
    EXPECT_EQ(active, (std::vector<IProjectDocument*>{nullptr, &second}));
}

TEST(ProjectManager, TheActiveProjectIsDeactivatedBeforeItCloses)
{
    EmptyHost host;
    Project& project = host.application.createProject();
    host.application.activateProject(&project);
    host.calls.clear();

    host.application.closeProject(project);

    EXPECT_EQ(host.calls, (Calls{"deactivated", "closing"}));
    EXPECT_EQ(host.manager->activeProject(), nullptr);
}

TEST(ProjectManager, AProjectCanBeUsedWhileItCloses)
{
    EmptyHost host;
    Project& project = host.application.createProject();
    int32 count = 0;
    host.listener->whenCalled = [&](const std::string&) { count = host.manager->projectCount(); };

    host.application.closeProject(project);

    EXPECT_EQ(count, 1);
}

TEST(ProjectManager, ANewProjectHasNoChangesToTell)
{
    EmptyHost host;

    Project& project = host.application.createProject();

    EXPECT_FALSE(project.hasChanges());
    EXPECT_EQ(static_cast<IProjectNode&>(project).changeFlags(), 0U);
}

TEST(ProjectManager, TheApplicationClosesItsProjectsAtItsEnd)
{
    Calls calls;
    const auto listener = makeCounted<Recorder>(calls);
    Counted<Project> kept;
    {
        Application application;
        service<IProjectManager>(application.context())->addNotification(listener.get());
        kept = Counted<Project>::share(&application.createProject());
        application.createProject();
        calls.clear();
    }

    EXPECT_EQ(calls, (Calls{"closing", "closing"}));
    EXPECT_EQ(kept->refCount(), 1);
}

TEST(ProjectManager, AListenerIsThereOnceAndNotCounted)
{
    EmptyHost host;

    EXPECT_EQ(host.listener->refCount(), 1);
    EXPECT_NE(host.manager->addNotification(host.listener.get()), ResultOk);
    EXPECT_NE(host.manager->addNotification(nullptr), ResultOk);
    EXPECT_NE(host.manager->removeNotification(nullptr), ResultOk);
    const auto other = makeCounted<Recorder>(host.calls);
    EXPECT_NE(host.manager->removeNotification(other.get()), ResultOk);

    EXPECT_EQ(host.manager->removeNotification(host.listener.get()), ResultOk);
    host.application.createProject();
    EXPECT_EQ(host.calls, Calls{});
}

TEST(ProjectManager, AListenerThatAnotherRemovesIsNotToldAnyMore)
{
    EmptyHost host;
    const auto second = makeCounted<Recorder>(host.calls, "second ");
    host.manager->addNotification(second.get());
    host.listener->whenCalled = [&](const std::string&) { host.manager->removeNotification(second.get()); };

    host.application.createProject();

    EXPECT_EQ(host.calls, Calls{"opened"});
}

TEST(ProjectManager, AListenerThatIsAddedInACallIsToldOfWhatComesLater)
{
    EmptyHost host;
    const auto second = makeCounted<Recorder>(host.calls, "second ");
    host.listener->whenCalled = [&](const std::string&) { host.manager->addNotification(second.get()); };

    host.application.createProject();
    EXPECT_EQ(host.calls, Calls{"opened"});

    host.application.createProject();
    EXPECT_EQ(host.calls, (Calls{"opened", "opened", "second opened"}));
    host.manager->removeNotification(second.get());
}

TEST(ProjectManager, FindsOpenProjectsAlone)
{
    EmptyHost host;
    Project& project = host.application.createProject();
    const auto loose = makeCounted<Project>(project.log());

    EXPECT_EQ(host.application.projects().find(&project), &project);
    EXPECT_EQ(host.application.projects().find(loose.get()), nullptr);
    EXPECT_EQ(host.application.projects().find(nullptr), nullptr);
}

} // namespace standin::tests
