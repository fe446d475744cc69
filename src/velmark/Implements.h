// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FObject.h"

#include <cstring>

namespace Velmark {

/// What a class over FObject would write by hand for the interfaces that it implements: one count for all of them, the
/// answers to `queryInterface`, and its name.
///
///     class Clock : public Implements<Clock, FObject, IIdleHandler, IActionHandler> {
///     public:
///         static constexpr const char* ClassName = "Clock";
///         int32 onIdle() override;
///         ...
///     };
///
/// `Base` is FObject or a class that derives from it in this way. An interface without an identifier is implemented, but
/// not answered for; of one that extends another interface only the last is answered for.
template <class Self, class Base, class... Interfaces>
class Implements : public Base, public Interfaces... {
public:
    using Base::Base;

    int32 queryInterface(const Identifier& id, void** out) override
    {
        const bool found = (answer<Interfaces>(id, out) || ...);
        return found ? ResultOk : Base::queryInterface(id, out);
    }
    int32 addRef() override { return Base::addRef(); }
    int32 release() override { return Base::release(); }

    const char* classNameOf() const override { return Self::ClassName; }
    bool isA(const char* name, bool askBase) const override
    {
        return std::strcmp(name, Self::ClassName) == 0 || (askBase && Base::isA(name, askBase));
    }

private:
    template <class Interface>
    bool answer(const Identifier& id, void** out)
    {
        if constexpr (Identified<Interface>) {
            if (id == Interface::iid) {
                *out = static_cast<Interface*>(this);
                addRef();
                return true;
            }
        }
        return false;
    }
};

} // namespace Velmark
