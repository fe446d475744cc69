// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/video/VideoError.h"

namespace standin {

const char* VideoError::what() const noexcept
{
    switch (m_reason) {
    case Reason::Missing:
        return "The file is missing.";
    case Reason::NotOpened:
        return "The file can't be opened.";
    case Reason::Unreadable:
        return "The file has no picture or sound that can be read.";
    case Reason::NoPicture:
        return "The file has no picture.";
    case Reason::NoSound:
        return "The file has no sound.";
    case Reason::UnknownKind:
        return "The file's pictures are of a kind that can't be read.";
    case Reason::Broken:
        return "The file is broken here.";
    case Reason::TooLarge:
        return "The picture is too large.";
    case Reason::TooSlow:
        return "The picture takes too long to read.";
    case Reason::PastTheEnd:
        return "The file ends before this frame.";
    }
    return "";
}

} // namespace standin
