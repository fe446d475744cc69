// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/notify/ChangeContextNotificationBase.h"
#include "core/serialize/Serializable.h"
#include "core/time/Timecode.h"
#include "util/Result.h"

#include <cstddef>
#include <functional>
#include <set>
#include <string>

namespace cadrel::core {

/// The videos of the new edit version, by their starts on the timeline. No two start at the same time. A video is
/// identified by its file's name without the folder, which the string converter finds. Every changing operation sends a
/// plain ChangeContext of type VideoListChanged.
class VideoList : public serialize::Serializable, public ChangeContextNotificationBase {
public:
    class Entry : public serialize::Serializable {
    public:
        Entry();
        Entry(std::string path, const Timecode& start, const Timecode& length);

        std::wstring fileName() const;
        /// Equal start, equal length and the same file name; the folder doesn't count.
        bool operator==(const Entry& other) const;
        bool operator<(const Entry& other) const { return start < other.start; }

        void readCurrent(serialize::ByteArchive& archive) override;
        void write(serialize::ByteArchive& archive) const override;

        std::string path;
        Timecode start;
        Timecode length;
    };

    VideoList();
    /// A copy has no listeners.
    VideoList(const VideoList&) = default;
    /// Does nothing when the entries are equal; else copies them and notifies.
    VideoList& operator=(const VideoList& other);
    ~VideoList() override = default;

    bool isEmpty() const { return m_entries.empty(); }
    std::size_t size() const { return m_entries.size(); }
    /// In the order of the starts. Throws Result::InvalidArgument at or past the size.
    const Entry& at(std::size_t index) const;
    const std::set<Entry, std::less<>>& entries() const { return m_entries; }
    /// Whether an entry has this path or this file name.
    bool containsFile(const std::string& path) const;
    bool contains(const Entry& entry) const;
    /// The first entry that containsFile would match, or the end of `entries`.
    std::set<Entry, std::less<>>::const_iterator find(const std::string& path) const;
    /// PositionOccupied when a video starts there, FrameOutOfRate when it would end past the day, else Ok. Throws
    /// Result::NotAvailable without a FramerateProvider, and what Timecode::toFrameCount throws.
    util::Result::Type checkAdd(const Entry& entry) const;
    /// Refused when the file is listed, or when a video starts there and `replaceAtStart` is false.
    util::Result::Type add(const Entry& entry, bool replaceAtStart);
    /// Refused when the file isn't listed.
    util::Result::Type remove(const std::string& path);
    /// Does nothing and sends nothing when the file isn't listed. An entry that is at the new start is removed.
    void setStart(const std::string& path, const Timecode& start);
    /// Notifies also when the list was empty.
    void clear();
    /// The video on the screen at a time: the last that starts at or before it, whatever its length; a default Entry
    /// when there is none.
    Entry entryAt(const Timecode& timecode) const;

    void readCurrent(serialize::ByteArchive& archive) override;
    void write(serialize::ByteArchive& archive) const override;

private:
    void notifyListeners();

    std::set<Entry, std::less<>> m_entries;
};

} // namespace cadrel::core
