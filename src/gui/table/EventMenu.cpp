// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventMenu.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "gui/look/ShownText.h"
#include "util/Result.h"

#include <utility>

namespace cadrel::gui {

using core::EventList;

namespace {

bool isChangeList(const EventList& list)
{
    return list.listKind() == core::ListKind::Change;
}

bool canHeal(const EventList& list, const EventList& newList, const EventList& selection, int mode)
{
    try {
        return list.canHeal(selection, newList, mode);
    } catch (util::Result::Type) {
        // Healing would fail too.
        return false;
    }
}

bool canExtend(int id, const EventList& list, const std::shared_ptr<core::EventBase>& event)
{
    const bool toPrevious = id == EventMenu::ExtendNext || list.canExtendEvent(event, true);
    return toPrevious && (id == EventMenu::ExtendPrevious || list.canExtendEvent(event, false));
}

EventMenu::Item healingMenu(const EventList& list, const EventList& newList, const EventRows::Events& selected)
{
    const EventList selection = EventRows::listOf(selected);
    EventMenu::Item menu = {EventMenu::Separator, translated(L"Healing"), true, {}};
    for (const auto& [id, text] : {std::pair(EventMenu::HealNone, L"None"), std::pair(EventMenu::HealNormal, L"Normal"),
                                   std::pair(EventMenu::HealGapsWithoutInserts, L"Gaps without Inserts"),
                                   std::pair(EventMenu::HealGapsWithInserts, L"Gaps with Inserts")}) {
        menu.children.push_back({id, translated(text), canHeal(list, newList, selection, EventMenu::healMode(id)), {}});
    }
    return menu;
}

EventMenu::Item extendMenu(const EventList& list, const std::shared_ptr<core::EventBase>& event)
{
    const bool toPrevious = list.canExtendEvent(event, true);
    const bool toNext = list.canExtendEvent(event, false);
    return {EventMenu::Separator,
            translated(L"Extend Event"),
            true,
            {{EventMenu::ExtendPrevious, translated(L"Until Previous Event"), toPrevious, {}},
             {EventMenu::ExtendNext, translated(L"Until Next Event"), toNext, {}},
             {EventMenu::ExtendBoth, translated(L"Until Previous and Next Event"), toPrevious && toNext, {}}}};
}

} // namespace

EventMenu::EventMenu(const EventList& list, const EventList& newList, const EventRows::Events& selected)
{
    if (isChangeList(list)) {
        m_items.push_back(healingMenu(list, newList, selected));
        m_items.emplace_back();
    }
    if (selected.size() == 1) {
        if (isChangeList(list)) {
            m_items.push_back(extendMenu(list, selected.front()));
            m_items.emplace_back();
        }
        m_items.push_back({Edit, translated(L"Edit"), allowsEdit(selected.front()), {}});
    }
    m_items.push_back({Delete, translated(L"Delete"), true, {}});
}

bool EventMenu::allows(int id, const EventList& list, const EventList& newList, const EventRows::Events& selected)
{
    if (selected.empty())
        return false;
    if (id == Delete)
        return true;
    if (isHealing(id))
        return isChangeList(list) && canHeal(list, newList, EventRows::listOf(selected), healMode(id));
    if (selected.size() != 1)
        return false;
    if (id == Edit)
        return allowsEdit(selected.front());
    return isExtending(id) && isChangeList(list) && canExtend(id, list, selected.front());
}

bool EventMenu::allowsEdit(const std::shared_ptr<core::EventBase>& event)
{
    return event && !event->hasFlaw(core::EventFlaw::TimecodeInvalid);
}

} // namespace cadrel::gui
