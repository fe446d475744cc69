// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/ContentPrint.h"
#include "util/FileStamp.h"

#include <filesystem>

namespace desktop {

/// The file of a document as the document last read or wrote it, so that what other programs do to it is noticed.
class StoredFile {
public:
    enum class State { AsStored, Changed, Missing };

    /// The file as it is now. Throws DocumentError when it can't be read.
    explicit StoredFile(std::filesystem::path path);
    /// A file to which this content has just been written.
    StoredFile(std::filesystem::path path, const ContentPrint& written);

    const std::filesystem::path& path() const { return m_path; }
    const ContentPrint& print() const { return m_print; }
    const cadrel::util::FileStamp& stamp() const { return m_stamp; }

    /// What the file is now. Its content is read only when it has got another size, time or place on the disk since the last
    /// look; a file that was only touched is as it was stored.
    State look();
    /// The same, but the content is always read: not every program that writes a file leaves a new time.
    State lookInside();

private:
    State compareContent();

    std::filesystem::path m_path;
    cadrel::util::FileStamp m_stamp;
    cadrel::util::FileStamp m_changedStamp; ///< with which it had another content
    ContentPrint m_print;
};

} // namespace desktop
