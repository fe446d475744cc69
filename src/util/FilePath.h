// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <string>

namespace cadrel::util {

/// The system's path for a wide file name. Throws what StringUtil::toUtf8 throws, and Result::FileAccessFailed for a
/// name with a zero character, which the system would take for the shorter name in front of it.
std::filesystem::path toFilePath(const std::wstring& name);

} // namespace cadrel::util
