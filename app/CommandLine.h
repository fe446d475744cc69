// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/apply/ApplyCommand.h"
#include "app/edl/GenerateCommand.h"
#include "app/edl/ListCommand.h"
#include "app/notes/NotesCommand.h"
#include "app/open/OpenCommand.h"
#include "app/project/ShowCommand.h"

#include <optional>

namespace cadrel::app {

/// The command line, once parsed.
struct CommandLine {
    enum class Command { Generate, Apply, Notes, List, Show, Open };

    GenerateOptions generate;
    ApplyOptions apply;
    NotesOptions notes;
    ListOptions list;
    ShowOptions show;
    OpenOptions open;
    Command command = Command::Generate;

    /// Prints what `--help` and `--version` ask for, and gives nothing then. Throws UsageError.
    static std::optional<CommandLine> parse(int argc, char** argv);
};

} // namespace cadrel::app
