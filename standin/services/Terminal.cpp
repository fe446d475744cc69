// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/Terminal.h"

#include "util/HostString.h"
#include "util/PrintableCharacter.h"
#include "velmark/String.h"

#include <algorithm>
#include <ostream>

namespace standin {

namespace {

using cadrel::util::HostString;
using cadrel::util::isPrintable;

constexpr const char* EraseLine = "\r\033[K";

std::string toUtf8(const std::wstring& text)
{
    return Velmark::ConstString(HostString(text).utf16()).text8();
}

} // namespace

void Terminal::writeMessage(const std::u16string& text)
{
    if (!m_out)
        return;
    eraseProgress();
    std::wstring shown = HostString(text).wide();
    std::replace_if(
        shown.begin(), shown.end(),
        [](wchar_t character) { return character != L'\n' && !isPrintable(static_cast<char32_t>(character)); }, L'?');
    *m_out << toUtf8(shown) + "\n" << std::flush;
}

void Terminal::drawProgress(const std::u16string& text)
{
    if (!m_out || !m_canRedraw)
        return;
    std::wstring shown = HostString(text).wide();
    shown.resize(std::min(shown.size(), m_lineLength));
    std::replace_if(
        shown.begin(), shown.end(), [](wchar_t character) { return !isPrintable(static_cast<char32_t>(character)); },
        L'?');
    *m_out << EraseLine + toUtf8(shown) << std::flush;
    m_hasProgress = true;
}

void Terminal::eraseProgress()
{
    if (!m_hasProgress)
        return;
    *m_out << EraseLine << std::flush;
    m_hasProgress = false;
}

} // namespace standin
