// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/VideoSupport.h"
#include "util/FileStamp.h"

#include <filesystem>
#include <map>

namespace standin {

/// Lets a host open video files:
///
///     Videos videos;
///     Application application(terminal, &videos);
class Videos : public VideoSupport {
public:
    /// A file that couldn't be used isn't opened again until it changes.
    std::optional<Video> probe(const MediaReference& file, double projectFramesPerSecond) override;
    Velmark::Counted<Velmark::FObject> createThumbnailFactory() override;

private:
    std::map<std::filesystem::path, cadrel::util::FileStamp> m_refused;
};

} // namespace standin
