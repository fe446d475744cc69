// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/Application.h"
#include "util/FileStamp.h"
#include "util/Result.h"
#include "velmark/Counted.h"

#include <functional>
#include <optional>
#include <string>

namespace cadrel::core {
class DataModel;
struct SecondsRange;
} // namespace cadrel::core

namespace cadrel::host {
class Host;
} // namespace cadrel::host

namespace cadrel::app {

class Terminal;

/// A project that is open in the stand-in host. Cadrel works there as in any host: it gets the host's context and is
/// told of the project. A run is requested as the window requests it, and done in the host's next idle call.
class HostedProject {
public:
    /// What becomes of a stored model that can't be read.
    enum class Opening {
        WithStored,   ///< it is a failure
        Fresh,        ///< it is dropped
        FreshInPlace, ///< it is dropped, but for that of a newer version, which is a failure
    };

    /// Throws Failure when the file or its model can't be read. The terminal shows the progress of a run.
    HostedProject(const std::string& file, const Terminal& terminal, Opening opening);
    HostedProject(const HostedProject&) = delete;
    HostedProject& operator=(const HostedProject&) = delete;
    ~HostedProject();

    standin::Project& project() { return *m_project; }
    core::DataModel& model();

    /// A project can have been saved in the middle of a preview, which a run and its plan must not meet.
    void endPreview();
    /// Applies the change list of the model. An Interruption cancels it, and what has been done is taken back. Throws
    /// Interruption::Requested then, and Failure when the run couldn't begin or failed.
    void apply();
    /// The same, but nothing changes outside of the bounds, in seconds of the project's clock.
    void applyWithin(const core::SecondsRange& bounds);

    /// Throws Failure where the project can't be written, as far as that is known before a run.
    void requireTarget(const std::string& file) const;

    // The host's own save, in which the model is stored with the project. Each throws Failure, with all files as they were.

    /// Over the file that was read. Refused when another program has saved it since.
    void saveInPlace() { save(m_file, m_stamp); }
    /// To a file that doesn't exist. Refused when it does by now.
    void saveAs(const std::string& file) { save(file, util::FileStamp()); }
    /// Over whatever stands there.
    void saveOver(const std::string& file) { save(file, std::nullopt); }

private:
    void dropUnreadableModel(Opening opening);
    void apply(const std::function<util::Result::Type()>& request);
    void save(const std::string& file, const std::optional<util::FileStamp>& expected);

    std::string m_file;
    util::FileStamp m_stamp; ///< of the file, before it was read
    standin::Application m_application;
    Velmark::Counted<host::Host> m_host;
    standin::Project* m_project = nullptr;
};

} // namespace cadrel::app
