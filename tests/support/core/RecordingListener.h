// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "core/notify/ChangeContextNotificationBase.h"

#include <cstdint>
#include <vector>

namespace cadrel::tests {

/// Remembers what it heard, in order. Must be removed where it dies before what it listens to sends again.
class RecordingListener : public core::ChangeContextListenerInterface {
public:
    void onChange(const core::ChangeContext& context) override
    {
        types.push_back(context.type);
        contexts.push_back(&context);
        if (const auto* list = dynamic_cast<const core::EventListChangeContext*>(&context))
            listKinds.push_back(list->listKind);
        if (const auto* model = dynamic_cast<const core::DataModelChangeContext*>(&context))
            dataModels.push_back(model->dataModel);
    }

    void forget()
    {
        types.clear();
        contexts.clear();
        listKinds.clear();
        dataModels.clear();
    }

    std::vector<std::int32_t> types;
    std::vector<const core::ChangeContext*> contexts; ///< to be compared, not looked into
    std::vector<std::int32_t> listKinds;              ///< of the EventListChangeContexts
    std::vector<core::DataModel*> dataModels;         ///< of the DataModelChangeContexts
};

/// Stands in for the host: passes what it is told to its listeners, and remembers it.
class RecordingNotifier : public core::ChangeContextNotificationBase {
public:
    void notify(const core::ChangeContext& context) override
    {
        heard.onChange(context);
        ChangeContextNotificationBase::notify(context);
    }

    RecordingListener heard;
};

} // namespace cadrel::tests
