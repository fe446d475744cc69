// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/IDependent.h"

#include <atomic>

namespace Velmark {

class UpdateHandler;

/// The base of every object of ours that crosses to the host: it counts its references, answers for its interfaces, is
/// told of others' changes and tells its own. It is born with one reference, which belongs to its maker.
///
/// Only the count is safe with several threads; all else is for the main thread. A class derives through `Implements`.
class FObject : public IDependent {
public:
    /// Our own, for queries within the module.
    static constexpr InterfaceId<FObject> iid{"0c39f86388e9607cc24b9efec3ce3d29"};
    static constexpr const char* ClassName = "FObject";
    /// The value of the count after the last release, so that a mistaken further release is noticed.
    static constexpr int32 ReleasedCount = -1000;

    FObject() = default;
    /// A copy is an object of its own, with a count of its own and without the other's dependents.
    FObject(const FObject&) {}
    FObject& operator=(const FObject&) { return *this; }

    /// Answers for FUnknown, IDependent and FObject.
    int32 queryInterface(const Identifier& id, void** out) override;
    int32 addRef() override;
    int32 release() override;

    int32 update(FUnknown* changed, int32 message) override;

    virtual ~FObject() = default;

    /// Whether `name` is the name of this object's own class.
    virtual bool isTypeOf(const char* name) const;
    /// The name of this object's class, without its namespace.
    virtual const char* classNameOf() const;
    /// Whether `name` is the name of this object's class or, with `askBase`, of one that it derives from.
    virtual bool isA(const char* name, bool askBase) const;
    /// Tells the dependents now, through the process-wide handler; without one only updateDone() is called.
    virtual void changed(int32 message);
    /// Tells the dependents later; without a handler like changed().
    virtual void deferUpdate(int32 message);
    /// Every dependent has been told.
    virtual void updateDone(int32 message);

    /// Neither side is counted. Nothing is kept without a process-wide handler.
    void addDependent(IDependent& dependent);
    void removeDependent(IDependent& dependent);

    int32 refCount() const { return m_refCount.load(std::memory_order_relaxed); }

    /// The process-wide handler, or none. It isn't owned: whoever sets it removes it again.
    static void setUpdateHandler(UpdateHandler* handler);

private:
    std::atomic<int32> m_refCount{1};
};

} // namespace Velmark
