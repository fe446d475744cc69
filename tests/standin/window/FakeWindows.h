// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/window/WindowSystem.h"
#include "velmark/CPluginView.h"
#include "velmark/Module.h"

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// Windows without a screen; all that happens to them is noted.
class FakeWindows : public standin::WindowSystem {
public:
    class Window : public standin::NativeWindow {
    public:
        Window(FakeWindows& owner, Listener& told) : listener(told), m_owner(owner) {}
        ~Window() override { m_owner.calls.push_back("window closed"); }

        void* parent() override { return this; }
        bool hasFixedRoom() const override { return m_owner.isRoomFixed; }
        void setSize(std::int32_t width, std::int32_t height) override
        {
            m_owner.calls.push_back("size " + std::to_string(width) + " x " + std::to_string(height));
        }
        void show() override { m_owner.calls.push_back("shown"); }

        Listener& listener;

    private:
        FakeWindows& m_owner;
    };

    const char* parentType() const override { return "Fake"; }
    std::unique_ptr<standin::NativeWindow> createWindow(const std::string& title, std::int32_t width,
                                                        std::int32_t height,
                                                        standin::NativeWindow::Listener& listener) override
    {
        if (isOutOfWindows)
            return nullptr;
        calls.push_back("window " + title + " " + std::to_string(width) + " x " + std::to_string(height));
        auto window = std::make_unique<Window>(*this, listener);
        last = window.get();
        return window;
    }

    std::vector<std::string> calls;
    Window* last = nullptr;
    bool isOutOfWindows = false;
    bool isRoomFixed = false;
};

/// A view that notes into the same list.
class FakeView : public Velmark::Implements<FakeView, Velmark::CPluginView> {
public:
    static constexpr const char* ClassName = "FakeView";

    explicit FakeView(std::vector<std::string>& calls) : Implements(Velmark::ViewRect{0, 0, 600, 400}), m_calls(calls)
    {
    }
    ~FakeView() override { m_calls.push_back("view gone"); }

    Velmark::int32 attached(void* parent, const char* type) override
    {
        m_calls.push_back(std::string("attached to ") + type);
        duringCall("attached");
        return refusesParent ? Velmark::ResultFalse : CPluginView::attached(parent, type);
    }
    Velmark::int32 removed() override
    {
        m_calls.push_back("removed");
        duringCall("removed");
        return CPluginView::removed();
    }
    Velmark::int32 idle() override
    {
        m_calls.push_back("idle");
        duringCall("idle");
        return Velmark::ResultOk;
    }
    Velmark::int32 onSize(const Velmark::ViewRect& rect) override
    {
        m_calls.push_back("on size " + std::to_string(rect.right) + " x " + std::to_string(rect.bottom));
        const Velmark::int32 result = CPluginView::onSize(rect);
        duringCall("onSize");
        return result;
    }
    Velmark::int32 onFocus(bool state) override
    {
        m_calls.push_back(state ? "focus" : "no focus");
        duringCall("onFocus");
        return Velmark::ResultOk;
    }
    Velmark::int32 setFrame(Velmark::IPlugFrame* given) override
    {
        m_calls.push_back(given ? "frame" : "no frame");
        frame = given;
        const Velmark::int32 result = CPluginView::setFrame(given);
        duringCall("setFrame");
        return result;
    }
    Velmark::int32 checkSizeConstraint(Velmark::ViewRect& rect) override
    {
        rect.right = rect.right < 500 ? 500 : rect.right;
        duringCall("checkSizeConstraint");
        return Velmark::ResultOk;
    }

    Velmark::IPlugFrame* frame = nullptr;
    bool refusesParent = false;
    /// What the view does in the next call of that name.
    std::function<void()> action;
    std::string actsIn;

private:
    void duringCall(const char* name)
    {
        if (!action || actsIn != name)
            return;
        const auto once = std::exchange(action, nullptr);
        once();
        m_calls.push_back("done");
    }

    std::vector<std::string>& m_calls;
};

} // namespace cadrel::tests
