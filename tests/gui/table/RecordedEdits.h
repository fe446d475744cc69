// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/model/DataModel.h"
#include "core/model/DataModelCommandCreator.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextNotificationBase.h"
#include "tests/support/core/MemoryEngine.h"

#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// Writes down, in order, what happens to the change list of a model: the entries of the undo list with the number of events
/// that the list had then, what the list tells, and the end of previews. It is the model's notifier, its undo list and its
/// engine.
class RecordedEdits : public core::ChangeContextNotificationBase, private core::DataModelCommandCreator {
public:
    explicit RecordedEdits(core::DataModel& model) : engine(*this, model), m_model(model)
    {
        model.setNotifier(this);
        core::setDataModelCommandCreator(this);
    }
    RecordedEdits(const RecordedEdits&) = delete;
    RecordedEdits& operator=(const RecordedEdits&) = delete;
    ~RecordedEdits() override
    {
        core::setDataModelCommandCreator(nullptr);
        m_model.setNotifier(nullptr);
    }

    void notify(const core::ChangeContext& context) override
    {
        if (context.type == core::ChangeContext::EventListChanged)
            steps.push_back("list of " + listSize());
        ChangeContextNotificationBase::notify(context);
    }

    class Engine : public MemoryEngine {
    public:
        Engine(RecordedEdits& edits, core::DataModel& model) : MemoryEngine(model), m_edits(edits) {}

        void setPreviewActive(bool active) override
        {
            MemoryEngine::setPreviewActive(active);
            m_edits.steps.emplace_back(active ? "preview on" : "preview off");
            if (const auto call = std::exchange(m_edits.onPreview, nullptr))
                call();
        }

    private:
        RecordedEdits& m_edits;
    };

    Engine engine;
    std::vector<std::string> steps;
    /// Called once, at the next change of the preview and at the next undo entry.
    std::function<void()> onPreview;
    std::function<void()> onEntry;

private:
    class Command : public core::DataModelChangeCommand {
    public:
        Command(RecordedEdits& edits, const std::wstring& name)
            : DataModelChangeCommand(name), m_edits(edits), m_entry({name.begin(), name.end()})
        {
            m_entry += " of " + edits.listSize();
        }
        ~Command() override
        {
            m_edits.steps.push_back(m_entry);
            if (const auto call = std::exchange(m_edits.onEntry, nullptr))
                call();
        }

    private:
        RecordedEdits& m_edits;
        std::string m_entry;
    };

    std::string listSize() const { return std::to_string(m_model.changeEdl().size()); }

    std::unique_ptr<core::DataModelChangeCommand> createCommand(const std::wstring& name) override
    {
        return std::make_unique<Command>(*this, name);
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle&) override
    {
        return nullptr;
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle&,
                                                                const core::serialize::ByteArchive&) override
    {
        return nullptr;
    }

    core::DataModel& m_model;
};

} // namespace cadrel::tests
