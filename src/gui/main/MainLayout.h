// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/main/MainButton.h"

#include <array>
#include <cstddef>
#include <cstdint>

namespace cadrel::gui {

/// Where everything stands in a window of any size, in pixels. The lists are those of core::ListKind.
///
///     |-- Old EDL ------------|-- New EDL ------------|
///     |        table          |        table          |
///     |        counters   [Generate]   counters       |
///     |-- Change EDL ---------------------|-- Video --|
///     |        table                      |           |
///     |        counters                   |           |
///     |        timeline                   |           |
class MainLayout {
public:
    struct Box {
        int x;
        int y;
        int width;
        int height;

        bool operator==(const Box&) const = default;
    };
    /// Of what is drawn; halves of pixels count.
    struct Area {
        float x;
        float y;
        float width;
        float height;

        bool operator==(const Area&) const = default;
    };

    MainLayout(int width, int height) : m_width(width), m_height(height) {}

    Box table(std::int32_t listKind) const;
    Box button(MainButton button) const;
    Box timeline() const;
    Box video() const;

    /// The counters of a list stand in a row: Total, Selected, Invalid, each as a label and a value.
    static constexpr std::size_t CounterCount = 3;
    struct Counter {
        Box label;
        Box value;
    };
    /// How wide the texts are.
    struct CounterText {
        int label;
        int value;
    };
    using Counters = std::array<Counter, CounterCount>;
    /// A value has room for its whole text.
    Counters counters(std::int32_t listKind, const std::array<CounterText, CounterCount>& texts) const;

    // What is drawn around the controls.

    Area panel(std::int32_t listKind) const;
    Area title(std::int32_t listKind) const;
    Area band(std::int32_t listKind) const;
    /// The line above the timeline, from its left end to its right end.
    struct Rule {
        float left;
        float right;
        float y;
    };
    Rule rule() const;

    /// Where a box that comes up beside the mouse begins, along one side of the window: after the mouse where it fits there,
    /// and else at the end of the window.
    static int besideMouse(int mouse, int box, int window);

private:
    float halfWidth() const { return static_cast<float>(m_width) / 2.0F; }
    float halfHeight() const { return static_cast<float>(m_height) / 2.0F; }

    int m_width;
    int m_height;
};

} // namespace cadrel::gui
