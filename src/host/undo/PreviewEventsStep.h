// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "velmark/Implements.h"
#include "velmark/Module.h"

#include <memory>
#include <utility>
#include <vector>

namespace cadrel::host {

/// Lets a project's list of previewed events follow the host's undo list, as what stands in the preview stretch does.
/// If the two differed, the next edit of a memo would be carried over to the wrong place.
class PreviewEventsStep : public Velmark::Implements<PreviewEventsStep, Velmark::FObject, Velmark::IEditStep> {
public:
    static constexpr const char* ClassName = "PreviewEventsStep";

    using Events = std::vector<std::shared_ptr<core::EventBase>>;

    /// `before` is what stood in the list. The step may outlive the list, and isn't part of what keeps it alive.
    PreviewEventsStep(std::weak_ptr<core::EventList> list, Events before)
        : m_list(std::move(list)), m_other(std::move(before))
    {
    }

    Velmark::int32 execute() override { return Velmark::ResultOk; }
    /// Without their list both do nothing and answer Result::NotAvailable.
    Velmark::int32 undo() override { return swap(); }
    Velmark::int32 redo() override { return swap(); }
    const char16_t* getDescription() override { return nullptr; }

private:
    Velmark::int32 swap();

    std::weak_ptr<core::EventList> m_list;
    Events m_other; ///< what the list holds on the other side of the edit
};

} // namespace cadrel::host
