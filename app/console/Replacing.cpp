// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/console/Replacing.h"

#include "app/console/Failure.h"
#include "app/console/Paths.h"
#include "util/FilePath.h"
#include "util/Result.h"

#include <system_error>

namespace cadrel::app {

namespace fs = std::filesystem;

namespace {

fs::path numbered(const fs::path& file, int number)
{
    fs::path path = file;
    path.replace_filename(file.stem().string() + "_backup_" + std::to_string(number) + file.extension().string());
    return path;
}

/// A second name, or a copy where the disk doesn't support second names. Returns whether the new name was free.
bool takesName(const fs::path& file, const fs::path& name)
{
    std::error_code error;
    if (fs::exists(fs::symlink_status(name, error)))
        return false;
    fs::create_hard_link(file, name, error);
    if (!error)
        return true;
    if (error != std::errc::file_exists) {
        fs::copy_file(file, name, error);
        std::error_code ignored;
        if (error && error != std::errc::file_exists)
            fs::remove(name, ignored);
    }
    if (error && error != std::errc::file_exists)
        throw unwritable({name.string()});
    return !error;
}

fs::path backUp(const std::string& file)
{
    try {
        const fs::path target = util::followLinks(file);
        int number = 1;
        while (!takesName(target, numbered(target, number)))
            ++number;
        return numbered(target, number);
    } catch (const util::Result::Type&) {
        throw unreadable(file, FileKind::Project);
    }
}

bool isFile(const std::string& file)
{
    std::error_code error;
    return fs::is_regular_file(file, error);
}

} // namespace

void requireReplaceable(const std::vector<std::string>& files, const Replacing& replacing)
{
    for (const std::string& file : files) {
        if (!replacing.isAllowed && isFile(file))
            throw Failure{file, "exists already", "give --overwrite to replace it, or another name"};
    }
}

Backups::Backups(const std::vector<std::string>& files)
{
    try {
        for (const std::string& file : files) {
            if (isFile(file))
                m_files.push_back(backUp(file));
        }
    } catch (...) {
        removeAll();
        throw;
    }
}

Backups::~Backups()
{
    if (!m_isKept)
        removeAll();
}

void Backups::removeAll()
{
    std::error_code error;
    for (const fs::path& file : m_files)
        fs::remove(file, error);
}

std::vector<std::string> Backups::names() const
{
    std::vector<std::string> names;
    for (const fs::path& file : m_files)
        names.push_back(file.string());
    return names;
}

} // namespace cadrel::app
