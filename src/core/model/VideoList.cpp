// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/VideoList.h"

#include "core/notify/ChangeContext.h"
#include "core/serialize/ByteArchive.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <iterator>
#include <utility>

namespace cadrel::core {

using serialize::ByteArchive;
using util::Result;
using util::StringUtil;

namespace {

constexpr std::uint32_t PersistenceVersion = 0;

std::wstring fileNameOf(const std::string& path)
{
    return StringUtil::fileNameOf(StringUtil::toWide(path));
}

/// A stored path may not be valid text. It has no file name then, and is found only by the whole path.
bool isSameFile(const std::string& stored, const std::string& path)
{
    try {
        return stored == path || fileNameOf(stored) == fileNameOf(path);
    } catch (Result::Type failure) {
        if (failure != Result::InvalidArgument)
            throw;
        return false;
    }
}

} // namespace

VideoList::Entry::Entry() : Serializable(PersistenceVersion) {}

VideoList::Entry::Entry(std::string filePath, const Timecode& startsAt, const Timecode& lasts)
    : Serializable(PersistenceVersion), path(std::move(filePath)), start(startsAt), length(lasts)
{
}

std::wstring VideoList::Entry::fileName() const
{
    return fileNameOf(path);
}

bool VideoList::Entry::operator==(const Entry& other) const
{
    return start == other.start && length == other.length && isSameFile(path, other.path);
}

void VideoList::Entry::readCurrent(ByteArchive& archive)
{
    archive >> path >> start >> length;
}

void VideoList::Entry::write(ByteArchive& archive) const
{
    archive << path << start << length;
}

VideoList::VideoList() : Serializable(PersistenceVersion) {}

VideoList& VideoList::operator=(const VideoList& other)
{
    if (std::equal(m_entries.begin(), m_entries.end(), other.m_entries.begin(), other.m_entries.end()))
        return *this;
    m_entries = other.m_entries;
    notifyListeners();
    return *this;
}

const VideoList::Entry& VideoList::at(std::size_t index) const
{
    if (index >= m_entries.size())
        throw Result::InvalidArgument;
    return *std::next(m_entries.begin(), static_cast<std::ptrdiff_t>(index));
}

bool VideoList::containsFile(const std::string& path) const
{
    return find(path) != m_entries.end();
}

bool VideoList::contains(const Entry& entry) const
{
    return containsFile(entry.path);
}

std::set<VideoList::Entry, std::less<>>::const_iterator VideoList::find(const std::string& path) const
{
    const auto samePath =
        std::find_if(m_entries.begin(), m_entries.end(), [&](const Entry& entry) { return entry.path == path; });
    if (samePath != m_entries.end())
        return samePath;
    fileNameOf(path); // throws for a path that can't be looked for
    return std::find_if(m_entries.begin(), m_entries.end(),
                        [&](const Entry& entry) { return isSameFile(entry.path, path); });
}

Result::Type VideoList::checkAdd(const Entry& entry) const
{
    const Framerate framerate = Timecode::framerate();
    if (m_entries.contains(entry))
        return Result::PositionOccupied;
    const std::int32_t framesToDaysEnd =
        Timecode::maxTimecode().toFrameCount(framerate) - entry.start.toFrameCount(framerate);
    return entry.length.toFrameCount(framerate) > framesToDaysEnd ? Result::FrameOutOfRate : Result::Ok;
}

Result::Type VideoList::add(const Entry& entry, bool replaceAtStart)
{
    if (contains(entry))
        return Result::Refused;
    const auto occupant = m_entries.find(entry);
    if (occupant != m_entries.end()) {
        if (!replaceAtStart)
            return Result::Refused;
        m_entries.erase(occupant);
    }
    m_entries.insert(entry);
    notifyListeners();
    return Result::Ok;
}

Result::Type VideoList::remove(const std::string& path)
{
    const auto found = find(path);
    if (found == m_entries.end())
        return Result::Refused;
    m_entries.erase(found);
    notifyListeners();
    return Result::Ok;
}

void VideoList::setStart(const std::string& path, const Timecode& start)
{
    const auto found = find(path);
    if (found == m_entries.end())
        return;
    auto moved = m_entries.extract(found);
    moved.value().start = start;
    // An entry that is already there would keep the moved entry out of the set.
    m_entries.erase(moved.value());
    m_entries.insert(std::move(moved));
    notifyListeners();
}

void VideoList::clear()
{
    m_entries.clear();
    notifyListeners();
}

VideoList::Entry VideoList::entryAt(const Timecode& timecode) const
{
    const auto later = m_entries.upper_bound(Entry({}, timecode, {}));
    return later == m_entries.begin() ? Entry() : *std::prev(later);
}

void VideoList::readCurrent(ByteArchive& archive)
{
    m_entries.clear();
    for (std::size_t left = archive.readCount(); left > 0; --left) {
        Entry entry;
        archive >> entry;
        m_entries.insert(m_entries.end(), std::move(entry));
    }
    notifyListeners();
}

void VideoList::write(ByteArchive& archive) const
{
    archive.writeCount(m_entries.size());
    for (const Entry& entry : m_entries)
        archive << entry;
}

void VideoList::notifyListeners()
{
    notify(ChangeContext(ChangeContext::VideoListChanged));
}

} // namespace cadrel::core
