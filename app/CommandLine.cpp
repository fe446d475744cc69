// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/CommandLine.h"

#include "app/console/Failure.h"
#include "app/console/Nearest.h"
#include "app/console/Output.h"
#include "app/console/Replacing.h"
#include "app/console/Wording.h"
#include "app/edl/ProjectFramerate.h"
#include "app/settings/SettingsTable.h"
#include "core/settings/FrameBounds.h"
#include "core/settings/Settings.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <functional>
#include <iterator>
#include <string>
#include <utility>
#include <variant>
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
  cadrel open reel3.stage

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
    R"(Clips, automation and markers go where their picture went. Sound whose picture is gone is removed from the project,
and a new shot has no sound yet. What the new cut doesn't change isn't touched: leader, pops and tails go with their
reel, and what is before the first change stays as it is. With --keep cut the change EDL alone counts, and all that it
doesn't name is removed. Locked tracks stay as they are. On tracks of its own in the folder "Cadrel
Markers", Cadrel marks where to look: each stretch that was carried over (Destination), new picture (Insert), new
transitions (Dissolve/Wipe), jumps of the automation where two stretches meet (Automation Warning), slivers of clips
at the end of one (Audio Snippet), and stretches that want the same place of a track (Overlap).

The report has the totals and the largest changes of the picture, with what happened to the sound there. --notes FILE
writes all changes, step by step, as a page to hand around, and --clips prints what became of each clip.

Without -o and --in-place no project is written, and the report tells what would become of it. The settings are
stored with the project: an option that isn't given is as it was in the last run. Ctrl-C takes the run back. With
--json - only the JSON goes to standard output.

PROJECT is a project of Cadrel's own or a session of Ardour 6 or 7; a folder stands for the only session in it. The
result has the same form. A session is written beside the old one, where its sound is.

Examples:
  cadrel apply reel3.ardour --old reel3_v07.edl --new reel3_v12.edl -o reel3_v12.ardour
  cadrel apply reel3.stage --old reel3_v07.edl --new reel3_v12.edl -o reel3_v12.stage
  cadrel apply reel3.stage --old reel3_v07.edl --new reel3_v12.edl --notes reel3_notes.html
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
stands under the event. A line that makes no event is named in a warning. With --json - only the JSON goes to
standard output.

Examples:
  cadrel list reel3_v12.edl
  cadrel list --summary *.edl
  cadrel list reel3_change.edl --audio --rate "25 fps" --json -)";

constexpr const char* OpenHelp =
    R"(The window shows the tracks of the project, and below them Cadrel. It needs a display of the X Window System. The
program with the window, cadrel-desktop, lies beside this one.

Examples:
  cadrel open
  cadrel open reel3.stage reel4.stage)";

constexpr const char* ShowHelp =
    R"(Shows the facts of the project and the tree of its tracks; then what lies on each track, with its times, its clip
and how far into the clip it begins, and the points of its automation, of long curves the first and the last; then
the media pool. Times are those of the project's clock; .25 after a timecode is a quarter of a frame. With --json -
only the JSON goes to standard output, with all points and with times in seconds, too.

Examples:
  cadrel show reel3.stage
  cadrel show reel3.stage --track "DIA 1"
  cadrel show reel3.stage --track Music --json -
  cadrel show reel3.stage --media)";

/// In the order of ApplyOptions::Keep.
constexpr std::array<const char*, 2> KeepWords{"all", "cut"};

constexpr const char* EventsJsonHelp = "Also write the events as JSON; - is standard output";
constexpr const char* AllJsonHelp = "Also write it all as JSON; - is standard output";

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

/// An empty name is a mistake, such as a variable of a script that isn't set.
std::string isNamed(const std::string& name)
{
    return name.empty() ? "the name is empty" : std::string();
}

/// A file to write. `name` is that of the option.
CLI::Option* addOutput(CLI::App& command, const char* name, std::string& file, const char* help)
{
    return command.add_option(name, file, help)->check(isNamed)->type_name("FILE");
}

/// The file that the command is for.
void addResult(CLI::App& command, std::string& file, Replacing& replacing, const char* help)
{
    addOutput(command, "-o,--output", file, help);
    command.add_flag("--overwrite", replacing.isAllowed, "Replace files that exist");
    command.add_flag("--backup", replacing.keepsFormer, "Keep what is replaced, as NAME_backup_1 and so on");
}

/// JSON beside what the command prints.
void addJson(CLI::App& command, std::string& file, bool& isReplacing, const char* help)
{
    addOutput(command, "--json", file, help);
    command.add_flag("--overwrite", isReplacing, "Replace the file of --json where it exists");
}

CLI::Option* addFiles(CLI::App& command, const char* name, std::vector<std::string>& files, const char* help)
{
    return command.add_option(name, files, help)->type_name("FILE");
}

