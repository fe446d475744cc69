// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/VideoError.h"

#include <filesystem>

namespace standin {

/// What a file of sound is.
struct SoundFile {
    int samplesPerSecond = 0;
    double seconds = 0.0;

    /// Throws VideoError.
    static SoundFile read(const std::filesystem::path& file, Deadline deadline);
};

} // namespace standin
