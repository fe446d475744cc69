// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/module/ModuleLoader.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/MediaClip.h"

#include "tests/host/plugin/WatchedPictures.h"
#include "tests/support/ThisProcess.h"
#include "tests/support/TreePaths.h"
#include "tests/support/standin/TestHost.h"
#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <memory>
#include <set>
#include <string>
#include <thread>

#include <sys/syscall.h>
#include <unistd.h>

using namespace Velmark;
using cadrel::tests::isMapped;

namespace fs = std::filesystem;

namespace {

std::atomic<bool> isHeld = false;
std::atomic<bool> isReleased = false;

/// On the thread that gets the signal: what it is at goes on when the test says so.
void hold(int)
{
    isHeld = true;
    while (!isReleased)
        usleep(1000);
}

bool isTrueInTime(const std::function<bool()>& condition)
{
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(10);
    while (!condition() && std::chrono::steady_clock::now() < end)
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    return condition();
}

std::set<pid_t> threads()
{
    std::set<pid_t> ids;
    for (const auto& task : fs::directory_iterator("/proc/self/task"))
        ids.insert(static_cast<pid_t>(std::stol(task.path().filename())));
    return ids;
}

/// Ends the process: 0 when the module has stayed for a thread that had to be left, and that thread has come to its end.
[[noreturn]] void leaveAThreadAlone()
{
    const cadrel::tests::VirtualScreen screen;
    standin::tests::TestHost host;
    host.setClock(0.0);
    const auto picture = host.addClip(host.addTrack(TypeWord::Video, u"Picture"), u"Reel", 0.0, 10.0);
    dynamic_cast<standin::ClipEvent&>(*picture).setClip(
        Counted<standin::MediaClip>::share(&host.addVideo(u"/video/reel.mov", 10.0)));
    auto loader = std::make_unique<standin::ModuleLoader>(
        host.application, cadrel::tests::programPath("../lib/Cadrel.so"), cadrel::tests::treePath("resources"));
    auto pictures = cadrel::tests::picturesOf(host.application);
    if (!pictures)
        _exit(2);
    const std::set<pid_t> before = threads();
    {
        const cadrel::tests::PictureWatch window(*pictures);
        pictures->setImageSize(16, 9);
        host.application.idle();
    }
    pictures.reset();
    // The old picture alone is there, and has a thread of its own.
    const std::set<pid_t> after = threads();
    if (after.size() != before.size() + 1)
        _exit(3);
    const pid_t drawing = *std::ranges::find_if(after, [&](pid_t id) { return !before.contains(id); });

    std::signal(SIGUSR1, hold);
    syscall(SYS_tgkill, getpid(), drawing, SIGUSR1);
    if (!isTrueInTime([] { return isHeld.load(); }))
        _exit(4);
    loader.reset();
    if (!isMapped("Cadrel.so"))
        _exit(5);
    isReleased = true;
    _exit(isTrueInTime([=] { return !threads().contains(drawing); }) ? 0 : 6);
}

} // namespace

TEST(LeftThread, KeepsTheModuleInMemoryUntilTheProcessEnds)
{
    EXPECT_EXIT(leaveAThreadAlone(), testing::ExitedWithCode(0), "");
}
