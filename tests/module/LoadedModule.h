// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/Application.h"
#include "standin/module/ModuleLoader.h"
#include "standin/window/HostWindow.h"
#include "standin/window/ViewManager.h"
#include "velmark/Module.h"
#include "velmark/PluginFactory.h"

#include "tests/support/ThisProcess.h"
#include "tests/support/TreePaths.h"
#include "tests/support/x11/HostLoop.h"
#include "tests/support/x11/VirtualScreen.h"
#include "tests/support/x11/XWindows.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>

#include <dlfcn.h>

namespace cadrel::tests {

inline std::filesystem::path modulePath()
{
    return std::filesystem::path(programPath("../lib/Cadrel.so")).lexically_normal();
}

inline bool isModuleMapped()
{
    return isMapped("Cadrel.so");
}

/// The module's three functions, for a host that calls them in another way than the stand-in's does.
struct ModuleFunctions {
    ModuleFunctions() : object(dlopen(modulePath().c_str(), RTLD_NOW | RTLD_LOCAL))
    {
        if (!object)
            throw std::runtime_error(dlerror());
        enter = reinterpret_cast<bool (*)(void*)>(dlsym(object, "bundleEntry"));
        leave = reinterpret_cast<bool (*)()>(dlsym(object, "bundleExit"));
        getFactory = reinterpret_cast<Velmark::IPluginFactory* (*)()>(dlsym(object, "GetPluginFactory"));
    }
    ModuleFunctions(const ModuleFunctions&) = delete;
    ModuleFunctions& operator=(const ModuleFunctions&) = delete;
    ~ModuleFunctions() { dlclose(object); }

    /// Not yet initialised.
    Velmark::Counted<Velmark::IPluginBase> makeController() const
    {
        const auto factory = Velmark::Counted<Velmark::IPluginFactory>::adopt(getFactory());
        Velmark::PClassInfo info;
        factory->getClassInfo(0, info);
        Velmark::Counted<Velmark::IPluginBase> controller;
        factory->createInstance(info.cid, Velmark::IPluginBase::iid, reinterpret_cast<void**>(controller.out()));
        return controller;
    }

    void* object;
    bool (*enter)(void*) = nullptr;
    bool (*leave)() = nullptr;
    Velmark::IPluginFactory* (*getFactory)() = nullptr;
};

/// A host with a screen, in plain Xlib, which may load the module.
class LoadedModule : public testing::Test, protected HostLoop {
protected:
    /// With `videos`, the host opens video files.
    explicit LoadedModule(standin::VideoSupport* videos = nullptr)
        : m_application(standin::Terminal(m_messages, false), videos)
    {
        m_application.views().setWindowSystem(&m_windows);
    }
    ~LoadedModule() override { m_application.views().setWindowSystem(nullptr); }

    /// The module gets this context or, with null, the application's.
    void load(Velmark::IHostContext* context = nullptr)
    {
        m_module = std::make_unique<standin::ModuleLoader>(m_application, modulePath(), treePath("resources"), context);
    }
    void unload() { m_module.reset(); }

    void work() override
    {
        m_windows.serve();
        m_application.idle();
    }

    bool openWindow() { return m_application.choose(m_application.menus().commands().front()) && window(); }
    standin::HostWindow* window()
    {
        const auto& open = m_application.views().windows();
        return open.empty() ? nullptr : open.front().get();
    }
    bool isDrawn() { return m_windows.colourAt(400, 425) == Band; }

    /// What the user has been told, a line each, and was not asked for before.
    std::string messages()
    {
        std::string told = m_messages.str();
        m_messages.str("");
        return told;
    }

private:
    /// Of the band of the change EDL.
    static constexpr unsigned long Band = 0x565d63;

    std::ostringstream m_messages;

protected:
    VirtualScreen m_screen;
    XWindows m_windows;
    standin::Application m_application;
    std::unique_ptr<standin::ModuleLoader> m_module;
};

} // namespace cadrel::tests
