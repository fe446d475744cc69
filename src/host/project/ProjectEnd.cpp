// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/ProjectEnd.h"

#include "host/border/HostFailure.h"
#include "host/border/NumberList.h"
#include "host/track/Instant.h"
#include "velmark/Attributes.h"

#include <algorithm>
#include <vector>

using namespace Velmark;

namespace cadrel::host {

void ProjectEnd::putOffTo(double end, bool isPreviewWritten)
{
    const std::optional<PutOff> before = putOff();
    if (before && !isStillAt(before->to))
        return;
    const double present = root()->getEnd(nullptr);
    const bool isSet = isBefore(m_contentEnd(), present);
    if (!isBefore(present, end) || (!before && !isSet && isPreviewWritten))
        return;
    const double from = before ? before->from : isSet ? present : 0.0;
    // First, so that no end is put off that nobody knows to put back.
    keep({from, end});
    if (m_document->setProjectEnd(end) == ResultOk)
        return;
    if (before)
        keep(*before);
    else
        forget();
    throw util::Result::HostCallFailed;
}

void ProjectEnd::putBack()
{
    const std::optional<PutOff> before = putOff();
    if (before && isStillAt(before->to))
        requireOk(m_document->setProjectEnd(before->from));
    forget();
}

Counted<IProjectNode> ProjectEnd::root() const
{
    return required(query<IProjectNode>(m_document));
}

std::optional<ProjectEnd::PutOff> ProjectEnd::putOff() const
{
    const std::optional<std::vector<double>> numbers = readNumbers(*root(), AttributeKey::ProjectEnd);
    if (!numbers || numbers->size() != 2)
        return std::nullopt;
    // It's only ever put off, and none lies before the time origin.
    if (numbers->front() < 0.0 || numbers->back() < numbers->front())
        return std::nullopt;
    return PutOff{numbers->front(), numbers->back()};
}

void ProjectEnd::keep(const PutOff& putOff) const
{
    writeNumbers(m_hostContext, *root(), AttributeKey::ProjectEnd, {putOff.from, putOff.to});
}

void ProjectEnd::forget() const
{
    removeNumbers(*root(), AttributeKey::ProjectEnd);
}

bool ProjectEnd::isStillAt(double end) const
{
    // What lies past it hides it.
    return isWithin(root()->getEnd(nullptr), end, std::max(end, m_contentEnd()));
}

} // namespace cadrel::host
