// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"

#include <cstddef>
#include <cstdint>
#include <span>
#include <vector>

namespace cadrel::core {

class EventList;
class PictureNames;

/// Where a cut shows a picture: all events that have a DST, flawed ones too, except sound and black, in any order.
FrameRanges litFrames(const EventList& events, const Framerate& framerate);

/// One event's part in a picture. The source frame at a frame of the programme is `origin + frame * speed`.
struct PictureLayer {
    std::int32_t material = 0; ///< by PictureNames
    double speed = 0.0;        ///< signed; 0 stands still
    double origin = 0.0;       ///< the source frame at frame 0 of the programme
    std::uint32_t event = 0;   ///< the place of an event in the list, which plays no part in a comparison

    bool isSamePicture(const PictureLayer& other) const
    {
        return material == other.material && speed == other.speed && origin == other.origin;
    }
};

/// A stretch on which the same layers stand.
struct PictureRun {
    FrameRange frames;
    std::size_t firstLayer = 0;
    std::size_t layerCount = 0;
    std::size_t unseenLayers = 0; ///< beyond PictureLine::MostLayers
    bool isStill = false;         ///< no layer moves, so that every frame shows the same
};

/// What a cut shows at each frame. Where no event stands it is black.
///
///     V2              |-- T --|
///     V1      |----- A -----|---- B ----|
///     runs    |   A   | A T |T B|   B   |
class PictureLine {
public:
    /// More layers at one frame are counted but not looked at.
    static constexpr std::size_t MostLayers = 64;

    /// Of the events that litFrames() counts.
    PictureLine(const EventList& events, PictureNames& names, const Framerate& framerate);

    /// Ascending, without overlaps; neighbours that touch differ.
    const std::vector<PictureRun>& runs() const { return m_runs; }
    std::span<const PictureLayer> layersOf(const PictureRun& run) const
    {
        return std::span(m_layers).subspan(run.firstLayer, run.layerCount);
    }
    /// The event that gives a run its name: the first one of the list.
    std::uint32_t eventOf(const PictureRun& run) const;

    /// Where there is a picture.
    const FrameRanges& lit() const { return m_lit; }

private:
    struct Edge {
        std::int32_t frame;
        bool isStart;
        PictureLayer layer;
    };

    static std::vector<Edge> edgesOf(const EventList& events, PictureNames& names, const Framerate& framerate);
    void addRuns(const std::vector<Edge>& edges);
    template <class Layers>
    void addRun(const FrameRange& frames, const Layers& layers);
    bool continuesLastRun(const PictureRun& run) const;

    std::vector<PictureRun> m_runs;
    std::vector<PictureLayer> m_layers;
    FrameRanges m_lit;
};

} // namespace cadrel::core