/// Replaces a rate by its label, or says what is wrong with it.
std::string toRateLabel(std::string& text)
{
    if (const auto label = ProjectFramerate::labelMeant(text)) {
        text = *label;
        return {};
    }
    if (text.ends_with("dfps"))
        return app::quoted(text) +
               " is not supported; drop-frame timecode counts 30 frames, at 29.97 dfps and 30 dfps alone";
    return app::quoted(text) + " is none of " + joined(wordList(ProjectFramerate::Labels));
}

void addRate(CLI::App& command, LoadOptions& load, const char* help)
{
    command.add_option("--rate", load.rateLabel, help)
        ->transform(CLI::Validator(toRateLabel, "", "rate"))
        ->type_name("LABEL");
}

void addShift(CLI::App& command, std::vector<std::string>& shifts)
{
    command
        .add_option("--shift", shifts,
                    "Move all timecodes of an EDL, such as --shift reel2.edl=+01:00:00:00; once for each file")
        ->type_name("FILE=+TC")
        ->allow_extra_args(false);
}

void addStrict(CLI::App& command, LoadOptions& load)
{
    command.add_flag("--strict", load.strict,
                     "Stop at a line that can't be read or a file that doesn't fit the frame rate, instead of warning");
}

/// The options that say how EDLs are read without a project.
void addLoadOptions(CLI::App& command, LoadOptions& load)
{
    addRate(command, load, "Frame rate of the project; else the one that the first file shows");
    addStrict(command, load);
}

/// Adds the options of a setting to a command, by the kind of the setting, and gives the one that sets it. What the user
/// wants goes to `given`.
class SettingAdder {
public:
    SettingAdder(CLI::App& command, GivenSettings& given, const SettingEntry& entry)
        : m_command(command), m_given(given), m_entry(entry)
    {
    }

    CLI::Option* operator()(const SwitchSetting& kind) const
    {
        return m_command
            .add_flag_function(
                option() + ",!" + offOption(),
                [add = adder(), kind](std::int64_t count) {
                    add([kind, isOn = count > 0](Settings& settings) { settings.set(kind.option, isOn); });
                },
                m_entry.help)
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    }

    CLI::Option* operator()(const ChoiceSetting& kind) const
    {
        return m_command
            .add_option_function<std::string>(
                option(),
                [add = adder(), kind](const std::string& word) {
                    add([kind, number = numberOf(word, kind.words)](Settings& settings) {
                        settings.set(kind.option, number);
                    });
                },
                m_entry.help)
            ->check(CLI::IsMember(wordList(kind.words)))
            ->type_name(kind.wordName);
    }

    CLI::Option* operator()(const FramesSetting& kind) const
    {
        return m_command
            .add_option_function<std::int32_t>(
                option(),
                [add = adder(), kind](std::int32_t frames) {
                    add([kind, frames](Settings& settings) { settings.set(kind.option, frames); });
                },
                m_entry.help)
            ->check(CLI::Range(core::FrameBounds::Fewest, core::FrameBounds::Most))
            ->type_name("FRAMES");
    }

    template <typename Number>
    CLI::Option* operator()(const BoundSetting<Number>& kind) const
    {
        CLI::Option* const bound = m_command
                                       .add_option_function<Number>(
                                           option(),
                                           [add = adder(), kind](Number number) {
                                               add([kind, number](Settings& settings) {
                                                   settings.set(kind.isOn, true);
                                                   settings.set(kind.bound, number);
                                               });
                                           },
                                           m_entry.help)
                                       ->check(CLI::Range(kind.least, kind.greatest))
                                       ->type_name(kind.numberName);
        addOff(kind.isOn, kind.offHelp)->excludes(bound);
        return bound;
    }

    CLI::Option* operator()(const RangeSetting& kind) const
    {
        CLI::Option* const range =
            m_command.add_option(option(), m_given.preserve, m_entry.help)->expected(2)->type_name("BEFORE AFTER");
        addOff(&Settings::restrictRange, kind.offHelp)->excludes(range);
        return range;
    }

    CLI::Option* operator()(const VfxSetting&) const
    {
        return m_command.add_option(option(), m_given.vfxPatterns, m_entry.help)
            ->type_name("PREFIX,POSTFIX|none")
            ->allow_extra_args(false);
    }

private:
    using Apply = std::function<void(Settings&)>;

    /// Puts a change of this setting to what is given.
    std::function<void(Apply)> adder() const
    {
        return [&given = m_given, &entry = m_entry](Apply apply) {
            given.changes.push_back({&entry, std::move(apply)});
        };
    }

    std::string option() const { return std::string("--") + m_entry.name; }
    std::string offOption() const { return std::string("--no-") + m_entry.name; }

