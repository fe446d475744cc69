// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ArdourReader.h"

#include "standin/ardour/ListText.h"
#include "standin/ardour/OwnStorage.h"
#include "standin/ardour/RegionFades.h"
#include "standin/ardour/RegionPiece.h"
#include "standin/base/Text.h"
#include "standin/base/Times.h"
#include "standin/base/Utf16.h"
#include "standin/project/AutomationPoint.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/FileFault.h"
#include "standin/project/Marker.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "standin/stage/ProjectReader.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <array>
#include <charconv>
#include <cmath>
#include <cstring>
#include <optional>
#include <system_error>

using Velmark::AttributeKey;
using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::makeCounted;

namespace standin {

namespace {

/// All that is in a text, but for the blanks between elements. What an entity stands for is read, but no entity that the
/// text itself declares.
constexpr unsigned int ParseAll = pugi::parse_cdata | pugi::parse_escapes | pugi::parse_eol | pugi::parse_doctype;
/// No session nests its elements deeper than a handful of levels.
constexpr int DeepestElement = 200;

/// The number by which Cadrel knows the track of the old picture.
constexpr Velmark::int64 OldVideo = 10;

/// The first of the curves that have no fixed number.
constexpr int FirstFreeCurve = 101;

struct FrameRate {
    std::string_view format;
    double framesPerSecond;
    unsigned int flags;
};

constexpr double PulledDown = 1000.0 / 1001.0;
constexpr std::array FrameRates{
    FrameRate{"timecode_23976", 24 * PulledDown, FrameRateInfo::Flag::PulledDown},
    FrameRate{"timecode_24", 24, 0},
    FrameRate{"timecode_24976", 25 * PulledDown, FrameRateInfo::Flag::PulledDown},
    FrameRate{"timecode_25", 25, 0},
    FrameRate{"timecode_2997", 30 * PulledDown, FrameRateInfo::Flag::PulledDown},
    FrameRate{"timecode_2997drop", 30 * PulledDown, FrameRateInfo::Flag::PulledDown | FrameRateInfo::Flag::DropFrame},
    FrameRate{"timecode_2997000", 29.97, 0},
    FrameRate{"timecode_2997000drop", 29.97, FrameRateInfo::Flag::DropFrame},
    FrameRate{"timecode_30", 30, 0},
    FrameRate{"timecode_30drop", 30, FrameRateInfo::Flag::DropFrame},
    FrameRate{"timecode_5994", 60 * PulledDown, FrameRateInfo::Flag::PulledDown},
    FrameRate{"timecode_60", 60, 0},
};

std::optional<SessionId> idIn(std::string_view text)
{
    SessionId id = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), id);
    if (error != std::errc() || end != text.data() + text.size() || id < 0)
        return std::nullopt;
    return id;
}

SessionId idOf(const pugi::xml_node& node)
{
    const std::optional<SessionId> id = idIn(node.attribute("id").value());
    if (!id)
        throw FileFault(quoted(node.name()), "has the id " + quoted(node.attribute("id").value()) + ", which is none");
    return *id;
}

std::u16string textOf(std::string_view text)
{
    if (!isWellFormed(text) || text.find('\0') != text.npos)
        throw FileFault("the session has a name that isn't UTF-8: " + quoted(text));
    return toUtf16(text);
}

/// Whether one of the words that are parted by commas is `flag`.
bool hasFlag(std::string_view flags, std::string_view flag)
{
    for (std::size_t begin = 0; begin <= flags.size();) {
        const std::size_t end = std::min(flags.find(',', begin), flags.size());
        if (flags.substr(begin, end - begin) == flag)
            return true;
        begin = end + 1;
    }
    return false;
}

void setId(Node& node, const char* key, SessionId id)
{
    node.setAttribute(key, Attribute{Velmark::int64{id}, true});
}

/// The name of a marker without that of its track.
std::u16string markerName(std::string_view location, const Track& track)
{
    const std::u16string name = textOf(location);
    if (name == track.name())
        return std::u16string();
    const std::u16string kind = track.name() + u": ";
    return name.starts_with(kind) ? name.substr(kind.size()) : name;
}

bool hasPoints(const Track& track)
{
    return std::ranges::any_of(track.curves(), [](const auto& curve) { return curve.second->firstChild() != nullptr; });
}

