// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

// The headers of the libraries that read videos, and owners of their objects.

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
#include <libavutil/display.h>
#include <libswscale/swscale.h>
}

#include <memory>
#include <new>

namespace standin {

struct AvDeleter {
    void operator()(AVFrame* frame) const { av_frame_free(&frame); }
    void operator()(AVPacket* packet) const { av_packet_free(&packet); }
    void operator()(AVCodecContext* context) const { avcodec_free_context(&context); }
    /// Closes what it reads from, too, even if that was opened by itself.
    void operator()(AVFormatContext* context) const
    {
        const bool hasOwnBytes = (context->flags & AVFMT_FLAG_CUSTOM_IO) != 0;
        AVIOContext* bytes = hasOwnBytes ? context->pb : nullptr;
        avformat_close_input(&context);
        avio_closep(&bytes);
    }
    void operator()(AVIOContext* bytes) const { avio_closep(&bytes); }
    void operator()(AVDictionary* dictionary) const { av_dict_free(&dictionary); }
    void operator()(SwsContext* context) const { sws_freeContext(context); }
};

template <class T>
using AvOwner = std::unique_ptr<T, AvDeleter>;

/// Of what was allocated; throws when there was no memory for it.
template <class T>
AvOwner<T> owned(T* object)
{
    if (!object)
        throw std::bad_alloc();
    return AvOwner<T>(object);
}

} // namespace standin
