// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/StoredChange.h"

#include "core/keep/PastRuns.h"
#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/protect/RunRecord.h"
#include "gui/table/EventColumn.h"
#include "gui/table/RowSet.h"
#include "gui/table/StoredTable.h"
#include "standin/Application.h"
#include "standin/project/Project.h"
#include "tests/module/StoredProject.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

namespace desktop::tests {
namespace {

namespace core = cadrel::core;

/// The two reels, which begin at 01:00:00:00 and 02:00:00:00, in a project whose clock begins an hour before.
class StoredChangeTest : public testing::Test {
protected:
    StoredChangeTest()
    {
        const std::string folder = cadrel::tests::treePath("examples/tworeels/");
        m_model.oldEdl().load(cadrel::tests::widePath(folder + "old.edl"), true);
        m_model.newEdl().load(cadrel::tests::widePath(folder + "new.edl"), true);
        m_model.generateChangeEdl();
    }

    /// Whether a look finds something else than the one before.
    bool store()
    {
        cadrel::tests::StoredModel::of(m_model).putInto(m_project);
        return m_change.look(m_project);
    }

    cadrel::tests::TestProject m_rate{core::Framerate(24, 0)};
    core::DataModel m_model;
    standin::Application m_application;
    standin::Project& m_project = m_application.createProject();
    StoredChange m_change;
};

TEST_F(StoredChangeTest, IsEmptyInAProjectThatHasNone)
{
    EXPECT_FALSE(m_change.look(m_project));
    EXPECT_TRUE(m_change.map().isEmpty());
    EXPECT_FALSE(m_change.event());
}

TEST_F(StoredChangeTest, IsReadAgainOnlyWhenItIsAnother)
{
    EXPECT_TRUE(store());
    EXPECT_FALSE(m_change.map().isEmpty());
    EXPECT_FALSE(store());
    m_model.changeEdl().clear();
    EXPECT_TRUE(store());
    EXPECT_TRUE(m_change.map().isEmpty());
}

TEST_F(StoredChangeTest, PassesOverWhateverBlockSomebodyHasMade)
{
    using cadrel::tests::StoredModel;
    const std::vector<std::uint8_t> whole = StoredModel::of(m_model).block;
    for (std::size_t place = 0; place + 4 <= whole.size(); ++place) {
        // As a count it is more than there is memory for.
        std::vector<std::uint8_t> block = whole;
        std::fill_n(block.begin() + static_cast<std::ptrdiff_t>(place), 3, std::uint8_t{0xFF});
        block[place + 3] = 0x7F;
        StoredModel::ofBlock(std::move(block)).putInto(m_project);
        EXPECT_NO_THROW(m_change.look(m_project)) << "at byte " << place;
    }
    EXPECT_TRUE(store());
    EXPECT_EQ(m_change.map().isEmpty(), false);
}

TEST_F(StoredChangeTest, IsPlannedUntilARunWasNoted)
{
    store();
    EXPECT_EQ(m_change.map().state(), ChangeMap::State::Planned);
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    store();
    EXPECT_EQ(m_change.map().state(), ChangeMap::State::Carried);
}

TEST_F(StoredChangeTest, TellsTheOneEventThatIsSelectedByItsPlaceInTheList)
{
    cadrel::gui::StoredTable table(m_model, core::ListKind::Change);
    table.setSelection(cadrel::gui::RowSet::parse("1", 5));
    store();
    EXPECT_EQ(m_change.event(), 1U);
    // By falling names: STAIRS, PIER, LAMP, DOOR, BOAT.
    table.setSortKey({cadrel::gui::EventColumn::ClipName, true});
    store();
    EXPECT_EQ(m_change.event(), 0U) << "PIER is the first of the list.";
    table.setSelection(cadrel::gui::RowSet::parse("1,2", 5));
    store();
    EXPECT_FALSE(m_change.event());
}

} // namespace
} // namespace desktop::tests
