// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/edl/ProjectClock.h"
#include "app/settings/SettingsReport.h"
#include "core/model/DataModel.h"
#include "util/Result.h"

#include <memory>
#include <optional>
#include <string>

namespace standin {
class Project;
} // namespace standin

namespace cadrel::app {

/// What earlier runs of Cadrel have stored in a project: the cuts of the last one and its settings.
class StoredModel {
public:
    /// Reads it under the rate of the clock; no ProjectFramerate may be installed.
    StoredModel(const standin::Project& project, const ProjectClock& clock);

    bool isUnreadable() const { return m_failure.has_value(); }
    bool isOfNewerVersion() const { return m_failure == util::Result::NewerVersion; }
    /// What is wrong with it, where it is unreadable: "Cadrel's data in it is damaged".
    std::string fault() const;
    /// What the user can do then.
    std::string remedy() const;
    /// Null where there is none, or none that can be read.
    const core::DataModel* model() const { return m_model.get(); }

private:
    std::unique_ptr<core::DataModel> m_model;
    std::optional<util::Result::Type> m_failure;
};

/// The settings of a stored model, for a report.
SettingsReport settingsIn(const core::DataModel& model, const standin::Project& project, const ProjectClock& clock);

} // namespace cadrel::app
