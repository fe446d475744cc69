// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/table/EventTableModel.h"

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/model/DataModel.h"
#include "gui/guard/Guard.h"
#include "gui/table/EventCells.h"
#include "gui/table/EventEdits.h"
#include "gui/table/EventMenu.h"
#include "gui/table/EventTable.h"
#include "gui/table/EventTablePainter.h"

#include <algorithm>
#include <unordered_set>
#include <utility>

namespace cadrel::gui {

using core::EventBase;

namespace {

juce::String toString(const std::wstring& text)
{
    return text.c_str();
}

/// Adding many ranges to JUCE's set one by one takes it seconds. Gaps that are taken out of one range in ascending order take
/// no time.
juce::SparseSet<int> toSparseSet(const RowSet& rows)
{
    juce::SparseSet<int> set;
    if (rows.isEmpty())
        return set;
    const auto& ranges = rows.ranges();
    set.addRange({ranges.front().first, ranges.back().end});
    for (std::size_t index = 1; index < ranges.size(); ++index)
        set.removeRange({ranges[index - 1].end, ranges[index].first});
    return set;
}

RowSet toRowSet(const juce::SparseSet<int>& set)
{
    RowSet rows;
    for (const juce::Range<int>& range : set.getRanges())
        rows.append(range.getStart(), range.getEnd());
    return rows;
}

/// Whether both are the same events, in whatever order.
bool areSame(const std::vector<std::weak_ptr<EventBase>>& offered, const EventTableModel::Events& selected)
{
    const auto isSame = [](const std::weak_ptr<EventBase>& a, const std::shared_ptr<EventBase>& b) {
        return a.lock() == b;
    };
    // They are in one order unless the table was sorted meanwhile.
    if (std::equal(offered.begin(), offered.end(), selected.begin(), selected.end(), isSame))
        return true;
    std::unordered_set<std::shared_ptr<EventBase>> events;
    for (const auto& event : offered)
        events.insert(event.lock());
    return events == std::unordered_set<std::shared_ptr<EventBase>>(selected.begin(), selected.end());
}

void addItems(juce::PopupMenu& menu, const std::vector<EventMenu::Item>& items)
{
    for (const EventMenu::Item& item : items) {
        if (!item.children.empty()) {
            juce::PopupMenu submenu;
            addItems(submenu, item.children);
            menu.addSubMenu(toString(item.text), std::move(submenu), item.isEnabled);
        } else if (item.id == EventMenu::Separator) {
            menu.addSeparator();
        } else {
            menu.addItem(item.id, toString(item.text), item.isEnabled);
        }
    }
}

} // namespace

class EventTableModel::Silence {
public:
    explicit Silence(EventTableModel& model)
        : m_model(model), m_life(model.m_life), m_wasSilent(std::exchange(model.m_isSilent, true))
    {
    }
    Silence(const Silence&) = delete;
    Silence& operator=(const Silence&) = delete;
    ~Silence()
    {
        if (!m_life.expired())
            m_model.m_isSilent = m_wasSilent;
    }

private:
    EventTableModel& m_model;
    Life m_life;
    bool m_wasSilent;
};

EventTableModel::EventTableModel(juce::TableListBox& table, core::EventList& list, core::DataModel& dataModel)
    : m_table(&table), m_list(&list), m_dataModel(dataModel),
      m_presentMenu([this](juce::PopupMenu& menu, juce::Point<int> position, std::function<void(int)> chosen) {
          menu.setLookAndFeel(&m_table->getLookAndFeel());
          menu.showMenuAsync(juce::PopupMenu::Options()
                                 .withTargetComponent(m_table.getComponent())
                                 .withTargetScreenArea({position.x, position.y, 1, 1})
                                 .withDeletionCheck(*m_table),
                             std::move(chosen));
      })
{
    const Silence silence(*this);
    m_rows.reload(list);
    // Rows that another model had selected mean nothing here.
    table.setModel(nullptr);
    table.setSelectedRows({}, juce::dontSendNotification);
    table.setModel(this);
    table.resized();
    table.getHeader().setSortColumnId(getSortColumn(), getSortForwards());
}

EventTableModel::~EventTableModel()
{
    if (m_table != nullptr && m_table->getModel() == this)
        guardSystem([&] { m_table->setModel(nullptr); });
}

void EventTableModel::reload(core::EventList& list)
{
    const Place kept = place();
    m_list = &list;
    m_rows.reload(list);
    m_isStale = false;
    restore(kept);
}

void EventTableModel::addListener(Listener* listener)
{
    if (listener != nullptr && std::find(m_listeners.begin(), m_listeners.end(), listener) == m_listeners.end())
        m_listeners.push_back(listener);
}

void EventTableModel::removeListener(Listener* listener)
{
    std::erase(m_listeners, listener);
}

template <class Action>
void EventTableModel::tell(const Action& action)
{
    const Life life = m_life;
    const std::vector<Listener*> called = m_listeners;
    for (auto listener = called.rbegin(); listener != called.rend() && !life.expired(); ++listener) {
        if (std::find(m_listeners.begin(), m_listeners.end(), *listener) != m_listeners.end())
            action(**listener);
    }
}

void EventTableModel::tellSelectionChanged()
{
    tell([this](Listener& listener) { listener.selectionChanged(*this); });
}

void EventTableModel::selectRows(const RowSet& rows)
{
    m_rows.select(rows);
    restore({});
}

bool EventTableModel::selectEvent(const std::shared_ptr<core::EventBase>& event)
{
    reloadIfStale();
    const int row = m_rows.rowOf(event);
    if (row < 0 || m_table == nullptr)
        return false;
    m_table->scrollToEnsureRowIsOnscreen(row);
    m_table->selectRow(row);
    return true;
}

void EventTableModel::setHighlight(const Events& events)
{
    m_rows.setHighlight(events);
    if (m_table == nullptr)
        return;
    const Silence silence(*this);
    // The rows say to screen readers whether they are related.
    m_table->updateContent();
    m_table->repaint();
}

// What is kept while the rows change.

bool EventTableModel::isPartlyInView(int row) const
{
    const int height = m_table->getRowHeight();
    const juce::Range<int> place(row * height, (row + 1) * height);
    return m_table->getViewport()->getViewArea().getVerticalRange().intersects(place);
}

EventTableModel::Place EventTableModel::place() const
{
    Place found;
    if (m_table == nullptr)
        return found;
    const int anchor = m_table->getLastRowSelected();
    found.anchor = m_rows.eventAt(anchor);
    if (found.anchor && isPartlyInView(anchor)) {
        found.watched = found.anchor;
        return found;
    }
    const int first = m_table->getViewport()->getViewPositionY() / m_table->getRowHeight();
    for (int row = first; row <= first + m_table->getNumRowsOnScreen() && !found.watched; ++row) {
        if (m_rows.selection().contains(row) && isPartlyInView(row))
            found.watched = m_rows.eventAt(row);
    }
    return found;
}

void EventTableModel::restore(const Place& place)
{
    if (m_table == nullptr)
        return;
    const Silence silence(*this);
    m_table->updateContent();
    // The scroll bar may have come or gone, and left the columns another width.
    m_table->resized();

    juce::SparseSet<int> selected = toSparseSet(m_rows.selection());
    const int anchor = m_rows.rowOf(place.anchor);
    const bool hasAnchor = m_rows.selection().contains(anchor);
    if (hasAnchor)
        selected.removeRange({anchor, anchor + 1});
    m_table->setSelectedRows(selected, juce::dontSendNotification);
    // The row that is selected last is where the keys go on.
    if (hasAnchor)
        m_table->selectRow(anchor, true, false);

    if (const int watched = m_rows.rowOf(place.watched); m_rows.selection().contains(watched))
        m_table->scrollToEnsureRowIsOnscreen(watched);
    m_table->repaint();
}

// Sorting.

void EventTableModel::applySort(int column, bool forwards)
{
    const SortKey key = {shownSortColumn(column), forwards};
    const Life life = m_life;
    sortBy(key);
    // The header calls back later, with the key that is there already.
    if (!life.expired() && m_table != nullptr)
        m_table->getHeader().setSortColumnId(key.column, key.forwards);
}

bool EventTableModel::sortBy(const SortKey& key)
{
    const Place kept = place();
    if (!m_rows.sort(key))
        return false;
    restore(kept);
    tell([this](Listener& listener) { listener.sortChanged(*this); });
    return true;
}

void EventTableModel::sortOrderChanged(int column, bool forwards)
{
    guardUser([&] { sortBy({column, forwards}); });
}

juce::String EventTableModel::getColumnName(int id)
{
    return toString(EventColumn::name(id));
}

// Cells.

void EventTableModel::paintRowBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected)
{
    guardSystem([&] {
        const bool isRelated = m_rows.isHighlighted(m_rows.eventAt(row));
        EventTablePainter::paintBackground(graphics, row, width, height, isSelected, isRelated);
    });
}

