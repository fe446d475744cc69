// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/main/ListCounters.h"
#include "gui/main/MainLayout.h"
#include "gui/table/EventTable.h"
#include "gui/table/EventTableModel.h"

#include <juce_gui_basics/juce_gui_basics.h>

#include <array>
#include <cstdint>
#include <memory>

namespace cadrel::core {
class CadrelerBase;
class DataModel;
} // namespace cadrel::core

namespace cadrel::gui {

/// One of the three lists as the window shows it: its table, and the counters below. They are children of another component,
/// which adds them in the order that it wants.
class ListPanel {
public:
    /// The counters by their index.
    static constexpr std::size_t Total = 0;
    static constexpr std::size_t Selected = 1;
    static constexpr std::size_t Invalid = 2;

    /// The component names of a counter.
    struct CounterNames {
        const char* label;
        const char* value;
    };
    /// `listKind` is a core::ListKind.
    ListPanel(std::int32_t listKind, const char* tableName, const std::wstring& title,
              const std::array<CounterNames, MainLayout::CounterCount>& names);

    std::int32_t listKind() const { return m_listKind; }
    EventTable& table() { return m_table; }
    juce::Label& label(std::size_t counter) { return m_labels.at(counter); }
    juce::Label& value(std::size_t counter) { return m_values.at(counter); }
    void place(const MainLayout& layout);

    /// Shows the list of that model, and tells `listener` from then on what the user does with it. With the model that was
    /// shown before, the table takes the list as it is now; what the model has stored of the table counts in any case.
    void show(core::DataModel& model, core::CadrelerBase* engine, EventTableModel::Listener* listener);
    /// Takes the list as it is now. What is selected and still there stays so. Tells nobody.
    void reload();
    /// Selects the rows that the data model has stored. Tells nobody.
    void restoreSelection();
    /// Stores which rows are selected.
    void storeSelection();
    void storeSortKey();
    /// Shows nothing any more.
    void forget(EventTableModel::Listener* listener);

    /// Null while no model is shown.
    EventTableModel* model() { return m_model.get(); }
    bool isOf(const EventTableModel& model) const { return m_model.get() == &model; }
    void updateCounters();
    /// The list is as it was.
    void updateSelected();

private:
    void showCounters(const ListCounters& counters);

    std::int32_t m_listKind;
    EventTable m_table;
    std::array<juce::Label, MainLayout::CounterCount> m_labels;
    std::array<juce::Label, MainLayout::CounterCount> m_values;
    ListCounters m_counters;
    core::DataModel* m_dataModel = nullptr;
    std::shared_ptr<EventTableModel> m_model;
};

} // namespace cadrel::gui
