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

LineReader::LineReader(const std::filesystem::path& file) : buffer_(ChunkSize, '\0')
{
    std::error_code error;
    if (!std::filesystem::is_regular_file(file, error))
        throw Result::FileAccessFailed;
    // The chunks are read straight into the own buffer.
    stream_.rdbuf()->pubsetbuf(nullptr, 0);
    stream_.open(file, std::ios::binary);
    if (!stream_.is_open())
        throw Result::FileAccessFailed;
    findDelimiter();
}

std::optional<std::string_view> LineReader::next()
{
    std::size_t searched = 0;
    for (;;) {
        const std::size_t length = unread().find(delimiter_, searched);
        if (length != std::string_view::npos) {
            const std::string_view line = unread().substr(0, length);
            begin_ += length + 1;
            return StringUtil::trimView(line);
        }
        searched = unread().size();
        if (!readMore())
            break;
    }
    if (unread().empty())
        return std::nullopt;
    const std::string_view line = unread();
    begin_ = end_;
    return StringUtil::trimView(line);
}

void LineReader::findDelimiter()
{
    std::size_t searched = 0;
    while (readMore()) {
        const std::size_t carriageReturn = unread().find('\r', searched);
        const std::size_t lineFeed = unread().find('\n', searched);
        if (carriageReturn != lineFeed) {
            delimiter_ = carriageReturn < lineFeed ? '\r' : '\n';
            return;
        }
        searched = unread().size();
    }
}

/// Adds a part of the file to the unread text; false at the end of the file.
bool LineReader::readMore()
{
    if (begin_ > 0) {
        std::copy(unread().begin(), unread().end(), buffer_.begin());
        end_ -= begin_;
        begin_ = 0;
    }
    // Doubling keeps the time for a line of any length linear.
    if (end_ == buffer_.size())
        buffer_.resize(2 * buffer_.size());
    stream_.read(&buffer_[end_], static_cast<std::streamsize>(buffer_.size() - end_));
    if (stream_.bad())
        throw Result::FileAccessFailed;
    const auto count = static_cast<std::size_t>(stream_.gcount());
    end_ += count;
    return count > 0;
}

} // namespace cadrel::core::fileio
