// SPDX-License-Identifier: GPL-3.0-or-later

#include "examples/newcuts/CutText.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <cstdio>
#include <fstream>
#include <iterator>
#include <sstream>
#include <stdexcept>
#include <string_view>

namespace cadrel::examples {

namespace {

using Place = std::vector<Shot>::difference_type;

std::string eventLine(std::size_t number, const std::string& roll, const std::string& transition, int srcIn, int srcOut,
                      int dstIn, int dstOut)
{
    std::array<char, 160> line{};
    std::snprintf(line.data(), line.size(), "%06zu  %-24s V     %-8s %s %s %s %s\n", number, roll.c_str(),
                  transition.c_str(), timecodeOf(srcIn).c_str(), timecodeOf(srcOut).c_str(), timecodeOf(dstIn).c_str(),
                  timecodeOf(dstOut).c_str());
    return line.data();
}

constexpr std::string_view FromClip = "* FROM CLIP NAME:";
constexpr std::string_view ToClip = "* TO CLIP NAME:";

/// Below a dissolve stand the names of both of its shots.
std::vector<std::string> notesOf(const Shot& shot, const Shot* before)
{
    if (shot.dissolve == 0 || before == nullptr)
        return shot.notes;
    std::vector<std::string> notes;
    const auto isName = [](const std::string& note) { return note.starts_with(FromClip); };
    std::copy_if(before->notes.begin(), before->notes.end(), std::back_inserter(notes), isName);
    for (const std::string& note : shot.notes)
        notes.push_back(isName(note) ? std::string(ToClip) + note.substr(FromClip.size()) : note);
    return notes;
}

} // namespace

std::string timecodeOf(int frames)
{
    const int seconds = frames / FramesPerSecond;
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%02d:%02d:%02d:%02d", seconds / 3600 % 24, seconds / 60 % 60, seconds % 60,
                  frames % FramesPerSecond);
    return text.data();
}

int framesOf(const std::string& timecode)
{
    int hours = 0;
    int minutes = 0;
    int seconds = 0;
    int frames = 0;
    if (std::sscanf(timecode.c_str(), "%d:%d:%d:%d", &hours, &minutes, &seconds, &frames) != 4)
        throw std::runtime_error(timecode + " is no timecode");
    return ((hours * 60 + minutes) * 60 + seconds) * FramesPerSecond + frames;
}

Shot shotOf(const std::string& roll, const std::string& clip, int srcIn, int length)
{
    return {roll, srcIn, length, length, {"* FROM CLIP NAME:  " + clip}, 0};
}

CutText CutText::read(const std::filesystem::path& file)
{
    std::ifstream stream(file, std::ios::binary);
    if (!stream)
        throw std::runtime_error("can't read " + file.string());
    CutText cut(-1);
    int end = 0;
    for (std::string line; std::getline(stream, line);) {
        line.erase(line.find_last_not_of(" \r") + 1);
        if (!line.empty() && std::isdigit(static_cast<unsigned char>(line.front())) != 0) {
            std::istringstream words(line);
            const std::vector<std::string> word{std::istream_iterator<std::string>(words), {}};
            if (word.size() != 8 || word[3] != "C")
                throw std::runtime_error(file.string() + ": no plain cut: " + line);
            const int dstIn = framesOf(word[6]);
            if (cut.m_start < 0)
                cut.m_start = end = dstIn;
            if (dstIn != end)
                throw std::runtime_error(file.string() + ": a gap before " + line);
            end = framesOf(word[7]);
            cut.m_shots.push_back(
                {word[1], framesOf(word[4]), end - dstIn, framesOf(word[5]) - framesOf(word[4]), {}, 0});
        } else if (!line.empty() && !cut.m_shots.empty()) {
            cut.m_shots.back().notes.push_back(line);
        }
    }
    return cut;
}

void CutText::write(const std::filesystem::path& file) const
{
    std::ofstream stream(file, std::ios::binary);
    stream << "TITLE:   " << file.stem().string() << "\nFCM: NON-DROP FRAME\n";
    int place = m_start;
    const Shot* before = nullptr;
    std::size_t number = 0;
    for (const Shot& shot : m_shots) {
        ++number;
        std::string transition = "C";
        if (shot.dissolve > 0 && before != nullptr) {
            const int out = before->srcIn + before->sourceLength;
            stream << eventLine(number, before->roll, "C", out, out, place, place);
            transition = "D    " + std::string(shot.dissolve < 100 ? "0" : "") + std::to_string(shot.dissolve);
        }
        stream << eventLine(number, shot.roll, transition, shot.srcIn, shot.srcIn + shot.sourceLength, place,
                            place + shot.length);
        for (const std::string& note : notesOf(shot, before))
            stream << note << '\n';
        place += shot.length;
        before = &shot;
    }
    stream.close();
    if (!stream)
        throw std::runtime_error("can't write " + file.string());
}

void CutText::trimHead(std::size_t shot, int frames)
{
    Shot& trimmed = m_shots.at(shot);
    trimmed.srcIn += frames;
    trimmed.length -= frames;
    trimmed.sourceLength -= frames;
}

void CutText::trimTail(std::size_t shot, int frames)
{
    Shot& trimmed = m_shots.at(shot);
    trimmed.length -= frames;
    trimmed.sourceLength -= frames;
}

void CutText::lift(std::size_t first, std::size_t count)
{
    const auto start = m_shots.begin() + static_cast<Place>(first);
    m_shots.erase(start, start + static_cast<Place>(count));
}

void CutText::insert(std::size_t place, const std::vector<Shot>& shots)
{
    m_shots.insert(m_shots.begin() + static_cast<Place>(place), shots.begin(), shots.end());
}

void CutText::move(std::size_t first, std::size_t count, std::size_t place)
{
    const auto start = m_shots.begin() + static_cast<Place>(first);
    const std::vector<Shot> moved(start, start + static_cast<Place>(count));
    lift(first, count);
    insert(place > first ? place - count : place, moved);
}

void CutText::dissolveTo(std::size_t shot, int frames)
{
    const int half = frames / 2;
    trimTail(shot - 1, half);
    trimHead(shot, -half);
    m_shots.at(shot).dissolve = frames;
}

} // namespace cadrel::examples
