// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/Transport.h"

#include "standin/edit/ProjectManager.h"
#include "standin/project/Project.h"

#include <string_view>

namespace standin {

using namespace Velmark;

IParameter* Transport::getParameter(const char* name)
{
    Project* const project = m_projects.active();
    if (!project || !name)
        return nullptr;
    if (std::string_view(name) == ParameterName::CycleLeftTime)
        return &project->cycleLeft();
    if (std::string_view(name) == ParameterName::CycleRightTime)
        return &project->cycleRight();
    return nullptr;
}

double Transport::getPosition()
{
    Project* const project = m_projects.active();
    return project ? project->position().getValue() : 0.0;
}

int32 Transport::setPosition(double seconds)
{
    Project* const project = m_projects.active();
    return project ? project->position().setValue(IParameter::Flag::Notify, seconds) : ResultFalse;
}

int32 Transport::stop()
{
    return m_projects.active() ? ResultOk : ResultFalse;
}

} // namespace standin
