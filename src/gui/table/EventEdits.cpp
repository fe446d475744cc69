// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventEdits.h"

#include "core/conform/CadrelerBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "gui/look/ShownText.h"
#include "gui/table/EventMenu.h"

namespace cadrel::gui {

using core::EventList;

namespace {

const wchar_t* undoName(int id)
{
    if (id == EventMenu::Delete)
        return L"Delete EDL Events";
    if (EventMenu::isExtending(id))
        return L"Extend EDL Event";
    return id == EventMenu::HealNone ? L"Heal EDL events" : L"Heal EDL Events";
}

void extend(int id, EventList& list, const std::shared_ptr<core::EventBase>& event)
{
    if (id != EventMenu::ExtendNext)
        list.extendEvent(event, true);
    if (id != EventMenu::ExtendPrevious)
        list.extendEvent(event, false);
}

} // namespace

void EventEdits::stopPreview(const core::DataModel& model, core::CadrelerBase* engine)
{
    if (engine != nullptr && model.isPreviewActive())
        engine->setPreviewActive(false);
}

void EventEdits::makeUndoEntry(int id)
{
    core::createDataModelCommand(translated(undoName(id)));
}

void EventEdits::apply(int id, EventList& list, const EventList& newList, const EventRows::Events& events)
{
    if (id == EventMenu::Delete)
        list.remove(EventRows::listOf(events));
    else if (EventMenu::isHealing(id))
        list.heal(EventRows::listOf(events), newList, EventMenu::healMode(id));
    else if (EventMenu::isExtending(id) && events.size() == 1)
        extend(id, list, events.front());
}

} // namespace cadrel::gui
