// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"

namespace Velmark {

class FObject;
class IIdleHandler;

/// Gives the module access to everything that the host has. IPluginBase::initialize gets it. `queryInterface` also
/// finds IHostInfo and the other services.
class IHostContext : public FUnknown {
public:
    static constexpr InterfaceId<IHostContext> iid{"eec8968380db43369177273e138a763b"};

    /// A service, or a new object of a class; counted. `out` points to the interface whose identifier was given; for the
    /// identifier of a class that is no interface's to the FUnknown of the new object. Nonzero, and null in `out`, for
    /// an unknown identifier. Callers use service() and create() below.
    virtual int32 getInterface(const Identifier& id, void** out) = 0;
};

/// What the host says about itself.
class IHostInfo : public FUnknown {
public:
    static constexpr InterfaceId<IHostInfo> iid{"cc0b7716362b4ee589ee5f415458463f"};

    /// The host's product name, UTF-8; as long as the host lives.
    virtual const char* getName() = 0;
};

/// The name of the host that this system is made for.
inline constexpr const char* HostName = "Stagio";

/// Idle calls: what is done while the user does nothing.
class IIdleManager : public FUnknown {
public:
    static constexpr InterfaceId<IIdleManager> iid{"9e871847f1ab4776a06c6f945d7fdd4d"};

    /// The handler isn't counted: remove it before you delete it. Both may be called from within an idle call.
    virtual int32 addIdleHandler(IIdleHandler* handler) = 0;
    virtual int32 removeIdleHandler(IIdleHandler* handler) = 0;
    /// The host counts these calls: there are no idle calls until each `true` has been followed by a `false`. The
    /// action "Edit"/"Undo" works meanwhile.
    virtual int32 setIdleBlocked(bool blocked) = 0;
};

/// Tells dependents of the changes of the host's objects: projects and media pools.
class IDependencyManager : public FUnknown {
public:
    static constexpr InterfaceId<IDependencyManager> iid{"f5246d5686544d60b026afb57b697b37"};

    /// From now on the dependent's `update` is called with the object. Neither is counted: remove the dependent before
    /// either is deleted. The host uses only the operations of IDependent, with which an FObject begins.
    virtual int32 addDependent(FUnknown* object, FObject* dependent) = 0;
    virtual int32 removeDependent(FUnknown* object, FObject* dependent) = 0;
};

/// A service of the host; nothing if the host doesn't have it.
template <Identified T>
[[nodiscard]] Counted<T> service(IHostContext* context)
{
    void* found = nullptr;
    if (!context || context->getInterface(T::iid, &found) != ResultOk)
        return nullptr;
    return Counted<T>::adopt(static_cast<T*>(found));
}
template <Identified T>
[[nodiscard]] Counted<T> service(const Counted<IHostContext>& context)
{
    return service<T>(context.get());
}

/// The interface T of a new object of a class: one of ClassId or, where the interface names the class too, T's own
/// identifier. Nothing when the host doesn't know the class.
template <Identified T>
[[nodiscard]] Counted<T> create(IHostContext* context, const Identifier& classId = T::iid)
{
    void* created = nullptr;
    if (!context || context->getInterface(classId, &created) != ResultOk)
        return nullptr;
    // Every interface begins with its FUnknown, so this holds for those that name a class as well.
    return query<T>(Counted<FUnknown>::adopt(static_cast<FUnknown*>(created)));
}
template <Identified T>
[[nodiscard]] Counted<T> create(const Counted<IHostContext>& context, const Identifier& classId = T::iid)
{
    return create<T>(context.get(), classId);
}

} // namespace Velmark
