// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/shell/StoredChange.h"

#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "core/protect/RunRecord.h"
#include "core/serialize/ByteArchive.h"
#include "core/settings/Settings.h"
#include "core/time/FramerateProvider.h"
#include "core/time/Timecode.h"
#include "desktop/tracks/ProjectClock.h"
#include "gui/table/EventRows.h"
#include "gui/table/StoredTable.h"
#include "standin/base/AttributeList.h"
#include "standin/project/Project.h"
#include "util/Result.h"
#include "velmark/Attributes.h"

#include <exception>
#include <variant>
#include <vector>

namespace desktop {

namespace core = cadrel::core;

using cadrel::util::Result;
using standin::AttributeList;
using Velmark::AttributeKey;

namespace {

template <class T>
const T* find(const standin::Project& project, const char* key)
{
    const auto found = project.attributes().find(key);
    return found == project.attributes().end() ? nullptr : std::get_if<T>(&found->second.value);
}

const standin::Bytes* storedBytes(const standin::Project& project)
{
    const auto* const object = find<Velmark::Counted<Velmark::FUnknown>>(project, AttributeKey::Storage);
    const auto* const list = object ? dynamic_cast<const AttributeList*>(object->get()) : nullptr;
    return list && list->values().contains(AttributeKey::StorageData) ? &list->values().at(AttributeKey::StorageData)
                                                                      : nullptr;
}

/// While it lives, all timecodes are read at the rate of one project.
class OwnRate : public core::FramerateProvider {
public:
    explicit OwnRate(const core::Framerate& framerate)
        : m_former(core::Timecode::framerateProvider()), m_framerate(framerate)
    {
        core::Timecode::setFramerateProvider(this);
    }
    OwnRate(const OwnRate&) = delete;
    OwnRate& operator=(const OwnRate&) = delete;
    ~OwnRate() { core::Timecode::setFramerateProvider(m_former); }

    core::Framerate getFramerate() const override { return m_framerate; }

private:
    const core::FramerateProvider* m_former;
    core::Framerate m_framerate;
};

/// The sound stands in the new cut where the last run of cuts has put it, or where a change EDL was carried out.
ChangeMap::State stateOf(const core::DataModel& model)
{
    const auto runs = core::RunRecord::find(model);
    if (!runs || runs->isEmpty())
        return ChangeMap::State::Planned;
    const auto source = core::ProtectedRun::sourceOf(model);
    const bool isDone = source == core::ProtectedRun::Source::Given
                            ? core::NextRun(model, source).hasBeenDone(*runs)
                            : runs->firstDifference(model.oldEdl()) && !runs->firstDifference(model.newEdl());
    return isDone ? ChangeMap::State::Carried : ChangeMap::State::Planned;
}

/// By what pictures are compared; names with versions are different ones where a row of the settings can't be used.
core::PictureNames namesOf(const core::Settings& settings)
try {
    return {settings.matchBy(), settings.vfxPatterns()};
} catch (Result::Type) {
    return {settings.matchBy(), {}};
}

/// The rows of the table are in its order.
std::optional<std::size_t> selectedEvent(core::DataModel& model)
{
    const core::EventList& list = model.changeEdl();
    const cadrel::gui::StoredTable table(model, core::ListKind::Change);
    std::vector<int> selected;
    table.selection(static_cast<int>(list.size())).forEach([&](int row) { selected.push_back(row); });
    if (selected.size() != 1)
        return std::nullopt;
    cadrel::gui::EventRows rows;
    if (const auto key = table.sortKey())
        rows.sort(*key);
    rows.reload(list);
    const auto event = rows.eventAt(selected.front());
    for (std::size_t index = 0; index < list.size(); ++index) {
        if (&list.at(index) == event.get())
            return index;
    }
    return std::nullopt;
}

} // namespace

bool StoredChange::look(const standin::Project& project)
{
    const auto* const checksum = find<Velmark::int64>(project, AttributeKey::StorageChecksum);
    const standin::Bytes* const bytes = storedBytes(project);
    if (!checksum || !bytes || m_checksum == *checksum)
        return false;
    m_checksum = *checksum;
    try {
        core::serialize::ByteArchive block;
        block.assign(bytes->data(), bytes->size());
        if (static_cast<std::uint32_t>(*checksum) != block.crc32())
            return false;
        const ProjectClock clock(project.frameRate(), project.timeOrigin());
        const OwnRate rate(clock.framerate());
        core::DataModel model;
        block >> model;
        m_map = ChangeMap(model.changeEdl(), model.oldEdl(), model.newEdl(), clock.framerate(), project.timeOrigin(),
                          stateOf(model), namesOf(model.settings()));
        m_event = selectedEvent(model);
        return true;
    } catch (Result::Type) {
        return false;
    } catch (const std::exception&) {
        // Such as a count in it for which there is no memory.
        return false;
    }
}

} // namespace desktop
