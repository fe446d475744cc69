// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/document/ContentPrint.h"

#include <chrono>
#include <filesystem>
#include <optional>
#include <string>
#include <string_view>

namespace desktop {

/// Work that wasn't saved, in a file beside that of its project: `reel3.stage.autosave` for `reel3.stage`. It can be seen in
/// the folder, as it only stays there after a crash. It begins with lines of its own, so that no program takes it for a
/// project:
///
///     Cadrel autosave 1
///     {"path":"/film/reel3.stage","form":"stage","fileSize":...,"fileHash":"...","time":...,"size":...,"hash":"..."}
///     the content that the project would be stored with
///
/// It is replaced at one stroke, and what isn't whole is never taken for one.
struct Autosave {
    using Time = std::chrono::system_clock::time_point;

    std::filesystem::path path; ///< of the project
    std::string form;           ///< in which the content is: "stage" or "ardour"
    ContentPrint filePrint;     ///< of the project's file when that was last read or written
    Time time;                  ///< when it was written, in whole seconds
    std::string content;

    static std::filesystem::path pathFor(const std::filesystem::path& project);

    /// The one of a project; nothing where there is none that is whole.
    static std::optional<Autosave> read(const std::filesystem::path& project);
    /// Replaces the one of its project. Throws DocumentError, also where another file has its name.
    void write() const;
    /// The same for a content that is elsewhere.
    static void write(const std::filesystem::path& path, const ContentPrint& filePrint, std::string_view content,
                      Time time);
    /// Does nothing where another file has its name.
    static void remove(const std::filesystem::path& project);
    /// Gives it a name under which nobody looks for it or replaces it, `reel3.stage.autosave-1`. Answers its new path; nothing
    /// where there is none, and where the disk refuses that.
    static std::optional<std::filesystem::path> keepAside(const std::filesystem::path& project);
    /// The first such name that is free.
    static std::filesystem::path asidePathFor(const std::filesystem::path& project);
    /// Writes one under such a name, and leaves the one of the project as it is. Throws DocumentError.
    static void writeAside(const std::filesystem::path& path, const ContentPrint& filePrint, std::string_view content,
                           Time time);
};

} // namespace desktop
