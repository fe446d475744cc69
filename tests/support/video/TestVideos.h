// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/PictureDrawing.h"
#include "standin/video/PictureReader.h"

#include <filesystem>
#include <string>

namespace standin::tests {

/// How a video of frames is made whose bars say their number, which counts from 0.
struct VideoRecipe {
    std::string name; ///< of the file, whose extension says the container
    int frames = 300;
    std::string rate = "24"; ///< as a fraction
    std::string options;     ///< of ffmpeg, for the output
    int width = 320;
    int height = 192;
};

/// The path of the video, which is made when there is none of that recipe yet. It stays in the build folder.
std::filesystem::path videoOf(const VideoRecipe& recipe);

/// A cut of the example reel, "v07" or "v12", rendered as its videos are. It stays in the build folder, too.
std::filesystem::path reel3VideoOf(const std::string& cut);

/// The number that the bars of a picture show; -1 when they aren't black and white, or there is no picture.
int numberIn(const Picture& picture);

/// A later deadline than any test needs.
Deadline inGoodTime();

} // namespace standin::tests
