// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyCommand.h"

#include "app/apply/ApplyFacts.h"
#include "app/apply/ApplyJson.h"
#include "app/apply/ApplyListing.h"
#include "app/apply/HostedProject.h"
#include "app/apply/ProgrammeShift.h"
#include "app/apply/ProjectComparison.h"
#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/JsonOutput.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/EventJson.h"
#include "app/project/ProjectAccess.h"
#include "app/project/ProjectClock.h"
#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <chrono>
#include <iostream>
#include <limits>
#include <optional>
#include <string_view>
#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventFlaw;
using core::Framerate;
using core::Settings;
using core::Timecode;

namespace {

/// The project file to write; empty for none.
const std::string& targetOf(const ApplyOptions& options)
{
    return options.inPlace ? options.projectFile : options.outputFile;
}

/// Throws UsageError when an output would overwrite another file of this run.
void checkOutputs(const ApplyOptions& options)
{
    if (options.outputFile == "-")
        throw UsageError{"-o: \"-\" is no file name; the report goes to standard output with --json -"};
    std::vector<std::string> taken = inputsOf(options.generation);
    taken.insert(taken.end(), options.changeFiles.begin(), options.changeFiles.end());
    if (options.inPlace)
        refuseToOverwrite(taken, options.projectFile);
    if (!options.outputFile.empty()) {
        if (isSameFile(options.projectFile, options.outputFile))
            throw UsageError{options.outputFile + ": is the project itself", "give --in-place to replace it"};
        refuseToOverwrite(taken, options.outputFile);
        taken.push_back(options.outputFile);
    }
    taken.push_back(options.projectFile);
    if (JsonOutput::isFile(options.jsonFile))
        refuseToOverwrite(taken, options.jsonFile);
}

/// Throws Failure when the project doesn't run at the rate that the user gave.
void requireRate(const ApplyOptions& options, const ProjectClock& clock)
{
    const std::string& rate = options.generation.load.rateLabel;
    if (!rate.empty() && rate != clock.rateLabel())
        throw Failure{options.projectFile, "runs at " + clock.rateLabel() + " and not at " + rate,
                      "give the EDLs of this project, or correct its rate"};
}

/// A timecode of the project's clock, which may show times before midnight: "-00:00:02:00". In seconds.
double secondsOf(const std::string& text)
{
    const bool isNegative = text.starts_with('-');
    const std::optional<Timecode> timecode = Timecode::parse(std::string_view(text).substr(isNegative ? 1 : 0));
    if (!timecode || !timecode->isValid())
        throw UsageError{"--preserve: \"" + text + "\" is no timecode of the project"};
    return isNegative ? -timecode->toSeconds() : timecode->toSeconds();
}

/// Puts the stretch that may change into the settings, where the user gave one. Throws UsageError.
void restrictRange(Settings& settings, const std::vector<std::string>& preserve)
{
    if (preserve.empty())
        return;
    const double before = secondsOf(preserve[0]);
    const double after = secondsOf(preserve[1]);
    if (!(before < after))
        throw UsageError{"--preserve: the second timecode has to be after the first"};
    settings.setRestrictRange(true);
    settings.setPreserveMaterial(before, after);
}

/// What the change EDL of the model was made of.
struct ChangeSource {
    std::optional<Cuts> cuts; ///< nothing when it was given
    std::vector<std::string> fileNames;
};

/// Puts the change EDL into the model, and both cuts when it is made of them. Throws Failure.
ChangeSource fillChangeList(DataModel& model, const ApplyOptions& options, Terminal& terminal)
{
    // The lists of an earlier run belong to other cuts.
    for (core::EventList* const list : {&model.oldEdl(), &model.newEdl(), &model.changeEdl()})
        list->clear();
    GenerationOptions generation = options.generation;
    generation.load.renameBRolls = model.settings().bRollRenaming();
    generation.load.rateAdvice = "check the file and the frame rate of the project";
    if (options.changeFiles.empty())
        return {generateChangeEdl(model, generation, terminal), {}};
    generation.load.acceptAudio = true;
    return {std::nullopt, loadEvents(EdlLoader(generation.load, terminal), options.changeFiles, model.changeEdl())};
}

/// The stretch of the new programme that a run may change, in seconds of the project's clock.
struct Bounds {
    explicit Bounds(const Settings& settings)
    {
        if (settings.restrictRange()) {
            start = settings.preserveMaterialBefore();
            end = settings.preserveMaterialAfter();
        }
    }

