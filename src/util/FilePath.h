// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>

namespace cadrel::util {

/// The system's path for a wide file name. Throws what StringUtil::toUtf8 throws, and Result::FileAccessFailed for a
/// name with a zero character, which the system would take for the shorter name in front of it.
std::filesystem::path toFilePath(const std::wstring& name);

/// The file that a symbolic link points to, which need not exist; another path as it is. Throws
/// Result::FileAccessFailed for links that go round in circles.
std::filesystem::path followLinks(std::filesystem::path path);

} // namespace cadrel::util
