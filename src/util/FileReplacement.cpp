#include "util/FileReplacement.h"

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

/// As many as the system itself follows.
constexpr int MostLinks = 40;
/// From so many bytes on they are handed to the system.
constexpr std::size_t WellFilled = 1 << 16;
constexpr mode_t ReadableAndWritable = 0666; // less what the user's mask takes away

/// The file behind a symbolic link, which need not exist.
fs::path followLinks(fs::path path)
{
    std::error_code error;
    for (int count = 0; fs::is_symlink(path, error); ++count) {
        const fs::path next = fs::read_symlink(path, error);
        if (error || count == MostLinks)
            throw Result::FileAccessFailed;
        path = path.parent_path() / next;
    }
    return path;
}

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

/// Waits until a file or folder is on the disk as it is now. Some disks don't know how, and have nothing to wait for.
bool waitForDisk(int descriptor)
{
    int result = 0;
    do
        result = ::fsync(descriptor);
    while (result != 0 && errno == EINTR);
    return result == 0 || errno == EINVAL || errno == ENOTSUP || errno == ENOSYS;
}

/// The same for the names in a folder. A folder that can't be read is left to itself.
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
        target_ = followLinks(target);
        if (!target_.has_filename() || (type == fs::file_type::regular && !isWritable(target_)))
            throw Result::FileAccessFailed;
        openBeside();
    } else {
        descriptor_ = ::open(target.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, ReadableAndWritable);
    }
    if (descriptor_ < 0)
        throw Result::FileAccessFailed;
}

FileReplacement::~FileReplacement()
{
    if (descriptor_ >= 0)
        ::close(descriptor_);
    std::error_code error;
    if (!unfinished_.empty())
        fs::remove(unfinished_, error);
    if (!former_.empty())
        fs::rename(former_, target_, error);
    else if (isPlaced_)
        fs::remove(target_, error);
}

void FileReplacement::openBeside()
{
    unfinished_ = unusedNameBeside(target_);
    descriptor_ = ::open(unfinished_.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, ReadableAndWritable);
    if (descriptor_ < 0) {
        unfinished_.clear();
        return;
    }
    std::error_code error;
    const fs::file_status former = fs::status(target_, error);
    if (fs::is_regular_file(former))
        fs::permissions(unfinished_, former.permissions(), error);
}

void FileReplacement::write(std::string_view text)
{
    if (pending_.size() + text.size() < WellFilled) {
        pending_ += text;
    } else {
        send(std::exchange(pending_, {}));
        send(text);
    }
    if (hasFailed_ || descriptor_ < 0)
        throw Result::FileAccessFailed;
}

void FileReplacement::send(std::string_view text)
{
    while (!text.empty() && !hasFailed_) {
        const ssize_t written = ::write(descriptor_, text.data(), text.size());
        if (written >= 0)
            text.remove_prefix(static_cast<std::size_t>(written));
        else
            hasFailed_ = errno != EINTR;
    }
}

bool FileReplacement::close()
{
    send(std::exchange(pending_, {}));
    if (!target_.empty() && !hasFailed_)
        hasFailed_ = !waitForDisk(descriptor_);
    if (::close(std::exchange(descriptor_, -1)) != 0)
        hasFailed_ = true;
    return !hasFailed_;
}

void FileReplacement::finish()
{
    if (descriptor_ >= 0 ? !close() : hasFailed_)
        throw Result::FileAccessFailed;
}

void FileReplacement::putInPlace()
{
    finish();
    if (target_.empty())
        return;
    std::error_code error;
    if (fs::is_regular_file(target_, error)) {
        // By a second name the former file stays in its place until the new one takes it. Some disks know no such names.
        const fs::path aside = unusedNameBeside(target_);
        fs::create_hard_link(target_, aside, error);
        if (error)
            fs::rename(target_, aside, error);
        if (error)
            throw Result::FileAccessFailed;
        former_ = aside;
    }
    moveToTarget();
    isPlaced_ = true;
    syncFolderOf(target_);
}

void FileReplacement::keep()
{
    std::error_code error;
    if (!former_.empty())
        fs::remove(former_, error);
    former_.clear();
    isPlaced_ = false;
}

void FileReplacement::commit()
{
    finish();
    if (target_.empty())
        return;
    moveToTarget();
    syncFolderOf(target_);
}

void FileReplacement::moveToTarget()
{
    std::error_code error;
    fs::rename(unfinished_, target_, error);
    if (error)
        throw Result::FileAccessFailed;
    unfinished_.clear();
}

} // namespace cadrel::util
