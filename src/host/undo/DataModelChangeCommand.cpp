// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelChangeCommand.h"

#include "host/border/HostFailure.h"
#include "util/HostString.h"

#include <utility>

namespace cadrel::host {

using core::serialize::ByteArchive;
using Velmark::IEditTransaction;
using Velmark::IProjectDocument;

DataModelChangeCommand::DataModelChangeCommand(std::wstring name, IEditTransaction& transaction,
                                               const std::shared_ptr<core::DataModel>& model, IProjectDocument* project)
    : DataModelChangeCommand(std::move(name), transaction, model, project, DataModelEditStep::snapshotOf(*model), true)
{
}

DataModelChangeCommand::DataModelChangeCommand(IEditTransaction& transaction,
                                               const std::shared_ptr<core::DataModel>& model, IProjectDocument* project,
                                               ByteArchive before)
    : DataModelChangeCommand({}, transaction, model, project, std::move(before), false)
{
}

DataModelChangeCommand::DataModelChangeCommand(std::wstring name, IEditTransaction& transaction,
                                               const std::shared_ptr<core::DataModel>& model, IProjectDocument* project,
                                               ByteArchive before, bool commitOnEnd)
    : core::DataModelChangeCommand(std::move(name)),
      m_transaction(Velmark::Counted<IEditTransaction>::share(&transaction)),
      m_project(Velmark::Counted<IProjectDocument>::share(project)),
      m_step(Velmark::makeCounted<DataModelEditStep>(model, std::move(before))), m_commitOnEnd(commitOnEnd)
{
    // This comes after everything else that can fail, so that no transaction is left open.
    if (m_commitOnEnd)
        requireOk(m_transaction->begin(true));
}

DataModelChangeCommand::~DataModelChangeCommand()
{
    m_transaction->addStep(m_step.get());
    if (m_commitOnEnd)
        m_transaction->commit(m_project.get(), util::HostString(m_name).utf16());
}

} // namespace cadrel::host
