// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "velmark/Counted.h"
#include "velmark/ProjectNode.h"

#include <cstdint>
#include <map>
#include <optional>
#include <utility>
#include <vector>

namespace cadrel::host {

/// The automation that the system has written on the curves of a track in the preview stretch: a part of PreviewRecord, which
/// stores it. Times are seconds from the time origin.
class WrittenAutomation {
public:
    using Node = Velmark::Counted<Velmark::IProjectNode>;
    using Numbers = std::vector<double>;

    /// With nothing written.
    WrittenAutomation() = default;
    /// As numbers() gives it. Nothing for what is none.
    static std::optional<WrittenAutomation> ofNumbers(const Numbers& numbers);
    /// Where the points aren't known: all that stands up to `end` on the curves with these numbers, or without numbers on
    /// any.
    static WrittenAutomation upTo(double end, std::optional<Numbers> curves);

    void add(Velmark::IProjectNode& curve, Velmark::IProjectNode& point);
    /// Of each point the number of its curve, its time and its value.
    const Numbers& numbers() const { return m_numbers; }
    /// Those of the points of a curve that weren't written, or have another time or value since.
    std::vector<Node> others(Velmark::IProjectNode& curve, std::vector<Node> points) const;

private:
    /// Of a point: where it stands, in instants, and its value.
    using Known = std::pair<std::int64_t, double>;
    struct Unknown {
        double end;
        std::optional<Numbers> curves;
    };

    void add(double curve, double time, double value);

    /// By the number of the curve, and how many of them are there.
    std::map<double, std::map<Known, std::int64_t>> m_points;
    Numbers m_numbers;
    std::optional<Unknown> m_unknown; ///< where the points aren't known
};

} // namespace cadrel::host
