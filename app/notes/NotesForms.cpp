// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/notes/NotesForms.h"

#include "app/console/Failure.h"
#include "app/notes/NotesHtml.h"
#include "app/notes/NotesPdf.h"
#include "app/settings/SettingsReport.h"
#include "core/settings/Settings.h"

#include <algorithm>
#include <array>
#include <cctype>
#include <string_view>

namespace cadrel::app {

namespace {

struct Form {
    std::string_view extension;
    NotesWriter write;
};

constexpr std::array Forms{Form{".txt", writeNotesText}, Form{".csv", writeNotesCsv}, Form{".json", writeNotesJson},
                           Form{".html", writeNotesHtml}, Form{".pdf", writeNotesPdf}};

} // namespace

NotesWriter notesWriterFor(const std::string& option, const std::string& file)
{
    std::string lower = file;
    std::transform(lower.begin(), lower.end(), lower.begin(),
                   [](unsigned char letter) { return letter < 0x80 ? static_cast<char>(std::tolower(letter)) : '?'; });
    for (const Form& form : Forms) {
        if (lower.ends_with(form.extension))
            return form.write;
    }
    throw UsageError{option + ": the name has to end in .html, .pdf, .csv, .txt or .json, which tells the form"};
}

core::PictureRules pictureRules(const core::Settings& settings, const core::Framerate& framerate)
{
    core::PictureRules rules{framerate, settings.matchBy(), {}};
    rules.versions.compileEnabled(settings.vfxPatterns());
    return rules;
}

SettingsReport settingsOfNotes(SettingsReport settings, const NotesLayout& layout)
{
    using Origin = SettingsReport::Origin;
    settings.add({"simplify", "--simplify " + std::to_string(layout.simplify), layout.simplify,
                  layout.simplify == 0 ? Origin::Default : Origin::CommandLine});
    return settings;
}

} // namespace cadrel::app
