// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>
#include <vector>

namespace standin {

class Project;

/// The form in which a project is stored. It belongs to one project and may keep what that was read from, so that writing
/// changes only what has changed.
class ProjectForm {
public:
    /// The attributes by which a form knows what it has read have keys that begin so.
    static constexpr const char* KeyPrefix = "Form:";

    ProjectForm() = default;
    ProjectForm(const ProjectForm&) = delete;
    ProjectForm& operator=(const ProjectForm&) = delete;
    virtual ~ProjectForm() = default;

    /// The content of the project's file. Throws FileFault for a project that no file of this form can hold.
    virtual std::string textOf(const Project& project) const = 0;
    /// Throws FileFault when something beside the file forbids that it is read or replaced.
    virtual void requireFree(const std::filesystem::path& file) const = 0;
    /// Throws FileFault for a place in which the file would be of no use.
    virtual void requirePlace(const std::filesystem::path& file) const = 0;
    /// What there is to do beside a file that has been written.
    virtual void wasWritten(const std::filesystem::path& file) const = 0;
    /// Whether what Cadrel has stored in the file can't be read. The next writing replaces it if there is something to store.
    virtual bool hasBrokenStorage() const = 0;
    /// What of the file no edit of the project moves, in words.
    virtual std::vector<std::string> staying() const = 0;
    /// How long a clip fades in or out where an edit has cut it, in seconds.
    virtual void setEdgeFade(double seconds) = 0;
};

} // namespace standin
