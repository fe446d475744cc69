// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "standin/changes/ChangeLog.h"
#include "standin/file/ProjectFile.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "velmark/Counted.h"

#include <string>
#include <string_view>

namespace standin::tests {

/// The parts of a small session, each of which a test may set: 48,000 samples and 25 frames a second.
struct SessionText {
    std::string version = "7002";
    std::string sampleRate = "48000";
    std::string idCounter = "2000";
    std::string timecode = "timecode_25";
    std::string timecodeOffset = "0";
    std::string offsetIsNegative = "1";
    std::string sources = R"(<Source name="door.wav" type="audio" id="11" channel="0" origin=""/>)";
    std::string locations{};
    /// What the route "Dia" holds, and its playlist.
    std::string route{};
    std::string regions{};
    std::string tempos =
        R"(<Tempo npm="120" enpm="120" note-type="4" type="Tempo::Constant" sclock="0" quarters="0:0"/>)";
    std::string routes{};    ///< more of them
    std::string playlists{}; ///< more of them
    std::string extra{};     ///< at the end, an Extra element

    operator std::string() const
    {
        return R"(<?xml version="1.0" encoding="UTF-8"?>
<Session version=")" +
               version + R"(" name="reel" sample-rate=")" + sampleRate + R"(" id-counter=")" + idCounter + R"(">
  <Config>
    <Option name="timecode-format" value=")" +
               timecode + R"("/>
    <Option name="timecode-offset" value=")" +
               timecodeOffset + R"("/>
    <Option name="timecode-offset-negative" value=")" +
               offsetIsNegative + R"("/>
  </Config>
  <Sources>
    )" + sources +
               R"(
  </Sources>
  <Regions/>
  <Locations>)" +
               locations + R"(</Locations>
  <Routes>
    <Route id="21" name="Dia" default-type="audio" audio-playlist="31">
      )" + route +
               R"(
    </Route>)" +
               routes + R"(
  </Routes>
  <Playlists>
    <Playlist id="31" name="Dia" type="audio" orig-track-id="21" shared-with-ids="">
      )" + regions +
               R"(
    </Playlist>)" +
               playlists + R"(
  </Playlists>
  <TempoMap superclocks-per-second="282240000">
    <Tempos>
      )" + tempos +
               R"(
    </Tempos>
  </TempoMap>
)" + extra + R"(</Session>
)";
    }
};

/// A region of samples, of the source 11 unless it is another.
inline std::string region(int id, long position, long length, long start = 0, const std::string& content = "",
                          const std::string& attributes = "")
{
    const auto time = [](long samples) { return std::string("a").append(std::to_string(samples * 5880)); };
    return "<Region name=\"r" + std::to_string(id) + "\" start=\"" + time(start) + "\" length=\"" + time(length) + "@" +
           time(position) + "\" sync-position=\"" + time(start) +
           R"(" sync-marked="0" layering-index="0" default-fade-in="1" default-fade-out="1" fade-in-active="1" )"
           R"(fade-out-active="1" whole-file="0" )" +
           attributes + " id=\"" + std::to_string(id) + "\" type=\"audio\" source-0=\"11\">" + content + "</Region>";
}

/// An automation list with these points.
inline std::string list(const std::string& what, const std::string& style, const std::string& points,
                        const std::string& domain = "AudioTime")
{
    return "<Automation><AutomationList automation-id=\"" + what + "\" id=\"41\" interpolation-style=\"" + style +
           "\" time-domain=\"" + domain + "\" state=\"Play\"><events>" + points +
           "</events></AutomationList></Automation>";
}

/// The gain of the fader.
inline std::string gain(const std::string& points)
{
    return R"(<Processor id="40" name="Amp" type="amp">)" + list("gain", "Exponential", points) + "</Processor>";
}

inline std::string location(int id, const std::string& name, long start, long end, const std::string& flags)
{
    const auto time = [](long samples) { return std::string("a").append(std::to_string(samples * 5880)); };
    return "<Location id=\"" + std::to_string(id) + "\" name=\"" + name + "\" start=\"" + time(start) + "\" end=\"" +
           time(end) + "\" flags=\"" + flags + R"(" locked="0" timestamp="0" cue="0"/>)";
}

/// A project that was read from a session.
class SessionProject {
public:
    explicit SessionProject(const std::string& text) : project(ProjectFile::parse(text, "/film/reel.ardour", m_log)) {}

    Track& track(std::string_view name) const
    {
        for (Track* const candidate : project->allTracks()) {
            if (candidate->name() == std::u16string(name.begin(), name.end()))
                return *candidate;
        }
        throw std::runtime_error("no such track");
    }
    std::string text() const { return ProjectFile::toText(*project); }

private:
    ChangeLog m_log;

public:
    Velmark::Counted<Project> project;
};

/// What is said of a text that is no session; "none" for one that is.
inline std::string faultOf(const std::string& text)
{
    try {
        SessionProject read(text);
        return "none";
    } catch (const ProjectFileError& error) {
        return error.what();
    }
}

} // namespace standin::tests