/// A VCA has a number of its own in place of an id.
SessionId vcaKey(SessionId number)
{
    return -number;
}

class IdCollector : public pugi::xml_tree_walker {
public:
    bool for_each(pugi::xml_node& node) override
    {
        if (depth() > DeepestElement)
            throw FileFault("the session nests its elements too deep");
        const pugi::xml_attribute attribute = node.attribute("id");
        if (attribute)
            largest = std::max(largest, idIn(attribute.value()).value_or(0));
        return true;
    }

    SessionId largest = 0;
};

} // namespace

ArdourReader::ArdourReader(std::string text, const std::filesystem::path& file) : m_file(file)
{
    m_session.text = std::move(text);
    requireUtf8();
    const pugi::xml_parse_result result =
        m_document.load_buffer(m_session.text.data(), m_session.text.size(), ParseAll, pugi::encoding_utf8);
    if (!result) {
        const auto offset = std::clamp<std::ptrdiff_t>(result.offset, 0, std::ssize(m_session.text));
        const auto line = std::count(m_session.text.begin(), m_session.text.begin() + offset, '\n') + 1;
        throw FileFault("line " + std::to_string(line), "isn't XML: " + std::string(result.description()));
    }
    m_root = m_document.document_element();
    for (const pugi::xml_node& node : m_document.children()) {
        if (node.type() == pugi::node_doctype)
            throw FileFault("the file declares a document type, which no session does");
        if (node.type() == pugi::node_element && node != m_root)
            throw FileFault("the file goes on after the end of the session");
    }
    if (std::strcmp(m_root.name(), "Session") != 0)
        throw FileFault("is XML, but no session of Ardour");
    const int version = m_root.attribute("version").as_int();
    if (version > NewestVersion) {
        throw FileFault("version",
                        "is " + std::to_string(version) + ": written by a newer Ardour than 7, which can't be read yet")
            .withRemedy("take a copy that Ardour 7 has saved");
    }
    if (version < OldestVersion) {
        throw FileFault("version", "is " + quoted(m_root.attribute("version").value()) + ": older than Ardour 6")
            .withRemedy("open the session in Ardour 7 and save it there");
    }
    m_session.clock = SessionClock(m_root);
    m_session.element = rangeOf(m_root);
}

void ArdourReader::requireUtf8() const
{
    const std::string_view text = m_session.text;
    const auto refuse = [](std::string_view encoding) {
        throw FileFault("the file is " + quoted(encoding) + ", but Ardour writes UTF-8")
            .withRemedy("convert it to UTF-8, or take the file that Ardour has saved");
    };
    if (text.starts_with("\xFF\xFE") || text.starts_with("\xFE\xFF"))
        refuse("UTF-16");
    pugi::xml_document declared;
    const std::size_t begin = text.find("<?xml");
    const std::size_t end = text.find("?>", begin);
    if (begin == text.npos || end == text.npos || text.find('<') != begin ||
        !declared.load_buffer(&text[begin], end + 2 - begin, pugi::parse_declaration | pugi::parse_fragment,
                              pugi::encoding_utf8))
        return;
    std::string encoding = declared.first_child().attribute("encoding").as_string("UTF-8");
    std::ranges::transform(encoding, encoding.begin(),
                           [](char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; });
    if (encoding != "UTF-8" && encoding != "UTF8" && encoding != "US-ASCII")
        refuse(encoding);
}

TextRange ArdourReader::rangeOf(const pugi::xml_node& node) const
{
    return standin::rangeOf(node, m_session.text);
}

std::string ArdourReader::optionOf(const char* name) const
{
    return m_root.child("Config").find_child_by_attribute("Option", "name", name).attribute("value").value();
}

Counted<Project> ArdourReader::read(ChangeLog& log)
{
    findIds();
    findExtra();
    const Counted<Project> project = m_session.ownText.empty() ? makeCounted<Project>(log) : readOwn(log);
    m_project = project.get();
    readClock(*project);
    readSources(*project);
    readRoutes(*project);
    dropGoneTracks(*project);
    readLocations(*project);
    readVideo(*project);
    project->showChanges();
    project->clearChanges();
    return project;
}

