// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/CommandLine.h"

#include "app/Failure.h"
#include "app/JsonOutput.h"
#include "app/edl/ProjectFramerate.h"
#include "core/settings/Settings.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <cstdint>
#include <iterator>
#include <string>
#include <vector>

namespace cadrel::app {

using core::Settings;

namespace {

constexpr const char* MainHelp = R"(Examples:
  cadrel generate --old reel3_v07.edl --new reel3_v12.edl -o reel3_change.edl
  cadrel apply reel3.stage --old reel3_v07.edl --new reel3_v12.edl -o reel3_v12.stage
  cadrel notes --old reel3_v07.edl --new reel3_v12.edl -o reel3_notes.html
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

constexpr const char* ApplyHelp =
    R"(Clips, automation and markers go where their picture has gone. What stood in no shot that survives goes out of the
project, and a new shot has no sound yet. Locked tracks stay as they are. On tracks of its own in the folder "Cadrel
Markers", Cadrel marks where to look: each stretch that was carried over (Destination), new picture (Insert), new
transitions (Dissolve/Wipe), jumps of the automation where two stretches meet (Automation Warning), slivers of clips
at the end of one (Audio Snippet), and stretches that want the same place of a track (Overlap).

Without -o and --in-place nothing is written, and the report tells what would become of the project. The settings are
stored with the project: an option that isn't given is as it was in the last run. Ctrl-C takes the run back. With
--json - only the JSON goes to standard output.

Examples:
  cadrel apply reel3.stage --old reel3_v07.edl --new reel3_v12.edl -o reel3_v12.stage
  cadrel apply reel3.stage --change reel3_change.edl --in-place
  cadrel apply reel3.stage --old old.edl --new new.edl --tracks selected --overhang 6 --no-destination-markers \
      --preserve 03:02:00:00 03:05:00:00 -o scene42.stage --json report.json)";

constexpr const char* NotesHelp =
    R"(Says in programme order what has changed: what was trimmed, lifted, inserted, replaced, moved, doubled or retimed, new
versions of VFX shots, other dissolves and wipes. The lines are steps. Carried out in order by hand, they turn the
old cut into the new one: each stands at its place in the programme as it is then, and all before it is done.

The name of the file tells the form: .html with a picture of both cuts, .pdf for paper, .csv with a row for each step,
.txt, .json.
Without -o the text goes to standard output.

Examples:
  cadrel notes --old reel3_v07.edl --new reel3_v12.edl --vfx 'VFX_****_v,_comp' -o notes.html
  cadrel notes --old old.edl --new new.edl --simplify 48 --feet)";

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

constexpr const char* EventsJsonHelp = "Also write the events as JSON; - is standard output";
constexpr const char* AllJsonHelp = "Also write it all as JSON; - is standard output";

/// The words of an option in the order of the numbers that they stand for.
constexpr std::array<const char*, 2> MatchWords{"roll", "clip"};
constexpr std::array<const char*, 4> HealWords{"none", "normal", "gaps", "inserts"};
constexpr std::array<const char*, 2> TrackWords{"all", "selected"};
constexpr std::array<const char*, 2> PaperWords{"a4", "letter"};
static_assert(core::MatchBy::ClipName == 1 && core::HealMode::GapsWithInserts == 3 &&
              core::ApplyTo::SelectedTracks == 1);

/// A setting that is on or off: "--name" and "--no-name".
struct Switch {
    const char* name;
    const char* help;
    void (Settings::*set)(bool);
};

constexpr std::array Switches{
    Switch{"destination-markers", "Mark each stretch that was carried over", &Settings::setCreateDestinationMarkers},
    Switch{"insert-markers", "Mark new picture, which needs sound", &Settings::setCreateInsertMarkers},
    Switch{"dissolve-wipe-markers", "Mark new dissolves and wipes", &Settings::setCreateDissolveWipeMarkers},
    Switch{"automation-markers", "Mark jumps of the automation", &Settings::setCreateAutomationWarningMarkers},
    Switch{"snippet-markers", "Mark slivers of clips at the ends of stretches",
           &Settings::setCreateAudioSnippetMarkers},
    Switch{"overlap-markers", "Mark stretches that want the same place of a track", &Settings::setCreateOverlapMarkers},
    Switch{"virgin-territories", "Lead the automation over the stretches without old sound",
           &Settings::setCreateVirginTerritories},
    Switch{"b-roll", "Take A001B for a B-roll of A001", &Settings::setBRollRenaming},
};

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

