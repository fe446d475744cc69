// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/shell/StoredChange.h"
#include "desktop/tracks/Stills.h"
#include "desktop/tracks/TracksView.h"
#include "velmark/Counted.h"
#include "velmark/FObject.h"

#include <chrono>
#include <cstddef>
#include <memory>
#include <optional>

namespace standin {
class Application;
class Project;
} // namespace standin

namespace desktop {

/// The view of the tracks of one open project, which follows the project and what Cadrel stores in it.
class ProjectTracks {
public:
    /// All outlive it, the project too, which may be closed before.
    ProjectTracks(standin::Application& application, standin::Project& project, Stills* stills);
    ProjectTracks(const ProjectTracks&) = delete;
    ProjectTracks& operator=(const ProjectTracks&) = delete;
    ~ProjectTracks();

    TracksView& view() { return *m_view; }
    standin::Project& project() const { return *m_project; }
    /// Call it while the user does nothing: takes over what Cadrel has stored meanwhile, and selects in Cadrel's window the
    /// event that has moved the clip that the user has clicked on.
    void idle();

private:
    class Dependent;
    using Clock = std::chrono::steady_clock;
    /// The event that the view has scrolled to, or on one of whose clips the user has clicked there.
    struct SeenEvent {
        ChangeMap::Move move;
        ChangeMap::State state;

        bool operator==(const SeenEvent&) const = default;
    };

    std::optional<SeenEvent> seen(std::optional<std::size_t> event) const;
    void select(std::size_t event);

    standin::Application& m_application;
    Velmark::Counted<standin::Project> m_project;
    std::unique_ptr<TracksView> m_view;
    Velmark::Counted<Dependent> m_dependent;
    StoredChange m_change;
    Clock::time_point m_nextLook{};
    std::optional<SeenEvent> m_seen;
    std::optional<std::size_t> m_clicked; ///< and not selected yet
};

} // namespace desktop
