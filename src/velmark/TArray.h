// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Types.h"

#include <algorithm>
#include <cstddef>
#include <vector>

namespace Velmark {

/// Anything that holds a number of elements.
class TContainer {
public:
    virtual ~TContainer() = default;

    virtual int32 count() const = 0;
    virtual void removeAll() = 0;
    bool isEmpty() const { return count() == 0; }
};

/// What arrays of all elements have in common: they grow by doubling.
class TArrayBase : public TContainer {
public:
    virtual int32 capacity() const = 0;

protected:
    static int32 grown(int32 capacity) { return std::max(1, 2 * capacity); }
};

template <class T>
class TIterator;

/// A growing array of pointers or other small values. It doesn't count what its pointers point to.
template <class T>
class TArray : public TArrayBase {
public:
    TArray() = default;
    /// Empty, with room for so many elements.
    explicit TArray(int32 capacity) { m_elements.reserve(static_cast<std::size_t>(capacity)); }

    int32 count() const override { return static_cast<int32>(m_elements.size()); }
    int32 capacity() const override { return static_cast<int32>(m_elements.capacity()); }
    void removeAll() override { m_elements.clear(); }

    void add(const T& element)
    {
        if (count() == capacity())
            m_elements.reserve(static_cast<std::size_t>(grown(capacity())));
        m_elements.push_back(element);
    }
    /// Removes the first element that equals this one, and closes the gap; false when there is none.
    bool remove(const T& element)
    {
        const auto found = std::find(m_elements.begin(), m_elements.end(), element);
        if (found == m_elements.end())
            return false;
        m_elements.erase(found);
        return true;
    }
    /// Removes the last element and returns it; if there is none, a default T, which is null for a pointer.
    T removeLast()
    {
        const T last = at(count() - 1);
        if (!isEmpty())
            m_elements.pop_back();
        return last;
    }
    /// A default T, which is null for a pointer, at an index that isn't there.
    T at(int32 index) const
    {
        return index >= 0 && index < count() ? m_elements[static_cast<std::size_t>(index)] : T();
    }

    /// From the first element on.
    TIterator<T> iterator() const { return TIterator<T>(*this); }

private:
    std::vector<T> m_elements;
};

/// Iterates over an array, which has to outlive it. Elements that are added meanwhile are included.
template <class T>
class TIterator {
public:
    explicit TIterator(const TArray<T>& array) : m_array(array) {}

    bool isDone() const { return m_next >= m_array.count(); }
    /// Returns the element and moves on; a default T when done.
    T next() { return isDone() ? T() : m_array.at(m_next++); }

private:
    const TArray<T>& m_array;
    int32 m_next = 0;
};

} // namespace Velmark
