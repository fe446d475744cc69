// SPDX-License-Identifier: GPL-3.0-or-later

// Sessions as Ardour itself has saved them.

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Project.h"
#include "standin/project/ProjectForm.h"
#include "standin/project/Track.h"
#include "tests/support/TreePaths.h"

#include <fstream>
#include <gtest/gtest.h>
#include <iterator>
#include <map>

namespace standin::tests {

namespace {

class SavedSession : public testing::TestWithParam<const char*> {
protected:
    Velmark::Counted<Project> read() { return ProjectFile::read(file, m_log); }

    const std::string file = cadrel::tests::treePath(std::string("tests/data/ardour/") + GetParam());

private:
    ChangeLog m_log;
};

TEST_P(SavedSession, IsWrittenToTheByteWhenNothingHasChanged)
{
    std::ifstream stream(file, std::ios::binary);
    const std::string text(std::istreambuf_iterator<char>(stream), {});
    ASSERT_GT(text.size(), 10000U);
    EXPECT_EQ(ProjectFile::toText(*read()), text);
}

class SavedSessionWithABus : public SavedSession {};

TEST_P(SavedSessionWithABus, HasTheTracksTheBusAndTheVcaThatCarryAutomation)
{
    const auto project = read();
    EXPECT_EQ(project->timeOrigin(), 3600.0);
    EXPECT_EQ(project->frameRate().framesPerSecond, 25.0);
    std::map<std::u16string, std::size_t> curvesWithPoints;
    for (const Track* const track : project->allTracks()) {
        for (const auto& [number, curve] : track->curves())
            curvesWithPoints[track->name()] += curve->firstChild() != nullptr ? 1 : 0;
    }
    // Gain, pan, trim and send of a track.
    EXPECT_EQ(curvesWithPoints.at(u"Dia 1"), 4U);
    EXPECT_EQ(curvesWithPoints.at(u"Bus 1"), 1U);
    EXPECT_EQ(curvesWithPoints.at(u"VCA"), 1U);
    EXPECT_EQ(project->form()->staying(), std::vector<std::string>{"the range \"Loop\""});
}

std::string nameOf(const testing::TestParamInfo<const char*>& session)
{
    const std::string name = session.param;
    return name.substr(0, name.find('.'));
}

INSTANTIATE_TEST_SUITE_P(Kept, SavedSession, testing::Values("film.ardour", "conformed.ardour", "version6000.ardour"),
                         nameOf);
INSTANTIATE_TEST_SUITE_P(Kept, SavedSessionWithABus, testing::Values("film.ardour", "conformed.ardour"), nameOf);

} // namespace

} // namespace standin::tests
