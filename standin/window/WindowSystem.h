// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <memory>
#include <string>

namespace standin {

/// A window on the screen. It is closed when this object goes.
class NativeWindow {
public:
    /// What the user does with it, told while events are served.
    class Listener {
    public:
        virtual void resizedByUser(std::int32_t width, std::int32_t height) = 0;
        /// The host has no more room than this, whatever the view would like to have.
        virtual void givenRoom(std::int32_t width, std::int32_t height) = 0;
        virtual void closedByUser() = 0;
        virtual void focusChanged(bool hasFocus) = 0;

    protected:
        ~Listener() = default;
    };

    virtual ~NativeWindow() = default;

    /// What a view is attached to; its kind is WindowSystem::parentType().
    virtual void* parent() = 0;
    /// Whether its size is the host's alone, so that views may not ask for another one.
    virtual bool hasFixedRoom() const { return false; }
    /// In physical pixels.
    virtual void setSize(std::int32_t width, std::int32_t height) = 0;
    /// Makes it visible, in front of the others.
    virtual void show() = 0;
};

/// How the host's windows get on the screen: whoever carries the host brings one.
class WindowSystem {
public:
    virtual ~WindowSystem() = default;

    /// One of Velmark::ParentType.
    virtual const char* parentType() const = 0;
    /// Not yet visible. The listener outlives the window. Null when there can be none. The title is UTF-8.
    virtual std::unique_ptr<NativeWindow> createWindow(const std::string& title, std::int32_t width,
                                                       std::int32_t height, NativeWindow::Listener& listener) = 0;
};

} // namespace standin