/// A file to write. `name` is that of the option.
void addOutput(CLI::App& command, const char* name, std::string& file, const char* help)
{
    command.add_option(name, file, help)->check(isNamed)->type_name("FILE");
}

CLI::Option* addFiles(CLI::App& command, const char* name, std::vector<std::string>& files, const char* help)
{
    return command.add_option(name, files, help)->type_name("FILE");
}

void addRate(CLI::App& command, LoadOptions& load, const char* help)
{
    command.add_option("--rate", load.rateLabel, help)
        ->check(CLI::IsMember(wordList(ProjectFramerate::Labels)))
        ->type_name("LABEL");
}

void addStrict(CLI::App& command, LoadOptions& load)
{
    command.add_flag("--strict", load.strict, "Stop at a file that doesn't fit the frame rate, instead of warning");
}

/// The options that say how EDLs are read without a project.
void addLoadOptions(CLI::App& command, LoadOptions& load)
{
    addRate(command, load, "Frame rate of the project; else the one that the first file shows");
    command.add_flag_callback(
        "--no-b-roll", [&load] { load.renameBRolls = false; },
        "Keep A001B and A001 apart, instead of taking the first for a B-roll of the second");
    addStrict(command, load);
}

/// An option whose word stands for a number.
template <typename Words, typename Set>
CLI::Option* addChoice(CLI::App& command, const char* name, const Words& words, Set set, const char* help)
{
    return command
        .add_option_function<std::string>(
            name, [&words, set](const std::string& word) { set(numberOf(word, words)); }, help)
        ->check(CLI::IsMember(wordList(words)));
}

/// The options that say how a change EDL is made; those that have no meaning where there is one.
std::vector<CLI::Option*> addMatching(CLI::App& command, GenerationOptions& generation)
{
    addChoice(
        command, "--match", MatchWords, [&generation](std::int32_t number) { generation.matchBy = number; },
        "The name that tells the same material: roll (default) or clip")
        ->type_name("NAME");
    CLI::Option* const heal =
        addChoice(
            command, "--heal", HealWords, [&generation](std::int32_t number) { generation.healMode = number; },
            "How to join neighbours that keep their distance: none, normal (default), gaps or inserts")
            ->type_name("MODE");
    CLI::Option* const vfx =
        command
            .add_option("--vfx", generation.vfxPatterns,
                        "The texts around the version number of VFX shots, * being any character; up to three times")
            ->type_name("PREFIX,POSTFIX")
            ->allow_extra_args(false);
    return {heal, vfx};
}

CLI::App* addGenerate(CLI::App& program, GenerateOptions& options)
{
    CLI::App* const generate = program.add_subcommand("generate", "Make the change EDL from an old and a new cut");
    addFiles(*generate, "--old", options.generation.oldFiles, "EDLs of the old cut, in order")->required();
    addFiles(*generate, "--new", options.generation.newFiles, "EDLs of the new cut, in order")->required();
    addOutput(*generate, "-o,--output", options.changeFile, "Where to write the change EDL");
    addOutput(*generate, "--json", options.jsonFile, EventsJsonHelp);
    addMatching(*generate, options.generation);
    addLoadOptions(*generate, options.generation.load);
    generate->footer(GenerateHelp);
    return generate;
}

