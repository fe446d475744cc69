#include "app/edl/GenerationReport.h"

#include "app/Printable.h"
#include "app/Wording.h"
#include "core/DataModel.h"
#include "core/HealedEvent.h"
#include "core/Timecode.h"

#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventList;
using core::Framerate;
using core::HealedEvent;
using core::Timecode;
using nlohmann::ordered_json;

namespace {

ordered_json sideToJson(const EventList& events, const std::vector<std::string>& names)
{
    return {{"files", names}, {"events", events.size()}, {"invalid", events.countInvalid()}};
}

/// "93.6".
std::string percentOf(const Coverage& coverage)
{
    const std::int32_t permille = coverage.permille();
    return std::to_string(permille / 10) + "." + std::to_string(permille % 10);
}

} // namespace

std::string describeEvents(const EventList& events, const std::vector<std::string>& names)
{
    const std::size_t invalid = events.countInvalid();
    return toPrintable(joined(names)).text + ": " + counted(events.size(), "event") + ", " +
           (invalid == 0 ? "all valid" : std::to_string(invalid) + " invalid");
}

GenerationReport::GenerationReport(const DataModel& model, Cuts cuts, const Framerate& framerate)
    : model_(model), cuts_(std::move(cuts)), framerate_(framerate),
      coverage_(model.newEdl(), model.changeEdl(), framerate)
{
    for (const auto& event : model.changeEdl().events()) {
        if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get())) {
            ++healedEvents_;
            healedMembers_ += healed->healedEvents().size();
        }
    }
}

std::string GenerationReport::cutsText(const std::string& rate) const
{
    return "Old cut     " + describeEvents(model_.oldEdl(), cuts_.oldNames) + "\n" + //
           "New cut     " + describeEvents(model_.newEdl(), cuts_.newNames) + "\n" + //
           "Frame rate  " + rate + "\n";
}

std::string GenerationReport::changeText() const
{
    std::string healed;
    if (healedEvents_ > 0)
        healed = ", " + std::to_string(healedEvents_) + " of them healed from " + std::to_string(healedMembers_);
    return "Change EDL  " + counted(model_.changeEdl().size(), "event") + healed + "\n" + //
           "Covered     " + timecode(coverage_.coveredFrames) + " of " + timecode(coverage_.programmeFrames) + ", " +
           percentOf(coverage_) + " %\n";
}

std::string GenerationReport::insertsText() const
{
    if (coverage_.inserts.empty())
        return "Inserts     none\n";
    std::string text = "Inserts     " + std::to_string(coverage_.inserts.size()) + ", together " +
                       timecode(coverage_.insertedFrames()) + "\n\n" +
                       "            in           out          length       shot\n";
    for (const Insert& insert : coverage_.inserts) {
        text += "            " + timecode(insert.start) + "  " + timecode(insert.end) + "  " +
                timecode(insert.frames()) + "  " + toPrintable(insert.shot, 40).text;
        text += insert.moreShots == 0 ? "\n" : " and " + std::to_string(insert.moreShots) + " more\n";
    }
    return text + "\n";
}

ordered_json GenerationReport::toJson() const
{
    ordered_json inserts = ordered_json::array();
    for (const Insert& insert : coverage_.inserts) {
        inserts.push_back({{"dstIn", timecode(insert.start)},
                           {"dstOut", timecode(insert.end)},
                           {"frames", insert.frames()},
                           {"shot", insert.shot},
                           {"moreShots", insert.moreShots}});
    }
    return {{"old", sideToJson(model_.oldEdl(), cuts_.oldNames)},
            {"new", sideToJson(model_.newEdl(), cuts_.newNames)},
            {"healed", {{"events", healedEvents_}, {"members", healedMembers_}}},
            {"programmeFrames", coverage_.programmeFrames},
            {"coveredFrames", coverage_.coveredFrames},
            {"inserts", std::move(inserts)}};
}

std::string GenerationReport::timecode(std::int32_t frames) const
{
    Timecode timecode;
    timecode.setFrameCount(frames, framerate_);
    return timecode.toString();
}

} // namespace cadrel::app
