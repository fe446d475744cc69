// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace cadrel::core {

/// The videos of the project's media pool. The operations with an index throw Result::InvalidArgument for one at or
/// above `count`, and Result::NotAvailable without a pool.
class MediaPoolInterface {
public:
    class Listener {
    public:
        virtual ~Listener() = default;

        virtual void mediaPoolChanged() = 0;
    };

    virtual ~MediaPoolInterface() = default;

    /// 0 without a pool.
    virtual std::size_t count() = 0;
    virtual std::wstring getPath(std::size_t index) = 0;
    virtual std::wstring getName(std::size_t index) = 0;
    /// Without folder and extension.
    virtual std::wstring getFileName(std::size_t index) = 0;
    virtual std::uint32_t getFrameCount(std::size_t index) = 0;
    /// Listeners are not owned.
    virtual void addListener(Listener* listener) = 0;
    virtual void removeListener(Listener* listener) = 0;
};

} // namespace cadrel::core
