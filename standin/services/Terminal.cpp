#include "standin/services/Terminal.h"

#include "util/HostString.h"
#include "velmark/String.h"

#include <algorithm>
#include <ostream>

namespace standin {

namespace {

using cadrel::util::HostString;

constexpr const char* EraseLine = "\r\033[K";

/// Whether a character is seen and does nothing else: it doesn't control the terminal or turn the writing direction.
bool isHarmless(wchar_t character)
{
    const auto within = [character](wchar_t first, wchar_t last) { return character >= first && character <= last; };
    const bool controls = within(0x00, 0x1f) || within(0x7f, 0x9f);
    const bool invisible = within(0x200b, 0x200f) || within(0x2028, 0x202e) || within(0x2060, 0x206f) ||
                           character == 0xfeff || within(0xe0000, 0xe007f);
    return !controls && !invisible;
}

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
        shown.begin(), shown.end(), [](wchar_t character) { return character != L'\n' && !isHarmless(character); },
        L'?');
    *m_out << toUtf8(shown) + "\n" << std::flush;
}

void Terminal::drawProgress(const std::u16string& text)
{
    if (!m_out || !m_canRedraw)
        return;
    std::wstring shown = HostString(text).wide();
    shown.resize(std::min(shown.size(), LineLength));
    std::replace_if(
        shown.begin(), shown.end(), [](wchar_t character) { return !isHarmless(character); }, L'?');
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
