// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MemoMark.h"

#include "host/border/HostFailure.h"
#include "host/project/EventPrint.h"
#include "velmark/Attributes.h"
#include "velmark/ProjectNode.h"

using namespace Velmark;

namespace cadrel::host {

namespace {

constexpr int PrintBits = 32;

} // namespace

MemoMark MemoMark::of(IProjectNode& copy)
{
    return {placePrintOf(copy), namePrintOf(copy)};
}

std::optional<MemoMark> MemoMark::keptBy(IProjectNode& copy)
{
    FVariant kept;
    if (copy.getAttribute(AttributeKey::Followed, kept) != ResultOk || !kept.isInteger())
        return std::nullopt;
    const auto number = static_cast<std::uint64_t>(kept.asInteger());
    return MemoMark{static_cast<std::uint32_t>(number >> PrintBits), static_cast<std::uint32_t>(number)};
}

void MemoMark::keepOn(IProjectNode& copy) const
{
    // A print has less than 32 bits.
    const std::int64_t number = (std::int64_t{place} << PrintBits) | std::int64_t{name};
    requireOk(copy.setAttribute(AttributeKey::Followed, FVariant::integer(number), true));
}

void MemoMark::renewOn(IProjectNode& copy)
{
    of(copy).keepOn(copy);
}

bool MemoMark::isUpToDateOn(IProjectNode& copy)
{
    return keptBy(copy) == of(copy);
}

} // namespace cadrel::host
