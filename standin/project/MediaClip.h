// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/base/FilePath.h"
#include "standin/project/Node.h"
#include "standin/project/VideoSupport.h"
#include "velmark/Media.h"

#include <mutex>

namespace standin {

/// A file of sound or of picture in the media pool.
class MediaClip : public Velmark::Implements<MediaClip, Node, Velmark::IMediaClip> {
public:
    static constexpr const char* ClassName = "MediaClip";

    enum class Kind { Audio, Video };

    /// `length` in seconds. Its name is the name of the file without folder and extension unless it is given another.
    MediaClip(Kind kind, std::u16string path, double length);

    bool isType(const char* word) override;
    Velmark::uint32 getFrameCount() override;
    Velmark::IFilePath* getFile() override;

    /// That of its pool; null when it is in none.
    ProjectLink* link() const override;
    Kind kind() const { return m_kind; }
    const std::u16string& path() const { return m_path; }
    /// When the project is stored in another folder.
    void setPath(std::u16string path);
    double seconds() const { return length(); }
    /// Of the file, in frames per second; 0 when it isn't known, as it is of sound.
    double fileRate() const { return m_fileRate; }
    void setFileRate(double framesPerSecond);
    /// What a picture of it takes.
    struct Caption {
        std::u16string name;
        Velmark::uint32 frameCount = 0;
        MediaReference file;
        double framesPerSecond = 0.0; ///< of the project
    };
    /// As of the last change. For any thread, unlike all else.
    Caption caption() const;
    /// The number of the clip in the project file; 0 for one that is in no pool yet.
    int number() const { return m_number; }

protected:
    void markContentChanged() override;

private:
    friend class MediaPool;

    void updateCaption();

    Kind m_kind;
    std::u16string m_path;
    Velmark::Counted<FilePath> m_file; ///< what was handed out
    int m_number = 0;
    Velmark::Counted<ProjectLink> m_link; ///< null when it is in no pool
    double m_framesPerSecond = 0.0;       ///< of the project, as its pool says
    std::u16string m_projectFile;         ///< likewise
    double m_fileRate = 0.0;
    mutable std::mutex m_captionMutex;
    Caption m_caption;
};

} // namespace standin
