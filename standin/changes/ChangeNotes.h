// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/MarkedObject.h"
#include "velmark/Counted.h"

#include <vector>

namespace standin {

/// Notes which objects of a project have changed, and keeps them alive, until all who depend on them have been told.
class ChangeNotes {
public:
    /// `project` is the project itself, which is never kept alive; it owns the notes.
    explicit ChangeNotes(MarkedObject& project) : m_project(project) {}

    /// `flags` are Velmark::ChangeFlag bits, here and below.
    void mark(MarkedObject& object, Velmark::uint32 flags);
    void markProject(Velmark::uint32 flags) { m_project.addMarks(flags); }
    void markPool() { m_hasPoolChanged = true; }
    /// Whether something has changed that isn't told yet.
    bool hasChanges() const { return m_project.isMarked() || !m_marked.empty() || m_hasPoolChanged; }

    /// From now on the objects show what was marked so far.
    void show();
    /// Shows the marks to those who are told of them now. What is marked from here on is to be told another time.
    void startTelling();
    /// All have been told: no mark is shown any more, and what was kept alive for the telling alone is dropped.
    void endTelling();
    /// Whether the media pool is among what is told.
    bool tellsOfPool() const { return m_tellsOfPool; }
    /// Nothing of what has happened so far counts as a change.
    void clear();

private:
    MarkedObject& m_project;
    std::vector<Velmark::Counted<MarkedObject>> m_marked;
    std::vector<Velmark::Counted<MarkedObject>> m_told;
    bool m_hasPoolChanged = false;
    bool m_tellsOfPool = false;
};

} // namespace standin
