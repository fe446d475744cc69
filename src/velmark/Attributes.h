// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

#include <cstddef>
#include <utility>

namespace Velmark {

/// The value of an attribute: nothing, an integer, a text or a counted object. It holds a reference to its object. A text
/// is borrowed: one that was read lasts until the attribute is set or removed, one that is written is copied by the host.
class FVariant {
public:
    /// What the type word may hold. An attribute with none of them reads as one that isn't there.
    struct Type {
        static constexpr uint16 Integer = 1;
        static constexpr uint16 String = 4;
        static constexpr uint16 Object = 8;
    };

    FVariant() = default;
    static FVariant integer(int64 value)
    {
        FVariant variant(Type::Integer);
        variant.m_value.integer = value;
        return variant;
    }
    /// UTF-8, zero-ended.
    static FVariant string(const char* text)
    {
        FVariant variant(Type::String);
        variant.m_value.string = text;
        return variant;
    }
    /// Adds a reference.
    static FVariant object(FUnknown* object)
    {
        FVariant variant(Type::Object);
        variant.m_value.object = object;
        if (object)
            object->addRef();
        return variant;
    }
    FVariant(const FVariant& other) : m_type(other.m_type), m_value(other.m_value)
    {
        if (FUnknown* const object = asObject())
            object->addRef();
    }
    FVariant(FVariant&& other) noexcept { swap(other); }
    FVariant& operator=(FVariant other) noexcept
    {
        swap(other);
        return *this;
    }
    ~FVariant()
    {
        if (FUnknown* const object = asObject())
            object->release();
    }

    uint16 type() const { return m_type; }
    bool isInteger() const { return (m_type & Type::Integer) != 0; }
    bool isString() const { return (m_type & Type::String) != 0; }
    bool isObject() const { return (m_type & Type::Object) != 0; }

    /// 0 or null when the value is of another type.
    int64 asInteger() const { return isInteger() ? m_value.integer : 0; }
    const char* asString() const { return isString() ? m_value.string : nullptr; }
    /// Borrowed from this variant.
    FUnknown* asObject() const { return isObject() ? m_value.object : nullptr; }

private:
    friend struct FVariantLayout;

    explicit FVariant(uint16 type) : m_type(type) {}

    void swap(FVariant& other) noexcept
    {
        std::swap(m_type, other.m_type);
        std::swap(m_value, other.m_value);
    }

    uint16 m_type = 0;
    union {
        int64 integer;
        const char* string;
        FUnknown* object;
    } m_value = {};
};

struct FVariantLayout {
    static_assert(sizeof(FVariant) == 16);
    static_assert(offsetof(FVariant, m_type) == 0 && sizeof(FVariant::m_type) == 2);
    static_assert(offsetof(FVariant, m_value) == 8 && sizeof(FVariant::m_value) == 8);
};

/// A list of binary values under keys; its class identifier is its interface's. As the value of an attribute it is copied
/// when it is set and when it is got; what a persistent attribute holds is stored with the project.
class IAttributeData : public FUnknown {
public:
    static constexpr InterfaceId<IAttributeData> iid{"fa1e32f9ca6d46f5a982f956b1191b58"};

    /// Replaces the value under the key. With `copy` the host keeps a copy. Without it, the bytes belong to the caller
    /// and have to outlive the list.
    virtual int32 setBinary(const char* key, const void* bytes, int32 size, bool copy) = 0;
    /// Fills the first `size` bytes of the buffer; nonzero, and nothing written, when there is nothing under the key or it
    /// has fewer bytes.
    virtual int32 getBinary(const char* key, void* buffer, int32 size) = 0;
    /// -1 when there is nothing under the key.
    virtual int32 getBinarySize(const char* key) = 0;
};

/// The keys that the system uses on the host's objects; 8-bit texts, written exactly so.
struct AttributeKey {
    /// On the project: an IAttributeData with the stored model.
    static constexpr const char* Storage = "CaDr";
    /// In that list: the block of the model.
    static constexpr const char* StorageData = "CaDrData";
    /// On the project: the CRC-32 of the block, an integer.
    static constexpr const char* StorageChecksum = "CaDs";
    /// On the project: the two of another version of the program, which this one couldn't read and has replaced.
    static constexpr const char* OtherStorage = "CaDrOther";
    static constexpr const char* OtherStorageChecksum = "CaDsOther";
    /// On a track: 1 while Cadrel holds it locked, 0 afterwards.
    static constexpr const char* LockState = "Cadrel:LockState";
    /// On a track that a preview shows or that has something left of a run: an IAttributeData with numbers.
    static constexpr const char* Preview = "Cadrel:Preview";
    /// On such a track, beside it: an IAttributeData with numbers of each event.
    static constexpr const char* PreviewEvents = "Cadrel:PreviewEvents";
    /// On such a track, beside these: an IAttributeData with numbers of each automation point.
    static constexpr const char* PreviewCurves = "Cadrel:PreviewCurves";
    /// On the project while a preview has room past its end: an IAttributeData with numbers.
    static constexpr const char* ProjectEnd = "Cadrel:ProjectEnd";
    /// On a project whose session has an end of its own: that end in nanoseconds from the time origin, an integer. The host
    /// sets it when it opens the project, not as a persistent one, and stores the session with the end that stands there.
    static constexpr const char* SessionEnd = "Cadrel:SessionEnd";
    /// On such a project: the frame at which the cut ends with which that end stands, an integer.
    static constexpr const char* SessionCutEnd = "Cadrel:SessionCutEnd";
    /// In these lists: the numbers.
    static constexpr const char* Numbers = "Numbers";
    /// On a marker, a video and a folder track: the role of the track, an integer.
    static constexpr const char* MarkerType = "Cadrel:MarkerType";
    static constexpr const char* VideoType = "Cadrel:VideoType";
    static constexpr const char* FolderType = "Cadrel:FolderType";
    /// On a marker: an integer by which the marker is known in the source and in the preview stretch.
    static constexpr const char* EventUserId = "CadrEventUserId";
    /// On a copy of a memo in the preview stretch: a number made of what it was like when it was written or its memo followed
    /// it last.
    static constexpr const char* Followed = "Cadrel:Followed";
    /// On an automation point that the system has written, to go once the curve runs the same without it: its value as a
    /// number, so that one that somebody has given another value stays.
    static constexpr const char* HeldValue = "Cadrel:HeldValue";
    /// On a marker: the reel of the change event, a text.
    static constexpr const char* Reel = "User:STR_MAReel";
};

} // namespace Velmark
