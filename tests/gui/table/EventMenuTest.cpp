// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventMenu.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using cadrel::core::EventBase;
using cadrel::core::EventFlaw;
using cadrel::core::EventList;
using cadrel::core::ListKind;
using cadrel::gui::EventMenu;
using cadrel::gui::EventRows;
using cadrel::tests::makeEvent;

using Events = EventRows::Events;

namespace {

/// The menu as text, one line an item: "id text", "-" after what is disabled, children indented.
std::wstring textOf(const std::vector<EventMenu::Item>& items, const std::wstring& indent = {})
{
    std::wstring text;
    for (const EventMenu::Item& item : items) {
        const bool isSeparator = item.id == EventMenu::Separator && item.children.empty();
        if (isSeparator)
            text += indent + L"----\n";
        else
            text += indent + std::to_wstring(item.id) + L" " + item.text + (item.isEnabled ? L"\n" : L" -\n");
        text += textOf(item.children, indent + L"  ");
    }
    return text;
}

class EventMenuTest : public testing::Test {
protected:
    std::wstring menuOf(const EventList& list, const Events& selected) const
    {
        return textOf(EventMenu(list, m_newList, selected, selected.front()).items());
    }
    bool allows(int id, const Events& selected) const { return EventMenu::allows(id, m_change, m_newList, selected); }

    cadrel::tests::TestProject m_project;
    EventList m_newList{ListKind::New};
    EventList m_change{ListKind::Change};
    // The first two touch on both sides; then there is a gap of ten seconds on both.
    std::shared_ptr<EventBase> m_first = makeEvent("A", "00:00:00:00", "00:00:10:00", "01:00:00:00", "01:00:10:00");
    std::shared_ptr<EventBase> m_second = makeEvent("A", "00:00:10:00", "00:00:20:00", "01:00:10:00", "01:00:20:00");
    std::shared_ptr<EventBase> m_third = makeEvent("A", "00:00:30:00", "00:00:40:00", "01:00:30:00", "01:00:40:00");
    std::shared_ptr<EventBase> m_fourth = makeEvent("A", "00:00:45:00", "00:00:50:00", "01:00:45:00", "01:00:50:00");

    void SetUp() override
    {
        for (const auto& event : {m_first, m_second, m_third, m_fourth})
            m_change.add(event);
    }
};

} // namespace

TEST_F(EventMenuTest, OffersEverythingForOneEventOfTheChangeList)
{
    EXPECT_EQ(menuOf(m_change, {m_third}), L"0 Healing\n"
                                           L"  1 None -\n"
                                           L"  2 Normal -\n"
                                           L"  3 Gaps without Inserts -\n"
                                           L"  4 Gaps with Inserts -\n"
                                           L"----\n"
                                           L"0 Extend Event\n"
                                           L"  7 Until Previous Event\n"
                                           L"  8 Until Next Event\n"
                                           L"  9 Until Previous and Next Event\n"
                                           L"----\n"
                                           L"6 Edit\n"
                                           L"5 Delete\n");
}

TEST_F(EventMenuTest, OffersAtMostEditAndDeleteForTheOldAndTheNewList)
{
    for (const auto kind : {ListKind::Old, ListKind::New}) {
        EventList list(kind);
        list.append(m_change);
        EXPECT_EQ(menuOf(list, {m_third}), L"6 Edit\n5 Delete\n");
        EXPECT_EQ(menuOf(list, {m_second, m_third}), L"5 Delete\n");
    }
}

TEST_F(EventMenuTest, OffersNoEditAndNoExtensionForTwoEvents)
{
    EXPECT_EQ(menuOf(m_change, {m_first, m_second}), L"0 Healing\n"
                                                     L"  1 None -\n"
                                                     L"  2 Normal\n"
                                                     L"  3 Gaps without Inserts\n"
                                                     L"  4 Gaps with Inserts\n"
                                                     L"----\n"
                                                     L"5 Delete\n");
}

TEST_F(EventMenuTest, AsksTheListWhetherAModeHeals)
{
    // Over a gap with an insert in it.
    m_newList.add(makeEvent("N", "00:00:00:00", "00:00:02:00", "01:00:23:00", "01:00:25:00"));
    EXPECT_FALSE(allows(EventMenu::HealNormal, {m_second, m_third}));
    EXPECT_FALSE(allows(EventMenu::HealGapsWithoutInserts, {m_second, m_third}));
    EXPECT_TRUE(allows(EventMenu::HealGapsWithInserts, {m_second, m_third}));
    // With an event between them that isn't selected.
    EXPECT_FALSE(allows(EventMenu::HealGapsWithInserts, {m_first, m_third}));
}

