// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/app/figures/EdlFrames.h"

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <set>
#include <sstream>
#include <stdexcept>

namespace cadrel::tests {

namespace {

constexpr int GapBetweenReels = 60 * FramesASecond;
const std::string FromClip = "* FROM CLIP NAME:";
const std::string ToClip = "* TO CLIP NAME:";

std::vector<std::string> wordsOf(const std::string& line)
{
    std::istringstream words(line);
    return {std::istream_iterator<std::string>(words), {}};
}

std::string trimmed(const std::string& text)
{
    const std::size_t start = text.find_first_not_of(' ');
    return start == std::string::npos ? "" : text.substr(start, text.find_last_not_of(' ') + 1 - start);
}

WrittenEvent eventOf(const std::vector<std::string>& words, const std::string& line)
{
    const bool isTransition = words.size() == 9;
    if (words.size() != 8 && !isTransition)
        throw std::runtime_error("no event: " + line);
    const std::size_t first = isTransition ? 5 : 4;
    WrittenEvent event;
    event.number = std::stoi(words[0]);
    event.roll = words[1];
    event.transition = words[3];
    event.duration = isTransition ? std::stoi(words[4]) : 0;
    event.srcIn = framesOfTimecode(words[first]);
    event.srcOut = framesOfTimecode(words[first + 1]);
    event.dstIn = framesOfTimecode(words[first + 2]);
    event.dstOut = framesOfTimecode(words[first + 3]);
    return event;
}

} // namespace

int framesOfTimecode(const std::string& timecode)
{
    const auto part = [&timecode](std::size_t at) { return std::stoi(timecode.substr(at, 2)); };
    return ((part(0) * 60 + part(3)) * 60 + part(6)) * FramesASecond + part(9);
}

std::string timecodeOfFrames(int frames)
{
    std::array<char, 16> text{};
    const int seconds = frames / FramesASecond;
    std::snprintf(text.data(), text.size(), "%02d:%02d:%02d:%02d", seconds / 3600 % 100, seconds / 60 % 60,
                  seconds % 60, frames % FramesASecond);
    return text.data();
}

std::string signedTimecode(int frames)
{
    return std::string(1, frames < 0 ? '-' : frames > 0 ? '+' : ' ').append(timecodeOfFrames(std::abs(frames)));
}

bool PictureFrame::looksLike(const PictureFrame& other) const
{
    if (what != other.what || std::abs(speed - other.speed) > 0.01)
        return false;
    return speed == 1.0 ? source == other.source : std::abs(source - other.source) <= std::abs(speed) + 1e-6;
}

EdlFrames::EdlFrames(const std::vector<std::string>& files, const FrameRules& rules)
{
    for (const std::string& file : files)
        readFile(file);
    int next = 0;
    for (std::size_t event = 0; event < m_events.size(); ++event) {
        const WrittenEvent& written = m_events[event];
        if (m_reels.empty() || written.dstIn - next >= GapBetweenReels) {
            m_reels.push_back({written.dstIn, {}});
            next = written.dstIn;
        }
        if (written.dstIn < next)
            throw std::runtime_error("events overlap");
        for (int gap = next; gap < written.dstIn; ++gap)
            m_reels.back().frames.push_back({"gap", "", static_cast<double>(gap - next), 1.0, nullptr});
        for (int frame = written.dstIn; frame < written.dstOut; ++frame)
            m_reels.back().frames.push_back(frameOf(event, frame - written.dstIn, rules));
        next = written.dstOut;
    }
}

void EdlFrames::readFile(const std::string& file)
{
    std::ifstream stream(file, std::ios::binary);
    if (!stream)
        throw std::runtime_error("can't read " + file);
    const std::size_t first = m_events.size();
    for (std::string line; std::getline(stream, line);) {
        line.erase(line.find_last_not_of(" \r") + 1);
        const std::vector<std::string> words = wordsOf(line);
        if (words.empty())
            continue;
        if (std::isdigit(static_cast<unsigned char>(line.front())) != 0) {
            m_events.push_back(eventOf(words, line));
            m_events.back().file = std::filesystem::path(file).filename();
        } else if (words.front() == "M2") {
            const auto of = std::find_if(m_events.rbegin(), m_events.rend(),
                                         [&words](const WrittenEvent& event) { return event.roll == words[1]; });
            of->speed = std::stod(words[2]) / FramesASecond;
        } else if (line.starts_with(FromClip)) {
            // Below a transition it is the name of the shot that goes.
            const bool isOfBoth = m_events.back().duration > 0;
            m_events[m_events.size() - (isOfBoth ? 2 : 1)].clip = trimmed(line.substr(FromClip.size()));
        } else if (line.starts_with(ToClip)) {
            m_events.back().clip = trimmed(line.substr(ToClip.size()));
        }
    }
    // The second machine's copy of a roll.
    std::set<std::string> rolls;
    for (std::size_t event = first; event < m_events.size(); ++event)
        rolls.insert(m_events[event].roll);
    for (std::size_t event = first; event < m_events.size(); ++event) {
        std::string& roll = m_events[event].roll;
        if (roll.ends_with('B') && rolls.contains(roll.substr(0, roll.size() - 1)))
            roll.pop_back();
    }
}

PictureFrame EdlFrames::frameOf(std::size_t index, int frame, const FrameRules& rules) const
{
    const auto nameOf = [&rules](const WrittenEvent& event) { return rules.byClip ? event.clip : event.roll; };
    const auto strip = [&rules](const std::string& name) { return std::regex_replace(name, rules.version, "$1$2"); };
    const WrittenEvent& event = m_events[index];
    const std::string name = nameOf(event);
    if (frame < event.duration) {
        const WrittenEvent& before = m_events[index - 1];
        return {event.transition + std::to_string(event.duration) + " to " + strip(name) + " at " +
                    std::to_string(event.srcIn) + " from " + strip(nameOf(before)) + " at " +
                    std::to_string(before.srcOut),
                name, static_cast<double>(frame), 1.0, &event};
    }
    if (event.speed == 0.0)
        return {strip(name) + " frozen", name, static_cast<double>(event.srcIn), 1.0, &event};
    return {strip(name), name, event.srcIn + frame * event.speed, event.speed, &event};
}

int EdlFrames::length() const
{
    int length = 0;
    for (const FrameReel& reel : m_reels)
        length += static_cast<int>(reel.frames.size());
    return length;
}

const PictureFrame& EdlFrames::at(int frame) const
{
    for (const FrameReel& reel : m_reels) {
        if (frame < static_cast<int>(reel.frames.size()))
            return reel.frames.at(static_cast<std::size_t>(frame));
        frame -= static_cast<int>(reel.frames.size());
    }
    throw std::out_of_range("no frame of the programme");
}

int EdlFrames::timecodeOf(int frame) const
{
    for (const FrameReel& reel : m_reels) {
        if (frame < static_cast<int>(reel.frames.size()))
            return reel.timecode + frame;
        frame -= static_cast<int>(reel.frames.size());
    }
    throw std::out_of_range("no frame of the programme");
}

int EdlFrames::frameAt(int timecode) const
{
    int start = 0;
    for (const FrameReel& reel : m_reels) {
        const int length = static_cast<int>(reel.frames.size());
        if (timecode >= reel.timecode && timecode < reel.timecode + length)
            return start + timecode - reel.timecode;
        start += length;
    }
    throw std::out_of_range("no frame at " + timecodeOfFrames(timecode));
}

std::size_t EdlFrames::reelAt(int timecode) const
{
    for (std::size_t reel = 0; reel < m_reels.size(); ++reel) {
        if (m_reels[reel].timecode == timecode)
            return reel;
    }
    throw std::out_of_range("no reel at " + timecodeOfFrames(timecode));
}

int EdlFrames::startOf(std::size_t reel) const
{
    int start = 0;
    for (std::size_t before = 0; before < reel; ++before)
        start += static_cast<int>(m_reels.at(before).frames.size());
    return start;
}

} // namespace cadrel::tests
