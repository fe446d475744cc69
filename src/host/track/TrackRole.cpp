// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackRole.h"

#include "util/StringUtil.h"

namespace cadrel::host {

namespace {

const wchar_t* untranslatedName(std::int32_t role)
{
    switch (role) {
    case TrackRole::Destination:
        return L"Destination";
    case TrackRole::DissolveWipe:
        return L"Dissolve/Wipe";
    case TrackRole::Insert:
        return L"Insert";
    case TrackRole::AutomationWarning:
        return L"Automation Warning";
    case TrackRole::AudioSnippet:
        return L"Audio Snippet";
    case TrackRole::Overlap:
        return L"Overlap";
    case TrackRole::Memos:
        return L"Memos";
    case TrackRole::NewVideo:
        return L"New Video";
    case TrackRole::Markers:
        return L"Cadrel Markers";
    case TrackRole::OldVideo:
        return L"Old Video";
    default:
        return L"INVALID!";
    }
}

} // namespace

std::wstring TrackRole::nameOf(std::int32_t role)
{
    return util::StringUtil::translate(untranslatedName(role));
}

} // namespace cadrel::host
