// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Identifier.h"

namespace Velmark {

/// The root of all interfaces: a counted object that can be asked for the others that it has.
///
/// An interface is an abstract class of virtual operations without a destructor, derived from this one or from another
/// interface alone. Only plain values, records and pointers pass through it, and its operations never throw.
///
/// An object has one count for all its interfaces. Whoever gets a *counted* pointer releases it. Whoever gets a
/// *borrowed* one doesn't release it, and keeps it only for the time that the operation states, or adds a reference.
/// `Counted` does all of this.
class FUnknown {
public:
    static constexpr InterfaceId<FUnknown> iid{"0000000000000000C000000000000046"};

    /// ResultOk and a counted pointer to the interface of that identifier; or ResultNoInterface and null. The pointer in
    /// `out` is one to the interface itself, not to this root.
    virtual int32 queryInterface(const Identifier& id, void** out) = 0;
    /// Adds a reference. Returns the new count. From any thread.
    virtual int32 addRef() = 0;
    /// Drops a reference; the object is deleted with the last one. Returns the new count. From any thread.
    virtual int32 release() = 0;

protected:
    ~FUnknown() = default;
};

} // namespace Velmark
