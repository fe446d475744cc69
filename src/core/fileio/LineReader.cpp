// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/LineReader.h"

#include "util/Result.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <system_error>

namespace cadrel::core::fileio {

using util::Result;
using util::StringUtil;

namespace {

constexpr std::size_t ChunkSize = 256 * 1024;

} // namespace

LineReader::LineReader(const std::filesystem::path& file) : m_buffer(ChunkSize, '\0')
{
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error))
        throw Result::FileAccessFailed;
    // The chunks are read directly into this buffer.
    m_stream.rdbuf()->pubsetbuf(nullptr, 0);
    m_stream.open(file, std::ios::binary);
    if (!m_stream.is_open())
        throw Result::FileAccessFailed;
    findDelimiter();
}

std::optional<std::string_view> LineReader::next()
{
    std::size_t searched = 0;
    for (;;) {
        const std::size_t length = unread().find(m_delimiter, searched);
        if (length != std::string_view::npos) {
            return take(length, 1);
        }
        searched = unread().size();
        if (!readMore())
            break;
    }
    if (unread().empty())
        return std::nullopt;
    return take(unread().size(), 0);
}

/// Takes a line off the unread text, counts it and trims it.
std::string_view LineReader::take(std::size_t length, std::size_t delimiterLength)
{
    std::string_view line = unread().substr(0, length);
    m_begin += length + delimiterLength;
    // The second byte of a CR LF belongs to the delimiter, on whichever side of it it stands.
    if (m_delimiter == '\r' && line.starts_with('\n'))
        line.remove_prefix(1);
    if (m_delimiter == '\n' && line.ends_with('\r'))
        line.remove_suffix(1);
    const std::string_view trimmed = StringUtil::trimView(line);
    const auto start = static_cast<std::size_t>(trimmed.data() - line.data());
    m_lineNumber = m_nextLineNumber + innerBreaks(line.substr(0, start));
    m_nextLineNumber += innerBreaks(line) + 1;
    return trimmed;
}

/// The line breaks in a line, which are of the kind that isn't the delimiter.
std::uint32_t LineReader::innerBreaks(std::string_view text) const
{
    const char other = m_delimiter == '\n' ? '\r' : '\n';
    std::uint32_t count = 0;
    for (std::size_t place = text.find(other); place != std::string_view::npos; place = text.find(other, place + 1))
        ++count;
    return count;
}

void LineReader::findDelimiter()
{
    std::size_t searched = 0;
    while (readMore()) {
        const std::size_t carriageReturn = unread().find('\r', searched);
        const std::size_t lineFeed = unread().find('\n', searched);
        if (carriageReturn != lineFeed) {
            m_delimiter = carriageReturn < lineFeed ? '\r' : '\n';
            return;
        }
        searched = unread().size();
    }
}

/// Adds a part of the file to the unread text; false at the end of the file.
bool LineReader::readMore()
{
    if (m_begin > 0) {
        std::copy(unread().begin(), unread().end(), m_buffer.begin());
        m_end -= m_begin;
        m_begin = 0;
    }
    // Doubling keeps the time for a line of any length linear.
    if (m_end == m_buffer.size())
        m_buffer.resize(2 * m_buffer.size());
    m_stream.read(&m_buffer[m_end], static_cast<std::streamsize>(m_buffer.size() - m_end));
    if (m_stream.bad())
        throw Result::FileAccessFailed;
    const auto count = static_cast<std::size_t>(m_stream.gcount());
    m_end += count;
    return count > 0;
}

} // namespace cadrel::core::fileio
