// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/FileReplacement.h"

#include "tests/support/ChildProcess.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/NoPrivileges.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <fcntl.h>
#include <filesystem>
#include <set>
#include <string>
#include <sys/stat.h>
#include <sys/syscall.h>
#include <unistd.h>
#include <vector>

namespace cadrel::tests {
namespace {

namespace fs = std::filesystem;

using util::FileReplacement;
using util::Result;

using Names = std::vector<std::string>;

void replace(const fs::path& target, std::string_view text)
{
    FileReplacement file(target);
    file.write(text);
    file.commit();
}

Result::Type resultOfReplacing(const fs::path& target)
{
    return thrownBy([&] { replace(target, "new"); });
}

TEST(FileReplacement, MakesANewFile)
{
    const TempFolder folder;

    replace(folder / "a.txt", "text\n");

    EXPECT_EQ(contentOf(folder / "a.txt"), "text\n");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, LeavesTheFormerFileUntilItIsCommitted)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    FileReplacement file(path);
    file.write("new ");
    file.write("text");
    file.finish();
    EXPECT_EQ(contentOf(path), "former");

    file.commit();

    EXPECT_EQ(contentOf(path), "new text");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, LeavesNothingBehindWhenItIsDropped)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");

    FileReplacement(path).write("new");
    FileReplacement(folder / "b.txt").write("new");

    EXPECT_EQ(contentOf(path), "former");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

/// What another program can do to a file that was there before, or to its name.
enum class Meanwhile { Longer, Rewritten, OtherFile, Removed };

TEST(FileReplacement, RefusesATargetThatAnotherProgramHasWrittenSince)
{
    for (const Meanwhile meanwhile :
         {Meanwhile::Longer, Meanwhile::Rewritten, Meanwhile::OtherFile, Meanwhile::Removed}) {
        const TempFolder folder;
        const fs::path path = folder.write("a.txt", "former");
        const auto formerTime = fs::last_write_time(path);
        const util::FileStamp stamp = util::FileStamp::of(path);
        FileReplacement file(path);
        file.write("new");
        if (meanwhile == Meanwhile::Removed)
            fs::remove(path);
        if (meanwhile == Meanwhile::OtherFile)
            fs::rename(folder.write("b.txt", "former"), path);
        if (meanwhile == Meanwhile::Longer)
            folder.write("a.txt", "longer than it was");
        if (meanwhile != Meanwhile::Removed)
            fs::last_write_time(path, meanwhile == Meanwhile::Rewritten ? formerTime + std::chrono::nanoseconds(1)
                                                                        : formerTime);
        const bool exists = fs::exists(path);
        const std::string found = exists ? contentOf(path) : std::string();

        EXPECT_THROW(file.commit(stamp), FileReplacement::TargetChanged) << static_cast<int>(meanwhile);

        EXPECT_EQ(fs::exists(path), exists);
        EXPECT_EQ(exists ? contentOf(path) : std::string(), found);
    }
}

TEST(FileReplacement, RefusesATargetThatHasComeUpSince)
{
    const TempFolder folder;
    const fs::path path = folder / "a.txt";
    const util::FileStamp none = util::FileStamp::of(path);
    EXPECT_FALSE(none.exists);
    FileReplacement file(path);
    file.write("new");
    folder.write("a.txt", "of another program");

    EXPECT_THROW(file.commit(none), FileReplacement::TargetChanged);

    EXPECT_EQ(contentOf(path), "of another program");
}

TEST(FileReplacement, TakesATargetThatIsAsItWasAlsoThroughALink)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    fs::create_symlink("a.txt", folder / "link");
    const util::FileStamp stamp = util::FileStamp::of(folder / "link");
    EXPECT_EQ(stamp, util::FileStamp::of(path));
    // Another name and another right to read it are no saving.
    fs::create_hard_link(path, folder / "second name");
    FileReplacement file(folder / "link");
    file.write("new");

    file.commit(stamp);

    EXPECT_EQ(contentOf(path), "new");
    EXPECT_EQ(contentOf(folder / "second name"), "former");
}

TEST(FileReplacement, KeepsThePermissionsOfTheFormerFile)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    const fs::perms ownerAndGroup = fs::perms::owner_read | fs::perms::owner_write | fs::perms::group_read;
    fs::permissions(path, ownerAndGroup);

    replace(path, "new");

    EXPECT_EQ(fs::status(path).permissions(), ownerAndGroup);
}

