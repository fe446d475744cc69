// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/apply/ApplyCommand.h"

#include "app/apply/ApplyFacts.h"
#include "app/apply/ApplyJson.h"
#include "app/apply/ApplyListing.h"
#include "app/apply/ApplyNotes.h"
#include "app/apply/HostedProject.h"
#include "app/apply/KeptRun.h"
#include "app/apply/Plausibility.h"
#include "app/apply/ProjectComparison.h"
#include "app/apply/RunMaterial.h"
#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/EventJson.h"
#include "app/edl/ProjectClock.h"
#include "app/notes/NotesForms.h"
#include "app/project/ProjectAccess.h"
#include "core/cut/ProgrammeShift.h"
#include "core/edl/EventBase.h"
#include "core/keep/ChangeStretch.h"
#include "core/keep/PastRuns.h"
#include "core/model/DataModel.h"
#include "core/protect/RunRecord.h"
#include "core/time/SecondsRange.h"
#include "core/time/Timecode.h"
#include "standin/base/Times.h"
#include "standin/project/Project.h"
#include "standin/project/ProjectForm.h"
#include "util/Result.h"

#include <algorithm>
#include <chrono>
#include <iostream>
#include <limits>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::FrameRanges;
using core::Framerate;
using core::ProgrammeShift;
using core::Settings;
using core::Timecode;

namespace {

/// The project file to write; empty for none.
const std::string& targetOf(const ApplyOptions& options)
{
    return options.inPlace ? options.projectFile : options.outputFile;
}

/// Throws UsageError when an output would overwrite another file of this run, and Failure when it would overwrite one that the
/// user hasn't given up.
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
        requireReplaceable({options.outputFile}, options.replacing);
        taken.push_back(options.outputFile);
    }
    taken.push_back(options.projectFile);
    if (!options.notesFile.empty()) {
        notesWriterFor("--notes", options.notesFile);
        refuseToOverwrite(taken, options.notesFile);
        requireReplaceable({options.notesFile}, options.replacing);
        taken.push_back(options.notesFile);
    }
    if (Output::isFile(options.jsonFile)) {
        refuseToOverwrite(taken, options.jsonFile);
        requireReplaceable({options.jsonFile}, options.replacing);
    }
}

HostedProject::Opening openingOf(const ApplyOptions& options)
{
    if (!options.isFresh)
        return HostedProject::Opening::WithStored;
    return options.inPlace ? HostedProject::Opening::FreshInPlace : HostedProject::Opening::Fresh;
}

