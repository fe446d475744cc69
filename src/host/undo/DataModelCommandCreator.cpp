// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelCommandCreator.h"

#include "host/border/HostFailure.h"
#include "host/undo/DataModelChangeCommand.h"
#include "velmark/Context.h"
#include "velmark/Editing.h"

namespace cadrel::host {

using core::EditTransactionHandle;
using core::serialize::ByteArchive;
using Command = std::unique_ptr<core::DataModelChangeCommand>;

Command DataModelCommandCreator::createCommand(const std::wstring& name)
{
    const std::optional<Document> document = activeDocument();
    if (!document)
        return nullptr;
    const auto editService = required(Velmark::service<Velmark::IEditService>(serviceContext()));
    const auto transaction = required(Velmark::query<Velmark::IEditTransaction>(editService));
    const auto edit = std::make_shared<NamedEdit>(NamedEdit{transaction.get(), document->project});
    auto command = std::make_unique<DataModelChangeCommand>(name, edit, document->model);
    m_namedEdit = edit;
    return command;
}

Command DataModelCommandCreator::createCommand(EditTransactionHandle& transaction)
{
    const std::optional<Document> document = activeDocument();
    return document ? createCommand(transaction, DataModelEditStep::snapshotOf(*document->model)) : nullptr;
}

Command DataModelCommandCreator::createCommand(EditTransactionHandle& transaction, const ByteArchive& snapshot)
{
    const std::optional<Document> document = activeDocument();
    if (!document)
        return nullptr;
    return std::make_unique<DataModelChangeCommand>(transaction.transaction(), document->model, document->project,
                                                    snapshot);
}

Velmark::IEditTransaction* DataModelCommandCreator::namedEdit(const Velmark::IProjectDocument* project) const
{
    const std::shared_ptr<const NamedEdit> edit = m_namedEdit.lock();
    return edit && edit->project == project ? edit->transaction : nullptr;
}

} // namespace cadrel::host
