// SPDX-License-Identifier: GPL-3.0-or-later

// Saving when something goes wrong: whatever happens, and whenever, there is all of the former file or all of the new one.

#include "standin/file/ProjectFile.h"

#include "standin/project/Project.h"
#include "tests/support/ChildProcess.h"
#include "tests/support/FileSizeLimit.h"
#include "tests/support/NoPrivileges.h"
#include "tests/support/TempFolder.h"
#include "tests/support/standin/RandomProject.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <sched.h>
#include <set>
#include <string>
#include <sys/mount.h>
#include <sys/syscall.h>
#include <vector>

using Velmark::Counted;

namespace standin::tests {

namespace {

namespace fs = std::filesystem;

using cadrel::tests::ChildProcess;
using cadrel::tests::contentOf;
using cadrel::tests::FileSizeLimit;
using cadrel::tests::NoPrivileges;
using cadrel::tests::refuseCalls;
using cadrel::tests::TempFolder;

using Names = std::vector<std::string>;

/// A file that holds one project, and another project that is to be saved over it.
class ProjectFileSaving : public testing::Test {
protected:
    ProjectFileSaving()
        : m_former(makeProject(1)), m_new(makeProject(2)), formerText(ProjectFile::toText(*m_former)),
          newText(ProjectFile::toText(*m_new))
    {
        putFormerFile();
    }

    void putFormerFile() const { m_folder.write("reel.stage", formerText); }
    const TempFolder& folder() const { return m_folder; }
    fs::path path() const { return m_folder / "reel.stage"; }
    std::string content() const { return contentOf(path()); }

    const Counted<Project>& newProject() const { return m_new; }
    void save() const { ProjectFile::write(*m_new, path()); }
    /// Empty when it succeeds.
    std::string faultOfSaving(const fs::path& file) const
    {
        try {
            ProjectFile::write(*m_new, file);
            return {};
        } catch (const ProjectFileError& error) {
            return error.what();
        }
    }
    std::string faultOfSaving() const { return faultOfSaving(path()); }
    std::string unwritable(const fs::path& file) const { return file.string() + ": can't be written"; }
    std::string unwritable() const { return unwritable(path()); }

private:
    Counted<Project> makeProject(std::uint64_t seed)
    {
        SeededChance chance(seed);
        return randomProject(chance, m_log, {.clips = 40, .tracks = 12, .events = 30, .points = 20});
    }

