// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/Track.h"

#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/track/AutomationCurve.h"
#include "host/track/Instant.h"
#include "host/track/TrackIndex.h"
#include "host/track/TrackProject.h"
#include "util/HostString.h"
#include "velmark/Attributes.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/StringObject.h"

#include <algorithm>
#include <array>
#include <iterator>
#include <limits>
#include <map>
#include <set>
#include <utility>

using namespace Velmark;
using cadrel::util::Result;

namespace cadrel::host {

namespace {

/// eventAt looks this far to both sides, in seconds: half a frame of 25 a second.
constexpr double HalfFrame = 0.02;

/// The kinds of tracks whose events eventAt and clipEvents know.
constexpr std::array EventKinds{TypeWord::Audio, TypeWord::Marker, TypeWord::Video};

/// Where an event stands, in seconds from the time origin. One in a part ends with the outermost part around it.
core::SecondsRange spanOf(IProjectNode& event, FUnknown* times)
{
    core::SecondsRange span{event.getStart(times), event.getEnd(times)};
    Counted<IProjectNode> outermost;
    const auto self = query<IEventNode>(&event);
    for (IEventNode* owner = self ? self->getOwner() : nullptr; owner; owner = owner->getOwner()) {
        auto node = query<IProjectNode>(owner);
        if (!node)
            break;
        outermost = std::move(node);
    }
    if (!outermost)
        return span;
    span.end = outermost->getEnd(times);
    IProjectNode* const parent = outermost->getParent();
    if (parent && parent->isType(TypeWord::Part))
        span.end += parent->getStart(times);
    return span;
}

/// The same of an event that has to be in order.
core::SecondsRange orderedSpanOf(IProjectNode& event, FUnknown* times)
{
    const core::SecondsRange span = spanOf(event, times);
    if (span.start > span.end)
        throw Result::InvalidArgument;
    return span;
}

std::int64_t idAfter(std::int64_t id)
{
    if (id == std::numeric_limits<std::int64_t>::max())
        throw Result::OutOfRange;
    return id + 1;
}

} // namespace

Track::Track(TrackProject* project, ITrackNode* track) : m_project(project), m_track(Counted<ITrackNode>::share(track))
{
    if (m_project)
        m_project->addListener(this);
}

Track::Track(const Track& other)
    : ProjectListener(other), m_project(other.m_project), m_track(other.m_track), m_needsCheck(other.m_needsCheck)
{
    if (m_project)
        m_project->addListener(this);
}

Track& Track::operator=(const Track& other)
{
    if (m_project != other.m_project) {
        if (m_project)
            m_project->removeListener(this);
        m_project = other.m_project;
        if (m_project)
            m_project->addListener(this);
    }
    m_track = other.m_track;
    m_needsCheck = other.m_needsCheck;
    return *this;
}

Track::~Track()
{
    if (m_project)
        m_project->removeListener(this);
}

bool Track::isAlive() const
{
    if (!m_project || !m_track)
        return false;
    if (m_needsCheck) {
        if (!m_project->isTrackAlive(m_track.get()))
            m_track.reset();
        m_needsCheck = false;
    }
    return static_cast<bool>(m_track);
}

void Track::projectChanging(Project& /*project*/)
{
    noteChange();
}

void Track::projectChanged(Project& /*project*/)
{
    noteChange();
}

bool Track::isAudio() const
{
    return isKind(TypeWord::Audio);
}

bool Track::isMarker() const
{
    return isKind(TypeWord::Marker);
}

bool Track::isVideo() const
{
    return isKind(TypeWord::Video);
}

bool Track::isFolder() const
{
    return isKind(TypeWord::Folder);
}

bool Track::isSelected() const
{
    const auto node = liveNode();
    return node && node->isSelected();
}

bool Track::hasChanged() const
{
    const auto node = liveNode();
    return node && (node->changeFlags() & ChangeFlag::Content) != 0;
}

std::wstring Track::getName() const
{
    const auto node = liveNode();
    return node ? nameOf(*node) : std::wstring();
}

void Track::setName(const std::wstring& name)
{
    const auto node = requiredNode();
    const auto text = makeCounted<StringObject>(util::HostString(name).utf16());
    requireOk(node->setName(container().get(), text.get(), 0));
}

std::int32_t Track::role() const
{
    return isAlive() ? static_cast<std::int32_t>(integerAttribute(roleKey()).value_or(-1)) : -1;
}

void Track::setRole(std::int32_t role)
{
    const auto node = requiredNode();
    requireOk(node->setAttribute(roleKey(), FVariant::integer(role), true));
}

void Track::removeRole()
{
    const auto node = requiredNode();
    if (node->hasAttribute(roleKey()) == ResultOk)
        requireOk(node->removeAttribute(roleKey()));
}

bool Track::hasRole(std::int32_t role, std::int32_t mask) const
{
    if (!isAlive())
        return false;
    const std::optional<std::int64_t> stored = integerAttribute(roleKey());
    return stored && (static_cast<std::int32_t>(*stored) & mask) == (role & mask);
}

bool Track::hostLocked() const
{
    return isAlive() && m_track->getFlag(TrackFlag::Lock) == ResultOk;
}

bool Track::hasLockState() const
{
    return integerAttribute(AttributeKey::LockState).value_or(0) != 0;
}

void Track::setLock(bool lock)
{
    const auto node = requiredNode();
    const bool wasLocked = hostLocked();
    requireOk(m_track->setFlag(TrackFlag::Lock, lock));
    if (node->setAttribute(AttributeKey::LockState, FVariant::integer(lock ? 1 : 0), true) != ResultOk) {
        // Nobody would know whose lock it is, and take it away.
        m_track->setFlag(TrackFlag::Lock, wasLocked);
        throw Result::HostCallFailed;
    }
}

std::vector<HostEvent> Track::eventsInRange(double start, double end) const
{
    std::vector<HostEvent> events;
    const auto node = liveNode();
    if (!node)
        return events;
    if (start > end)
        throw Result::InvalidArgument;
    const auto times = container();
    for (Counted<IProjectNode>& child : childrenOf(*node)) {
        if (countsAsIn({child->getStart(times.get()), child->getEnd(times.get())}, {start, end}))
            events.emplace_back(*this, std::move(child));
    }
    return events;
}

//     window                      |----|
//     Forward finds        |---|    |------|          and not what ends in the window, when it is alone
//     Backward finds       |--------| |------|        and not what starts in the window, when it is alone
HostEvent Track::eventAt(double time, Direction direction) const
{
    const double low = time - HalfFrame;
    const double high = time + HalfFrame;
    std::map<double, HostEvent> touching;
    for (const HostEvent& event : clipEvents()) {
        const double start = event.getStart();
        if (!isBefore(event.getEnd(), low) && !isBefore(high, start))
            touching.insert_or_assign(start, event);
    }
    if (touching.empty())
        return {};
    const bool isBackward = direction == Direction::Backward;
    const HostEvent& found = (isBackward ? touching.begin() : std::prev(touching.end()))->second;
    if (touching.size() == 1 && isWithin(isBackward ? found.getStart() : found.getEnd(), low, high))
        return {};
    return found;
}

std::vector<HostEvent> Track::clipEvents() const
{
    std::vector<HostEvent> events;
    const auto kind = std::ranges::find_if(EventKinds, [this](const char* word) { return isKind(word); });
    if (kind == EventKinds.end())
        return events;
    for (Counted<IProjectNode>& child : childrenOf(*liveNode())) {
        if (child->isType(*kind))
            events.emplace_back(*this, std::move(child));
    }
    return events;
}

core::SecondsRange Track::eventSpan(const HostEvent& event) const
{
    if (!event)
        throw Result::NotAvailable;
    return orderedSpanOf(*event.node(), container().get());
}

void Track::assignIds(double start, double end)
{
    std::int64_t last = highestUserId();
    for (HostEvent& event : eventsInRange(start, end)) {
        if (event.getUserId() == -1)
            event.setUserId(last = idAfter(last));
    }
}

void Track::assignOwnIds(double start, double end)
{
    std::vector<HostEvent> events = eventsInRange(start, end);
    std::erase_if(events,
                  [until = end + timeOrigin()](const HostEvent& event) { return !isBefore(event.getStart(), until); });
    std::int64_t last = highestUserId();
    std::set<std::int64_t> taken{-1, 0};
    for (HostEvent& event : events) {
        if (!taken.insert(event.getUserId()).second)
            event.setUserId(last = idAfter(last));
    }
}

std::int64_t Track::nextUserId() const
{
    return idAfter(highestUserId());
}

void Track::removeAll(IEditTransaction& transaction)
{
    removeChildren(transaction, childrenOf(*requiredNode()));
}

void Track::removeEvent(IEditTransaction& transaction, HostEvent& event)
{
    event.remove(transaction);
}

void Track::removeRange(IEditTransaction& transaction, double start, double end)
{
    const auto node = requiredNode();
    if (start > end)
        throw Result::InvalidArgument;
    const double from = start - timeOrigin();
    const double to = end - timeOrigin();
    std::vector<Counted<IProjectNode>> children = childrenOf(*node);
    std::erase_if(children, [from, to, times = container()](const Counted<IProjectNode>& child) {
        const core::SecondsRange span = orderedSpanOf(*child, times.get());
        return isBefore(span.start, from) || !isBefore(span.start, to) || isBefore(to, span.end);
    });
    removeChildren(transaction, children);
}

TrackIndex Track::readIndex() const
{
    const auto node = required(liveNode());
    const auto times = container();
    std::vector<core::SecondsRange> spans;
    for (const Counted<IProjectNode>& child : childrenOf(*node))
        spans.push_back(spanOf(*child, times.get()));
    return TrackIndex(TrackSpans(spans), prepareVirginRange(), timeOrigin());
}

std::vector<AutomationCurve> Track::prepareVirginRange() const
{
    std::vector<AutomationCurve> curves;
    if (!isAlive())
        return curves;
    for (const Counted<IProjectNode>& curve : curvesOf(*m_track))
        curves.emplace_back(curve.get(), timeOrigin());
    return curves;
}

void Track::fillAutomationGap(IEditTransaction& transaction, std::vector<AutomationCurve>& curves, double start,
                              double end) const
{
    for (AutomationCurve& curve : curves)
        curve.fill(m_project->hostContext(), transaction, start, end);
}

double Track::timeOrigin() const
{
    return isAlive() ? m_project->timeOrigin() : 0.0;
}

Counted<FUnknown> Track::container() const
{
    if (!isAlive())
        throw Result::NotAvailable;
    return required(m_project->containerOf(m_track.get()));
}

Counted<IProjectNode> Track::liveNode() const
{
    return isAlive() ? required(query<IProjectNode>(m_track)) : nullptr;
}

Counted<IProjectNode> Track::requiredNode() const
{
    auto node = liveNode();
    if (!node)
        throw Result::NotAvailable;
    return node;
}

bool Track::isKind(const char* word) const
{
    const auto node = liveNode();
    return node && node->isType(TypeWord::Track) && node->isType(word);
}

const char* Track::roleKey() const
{
    if (isMarker())
        return AttributeKey::MarkerType;
    if (isVideo())
        return AttributeKey::VideoType;
    if (isFolder())
        return AttributeKey::FolderType;
    throw Result::NotSupported;
}

std::optional<std::int64_t> Track::integerAttribute(const char* key) const
{
    FVariant value;
    const auto node = liveNode();
    if (!node || node->getAttribute(key, value) != ResultOk || !value.isInteger())
        return std::nullopt;
    return value.asInteger();
}

std::int64_t Track::highestUserId() const
{
    std::int64_t highest = 0;
    for (const HostEvent& event : clipEvents())
        highest = std::max(highest, event.getUserId());
    return highest;
}

void Track::removeChildren(IEditTransaction& transaction, const std::vector<Counted<IProjectNode>>& children)
{
    const auto parent = container();
    for (const Counted<IProjectNode>& child : children)
        requireOk(transaction.remove(parent.get(), child.get()));
}

void Track::noteChange()
{
    if (m_needsCheck)
        return;
    const auto node = query<IProjectNode>(m_track);
    m_needsCheck = !node || (node->changeFlags() & ChangeFlag::Removed) != 0;
}

} // namespace cadrel::host
