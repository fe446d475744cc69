// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/ProjectManager.h"

#include "standin/edit/DependencyManager.h"
#include "standin/project/Project.h"

#include <algorithm>
#include <cstddef>
#include <utility>

using namespace Velmark;

namespace standin {

int32 ProjectManager::projectCount()
{
    return static_cast<int32>(m_projects.size());
}

IProjectDocument* ProjectManager::projectAt(int32 index)
{
    const bool isThere = index >= 0 && static_cast<std::size_t>(index) < m_projects.size();
    return isThere ? m_projects[static_cast<std::size_t>(index)].get() : nullptr;
}

IProjectDocument* ProjectManager::activeProject()
{
    return m_active;
}

int32 ProjectManager::addNotification(IProjectNotification* listener)
{
    return m_listeners.add(listener);
}

int32 ProjectManager::removeNotification(IProjectNotification* listener)
{
    return m_listeners.remove(listener);
}

Project* ProjectManager::find(const IProjectDocument* project) const
{
    const auto found = std::find_if(m_projects.begin(), m_projects.end(),
                                    [&](const Counted<Project>& open) { return open.get() == project; });
    return found != m_projects.end() ? found->get() : nullptr;
}

Project& ProjectManager::add(Counted<Project> project)
{
    m_projects.push_back(project);
    project->setOpen(true);
    // To whoever is told of it, nothing in it has changed.
    project->clearChanges();
    tellListeners([&](IProjectNotification& listener) { listener.projectOpened(project.get()); });
    return *project;
}

void ProjectManager::activate(Project* project)
{
    if (project == m_active)
        return;
    if (Project* const former = std::exchange(m_active, nullptr))
        tellListeners([&](IProjectNotification& listener) { listener.projectDeactivated(former); });
    m_active = project;
    if (project)
        tellListeners([&](IProjectNotification& listener) { listener.projectActivated(project); });
}

void ProjectManager::close(Project& project)
{
    if (&project == m_active)
        activate(nullptr);
    const auto keptAlive = Counted<Project>::share(&project);
    tellListeners([&](IProjectNotification& listener) { listener.projectClosing(&project, 0); });
    std::erase(m_projects, &project);
    project.setOpen(false);
    project.undoList().clear();
}

void ProjectManager::renamed(Project& project)
{
    tellListeners([&](IProjectNotification& listener) { listener.projectRenamed(&project); });
}

void ProjectManager::edited(Project& project, IEditTransaction& transaction)
{
    project.showChanges();
    tellListeners([&](IProjectNotification& listener) {
        if (const auto hook = query<IProjectEditHook>(&listener))
            hook->projectEdited(&project, &transaction);
    });
}

void ProjectManager::tellChanges(Project& project)
{
    if (!m_beingTold.insert(&project).second)
        return;
    const auto keptAlive = Counted<Project>::share(&project);
    project.startTelling();
    m_dependencies.tell(static_cast<FObject&>(project));
    if (project.tellsOfPool())
        m_dependencies.tell(static_cast<FObject&>(project.pool()));
    project.endTelling();
    m_beingTold.erase(&project);
}

template <class Visit>
void ProjectManager::tellListeners(Visit visit) const
{
    m_listeners.anyOf([&](IProjectNotification& listener) {
        visit(listener);
        return false;
    });
}

} // namespace standin
