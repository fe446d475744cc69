// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/PluginFactory.h"

namespace cadrel::module {

/// The class of the controller.
inline constexpr Velmark::Identifier ControllerClass{"F61C1C254C9D4D68A782F7FBF56B9068"};

/// The module's factory with its one class, made at the first call and anew after its last release. Counted; null when it
/// can't be made.
Velmark::IPluginFactory* factory() noexcept;

} // namespace cadrel::module
