// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <functional>
#include <map>
#include <string>
#include <tuple>

namespace cadrel::gui {

/// Texts that are cut to fit into a box. It remembers what it has cut, so that a table isn't measured anew at each paint.
class TextShortening {
public:
    /// The width of a text in one line, in pixels. It never falls when a letter is added.
    using Measure = std::function<double(const std::wstring&)>;

    /// The text itself where it is no wider than the box or has several lines. Otherwise its longest beginning that is no
    /// wider than the box less 10 pixels, with "..." after it; "..." alone where there is none.
    static std::wstring cut(const std::wstring& text, double boxWidth, const Measure& measure);

    /// As cut. The font's key names whatever the measure depends on.
    std::wstring cutOnce(const std::wstring& text, double boxWidth, const std::wstring& fontKey,
                         const Measure& measure);

    /// How many texts it remembers at most. When there are more, it forgets them all.
    static constexpr std::size_t Capacity = 4096;
    /// How many letters of a text it remembers. Hardly any box has room for so many.
    static constexpr std::size_t LongestRemembered = 256;
    std::size_t size() const { return m_cut.size(); }

private:
    const std::wstring& rememberedCut(const std::wstring& text, double boxWidth, const std::wstring& fontKey,
                                      const Measure& measure);

    std::map<std::tuple<std::wstring, double, std::wstring>, std::wstring> m_cut;
};

} // namespace cadrel::gui
