// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace cadrel::util {

/// A file that takes the place of another only when all of it is written, so that a failure leaves what stood there.
///
///     constructed     notes.txt          the former file, if there is one
///                     .cadrel-1f3a...    what is being written
///     commit()        notes.txt          what has been written, with the former file's permissions
///
/// A target that is a symbolic link stays one: the file behind it is replaced. A target that exists and is no regular
/// file, such as a device or a pipe, is written directly and never removed.
///
/// The content reaches the disk before the name does, so that after a crash or a power failure, too, there is all of the
/// former file or all of the new one. What a crash may leave beside them is never taken for anything by a later
/// replacement.
///
/// Several files that belong together are put in place one after the other and kept when all are there; up to `keep`,
/// destruction takes back what has been done.
class FileReplacement {
public:
    /// Throws Result::FileAccessFailed when the target can't be written, as for a folder or a write-protected file.
    explicit FileReplacement(const std::filesystem::path& target);
    FileReplacement(const FileReplacement&) = delete;
    FileReplacement& operator=(const FileReplacement&) = delete;
    /// Restores what stood there, unless all was kept.
    ~FileReplacement();

    /// Appends to the file. Throws Result::FileAccessFailed when it can't be written; a full disk may show only later.
    void write(std::string_view text);
    /// Ends the writing; then the content is on the disk. Throws Result::FileAccessFailed when not all could be written.
    void finish();
    /// Moves the former file aside and the finished one to its place. Throws Result::FileAccessFailed.
    void putInPlace();
    /// Makes the replacement final and drops the former file.
    void keep();

    /// Finishes the file and replaces the former one at one stroke, so that the target exists at every moment.
    /// Throws Result::FileAccessFailed. Only when the disk fails in the very last step is the new file there even so.
    void commit();

private:
    void openBeside();
    void send(std::string_view text);
    /// Closes the file. Whether all that was written has arrived.
    bool close();
    void moveToTarget();

    std::filesystem::path m_target;     ///< with symbolic links followed; empty when the target is written directly
    std::filesystem::path m_unfinished; ///< empty when there is none (any more)
    std::filesystem::path m_former;     ///< the former file while it stands aside, else empty
    bool m_isPlaced = false;            ///< in the place of the target, but not kept yet
    int m_descriptor = -1;              ///< of the file that is written; -1 when none is open
    bool m_hasFailed = false;           ///< something of the content is lost
    std::string m_pending;              ///< content that is handed to the system with what follows
};

} // namespace cadrel::util
