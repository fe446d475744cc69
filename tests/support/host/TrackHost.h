// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/project/Project.h"
#include "host/track/Track.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/Context.h"
#include "velmark/Implements.h"
#include "velmark/Tracks.h"

#include <functional>
#include <utility>

namespace cadrel::host::tests {

/// Tells a project of the changes of its document, as soon as the host tells of them.
class ChangeTeller : public Velmark::Implements<ChangeTeller, Velmark::FObject> {
public:
    static constexpr const char* ClassName = "ChangeTeller";

    ChangeTeller(Velmark::IHostContext* context, Project& project)
        : m_dependencies(Velmark::service<Velmark::IDependencyManager>(context)), m_project(project)
    {
        m_dependencies->addDependent(m_project.document(), this);
    }
    ~ChangeTeller() override { m_dependencies->removeDependent(m_project.document(), this); }

    /// What is done when the project has been told; the change flags can be read.
    std::function<void()> whenTold;

    Velmark::int32 update(Velmark::FUnknown*, Velmark::int32) override
    {
        m_project.onProjectChanged();
        if (whenTold)
            whenTold();
        return Velmark::ResultOk;
    }

private:
    Velmark::Counted<Velmark::IDependencyManager> m_dependencies;
    Project& m_project;
};

/// A host with one open project of 25 frames per second, and the system's view of it.
class TrackHost : public standin::tests::TestHost {
public:
    /// The project's clock begins at `clockOrigin`, in seconds.
    explicit TrackHost(double clockOrigin) : origin(setClock(clockOrigin)), adapter(context(), document()) {}

    Track handle(const Node& track) { return Track(&adapter, Velmark::query<Velmark::ITrackNode>(track).get()); }

    const double origin;
    Project adapter;
    ChangeTeller teller{context(), adapter};
};

} // namespace cadrel::host::tests
