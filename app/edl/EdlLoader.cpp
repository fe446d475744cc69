// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/EdlLoader.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Printable.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/ProjectFramerate.h"
#include "core/edl/EventBase.h"
#include "core/fileio/CmxParser.h"
#include "core/time/Timecode.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <fstream>
#include <functional>
#include <string_view>

namespace cadrel::app {

using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::Timecode;
using util::Result;
using util::StringUtil;

namespace {

/// A line of a file, shown in a message.
constexpr std::size_t MostCharactersOfALine = 120;

std::string firstLineOf(const EventBase& event)
{
    return event.comment().substr(0, event.comment().find('\n'));
}

/// The first line of the file that passes the test, as `line 12: "001 AX ..."`; empty when there is none.
std::string quoteLine(const std::string& path, const std::function<bool(std::string_view)>& test)
{
    std::ifstream file(path, std::ios::binary);
    const std::string content((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    std::string_view rest = content;
    for (std::size_t number = 1; !rest.empty(); ++number) {
        const std::size_t end = std::min(rest.find_first_of("\r\n"), rest.size());
        const std::string_view line = StringUtil::trimView(rest.substr(0, end));
        if (test(line))
            return "line " + std::to_string(number) + ": \"" + toPrintable(line, MostCharactersOfALine).text + "\"";
        rest.remove_prefix(end);
        rest.remove_prefix(rest.starts_with("\r\n") ? 2 : std::min<std::size_t>(rest.size(), 1));
    }
    return {};
}

bool saysDropFrame(std::string_view line)
{
    return line.starts_with("FCM") && line.find("DROP FRAME") != std::string_view::npos &&
           line.find("NON-DROP FRAME") == std::string_view::npos;
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
    if (core::fileio::CmxParser().detect(toWide(firstFile), shown) != Result::Ok)
        throw unreadable(firstFile);
    if (const auto framerate = ProjectFramerate::fromShownRate(shown))
        return *framerate;
    // A file without anything readable needs different advice. At 60 frames a second every timecode can be read.
    const ProjectFramerate anyRate(Framerate(60, 0));
    LoadedEdl edl{firstFile, core::EventList(), {}};
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
    m_terminal.showProgress("reading " + fileNameOf(edl.path));
    try {
        edl.events.load(path, true, edl.shown, m_options.renameBRolls, m_options.acceptAudio);
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

    const std::string where =
        first == events.end() ? quoteLine(edl.path, saysDropFrame)
                              : quoteLine(edl.path, [text = firstLineOf(**first)](auto line) { return line == text; });
    const std::string what =
        faster
            ? "shows " + std::to_string(edl.shown.framesPerSecond) + " fps, more than the " + label + " of the project"
            : counted(edl.events.countInvalidTimecodes(), "event") + " with timecodes that don't exist at " + label;
    const Failure failure{edl.path, where.empty() ? what : what + ", first in " + where, m_options.rateAdvice};
    if (m_options.strict)
        throw failure;
    m_terminal.warn(failure);
}

} // namespace cadrel::app
