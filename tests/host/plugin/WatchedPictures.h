// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/picture/VideoProviderBase.h"
#include "host/Host.h"
#include "host/video/ProjectVideo.h"
#include "standin/Application.h"
#include "standin/services/IdleManager.h"

#include <cstddef>
#include <memory>

namespace cadrel::tests {

/// What a window asks for pictures, of the module that works on the host.
inline std::shared_ptr<gui::VideoProviderBase> picturesOf(standin::Application& application)
{
    for (Velmark::IIdleHandler* const handler : application.idleManager().handlers()) {
        if (auto* const found = dynamic_cast<host::Host*>(handler))
            return std::dynamic_pointer_cast<gui::VideoProviderBase>(found->getVideoProvider());
    }
    return nullptr;
}

/// Looks at the pictures while it lives, so that they are drawn.
class PictureWatch : public gui::VideoProviderBase::Listener {
public:
    explicit PictureWatch(gui::VideoProviderBase& pictures) : m_pictures(pictures) { m_pictures.addListener(this); }
    PictureWatch(const PictureWatch&) = delete;
    PictureWatch& operator=(const PictureWatch&) = delete;
    ~PictureWatch() override { m_pictures.removeListener(this); }

    void imageChanged(std::size_t) override {}

private:
    gui::VideoProviderBase& m_pictures;
};

} // namespace cadrel::tests
