// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Implements.h"
#include "velmark/Transport.h"

namespace standin {

class ProjectManager;

/// The transport of the active project. It never runs; its cycle and its position are the project's.
class Transport : public Velmark::Implements<Transport, Velmark::FObject, Velmark::ITransportControl> {
public:
    static constexpr const char* ClassName = "Transport";

    explicit Transport(ProjectManager& projects) : m_projects(projects) {}

    // Without an active project there is no parameter, the position is 0, and the rest is refused.

    Velmark::IParameter* getParameter(const char* name) override;
    double getPosition() override;
    Velmark::int32 setPosition(double seconds) override;
    Velmark::int32 stop() override;

private:
    ProjectManager& m_projects;
};

} // namespace standin
