// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <memory>
#include <string>
#include <vector>

namespace cadrel::gui {

class TakenFiles;

/// Reads the files (paths in UTF-8) in their order and takes them. The user is told of each that can't be read or fits the
/// project badly, and asked whether it is taken all the same. While he is asked, everything can happen: when `taken` has
/// gone, all that is left to do is dropped. Throws Result::NotAvailable when nobody can be told.
void takeEdls(const std::weak_ptr<TakenFiles>& taken, const std::vector<std::string>& paths, bool renameBRolls);

} // namespace cadrel::gui
