// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EdlLoader.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Printable.h"
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

namespace cadrel::app {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::Timecode;
using core::fileio::parserFor;
using core::fileio::SourceLine;
using util::Result;
using util::StringUtil;

namespace {

/// A line of a file, shown in a message.
constexpr std::size_t MostCharactersOfALine = 120;

/// The line that an event was read from.
SourceLine lineOf(const EventBase& event)
{
    return {event.sourceLine(), event.comment().substr(0, event.comment().find('\n'))};
}

/// `line 12: "001 AX ..."`.
std::string quoted(const SourceLine& line)
{
    return "line " + std::to_string(line.number) + ": \"" + toPrintable(line.text, MostCharactersOfALine).text + "\"";
}

/// Whether a frames field of the event is beyond the rate.
bool exceeds(const EventBase& event, std::int32_t framesPerSecond)
{
    const auto beyond = [framesPerSecond](const Timecode& timecode) { return timecode.frames() >= framesPerSecond; };
    return beyond(event.srcIn()) || beyond(event.srcOut()) || beyond(event.dstIn()) || beyond(event.dstOut());
}

} // namespace

Framerate EdlLoader::chooseRate(const std::string& firstFile) const
{
    if (!m_options.rateLabel.empty())
        return Framerate::fromLabel(m_options.rateLabel);
    Framerate shown;
    const std::wstring path = toWide(firstFile);
    requireEdlSize(firstFile);
    if (parserFor(path)->detect(path, shown) != Result::Ok)
        throw unreadable(firstFile);
    if (const auto framerate = ProjectFramerate::fromShownRate(shown))
        return *framerate;
    // A file without anything readable needs different advice. At 60 frames a second every timecode can be read.
    const ProjectFramerate anyRate(Framerate(60, 0));
    LoadedEdl edl{firstFile, core::EventList(), {}, {}};
    load(edl);
    refuseUnreadable(edl);
    throw Failure{firstFile, "shows no frame rate", "give it with --rate, such as --rate \"24 fps\""};
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
        edl.events.load(path, edl.shown, m_options.renameBRolls, m_options.acceptAudio, *parser);
        edl.rateLine = parser->rateLine();
    } catch (const Result::Type&) {
        throw unreadable(edl.path);
    }
    if (edl.events.isEmpty())
        throw Failure{edl.path, "holds no events", "give a CMX EDL"};
}

void EdlLoader::checkRate(const LoadedEdl& edl) const
{
    const Framerate project = Timecode::framerate();
    const std::string label = ProjectFramerate::labelOf(project);
    const bool faster = edl.shown.framesPerSecond > project.framesPerSecond;
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
    const Failure failure{edl.path, where ? what + ", first in " + quoted(*where) : what, m_options.rateAdvice};
    if (m_options.strict)
        throw failure;
    m_terminal.warn(failure);
}

} // namespace cadrel::app
