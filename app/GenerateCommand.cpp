#include "app/GenerateCommand.h"

#include "app/Coverage.h"
#include "app/EventJson.h"
#include "app/Failure.h"
#include "app/GenerationFailure.h"
#include "app/Interruption.h"
#include "app/JsonOutput.h"
#include "app/Paths.h"
#include "app/Printable.h"
#include "app/ProjectFramerate.h"
#include "app/Terminal.h"
#include "app/Wording.h"
#include "core/DataModel.h"
#include "core/HealedEvent.h"
#include "core/Timecode.h"
#include "core/VfxNameMatcher.h"
#include "core/fileio/CmxWriter.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <cstddef>
#include <iostream>
#include <optional>
#include <string_view>

namespace cadrel::app {

using core::DataModel;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::HealedEvent;
using core::Settings;
using core::Timecode;
using core::VfxNameMatcher;
using core::VfxPatternEntry;
using core::fileio::CmxWriter;
using nlohmann::ordered_json;
using util::Result;
using util::StringUtil;

namespace {

std::vector<std::string> inputsOf(const GenerateOptions& options)
{
    std::vector<std::string> inputs = options.oldFiles;
    inputs.insert(inputs.end(), options.newFiles.begin(), options.newFiles.end());
    return inputs;
}

bool writesJsonFile(const GenerateOptions& options)
{
    return !options.jsonFile.empty() && !JsonOutput::isStandardOutput(options.jsonFile);
}

/// Throws UsageError when one of the change EDL's files, or the JSON file, would overwrite another file of this run.
void checkOutputs(const GenerateOptions& options, const std::vector<std::string>& changeFiles)
{
    std::vector<std::string> taken = inputsOf(options);
    if (writesJsonFile(options)) {
        refuseToOverwrite(taken, options.jsonFile);
        taken.push_back(options.jsonFile);
    }
    for (const std::string& file : changeFiles)
        refuseToOverwrite(taken, file);
}

/// The files into which the writer puts that many events.
std::vector<std::string> filesOf(const std::string& path, std::size_t eventCount)
{
    if (path.empty())
        return {};
    if (eventCount <= CmxWriter::MostEventsInAFile)
        return {path};
    std::vector<std::string> files;
    for (std::size_t first = 0; first < eventCount; first += CmxWriter::MostEventsInAFile)
        files.push_back(StringUtil::toUtf8(StringUtil::withIndex(toWide(path), static_cast<int>(files.size()) + 1)));
    return files;
}

VfxPatternEntry vfxPatternOf(const std::string& text)
{
    const std::size_t comma = text.find(',');
    if (comma == std::string::npos)
        throw UsageError{"--vfx: \"" + text + "\" has no comma between the texts before and behind the version number"};
    const std::string prefix = text.substr(0, comma);
    const std::string postfix = text.substr(comma + 1);
    try {
        VfxNameMatcher().compile({{prefix, postfix}});
    } catch (const Result::Type&) {
        throw UsageError{prefix.empty() && postfix.empty()
                             ? "--vfx: give a text before or behind the comma"
                             : "--vfx: \"" + text + "\" may hold letters, digits and . * - _ alone"};
    }
    return {prefix, postfix, true};
}

void configure(Settings& settings, const GenerateOptions& options)
{
    settings.setMatchBy(options.matchBy);
    settings.setHealMode(options.healMode);
    settings.setBRollRenaming(options.load.renameBRolls);
    if (options.vfxPatterns.size() > Settings::VfxRowCount)
        throw UsageError{"--vfx: can be given " + std::to_string(Settings::VfxRowCount) + " times at most"};
    for (std::size_t row = 0; row < options.vfxPatterns.size(); ++row)
        settings.setVfxPattern(vfxPatternOf(options.vfxPatterns[row]), row);
}

/// Puts the files' events into the list; returns the names of the files.
std::vector<std::string> loadSide(const EdlLoader& loader, const std::vector<std::string>& files, EventList& events)
{
    std::vector<std::string> names;
    for (LoadedEdl& edl : loader.load(files)) {
        EdlLoader::refuseUnreadable(edl);
        events.append(edl.events.release());
        names.push_back(fileNameOf(edl.path));
    }
    return names;
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

/// "event 005 of reel3.edl (A012C004)".
std::string nameOf(const EventBase& event)
{
    return "event " + std::to_string(event.eventNumber()) + " of " + event.edlFileName() + " (" + event.rollName() +
           ")";
}

Failure failureOf(const DataModel& model, Result::Type result, const GenerateOptions& options)
{
    const auto [newEvent, oldEvent] = findGenerationFailure(model);
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

/// Fills the change list. Throws Failure, also when nothing survives.
void generate(DataModel& model, const GenerateOptions& options, Terminal& terminal)
{
    terminal.showProgress("generating the change EDL");
    const Result::Type result = model.generateChangeEdl();
    if (result != Result::Ok) {
        terminal.showProgress("looking for the event on which it fails");
        throw failureOf(model, result, options);
    }
    if (model.changeEdl().isEmpty())
        throw Failure{joined(inputsOf(options)),
                      "nothing of the old cut survives in the new one, so there is no change EDL",
                      "see that both are of one reel, and try --match or --vfx"};
}

struct HealedCount {
    std::size_t events = 0;  ///< events that stand for several
    std::size_t members = 0; ///< those that they stand for
};

HealedCount countHealed(const EventList& changeEvents)
{
    HealedCount count;
    for (const auto& event : changeEvents.events()) {
        if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get())) {
            ++count.events;
            count.members += healed->healedEvents().size();
        }
    }
    return count;
}

/// What there is to tell about a generation, for people and for programs.
struct Report {
    std::string rate;
    Framerate framerate;
    std::vector<std::string> oldNames;
    std::vector<std::string> newNames;
    std::vector<std::string> changeFiles;
    const DataModel& model;
    HealedCount healed;
    Coverage coverage;

