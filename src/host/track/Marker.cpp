// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/track/Marker.h"

#include "host/border/HostFailure.h"
#include "host/track/HostEvent.h"
#include "host/track/Instant.h"
#include "host/track/Track.h"
#include "velmark/Attributes.h"
#include "velmark/ClassId.h"
#include "velmark/Context.h"

#include <algorithm>

using namespace Velmark;

namespace cadrel::host {

namespace {

/// In seconds.
constexpr double LongestPoint = 0.01;

} // namespace

void Marker::insertInto(IHostContext* context, IEditTransaction& transaction, const Track& track) const
{
    if (!track.isAlive())
        throw util::Result::NotAvailable;
    // A host refuses an event that ends before it starts, and one change event would end the whole run.
    const auto [first, last] = std::minmax(start, end);
    const bool isRange = isBefore(LongestPoint, last - first);
    HostEvent marker(track,
                     required(create<IProjectNode>(context, isRange ? ClassId::RangeMarker : ClassId::PointMarker)));
    marker.setStart(transaction, first);
    if (isRange)
        marker.setEnd(transaction, last);
    requireOk(transaction.insert(track.container().get(), marker.node()));
    marker.setName(transaction, name);
    requireOk(marker.node()->setAttribute(AttributeKey::Reel, FVariant::string(reel.c_str()), true));
    if (userId != 0)
        marker.setUserId(userId);
}

} // namespace cadrel::host
