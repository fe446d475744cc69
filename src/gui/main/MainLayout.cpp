// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainLayout.h"

#include "core/edl/EventList.h"
#include "util/Result.h"

#include <algorithm>

namespace cadrel::gui {

using core::ListKind;
using util::Result;

namespace {

constexpr int CounterHeight = 24;
/// From the end of a value to the next label.
constexpr int CounterGap = 50;
/// A label has this much more room than its text, and its value begins that much before the end of the label.
constexpr int LabelRoom = 32;
constexpr int ValueOverlap = 30;
constexpr int LeastValueWidth = 40;
/// Of a value, for its borders and a distance from its label.
constexpr int ValueRoom = 16;

/// Between the mouse and a box beside it, and between the box and the end of the window.
constexpr int MouseDistance = 10;

} // namespace

MainLayout::Box MainLayout::table(std::int32_t listKind) const
{
    const int w = m_width;
    const int h = m_height;
    switch (listKind) {
    case ListKind::Old:
        return {18, 73, w / 2 - 36, h / 2 - 153};
    case ListKind::New:
        return {w / 2 + 18, 73, w / 2 - 36, h / 2 - 153};
    case ListKind::Change:
        return {18, h / 2 + 55, w - 244, h / 2 - 225};
    default:
        throw Result::InvalidArgument;
    }
}

MainLayout::Box MainLayout::timeline() const
{
    return {18, m_height - 130, m_width - 244, 80};
}

MainLayout::Box MainLayout::video() const
{
    return {m_width - 210, m_height / 2 - 12, 204, m_height / 2 - 26};
}

MainLayout::Box MainLayout::button(MainButton button) const
{
    const int w = m_width;
    const int h = m_height;
    const int changeRow = h / 2 + 15;
    switch (button) {
    case MainButton::AddOld:
        return {15, 34, 32, 24};
    case MainButton::ClearOld:
        return {w / 2 - 43, 34, 32, 24};
    case MainButton::AddNew:
        return {w / 2 + 11, 34, 32, 24};
    case MainButton::ClearNew:
        return {w - 47, 34, 32, 24};
    case MainButton::Generate:
        return {w / 2 - 40, h / 2 - 42, 80, 24};
    case MainButton::AddChange:
        return {15, changeRow, 32, 24};
    case MainButton::Save:
        return {55, changeRow, 32, 24};
    case MainButton::ClearChange:
        return {120, changeRow, 32, 24};
    case MainButton::Preview:
        return {w - 404, changeRow, 90, 24};
    case MainButton::Source:
        return {w - 307, changeRow, 40, 24};
    case MainButton::Destination:
        return {w - 269, changeRow, 40, 24};
    case MainButton::Videos:
        return {w - 201, h / 2 + 16, 32, 24};
    case MainButton::In:
        return {w - 93, changeRow, 40, 24};
    case MainButton::Out:
        return {w - 55, changeRow, 40, 24};
    case MainButton::Settings:
        return {7, h - 32, 32, 24};
    case MainButton::Start:
        return {w - 164, h - 32, 112, 24};
    }
    throw Result::InvalidArgument;
}

MainLayout::Counters MainLayout::counters(std::int32_t listKind,
                                          const std::array<CounterText, CounterCount>& texts) const
{
    int x = listKind == ListKind::New ? m_width / 2 + 19 : 22;
    const int y = listKind == ListKind::Change ? m_height - 169 : m_height / 2 - 79;
    Counters row{};
    for (std::size_t index = 0; index < row.size(); ++index) {
        const int labelWidth = texts.at(index).label + LabelRoom;
        const int valueWidth = std::max(LeastValueWidth, texts.at(index).value + ValueRoom);
        const int valueX = x + labelWidth - ValueOverlap;
        row.at(index) = {{x, y, labelWidth, CounterHeight}, {valueX, y, valueWidth, CounterHeight}};
        x = valueX + valueWidth + CounterGap;
    }
    return row;
}

MainLayout::Area MainLayout::panel(std::int32_t listKind) const
{
    const auto width = static_cast<float>(m_width);
    switch (listKind) {
    case ListKind::Old:
        return {8.0F, 8.0F, halfWidth() - 12.0F, halfHeight() - 58.0F};
    case ListKind::New:
        return {halfWidth() + 4.0F, 8.0F, halfWidth() - 12.0F, halfHeight() - 58.0F};
    case ListKind::Change:
        return {8.0F, halfHeight() - 10.0F, width - 224.0F, halfHeight() - 30.0F};
    default:
        throw Result::InvalidArgument;
    }
}

MainLayout::Area MainLayout::title(std::int32_t listKind) const
{
    const auto width = static_cast<float>(m_width);
    switch (listKind) {
    case ListKind::Old:
        return {width / 4.0F - 100.0F, 8.0F, 200.0F, 20.0F};
    case ListKind::New:
        return {3.0F * width / 4.0F - 100.0F, 8.0F, 200.0F, 20.0F};
    case ListKind::Change:
        return {20.0F, halfHeight() - 10.0F, width - 260.0F, 20.0F};
    default:
        throw Result::InvalidArgument;
    }
}

MainLayout::Area MainLayout::band(std::int32_t listKind) const
{
    const auto width = static_cast<float>(m_width);
    switch (listKind) {
    case ListKind::Old:
        return {9.0F, 28.0F, halfWidth() - 14.0F, 35.0F};
    case ListKind::New:
        return {halfWidth() + 5.0F, 28.0F, halfWidth() - 14.0F, 35.0F};
    case ListKind::Change:
        return {9.0F, halfHeight() + 10.0F, width - 226.0F, 35.0F};
    default:
        throw Result::InvalidArgument;
    }
}

MainLayout::Rule MainLayout::rule() const
{
    return {8.0F, static_cast<float>(m_width) - 216.0F, static_cast<float>(m_height) - 140.0F};
}

int MainLayout::besideMouse(int mouse, int box, int window)
{
    return box + mouse + MouseDistance < window ? mouse + MouseDistance : window - box - MouseDistance;
}

} // namespace cadrel::gui
