// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/TrackRole.h"

#include "util/StringUtil.h"

namespace cadrel::host {

namespace {

const wchar_t* untranslatedName(std::int32_t role)
{
    if (const core::MarkerTrack* const markers = core::MarkerTrack::ofRole(role))
        return markers->name;
    switch (role) {
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
