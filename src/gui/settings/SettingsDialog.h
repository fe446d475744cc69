// SPDX-License-Identifier: GPL-3.0-or-later

#pragma once

#include "gui/input/SpinBox.h"
#include "gui/input/TcInput.h"
#include "gui/settings/SettingsEntries.h"
#include "gui/settings/ShownSettings.h"
#include "gui/sheet/Sheet.h"
#include "gui/sheet/SheetLabel.h"
#include "gui/sheet/TickBox.h"

#include <array>
#include <cstddef>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <vector>

namespace cadrel::gui {

/// The sheet with the options of the project. What the user does counts at once; there is no OK and no Cancel. A click beside
/// the panel, Return and Escape close it.
class SettingsDialog : public Sheet,
                       public juce::TextEditor::Listener,
                       public TcInput::Listener,
                       public SpinBox::Listener,
                       public juce::Button::Listener,
                       public juce::ComboBox::Listener {
public:
    SettingsDialog();
    ~SettingsDialog() override;

    /// Shows the values anew; without settings the sheet is disabled. They aren't owned: give others or null before they go,
    /// and before the sheet is hidden then, as what was being typed is stored when it closes.
    void setSettings(core::Settings* settings);

    void resized() override;
    void visibilityChanged() override;
    void mouseDown(const juce::MouseEvent& event) override;
    void buttonClicked(juce::Button* button) override;
    void comboBoxChanged(juce::ComboBox* comboBox) override;
    void textEditorTextChanged(juce::TextEditor& editor) override;
    void timecodeChanged(TcInput& input) override;
    void valueChanged(SpinBox& spinBox) override;

protected:
    void confirm() override { setVisible(false); }
    void cancel() override { setVisible(false); }
    juce::Rectangle<int> panel() const override;
    juce::Component* firstFocus() override { return m_inReadingOrder.front(); }

private:
    /// What goes with an entry.
    struct Switch {
        explicit Switch(const SwitchEntry& entry);

        const SwitchEntry& entry;
        TickBox box;
    };
    struct Choice {
        explicit Choice(const ChoiceEntry& entry);

        const ChoiceEntry& entry;
        juce::ComboBox box;
        SheetLabel label;
    };
    struct Frames {
        explicit Frames(const FramesEntry& entry);

        const FramesEntry& entry;
        SpinBox box;
    };
    /// One end of the names of VFX shots.
    struct VfxText {
        VfxText(const juce::String& name, std::string core::VfxPatternEntry::*part);

        juce::TextEditor editor;
        std::string core::VfxPatternEntry::*part;
        juce::String shown; ///< what was stored when it was last shown
    };
    struct VfxRow {
        explicit VfxRow(std::size_t row);

        std::size_t row;
        TickBox box;
        VfxText prefix;
        VfxText postfix;
        SheetLabel versionLabel;
    };
    /// One of the times that limit a run.
    struct Limit {
        Limit(const char* inputName, const char* labelName, const wchar_t* labelText);

        SheetLabel label;
        TcInput input{true};
    };

    template <class Entry, class Control>
    void addEntries(std::span<const Entry> entries, std::vector<std::unique_ptr<Control>>& controls);
    void addVfxRow(VfxRow& row);
    void addLimit(Limit& limit);
    void orderForKeys();
    void put(juce::Component& component, const ChoiceEntry::Place& place) const;

    /// Stores what the user entered and shows what came of it. The change may delete the sheet.
    void change(const std::function<void(core::Settings&)>& store);
    void changeRow(const VfxRow& row, const std::function<void(core::VfxPatternEntry&)>& store);
    void storeText(const VfxRow& row, VfxText& text);
    void storeTexts();

    void refresh(bool isAnother);
    void refreshVfx(bool isAnother);
    void refreshLimit(Limit& limit, double seconds, bool isAnother) const;

    core::Settings* m_settings = nullptr;
    SheetLabel m_generationTitle;
    SheetRule m_generationLine;
    SheetLabel m_processingTitle;
    SheetRule m_processingLine;
    SheetLabel m_loadTitle;
    SheetRule m_loadLine;
    SheetLabel m_vfxTitle;
    SheetLabel m_vfxFlaw;
    std::vector<std::unique_ptr<Switch>> m_switches;
    std::vector<std::unique_ptr<Choice>> m_choices;
    std::vector<std::unique_ptr<Frames>> m_frames;
    std::vector<std::unique_ptr<VfxRow>> m_vfxRows;
    Limit m_before;
    Limit m_after;
    std::vector<juce::Component*> m_inReadingOrder;
};

} // namespace cadrel::gui
