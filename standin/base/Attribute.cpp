// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/Attribute.h"

#include "standin/base/AttributeList.h"

namespace standin {

namespace {

using Object = Velmark::Counted<Velmark::FUnknown>;

bool areEqual(const Object& a, const Object& b)
{
    if (a == b)
        return true;
    const auto* const listA = dynamic_cast<const AttributeList*>(a.get());
    const auto* const listB = dynamic_cast<const AttributeList*>(b.get());
    return listA && listB && listA->values() == listB->values();
}

} // namespace

bool operator==(const Attribute& a, const Attribute& b)
{
    if (a.isPersistent != b.isPersistent)
        return false;
    const Object* const objectA = std::get_if<Object>(&a.value);
    const Object* const objectB = std::get_if<Object>(&b.value);
    return objectA && objectB ? areEqual(*objectA, *objectB) : a.value == b.value;
}

} // namespace standin
