// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesCommand.h"

#include "app/console/Failure.h"
#include "app/console/Interruption.h"
#include "app/console/Output.h"
#include "app/console/Paths.h"
#include "app/console/Terminal.h"
#include "app/edl/ProjectFramerate.h"
#include "app/notes/NotesForms.h"
#include "app/notes/NotesText.h"
#include "app/settings/SettingsReport.h"
#include "core/model/DataModel.h"
#include "core/notes/ChangeNotes.h"
#include "util/Result.h"

#include <optional>
#include <string_view>

namespace cadrel::app {

using core::ChangeNotes;
using core::DataModel;

void runNotes(const NotesOptions& options, Terminal& terminal)
{
    const NotesWriter write = options.outputFile.empty() ? writeNotesText : notesWriterFor("-o", options.outputFile);
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
    const ChangeNotes notes(model.oldEdl(), model.newEdl(), pictureRules(model.settings(), framerate.getFramerate()),
                            options.layout.simplify);
    // Only what was healed is told of it. The notes themselves leave no event out.
    model.generateChangeEdl([](const core::GenerationFailure&) { return core::FailureAnswer::PassOver; });
    const SettingsReport settings =
        settingsOfNotes(SettingsReport::ofCuts(model.settings(), options.generation.settings), options.layout);
    const NotesDocument document{notes,
                                 model.oldEdl(),
                                 model.newEdl(),
                                 core::notesOfHealing(model.changeEdl()),
                                 cuts,
                                 ProjectFramerate::labelOf(framerate.getFramerate()),
                                 model.settings().matchBy(),
                                 settings,
                                 options.layout};

    terminal.showProgress("writing");
    std::optional<Interruption> interruption;
    if (!options.outputFile.empty())
        interruption.emplace();
    terminal.clearProgress();
    Output output(options.outputFile.empty() ? "-" : options.outputFile, options.replacing.isAllowed);
    write(document, [&output](std::string_view text) { output.write(text); });
    Backups backups(options.replacing.keepsFormer ? std::vector{options.outputFile} : std::vector<std::string>());
    output.place();
    backups.keep();
}

} // namespace cadrel::app
