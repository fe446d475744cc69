// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/Av.h"
#include "standin/video/VideoError.h"

#include <filesystem>

namespace standin {

/// Opens a regular file of this machine, and nothing that it may refer to elsewhere. What reads from it gives up at the
/// deadline, which outlives it and may be changed meanwhile. Throws VideoError.
AvOwner<AVFormatContext> openMedia(const std::filesystem::path& file, const Deadline& deadline);

/// Throws what a failure of the libraries means: TooSlow after the deadline, else the reason. A lack of memory is no reason of
/// its own, since broken files ask for any amount.
[[noreturn]] void throwFailure(Deadline deadline, VideoError::Reason reason);

} // namespace standin
