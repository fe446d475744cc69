// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/ardour/ArdourSession.h"
#include "standin/project/ProjectForm.h"
#include "velmark/Counted.h"

#include <memory>
#include <string_view>

namespace standin {

class ChangeLog;

/// Sessions of Ardour 6 and 7, as docs/ardour.md describes them. The text that was read is kept, and only what has changed
/// in the project is changed in it.
class ArdourForm : public ProjectForm {
public:
    /// Whether it is the text of a session, of whatever version.
    static bool recognises(std::string_view text);
    /// Throws FileFault. Nothing of the project counts as changed.
    static Velmark::Counted<Project> read(std::string text, const std::filesystem::path& file, ChangeLog& log);

    explicit ArdourForm(ArdourSession session) : m_session(std::move(session)) {}

    std::string textOf(const Project& project) const override;
    void requireFree(const std::filesystem::path& file) const override;
    void wasWritten(const std::filesystem::path& file) const override;

private:
    ArdourSession m_session;
};

} // namespace standin
