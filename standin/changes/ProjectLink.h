// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"
#include "standin/changes/ChangeNotes.h"
#include "velmark/Implements.h"

#include <cstdint>
#include <memory>

namespace standin {

class Project;

/// How the objects of a project find it, which they may outlive, and where they leave word of their changes: for the undo
/// list in the ChangeLog, and for those who are told in the ChangeNotes.
class ProjectLink : public Velmark::Implements<ProjectLink, Velmark::FObject> {
public:
    static constexpr const char* ClassName = "ProjectLink";

    /// `object` is the project itself. The log has to be there as long as the project is.
    ProjectLink(Project& project, MarkedObject& object, ChangeLog& log)
        : m_project(&project), m_changes(object), m_log(log)
    {
    }

    /// Null when it has gone; then nothing but this may be asked.
    Project* project() const { return m_project; }
    /// The project calls it when it goes.
    void cut() { m_project = nullptr; }

    ChangeNotes& changes() { return m_changes; }
    const ChangeNotes& changes() const { return m_changes; }
    ChangeLog& log() const { return m_log; }
    /// Whether the project is open in the host; only then do its changes go to the log.
    bool isOpen() const { return m_isOpen; }
    void setOpen(bool isOpen) { m_isOpen = isOpen; }
    /// Whether edits are taken down: the project is there and open, and so is a transaction. May be asked at any time.
    bool isRecording() const { return m_project && m_isOpen && m_log.isOpen(); }
    void record(std::unique_ptr<Edit> edit) { m_log.add(*m_project, std::move(edit)); }
    /// How many changes below the project itself were made that no undo takes back. That of the project's own values isn't
    /// among them.
    std::uint64_t unrecordedChanges() const { return m_unrecordedChanges; }
    void countUnrecorded() { ++m_unrecordedChanges; }

private:
    Project* m_project;
    ChangeNotes m_changes;
    ChangeLog& m_log;
    bool m_isOpen = false;
    std::uint64_t m_unrecordedChanges = 0;
};

} // namespace standin
