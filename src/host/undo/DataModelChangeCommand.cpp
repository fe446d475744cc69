// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelChangeCommand.h"

#include "host/border/HostFailure.h"
#include "util/HostString.h"

#include <utility>

namespace cadrel::host {

using core::serialize::ByteArchive;
using Velmark::IEditTransaction;
using Velmark::IProjectDocument;

DataModelChangeCommand::DataModelChangeCommand(std::wstring name, std::shared_ptr<const NamedEdit> edit,
                                               const std::shared_ptr<core::DataModel>& model)
    : core::DataModelChangeCommand(std::move(name)),
      m_transaction(Velmark::Counted<IEditTransaction>::share(edit->transaction)),
      m_project(Velmark::Counted<IProjectDocument>::share(edit->project)),
      m_step(Velmark::makeCounted<DataModelEditStep>(model, DataModelEditStep::snapshotOf(*model))),
      m_namedEdit(std::move(edit))
{
    // This comes after everything else that can fail, so that no transaction is left open.
    requireOk(m_transaction->begin(true));
}

DataModelChangeCommand::DataModelChangeCommand(IEditTransaction& transaction,
                                               const std::shared_ptr<core::DataModel>& model, IProjectDocument* project,
                                               ByteArchive before)
    : core::DataModelChangeCommand({}), m_transaction(Velmark::Counted<IEditTransaction>::share(&transaction)),
      m_project(Velmark::Counted<IProjectDocument>::share(project)),
      m_step(Velmark::makeCounted<DataModelEditStep>(model, std::move(before)))
{
}

DataModelChangeCommand::~DataModelChangeCommand()
{
    m_transaction->addStep(m_step.get());
    const bool isNamed = m_namedEdit != nullptr;
    // Whoever is told of the commit begins an edit of his own.
    m_namedEdit.reset();
    if (isNamed)
        m_transaction->commit(m_project.get(), util::HostString(m_name).utf16());
}

} // namespace cadrel::host
