// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/HostEvent.h"

#include "host/border/HostFailure.h"
#include "host/border/NodeReading.h"
#include "host/track/Track.h"
#include "util/HostString.h"
#include "velmark/Attributes.h"
#include "velmark/Editing.h"
#include "velmark/Events.h"
#include "velmark/Media.h"
#include "velmark/StringObject.h"

#include <utility>

using namespace Velmark;
using cadrel::util::Result;

namespace cadrel::host {

HostEvent::HostEvent(const Track& track, Counted<IProjectNode> event) : m_track(&track), m_event(std::move(event)) {}

bool HostEvent::isClip() const
{
    return static_cast<bool>(query<IClipEvent>(&event()));
}

bool HostEvent::isMarker() const
{
    return event().isType(TypeWord::Marker);
}

bool HostEvent::isRange() const
{
    return event().isType(TypeWord::Range);
}

Counted<IMediaClip> HostEvent::getClip() const
{
    return Counted<IMediaClip>::share(required(query<IClipEvent>(&event()))->getClip());
}

void HostEvent::setClip(IMediaClip* clip, std::int32_t flags)
{
    requireOk(required(query<IClipEvent>(&event()))->setClip(clip, flags));
}

std::uint32_t HostEvent::getClipFrameCount() const
{
    return required(getClip())->getFrameCount();
}

double HostEvent::getStart() const
{
    return event().getStart(container().get()) + m_track->timeOrigin();
}

void HostEvent::setStart(IEditTransaction& /*transaction*/, double seconds)
{
    requireOk(event().setStart(container().get(), 0, hostTime(seconds)));
}

double HostEvent::getEnd() const
{
    return event().getEnd(container().get()) + m_track->timeOrigin();
}

void HostEvent::setEnd(IEditTransaction& /*transaction*/, double seconds)
{
    requireOk(event().setEnd(container().get(), 0, hostTime(seconds)));
}

void HostEvent::setLength(IEditTransaction& transaction, double seconds)
{
    requireOk(event().setLength(container().get(), &transaction, seconds));
}

double HostEvent::getSourceOffset() const
{
    return event().getSourceOffset(container().get());
}

std::wstring HostEvent::getName() const
{
    return nameOf(event());
}

void HostEvent::setName(IEditTransaction& /*transaction*/, const std::wstring& name)
{
    const auto text = makeCounted<StringObject>(util::HostString(name).utf16());
    requireOk(event().setName(container().get(), text.get(), 0));
}

std::int64_t HostEvent::getUserId() const
{
    FVariant id;
    const bool isThere = event().getAttribute(AttributeKey::EventUserId, id) == ResultOk;
    return isThere && (id.isInteger() || id.isString() || id.isObject()) ? id.asInteger() : -1;
}

void HostEvent::setUserId(std::int64_t id)
{
    IProjectNode& node = event();
    if (id < 0)
        throw Result::InvalidArgument;
    requireOk(node.setAttribute(AttributeKey::EventUserId, FVariant::integer(id), true));
}

void HostEvent::remove(IEditTransaction& transaction)
{
    IProjectNode& node = event();
    requireOk(transaction.remove(container().get(), &node));
}

IProjectNode& HostEvent::event() const
{
    if (!m_track || !m_event || !m_track->isAlive())
        throw Result::NotAvailable;
    return *m_event;
}

Counted<FUnknown> HostEvent::container() const
{
    return m_track->container();
}

double HostEvent::hostTime(double seconds) const
{
    return seconds - m_track->timeOrigin();
}

} // namespace cadrel::host
