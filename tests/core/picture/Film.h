// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventList.h"
#include "core/picture/FrameRange.h"
#include "core/time/Framerate.h"

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

/// "100..110".
std::string lineOf(const core::FrameRange& range);
/// "100..110" for each.
std::vector<std::string> linesOf(const core::FrameRanges& ranges);

} // namespace cadrel::tests
