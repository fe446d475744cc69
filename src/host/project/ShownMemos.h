// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"
#include "host/project/PlacedMemos.h"

#include <cstddef>
#include <memory>
#include <vector>

namespace cadrel::core {
class EventBase;
} // namespace cadrel::core

namespace cadrel::host {

/// What is shown in the preview stretch.
struct PreviewedEvents {
    using Events = std::vector<std::shared_ptr<core::EventBase>>;

    const Events& events;
    core::Framerate framerate; ///< of their timecodes
    double offset;             ///< how much later than its destination each one stands, in seconds
    double begin;              ///< of the host's timeline, before which nothing stands, on the project's clock
    double moved = 0.0;        ///< how far the time origin has moved since they were written, in seconds

    /// Of the preview stretch, in seconds of the project's clock. Memos that start before it are of the real programme.
    double start() const { return offset + moved; }
};

/// Where a previewed event, or what later ones have left of it, comes from and stands, in seconds of the project's clock.
struct PreviewStretch {
    core::SecondsRange source;
    core::SecondsRange preview;

    double clamped(double sourceTime) const;
    double toSource(double previewTime) const;
    /// Where the memo of a copy stands.
    core::SecondsRange toSource(const core::SecondsRange& copy) const;
    /// Whether the preview goes on where nothing is left of the source.
    bool isSlower() const;
};

/// A stretch with the copies that belong to it.
struct ShownStretch {
    std::shared_ptr<core::EventBase> event;
    std::size_t piece; ///< of what is left of the event
    PreviewStretch stretch;
    std::vector<PlacedMemo> copies;
};

/// The copies of memos in a preview. Each memo after the preview offset belongs to the first stretch in which most of it lies
/// or, where there is none, to the first into which it reaches.
struct ShownMemos {
    std::vector<ShownStretch> shown; ///< in the order of the events
    std::vector<PlacedMemo> adrift;  ///< in no stretch

    ShownMemos(const PlacedMemos& memos, const PreviewedEvents& previewed);
};

} // namespace cadrel::host
