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
    static constexpr const char* Extension = ".ardour";

    /// Whether it is the text of a session, of whatever version.
    static bool recognises(std::string_view text);
    /// Throws FileFault. Nothing of the project counts as changed.
    static Velmark::Counted<Project> read(std::string text, const std::filesystem::path& file, ChangeLog& log);

    /// `folder` is that of the session, with its sound.
    ArdourForm(ArdourSession session, std::filesystem::path folder)
        : m_session(std::move(session)), m_folder(std::move(folder))
    {
    }

    std::string textOf(const Project& project) const override;
    void requireFree(const std::filesystem::path& file) const override;
    void requirePlace(const std::filesystem::path& file) const override;
    void wasWritten(const std::filesystem::path& file) const override;
    bool hasBrokenStorage() const override { return m_session.isOwnBroken; }
    std::vector<std::string> staying() const override { return m_session.staying; }
    void setEdgeFade(double seconds) override { m_session.edgeFade = m_session.clock.samplesOf(seconds); }

private:
    ArdourSession m_session;
    std::filesystem::path m_folder;
};

} // namespace standin