TEST_F(EventMenuTest, UndoesHealing)
{
    m_change.heal(m_change, m_newList, EventMenu::healMode(EventMenu::HealNormal));
    ASSERT_EQ(m_change.size(), 3U);
    EXPECT_TRUE(allows(EventMenu::HealNone, {m_change.eventAt(0)}));
    EXPECT_FALSE(allows(EventMenu::HealNone, {m_change.eventAt(1)}));
}

TEST_F(EventMenuTest, ExtendsTheFirstEventToNoPreviousOne)
{
    m_change.remove(EventRows::listOf({m_second}));
    EXPECT_FALSE(allows(EventMenu::ExtendPrevious, {m_first}));
    EXPECT_TRUE(allows(EventMenu::ExtendNext, {m_first}));
    EXPECT_FALSE(allows(EventMenu::ExtendBoth, {m_first}));
}

TEST_F(EventMenuTest, ExtendsTheLastEventToNoNextOne)
{
    EXPECT_TRUE(allows(EventMenu::ExtendPrevious, {m_fourth}));
    EXPECT_FALSE(allows(EventMenu::ExtendNext, {m_fourth}));
    EXPECT_FALSE(allows(EventMenu::ExtendBoth, {m_fourth}));
}

TEST_F(EventMenuTest, EditsNoEventWhoseTimecodesTheRateDoesNotHave)
{
    const auto flawed = makeEvent("A", "00:00:00:30", "00:00:10:00", "01:00:00:00", "01:00:10:00");
    ASSERT_TRUE(flawed->hasFlaw(EventFlaw::TimecodeInvalid));
    m_change.add(flawed);
    EXPECT_NE(menuOf(m_change, {flawed}).find(L"6 Edit -\n"), std::wstring::npos);
    EXPECT_FALSE(allows(EventMenu::Edit, {flawed}));
    EXPECT_TRUE(allows(EventMenu::Delete, {flawed}));
    // Any other flaw doesn't matter.
    m_third->addFlaw(EventFlaw::NotVideoEvent);
    EXPECT_TRUE(allows(EventMenu::Edit, {m_third}));
    EXPECT_FALSE(EventMenu::allowsEdit(nullptr));
}

TEST_F(EventMenuTest, AllowsNothingWithoutASelectionAndNoOtherNumber)
{
    for (int id = -1; id <= 11; ++id)
        EXPECT_FALSE(allows(id, {})) << id;
    for (const int id : {-1, 0, 10, 11})
        EXPECT_FALSE(allows(id, {m_third})) << id;
}

TEST_F(EventMenuTest, AllowsWhatItOffers)
{
    for (const Events& selected :
         {Events{m_first}, Events{m_third}, Events{m_first, m_second}, Events{m_first, m_third}}) {
        const EventMenu menu(m_change, m_newList, selected, selected.front());
        for (const EventMenu::Item& item : menu.items()) {
            if (item.id != EventMenu::Separator) {
                EXPECT_EQ(allows(item.id, selected), item.isEnabled);
            }
            for (const EventMenu::Item& child : item.children)
                EXPECT_EQ(allows(child.id, selected), child.isEnabled) << child.id;
        }
    }
}

TEST_F(EventMenuTest, OffersNoHealingWhereItWouldFail)
{
    // Without a frame rate there are no seconds.
    const cadrel::tests::NoProject none;
    EXPECT_FALSE(allows(EventMenu::HealNormal, {m_first, m_second}));
    EXPECT_FALSE(allows(EventMenu::ExtendNext, {m_first}));
}

TEST(EventMenu, KnowsTheHealModesOfItsItems)
{
    EXPECT_EQ(EventMenu::healMode(1), 0);
    EXPECT_EQ(EventMenu::healMode(4), 3);
    for (const int id : {1, 4})
        EXPECT_TRUE(EventMenu::isHealing(id));
    for (const int id : {0, 5})
        EXPECT_FALSE(EventMenu::isHealing(id));
    for (const int id : {7, 9})
        EXPECT_TRUE(EventMenu::isExtending(id));
    for (const int id : {6, 10})
        EXPECT_FALSE(EventMenu::isExtending(id));
}
