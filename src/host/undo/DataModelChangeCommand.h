// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModelChangeCommand.h"
#include "host/undo/DataModelEditStep.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Project.h"

#include <memory>
#include <string>

namespace cadrel::host {

/// The edit of a change that is an entry of the undo list by itself; as long as the change.
struct NamedEdit {
    Velmark::IEditTransaction* transaction;
    Velmark::IProjectDocument* project;
};

/// Brings one change of the model into the host's undo list: it takes a snapshot of the state before the change when it
/// is created, and gives it to the transaction when it is destroyed. It ignores a failure of the host there, because a
/// destructor must not throw.
class DataModelChangeCommand : public core::DataModelChangeCommand {
public:
    /// A change that is an entry of the undo list by itself: begins the transaction, and commits it under the name at the
    /// end. Throws Result::HostCallFailed when it can't begin; nothing is committed then.
    DataModelChangeCommand(std::wstring name, std::shared_ptr<const NamedEdit> edit,
                           const std::shared_ptr<core::DataModel>& model);
    /// A change within an open transaction, whose commit is somebody else's. `before` is the snapshot to go back to.
    DataModelChangeCommand(Velmark::IEditTransaction& transaction, const std::shared_ptr<core::DataModel>& model,
                           Velmark::IProjectDocument* project, core::serialize::ByteArchive before);
    ~DataModelChangeCommand() override;

private:
    Velmark::Counted<Velmark::IEditTransaction> m_transaction;
    Velmark::Counted<Velmark::IProjectDocument> m_project;
    Velmark::Counted<DataModelEditStep> m_step;
    std::shared_ptr<const NamedEdit> m_namedEdit; ///< null for a change within an open transaction
};

} // namespace cadrel::host
