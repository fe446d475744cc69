// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/FUnknown.h"

namespace Velmark {

/// A text that is passed as an object. It can be read in both widths; the pointers last until the text changes.
class IString : public FUnknown {
public:
    static constexpr InterfaceId<IString> iid{"f99db7a30fc14821800b0cf98e348edf"};

    /// UTF-16, zero-ended, never null.
    virtual const char16_t* text16() = 0;
    /// UTF-8, zero-ended, never null.
    virtual const char* text8() = 0;
};

/// Where somebody else may put a text. Null empties it.
class IStringResult : public FUnknown {
public:
    static constexpr InterfaceId<IStringResult> iid{"550798bc872049db84920a153b50b7a8"};

    virtual int32 setText16(const char16_t* text) = 0;
    virtual int32 setText8(const char* text) = 0;
};

} // namespace Velmark
