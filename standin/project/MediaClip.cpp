// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/project/MediaClip.h"

#include <algorithm>
#include <cmath>
#include <limits>
#include <utility>

using namespace Velmark;

namespace standin {

namespace {

/// Without folder and extension.
std::u16string nameOfFile(std::u16string_view path)
{
    path.remove_prefix(path.find_last_of(u"/\\") + 1); // npos + 1 is 0
    const std::size_t dot = path.rfind(u'.');
    return std::u16string(dot == 0 ? path : path.substr(0, dot));
}

} // namespace

MediaClip::MediaClip(Kind kind, std::u16string path, double length) : m_kind(kind), m_path(std::move(path))
{
    setSpan(0.0, length);
    Node::setName(nameOfFile(m_path));
}

bool MediaClip::isType(const char* word)
{
    return word && std::string_view(word) == (m_kind == Kind::Audio ? TypeWord::Audio : TypeWord::Video);
}

uint32 MediaClip::getFrameCount()
{
    if (!link())
        return 0;
    constexpr double Most = std::numeric_limits<uint32>::max();
    return static_cast<uint32>(std::min(std::round(seconds() * m_framesPerSecond), Most));
}

IFilePath* MediaClip::getFile()
{
    // What a caller does to the object mustn't change the clip.
    if (!m_file || m_file->path() != m_path)
        m_file = makeCounted<FilePath>(m_path);
    return m_file.get();
}

void MediaClip::setPath(std::u16string path)
{
    m_path = std::move(path);
    markContentChanged();
}

void MediaClip::setFileRate(double framesPerSecond)
{
    m_fileRate = framesPerSecond;
    markContentChanged();
}

MediaClip::Caption MediaClip::caption() const
{
    const std::lock_guard lock(m_captionMutex);
    return m_caption;
}

void MediaClip::updateCaption()
{
    Caption caption{name(), getFrameCount(), {m_path, m_projectFile}, m_framesPerSecond};
    const std::lock_guard lock(m_captionMutex);
    m_caption = std::move(caption);
}

ProjectLink* MediaClip::link() const
{
    return m_link && m_link->project() ? m_link.get() : nullptr;
}

void MediaClip::markContentChanged()
{
    updateCaption();
    Node::markContentChanged();
    if (ProjectLink* const link = this->link()) {
        link->changes().markPool();
        // Clips of the pool stay when what brought them is undone.
        link->countUnrecorded();
    }
}

} // namespace standin