    CLI::Option* addOff(core::Option<bool> Settings::*isOn, const char* help) const
    {
        return m_command.add_flag_callback(
            offOption(), [add = adder(), isOn] { add([isOn](Settings& settings) { settings.set(isOn, false); }); },
            help);
    }

    CLI::App& m_command;
    GivenSettings& m_given;
    const SettingEntry& m_entry;
};

CLI::Option* addSetting(CLI::App& command, GivenSettings& given, const SettingEntry& entry)
{
    return std::visit(SettingAdder(command, given, entry), entry.kind);
}

/// The settings that say how a change EDL is made.
void addMatching(CLI::App& command, GivenSettings& given)
{
    for (const SettingEntry& entry : settingsTable()) {
        if (entry.use != SettingEntry::Use::Run)
            addSetting(command, given, entry);
    }
}

/// How change notes are laid out. Gives the options that only a file of notes needs.
std::vector<CLI::Option*> addNotesLayout(CLI::App& command, NotesLayout& layout)
{
    command
        .add_option("--simplify", layout.simplify,
                    "Join trims that cancel out within so many frames into one step (default 0, none)")
        ->check(CLI::Range(0, 10000))
        ->type_name("FRAMES");
    CLI::Option* const feet =
        command.add_flag("--feet", layout.showsFeet, "Show places also in 35 mm feet and frames, 16 frames a foot");
    CLI::Option* const paper =
        command
            .add_option_function<std::string>(
                "--paper", [&layout](const std::string& size) { layout.isLetter = size == "letter"; },
                "The paper of a PDF: a4 (default) or letter")
            ->check(CLI::IsMember({"a4", "letter"}))
            ->type_name("SIZE");
    return {feet, paper};
}

CLI::App* addGenerate(CLI::App& program, GenerateOptions& options)
{
    CLI::App* const generate = program.add_subcommand("generate", "Make the change EDL from an old and a new cut");
    addFiles(*generate, "--old", options.generation.oldFiles, "EDLs of the old cut, in order")->required();
    addFiles(*generate, "--new", options.generation.newFiles, "EDLs of the new cut, in order")->required();
    addResult(*generate, options.changeFile, options.replacing, "Where to write the change EDL");
    addOutput(*generate, "--json", options.jsonFile, EventsJsonHelp);
    addMatching(*generate, options.generation.settings);
    addShift(*generate, options.generation.shifts);
    addLoadOptions(*generate, options.generation.load);
    generate->footer(GenerateHelp);
    return generate;
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
    addResult(*apply, options.outputFile, options.replacing, "Where to write the project");
    apply->add_flag("--in-place", options.inPlace, "Replace the project itself")->excludes("--output");
    apply->add_option("--fade", options.fade, "How long clips of a session fade where they were cut (64 samples)")
        ->type_name("MS")
        ->check(CLI::Range(0.0, 10000.0))
        ->check([](const std::string& word) {
            // What is no number lies neither below a range nor above it.
            double number = 0.0;
            const bool isNumber = CLI::detail::lexical_cast(word, number) && !std::isnan(number);
            return isNumber ? std::string() : app::quoted(word) + " is no number";
        });
    addOutput(*apply, "--json", options.jsonFile, AllJsonHelp);
    CLI::Option* const notes = addOutput(*apply, "--notes", options.notesFile,
                                         "Also write change notes with what happened to the sound: .html, .pdf, .csv, "
                                         ".txt or .json");
    notes->excludes(change);
    for (CLI::Option* const option : addNotesLayout(*apply, options.notes))
        option->needs(notes);
    CLI::Option* const clips =
        apply->add_flag("--clips", options.listsClips, "Print also what became of each clip and what was marked");
    apply->add_flag("--summary", options.summary, "Print the totals alone")->excludes(clips);
    apply
        ->add_option_function<std::string>(
            "--keep",
            [&options](const std::string& word) {
                options.isKeepGiven = true;
                options.keep = static_cast<ApplyOptions::Keep>(numberOf(word, KeepWords));
            },
            "What stays where the cuts don't speak of a change: all (default), or what the change EDL says (cut)")
        ->check(CLI::IsMember(wordList(KeepWords)))
        ->type_name("WHAT");
    apply->add_flag("--force", options.isForced, "Go on where the files don't seem to belong together");
    apply->add_flag("--fresh", options.isFresh,
                    "Begin anew, without the settings and cuts that earlier runs have stored");
    addShift(*apply, options.generation.shifts);
    addRate(*apply, options.generation.load, "Stop when the project has another frame rate");
    addStrict(*apply, options.generation.load);
    apply->option_defaults()->group("Settings, stored with the project");
    for (const SettingEntry& entry : settingsTable()) {
        CLI::Option* const option = addSetting(*apply, options.generation.settings, entry);
        if (entry.use == SettingEntry::Use::Generation)
            option->excludes(change);
    }
    apply->footer(ApplyHelp);
    return apply;
}

