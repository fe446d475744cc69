// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventColumn.h"

#include "gui/look/ShownText.h"

namespace cadrel::gui {

namespace {

const wchar_t* untranslatedName(int id)
{
    switch (id) {
    case EventColumn::State:
        return L"State";
    case EventColumn::Number:
        return L"ID";
    case EventColumn::Roll:
        return L"Roll";
    case EventColumn::ClipName:
        return L"Clip Name";
    case EventColumn::EdlFile:
        return L"EDL File";
    case EventColumn::Transition:
        return L"TR";
    case EventColumn::SrcIn:
        return L"SRC IN";
    case EventColumn::SrcOut:
        return L"SRC OUT";
    case EventColumn::DstIn:
        return L"DST IN";
    case EventColumn::DstOut:
        return L"DST OUT";
    default:
        return L"Unknown Column";
    }
}

} // namespace

const std::array<EventColumn, EventColumn::Count>& EventColumn::all()
{
    static constexpr int NameMaximum = 800;
    static constexpr int TimecodeWidth = 65;
    static constexpr std::array<EventColumn, Count> Columns = {{
        {State, 50, 50},
        {Number, 40, 40},
        {Roll, 70, 400},
        {ClipName, 70, NameMaximum},
        {EdlFile, 80, NameMaximum},
        {Transition, 30, 30},
        {SrcIn, TimecodeWidth, TimecodeWidth},
        {SrcOut, TimecodeWidth, TimecodeWidth},
        {DstIn, TimecodeWidth, TimecodeWidth},
        {DstOut, TimecodeWidth, TimecodeWidth},
    }};
    return Columns;
}

std::wstring EventColumn::name(int id)
{
    return translated(untranslatedName(id));
}

} // namespace cadrel::gui
