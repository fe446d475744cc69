// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ObjectFactory.h"

#include "standin/project/VideoSupport.h"
#include "standin/services/ThumbnailFactory.h"

#include <string_view>

namespace standin {

using namespace Velmark;

FUnknown* ObjectFactory::createObject(const char* className, const char* typeName)
{
    if (!className || !typeName || std::string_view(className) != ThumbnailClass ||
        std::string_view(typeName) != ThumbnailType)
        return nullptr;
    FObject* const created =
        m_videos ? m_videos->createThumbnailFactory().detach() : makeCounted<ThumbnailFactory>().detach();
    m_givenOut.insert(created);
    return created;
}

int32 ObjectFactory::releaseObject(FUnknown* object)
{
    // It may come back as any of its interfaces.
    const auto identity = query<FUnknown>(object);
    if (m_givenOut.erase(identity.get()) == 0)
        return ResultFalse;
    identity->release();
    return ResultOk;
}

} // namespace standin
