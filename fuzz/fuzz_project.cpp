// SPDX-License-Identifier: GPL-3.0-or-later

// The reader of project files on any bytes, and the writer on what it has read.

#include "fuzz/Check.h"
#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace {

using namespace standin;
using cadrel::fuzz::check;

/// The text of the project that is read from a text; nothing when that is refused.
std::optional<std::string> textAgain(std::string_view text)
{
    ChangeLog log;
    Velmark::Counted<Project> project;
    try {
        project = ProjectFile::parse(text, "input", log);
    } catch (const ProjectFileError& error) {
        const std::string_view line = error.what();
        check(line.starts_with("input: ") && line.find('\n') == std::string_view::npos, "a fault is told in one line");
        check(line.size() < 4096, "a fault is told in few words");
        return std::nullopt;
    }
    check(!project->hasChanges(), "nothing of a project that was read counts as changed");
    return ProjectFile::toText(*project);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    const std::optional<std::string> text = textAgain({reinterpret_cast<const char*>(data), size});
    if (text)
        check(textAgain(*text) == text, "what was written reads back to the same bytes");
    return 0;
}
