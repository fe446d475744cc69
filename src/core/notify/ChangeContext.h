// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

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

/// A deferred job of the host adapter has ended.
class ActionChangeContext : public ChangeContext {
public:
    explicit ActionChangeContext(std::int32_t finished) : ChangeContext(ActionFinished), action(finished) {}

    std::int32_t action; ///< 0 the preview job, 1 the change-applying job
};

} // namespace cadrel::core
