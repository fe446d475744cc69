// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/HostWindow.h"

#include "velmark/Module.h"

#include <utility>

namespace standin {

using namespace Velmark;

namespace {

int32 widthOf(const ViewRect& rect)
{
    return rect.right - rect.left;
}

int32 heightOf(const ViewRect& rect)
{
    return rect.bottom - rect.top;
}

} // namespace

HostWindow::HostWindow(WindowSystem& windows, WindowDescription description, Counted<IPlugView> view, Changed changed)
    : m_windows(windows), m_description(std::move(description)), m_view(std::move(view)), m_changed(std::move(changed))
{
}

HostWindow::~HostWindow() = default;

int32 HostWindow::open()
{
    const auto self = Counted<HostWindow>::share(this);
    const Counted<IPlugView> view = m_view;
    if (m_native || !view || view->isPlatformTypeSupported(m_windows.parentType()) != ResultOk)
        return ResultFalse;
    ViewRect rect;
    view->getSize(rect);
    m_native = m_windows.createWindow(m_description.title, widthOf(rect), heightOf(rect), *this);
    if (m_native)
        view->setFrame(this);
    if (!m_native)
        return ResultFalse;
    const bool isAttached = view->attached(m_native->parent(), m_windows.parentType()) == ResultOk;
    if (!m_native)
        return ResultFalse;
    if (!isAttached) {
        view->setFrame(nullptr);
        m_native.reset();
        return ResultFalse;
    }
    m_native->show();
    m_changed(*this, true);
    return ResultOk;
}

int32 HostWindow::setCloseNotification(ICloseWindowNotification* listener)
{
    m_listener = listener;
    return ResultOk;
}

int32 HostWindow::show(bool visible)
{
    if (!m_native)
        return ResultFalse;
    if (visible)
        m_native->show();
    else
        close();
    return ResultOk;
}

void HostWindow::close()
{
    if (!m_native)
        return;
    // Whoever is told may give back the last reference.
    const auto self = Counted<HostWindow>::share(this);
    // Taken out first, so that a view that closes the window once more finds it closed.
    std::unique_ptr<NativeWindow> native = std::move(m_native);
    Counted<IPlugView> view = std::exchange(m_view, nullptr);
    view->removed();
    view->setFrame(nullptr);
    view.reset();
    native.reset();
    if (ICloseWindowNotification* const listener = std::exchange(m_listener, nullptr))
        listener->windowClosed(this);
    m_changed(*this, false);
}

int32 HostWindow::resizeView(IPlugView* view, const ViewRect& rect)
{
    if (!m_native || view != m_view.get() || !m_description.isResizable || m_native->hasFixedRoom() ||
        widthOf(rect) <= 0 || heightOf(rect) <= 0)
        return ResultFalse;
    const Counted<IPlugView> held = m_view;
    m_native->setSize(widthOf(rect), heightOf(rect));
    return held->onSize({0, 0, widthOf(rect), heightOf(rect)});
}

void HostWindow::resizedByUser(int32 width, int32 height)
{
    const auto self = Counted<HostWindow>::share(this);
    const Counted<IPlugView> view = m_view;
    if (!view)
        return;
    ViewRect rect{0, 0, width, height};
    if (view->canResize() == 0)
        view->getSize(rect);
    else
        view->checkSizeConstraint(rect);
    if (!m_native)
        return;
    if (widthOf(rect) != width || heightOf(rect) != height)
        m_native->setSize(widthOf(rect), heightOf(rect));
    view->onSize({0, 0, widthOf(rect), heightOf(rect)});
}

void HostWindow::givenRoom(int32 width, int32 height)
{
    if (const Counted<IPlugView> view = m_view)
        view->onSize({0, 0, width, height});
}

void HostWindow::focusChanged(bool hasFocus)
{
    if (const Counted<IPlugView> view = m_view)
        view->onFocus(hasFocus);
}

void HostWindow::idle()
{
    if (const Counted<IPlugView> view = m_view; view && m_native)
        view->idle();
}

} // namespace standin
