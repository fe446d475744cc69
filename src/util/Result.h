// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include <cstdint>

namespace cadrel::util {

/// The system's error values. They are thrown by value as exceptions and are also the result codes of the operations
/// that end a user flow and of the file readers and writers.
struct Result {
    enum Type : std::int32_t {
        Ok = 0,
        Refused = 1,           ///< the operation would change nothing
        NotSupported = 2,      ///< no such operation for these arguments
        Cancelled = 3,         ///< the user cancelled
        HostObjectMissing = 4, ///< a host object or interface isn't there
        HostCallFailed = 5,    ///< a host call returned a failure
        NoProject = 6,         ///< no project attached
        NoTracks = 7,          ///< no track to work on
        NoTracksSelected = 8,  ///< only selected tracks are asked for, and none is selected
        ChangeEdlEmpty = 10,   ///< the change EDL has no events
        FileAccessFailed = 11, ///< a file can't be opened, read or written
        ChecksumMismatch = 12, ///< stored data whose checksum doesn't fit
        CorruptData = 13,      ///< persisted data that can't be right
        EndOfData = 14,        ///< a read past the end of an archive
        UnknownVersion = 15,   ///< a persisted older version that isn't handled
        NewerVersion = 16,     ///< a persisted version newer than the code
        InvalidArgument = 17,  ///< bad text, index or range
        NotAvailable = 18,     ///< a global service isn't installed; a list is empty where it mustn't be
        OutOfRange = 19,       ///< a timecode or index beyond its bounds
        FrameOutOfRate = 20,   ///< a frame number greater than the rate
        PositionOccupied = 21, ///< a video already starts at that position
    };
};

} // namespace cadrel::util
