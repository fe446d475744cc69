// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "gui/look/LookAndFeel.h"
#include "gui/table/EventTable.h"
#include "gui/table/EventTableModel.h"
#include "tests/gui/table/RecordedEdits.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {

/// The table of the change list, and a window that does what the main window does: it reloads the table when the list changes,
/// and writes down what it is told.
class ShownTable : public testing::Test,
                   protected gui::EventTableModel::Listener,
                   private core::ChangeContextListenerInterface {
protected:
    using Events = gui::EventRows::Events;

    ShownTable()
    {
        m_edits.addListener(this);
        m_table.setBounds(0, 0, 900, 240);
        m_table.setVisible(true);
    }
    ~ShownTable() override { m_edits.removeListener(this); }

    core::EventList& list() { return m_dataModel.changeEdl(); }
    /// An event of five seconds, the next of the programme, of any source. They touch on both sides.
    std::shared_ptr<core::EventBase> add(const std::string& roll = "A001")
    {
        const auto second = static_cast<std::int32_t>(list().size()) * 5;
        const auto at = [](std::int32_t hour, std::int32_t seconds) {
            return core::Timecode(hour, seconds / 60, seconds % 60, 0);
        };
        auto event = std::make_shared<core::EventBase>();
        event->setRollName(roll);
        event->setTimecodes(at(0, second), at(0, second + 5), at(1, second), at(1, second + 5));
        event->setEventNumber(static_cast<std::uint32_t>(list().size() + 1));
        list().add(event);
        return event;
    }
    /// The table with its model, once the events are there.
    gui::EventTableModel& show()
    {
        m_model = std::make_unique<gui::EventTableModel>(m_table, list(), m_dataModel);
        m_model->setEngine(&m_edits.engine);
        m_model->addListener(this);
        if (!m_showsMenus) {
            m_model->setMenuPresenter([this](juce::PopupMenu& menu, juce::Point<int> position, auto chosen) {
                m_menuText = textOf(menu);
                m_menuPosition = position;
                m_choose = std::move(chosen);
            });
        }
        m_edits.steps.clear();
        return *m_model;
    }

    std::vector<int> selectedRows() const
    {
        std::vector<int> rows;
        m_model->getSelectedRows().forEach([&](int row) { rows.push_back(row); });
        // The table says the same.
        const juce::SparseSet<int> table = m_table.getSelectedRows();
        EXPECT_EQ(table.size(), static_cast<int>(rows.size()));
        for (std::size_t index = 0; index < rows.size(); ++index)
            EXPECT_EQ(table[static_cast<int>(index)], rows[index]);
        return rows;
    }
    /// As the user does it, with the Control key for all but the first.
    void select(const std::vector<int>& rows)
    {
        bool isFirst = true;
        for (const int row : rows)
            m_table.selectRow(row, true, std::exchange(isFirst, false));
        m_steps.clear();
    }
    bool isInView(int row) const
    {
        const auto view = m_table.getViewport()->getViewArea().getVerticalRange();
        const int height = m_table.getRowHeight();
        return view.contains(juce::Range<int>(row * height, (row + 1) * height));
    }

    /// Mouse events at the middle of a row's first cell, as JUCE sends them to the row.
    juce::MouseEvent mouseAt(int row, juce::ModifierKeys modifiers)
    {
        const auto place = m_table.getRowPosition(row, true).getCentre().toFloat();
        return {juce::Desktop::getInstance().getMainMouseSource(),
                place,
                modifiers,
                0.0F,
                0.0F,
                0.0F,
                0.0F,
                0.0F,
                &m_table,
                &m_table,
                {},
                place,
                {},
                1,
                false};
    }
    void rightClick(int row)
    {
        const juce::ModifierKeys right(juce::ModifierKeys::rightButtonModifier);
        m_table.selectRowsBasedOnModifierKeys(row, right, false);
        m_model->cellClicked(row, 1, mouseAt(row, right));
    }

    void selectionChanged(gui::EventTableModel&) override
    {
        m_steps.emplace_back("selection");
        if (const auto call = std::exchange(m_onSelection, nullptr))
            call();
    }
    void sortChanged(gui::EventTableModel&) override { m_steps.emplace_back("sort"); }
    void editRequested(const std::shared_ptr<core::EventBase>& event, gui::EventTableModel&,
                       juce::Point<int> position) override
    {
        m_steps.emplace_back("edit");
        m_edited = event;
        m_editPosition = position;
    }

    using Steps = std::vector<std::string>;

    TestProject m_project;
    juce::ScopedJuceInitialiser_GUI m_juce;
    juce::SharedResourcePointer<gui::LookAndFeel> m_look;
    core::DataModel m_dataModel;
    RecordedEdits m_edits{m_dataModel};
    gui::EventTable m_table{"Change Table List Box"};
    std::unique_ptr<gui::EventTableModel> m_model;
    bool m_reloads = true;
    bool m_showsMenus = false; ///< else a menu is only written down

    Steps m_steps; ///< what the table tells
    std::function<void()> m_onSelection;
    std::shared_ptr<core::EventBase> m_edited;
    juce::Point<int> m_editPosition;
    std::string m_menuText;
    juce::Point<int> m_menuPosition;
    std::function<void(int)> m_choose;

private:
    void onChange(const core::ChangeContext& context) override
    {
        if (context.type == core::ChangeContext::EventListChanged && m_model && m_reloads)
            m_model->reload(list());
    }

    /// The ids of the items; "-" after what is disabled, "|" for a separator, brackets around a submenu.
    static std::string textOf(const juce::PopupMenu& menu)
    {
        std::string text;
        juce::PopupMenu::MenuItemIterator items(menu);
        while (items.next()) {
            const juce::PopupMenu::Item& item = items.getItem();
            if (item.isSeparator)
                text += "|";
            else if (item.subMenu)
                text += item.text.toStdString() + "(" + textOf(*item.subMenu) + ")";
            else
                text += std::to_string(item.itemID) + (item.isEnabled ? "" : "-") + " ";
        }
        return text;
    }
};

} // namespace cadrel::tests