/// Leaves the model as that of a project without any run. The settings forget their VFX patterns, too.
void forgetStored(DataModel& model)
{
    model.reset();
    model.settings() = Settings();
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

/// The EDLs of the run, in a message.
std::string edlsOf(const ApplyOptions& options)
{
    return options.changeFiles.empty() ? joined(inputsOf(options.generation)) : joined(options.changeFiles);
}

/// Throws UsageError.
FileShifts shiftsOf(const ApplyOptions& options)
{
    std::vector<std::string> files = inputsOf(options.generation);
    files.insert(files.end(), options.changeFiles.begin(), options.changeFiles.end());
    return {options.generation.shifts, files};
}

/// What the change EDL of the model was made of.
struct ChangeSource {
    std::optional<Cuts> cuts; ///< nothing when it was given
    ReadFiles files;          ///< its files then
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
    generation.load.refusesSameTimecodes = !options.isForced;
    if (options.changeFiles.empty())
        return {generateChangeEdl(model, generation, terminal), {}};
    generation.load.acceptAudio = true;
    generation.load.shifts = shiftsOf(options);
    generation.load.shiftedTimes = FileShifts::Times::Both;
    return {std::nullopt, loadEvents(EdlLoader(generation.load, terminal), options.changeFiles, model.changeEdl())};
}

/// The stretch of the new programme that a run may change, in seconds of the project's clock.
struct Bounds {
    /// `kept` is null for a run that isn't planned.
    Bounds(const Settings& settings, const KeptRun* kept)
    {
        if (kept && kept->needsRun()) {
            start = kept->bounds().start;
            end = kept->bounds().end;
        } else if (settings.restrictRange()) {
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
    const Bounds bounds(model.settings(), nullptr);
    std::vector<PassedOver> passed;
    for (const auto& event : model.changeEdl().events()) {
        const std::string reason = obstacleOf(*event, Timecode::framerate(), bounds, rateLabel);
        if (!reason.empty())
            passed.push_back({event.get(), reason});
    }
    if (passed.size() == model.changeEdl().size())
        throw Failure{edlsOf(options), "no change event can be applied (the first: " + passed.front().reason + ")",
                      "check the timecodes and the frame rate of the project"};
    return passed;
}

/// What a run of the change list means for the times of the project, which begin at `origin`.
ProgrammeShift shiftOf(const DataModel& model, const KeptRun* kept, double origin)
{
    const Framerate framerate = Timecode::framerate();
    const Bounds bounds(model.settings(), kept);
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

/// Throws the failure, or warns of it when the user has said to go on.
void require(const std::optional<Failure>& doubt, const ApplyOptions& options, Terminal& terminal)
{
    if (!doubt)
        return;
    if (!options.isForced)
        throw *doubt;
    terminal.warn({doubt->file, doubt->problem, "--force goes on all the same"});
}

/// What a run leaves of a marker of an earlier one; `changed` in seconds of the project.
std::vector<Placement> leftOf(const Placement& marker, const core::SecondsRange& changed)
{
    const bool startsIn =
        marker.start - changed.start > -standin::SameInstant && changed.end - marker.start >= standin::SameInstant;
    if (marker.kind == Placement::Kind::Point)
        return startsIn ? std::vector<Placement>() : std::vector{marker};
    Placement before = marker;
    before.end = std::min(marker.end, changed.start);
    Placement after = marker;
    after.start = std::max(marker.start, changed.end);
    std::vector<Placement> left{before, after};
    std::erase_if(left, [](const Placement& piece) { return piece.length() < standin::SameInstant; });
    return left;
}

/// Takes out of the markers of earlier runs what a run has replaced by its own, so that those count as new where they are the
/// same. `changed` is what the run may change, in seconds of the project's clock; null for all.
void forgetReplacedMarkers(ProjectState& state, const core::SecondsRange* changed, double origin)
{
    for (auto& [track, placements] : state) {
        if (!isMarkedByRuns(*track) || track->isLocked())
            continue;
        std::vector<Placement> left;
        for (const Placement& marker : placements) {
            if (!changed)
                break;
            for (Placement& piece : leftOf(marker, {changed->start - origin, changed->end - origin}))
                left.push_back(std::move(piece));
        }
        std::ranges::stable_sort(left, {}, &Placement::start);
        placements = std::move(left);
    }
}

/// What the run that was made could change, in seconds of the project's clock; nothing where it could change all.
std::optional<core::SecondsRange> changedRange(const Settings& settings, const KeptRun* kept)
{
    if (kept)
        return kept->bounds();
    if (settings.restrictRange())
        return core::SecondsRange{settings.preserveMaterialBefore(), settings.preserveMaterialAfter()};
    return std::nullopt;
}

/// What of the old programme the run carries over or leaves alone.
FrameRanges sourcesOf(const DataModel& model, const KeptRun* kept)
{
    FrameRanges sources;
    if (kept) {
        for (const auto* events : {&kept->plan().events, &kept->plan().untouched}) {
            for (const core::KeptEvent& event : *events)
                sources.push_back(event.source());
        }
        return sources;
    }
    for (const auto& event : model.changeEdl().events()) {
        if (const auto stretch = core::changeStretchOf(*event, Timecode::framerate()))
            sources.push_back(stretch->source());
    }
    return sources;
}

/// Adds what isn't stored with the project.
void addChoices(SettingsReport& settings, const ApplyOptions& options)
{
    using Origin = SettingsReport::Origin;
    const std::string kept = options.keep == ApplyOptions::Keep::All ? "all" : "cut";
    settings.add({"keep", "--keep " + kept, kept, options.isKeepGiven ? Origin::CommandLine : Origin::Default});
    settings.add({"force", options.isForced ? "--force" : "", options.isForced,
                  options.isForced ? Origin::CommandLine : Origin::Default});
}

/// What the run is going to be, and what is known of it before.
class Preparation {
public:
    /// Throws Failure where the run can't be done, or where it doesn't look as if the user meant it.
    /// `lastAllowed` is what the last run of the project could change.
    Preparation(HostedProject& hosted, const ProjectClock& clock, const ApplyOptions& options,
                const core::FrameRange& lastAllowed, Terminal& terminal)
        : m_hosted(hosted), m_clock(clock), m_options(options), m_edls(edlsOf(options)), m_facts(hosted.model())
    {
        DataModel& model = hosted.model();
        const core::PastRuns runs = core::RunRecord::findOrGuess(model, lastAllowed);
        const ChangeSource source = fillChangeList(model, options, terminal);
        m_facts.projectName = fileNameOf(options.projectFile);
        if (const standin::ProjectForm* const form = hosted.project().form())
            m_facts.staying = form->staying();
        m_facts.timeOrigin = hosted.project().timeOrigin();
        m_facts.cuts = source.cuts;
        m_facts.changeNames = source.files.names;
        m_facts.changeUnread = source.files.unread;
        m_facts.settings.emplace(model.settings(), options.generation.settings, source.cuts.has_value(),
                                 timeText(hosted.project(), clock));
        addChoices(*m_facts.settings, options);
        m_facts.written = targetOf(options);
        m_facts.jsonFile = Output::isFile(options.jsonFile) ? options.jsonFile : std::string();
        m_facts.notesFile = options.notesFile;
        const Plausibility plausibility(model, options.projectFile, m_edls);
        const core::NextRun next(model, sourceOf(source));
        if (source.cuts)
            checkCuts(plausibility, next, runs, terminal);
        require(plausibility.doubtOfChanges(next, runs), options, terminal);
        core::RunRecord::write(runs, model);
        plan(source.cuts.has_value(), terminal);
        if (source.cuts) {
            require(plausibility.doubtOfSurvival(sourcesOf(model, m_kept ? &*m_kept : nullptr)), options, terminal);
            m_facts.generation.emplace(model, isPlanned(source) ? m_kept->carried() : model.changeEdl(), *source.cuts,
                                       Timecode::framerate());
        }
    }

    const KeptRun* kept() const { return m_kept ? &*m_kept : nullptr; }
    ApplyFacts& facts() { return m_facts; }

private:
    bool isPlanned(const ChangeSource& source) const { return m_kept && source.cuts; }

    static KeptRun::Source sourceOf(const ChangeSource& source)
    {
        return source.cuts ? KeptRun::Source::Generated : KeptRun::Source::Given;
    }

    void checkCuts(const Plausibility& plausibility, const core::NextRun& next, const core::PastRuns& runs,
                   Terminal& terminal)
    {
        require(plausibility.doubtOfLastCut(next, runs), m_options, terminal);
        require(plausibility.doubtOfNames(), m_options, terminal);
        require(plausibility.doubtOfSound(m_hosted.project()), m_options, terminal);
        if (const auto dull = plausibility.dullNames()) {
            terminal.warn(dull->warning);
            m_facts.matchText = dull->summary;
        }
        if (m_options.keep == ApplyOptions::Keep::Cut)
            requireChangeEvents(m_hosted.model(), m_options.generation);
    }

    void plan(bool isGenerated, Terminal& terminal)
    {
        DataModel& model = m_hosted.model();
        const bool isPlanned = m_options.keep == ApplyOptions::Keep::All;
        if (!isPlanned || !isGenerated)
            m_facts.passedOver = passedOver(model, m_clock.rateLabel(), m_options);
        m_facts.appliedCount = model.changeEdl().size() - m_facts.passedOver.size();
        if (!isPlanned)
            return;
        m_kept.emplace(model, m_hosted.project(), m_clock,
                       isGenerated ? KeptRun::Source::Generated : KeptRun::Source::Given, m_edls,
                       [&](const Failure& doubt) { require(doubt, m_options, terminal); });
        m_facts.isRunNeeded = m_kept->needsRun();
        m_facts.isHeldBack = m_kept->plan().isHeldBack;
        const Framerate framerate = Timecode::framerate();
        for (const core::FrameRange& range : m_kept->plan().lost)
            m_facts.lost.push_back({range.start / framerate.rate, range.end / framerate.rate});
        if (!isGenerated)
            return;
        m_facts.appliedCount = model.changeEdl().size();
        m_facts.kept = m_kept->plan().events;
        for (const auto& event : m_kept->outside().events())
            m_facts.passedOver.push_back({event.get(), "lies outside of the stretch that may change"});
    }

    HostedProject& m_hosted;
    const ProjectClock& m_clock;
    const ApplyOptions& m_options;
    const std::string m_edls;
    ApplyFacts m_facts;
    std::optional<KeptRun> m_kept; ///< nothing where the change EDL alone counts
};

/// Runs, and adds what that did to the project.
void apply(HostedProject& hosted, const KeptRun* kept, ApplyFacts& facts)
{
    ProjectState before = stateOf(hosted.project());
    const auto start = std::chrono::steady_clock::now();
    if (kept)
        kept->apply(hosted);
    else
        hosted.apply();
    facts.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    if (!kept || kept->needsRun()) {
        const auto changed = changedRange(hosted.model().settings(), kept);
        forgetReplacedMarkers(before, changed ? &*changed : nullptr, facts.timeOrigin);
    }
    facts.tracks = compare(before, hosted.project(), shiftOf(hosted.model(), kept, facts.timeOrigin));
}

void writeReport(Output& output, const core::DataModel& model, const ApplyJson& report)
{
    EventJson::write(
        model.changeEdl().events(), report.toJson(), [&](std::string_view text) { output.write(text); },
        [&](std::size_t index) { return report.partsOf(index); });
}

/// Whether something is told that stands in change notes. A change EDL alone has none.
bool wantsNotes(const ApplyOptions& options)
{
    const bool printsThem = !options.summary && !Output::isStandardOutput(options.jsonFile);
    return options.changeFiles.empty() && (!options.notesFile.empty() || printsThem);
}

/// Writes the files of the run. What can fail is done before the project is written, so that there is a report of every
/// project that is, and no report of another. Throws Failure.
void write(HostedProject& hosted, const ProjectClock& clock, ApplyFacts& facts, const ApplyNotes* notes,
           const ApplyOptions& options)
{
    const std::string& target = targetOf(options);
    const auto namesToKeep = [&](const std::string& file) {
        return options.replacing.keepsFormer ? std::vector{file} : std::vector<std::string>();
    };
    Backups formerProject(namesToKeep(target));
    Backups formerReport(namesToKeep(Output::isFile(options.jsonFile) ? options.jsonFile : std::string()));
    Backups formerNotes(namesToKeep(options.notesFile));
    facts.projectBackups = formerProject.names();
    facts.notesBackups = formerNotes.names();
    facts.reportBackups = formerReport.names();
    std::optional<Output> report;
    if (Output::isFile(options.jsonFile)) {
        report.emplace(options.jsonFile, options.replacing.isAllowed);
        writeReport(*report, hosted.model(), ApplyJson(facts, clock));
        report->finish();
    }
    std::optional<Output> page;
    if (!options.notesFile.empty()) {
        page.emplace(options.notesFile, options.replacing.isAllowed);
        notesWriterFor("--notes", options.notesFile)(notes->document(),
                                                     [&page](std::string_view text) { page->write(text); });
        page->finish();
    }
    Interruption::check();
    if (options.inPlace)
        hosted.saveInPlace();
    else if (!target.empty() && options.replacing.isAllowed)
        hosted.saveOver(target);
    else if (!target.empty())
        hosted.saveAs(target);
    formerProject.keep();
    if (report)
        report->place();
    formerReport.keep();
    if (page)
        page->place();
    formerNotes.keep();
}

/// The head of the notes, where there are any.
void printChanges(const ApplyNotes* notes)
{
    if (!notes)
        return;
    std::cout << '\n';
    writeNotesHead(notes->document(), [](std::string_view text) { std::cout << text; });
}

void printClips(const ApplyListing& listing)
{
    std::cout << '\n' << ApplyListing::ClipsTitle << "\n\n";
    listing.printMoves(std::cout);
    std::cout << '\n';
    listing.printMarkers(std::cout);
}

/// Where the rest of the report is.
void printHint(const ApplyNotes* notes, const ApplyOptions& options)
{
    const bool canTellSteps = notes && options.notesFile.empty();
    std::cout << (canTellSteps ? "\n--notes NOTES.html tells every step, and --clips lists every clip.\n"
                               : "\n--clips lists every clip.\n");
}

void print(const ApplyFacts& facts, const ProjectClock& clock, const ApplyNotes* notes, const ApplyOptions& options)
{
    if (Output::isStandardOutput(options.jsonFile)) {
        Output output(options.jsonFile, true);
        writeReport(output, facts.model, ApplyJson(facts, clock));
        output.place();
        return;
    }
    const ApplyListing listing(facts, clock);
    listing.printTotals(std::cout);
    if (!options.summary)
        printChanges(notes);
    if (options.listsClips)
        printClips(listing);
    else if (!options.summary)
        printHint(notes, options);
    flushStandardOutput();
}

void setFade(standin::Project& project, const ApplyOptions& options)
{
    if (!project.form())
        throw Failure{options.projectFile, "has clips without fades", "leave --fade out"};
    project.form()->setEdgeFade(*options.fade / 1000.0);
}

} // namespace

void runApply(const ApplyOptions& options, Terminal& terminal)
{
    checkOutputs(options);
    Settings trial; // so that wrong usage is told at once
    configure(trial, options.generation.settings);
    shiftsOf(options);

    terminal.showProgress("reading " + fileNameOf(options.projectFile));
    HostedProject hosted(options.projectFile, terminal, openingOf(options));
    const ProjectClock clock = clockOf(hosted.project(), options.projectFile);
    requireRate(options, clock);
    if (!targetOf(options).empty())
        hosted.requireTarget(targetOf(options));
    if (options.fade)
        setFade(hosted.project(), options);
    hosted.endPreview();
    if (options.isFresh)
        forgetStored(hosted.model());
    const core::FrameRange lastAllowed = core::RunRecord::allowedBy(hosted.model().settings());
    configure(hosted.model().settings(), options.generation.settings);
    restrictRange(hosted.model().settings(), options.generation.settings.preserve);
    Preparation run(hosted, clock, options, lastAllowed, terminal);
    ApplyFacts& facts = run.facts();

    std::optional<Interruption> interruption(std::in_place);
    terminal.clearProgress();
    apply(hosted, run.kept(), facts);
    std::optional<ApplyNotes> notes;
    if (wantsNotes(options)) {
        terminal.showProgress("comparing the cuts");
        notes.emplace(facts, clock, options.notes);
    }
    terminal.showProgress("writing");
    write(hosted, clock, facts, notes ? &*notes : nullptr, options);
    interruption.reset();

    terminal.clearProgress();
    print(facts, clock, notes ? &*notes : nullptr, options);
}

} // namespace cadrel::app
