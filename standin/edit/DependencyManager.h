// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/HandlerList.h"
#include "velmark/Context.h"
#include "velmark/Counted.h"
#include "velmark/Implements.h"

#include <map>

namespace standin {

/// Tells dependents of the changes of the objects that they depend on.
class DependencyManager : public Velmark::Implements<DependencyManager, Velmark::FObject, Velmark::IDependencyManager> {
public:
    static constexpr const char* ClassName = "DependencyManager";

    /// Refuses null, and a dependent that the object has already.
    Velmark::int32 addDependent(Velmark::FUnknown* object, Velmark::FObject* dependent) override;
    /// Refuses one that the object hasn't.
    Velmark::int32 removeDependent(Velmark::FUnknown* object, Velmark::FObject* dependent) override;

    /// Calls `update` of the dependents, in the order in which they were added, from a copy of the list; one that is removed
    /// meanwhile is passed over.
    void tell(Velmark::FUnknown& object);

private:
    /// By the address of the object's FUnknown, which is the same whichever of its interfaces was given.
    std::map<const Velmark::FUnknown*, HandlerList<Velmark::FObject>> m_dependents;
};

} // namespace standin
