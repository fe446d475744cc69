// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourForm.h"

#include "standin/ardour/ArdourReader.h"
#include "standin/ardour/ArdourWriter.h"
#include "standin/ardour/OwnStorage.h"
#include "standin/project/FileFault.h"
#include "standin/project/Project.h"

#include <system_error>

namespace standin {

namespace fs = std::filesystem;

namespace {

fs::path besideWith(const fs::path& file, const char* extension)
{
    fs::path beside = file;
    return beside.replace_extension(extension);
}

} // namespace

bool ArdourForm::recognises(std::string_view text)
{
    // A text of 16 bits a character, which the reader refuses by its name.
    if (text.starts_with("\xFF\xFE") || text.starts_with("\xFE\xFF"))
        return true;
    if (text.starts_with("\xEF\xBB\xBF"))
        text.remove_prefix(3);
    const std::size_t first = text.find_first_not_of(" \t\r\n");
    return first != std::string_view::npos && text[first] == '<';
}

Velmark::Counted<Project> ArdourForm::read(std::string text, const fs::path& file, ChangeLog& log)
{
    try {
        ArdourReader reader(std::move(text), file);
        Velmark::Counted<Project> project = reader.read(log);
        ArdourSession session = reader.takeSession();
        session.ownAsRead = OwnStorage::textOf(*project);
        project->setForm(std::make_unique<ArdourForm>(std::move(session), file.parent_path()));
        return project;
    } catch (const FileFault& fault) {
        if (!fault.remedy().empty())
            throw;
        throw fault.withRemedy("open the session in Ardour and save it there, or take an intact copy");
    }
}

std::string ArdourForm::textOf(const Project& project) const
{
    return ArdourWriter(m_session, project).text();
}

void ArdourForm::requireFree(const fs::path& file) const
{
    std::error_code ignored;
    const fs::path pending = besideWith(file, ".pending");
    if (fs::exists(pending, ignored)) {
        throw FileFault("Ardour has unsaved work in " + quoted(std::string_view(pending.filename().native())) +
                        ", which it would open in place of this session")
            .withRemedy("open the session in Ardour and save it, or remove that file");
    }
}

void ArdourForm::requirePlace(const fs::path& file) const
{
    std::error_code error;
    const fs::path folder = fs::weakly_canonical(m_folder.empty() ? fs::path(".") : m_folder, error);
    const fs::path target =
        fs::weakly_canonical(file.parent_path().empty() ? fs::path(".") : file.parent_path(), error);
    if (error || folder != target) {
        throw FileFault("lies outside of the session's folder " + quoted(std::string_view(folder.native())) +
                        ", and Ardour looks for the sound beside the session")
            .withRemedy("name a file in that folder");
    }
    if (file.extension() != Extension) {
        throw FileFault("has another ending than " + std::string(Extension) + ", which Ardour asks for")
            .withRemedy("end the name in " + std::string(Extension));
    }
}

void ArdourForm::wasWritten(const fs::path& file) const
{
    // It tells of regions by ids that may be others now.
    const fs::path history = besideWith(file, ".history");
    std::error_code ignored;
    if (fs::exists(history, ignored))
        fs::rename(history, besideWith(file, ".history.old"), ignored);
}

} // namespace standin
