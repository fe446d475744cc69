// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/Project.h"

#include <set>
#include <vector>

namespace standin {

class DependencyManager;
class Project;

/// The open projects, the active one of them, and those who are told of them.
class ProjectManager : public Velmark::Implements<ProjectManager, Velmark::FObject, Velmark::IProjectManager> {
public:
    static constexpr const char* ClassName = "ProjectManager";

    explicit ProjectManager(DependencyManager& dependencies) : m_dependencies(dependencies) {}

    Velmark::int32 projectCount() override;
    Velmark::IProjectDocument* projectAt(Velmark::int32 index) override;
    Velmark::IProjectDocument* activeProject() override;
    Velmark::int32 addNotification(Velmark::IProjectNotification* listener) override;
    Velmark::int32 removeNotification(Velmark::IProjectNotification* listener) override;

    const std::vector<Velmark::Counted<Project>>& projects() const { return m_projects; }
    /// Null when none is.
    Project* active() const { return m_active; }
    /// The open project that has this interface; null for any other.
    Project* find(const Velmark::IProjectDocument* project) const;

    // These tell the listeners, from a copy of their list.

    Project& add(Velmark::Counted<Project> project);
    /// Null makes none active. Activating the active one does nothing.
    void activate(Project* project);
    /// Drops its undo list, too.
    void close(Project& project);
    void renamed(Project& project);
    /// To the edit hooks, with the changes shown: the transaction is about to be committed.
    void edited(Project& project, Velmark::IEditTransaction& transaction);
    /// To the dependents of the project and, when it has changed, of the pool, with the changes shown. What changes while they
    /// are told, they are told of another time.
    void tellChanges(Project& project);

private:
    template <class Visit>
    void tellListeners(Visit visit) const;

    DependencyManager& m_dependencies;
    std::vector<Velmark::Counted<Project>> m_projects;
    Project* m_active = nullptr;
    HandlerList<Velmark::IProjectNotification> m_listeners;
    std::set<const Project*> m_beingTold;
};

} // namespace standin
