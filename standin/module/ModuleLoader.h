// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/Module.h"
#include "velmark/PluginFactory.h"

#include <filesystem>
#include <stdexcept>
#include <string>

namespace standin {

class Application;

/// Why a module can't be used, with the name of its file.
class ModuleError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// A module that is loaded into this process and works on the host. It is unloaded when this object goes:
///
///     dlopen > bundleEntry > GetPluginFactory > createInstance > initialize
///     windows closed < terminate < undo lists dropped < releases < bundleExit < dlclose
class ModuleLoader {
public:
    /// Loads the shared object and initialises the object of its class "Service". `resources` is the folder with the
    /// module's files. The application outlives the loader, and so does `context`, which the module is given in the place of
    /// the application's own unless it is null. Throws ModuleError; nothing stays loaded then.
    ModuleLoader(Application& application, const std::filesystem::path& module, const std::filesystem::path& resources,
                 Velmark::IHostContext* context = nullptr);
    ModuleLoader(const ModuleLoader&) = delete;
    ModuleLoader& operator=(const ModuleLoader&) = delete;
    /// The undo lists of all open projects are dropped, because they hold steps of the module.
    ~ModuleLoader();

    Velmark::IPluginFactory& factory() { return *m_factory; }
    Velmark::IPluginBase& controller() { return *m_controller; }

private:
    void load();
    void unload();
    template <class Function>
    Function* find(const char* name);
    Velmark::Identifier serviceClass();
    [[noreturn]] void fail(const std::string& reason) const;

    Application& m_application;
    Velmark::IHostContext* m_context;
    std::filesystem::path m_file;
    std::string m_resources; ///< the bundle handle is its text
    void* m_object = nullptr;
    bool m_hasEntered = false;
    bool m_isInitialised = false;
    Velmark::Counted<Velmark::IPluginFactory> m_factory;
    Velmark::Counted<Velmark::IPluginBase> m_controller;
};

} // namespace standin
