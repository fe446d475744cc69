// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/ProjectReader.h"

#include "standin/base/AttributeList.h"
#include "standin/base/Utf16.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/FileFault.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "standin/stage/Base64.h"

#include <limits>
#include <optional>
#include <set>

using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::makeCounted;
using Velmark::TypeWord;

namespace standin {

namespace {

/// A container takes two levels of a file, a list and itself, and so do a curve and its points below the deepest one; what
/// is unknown has levels of its own.
constexpr std::size_t DeepestFile = 2 * (Project::DeepestNesting + 2) + Project::DeepestNesting;

double timeIn(const JsonMembers& members, std::string_view key)
{
    return members.number(key, 0.0, FurthestTime);
}

/// 0 when it isn't there.
double signedTimeIn(const JsonMembers& members, std::string_view key)
{
    return members.number(key, -FurthestTime, FurthestTime, 0.0);
}

void checkVersion(const JsonMembers& members)
{
    const std::optional<JsonValue> format = members.find(Key::Format);
    if (!format || !format->isText() || format->text() != FormatName)
        members.refuse(Key::Format, "isn't " + quoted(FormatName) + ": this is no project");
    const int version = members.wholeNumber(Key::Version, 1, std::numeric_limits<int>::max());
    if (version > ProjectFileVersion) {
        members.refuse(Key::Version, "is " + std::to_string(version) +
                                         ": written by a newer version than this one, which knows " +
                                         std::to_string(ProjectFileVersion));
    }
}

void checkLevel(const JsonMembers& members, int level)
{
    if (level > Project::DeepestNesting)
        members.place().refuse("nested deeper than " + std::to_string(Project::DeepestNesting) + " levels");
}

} // namespace

Counted<Project> ProjectReader::read(std::string_view text, ChangeLog& log)
{
    const JsonDocument document(text, DeepestFile);
    if (!document.root().isObject())
        throw FileFault(std::string("is ") + document.root().kindName() + ", not a project");
    auto project = makeCounted<Project>(log);
    const JsonPlace file;
    ProjectReader(*project).readProject(JsonMembers(document.root(), file));
    project->showChanges();
    project->clearChanges();
    return project;
}

void ProjectReader::readProject(const JsonMembers& members)
{
    checkVersion(members);
    readClock(members);
    readDetails(members, m_project, ProjectKeys);
    members.forEach(Key::Pool, [&](JsonValue clip, const JsonPlace& place) { readClip({clip, place}); });
    members.forEach(Key::Tracks, [&](JsonValue track, const JsonPlace& place) {
        readTrack({track, place}, m_project, 2);
    });
}

void ProjectReader::readClock(const JsonMembers& members)
{
    FrameRateInfo rate;
    rate.framesPerSecond = members.number(Key::FramesPerSecond, LowestFrameRate, HighestFrameRate);
    if (members.flag(Key::DropFrame)) {
        if (!hasDropFrame(rate.framesPerSecond))
            members.refuse(Key::DropFrame, "is true, but timecode is drop-frame at 30 frames per second (29.97) alone");
        rate.flags |= FrameRateInfo::Flag::DropFrame;
    }
    if (members.flag(Key::PulledDown))
        rate.flags |= FrameRateInfo::Flag::PulledDown;
    m_project.setFrameRate(rate);
    m_project.setTimeOrigin(signedTimeIn(members, Key::TimeOrigin));
    m_project.setProjectEnd(members.number(Key::End, 0.0, FurthestTime, 0.0));
    m_project.position().setValue(0, signedTimeIn(members, Key::Position));
    m_project.locatorLeft().setValue(0, signedTimeIn(members, Key::LeftLocator));
    m_project.locatorRight().setValue(0, signedTimeIn(members, Key::RightLocator));
    m_project.cycleLeft().setValue(0, signedTimeIn(members, Key::CycleStart));
    m_project.cycleRight().setValue(0, signedTimeIn(members, Key::CycleEnd));
}

void ProjectReader::readClip(const JsonMembers& members)
{
    const int number = members.wholeNumber(Key::Number, 1, LargestNumber);
    if (m_project.pool().clipWith(number))
        members.refuse(Key::Number, "is " + std::to_string(number) + ", which is another clip's");
    const std::string_view kind = members.text(Key::Kind);
    if (kind != TypeWord::Audio && kind != TypeWord::Video)
        members.refuse(Key::Kind, "is " + quoted(kind) + ", which is no kind of clip");
    const auto clip = makeCounted<MediaClip>(kind == TypeWord::Audio ? MediaClip::Kind::Audio : MediaClip::Kind::Video,
                                             toUtf16(members.text(Key::Path)), timeIn(members, Key::Length));
    if (members.has(Key::FramesPerSecond))
        clip->setFileRate(members.number(Key::FramesPerSecond, LowestFrameRate, HighestFrameRate));
    readDetails(members, *clip, PoolClipKeys);
    m_project.pool().add(clip, number);
}

void ProjectReader::readTrack(const JsonMembers& members, Container& parent, int level)
{
    checkLevel(members, level);
    const std::string_view word = members.text(Key::Kind);
    const std::optional<Track::Kind> kind = Track::kindOf(word);
    if (!kind)
        members.refuse(Key::Kind, "is " + quoted(word) + ", which is no kind of track");
    const Counted<Track> track = Track::create(*kind);
    track->setLocked(members.flag(Key::Locked));
    readDetails(members, *track, TrackKeys);
    if (track->isFolder()) {
        members.forbid({Key::Curves, Key::Events}, "a folder has none");
        members.forEach(Key::Tracks, [&](JsonValue inner, const JsonPlace& place) {
            readTrack({inner, place}, *track, level + 1);
        });
    } else {
        members.forbid({Key::Tracks}, "only a folder has tracks");
        if (!track->hasAutomation())
            members.forbid({Key::Curves}, "this kind of track has none");
        readCurves(members, *track);
        readEvents(members, *track, level);
    }
    // Only now, so that what is in it concerns nobody yet.
    track->insertInto(parent);
}

void ProjectReader::readCurves(const JsonMembers& members, Track& track)
{
    std::set<int> numbers;
    members.forEach(Key::Curves, [&](JsonValue value, const JsonPlace& place) {
        const JsonMembers curve(value, place);
        const int number = curve.wholeNumber(Key::Number, 1, LargestNumber);
        if (!numbers.insert(number).second)
            curve.refuse(Key::Number, "is " + std::to_string(number) + ", which is another curve's");
        readCurve(curve, track.curve(number));
    });
}

void ProjectReader::readCurve(const JsonMembers& members, Envelope& curve)
{
    const int number = curve.number();
    const std::string_view name = Envelope::Curve::nameOf(number);
    if (!name.empty() && members.has(Key::Automates) && members.text(Key::Automates) != name) {
        members.refuse(Key::Automates, "is " + quoted(members.text(Key::Automates)) + ", but curve " +
                                           std::to_string(number) + " is " + quoted(name));
    }
    readDetails(members, curve, name.empty() ? KnownKeys(NamelessCurveKeys) : CurveKeys);
    members.forEach(Key::Points, [&](JsonValue point, const JsonPlace& place) { readPoint({point, place}, curve); });
}

void ProjectReader::readPoint(const JsonMembers& members, Envelope& curve)
{
    const auto point = makeCounted<AutomationPoint>();
    const double time = timeIn(members, Key::Time);
    point->setSpan(time, time);
    point->setValue(members.number(Key::Value, 0.0, 1.0));
    point->setHolding(members.flag(Key::Holding));
    readDetails(members, *point, PointKeys);
    point->insertInto(curve);
}

void ProjectReader::readEvents(const JsonMembers& members, Container& container, int level)
{
    members.forEach(Key::Events, [&](JsonValue event, const JsonPlace& place) {
        readEvent({event, place}, container, level);
    });
}

void ProjectReader::readEvent(const JsonMembers& members, Container& container, int level)
{
    const Counted<Event> event = newEvent(members);
    if (!container.accepts(*event))
        members.refuse(Key::Kind, "is " + quoted(members.text(Key::Kind)) + ", which can't lie here");
    readDetails(members, *event, EventKeys);
    if (event->holdsChildren()) {
        checkLevel(members, level + 1);
        readEvents(members, *event, level + 1);
    }
    event->insertInto(container);
}

Counted<Event> ProjectReader::newEvent(const JsonMembers& members)
{
    const std::string_view kind = members.text(Key::Kind);
    const bool isPoint = kind == EventKind::Point;
    Counted<Event> event;
    if (kind == EventKind::Clip)
        event = newClipEvent(members);
    else if (kind == EventKind::Part)
        event = makeCounted<Part>();
    else if (isPoint || kind == EventKind::Range)
        event = makeCounted<Marker>(!isPoint);
    else
        members.refuse(Key::Kind, "is " + quoted(kind) + ", which is no kind of event");

    if (kind != EventKind::Clip)
        members.forbid({Key::Clip, Key::Offset}, "only a clip has it");
    if (kind != EventKind::Part)
        members.forbid({Key::Events}, "only a part has events");
    if (isPoint)
        members.forbid({Key::End}, "a point has none");

    const double start = timeIn(members, Key::Start);
    const double end = isPoint ? start : timeIn(members, Key::End);
    if (end < start)
        members.refuse(Key::End, "lies before the start: the length is negative");
    event->setSpan(start, end);
    return event;
}

Counted<Event> ProjectReader::newClipEvent(const JsonMembers& members)
{
    auto event = makeCounted<ClipEvent>();
    if (members.has(Key::Clip)) {
        const int number = members.wholeNumber(Key::Clip, 1, LargestNumber);
        MediaClip* const clip = m_project.pool().clipWith(number);
        if (!clip)
            members.refuse(Key::Clip, "is " + std::to_string(number) + ", but the pool has no clip of that number");
        event->setClip(Counted<MediaClip>::share(clip));
    }
    event->setSourceOffset(members.number(Key::Offset, 0.0, FurthestTime, 0.0));
    return event;
}

void ProjectReader::readDetails(const JsonMembers& members, Node& node, KnownKeys known)
{
    if (members.has(Key::Name))
        node.setName(toUtf16(members.text(Key::Name)));
    node.setSelected(members.flag(Key::Selected));
    members.forEachMember(Key::Attributes, [&](JsonValue value, const JsonPlace& place) {
        if (value.key().find('\0') != std::string::npos)
            place.refuse("has a key with a zero character");
        node.setAttribute(value.key(), attributeOf(value, place));
    });
    node.setUnknownMembers(members.unknown(known));
}

Attribute ProjectReader::attributeOf(JsonValue value, const JsonPlace& place)
{
    if (value.isText())
        return {std::string(textOf(value, place)), true};
    if (value.isNumber()) {
        const std::optional<std::int64_t> integer = value.integer();
        if (!integer)
            place.refuse("isn't a whole number of 64 bits");
        return {*integer, true};
    }
    if (!value.isObject())
        JsonMembers::refuseKind(place, value, "a number, a text or an object of binary values");
    const JsonMembers members(value, place);
    auto list = makeCounted<AttributeList>();
    for (const JsonValue& member : value.children()) {
        const JsonPlace memberPlace(place, member.key());
        std::optional<Bytes> bytes = fromBase64(textOf(member, memberPlace));
        if (!bytes)
            memberPlace.refuse("isn't base64");
        if (member.key().find('\0') != std::string::npos)
            memberPlace.refuse("has a key with a zero character");
        list->set(member.key(), std::move(*bytes));
    }
    return {Counted<Velmark::FUnknown>(Counted<Velmark::FObject>(std::move(list))), true};
}

} // namespace standin
