// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/EdlFile.h"

#include "core/edl/EventBase.h"
#include "core/fileio/ParserChoice.h"
#include "core/fileio/ParserInterface.h"
#include "core/time/Timecode.h"
#include "gui/files/UnreadText.h"
#include "util/FilePath.h"
#include "util/Result.h"
#include "util/StringUtil.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

namespace cadrel::gui {

using core::EventList;
using core::Framerate;
using core::ListKind;
using core::TransitionType;
using util::Result;
using util::StringUtil;

namespace fs = std::filesystem;

namespace {

/// The nominal rate at which there is drop-frame timecode.
constexpr std::int32_t DropFrameRate = 30;

/// Bytes. The list of a feature film has a hundredth of it.
constexpr std::uintmax_t LargestFile = std::uintmax_t{256} * 1024 * 1024;

void requireSize(const std::wstring& path)
{
    std::error_code error;
    const std::uintmax_t size = fs::file_size(util::toFilePath(path), error);
    if (!error && size > LargestFile)
        throw Result::FileAccessFailed;
}

} // namespace

EdlFile::EdlFile(const std::string& path, std::int32_t listKind, bool renameBRolls)
    : m_path(fs::path(path).lexically_normal().string()), m_listKind(listKind)
{
    const std::wstring widePath = StringUtil::toWide(m_path);
    requireSize(widePath);
    const auto parser = core::fileio::parserFor(widePath);
    parser->readThoroughly();
    m_events.load(widePath, m_shown, renameBRolls, listKind == ListKind::Change, *parser);
    m_remarks = parser->remarks();
}

std::wstring EdlFile::name() const
{
    return util::toShownLine(fs::path(m_path).filename().string());
}

bool EdlFile::hasOtherRate() const
{
    const Framerate project = core::Timecode::framerate();
    const bool isDropFrame = m_remarks.dropFrame == 1;
    if (project.framesPerSecond < std::max(m_shown.framesPerSecond, isDropFrame ? DropFrameRate : 0))
        return true;
    const bool saysDropFrame = m_remarks.dropFrame != -1 && project.dropFrame != -1;
    return project.framesPerSecond == DropFrameRate && saysDropFrame && m_remarks.dropFrame != project.dropFrame;
}

std::wstring EdlFile::unreadText(std::size_t mostLines) const
{
    return textOfUnread(m_remarks.unreadLines, mostLines);
}

EventList EdlFile::takeEvents() const
{
    if (m_listKind != ListKind::Change)
        return m_events;
    auto events = m_events.events();
    std::erase_if(events, [](const auto& event) { return event->transitionType() != TransitionType::Cut; });
    EventList cuts;
    cuts.append(std::move(events));
    return cuts;
}

} // namespace cadrel::gui
