// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/MissingFiles.h"

#include <mutex>
#include <set>
#include <system_error>
#include <thread>
#include <utility>

namespace desktop {

namespace fs = std::filesystem;

struct MissingFiles::Shared {
    std::mutex mutex;
    std::set<fs::path> missing;
    bool isLooking = false;
};

MissingFiles::MissingFiles() : m_shared(std::make_shared<Shared>()) {}

MissingFiles::~MissingFiles() = default;

void MissingFiles::look(std::vector<fs::path> files)
{
    {
        const std::lock_guard lock(m_shared->mutex);
        if (std::exchange(m_shared->isLooking, true))
            return;
    }
    const auto search = [shared = m_shared, files = std::move(files)] {
        for (const fs::path& file : files) {
            std::error_code ignored;
            const bool isThere = fs::exists(file, ignored);
            const std::lock_guard lock(shared->mutex);
            if (isThere)
                shared->missing.erase(file);
            else
                shared->missing.insert(file);
        }
        const std::lock_guard lock(shared->mutex);
        shared->isLooking = false;
    };
    try {
        std::thread(search).detach();
    } catch (const std::system_error&) {
        // Without a thread nothing more is known.
        const std::lock_guard lock(m_shared->mutex);
        m_shared->isLooking = false;
    }
}

bool MissingFiles::isLooking() const
{
    const std::lock_guard lock(m_shared->mutex);
    return m_shared->isLooking;
}

bool MissingFiles::isMissing(const fs::path& file) const
{
    const std::lock_guard lock(m_shared->mutex);
    return m_shared->missing.contains(file);
}

} // namespace desktop
