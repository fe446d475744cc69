// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/serialize/ByteArchive.h"
#include "util/Result.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <memory>

namespace cadrel::core {
class DataModel;
}

namespace cadrel::host {

/// A change of the model in the host's undo list. The step holds the state on the other side of the change: each undo and
/// each redo puts that in the place of the model's present state, which the step holds from then on.
///
///                  model      step
///     done         after      before
///     undo()       before     after
///     redo()       after      before
class DataModelEditStep : public Velmark::Implements<DataModelEditStep, Velmark::FObject, Velmark::IEditStep> {
public:
    static constexpr const char* ClassName = "DataModelEditStep";

    /// A snapshot of a model as it stands. Throws what the model's writing throws.
    static core::serialize::ByteArchive snapshotOf(const core::DataModel& model);

    /// `before` is a snapshot from before the change. The step may outlive the model, and isn't part of what keeps it alive.
    DataModelEditStep(std::weak_ptr<core::DataModel> model, core::serialize::ByteArchive before);

    Velmark::int32 execute() override { return Velmark::ResultOk; }
    /// Both notify the model's listeners. They answer the Result::Type of a failure; the step has changed sides even then,
    /// so that the next call brings back what stood before this one.
    /// Without its model a step does nothing and answers Result::NotAvailable.
    Velmark::int32 undo() override { return swap(); }
    Velmark::int32 redo() override { return swap(); }
    const char16_t* getDescription() override { return nullptr; }

private:
    util::Result::Type swap();

    core::serialize::ByteArchive m_snapshot; ///< read from its start
    std::weak_ptr<core::DataModel> m_model;
};

} // namespace cadrel::host
