// SPDX-License-Identifier: GPL-3.0-or-later

#include "module/Factory.h"

#include "host/plugin/Cadrel.h"
#include "velmark/CPluginFactory.h"
#include "velmark/FieldText.h"

#include <exception>
#include <string_view>

namespace cadrel::module {

using namespace Velmark;

namespace {

PFactoryInfo makeFactoryInfo()
{
    PFactoryInfo info;
    putText(std::string_view("Cadrel"), info.vendor);
    info.flags = PFactoryInfo::Flag::Unicode;
    return info;
}

PClassInfo2 makeControllerInfo()
{
    PClassInfo2 info;
    info.cid = ControllerClass;
    info.cardinality = 1;
    putText(std::string_view("Service"), info.category);
    putText(std::string_view("Cadrel"), info.name);
    putText(std::string_view("1.0.3.820"), info.version);
    putText(std::string_view("QMI 4.0.0"), info.sdkVersion);
    return info;
}

FUnknown* makeController(void* /*context*/)
{
    return static_cast<FObject*>(new host::Cadrel);
}

} // namespace

IPluginFactory* factory() noexcept
{
    if (gPluginFactory) {
        gPluginFactory->addRef();
        return gPluginFactory;
    }
    static const PFactoryInfo factoryInfo = makeFactoryInfo();
    static const PClassInfo2 controllerInfo = makeControllerInfo();
    try {
        auto made = makeCounted<CPluginFactory>(factoryInfo);
        if (!made->registerClass(controllerInfo, makeController, nullptr))
            return nullptr;
        return gPluginFactory = made.detach();
    } catch (const std::exception&) {
        return nullptr;
    }
}

} // namespace cadrel::module
