// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

namespace cadrel::tests {

/// Whether a shared object of that file name is in the memory of this process.
inline bool isMapped(const std::string& name)
{
    std::ifstream maps("/proc/self/maps");
    for (std::string line; std::getline(maps, line);) {
        if (line.ends_with("/" + name))
            return true;
    }
    return false;
}

/// How many threads, and how many open files, this process has.
struct ProcessResources {
    std::size_t threads = countOf("/proc/self/task");
    std::size_t descriptors = countOf("/proc/self/fd");

    bool operator==(const ProcessResources&) const = default;

private:
    static std::size_t countOf(const char* folder)
    {
        return static_cast<std::size_t>(
            std::distance(std::filesystem::directory_iterator(folder), std::filesystem::directory_iterator()));
    }
};

} // namespace cadrel::tests
