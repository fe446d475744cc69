// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/GenerationSettings.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

namespace GenerationSettings = gui::GenerationSettings;
using core::VfxPatternEntry;

class GenerationSettingsTest : public testing::Test {
protected:
    GenerationSettingsTest()
    {
        m_model.changeEdl().add(makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00"));
    }
    core::Settings& settings() { return m_model.settings(); }
    bool haveChanged() const { return GenerationSettings::haveChanged(m_model); }

    TestProject m_project;
    core::DataModel m_model;
};

TEST_F(GenerationSettingsTest, HaveNotChangedWhereNoneWereKept)
{
    settings().setMatchBy(core::MatchBy::ClipName);

    EXPECT_FALSE(haveChanged());
}

TEST_F(GenerationSettingsTest, HaveChangedUntilTheyAreAsTheyWere)
{
    GenerationSettings::keep(m_model);
    EXPECT_FALSE(haveChanged());
    settings().setMatchBy(core::MatchBy::ClipName);
    EXPECT_TRUE(haveChanged());
    settings().setMatchBy(core::MatchBy::RollName);
    EXPECT_FALSE(haveChanged());
    settings().setHealMode(core::HealMode::None);
    EXPECT_TRUE(haveChanged());
    GenerationSettings::keep(m_model);
    EXPECT_FALSE(haveChanged());
}

TEST_F(GenerationSettingsTest, HaveTheVfxNamesThatAreUsed)
{
    GenerationSettings::keep(m_model);
    settings().setVfxPattern(VfxPatternEntry("VFX", "comp", false), 1);
    EXPECT_FALSE(haveChanged());
    settings().setVfxPattern(VfxPatternEntry("VFX", "comp", true), 1);
    EXPECT_TRUE(haveChanged());
    GenerationSettings::keep(m_model);
    settings().setVfxPattern(VfxPatternEntry("VFXc", "omp", true), 1);
    EXPECT_TRUE(haveChanged());
}

TEST_F(GenerationSettingsTest, DoNotCountWithoutAList)
{
    GenerationSettings::keep(m_model);
    settings().setHealMode(core::HealMode::None);
    m_model.changeEdl().clear();

    EXPECT_FALSE(haveChanged());
}

TEST_F(GenerationSettingsTest, AreNeitherThoseOfTheRunNorThoseOfLoading)
{
    GenerationSettings::keep(m_model);
    settings().set(&core::Settings::bRollRenaming, !settings().bRollRenaming());
    settings().set(&core::Settings::createInsertMarkers, !settings().createInsertMarkers());
    settings().setRestrictRange(true);

    EXPECT_FALSE(haveChanged());
}

TEST_F(GenerationSettingsTest, AreStoredWithTheModel)
{
    GenerationSettings::keep(m_model);
    core::serialize::ByteArchive stored;
    stored << m_model;
    settings().setHealMode(core::HealMode::None);
    stored.rewind();
    m_model.restore(stored);

    EXPECT_TRUE(haveChanged());
}

} // namespace
} // namespace cadrel::tests
