// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/keep/KeepPlanner.h"
#include "core/time/Framerate.h"
#include "core/time/SecondsRange.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace cadrel::tests {

/// One frame a second, so that 60 seconds are 60 frames and a film can be written down by hand.
inline const core::Framerate FrameASecond(1, 0);

/// A cut that is put together shot by shot, all times in frames.
class Film {
public:
    /// Where the next shot goes.
    Film& at(std::int32_t frame);
    Film& black(std::int32_t length) { return at(m_cursor + length); }
    Film& shot(const std::string& roll, std::int32_t srcIn, std::int32_t length);
    Film& freeze(const std::string& roll, std::int32_t srcIn, std::int32_t length);
    /// A shot that takes `sourceLength` frames of its roll; negative for one that runs backwards.
    Film& retimed(const std::string& roll, std::int32_t srcIn, std::int32_t sourceLength, std::int32_t length);
    /// Makes the last shot one that the change EDL leaves out.
    Film& flawed();
    /// Another film behind this one, its frame `start` at the cursor.
    Film& append(const Film& other, std::int32_t start);

    std::int32_t cursor() const { return m_cursor; }
    core::FrameRange framesOf(std::size_t shot) const;
    /// Whether the shot runs at normal speed.
    bool isPlain(std::size_t shot) const;
    /// Needs a TestProject.
    core::EventList list() const;

    /// The film after one change. What stands behind it moves.
    Film withoutShot(std::size_t shot) const;
    Film withInsertBefore(std::size_t shot, const std::string& roll, std::int32_t length) const;
    Film trimmedAtHead(std::size_t shot, std::int32_t frames) const;
    Film trimmedAtTail(std::size_t shot, std::int32_t frames) const;

private:
    struct Shot {
        std::string roll;
        std::int32_t srcIn;
        std::int32_t sourceLength;
        std::int32_t dstIn;
        std::int32_t length;
        bool isFlawed;
    };

    void move(std::size_t firstShot, std::int32_t frames);

    std::vector<Shot> m_shots;
    std::int32_t m_cursor = 0;
};

/// What the generator and the healing make of two cuts; nothing where they fail.
core::EventList generatedChanges(const core::EventList& oldEvents, const core::EventList& newEvents,
                                 std::int32_t matchBy, std::int32_t healMode, const core::Framerate& framerate);

/// The plan for two films, with the change EDL that is generated of them.
core::KeepPlan planFor(const Film& oldFilm, const Film& newFilm, const std::vector<core::SecondsRange>& material = {},
                       bool isForced = false);

/// An event as "100..150 to 110..160: cut black", with the origins of its parts.
std::string lineOf(const core::KeptEvent& event);
std::vector<std::string> linesOf(const std::vector<core::KeptEvent>& events);
/// "100..110" for each.
std::vector<std::string> linesOf(const core::FrameRanges& ranges);
/// "100..110"; "none" for no run.
std::string hullOf(const core::KeepPlan& plan);

} // namespace cadrel::tests
