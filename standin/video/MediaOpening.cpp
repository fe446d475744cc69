// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/MediaOpening.h"

#include <cerrno>
#include <string>
#include <system_error>

namespace standin {

namespace fs = std::filesystem;

using Reason = VideoError::Reason;

namespace {

bool isOver(const Deadline& deadline)
{
    return std::chrono::steady_clock::now() >= deadline;
}

void requireRegularFile(const fs::path& file)
{
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (status.type() == fs::file_type::not_found)
        throw VideoError(Reason::Missing);
    // The reader would wait for what comes through a pipe or a device.
    if (!fs::is_regular_file(status))
        throw VideoError(Reason::NotOpened);
}

AvOwner<AVIOContext> openBytes(const fs::path& file, const AVIOInterruptCB& interrupt, Deadline deadline)
{
    AVIOContext* bytes = nullptr;
    // The name of the protocol keeps a colon in the path from being read as one.
    const int error =
        avio_open2(&bytes, ("file:" + fs::absolute(file).string()).c_str(), AVIO_FLAG_READ, &interrupt, nullptr);
    if (error < 0)
        throwFailure(deadline, error == AVERROR(ENOENT) ? Reason::Missing : Reason::NotOpened);
    return AvOwner<AVIOContext>(bytes);
}

} // namespace

AvOwner<AVFormatContext> openMedia(const fs::path& file, const Deadline& deadline)
{
    requireRegularFile(file);
    // What the libraries write to the terminal is of no use to anybody.
    av_log_set_level(AV_LOG_QUIET);
    // The libraries ask for a pointer to what may change.
    const AVIOInterruptCB interrupt{[](void* until) { return isOver(*static_cast<const Deadline*>(until)) ? 1 : 0; },
                                    const_cast<Deadline*>(&deadline)};
    auto bytes = openBytes(file, interrupt, deadline);
    AVFormatContext* format = owned(avformat_alloc_context()).release();
    format->interrupt_callback = interrupt;
    format->pb = bytes.get();
    AVDictionary* options = nullptr;
    // A play list would open other files, and might wait for them. Of the name only the extension helps to tell the kind.
    av_dict_set(&options, "protocol_whitelist", "none", 0);
    const int error = avformat_open_input(&format, ("video" + file.extension().string()).c_str(), nullptr, &options);
    av_dict_free(&options);
    // What fails to open is freed, without what it reads from.
    if (error < 0)
        throwFailure(deadline, Reason::Unreadable);
    static_cast<void>(bytes.release());
    return AvOwner<AVFormatContext>(format);
}

void throwFailure(Deadline deadline, VideoError::Reason reason)
{
    throw VideoError(isOver(deadline) ? Reason::TooSlow : reason);
}

} // namespace standin
