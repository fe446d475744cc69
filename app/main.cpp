// `cadrel`: carries a sound project over to a new picture cut. This file knows the command line and the exit status; the
// commands themselves stand beside it.

#include "app/Failure.h"
#include "app/GenerateCommand.h"
#include "app/Interruption.h"
#include "app/JsonOutput.h"
#include "app/ListCommand.h"
#include "app/PlainStringConverter.h"
#include "app/ProjectFramerate.h"
#include "app/ShowCommand.h"
#include "app/Terminal.h"
#include "core/Settings.h"
#include "util/Result.h"
#include "util/StringUtil.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <exception>
#include <iostream>
#include <iterator>
#include <new>
#include <string>
#include <vector>

namespace {

using namespace cadrel;
using app::Failure;
using app::GenerateOptions;
using app::ListOptions;
using app::LoadOptions;
using app::ShowOptions;
using app::Terminal;
using app::UsageError;

enum ExitStatus : int { Done = 0, WorkStopped = 1, WrongUsage = 2 };

constexpr const char* MainHelp = R"(Examples:
  cadrel generate --old reel3_v07.edl --new reel3_v12.edl -o reel3_change.edl
  cadrel list reel3_v12.edl
  cadrel show reel3.stage

Exit status: 0 done, 1 a file or its content stopped the work, 2 wrong usage.)";

constexpr const char* GenerateHelp =
    R"(The change EDL says for every stretch of the old cut that survives where it stood (SRC) and where it stands
now (DST). Invalid events take no part. Neighbours are healed into one event where they touch (normal), also
over a gap that is the same in both cuts and holds no insert (gaps), or over any such gap (inserts).

More than 999 change events go into CHANGE_1.edl, CHANGE_2.edl and so on. Either all files are written or none.
With --json - only the JSON goes to standard output; the summary is left out.

Examples:
  cadrel generate --old reel3_v07.edl --new reel3_v12.edl -o reel3_change.edl
  cadrel generate --old old_a.edl old_b.edl --new new.edl --rate "23.98 fps" --match clip \
      --heal gaps --vfx 'VFX_****_v,_comp' -o change.edl --json change.json)";

constexpr const char* ListHelp =
    R"(Each event is "ok", or its state says which kind of flaw it has: "format" for a field that can't be read,
"timecode" for a time that doesn't exist at the frame rate, "range" for an end before its start. What is wrong
stands under the event. With --json - only the JSON goes to standard output.

Examples:
  cadrel list reel3_v12.edl
  cadrel list --summary *.edl
  cadrel list reel3_change.edl --audio --rate "25 fps" --json -)";

constexpr const char* ShowHelp =
    R"(Shows the facts of the project and the tree of its tracks; then what lies on each track, with its times, its clip
and how far into the clip it begins, and the points of its automation, of long curves the first and the last; then
the media pool. Times are those of the project's clock; .25 behind a timecode is a quarter of a frame. With --json -
only the JSON goes to standard output, with all points and with times in seconds, too.

Examples:
  cadrel show reel3.stage
  cadrel show reel3.stage --track "DIA 1"
  cadrel show reel3.stage --track Music --json -)";

constexpr const char* JsonHelp = "Also write the events as JSON; - is standard output";
constexpr const char* ShowJsonHelp = "Also write it all as JSON; - is standard output";

/// The words of an option in the order of the numbers that they stand for.
constexpr std::array<const char*, 2> MatchWords{"roll", "clip"};
constexpr std::array<const char*, 4> HealWords{"none", "normal", "gaps", "inserts"};
static_assert(core::MatchBy::ClipName == 1 && core::HealMode::GapsWithInserts == 3);

template <typename Words>
std::vector<std::string> wordList(const Words& words)
{
    return {words.begin(), words.end()};
}

template <typename Words>
std::int32_t numberOf(const std::string& word, const Words& words)
{
    return static_cast<std::int32_t>(std::distance(words.begin(), std::find(words.begin(), words.end(), word)));
}

/// An empty name is a slip, such as a variable of a script that isn't set.
std::string isNamed(const std::string& name)
{
    return name.empty() ? "the name is empty" : std::string();
}

/// The options that say how EDLs are read.
void addLoadOptions(CLI::App& command, LoadOptions& load)
{
    command.add_option("--rate", load.rateLabel, "Frame rate of the project; else the one that the first file shows")
        ->check(CLI::IsMember(wordList(app::ProjectFramerate::Labels)))
        ->type_name("LABEL");
    command.add_flag_callback(
        "--no-b-roll", [&load] { load.renameBRolls = false; },
        "Keep A001B and A001 apart, instead of taking the first for a B-roll of the second");
    command.add_flag("--strict", load.strict, "Stop at a file that doesn't fit the frame rate, instead of warning");
}

/// The command line, once parsed.
struct CommandLine {
    enum class Command { Generate, List, Show };

    GenerateOptions generate;
    ListOptions list;
    ShowOptions show;
    Command command = Command::Generate;
};

