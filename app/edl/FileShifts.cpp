// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/FileShifts.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/edl/EdlLoader.h"
#include "core/edl/EventBase.h"
#include "core/picture/FrameRange.h"
#include "core/picture/PictureLine.h"
#include "core/picture/PictureNames.h"
#include "core/settings/MatchBy.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <optional>
#include <string_view>
#include <utility>

namespace cadrel::app {

using core::EventBase;
using core::EventList;
using core::FrameRange;
using core::FrameRanges;
using core::Framerate;
using core::Timecode;

namespace {

constexpr std::int32_t HoursOfADay = 24;

[[noreturn]] void refuse(const std::string& text, const std::string& why)
{
    throw UsageError{"--shift: \"" + text + "\" " + why, "give FILE=+HH:MM:SS:FF or FILE=-HH:MM:SS:FF"};
}

/// The file that is meant: a path, or the name of one file alone.
std::string fileMeant(const std::string& text, const std::string& name, const std::vector<std::string>& files)
{
    if (std::find(files.begin(), files.end(), name) != files.end())
        return name;
    std::vector<std::string> found;
    for (const std::string& file : files) {
        const bool isKnown = std::any_of(found.begin(), found.end(),
                                         [&file](const std::string& other) { return isSameFile(file, other); });
        if (fileNameOf(file) == name && !isKnown)
            found.push_back(file);
    }
    if (found.empty())
        refuse(text, "names no EDL of this run");
    if (found.size() > 1)
        refuse(text, "names more than one file; give the whole path");
    return found.front();
}

/// Moves one time of an event.
void move(EventBase& event, const Timecode& (EventBase::*get)() const, void (EventBase::*set)(const Timecode&),
          std::int32_t frames, const std::string& file)
{
    const Framerate framerate = Timecode::framerate();
    const Timecode& time = (event.*get)();
    if (!time.isInitialized() || !time.isValid(framerate))
        return;
    const std::int32_t moved = time.toFrameCount(framerate) + frames;
    if (!Timecode::isValidFrameCount(moved, framerate))
        throw Failure{file, "would leave the 24 hours of a day with this --shift", "give another"};
    Timecode timecode;
    timecode.setFrameCount(moved, framerate);
    (event.*set)(timecode);
}

FrameRanges pictureOf(const LoadedEdl& edl)
{
    core::PictureNames names(core::MatchBy::RollName, {});
    return core::PictureLine(edl.events, names, Timecode::framerate()).lit();
}

bool overlap(const FrameRanges& a, const FrameRanges& b)
{
    return without(a, b) != a;
}

/// By how many hours the picture has to move to stand where nothing is taken.
std::optional<std::int32_t> hoursThatPart(const FrameRanges& picture, const FrameRanges& taken)
{
    const Framerate framerate = Timecode::framerate();
    const auto isFree = [&](std::int32_t hours) {
        const std::int32_t frames = Timecode(std::abs(hours), 0, 0, 0).toFrameCount(framerate) * (hours < 0 ? -1 : 1);
        const FrameRanges moved = shiftedBy(frames, picture);
        return moved.front().start >= 0 && moved.back().end <= framerate.lastFrame && !overlap(moved, taken);
    };
    for (const std::int32_t sign : {1, -1}) {
        for (std::int32_t hours = 1; hours < HoursOfADay; ++hours) {
            if (isFree(sign * hours))
                return sign * hours;
        }
    }
    return std::nullopt;
}

std::string remedyFor(const LoadedEdl& edl, const std::optional<std::int32_t>& hours)
{
    if (!hours)
        return "give files of different timecodes";
    return "give --shift " + edl.path + "=" + (*hours < 0 ? "-" : "+") + Timecode(std::abs(*hours), 0, 0, 0).toString();
}

} // namespace

FileShifts::FileShifts(const std::vector<std::string>& texts, const std::vector<std::string>& files)
{
    for (const std::string& text : texts) {
        const std::size_t equals = text.rfind('=');
        if (equals == std::string::npos || equals + 1 >= text.size())
            refuse(text, "has no timecode after the file");
        const char sign = text[equals + 1];
        const std::string timecode = text.substr(equals + 2);
        if ((sign != '+' && sign != '-') || !Timecode::parse(timecode))
            refuse(text, "has no + or - and timecode after the file");
        m_shifts.push_back({fileMeant(text, text.substr(0, equals), files), timecode, sign == '-'});
    }
}

void FileShifts::apply(const std::string& file, EventList& events, Times times) const
{
    const auto shift = std::find_if(m_shifts.rbegin(), m_shifts.rend(),
                                    [&file](const Shift& other) { return isSameFile(other.file, file); });
    if (shift == m_shifts.rend())
        return;
    const Framerate framerate = Timecode::framerate();
    const Timecode timecode = *Timecode::parse(shift->timecode);
    if (!timecode.isValid(framerate))
        refuse(shift->timecode, "is no timecode at the frame rate");
    const std::int32_t frames = timecode.toFrameCount(framerate) * (shift->isBackwards ? -1 : 1);
    for (const auto& event : events.events()) {
        move(*event, &EventBase::dstIn, &EventBase::setDstIn, frames, file);
        move(*event, &EventBase::dstOut, &EventBase::setDstOut, frames, file);
        if (times == Times::Both) {
            move(*event, &EventBase::srcIn, &EventBase::setSrcIn, frames, file);
            move(*event, &EventBase::srcOut, &EventBase::setSrcOut, frames, file);
        }
    }
}

std::vector<std::string> requireParted(const std::list<LoadedEdl>& edls, bool isRefused, Terminal& terminal)
{
    std::vector<std::string> overlapping;
    FrameRanges taken;
    for (const LoadedEdl& edl : edls) {
        const FrameRanges picture = pictureOf(edl);
        if (overlap(picture, taken)) {
            const Failure failure{edl.path, "lies on the same timecode as another file of its cut",
                                  remedyFor(edl, hoursThatPart(picture, taken))};
            if (isRefused)
                throw failure;
            terminal.warn(failure);
            overlapping.push_back(fileNameOf(edl.path));
        }
        taken.insert(taken.end(), picture.begin(), picture.end());
        taken = united(std::move(taken));
    }
    return overlapping;
}

} // namespace cadrel::app
