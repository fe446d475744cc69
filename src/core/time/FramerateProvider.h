// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"

namespace cadrel::core {

/// Knows the project's frame rate; see Timecode::setFramerateProvider.
class FramerateProvider {
public:
    virtual Framerate getFramerate() const = 0;

protected:
    ~FramerateProvider() = default;
};

} // namespace cadrel::core
