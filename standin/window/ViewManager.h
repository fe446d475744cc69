// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/window/HostWindow.h"
#include "standin/window/WindowDescription.h"
#include "standin/window/WindowSystem.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/UserInterface.h"

#include <map>
#include <string>
#include <vector>

namespace standin {

/// The windows of modules. Without a window system there are none, and every description and name is refused.
class ViewManager : public Velmark::Implements<ViewManager, Velmark::FObject, Velmark::IViewManager> {
public:
    static constexpr const char* ClassName = "ViewManager";

    /// Not owned; null for none. The windows that are open are closed first.
    void setWindowSystem(WindowSystem* windows);

    /// The bundle is the path of the folder with the resources, as for translations. A description of the same name as one
    /// before takes its place.
    Velmark::int32 loadSkin(Velmark::BundleHandle bundle, const char* file) override;
    Velmark::int32 openWindow(const char* name, Velmark::IViewBuilder* builder, Velmark::IHostWindow** window) override;

    /// Those on the screen, in the order in which they came.
    const std::vector<Velmark::Counted<HostWindow>>& windows() const { return m_open; }
    /// Lets the views of all windows work.
    void idle();
    void closeAll();

private:
    WindowSystem* m_windows = nullptr;
    std::map<std::string, WindowDescription> m_descriptions;
    std::vector<Velmark::Counted<HostWindow>> m_open;
};

} // namespace standin
