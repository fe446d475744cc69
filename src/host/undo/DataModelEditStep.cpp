// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelEditStep.h"

#include "core/model/DataModel.h"
#include "host/border/HostFailure.h"

#include <utility>

namespace cadrel::host {

using core::serialize::ByteArchive;
using util::Result;

ByteArchive DataModelEditStep::snapshotOf(const core::DataModel& model)
{
    ByteArchive snapshot;
    snapshot << model;
    return snapshot;
}

DataModelEditStep::DataModelEditStep(std::weak_ptr<core::DataModel> model, ByteArchive before)
    : m_snapshot(std::move(before)), m_model(std::move(model))
{
    m_snapshot.rewind();
}

Result::Type DataModelEditStep::swap()
{
    return resultOf([this] {
        const auto model = m_model.lock();
        if (!model)
            throw Result::NotAvailable;
        // Kept before the restore, which empties the model when it fails.
        ByteArchive other = std::exchange(m_snapshot, snapshotOf(*model));
        model->restore(other);
    });
}

} // namespace cadrel::host
