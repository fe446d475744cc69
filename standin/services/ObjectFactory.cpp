#include "standin/services/ObjectFactory.h"

namespace standin {

using namespace Velmark;

FUnknown* ObjectFactory::createObject(const char* /*className*/, const char* /*typeName*/)
{
    return nullptr;
}

int32 ObjectFactory::releaseObject(FUnknown* /*object*/)
{
    return ResultFalse;
}

} // namespace standin
