// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <string_view>

namespace cadrel::app {

/// What is the same in every page of notes.
struct NotesPage {
    static const std::string_view Style;
    static const std::string_view Script;
};

} // namespace cadrel::app
