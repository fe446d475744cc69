// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/boxes/BoxText.h"

#include "standin/base/Utf16.h"

namespace desktop {

juce::String toJuce(const std::u16string& text)
{
    return juce::String::fromUTF8(standin::toUtf8(text).c_str());
}

std::u16string fromJuce(const juce::String& text)
{
    return standin::toUtf16(text.toStdString());
}

} // namespace desktop
