// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/guard/Guard.h"

#include "gui/services/AlertWindowBase.h"
#include "util/Result.h"

#include <new>

namespace cadrel::gui {

using util::Result;

namespace {

/// How many frames there are around the present call, and how many of them drop failures.
int frames = 0;
int droppingFrames = 0;
/// The first failure of the outermost frame.
std::wstring message;

std::wstring messageOf(Result::Type failure)
{
    switch (failure) {
    case Result::Cancelled:
    case Result::NoProject:
        return {};
    case Result::HostObjectMissing:
    case Result::HostCallFailed:
        return L"The workstation has refused this. Check that no track is locked.";
    case Result::FileAccessFailed:
        return L"The file can't be read or written. Check that it is there and that you are allowed to use it.";
    case Result::ChecksumMismatch:
    case Result::CorruptData:
    case Result::EndOfData:
    case Result::UnknownVersion:
    case Result::NewerVersion:
        return L"The data is damaged, or was written by another version of Cadrel.";
    case Result::OutOfRange:
    case Result::FrameOutOfRate:
        return L"A timecode would lie outside of the day, or doesn't exist at the frame rate of the project.";
    case Result::PositionOccupied:
        return L"Another video starts at this timecode.";
    default:
        return L"This could not be carried out.";
    }
}

void show(const std::wstring& text) noexcept
{
    try {
        AlertWindowBase::instance().show(text, {}, {}, {});
    } catch (...) {
        // Nobody is there to tell the user.
        return;
    }
}

} // namespace

std::wstring Guard::messageOfFailure()
{
    try {
        throw;
    } catch (Result::Type failure) {
        return messageOf(failure);
    } catch (const std::bad_alloc&) {
        return L"There is not enough memory for this.";
    } catch (...) {
        return messageOf(Result::InvalidArgument);
    }
}

void Guard::tell(const std::wstring& text)
{
    if (frames > 0 && droppingFrames == 0 && message.empty())
        message = text;
}

Guard::Frame::Frame(Cause cause) : m_cause(cause)
{
    ++frames;
    if (m_cause == Cause::System)
        ++droppingFrames;
}

Guard::Frame::~Frame()
{
    if (m_cause == Cause::System)
        --droppingFrames;
    if (--frames > 0 || message.empty())
        return;
    const std::wstring told = std::exchange(message, {});
    show(told);
}

void Guard::Frame::failed() const noexcept
{
    if (droppingFrames > 0 || !message.empty())
        return;
    try {
        message = messageOfFailure();
    } catch (...) {
        // Not even the message can be made.
        message.clear();
    }
}

} // namespace cadrel::gui
