// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"

#include <cstdint>
#include <map>
#include <optional>
#include <vector>

namespace cadrel::core {

struct PicturePiece;

/// Why a stretch of the old programme is carried over.
enum class CarriedFrom : std::int32_t {
    Cut,       ///< the change EDL says so
    Unchanged, ///< the picture is the same at the same time
    Hole,      ///< the change EDL doesn't tell, but the picture goes on as beside it
    Black,     ///< there is no picture, and sound or markers stand there
};

/// A stretch of the new programme and where it comes from.
struct CarriedStretch {
    static constexpr std::int32_t NoEvent = -1;

    FrameRange destination;
    std::int32_t shift = 0; ///< frames from the old place to the new one
    CarriedFrom from = CarriedFrom::Cut;
    std::int32_t event = NoEvent; ///< the place in the new list of the event that names it

    FrameRange source() const { return destination.shiftedBy(-shift); }
};

/// What has been carried over so far. No frame of the new programme is given away twice: the first one gets it.
class CarriedStretches {
public:
    /// Takes those frames of `stretch` that are free.
    void carry(const CarriedStretch& stretch);
    void carry(const std::vector<PicturePiece>& pieces, std::int32_t shift, CarriedFrom from);

    bool isEmpty() const { return m_byStart.empty(); }
    /// Ascending by destination.
    std::vector<CarriedStretch> stretches() const;
    /// Where something has been carried to.
    FrameRanges destinations() const;
    FrameRanges freeIn(const FrameRange& bounds) const;

    /// The shift of the nearest stretch within `bounds` that ends at or before a frame, or starts at or after it.
    std::optional<std::int32_t> shiftBefore(std::int32_t frame, const FrameRange& bounds) const;
    std::optional<std::int32_t> shiftAfter(std::int32_t frame, const FrameRange& bounds) const;

private:
    std::map<std::int32_t, CarriedStretch> m_byStart;
};

} // namespace cadrel::core
