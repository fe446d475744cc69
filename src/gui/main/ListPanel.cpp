// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/ListPanel.h"

#include "core/model/DataModel.h"
#include "core/model/ListOfKind.h"
#include "gui/look/Text.h"
#include "gui/main/CutCommands.h"
#include "gui/table/StoredTable.h"

#include <cmath>

namespace cadrel::gui {

namespace {

constexpr int CounterFont = 1;
const juce::Colour CounterColour(0xff797a7b);
const juce::Colour FirstInvalidColour(0xff00ff00);
const std::array<const wchar_t*, MainLayout::CounterCount> CounterTitles{L"Total", L"Selected", L"Invalid"};

void makeCounter(juce::Label& label, const char* name, juce::Justification justification)
{
    label.setName(name);
    label.setFont(getFont(CounterFont));
    label.setJustificationType(justification);
    label.setColour(juce::Label::textColourId, CounterColour);
    label.setColour(juce::TextEditor::textColourId, juce::Colours::black);
    label.setColour(juce::TextEditor::backgroundColourId, juce::Colours::transparentBlack);
}

MainLayout::CounterText widthsOf(const juce::Label& label, const juce::Label& value)
{
    const auto widthOf = [](const juce::Label& text) {
        return static_cast<int>(std::ceil(text.getFont().getStringWidthFloat(text.getText())));
    };
    return {widthOf(label), widthOf(value)};
}

void setBounds(juce::Component& component, const MainLayout::Box& box)
{
    component.setBounds(box.x, box.y, box.width, box.height);
}

/// While it lives, a listener doesn't hear of a table.
class Unheard {
public:
    Unheard(std::shared_ptr<EventTableModel> model, EventTableModel::Listener* listener)
        : m_model(std::move(model)), m_listener(listener)
    {
        m_model->removeListener(m_listener);
    }
    Unheard(const Unheard&) = delete;
    Unheard& operator=(const Unheard&) = delete;
    ~Unheard() { m_model->addListener(m_listener); }

private:
    std::shared_ptr<EventTableModel> m_model;
    EventTableModel::Listener* m_listener;
};

} // namespace

ListPanel::ListPanel(std::int32_t listKind, const char* tableName, const std::wstring& title,
                     const std::array<CounterNames, MainLayout::CounterCount>& names)
    : m_listKind(listKind), m_table(tableName)
{
    m_table.setTitle(translatedText(title));
    for (std::size_t index = 0; index < names.size(); ++index) {
        makeCounter(m_labels.at(index), names.at(index).label, juce::Justification::centredLeft);
        makeCounter(m_values.at(index), names.at(index).value, juce::Justification::centredRight);
        m_labels.at(index).setText(translatedText(CounterTitles.at(index)), juce::dontSendNotification);
        m_values.at(index).setText("0", juce::dontSendNotification);
        m_values.at(index).setTitle(m_table.getTitle() + ", " + m_labels.at(index).getText());
    }
    m_values.at(Invalid).setColour(juce::Label::textColourId, FirstInvalidColour);
}

void ListPanel::place(const MainLayout& layout)
{
    setBounds(m_table, layout.table(m_listKind));
    std::array<MainLayout::CounterText, MainLayout::CounterCount> texts{};
    for (std::size_t index = 0; index < texts.size(); ++index)
        texts.at(index) = widthsOf(m_labels.at(index), m_values.at(index));
    const MainLayout::Counters counters = layout.counters(m_listKind, texts);
    for (std::size_t index = 0; index < counters.size(); ++index) {
        setBounds(m_labels.at(index), counters.at(index).label);
        setBounds(m_values.at(index), counters.at(index).value);
    }
}

void ListPanel::show(core::DataModel& model, core::CadrelerBase* engine, EventTableModel::Listener* listener)
{
    const bool isNew = !m_model || m_dataModel != &model;
    if (isNew) {
        m_model.reset();
        m_model = std::make_shared<EventTableModel>(m_table, core::listOf(model, m_listKind), model);
        m_dataModel = &model;
    }
    const Unheard unheard(m_model, listener);
    if (!isNew)
        reload();
    m_model->setEngine(engine);
    // Stored rows are counted in the stored order, or in that of the programme.
    const SortKey key = StoredTable(model, m_listKind).sortKey().value_or(SortKey());
    m_model->applySort(key.column, key.forwards);
    updateCounters();
}

void ListPanel::reload()
{
    if (m_model)
        m_model->reload(core::listOf(*m_dataModel, m_listKind));
}

void ListPanel::restoreSelection()
{
    if (m_model)
        m_model->selectRows(StoredTable(*m_dataModel, m_listKind).selection(m_model->getNumRows()));
}

void ListPanel::storeSelection()
{
    if (m_model)
        StoredTable(*m_dataModel, m_listKind).setSelection(m_model->getSelectedRows());
}

void ListPanel::storeSortKey()
{
    if (m_model)
        StoredTable(*m_dataModel, m_listKind).setSortKey({m_model->getSortColumn(), m_model->getSortForwards()});
}

void ListPanel::forget(EventTableModel::Listener* listener)
{
    if (m_model)
        m_model->removeListener(listener);
    m_model.reset();
    m_dataModel = nullptr;
    m_table.updateContent();
    showCounters({});
}

void ListPanel::updateCounters()
{
    if (m_model)
        showCounters(ListCounters::of(core::listOf(*m_dataModel, m_listKind), m_model->getSelectedRows().count()));
}

void ListPanel::updateSelected()
{
    if (!m_model)
        return;
    ListCounters counters = m_counters;
    counters.selected = m_model->getSelectedRows().count();
    showCounters(counters);
}

void ListPanel::showCounters(const ListCounters& counters)
{
    m_counters = counters;
    m_values.at(Total).setText(juce::String(static_cast<juce::uint64>(counters.total)), juce::dontSendNotification);
    m_values.at(Selected).setText(juce::String(static_cast<juce::uint64>(counters.selected)),
                                  juce::dontSendNotification);
    m_values.at(Invalid).setText(juce::String(static_cast<juce::uint64>(counters.invalid)), juce::dontSendNotification);
    m_values.at(Invalid).setColour(juce::Label::textColourId, toColour(counters.invalidColour()));
    if (juce::Component* const parent = m_table.getParentComponent())
        place({parent->getWidth(), parent->getHeight()});
}

} // namespace cadrel::gui
