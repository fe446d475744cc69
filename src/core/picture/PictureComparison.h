// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"

#include <cstdint>
#include <vector>

namespace cadrel::core {

class PictureLine;
struct PictureRun;

/// Some frames of the new programme that belong to one run of it.
struct PicturePiece {
    FrameRange frames;
    std::uint32_t event; ///< the new event that names them
};

/// Holds two cuts against each other, the old one moved by a shift: frame t of the new one against t - shift of the old.
///
/// Two pictures are equal when they have the same layers, each with the same material, the same speed to 0.01, and the
/// same source frame to less than half of what it moves in one frame. A still shows the same at every frame, so that
/// it would be equal to itself at any shift that lets the two overlap; it has to begin or to end at the same frame too.
///
///     old          |-- still --|-- B --|
///     new          |- X -|-- still --|-- B --|
///     shift 0              unequal                  the still has moved along with B
class PictureComparison {
public:
    PictureComparison(const PictureLine& oldLine, const PictureLine& newLine) : m_old(oldLine), m_new(newLine) {}

    /// Where the pictures are equal within `bounds` of the new programme, ascending. Black isn't equal to anything.
    std::vector<PicturePiece> equalUnder(std::int32_t shift, const FrameRange& bounds) const;
    /// Where neither cut is black.
    std::vector<PicturePiece> litUnder(std::int32_t shift, const FrameRange& bounds) const;
    /// Where the pictures differ; black doesn't differ from black.
    FrameRanges differencesUnder(std::int32_t shift, const FrameRange& bounds) const;

private:
    template <class Action>
    void forEachOverlap(std::int32_t shift, const FrameRange& bounds, Action action) const;
    FrameRange equalPart(const PictureRun& oldRun, const PictureRun& newRun, std::int32_t shift,
                         const FrameRange& overlap) const;

    const PictureLine& m_old;
    const PictureLine& m_new;
};

} // namespace cadrel::core
