// SPDX-License-Identifier: GPL-3.0-or-later

// The reader of videos on any bytes: it answers a picture or a reason, and in time.

#include "fuzz/Check.h"
#include "standin/video/VideoError.h"
#include "standin/video/VideoFile.h"

#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <string>

#include <sys/mman.h>
#include <unistd.h>

namespace {

using namespace standin;
using cadrel::fuzz::check;

constexpr PictureSize Box{64, 48};

/// A file that is nowhere but in memory.
class MemoryFile {
public:
    MemoryFile(const std::uint8_t* data, std::size_t size) : m_file(memfd_create("input", 0))
    {
        check(m_file >= 0 && write(m_file, data, size) == static_cast<ssize_t>(size), "the input is a file");
    }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;
    ~MemoryFile() { close(m_file); }

    std::string path() const { return "/proc/self/fd/" + std::to_string(m_file); }

private:
    int m_file;
};

Deadline soon()
{
    return std::chrono::steady_clock::now() + std::chrono::milliseconds(500);
}

void look(VideoFile& file, std::uint32_t frame)
{
    try {
        const Picture picture = file.picture(frame, {24, 1}, Box, soon());
        check(picture.size.width >= 1 && picture.size.width <= Box.width,
              "a picture is as wide as the box at the most");
        check(picture.size.height >= 1 && picture.size.height <= Box.height, "and as high");
        check(picture.pixels.size() == static_cast<std::size_t>(picture.size.width * picture.size.height) * 4,
              "it has all its pixels");
    } catch (const VideoError& error) {
        check(*error.what() != '\0', "a reason is told");
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const MemoryFile bytes(data, size);
    try {
        VideoFile file(bytes.path(), soon());
        const std::uint32_t count = file.frameCount({24, 1});
        check(count > 0, "a video has a frame");
        // Far from each other, step by step to the front, and past the end.
        for (const std::uint32_t frame :
             {count - 1, 0U, count / 2, std::max(count / 2, 1U) - 1, std::max(count / 2, 2U) - 2, count})
            look(file, frame);
    } catch (const VideoError& error) {
        check(*error.what() != '\0', "a reason is told");
    }
    return 0;
}
