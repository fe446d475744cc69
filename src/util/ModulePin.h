// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

namespace cadrel::util {

/// Keeps the shared object that this code is part of in memory until the process ends, whoever unloads it: for code that
/// may still be called then. It can't be taken back. In a program it does nothing.
void pinModule() noexcept;

} // namespace cadrel::util
