// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/ObjectList.h"

namespace standin {

using namespace Velmark;

int32 ObjectList::add(FUnknown* object, int32 /*reserved*/)
{
    if (!object)
        return ResultFalse;
    m_objects.push_back(Counted<FUnknown>::share(object));
    return ResultOk;
}

int32 ObjectList::count()
{
    return static_cast<int32>(m_objects.size());
}

FUnknown* ObjectList::at(int32 index)
{
    return index >= 0 && index < count() ? m_objects[static_cast<std::size_t>(index)].get() : nullptr;
}

} // namespace standin