    std::string timecode(std::int32_t frames) const
    {
        Timecode timecode;
        timecode.setFrameCount(frames, framerate);
        return timecode.toString();
    }
    /// "93.6".
    std::string percent() const
    {
        const std::int32_t permille = coverage.permille();
        return std::to_string(permille / 10) + "." + std::to_string(permille % 10);
    }
};

ordered_json sideToJson(const EventList& events, const std::vector<std::string>& names)
{
    return {{"files", names}, {"events", events.size()}, {"invalid", events.countInvalid()}};
}

ordered_json toJson(const Report& report)
{
    const Coverage& coverage = report.coverage;
    ordered_json inserts = ordered_json::array();
    for (const Insert& insert : coverage.inserts) {
        inserts.push_back({{"dstIn", report.timecode(insert.start)},
                           {"dstOut", report.timecode(insert.end)},
                           {"frames", insert.frames()},
                           {"shot", insert.shot},
                           {"moreShots", insert.moreShots}});
    }
    return {{"rate", report.rate},
            {"old", sideToJson(report.model.oldEdl(), report.oldNames)},
            {"new", sideToJson(report.model.newEdl(), report.newNames)},
            {"healed", {{"events", report.healed.events}, {"members", report.healed.members}}},
            {"programmeFrames", coverage.programmeFrames},
            {"coveredFrames", coverage.coveredFrames},
            {"inserts", std::move(inserts)},
            {"written", report.changeFiles}};
}

std::string sideToText(const EventList& events, const std::vector<std::string>& names)
{
    const std::size_t invalid = events.countInvalid();
    return toPrintable(joined(names)).text + ": " + counted(events.size(), "event") + ", " +
           (invalid == 0 ? "all valid" : std::to_string(invalid) + " invalid") + "\n";
}

std::string insertsToText(const Report& report)
{
    const Coverage& coverage = report.coverage;
    if (coverage.inserts.empty())
        return "Inserts     none\n";
    std::string text = "Inserts     " + std::to_string(coverage.inserts.size()) + ", together " +
                       report.timecode(coverage.insertedFrames()) + "\n\n" +
                       "            in           out          length       shot\n";
    for (const Insert& insert : coverage.inserts) {
        text += "            " + report.timecode(insert.start) + "  " + report.timecode(insert.end) + "  " +
                report.timecode(insert.frames()) + "  " + toPrintable(insert.shot, 40).text;
        text += insert.moreShots == 0 ? "\n" : " and " + std::to_string(insert.moreShots) + " more\n";
    }
    return text + "\n";
}

std::string toText(const Report& report, const GenerateOptions& options)
{
    const Coverage& coverage = report.coverage;
    std::vector<std::string> written = report.changeFiles;
    if (writesJsonFile(options))
        written.push_back(options.jsonFile);
    std::string healed;
    if (report.healed.events > 0)
        healed = ", " + std::to_string(report.healed.events) + " of them healed from " +
                 std::to_string(report.healed.members);
    return "Old cut     " + sideToText(report.model.oldEdl(), report.oldNames) + //
           "New cut     " + sideToText(report.model.newEdl(), report.newNames) + //
           "Frame rate  " + report.rate + (options.load.rateLabel.empty() ? ", as the old cut shows\n" : "\n") +
           "Change EDL  " + counted(report.model.changeEdl().size(), "event") + healed + "\n" + //
           "Covered     " + report.timecode(coverage.coveredFrames) + " of " +
           report.timecode(coverage.programmeFrames) + ", " + report.percent() + " %\n" + //
           insertsToText(report) +                                                        //
           "Written     " + (written.empty() ? "nothing; give -o CHANGE.edl" : toPrintable(joined(written)).text) +
           "\n";
}

void saveChangeEdl(const EventList& changeEvents, const std::string& path, const std::vector<std::string>& files)
{
    try {
        changeEvents.save(toWide(path));
    } catch (const Result::Type&) {
        throw unwritable(files);
    }
}

} // namespace

void runGenerate(const GenerateOptions& options, Terminal& terminal)
{
    if (options.changeFile == "-")
        throw UsageError{"-o: \"-\" is no file name; the list goes to standard output with --json -"};
    checkOutputs(options, filesOf(options.changeFile, 1));

    // Taking long lists apart event by event takes a while; the end of the program does it at once.
    static DataModel& model = *new DataModel;
    configure(model.settings(), options);
    const EdlLoader loader(options.load, terminal);
    const ProjectFramerate rate(loader.chooseRate(options.oldFiles.front()));
    const std::vector<std::string> oldNames = loadSide(loader, options.oldFiles, model.oldEdl());
    const std::vector<std::string> newNames = loadSide(loader, options.newFiles, model.newEdl());

    generate(model, options, terminal);
    const Report report{ProjectFramerate::labelOf(rate.getFramerate()),
                        rate.getFramerate(),
                        oldNames,
                        newNames,
                        filesOf(options.changeFile, model.changeEdl().size()),
                        model,
                        countHealed(model.changeEdl()),
                        Coverage(model.newEdl(), model.changeEdl(), rate.getFramerate())};
    checkOutputs(options, report.changeFiles);

    terminal.showProgress("writing");
    std::optional<Interruption> interruption;
    if (!report.changeFiles.empty() || writesJsonFile(options))
        interruption.emplace();
    std::optional<JsonOutput> json;
    if (!options.jsonFile.empty()) {
        json.emplace(options.jsonFile);
        EventJson::write(model.changeEdl().events(), toJson(report), [&](std::string_view text) { json->write(text); });
        json->finish();
    }
    if (!options.changeFile.empty())
        saveChangeEdl(model.changeEdl(), options.changeFile, report.changeFiles);
    if (json)
        json->keep();

    terminal.clearProgress();
    if (!JsonOutput::isStandardOutput(options.jsonFile)) {
        std::cout << toText(report, options);
        flushStandardOutput();
    }
}

} // namespace cadrel::app
