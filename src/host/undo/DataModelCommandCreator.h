// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModelCommandCreator.h"

#include <memory>
#include <optional>

namespace Velmark {
class IEditTransaction;
class IHostContext;
class IProjectDocument;
} // namespace Velmark

namespace cadrel::core {

class DataModel;

/// What the handle stands for: the host's transaction, borrowed.
class EditTransactionHandle {
public:
    explicit EditTransactionHandle(Velmark::IEditTransaction& transaction) : m_transaction(transaction) {}

    Velmark::IEditTransaction& transaction() const { return m_transaction; }

private:
    Velmark::IEditTransaction& m_transaction;
};

} // namespace cadrel::core

namespace cadrel::host {

struct NamedEdit;

/// Makes the undo scopes for the model of the active project. Without an active project there are none, and the change is
/// made without undo.
class DataModelCommandCreator : public core::DataModelCommandCreator {
public:
    /// The change is an entry of the undo list by itself. Throws Result::HostObjectMissing when the host can't edit, and
    /// Result::HostCallFailed when an edit is open already.
    std::unique_ptr<core::DataModelChangeCommand> createCommand(const std::wstring& name) override;
    /// The change belongs to an edit that is open and is committed by whoever opened it.
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle& transaction) override;
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle& transaction,
                                                                const core::serialize::ByteArchive& snapshot) override;

protected:
    /// A model and the host's project that it belongs to.
    struct Document {
        std::shared_ptr<core::DataModel> model;
        Velmark::IProjectDocument* project;
    };

    /// The active project's, or none.
    virtual std::optional<Document> activeDocument() = 0;
    /// Where the edit service is asked for.
    virtual Velmark::IHostContext* serviceContext() = 0;

    /// The edit of a command with a name that goes on now; null without one. It is for that project alone.
    Velmark::IEditTransaction* namedEdit(const Velmark::IProjectDocument* project) const;

private:
    std::weak_ptr<const NamedEdit> m_namedEdit;
};

} // namespace cadrel::host