Counted<Project> ArdourReader::readOwn(ChangeLog& log)
{
    try {
        return ProjectReader::read(m_session.ownText, log);
    } catch (const FileFault&) {
        // The sound of the user is whole.
        m_session.isOwnBroken = true;
        m_session.ownMarkers.clear();
        return makeCounted<Project>(log);
    }
}

void ArdourReader::findIds()
{
    IdCollector collector;
    m_document.traverse(collector);
    m_session.largestId = std::max(collector.largest, idIn(m_root.attribute("id-counter").value()).value_or(0));
    constexpr SessionId Furthest = SessionId{1} << 62;
    if (m_session.largestId > Furthest)
        throw FileFault("the session has an id beyond all others, after which no new ones can come");
}

void ArdourReader::findExtra()
{
    const pugi::xml_node extra = m_root.child("Extra");
    if (!extra)
        return;
    m_session.extra = rangeOf(extra);
    const pugi::xml_node own = extra.child("Cadrel");
    if (!own)
        return;
    m_session.own = rangeOf(own);
    m_session.ownText = own.text().get();
    for (std::string_view rest = own.attribute("markers").value(); !rest.empty();) {
        const std::string_view word = rest.substr(0, rest.find(' '));
        m_session.ownMarkers.push_back(idIn(word).value_or(0));
        rest.remove_prefix(std::min(word.size() + 1, rest.size()));
    }
}

void ArdourReader::readClock(Project& project)
{
    const std::string format = optionOf("timecode-format");
    const auto rate = std::ranges::find(FrameRates, format, &FrameRate::format);
    if (rate == FrameRates.end())
        throw FileFault("timecode-format", "is " + quoted(std::string_view(format)) + ", at which no timecode counts");
    FrameRateInfo info;
    info.framesPerSecond = rate->framesPerSecond;
    info.flags = rate->flags;
    project.setFrameRate(info);
    project.setName(textOf(m_root.attribute("name").value()));

    const std::string offset = optionOf("timecode-offset");
    const auto samples = idIn(offset.empty() ? "0" : offset);
    if (!samples)
        throw FileFault("timecode-offset",
                        "is " + quoted(std::string_view(offset)) + ", which is no number of samples");
    const double seconds = m_session.clock.secondsOf(*samples);
    // The option is named after what is done with a timecode to get a time of the session.
    project.setTimeOrigin(optionOf("timecode-offset-negative") == "0" ? -seconds : seconds);
}

std::filesystem::path ArdourReader::folderOfSession() const
{
    std::error_code ignored;
    return std::filesystem::absolute(m_file, ignored).parent_path();
}

void ArdourReader::readSources(Project& project)
{
    // How much of a source the regions know.
    std::map<SessionId, double> lengths;
    const auto measure = [&](const pugi::xml_node& region) {
        // In the order in which Ardour writes them, each is found after the one before.
        pugi::xml_attribute last;
        const char* const start = region.attribute("start", last).value();
        const std::string_view length = region.attribute("length", last).value();
        const char* const type = region.attribute("type", last).value();
        const std::optional<SessionId> source = idIn(region.attribute("source-0", last).value());
        if (!source || std::strcmp(type, "audio") != 0)
            return;
        const SessionClock& clock = m_session.clock;
        const double end =
            clock.seconds(start) + clock.seconds(length.substr(0, clock.hasUnits() ? length.find('@') : length.npos));
        double& known = lengths[*source];
        known = std::max(known, end);
    };
    for (const pugi::xml_node& region : m_root.child("Regions").children("Region"))
        measure(region);
    for (const pugi::xml_node& playlist : m_root.child("Playlists").children("Playlist")) {
        for (const pugi::xml_node& region : playlist.children("Region"))
            measure(region);
    }

    // Ardour names the folder of a session's sound after the session's own.
    const std::filesystem::path session = folderOfSession();
    const std::filesystem::path folder = session / "interchange" / session.filename() / "audiofiles";
    for (const pugi::xml_node& source : m_root.child("Sources").children("Source")) {
        if (std::strcmp(source.attribute("type").value(), "audio") != 0)
            continue;
        const SessionId id = idOf(source);
        // An absolute name replaces the folder.
        const std::filesystem::path path = folder / source.attribute("name").value();
        const auto clip = makeCounted<MediaClip>(MediaClip::Kind::Audio, textOf(path.string()), lengths[id]);
        if (!m_clips.emplace(id, clip).second)
            throw FileFault("Sources", "has two sources with the id " + std::to_string(id));
        project.pool().add(clip);
    }
}

