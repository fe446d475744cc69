// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/serialize/ByteArchive.h"
#include "util/Result.h"

#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace cadrel::tests {

/// Stands in for the host's undo list while it lives, and remembers the names of the entries.
class RecordingUndo : public core::DataModelCommandCreator {
public:
    RecordingUndo() { core::setDataModelCommandCreator(this); }
    RecordingUndo(const RecordingUndo&) = delete;
    RecordingUndo& operator=(const RecordingUndo&) = delete;
    ~RecordingUndo() override { core::setDataModelCommandCreator(nullptr); }

    std::unique_ptr<core::DataModelChangeCommand> createCommand(const std::wstring& name) override
    {
        if (failure != util::Result::Ok)
            throw failure;
        begun.push_back(name);
        if (model) {
            before.clear();
            before << *model;
        }
        return std::make_unique<Command>(name, *this);
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle&) override
    {
        throw std::logic_error("the window opens no transaction");
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle&,
                                                                const core::serialize::ByteArchive&) override
    {
        throw std::logic_error("the window opens no transaction");
    }

    const core::DataModel* model = nullptr;        ///< its state is kept at the start of each scope, if it is set
    core::serialize::ByteArchive before;           ///< that state
    util::Result::Type failure = util::Result::Ok; ///< thrown instead of the next scopes, when it isn't Ok
    std::vector<std::wstring> begun;               ///< scopes that were opened
    std::vector<std::wstring> entries;             ///< scopes that were closed

private:
    class Command : public core::DataModelChangeCommand {
    public:
        Command(const std::wstring& name, RecordingUndo& undo) : DataModelChangeCommand(name), m_undo(undo) {}
        ~Command() override { m_undo.entries.push_back(m_name); }

    private:
        RecordingUndo& m_undo;
    };
};

} // namespace cadrel::tests
