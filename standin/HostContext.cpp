// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/HostContext.h"

#include "standin/base/AttributeList.h"
#include "standin/base/FilePath.h"
#include "standin/base/ObjectList.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Marker.h"
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
