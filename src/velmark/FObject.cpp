// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/FObject.h"

#include "velmark/UpdateHandler.h"

#include <cstring>

namespace Velmark {

namespace {

UpdateHandler* updateHandler = nullptr;

} // namespace

void FObject::setUpdateHandler(UpdateHandler* handler)
{
    updateHandler = handler;
}

int32 FObject::queryInterface(const Identifier& id, void** out)
{
    if (id == FUnknown::iid)
        *out = static_cast<FUnknown*>(this);
    else if (id == IDependent::iid)
        *out = static_cast<IDependent*>(this);
    else if (id == FObject::iid)
        *out = this;
    else {
        *out = nullptr;
        return ResultNoInterface;
    }
    addRef();
    return ResultOk;
}

int32 FObject::addRef()
{
    return m_refCount.fetch_add(1, std::memory_order_relaxed) + 1;
}

int32 FObject::release()
{
    // What the other threads did with the object happens before its destruction by the last of them.
    const int32 count = m_refCount.fetch_sub(1, std::memory_order_acq_rel) - 1;
    if (count == 0) {
        m_refCount.store(ReleasedCount, std::memory_order_relaxed);
        delete this;
    }
    return count;
}

int32 FObject::update(FUnknown* /*changed*/, int32 /*message*/)
{
    return ResultOk;
}

bool FObject::isTypeOf(const char* name) const
{
    return std::strcmp(name, classNameOf()) == 0;
}

const char* FObject::classNameOf() const
{
    return ClassName;
}

bool FObject::isA(const char* name, bool /*askBase*/) const
{
    return std::strcmp(name, ClassName) == 0;
}

void FObject::changed(int32 message)
{
    if (updateHandler)
        updateHandler->triggerUpdates(*this, message);
    else
        updateDone(message);
}

void FObject::deferUpdate(int32 message)
{
    if (updateHandler)
        updateHandler->deferUpdates(*this, message);
    else
        updateDone(message);
}

void FObject::updateDone(int32 /*message*/) {}

void FObject::addDependent(IDependent& dependent)
{
    if (updateHandler)
        updateHandler->addDependent(*this, dependent);
}

void FObject::removeDependent(IDependent& dependent)
{
    if (updateHandler)
        updateHandler->removeDependent(*this, dependent);
}

} // namespace Velmark
