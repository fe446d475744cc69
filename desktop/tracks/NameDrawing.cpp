// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/NameDrawing.h"

#include "standin/base/Text.h"
#include "standin/base/Utf16.h"

namespace desktop {

namespace {

/// No clip is wide enough for more.
constexpr std::size_t LongestDrawn = 200;
constexpr int LeastLetters = 3;

std::u16string beginning(const std::u16string& name)
{
    if (name.size() <= LongestDrawn)
        return name;
    std::u16string part = name.substr(0, LongestDrawn);
    // A character of two units stays whole.
    if (!standin::isWellFormed(part))
        part.pop_back();
    return part;
}

} // namespace

juce::String shownName(const std::u16string& name)
{
    return standin::isWellFormed(name) ? juce::String::fromUTF8(standin::toUtf8(name).c_str()) : juce::String("?");
}

void NameDrawing::draw(juce::Graphics& graphics, const std::u16string& name, float left, float baseline, float room)
{
    if (name.empty() || room <= 0.0F)
        return;
    auto found = m_names.find(name);
    if (found == m_names.end()) {
        if (m_names.size() >= Capacity)
            m_names.clear();
        juce::GlyphArrangement letters;
        letters.addLineOfText(m_font, shownName(beginning(name)), 0.0F, 0.0F);
        found = m_names.emplace(name, std::move(letters)).first;
    }
    juce::GlyphArrangement& letters = found->second;
    const int count = letters.getNumGlyphs();
    int fitting = 0;
    while (fitting < count && letters.getGlyph(fitting).getRight() <= room)
        ++fitting;
    if (fitting < count && fitting < LeastLetters)
        return;
    const auto place = juce::AffineTransform::translation(left, baseline);
    for (int letter = 0; letter < fitting; ++letter)
        letters.getGlyph(letter).draw(graphics, place);
}

} // namespace desktop
