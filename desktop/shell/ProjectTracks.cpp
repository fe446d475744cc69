// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/ProjectTracks.h"

#include "standin/Application.h"
#include "standin/edit/DependencyManager.h"
#include "standin/edit/EditService.h"
#include "standin/project/Project.h"
#include "standin/window/ViewManager.h"
#include "velmark/ChangeView.h"
#include "velmark/Implements.h"

#include <utility>

namespace desktop {

using namespace Velmark;

namespace {

/// Reading a long list anew for each key would hold the user up: it may take one part in so many of the time.
constexpr int LookShare = 20;

} // namespace

/// Tells the view that the project has changed.
class ProjectTracks::Dependent : public Implements<Dependent, FObject> {
public:
    static constexpr const char* ClassName = "Dependent";

    explicit Dependent(TracksView& view) : m_view(view) {}

    int32 update(FUnknown* /*changed*/, int32 /*message*/) override
    {
        m_view.projectChanged();
        return ResultOk;
    }

private:
    TracksView& m_view;
};

ProjectTracks::ProjectTracks(standin::Application& application, standin::Project& project, Stills* stills)
    : m_application(application), m_project(Counted<standin::Project>::share(&project)),
      m_view(std::make_unique<TracksView>(project, application.edits(), stills)),
      m_dependent(makeCounted<Dependent>(*m_view))
{
    m_application.dependencies().addDependent(static_cast<FObject*>(&project), m_dependent.get());
    m_view->onClipClicked = [this](std::size_t event) { m_clicked = event; };
}

ProjectTracks::~ProjectTracks()
{
    m_application.dependencies().removeDependent(static_cast<FObject*>(m_project.get()), m_dependent.get());
}

std::optional<ProjectTracks::SeenEvent> ProjectTracks::seen(std::optional<std::size_t> event) const
{
    const auto move = event ? m_change.map().moveOf(*event) : std::nullopt;
    return move ? std::optional(SeenEvent{*move, m_change.map().state()}) : std::nullopt;
}

void ProjectTracks::select(std::size_t event)
{
    const auto clicked = seen(event);
    bool isSelected = false;
    for (const auto& window : m_application.views().windows()) {
        const auto view = query<IChangeView>(window->view());
        isSelected = isSelected || (clicked && view &&
                                    view->selectChange(clicked->move.source, clicked->move.destination) == ResultOk);
    }
    if (isSelected)
        m_seen = clicked;
    else
        m_view->showEvent(m_change.event(), false);
}

void ProjectTracks::idle()
{
    if (const auto clicked = std::exchange(m_clicked, std::nullopt))
        select(*clicked);
    const auto start = Clock::now();
    if (start < m_nextLook)
        return;
    const bool isNew = m_change.look(*m_project);
    const auto end = Clock::now();
    m_nextLook = end + LookShare * (end - start);
    if (!isNew)
        return;
    m_view->setChange(m_change.map());
    // The user may have scrolled elsewhere since.
    const auto event = seen(m_change.event());
    m_view->showEvent(m_change.event(), event != m_seen);
    m_seen = event;
}

} // namespace desktop