void ArdourReader::readRoutes(Project& project)
{
    for (const pugi::xml_node& playlist : m_root.child("Playlists").children("Playlist")) {
        if (!m_playlists.emplace(idOf(playlist), playlist).second)
            throw FileFault("Playlists", "has two playlists with one id");
    }
    for (Track* const track : project.allTracks()) {
        if (track->kind() == Track::Kind::Audio)
            m_tracks.emplace(attributeId(*track, SessionKey::Route), Counted<Track>::share(track));
    }
    for (const pugi::xml_node& route : m_root.child("Routes").children("Route"))
        readRoute(route, project);
    for (const pugi::xml_node& vca : m_root.child("VCAManager").children("VCA"))
        readVca(vca, project);
    for (const auto& [id, playlist] : m_playlists) {
        if (!m_playlistsRead.contains(id) && std::strcmp(playlist.attribute("type").value(), "audio") == 0)
            m_session.staying.push_back("the playlist " + quoted(playlist.attribute("name").value()));
    }
    for (const pugi::xml_node& playlist : m_root.child("UnusedPlaylists").children("Playlist"))
        m_session.staying.push_back("the playlist " + quoted(playlist.attribute("name").value()));
}

void ArdourReader::readRoute(const pugi::xml_node& route, Project& project)
{
    const SessionId id = idOf(route);
    const std::string name = route.attribute("name").value();
    if (std::strcmp(route.attribute("default-type").value(), "audio") != 0 || route.attribute("midi-playlist")) {
        m_session.staying.push_back("the MIDI track " + quoted(std::string_view(name)));
        return;
    }
    const Counted<Track> track = trackOf(id);
    track->setName(textOf(name));
    readLists(id, route, *track);

    const pugi::xml_attribute ownPlaylist = route.attribute("audio-playlist");
    if (ownPlaylist) {
        const std::optional<SessionId> playlistId = idIn(ownPlaylist.value());
        const auto playlist = playlistId ? m_playlists.find(*playlistId) : m_playlists.end();
        if (playlist == m_playlists.end())
            throw FileFault(quoted(std::string_view(name)),
                            "plays the playlist " + quoted(ownPlaylist.value()) + ", which isn't there");
        // One that tracks share moves once.
        if (m_playlistsRead.insert(*playlistId).second) {
            readPlaylist(id, playlist->second, *track);
            // The elements of long playlists take more memory than all else together.
            playlist->second.parent().remove_child(playlist->second);
        }
    }
    if (ownPlaylist || hasPoints(*track))
        track->insertInto(project);
}

void ArdourReader::readVca(const pugi::xml_node& vca, Project& project)
{
    const std::optional<SessionId> number = idIn(vca.attribute("number").value());
    if (!number || *number == 0)
        throw FileFault("VCAManager", "has a VCA without a number");
    const SessionId key = vcaKey(*number);
    const Counted<Track> track = trackOf(key);
    track->setName(textOf(vca.attribute("name").value()));
    readLists(key, vca, *track);
    if (hasPoints(*track))
        track->insertInto(project);
}

Counted<Track> ArdourReader::trackOf(SessionId route)
{
    // What Cadrel has stored of a track comes first.
    Counted<Track>& track = m_tracks[route];
    if (!track) {
        track = Track::create(Track::Kind::Audio);
        setId(*track, SessionKey::Route, route);
    } else if (track->parent()) {
        track->remove();
    }
    return track;
}

void ArdourReader::readPlaylist(SessionId route, const pugi::xml_node& playlist, Track& track)
{
    ArdourSession::Playlist& read = m_session.playlists[route];
    for (const pugi::xml_node& region : playlist.children("Region")) {
        if (std::strcmp(region.attribute("type").value(), "audio") == 0)
            read.regions.push_back(readRegion(region, track));
    }
}

