// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/ActionManager.h"

#include "standin/edit/EditService.h"
#include "standin/edit/ProjectManager.h"
#include "standin/project/Project.h"

namespace standin {

using namespace Velmark;

int32 ActionManager::invoke(const char* category, const char* action, int32 /*reserved*/)
{
    if (!category || !action)
        return ResultFalse;
    const auto carriesOut = [=](IActionHandler& handler) {
        return handler.handleAction(category, action, true) == ResultOk;
    };
    const std::optional<bool> own = invokeOwn(category, action);
    const bool done = own ? *own : m_handlers.anyOf(carriesOut);
    return done ? ResultOk : ResultFalse;
}

std::optional<bool> ActionManager::invokeOwn(std::string_view category, std::string_view action)
{
    const bool isUndo = action == Undo;
    if (category != EditCategory || (!isUndo && action != Redo))
        return std::nullopt;
    Project* const project = m_projects.active();
    if (!project)
        return false;
    return isUndo ? m_edits.undo(*project) : m_edits.redo(*project);
}

} // namespace standin
