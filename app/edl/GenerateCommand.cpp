// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/GenerateCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/JsonOutput.h"
#include "app/console/Paths.h"
#include "app/console/Printable.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/EventJson.h"
#include "app/edl/GenerationReport.h"
#include "app/edl/ProjectFramerate.h"
#include "core/fileio/CmxWriter.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <cstddef>
#include <iostream>
#include <optional>
#include <string_view>

namespace cadrel::app {

using core::DataModel;
using core::EventList;
using core::Timecode;
using core::fileio::CmxWriter;
using nlohmann::ordered_json;
using util::Result;
using util::StringUtil;

namespace {

/// Throws UsageError when one of the change EDL's files, or the JSON file, would overwrite another file of this run.
void checkOutputs(const GenerateOptions& options, const std::vector<std::string>& changeFiles)
{
    std::vector<std::string> taken = inputsOf(options.generation);
    if (JsonOutput::isFile(options.jsonFile)) {
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

void saveChangeEdl(const EventList& changeEvents, const std::string& path, const std::vector<std::string>& files)
{
    using Mode = CmxWriter::FrameCountMode;
    CmxWriter writer(Timecode::framerate().dropFrame == 1 ? Mode::DropFrame : Mode::Unsaid);
    if (writer.write(toWide(path), changeEvents) != Result::Ok)
        throw unwritable(files);
}

std::string writtenText(const GenerateOptions& options, std::vector<std::string> written)
{
    if (JsonOutput::isFile(options.jsonFile))
        written.push_back(options.jsonFile);
    return "Written     " + (written.empty() ? "nothing; give -o CHANGE.edl" : toPrintable(joined(written)).text) +
           "\n";
}

} // namespace

void runGenerate(const GenerateOptions& options, Terminal& terminal)
{
    if (options.changeFile == "-")
        throw UsageError{"-o: \"-\" is no file name; the list goes to standard output with --json -"};
    checkOutputs(options, filesOf(options.changeFile, 1));

    // Deleting long lists event by event takes a while; the end of the program frees them at once.
    static DataModel& model = *new DataModel;
    configure(model.settings(), options.generation.settings);
    const ProjectFramerate framerate(
        EdlLoader(options.generation.load, terminal).chooseRate(options.generation.oldFiles.front()));
    const std::string rate = ProjectFramerate::labelOf(framerate.getFramerate());
    const Cuts cuts = generateChangeEdl(model, options.generation, terminal);
    requireChangeEvents(model, options.generation);
    const GenerationReport report(model, model.changeEdl(), cuts, framerate.getFramerate());
    const std::vector<std::string> changeFiles = filesOf(options.changeFile, model.changeEdl().size());
    checkOutputs(options, changeFiles);

    terminal.showProgress("writing");
    std::optional<Interruption> interruption;
    if (!changeFiles.empty() || JsonOutput::isFile(options.jsonFile))
        interruption.emplace();
    std::optional<JsonOutput> json;
    if (!options.jsonFile.empty()) {
        ordered_json facts{{"rate", rate}};
        facts.update(report.toJson());
        facts["written"] = changeFiles;
        json.emplace(options.jsonFile);
        EventJson::write(model.changeEdl().events(), facts, [&](std::string_view text) { json->write(text); });
        json->finish();
    }
    if (!options.changeFile.empty())
        saveChangeEdl(model.changeEdl(), options.changeFile, changeFiles);
    if (json)
        json->keep();

    terminal.clearProgress();
    if (!JsonOutput::isStandardOutput(options.jsonFile)) {
        const char* const origin = options.generation.load.rateLabel.empty() ? ", as the old cut shows" : "";
        std::cout << report.cutsText(rate + origin) << report.changeText() << report.insertsText()
                  << writtenText(options, changeFiles);
        flushStandardOutput();
    }
}

} // namespace cadrel::app
