// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/Text.h"

#include <algorithm>
#include <cmath>

namespace cadrel::gui {

namespace {

constexpr float DisabledMenuOpacity = 0.3F;
constexpr float MenuFontHeight = 16.0F;
/// The width of the moving block of a progress bar, and how long its way takes, in milliseconds.
constexpr float BlockShare = 0.25F;
constexpr unsigned BlockPeriod = 1500;
/// The free space that a sort arrow takes at the end of a header.
constexpr float SortArrow = 14.0F;

/// The part of a progress bar that is filled: up to the progress, or a moving block when nobody knows it.
juce::Rectangle<float> doneOf(juce::Rectangle<float> bar, double progress)
{
    if (progress >= 0.0 && progress <= 1.0)
        return bar.withWidth(bar.getWidth() * static_cast<float>(progress));
    const float phase =
        static_cast<float>(juce::Time::getMillisecondCounter() % BlockPeriod) / static_cast<float>(BlockPeriod);
    const float block = bar.getWidth() * BlockShare;
    return bar.withX((bar.getWidth() + block) * phase - block).withWidth(block).getIntersection(bar);
}

void drawSeparator(juce::Graphics& graphics, juce::Rectangle<int> area)
{
    juce::Rectangle<int> lines = area.reduced(5, 0).withTop(area.getCentreY() - 1);
    graphics.setColour(juce::Colour(0x33000000));
    graphics.fillRect(lines.removeFromTop(1));
    graphics.setColour(juce::Colour(0x66ffffff));
    graphics.fillRect(lines.removeFromTop(1));
}

/// Points to the right, into a submenu.
juce::Path subMenuArrow(juce::Rectangle<int> area)
{
    const juce::Point<float> centre = area.toFloat().getCentre();
    juce::Path arrow;
    arrow.addTriangle(centre.translated(-2.5F, -4.5F), centre.translated(-2.5F, 4.5F), centre.translated(3.0F, 0.0F));
    return arrow;
}

/// Points up where values rise down the table.
juce::Path sortArrow(juce::Point<float> centre, bool isRising)
{
    const float tip = isRising ? -3.0F : 3.0F;
    juce::Path arrow;
    arrow.addTriangle(centre.translated(-4.0F, -tip), centre.translated(4.0F, -tip), centre.translated(0.0F, tip));
    return arrow;
}

} // namespace

void LookAndFeel::drawComboBox(juce::Graphics& graphics, int width, int height, bool isDown, int buttonX, int buttonY,
                               int buttonWidth, int buttonHeight, juce::ComboBox& box)
{
    guardSystem([&] {
        const juce::Rectangle<int> button(buttonX, buttonY, buttonWidth, buttonHeight);
        const float opacity = opacityOf(box);
        const juce::Colour buttonColour = box.findColour(juce::ComboBox::buttonColourId).withMultipliedAlpha(opacity);
        graphics.fillAll(box.findColour(juce::ComboBox::backgroundColourId));
        graphics.setColour(isDown ? buttonColour.brighter(0.4F) : buttonColour);
        graphics.fillRect(button);
        graphics.setColour(box.findColour(juce::ComboBox::outlineColourId));
        graphics.drawRect(0, 0, width, height);
        if (box.hasKeyboardFocus(false))
            drawFocusRing(graphics, juce::Rectangle<int>(width, height).toFloat(), 0.0F);
        const auto at = [area = button.toFloat()](float x, float y) { return area.getRelativePoint(x, y); };
        juce::Path triangle;
        triangle.addTriangle(at(0.5F, 0.63F), at(0.8F, 0.33F), at(0.2F, 0.33F));
        graphics.setColour(box.findColour(juce::ComboBox::arrowColourId).withMultipliedAlpha(opacity));
        graphics.fillPath(triangle);
        if (!box.isEnabled())
            graphics.fillAll(juce::Colour(DisabledShade));
    });
}

juce::Font LookAndFeel::getComboBoxFont(juce::ComboBox&)
{
    return getFont(6);
}

juce::Font LookAndFeel::getPopupMenuFont()
{
    return {FontFamily, MenuFontHeight, juce::Font::plain};
}

void LookAndFeel::drawPopupMenuBackground(juce::Graphics& graphics, int width, int height)
{
    guardSystem([&] {
        graphics.fillAll(findColour(juce::PopupMenu::backgroundColourId));
        graphics.setColour(juce::Colours::black.withAlpha(0.6F));
        graphics.drawRect(0, 0, width, height);
    });
}

void LookAndFeel::drawPopupMenuItem(juce::Graphics& graphics, const juce::Rectangle<int>& area, bool isSeparator,
                                    bool isActive, bool isHighlighted, bool isTicked, bool hasSubMenu,
                                    const juce::String& text, const juce::String& shortcut, const juce::Drawable* icon,
                                    const juce::Colour* colour)
{
    guardSystem([&] {
        if (isSeparator) {
            drawSeparator(graphics, area);
            return;
        }
        juce::Rectangle<int> row = area.reduced(1);
        juce::Colour textColour = colour ? *colour : findColour(juce::PopupMenu::textColourId);
        if (isHighlighted) {
            graphics.setColour(findColour(juce::PopupMenu::highlightedBackgroundColourId));
            graphics.fillRect(row);
            textColour = findColour(juce::PopupMenu::highlightedTextColourId);
        }
        const float opacity = isActive ? 1.0F : DisabledMenuOpacity;
        graphics.setColour(textColour.withMultipliedAlpha(opacity));

        juce::Font font = getPopupMenuFont();
        font.setHeight(std::min(font.getHeight(), static_cast<float>(area.getHeight()) / 1.3F));
        graphics.setFont(font);
        const auto mark = row.removeFromLeft(row.getHeight()).reduced(row.getHeight() / 6).toFloat();
        if (icon) {
            icon->drawWithin(graphics, mark, juce::RectanglePlacement::centred, opacity);
        } else if (isTicked) {
            const juce::Path tick = getTickShape(1.0F);
            graphics.fillPath(tick, tick.getTransformToScaleToFit(mark, true));
        }
        if (hasSubMenu)
            graphics.fillPath(subMenuArrow(row.removeFromRight(row.getHeight() * 3 / 4)));
        row.removeFromRight(4);
        graphics.drawText(shortcut, row, juce::Justification::centredRight);
        graphics.drawFittedText(text, row, juce::Justification::centredLeft, 1);
    });
}

void LookAndFeel::drawLabel(juce::Graphics& graphics, juce::Label& label)
{
    guardSystem([&] {
        const float opacity = opacityOf(label);
        graphics.fillAll(label.findColour(juce::Label::backgroundColourId));
        if (!label.isBeingEdited()) {
            const auto box = getLabelBorderSize(label).subtractedFrom(label.getLocalBounds()).toFloat();
            const juce::Colour colour = label.findColour(juce::Label::textColourId).withMultipliedAlpha(opacity);
            drawText(graphics, label.getText(), box.getX(), box.getY(), box.getWidth(), box.getHeight(),
                     label.getJustificationType(), getLabelFont(label), colour, true);
        }
        graphics.setColour(label.findColour(juce::Label::outlineColourId));
        graphics.drawRect(label.getLocalBounds());
    });
}

void LookAndFeel::drawProgressBar(juce::Graphics& graphics, juce::ProgressBar& bar, int width, int height,
                                  double progress, const juce::String& text)
{
    guardSystem([&] {
        const auto area = juce::Rectangle<int>(width, height).toFloat();
        const juce::Colour background = bar.findColour(juce::ProgressBar::backgroundColourId);
        const juce::Colour foreground = bar.findColour(juce::ProgressBar::foregroundColourId);
        graphics.fillAll(background);
        graphics.setColour(foreground);
        const juce::Rectangle<int> done = doneOf(area, progress).toNearestInt();
        graphics.fillRect(done);
        // The text can be read on both.
        const auto write = [&](juce::Colour ground) {
            drawText(graphics, text, 0.0F, 0.0F, area.getWidth(), area.getHeight(), juce::Justification::centred,
                     {FontFamily, 0.6F * area.getHeight(), juce::Font::plain}, ground.contrasting(), false);
        };
        write(background);
        const juce::Graphics::ScopedSaveState saved(graphics);
        if (graphics.reduceClipRegion(done)) {
            graphics.setColour(foreground);
            graphics.fillRect(done);
            write(foreground);
        }
    });
}

void LookAndFeel::drawTextEditorOutline(juce::Graphics& graphics, int width, int height, juce::TextEditor& editor)
{
    guardSystem([&] {
        if (editor.isEnabled())
            LookAndFeel_V2::drawTextEditorOutline(graphics, width, height, editor);
        else if (editor.findColour(juce::TextEditor::backgroundColourId).isOpaque())
            graphics.fillAll(juce::Colour(DisabledShade));
        else {
            graphics.setColour(
                editor.findColour(juce::TextEditor::outlineColourId).withMultipliedAlpha(DisabledOpacity));
            graphics.drawRect(0, 0, width, height);
        }
    });
}

void LookAndFeel::drawTableHeaderBackground(juce::Graphics& graphics, juce::TableHeaderComponent&)
{
    guardSystem([&] { graphics.fillAll(toColour(Palette::panel)); });
}

void LookAndFeel::drawTableHeaderColumn(juce::Graphics& graphics, juce::TableHeaderComponent&, const juce::String& name,
                                        int, int width, int height, bool, bool, int flags)
{
    guardSystem([&] {
        const juce::Rectangle<float> field = juce::Rectangle<int>(2, 2, width - 4, height - 4).toFloat();
        const bool isForwards = (flags & juce::TableHeaderComponent::sortedForwards) != 0;
        const bool isSorted = isForwards || (flags & juce::TableHeaderComponent::sortedBackwards) != 0;
        graphics.setColour(toColour(Palette::band));
        graphics.fillRect(field);
        const auto box = static_cast<float>(width - 4) - (isSorted ? SortArrow : 0.0F);
        drawText(graphics, name, 6.0F, 0.0F, box, static_cast<float>(height), juce::Justification::centredLeft,
                 getFont(7), juce::Colours::black, true);
        if (isSorted) {
            graphics.setColour(juce::Colours::black);
            graphics.fillPath(sortArrow({field.getRight() - 5.0F, field.getCentreY()}, !isForwards));
        }
    });
}

} // namespace cadrel::gui
