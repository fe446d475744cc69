// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/video/VideoListTableModel.h"

#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "gui/video/DarkTickBox.h"

#include <algorithm>
#include <optional>
#include <utility>

namespace cadrel::gui {

namespace {

/// What a row keeps free beside its rule.
constexpr int LeftEdge = 5;
constexpr int BothEdges = 8;
constexpr float SelectionOpacity = 0.35F;
constexpr int NameFont = 5;
constexpr int TimecodeFont = 7;
constexpr float TextX = 18.0F;

/// Scrolls the table to the row of an input.
void bringIntoView(const juce::Component& input)
{
    auto* const table = input.findParentComponentOfClass<juce::TableListBox>();
    for (const auto* part = &input; table != nullptr && part != table; part = part->getParentComponent()) {
        if (const int row = table->getRowNumberOfComponent(part); row >= 0)
            table->scrollToEnsureRowIsOnscreen(row);
    }
}

} // namespace

/// Whether the video is used.
class VideoListTableModel::UseBox : public DarkTickBox {
public:
    UseBox() : DarkTickBox("Use as New Video") {}

    void show(const VideoRows::Row& row)
    {
        path = row.path;
        setToggleState(row.isUsed, juce::dontSendNotification);
    }
    void focusGained(FocusChangeType cause) override
    {
        guardSystem([&] {
            DarkTickBox::focusGained(cause);
            bringIntoView(*this);
        });
    }

    std::string path;
};

/// Where the video starts.
class VideoListTableModel::StartInput : public TcInput {
public:
    StartInput() : TcInput(false)
    {
        setName("Start");
        setBackgroundColour(juce::Colours::transparentBlack);
    }

    /// What is being typed stays while the video and its start do.
    void show(const VideoRows::Row& row)
    {
        if (path == row.path && getValue() == row.start)
            return;
        path = row.path;
        setValue(row.start, juce::dontSendNotification);
        // Zeros for a start that the project's frame rate doesn't have.
        if (!(getValue() == row.start))
            setValue(core::Timecode(), juce::dontSendNotification);
    }
    void focusOfChildComponentChanged(FocusChangeType cause) override
    {
        // A listener may delete the input.
        const SafePointer<StartInput> self(this);
        TcInput::focusOfChildComponentChanged(cause);
        guardSystem([&] {
            if (self && self->hasKeyboardFocus(true))
                bringIntoView(*self);
        });
    }

    std::string path;
};

VideoListTableModel::VideoListTableModel(juce::TableListBox& table, core::VideoList& list,
                                         core::MediaPoolInterface* pool)
    : m_table(&table), m_pool(pool), m_rows(list, pool)
{
    m_rows.refill();
    if (m_pool)
        m_pool->addListener(this);
    // The inputs of a model before this one go.
    table.setModel(nullptr);
    table.setModel(this);
}

VideoListTableModel::~VideoListTableModel()
{
    guardSystem([this] {
        if (m_pool)
            m_pool->removeListener(this);
        // The inputs go with it.
        if (m_table && m_table->getModel() == this)
            m_table->setModel(nullptr);
    });
}

// ---- Rows ----------------------------------------------------------------------------------------------------------

void VideoListTableModel::setMediaPool(core::MediaPoolInterface* pool)
{
    if (pool != m_pool) {
        if (m_pool)
            m_pool->removeListener(this);
        m_pool = pool;
        m_rows.setMediaPool(pool);
        if (m_pool)
            m_pool->addListener(this);
    }
    reload();
}

void VideoListTableModel::setTimeOrigin(double seconds)
{
    m_rows.setTimeOrigin(seconds);
    reload();
}

void VideoListTableModel::mediaPoolChanged()
{
    guardSystem([this] { reload(); });
}

void VideoListTableModel::reload()
{
    const std::vector<std::string> selected = selectedPaths();
    m_rows.refill();
    showRows(selected);
}

void VideoListTableModel::sortOrderChanged(int column, bool forwards)
{
    guardUser([&] {
        std::vector<std::string> selected = selectedPaths();
        selected.resize(std::min<std::size_t>(selected.size(), 1));
        m_rows.sort(column, forwards);
        showRows(selected);
    });
}

void VideoListTableModel::showRows(const std::vector<std::string>& selected)
{
    if (!m_table)
        return;
    const juce::SparseSet<int> rows = rowsOf(selected);
    const Cell focused = focusedCell();
    m_table->updateContent();
    // The scroll bar may have come or gone.
    m_table->resized();
    m_table->setSelectedRows(rows, juce::dontSendNotification);
    m_table->repaint();
    keepFocus(focused);
}

/// JUCE's set takes gaps out of one range much faster than it takes many ranges in.
juce::SparseSet<int> VideoListTableModel::rowsOf(const std::vector<std::string>& paths) const
{
    std::vector<int> rows;
    for (const std::string& path : paths) {
        if (const std::optional<std::size_t> row = m_rows.find(path))
            rows.push_back(static_cast<int>(*row));
    }
    std::sort(rows.begin(), rows.end());
    juce::SparseSet<int> set;
    if (!rows.empty())
        set.addRange({rows.front(), rows.back() + 1});
    for (std::size_t index = 1; index < rows.size(); ++index)
        set.removeRange({rows[index - 1] + 1, rows[index]});
    return set;
}

std::vector<std::string> VideoListTableModel::selectedPaths() const
{
    std::vector<std::string> paths;
    const juce::SparseSet<int> selected = m_table ? m_table->getSelectedRows() : juce::SparseSet<int>();
    for (const juce::Range<int>& range : selected.getRanges()) {
        for (int row = range.getStart(); row < range.getEnd() && row < static_cast<int>(m_rows.count()); ++row)
            paths.push_back(m_rows.at(static_cast<std::size_t>(row)).path);
    }
    return paths;
}

// ---- The keyboard --------------------------------------------------------------------------------------------------

VideoListTableModel::Cell VideoListTableModel::focusedCell() const
{
    juce::Component* component = m_table ? juce::Component::getCurrentlyFocusedComponent() : nullptr;
    for (; component != nullptr && m_table->isParentOf(component); component = component->getParentComponent()) {
        if (const auto* const box = dynamic_cast<const UseBox*>(component))
            return {box->path, VideoColumn::Use};
        if (const auto* const input = dynamic_cast<const StartInput*>(component))
            return {input->path, VideoColumn::Start};
    }
    return {};
}

/// Nobody goes on typing into the input of another video.
void VideoListTableModel::keepFocus(const Cell& cell)
{
    if (cell.column == 0 || focusedCell().path == cell.path)
        return;
    const std::optional<std::size_t> row = m_rows.find(cell.path);
    juce::Component* const component = row ? m_table->getCellComponent(cell.column, static_cast<int>(*row)) : nullptr;
    (component ? component : m_table.getComponent())->grabKeyboardFocus();
}

void VideoListTableModel::toggleSelected()
{
    const std::vector<std::string> paths = selectedPaths();
    const bool isUse = std::any_of(paths.begin(), paths.end(), [this](const std::string& path) {
        const std::optional<std::size_t> row = m_rows.find(path);
        return row && !m_rows.at(*row).isUsed;
    });
    const std::weak_ptr<const char> life = m_life;
    for (const std::string& path : paths) {
        if (!life.expired())
            edit([&] { m_rows.setUsed(path, isUse); });
    }
}

// ---- What the user does --------------------------------------------------------------------------------------------

template <class Edit>
void VideoListTableModel::edit(const Edit& change)
{
    // Whoever is told of the change may end the model.
    const std::weak_ptr<const char> life = m_life;
    guardUser(change);
    if (!life.expired())
        reload();
}

void VideoListTableModel::timecodeChanged(TcInput& input)
{
    guardUser([&] {
        const auto& start = dynamic_cast<const StartInput&>(input);
        edit([this, path = start.path, value = start.getValue()] { m_rows.setStart(path, value); });
    });
}

void VideoListTableModel::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        const auto& box = dynamic_cast<const UseBox&>(*button);
        edit([this, path = box.path, isUsed = box.getToggleState()] { m_rows.setUsed(path, isUsed); });
    });
}

