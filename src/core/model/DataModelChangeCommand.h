// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string>
#include <utility>

namespace cadrel::core {

/// The scope of one change of the data model that the user can undo. A command takes a snapshot of the model when it is
/// created, and passes it on when it is destroyed.
class DataModelChangeCommand {
public:
    explicit DataModelChangeCommand(std::wstring name) : m_name(std::move(name)) {}
    DataModelChangeCommand(const DataModelChangeCommand&) = delete;
    DataModelChangeCommand& operator=(const DataModelChangeCommand&) = delete;
    virtual ~DataModelChangeCommand() = 0;

protected:
    std::wstring m_name; ///< of the undo entry
};

inline DataModelChangeCommand::~DataModelChangeCommand() = default;

} // namespace cadrel::core