void EventTableModel::paintCell(juce::Graphics& graphics, int row, int column, int width, int height, bool isSelected)
{
    guardSystem([&] {
        if (const auto event = m_rows.eventAt(row))
            EventTablePainter::paintCell(graphics, *event, column, width, height, isSelected,
                                         m_rows.isHighlighted(event));
    });
}

juce::Component* EventTableModel::refreshComponentForCell(int, int, bool, juce::Component* existing)
{
    delete existing;
    return nullptr;
}

juce::String EventTableModel::getCellTooltip(int row, int column)
{
    juce::String text;
    guardSystem([&] {
        if (const auto event = m_rows.eventAt(row))
            text = toString(EventCells::tooltip(*event, column));
    });
    return text;
}

juce::String EventTableModel::getSpokenRow(int row) const
{
    const auto event = m_rows.eventAt(row);
    return event ? toString(EventCells::spokenRow(*event, m_rows.isHighlighted(event))) : juce::String();
}

juce::String EventTableModel::getSpokenCell(int row, int column) const
{
    const auto event = m_rows.eventAt(row);
    return event ? toString(EventCells::spokenText(*event, column, m_rows.isHighlighted(event))) : juce::String();
}

// What the user does.

void EventTableModel::selectedRowsChanged(int)
{
    if (m_isSilent || m_table == nullptr)
        return;
    guardUser([&] {
        m_rows.select(toRowSet(m_table->getSelectedRows()));
        tellSelectionChanged();
    });
}

