// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/ListCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Replacing.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/EventJson.h"
#include "app/edl/EventTable.h"
#include "app/edl/ProjectFramerate.h"
#include "app/edl/ScreenTimecode.h"
#include "app/edl/TransitionFault.h"
#include "core/edl/EventBase.h"
#include "core/time/Timecode.h"

#include <array>
#include <cstddef>
#include <iostream>
#include <list>
#include <memory>
#include <optional>
#include <string_view>

namespace cadrel::app {

using core::EventBase;
using core::Timecode;

namespace {

struct Totals {
    std::size_t events = 0;
    std::size_t invalid = 0;
    std::array<std::size_t, 3> byTransition{}; ///< by TransitionType
    std::size_t overlong = 0;                  ///< with a transition that is longer than the event
    std::size_t retimed = 0;                   ///< of the valid events
    std::size_t reversed = 0;                  ///< of the retimed events
    std::size_t unreadLines = 0;
    std::optional<Timecode> start; ///< of the valid events
    std::optional<Timecode> end;

    void count(const EventBase& event)
    {
        ++events;
        overlong += transitionFaultOf(event).empty() ? 0U : 1U;
        ++byTransition.at(static_cast<std::size_t>(event.transitionType()));
        if (!event.isValid()) {
            ++invalid;
            return;
        }
        retimed += event.isNormalSpeed() && !event.isReversed() ? 0U : 1U;
        reversed += event.isReversed() ? 1U : 0U;
        if (!start || event.dstIn() < *start)
            start = event.dstIn();
        if (!end || event.dstOut() > *end)
            end = event.dstOut();
    }
};

Totals totalsOf(const std::list<LoadedEdl>& edls)
{
    Totals totals;
    for (const LoadedEdl& edl : edls) {
        for (const auto& event : edl.events.events())
            totals.count(*event);
        totals.unreadLines += edl.remarks.unreadLines.size();
    }
    return totals;
}

std::string toText(const Totals& totals, const std::string& rate)
{
    std::string text =
        "Events      " + std::to_string(totals.events) + ", " +
        (totals.invalid == 0 ? "all valid" : std::to_string(totals.invalid) + " invalid") +
        (totals.overlong == 0 ? ""
                              : ", " + std::to_string(totals.overlong) + " with a transition longer than the event") +
        "\n" + "            " + counted(totals.byTransition[0], "cut") + ", " +
        counted(totals.byTransition[1], "dissolve") + ", " + counted(totals.byTransition[2], "wipe") + ", " +
        std::to_string(totals.retimed) + " retimed" +
        (totals.reversed == 0 ? "" : ", " + std::to_string(totals.reversed) + " of them reversed") + "\n";
    if (totals.unreadLines > 0)
        text += "Not read    " + counted(totals.unreadLines, "line") + "\n";
    const auto timecodeText = [](const Timecode& timecode) {
        return onScreen(timecode.toString(), Timecode::framerate());
    };
    if (totals.start)
        text += "Programme   " + timecodeText(*totals.start) + " - " + timecodeText(*totals.end) + ", " +
                timecodeText(*totals.end - *totals.start) + " long\n";
    return text + "Frame rate  " + rate + "\n";
}

std::vector<std::shared_ptr<EventBase>> allEvents(const std::list<LoadedEdl>& edls)
{
    std::vector<std::shared_ptr<EventBase>> events;
    for (const LoadedEdl& edl : edls)
        events.insert(events.end(), edl.events.events().begin(), edl.events.events().end());
    return events;
}

void writeJson(const std::list<LoadedEdl>& edls, const std::string& rate, const ListOptions& options)
{
    std::vector<std::string> names;
    std::vector<UnreadOfFile> unread;
    for (const LoadedEdl& edl : edls) {
        names.push_back(fileNameOf(edl.path));
        unread.push_back({names.back(), edl.remarks.unreadLines});
    }
    std::optional<Interruption> interruption;
    if (!Output::isStandardOutput(options.jsonFile))
        interruption.emplace();
    Output json(options.jsonFile, options.isReplacing);
    EventJson::write(allEvents(edls), {{"files", names}, {"rate", rate}, {"unread", toJson(unread)}},
                     [&json](std::string_view text) { json.write(text); });
    json.place();
}

} // namespace

void runList(const ListOptions& options, Terminal& terminal)
{
    const bool jsonOnly = Output::isStandardOutput(options.jsonFile);
    if (Output::isFile(options.jsonFile)) {
        refuseToOverwrite(options.files, options.jsonFile);
        requireReplaceable({options.jsonFile}, {.isAllowed = options.isReplacing});
    }
    LoadOptions load = options.load;
    load.shifts = FileShifts(options.shifts, options.files);
    const EdlLoader loader(load, terminal);
    const ProjectFramerate rate(loader.chooseRate(options.files.front()));
    const std::string label = ProjectFramerate::labelOf(rate.getFramerate());
    // Deleting a long list event by event takes a quarter of the whole time; the end of the program frees it at once.
    static const auto& edls = *new std::list<LoadedEdl>(loader.load(options.files));

    terminal.clearProgress();
    if (!options.jsonFile.empty())
        writeJson(edls, label, options);
    if (jsonOnly)
        return;
    if (!options.summary) {
        EventTable(allEvents(edls), Terminal::wantsColour()).print(std::cout);
        std::cout << '\n';
    }
    std::cout << toText(totalsOf(edls), label);
    flushStandardOutput();
}

} // namespace cadrel::app
