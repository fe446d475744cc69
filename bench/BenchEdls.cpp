// SPDX-License-Identifier: GPL-3.0-or-later

#include "bench/BenchEdls.h"

#include <algorithm>
#include <cstdio>
#include <fstream>
#include <stdexcept>

namespace cadrel::bench {

namespace {

constexpr std::uint32_t FramesPerSecond = 24;
constexpr std::size_t ShotsInAScene = 50;
constexpr std::size_t RollsInAScene = 10;

std::uint32_t lengthOf(std::size_t index, std::size_t shotCount)
{
    // 12 to 27 frames; a day of 2073600 frames holds 100,000 such shots, but a million only of two frames each.
    if (shotCount > 100'000)
        return 2;
    return 12 + static_cast<std::uint32_t>(index * 7 % 16);
}

std::string timecode(std::uint32_t frameCount)
{
    const std::uint32_t seconds = frameCount / FramesPerSecond;
    char text[32];
    std::snprintf(text, sizeof text, "%02u:%02u:%02u:%02u", seconds / 3600, seconds / 60 % 60, seconds % 60,
                  frameCount % FramesPerSecond);
    return text;
}

} // namespace

Cut makeCut(std::size_t shotCount)
{
    Cut cut;
    cut.reserve(shotCount);
    for (std::size_t i = 0; i < shotCount; ++i) {
        const std::size_t scene = i / ShotsInAScene;
        const std::size_t inScene = i % ShotsInAScene;
        const std::size_t roll = scene * RollsInAScene + inScene * 7 % RollsInAScene;
        const std::size_t use = inScene / RollsInAScene;
        // Two seconds from use to use, more than the longest shot, so that no material stands twice.
        cut.push_back(
            {static_cast<std::uint32_t>(roll), static_cast<std::uint32_t>(86'400 + use * 48), lengthOf(i, shotCount)});
    }
    return cut;
}

Cut recut(const Cut& cut, std::size_t changeCount)
{
    const std::size_t spacing = cut.size() / changeCount;
    Cut result;
    result.reserve(cut.size() + changeCount);
    for (std::size_t change = 0; change < changeCount; ++change) {
        const auto from = cut.begin() + static_cast<std::ptrdiff_t>(change * spacing);
        const std::size_t place = result.size() + spacing / 2;
        result.insert(result.end(), from, from + static_cast<std::ptrdiff_t>(spacing));
        const auto changed = result.begin() + static_cast<std::ptrdiff_t>(place);
        switch (change % 4) {
        case 0:
            changed->length -= 3;
            break;
        case 1:
            result.erase(changed);
            break;
        case 2:
            result.insert(changed, {static_cast<std::uint32_t>(cut.size() + change), 86'400, 20});
            break;
        default:
            std::rotate(changed, changed + 1, changed + 3);
        }
    }
    return result;
}

void writeEdl(const std::filesystem::path& path, const Cut& cut)
{
    std::ofstream file(path, std::ios::binary);
    file << "TITLE: BENCH\nFCM: NON-DROP FRAME\n";
    std::uint32_t programme = 0;
    std::size_t number = 0;
    for (const Shot& shot : cut) {
        char roll[40];
        std::snprintf(roll, sizeof roll, "A%03uC%03u_250311_R2KD", shot.roll / 1000, shot.roll % 1000);
        char line[256];
        std::snprintf(line, sizeof line, "%06zu  %-32s V     C        %s %s %s %s\n", ++number, roll,
                      timecode(shot.srcIn).c_str(), timecode(shot.srcIn + shot.length).c_str(),
                      timecode(programme).c_str(), timecode(programme + shot.length).c_str());
        file << line << "* FROM CLIP NAME: SC" << shot.roll / RollsInAScene << "_TK" << shot.roll % RollsInAScene
             << "\n* SOURCE FILE: " << roll << '\n';
        programme += shot.length;
    }
    file.close();
    if (!file)
        throw std::runtime_error("Cannot write " + path.string());
}

} // namespace cadrel::bench
