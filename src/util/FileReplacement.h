// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/FileStamp.h"

#include <filesystem>
#include <optional>
#include <string>
#include <string_view>

namespace cadrel::util {

/// A file that takes the place of another only when all of it is written, so that a failure leaves the former file as
/// it was.
///
///     constructed     notes.txt          the former file, if there is one
///                     .cadrel-1f3a...    what is being written
///     commit()        notes.txt          what has been written, with the former file's permissions
///
/// A target that is a symbolic link stays one: the file that it points to is replaced. A target that exists and isn't a
/// regular file, such as a device or a pipe, is written directly and never removed.
///
/// The content reaches the disk before the name does, so that there is either the whole former file or the whole new
/// one, also after a crash or a power failure. A crash may leave a hidden file in the folder; later replacements ignore
/// it.
///
/// To replace several files together, put them in place one after the other, and call `keep` when all are there.
/// Without `keep`, the destructor restores the former files.
class FileReplacement {
public:
    /// Thrown where another program has written the target.
    struct TargetChanged {};

    /// Throws Result::FileAccessFailed when the target can't be written, as for a folder or a write-protected file.
    explicit FileReplacement(const std::filesystem::path& target);
    FileReplacement(const FileReplacement&) = delete;
    FileReplacement& operator=(const FileReplacement&) = delete;
    /// Restores the former file, unless `keep` or `commit` was called.
    ~FileReplacement();

    /// Appends to the file. Throws Result::FileAccessFailed when it can't be written; a full disk may show only later.
    void write(std::string_view text);
    /// Ends the writing; then the content is on the disk. Throws Result::FileAccessFailed when not all could be written.
    void finish();
    /// Throws TargetChanged when the target isn't as it was at the time of the stamp. A target that is written directly
    /// isn't looked at.
    void requireUnchanged(const FileStamp& expected) const;
    /// Moves the former file aside and the finished one to its place. Throws Result::FileAccessFailed; with an `expected`
    /// stamp, as requireUnchanged.
    void putInPlace(const std::optional<FileStamp>& expected = std::nullopt);
    /// Makes the replacement final and drops the former file.
    void keep();

    /// Finishes the file and replaces the former one in one step, so that the target exists at every moment. Throws
    /// Result::FileAccessFailed. The new file is in place nevertheless if the disk fails in the very last step.
    ///
    /// With an `expected` stamp, throws as requireUnchanged, and the target stays.
    void commit(const std::optional<FileStamp>& expected = std::nullopt);

private:
    void openBeside();
    void send(std::string_view text);
    /// Closes the file. Returns whether everything was written.
    bool close();
    void moveToTarget();

    std::filesystem::path m_target;     ///< with symbolic links followed; empty when the target is written directly
    std::filesystem::path m_unfinished; ///< empty when there is none (any more)
    std::filesystem::path m_former;     ///< the former file while it is moved aside, else empty
    bool m_isPlaced = false;            ///< in the place of the target, but not kept yet
    int m_descriptor = -1;              ///< of the file that is written; -1 when none is open
    bool m_hasFailed = false;           ///< something of the content is lost
    std::string m_pending;              ///< content that isn't written yet
};

} // namespace cadrel::util
