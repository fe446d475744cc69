// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <string>

namespace Velmark {
class IEditTransaction;
class IHostContext;
} // namespace Velmark

namespace cadrel::host {

class Track;

/// A marker that is about to be written. Times are those of the project's clock, in seconds, and may be reversed.
struct Marker {
    double start = 0.0;
    double end = 0.0; ///< one that is no longer than a hundredth of a second becomes a point
    std::wstring name;
    std::string reel;
    std::int64_t userId = 0; ///< 0 for none

    /// Throws Result::NotAvailable when the track isn't alive, Result::HostObjectMissing and Result::HostCallFailed.
    void insertInto(Velmark::IHostContext* context, Velmark::IEditTransaction& transaction, const Track& track) const;
};

} // namespace cadrel::host