void EventTableModel::selectAll()
{
    RowSet all;
    all.append(0, m_rows.count());
    if (m_table != nullptr && m_rows.selection() != all)
        m_table->setSelectedRows(toSparseSet(all), juce::sendNotification);
}

void EventTableModel::cellClicked(int row, int, const juce::MouseEvent& event)
{
    guardUser([&] {
        if (event.mods.isPopupMenu())
            openMenuAt(event.getScreenPosition(), row);
    });
}

void EventTableModel::cellDoubleClicked(int row, int, const juce::MouseEvent& event)
{
    guardUser([&] {
        if (event.mods.isLeftButtonDown() && !event.mods.isPopupMenu() && m_rows.selection().contains(row) &&
            getNumSelectedRows() == 1)
            requestEdit(m_rows.eventAt(row), event.getScreenPosition());
    });
}

void EventTableModel::returnKeyPressed(int lastRow)
{
    guardUser([&] {
        if (m_rows.selection().contains(lastRow) && getNumSelectedRows() == 1)
            requestEdit(m_rows.eventAt(lastRow), screenPositionOf(lastRow));
    });
}

void EventTableModel::deleteKeyPressed(int lastRow)
{
    guardUser([&] {
        if (lastRow >= 0)
            edit(EventMenu::Delete, lastRow);
    });
}

juce::Point<int> EventTableModel::screenPositionOf(int row) const
{
    return m_table == nullptr ? juce::Point<int>()
                              : m_table->localPointToGlobal(m_table->getRowPosition(row, true).getBottomLeft());
}

void EventTableModel::requestEdit(const std::shared_ptr<EventBase>& event, juce::Point<int> position)
{
    if (EventMenu::allowsEdit(event))
        tell([&](Listener& listener) { listener.editRequested(event, *this, position); });
}

// The menu.

