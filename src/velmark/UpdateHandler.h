// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

namespace Velmark {

class FObject;
class IDependent;

/// Tells dependents of the changes of FObjects, for the whole process: FObject::setUpdateHandler. It ends each round of
/// a changed object with `updateDone`.
class UpdateHandler {
public:
    virtual ~UpdateHandler() = default;

    /// Tells the dependents now.
    virtual void triggerUpdates(FObject& changed, int32 message) = 0;
    /// Tells the dependents later, and of many changes once.
    virtual void deferUpdates(FObject& changed, int32 message) = 0;
    /// Neither the object nor the dependent is counted.
    virtual void addDependent(FObject& object, IDependent& dependent) = 0;
    virtual void removeDependent(FObject& object, IDependent& dependent) = 0;
};

} // namespace Velmark
