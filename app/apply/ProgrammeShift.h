// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <map>
#include <optional>

namespace cadrel::app {

/// By how much each stretch of the new programme stands later than it did in the old one, in seconds. Of stretches that
/// overlap, the one that was added last holds, as it does in a run:
///
///     first   |----- +2 -----|
///     then           |---- -1 ----|
///     holds   |- +2 -|---- -1 ----|
class ProgrammeShift {
public:
    /// An empty stretch adds nothing.
    void add(double start, double end, double shift);
    /// Nothing where there is no stretch.
    std::optional<double> at(double time) const;

private:
    struct Stretch {
        double end;
        double shift;
    };

    std::map<double, Stretch> m_stretches; ///< by their starts; they don't overlap
};

} // namespace cadrel::app