// ---- Cells ---------------------------------------------------------------------------------------------------------

juce::Component* VideoListTableModel::refreshComponentForCell(int row, int column, bool, juce::Component* existing)
{
    guardSystem([&] {
        const VideoRows::Row& video = m_rows.at(static_cast<std::size_t>(row));
        if (column == VideoColumn::Use) {
            std::unique_ptr<UseBox> box = takeOrMake<UseBox>(existing);
            box->show(video);
            existing = box.release();
        } else if (column == VideoColumn::Start) {
            std::unique_ptr<StartInput> input = takeOrMake<StartInput>(existing);
            input->show(video);
            existing = input.release();
        }
    });
    return existing;
}

/// The table gives away what it has, and takes it back or another.
template <class Input>
std::unique_ptr<Input> VideoListTableModel::takeOrMake(juce::Component*& existing)
{
    std::unique_ptr<Input> input(static_cast<Input*>(std::exchange(existing, nullptr)));
    if (!input) {
        input = std::make_unique<Input>();
        input->addListener(this);
    }
    return input;
}

void VideoListTableModel::paintRowBackground(juce::Graphics& graphics, int row, int width, int height, bool isSelected)
{
    guardSystem([&] {
        if (isSelected) {
            // Dark enough for the white digits of the start.
            graphics.setColour(toColour(Palette::selection).withAlpha(SelectionOpacity));
            graphics.fillRect(LeftEdge, 1, width - BothEdges, height - 1);
        }
        if (row != 0) {
            graphics.setColour(toColour(Palette::band));
            graphics.drawHorizontalLine(0, static_cast<float>(LeftEdge), static_cast<float>(width - BothEdges));
        }
        if (isSelected) {
            graphics.setColour(toColour(Palette::selection));
            graphics.fillRect(0, 2, LeftEdge - 2, height - 3);
        }
    });
}

void VideoListTableModel::paintCell(juce::Graphics& graphics, int row, int column, int width, int height, bool)
{
    guardSystem([&] {
        const auto index = static_cast<std::size_t>(row);
        const std::wstring text = m_rows.text(index, column);
        const bool isWarned = column == VideoColumn::Name && m_rows.at(index).isMissing;
        drawText(graphics, text.c_str(), TextX, 0.0F, static_cast<float>(width) - TextX, static_cast<float>(height),
                 juce::Justification::centredLeft, getFont(column == VideoColumn::Name ? NameFont : TimecodeFont),
                 isWarned ? toColour(Palette::orange) : juce::Colours::white, true);
    });
}

juce::String VideoListTableModel::getCellTooltip(int, int)
{
    return {};
}

juce::String VideoListTableModel::getSpokenCell(int row, int column) const
{
    const auto index = static_cast<std::size_t>(row);
    if (row < 0 || index >= m_rows.count())
        return {};
    const juce::String text = m_rows.text(index, column).c_str();
    if (column == VideoColumn::Name)
        return text;
    const auto header = m_table ? m_table->getHeader().getColumnName(column) : juce::String();
    return text.isEmpty() ? header + ", " + getSpokenCell(row, VideoColumn::Name) : header + " " + text;
}

} // namespace cadrel::gui
