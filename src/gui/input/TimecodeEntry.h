// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Timecode.h"

#include <array>
#include <cstddef>
#include <string>

namespace cadrel::gui {

/// The value of a timecode input, and how what is typed becomes the value. Everything is judged at the project's frame rate;
/// without one, what is typed is dropped.
class TimecodeEntry {
public:
    enum Field : std::size_t { Hours, Minutes, Seconds, Frames };
    static constexpr std::size_t FieldCount = 4;

    /// What the fields of the input hold.
    struct Texts {
        std::array<std::string, FieldCount> fields;
        std::string sign;

        bool operator==(const Texts&) const = default;
    };

    /// Starts at 00:00:00:00. Without `isSigned` the value is never negative.
    explicit TimecodeEntry(bool isSigned) : m_isSigned(isSigned) {}

    bool isSigned() const { return m_isSigned; }
    /// The last accepted value, without its sign.
    const core::Timecode& value() const { return m_value; }
    bool isPositive() const { return m_isPositive; }
    /// What the fields show for the value: two digits each, and "+" or "-".
    Texts texts() const;

    /// These change the value, and answer whether it is another one now. A value that the frame rate doesn't have is
    /// dropped. An uninitialised timecode is 00:00:00:00.
    bool set(const core::Timecode& timecode, bool isPositive);
    /// Empty texts read as 0, and an empty sign as "+".
    bool commit(const Texts& typed);
    /// One up or down, with carry into the other fields. Frame numbers that drop-frame leaves out are passed over. Stays
    /// within the day, and without a sign at or above zero.
    bool step(Field field, bool isUp);
    bool flipSign();

private:
    bool accept(const core::Timecode& timecode, bool isPositive);

    bool m_isSigned;
    bool m_isPositive = true;
    core::Timecode m_value{0, 0, 0, 0};
};

} // namespace cadrel::gui
