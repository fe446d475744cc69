// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/MediaPoolInterface.h"
#include "util/ListenerSet.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// A media pool of videos that a test lists.
class TestPool : public core::MediaPoolInterface {
public:
    struct Video {
        std::wstring path;
        std::uint32_t frames = 0;
        bool isBroken = false; ///< the host fails to tell its path
    };

    TestPool() = default;
    explicit TestPool(std::vector<Video> list) : videos(std::move(list)) {}

    std::size_t count() override { return videos.size(); }
    std::wstring getPath(std::size_t index) override
    {
        if (at(index).isBroken)
            throw util::Result::HostObjectMissing;
        return at(index).path;
    }
    /// The name of the file.
    std::wstring getName(std::size_t index) override { return util::StringUtil::fileNameOf(at(index).path); }
    std::wstring getFileName(std::size_t index) override { return util::StringUtil::baseNameOf(at(index).path); }
    std::uint32_t getFrameCount(std::size_t index) override { return at(index).frames; }
    void addListener(Listener* listener) override
    {
        ++listeners;
        m_listeners.add(listener);
    }
    void removeListener(Listener* listener) override
    {
        --listeners;
        m_listeners.remove(listener);
    }

    void tell()
    {
        m_listeners.forEach([](Listener& listener) { listener.mediaPoolChanged(); });
    }

    std::vector<Video> videos;
    int listeners = 0; ///< how many there are

private:
    Video& at(std::size_t index)
    {
        if (index >= videos.size())
            throw util::Result::InvalidArgument;
        return videos[index];
    }

    util::ListenerSet<Listener> m_listeners;
};

} // namespace cadrel::tests
