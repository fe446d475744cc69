// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>
#include <deque>
#include <optional>

namespace standin {

/// At which times the pictures of a video aren't what they should be, while it is decoded. Pictures are made of others, so that
/// damage goes on up to the next key picture:
///
///     fed           key 0    3  1  2    6  4  5    key 9   7  8    12 10 11
///     damaged                           ^
///     wrong                             4  5  6    7  8
class DamagedTimes {
public:
    /// The decoder gets a picture that is shown at that time.
    void feed(std::int64_t ticks, bool isKey);
    /// The picture of that time can't be decoded, or not in whole. It is the last one that was fed, or comes before.
    void note(std::int64_t ticks);

    bool isAt(std::int64_t ticks) const;
    /// The first time after `before` and before `after` at which damage begins.
    std::optional<std::int64_t> firstBetween(std::int64_t before, std::int64_t after) const;

private:
    struct Stretch {
        std::int64_t from = 0;
        std::optional<std::int64_t> until; ///< the time of the next key picture; nothing before it has come
    };

    std::deque<std::int64_t> m_keys; ///< the last ones, as they were fed
    std::deque<Stretch> m_stretches;
};

} // namespace standin