/// The options of a run that are numbers.
void addNumbers(CLI::App& apply, ApplyOptions& options)
{
    const auto change = [&options](auto setting) { options.settings.push_back(setting); };
    const CLI::Range frames(0, 10000);
    addChoice(
        apply, "--tracks", TrackWords,
        [change](std::int32_t number) { change([number](Settings& settings) { settings.setApplyTo(number); }); },
        "Which tracks to change: all (default) or those that are selected")
        ->type_name("WHICH");
    CLI::Option* const overhang = apply
                                      .add_option_function<std::int32_t>(
                                          "--overhang",
                                          [change](std::int32_t threshold) {
                                              change([threshold](Settings& settings) {
                                                  settings.setIncludeOverhangingAudioEvents(true);
                                                  settings.setSnippetThreshold(threshold);
                                              });
                                          },
                                          "Let clips that hang over the end of a stretch by up to so many frames go "
                                          "along with it whole or not at all")
                                      ->check(frames)
                                      ->type_name("FRAMES");
    apply
        .add_flag_callback(
            "--no-overhang",
            [change] { change([](Settings& settings) { settings.setIncludeOverhangingAudioEvents(false); }); },
            "Cut clips exactly where their stretch ends (default)")
        ->excludes(overhang);
    CLI::Option* const share = apply
                                   .add_option_function<double>(
                                       "--overhang-percent",
                                       [change](double percent) {
                                           change([percent](Settings& settings) {
                                               settings.setSnippetUsesPercentage(true);
                                               settings.setSnippetMaxPercentage(percent);
                                           });
                                       },
                                       "The largest part of a clip that counts as hanging over (default 50)")
                                   ->check(CLI::Range(0.0, 100.0))
                                   ->type_name("PERCENT");
    apply
        .add_flag_callback(
            "--no-overhang-percent",
            [change] { change([](Settings& settings) { settings.setSnippetUsesPercentage(false); }); },
            "However much of the clip it is")
        ->excludes(share);
    apply
        .add_option_function<std::int32_t>(
            "--remains",
            [change](std::int32_t threshold) {
                change([threshold](Settings& settings) { settings.setRemainsThreshold(threshold); });
            },
            "The longest sliver that is marked as a snippet (default 5)")
        ->check(frames)
        ->type_name("FRAMES");
}

void addPreserve(CLI::App& apply, ApplyOptions& options)
{
    CLI::Option* const preserve =
        apply
            .add_option("--preserve", options.preserve,
                        "Change the project between these two timecodes alone and keep what is before and after")
            ->expected(2)
            ->type_name("BEFORE AFTER");
    apply
        .add_flag_callback(
            "--no-preserve",
            [&options] { options.settings.push_back([](Settings& settings) { settings.setRestrictRange(false); }); },
            "Change the whole project (default)")
        ->excludes(preserve);
}

void addSwitches(CLI::App& apply, ApplyOptions& options)
{
    for (const Switch& entry : Switches) {
        const std::string name = entry.name;
        const auto change = [&options, set = entry.set](std::int64_t count) {
            options.settings.push_back([set, isOn = count > 0](Settings& settings) { (settings.*set)(isOn); });
        };
        apply.add_flag_function("--" + name + ",!--no-" + name, change, entry.help)
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    }
}

CLI::App* addApply(CLI::App& program, ApplyOptions& options)
{
    CLI::App* const apply = program.add_subcommand("apply", "Carry a sound project over to a new cut");
    apply->add_option("PROJECT", options.projectFile, "The project to carry over")->type_name("")->required();
    CLI::Option* const oldFiles =
        addFiles(*apply, "--old", options.generation.oldFiles, "EDLs of the old cut, in order");
    CLI::Option* const newFiles =
        addFiles(*apply, "--new", options.generation.newFiles, "EDLs of the new cut, in order")->needs(oldFiles);
    oldFiles->needs(newFiles);
    CLI::Option* const change =
        addFiles(*apply, "--change", options.changeFiles, "A change EDL instead, in one file or several")
            ->excludes(oldFiles)
            ->excludes(newFiles);
    addOutput(*apply, "-o,--output", options.outputFile, "Where to write the project");
    apply->add_flag("--in-place", options.inPlace, "Replace the project itself")->excludes("--output");
    addOutput(*apply, "--json", options.jsonFile, AllJsonHelp);
    apply->add_flag("--summary", options.summary, "Print the totals alone");
    addRate(*apply, options.generation.load, "Stop when the project has another frame rate");
    addStrict(*apply, options.generation.load);
    apply->option_defaults()->group("Settings, stored with the project");
    for (CLI::Option* const option : addMatching(*apply, options.generation))
        option->excludes(change);
    addNumbers(*apply, options);
    addPreserve(*apply, options);
    addSwitches(*apply, options);
    apply->footer(ApplyHelp);
    return apply;
}

