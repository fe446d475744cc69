// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextListenerInterface.h"
#include "host/video/VideoSourceBase.h"
#include "velmark/Counted.h"
#include "velmark/Media.h"

namespace cadrel::core {
class VideoList;
} // namespace cadrel::core

namespace cadrel::host {

class MediaPool;

/// The picture that the list of the new videos tells, from files of the media pool.
class PoolVideoSource : public VideoSourceBase, public core::ChangeContextListenerInterface {
public:
    PoolVideoSource() = default;
    ~PoolVideoSource() override;

    /// Neither is owned, and both may be null.
    void setMediaPool(MediaPool* pool);
    void setVideoList(core::VideoList* list);
    MediaPool* mediaPool() const { return m_pool; }
    core::VideoList* videoList() const { return m_list; }

    /// `lastFrame` is ignored: where two videos meet, the second one counts from its first frame.
    VideoFrame getFrame(bool lastFrame, double time) override;

    void onChange(const core::ChangeContext& context) override;

private:
    MediaPool* m_pool = nullptr;
    core::VideoList* m_list = nullptr;
};

} // namespace cadrel::host
