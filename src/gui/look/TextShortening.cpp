// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/TextShortening.h"

#include <utility>

namespace cadrel::gui {

namespace {

/// What is kept free for the dots.
constexpr double DotsWidth = 10.0;

bool hasSeveralLines(const std::wstring& text)
{
    return text.find_first_of(L"\r\n") != std::wstring::npos;
}

} // namespace

std::wstring TextShortening::cut(const std::wstring& text, double boxWidth, const Measure& measure)
{
    if (text.empty() || hasSeveralLines(text) || measure(text) <= boxWidth)
        return text;

    // The longest beginning lies in [fitting, tooLong).
    std::size_t fitting = 0;
    std::size_t tooLong = text.size();
    while (tooLong - fitting > 1) {
        const std::size_t middle = fitting + (tooLong - fitting) / 2;
        (measure(text.substr(0, middle)) <= boxWidth - DotsWidth ? fitting : tooLong) = middle;
    }
    return text.substr(0, fitting) + L"...";
}

std::wstring TextShortening::cutOnce(const std::wstring& text, double boxWidth, const std::wstring& fontKey,
                                     const Measure& measure)
{
    if (text.size() <= LongestRemembered)
        return rememberedCut(text, boxWidth, fontKey, measure);
    if (hasSeveralLines(text))
        return text;
    // Where the box has no room for a part of the text, what follows the part doesn't matter.
    const std::wstring beginning = text.substr(0, LongestRemembered);
    const std::wstring& shown = rememberedCut(beginning, boxWidth, fontKey, measure);
    return shown != beginning ? shown : cut(text, boxWidth, measure);
}

const std::wstring& TextShortening::rememberedCut(const std::wstring& text, double boxWidth,
                                                  const std::wstring& fontKey, const Measure& measure)
{
    std::tuple key(text, boxWidth, fontKey);
    const auto known = m_cut.find(key);
    if (known != m_cut.end())
        return known->second;
    std::wstring fresh = cut(text, boxWidth, measure);
    if (m_cut.size() >= Capacity)
        m_cut.clear();
    return m_cut.emplace(std::move(key), std::move(fresh)).first->second;
}

} // namespace cadrel::gui
