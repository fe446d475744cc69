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
            const std::string_view line = unread().substr(0, length);
            m_begin += length + 1;
            return StringUtil::trimView(line);
        }
        searched = unread().size();
        if (!readMore())
            break;
    }
    if (unread().empty())
        return std::nullopt;
    const std::string_view line = unread();
    m_begin = m_end;
    return StringUtil::trimView(line);
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
