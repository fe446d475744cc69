// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/GenerateCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Printable.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/edl/EventJson.h"
#include "app/edl/GenerationReport.h"
#include "app/edl/ProjectFramerate.h"
#include "app/settings/SettingsReport.h"
#include "core/fileio/CmxWriter.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <cstddef>
#include <filesystem>
#include <iostream>
#include <optional>
#include <string_view>
#include <system_error>

namespace cadrel::app {

using core::DataModel;
using core::EventList;
using core::Timecode;
using core::fileio::CmxWriter;
using nlohmann::ordered_json;
using util::Result;
using util::StringUtil;

namespace fs = std::filesystem;

namespace {

/// Throws UsageError when one of the change EDL's files, or the JSON file, would overwrite another file of this run, and
/// Failure when the JSON file would overwrite one that the user hasn't given up.
void checkOutputs(const GenerateOptions& options, const std::vector<std::string>& changeFiles)
{
    std::vector<std::string> taken = inputsOf(options.generation);
    if (Output::isFile(options.jsonFile)) {
        refuseToOverwrite(taken, options.jsonFile);
        requireReplaceable({options.jsonFile}, options.replacing);
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
    std::vector<std::string> files;
    for (const std::wstring& file : CmxWriter::filesOf(toWide(path), eventCount))
        files.push_back(StringUtil::toUtf8(file));
    return files;
}

void saveChangeEdl(const EventList& changeEvents, const std::string& path, const std::vector<std::string>& files,
                   bool mayReplace)
{
    using Existing = CmxWriter::Existing;
    CmxWriter writer(CmxWriter::modeFor(Timecode::framerate()), mayReplace ? Existing::Replaced : Existing::Kept);
    const Result::Type result = writer.write(toWide(path), changeEvents);
    if (result == Result::Refused) {
        const auto there =
            std::find_if(files.begin(), files.end(), [](const std::string& file) { return fs::exists(file); });
        throw writtenMeanwhile(there == files.end() ? path : *there);
    }
    if (result != Result::Ok)
        throw unwritable(files);
}

/// "001" has the number 1, but isn't how a part is numbered.
bool isPartNumber(std::string_view text)
{
    return !text.empty() && text.front() != '0' &&
           std::all_of(text.begin(), text.end(), [](char digit) { return digit >= '0' && digit <= '9'; });
}

/// The files of an earlier list of that name that aren't of this run: parts with higher numbers, or all of them beside a list
/// in one file, and the one file beside a list in parts. `used` is what this run reads and writes.
std::vector<std::string> leftOver(const std::string& path, const std::vector<std::string>& used)
{
    if (path.empty())
        return {};
    const fs::path file(path);
    const std::string start = file.stem().string() + "_";
    const std::string end = file.extension().string();
    // The parts of NAME_backup.edl would be named like what is kept of NAME.edl.
    const bool isNamedLikeABackup = file.stem().string().ends_with("_backup");
    const auto isPart = [&](const std::string& name) {
        return !isNamedLikeABackup && name.size() > start.size() + end.size() && name.starts_with(start) &&
               name.ends_with(end) &&
               isPartNumber(std::string_view(name).substr(start.size(), name.size() - start.size() - end.size()));
    };
    std::error_code error;
    std::vector<std::string> found;
    const fs::path folder = file.has_parent_path() ? file.parent_path() : fs::path(".");
    for (fs::directory_iterator entry(folder, error), none; !error && entry != none; entry.increment(error)) {
        const std::string name = entry->path().filename();
        const std::string candidate = file.parent_path() / name;
        const auto isCandidate = [&](const std::string& other) { return isSameFile(other, candidate); };
        if ((isPart(name) || name == file.filename()) && std::none_of(used.begin(), used.end(), isCandidate))
            found.push_back(candidate);
    }
    // By their numbers.
    std::sort(found.begin(), found.end(), [](const std::string& a, const std::string& b) {
        return a.size() != b.size() ? a.size() < b.size() : a < b;
    });
    return found;
}

/// The files of a run.
struct Files {
    std::vector<std::string> change;
    std::vector<std::string> backups;
    std::vector<std::string> leftOver;
};

std::string writtenText(const GenerateOptions& options, const Files& files)
{
    std::vector<std::string> written = files.change;
    if (Output::isFile(options.jsonFile))
        written.push_back(options.jsonFile);
    const auto line = [](const char* title, const std::vector<std::string>& names, const char* remark) {
        return names.empty() ? std::string() : title + toPrintable(joined(names)).text + remark + "\n";
    };
    return (written.empty() ? "Written     nothing; give -o CHANGE.edl\n" : line("Written     ", written, "")) +
           line("Backup      ", files.backups, "") +
           line("Left over   ", files.leftOver, ", which may be of an earlier list; remove what you don't need");
}

void writeJson(Output& output, const DataModel& model, const GenerationReport& report, const SettingsReport& settings,
               const std::string& rate, const Files& files)
{
    ordered_json facts{{"rate", rate}};
    facts.update(report.toJson());
    facts["settings"] = settings.toJson();
    facts["written"] = files.change;
    facts["backups"] = files.backups;
    facts["leftOver"] = files.leftOver;
    EventJson::write(model.changeEdl().events(), facts, [&](std::string_view text) { output.write(text); });
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
    const SettingsReport settings = SettingsReport::ofCuts(model.settings(), options.generation.settings);
    Files files{filesOf(options.changeFile, model.changeEdl().size()), {}, {}};
    checkOutputs(options, files.change);
    requireReplaceable(files.change, options.replacing);

    terminal.showProgress("writing");
    std::optional<Interruption> interruption;
    if (!files.change.empty() || Output::isFile(options.jsonFile))
        interruption.emplace();
    std::vector<std::string> written = files.change;
    if (Output::isFile(options.jsonFile))
        written.push_back(options.jsonFile);
    Backups backups(options.replacing.keepsFormer ? written : std::vector<std::string>());
    files.backups = backups.names();
    std::vector<std::string> used = inputsOf(options.generation);
    used.insert(used.end(), files.change.begin(), files.change.end());
    files.leftOver = leftOver(options.changeFile, used);
    std::optional<Output> json;
    if (Output::isFile(options.jsonFile)) {
        json.emplace(options.jsonFile, options.replacing.isAllowed);
        writeJson(*json, model, report, settings, rate, files);
        json->finish();
    }
    if (!options.changeFile.empty())
        saveChangeEdl(model.changeEdl(), options.changeFile, files.change, options.replacing.isAllowed);
    backups.keep();
    if (json)
        json->place();
    interruption.reset();

    terminal.clearProgress();
    if (Output::isStandardOutput(options.jsonFile)) {
        Output output(options.jsonFile, true);
        writeJson(output, model, report, settings, rate, files);
        output.place();
        return;
    }
    const char* const origin = options.generation.load.rateLabel.empty() ? ", as the old cut shows" : "";
    std::cout << report.cutsText(rate + origin) << report.changeText() << settings.text("Settings    ")
              << report.insertsText() << writtenText(options, files);
    flushStandardOutput();
}

} // namespace cadrel::app
