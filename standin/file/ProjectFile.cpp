// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/ProjectFile.h"

#include "standin/ardour/ArdourForm.h"
#include "standin/project/FileFault.h"
#include "standin/project/Project.h"
#include "standin/project/ProjectForm.h"
#include "standin/stage/ProjectReader.h"
#include "standin/stage/ProjectWriter.h"
#include "util/FileReplacement.h"
#include "util/Result.h"

#include <algorithm>
#include <fstream>
#include <system_error>

namespace standin {

namespace fs = std::filesystem;

using cadrel::util::FileReplacement;
using cadrel::util::FileStamp;
using Velmark::Counted;

namespace {

template <class Error = ProjectFileError>
[[noreturn]] void fail(std::string name, const std::string& fault, const std::string& remedy = {})
{
    // A name may hold anything, but the message is one line.
    std::ranges::replace_if(
        name, [](char byte) { return (byte >= 0 && byte < 0x20) || byte == 0x7F; }, '?');
    throw Error(name + ": " + fault, remedy);
}

std::string contentOf(const fs::path& file)
{
    std::error_code error;
    const fs::file_status status = fs::status(file, error);
    if (status.type() == fs::file_type::not_found)
        fail(file.string(), "there is no such file");
    if (status.type() == fs::file_type::none)
        fail(file.string(), error.message());
    if (fs::is_directory(status))
        fail(file.string(), "is a folder");
    if (!fs::is_regular_file(status))
        fail(file.string(), "is no ordinary file");
    const std::uintmax_t size = fs::file_size(file, error);
    if (!error && size > ProjectFile::LargestSize)
        fail(file.string(), "is too large for a project");

    std::ifstream stream(file, std::ios::binary);
    std::string content(error ? 0 : size, '\0');
    stream.read(content.data(), static_cast<std::streamsize>(content.size()));
    if (error || !stream.is_open() || static_cast<std::size_t>(stream.gcount()) != content.size())
        fail(file.string(), "can't be read");
    return content;
}

/// Whether a name is one under which Cadrel keeps what it replaces: "reel_backup_1".
bool isBackup(const fs::path& stem)
{
    constexpr std::string_view Mark = "_backup_";
    const std::string& name = stem.native();
    const std::size_t mark = name.rfind(Mark);
    return mark != std::string::npos && mark + Mark.size() < name.size() &&
           name.find_first_not_of("0123456789", mark + Mark.size()) == std::string::npos;
}

Counted<Project> parsed(std::string text, const fs::path& file, ChangeLog& log)
{
    if (ArdourForm::recognises(text))
        return ArdourForm::read(std::move(text), file, log);
    return ProjectReader::read(text, log);
}

/// Throws FileFault.
std::string contentFor(const Project& project)
{
    return project.form() ? project.form()->textOf(project) : ProjectWriter::textOf(project);
}

} // namespace

fs::path ProjectFile::fileIn(const fs::path& path)
{
    std::error_code error;
    if (!fs::is_directory(path, error))
        return path;
    // Ardour names the first session after its folder.
    const fs::path first = path / fs::weakly_canonical(path, error).filename().concat(ArdourForm::Extension);
    if (!error && fs::is_regular_file(first, error))
        return first;
    error.clear();
    fs::path found;
    for (fs::directory_iterator entry(path, error); !error && entry != fs::directory_iterator();
         entry.increment(error)) {
        if (entry->path().extension() != ArdourForm::Extension || isBackup(entry->path().stem()))
            continue;
        if (!found.empty())
            fail(path.string(), "holds several sessions", "name one of them");
        found = entry->path();
    }
    if (error)
        fail(path.string(), error.message());
    if (found.empty())
        fail(path.string(), "is a folder without a session");
    return found;
}

Counted<Project> ProjectFile::read(const fs::path& file, ChangeLog& log)
{
    std::string content = contentOf(file);
    try {
        Counted<Project> project = parsed(std::move(content), file, log);
        if (project->form())
            project->form()->requireFree(file);
        return project;
    } catch (const FileFault& fault) {
        fail(file.string(), fault.what(), fault.remedy());
    }
}

Counted<Project> ProjectFile::parse(std::string_view text, const std::string& name, ChangeLog& log)
{
    try {
        return parsed(std::string(text), name, log);
    } catch (const FileFault& fault) {
        fail(name, fault.what(), fault.remedy());
    }
}

void ProjectFile::requireWritable(const Project& project, const fs::path& file)
{
    try {
        if (!project.form())
            return;
        project.form()->requirePlace(file);
        project.form()->requireFree(file);
    } catch (const FileFault& fault) {
        fail(file.string(), fault.what(), fault.remedy());
    }
}

std::string ProjectFile::write(const Project& project, const fs::path& file, const std::optional<FileStamp>& expected)
{
    requireWritable(project, file);
    try {
        const ProjectForm* const form = project.form();
        std::string text = contentFor(project);
        FileReplacement replacement(file);
        replacement.write(text);
        replacement.commit(expected);
        if (form)
            form->wasWritten(file);
        return text;
    } catch (const FileFault& fault) {
        fail(file.string(), std::string("this project can't be stored: ") + fault.what(), fault.remedy());
    } catch (const FileReplacement::TargetChanged&) {
        fail<ProjectFileChanged>(file.string(), "another program has written it meanwhile");
    } catch (const cadrel::util::Result::Type&) {
        fail(file.string(), "can't be written");
    }
}

std::string ProjectFile::toText(const Project& project)
{
    try {
        return contentFor(project);
    } catch (const FileFault& fault) {
        throw ProjectFileError(std::string("this project can't be stored: ") + fault.what());
    }
}

} // namespace standin