CLI::App* addNotes(CLI::App& program, NotesOptions& options)
{
    CLI::App* const notes = program.add_subcommand("notes", "Tell what has changed between two cuts, step by step");
    addFiles(*notes, "--old", options.generation.oldFiles, "EDLs of the old cut, in order")->required();
    addFiles(*notes, "--new", options.generation.newFiles, "EDLs of the new cut, in order")->required();
    addResult(*notes, options.outputFile, options.replacing,
              "Where to write the notes: .html, .pdf, .csv, .txt or .json");
    addNotesLayout(*notes, options.layout);
    addMatching(*notes, options.generation.settings);
    addShift(*notes, options.generation.shifts);
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
    addJson(*list, options.jsonFile, options.isReplacing, EventsJsonHelp);
    list->add_flag_callback(
        "--no-b-roll", [&options] { options.load.renameBRolls = false; },
        "Keep A001B and A001 apart, instead of taking the first for a B-roll of the second");
    addShift(*list, options.shifts);
    addLoadOptions(*list, options.load);
    list->footer(ListHelp);
    return list;
}

CLI::App* addShow(CLI::App& program, ShowOptions& options)
{
    CLI::App* const show = program.add_subcommand("show", "Show what is in a sound project");
    show->add_option("PROJECT", options.projectFile, "The project to show")->type_name("")->required();
    CLI::Option* const track =
        show->add_option("--track", options.trackName,
                         "Show only the tracks of that name; a folder stands for all that is in it")
            ->check(isNamed)
            ->type_name("NAME");
    addJson(*show, options.jsonFile, options.isReplacing, AllJsonHelp);
    show->add_flag("--media", options.isMedia,
                   "Show the files of the media pool instead: rate, length, what is missing")
        ->excludes(track)
        ->excludes("--json");
    show->footer(ShowHelp);
    return show;
}

CLI::App* addOpen(CLI::App& program, OpenOptions& options)
{
    CLI::App* const open = program.add_subcommand("open", "Open a window to conform in");
    open->add_option("PROJECT", options.projects, "Projects to open, each in a tab")->type_name("");
    open->footer(OpenHelp);
    return open;
}

std::vector<std::string> commandNames(const CLI::App& program)
{
    std::vector<std::string> names;
    for (const CLI::App* const command : program.get_subcommands([](const CLI::App*) { return true; }))
        names.push_back(command->get_name());
    return names;
}

/// With their dashes.
std::vector<std::string> optionNames(const CLI::App& command)
{
    std::vector<std::string> names;
    for (const CLI::Option* const option : command.get_options()) {
        for (const std::string& name : option->get_lnames())
            names.push_back("--" + name);
    }
    return names;
}

/// Throws UsageError for a word that isn't one of those.
void requireKnown(const char* kind, const std::string& typed, const std::vector<std::string>& words)
{
    if (std::find(words.begin(), words.end(), typed) != words.end())
        return;
    const std::string nearest = nearestWord(typed, words);
    throw UsageError{std::string("there is no ") + kind + " " + typed,
                     nearest.empty() ? "see --help" : "did you mean " + nearest + "?"};
}

/// Throws UsageError for the first command or option that there isn't: the parser may complain of what is missing instead.
void requireKnownWords(const CLI::App& program, const std::vector<std::string>& arguments)
{
    const CLI::App* command = &program;
    for (const std::string& argument : arguments) {
        if (argument == "--")
            return;
        if (argument.starts_with("--")) {
            requireKnown("option", argument.substr(0, argument.find('=')), optionNames(*command));
        } else if (command == &program && !argument.starts_with("-")) {
            requireKnown("command", argument, commandNames(program));
            command = program.get_subcommand(argument);
        }
    }
}

/// Throws UsageError where `apply` is given both a change EDL and a cut: the parser may ask for the other cut instead.
void requireOneSource(const CLI::App& apply)
{
    const auto isGiven = [&apply](const char* name) { return apply.get_option(name)->count() > 0; };
    if (isGiven("--change") && (isGiven("--old") || isGiven("--new")))
        throw UsageError{"apply: --change stands instead of --old and --new",
                         "give the two cuts, or the change EDL alone"};
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
    const CLI::App* const open = addOpen(program, line.open);

    try {
        program.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        if (error.get_exit_code() != 0) {
            requireKnownWords(program, {argv + 1, argv + argc});
            requireOneSource(*apply);
            throw UsageError{error.what()};
        }
        program.exit(error); // --help and --version
        flushStandardOutput();
        return std::nullopt;
    }
    if (program.get_subcommands().empty())
        throw UsageError{"give a command, generate, apply, notes, list, show or open"};
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
    else if (open->parsed())
        line.command = Command::Open;
    return line;
}

} // namespace cadrel::app
