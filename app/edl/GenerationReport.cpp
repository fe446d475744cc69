// SPDX-License-Identifier: GPL-3.0-or-later

#include "app/edl/GenerationReport.h"

#include "app/console/Printable.h"
#include "app/console/Wording.h"
#include "app/edl/ScreenTimecode.h"
#include "core/edl/EventBase.h"
#include "core/edl/HealedEvent.h"
#include "core/model/DataModel.h"
#include "core/time/Timecode.h"

#include <algorithm>
#include <unordered_set>
#include <utility>

namespace cadrel::app {

using core::DataModel;
using core::EventList;
using core::Framerate;
using core::HealedEvent;
using core::Timecode;
using nlohmann::ordered_json;

namespace {

/// What was read, and what couldn't be.
ordered_json sideToJson(const EventList& events, const std::vector<std::string>& names,
                        const std::vector<UnreadOfFile>& unread)
{
    ordered_json side = describeEventsAsJson(events, names);
    side["unread"] = app::toJson(unread);
    return side;
}

/// "93.6".
std::string percentOf(const Coverage& coverage)
{
    const std::int32_t permille = coverage.permille();
    return std::to_string(permille / 10) + "." + std::to_string(permille % 10);
}

} // namespace

std::string describeEvents(const EventList& events, const std::vector<std::string>& names, std::size_t unreadLines)
{
    const std::size_t invalid = events.countInvalid();
    const auto reversed = std::ranges::count_if(events.events(), [](const auto& event) { return event->isReversed(); });
    const std::string title = names.empty() ? "" : toPrintable(joined(names)).text + ": ";
    return title + counted(events.size(), "event") + ", " +
           (invalid == 0 ? "all valid" : std::to_string(invalid) + " invalid") +
           (reversed == 0 ? "" : ", " + std::to_string(reversed) + " reversed") +
           (unreadLines == 0 ? "" : ", " + counted(unreadLines, "line") + " not read");
}

ordered_json describeEventsAsJson(const EventList& events, const std::vector<std::string>& names)
{
    return {{"files", names}, {"events", events.size()}, {"invalid", events.countInvalid()}};
}

std::vector<std::string> edlFilesOf(const EventList& events)
{
    std::vector<std::string> files;
    std::unordered_set<std::string> known;
    for (const auto& event : events.events()) {
        // What was generated wasn't read from any.
        if (!event->edlFileName().empty() && known.insert(event->edlFileName()).second)
            files.push_back(event->edlFileName());
    }
    return files;
}

GenerationReport::GenerationReport(const DataModel& model, const EventList& carried, Cuts cuts,
                                   const Framerate& framerate)
    : m_model(model), m_cuts(std::move(cuts)), m_framerate(framerate), m_coverage(model.newEdl(), carried, framerate)
{
    for (const auto& event : model.changeEdl().events()) {
        if (const auto* healed = dynamic_cast<const HealedEvent*>(event.get())) {
            ++m_healedEvents;
            m_healedMembers += healed->healedEvents().size();
        }
    }
}

std::string GenerationReport::cutsText(const std::string& rate) const
{
    return "Old cut     " + describeEvents(m_model.oldEdl(), m_cuts.oldNames, countOf(m_cuts.oldUnread)) + "\n" + //
           "New cut     " + describeEvents(m_model.newEdl(), m_cuts.newNames, countOf(m_cuts.newUnread)) + "\n" + //
           "Frame rate  " + rate + "\n";
}

std::string GenerationReport::changeText() const
{
    std::string healed;
    if (m_healedEvents > 0)
        healed = ", " + std::to_string(m_healedEvents) + " of them healed from " + std::to_string(m_healedMembers);
    return "Change EDL  " + counted(m_model.changeEdl().size(), "event") + healed + "\n" + //
           "Covered     " + shown(m_coverage.coveredFrames) + " of " + shown(m_coverage.programmeFrames) + ", " +
           percentOf(m_coverage) + " %\n";
}

std::string GenerationReport::insertsText() const
{
    if (m_coverage.inserts.empty())
        return "Inserts     none\n";
    std::string text = "Inserts     " + std::to_string(m_coverage.inserts.size()) + ", together " +
                       shown(m_coverage.insertedFrames()) + "\n\n" +
                       "            in           out          length       shot\n";
    for (const Insert& insert : m_coverage.inserts) {
        text += "            " + shown(insert.start) + "  " + shown(insert.end) + "  " + shown(insert.frames()) + "  " +
                toPrintable(insert.shot, 40).text;
        text += insert.moreShots == 0 ? "\n" : " and " + std::to_string(insert.moreShots) + " more\n";
    }
    return text + "\n";
}

ordered_json GenerationReport::toJson() const
{
    ordered_json inserts = ordered_json::array();
    for (const Insert& insert : m_coverage.inserts) {
        inserts.push_back({{"dstIn", timecode(insert.start)},
                           {"dstOut", timecode(insert.end)},
                           {"frames", insert.frames()},
                           {"shot", insert.shot},
                           {"moreShots", insert.moreShots}});
    }
    return {{"old", sideToJson(m_model.oldEdl(), m_cuts.oldNames, m_cuts.oldUnread)},
            {"new", sideToJson(m_model.newEdl(), m_cuts.newNames, m_cuts.newUnread)},
            {"unmatched", m_cuts.unmatched},
            {"healed", {{"events", m_healedEvents}, {"members", m_healedMembers}}},
            {"programmeFrames", m_coverage.programmeFrames},
            {"coveredFrames", m_coverage.coveredFrames},
            {"inserts", std::move(inserts)}};
}

std::string GenerationReport::shown(std::int32_t frames) const
{
    return onScreen(timecode(frames), m_framerate);
}

std::string GenerationReport::timecode(std::int32_t frames) const
{
    Timecode timecode;
    timecode.setFrameCount(frames, m_framerate);
    return timecode.toString();
}

} // namespace cadrel::app