/// Throws UsageError without a command and CLI::ParseError for all else, also for --help and --version.
CommandLine parse(CLI::App& program, int argc, char** argv)
{
    CommandLine line;
    std::string match = MatchWords[core::MatchBy::RollName];
    std::string heal = HealWords[core::HealMode::Normal];

    program.set_version_flag("--version", "cadrel " CADREL_VERSION, "Print the version and exit");
    program.require_subcommand(0, 1); // so that an unknown word is named
    program.footer(MainHelp);

    CLI::App* generate = program.add_subcommand("generate", "Make the change EDL from an old and a new cut");
    generate->add_option("--old", line.generate.oldFiles, "EDLs of the old cut, in order")
        ->type_name("FILE")
        ->required();
    generate->add_option("--new", line.generate.newFiles, "EDLs of the new cut, in order")
        ->type_name("FILE")
        ->required();
    generate->add_option("-o,--output", line.generate.changeFile, "Where to write the change EDL")
        ->check(isNamed)
        ->type_name("FILE");
    generate->add_option("--json", line.generate.jsonFile, JsonHelp)->check(isNamed)->type_name("FILE");
    generate->add_option("--match", match, "The name that tells the same material: roll (default) or clip")
        ->check(CLI::IsMember(wordList(MatchWords)))
        ->type_name("NAME");
    generate
        ->add_option("--heal", heal,
                     "How to join neighbours that keep their distance: none, normal (default), gaps or inserts")
        ->check(CLI::IsMember(wordList(HealWords)))
        ->type_name("MODE");
    generate
        ->add_option("--vfx", line.generate.vfxPatterns,
                     "The texts around the version number of VFX shots, * being any character; up to three times")
        ->type_name("PREFIX,POSTFIX")
        ->allow_extra_args(false);
    addLoadOptions(*generate, line.generate.load);
    generate->footer(GenerateHelp);

    CLI::App* list = program.add_subcommand("list", "Show the events of EDLs and what is wrong with them");
    list->add_option("FILE", line.list.files, "EDLs to show")->type_name("")->required();
    list->add_flag("--audio", line.list.load.acceptAudio, "Accept audio events, as for a change EDL");
    list->add_flag("--summary", line.list.summary, "Print the totals alone");
    list->add_option("--json", line.list.jsonFile, JsonHelp)->check(isNamed)->type_name("FILE");
    addLoadOptions(*list, line.list.load);
    list->footer(ListHelp);

    CLI::App* show = program.add_subcommand("show", "Show what is in a sound project");
    show->add_option("PROJECT", line.show.projectFile, "The project to show")->type_name("")->required();
    show->add_option("--track", line.show.trackName,
                     "Show only the tracks of that name; a folder stands for all that is in it")
        ->check(isNamed)
        ->type_name("NAME");
    show->add_option("--json", line.show.jsonFile, ShowJsonHelp)->check(isNamed)->type_name("FILE");
    show->footer(ShowHelp);

    program.parse(argc, argv);
    if (program.get_subcommands().empty())
        throw UsageError{"give a command, generate, list or show"};
    line.generate.matchBy = numberOf(match, MatchWords);
    line.generate.healMode = numberOf(heal, HealWords);
    if (list->parsed())
        line.command = CommandLine::Command::List;
    else if (show->parsed())
        line.command = CommandLine::Command::Show;
    return line;
}

void run(int argc, char** argv, Terminal& terminal)
{
    CLI::App program("Carries a sound project over to a new picture cut.", "cadrel");
    try {
        const CommandLine line = parse(program, argc, argv);
        switch (line.command) {
        case CommandLine::Command::Generate:
            app::runGenerate(line.generate, terminal);
            break;
        case CommandLine::Command::List:
            app::runList(line.list, terminal);
            break;
        case CommandLine::Command::Show:
            app::runShow(line.show, terminal);
            break;
        }
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() != 0)
            throw UsageError{error.what()};
        program.exit(error); // --help and --version
        app::flushStandardOutput();
    }
}

/// Nothing that is thrown ends the program without a word.
int runToStatus(int argc, char** argv, Terminal& terminal)
{
    try {
        run(argc, argv, terminal);
        return Done;
    } catch (const UsageError& error) {
        terminal.report(error);
        return WrongUsage;
    } catch (const Failure& failure) {
        terminal.report(failure);
    } catch (const app::Interruption::Requested&) {
        terminal.clearProgress();
    } catch (const std::bad_alloc&) {
        terminal.report(Failure{"memory", "there is not enough of it", "split the files or close other programs"});
    } catch (const util::Result::Type& result) {
        terminal.report(Failure{"internal", "failure " + std::to_string(result), "report it with the files"});
    } catch (const std::exception& exception) {
        terminal.report(Failure{"internal", exception.what(), "report it with the files"});
    }
    return WorkStopped;
}

} // namespace

int main(int argc, char** argv)
{
    std::ios::sync_with_stdio(false);
    const app::PlainStringConverter converter;
    util::StringUtil::setConverter(&converter);
    Terminal terminal;
    const int status = runToStatus(argc, argv, terminal);
    util::StringUtil::setConverter(nullptr);
    return status;
}
