// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Identifier.h"

namespace Velmark {

/// The root of all interfaces: a counted object that can be asked for the others that it has.
///
/// An interface is an abstract class of virtual operations without a destructor, derived from this one or from another
/// interface alone; nothing but plain values, records and pointers passes through it, and no exception leaves it.
///
/// An object has one count for all its interfaces. Who is given a *counted* pointer releases it; who is given a
/// *borrowed* one neither releases it nor keeps it beyond the time told, unless it adds a reference of its own.
/// `Counted` does all of this.
class FUnknown {
public:
    static constexpr InterfaceId<FUnknown> iid{"0000000000000000C000000000000046"};

    /// ResultOk and a counted pointer to the interface of that identifier; or ResultNoInterface and null. The pointer in
    /// `out` is one to the interface itself, not to this root.
    virtual int32 queryInterface(const Identifier& id, void** out) = 0;
    /// Adds a reference; the count after it. From any thread.
    virtual int32 addRef() = 0;
    /// Drops a reference, and with the last the object; the count after it. From any thread.
    virtual int32 release() = 0;

protected:
    ~FUnknown() = default;
};

} // namespace Velmark
