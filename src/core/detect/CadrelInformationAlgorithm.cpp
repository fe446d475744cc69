// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/detect/CadrelInformationAlgorithm.h"

#include "core/cut/CadrelRunState.h"
#include "core/cut/CutList.h"
#include "core/cut/ProgressHandlerBase.h"
#include "core/edl/EventBase.h"
#include "core/settings/MatchBy.h"
#include "core/settings/Settings.h"
#include "util/Result.h"

namespace cadrel::core {

using util::Result;

void CadrelInformationAlgorithm::report(ProgressHandlerBase* progress, std::uint64_t steps)
{
    if (progress)
        progress->tick(steps);
}

void CadrelInformationAlgorithm::stopIfCancelled(ProgressHandlerBase* progress)
{
    if (progress && progress->isCancelled())
        throw Result::Cancelled;
}

const std::string& CadrelInformationAlgorithm::nameOf(const EventBase& event, const CadrelRunState& state)
{
    return state.settings->matchBy() != MatchBy::RollName ? event.clipName() : event.rollName();
}

std::vector<std::shared_ptr<Cut>> CadrelInformationAlgorithm::inTimeOrder(const CutList& cuts)
{
    const auto ordered = cuts.orderedByStart();
    std::vector<std::shared_ptr<Cut>> found;
    found.reserve(ordered.size());
    for (const auto& [start, reference] : ordered) {
        if (auto cut = reference.lock())
            found.push_back(std::move(cut));
    }
    return found;
}

} // namespace cadrel::core
