// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventCells.h"

#include "core/edl/EventBase.h"
#include "gui/look/ShownText.h"
#include "gui/table/EventColumn.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

namespace cadrel::gui {

using core::EventBase;
using core::TransitionType;
using util::StringUtil;
using util::toShownLine;

namespace {

const char* transitionText(const EventBase& event)
{
    switch (event.transitionType()) {
    case TransitionType::Dissolve:
        return "D";
    case TransitionType::Wipe:
        return "W";
    default:
        return "C";
    }
}

std::wstring joined(const std::vector<std::wstring>& texts, const wchar_t* separator)
{
    std::wstring all;
    for (const std::wstring& text : texts) {
        if (!all.empty())
            all += separator;
        all += text;
    }
    return all;
}

/// What is wrong with an event, a line each.
std::vector<std::wstring> flawLines(const EventBase& event)
{
    std::string text;
    try {
        text = event.flawsText();
    } catch (util::Result::Type) {
        return {};
    }
    std::vector<std::wstring> lines;
    for (const std::string& line : StringUtil::split(StringUtil::trim(text), '\n', false))
        lines.push_back(toShownLine(line));
    return lines;
}

std::wstring spokenState(const EventBase& event, bool isRelated)
{
    std::vector<std::wstring> words = {translated(event.isValid() ? L"Valid" : L"Invalid")};
    if (!event.isValid()) {
        for (std::wstring& flaw : flawLines(event)) {
            if (!flaw.empty())
                words.push_back(std::move(flaw));
        }
    }
    if (event.vfx())
        words.push_back(translated(L"VFX shot"));
    if (isRelated)
        words.push_back(translated(L"Related to the selected change"));
    return joined(words, L", ");
}

} // namespace

std::wstring EventCells::text(const EventBase& event, int column)
{
    switch (column) {
    case EventColumn::Number:
        return std::to_wstring(event.eventNumber());
    case EventColumn::Roll:
        return toShownLine(event.rollName());
    case EventColumn::ClipName:
        return toShownLine(event.clipName());
    case EventColumn::EdlFile:
        return toShownLine(event.edlFileName());
    case EventColumn::Transition:
        return toShownLine(transitionText(event));
    case EventColumn::SrcIn:
        return toShownLine(event.srcIn().toString());
    case EventColumn::SrcOut:
        return toShownLine(event.srcOut().toString());
    case EventColumn::DstIn:
        return toShownLine(event.dstIn().toString());
    case EventColumn::DstOut:
        return toShownLine(event.dstOut().toString());
    default:
        return {};
    }
}

std::wstring EventCells::tooltip(const EventBase& event, int column)
{
    switch (column) {
    case EventColumn::State:
        return event.isValid() ? std::wstring() : joined(flawLines(event), L"\n");
    case EventColumn::Roll:
    case EventColumn::ClipName:
    case EventColumn::EdlFile:
        return text(event, column);
    default:
        return {};
    }
}

std::wstring EventCells::spokenText(const EventBase& event, int column, bool isRelated)
{
    return column == EventColumn::State ? spokenState(event, isRelated) : text(event, column);
}

std::wstring EventCells::spokenRow(const EventBase& event, bool isRelated)
{
    std::vector<std::wstring> texts;
    for (const EventColumn& column : EventColumn::all()) {
        if (std::wstring spoken = spokenText(event, column.id, isRelated); !spoken.empty())
            texts.push_back(std::move(spoken));
    }
    return joined(texts, L", ");
}

} // namespace cadrel::gui
