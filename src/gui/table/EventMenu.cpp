// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventMenu.h"

#include "core/change/HealCheck.h"
#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "gui/look/ShownText.h"
#include "util/Result.h"

#include <cstddef>
#include <vector>

namespace cadrel::gui {

using core::EventList;

namespace {

bool isChangeList(const EventList& list)
{
    return list.listKind() == core::ListKind::Change;
}

/// Whether each of the items can heal the selection.
std::vector<bool> canHeal(const EventList& list, const EventList& newList, const EventRows::Events& selected,
                          const std::vector<int>& ids)
{
    std::vector<bool> can(ids.size());
    const auto askEach = [&](const core::HealCheck& check) {
        for (std::size_t index = 0; index < ids.size(); ++index) {
            try {
                can[index] = check.canHeal(EventMenu::healMode(ids[index]));
            } catch (util::Result::Type) {
                // Healing would fail too.
                can[index] = false;
            }
        }
    };
    try {
        askEach(core::HealCheck(list, selected, newList));
    } catch (util::Result::Type) {
        // Nothing can be healed then.
    }
    return can;
}

bool canExtend(int id, const EventList& list, const std::shared_ptr<core::EventBase>& event)
{
    const bool toPrevious = id == EventMenu::ExtendNext || list.canExtendEvent(event, true);
    return toPrevious && (id == EventMenu::ExtendPrevious || list.canExtendEvent(event, false));
}

EventMenu::Item healingMenu(const EventList& list, const EventList& newList, const EventRows::Events& selected)
{
    const std::vector<int> ids = {EventMenu::HealNone, EventMenu::HealNormal, EventMenu::HealGapsWithoutInserts,
                                  EventMenu::HealGapsWithInserts};
    const std::vector<bool> can = canHeal(list, newList, selected, ids);
    EventMenu::Item menu = {EventMenu::Separator, translated(L"Healing"), true, {}};
    std::size_t index = 0;
    for (const wchar_t* const text : {L"None", L"Normal", L"Gaps without Inserts", L"Gaps with Inserts"}) {
        menu.children.push_back({ids[index], translated(text), can[index], {}});
        ++index;
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

EventMenu::EventMenu(const EventList& list, const EventList& newList, const EventRows::Events& selected,
                     const std::shared_ptr<core::EventBase>& clicked)
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
        m_items.push_back({Edit, translated(L"Edit"), clicked == selected.front() && allowsEdit(clicked), {}});
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
        return isChangeList(list) && canHeal(list, newList, selected, {id}).front();
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
