// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/changes/ProjectLink.h"

#include "standin/project/Project.h"

#include <gtest/gtest.h>

using namespace Velmark;

namespace standin::tests {

namespace {

struct NoEdit : Edit {
    void undo() override {}
    void redo() override {}
};

struct LinkedProject {
    ChangeLog log;
    Counted<Project> project = makeCounted<Project>(log);
    Counted<ProjectLink> link = Counted<ProjectLink>::share(project->link());
};

} // namespace

TEST(ProjectLink, FindsTheProjectUntilThatHasGone)
{
    LinkedProject linked;
    EXPECT_EQ(linked.link->project(), linked.project.get());

    linked.project.reset();
    EXPECT_EQ(linked.link->project(), nullptr);
}

TEST(ProjectLink, RecordsOnlyForAnOpenProjectInAnOpenTransaction)
{
    LinkedProject linked;
    EXPECT_FALSE(linked.link->isRecording());
    linked.log.open();
    EXPECT_FALSE(linked.link->isRecording());
    linked.project->setOpen(true);
    EXPECT_TRUE(linked.link->isRecording());
    linked.log.close();
    EXPECT_FALSE(linked.link->isRecording());
}

TEST(ProjectLink, DoesNotRecordForAProjectThatHasGone)
{
    LinkedProject linked;
    linked.log.open();
    linked.project->setOpen(true);
    linked.project.reset();

    EXPECT_FALSE(linked.link->isRecording());
}

TEST(ProjectLink, RecordsAnEditAsOneOfItsProject)
{
    LinkedProject linked;
    linked.log.open();
    linked.link->record(std::make_unique<NoEdit>());

    ASSERT_EQ(linked.log.records().size(), 1u);
    EXPECT_EQ(linked.log.records()[0].project, linked.project.get());
}

} // namespace standin::tests
