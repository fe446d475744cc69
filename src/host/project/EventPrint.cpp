// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/EventPrint.h"

#include "core/serialize/ByteArchive.h"
#include "core/time/SecondsRange.h"
#include "host/border/NodeReading.h"
#include "velmark/Events.h"
#include "velmark/Media.h"
#include "velmark/ProjectNode.h"

#include <array>
#include <cmath>
#include <string>
#include <string_view>

using namespace Velmark;
using cadrel::core::serialize::ByteArchive;

namespace cadrel::host {

namespace {

void addText(ByteArchive& bytes, const std::wstring& text)
{
    for (const wchar_t character : text)
        bytes << static_cast<std::uint32_t>(character);
}

/// Of an event without a file nothing is added.
void addFile(ByteArchive& bytes, IProjectNode& event)
{
    const auto clipEvent = query<IClipEvent>(&event);
    IMediaClip* const clip = clipEvent ? clipEvent->getClip() : nullptr;
    IFilePath* const file = clip ? clip->getFile() : nullptr;
    if (!file)
        return;
    std::array<char16_t, IFilePath::Capacity> path{};
    bytes << std::uint8_t{1};
    // One may be longer than can be given.
    if (file->getPath(path.data()) != ResultOk)
        return;
    for (const char16_t unit : std::u16string_view(path.data()))
        bytes << static_cast<std::uint32_t>(unit);
}

void addInstant(ByteArchive& bytes, double seconds)
{
    bytes << static_cast<double>(toInstant(seconds));
}

void addPlace(ByteArchive& bytes, IProjectNode& event)
{
    addInstant(bytes, event.getStart(nullptr));
    addInstant(bytes, event.getEnd(nullptr));
    addInstant(bytes, event.getSourceOffset(nullptr));
}

void addContent(ByteArchive& bytes, IProjectNode& event)
{
    addText(bytes, nameOf(event));
    addFile(bytes, event);
    if (!event.isType(TypeWord::Part))
        return;
    for (const Counted<IProjectNode>& child : childrenOf(event)) {
        bytes << std::uint8_t{2};
        addPlace(bytes, *child);
        addContent(bytes, *child);
    }
    bytes << std::uint8_t{3};
}

std::uint32_t printOf(const ByteArchive& bytes)
{
    return bytes.crc32() >> 3;
}

} // namespace

std::uint32_t namePrintOf(IProjectNode& event)
{
    ByteArchive bytes;
    addText(bytes, nameOf(event));
    return printOf(bytes);
}

std::uint32_t contentPrintOf(IProjectNode& event)
{
    ByteArchive bytes;
    addContent(bytes, event);
    return printOf(bytes);
}

std::uint32_t placePrintOf(IProjectNode& event)
{
    ByteArchive bytes;
    addPlace(bytes, event);
    return printOf(bytes);
}

std::int64_t toInstant(double seconds)
{
    return std::llround(seconds / core::SameInstant);
}

} // namespace cadrel::host
