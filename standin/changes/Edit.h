// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"

#include <utility>

namespace standin {

/// One change of a project that can be taken back and made again, by turns and beginning with `undo`.
class Edit {
public:
    virtual ~Edit() = default;

    virtual void undo() = 0;
    virtual void redo() = 0;
};

/// The change of one value of an object. It keeps the object alive and the value that the object hasn't got now; undo
/// and redo are the same exchange of the two.
template <class Object, class Value>
class ValueEdit : public Edit {
public:
    /// Puts a value in and gives back the one that was there.
    using Exchange = Value (Object::*)(Value);

    ValueEdit(Object& object, Exchange exchange, Value other)
        : m_object(Velmark::Counted<Object>::share(&object)), m_exchange(exchange), m_other(std::move(other))
    {
    }

    void undo() override { m_other = (m_object.get()->*m_exchange)(std::move(m_other)); }
    void redo() override { undo(); }

private:
    Velmark::Counted<Object> m_object;
    Exchange m_exchange;
    Value m_other;
};

} // namespace standin
