// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "util/Result.h"

#include <cstdint>

namespace cadrel::core {

class DataModel;

/// What one change notification says: the kind of thing that changed. Contexts live for the one call only; a listener
/// must not keep them.
class ChangeContext {
public:
    enum Type : std::int32_t {
        DataModelChanged = 0,
        SettingsChanged = 1,
        EventListChanged = 2,
        EventChanged = 3,
        VideoListChanged = 4,
        PreviewStateChanged = 5,
        ActionFinished = 6,
    };

    explicit ChangeContext(std::int32_t contextType) : type(contextType) {}
    ChangeContext(const ChangeContext&) = default;
    ChangeContext& operator=(const ChangeContext&) = default;
    virtual ~ChangeContext() = default;

    std::int32_t type;
};

/// An event list changed as a whole or in one of its events.
class EventListChangeContext : public ChangeContext {
public:
    explicit EventListChangeContext(std::int32_t kind) : ChangeContext(EventListChanged), listKind(kind) {}

    std::int32_t listKind; ///< 0 old, 1 new, 2 change
};

/// Another data model is current, or all of one changed.
class DataModelChangeContext : public ChangeContext {
public:
    explicit DataModelChangeContext(DataModel* model) : ChangeContext(DataModelChanged), dataModel(model) {}

    DataModel* dataModel; ///< not owned; may be null
};

/// Some event changed. Each event owns one of these and sends it with every notification.
class EventChangeContext : public ChangeContext {
public:
    EventChangeContext() : ChangeContext(EventChanged) {}
};

/// A deferred job of the host adapter has ended, or will never begin.
class ActionChangeContext : public ChangeContext {
public:
    enum Action : std::int32_t {
        Preview = 0,
        Run = 1, ///< applies the changes
    };

    explicit ActionChangeContext(std::int32_t finished, util::Result::Type ended = util::Result::Ok)
        : ChangeContext(ActionFinished), action(finished), result(ended)
    {
    }
    /// Of a job that was requested and never begins: its project was left, or the preview has ended.
    static ActionChangeContext dropped(std::int32_t requested)
    {
        ActionChangeContext context(requested, util::Result::Cancelled);
        context.isDropped = true;
        return context;
    }

    std::int32_t action; ///< an Action
    /// Ok when all of it is done, and Cancelled when nothing is: the user has cancelled it, and it was taken back. Else why
    /// it broke off; what was done until then stays, and can be undone.
    util::Result::Type result;
    bool isDropped = false;
};

} // namespace cadrel::core
