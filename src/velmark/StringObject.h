// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/IString.h"
#include "velmark/Implements.h"
#include "velmark/String.h"

namespace Velmark {

/// A text as a counted object, to hand to the host or to let it fill.
class StringObject : public Implements<StringObject, FObject, IStringResult, IString>, public String {
public:
    static constexpr const char* ClassName = "StringObject";

    StringObject() = default;
    explicit StringObject(const ConstString& text) : String(text) {}

    const char16_t* text16() override { return String::text16(); }
    const char* text8() override { return String::text8(); }

    int32 setText16(const char16_t* text) override;
    int32 setText8(const char* text) override;
};

} // namespace Velmark
