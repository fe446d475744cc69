// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "examples/burnin/BurntInFrame.h"

#include <cstdio>
#include <filesystem>
#include <string>

namespace cadrel::examples {

/// A video that the program `ffmpeg` makes of frames. All operations throw std::runtime_error when it can't.
class VideoEncoding {
public:
    /// `rate` is a fraction as ffmpeg reads it, such as "24000/1001". `options` go to the command as they are, after the input
    /// and before the file, which it replaces.
    VideoEncoding(const std::filesystem::path& file, int width, int height, const std::string& rate,
                  const std::string& options);
    VideoEncoding(const VideoEncoding&) = delete;
    VideoEncoding& operator=(const VideoEncoding&) = delete;
    ~VideoEncoding();

    void add(const BurntInFrame& frame);
    /// Waits for the file to be whole.
    void finish();

private:
    std::filesystem::path m_file;
    std::FILE* m_pipe;
};

/// The argument as a shell takes it for one word.
std::string shellWord(const std::string& argument);

} // namespace cadrel::examples