TEST(FileReplacement, TakesANameAsLongAsTheSystemDoes)
{
    const TempFolder folder;
    const std::string name(255, 'n');

    replace(folder / name, "text");

    EXPECT_EQ(folder.names(), Names{name});
}

TEST(FileReplacement, TakesANameWithoutAFolder)
{
    const TempFolder folder;
    const fs::path former = fs::current_path();
    fs::current_path(folder.path());

    const Result::Type result = resultOfReplacing("a.txt");

    fs::current_path(former);
    EXPECT_EQ(result, Result::Ok);
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, ReplacesTheFileBehindALink)
{
    const TempFolder folder;
    fs::create_directory(folder / "reel");
    folder.write("reel/a.txt", "former");
    fs::create_symlink("reel/link.txt", folder / "outer.txt");
    fs::create_symlink("a.txt", folder / "reel/link.txt");

    replace(folder / "outer.txt", "new");

    EXPECT_EQ(contentOf(folder / "reel/a.txt"), "new");
    EXPECT_TRUE(fs::is_symlink(folder / "outer.txt"));
    EXPECT_TRUE(fs::is_symlink(folder / "reel/link.txt"));
}

TEST(FileReplacement, MakesTheFileThatALinkNames)
{
    const TempFolder folder;
    fs::create_symlink(folder / "missing.txt", folder / "link.txt");

    replace(folder / "link.txt", "new");

    EXPECT_EQ(contentOf(folder / "missing.txt"), "new");
    EXPECT_TRUE(fs::is_symlink(folder / "link.txt"));
}

TEST(FileReplacement, RefusesALinkToItself)
{
    const TempFolder folder;
    fs::create_symlink("link.txt", folder / "link.txt");

    EXPECT_EQ(resultOfReplacing(folder / "link.txt"), Result::FileAccessFailed);
    EXPECT_EQ(folder.names(), Names{"link.txt"});
}

TEST(FileReplacement, RefusesWhatNamesNoFile)
{
    const TempFolder folder;
    fs::create_directory(folder / "reel");
    folder.write("a.txt", "former");

    EXPECT_EQ(resultOfReplacing(folder / "reel"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / "reel/"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / "missing/"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / "missing/a.txt"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / "a.txt/"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / "a.txt/b.txt"), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(folder / std::string(256, 'n')), Result::FileAccessFailed);
    EXPECT_EQ(resultOfReplacing(""), Result::FileAccessFailed);
    EXPECT_EQ(folder.names(), (Names{"a.txt", "reel"}));
    EXPECT_EQ(contentOf(folder / "a.txt"), "former");
}

TEST(FileReplacement, RefusesAWriteProtectedFile)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    fs::permissions(path, fs::perms::owner_read | fs::perms::group_read | fs::perms::others_read);
    fs::permissions(folder.path(), fs::perms::all);

    {
        const NoPrivileges user;
        EXPECT_EQ(resultOfReplacing(path), Result::FileAccessFailed);
        EXPECT_EQ(resultOfReplacing(folder / "b.txt"), Result::Ok);
    }

    EXPECT_EQ(contentOf(path), "former");
    EXPECT_EQ(folder.names(), (Names{"a.txt", "b.txt"}));
}

TEST(FileReplacement, RefusesAWriteProtectedFolder)
{
    const TempFolder folder;
    fs::permissions(folder.path(),
                    fs::perms::owner_read | fs::perms::owner_exec | fs::perms::others_read | fs::perms::others_exec);

    Result::Type result = Result::Ok;
    {
        const NoPrivileges user;
        result = resultOfReplacing(folder / "a.txt");
    }

    fs::permissions(folder.path(), fs::perms::owner_all);
    EXPECT_EQ(result, Result::FileAccessFailed);
    EXPECT_TRUE(folder.names().empty());
}

TEST(FileReplacement, WritesADeviceItself)
{
    replace("/dev/null", "text");

    EXPECT_TRUE(fs::is_character_file("/dev/null"));
}

TEST(FileReplacement, ReportsAFullDevice)
{
    FileReplacement file("/dev/full");
    file.write("text");

    EXPECT_EQ(thrownBy([&] { file.finish(); }), Result::FileAccessFailed);
    EXPECT_EQ(thrownBy([&] { file.commit(); }), Result::FileAccessFailed);
    EXPECT_TRUE(fs::is_character_file("/dev/full"));
}

