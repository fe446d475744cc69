// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace cadrel::core {
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// What the user can do first, in his language, where a list (core::ListKind) is empty; nothing where it isn't. The model may be
/// null, as without a project.
std::wstring emptyListHint(const core::DataModel* model, std::int32_t listKind);

} // namespace cadrel::gui
