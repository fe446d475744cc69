// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <concepts>
#include <cstddef>
#include <utility>

namespace Velmark {

/// Holds one reference to a counted object, or none. The name of the operation says where the reference comes from:
///
///     auto tracks = Counted<IObjectList>::adopt(track->getAutomation());  // the call gave the reference
///     auto parent = Counted<IProjectNode>::share(node->getParent());      // borrowed; adds one
///     views->openWindow(name, builder, window.out());                     // an out pointer's reference
template <class T>
class Counted {
public:
    constexpr Counted() = default;
    constexpr Counted(std::nullptr_t) {}
    Counted(const Counted& other) : Counted(share(other.m_object)) {}
    Counted(Counted&& other) noexcept : m_object(other.detach()) {}
    template <class U>
    requires std::convertible_to<U*, T*> Counted(const Counted<U>& other) : Counted(share(other.get())) {}
    template <class U>
    requires std::convertible_to<U*, T*> Counted(Counted<U>&& other)
    noexcept : m_object(other.detach()) {}
    ~Counted() { reset(); }

    Counted& operator=(Counted other) noexcept
    {
        std::swap(m_object, other.m_object);
        return *this;
    }

    /// Takes over a reference that the caller owns.
    [[nodiscard]] static Counted adopt(T* object)
    {
        Counted counted;
        counted.m_object = object;
        return counted;
    }
    /// Adds a reference of its own.
    [[nodiscard]] static Counted share(T* object)
    {
        if (object)
            object->addRef();
        return adopt(object);
    }

    T* get() const { return m_object; }
    T* operator->() const { return m_object; }
    T& operator*() const { return *m_object; }
    explicit operator bool() const { return m_object != nullptr; }

    /// Hands the reference over to the caller.
    [[nodiscard]] T* detach() { return std::exchange(m_object, nullptr); }
    void reset()
    {
        if (T* const object = detach())
            object->release();
    }
    /// For an out pointer, which gives a reference. What was held is dropped first.
    [[nodiscard]] T** out()
    {
        reset();
        return &m_object;
    }

    friend bool operator==(const Counted& a, const Counted& b) { return a.m_object == b.m_object; }
    friend bool operator==(const Counted& a, const T* b) { return a.m_object == b; }

private:
    T* m_object = nullptr;
};

/// A new object, with the reference that its creation gives.
template <class T, class... Arguments>
[[nodiscard]] Counted<T> makeCounted(Arguments&&... arguments)
{
    return Counted<T>::adopt(new T(std::forward<Arguments>(arguments)...));
}

/// The interface T of an object; nothing when it hasn't that interface, and for null.
template <Identified T, class Object>
[[nodiscard]] Counted<T> query(Object* object)
{
    void* found = nullptr;
    if (!object || object->queryInterface(T::iid, &found) != ResultOk)
        return nullptr;
    return Counted<T>::adopt(static_cast<T*>(found));
}
template <Identified T, class Object>
[[nodiscard]] Counted<T> query(const Counted<Object>& object)
{
    return query<T>(object.get());
}

} // namespace Velmark