SessionId ArdourReader::readRegion(const pugi::xml_node& region, Track& track)
{
    pugi::xml_attribute last;
    const std::string name = region.attribute("name", last).value();
    const std::string_view start = region.attribute("start", last).value();
    const std::string_view length = region.attribute("length", last).value();
    const SessionId id = idOf(region);
    const SessionClock& clock = m_session.clock;
    ArdourSession::Region read;
    read.text = rangeOf(region);
    if (clock.hasUnits()) {
        const std::size_t at = length.find('@');
        if (at == length.npos)
            throw FileFault(quoted(std::string_view(name)), "has the length " + quoted(length) + ", which is none");
        read.position = clock.samples(length.substr(at + 1));
        read.length = clock.lengthInSamples(length.substr(at + 1), length.substr(0, at));
    } else {
        read.position = clock.samples(region.attribute("position").value());
        read.length = clock.samples(length);
    }
    read.start = clock.samples(start);
    read.isMusical = clock.hasUnits() && (SessionClock::isMusical(start) || length.find('b') != length.npos);
    const SessionId source = idIn(region.attribute("source-0").value()).value_or(-1);
    read.source = source;
    if (region.child("Extra")) {
        read.head = CutMark::read(region, "head", read.start, RegionFades::lengthIn(region, clock));
        read.tail = CutMark::read(region, "tail", read.start + read.length, RegionFades::lengthOut(region, clock));
    }
    if (!m_session.regions.emplace(id, read).second)
        throw FileFault(quoted(std::string_view(name)),
                        "has the id " + std::to_string(id) + ", which is another region's");

    // What a combined region plays stands in the region itself.
    const pugi::xml_node nested = region.child("NestedSource").child("Source");
    if (nested && !m_clips.contains(source) && idIn(nested.attribute("id").value()) == source) {
        const auto combined = makeCounted<MediaClip>(MediaClip::Kind::Audio, textOf(nested.attribute("name").value()),
                                                     clock.secondsOf(read.start + read.length));
        m_clips.emplace(source, combined);
        m_project->pool().add(combined);
    }
    const auto clip = m_clips.find(source);
    if (clip == m_clips.end()) {
        throw FileFault(name,
                        "plays the source " + quoted(region.attribute("source-0").value()) + ", which isn't there");
    }
    const auto event = makeCounted<ClipEvent>();
    event->setClip(clip->second);
    event->setName(textOf(name));
    setId(*event, SessionKey::Region, id);
    const double first = clock.secondsOf(read.position);
    double head = first;
    double tail = clock.secondsOf(read.position + read.length);
    if (static_cast<double>(read.length) > 2.0 * NearToCut) {
        head += std::max(distanceToFrame(head), 0.0);
        tail += std::min(distanceToFrame(tail), 0.0);
    }
    event->setSourceOffset(clock.secondsOf(read.start) + (head - first));
    event->setSpan(head, tail);
    event->insertInto(track);
    return id;
}

double ArdourReader::distanceToFrame(double seconds) const
{
    const double frames = m_project->frameRate().framesPerSecond;
    const auto samples = static_cast<double>(m_session.clock.sampleRate());
    if (std::abs(samples / frames - std::round(samples / frames)) < 1e-6)
        return 0.0;
    const double origin = m_project->timeOrigin();
    const double distance = std::round((seconds + origin) * frames) / frames - origin - seconds;
    // Nearer by more than rounding, so that the region is whole when it is written.
    return std::abs(distance) * samples < NearToCut - 1e-3 ? distance : 0.0;
}

void ArdourReader::readLists(SessionId route, const pugi::xml_node& node, Track& track)
{
    // A route holds lists in itself, in its panner and in its processors, at most a few levels below.
    std::vector<pugi::xml_node> open{node};
    int next = FirstFreeCurve;
    while (!open.empty()) {
        const pugi::xml_node parent = open.back();
        open.pop_back();
        for (const pugi::xml_node& child : parent.children()) {
            if (std::strcmp(child.name(), "AutomationList") != 0) {
                if (std::strcmp(child.name(), "Triggers") != 0 && std::strcmp(child.name(), "Extra") != 0)
                    open.push_back(child);
                continue;
            }
            if (!child.child("events"))
                continue;
            const std::string_view what = child.attribute("automation-id").value();
            const std::string_view type = parent.parent().attribute("type").value();
            int number = 0;
            const bool isVca = route < 0;
            if (what == "gain" && (type == "amp" || isVca))
                number = Envelope::Curve::Volume;
            else if (what == "pan-azimuth")
                number = Envelope::Curve::Pan;
            else if (what == "mute")
                number = Envelope::Curve::Mute;
            if (number == 0 || m_session.lists.contains({route, number}))
                number = next++;
            readList(route, child, track, number);
        }
    }
}

