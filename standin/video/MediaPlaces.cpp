// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/MediaPlaces.h"

#include "standin/base/Utf16.h"
#include "standin/video/VideoError.h"

#include <algorithm>
#include <string>
#include <system_error>

namespace standin {

namespace fs = std::filesystem;

std::vector<fs::path> placesOf(const MediaReference& file)
{
    const std::string path = toUtf8(file.path);
    const fs::path folder = fs::path(toUtf8(file.projectFile)).parent_path();
    // Joined to the folder, an absolute path stays as it is.
    std::vector<fs::path> places{(folder / path).lexically_normal()};
    // A path of another system may have the other slashes.
    const std::string name = path.substr(path.find_last_of("/\\") + 1);
    const fs::path beside = (folder / name).lexically_normal();
    if (!folder.empty() && !name.empty() && beside != places.front())
        places.push_back(beside);
    return places;
}

fs::path findMedia(const std::vector<fs::path>& places)
{
    const auto found = std::find_if(places.begin(), places.end(), [](const fs::path& place) {
        std::error_code error;
        return fs::exists(place, error);
    });
    if (found == places.end())
        throw VideoError(VideoError::Reason::Missing);
    return *found;
}

} // namespace standin
