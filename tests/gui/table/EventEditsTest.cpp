// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventEdits.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "gui/table/EventMenu.h"
#include "tests/gui/table/RecordedEdits.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

using cadrel::core::EventBase;
using cadrel::core::EventList;
using cadrel::gui::EventMenu;
using cadrel::gui::EventRows;
using cadrel::tests::makeEvent;
using cadrel::tests::thrownBy;
using cadrel::tests::timecodesOf;
using cadrel::util::Result;

namespace EventEdits = cadrel::gui::EventEdits;

namespace {

class EventEditsTest : public testing::Test {
protected:
    void SetUp() override
    {
        for (const auto& event : {m_first, m_second, m_third})
            list().add(event);
        m_edits.steps.clear();
    }
    EventList& list() { return m_model.changeEdl(); }
    void edit(int id, const EventRows::Events& events)
    {
        EventEdits::makeUndoEntry(id);
        EventEdits::apply(id, list(), m_model.newEdl(), events);
    }

    using Steps = std::vector<std::string>;

    cadrel::tests::TestProject m_project;
    cadrel::core::DataModel m_model;
    cadrel::tests::RecordedEdits m_edits{m_model};
    std::shared_ptr<EventBase> m_first = makeEvent("A", "00:00:05:00", "00:00:10:00", "01:00:00:00", "01:00:05:00");
    std::shared_ptr<EventBase> m_second = makeEvent("A", "00:00:20:00", "00:00:25:00", "01:00:10:00", "01:00:15:00");
    std::shared_ptr<EventBase> m_third = makeEvent("A", "00:00:25:00", "00:00:40:00", "01:00:15:00", "01:00:30:00");
};

} // namespace

TEST_F(EventEditsTest, RemoveAfterTheirUndoEntry)
{
    edit(EventMenu::Delete, {m_first, m_third});
    EXPECT_EQ(list().events(), (EventRows::Events{m_second}));
    EXPECT_EQ(m_edits.steps, (Steps{"Delete EDL Events of 3", "list of 1"}));
}

TEST_F(EventEditsTest, HealAfterTheirUndoEntry)
{
    edit(EventMenu::HealNormal, {m_second, m_third});
    EXPECT_EQ(list().size(), 2U);
    EXPECT_EQ(m_edits.steps, (Steps{"Heal EDL Events of 3", "list of 2"}));
}

TEST_F(EventEditsTest, TakeHealingBackUnderANameOfItsOwn)
{
    edit(EventMenu::HealNormal, {m_second, m_third});
    m_edits.steps.clear();
    edit(EventMenu::HealNone, {list().eventAt(1)});
    EXPECT_EQ(list().size(), 3U);
    EXPECT_EQ(m_edits.steps, (Steps{"Heal EDL events of 2", "list of 3"}));
}

TEST_F(EventEditsTest, HealByTheModeOfTheItem)
{
    edit(EventMenu::HealNone, {m_first, m_second, m_third});
    EXPECT_EQ(list().size(), 3U);
    edit(EventMenu::HealGapsWithoutInserts, {m_first, m_second, m_third});
    // The gap is five seconds in the programme and ten in the source.
    EXPECT_EQ(list().size(), 2U);
}

TEST_F(EventEditsTest, ExtendToEitherSideOrBoth)
{
    edit(EventMenu::ExtendPrevious, {m_second});
    EXPECT_EQ(timecodesOf(*m_second), "00:00:15:00 00:00:25:00 01:00:05:00 01:00:15:00");
    EXPECT_EQ(m_edits.steps, (Steps{"Extend EDL Event of 3", "list of 3"}));

    edit(EventMenu::ExtendNext, {m_first});
    EXPECT_EQ(timecodesOf(*m_first), "00:00:05:00 00:00:10:00 01:00:00:00 01:00:05:00");
}

TEST_F(EventEditsTest, ExtendToBothSidesInOneEntry)
{
    list().remove(EventRows::listOf({m_third}));
    list().add(makeEvent("A", "00:01:00:00", "00:02:00:00", "01:00:17:00", "01:01:00:00"));
    m_edits.steps.clear();
    edit(EventMenu::ExtendBoth, {m_second});
    EXPECT_EQ(timecodesOf(*m_second), "00:00:15:00 00:00:27:00 01:00:05:00 01:00:17:00");
    EXPECT_EQ(m_edits.steps, (Steps{"Extend EDL Event of 3", "list of 3", "list of 3"}));
}

TEST_F(EventEditsTest, ThrowWhatTheListThrows)
{
    // The source would begin before the day.
    const auto early = makeEvent("A", "00:00:01:00", "00:00:10:00", "01:01:00:00", "01:01:09:00");
    list().add(early);
    EXPECT_EQ(thrownBy([&] { edit(EventMenu::ExtendPrevious, {early}); }), Result::OutOfRange);
}

TEST_F(EventEditsTest, GoOnWithoutAnUndoList)
{
    cadrel::core::setDataModelCommandCreator(nullptr);
    edit(EventMenu::Delete, {m_first});
    EXPECT_EQ(list().size(), 2U);
}

TEST_F(EventEditsTest, StopAPreviewThatIsOn)
{
    EventEdits::stopPreview(m_model, &m_edits.engine);
    EXPECT_TRUE(m_edits.steps.empty());

    m_model.setPreviewActive(true);
    EXPECT_NO_THROW(EventEdits::stopPreview(m_model, nullptr));
    EventEdits::stopPreview(m_model, &m_edits.engine);
    EXPECT_EQ(m_edits.steps, (Steps{"preview off"}));
    EXPECT_FALSE(m_model.isPreviewActive());
}
