// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/TracksView.h"

#include "core/edl/EventList.h"
#include "standin/Application.h"
#include "standin/edit/EditService.h"
#include "standin/project/Project.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/Pictures.h"

#include <gtest/gtest.h>

#include <optional>

using cadrel::core::EventList;
using cadrel::tests::expectPicture;
using cadrel::tests::treePath;
using desktop::ChangeMap;
using desktop::TracksView;

namespace {

/// The example reel, as it is before a run.
class TracksViewTest : public testing::Test {
protected:
    TracksViewTest() : m_project(m_application.openProject(treePath("examples/reel3/reel3.stage")))
    {
        m_application.activateProject(&m_project);
        m_view.emplace(m_project, m_application.edits(), nullptr);
        m_view->setSize(1300, 640);
    }

    cadrel::tests::TestProject m_rate{cadrel::core::Framerate(24, 0)};
    juce::ScopedJuceInitialiser_GUI m_juce;
    standin::Application m_application;
    standin::Project& m_project;
    std::optional<TracksView> m_view;
};

} // namespace

TEST_F(TracksViewTest, ShowsAllOfTheProgrammeAtFirst)
{
    expectPicture(*m_view, "tracks-reel");
}

TEST_F(TracksViewTest, ShowsClipsWithTheirNamesWhenItIsClose)
{
    m_view->zoomBy(12.0);
    m_view->scrollTo(100.0);
    expectPicture(*m_view, "tracks-reel-close");
}
