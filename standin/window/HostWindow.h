// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/window/WindowDescription.h"
#include "standin/window/WindowSystem.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/PlugView.h"
#include "velmark/UserInterface.h"

#include <functional>
#include <memory>

namespace standin {

/// A window of this host that shows the view of a module. It is on the screen from open() until the user or show(false)
/// closes it, which ends the view. It can't be opened again.
class HostWindow : public Velmark::Implements<HostWindow, Velmark::FObject, Velmark::IHostWindow, Velmark::IPlugFrame>,
                   private NativeWindow::Listener {
public:
    static constexpr const char* ClassName = "HostWindow";

    /// `changed` is called with true when the window has come on the screen, and with false when it has been closed.
    using Changed = std::function<void(HostWindow&, bool isOpen)>;

    /// The window system outlives the window.
    HostWindow(WindowSystem& windows, WindowDescription description, Velmark::Counted<Velmark::IPlugView> view,
               Changed changed);
    ~HostWindow() override;

    /// Fails when the view can't be shown by this window system, refuses its parent or closes the window meanwhile, and when
    /// it was open before.
    Velmark::int32 open() override;
    Velmark::int32 setCloseNotification(Velmark::ICloseWindowNotification* listener) override;
    Velmark::int32 show(bool visible) override;

    /// Fails for another view than its own, and where the description or the window allows no other size.
    Velmark::int32 resizeView(Velmark::IPlugView* view, const Velmark::ViewRect& rect) override;

    void idle();

    const WindowDescription& description() const { return m_description; }
    /// Null while it isn't on the screen.
    NativeWindow* native() const { return m_native.get(); }
    Velmark::IPlugView* view() const { return m_view.get(); }

private:
    // The view may close the window in each of its calls, and with it give back the last reference.
    void resizedByUser(std::int32_t width, std::int32_t height) override;
    void givenRoom(std::int32_t width, std::int32_t height) override;
    void closedByUser() override { close(); }
    void focusChanged(bool hasFocus) override;
    void close();

    WindowSystem& m_windows;
    WindowDescription m_description;
    Velmark::Counted<Velmark::IPlugView> m_view;
    Changed m_changed;
    std::unique_ptr<NativeWindow> m_native;
    Velmark::ICloseWindowNotification* m_listener = nullptr;
};

} // namespace standin
