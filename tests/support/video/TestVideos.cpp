// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/video/TestVideos.h"

#include "examples/burnin/VideoEncoding.h"
#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <chrono>
#include <cmath>
#include <cstdlib>
#include <functional>
#include <stdexcept>
#include <string>

#include <unistd.h>

namespace standin::tests {

namespace fs = std::filesystem;

using cadrel::examples::BurntInFrame;
using cadrel::examples::VideoEncoding;

namespace {

/// What a change of the way videos are made raises, so that those of earlier builds aren't used.
constexpr int RecipeVersion = 1;
constexpr int BytesPerPixel = 4;

/// "01:00:12:07", without drop-frame.
std::string timecodeOf(int frame, int framesPerSecond)
{
    const int seconds = frame / framesPerSecond;
    std::string timecode = "01";
    for (const int part : {seconds / 60, seconds % 60, frame % framesPerSecond})
        timecode.append(":").append(std::to_string(100 + part), 1);
    return timecode;
}

void make(const fs::path& file, const VideoRecipe& recipe)
{
    VideoEncoding encoding(file, recipe.width, recipe.height, recipe.rate, recipe.options);
    BurntInFrame frame(recipe.width, recipe.height);
    const int nominal =
        static_cast<int>(std::lround(std::stod(recipe.rate) / (recipe.rate.ends_with("/1001") ? 1000 : 1)));
    for (int number = 0; number < recipe.frames; ++number) {
        frame.fill(cadrel::examples::colourOf(static_cast<std::size_t>(number / 48)));
        frame.write(1, recipe.name);
        frame.write(3, timecodeOf(number, nominal));
        frame.drawBars(static_cast<std::uint16_t>(number));
        encoding.add(frame);
    }
    encoding.finish();
}

/// The file of that name that was made of what `whole` tells, made now if it isn't there.
fs::path kept(const std::string& whole, const std::string& name, const std::function<void(const fs::path&)>& makeFile)
{
    const fs::path folder = fs::path(cadrel::tests::programPath("../test-videos")).lexically_normal();
    fs::create_directories(folder);
    const fs::path file = folder / (std::to_string(std::hash<std::string>()(whole)) + "-" + name);
    if (fs::exists(file))
        return file;
    // Another test may make it at the same time: whoever comes last replaces it with the same.
    const fs::path unfinished = folder / (std::to_string(getpid()) + "-" + file.filename().string());
    makeFile(unfinished);
    fs::rename(unfinished, file);
    return file;
}

} // namespace

fs::path videoOf(const VideoRecipe& recipe)
{
    const std::string whole = recipe.options + '\n' + recipe.rate + '\n' + std::to_string(recipe.frames) + '\n' +
                              std::to_string(recipe.width) + 'x' + std::to_string(recipe.height) + '\n' +
                              std::to_string(RecipeVersion);
    return kept(whole, recipe.name, [&recipe](const fs::path& file) { make(file, recipe); });
}

fs::path reel3VideoOf(const std::string& cut)
{
    const std::string program = cadrel::tests::programPath("render_reel3");
    const std::string edl = cadrel::tests::treePath("examples/reel3/reel3_" + cut + ".edl");
    const auto render = [&](const fs::path& file) {
        std::string command;
        for (const std::string& word : {program, edl, file.string()})
            command += cadrel::examples::shellWord(word) + " ";
        if (std::system(command.c_str()) != 0)
            throw std::runtime_error("can't render " + edl);
    };
    return kept(cadrel::tests::contentOf(program) + cadrel::tests::contentOf(edl), "LW_R3_" + cut + ".mov", render);
}

int numberIn(const Picture& picture)
{
    constexpr int Dark = 64;
    constexpr int Bright = 192;
    if (picture.pixels.empty())
        return -1;
    const int y = static_cast<int>(picture.size.height * (1.0 + BurntInFrame::BarsTop) / 2.0);
    int number = 0;
    for (int bar = 0; bar < BurntInFrame::Bars; ++bar) {
        const int x = (2 * bar + 1) * picture.size.width / (2 * BurntInFrame::Bars);
        const int green = picture.pixels[static_cast<std::size_t>((y * picture.size.width + x) * BytesPerPixel + 1)];
        if (green > Dark && green < Bright)
            return -1;
        number = 2 * number + (green >= Bright ? 1 : 0);
    }
    return number;
}

Deadline inGoodTime()
{
    return std::chrono::steady_clock::now() + std::chrono::minutes(2);
}

} // namespace standin::tests
