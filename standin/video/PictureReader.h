// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/video/Av.h"
#include "standin/video/DamagedTimes.h"
#include "standin/video/FrameClock.h"
#include "standin/video/VideoError.h"

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <optional>

namespace standin {

/// Decodes the pictures of a video one after the other, from the start of the file or from a place that it was set to. Reads
/// files of this machine alone and decodes on the thread that calls. Everything may throw VideoError.
class PictureReader {
public:
    /// More pixels aren't decoded.
    static constexpr std::int64_t MostPixels = 8192 * 4608;

    /// Opens the file, which has to be a regular one.
    explicit PictureReader(const std::filesystem::path& file, Deadline deadline);
    PictureReader(const PictureReader&) = delete;
    PictureReader& operator=(const PictureReader&) = delete;

    /// All that takes longer ends as TooSlow.
    void setDeadline(Deadline deadline) { m_deadline = deadline; }
    /// Whether what comes next isn't known, after a failure; a `rewind` or a `seek` tells it again.
    bool hasLostItsPlace() const { return m_hasLostItsPlace; }

    /// Its time is what `timeOf` says. False at the end of the file. Where pictures can't be decoded, one that is damaged and has
    /// no pixels stands for them.
    bool next(AVFrame& picture);
    /// Whether parts of it had to be guessed, or may have been made of others that were guessed.
    static bool isDamaged(const AVFrame& picture);
    /// Sets it to a key picture that was stored at or before that time, as far as the file tells. The pictures that are shown
    /// before that key picture are left out, since they may need others that come before it. False when it can't be done.
    bool seek(std::int64_t ticks);
    /// Sets it to the start, and opens the file anew for it.
    void rewind();
    /// The end of the last picture, in ticks. Moves the place.
    std::int64_t findEnd();

    /// Until the next `seek` or `rewind`, pictures on which no other depends may be left out if they come before that time.
    void leaveOutBefore(std::int64_t ticks) { m_leaveOutBefore = ticks; }
    /// The last picture that was left out; nothing when none was.
    std::optional<std::int64_t> lastLeftOut() const { return m_lastLeftOut; }

    /// Whether the file tells that no key picture is stored after the first time up to the second.
    bool isWithoutKeyBetween(std::int64_t first, std::int64_t second) const;
    /// When it comes on the screen, and for how long it stands there, in ticks.
    static std::int64_t timeOf(const AVFrame& picture) { return picture.best_effort_timestamp; }
    std::int64_t durationOf(const AVFrame& picture) const;
    /// How long a picture stands that doesn't say so, in ticks.
    std::int64_t frameTicks() const { return m_frameTicks; }

    Ratio timeBase() const;
    Ratio rate() const { return m_rate; }
    AVStream& stream() const { return *m_stream; }

private:
    bool isLate() const { return std::chrono::steady_clock::now() >= m_deadline; }
    bool decodeNext(AVFrame& picture);
    std::optional<std::int64_t> holeBefore(std::int64_t ticks) const;
    void noteDamage(std::int64_t ticks);
    /// Gives the decoder what comes next, which may be the end.
    void feed();
    bool readPacket();
    bool isEntry(const AVPacket& packet);
    void decide(const AVPacket& packet);
    void restart();

    /// What the packets from here to the end of the file tell.
    struct Tail {
        std::optional<std::int64_t> end;
        bool hasUnknownTimes = false; ///< so that only decoding tells the end
    };
    std::int64_t toldLength() const;
    Tail readTail();
    std::optional<std::int64_t> decodeTail();

    std::filesystem::path m_file;
    Deadline m_deadline;
    AvOwner<AVFormatContext> m_format;
    AVStream* m_stream = nullptr;
    AvOwner<AVCodecContext> m_decoder;
    AvOwner<AVPacket> m_packet = owned(av_packet_alloc());
    Ratio m_rate;
    std::int64_t m_frameTicks = 1;
    bool m_hasLostItsPlace = false;
    bool m_isDrained = false;            ///< the end of the file has been told to the decoder
    bool m_waitsForKey = false;          ///< after a seek
    bool m_isAfterSeek = false;          ///< nothing has been read since
    bool m_hasTrueTimes = false;         ///< of what has been read since
    bool m_tellsPlaces = false;          ///< the file says where some of its packets are
    std::optional<std::int64_t> m_entry; ///< of the key picture at which it began after a seek
    std::optional<std::int64_t> m_leaveOutBefore;
    std::optional<std::int64_t> m_lastLeftOut;
    std::optional<std::int64_t> m_lastTime; ///< of the picture before
    AvOwner<AVFrame> m_heldBack;            ///< what comes after a hole; null when none does
    DamagedTimes m_damage;
    bool m_hasBegun = false; ///< a picture has come since the last seek
};

} // namespace standin
