// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/StringObject.h"

namespace Velmark {

int32 StringObject::setText16(const char16_t* text)
{
    String::operator=(text);
    return ResultOk;
}

int32 StringObject::setText8(const char* text)
{
    String::operator=(text);
    return ResultOk;
}

} // namespace Velmark
