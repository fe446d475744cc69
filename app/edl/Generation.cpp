// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/Generation.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/TransitionFault.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/settings/VfxNameMatcher.h"
#include "util/Result.h"

#include <algorithm>
#include <cstddef>
#include <list>
#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventList;
using core::FailureAnswer;
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
        if (const std::string fault = transitionFaultOf(event); !fault.empty())
            return {event.edlFileName(), nameOf(event) + " can't be used: " + fault,
                    "correct the duration of the " + transitionNameOf(event) + " or leave the event out"};
        return {event.edlFileName(), nameOf(event) + " can't be used" + reason, remedy};
    }
    return {joined(inputsOf(options)), "no change EDL can be made" + reason, "check the timecodes"};
}

/// Takes part in making a change EDL: tells of the events that can't be matched, and says whether to go on without them.
class Unmatched {
public:
    Unmatched(const GenerationOptions& options, Terminal& terminal) : m_options(options), m_terminal(terminal) {}

    FailureAnswer answer(const GenerationFailure& failed)
    {
        m_last = failed;
        if (m_options.load.strict)
            return FailureAnswer::Stop;
        ++m_count;
        if (m_texts.size() == MostKept)
            return FailureAnswer::PassOver;
        Failure failure = failureOf(failed, Result::OutOfRange, m_options);
        m_texts.push_back(failure.file + ": " + failure.problem);
        failure.problem += ", so it is passed over";
        if (m_count <= MostTold)
            m_terminal.warn(failure);
        return FailureAnswer::PassOver;
    }

    /// What the last failure means when it has stopped the work.
    Failure failureFor(Result::Type result) const { return failureOf(m_last, result, m_options); }

    void tellRest() const
    {
        if (m_count > MostTold)
            m_terminal.warn({joined(inputsOf(m_options)),
                             counted(m_count - MostTold, "more event") + " can't be matched and " +
                                 (m_count == MostTold + 1 ? "is" : "are") + " passed over",
                             "correct the timecodes"});
    }

    std::vector<std::string> release() { return std::move(m_texts); }

private:
    static constexpr std::size_t MostTold = 10;
    static constexpr std::size_t MostKept = 1000;

    const GenerationOptions& m_options;
    Terminal& m_terminal;
    GenerationFailure m_last;
    std::size_t m_count = 0;
    std::vector<std::string> m_texts;
};

/// Fills the change list; returns what it was made without. Throws Failure.
std::vector<std::string> generate(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    terminal.showProgress("generating the change EDL");
    Unmatched unmatched(options, terminal);
    const Result::Type result =
        model.generateChangeEdl([&](const GenerationFailure& failed) { return unmatched.answer(failed); });
    if (result != Result::Ok)
        throw unmatched.failureFor(result);
    unmatched.tellRest();
    return unmatched.release();
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

ReadFiles takeEvents(std::list<LoadedEdl> edls, EventList& events)
{
    ReadFiles read;
    for (LoadedEdl& edl : edls) {
        EdlLoader::refuseUnreadable(edl);
        events.append(edl.events.release());
        read.names.push_back(fileNameOf(edl.path));
        const std::string& title = edl.remarks.title;
        if (!title.empty() && std::find(read.titles.begin(), read.titles.end(), title) == read.titles.end())
            read.titles.push_back(title);
        read.unread.push_back({fileNameOf(edl.path), std::move(edl.remarks.unreadLines)});
    }
    return read;
}

ReadFiles loadCut(const std::vector<std::string>& files, EventList& events, const LoadOptions& options,
                  Terminal& terminal)
{
    std::list<LoadedEdl> edls = EdlLoader(options, terminal).load(files);
    std::vector<std::string> overlapping =
        requireParted(edls, options.refusesSameTimecodes || options.strict, terminal);
    ReadFiles read = takeEvents(std::move(edls), events);
    read.overlapping = std::move(overlapping);
    return read;
}

} // namespace

ReadFiles loadEvents(const EdlLoader& loader, const std::vector<std::string>& files, EventList& events)
{
    return takeEvents(loader.load(files), events);
}

Cuts loadCuts(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    LoadOptions load = options.load;
    load.renameBRolls = model.settings().bRollRenaming();
    load.shifts = FileShifts(options.shifts, inputsOf(options));
    ReadFiles oldFiles = loadCut(options.oldFiles, model.oldEdl(), load, terminal);
    ReadFiles newFiles = loadCut(options.newFiles, model.newEdl(), load, terminal);
    return {std::move(oldFiles.names),
            std::move(newFiles.names),
            std::move(oldFiles.unread),
            std::move(newFiles.unread),
            std::move(oldFiles.overlapping),
            std::move(newFiles.overlapping),
            {},
            std::move(oldFiles.titles),
            std::move(newFiles.titles)};
}

Cuts generateChangeEdl(DataModel& model, const GenerationOptions& options, Terminal& terminal)
{
    Cuts cuts = loadCuts(model, options, terminal);
    cuts.unmatched = generate(model, options, terminal);
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
