// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/SourceLine.h"

#include <filesystem>
#include <vector>

namespace cadrel::core::fileio {

/// Whether a file is UTF-16 text, with or without a byte order mark. Throws Result::FileAccessFailed for a file that can't
/// be read.
bool isUtf16(const std::filesystem::path& file);

/// The lines of a file of UTF-16 text that begin with a digit, as UTF-8; a long one only in part. Throws
/// Result::FileAccessFailed for a file that can't be read.
std::vector<SourceLine> numberedUtf16Lines(const std::filesystem::path& file);

} // namespace cadrel::core::fileio
