// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/MediaPoolInterface.h"
#include "core/model/VideoList.h"
#include "util/ListenerSet.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/Media.h"

#include <cstddef>
#include <cstdint>
#include <string>

namespace Velmark {
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

/// The videos of the host's media pool. Whatever changes in the pool is told to the listeners.
class MediaPool : public Velmark::Implements<MediaPool, Velmark::FObject>, public core::MediaPoolInterface {
public:
    static constexpr const char* ClassName = "MediaPool";

    /// Becomes a dependent of the pool, which may be null and isn't counted: it outlives this object. Throws
    /// Result::HostObjectMissing without the host's IDependencyManager and Result::HostCallFailed when that refuses.
    MediaPool(Velmark::IHostContext* context, Velmark::IMediaPool* pool);
    /// Becomes a dependent in its turn; has no listeners.
    MediaPool(const MediaPool& other);
    MediaPool& operator=(const MediaPool&) = delete;
    ~MediaPool() override;

    std::size_t count() override;
    std::wstring getPath(std::size_t index) override;
    std::wstring getName(std::size_t index) override;
    std::wstring getFileName(std::size_t index) override;
    std::uint32_t getFrameCount(std::size_t index) override;
    void addListener(Listener* listener) override { m_listeners.add(listener); }
    void removeListener(Listener* listener) override { m_listeners.remove(listener); }

    /// The clip of that file, which the host brings into the pool where it can; else a video of the pool that has the
    /// file's name and the number of frames, wherever it lies. Nothing when there is none, and without a pool.
    Velmark::Counted<Velmark::IMediaClip> findClip(const std::wstring& path, std::uint32_t frames);
    /// The same for an entry of the list of new videos. Throws what Timecode::toFrameCount throws for its length.
    Velmark::Counted<Velmark::IMediaClip> findClip(const core::VideoList::Entry& entry);

    Velmark::int32 update(Velmark::FUnknown* changed, Velmark::int32 message) override;
    void notifyListeners();

private:
    void attach();
    Velmark::IProjectNode* itemAt(std::size_t index);
    Velmark::Counted<Velmark::IMediaClip> clipAt(std::size_t index);
    Velmark::Counted<Velmark::IMediaClip> importClip(const std::wstring& path);

    Velmark::IMediaPool* m_pool;
    Velmark::IHostContext* m_hostContext;
    util::ListenerSet<Listener> m_listeners;
};

} // namespace cadrel::host
