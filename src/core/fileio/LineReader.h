// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
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

private:
    void findDelimiter();
    bool readMore();
    std::string_view unread() const { return std::string_view(m_buffer).substr(m_begin, m_end - m_begin); }

    std::ifstream m_stream;
    std::string m_buffer;
    std::size_t m_begin = 0; ///< what has been read and not yet returned starts here
    std::size_t m_end = 0;   ///< and ends here
    char m_delimiter = '\n';
};

} // namespace cadrel::core::fileio
