// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

/// What a view of the module's may have beside IPlugView, when it shows how the picture was changed, event by event. It is an
/// extra: a host need not ask for it.
class IChangeView : public FUnknown {
public:
    static constexpr InterfaceId<IChangeView> iid{"abd72183baa74c2c8aaa7fab86d248dc"};

    /// Selects the event that takes what begins at `source` to `destination`, and no other, and shows it; as if the user had
    /// clicked on it. Seconds from the time origin. ResultFalse where there is no such event, or while the user couldn't click.
    virtual int32 selectChange(double source, double destination) = 0;
};

} // namespace Velmark
