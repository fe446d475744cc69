// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/Variant.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <memory>
#include <optional>

namespace cadrel::core {
class DataModel;
}

namespace cadrel::host {

/// Lets the note of a run in a model follow the host's undo list, also where the host has refused the step that holds the
/// whole model. A run that was undone must not count as done.
class RunNoteStep : public Velmark::Implements<RunNoteStep, Velmark::FObject, Velmark::IEditStep> {
public:
    static constexpr const char* ClassName = "RunNoteStep";

    /// Make it before the note is written. The step may outlive the model, and isn't part of what keeps it alive.
    explicit RunNoteStep(const std::shared_ptr<core::DataModel>& model);

    Velmark::int32 execute() override { return Velmark::ResultOk; }
    /// Without their model both do nothing and answer Result::NotAvailable.
    Velmark::int32 undo() override { return swap(); }
    Velmark::int32 redo() override { return swap(); }
    const char16_t* getDescription() override { return nullptr; }

private:
    /// The properties that RunRecord writes, where they are there.
    struct Note {
        std::optional<core::Variant> doneRuns;
        std::optional<core::Variant> earlierRuns;
    };

    static Note noteIn(const core::DataModel& model);
    Velmark::int32 swap();

    std::weak_ptr<core::DataModel> m_model;
    Note m_other; ///< what the model holds on the other side of the run
};

} // namespace cadrel::host
