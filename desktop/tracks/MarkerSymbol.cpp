// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/tracks/MarkerSymbol.h"

#include "gui/look/Text.h"

namespace desktop {

using cadrel::gui::Palette;

namespace {

constexpr auto Side = static_cast<float>(MarkerSymbol::Size);

juce::Path polygon(std::initializer_list<juce::Point<float>> corners)
{
    juce::Path path;
    path.startNewSubPath(*corners.begin());
    for (const juce::Point<float>& corner : corners)
        path.lineTo(corner);
    path.closeSubPath();
    return path;
}

juce::Path shapeOf(MarkerLook look)
{
    juce::Path path;
    switch (look) {
    case MarkerLook::User: // a flag
        return polygon({{0, 0}, {Side, 0}, {Side - 3, 3}, {Side, 6}, {1.5F, 6}, {1.5F, Side}, {0, Side}});
    case MarkerLook::Destination: // a block
        path.addRectangle(0.5F, 2.0F, 8.0F, 5.0F);
        return path;
    case MarkerLook::Insert: // an arrow into the gap
        return polygon({{0.5F, 1.5F}, {8.5F, 1.5F}, {4.5F, 8.0F}});
    case MarkerLook::DissolveWipe: // two wedges
        path = polygon({{0, 1}, {4.5F, 4.5F}, {0, 8}});
        path.addPath(polygon({{9, 1}, {4.5F, 4.5F}, {9, 8}}));
        return path;
    case MarkerLook::AutomationWarning: // a sign
        return polygon({{4.5F, 0.5F}, {9.0F, 8.5F}, {0.0F, 8.5F}});
    case MarkerLook::AudioSnippet: // a sliver
        path.addRectangle(3.0F, 0.0F, 3.0F, Side);
        return path;
    case MarkerLook::Overlap: // two that lie over each other
        path.addRectangle(0.0F, 0.5F, 6.0F, 4.5F);
        path.addRectangle(3.0F, 4.0F, 6.0F, 4.5F);
        return path;
    case MarkerLook::Memo: // a sheet with a folded corner
        return polygon({{1, 0}, {5.5F, 0}, {8, 2.5F}, {8, Side}, {1, Side}});
    }
    return path;
}

} // namespace

juce::Colour MarkerSymbol::colourOf(MarkerLook look)
{
    switch (look) {
    case MarkerLook::User:
        return toColour(Palette::text);
    case MarkerLook::Destination:
        return juce::Colour(104, 152, 199);
    case MarkerLook::Insert:
        return toColour(Palette::orange);
    case MarkerLook::DissolveWipe:
        return juce::Colour(176, 148, 214);
    case MarkerLook::AutomationWarning:
        return juce::Colour(236, 104, 84);
    case MarkerLook::AudioSnippet:
        return toColour(Palette::eventTeal);
    case MarkerLook::Overlap:
        return juce::Colour(214, 128, 172);
    case MarkerLook::Memo:
        return toColour(Palette::selection);
    }
    return {};
}

void MarkerSymbol::draw(juce::Graphics& graphics, MarkerLook look, float left, float top)
{
    graphics.fillPath(shapeOf(look), juce::AffineTransform::translation(left, top));
}

} // namespace desktop
