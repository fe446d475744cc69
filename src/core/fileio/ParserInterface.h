// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/fileio/FileRemarks.h"
#include "core/fileio/SourceLine.h"
#include "core/time/Framerate.h"
#include "util/Result.h"

#include <optional>
#include <string>
#include <string_view>

namespace cadrel::core {
class EventList;
}

namespace cadrel::core::fileio {

/// Reads event lists of one file format. A new format is a class of this kind, and a line in ParserChoice.cpp.
class ParserInterface {
public:
    virtual ~ParserInterface() = default;

    /// Appends the file's events to `events` in file order and puts the rate that the file shows into `framerate`.
    /// With `acceptAudio`, events of audio channels are taken without a flaw. Returns Ok, FileAccessFailed for what
    /// can't be read to its end, with `events` and `framerate` unchanged, or what the conversion of the path throws.
    virtual util::Result::Type parse(const std::wstring& path, EventList& events, Framerate& framerate,
                                     bool acceptAudio) = 0;

    /// Reads the file for its rate alone: `framerate` becomes what `parse` would give. Returns as `parse`.
    virtual util::Result::Type detect(const std::wstring& path, Framerate& framerate) = 0;

    /// Whether a file that begins so is of this format. `beginning` is all of a short file, and empty for a file that
    /// can't be read.
    virtual bool recognises(std::string_view beginning) const = 0;

    /// The line that says which rate the file has that was read last; nothing where its timecodes alone show it.
    virtual std::optional<SourceLine> rateLine() const = 0;

    /// From now on, what the letter of the format passes over is read too where its meaning is plain, such as tabs between
    /// columns, and the remarks are collected.
    virtual void readThoroughly() = 0;

    /// Of the last file that was parsed; empty before readThoroughly().
    virtual const FileRemarks& remarks() const = 0;

    /// Without audio, and without returning the rate.
    util::Result::Type parse(const std::wstring& path, EventList& events)
    {
        Framerate scratch;
        return parse(path, events, scratch, false);
    }
};

} // namespace cadrel::core::fileio
