// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/look/ButtonPicture.h"

#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"

namespace cadrel::gui {

namespace {

using Symbol = ButtonPicture::Symbol;

const juce::Rectangle<float> CommonSize(57.0F, 43.0F);
const juce::Rectangle<float> WideSize(144.0F, 43.0F);
const juce::Rectangle<float> ArrowSize(16.0F, 12.0F);

juce::Path plus()
{
    juce::Path path;
    path.addRectangle(25.0F, 10.5F, 7.0F, 22.0F);
    path.addRectangle(17.5F, 18.0F, 7.5F, 7.0F);
    path.addRectangle(32.0F, 18.0F, 7.5F, 7.0F);
    return path;
}

juce::Path bin()
{
    juce::Path path;
    path.setUsingNonZeroWinding(false);
    path.addRoundedRectangle(16.0F, 11.0F, 25.0F, 4.0F, 1.0F);
    path.addRectangle(24.0F, 8.0F, 9.0F, 3.0F);
    path.startNewSubPath(18.5F, 17.0F);
    path.lineTo(38.5F, 17.0F);
    path.lineTo(36.5F, 36.0F);
    path.lineTo(20.5F, 36.0F);
    path.closeSubPath();
    for (const float x : {22.8F, 27.4F, 32.0F})
        path.addRectangle(x, 19.5F, 2.2F, 13.5F);
    return path;
}

juce::Path cog()
{
    constexpr int teeth = 8;
    constexpr float outer = 14.0F;
    constexpr float inner = 10.0F;
    constexpr float hole = 4.4F;
    const juce::Point<float> centre = CommonSize.getCentre();
    const float turn = juce::MathConstants<float>::twoPi / teeth;

    juce::Path path;
    path.setUsingNonZeroWinding(false);
    for (int tooth = 0; tooth < teeth; ++tooth) {
        const float angle = turn * static_cast<float>(tooth);
        const auto at = [&](float radius, float part) {
            return centre.getPointOnCircumference(radius, angle + turn * part);
        };
        if (tooth == 0)
            path.startNewSubPath(at(inner, -0.27F));
        else
            path.lineTo(at(inner, -0.27F));
        path.lineTo(at(outer, -0.17F));
        path.lineTo(at(outer, 0.17F));
        path.lineTo(at(inner, 0.27F));
    }
    path.closeSubPath();
    path.addEllipse(juce::Rectangle<float>(2.0F * hole, 2.0F * hole).withCentre(centre));
    return path;
}

juce::Path floppy()
{
    juce::Path path;
    path.setUsingNonZeroWinding(false);
    path.startNewSubPath(16.5F, 9.5F);
    path.lineTo(36.0F, 9.5F);
    path.lineTo(40.5F, 14.0F);
    path.lineTo(40.5F, 33.5F);
    path.lineTo(16.5F, 33.5F);
    path.closeSubPath();
    // The shutter with its slot, and the label.
    path.addRectangle(21.0F, 11.5F, 14.0F, 6.5F);
    path.addRectangle(30.0F, 12.5F, 3.0F, 4.5F);
    path.addRectangle(20.0F, 22.0F, 17.0F, 9.5F);
    path.addRectangle(22.0F, 24.0F, 13.0F, 2.0F);
    path.addRectangle(22.0F, 27.5F, 13.0F, 2.0F);
    return path;
}

juce::Path folder()
{
    const float left = WideSize.getCentreX() - 15.0F;
    juce::Path path;
    path.startNewSubPath(left, 10.0F);
    path.lineTo(left + 11.0F, 10.0F);
    path.lineTo(left + 14.0F, 13.0F);
    path.lineTo(left + 28.0F, 13.0F);
    path.lineTo(left + 28.0F, 15.5F);
    path.lineTo(left, 15.5F);
    path.closeSubPath();
    path.startNewSubPath(left, 18.0F);
    path.lineTo(left + 30.0F, 18.0F);
    path.lineTo(left + 28.0F, 33.5F);
    path.lineTo(left, 33.5F);
    path.closeSubPath();
    return path;
}

juce::Path triangle(float tip, float base)
{
    juce::Path path;
    path.addTriangle(ArrowSize.getCentreX(), tip, 13.0F, base, 3.0F, base);
    return path;
}

juce::Path letters(const char* text)
{
    const juce::Font font(FontFamily, 26.0F, juce::Font::bold);
    juce::GlyphArrangement glyphs;
    glyphs.addLineOfText(font, text, 0.0F, 0.0F);
    juce::Path path;
    glyphs.createPath(path);
    const juce::Point<float> centre = path.getBounds().getCentre();
    path.applyTransform(juce::AffineTransform::translation(CommonSize.getCentre() - centre));
    return path;
}

juce::Path pathOf(Symbol symbol)
{
    switch (symbol) {
    case Symbol::Plus:
        return plus();
    case Symbol::Bin:
        return bin();
    case Symbol::Cog:
        return cog();
    case Symbol::Floppy:
        return floppy();
    case Symbol::Folder:
        return folder();
    case Symbol::Up:
        return triangle(2.5F, 9.5F);
    case Symbol::Down:
        return triangle(9.5F, 2.5F);
    case Symbol::In:
        return letters("IN");
    case Symbol::Out:
        return letters("OUT");
    }
    return {};
}

juce::Rectangle<float> boundsOf(Symbol symbol)
{
    switch (symbol) {
    case Symbol::Folder:
        return WideSize;
    case Symbol::Up:
    case Symbol::Down:
        return ArrowSize;
    default:
        return CommonSize;
    }
}

ButtonTile tileOf(ButtonPicture::State state)
{
    ButtonTile tile =
        state.isPressed && state.isEnabled ? ButtonTile::lit(toColour(Palette::light)) : ButtonTile::normal();
    tile.isEnabled = state.isEnabled;
    tile.hasFocus = state.hasFocus;
    tile.isBeneath = state.isBeneath;
    return tile;
}

juce::Colour symbolColour(ButtonPicture::State state)
{
    const juce::Colour dark(0xff1b1f24);
    if (!state.isEnabled)
        return disabledInk(state.isBeneath);
    return state.isPressed ? dark.brighter(0.25F) : dark;
}

} // namespace

ButtonPicture::ButtonPicture(Symbol symbol) : m_bounds(boundsOf(symbol)), m_path(pathOf(symbol)) {}

void ButtonPicture::draw(juce::Graphics& graphics, juce::Rectangle<int> area, State state) const
{
    const juce::RectanglePlacement centred(juce::RectanglePlacement::centred);
    const juce::AffineTransform fit = centred.getTransformToFit(m_bounds, area.toFloat());
    // Edges on whole pixels are sharp.
    const juce::Rectangle<int> tile = m_bounds.transformedBy(fit).toNearestInt().getIntersection(area);
    tileOf(state).draw(graphics, tile.toFloat());
    graphics.setColour(symbolColour(state));
    graphics.fillPath(m_path, fit);
}

} // namespace cadrel::gui
