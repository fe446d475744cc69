// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "desktop/tracks/ChangeMap.h"

#include <cstddef>
#include <cstdint>
#include <optional>

namespace standin {
class Project;
} // namespace standin

namespace desktop {

/// What Cadrel has stored in a project of its recut, for the view of the tracks.
class StoredChange {
public:
    /// Reads what is stored now. False when that is the same as at the last look, or can't be read. Whether the stretches
    /// have been carried over already is known from the runs that Cadrel has noted.
    bool look(const standin::Project& project);

    const ChangeMap& map() const { return m_map; }
    /// The event that is selected in the change EDL; nothing when none or several are.
    std::optional<std::size_t> event() const { return m_event; }

private:
    std::optional<std::int64_t> m_checksum;
    ChangeMap m_map;
    std::optional<std::size_t> m_event;
};

} // namespace desktop
