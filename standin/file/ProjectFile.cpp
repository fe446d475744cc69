// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/ProjectFile.h"

#include "standin/file/FileFault.h"
#include "standin/file/JsonDocument.h"
#include "standin/file/ProjectReader.h"
#include "standin/file/ProjectWriter.h"
#include "standin/project/Project.h"
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
[[noreturn]] void fail(std::string name, const std::string& fault)
{
    // A name may hold anything, but the message is one line.
    std::ranges::replace_if(
        name, [](char byte) { return (byte >= 0 && byte < 0x20) || byte == 0x7F; }, '?');
    throw Error(name + ": " + fault);
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
    if (!error && size > JsonDocument::LargestSize)
        fail(file.string(), "is too large for a project");

    std::ifstream stream(file, std::ios::binary);
    std::string content(error ? 0 : size, '\0');
    stream.read(content.data(), static_cast<std::streamsize>(content.size()));
    if (error || !stream.is_open() || static_cast<std::size_t>(stream.gcount()) != content.size())
        fail(file.string(), "can't be read");
    return content;
}

} // namespace

Counted<Project> ProjectFile::read(const fs::path& file, ChangeLog& log)
{
    return parse(contentOf(file), file.string(), log);
}

Counted<Project> ProjectFile::parse(std::string_view text, const std::string& name, ChangeLog& log)
{
    try {
        return ProjectReader::read(text, log);
    } catch (const FileFault& fault) {
        fail(name, fault.what());
    }
}

void ProjectFile::write(const Project& project, const fs::path& file, const std::optional<FileStamp>& expected)
{
    try {
        const std::string text = ProjectWriter::textOf(project);
        FileReplacement replacement(file);
        replacement.write(text);
        replacement.commit(expected);
    } catch (const FileFault& fault) {
        fail(file.string(), std::string("this project can't be stored: ") + fault.what());
    } catch (const FileReplacement::TargetChanged&) {
        fail<ProjectFileChanged>(file.string(), "another program has written it meanwhile");
    } catch (const cadrel::util::Result::Type&) {
        fail(file.string(), "can't be written");
    }
}

std::string ProjectFile::toText(const Project& project)
{
    try {
        return ProjectWriter::textOf(project);
    } catch (const FileFault& fault) {
        throw ProjectFileError(std::string("this project can't be stored: ") + fault.what());
    }
}

} // namespace standin