    const TempFolder m_folder;
    ChangeLog m_log;
    const Counted<Project> m_former;
    const Counted<Project> m_new;

protected:
    const std::string formerText;
    const std::string newText;
};

TEST_F(ProjectFileSaving, PutsTheNewFileInThePlaceOfTheFormer)
{
    save();

    EXPECT_EQ(content(), newText);
    EXPECT_NE(newText, formerText);
    EXPECT_EQ(folder().names(), Names{"reel.stage"});
}

TEST_F(ProjectFileSaving, RefusesAFileThatAnotherProgramHasSavedSince)
{
    const cadrel::util::FileStamp stamp = cadrel::util::FileStamp::of(path());
    folder().write("other.stage", "of another program");
    fs::rename(folder() / "other.stage", path());

    try {
        ProjectFile::write(*newProject(), path(), stamp);
        FAIL();
    } catch (const ProjectFileChanged& error) {
        EXPECT_EQ(std::string(error.what()), path().string() + ": another program has written it meanwhile");
    }
    EXPECT_EQ(content(), "of another program");
    EXPECT_EQ(folder().names(), Names{"reel.stage"});
    ProjectFile::write(*newProject(), path(), cadrel::util::FileStamp::of(path()));
    EXPECT_EQ(content(), newText);
}

TEST_F(ProjectFileSaving, LeavesOneWholeFileWhereverItIsKilled)
{
    std::set<std::string> found;
    ChildProcess::Progress progress;
    for (int step = 1; !progress.status; ++step) {
        putFormerFile();

        progress = ChildProcess::runUnlessKilledAt(step, [&] { return save(), 0; });

        const std::string left = content();
        EXPECT_TRUE(left == (progress.hasRenamed ? newText : formerText)) << "killed at step " << step;
        found.insert(left);
    }

    EXPECT_EQ(progress.status, 0);
    EXPECT_EQ(found, (std::set<std::string>{formerText, newText}));
}

TEST_F(ProjectFileSaving, SucceedsAmongWhatEarlierOnesLeftBehindWhenTheyWereKilled)
{
    for (int step = 1; !ChildProcess::runUnlessKilledAt(step, [&] { return save(), 0; }).status; ++step)
        putFormerFile();
    ASSERT_GT(folder().names().size(), 1U);
    putFormerFile();
    const Names before = folder().names();

    save();

    EXPECT_EQ(content(), newText);
    EXPECT_EQ(folder().names(), before);
}

TEST_F(ProjectFileSaving, LeavesTheFormerFileWhereverTheDiskGetsFull)
{
    for (std::size_t size = 0; size < newText.size(); size += newText.size() / 20 + 1) {
        const FileSizeLimit fullDisk(size);

        EXPECT_EQ(faultOfSaving(), unwritable());

        EXPECT_EQ(content(), formerText) << size;
        EXPECT_EQ(folder().names(), Names{"reel.stage"}) << size;
    }
    const FileSizeLimit roomyDisk(newText.size());
    EXPECT_EQ(faultOfSaving(), "");
    EXPECT_EQ(content(), newText);
}

TEST_F(ProjectFileSaving, LeavesTheFormerFileOnASmallDisk)
{
    constexpr int NoDisk = 77;
    const std::string options = "size=" + std::to_string(formerText.size() + 8192);
    const fs::path file = folder() / "disk/reel.stage";
    fs::create_directory(folder() / "disk");

    const int status = ChildProcess::statusOf([&] {
        // In a process of its own, a disk is seen by nobody else and goes with it.
        if ((unshare(CLONE_NEWNS) != 0 && unshare(CLONE_NEWUSER | CLONE_NEWNS) != 0) ||
            mount(nullptr, "/", nullptr, MS_REC | MS_PRIVATE, nullptr) != 0 ||
            mount("tmpfs", (folder() / "disk").c_str(), "tmpfs", 0, options.c_str()) != 0)
            return NoDisk;
        cadrel::tests::writeFile(file, formerText);
        const bool isRefused = faultOfSaving(file) == unwritable(file);
        const bool isFormer = contentOf(file) == formerText;
        const auto files = std::distance(fs::directory_iterator(folder() / "disk"), fs::directory_iterator());
        return isRefused && isFormer && files == 1 ? 0 : 1;
    });

    if (status == NoDisk)
        GTEST_SKIP() << "this system lets nobody make a small disk";
    EXPECT_EQ(status, 0);
}

TEST_F(ProjectFileSaving, LeavesTheFormerFileWhenTheSystemRefusesACall)
{
    std::vector<long> renaming{SYS_renameat, SYS_renameat2};
#ifdef SYS_rename
    renaming.push_back(SYS_rename); // newer kinds of machine have it no more
#endif
    const struct {
        std::vector<long> calls;
        int error;
    } faults[] = {
        {{SYS_openat}, EMFILE}, {{SYS_write}, ENOSPC}, {{SYS_write}, EIO},
        {{SYS_fsync}, EIO},     {{SYS_close}, EDQUOT}, {renaming, EPERM},
    };
    for (const auto& fault : faults) {
        const int status = ChildProcess::statusOf([&] {
            refuseCalls(fault.calls, fault.error);
            return faultOfSaving() == unwritable() ? 0 : 1;
        });

        EXPECT_EQ(status, 0) << std::strerror(fault.error);
        EXPECT_EQ(content(), formerText) << std::strerror(fault.error);
        EXPECT_EQ(folder().names(), Names{"reel.stage"}) << std::strerror(fault.error);
    }
}

TEST_F(ProjectFileSaving, LeavesTheFormerFileInAWriteProtectedFolder)
{
    fs::permissions(path(), fs::perms::all);
    fs::permissions(folder().path(),
                    fs::perms::owner_read | fs::perms::owner_exec | fs::perms::others_read | fs::perms::others_exec);

    std::string fault;
    {
        const NoPrivileges user;
        fault = faultOfSaving();
    }

    fs::permissions(folder().path(), fs::perms::owner_all);
    EXPECT_EQ(fault, unwritable());
    EXPECT_EQ(content(), formerText);
    EXPECT_EQ(folder().names(), Names{"reel.stage"});
}

TEST_F(ProjectFileSaving, RefusesAFolderAndAPlaceThatIsNotThere)
{
    fs::create_directory(folder() / "folder");

    EXPECT_EQ(faultOfSaving(folder() / "folder"), unwritable(folder() / "folder"));
    EXPECT_EQ(faultOfSaving(folder() / "no/reel.stage"), unwritable(folder() / "no/reel.stage"));
    EXPECT_EQ(faultOfSaving(""), ": can't be written");
    EXPECT_EQ(folder().names(), (Names{"folder", "reel.stage"}));
}

TEST_F(ProjectFileSaving, LeavesTheFormerFileWhenTheProjectCannotBeStored)
{
    ChangeLog log;
    const auto project = Velmark::makeCounted<Project>(log);
    project->setFrameRate({-1.0, 0});

    std::string fault;
    try {
        ProjectFile::write(*project, path());
    } catch (const ProjectFileError& error) {
        fault = error.what();
    }

    EXPECT_EQ(fault, path().string() + ": this project can't be stored: framesPerSecond: a number out of its bounds");
    EXPECT_EQ(content(), formerText);
}

} // namespace

} // namespace standin::tests
