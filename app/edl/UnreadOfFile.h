// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/FileRemarks.h"

#include <cstddef>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace cadrel::app {

/// The lines of an EDL that were not read.
struct UnreadOfFile {
    std::string file;
    std::vector<core::fileio::UnreadLine> lines;
};

/// `line 12: "001 AX ..."`, with a long text cut.
std::string quoted(const core::fileio::SourceLine& line);
/// `line 12 misses a field and isn't read: "001 AX ..."`.
std::string textOf(const core::fileio::UnreadLine& line);

/// The lines of all files.
std::size_t countOf(const std::vector<UnreadOfFile>& unread);
/// [{"file": ..., "line": 12, "problem": "misses a field and isn't read", "text": "001 AX ..."}, ...]
nlohmann::ordered_json toJson(const std::vector<UnreadOfFile>& unread);

} // namespace cadrel::app
