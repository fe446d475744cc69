// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <optional>
#include <string>
#include <string_view>

namespace cadrel::core::fileio {

/// Reads the lines of a file of 8-bit text one by one, holding no more of the file than a chunk or its longest line.
/// All lines end with CR if a CR comes before the first LF, otherwise with LF. So after CR LF the LF is at the start of
/// the next line.
class LineReader {
public:
    /// Throws Result::FileAccessFailed for what isn't a regular file or can't be read. Never waits for a pipe.
    explicit LineReader(const std::filesystem::path& file);

    /// The next line without blanks, tabs, LF and CR at its ends, valid until the next call; nothing at the end of the
    /// file. Throws Result::FileAccessFailed when reading fails.
    std::optional<std::string_view> next();

    /// The number of the line that `next` gave last, as an editor counts: from 1, and each CR, LF or CR LF ends a line.
    std::uint32_t lineNumber() const { return m_lineNumber; }

private:
    void findDelimiter();
    bool readMore();
    std::string_view take(std::size_t length, std::size_t delimiterLength);
    std::uint32_t innerBreaks(std::string_view text) const;
    std::string_view unread() const { return std::string_view(m_buffer).substr(m_begin, m_end - m_begin); }

    std::ifstream m_stream;
    std::string m_buffer;
    std::size_t m_begin = 0; ///< what has been read and not yet returned starts here
    std::size_t m_end = 0;   ///< and ends here
    char m_delimiter = '\n';
    std::uint32_t m_lineNumber = 0;     ///< of the line given last
    std::uint32_t m_nextLineNumber = 1; ///< of the first byte at `m_begin`
};

} // namespace cadrel::core::fileio
