// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventRows.h"

#include <memory>
#include <string>
#include <vector>

namespace cadrel::core {
class EventBase;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The menu of an event table: what it offers for the selected events, and what of it may be done.
class EventMenu {
public:
    /// The ids of the items.
    enum Id : int {
        HealNone = 1,
        HealNormal = 2,
        HealGapsWithoutInserts = 3,
        HealGapsWithInserts = 4,
        Delete = 5,
        Edit = 6,
        ExtendPrevious = 7,
        ExtendNext = 8,
        ExtendBoth = 9,
    };
    static constexpr int Separator = 0;

    struct Item {
        int id = Separator; ///< also of a submenu, which has children then
        std::wstring text;  ///< translated
        bool isEnabled = true;
        std::vector<Item> children;
    };

    /// The menu asks the lists at once. `newList` is the new EDL, against which healing finds inserts. `clicked` is the event
    /// at which the menu is opened; only it can be edited, and only while it is selected.
    EventMenu(const core::EventList& list, const core::EventList& newList, const EventRows::Events& selected,
              const std::shared_ptr<core::EventBase>& clicked);

    const std::vector<Item>& items() const { return m_items; }

    /// Whether the item may be done with the events. False for a number that is no item.
    static bool allows(int id, const core::EventList& list, const core::EventList& newList,
                       const EventRows::Events& selected);
    /// Whether the event may be edited: whether its timecodes exist at the project's rate.
    static bool allowsEdit(const std::shared_ptr<core::EventBase>& event);
    /// The heal mode of one of the ids HealNone to HealGapsWithInserts.
    static int healMode(int id) { return id - HealNone; }
    static bool isHealing(int id) { return id >= HealNone && id <= HealGapsWithInserts; }
    static bool isExtending(int id) { return id >= ExtendPrevious && id <= ExtendBoth; }

private:
    std::vector<Item> m_items;
};

} // namespace cadrel::gui
