// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

/// The messages of `IDependent::update`. A host may send others.
struct UpdateMessage {
    /// The object, or something in it, has changed.
    static constexpr int32 Changed = 0;
};

/// Is told of the changes of another object.
class IDependent : public FUnknown {
public:
    static constexpr InterfaceId<IDependent> iid{"f52b7aaede72416d8af18ace9dd7bd5e"};

    /// The object has changed; `changed` is borrowed for the call. The result doesn't count.
    virtual int32 update(FUnknown* changed, int32 message) = 0;
};

} // namespace Velmark
