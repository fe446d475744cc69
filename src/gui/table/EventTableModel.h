// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/table/EventRows.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <cstddef>
#include <functional>
#include <memory>
#include <vector>

namespace cadrel::core {
class CadrelerBase;
class DataModel;
class EventBase;
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The model of one of the three event tables. It shows a list, sorts and selects its rows, paints them, and edits the list
/// through its menu and keys. What it decides is in EventRows, EventMenu and EventEdits.
///
/// It doesn't listen to the list. Whoever does calls `reload` after each change. It outlives neither list nor data model; the
/// table may go before it.
class EventTableModel : public juce::TableListBoxModel {
public:
    using Events = EventRows::Events;

    class Listener {
    public:
        virtual ~Listener() = default;

        /// Other events or other rows are selected.
        virtual void selectionChanged(EventTableModel& model) = 0;
        /// The table is sorted by another column, or the other way round.
        virtual void sortChanged(EventTableModel& model) = 0;
        /// The user wants to edit the event. `position` is where he has asked for it, on the screen.
        virtual void editRequested(const std::shared_ptr<core::EventBase>& event, EventTableModel& model,
                                   juce::Point<int> position) = 0;
    };

    /// Becomes the table's model, with nothing selected and in the order of the programme.
    EventTableModel(juce::TableListBox& table, core::EventList& list, core::DataModel& dataModel);
    EventTableModel(const EventTableModel&) = delete;
    EventTableModel& operator=(const EventTableModel&) = delete;
    ~EventTableModel() override;

    /// Whose preview is ended before an edit; null for none. Not owned.
    void setEngine(core::CadrelerBase* engine) { m_engine = engine; }
    /// Shows the list as it is now. The selected events that are still there stay selected, and one of them that is in view
    /// stays in view. Tells nobody: whoever calls it looks after what depends on the selection and its rows.
    void reload(core::EventList& list);

    /// Null, and a listener that is there already, are ignored. Not owned. The last that was added is called first. Listeners
    /// may be added and removed while they are called; one that is added isn't called then.
    void addListener(Listener* listener);
    void removeListener(Listener* listener);

    /// In the order of the rows.
    Events getSelectedEvents() const { return m_rows.selectedEvents(); }
    const RowSet& getSelectedRows() const { return m_rows.selection(); }
    int getNumSelectedRows() const { return static_cast<int>(m_rows.selection().count()); }
    /// Selects these rows and no others. Tells nobody.
    void selectRows(const RowSet& rows);
    /// Selects an event and no other, as the user does, and scrolls to it. False for one that isn't in the table.
    bool selectEvent(const std::shared_ptr<core::EventBase>& event);
    /// As EventRows::withNeighbours.
    Events getSelectionWithNeighbours(const Events& selected, std::size_t& before, std::size_t& after) const
    {
        return m_rows.withNeighbours(selected, before, after);
    }
    /// These events, and no others, are shown as related to what is selected elsewhere.
    void setHighlight(const Events& events);

    int getSortColumn() const { return shownSortColumn(m_rows.sortKey().column); }
    bool getSortForwards() const { return m_rows.sortKey().forwards; }
    /// Sorts at once, and shows it in the header. A number that is no column stands for the event numbers.
    void applySort(int column, bool forwards);

    static juce::String getColumnName(int id);

    /// Opens the menu of the selected events at the last row that was selected, for the keyboard.
    void openMenu();
    void selectAll();
    /// What a screen reader says.
    juce::String getSpokenRow(int row) const;
    juce::String getSpokenCell(int row, int column) const;

    /// Shows a menu at a place on the screen, and tells later which item was chosen, 0 for none. Tests put another in its place.
    using MenuPresenter =
        std::function<void(juce::PopupMenu& menu, juce::Point<int> position, std::function<void(int)> chosen)>;
    void setMenuPresenter(MenuPresenter presenter) { m_presentMenu = std::move(presenter); }

    int getNumRows() override { return m_rows.count(); }
    void paintRowBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected) override;
    void paintCell(juce::Graphics& graphics, int row, int column, int width, int height, bool isSelected) override;
    /// Cells are painted; returns nothing.
    juce::Component* refreshComponentForCell(int row, int column, bool isSelected, juce::Component* existing) override;
    void cellClicked(int row, int column, const juce::MouseEvent& event) override;
    void cellDoubleClicked(int row, int column, const juce::MouseEvent& event) override;
    void sortOrderChanged(int column, bool forwards) override;
    juce::String getCellTooltip(int row, int column) override;
    void selectedRowsChanged(int lastRow) override;
    void deleteKeyPressed(int lastRow) override;
    void returnKeyPressed(int lastRow) override;

private:
    /// While it lives, what the table says of its selection is the model's own doing.
    class Silence;
    /// Tells whether the model still lives after a call that may have destroyed it.
    using Life = std::weak_ptr<const char>;

    /// What the table keeps by event while its rows change.
    struct Place {
        std::shared_ptr<core::EventBase> anchor;  ///< the event that keys go on from
        std::shared_ptr<core::EventBase> watched; ///< a selected event in view; null when there is none
    };
    Place place() const;
    void restore(const Place& place);
    bool isPartlyInView(int row) const;

    bool sortBy(const SortKey& key);
    void openMenuAt(juce::Point<int> position, int row);
    void menuAnswered(int id, const std::vector<std::weak_ptr<core::EventBase>>& offered, juce::Point<int> position,
                      const std::shared_ptr<core::EventBase>& clicked);
    juce::Point<int> screenPositionOf(int row) const;
    void requestEdit(const std::shared_ptr<core::EventBase>& event, juce::Point<int> position);
    /// Carries out an edit that is allowed for the selected events. `row` is the one that was clicked or selected last.
    void edit(int id, int row);
    void changeList(int id, const Events& events, int row);
    void reloadIfStale();
    void selectAfterRemoval(int row);
    int rowAfterRemoval(const Events& removed, int row) const;
    void selectNothing();

    template <class Action>
    void tell(const Action& action);
    void tellSelectionChanged();

    std::shared_ptr<const char> m_life = std::make_shared<const char>();
    std::vector<Listener*> m_listeners;
    juce::Component::SafePointer<juce::TableListBox> m_table;
    core::EventList* m_list;
    core::DataModel& m_dataModel;
    core::CadrelerBase* m_engine = nullptr;
    EventRows m_rows;
    MenuPresenter m_presentMenu;
    bool m_isSilent = false;
    bool m_isStale = false; ///< the list has changed since the last reload
};

} // namespace cadrel::gui
