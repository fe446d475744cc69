#pragma once

#include "velmark/Implements.h"
#include "velmark/Media.h"

namespace standin {

/// This host draws no pictures: there is no class that it could make objects of, and so none to give back.
class ObjectFactory : public Velmark::Implements<ObjectFactory, Velmark::FObject, Velmark::IObjectFactory> {
public:
    static constexpr const char* ClassName = "ObjectFactory";

    Velmark::FUnknown* createObject(const char* className, const char* typeName) override;
    Velmark::int32 releaseObject(Velmark::FUnknown* object) override;
};

} // namespace standin
