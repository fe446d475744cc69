// SPDX-License-Identifier: GPL-3.0-or-later

#include "util/FileReplacement.h"

#include "util/FilePath.h"
#include "util/Result.h"

#include <cerrno>
#include <fcntl.h>
#include <random>
#include <system_error>
#include <unistd.h>
#include <utility>

namespace cadrel::util {

namespace fs = std::filesystem;

namespace {

/// Content is collected up to so many bytes before it is written.
constexpr std::size_t WellFilled = 1 << 16;
constexpr mode_t ReadableAndWritable = 0666; // less what the user's mask takes away

/// A hidden name in the same folder. It doesn't hold the target's name, which may be as long as a name can be.
fs::path unusedNameBeside(const fs::path& target)
{
    static constexpr char Digits[] = "0123456789abcdef";
    std::random_device random;
    fs::path path;
    std::error_code error;
    do {
        std::string name = ".cadrel-";
        for (int count = 0; count < 16; ++count)
            name += Digits[random() % 16];
        path = target.parent_path() / name;
    } while (fs::exists(fs::symlink_status(path, error)));
    return path;
}

bool isWritable(const fs::path& file)
{
    const int descriptor = ::open(file.c_str(), O_WRONLY | O_CLOEXEC);
    if (descriptor < 0)
        return false;
    ::close(descriptor);
    return true;
}

/// Waits until a file or folder is on the disk as it is now. Some disks don't support this; then there is nothing to
/// wait for.
bool waitForDisk(int descriptor)
{
    int result = 0;
    do
        result = ::fsync(descriptor);
    while (result != 0 && errno == EINTR);
    return result == 0 || errno == EINVAL || errno == ENOTSUP || errno == ENOSYS;
}

/// The same for the names in a folder. Does nothing for a folder that can't be read.
void syncFolderOf(const fs::path& file)
{
    const fs::path folder = file.has_parent_path() ? file.parent_path() : fs::path(".");
    const int descriptor = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (descriptor < 0)
        return;
    const bool isOnDisk = waitForDisk(descriptor);
    ::close(descriptor);
    if (!isOnDisk)
        throw Result::FileAccessFailed;
}

} // namespace

FileReplacement::FileReplacement(const fs::path& target)
{
    std::error_code error;
    const fs::file_type type = fs::status(target, error).type();
    if (type == fs::file_type::regular || type == fs::file_type::not_found) {
        m_target = followLinks(target);
        if (!m_target.has_filename() || (type == fs::file_type::regular && !isWritable(m_target)))
            throw Result::FileAccessFailed;
        openBeside();
    } else {
        m_descriptor = ::open(target.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, ReadableAndWritable);
    }
    if (m_descriptor < 0)
        throw Result::FileAccessFailed;
}

FileReplacement::~FileReplacement()
{
    if (m_descriptor >= 0)
        ::close(m_descriptor);
    std::error_code error;
    if (!m_unfinished.empty())
        fs::remove(m_unfinished, error);
    if (!m_former.empty())
        fs::rename(m_former, m_target, error);
    else if (m_isPlaced)
        fs::remove(m_target, error);
}

void FileReplacement::openBeside()
{
    m_unfinished = unusedNameBeside(m_target);
    m_descriptor = ::open(m_unfinished.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, ReadableAndWritable);
    if (m_descriptor < 0) {
        m_unfinished.clear();
        return;
    }
    std::error_code error;
    const fs::file_status former = fs::status(m_target, error);
    if (fs::is_regular_file(former))
        fs::permissions(m_unfinished, former.permissions(), error);
}

void FileReplacement::write(std::string_view text)
{
    if (m_pending.size() + text.size() < WellFilled) {
        m_pending += text;
    } else {
        send(std::exchange(m_pending, {}));
        send(text);
    }
    if (m_hasFailed || m_descriptor < 0)
        throw Result::FileAccessFailed;
}

void FileReplacement::send(std::string_view text)
{
    while (!text.empty() && !m_hasFailed) {
        const ssize_t written = ::write(m_descriptor, text.data(), text.size());
        if (written >= 0)
            text.remove_prefix(static_cast<std::size_t>(written));
        else
            m_hasFailed = errno != EINTR;
    }
}

bool FileReplacement::close()
{
    send(std::exchange(m_pending, {}));
    if (!m_target.empty() && !m_hasFailed)
        m_hasFailed = !waitForDisk(m_descriptor);
    if (::close(std::exchange(m_descriptor, -1)) != 0)
        m_hasFailed = true;
    return !m_hasFailed;
}

void FileReplacement::finish()
{
    if (m_descriptor >= 0 ? !close() : m_hasFailed)
        throw Result::FileAccessFailed;
}

void FileReplacement::requireUnchanged(const FileStamp& expected) const
{
    if (!m_target.empty() && FileStamp::of(m_target) != expected)
        throw TargetChanged{};
}

void FileReplacement::putInPlace(const std::optional<FileStamp>& expected)
{
    finish();
    if (m_target.empty())
        return;
    if (expected)
        requireUnchanged(*expected);
    std::error_code error;
    if (fs::is_regular_file(m_target, error)) {
        // With a second name, the former file keeps its place until the new one takes it. Some disks don't support
        // second names.
        const fs::path aside = unusedNameBeside(m_target);
        fs::create_hard_link(m_target, aside, error);
        if (error)
            fs::rename(m_target, aside, error);
        if (error)
            throw Result::FileAccessFailed;
        m_former = aside;
    }
    moveToTarget();
    m_isPlaced = true;
    syncFolderOf(m_target);
}

void FileReplacement::keep()
{
    std::error_code error;
    if (!m_former.empty())
        fs::remove(m_former, error);
    m_former.clear();
    m_isPlaced = false;
}

void FileReplacement::commit(const std::optional<FileStamp>& expected)
{
    finish();
    if (m_target.empty())
        return;
    if (expected)
        requireUnchanged(*expected);
    moveToTarget();
    syncFolderOf(m_target);
}

void FileReplacement::moveToTarget()
{
    std::error_code error;
    fs::rename(m_unfinished, m_target, error);
    if (error)
        throw Result::FileAccessFailed;
    m_unfinished.clear();
}

} // namespace cadrel::util
