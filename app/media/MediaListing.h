// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "app/console/Columns.h"
#include "app/edl/ProjectClock.h"

#include <cstddef>
#include <filesystem>
#include <iosfwd>
#include <string>
#include <vector>

namespace standin {
class MediaClip;
class Project;
} // namespace standin

namespace cadrel::app {

class Terminal;

/// The files of a project's media pool as they are on the disk: which are there, and what they are.
class MediaListing {
public:
    /// Opens all of them. The project has to know where it is stored.
    MediaListing(const standin::Project& project, const ProjectClock& clock, Terminal& terminal);

    void print(std::ostream& out) const;

private:
    struct Found {
        std::string rate = "-";
        std::string length = "-"; ///< of the file
        std::string file;         ///< its path, and what is wrong
        bool isMissing = false;
        bool isUsable = false;
    };

    Found look(const standin::MediaClip& clip) const;
    void open(const standin::MediaClip& clip, const std::filesystem::path& file, Found& found) const;

    const standin::Project& m_project;
    const ProjectClock& m_clock;
    std::vector<Columns::Row> m_rows;
    std::size_t m_missing = 0;
    std::size_t m_unusable = 0;
};

} // namespace cadrel::app
