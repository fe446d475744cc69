// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/fileio/CmxWriter.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/time/Framerate.h"
#include "util/FilePath.h"
#include "util/FileReplacement.h"
#include "util/FileStamp.h"
#include "util/StringUtil.h"

#include <algorithm>
#include <deque>
#include <iomanip>
#include <memory>
#include <optional>
#include <span>
#include <sstream>

namespace cadrel::core::fileio {

using util::FileReplacement;
using util::Result;
using util::StringUtil;

namespace {

using Events = std::span<const std::shared_ptr<EventBase>>;
using Mode = CmxWriter::FrameCountMode;

constexpr std::size_t LongestTitle = 70;
constexpr std::size_t RollNameWidth = 8;

char transitionLetter(std::int32_t transitionType)
{
    switch (transitionType) {
    case TransitionType::Dissolve:
        return 'D';
    case TransitionType::Wipe:
        return 'W';
    default:
        return 'C';
    }
}

std::string textOf(const std::wstring& title, Events events, Mode mode)
{
    std::ostringstream text;
    text << "TITLE:   " << StringUtil::toPrintable(title).substr(0, LongestTitle) << '\n';
    if (mode == Mode::DropFrame)
        text << "FCM: DROP FRAME\n";
    for (std::size_t index = 0; index < events.size(); ++index) {
        const EventBase& event = *events[index];
        if (!event.isValid())
            continue;
        text << std::setfill('0') << std::setw(3) << index + 1 << "  " << std::left << std::setfill(' ')
             << std::setw(RollNameWidth) << CmxWriter::normalizedRollName(event.rollName()) << std::right << " V     "
             << transitionLetter(event.transitionType()) << "        " << event.srcIn().toString() << ' '
             << event.srcOut().toString() << ' ' << event.dstIn().toString() << ' ' << event.dstOut().toString()
             << '\n';
    }
    return std::move(text).str();
}

void writeFile(const std::wstring& path, Events events, Mode mode, FileReplacement& file)
{
    const std::wstring title = StringUtil::fileNameOf(path);
    if (title.empty())
        throw Result::NotAvailable;
    file.write(textOf(title, events, mode));
    file.finish();
}

/// The state in which targets have to be; nothing for any.
using Expected = std::optional<util::FileStamp>;

void writeOne(const std::wstring& path, Events events, Mode mode, const Expected& expected)
{
    FileReplacement file(util::toFilePath(path));
    writeFile(path, events, mode, file);
    file.commit(expected);
}

/// All files are written before the first one is put in place. If that fails for one of them, all are taken back.
void writeSeveral(const std::wstring& path, Events events, Mode mode, const Expected& expected)
{
    std::deque<FileReplacement> files;
    while (!events.empty()) {
        const Events part = events.first(std::min(events.size(), CmxWriter::MostEventsInAFile));
        const std::wstring partPath = StringUtil::withIndex(path, static_cast<int>(files.size() + 1));
        writeFile(partPath, part, mode, files.emplace_back(util::toFilePath(partPath)));
        events = events.subspan(part.size());
    }
    for (FileReplacement& file : files)
        file.putInPlace(expected);
    for (FileReplacement& file : files)
        file.keep();
}

bool isDigit(char character)
{
    return character >= '0' && character <= '9';
}

/// Copies the digits at the end of a name to the end of its first eight characters, with a "-" in front:
///
///     S H O T _ L O N G N A M E _ 1 2
///     S H O T _ - 1 2
///
/// The first four characters never count as ending digits. If the digits reach back to them, the "-" replaces the first
/// digit. Digits and a "-" that would come before the start of the name are dropped.
std::string keepEndingDigits(const std::string& name)
{
    constexpr std::ptrdiff_t FirstThatCounts = 4;
    std::string kept = name;
    auto from = static_cast<std::ptrdiff_t>(name.size()) - 1;
    auto to = static_cast<std::ptrdiff_t>(RollNameWidth) - 1;
    const auto put = [&](char character) {
        if (to >= 0)
            kept[static_cast<std::size_t>(to)] = character;
    };
    while (isDigit(name[static_cast<std::size_t>(from)])) {
        put(name[static_cast<std::size_t>(from)]);
        if (from == FirstThatCounts)
            break;
        --from;
        --to;
    }
    put('-');
    return kept;
}

bool isAllowedInRollName(char character)
{
    return isDigit(character) || (character >= 'A' && character <= 'Z') || character == '.' || character == '-' ||
           character == '_';
}

} // namespace

Result::Type CmxWriter::write(const std::wstring& path, const EventList& events)
try {
    if (events.isEmpty() || !events.hasReadableEvent())
        return Result::InvalidArgument;
    const Expected expected = m_existing == Existing::Kept ? Expected(util::FileStamp()) : std::nullopt;
    if (events.size() <= MostEventsInAFile)
        writeOne(path, events.events(), m_mode, expected);
    else
        writeSeveral(path, events.events(), m_mode, expected);
    return Result::Ok;
} catch (const FileReplacement::TargetChanged&) {
    return Result::Refused;
} catch (Result::Type failure) {
    return failure;
}

std::vector<std::wstring> CmxWriter::filesOf(const std::wstring& path, std::size_t eventCount)
{
    if (eventCount <= MostEventsInAFile)
        return {path};
    std::vector<std::wstring> files;
    for (std::size_t first = 0; first < eventCount; first += MostEventsInAFile)
        files.push_back(StringUtil::withIndex(path, static_cast<int>(files.size()) + 1));
    return files;
}

CmxWriter::FrameCountMode CmxWriter::modeFor(const Framerate& framerate)
{
    return framerate.dropFrame == 1 ? FrameCountMode::DropFrame : FrameCountMode::Unsaid;
}

std::string CmxWriter::normalizedRollName(const std::string& name)
{
    const bool endsInDigits = name.size() > RollNameWidth && isDigit(name.back());
    const bool losesDigits = endsInDigits && !std::all_of(name.begin(), name.end(), isDigit);
    std::string normalized = losesDigits ? keepEndingDigits(name) : name;
    normalized = StringUtil::toUpperAscii(normalized.substr(0, RollNameWidth));
    if (normalized.empty())
        return "UNKNOWN";
    std::replace_if(
        normalized.begin(), normalized.end(), [](char character) { return !isAllowedInRollName(character); }, '_');
    return normalized;
}

} // namespace cadrel::core::fileio
