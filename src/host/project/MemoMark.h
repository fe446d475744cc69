// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <optional>

namespace Velmark {
class IProjectNode;
}

namespace cadrel::host {

/// What a copy of a memo was like when it was written or its memo followed it last. The copy keeps it in an attribute, which
/// travels along when the user pastes the copy.
struct MemoMark {
    std::uint32_t place;
    std::uint32_t name;

    bool operator==(const MemoMark&) const = default;

    /// What it is like now.
    static MemoMark of(Velmark::IProjectNode& copy);
    /// Nothing for an event that keeps none: a memo that was never a copy.
    static std::optional<MemoMark> keptBy(Velmark::IProjectNode& copy);
    /// Throws Result::HostCallFailed when the host refuses.
    void keepOn(Velmark::IProjectNode& copy) const;
    /// Keeps on a copy what it is like now. Throws as keepOn does.
    static void renewOn(Velmark::IProjectNode& copy);
    /// Whether a copy is as it was when it was written or its memo followed it last. False for what keeps no mark.
    static bool isUpToDateOn(Velmark::IProjectNode& copy);
};

} // namespace cadrel::host
