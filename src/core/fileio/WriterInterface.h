// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

#include <string>

namespace cadrel::core {
class EventList;
}

namespace cadrel::core::fileio {

/// Writes an event list to a file.
class WriterInterface {
public:
    virtual ~WriterInterface() = default;

    /// Returns Ok or what is wrong.
    virtual util::Result::Type write(const std::wstring& path, const EventList& events) = 0;
};

} // namespace cadrel::core::fileio