TEST(FileReplacement, WritesAPipeItself)
{
    const TempFolder folder;
    const fs::path path = folder / "pipe";
    ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
    const int reader = open(path.c_str(), O_RDONLY | O_NONBLOCK);

    replace(path, "text");

    std::array<char, 8> bytes{};
    EXPECT_EQ(read(reader, bytes.data(), bytes.size()), 4);
    EXPECT_EQ(std::string(bytes.data()), "text");
    EXPECT_TRUE(fs::is_fifo(path));
    close(reader);
}

TEST(FileReplacement, LeavesTheFormerFileWhenTheDiskIsFull)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    const std::string text(100000, 'x');

    Result::Type result = Result::Ok;
    {
        const FileSizeLimit fullDisk(1000);
        result = thrownBy([&] { replace(path, text); });
    }

    EXPECT_EQ(result, Result::FileAccessFailed);
    EXPECT_EQ(contentOf(path), "former");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, LeavesNothingBehindWhenItsPlaceIsTaken)
{
    const TempFolder folder;
    const fs::path path = folder / "a.txt";

    {
        FileReplacement file(path);
        file.write("text");
        fs::create_directory(path);
        EXPECT_EQ(thrownBy([&] { file.commit(); }), Result::FileAccessFailed);
    }

    EXPECT_EQ(folder.names(), Names{"a.txt"});
    EXPECT_TRUE(fs::is_directory(path));
}

TEST(FileReplacement, KeepsSeveralFilesThatAreAllInPlace)
{
    const TempFolder folder;
    folder.write("a.txt", "former a");

    {
        FileReplacement a(folder / "a.txt");
        FileReplacement b(folder / "b.txt");
        a.write("new a");
        b.write("new b");
        a.putInPlace();
        b.putInPlace();
        EXPECT_EQ(contentOf(folder / "a.txt"), "new a");
        EXPECT_EQ(contentOf(folder / "b.txt"), "new b");
        a.keep();
        b.keep();
    }

    EXPECT_EQ(contentOf(folder / "a.txt"), "new a");
    EXPECT_EQ(contentOf(folder / "b.txt"), "new b");
    EXPECT_EQ(folder.names(), (Names{"a.txt", "b.txt"}));
}

TEST(FileReplacement, TakesFilesBackThatAreNotKept)
{
    const TempFolder folder;
    folder.write("a.txt", "former a");

    {
        FileReplacement a(folder / "a.txt");
        FileReplacement b(folder / "b.txt");
        a.write("new a");
        b.write("new b");
        a.putInPlace();
        b.putInPlace();
    }

    EXPECT_EQ(contentOf(folder / "a.txt"), "former a");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, MovesNoFolderOutOfItsPlace)
{
    const TempFolder folder;
    const fs::path path = folder / "a.txt";

    {
        FileReplacement file(path);
        file.write("text");
        fs::create_directory(path);
        EXPECT_EQ(thrownBy([&] { file.putInPlace(); }), Result::FileAccessFailed);
    }

    EXPECT_EQ(folder.names(), Names{"a.txt"});
    EXPECT_TRUE(fs::is_directory(path));
}

TEST(FileReplacement, PutsAFileInPlaceOnlyWhenAllOfItIsWritten)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");
    FileReplacement file(path);

    Result::Type result = Result::Ok;
    {
        const FileSizeLimit fullDisk(1);
        file.write("new");
        result = thrownBy([&] { file.putInPlace(); });
    }

    EXPECT_EQ(result, Result::FileAccessFailed);
    EXPECT_EQ(contentOf(path), "former");
}

TEST(FileReplacement, IsWholeBeforeOrBehindWhereverItIsKilled)
{
    const std::string text(200000, 'n');
    std::set<std::string> found;
    ChildProcess::Progress progress;
    int step = 0;

    while (!progress.status) {
        const TempFolder folder;
        const fs::path path = folder.write("a.txt", "former");
        progress = ChildProcess::runUnlessKilledAt(++step, [&] { return thrownBy([&] { replace(path, text); }); });
        const std::string content = contentOf(path);
        EXPECT_TRUE(content == (progress.hasRenamed ? text : "former")) << "killed at step " << step;
        found.insert(content);

        replace(path, "later");
        EXPECT_EQ(contentOf(path), "later");
        for (const std::string& name : folder.names())
            EXPECT_TRUE(name == "a.txt" || name.starts_with(".cadrel-")) << name;
    }

    EXPECT_EQ(progress.status, Result::Ok);
    EXPECT_EQ(found, (std::set<std::string>{"former", text}));
}

