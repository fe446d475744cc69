// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/StoredFile.h"

#include "desktop/document/DocumentError.h"

#include <utility>

namespace desktop {

using cadrel::util::FileStamp;

StoredFile::StoredFile(std::filesystem::path path) : m_path(std::move(path)), m_stamp(FileStamp::of(m_path))
{
    const std::optional<ContentPrint> print = ContentPrint::ofFile(m_path);
    if (!print)
        throw DocumentError(m_path.string() + ": can't be read");
    m_print = *print;
}

StoredFile::StoredFile(std::filesystem::path path, const ContentPrint& written)
    : m_path(std::move(path)), m_stamp(FileStamp::of(m_path)), m_print(written)
{
}

StoredFile::State StoredFile::look()
{
    const FileStamp stamp = FileStamp::of(m_path);
    if (!stamp.exists)
        return State::Missing;
    if (stamp == m_stamp)
        return State::AsStored;
    return stamp == m_changedStamp ? State::Changed : compareContent();
}

StoredFile::State StoredFile::lookInside()
{
    return FileStamp::of(m_path).exists ? compareContent() : State::Missing;
}

StoredFile::State StoredFile::compareContent()
{
    // Before the content, so that what is written while it is read is noticed the next time.
    const FileStamp stamp = FileStamp::of(m_path);
    if (stamp.size != m_print.size || ContentPrint::ofFile(m_path) != m_print) {
        m_changedStamp = stamp;
        return State::Changed;
    }
    m_stamp = stamp;
    return State::AsStored;
}

} // namespace desktop
