// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/Editing.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <functional>

namespace cadrel::host::tests {

/// A host's edits of which some are refused. All others are the host's behind it.
class AlteredEdits
    : public Velmark::Implements<AlteredEdits, Velmark::FObject, Velmark::IEditService, Velmark::IEditTransaction> {
public:
    static constexpr const char* ClassName = "AlteredEdits";

    explicit AlteredEdits(Velmark::IHostContext* host)
        : m_service(Velmark::service<Velmark::IEditService>(host)),
          m_transaction(Velmark::query<Velmark::IEditTransaction>(m_service))
    {
    }

    bool removes = true;
    bool closes = true;
    bool deletes = true;
    std::function<bool()> copies = [] { return true; };
    std::function<void()> beforeDelete = [] {};
    std::function<bool(Velmark::IEditStep*)> addsStep = [](Velmark::IEditStep*) { return true; };

    Velmark::int32 copyRange(Velmark::IProjectDocument* project, Velmark::IObjectList* tracks, Velmark::int32 reserved,
                             double start, double end, double destination) override
    {
        if (!copies())
            return Refused;
        return m_service->copyRange(project, tracks, reserved, start, end, destination);
    }
    Velmark::int32 closeRange(Velmark::IProjectDocument* project, Velmark::IObjectList* tracks, double start,
                              double end, double reserved) override
    {
        return closes ? m_service->closeRange(project, tracks, start, end, reserved) : Refused;
    }

    Velmark::int32 begin(bool flag) override { return m_transaction->begin(flag); }
    Velmark::int32 commit(Velmark::IProjectDocument* project, const char16_t* name) override
    {
        return m_transaction->commit(project, name);
    }
    Velmark::int32 insert(Velmark::FUnknown* parent, Velmark::FUnknown* child) override
    {
        return m_transaction->insert(parent, child);
    }
    Velmark::int32 remove(Velmark::FUnknown* parent, Velmark::FUnknown* child) override
    {
        return removes ? m_transaction->remove(parent, child) : Velmark::ResultFalse;
    }
    Velmark::int32 move(Velmark::FUnknown* parent, Velmark::FUnknown* newParent, Velmark::FUnknown* child) override
    {
        return m_transaction->move(parent, newParent, child);
    }
    Velmark::int32 copyAll(Velmark::IProjectDocument* project, Velmark::FUnknown** clipboard, double start, double end,
                           Velmark::int32 reserved) override
    {
        return m_transaction->copyAll(project, clipboard, start, end, reserved);
    }
    Velmark::int32 paste(Velmark::IProjectDocument* project, Velmark::FUnknown* clipboard, Velmark::int32 reserved,
                         double destination) override
    {
        return m_transaction->paste(project, clipboard, reserved, destination);
    }
    Velmark::int32 deleteRange(Velmark::IProjectDocument* project, Velmark::int32 reserved, double start,
                               double end) override
    {
        beforeDelete();
        return deletes ? m_transaction->deleteRange(project, reserved, start, end) : Refused;
    }
    Velmark::int32 addStep(Velmark::IEditStep* step) override
    {
        return addsStep(step) ? m_transaction->addStep(step) : Velmark::ResultFalse;
    }

private:
    static constexpr Velmark::int32 Refused = 2;

    Velmark::Counted<Velmark::IEditService> m_service;
    Velmark::Counted<Velmark::IEditTransaction> m_transaction;
};

} // namespace cadrel::host::tests
