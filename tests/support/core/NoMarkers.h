// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/settings/Settings.h"

namespace cadrel::tests {

/// A run makes no markers of any kind.
inline void switchMarkersOff(core::Settings& settings)
{
    settings.setCreateDestinationMarkers(false);
    settings.setCreateInsertMarkers(false);
    settings.setCreateDissolveWipeMarkers(false);
    settings.setCreateAudioSnippetMarkers(false);
    settings.setCreateAutomationWarningMarkers(false);
    settings.setCreateOverlapMarkers(false);
}

} // namespace cadrel::tests
