// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/window/Pictures.h"

#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>

namespace cadrel::tests {

namespace {

/// How far a channel of a pixel may be off, of 255. Compilers round the edges of shapes differently.
constexpr int Tolerance = 6;

bool isRenewing()
{
    const char* const value = std::getenv("CADREL_RENEW_PICTURES");
    return value && *value;
}

int distance(juce::Colour a, juce::Colour b)
{
    return std::max({std::abs(a.getRed() - b.getRed()), std::abs(a.getGreen() - b.getGreen()),
                     std::abs(a.getBlue() - b.getBlue()), std::abs(a.getAlpha() - b.getAlpha())});
}

/// As the files hold them: not multiplied with the alpha.
juce::Image snapshot(juce::Component& component, float scale)
{
    return component.createComponentSnapshot(component.getLocalBounds(), true, scale)
        .convertedToFormat(juce::Image::ARGB);
}

void writePicture(const juce::Image& picture, const juce::File& file)
{
    file.getParentDirectory().createDirectory();
    file.deleteFile();
    juce::FileOutputStream stream(file);
    ASSERT_TRUE(stream.openedOk() && juce::PNGImageFormat().writeImageToStream(picture, stream))
        << file.getFullPathName();
}

/// How many pixels of the two are too far off. Draws them in red over black.
int differingPixels(const juce::Image& expected, const juce::Image& drawn, juce::Image& difference)
{
    int differing = 0;
    for (int y = 0; y < difference.getHeight(); ++y) {
        for (int x = 0; x < difference.getWidth(); ++x) {
            // Outside of an image there is no pixel, which is another than any.
            const bool isInBoth = expected.getBounds().contains(x, y) && drawn.getBounds().contains(x, y);
            const int off = isInBoth ? distance(expected.getPixelAt(x, y), drawn.getPixelAt(x, y)) : 255;
            if (off > Tolerance)
                ++differing;
            difference.setPixelAt(x, y, off > Tolerance ? juce::Colour::fromRGB(255, 0, 0) : juce::Colours::black);
        }
    }
    return differing;
}

juce::Image besideEachOther(const juce::Image& left, const juce::Image& middle, const juce::Image& right)
{
    constexpr int gap = 8;
    const int height = std::max({left.getHeight(), middle.getHeight(), right.getHeight()});
    juce::Image all(juce::Image::ARGB, left.getWidth() + middle.getWidth() + right.getWidth() + 2 * gap, height, true);
    juce::Graphics graphics(all);
    graphics.drawImageAt(left, 0, 0);
    graphics.drawImageAt(middle, left.getWidth() + gap, 0);
    graphics.drawImageAt(right, left.getWidth() + middle.getWidth() + 2 * gap, 0);
    return all;
}

void expectPictureAtScale(juce::Component& component, const std::string& name, float scale)
{
    const juce::Image drawn = snapshot(component, scale);
    if (!drawn.isValid()) {
        ADD_FAILURE() << name << " shows nothing: its component has no size";
        return;
    }
    const juce::File kept(treePath("tests/gui/pictures/" + name + ".png"));
    if (isRenewing()) {
        writePicture(drawn, kept);
        return;
    }

    const juce::Image expected = juce::ImageFileFormat::loadFrom(kept).convertedToFormat(juce::Image::ARGB);
    juce::Image difference(juce::Image::RGB, std::max(expected.getWidth(), drawn.getWidth()),
                           std::max(expected.getHeight(), drawn.getHeight()), true);
    const int differing = differingPixels(expected, drawn, difference);
    if (differing == 0)
        return;
    const juce::File shown(programPath("../pictures/" + name + ".png"));
    writePicture(besideEachOther(expected, drawn, difference), shown);
    ADD_FAILURE() << differing << " pixels of " << name << " differ: see " << shown.getFullPathName();
}

} // namespace

void expectPicture(juce::Component& component, const std::string& name)
{
    expectPictureAtScale(component, name, 1.0F);
    expectPictureAtScale(component, name + "@2x", 2.0F);
}

} // namespace cadrel::tests
