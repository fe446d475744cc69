#include "core/CadrelInformationAlgorithm.h"

#include "core/CadrelRunState.h"
#include "core/CutList.h"
#include "core/EventBase.h"
#include "core/MatchBy.h"
#include "core/ProgressHandlerBase.h"
#include "core/Settings.h"
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
