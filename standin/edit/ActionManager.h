// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"
#include "velmark/UserInterface.h"

#include <optional>
#include <string_view>

namespace standin {

class EditService;
class ProjectManager;

/// Named actions: the host's own on the undo list of the active project, and those of the handlers.
class ActionManager : public Velmark::Implements<ActionManager, Velmark::FObject, Velmark::IActionManager> {
public:
    static constexpr const char* ClassName = "ActionManager";

    ActionManager(ProjectManager& projects, EditService& edits) : m_projects(projects), m_edits(edits) {}

    /// Refuses null, and a handler that is there already.
    Velmark::int32 addHandler(Velmark::IActionHandler* handler) override { return m_handlers.add(handler); }
    /// Refuses a handler that isn't there.
    Velmark::int32 removeHandler(Velmark::IActionHandler* handler) override { return m_handlers.remove(handler); }
    /// The host's own actions come first and are passed on to nobody; of the handlers the first that carries the action
    /// out is the last that is asked.
    Velmark::int32 invoke(const char* category, const char* action, Velmark::int32 reserved) override;

private:
    /// Whether the action was carried out; nothing for one that isn't the host's own.
    std::optional<bool> invokeOwn(std::string_view category, std::string_view action);

    ProjectManager& m_projects;
    EditService& m_edits;
    HandlerList<Velmark::IActionHandler> m_handlers;
};

} // namespace standin
