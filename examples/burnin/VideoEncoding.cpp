// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/burnin/VideoEncoding.h"

#include <csignal>
#include <stdexcept>

namespace cadrel::examples {

VideoEncoding::VideoEncoding(const std::filesystem::path& file, int width, int height, const std::string& rate,
                             const std::string& options)
    : m_file(file)
{
    // An ffmpeg that ends early is told by the write that fails.
    std::signal(SIGPIPE, SIG_IGN);
    const std::string command = "ffmpeg -nostdin -v error -y -f rawvideo -pix_fmt yuv420p -s " + std::to_string(width) +
                                "x" + std::to_string(height) + " -r " + rate + " -i pipe:0 " + options + " " +
                                shellWord("file:" + file.string());
    m_pipe = popen(command.c_str(), "w");
    if (!m_pipe)
        throw std::runtime_error("can't start ffmpeg");
}

VideoEncoding::~VideoEncoding()
{
    if (m_pipe)
        pclose(m_pipe);
}

void VideoEncoding::add(const BurntInFrame& frame)
{
    const auto bytes = frame.bytes();
    if (std::fwrite(bytes.data(), 1, bytes.size(), m_pipe) != bytes.size())
        throw std::runtime_error(m_file.string() + ": ffmpeg takes no more frames");
}

void VideoEncoding::finish()
{
    std::FILE* const pipe = m_pipe;
    m_pipe = nullptr;
    if (pclose(pipe) != 0)
        throw std::runtime_error(m_file.string() + ": ffmpeg has failed");
}

std::string shellWord(const std::string& argument)
{
    std::string word = "'";
    for (const char character : argument)
        word += character == '\'' ? std::string("'\\''") : std::string(1, character);
    return word + "'";
}

} // namespace cadrel::examples
