// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/DocumentLock.h"

#include "desktop/document/FileBeside.h"

#include <array>
#include <cerrno>
#include <charconv>
#include <fcntl.h>
#include <string_view>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

namespace {

constexpr mode_t ReadableAndWritable = 0666; // less what the user's mask takes away

std::string thisMachine()
{
    std::array<char, 256> name{};
    return ::gethostname(name.data(), name.size() - 1) == 0 ? name.data() : "";
}

/// What the holder has written: its number, a blank, and the name of its machine.
DocumentLock::Holder readHolder(int descriptor)
{
    std::array<char, 512> content{};
    const ssize_t size = ::pread(descriptor, content.data(), content.size(), 0);
    const std::string_view text(content.data(), size > 0 ? static_cast<std::size_t>(size) : 0);
    DocumentLock::Holder holder;
    const auto read = std::from_chars(text.data(), text.data() + text.size(), holder.process);
    if (read.ec != std::errc() || holder.process < 0)
        return {};
    const std::string_view rest = text.substr(static_cast<std::size_t>(read.ptr - text.data()));
    const std::size_t end = rest.find('\n');
    if (rest.starts_with(' ') && end != std::string_view::npos)
        holder.machine = rest.substr(1, end - 1);
    return holder;
}

void writeHolder(int descriptor)
{
    const std::string text = std::to_string(::getpid()).append(" ").append(thisMachine()).append("\n");
    if (::ftruncate(descriptor, 0) != 0 || ::pwrite(descriptor, text.data(), text.size(), 0) < 0)
        return; // on a full disk it is locked all the same; only its holder isn't known
}

bool isOrdinary(int descriptor)
{
    struct stat state {};
    return ::fstat(descriptor, &state) == 0 && S_ISREG(state.st_mode);
}

bool isStillAt(int descriptor, const fs::path& path)
{
    struct stat open {};
    struct stat named {};
    return ::fstat(descriptor, &open) == 0 && ::stat(path.c_str(), &named) == 0 && open.st_ino == named.st_ino &&
           open.st_dev == named.st_dev;
}

struct LockFile {
    int descriptor = -1;
    bool isNew = false;       ///< it wasn't there before
    bool hasVanished = false; ///< between two looks
};

LockFile openLockFile(const fs::path& path)
{
    constexpr int Flags = O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK;
    const int made = ::open(path.c_str(), O_RDWR | O_CREAT | O_EXCL | Flags, ReadableAndWritable);
    if (made >= 0)
        return {made, true, false};
    const bool isThere = errno == EEXIST;
    int descriptor = ::open(path.c_str(), O_RDWR | Flags);
    if (descriptor < 0)
        descriptor = ::open(path.c_str(), O_RDONLY | Flags); // another user's
    return {descriptor, false, isThere && descriptor < 0 && errno == ENOENT};
}

} // namespace

DocumentLock::DocumentLock(const fs::path& file) : m_path(pathFor(file))
{
    while (!take())
        ;
}

DocumentLock::~DocumentLock()
{
    if (!isHeld())
        return;
    // First, so that nobody else holds what is removed. Whoever has removed ours may have let another program make its own.
    if (isStillAt(m_descriptor, m_path))
        ::unlink(m_path.c_str());
    ::close(m_descriptor);
}

bool DocumentLock::take()
{
    const auto [descriptor, isNew, hasVanished] = openLockFile(m_path);
    if (descriptor < 0)
        return !hasVanished;
    if (!isOrdinary(descriptor)) {
        ::close(descriptor);
        return true;
    }
    if (::flock(descriptor, LOCK_EX | LOCK_NB) != 0) {
        if (errno == EWOULDBLOCK)
            m_holder = readHolder(descriptor);
        else
            m_isUnknown = true;
        if (m_isUnknown && isNew)
            ::unlink(m_path.c_str());
        ::close(descriptor);
        return true;
    }
    if (!isStillAt(descriptor, m_path)) {
        // Its holder has removed it meanwhile.
        ::close(descriptor);
        return false;
    }
    writeHolder(descriptor);
    m_descriptor = descriptor;
    return true;
}

std::optional<DocumentLock::Holder> DocumentLock::holderOf(const fs::path& file)
{
    const int descriptor = ::open(pathFor(file).c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK);
    if (descriptor < 0)
        return std::nullopt;
    std::optional<Holder> holder;
    if (::flock(descriptor, LOCK_SH | LOCK_NB) != 0 && errno == EWOULDBLOCK)
        holder = readHolder(descriptor);
    ::close(descriptor);
    return holder;
}

fs::path DocumentLock::pathFor(const fs::path& file)
{
    return fileBeside(file, ".", ".cadrel-lock");
}

void DocumentLock::swap(DocumentLock& other) noexcept
{
    std::swap(m_path, other.m_path);
    std::swap(m_descriptor, other.m_descriptor);
    std::swap(m_isUnknown, other.m_isUnknown);
    std::swap(m_holder, other.m_holder);
}

} // namespace desktop
