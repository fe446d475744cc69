// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EdlLoader.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/ProjectFramerate.h"
#include "core/edl/EventBase.h"
#include "core/fileio/ParserChoice.h"
#include "core/fileio/ParserInterface.h"
#include "core/time/Timecode.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdint>

namespace cadrel::app {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::Timecode;
using core::fileio::parserFor;
using core::fileio::SourceLine;
using core::fileio::UnreadLine;
using util::Result;
using util::StringUtil;

namespace {

/// Of the unread lines of a file; the rest is counted.
constexpr std::size_t MostLinesTold = 10;

/// The fewest timecodes that tell a lower rate by the frames that none of them has. At 24 and 25 frames a second, one file of
/// 3500 of this size would tell it wrongly.
constexpr std::size_t FewestTimecodesForALowerRate = 200;

/// The nominal rates that timecodes show.
constexpr std::array<std::int32_t, 6> NominalRates{24, 25, 30, 48, 50, 60};

/// The line that an event was read from.
SourceLine lineOf(const EventBase& event)
{
    return {event.sourceLine(), event.comment().substr(0, event.comment().find('\n'))};
}

/// Whether a frames field of the event is beyond the rate.
bool exceeds(const EventBase& event, std::int32_t framesPerSecond)
{
    const auto beyond = [framesPerSecond](const Timecode& timecode) { return timecode.frames() >= framesPerSecond; };
    return beyond(event.srcIn()) || beyond(event.srcOut()) || beyond(event.dstIn()) || beyond(event.dstOut());
}

constexpr const char* LineRemedy = "correct the list, and save it as plain text";

/// The first of the lines, and how many there are more.
std::string firstOf(const std::vector<UnreadLine>& unread)
{
    const std::size_t more = unread.size() - 1;
    return textOf(unread.front()) + (more == 0 ? "" : ", and " + counted(more, "more line") + " like that");
}

} // namespace

Framerate EdlLoader::chooseRate(const std::string& firstFile) const
{
    if (!m_options.rateLabel.empty())
        return ProjectFramerate::fromLabel(m_options.rateLabel);
    Framerate shown;
    const std::wstring path = toWide(firstFile);
    requireEdlSize(firstFile);
    const auto parser = parserFor(path);
    parser->readThoroughly();
    if (parser->detect(path, shown) != Result::Ok)
        throw unreadable(firstFile);
    if (const auto framerate = ProjectFramerate::fromShownRate(shown)) {
        warnOfLikeRates(firstFile, *framerate);
        return *framerate;
    }
    // A file without anything readable needs different advice. At 60 frames a second every timecode can be read.
    const ProjectFramerate anyRate(Framerate(60, 0));
    LoadedEdl edl{firstFile, core::EventList(), {}, {}, {}};
    load(edl);
    refuseUnreadable(edl);
    throw Failure{firstFile, "shows no frame rate", "give it with --rate, such as --rate \"24 fps\""};
}

void EdlLoader::warnOfLikeRates(const std::string& file, const Framerate& judged) const
{
    // A list that fits 24, 25 or 30 fps is read at that.
    if (judged.framesPerSecond != NominalRates.back())
        return;
    const ProjectFramerate framerate(judged);
    LoadedEdl edl{file, core::EventList(), {}, {}, {}};
    load(edl);
    std::vector<std::string> labels;
    for (const std::int32_t rate : NominalRates) {
        if (edl.remarks.highestFrame < rate && rate < judged.framesPerSecond)
            labels.push_back(ProjectFramerate::labelOf({rate, 0}));
    }
    if (labels.empty() || edl.remarks.timecodeCount >= FewestTimecodesForALowerRate)
        return;
    tell({file,
          "is read at " + ProjectFramerate::labelOf(judged) + ", but has no frame number above " +
              std::to_string(edl.remarks.highestFrame) + ", so that it may be of " + labels.front() +
              (labels.size() > 1 ? " or " + labels.back() : ""),
          "give the right one with --rate, such as --rate \"" + labels.front() + "\""});
}

std::list<LoadedEdl> EdlLoader::load(const std::vector<std::string>& files) const
{
    std::list<LoadedEdl> edls;
    for (const std::string& file : files) {
        const auto same = [&file](const LoadedEdl& edl) { return isSameFile(edl.path, file); };
        if (std::none_of(edls.begin(), edls.end(), same)) {
            LoadedEdl& edl = edls.emplace_back();
            edl.path = file;
            load(edl);
            tellUnread(edl);
            checkRate(edl);
            m_options.shifts.apply(edl.path, edl.events, m_options.shiftedTimes);
        }
    }
    return edls;
}

void EdlLoader::refuseUnreadable(const LoadedEdl& edl)
{
    if (edl.events.hasReadableEvent())
        return;
    const std::string flaws = StringUtil::trim(edl.events.at(0).flawsText());
    throw Failure{edl.path, "holds no event that can be read (the first: " + flaws.substr(0, flaws.find('\n')) + ")",
                  "give the CMX EDL of a picture track"};
}

void EdlLoader::load(LoadedEdl& edl) const
{
    const std::wstring path = toWide(edl.path);
    requireEdlSize(edl.path);
    m_terminal.showProgress("reading " + fileNameOf(edl.path));
    try {
        const auto parser = parserFor(path);
        parser->readThoroughly();
        edl.events.load(path, edl.shown, m_options.renameBRolls, m_options.acceptAudio, *parser);
        edl.rateLine = parser->rateLine();
        edl.remarks = parser->remarks();
    } catch (const Result::Type&) {
        throw unreadable(edl.path);
    }
    if (!edl.events.isEmpty())
        return;
    const auto& unread = edl.remarks.unreadLines;
    if (unread.empty())
        throw Failure{edl.path, "holds no events", "give a CMX EDL"};
    throw Failure{edl.path, "holds no event that can be read; " + firstOf(unread), LineRemedy};
}

void EdlLoader::tellUnread(const LoadedEdl& edl) const
{
    const auto& unread = edl.remarks.unreadLines;
    if (m_options.strict && !unread.empty())
        throw Failure{edl.path, firstOf(unread), LineRemedy};
    const std::size_t told = std::min(unread.size(), MostLinesTold);
    for (std::size_t index = 0; index < told; ++index)
        m_terminal.warn({edl.path, textOf(unread[index]), LineRemedy});
    if (told < unread.size())
        m_terminal.warn(
            {edl.path, "and " + counted(unread.size() - told, "more line") + " like that", "--json lists them all"});
}

/// A warning, or a failure where warnings are failures.
void EdlLoader::tell(const Failure& failure) const
{
    if (m_options.strict)
        throw failure;
    m_terminal.warn(failure);
}

void EdlLoader::checkRate(const LoadedEdl& edl) const
{
    const Framerate project = Timecode::framerate();
    const std::string label = ProjectFramerate::labelOf(project);
    const bool hasFrames = edl.rateLine || edl.remarks.highestFrame >= project.framesPerSecond;
    const bool faster = edl.shown.framesPerSecond > project.framesPerSecond && hasFrames;
    if (!faster) {
        checkLowerRate(edl);
        checkDropFrame(edl);
    }
    const auto& events = edl.events.events();
    const auto first = std::find_if(events.begin(), events.end(), [&](const std::shared_ptr<EventBase>& event) {
        return faster ? exceeds(*event, project.framesPerSecond) : event->hasFlaw(EventFlaw::TimecodeInvalid);
    });
    if (!faster && first == events.end())
        return;

    const std::optional<SourceLine> where = first == events.end() ? edl.rateLine : lineOf(**first);
    const std::string what =
        faster
            ? "shows " + std::to_string(edl.shown.framesPerSecond) + " fps, more than the " + label + " of the project"
            : counted(edl.events.countInvalidTimecodes(), "event") + " with timecodes that don't exist at " + label;
    tell({edl.path, where ? what + ", first in " + quoted(*where) : what, m_options.rateAdvice});
}

void EdlLoader::checkLowerRate(const LoadedEdl& edl) const
{
    const Framerate project = Timecode::framerate();
    const std::size_t timecodeCount = edl.remarks.timecodeCount;
    const std::int32_t highestFrame = edl.remarks.highestFrame;
    const auto shown = std::upper_bound(NominalRates.begin(), NominalRates.end(), highestFrame);
    if (timecodeCount < FewestTimecodesForALowerRate || highestFrame == 0 || shown == NominalRates.end() ||
        *shown >= project.framesPerSecond)
        return;
    tell({edl.path,
          "shows " + std::to_string(*shown) + " fps in all of its " + std::to_string(timecodeCount) +
              " timecodes, less than the " + ProjectFramerate::labelOf(project) + " of the project",
          m_options.rateAdvice});
}

void EdlLoader::checkDropFrame(const LoadedEdl& edl) const
{
    const Framerate project = Timecode::framerate();
    const std::optional<SourceLine>& line = edl.remarks.dropFrameLine;
    const std::int32_t state = edl.remarks.dropFrame;
    if (!line || state == project.dropFrame)
        return;
    tell({edl.path,
          std::string("is of ") + (state == 1 ? "drop-frame" : "non-drop") + " timecode, unlike the " +
              ProjectFramerate::labelOf(project) + " of the project; " + quoted(*line),
          m_options.rateAdvice});
}

} // namespace cadrel::app
