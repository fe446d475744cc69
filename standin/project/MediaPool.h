// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/project/MediaClip.h"

#include <map>
#include <span>
#include <vector>

namespace standin {

/// The clips of a project, each under a number that stays its own.
class MediaPool : public Velmark::Implements<MediaPool, Velmark::FObject, Velmark::IMediaPool> {
public:
    static constexpr const char* ClassName = "MediaPool";

    explicit MediaPool(Project& project) : m_project(&project) {}
    ~MediaPool() override;

    Velmark::int32 count(const char* type) override;
    Velmark::IProjectNode* itemAt(Velmark::int32 index, const char* type) override;
    /// Answers the clip of that path. One that isn't in the pool can't be brought in: this host reads no media.
    Velmark::FUnknown* import(Velmark::IFilePath* path) override;

    /// In the order of their numbers.
    const std::map<int, Velmark::Counted<MediaClip>>& clips() const { return m_clips; }
    /// Null when there is none.
    MediaClip* clipWith(int number) const;
    /// Gives the clip the next free number, or the one asked for, which must be free and above 0.
    void add(Velmark::Counted<MediaClip> clip, int number = 0);

    /// The clips last other numbers of frames from now on.
    void frameRateChanged();

    /// Null when the project has gone.
    Project* project() const { return m_project; }

private:
    friend class Project;

    int freeNumber() const;
    /// The clips of the type word, in the order of their numbers.
    std::span<MediaClip* const> clipsOf(const char* type);

    Project* m_project;
    std::map<int, Velmark::Counted<MediaClip>> m_clips;
    // What clipsOf gives, so that a walk over a large pool by index takes no time.
    std::vector<MediaClip*> m_audio;
    std::vector<MediaClip*> m_video;
};

} // namespace standin
