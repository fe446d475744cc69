// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <chrono>
#include <exception>

namespace standin {

/// When work on a file has to be done.
using Deadline = std::chrono::steady_clock::time_point;

/// Why there is no picture.
class VideoError : public std::exception {
public:
    enum class Reason {
        Missing,     ///< there is no such file
        NotOpened,   ///< the system refuses it, or it is a folder, a pipe or a device
        Unreadable,  ///< its bytes aren't those of a film or of sound, or the table of what is in it is missing
        NoPicture,   ///< the file has none
        NoSound,     ///< likewise
        UnknownKind, ///< nothing here decodes its pictures
        Broken,      ///< this part of it can't be read
        TooLarge,    ///< the picture has more pixels than are read
        TooSlow,     ///< it wasn't there in time
        PastTheEnd,  ///< the file ends before the frame
    };

    explicit VideoError(Reason reason) : m_reason(reason) {}

    Reason reason() const { return m_reason; }
    /// A sentence for the user.
    const char* what() const noexcept override;

private:
    Reason m_reason;
};

} // namespace standin
