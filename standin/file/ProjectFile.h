// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/FileStamp.h"
#include "velmark/Counted.h"

#include <cstddef>
#include <filesystem>
#include <optional>
#include <stdexcept>
#include <string>
#include <string_view>
#include <utility>

namespace standin {

class ChangeLog;
class Project;

/// What is wrong with a project file. `what()` is one line: the file, the place in it and the fault.
class ProjectFileError : public std::runtime_error {
public:
    explicit ProjectFileError(const std::string& fault, std::string remedy = {})
        : std::runtime_error(fault), m_remedy(std::move(remedy))
    {
    }

    /// What the user can do; empty where it isn't known.
    const std::string& remedy() const { return m_remedy; }

private:
    std::string m_remedy;
};

/// Another program has written the file that a project was to replace.
class ProjectFileChanged : public ProjectFileError {
public:
    using ProjectFileError::ProjectFileError;
};

/// Projects in files. In which form one is stored is told by its content, and a project is written in the form in which it
/// was read. The same project always gives the same bytes.
class ProjectFile {
public:
    /// No project's file is larger than this, in bytes.
    static constexpr std::size_t LargestSize = std::size_t{1} << 31U;

    /// The only session in a folder, and any other path itself. Throws ProjectFileError for a folder with none or several.
    static std::filesystem::path fileIn(const std::filesystem::path& path);
    /// Throws ProjectFileError. `log` is the host's.
    static Velmark::Counted<Project> read(const std::filesystem::path& file, ChangeLog& log);
    /// The same from the content of a file; `name` is for the errors alone.
    static Velmark::Counted<Project> parse(std::string_view text, const std::string& name, ChangeLog& log);
    /// Throws ProjectFileError when a project of its form can't be written there, whatever is in it.
    static void requireWritable(const Project& project, const std::filesystem::path& file);
    /// Replaces the file in one step: whatever happens, there is either the whole former file or the whole new one. With an
    /// `expected` stamp the file has to be as it was then; else ProjectFileChanged is thrown. Throws ProjectFileError. Answers
    /// what it has written.
    static std::string write(const Project& project, const std::filesystem::path& file,
                             const std::optional<cadrel::util::FileStamp>& expected = std::nullopt);
    /// The content of the file. Throws ProjectFileError, without a name, for a project that no file can hold.
    static std::string toText(const Project& project);
};

} // namespace standin
