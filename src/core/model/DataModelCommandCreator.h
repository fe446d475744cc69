// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModelChangeCommand.h"

#include <memory>
#include <string>

namespace cadrel::core {

namespace serialize {
class ByteArchive;
}

/// An edit that the host adapter has open. The core only passes it on.
class EditTransactionHandle;

/// Makes the undo scopes; the host adapter implements it.
class DataModelCommandCreator {
public:
    virtual ~DataModelCommandCreator() = default;

    virtual std::unique_ptr<DataModelChangeCommand> createCommand(const std::wstring& name) = 0;
    virtual std::unique_ptr<DataModelChangeCommand> createCommand(EditTransactionHandle& transaction) = 0;
    /// Uses a snapshot of the model that was taken earlier.
    virtual std::unique_ptr<DataModelChangeCommand> createCommand(EditTransactionHandle& transaction,
                                                                  const serialize::ByteArchive& snapshot) = 0;
};

/// Installs the process-wide creator, or removes it with null. Not owned.
void setDataModelCommandCreator(DataModelCommandCreator* creator);

/// A scope from the process-wide creator; null when there is none; the caller then goes on without undo.
std::unique_ptr<DataModelChangeCommand> createDataModelCommand(const std::wstring& name);
std::unique_ptr<DataModelChangeCommand> createDataModelCommand(EditTransactionHandle& transaction);
std::unique_ptr<DataModelChangeCommand> createDataModelCommand(EditTransactionHandle& transaction,
                                                               const serialize::ByteArchive& snapshot);

} // namespace cadrel::core
