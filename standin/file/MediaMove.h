// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <filesystem>
#include <map>
#include <string>

namespace standin {

class Project;

/// The paths of a project's media when it is stored in another folder. A path that isn't absolute begins at the folder of the
/// project; so that it still leads to its file, it is made absolute, or made to begin at the new folder where the file lies in
/// that. The paths are put back unless `keep` is called.
class MediaMove {
public:
    /// Does nothing where the folder stays, or the project was never stored.
    MediaMove(Project& project, const std::filesystem::path& newFile);
    MediaMove(const MediaMove&) = delete;
    MediaMove& operator=(const MediaMove&) = delete;
    ~MediaMove();

    void keep() { m_former.clear(); }

private:
    Project& m_project;
    std::map<int, std::u16string> m_former; ///< by the numbers of the clips
};

/// Begins at the folder where the file lies in that, and is absolute else.
std::filesystem::path mediaPathFrom(const std::filesystem::path& folder, const std::filesystem::path& file);

} // namespace standin
