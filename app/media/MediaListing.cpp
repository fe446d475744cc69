// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/media/MediaListing.h"

#include "app/console/Printable.h"
#include "app/console/Terminal.h"
#include "app/console/Wording.h"
#include "app/project/ProjectContent.h"
#include "standin/base/Utf16.h"
#include "standin/project/Project.h"
#include "standin/video/MediaPlaces.h"
#include "standin/video/SoundFile.h"
#include "standin/video/VideoFile.h"

#include <array>
#include <chrono>
#include <cstdio>
#include <ostream>

namespace cadrel::app {

using standin::MediaClip;
using standin::VideoError;

namespace {

constexpr std::chrono::seconds MostTimeForAFile{10};

/// "24 fps", "23.976 fps".
std::string rateText(double framesPerSecond)
{
    std::array<char, 32> text{};
    std::snprintf(text.data(), text.size(), "%.6g fps", framesPerSecond);
    return text.data();
}

std::string printable(const std::filesystem::path& path)
{
    return toPrintable(path.string()).text;
}

} // namespace

MediaListing::MediaListing(const standin::Project& project, const ProjectClock& clock, Terminal& terminal)
    : m_project(project), m_clock(clock)
{
    for (const auto& [number, clip] : project.pool().clips()) {
        terminal.showProgress("opening " + toPrintable(standin::toUtf8(clip->path())).text);
        const Found found = look(*clip);
        m_missing += found.isMissing ? 1 : 0;
        m_unusable += found.isMissing || found.isUsable ? 0 : 1;
        m_rows.push_back({printableName(clip->name()),
                          clip->kind() == MediaClip::Kind::Video ? Velmark::TypeWord::Video : Velmark::TypeWord::Audio,
                          m_clock.exactLength(clip->seconds()), found.length, found.rate, found.file});
    }
    terminal.clearProgress();
}

void MediaListing::print(std::ostream& out) const
{
    out << "Media   " << counted(m_rows.size(), "clip") << ": " << m_missing << " missing, " << m_unusable
        << " that can't be used\n";
    if (m_rows.empty())
        return;
    Columns columns({"clip", "kind", "in the project", "length", "rate", "file"});
    for (const Columns::Row& row : m_rows)
        columns.measure(row);
    out << '\n' << columns.titleLine() << '\n';
    for (const Columns::Row& row : m_rows)
        out << columns.lineOf(row) << '\n';
}

MediaListing::Found MediaListing::look(const MediaClip& clip) const
{
    Found found;
    const auto places = standin::placesOf({clip.path(), m_project.path()});
    try {
        const std::filesystem::path file = standin::findMedia(places);
        found.file = printable(file);
        open(clip, file, found);
        found.isUsable = true;
    } catch (const VideoError& error) {
        found.isMissing = error.reason() == VideoError::Reason::Missing;
        if (found.isMissing) {
            std::vector<std::string> looked;
            for (const auto& place : places)
                looked.push_back(printable(place));
            found.file.append("missing, looked for ").append(joined(looked));
        } else {
            found.file.append(": ").append(error.what());
        }
    }
    return found;
}

void MediaListing::open(const MediaClip& clip, const std::filesystem::path& file, Found& found) const
{
    const standin::Deadline deadline = std::chrono::steady_clock::now() + MostTimeForAFile;
    if (clip.kind() == MediaClip::Kind::Audio) {
        const auto sound = standin::SoundFile::read(file, deadline);
        found.rate = std::to_string(sound.samplesPerSecond).append(" Hz");
        found.length = m_clock.exactLength(sound.seconds);
        return;
    }
    const standin::VideoFile video(file, deadline);
    const double framesPerSecond = m_project.frameRate().framesPerSecond;
    found.rate = rateText(video.rate().value());
    found.length = m_clock.exactLength(video.frameCount(standin::exactRate(framesPerSecond)) / framesPerSecond);
}

} // namespace cadrel::app
