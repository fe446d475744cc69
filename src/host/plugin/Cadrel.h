// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/border/Teardown.h"
#include "host/plugin/JuceGuiAdapter.h"
#include "host/plugin/JuceLayer.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/UserInterface.h"

#include <memory>
#include <optional>

namespace cadrel::host {

class Host;
class VideoProvider;

/// The controller of the module: the object that the factory makes. It enters the module's command into the host's "Project"
/// menu, opens the one window, and owns Host.
///
/// Host is made at the first initialize() that succeeds and lasts until the controller goes. What is registered with the
/// host, and JUCE, last from an initialize() that succeeded to the next terminate(), or to the end of the controller.
class Cadrel final : public Velmark::Implements<Cadrel, Velmark::FObject, Velmark::IPluginBase, Velmark::IActionHandler,
                                                Velmark::IViewBuilder, Velmark::IPlugController,
                                                Velmark::ICloseWindowNotification, Velmark::IPlugWindowFactory> {
public:
    static constexpr const char* ClassName = "Cadrel";

    Cadrel();
    Cadrel(const Cadrel&) = delete;
    Cadrel& operator=(const Cadrel&) = delete;
    ~Cadrel() override;

    /// Nonzero in a host with another name, and where the host refuses a part of it; nothing stays registered then.
    Velmark::int32 initialize(Velmark::FUnknown* context) override;
    /// Closes the window. Does nothing unless it is initialised.
    Velmark::int32 terminate() override;

    Velmark::int32 handleAction(const char* category, const char* action, bool show) override;

    /// Result::HostObjectMissing for another name, before initialize(), and while there is a view already.
    Velmark::int32 createView(const char* name, Velmark::FUnknown* parent, Velmark::IPlugView** view) override;

    Velmark::int32 windowClosed(Velmark::IHostWindow* window) override;

    const char* getWindowName() override;
    bool hasWindow(Velmark::IHostWindow* window) override;
    Velmark::IHostWindow* getWindow() override;

private:
    void registerWithHost(Velmark::IHostContext& context);
    Velmark::int32 showDialog(bool show);
    Velmark::int32 openWindow();
    void closeWindow();
    void disposeView() noexcept;
    /// A view that the host has given back without closing its window is over.
    void dropUnusedView();

    /// Of the last initialize() that succeeded; null while it isn't initialised.
    Velmark::Counted<Velmark::IHostContext> m_context;
    std::optional<JuceLayer> m_layer;
    Velmark::Counted<Host> m_host;
    std::shared_ptr<VideoProvider> m_video;   ///< of m_host
    Velmark::IHostWindow* m_window = nullptr; ///< not owned
    Velmark::Counted<Velmark::IViewManager> m_viewManager;
    Velmark::Counted<JuceGuiAdapter> m_view; ///< the last one made
    Teardown m_registration;
};

} // namespace cadrel::host
