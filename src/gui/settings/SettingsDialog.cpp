// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/settings/SettingsDialog.h"

#include "core/settings/VfxNameMatcher.h"
#include "gui/guard/Guard.h"
#include "gui/look/ButtonTile.h"
#include "gui/look/Text.h"
#include "util/Utf8Text.h"

#include <algorithm>
#include <cstdlib>

namespace cadrel::gui {

using core::Settings;
using core::VfxPatternEntry;

namespace {

constexpr int TitleFont = 1;
constexpr int TextFont = 0;
constexpr int FlawFont = 2;
constexpr int RowHeight = 20;
constexpr int LabelHeight = 24;
constexpr int FieldHeight = 22;
/// What a tick box takes beside its text.
constexpr int TickWidth = 30;

juce::String shownText(const std::string& stored)
{
    return util::toShownLine(stored).c_str();
}

juce::String numbered(const char* name, std::size_t row)
{
    return juce::String(name) + juce::String(row + 1);
}

juce::String allowedCharacters()
{
    return {core::VfxNameMatcher::AllowedCharacters.data(), core::VfxNameMatcher::AllowedCharacters.size()};
}

int widthOf(const TickBox& box)
{
    return box.getButtonText().isEmpty() ? TickWidth
                                         : getFont(TextFont).getStringWidth(box.getButtonText()) + TickWidth;
}

/// The tops of a row of VFX names, counted from the bottom of the sheet.
struct VfxPlace {
    int box;
    int editors;
    int label;
};
constexpr std::array<VfxPlace, Settings::VfxRowCount> VfxPlaces{{{508, 509, 512}, {481, 481, 484}, {453, 453, 456}}};

} // namespace

// ---- The controls --------------------------------------------------------------------------------------------------

SettingsDialog::Switch::Switch(const SwitchEntry& itsEntry)
    : entry(itsEntry), box(itsEntry.name, translatedText(itsEntry.label))
{
}

SettingsDialog::Choice::Choice(const ChoiceEntry& itsEntry)
    : entry(itsEntry), box(itsEntry.name), label(itsEntry.labelName, itsEntry.label, TextFont)
{
    box.setTextWhenNoChoicesAvailable(translatedText(L"(no choices)"));
    box.setTextWhenNothingSelected({});
    for (const wchar_t* const item : entry.items)
        box.addItem(translatedText(item), box.getNumItems() + 1);
    box.setTitle(label.getText());
}

SettingsDialog::Frames::Frames(const FramesEntry& itsEntry) : entry(itsEntry)
{
    box.setSuffix(" " + translatedText(L"frames"));
    box.setTitle(translatedText(entry.label));
}

SettingsDialog::VfxText::VfxText(const juce::String& name, std::string VfxPatternEntry::*itsPart)
    : editor(name), part(itsPart)
{
    editor.setMultiLine(false);
    editor.setScrollbarsShown(true);
    editor.setCaretVisible(true);
    editor.setPopupMenuEnabled(true);
    editor.setEscapeAndReturnKeysConsumed(false);
    editor.setInputRestrictions(0, allowedCharacters());
    editor.setFont(getFont(TextFont));
    editor.setJustification(juce::Justification::centredLeft);
    editor.setIndents(4, 0);
}

SettingsDialog::VfxRow::VfxRow(std::size_t itsRow)
    : row(itsRow), box(numbered("vfxShotHandlingSelect", row), {}),
      prefix(numbered("vfxShotHandlingPrefix", row), &VfxPatternEntry::prefix),
      postfix(numbered("vfxShotHandlingPostfix", row), &VfxPatternEntry::postfix),
      versionLabel(numbered("m_vfxShotHandlingVersionLabel", row), L"Version Number", TextFont)
{
    versionLabel.setJustificationType(juce::Justification::centred);
    box.setTitle(translatedText(L"VFX Handling") + " " + juce::String(row + 1));
    prefix.editor.setTitle(translatedText(L"Text before the Version Number") + " " + juce::String(row + 1));
    postfix.editor.setTitle(translatedText(L"Text after the Version Number") + " " + juce::String(row + 1));
}

SettingsDialog::Limit::Limit(const char* inputName, const char* labelName, const wchar_t* labelText)
    : label(labelName, labelText, TextFont)
{
    input.setName(inputName);
    input.setTitle(label.getText());
    input.setActive(false);
}

SettingsDialog::SettingsDialog()
    : Sheet("m_settingsDialog"), m_generationTitle("new label", L"Change EDL Generating Options", TitleFont),
      m_generationLine("HLine1"), m_processingTitle("new label", L"Processing Options", TitleFont),
      m_processingLine("HLine2"), m_loadTitle("Load EDL option", L"EDL Loading Options", TitleFont),
      m_loadLine("HLine1"), m_vfxTitle("HealingProcessingLabel", L"VFX Handling", TitleFont),
      m_vfxFlaw("m_vfxFlaw", {}, FlawFont),
      m_before("m_preserveBeforeEdit", "Preserve Before Label", L"Preserve Material Before"),
      m_after("m_preserveAfterEdit", "Preserve After Label", L"Preserve Material After")
{
    setTitle(translatedText(L"Cadrel Settings"));
    addEntries(choiceEntries(), m_choices);
    for (const auto& choice : m_choices) {
        // The label may reach over its box.
        addAndMakeVisible(choice->label);
        choice->box.toFront(false);
    }
    for (juce::Label* const label :
         std::initializer_list<juce::Label*>{&m_generationTitle, &m_generationLine, &m_processingTitle,
                                             &m_processingLine, &m_vfxTitle, &m_vfxFlaw, &m_loadTitle, &m_loadLine})
        addAndMakeVisible(label);
    m_vfxFlaw.setColour(juce::Label::textColourId, toColour(Palette::darkRed));
    addEntries(switchEntries(), m_switches);
    addEntries(framesEntries(), m_frames);
    for (std::size_t row = 0; row < VfxPlaces.size(); ++row)
        addVfxRow(*m_vfxRows.emplace_back(std::make_unique<VfxRow>(row)));
    addLimit(m_before);
    addLimit(m_after);
    orderForKeys();
    setSize(1000, 750);
    setSettings(nullptr);
}

SettingsDialog::~SettingsDialog()
{
    guardSystem([this] {
        // An input that loses the focus tells what was typed.
        m_settings = nullptr;
        giveAwayKeyboardFocus();
    });
}

template <class Entry, class Control>
void SettingsDialog::addEntries(std::span<const Entry> entries, std::vector<std::unique_ptr<Control>>& controls)
{
    for (const Entry& entry : entries) {
        Control& control = *controls.emplace_back(std::make_unique<Control>(entry));
        addAndMakeVisible(control.box);
        control.box.addListener(this);
    }
}

void SettingsDialog::addVfxRow(VfxRow& row)
{
    addAndMakeVisible(row.box);
    row.box.addListener(this);
    for (VfxText* const text : {&row.prefix, &row.postfix}) {
        addAndMakeVisible(text->editor);
        text->editor.addListener(this);
    }
    addAndMakeVisible(row.versionLabel);
}

void SettingsDialog::addLimit(Limit& limit)
{
    addAndMakeVisible(limit.label);
    addAndMakeVisible(limit.input);
    limit.input.addListener(this);
}

/// The Tab key goes from the top to the bottom, and from the left to the right within a row.
void SettingsDialog::orderForKeys()
{
    for (const auto& control : m_switches)
        m_inReadingOrder.push_back(&control->box);
    for (const auto& control : m_choices)
        m_inReadingOrder.push_back(&control->box);
    for (const auto& control : m_frames)
        m_inReadingOrder.push_back(&control->box);
    for (const auto& row : m_vfxRows) {
        for (juce::Component* const control :
             std::initializer_list<juce::Component*>{&row->box, &row->prefix.editor, &row->postfix.editor})
            m_inReadingOrder.push_back(control);
    }
    m_inReadingOrder.push_back(&m_before.input);
    m_inReadingOrder.push_back(&m_after.input);

    resized();
    // The tops of a row differ by less than the rows do.
    const auto isBefore = [](const juce::Component* a, const juce::Component* b) {
        const bool isSameRow = std::abs(a->getY() - b->getY()) < RowHeight / 2;
        return isSameRow ? a->getX() < b->getX() : a->getY() < b->getY();
    };
    std::sort(m_inReadingOrder.begin(), m_inReadingOrder.end(), isBefore);
    for (std::size_t index = 0; index < m_inReadingOrder.size(); ++index)
        m_inReadingOrder[index]->setExplicitFocusOrder(static_cast<int>(index) + 1);
}

// ---- Layout --------------------------------------------------------------------------------------------------------

juce::Rectangle<int> SettingsDialog::panel() const
{
    return {7, getHeight() - 729, 500, 690};
}

void SettingsDialog::put(juce::Component& component, const ChoiceEntry::Place& place) const
{
    component.setBounds(place.x, getHeight() - place.fromBottom, place.width, place.height);
}

void SettingsDialog::resized()
{
    guardSystem([this] {
        put(m_loadTitle, {19, 711, 472, LabelHeight});
        put(m_loadLine, {17, 685, 480, 1});
        put(m_generationTitle, {19, 641, 472, LabelHeight});
        put(m_generationLine, {17, 615, 480, 1});
        put(m_vfxTitle, {24, 539, 150, LabelHeight});
        put(m_vfxFlaw, {174, 539, 320, LabelHeight});
        put(m_processingTitle, {15, 425, 472, LabelHeight});
        put(m_processingLine, {17, 399, 480, 1});
        for (const auto& control : m_switches)
            put(control->box, {21, control->entry.fromBottom, widthOf(control->box), RowHeight});
        for (const auto& control : m_choices) {
            put(control->box, control->entry.place);
            put(control->label, control->entry.labelPlace);
        }
        for (const auto& control : m_frames)
            put(control->box, {360, control->entry.fromBottom, 114, RowHeight});
        for (const auto& row : m_vfxRows) {
            const VfxPlace& place = VfxPlaces[row->row];
            put(row->box, {21, place.box, TickWidth, RowHeight});
            put(row->prefix.editor, {45, place.editors, 140, RowHeight});
            put(row->versionLabel, {187, place.label, 140, LabelHeight});
            put(row->postfix.editor, {334, place.editors, 140, RowHeight});
        }
        put(m_before.label, {37, 307, 315, RowHeight});
        put(m_before.input, {365, 306, 109, FieldHeight});
        put(m_after.label, {37, 280, 315, RowHeight});
        put(m_after.input, {365, 279, 109, FieldHeight});
    });
}

void SettingsDialog::visibilityChanged()
{
    if (!isVisible())
        guardUser([this] {
            // Text fields tell of a change later, and whoever waits for the sheet to close wants all of it.
            storeTexts();
            for (const auto& choice : m_choices)
                choice->box.hidePopup();
        });
    Sheet::visibilityChanged();
}

void SettingsDialog::mouseDown(const juce::MouseEvent& event)
{
    guardUser([&] {
        // A pixel more than what is painted, at the right and at the bottom.
        const juce::Rectangle<int> area = panel().withWidth(501).withHeight(691);
        if (!area.contains(event.getPosition()))
            setVisible(false);
    });
}

// ---- What the user enters ------------------------------------------------------------------------------------------

void SettingsDialog::change(const std::function<void(Settings&)>& store)
{
    if (!m_settings)
        return;
    const SafePointer<SettingsDialog> self(this);
    store(*m_settings);
    if (self)
        refresh(false);
}

void SettingsDialog::changeRow(const VfxRow& row, const std::function<void(VfxPatternEntry&)>& store)
{
    change([&](Settings& settings) {
        VfxPatternEntry entry = vfxRow(settings, row.row);
        store(entry);
        setVfxRow(settings, entry, row.row);
    });
}

void SettingsDialog::buttonClicked(juce::Button* button)
{
    guardUser([&] {
        const bool isOn = button->getToggleState();
        const auto isClicked = [&](const auto& control) { return button == &control->box; };
        if (const auto found = std::find_if(m_switches.begin(), m_switches.end(), isClicked); found != m_switches.end())
            change([&](Settings& settings) { settings.set((*found)->entry.option, isOn); });
        else if (const auto row = std::find_if(m_vfxRows.begin(), m_vfxRows.end(), isClicked); row != m_vfxRows.end())
            changeRow(**row, [&](VfxPatternEntry& entry) { entry.enabled = isOn; });
    });
}

void SettingsDialog::comboBoxChanged(juce::ComboBox* comboBox)
{
    guardUser([&] {
        const int id = comboBox->getSelectedId();
        const auto choice = std::find_if(m_choices.begin(), m_choices.end(),
                                         [&](const auto& control) { return comboBox == &control->box; });
        if (choice != m_choices.end() && id > 0)
            change([&](Settings& settings) { settings.set((*choice)->entry.option, id - 1); });
    });
}

void SettingsDialog::valueChanged(SpinBox& spinBox)
{
    guardUser([&] {
        const auto number = static_cast<std::int32_t>(spinBox.getValue());
        const auto frames = std::find_if(m_frames.begin(), m_frames.end(),
                                         [&](const auto& control) { return &spinBox == &control->box; });
        if (frames != m_frames.end())
            change([&](Settings& settings) { settings.set((*frames)->entry.option, number); });
    });
}

void SettingsDialog::textEditorTextChanged(juce::TextEditor& editor)
{
    guardUser([&] {
        for (const auto& row : m_vfxRows) {
            for (VfxText* const text : {&row->prefix, &row->postfix}) {
                if (&editor == &text->editor)
                    storeText(*row, *text);
            }
        }
    });
}

void SettingsDialog::storeText(const VfxRow& row, VfxText& text)
{
    // The text may be that of other settings by now.
    if (text.editor.getText() == text.shown)
        return;
    changeRow(row, [&](VfxPatternEntry& entry) {
        text.shown = text.editor.getText();
        entry.*text.part = text.shown.toStdString();
    });
}

void SettingsDialog::storeTexts()
{
    for (const auto& row : m_vfxRows) {
        storeText(*row, row->prefix);
        storeText(*row, row->postfix);
    }
}

void SettingsDialog::timecodeChanged(TcInput& input)
{
    guardUser([&] {
        change([&](Settings& settings) {
            const auto secondsOf = [](const TcInput& in) {
                return SignedTimecode{in.getValue(), in.isPositive()}.seconds();
            };
            const auto edited = &input == &m_before.input ? Preserved::Edited::Before : Preserved::Edited::After;
            const Preserved preserved = Preserved{secondsOf(m_before.input), secondsOf(m_after.input)}.inOrder(edited);
            settings.setPreserveMaterial(preserved.before, preserved.after);
        });
    });
}

// ---- What is stored ------------------------------------------------------------------------------------------------

void SettingsDialog::setSettings(Settings* settings)
{
    const bool isAnother = settings != m_settings;
    m_settings = settings;
    refresh(isAnother);
    setEnabled(settings != nullptr);
}

/// With the same settings, what is being typed stays.
void SettingsDialog::refresh(bool isAnother)
{
    if (!m_settings)
        return;
    for (const auto& control : m_switches)
        control->box.setToggleState((m_settings->*control->entry.option)(), juce::dontSendNotification);
    for (const auto& control : m_choices) {
        const int id = itemIdFor((m_settings->*control->entry.option)(), control->entry.items.size());
        control->box.setSelectedId(id, juce::dontSendNotification);
    }
    for (const auto& control : m_frames) {
        const std::int32_t stored = (m_settings->*control->entry.option)();
        const FrameRange range = frameRangeFor(stored);
        control->box.setRange(range.fewest, range.most, 1.0);
        control->box.setValue(stored, juce::dontSendNotification);
    }
    refreshVfx(isAnother);
    refreshLimit(m_before, m_settings->preserveMaterialBefore(), isAnother);
    refreshLimit(m_after, m_settings->preserveMaterialAfter(), isAnother);
}

void SettingsDialog::refreshVfx(bool isAnother)
{
    const juce::String flaw = translatedText(L"Use only the letters A to Z, digits and . * - _");
    const juce::String hint = translatedText(L"* stands for any one character");
    const juce::String unused = translatedText(L"Tick the row to use this name.");
    bool isFlawed = false;
    for (const auto& row : m_vfxRows) {
        const VfxPatternEntry entry = vfxRow(*m_settings, row->row);
        row->box.setToggleState(entry.enabled, juce::dontSendNotification);
        row->versionLabel.setEnabled(entry.enabled);
        for (VfxText* const text : {&row->prefix, &row->postfix}) {
            const std::string& stored = entry.*text->part;
            if (isAnother || text->shown != shownText(stored)) {
                text->shown = shownText(stored);
                text->editor.setText(text->shown, false);
            }
            const bool isWrong = entry.enabled && isRefused(stored);
            text->editor.setTooltip(!entry.enabled ? unused : isWrong ? flaw : hint);
            text->editor.setAlpha(entry.enabled ? 1.0F : DisabledOpacity);
            isFlawed = isFlawed || isWrong;
        }
    }
    m_vfxFlaw.setText(isFlawed ? flaw : juce::String(), juce::dontSendNotification);
    m_vfxFlaw.setTooltip(m_vfxFlaw.getText());
}

void SettingsDialog::refreshLimit(Limit& limit, double seconds, bool isAnother) const
{
    const SignedTimecode present{limit.input.getValue(), limit.input.isPositive()};
    // A sign that was entered before its digits stays, too.
    if (isAnother || present.seconds() != seconds) {
        const SignedTimecode shown = shownTime(seconds);
        limit.input.setValue(shown.amount, shown.isPositive, juce::dontSendNotification);
    }
    limit.label.setEnabled(m_settings->restrictRange());
    limit.input.setActive(m_settings->restrictRange());
}

} // namespace cadrel::gui
