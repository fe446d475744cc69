// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"
#include "standin/changes/UndoList.h"
#include "velmark/Editing.h"
#include "velmark/Implements.h"

#include <string>
#include <vector>

namespace standin {

class Container;
class Node;
class Project;
class ProjectManager;

/// Edits of the open projects of a host, and the one transaction that can be open. All but `begin` is refused without it.
///
/// A transaction that has edited several projects makes an entry in the undo list of each.
class EditService
    : public Velmark::Implements<EditService, Velmark::FObject, Velmark::IEditService, Velmark::IEditTransaction> {
public:
    static constexpr const char* ClassName = "EditService";

    /// What these operations answer when they refuse.
    static constexpr Velmark::int32 Refused = 2;

    explicit EditService(ProjectManager& projects) : m_projects(projects) {}

    bool isOpen() const { return m_log.isOpen(); }
    ChangeLog& log() { return m_log; }

    /// Take the last entry of the project's undo list back, or make it again, and tell the dependents. False while a
    /// transaction is open or another entry is on its way, and when there is no such entry.
    bool undo(Project& project);
    bool redo(Project& project);
    /// Ends a transaction that was left open by those who were told of the closing of a project, which isn't looked into.
    /// What was edited in others becomes an entry there, of which nobody is told before the next idle call.
    void endAfterClosing(Project& closed);

    // IEditService
    Velmark::int32 copyRange(Velmark::IProjectDocument* project, Velmark::IObjectList* tracks, Velmark::int32 reserved,
                             double start, double end, double destination) override;
    Velmark::int32 closeRange(Velmark::IProjectDocument* project, Velmark::IObjectList* tracks, double start,
                              double end, double reserved) override;

    // IEditTransaction
    /// Refused from within the undo or redo of a step.
    Velmark::int32 begin(bool flag) override;
    /// Refused from within an edit hook, and for a project that isn't open; the transaction stays open then.
    Velmark::int32 commit(Velmark::IProjectDocument* project, const char16_t* name) override;
    /// The child keeps its times of the project. Refuses what is inserted already, belongs to another project, can't lie in
    /// that parent, or would lie before the start of it.
    Velmark::int32 insert(Velmark::FUnknown* parent, Velmark::FUnknown* child) override;
    /// The parent given may be the one that holds the child or any around that: a caller knows a track without knowing the
    /// folder into which the user has put it.
    Velmark::int32 remove(Velmark::FUnknown* parent, Velmark::FUnknown* child) override;
    Velmark::int32 move(Velmark::FUnknown* parent, Velmark::FUnknown* newParent, Velmark::FUnknown* child) override;
    Velmark::int32 copyAll(Velmark::IProjectDocument* project, Velmark::FUnknown** clipboard, double start, double end,
                           Velmark::int32 reserved) override;
    Velmark::int32 paste(Velmark::IProjectDocument* project, Velmark::FUnknown* clipboard, Velmark::int32 reserved,
                         double destination) override;
    Velmark::int32 deleteRange(Velmark::IProjectDocument* project, Velmark::int32 reserved, double start,
                               double end) override;
    Velmark::int32 addStep(Velmark::IEditStep* step) override;

private:
    /// A container of an open project; null for anything else.
    Container* openContainer(Velmark::FUnknown* object) const;
    /// A node of an open project that lies in another, however deep; null for anything else.
    Node* openChild(Velmark::FUnknown* parent, Velmark::FUnknown* child) const;
    /// The open projects that the transaction has edited; its steps are of the one for which it is committed.
    std::vector<Velmark::Counted<Project>> editedProjects(Project& committed) const;
    /// Makes the entries in the undo lists out of what the transaction has taken down.
    void addEntries(Project& committed, const std::u16string& name);
    template <bool (UndoList::*step)()>
    bool revert(Project& project);

    ProjectManager& m_projects;
    ChangeLog m_log;
    bool m_isCommitting = false;
    bool m_isReverting = false;
};

} // namespace standin