CLI::App* addNotes(CLI::App& program, NotesOptions& options)
{
    CLI::App* const notes = program.add_subcommand("notes", "Tell what has changed between two cuts, step by step");
    addFiles(*notes, "--old", options.generation.oldFiles, "EDLs of the old cut, in order")->required();
    addFiles(*notes, "--new", options.generation.newFiles, "EDLs of the new cut, in order")->required();
    addOutput(*notes, "-o,--output", options.outputFile, "Where to write the notes: .html, .pdf, .csv, .txt or .json");
    notes
        ->add_option("--simplify", options.simplify,
                     "Join trims that cancel out within so many frames into one step (default 0, none)")
        ->check(CLI::Range(0, 10000))
        ->type_name("FRAMES");
    notes->add_flag("--feet", options.showsFeet, "Show places also in 35 mm feet and frames, 16 frames a foot");
    addChoice(
        *notes, "--paper", PaperWords, [&options](std::int32_t number) { options.isLetter = number == 1; },
        "The paper of a PDF: a4 (default) or letter")
        ->type_name("SIZE");
    addMatching(*notes, options.generation);
    addLoadOptions(*notes, options.generation.load);
    notes->footer(NotesHelp);
    return notes;
}

CLI::App* addList(CLI::App& program, ListOptions& options)
{
    CLI::App* const list = program.add_subcommand("list", "Show the events of EDLs and what is wrong with them");
    list->add_option("FILE", options.files, "EDLs to show")->type_name("")->required();
    list->add_flag("--audio", options.load.acceptAudio, "Accept audio events, as for a change EDL");
    list->add_flag("--summary", options.summary, "Print the totals alone");
    addOutput(*list, "--json", options.jsonFile, EventsJsonHelp);
    addLoadOptions(*list, options.load);
    list->footer(ListHelp);
    return list;
}

CLI::App* addShow(CLI::App& program, ShowOptions& options)
{
    CLI::App* const show = program.add_subcommand("show", "Show what is in a sound project");
    show->add_option("PROJECT", options.projectFile, "The project to show")->type_name("")->required();
    show->add_option("--track", options.trackName,
                     "Show only the tracks of that name; a folder stands for all that is in it")
        ->check(isNamed)
        ->type_name("NAME");
    addOutput(*show, "--json", options.jsonFile, AllJsonHelp);
    show->footer(ShowHelp);
    return show;
}

} // namespace

std::optional<CommandLine> CommandLine::parse(int argc, char** argv)
{
    CLI::App program("Carries a sound project over to a new picture cut.", "cadrel");
    CommandLine line;
    program.set_version_flag("--version", "cadrel " CADREL_VERSION, "Print the version and exit");
    program.require_subcommand(0, 1); // so that an unknown word is named
    program.footer(MainHelp);
    addGenerate(program, line.generate);
    const CLI::App* const apply = addApply(program, line.apply);
    const CLI::App* const notes = addNotes(program, line.notes);
    const CLI::App* const list = addList(program, line.list);
    const CLI::App* const show = addShow(program, line.show);

    try {
        program.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() != 0)
            throw UsageError{error.what()};
        program.exit(error); // --help and --version
        flushStandardOutput();
        return std::nullopt;
    }
    if (program.get_subcommands().empty())
        throw UsageError{"give a command, generate, apply, notes, list or show"};
    if (apply->parsed() && line.apply.changeFiles.empty() && line.apply.generation.oldFiles.empty())
        throw UsageError{"apply: give the two cuts with --old and --new, or a change EDL with --change"};
    if (apply->parsed())
        line.command = Command::Apply;
    else if (notes->parsed())
        line.command = Command::Notes;
    else if (list->parsed())
        line.command = Command::List;
    else if (show->parsed())
        line.command = Command::Show;
    return line;
}

} // namespace cadrel::app
