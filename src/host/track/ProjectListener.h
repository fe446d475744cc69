// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::host {

class Project;

/// Told of the changes of a project of the host.
class ProjectListener {
public:
    virtual ~ProjectListener() = default;

    virtual void projectChanging(Project& project) = 0;
    virtual void projectChanged(Project& project) = 0;
};

} // namespace cadrel::host
