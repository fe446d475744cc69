// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/core/TreeEdls.h"

#include "core/fileio/CmxParser.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"
#include "util/Result.h"

#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <stdexcept>

namespace cadrel::tests {

namespace {

namespace fs = std::filesystem;

constexpr std::int32_t DropFrame = 1;
/// Of an EDL that shows no rate.
constexpr std::int32_t FilmRate = 24;

void require(util::Result::Type result, const std::string& path)
{
    if (result != util::Result::Ok)
        throw std::runtime_error("can't read " + path);
}

} // namespace

std::vector<std::string> treeEdls()
{
    const fs::path root = treePath("");
    std::vector<std::string> paths;
    for (const char* const folder : {"examples", "tests/data/edl"}) {
        for (const auto& entry : fs::recursive_directory_iterator(root / folder)) {
            if (entry.path().extension() == ".edl")
                paths.push_back(entry.path().lexically_relative(root).string());
        }
    }
    std::ranges::sort(paths);
    return paths;
}

TreeEdl::TreeEdl(const std::string& path, bool acceptAudio)
{
    const std::wstring file = widePath(treePath(path));
    core::Framerate shown;
    require(core::fileio::CmxParser().detect(file, shown), path);
    m_project.framerate = core::Framerate(shown.framesPerSecond == 0 ? FilmRate : shown.framesPerSecond,
                                          shown.dropFrame == DropFrame ? DropFrame : 0);
    require(core::fileio::CmxParser().parse(file, m_events, shown, acceptAudio), path);
}

} // namespace cadrel::tests
