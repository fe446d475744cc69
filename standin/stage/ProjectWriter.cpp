// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/ProjectWriter.h"

#include "standin/base/AttributeList.h"
#include "standin/base/Text.h"
#include "standin/base/Utf16.h"
#include "standin/project/ClipEvent.h"
#include "standin/project/FileFault.h"
#include "standin/project/Marker.h"
#include "standin/project/Part.h"
#include "standin/project/Project.h"
#include "standin/project/Track.h"
#include "standin/stage/Base64.h"
#include "standin/stage/JsonDocument.h"

#include <algorithm>

using Velmark::Counted;
using Velmark::FrameRateInfo;
using Velmark::FUnknown;
using Velmark::int64;

namespace standin {

namespace {

using Layout = JsonWriter::Layout;

constexpr double AnyTime = -FurthestTime;

template <class Child, class Visit>
void forEachChild(const Container& container, const ProjectWriter::Choice& isWritten, Visit visit)
{
    for (const Node* child = container.firstChild(); child; child = container.childBehind(*child)) {
        if (isWritten(*child))
            visit(static_cast<const Child&>(*child));
    }
}

std::string_view kindOf(const Event& event)
{
    if (dynamic_cast<const ClipEvent*>(&event))
        return EventKind::Clip;
    if (const auto* const marker = dynamic_cast<const Marker*>(&event))
        return marker->isRange() ? EventKind::Range : EventKind::Point;
    return EventKind::Part;
}

const AttributeList* listIn(const Attribute& attribute)
{
    const auto* const object = std::get_if<Counted<FUnknown>>(&attribute.value);
    return object ? dynamic_cast<const AttributeList*>(object->get()) : nullptr;
}

/// Objects other than lists live no longer than the session, whatever is said of them.
bool isStored(const Attribute& attribute)
{
    return attribute.isPersistent && (!std::holds_alternative<Counted<FUnknown>>(attribute.value) || listIn(attribute));
}

bool hasStoredAttributes(const Node& node)
{
    return std::ranges::any_of(node.attributes(), [](const auto& attribute) { return isStored(attribute.second); });
}

/// Whether something of the curve would be lost without it. Those that a new track has come by themselves.
bool isWorthStoring(const Envelope& curve, const Track& newTrack)
{
    return !newTrack.curves().contains(curve.number()) || curve.childCount() > 0 || !curve.name().empty() ||
           curve.selected() || hasStoredAttributes(curve) || !curve.unknownMembers().empty();
}

} // namespace

std::string ProjectWriter::textOf(const Project& project)
{
    return textOf(project, [](const Node&) { return true; });
}

std::string ProjectWriter::textOf(const Project& project, const Choice& isWritten)
{
    ProjectWriter writer(project, isWritten);
    writer.writeProject();
    std::string text = writer.m_json.takeText();
    if (text.size() > JsonDocument::LargestSize)
        writer.refuse("the project is too large for a file");
    return text;
}

void ProjectWriter::writeProject()
{
    m_json.beginObject(Layout::Lines);
    enter();
    writeText(Key::Format, FormatName);
    writeCount(Key::Version, ProjectFileVersion);
    writeName(m_project);
    writeClock();
    writeDetails(m_project, ProjectKeys, Layout::Lines);
    writePool();
    writeTracks(m_project);
    m_json.endObject();
}

void ProjectWriter::writeClock()
{
    const FrameRateInfo& rate = m_project.frameRate();
    writeNumber(Key::FramesPerSecond, rate.framesPerSecond, LowestFrameRate, HighestFrameRate);
    const bool isDropFrame = (rate.flags & FrameRateInfo::Flag::DropFrame) != 0;
    m_json.key(Key::DropFrame);
    if (isDropFrame && !hasDropFrame(rate.framesPerSecond))
        refuse("drop-frame at another rate than 30 frames per second");
    m_json.boolean(isDropFrame);
    m_json.key(Key::PulledDown);
    m_json.boolean((rate.flags & FrameRateInfo::Flag::PulledDown) != 0);
    writeSeconds(Key::TimeOrigin, m_project.timeOrigin(), AnyTime);
    writeSeconds(Key::End, m_project.setEndTime());
    writeSeconds(Key::Position, m_project.position().getValue(), AnyTime);
    writeSeconds(Key::LeftLocator, m_project.locatorLeft().getValue(), AnyTime);
    writeSeconds(Key::RightLocator, m_project.locatorRight().getValue(), AnyTime);
    writeSeconds(Key::CycleStart, m_project.cycleLeft().getValue(), AnyTime);
    writeSeconds(Key::CycleEnd, m_project.cycleRight().getValue(), AnyTime);
}

void ProjectWriter::writePool()
{
    m_json.key(Key::Pool);
    m_json.beginList();
    for (const auto& [number, clip] : m_project.pool().clips()) {
        if (m_isWritten(*clip))
            writeClip(*clip);
    }
    m_json.endList();
}

void ProjectWriter::writeClip(const MediaClip& clip)
{
    m_json.beginObject(Layout::OneLine);
    writeCount(Key::Number, clip.number());
    writeText(Key::Kind, clip.kind() == MediaClip::Kind::Audio ? Velmark::TypeWord::Audio : Velmark::TypeWord::Video);
    // Without one it would be named after its file.
    writeText(Key::Name, clip.name());
    writeText(Key::Path, clip.path());
    writeSeconds(Key::Length, clip.seconds());
    if (clip.fileRate() != 0.0)
        writeNumber(Key::FramesPerSecond, clip.fileRate(), LowestFrameRate, HighestFrameRate);
    writeDetails(clip, PoolClipKeys, Layout::OneLine);
    m_json.endObject();
}

void ProjectWriter::writeTracks(const Container& parent)
{
    m_json.key(Key::Tracks);
    m_json.beginList();
    forEachChild<Track>(parent, m_isWritten, [this](const Track& track) { writeTrack(track); });
    m_json.endList();
}

void ProjectWriter::writeTrack(const Track& track)
{
    m_json.beginObject(Layout::Lines);
    enter();
    writeText(Key::Kind, Track::wordOf(track.kind()));
    writeName(track);
    writeFlag(Key::Locked, track.isLocked());
    writeDetails(track, TrackKeys, Layout::Lines);
    if (track.isFolder()) {
        writeTracks(track);
    } else {
        writeCurves(track);
        writeEvents(track);
    }
    m_json.endObject();
    --m_depth;
}

void ProjectWriter::writeCurves(const Track& track)
{
    if (!track.hasAutomation())
        return;
    const Counted<Track> newTrack = Track::create(track.kind());
    const auto isStored = [&](const auto& curve) {
        return isWorthStoring(*curve.second, *newTrack) && m_isWritten(*curve.second);
    };
    if (std::ranges::none_of(track.curves(), isStored))
        return;
    m_json.key(Key::Curves);
    m_json.beginList();
    for (const auto& curve : track.curves()) {
        if (isStored(curve))
            writeCurve(*curve.second);
    }
    m_json.endList();
}

void ProjectWriter::writeCurve(const Envelope& curve)
{
    const std::string_view what = Envelope::Curve::nameOf(curve.number());
    m_json.beginObject(Layout::Lines);
    writeCount(Key::Number, curve.number());
    if (!what.empty())
        writeText(Key::Automates, what);
    writeName(curve);
    writeDetails(curve, what.empty() ? KnownKeys(NamelessCurveKeys) : CurveKeys, Layout::Lines);
    m_json.key(Key::Points);
    m_json.beginList();
    forEachChild<AutomationPoint>(curve, m_isWritten, [this](const AutomationPoint& point) { writePoint(point); });
    m_json.endList();
    m_json.endObject();
}

void ProjectWriter::writePoint(const AutomationPoint& point)
{
    m_json.beginObject(Layout::OneLine);
    writeSeconds(Key::Time, point.start());
    writeNumber(Key::Value, point.value(), 0.0, 1.0);
    writeName(point);
    writeFlag(Key::Holding, point.isHolding());
    writeDetails(point, PointKeys, Layout::OneLine);
    m_json.endObject();
}

void ProjectWriter::writeEvents(const Container& container)
{
    m_json.key(Key::Events);
    m_json.beginList();
    forEachChild<Event>(container, m_isWritten, [this](const Event& event) { writeEvent(event); });
    m_json.endList();
}

void ProjectWriter::writeEvent(const Event& event)
{
    const std::string_view kind = kindOf(event);
    const Layout layout = event.holdsChildren() ? Layout::Lines : Layout::OneLine;
    m_json.beginObject(layout);
    writeText(Key::Kind, kind);
    writeSeconds(Key::Start, event.start());
    if (kind != EventKind::Point)
        writeSeconds(Key::End, event.end(), event.start());
    if (const auto* const clipEvent = dynamic_cast<const ClipEvent*>(&event)) {
        if (clipEvent->clip())
            writeReference(*clipEvent->clip());
        if (clipEvent->sourceOffset() != 0.0)
            writeSeconds(Key::Offset, clipEvent->sourceOffset());
    }
    writeName(event);
    writeDetails(event, EventKeys, layout);
    if (event.holdsChildren()) {
        enter();
        writeEvents(event);
        --m_depth;
    }
    m_json.endObject();
}

void ProjectWriter::writeReference(const MediaClip& clip)
{
    writeCount(Key::Clip, clip.number());
    if (m_project.pool().clipWith(clip.number()) != &clip)
        refuse("a clip that isn't in the pool");
}

void ProjectWriter::writeName(const Node& node)
{
    if (!node.name().empty())
        writeText(Key::Name, node.name());
}

void ProjectWriter::writeDetails(const Node& node, KnownKeys known, Layout layout)
{
    writeFlag(Key::Selected, node.selected());
    writeAttributes(node, layout);
    if (!node.unknownMembers().empty())
        writeUnknownMembers(node, known);
}

void ProjectWriter::writeAttributes(const Node& node, Layout layout)
{
    if (!hasStoredAttributes(node))
        return;
    m_json.key(Key::Attributes);
    m_json.beginObject(layout);
    for (const auto& attribute : node.attributes()) {
        if (!isStored(attribute.second))
            continue;
        writeKey(attribute.first);
        writeAttribute(attribute.second, layout);
    }
    m_json.endObject();
}

void ProjectWriter::writeAttribute(const Attribute& attribute, Layout layout)
{
    if (const auto* const integer = std::get_if<int64>(&attribute.value)) {
        m_json.integer(*integer);
    } else if (const auto* const text = std::get_if<std::string>(&attribute.value)) {
        if (!isWellFormed(*text) || text->find('\0') != std::string::npos)
            refuse("a text that isn't UTF-8");
        m_json.text(*text);
    } else {
        m_json.beginObject(layout);
        for (const auto& [key, bytes] : listIn(attribute)->values()) {
            writeKey(key);
            m_json.text(toBase64(bytes));
        }
        m_json.endObject();
    }
}

void ProjectWriter::writeUnknownMembers(const Node& node, KnownKeys known)
{
    const JsonDocument members(node.unknownMembers(), Project::DeepestNesting + 1);
    if (!members.root().isObject())
        refuse("unknown members that aren't those of an object");
    for (const JsonValue& member : members.root().children()) {
        m_json.key(member.key());
        if (std::ranges::find(known, member.key()) != known.end())
            refuse("a member that isn't unknown");
        std::string text;
        member.appendTo(text);
        m_json.json(text);
    }
}

void ProjectWriter::writeSeconds(std::string_view key, double seconds, double least)
{
    writeNumber(key, seconds, least, FurthestTime);
}

void ProjectWriter::writeNumber(std::string_view key, double number, double least, double most)
{
    m_json.key(key);
    if (!(number >= least && number <= most))
        refuse("a number out of its bounds");
    // Adding 0 makes the two zeros one, which read back as the same integer.
    m_json.number(number + 0.0);
}

void ProjectWriter::writeCount(std::string_view key, int number)
{
    m_json.key(key);
    if (number < 1 || number > LargestNumber)
        refuse("a number out of its bounds");
    m_json.integer(number);
}

void ProjectWriter::writeText(std::string_view key, std::string_view text)
{
    m_json.key(key);
    m_json.text(text);
}

void ProjectWriter::writeText(std::string_view key, std::u16string_view text)
{
    m_json.key(key);
    if (!isWellFormed(text) || text.find(u'\0') != std::u16string_view::npos)
        refuse("a text that isn't UTF-16");
    m_json.text(toUtf8(text));
}

void ProjectWriter::writeFlag(std::string_view key, bool flag)
{
    if (!flag)
        return;
    m_json.key(key);
    m_json.boolean(true);
}

void ProjectWriter::writeKey(std::string_view key)
{
    if (!isWellFormed(key) || key.find('\0') != std::string_view::npos)
        refuse("the key of an attribute that isn't UTF-8");
    m_json.key(key);
}

void ProjectWriter::enter()
{
    if (++m_depth > Project::DeepestNesting)
        refuse("nested deeper than " + std::to_string(Project::DeepestNesting) + " levels");
}

void ProjectWriter::refuse(const std::string& fault) const
{
    throw FileFault(m_json.place(), fault);
}

} // namespace standin