void ArdourReader::readList(SessionId route, const pugi::xml_node& list, Track& track, int number)
{
    const SessionClock& clock = m_session.clock;
    const std::vector<ListPoint> points = readPoints(list, clock);
    std::vector<double> values;
    for (const ListPoint& point : points)
        values.push_back(point.value);
    ArdourSession::List read{rangeOf(list), CurveScale(list.attribute("interpolation-style").value(), values), {}};
    const auto add = [&](double seconds, double share) { read.points.emplace_back(seconds, share); };
    for (const ListPoint& point : points) {
        const double share = read.scale.toShare(point.value);
        if (!read.points.empty()) {
            const auto [before, shareBefore] = read.points.back();
            if (read.scale.holds()) {
                add(point.seconds, shareBefore);
            } else if (point.isMusical && point.seconds > before) {
                // What is straight over beats bends where the tempo changes.
                const double first = clock.ticksAt(before);
                const double last = clock.ticksAt(point.seconds);
                for (const double bend : clock.bendsBetween(before, point.seconds))
                    add(bend, std::lerp(shareBefore, share, (clock.ticksAt(bend) - first) / (last - first)));
            }
        }
        add(point.seconds, share);
    }
    Envelope& curve = track.curve(number);
    for (const auto& [seconds, share] : read.points) {
        const auto point = makeCounted<AutomationPoint>();
        point->setSpan(seconds, seconds);
        point->setValue(share);
        point->insertInto(curve);
    }
    m_session.lists.emplace(std::pair{route, number}, std::move(read));
}

void ArdourReader::dropGoneTracks(Project& project)
{
    std::set<SessionId> routes;
    for (const pugi::xml_node& route : m_root.child("Routes").children("Route"))
        routes.insert(idOf(route));
    for (const pugi::xml_node& vca : m_root.child("VCAManager").children("VCA"))
        routes.insert(vcaKey(idIn(vca.attribute("number").value()).value_or(0)));
    for (Track* const track : project.allTracks()) {
        const SessionId route = attributeId(*track, SessionKey::Route);
        if (route != 0 && !routes.contains(route))
            track->remove();
    }
}

void ArdourReader::readLocations(Project& project)
{
    const pugi::xml_node locations = m_root.child("Locations");
    if (locations)
        m_session.locationsElement = rangeOf(locations);
    const SessionClock& clock = m_session.clock;
    const auto stays = [this](const ArdourSession::Location& location) {
        m_session.staying.push_back((location.isRange ? "the range " : "the mark ") +
                                    quoted(std::string_view(location.name)));
    };
    for (const pugi::xml_node& location : locations.children("Location")) {
        const SessionId id = idOf(location);
        const std::string_view flags = location.attribute("flags").value();
        ArdourSession::Location read;
        read.text = rangeOf(location);
        read.isRange = !hasFlag(flags, "IsMark");
        read.name = location.attribute("name").value();
        read.start = clock.samples(location.attribute("start").value());
        read.end = read.isRange ? clock.samples(location.attribute("end").value()) : read.start;
        if (read.end < read.start)
            throw FileFault(quoted(std::string_view(read.name)), "ends before it begins");
        if (hasFlag(flags, "IsSessionRange")) {
            m_session.sessionRange = read;
            project.setProjectEnd(clock.secondsOf(read.end));
            setSessionEnd(project, clock.secondsOf(read.end));
        } else if (hasFlag(flags, "IsAutoLoop")) {
            project.cycleLeft().setValue(0, clock.secondsOf(read.start));
            project.cycleRight().setValue(0, clock.secondsOf(read.end));
            stays(read);
        } else if (hasFlag(flags, "IsAutoPunch") || hasFlag(flags, "IsClockOrigin")) {
            stays(read);
        } else {
            if (!m_session.locations.emplace(id, std::move(read)).second)
                throw FileFault("Locations", "has two with the id " + std::to_string(id));
            m_order.push_back(id);
        }
    }
    placeOwnMarkers(project);
    placeMarkersOfTheUser(project);
}

