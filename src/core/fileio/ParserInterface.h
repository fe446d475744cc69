// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/time/Framerate.h"
#include "util/Result.h"

#include <string>

namespace cadrel::core {
class EventList;
}

namespace cadrel::core::fileio {

/// Reads an event list from a file.
class ParserInterface {
public:
    virtual ~ParserInterface() = default;

    /// Appends the file's events to `events` in file order and puts the rate that the file shows into `framerate`.
    /// With `acceptAudio`, events of audio channels are taken without a flaw. Returns Ok, FileAccessFailed for what
    /// can't be read to its end, with `events` and `framerate` unchanged, or what the conversion of the path throws.
    virtual util::Result::Type parse(const std::wstring& path, EventList& events, Framerate& framerate,
                                     bool acceptAudio) = 0;

    /// Without audio, and without returning the rate.
    util::Result::Type parse(const std::wstring& path, EventList& events)
    {
        Framerate scratch;
        return parse(path, events, scratch, false);
    }
};

} // namespace cadrel::core::fileio
