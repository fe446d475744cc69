// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/ShownText.h"

#include "util/Result.h"
#include "util/StringUtil.h"

namespace cadrel::gui {

std::wstring translated(const std::wstring& text)
{
    try {
        return util::StringUtil::translate(text);
    } catch (util::Result::Type) {
        return text;
    }
}

} // namespace cadrel::gui
