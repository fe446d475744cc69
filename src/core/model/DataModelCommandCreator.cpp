// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/DataModelCommandCreator.h"

namespace cadrel::core {

namespace {

DataModelCommandCreator* commandCreator = nullptr;

} // namespace

void setDataModelCommandCreator(DataModelCommandCreator* creator)
{
    commandCreator = creator;
}

std::unique_ptr<DataModelChangeCommand> createDataModelCommand(const std::wstring& name)
{
    return commandCreator == nullptr ? nullptr : commandCreator->createCommand(name);
}

std::unique_ptr<DataModelChangeCommand> createDataModelCommand(EditTransactionHandle& transaction)
{
    return commandCreator == nullptr ? nullptr : commandCreator->createCommand(transaction);
}

std::unique_ptr<DataModelChangeCommand> createDataModelCommand(EditTransactionHandle& transaction,
                                                               const serialize::ByteArchive& snapshot)
{
    return commandCreator == nullptr ? nullptr : commandCreator->createCommand(transaction, snapshot);
}

} // namespace cadrel::core
