// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/edit/EventEdit.h"
#include "gui/input/TcInput.h"
#include "gui/sheet/Sheet.h"
#include "gui/sheet/SheetLabel.h"
#include "gui/sheet/TickBox.h"

#include <array>
#include <cstdint>
#include <functional>
#include <memory>
#include <utility>

namespace cadrel::core {
class EventList;
} // namespace cadrel::core

namespace cadrel::gui {

/// The box that changes the four timecodes of one event, as EventEdit tells. It has a size of its own, and comes up beside
/// the mouse.
class TcEditDialog : public Sheet, public TcInput::Listener, public juce::Button::Listener {
public:
    static constexpr int Width = 300;
    static constexpr int Height = 300;

    TcEditDialog();
    ~TcEditDialog() override;

    /// Called before an event of the change EDL is changed, outside of the undo entry. When it returns false or throws, nothing
    /// is changed.
    void setBeforeChange(std::function<bool()> call) { m_beforeChange = std::move(call); }
    /// For events of the old and the new EDL: shows the motion speed, and one timecode can be changed alone. It counts from
    /// the next event on.
    void setSingleSelectionMode(bool flag);
    /// The event, which isn't null, is one of the list of that kind (core::ListKind).
    void setEvent(std::shared_ptr<core::EventBase> event, std::int32_t listKind);
    /// Closes the box when the list has lost its event.
    void listChanged(const core::EventList& list);
    /// Closes the box.
    void modelChanged() { close(); }

    void resized() override;
    void buttonClicked(juce::Button* button) override;
    void timecodeChanged(TcInput& input) override;

protected:
    void confirm() override;
    void cancel() override { close(); }
    juce::Rectangle<int> panel() const override { return {0, 0, Width, Height}; }
    juce::Component* firstFocus() override { return &m_rows[EventEdit::SrcIn].input; }

private:
    /// One timecode.
    struct Row {
        Row(const char* tickName, const char* inputName, const std::wstring& labelText);

        TickBox tick;
        SheetLabel label;
        TcInput input{false};
    };

    void refresh();
    void refreshFlaw();
    bool prepareChange();
    void close();

    std::function<bool()> m_beforeChange;
    std::shared_ptr<EventEdit> m_edit; ///< null while the box is closed
    std::int32_t m_listKind = 0;
    bool m_singleSelectionMode = false;
    SheetLabel m_eventName;
    SheetRule m_line;
    std::array<Row, EventEdit::PlaceCount> m_rows;
    juce::TextButton m_applyButton;
    juce::TextButton m_cancelButton;
    SheetLabel m_motionSpeedLabel;
    SheetLabel m_motionSpeedValue;
    SheetLabel m_flaw;
};

} // namespace cadrel::gui
