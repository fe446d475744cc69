// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventSort.h"

#include "core/edl/EventBase.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <tuple>
#include <utility>

namespace cadrel::gui {

using core::EventBase;
using core::Timecode;

namespace {

/// A number whose unsigned order is the order of the signed one.
std::uint32_t ordered(std::int32_t number)
{
    return static_cast<std::uint32_t>(number) ^ 0x80000000U;
}

/// What a row is compared by. It is worked out once a row, because the events lie far apart in memory.
class RowKey {
public:
    RowKey(const EventBase* event, std::uint32_t position, std::size_t row, int column)
        : m_position(position), m_row(row)
    {
        if (event == nullptr)
            return;
        m_isThere = true;
        m_number = event->eventNumber();
        setColumn(*event, column);
    }

    std::size_t row() const { return m_row; }

    bool operator<(const RowKey& other) const { return fields() < other.fields(); }

private:
    std::tuple<const bool&, const std::array<std::uint32_t, 4>&, const std::string_view&, const std::uint32_t&,
               const std::uint32_t&>
    fields() const
    {
        return std::tie(m_isThere, m_leading, m_name, m_number, m_position);
    }

    void setColumn(const EventBase& event, int column)
    {
        switch (column) {
        case EventColumn::State:
            m_leading = {event.isValid() ? 1U : 0U};
            break;
        case EventColumn::Roll:
            setName(event.rollName());
            break;
        case EventColumn::ClipName:
            setName(event.clipName());
            break;
        case EventColumn::EdlFile:
            setName(event.edlFileName());
            break;
        case EventColumn::Transition:
            m_leading = {ordered(event.transitionType())};
            break;
        case EventColumn::SrcIn:
            setTimecode(event.srcIn());
            break;
        case EventColumn::SrcOut:
            setTimecode(event.srcOut());
            break;
        case EventColumn::DstIn:
            setTimecode(event.dstIn());
            break;
        case EventColumn::DstOut:
            setTimecode(event.dstOut());
            break;
        default:
            // The event number is compared anyway.
            break;
        }
    }

    void setTimecode(const Timecode& timecode)
    {
        m_leading = {ordered(timecode.hours()), ordered(timecode.minutes()), ordered(timecode.seconds()),
                     ordered(timecode.frames())};
    }

    /// Its first bytes settle most comparisons.
    void setName(const std::string& name)
    {
        m_name = name;
        constexpr std::size_t WordSize = sizeof(std::uint32_t);
        const std::size_t leadingBytes = std::min(name.size(), m_leading.size() * WordSize);
        for (std::size_t index = 0; index < leadingBytes; ++index) {
            const std::uint32_t byte = static_cast<unsigned char>(name[index]);
            m_leading[index / WordSize] |= byte << 8U * (WordSize - 1 - index % WordSize);
        }
    }

    std::array<std::uint32_t, 4> m_leading = {};
    std::string_view m_name;
    std::uint32_t m_number = 0;
    std::uint32_t m_position;
    std::size_t m_row;
    bool m_isThere = false;
};

} // namespace

void sortEventRows(std::vector<EventRow>& rows, const SortKey& key)
{
    // The keys look into names of the events.
    std::vector<std::shared_ptr<EventBase>> held;
    held.reserve(rows.size());
    std::vector<RowKey> keys;
    keys.reserve(rows.size());
    for (std::size_t row = 0; row < rows.size(); ++row) {
        held.push_back(rows[row].event.lock());
        keys.emplace_back(held.back().get(), rows[row].position, row, key.column);
    }

    const auto isBefore = [&key](const RowKey& a, const RowKey& b) { return key.forwards ? b < a : a < b; };
    // Most lists come in their order.
    if (std::is_sorted(keys.begin(), keys.end(), isBefore))
        return;
    std::sort(keys.begin(), keys.end(), isBefore);

    std::vector<EventRow> sorted;
    sorted.reserve(rows.size());
    for (const RowKey& next : keys)
        sorted.push_back(std::move(rows[next.row()]));
    rows = std::move(sorted);
}

} // namespace cadrel::gui