TEST(FileReplacement, LeavesTheFormerFileWhenTheSystemRefusesACall)
{
    const std::string text(100, 'n');
    std::vector<long> renaming{SYS_renameat, SYS_renameat2};
#ifdef SYS_rename
    renaming.push_back(SYS_rename); // newer kinds of machine have it no more
#endif
    struct {
        std::vector<long> calls;
        int error;
    } const faults[] = {
        {{SYS_openat}, EMFILE}, {{SYS_write}, ENOSPC}, {{SYS_fsync}, EIO}, {{SYS_close}, EDQUOT}, {renaming, EACCES},
    };
    for (const auto& fault : faults) {
        const TempFolder folder;
        const fs::path path = folder.write("a.txt", "former");

        const int status = ChildProcess::statusOf([&] {
            refuseCalls(fault.calls, fault.error);
            return thrownBy([&] { replace(path, text); });
        });

        EXPECT_EQ(status, Result::FileAccessFailed) << std::strerror(fault.error);
        EXPECT_EQ(contentOf(path), "former") << std::strerror(fault.error);
        EXPECT_EQ(folder.names(), Names{"a.txt"}) << std::strerror(fault.error);
    }
}

TEST(FileReplacement, ReportsThatTheNameMayBeLostAgain)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");

    const int status = ChildProcess::statusOf([&] {
        FileReplacement file(path);
        file.write("new");
        file.finish();
        refuseCalls({SYS_fsync}, EIO);
        return thrownBy([&] { file.commit(); });
    });

    EXPECT_EQ(status, Result::FileAccessFailed);
    EXPECT_EQ(contentOf(path), "new");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, TakesAFileBackWhoseNameMayBeLostAgain)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");

    const int status = ChildProcess::statusOf([&] {
        return thrownBy([&] {
            FileReplacement file(path);
            file.write("new");
            file.finish();
            refuseCalls({SYS_fsync}, EIO);
            file.putInPlace();
        });
    });

    EXPECT_EQ(status, Result::FileAccessFailed);
    EXPECT_EQ(contentOf(path), "former");
    EXPECT_EQ(folder.names(), Names{"a.txt"});
}

TEST(FileReplacement, GoesOnWhereADiskKnowsNoWaiting)
{
    const TempFolder folder;
    const fs::path path = folder.write("a.txt", "former");

    const int status = ChildProcess::statusOf([&] {
        refuseCalls({SYS_fsync}, EINVAL);
        return resultOfReplacing(path);
    });

    EXPECT_EQ(status, Result::Ok);
    EXPECT_EQ(contentOf(path), "new");
}

TEST(FileReplacement, IsOnTheDiskWhenItIsFinished)
{
    const TempFolder folder;

    const int status = ChildProcess::statusOf([&] {
        FileReplacement file(folder / "a.txt");
        file.write("new");
        refuseCalls({SYS_fsync}, EIO);
        return thrownBy([&] { file.finish(); });
    });

    EXPECT_EQ(status, Result::FileAccessFailed);
}

TEST(FileReplacement, RefusesToBeWrittenOnceItIsFinished)
{
    const TempFolder folder;
    FileReplacement file(folder / "a.txt");
    file.finish();

    EXPECT_EQ(thrownBy([&] { file.write("more"); }), Result::FileAccessFailed);
}

TEST(FileReplacement, TakesPiecesOfAnySize)
{
    const TempFolder folder;
    std::string text;

    {
        FileReplacement file(folder / "a.txt");
        for (const std::size_t size : {0U, 1U, 65535U, 65536U, 3U, 200000U, 7U}) {
            const std::string piece(size, static_cast<char>('a' + size % 26));
            file.write(piece);
            text += piece;
        }
        file.commit();
    }

    EXPECT_TRUE(contentOf(folder / "a.txt") == text);
}

} // namespace
} // namespace cadrel::tests
