// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/module/ModuleLoader.h"

#include "standin/Application.h"
#include "standin/edit/ProjectManager.h"
#include "standin/project/Project.h"
#include "standin/window/ViewManager.h"
#include "velmark/FieldText.h"

#include <dlfcn.h>

namespace standin {

using namespace Velmark;

namespace {

constexpr std::string_view ServiceCategory = "Service";

} // namespace

ModuleLoader::ModuleLoader(Application& application, const std::filesystem::path& module,
                           const std::filesystem::path& resources, IHostContext* context)
    : m_application(application), m_context(context ? context : application.context()),
      m_file(std::filesystem::absolute(module)), m_resources(std::filesystem::absolute(resources).string())
{
    try {
        load();
    } catch (...) {
        unload();
        throw;
    }
}

ModuleLoader::~ModuleLoader()
{
    unload();
}

void ModuleLoader::load()
{
    m_object = dlopen(m_file.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (!m_object)
        fail(dlerror());
    auto* const enter = find<bool(void*)>("bundleEntry");
    find<bool()>("bundleExit");
    auto* const getFactory = find<IPluginFactory*()>("GetPluginFactory");
    m_hasEntered = enter(m_resources.data());
    if (!m_hasEntered)
        fail("the module refuses to be loaded");
    m_factory = Counted<IPluginFactory>::adopt(getFactory());
    if (!m_factory)
        fail("the module has no factory");
    if (m_factory->createInstance(serviceClass(), IPluginBase::iid, reinterpret_cast<void**>(m_controller.out())) !=
        ResultOk)
        fail("the module can't make its object");
    m_isInitialised = m_controller->initialize(m_context) == ResultOk;
    if (!m_isInitialised)
        fail("the module doesn't work in this host");
}

void ModuleLoader::unload()
{
    if (m_isInitialised) {
        m_application.views().closeAll();
        m_controller->terminate();
        for (const Counted<Project>& project : m_application.projects().projects())
            project->undoList().clear();
    }
    m_controller.reset();
    m_factory.reset();
    if (m_hasEntered)
        find<bool()>("bundleExit")();
    if (m_object)
        dlclose(m_object);
}

template <class Function>
Function* ModuleLoader::find(const char* name)
{
    void* const found = dlsym(m_object, name);
    if (!found)
        fail(std::string("the module lacks ") + name);
    return reinterpret_cast<Function*>(found);
}

Identifier ModuleLoader::serviceClass()
{
    PClassInfo info;
    for (int32 index = 0; index < m_factory->countClasses(); ++index) {
        if (m_factory->getClassInfo(index, info) == ResultOk && textOf(info.category) == ServiceCategory)
            return info.cid;
    }
    fail("the module has no class of the kind \"Service\"");
}

void ModuleLoader::fail(const std::string& reason) const
{
    throw ModuleError(m_file.string() + ": " + reason);
}

} // namespace standin
