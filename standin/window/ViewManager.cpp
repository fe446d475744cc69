// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/ViewManager.h"

#include "velmark/Module.h"
#include "velmark/PlugView.h"

#include <filesystem>

namespace standin {

using namespace Velmark;

void ViewManager::setWindowSystem(WindowSystem* windows)
{
    closeAll();
    m_windows = windows;
}

int32 ViewManager::loadSkin(BundleHandle bundle, const char* file)
{
    if (!m_windows || !bundle || !file)
        return ResultFalse;
    const auto found = readWindowDescriptions(std::filesystem::path(static_cast<const char*>(bundle)) / file);
    if (!found)
        return ResultFalse;
    for (const WindowDescription& window : *found)
        m_descriptions[window.name] = window;
    return ResultOk;
}

int32 ViewManager::openWindow(const char* name, IViewBuilder* builder, IHostWindow** window)
{
    if (!window)
        return ResultFalse;
    *window = nullptr;
    const auto description = name ? m_descriptions.find(name) : m_descriptions.end();
    if (!m_windows || !builder || description == m_descriptions.end())
        return ResultFalse;
    Counted<IPlugView> view;
    if (builder->createView(name, nullptr, view.out()) != ResultOk || !view)
        return ResultFalse;
    const auto changed = [this](HostWindow& which, bool isOpen) {
        if (isOpen)
            m_open.push_back(Counted<HostWindow>::share(&which));
        else
            std::erase_if(m_open, [&](const Counted<HostWindow>& each) { return each == &which; });
    };
    *window = makeCounted<HostWindow>(*m_windows, description->second, std::move(view), changed).detach();
    return ResultOk;
}

void ViewManager::idle()
{
    const std::vector<Counted<HostWindow>> open = m_open;
    for (const Counted<HostWindow>& window : open)
        window->idle();
}

void ViewManager::closeAll()
{
    // One that is being closed already stays until that is done.
    const std::vector<Counted<HostWindow>> open = m_open;
    for (const Counted<HostWindow>& window : open)
        window->show(false);
}

} // namespace standin
