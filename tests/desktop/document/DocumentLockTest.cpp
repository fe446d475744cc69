// SPDX-License-Identifier: GPL-3.0-or-later

// Locks on disks that know none, and lock files that somebody has removed.

#include "desktop/document/DocumentLock.h"

#include "tests/desktop/document/DocumentHost.h"

#include <cerrno>
#include <sys/file.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace {

/// What the disk answers to whoever wants to lock a file; 0 where it locks it.
int refusal = 0;

} // namespace

/// In place of the system's, for all of this program.
extern "C" int flock(int descriptor, int operation) noexcept
{
    if (refusal == 0)
        return static_cast<int>(::syscall(SYS_flock, descriptor, operation));
    errno = refusal;
    return -1;
}

namespace desktop::tests {

namespace fs = std::filesystem;

/// Each test with one of the answers of disks without locks.
class DiskWithoutLocks : public testing::TestWithParam<int>, protected DocumentHost {
protected:
    DiskWithoutLocks() { refusal = GetParam(); }
    ~DiskWithoutLocks() override { refusal = 0; }

    fs::path file = fs::canonical(writeProject("reel3.stage"));
};

INSTANTIATE_TEST_SUITE_P(Answers, DiskWithoutLocks, testing::Values(ENOLCK, EOPNOTSUPP, EINVAL, ENOSYS));

TEST_P(DiskWithoutLocks, GetsNoLockFile)
{
    const DocumentLock lock(file);

    EXPECT_FALSE(lock.isHeld());
    EXPECT_FALSE(lock.holder());
    EXPECT_TRUE(lock.isOurs());
    EXPECT_FALSE(DocumentLock::holderOf(file));
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"reel3.stage"}));
}

TEST_P(DiskWithoutLocks, KeepsALockFileThatAnotherMachineHasLeft)
{
    writeFile(DocumentLock::pathFor(file), "12 other\n");
    {
        const DocumentLock lock(file);
        EXPECT_TRUE(lock.isOurs());
    }
    EXPECT_EQ(contentOf(DocumentLock::pathFor(file)), "12 other\n");
}

TEST_P(DiskWithoutLocks, KeepsUnsavedWorkAllTheSame)
{
    OpenDocument& document = documents.open(file);
    EXPECT_EQ(document.autosaveFault(), "");
    renameTrack(document, u"FX 1");
    idle();
    EXPECT_EQ(document.autosaveFault(), "");
    const std::string left = contentOf(Autosave::pathFor(file));
    documents.close(document);
    EXPECT_EQ(folder.names(), (std::vector<std::string>{"reel3.stage"}));

    writeFile(Autosave::pathFor(file), left);
    ASSERT_TRUE(documents.look(file).unsavedWork);
    EXPECT_EQ(trackOf(documents.open(file, Work::Recover)).name(), u"FX 1");
}

class DocumentLockTest : public DocumentTest {
protected:
    fs::path file = fs::canonical(writeProject("reel3.stage"));
    fs::path lockFile = DocumentLock::pathFor(file);
};

TEST_F(DocumentLockTest, IsOursOnlyWhereItIsHeld)
{
    const DocumentLock first(file);
    const DocumentLock second(file);

    EXPECT_TRUE(first.isOurs());
    EXPECT_FALSE(second.isOurs());
    EXPECT_FALSE(DocumentLock().isOurs());
    EXPECT_FALSE(DocumentLock(folder / "nowhere" / "reel3.stage").isOurs());
}

TEST_F(DocumentLockTest, TellsOfAFolderThatTakesNoAutosave)
{
    fs::create_directory(lockFile);
    EXPECT_EQ(documents.open(file).autosaveFault(),
              file.parent_path().string() + ": no autosave can be written into this folder");
}

TEST_F(DocumentLockTest, LeavesTheLockFileThatAnotherProgramHasMadeInItsPlace)
{
    auto first = std::make_unique<DocumentLock>(file);
    fs::remove(lockFile);
    const DocumentLock second(file);
    ASSERT_TRUE(second.isHeld());

    first.reset();

    EXPECT_TRUE(fs::exists(lockFile));
    EXPECT_TRUE(DocumentLock(file).holder()) << "A third one would get the lock, too.";
}

TEST_F(DocumentLockTest, GoesWithItsFileWhereSomebodyHasRemovedThat)
{
    auto lock = std::make_unique<DocumentLock>(file);
    fs::remove(lockFile);
    lock.reset();
    EXPECT_FALSE(fs::exists(lockFile));
    EXPECT_TRUE(DocumentLock(file).isHeld());
}

} // namespace desktop::tests
