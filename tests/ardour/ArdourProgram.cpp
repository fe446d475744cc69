// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/ardour/ArdourProgram.h"

#include <array>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <sys/wait.h>

namespace cadrel::tests {

namespace fs = std::filesystem;

namespace {

struct Output {
    int status = 0;
    std::vector<std::string> lines;

    std::string all() const
    {
        std::string text;
        for (const std::string& line : lines)
            text += line + "\n";
        return text;
    }
};

/// Runs a command of the shell for two minutes at most.
Output run(const std::string& command)
{
    FILE* const pipe = popen(("timeout 120 " + command + " 2>&1").c_str(), "r");
    if (!pipe)
        throw std::runtime_error("no process");
    Output output;
    std::string text;
    std::array<char, 4096> buffer{};
    while (const std::size_t size = std::fread(buffer.data(), 1, buffer.size(), pipe))
        text.append(buffer.data(), size);
    const int status = pclose(pipe);
    output.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);)
        output.lines.push_back(line);
    return output;
}

Output lua(const std::string& script, const fs::path& folder, const std::string& name, const std::string& more)
{
    const std::string command = "env FOLDER='" + folder.string() + "' NAME='" + name + "' " + more + " ardour7-lua '" +
                                CADREL_TEST_SCRIPTS "/" + script + "'";
    // It crashes now and then when a script begins while sound files are still being read. The session is saved last.
    constexpr int Signalled = 128;
    Output output = run(command);
    for (int attempt = 1; attempt < 3 && output.status > Signalled; ++attempt)
        output = run(command);
    if (output.status != 0 || output.all().find("Error: ") != std::string::npos)
        throw std::runtime_error(script + ": " + output.all());
    return output;
}

std::vector<std::string> wordsOf(const std::string& line)
{
    std::vector<std::string> words;
    std::istringstream stream(line);
    for (std::string word; std::getline(stream, word, '\t');)
        words.push_back(word);
    return words;
}

template <class Number>
Number readAs(const std::vector<char>& bytes, std::size_t at)
{
    Number number{};
    std::memcpy(&number, &bytes.at(at), sizeof number);
    return number;
}

} // namespace

bool ArdourProgram::isInstalled()
{
    return run("sh -c 'command -v ardour7-lua && command -v ardour7-export'").status == 0;
}

void ArdourProgram::make(const fs::path& folder, const std::string& name, int tracks, int sampleRate, bool withBus)
{
    lua("make.lua", folder, name,
        "TRACKS=" + std::to_string(tracks) + " RATE=" + std::to_string(sampleRate) + (withBus ? " WITHBUS=1" : ""));
}

void ArdourProgram::automate(const fs::path& folder, const std::string& name, const std::string& points)
{
    lua("automate.lua", folder, name, "POINTS='" + points + "'");
}

void ArdourProgram::draw(const fs::path& folder, const std::string& name, const std::string& drawn)
{
    lua("draw.lua", folder, name, "DRAWN='" + drawn + "'");
}

void ArdourProgram::resave(const fs::path& folder, const std::string& name)
{
    lua("resave.lua", folder, name, "");
}

ArdourDump ArdourProgram::dump(const fs::path& folder, const std::string& name,
                               const std::vector<std::int64_t>& samples)
{
    std::string list;
    for (const std::int64_t sample : samples)
        list += std::to_string(sample) + " ";
    ArdourDump dump;
    for (const std::string& line : lua("dump.lua", folder, name, "SAMPLES='" + list + "'").lines) {
        const std::vector<std::string> words = wordsOf(line);
        if (words.empty())
            continue;
        if (line.find("[WARNING]") != std::string::npos || line.find("[ERROR]") != std::string::npos)
            dump.complaints.push_back(line);
        else if (words.front() == "region" && words.size() == 6)
            dump.regions.push_back(
                {words[1], words[2], std::stoll(words[3]), std::stoll(words[4]), std::stoll(words[5])});
        else if (words.front() == "location" && words.size() == 4)
            dump.locations.emplace_back(words[1], std::stoll(words[2]), std::stoll(words[3]));
        else if (words.front() == "value" && words.size() == 5)
            dump.values[{words[1], words[2], std::stoll(words[3])}] = std::stod(words[4]);
    }
    return dump;
}

ArdourMix ArdourProgram::mixIn(const fs::path& file)
{
    std::ifstream stream(file, std::ios::binary);
    const std::vector<char> bytes((std::istreambuf_iterator<char>(stream)), std::istreambuf_iterator<char>());
    ArdourMix mix;
    std::size_t channels = 0;
    for (std::size_t at = 12; at + 8 <= bytes.size();) {
        const std::string chunk(&bytes[at], 4);
        const auto size = readAs<std::uint32_t>(bytes, at + 4);
        at += 8;
        if (chunk == "fmt " && at + 4 <= bytes.size()) {
            channels = readAs<std::uint16_t>(bytes, at + 2);
        } else if (chunk == "data" && channels > 0) {
            mix.isWhole = size > 0 && at + size <= bytes.size();
            const std::size_t end = mix.isWhole ? at + size : bytes.size();
            for (std::size_t frame = at; frame + 4 <= end; frame += 4 * channels)
                mix.left.push_back(readAs<float>(bytes, frame));
            return mix;
        }
        at += size + (size & 1U);
    }
    return mix;
}

std::vector<float> ArdourProgram::mix(const fs::path& folder, const std::string& name)
{
    const fs::path file = folder / (name + ".wav");
    const std::string command =
        "ardour7-export -b float -o '" + file.string() + "' '" + folder.string() + "' '" + name + "'";
    // The program may end with an error, after a whole file or before it has put the length into the file.
    std::string said;
    ArdourMix mix;
    for (int attempt = 0; attempt < 2 && !mix.isWhole; ++attempt) {
        fs::remove(file);
        said += run(command).all();
        mix = mixIn(file);
    }
    if (mix.left.empty())
        throw std::runtime_error("no mix: " + said);
    return mix.left;
}

} // namespace cadrel::tests