void EventTableModel::openMenu()
{
    if (m_table == nullptr || m_rows.selection().isEmpty())
        return;
    const int last = m_table->getLastRowSelected();
    const int row = m_rows.selection().contains(last) ? last : m_rows.selection().ranges().front().first;
    m_table->scrollToEnsureRowIsOnscreen(row);
    openMenuAt(screenPositionOf(row), row);
}

void EventTableModel::openMenuAt(juce::Point<int> position, int row)
{
    const Events selected = getSelectedEvents();
    if (selected.empty() || m_table == nullptr)
        return;
    const std::shared_ptr<EventBase> clicked = m_rows.eventAt(row);
    juce::PopupMenu menu;
    addItems(menu, EventMenu(*m_list, m_dataModel.newEdl(), selected, clicked).items());
    m_presentMenu(menu, position,
                  [this, life = Life(m_life), table = m_table, position, clicked = std::weak_ptr<EventBase>(clicked),
                   offered = std::vector<std::weak_ptr<EventBase>>(selected.begin(), selected.end())](int id) {
                      if (life.expired() || table == nullptr)
                          return;
                      guardUser([&] {
                          if (auto* const keys = dynamic_cast<EventTable*>(table.getComponent()))
                              keys->menuClosed();
                          menuAnswered(id, offered, position, clicked.lock());
                      });
                  });
}

void EventTableModel::menuAnswered(int id, const std::vector<std::weak_ptr<EventBase>>& offered,
                                   juce::Point<int> position, const std::shared_ptr<EventBase>& clicked)
{
    const Events selected = getSelectedEvents();
    // Another selection would be another menu.
    if (!areSame(offered, selected) || !EventMenu::allows(id, *m_list, m_dataModel.newEdl(), selected))
        return;
    if (id != EventMenu::Edit)
        edit(id, m_rows.rowOf(clicked));
    else if (selected.front() == clicked)
        requestEdit(clicked, position);
}

// Edits.

void EventTableModel::edit(int id, int row)
{
    const Events events = getSelectedEvents();
    if (events.empty())
        return;
    const auto mayGoOn = [this, life = Life(m_life), &events] {
        return !life.expired() && getSelectedEvents() == events;
    };
    EventEdits::stopPreview(m_dataModel, m_engine);
    if (!mayGoOn())
        return;
    EventEdits::makeUndoEntry(id);
    if (mayGoOn())
        changeList(id, events, row);
}

void EventTableModel::changeList(int id, const Events& events, int row)
{
    const bool keepsSelection = EventMenu::isExtending(id);
    const Life life = m_life;
    const int next = id == EventMenu::Delete ? rowAfterRemoval(events, row) : 0;
    try {
        const Silence silence(*this);
        if (!keepsSelection)
            selectNothing();
        m_isStale = true;
        EventEdits::apply(id, *m_list, m_dataModel.newEdl(), events);
        if (life.expired())
            return;
        reloadIfStale();
        if (id == EventMenu::Delete)
            selectAfterRemoval(next);
    } catch (...) {
        // The list may have changed all the same.
        if (!life.expired())
            reloadIfStale();
        if (!life.expired() && !keepsSelection)
            tellSelectionChanged();
        throw;
    }
    if (!keepsSelection)
        tellSelectionChanged();
}

void EventTableModel::reloadIfStale()
{
    if (m_isStale)
        reload(*m_list);
}

void EventTableModel::selectAfterRemoval(int row)
{
    if (m_rows.count() == 0 || m_table == nullptr)
        return;
    const int selected = std::min(row, m_rows.count() - 1);
    RowSet rows;
    rows.append(selected);
    m_rows.select(rows);
    m_table->selectRow(selected, false, true);
}

int EventTableModel::rowAfterRemoval(const Events& removed, int row) const
{
    const std::unordered_set<std::shared_ptr<EventBase>> gone(removed.begin(), removed.end());
    int after = 0;
    for (int before = 0; before < row; ++before)
        after += gone.contains(m_rows.eventAt(before)) ? 0 : 1;
    return after;
}

void EventTableModel::selectNothing()
{
    m_rows.select({});
    if (m_table != nullptr)
        m_table->setSelectedRows({}, juce::dontSendNotification);
}

} // namespace cadrel::gui
