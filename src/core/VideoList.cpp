#include "core/VideoList.h"

#include "core/ChangeContext.h"
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

/// A stored path may be no text; it has no file name then and is found by the whole path alone.
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
    if (std::equal(entries_.begin(), entries_.end(), other.entries_.begin(), other.entries_.end()))
        return *this;
    entries_ = other.entries_;
    notifyListeners();
    return *this;
}

const VideoList::Entry& VideoList::at(std::size_t index) const
{
    if (index >= entries_.size())
        throw Result::InvalidArgument;
    return *std::next(entries_.begin(), static_cast<std::ptrdiff_t>(index));
}

bool VideoList::containsFile(const std::string& path) const
{
    return find(path) != entries_.end();
}

bool VideoList::contains(const Entry& entry) const
{
    return containsFile(entry.path);
}

std::set<VideoList::Entry, std::less<>>::const_iterator VideoList::find(const std::string& path) const
{
    const auto samePath =
        std::find_if(entries_.begin(), entries_.end(), [&](const Entry& entry) { return entry.path == path; });
    if (samePath != entries_.end())
        return samePath;
    fileNameOf(path); // throws for a path that can't be looked for
    return std::find_if(entries_.begin(), entries_.end(),
                        [&](const Entry& entry) { return isSameFile(entry.path, path); });
}

Result::Type VideoList::checkAdd(const Entry& entry) const
{
    const Framerate framerate = Timecode::framerate();
    if (entries_.contains(entry))
        return Result::PositionOccupied;
    const std::int32_t framesToDaysEnd =
        Timecode::maxTimecode().toFrameCount(framerate) - entry.start.toFrameCount(framerate);
    return entry.length.toFrameCount(framerate) > framesToDaysEnd ? Result::FrameOutOfRate : Result::Ok;
}

Result::Type VideoList::add(const Entry& entry, bool replaceAtStart)
{
    if (contains(entry))
        return Result::Refused;
    const auto occupant = entries_.find(entry);
    if (occupant != entries_.end()) {
        if (!replaceAtStart)
            return Result::Refused;
        entries_.erase(occupant);
    }
    entries_.insert(entry);
    notifyListeners();
    return Result::Ok;
}

Result::Type VideoList::remove(const std::string& path)
{
    const auto found = find(path);
    if (found == entries_.end())
        return Result::Refused;
    entries_.erase(found);
    notifyListeners();
    return Result::Ok;
}

void VideoList::setStart(const std::string& path, const Timecode& start)
{
    const auto found = find(path);
    if (found == entries_.end())
        return;
    auto moved = entries_.extract(found);
    moved.value().start = start;
    // Whatever stands there would keep the moved entry out of the set.
    entries_.erase(moved.value());
    entries_.insert(std::move(moved));
    notifyListeners();
}

void VideoList::clear()
{
    entries_.clear();
    notifyListeners();
}

VideoList::Entry VideoList::entryAt(const Timecode& timecode) const
{
    const auto later = entries_.upper_bound(Entry({}, timecode, {}));
    return later == entries_.begin() ? Entry() : *std::prev(later);
}

void VideoList::readCurrent(ByteArchive& archive)
{
    entries_.clear();
    for (std::size_t left = archive.readCount(); left > 0; --left) {
        Entry entry;
        archive >> entry;
        entries_.insert(entries_.end(), std::move(entry));
    }
    notifyListeners();
}

void VideoList::write(ByteArchive& archive) const
{
    archive.writeCount(entries_.size());
    for (const Entry& entry : entries_)
        archive << entry;
}

void VideoList::notifyListeners()
{
    notify(ChangeContext(ChangeContext::VideoListChanged));
}

} // namespace cadrel::core
