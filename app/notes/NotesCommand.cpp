// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/edl/ProjectFramerate.h"
#include "app/notes/NotesHtml.h"
#include "app/notes/NotesPdf.h"
#include "app/notes/NotesText.h"
#include "core/model/DataModel.h"
#include "core/notes/ChangeNotes.h"
#include "util/Result.h"

#include <algorithm>
#include <array>
#include <optional>
#include <string_view>

namespace cadrel::app {

using core::ChangeNotes;
using core::DataModel;

namespace {

using Writer = void (*)(const NotesDocument&, const NotesSink&);

struct Form {
    std::string_view extension;
    Writer write;
};

constexpr std::array Forms{Form{".txt", writeNotesText}, Form{".csv", writeNotesCsv}, Form{".json", writeNotesJson},
                           Form{".html", writeNotesHtml}, Form{".pdf", writeNotesPdf}};

Writer writerFor(const std::string& file)
{
    if (file.empty())
        return writeNotesText;
    std::string lower = file;
    std::transform(lower.begin(), lower.end(), lower.begin(),
                   [](unsigned char letter) { return letter < 0x80 ? static_cast<char>(std::tolower(letter)) : '?'; });
    for (const Form& form : Forms) {
        if (lower.ends_with(form.extension))
            return form.write;
    }
    throw UsageError{"-o: the name has to end in .html, .pdf, .csv, .txt or .json, which tells the form"};
}

core::PictureRules rulesFrom(const core::Settings& settings, const core::Framerate& framerate)
{
    core::PictureRules rules{framerate, settings.matchBy(), {}};
    rules.versions.compileEnabled(settings.vfxPatterns());
    return rules;
}

} // namespace

void runNotes(const NotesOptions& options, Terminal& terminal)
{
    const Writer writer = writerFor(options.outputFile);
    if (!options.outputFile.empty()) {
        refuseToOverwrite(inputsOf(options.generation), options.outputFile);
        requireReplaceable({options.outputFile}, options.replacing);
    }

    // Taking long lists apart event by event takes a while; the end of the program does it at once.
    static DataModel& model = *new DataModel;
    configure(model.settings(), options.generation.settings);
    const EdlLoader loader(options.generation.load, terminal);
    const ProjectFramerate framerate(loader.chooseRate(options.generation.oldFiles.front()));
    const Cuts cuts = loadCuts(model, options.generation, terminal);
    terminal.showProgress("comparing the cuts");
    const ChangeNotes notes(model.oldEdl(), model.newEdl(), rulesFrom(model.settings(), framerate.getFramerate()),
                            options.simplify);
    // Only what was healed is told of it. The notes themselves leave no event out.
    model.generateChangeEdl([](const core::GenerationFailure&) { return core::FailureAnswer::PassOver; });
    const NotesDocument document{notes,
                                 model.oldEdl(),
                                 model.newEdl(),
                                 core::notesOfHealing(model.changeEdl()),
                                 cuts,
                                 ProjectFramerate::labelOf(framerate.getFramerate()),
                                 model.settings().matchBy(),
                                 options.simplify,
                                 options.showsFeet,
                                 options.isLetter};

    terminal.showProgress("writing");
    std::optional<Interruption> interruption;
    if (!options.outputFile.empty())
        interruption.emplace();
    terminal.clearProgress();
    Output output(options.outputFile.empty() ? "-" : options.outputFile, options.replacing.isAllowed);
    writer(document, [&output](std::string_view text) { output.write(text); });
    Backups backups(options.replacing.keepsFormer ? std::vector{options.outputFile} : std::vector<std::string>());
    output.place();
    backups.keep();
}

} // namespace cadrel::app
