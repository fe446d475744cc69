// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "host/track/HostEvent.h"

#include <cstdint>
#include <string>

namespace cadrel::host {

/// What a memo or a copy of one is like. Its times are seconds from the host's zero.
struct MemoState {
    std::int64_t id;
    std::wstring name;
    double start;
    double end;

    auto operator<=>(const MemoState&) const = default;

    static MemoState of(const HostEvent& event);
    /// Below all of its id and, where one is given, of its name.
    static MemoState firstOf(std::int64_t id, std::wstring name = {});
};

/// Which sides of a memo the user has edited.
struct EditedSides {
    bool name;
    bool place;
};

EditedSides differencesOf(const MemoState& one, const MemoState& other);

} // namespace cadrel::host
