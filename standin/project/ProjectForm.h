// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>

namespace standin {

class Project;

/// The form in which a project is stored. It belongs to one project and may keep what that was read from, so that writing
/// changes only what has changed.
class ProjectForm {
public:
    ProjectForm() = default;
    ProjectForm(const ProjectForm&) = delete;
    ProjectForm& operator=(const ProjectForm&) = delete;
    virtual ~ProjectForm() = default;

    /// The content of the project's file. Throws FileFault for a project that no file of this form can hold.
    virtual std::string textOf(const Project& project) const = 0;
    /// Throws FileFault when something beside the file forbids that it is read or replaced.
    virtual void requireFree(const std::filesystem::path& file) const = 0;
    /// What there is to do beside a file that has been written.
    virtual void wasWritten(const std::filesystem::path& file) const = 0;
};

} // namespace standin
