// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace cadrel::gui {

/// Which of the project's video tracks carries which picture version. There are two channels, each with one video track or
/// none. The operations with a channel throw Result::InvalidArgument for one that isn't there.
class VideoTrackHandlerBase {
public:
    /// What a channel's track carries.
    struct Mode {
        static constexpr std::int32_t None = -1;  ///< there is no track, or nobody has said what it carries
        static constexpr std::int32_t Old = 0;    ///< the old picture
        static constexpr std::int32_t New = 1;    ///< the new picture
        static constexpr std::int32_t OldOff = 2; ///< stands for the old picture, but the user has put another there
        static constexpr std::int32_t NewOff = 3; ///< likewise for the new one
    };

    class Listener {
    public:
        virtual ~Listener() = default;

        /// The tracks, or what they carry, have changed.
        virtual void tracksChanged() = 0;
    };

    virtual ~VideoTrackHandlerBase() = default;

    virtual bool isAvailable(std::size_t channel) = 0;
    virtual std::wstring getName(std::size_t channel) = 0;
    virtual std::int32_t getMode(std::size_t channel) = 0;
    /// Old and New give the other channel's track the other version. Throws Result::InvalidArgument for any other number
    /// than the modes of a track.
    virtual void setMode(std::size_t channel, std::int32_t mode) = 0;
    /// Listeners are not owned.
    virtual void addListener(Listener* listener) = 0;
    virtual void removeListener(Listener* listener) = 0;
    virtual std::size_t channelCount() const = 0;
};

} // namespace cadrel::gui
