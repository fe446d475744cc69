// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/HostContext.h"

#include "standin/Application.h"
#include "standin/ProjectManager.h"
#include "standin/edit/EditService.h"
#include "standin/project/AttributeList.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
#include "standin/project/Project.h"
#include "standin/services/ActionManager.h"
#include "standin/services/AlertService.h"
#include "standin/services/DependencyManager.h"
#include "standin/services/FilePath.h"
#include "standin/services/FileSelector.h"
#include "standin/services/HostInfo.h"
#include "standin/services/IdleManager.h"
#include "standin/services/MenuRegistry.h"
#include "standin/services/ObjectFactory.h"
#include "standin/services/ObjectList.h"
#include "standin/services/ProgressService.h"
#include "standin/services/Translations.h"
#include "standin/services/Transport.h"
#include "standin/services/ViewManager.h"
#include "standin/services/WindowFactoryRegistry.h"
#include "velmark/ClassId.h"

#include <algorithm>

namespace standin {

using namespace Velmark;

namespace {

/// A class of which modules may have objects, and as what they are given a new one.
struct ObjectClass {
    Identifier id;
    Identifier answersAs;
    Counted<FObject> (*create)();
};

template <class T>
Counted<FObject> make()
{
    return makeCounted<T>();
}

template <bool isRange>
Counted<FObject> makeMarker()
{
    return makeCounted<Marker>(isRange);
}

constexpr ObjectClass ObjectClasses[] = {
    {ClassId::PointMarker, FUnknown::iid, makeMarker<false>},
    {ClassId::RangeMarker, FUnknown::iid, makeMarker<true>},
    {ClassId::AutomationPoint, FUnknown::iid, make<AutomationPoint>},
    {ClassId::AttributeList, IAttributeData::iid, make<AttributeList>},
    {ClassId::ClipEvent, IClipEvent::iid, make<ClipEvent>},
    {ClassId::FilePath, IFilePath::iid, make<FilePath>},
    {ClassId::ObjectList, IObjectList::iid, make<ObjectList>},
};

template <class Entries>
auto* find(Entries& entries, const Identifier& id)
{
    const auto found =
        std::find_if(std::begin(entries), std::end(entries), [&](const auto& entry) { return entry.id == id; });
    return found == std::end(entries) ? nullptr : &*found;
}

} // namespace

HostContext::HostContext(Application& application)
{
    offer<IActionManager>(application.actions());
    offer<IAlertService>(application.alerts());
    offer<IDependencyManager>(application.dependencies());
    offer<IEditService>(application.edits());
    offer<IFileSelector>(application.fileSelector());
    offer<IHostInfo>(*makeCounted<HostInfo>());
    offer<IIdleManager>(application.idleManager());
    offer<IMenuRegistry>(application.menus());
    offer<IObjectFactory>(*makeCounted<ObjectFactory>());
    offer<IProgressService>(application.progress());
    offer<IProjectManager>(application.projects());
    offer<ITranslationService>(application.translations());
    offer<ITransportControl>(application.transport());
    offer<IViewManager>(*makeCounted<ViewManager>());
    offer<IWindowFactoryRegistry>(application.windowFactories());
}

template <class Interface>
void HostContext::offer(Interface& service)
{
    m_services.push_back({Interface::iid, Counted<FUnknown>::share(&service)});
}

int32 HostContext::queryInterface(const Identifier& id, void** out)
{
    if (const Service* const service = find(m_services, id))
        return service->object->queryInterface(id, out);
    return Implements::queryInterface(id, out);
}

int32 HostContext::getInterface(const Identifier& id, void** out)
{
    if (!out)
        return ResultFalse;
    if (const ObjectClass* const objectClass = find(ObjectClasses, id))
        return objectClass->create()->queryInterface(objectClass->answersAs, out);
    return queryInterface(id, out);
}

} // namespace standin
