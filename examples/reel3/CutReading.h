// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"

#include <string>

namespace reel3 {

/// What reading the EDLs of the example takes, at 24 frames a second, while it is there. One at a time.
class EdlSetting {
public:
    EdlSetting();
    EdlSetting(const EdlSetting&) = delete;
    EdlSetting& operator=(const EdlSetting&) = delete;
    ~EdlSetting();
};

/// Throws what EventList::load throws.
cadrel::core::EventList readCut(const std::string& edl);

} // namespace reel3