    double start = std::numeric_limits<double>::lowest();
    double end = std::numeric_limits<double>::max();
};

/// Why a run leaves the event out; empty when it doesn't.
std::string obstacleOf(const EventBase& event, const Framerate& framerate, const Bounds& bounds,
                       const std::string& rateLabel)
{
    if (event.hasFlaw(EventFlaw::TimecodeInvalid))
        return "has a timecode that doesn't exist at " + rateLabel;
    const std::int32_t sourceFrames = event.srcOut().toFrameCount(framerate) - event.srcIn().toFrameCount(framerate);
    if (sourceFrames == 0)
        return "nothing of the old programme goes there";
    if (sourceFrames < 0)
        return "its source ends before it begins";
    if (event.dstIn().toSeconds(framerate) >= bounds.end || event.dstOut().toSeconds(framerate) <= bounds.start)
        return "lies outside of the stretch that may change";
    return {};
}

/// Throws Failure when nothing would be left to apply: such a run would only empty the tracks.
std::vector<PassedOver> passedOver(const DataModel& model, const std::string& rateLabel, const ApplyOptions& options)
{
    const Bounds bounds(model.settings());
    std::vector<PassedOver> passed;
    for (const auto& event : model.changeEdl().events()) {
        const std::string reason = obstacleOf(*event, Timecode::framerate(), bounds, rateLabel);
        if (!reason.empty())
            passed.push_back({event.get(), reason});
    }
    if (passed.size() == model.changeEdl().size())
        throw Failure{options.changeFiles.empty() ? joined(inputsOf(options.generation)) : joined(options.changeFiles),
                      "no change event can be applied (the first: " + passed.front().reason + ")",
                      "check the timecodes and the frame rate of the project"};
    return passed;
}

/// What a run of the change list means for the times of the project, which begin at `origin`.
ProgrammeShift shiftOf(const DataModel& model, double origin)
{
    const Framerate framerate = Timecode::framerate();
    const Bounds bounds(model.settings());
    ProgrammeShift shift;
    shift.add(std::numeric_limits<double>::lowest(), bounds.start - origin, 0.0);
    shift.add(bounds.end - origin, std::numeric_limits<double>::max(), 0.0);
    for (const auto& event : model.changeEdl().events()) {
        if (event->hasFlaw(EventFlaw::TimecodeInvalid))
            continue;
        const double source = event->srcIn().toSeconds(framerate);
        const double start = event->dstIn().toSeconds(framerate);
        const double end = start + event->srcOut().toSeconds(framerate) - source;
        shift.add(std::max(start, bounds.start) - origin, std::min(end, bounds.end) - origin, start - source);
    }
    return shift;
}

/// What can be told before the run.
ApplyFacts factsOf(HostedProject& hosted, const ChangeSource& source, const ApplyOptions& options)
{
    const DataModel& model = hosted.model();
    ApplyFacts facts(model);
    facts.projectName = fileNameOf(options.projectFile);
    facts.timeOrigin = hosted.project().timeOrigin();
    if (source.cuts)
        facts.generation.emplace(model, *source.cuts, Timecode::framerate());
    facts.changeNames = source.fileNames;
    facts.passedOver = passedOver(model, clockOf(hosted.project(), options.projectFile).rateLabel(), options);
    facts.written = targetOf(options);
    facts.jsonFile = JsonOutput::isFile(options.jsonFile) ? options.jsonFile : std::string();
    return facts;
}

/// Takes the markers of earlier runs out that a run has replaced by its own, so that those count as new where they are the
/// same.
void forgetReplacedMarkers(ProjectState& state, const Settings& settings, double origin)
{
    const auto isReplaced = [&](const Placement& marker) {
        const double start = marker.start + origin;
        return !settings.restrictRange() || (start - settings.preserveMaterialBefore() > -standin::SameInstant &&
                                             settings.preserveMaterialAfter() - start >= standin::SameInstant);
    };
    for (auto& [track, placements] : state) {
        if (isMarkedByRuns(*track) && !track->isLocked())
            std::erase_if(placements, isReplaced);
    }
}

/// Runs, and adds what that did to the project.
void apply(HostedProject& hosted, ApplyFacts& facts)
{
    ProjectState before = stateOf(hosted.project());
    const auto start = std::chrono::steady_clock::now();
    hosted.apply();
    facts.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    forgetReplacedMarkers(before, hosted.model().settings(), facts.timeOrigin);
    facts.tracks = compare(before, hosted.project(), shiftOf(hosted.model(), facts.timeOrigin));
}

/// Writes the files of the run, all or none. Throws Failure.
void write(HostedProject& hosted, const ApplyJson& report, const ApplyOptions& options)
{
    std::optional<JsonOutput> json;
    if (!options.jsonFile.empty()) {
        json.emplace(options.jsonFile);
        EventJson::write(hosted.model().changeEdl().events(), report.toJson(),
                         [&](std::string_view text) { json->write(text); });
        json->finish();
    }
    Interruption::check();
    if (!targetOf(options).empty())
        hosted.save(targetOf(options));
    if (json)
        json->keep();
}

void print(const ApplyListing& listing, const ApplyOptions& options)
{
    listing.printTotals(std::cout);
    if (!options.summary) {
        std::cout << '\n';
        listing.printMoves(std::cout);
        std::cout << '\n';
        listing.printMarkers(std::cout);
    }
    flushStandardOutput();
}

} // namespace

void runApply(const ApplyOptions& options, Terminal& terminal)
{
    checkOutputs(options);
    Settings trial; // so that wrong usage is told at once
    configure(trial, options.generation.settings);

    terminal.showProgress("reading " + fileNameOf(options.projectFile));
    HostedProject hosted(options.projectFile, terminal);
    const ProjectClock clock = clockOf(hosted.project(), options.projectFile);
    requireRate(options, clock);
    configure(hosted.model().settings(), options.generation.settings);
    restrictRange(hosted.model().settings(), options.generation.settings.preserve);
    const ChangeSource source = fillChangeList(hosted.model(), options, terminal);
    ApplyFacts facts = factsOf(hosted, source, options);

    std::optional<Interruption> interruption(std::in_place);
    terminal.clearProgress();
    apply(hosted, facts);
    terminal.showProgress("writing");
    write(hosted, ApplyJson(facts, clock), options);
    interruption.reset();

    terminal.clearProgress();
    if (!JsonOutput::isStandardOutput(options.jsonFile))
        print(ApplyListing(facts, clock), options);
}

} // namespace cadrel::app
