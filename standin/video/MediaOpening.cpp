// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/MediaOpening.h"

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
    if (!fs::exists(status))
        throw VideoError(Reason::Missing);
    // The reader would wait for what comes through a pipe or a device.
    if (!fs::is_regular_file(status))
        throw VideoError(Reason::Broken);
}

} // namespace

AvOwner<AVFormatContext> openMedia(const fs::path& file, const Deadline& deadline)
{
    requireRegularFile(file);
    // What the libraries write to the terminal is of no use to anybody.
    av_log_set_level(AV_LOG_QUIET);
    AVFormatContext* format = owned(avformat_alloc_context()).release();
    // The libraries ask for a pointer to what may change.
    format->interrupt_callback = {[](void* until) { return isOver(*static_cast<const Deadline*>(until)) ? 1 : 0; },
                                  const_cast<Deadline*>(&deadline)};
    AVDictionary* options = nullptr;
    av_dict_set(&options, "protocol_whitelist", "file", 0);
    // The name of the protocol keeps a colon in the path from being read as one. What fails to open is freed.
    const int error = avformat_open_input(&format, ("file:" + fs::absolute(file).string()).c_str(), nullptr, &options);
    av_dict_free(&options);
    if (error < 0)
        throwFailure(deadline);
    return AvOwner<AVFormatContext>(format);
}

void throwFailure(Deadline deadline)
{
    throw VideoError(isOver(deadline) ? Reason::TooSlow : Reason::Broken);
}

} // namespace standin
