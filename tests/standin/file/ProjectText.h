// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/Project.h"
#include "velmark/Counted.h"

#include <string>
#include <string_view>

namespace standin::tests {

/// The text of a small project with two clips in its pool and, among its own, these members.
inline std::string projectWith(const std::string& members)
{
    return R"({"format": "stage", "version": 1, "framesPerSecond": 24, "pool": [)"
           R"({"number": 1, "kind": "audio", "name": "door", "path": "/fx/door.wav", "length": 2},)"
           R"({"number": 7, "kind": "video", "name": "reel 3", "path": "/pix/reel3.mov", "length": 600}],)" +
           members + "}";
}

/// One with a track of the kind, which has these members.
inline std::string projectWithTrack(const std::string& kind, const std::string& members)
{
    return projectWith(R"("tracks": [{"kind": ")" + kind + "\", " + members + "}]");
}

/// One with an audio track, or a track of another kind, that has this event.
inline std::string projectWithEvent(const std::string& event, const std::string& kind = "audio")
{
    return projectWithTrack(kind, R"("events": [)" + event + "]");
}

/// Projects that are read from a text, and that leave nothing open behind them.
class ProjectTexts {
public:
    Velmark::Counted<Project> parse(std::string_view text) { return ProjectFile::parse(text, "reel.stage", m_log); }
    /// The text of the project that is read from a text.
    std::string textAgain(std::string_view text) { return ProjectFile::toText(*parse(text)); }
    /// What is said of a text that is no project; "none" for one that is.
    std::string faultOf(std::string_view text)
    {
        try {
            parse(text);
            return "none";
        } catch (const ProjectFileError& error) {
            return error.what();
        }
    }
    ChangeLog& log() { return m_log; }

private:
    ChangeLog m_log;
};

} // namespace standin::tests
