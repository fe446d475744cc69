// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/Generation.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/settings/VfxNameMatcher.h"
#include "util/Result.h"

#include <cstddef>
#include <list>
#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventList;
using core::GenerationFailure;
using core::Settings;
using core::VfxNameMatcher;
using core::VfxPatternEntry;
using util::Result;

namespace {

VfxPatternEntry vfxPatternOf(const std::string& text)
{
    const std::size_t comma = text.find(',');
    if (comma == std::string::npos)
        throw UsageError{"--vfx: \"" + text + "\" has no comma between the texts before and after the version number"};
    const std::string prefix = text.substr(0, comma);
    const std::string postfix = text.substr(comma + 1);
    try {
        VfxNameMatcher().compile({{prefix, postfix}});
    } catch (const Result::Type&) {
        throw UsageError{prefix.empty() && postfix.empty()
                             ? "--vfx: give a text before or after the comma"
                             : "--vfx: \"" + text + "\" may hold letters, digits and . * - _ alone"};
    }
    return {prefix, postfix, true};
}

std::string reasonFor(Result::Type result)
{
    switch (result) {
    case Result::OutOfRange:
        return "a time would fall outside the 24 hours of a day";
    case Result::FrameOutOfRate:
        return "a frame number is greater than the frame rate";
    default:
        return "failure " + std::to_string(result);
    }
}

/// "event 5 in line 12 of reel3.edl (A012C004)".
std::string nameOf(const EventBase& event)
{
    return "event " + std::to_string(event.eventNumber()) + " in line " + std::to_string(event.sourceLine()) + " of " +
           event.edlFileName() + " (" + event.rollName() + ")";
}

Failure failureOf(const GenerationFailure& failed, Result::Type result, const GenerationOptions& options)
{
    const auto& [oldEvent, newEvent] = failed;
    const std::string reason = ": " + reasonFor(result);
    const std::string remedy = "correct its timecodes or leave it out";
    if (newEvent != nullptr && oldEvent != nullptr)
        return {newEvent->edlFileName(), nameOf(*newEvent) + " can't be matched with " + nameOf(*oldEvent) + reason,
                remedy};
    if (newEvent != nullptr || oldEvent != nullptr) {
        const EventBase& event = newEvent != nullptr ? *newEvent : *oldEvent;
        return {event.edlFileName(), nameOf(event) + " can't be used" + reason, remedy};
    }
    return {joined(inputsOf(options)), "no change EDL can be made" + reason, "check the timecodes"};
}

/// Fills the change list. Throws Failure.
void generate(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    terminal.showProgress("generating the change EDL");
    GenerationFailure failed;
    const Result::Type result = model.generateChangeEdl([&](const GenerationFailure& failure) { failed = failure; });
    if (result != Result::Ok)
        throw failureOf(failed, result, options);
}

} // namespace

std::vector<std::string> inputsOf(const GenerationOptions& options)
{
    std::vector<std::string> inputs = options.oldFiles;
    inputs.insert(inputs.end(), options.newFiles.begin(), options.newFiles.end());
    return inputs;
}

void configure(Settings& settings, const GivenSettings& given)
{
    for (const GivenSettings::Change& change : given.changes)
        change.apply(settings);
    std::vector<std::string> patterns = given.vfxPatterns;
    if (patterns.empty())
        return;
    if (std::erase(patterns, NoVfxPatterns) > 0 && !patterns.empty())
        throw UsageError{std::string("--vfx: give ") + NoVfxPatterns + " alone"};
    if (patterns.size() > Settings::VfxRowCount)
        throw UsageError{"--vfx: can be given " + std::to_string(Settings::VfxRowCount) + " times at most"};
    for (std::size_t row = 0; row < Settings::VfxRowCount; ++row)
        settings.setVfxPattern(row < patterns.size() ? vfxPatternOf(patterns[row]) : VfxPatternEntry(), row);
}

namespace {

std::vector<std::string> takeEvents(std::list<LoadedEdl> edls, EventList& events)
{
    std::vector<std::string> names;
    for (LoadedEdl& edl : edls) {
        EdlLoader::refuseUnreadable(edl);
        events.append(edl.events.release());
        names.push_back(fileNameOf(edl.path));
    }
    return names;
}

std::vector<std::string> loadCut(const std::vector<std::string>& files, EventList& events, const LoadOptions& options,
                                 Terminal& terminal)
{
    std::list<LoadedEdl> edls = EdlLoader(options, terminal).load(files);
    requireParted(edls, options.refusesSameTimecodes || options.strict, terminal);
    return takeEvents(std::move(edls), events);
}

} // namespace

std::vector<std::string> loadEvents(const EdlLoader& loader, const std::vector<std::string>& files, EventList& events)
{
    return takeEvents(loader.load(files), events);
}

Cuts loadCuts(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    LoadOptions load = options.load;
    load.shifts = FileShifts(options.shifts, inputsOf(options));
    return {loadCut(options.oldFiles, model.oldEdl(), load, terminal),
            loadCut(options.newFiles, model.newEdl(), load, terminal)};
}

Cuts generateChangeEdl(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    const Cuts cuts = loadCuts(model, options, terminal);
    generate(model, options, terminal);
    return cuts;
}

void requireChangeEvents(const DataModel& model, const GenerationOptions& options)
{
    if (model.changeEdl().isEmpty())
        throw Failure{joined(inputsOf(options)),
                      "nothing of the old cut survives in the new one, so there is no change EDL",
                      "see that both are of one reel, and try --match or --vfx"};
}

} // namespace cadrel::app
