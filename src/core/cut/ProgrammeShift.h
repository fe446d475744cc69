// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <map>
#include <optional>

namespace cadrel::core {

/// How much later each stretch is in the new programme than in the old one, in seconds. Where stretches overlap, the
/// one that was added last counts, as in a run:
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

} // namespace cadrel::core
