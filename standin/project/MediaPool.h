// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/MediaClip.h"

#include <map>
#include <span>
#include <utility>
#include <vector>

namespace standin {

/// The clips of a project, each under a number that stays its own.
class MediaPool : public Velmark::Implements<MediaPool, Velmark::FObject, Velmark::IMediaPool> {
public:
    static constexpr const char* ClassName = "MediaPool";

    /// `link` is that of its project.
    explicit MediaPool(Velmark::Counted<ProjectLink> link) : m_link(std::move(link)) {}
    ~MediaPool() override;

    Velmark::int32 count(const char* type) override;
    Velmark::IProjectNode* itemAt(Velmark::int32 index, const char* type) override;
    /// Answers the clip of that path. A video that isn't in the pool is brought in if the host opens videos.
    Velmark::FUnknown* import(Velmark::IFilePath* path) override;

    /// In the order of their numbers.
    const std::map<int, Velmark::Counted<MediaClip>>& clips() const { return m_clips; }
    /// Null when there is none.
    MediaClip* clipWith(int number) const;
    /// Gives the clip the next free number, or the one asked for, which must be free and above 0.
    void add(Velmark::Counted<MediaClip> clip, int number = 0);

    /// That of the project, by which the clips count their frames. 0 at first.
    void setFrameRate(double framesPerSecond);
    /// Where the project is stored, beside which its media may lie; empty at first.
    void setProjectFile(const std::u16string& path);
    /// Null at first. It outlives the pool, or is taken away before.
    void setVideoSupport(VideoSupport* videos) { m_videos = videos; }

private:
    Velmark::Counted<MediaClip> probe(const std::u16string& path) const;
    int freeNumber() const;
    /// The clips of the type word, in the order of their numbers.
    std::span<MediaClip* const> clipsOf(const char* type);

    Velmark::Counted<ProjectLink> m_link;
    double m_framesPerSecond = 0.0;
    std::u16string m_projectFile;
    VideoSupport* m_videos = nullptr;
    std::map<int, Velmark::Counted<MediaClip>> m_clips;
    // What clipsOf gives, so that a walk over a large pool by index takes no time.
    std::vector<MediaClip*> m_audio;
    std::vector<MediaClip*> m_video;
};

} // namespace standin
