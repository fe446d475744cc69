// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/edit/TcEditDialog.h"

#include "core/edl/EventList.h"
#include "gui/guard/Guard.h"
#include "gui/look/Text.h"
#include "util/Utf8Text.h"

#include <utility>

namespace cadrel::gui {

using core::EventBase;
using core::EventFlaw;
using core::Timecode;

namespace {

constexpr int TitleFont = 13;
constexpr int TextFont = 12;
constexpr int FlawFont = 2;

/// The tops of the rows, in the order of EventEdit::Place.
constexpr std::array<int, EventEdit::PlaceCount> RowTops{52, 92, 140, 180};
constexpr int RowHeight = 24;

/// Zeros for a timecode that the project's frame rate doesn't have.
void show(const Timecode& timecode, TcInput& input)
{
    input.setValue(timecode, juce::dontSendNotification);
    if (!(input.getValue() == timecode))
        input.setValue(Timecode(), juce::dontSendNotification);
}

} // namespace

TcEditDialog::Row::Row(const char* tickName, const char* inputName, const std::wstring& labelText)
    : tick(tickName, {}), label("new label", labelText, TextFont)
{
    tick.setTitle(label.getText());
    input.setName(inputName);
    input.setTitle(label.getText());
}

TcEditDialog::TcEditDialog()
    : Sheet("m_editDialog"), m_eventName("m_eventName", {}, TitleFont),
      m_line("HLine1"), m_rows{Row{"m_copyInSelect", "m_copyInEdit", L"SRC IN"},
                               Row{"m_copyOutSelect", "m_copyOutEdit", L"SRC OUT"},
                               Row{"m_pasteInSelect", "m_pasteInEdit", L"DST IN"},
                               Row{"m_pasteOutSelect", "m_pasteOutEdit", L"DST OUT"}},
      m_applyButton("m_applyButton"), m_cancelButton("m_cancelButton"),
      m_motionSpeedLabel("motioSpeedLabel", L"Motion Speed", TextFont),
      m_motionSpeedValue("motioSpeedValue", {}, TextFont), m_flaw("m_flaw", {}, FlawFont)
{
    setTitle(translatedText(L"Edit EDL Event"));
    addAndMakeVisible(m_eventName);
    addAndMakeVisible(m_line);
    for (Row& row : m_rows) {
        addAndMakeVisible(row.tick);
        row.tick.addListener(this);
    }
    for (Row& row : m_rows)
        addAndMakeVisible(row.label);
    m_applyButton.setButtonText(translatedText(L"OK"));
    m_cancelButton.setButtonText(translatedText(L"Cancel"));
    for (juce::TextButton* const button : {&m_applyButton, &m_cancelButton}) {
        addAndMakeVisible(button);
        button->addListener(this);
    }
    for (Row& row : m_rows) {
        addAndMakeVisible(row.input);
        row.input.addListener(this);
    }
    addChildComponent(m_motionSpeedLabel);
    addChildComponent(m_motionSpeedValue);
    addAndMakeVisible(m_flaw);
    m_flaw.setColour(juce::Label::textColourId, toColour(Palette::darkRed));
    setSize(Width, Height);
}

TcEditDialog::~TcEditDialog() = default;

void TcEditDialog::setSingleSelectionMode(bool flag)
{
    m_singleSelectionMode = flag;
    m_motionSpeedLabel.setVisible(flag);
    m_motionSpeedValue.setVisible(flag);
}

void TcEditDialog::setEvent(std::shared_ptr<EventBase> event, std::int32_t listKind)
{
    m_edit = std::make_shared<EventEdit>(std::move(event), m_singleSelectionMode);
    m_listKind = listKind;
    const juce::String name = util::toShownLine(m_edit->name()).c_str();
    m_eventName.setText(name, juce::dontSendNotification);
    m_eventName.setTooltip(name);
    refresh();
}

void TcEditDialog::listChanged(const core::EventList& list)
{
    if (m_edit && list.listKind() == m_listKind && !list.contains(m_edit->event()))
        close();
}

void TcEditDialog::resized()
{
    guardSystem([this] {
        m_eventName.setBounds(13, 8, 250, 24);
        m_line.setBounds(11, 34, 277, 1);
        for (std::size_t place = 0; place < m_rows.size(); ++place) {
            const int labelWidth = place < EventEdit::DstIn ? 80 : 104;
            m_rows[place].label.setBounds(20, RowTops[place], labelWidth, RowHeight);
            m_rows[place].tick.setBounds(126, RowTops[place], 30, RowHeight);
            m_rows[place].input.setBounds(156, RowTops[place], 128, RowHeight);
        }
        m_motionSpeedLabel.setBounds(19, 216, 141, 24);
        m_motionSpeedValue.setBounds(210, 216, 70, 24);
        m_flaw.setBounds(19, 239, 270, 18);
        m_applyButton.setBounds(66, 260, 80, 24);
        m_cancelButton.setBounds(155, 260, 80, 24);
    });
}

void TcEditDialog::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        if (button == &m_applyButton) {
            confirm();
            return;
        }
        if (button == &m_cancelButton) {
            close();
            return;
        }
        for (std::size_t place = 0; m_edit && place < m_rows.size(); ++place) {
            if (button == &m_rows[place].tick)
                m_edit->click(place);
        }
        refresh();
    });
}

void TcEditDialog::timecodeChanged(TcInput& input)
{
    guardUser([&] {
        for (std::size_t place = 0; m_edit && place < m_rows.size(); ++place) {
            if (&input == &m_rows[place].input)
                m_edit->change(place, input.getValue());
        }
        refresh();
    });
}

void TcEditDialog::confirm()
{
    // Whoever is told of the change may close the box.
    const std::shared_ptr<EventEdit> edit = m_edit;
    if (!edit || !edit->canApply())
        return;
    const SafePointer<TcEditDialog> self(this);
    if (!prepareChange() || !self || m_edit != edit)
        return;
    edit->apply();
    if (self)
        close();
}

bool TcEditDialog::prepareChange()
{
    const bool isAsked = m_beforeChange && m_listKind == core::ListKind::Change && m_edit->isChanged();
    return !isAsked || m_beforeChange();
}

void TcEditDialog::close()
{
    m_edit.reset();
    setVisible(false);
}

void TcEditDialog::refresh()
{
    if (!m_edit)
        return;
    for (std::size_t place = 0; place < m_rows.size(); ++place) {
        m_rows[place].tick.setToggleState(m_edit->isTicked(place), juce::dontSendNotification);
        show(m_edit->timecode(place), m_rows[place].input);
    }
    m_motionSpeedValue.setText(m_edit->speedText(), juce::dontSendNotification);
    refreshFlaw();
}

void TcEditDialog::refreshFlaw()
{
    const std::optional<std::int32_t> flaw = m_edit->flaw();
    const juce::String text = flaw ? translatedText(std::wstring(EventFlaw::text(*flaw))) : juce::String();
    m_flaw.setText(text, juce::dontSendNotification);
    m_flaw.setTooltip(text);
    m_applyButton.setEnabled(m_edit->canApply());
    m_applyButton.setTooltip(m_edit->canApply() ? juce::String() : text);
}

} // namespace cadrel::gui
