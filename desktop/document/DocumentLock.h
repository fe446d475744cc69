// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <sys/types.h>

namespace desktop {

/// Keeps other programs from taking a project for one that nobody has open: a hidden file beside it that this process holds
/// locked. The system drops the lock when the process ends in whatever way, so what a crash leaves holds nobody up.
///
/// On a disk without locks it can't be told whether another program has the project open. It counts as open here alone then,
/// and no file stays.
class DocumentLock {
public:
    /// Who holds a lock.
    struct Holder {
        pid_t process = 0; ///< 0 where it isn't known
        std::string machine;
    };

    /// Holds nothing.
    DocumentLock() = default;
    /// Takes the lock of the file, unless another has it. Where the folder lets no file be made, or the disk knows no locks,
    /// nothing is locked.
    explicit DocumentLock(const std::filesystem::path& file);
    DocumentLock(DocumentLock&& other) noexcept { swap(other); }
    DocumentLock& operator=(DocumentLock&& other) noexcept
    {
        DocumentLock taken(std::move(other));
        swap(taken);
        return *this;
    }
    /// Gives it up and removes the file, unless that is another's by now.
    ~DocumentLock();

    bool isHeld() const { return m_descriptor >= 0; }
    /// Whether nobody else is known to have the project open, and the folder takes files: it is held, or can't be.
    bool isOurs() const { return isHeld() || m_isUnknown; }
    /// The other process that has the lock.
    const std::optional<Holder>& holder() const { return m_holder; }

    /// Who has the file open; nothing where nobody has.
    static std::optional<Holder> holderOf(const std::filesystem::path& file);
    static std::filesystem::path pathFor(const std::filesystem::path& file);

private:
    void swap(DocumentLock& other) noexcept;
    /// Whether that settled it: it is held, or it never will be.
    bool take();

    std::filesystem::path m_path;
    int m_descriptor = -1;
    bool m_isUnknown = false; ///< the disk knows no locks
    std::optional<Holder> m_holder;
};

} // namespace desktop
