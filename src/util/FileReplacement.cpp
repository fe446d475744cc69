#include "util/FileReplacement.h"

#include "util/Result.h"

#include <random>
#include <string>
#include <system_error>

namespace cadrel::util {

namespace fs = std::filesystem;

namespace {

/// As many as the system itself follows.
constexpr int MostLinks = 40;

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
    return std::ofstream(file, std::ios::binary | std::ios::in).is_open();
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
        stream_.open(target, std::ios::binary);
    }
    if (!stream_.is_open())
        throw Result::FileAccessFailed;
}

FileReplacement::~FileReplacement()
{
    stream_.close();
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
    stream_.open(unfinished_, std::ios::binary);
    if (!stream_.is_open()) {
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
    if (!stream_.write(text.data(), static_cast<std::streamsize>(text.size())))
        throw Result::FileAccessFailed;
}

void FileReplacement::finish()
{
    if (stream_.is_open())
        stream_.close();
    if (!stream_)
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
    if (!target_.empty())
        moveToTarget();
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
