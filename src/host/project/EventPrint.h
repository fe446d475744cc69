// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace Velmark {
class IProjectNode;
}

namespace cadrel::host {

// Numbers by which an event of a track is known again, below 2^29. Two that differ tell that it was edited. All throw
// Result::HostObjectMissing when the host gives nothing.

/// Made of its name alone.
std::uint32_t namePrintOf(Velmark::IProjectNode& event);
/// Made of its name, of the file that it plays, and of all that a part holds.
std::uint32_t contentPrintOf(Velmark::IProjectNode& event);
/// Made of where it stands and of what of its clip it plays, and of nothing else.
std::uint32_t placePrintOf(Velmark::IProjectNode& event);

/// A time of a project in instants, of which all that are the same are equal.
std::int64_t toInstant(double seconds);

} // namespace cadrel::host