void ArdourReader::readVideo(Project& project)
{
    const pugi::xml_node timeline = m_root.child("Extra").child("Videotimeline");
    const std::string name = timeline.attribute("Filename").value();
    const auto isOldPicture = [](const Track* track) {
        return attributeId(*track, AttributeKey::VideoType) == OldVideo;
    };
    if (name.empty() || std::ranges::any_of(project.allTracks(), isOldPicture))
        return;
    const std::string_view offset = timeline.attribute("VideoOffset").as_string("0");
    const std::optional<SessionId> samples = idIn(offset.substr(offset.starts_with('-') ? 1 : 0));
    if (!samples || *samples > m_session.clock.samplesOf(FurthestTime))
        throw FileFault("Videotimeline", "begins at " + quoted(offset) + ", which is no number of samples");
    m_session.staying.push_back("the video " + quoted(std::string_view(name)));
    const double begin = m_session.clock.secondsOf(*samples) * (offset.starts_with('-') ? -1.0 : 1.0);
    // The session doesn't tell how long its video is: to the end of the programme.
    const double end = std::max(project.setEndTime(), contentEnd(project));
    if (end <= std::max(begin, 0.0))
        return;
    // Ardour keeps videos of its own beside the sound. An absolute name replaces the folder.
    const std::filesystem::path path = folderOfSession() / "videofiles" / name;
    const auto clip = makeCounted<MediaClip>(MediaClip::Kind::Video, textOf(path.string()), end - begin);
    setId(*clip, SessionKey::Video, 1);
    project.pool().add(clip);
    const Counted<Track> track = Track::create(Track::Kind::Video);
    track->setName(u"Video");
    setId(*track, SessionKey::Video, 1);
    setId(*track, AttributeKey::VideoType, OldVideo);
    const auto event = makeCounted<ClipEvent>();
    event->setClip(clip);
    event->setName(clip->name());
    event->setSourceOffset(std::max(-begin, 0.0));
    event->setSpan(std::max(begin, 0.0), end);
    event->insertInto(*track);
    // It stays where Ardour has it.
    track->setLocked(true);
    track->insertInto(project);
}

void ArdourReader::placeMarkersOfTheUser(Project& project)
{
    const SessionClock& clock = m_session.clock;
    Counted<Track> markers;
    for (Track* const track : project.allTracks()) {
        if (attributeId(*track, SessionKey::Markers) != 0)
            markers = Counted<Track>::share(track);
    }
    for (const SessionId id : m_order) {
        const ArdourSession::Location& location = m_session.locations.at(id);
        if (m_ownLocations.contains(id))
            continue;
        if (!markers) {
            markers = Track::create(Track::Kind::Marker);
            markers->setName(u"Markers");
            setId(*markers, SessionKey::Markers, 1);
            markers->insertInto(project);
        }
        const auto marker = makeCounted<Marker>(location.isRange);
        marker->setName(textOf(location.name));
        marker->setSpan(clock.secondsOf(location.start), clock.secondsOf(location.end));
        setId(*marker, SessionKey::Location, id);
        marker->insertInto(*markers);
    }
}

bool ArdourReader::isOwn(const ArdourSession::Location& location, const Track& track, const Node& marker) const
{
    const SessionClock& clock = m_session.clock;
    const bool isInPlace =
        location.start == clock.samplesOf(marker.start()) && location.end == clock.samplesOf(marker.end());
    return isInPlace || hasKind(textOf(location.name), track.name());
}

void ArdourReader::placeOwnMarkers(Project& project)
{
    const std::vector<Node*> markers = OwnStorage::markersOf(project);
    for (std::size_t index = 0; index < markers.size(); ++index) {
        const auto marker = Counted<Node>::share(markers[index]);
        auto& track = static_cast<Track&>(*marker->parent());
        marker->remove();
        const SessionId id = index < m_session.ownMarkers.size() ? m_session.ownMarkers[index] : 0;
        const auto found = m_session.locations.find(id);
        // One that was removed in Ardour is gone.
        if (found == m_session.locations.end() || !isOwn(found->second, track, *marker) ||
            !m_ownLocations.insert(id).second)
            continue;
        const ArdourSession::Location& location = found->second;
        marker->setSpan(m_session.clock.secondsOf(location.start), m_session.clock.secondsOf(location.end));
        if (textOf(location.name) != ownLocationName(track.name(), marker->name()))
            marker->setName(markerName(location.name, track));
        setId(*marker, SessionKey::Location, id);
        marker->insertInto(track);
    }
}

} // namespace standin
