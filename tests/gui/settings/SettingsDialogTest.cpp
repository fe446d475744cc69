// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/settings/SettingsDialog.h"

#include "core/settings/Settings.h"
#include "gui/look/LookAndFeel.h"
#include "gui/look/Text.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/GermanTexts.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/RecordingAlerts.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::Settings;
using core::Timecode;
using core::VfxPatternEntry;
using gui::SettingsDialog;
using gui::SpinBox;
using gui::TcInput;

/// Does at each change of the settings what the main window does.
class OnSettingsChange : public core::ChangeContextListenerInterface {
public:
    OnSettingsChange(Settings& settings, std::function<void()> call) : m_settings(settings), m_call(std::move(call))
    {
        m_settings.addListener(this);
    }
    ~OnSettingsChange() override { m_settings.removeListener(this); }

    void onChange(const core::ChangeContext&) override { m_call(); }

private:
    Settings& m_settings;
    std::function<void()> m_call;
};

class SettingsDialogTest : public testing::Test {
protected:
    SettingsDialogTest()
    {
        m_window.addAndMakeVisible(m_beneath);
        m_beneath.setBounds(m_window.getLocalBounds());
        m_window.addChildComponent(*m_dialog);
        m_dialog->setBeneath(&m_beneath);
    }

    /// Shows the settings as the main window does.
    void open()
    {
        m_dialog->setSettings(&m_settings);
        m_dialog->setVisible(true);
    }
    bool isOpen() const { return m_dialog->isVisible(); }
    void clickAt(int x, int fromBottom) { m_window.click(juce::Point<int>(x, m_dialog->getHeight() - fromBottom)); }

    /// The child of that name, or one of several.
    template <class Control = juce::Component>
    Control& named(const std::string& name, int index = 0) const
    {
        for (juce::Component* const component : m_dialog->getChildren()) {
            if (component->getName() == juce::String(name) && index-- == 0)
                return dynamic_cast<Control&>(*component);
        }
        throw std::runtime_error("there is no " + name);
    }
    juce::Button& toggle(const std::string& name, int index = 0) const { return named<juce::Button>(name, index); }
    juce::ComboBox& combo(const std::string& name) const { return named<juce::ComboBox>(name); }
    juce::TextEditor& editor(const std::string& name) const { return named<juce::TextEditor>(name); }
    TcInput& before() const { return named<TcInput>("m_preserveBeforeEdit"); }
    TcInput& after() const { return named<TcInput>("m_preserveAfterEdit"); }
    /// In the order of creation: that for overhanging clips, and that for snippets.
    SpinBox& spinBox(int index) const
    {
        for (juce::Component* const component : m_dialog->getChildren()) {
            auto* const box = dynamic_cast<SpinBox*>(component);
            if (box && index-- == 0)
                return *box;
        }
        throw std::runtime_error("there is no such spin box");
    }
    SpinBox& overhang() const { return spinBox(0); }
    SpinBox& remains() const { return spinBox(1); }
    static std::string textOf(SpinBox& box)
    {
        return dynamic_cast<juce::Label&>(*box.getChildComponent(0)).getText().toStdString();
    }
    static std::string textOf(const TcInput& input)
    {
        std::string text(1, input.isPositive() ? '+' : '-');
        return text += input.getValue().toString();
    }
    std::string flaw() const { return named<juce::Label>("m_vfxFlaw").getText().toStdString(); }

    void choose(const std::string& name, int id)
    {
        combo(name).setSelectedId(id, juce::sendNotificationSync);
        FocusedWindow::pump();
    }
    static void enter(TcInput& input, const char* amount, bool isPositive = true)
    {
        input.setValue(Timecode(amount), isPositive, juce::sendNotification);
    }
    void restrict() { m_settings.setRestrictRange(true); }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    TestProject m_project;
    RecordingAlerts m_alerts;
    Settings m_settings;
    FocusedWindow m_window{1000, 750};
    juce::Component m_beneath;
    std::unique_ptr<SettingsDialog> m_dialog = std::make_unique<SettingsDialog>();
};

constexpr const char* Prefix1 = "vfxShotHandlingPrefix1";
constexpr const char* Postfix1 = "vfxShotHandlingPostfix1";

// ---- Showing and closing -------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, IsClosedAndDisabledAtFirst)
{
    EXPECT_FALSE(isOpen());
    EXPECT_FALSE(m_dialog->isEnabled());
    EXPECT_EQ(m_dialog->getLocalBounds(), juce::Rectangle<int>(0, 0, 1000, 750));
}

TEST_F(SettingsDialogTest, IsDisabledWithoutSettings)
{
    open();
    EXPECT_TRUE(m_dialog->isEnabled());

    m_dialog->setSettings(nullptr);
    EXPECT_FALSE(m_dialog->isEnabled());
    EXPECT_FALSE(combo("m_matchNameSelect").isEnabled());

    m_dialog->setSettings(&m_settings);
    EXPECT_TRUE(combo("m_matchNameSelect").isEnabled());
}

TEST_F(SettingsDialogTest, IsClosedByAClickBesideThePanelWithoutSettingsToo)
{
    m_dialog->setVisible(true);

    clickAt(600, 300);

    EXPECT_FALSE(isOpen());
}

TEST_F(SettingsDialogTest, IsClosedByAClickBesideThePanelAlone)
{
    for (const auto& [x, fromBottom] : {std::pair(7, 729), std::pair(507, 729), std::pair(7, 39), std::pair(507, 39)}) {
        open();
        clickAt(x, fromBottom);
        EXPECT_TRUE(isOpen()) << x << ' ' << fromBottom;
    }
    for (const auto& [x, fromBottom] :
         {std::pair(6, 300), std::pair(508, 300), std::pair(300, 730), std::pair(300, 38)}) {
        open();
        clickAt(x, fromBottom);
        EXPECT_FALSE(isOpen()) << x << ' ' << fromBottom;
    }
}

TEST_F(SettingsDialogTest, IsClosedByEscapeAndReturn)
{
    for (const int key : {juce::KeyPress::escapeKey, juce::KeyPress::returnKey}) {
        open();
        EXPECT_TRUE(m_window.press(key));
        EXPECT_FALSE(isOpen());
        EXPECT_TRUE(m_beneath.isEnabled());
    }
}

TEST_F(SettingsDialogTest, IsClosedByEscapeInATextField)
{
    open();
    m_window.click(editor(Prefix1));
    m_window.type("VFX_");

    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "VFX_");
}

TEST_F(SettingsDialogTest, StoresWhatWasTypedWhenItCloses)
{
    open();
    m_window.click(editor(Prefix1));
    m_window.type("A");
    // Nobody has been told of this letter when the sheet is hidden.
    editor(Prefix1).insertTextAtCaret("B");

    m_dialog->setVisible(false);

    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "AB");
}

TEST_F(SettingsDialogTest, KeepsTheTabKeyAndGoesFromTheTopToTheBottom)
{
    open();
    std::vector<std::string> names;
    for (int count = 0; count < 60; ++count) {
        const juce::Component* focused = juce::Component::getCurrentlyFocusedComponent();
        ASSERT_NE(focused, nullptr);
        while (focused->getParentComponent() != m_dialog.get()) {
            focused = focused->getParentComponent();
            ASSERT_NE(focused, nullptr);
        }
        const std::string name = focused->getName().isEmpty() ? "spin box" : focused->getName().toStdString();
        if (names.empty() || names.back() != name)
            names.push_back(name);
        if (names.size() > 1 && name == names.front())
            break;
        m_window.press(juce::KeyPress::tabKey);
    }

    // The timecodes are covered, as the range isn't restricted.
    EXPECT_EQ(names, (std::vector<std::string>{"B Roll Renaming",
                                               "m_matchNameSelect",
                                               "m_healProcessingSelect",
                                               "vfxShotHandlingSelect1",
                                               "vfxShotHandlingPrefix1",
                                               "vfxShotHandlingPostfix1",
                                               "vfxShotHandlingSelect2",
                                               "vfxShotHandlingPrefix2",
                                               "vfxShotHandlingPostfix2",
                                               "vfxShotHandlingSelect3",
                                               "vfxShotHandlingPrefix3",
                                               "vfxShotHandlingPostfix3",
                                               "applyToSelect",
                                               "Virgin Territories Select",
                                               "Preserve Select",
                                               "m_lengthOfClipSelect",
                                               "spin box",
                                               "Destination Marker Select",
                                               "Dissolve Wipe Marker Select",
                                               "Insert Marker Select",
                                               "automationWarningMarkerSelect",
                                               "Insert Marker Select",
                                               "spin box",
                                               "Overlap Marker Select",
                                               "B Roll Renaming"}));
}

// ---- Layout --------------------------------------------------------------------------------------------------------

struct Place {
    const char* name;
    int index;
    int x, fromBottom, width, height;
};

const std::vector<Place>& places()
{
    static const std::vector<Place> all{
        {"new label", 0, 19, 641, 472, 24},
        {"HLine1", 0, 17, 615, 480, 1},
        {"new label", 1, 15, 425, 472, 24},
        {"HLine2", 0, 17, 399, 480, 1},
        {"MatchNameLabel", 0, 217, 603, 279, 24},
        {"m_matchNameSelect", 0, 25, 602, 188, 20},
        {"HealingProcessingLabel", 0, 217, 577, 279, 24},
        {"m_healProcessingSelect", 0, 25, 575, 188, 20},
        {"HealingProcessingLabel", 1, 24, 539, 150, 24},
        {"vfxShotHandlingSelect1", 0, 21, 508, 30, 20},
        {"vfxShotHandlingPrefix1", 0, 45, 509, 140, 20},
        {"vfxShotHandlingPostfix1", 0, 334, 509, 140, 20},
        {"m_vfxShotHandlingVersionLabel1", 0, 187, 512, 140, 24},
        {"vfxShotHandlingSelect2", 0, 21, 481, 30, 20},
        {"vfxShotHandlingPrefix2", 0, 45, 481, 140, 20},
        {"vfxShotHandlingPostfix2", 0, 334, 481, 140, 20},
        {"m_vfxShotHandlingVersionLabel2", 0, 187, 484, 140, 24},
        {"vfxShotHandlingSelect3", 0, 21, 453, 30, 20},
        {"vfxShotHandlingPrefix3", 0, 45, 453, 140, 20},
        {"vfxShotHandlingPostfix3", 0, 334, 453, 140, 20},
        {"m_vfxShotHandlingVersionLabel3", 0, 187, 456, 140, 24},
        {"Cadrel Label", 0, 37, 386, 328, 20},
        {"applyToSelect", 0, 335, 384, 139, 20},
        {"Load EDL option", 0, 19, 711, 472, 24},
        {"HLine1", 1, 17, 685, 480, 1},
        // Two pixels higher than their rows on either side, for fields of 22 pixels.
        {"m_preserveBeforeEdit", 0, 365, 306, 109, 22},
        {"m_preserveAfterEdit", 0, 365, 279, 109, 22},
        {"Preserve After Label", 0, 37, 280, 315, 20},
        {"Preserve Before Label", 0, 37, 307, 315, 20},
    };
    return all;
}

TEST_F(SettingsDialogTest, HasItsPlacesAtAnySize)
{
    for (const auto& [width, height] : {std::pair(1000, 750), std::pair(1300, 760), std::pair(1921, 1199)}) {
        m_dialog->setSize(width, height);
        for (const Place& place : places()) {
            const juce::Rectangle<int> expected(place.x, height - place.fromBottom, place.width, place.height);
            EXPECT_EQ(named(place.name, place.index).getBounds().toString(), expected.toString()) << place.name;
        }
        EXPECT_EQ(overhang().getBounds(), juce::Rectangle<int>(360, height - 249, 114, 20));
        EXPECT_EQ(remains().getBounds(), juce::Rectangle<int>(360, height - 114, 114, 20));
    }
}

TEST_F(SettingsDialogTest, HasToggleButtonsAsWideAsTheirTexts)
{
    struct Row {
        const char* name;
        int index;
        const char* text;
        int fromBottom;
    };
    for (const Row& row : {Row{"B Roll Renaming", 0, "B-Roll Renaming", 675},
                           Row{"Virgin Territories Select", 0, "Create Virgin Territories (May Take Some Time)", 359},
                           Row{"Preserve Select", 0, "Restrict Cadrel Range", 332},
                           Row{"m_lengthOfClipSelect", 0, "Include Overhanging Audio Events", 249},
                           Row{"Destination Marker Select", 0, "Create Destination Markers", 222},
                           Row{"Dissolve Wipe Marker Select", 0, "Create Dissolve/Wipe Markers", 195},
                           Row{"Insert Marker Select", 0, "Create Insert Markers", 168},
                           Row{"automationWarningMarkerSelect", 0, "Create Automation Warning Markers", 141},
                           Row{"Insert Marker Select", 1, "Create Audio Snippet Markers", 114},
                           Row{"Overlap Marker Select", 0, "Create Overlap Markers", 87}}) {
        const juce::Button& button = toggle(row.name, row.index);
        EXPECT_EQ(button.getButtonText(), row.text);
        EXPECT_EQ(button.getBounds(),
                  juce::Rectangle<int>(21, 750 - row.fromBottom, gui::getFont(0).getStringWidth(row.text) + 30, 20))
            << row.text;
        EXPECT_EQ(button.findColour(juce::ToggleButton::textColourId), juce::Colour(0xff2e352f));
    }
}

TEST_F(SettingsDialogTest, PaintsAShadeAndItsPanel)
{
    open();

    const juce::Image image = m_dialog->createComponentSnapshot(m_dialog->getLocalBounds());

    // The panel begins at 7 and 750 - 729, and is 500 x 690.
    EXPECT_EQ(image.getPixelAt(6, 21).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(7, 20).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(7, 21).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(506, 710).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(507, 710).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(506, 711).getAlpha(), 0x3a);
}

TEST_F(SettingsDialogTest, HasTheChoicesOfEachComboBox)
{
    const auto items = [this](const char* name) {
        std::vector<std::string> texts;
        for (int index = 0; index < combo(name).getNumItems(); ++index)
            texts.push_back(combo(name).getItemText(index).toStdString());
        return texts;
    };

    EXPECT_EQ(items("m_matchNameSelect"), (std::vector<std::string>{"Roll Name", "Clip Name"}));
    EXPECT_EQ(items("m_healProcessingSelect"),
              (std::vector<std::string>{"None", "Normal", "Gaps without Inserts", "Gaps with Inserts"}));
    EXPECT_EQ(items("applyToSelect"), (std::vector<std::string>{"All Tracks", "Selected Tracks"}));
    EXPECT_EQ(combo("applyToSelect").getItemId(0), 1);
    EXPECT_EQ(combo("applyToSelect").getTextWhenNoChoicesAvailable(), "(no choices)");
    EXPECT_EQ(combo("applyToSelect").getTextWhenNothingSelected(), "");
}

// ---- What is shown -------------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, ShowsNewSettings)
{
    open();

    for (const auto& [name, index] : {std::pair("B Roll Renaming", 0), std::pair("Destination Marker Select", 0),
                                      std::pair("Dissolve Wipe Marker Select", 0), std::pair("Insert Marker Select", 0),
                                      std::pair("automationWarningMarkerSelect", 0),
                                      std::pair("Insert Marker Select", 1), std::pair("Overlap Marker Select", 0)})
        EXPECT_TRUE(toggle(name, index).getToggleState()) << name;
    for (const char* const name : {"Virgin Territories Select", "Preserve Select", "m_lengthOfClipSelect",
                                   "vfxShotHandlingSelect1", "vfxShotHandlingSelect2", "vfxShotHandlingSelect3"})
        EXPECT_FALSE(toggle(name).getToggleState()) << name;
    EXPECT_EQ(combo("m_matchNameSelect").getText(), "Roll Name");
    EXPECT_EQ(combo("m_healProcessingSelect").getText(), "Normal");
    EXPECT_EQ(combo("applyToSelect").getText(), "All Tracks");
    EXPECT_EQ(textOf(overhang()), "5 frames");
    EXPECT_EQ(textOf(remains()), "5 frames");
    EXPECT_EQ(textOf(before()), "+00:00:00:00");
    EXPECT_EQ(textOf(after()), "+00:00:00:00");
    EXPECT_EQ(editor(Prefix1).getText(), "");
    EXPECT_EQ(flaw(), "");
}

TEST_F(SettingsDialogTest, ShowsTheFramesThatTheCommandTakes)
{
    for (const std::int32_t frames : {0, 1, 50, 51, 100, 101, 10000}) {
        m_settings.setSnippetThreshold(frames);
        m_settings.setRemainsThreshold(frames);
        open();
        EXPECT_EQ(overhang().getValue(), frames);
        EXPECT_EQ(remains().getValue(), frames);
    }
}

TEST_F(SettingsDialogTest, ShowsAStoredNumberOutsideItsBoundsAsItIs)
{
    m_settings.setSnippetThreshold(10001);
    m_settings.setRemainsThreshold(-3);
    open();

    EXPECT_EQ(textOf(overhang()), "10001 frames");
    EXPECT_EQ(textOf(remains()), "-3 frames");

    // It can only come back into them.
    overhang().grabKeyboardFocus();
    m_window.press(juce::KeyPress::upKey);
    EXPECT_EQ(m_settings.snippetThreshold(), 10001);
    m_window.press(juce::KeyPress::downKey);
    m_window.press(juce::KeyPress::upKey);
    EXPECT_EQ(m_settings.snippetThreshold(), 10000);
}

TEST_F(SettingsDialogTest, ShowsNoChoiceForANumberThatHasNone)
{
    m_settings.setHealMode(4);
    m_settings.setMatchBy(-1);
    m_settings.setApplyTo(2);
    open();

    EXPECT_EQ(combo("m_healProcessingSelect").getText(), "");
    EXPECT_EQ(combo("m_matchNameSelect").getText(), "");
    EXPECT_EQ(combo("applyToSelect").getText(), "");
    FocusedWindow::pump();
    EXPECT_EQ(m_settings.healMode(), 4);
}

TEST_F(SettingsDialogTest, ShowsTimesBelowZeroWithASign)
{
    m_settings.setPreserveMaterial(-3600.0, 90000.0);
    open();

    EXPECT_EQ(textOf(before()), "-01:00:00:00");
    // Outside of the day there is nothing to show.
    EXPECT_EQ(textOf(after()), "+23:59:59:24");
    EXPECT_EQ(m_settings.preserveMaterialAfter(), 90000.0);
}

TEST_F(SettingsDialogTest, TellsOfAStoredNameThatDoesNotCompile)
{
    m_settings.setVfxPattern(VfxPatternEntry("A/B", "_v", true), 0);

    open();

    EXPECT_EQ(editor(Prefix1).getText(), "A/B");
    EXPECT_EQ(flaw(), "Use only the letters A to Z, digits and . * - _");
    EXPECT_EQ(editor(Prefix1).getTooltip(), "Use only the letters A to Z, digits and . * - _");
    EXPECT_EQ(editor(Postfix1).getTooltip(), "* stands for any one character");
    EXPECT_TRUE(m_alerts.messages.empty());
}

TEST_F(SettingsDialogTest, LeavesAStoredNameThatDoesNotCompileAsItIs)
{
    m_settings.setVfxPattern(VfxPatternEntry("caf\xe9\n/", "_v", true), 0);
    open();

    m_window.press(juce::KeyPress::escapeKey);
    FocusedWindow::pump();

    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "caf\xe9\n/");
}

TEST_F(SettingsDialogTest, DimsTheNamesOfARowWithoutATick)
{
    m_settings.setVfxPattern(VfxPatternEntry("A", "_v", true), 0);
    m_settings.setVfxPattern(VfxPatternEntry("B", "_v", false), 1);
    open();

    EXPECT_EQ(editor(Prefix1).getAlpha(), 1.0F);
    EXPECT_LT(editor("vfxShotHandlingPrefix2").getAlpha(), 1.0F);
    EXPECT_LT(editor("vfxShotHandlingPostfix2").getAlpha(), 1.0F);
    EXPECT_EQ(editor("vfxShotHandlingPrefix2").getTooltip(), "Tick the row to use this name.");
    m_window.click(toggle("vfxShotHandlingSelect2"));
    EXPECT_EQ(editor("vfxShotHandlingPrefix2").getAlpha(), 1.0F);
    EXPECT_EQ(editor("vfxShotHandlingPrefix2").getTooltip(), "* stands for any one character");
    EXPECT_LT(editor("vfxShotHandlingPrefix3").getAlpha(), 1.0F);
}

TEST_F(SettingsDialogTest, TellsNoMoreOfANameThatIsMendedOrNotUsed)
{
    m_settings.setVfxPattern(VfxPatternEntry("A/B", "_v", true), 0);
    open();

    m_window.click(toggle("vfxShotHandlingSelect1"));
    EXPECT_EQ(flaw(), "");
    m_window.click(toggle("vfxShotHandlingSelect1"));
    EXPECT_NE(flaw(), "");

    m_window.click(editor(Prefix1));
    m_window.press('a', juce::ModifierKeys::ctrlModifier);
    m_window.type("AB");
    EXPECT_EQ(flaw(), "");
    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "AB");
}

TEST_F(SettingsDialogTest, ShowsRowsThatAreNotStoredAsEmpty)
{
    m_settings.set(&Settings::vfxPatterns, {});
    open();
    EXPECT_EQ(editor(Prefix1).getText(), "");

    m_window.click(toggle("vfxShotHandlingSelect2"));

    ASSERT_EQ(m_settings.vfxPatterns().size(), 3U);
    EXPECT_TRUE(m_settings.vfxPattern(1).enabled);
    EXPECT_TRUE(m_alerts.messages.empty());
}

TEST_F(SettingsDialogTest, ShowsOtherSettings)
{
    open();
    Settings other;
    other.setHealMode(core::HealMode::None);
    other.setVfxPattern(VfxPatternEntry("X", "Y", true), 2);
    editor(Prefix1).insertTextAtCaret("typed");

    m_dialog->setSettings(&other);
    FocusedWindow::pump();

    EXPECT_EQ(combo("m_healProcessingSelect").getText(), "None");
    EXPECT_EQ(editor("vfxShotHandlingPostfix3").getText(), "Y");
    EXPECT_EQ(editor(Prefix1).getText(), "");
    EXPECT_EQ(other.vfxPattern(0).prefix, "");
    m_dialog->setSettings(nullptr);
}

// ---- What is stored ------------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, StoresEachToggle)
{
    open();
    struct Bound {
        const char* name;
        int index;
        core::Option<bool> Settings::*option;
    };
    for (const Bound& bound : {Bound{"B Roll Renaming", 0, &Settings::bRollRenaming},
                               Bound{"Virgin Territories Select", 0, &Settings::createVirginTerritories},
                               Bound{"Preserve Select", 0, &Settings::restrictRange},
                               Bound{"m_lengthOfClipSelect", 0, &Settings::includeOverhangingAudioEvents},
                               Bound{"Destination Marker Select", 0, &Settings::createDestinationMarkers},
                               Bound{"Dissolve Wipe Marker Select", 0, &Settings::createDissolveWipeMarkers},
                               Bound{"Insert Marker Select", 0, &Settings::createInsertMarkers},
                               Bound{"automationWarningMarkerSelect", 0, &Settings::createAutomationWarningMarkers},
                               Bound{"Insert Marker Select", 1, &Settings::createAudioSnippetMarkers},
                               Bound{"Overlap Marker Select", 0, &Settings::createOverlapMarkers}}) {
        const bool usual = (m_settings.*bound.option).usual();
        m_window.click(toggle(bound.name, bound.index));
        EXPECT_EQ((m_settings.*bound.option)(), !usual) << bound.name;
        m_window.click(toggle(bound.name, bound.index));
        EXPECT_EQ((m_settings.*bound.option)(), usual) << bound.name;
    }
}

TEST_F(SettingsDialogTest, StoresEachChoice)
{
    open();

    choose("m_matchNameSelect", 2);
    EXPECT_EQ(m_settings.matchBy(), core::MatchBy::ClipName);
    choose("m_matchNameSelect", 1);
    EXPECT_EQ(m_settings.matchBy(), core::MatchBy::RollName);
    for (const std::int32_t mode : {3, 0, 2, 1}) {
        choose("m_healProcessingSelect", mode + 1);
        EXPECT_EQ(m_settings.healMode(), mode);
    }
    choose("applyToSelect", 2);
    EXPECT_EQ(m_settings.applyTo(), core::ApplyTo::SelectedTracks);
    choose("applyToSelect", 1);
    EXPECT_EQ(m_settings.applyTo(), core::ApplyTo::AllTracks);
}

TEST_F(SettingsDialogTest, ChoosesByTheArrowKeys)
{
    open();
    combo("m_healProcessingSelect").grabKeyboardFocus();

    m_window.press(juce::KeyPress::downKey);

    EXPECT_EQ(m_settings.healMode(), core::HealMode::GapsWithoutInserts);
}

TEST_F(SettingsDialogTest, StoresFrames)
{
    open();

    overhang().grabKeyboardFocus();
    m_window.press(juce::KeyPress::upKey);
    EXPECT_EQ(m_settings.snippetThreshold(), 6);
    remains().setValue(0.0, juce::sendNotification);
    EXPECT_EQ(m_settings.remainsThreshold(), 0);
    remains().setValue(10000.0, juce::sendNotification);
    EXPECT_EQ(m_settings.remainsThreshold(), 10000);
    remains().setValue(10001.0, juce::sendNotification);
    EXPECT_EQ(m_settings.remainsThreshold(), 10000);
    remains().setValue(7.9, juce::sendNotification);
    EXPECT_EQ(m_settings.remainsThreshold(), 7);
    EXPECT_EQ(textOf(remains()), "7 frames");
}

TEST_F(SettingsDialogTest, StoresARowOfVfxNamesAtEveryKey)
{
    open();
    m_settings.setVfxPattern(VfxPatternEntry("A", "B", false), 1);
    m_dialog->setSettings(&m_settings);

    m_window.click(toggle("vfxShotHandlingSelect2"));
    EXPECT_EQ(m_settings.vfxPattern(1), VfxPatternEntry("A", "B", true));
    m_window.click(editor("vfxShotHandlingPostfix2"));
    m_window.press(juce::KeyPress::endKey);
    m_window.type("_");
    EXPECT_EQ(m_settings.vfxPattern(1), VfxPatternEntry("A", "B_", true));
    m_window.type("c");
    EXPECT_EQ(m_settings.vfxPattern(1), VfxPatternEntry("A", "B_c", true));
    EXPECT_EQ(m_settings.vfxPattern(0), VfxPatternEntry());
    EXPECT_EQ(m_settings.vfxPattern(2), VfxPatternEntry());
}

TEST_F(SettingsDialogTest, TakesTheCharactersOfAVfxNameAlone)
{
    open();
    m_window.click(editor(Prefix1));

    m_window.type(" /A(b\\9.*-_?");

    EXPECT_EQ(editor(Prefix1).getText(), "Ab9.*-_");
    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "Ab9.*-_");
}

TEST_F(SettingsDialogTest, KeepsTheCaretWhereItIsWhileSomethingIsTyped)
{
    open();
    const OnSettingsChange window(m_settings, [this] { m_dialog->setSettings(&m_settings); });
    m_window.click(editor(Prefix1));
    m_window.type("AC");
    m_window.press(juce::KeyPress::leftKey);
    m_settings.setHealMode(core::HealMode::None);

    m_window.type("B");

    EXPECT_EQ(m_settings.vfxPattern(0).prefix, "ABC");
}

// ---- The range -----------------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, CoversTheTimesWhileTheRangeIsNotRestricted)
{
    open();
    EXPECT_FALSE(before().isEnabled());
    EXPECT_FALSE(after().isEnabled());
    for (const char* const label : {"Preserve Before Label", "Preserve After Label"})
        EXPECT_FALSE(named<juce::Label>(label).isEnabled());

    m_window.click(toggle("Preserve Select"));
    for (const char* const label : {"Preserve Before Label", "Preserve After Label"})
        EXPECT_TRUE(named<juce::Label>(label).isEnabled());
    EXPECT_TRUE(before().isEnabled());
    EXPECT_TRUE(after().isEnabled());
    enter(before(), "00:00:10:00");
    enter(after(), "00:00:20:00");

    m_window.click(toggle("Preserve Select"));
    EXPECT_FALSE(before().isEnabled());
    EXPECT_FALSE(after().isEnabled());
    EXPECT_EQ(textOf(before()), "+00:00:10:00");
    EXPECT_EQ(textOf(after()), "+00:00:20:00");
    EXPECT_EQ(m_settings.preserveMaterialAfter(), 20.0);
}

TEST_F(SettingsDialogTest, PullsTheTimeBeforeDownWithTheTimeAfter)
{
    m_settings.setPreserveMaterial(10.0, 20.0);
    restrict();
    open();

    enter(after(), "00:00:05:00");

    EXPECT_EQ(m_settings.preserveMaterialBefore(), 5.0);
    EXPECT_EQ(m_settings.preserveMaterialAfter(), 5.0);
    EXPECT_EQ(textOf(before()), "+00:00:05:00");
}

TEST_F(SettingsDialogTest, PullsTheTimeAfterUpWithTheTimeBefore)
{
    m_settings.setPreserveMaterial(10.0, 20.0);
    restrict();
    open();

    enter(before(), "00:00:25:00");

    EXPECT_EQ(m_settings.preserveMaterialBefore(), 25.0);
    EXPECT_EQ(m_settings.preserveMaterialAfter(), 25.0);
    EXPECT_EQ(textOf(after()), "+00:00:25:00");
}

TEST_F(SettingsDialogTest, StoresTimesBelowZero)
{
    m_settings.setPreserveMaterial(0.0, 20.0);
    restrict();
    open();

    enter(before(), "00:00:05:00", false);
    EXPECT_EQ(m_settings.preserveMaterialBefore(), -5.0);
    EXPECT_EQ(m_settings.preserveMaterialAfter(), 20.0);
    // Further below zero than the time before.
    enter(after(), "00:00:07:00", false);
    EXPECT_EQ(m_settings.preserveMaterialBefore(), -7.0);
    EXPECT_EQ(textOf(before()), "-00:00:07:00");
}

TEST_F(SettingsDialogTest, KeepsASignThatIsEnteredBeforeTheDigits)
{
    restrict();
    const OnSettingsChange window(m_settings, [this] { m_dialog->setSettings(&m_settings); });
    open();

    enter(before(), "00:00:00:00", false);

    EXPECT_EQ(textOf(before()), "-00:00:00:00");
    EXPECT_EQ(m_settings.preserveMaterialBefore(), 0.0);
}

TEST_F(SettingsDialogTest, TakesATypedTimeWhenItIsClosedByAClick)
{
    m_settings.setPreserveMaterial(0.0, 3600.0);
    restrict();
    open();
    m_window.click(before());
    m_window.type("000010");

    clickAt(700, 300);

    EXPECT_FALSE(isOpen());
    EXPECT_GT(m_settings.preserveMaterialBefore(), 0.0);
}

// ---- Who is told ---------------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, TellsNobodyWhenItIsFilled)
{
    RecordingListener listener;
    m_settings.addListener(&listener);
    m_settings.setHealMode(4);
    listener.forget();

    open();
    FocusedWindow::pump();
    m_dialog->setVisible(false);
    FocusedWindow::pump();

    EXPECT_TRUE(listener.types.empty());
    m_settings.removeListener(&listener);
}

TEST_F(SettingsDialogTest, IsFilledAnewAtEachChangeWithoutALoop)
{
    open();
    int calls = 0;
    const OnSettingsChange window(m_settings, [&] {
        ++calls;
        m_dialog->setSettings(&m_settings);
    });

    m_window.click(toggle("Overlap Marker Select"));
    m_window.click(toggle("Preserve Select"));
    enter(before(), "00:00:10:00");

    EXPECT_EQ(calls, 3);
    EXPECT_EQ(textOf(after()), "+00:00:10:00");
}

TEST_F(SettingsDialogTest, MayBeDestroyedByWhoIsToldOfItsChange)
{
    open();
    const OnSettingsChange window(m_settings, [&] { m_dialog.reset(); });

    m_window.click(toggle("Overlap Marker Select"));

    EXPECT_EQ(m_dialog, nullptr);
    EXPECT_FALSE(m_settings.createOverlapMarkers());
}

TEST_F(SettingsDialogTest, MayBeDestroyedWhileSomethingIsTyped)
{
    restrict();
    open();
    m_window.click(before());
    m_window.type("11");

    m_dialog.reset();

    EXPECT_EQ(m_settings.preserveMaterialBefore(), 0.0);
}

TEST_F(SettingsDialogTest, TellsTheUserWhenAChangeFails)
{
    open();
    const OnSettingsChange window(m_settings, [] { throw util::Result::HostCallFailed; });

    m_window.click(toggle("Overlap Marker Select"));

    EXPECT_EQ(m_alerts.messages.size(), 1U);
}

TEST_F(SettingsDialogTest, StoresNothingAfterItsSettingsHaveGone)
{
    auto settings = std::make_unique<Settings>();
    settings->setRestrictRange(true);
    m_dialog->setSettings(settings.get());
    m_dialog->setVisible(true);
    m_window.click(before());
    m_window.type("11");
    editor(Prefix1).insertTextAtCaret("X");

    m_dialog->setSettings(nullptr);
    settings.reset();
    m_dialog->setVisible(false);
    FocusedWindow::pump();

    EXPECT_TRUE(m_alerts.messages.empty());
}

// ---- What it looks like --------------------------------------------------------------------------------------------

TEST_F(SettingsDialogTest, NamesItsControlsForScreenReaders)
{
    EXPECT_EQ(m_dialog->getTitle(), "Cadrel Settings");
    EXPECT_EQ(combo("applyToSelect").getTitle(), "Apply Cadrel to");
    EXPECT_EQ(overhang().getTitle(), "Include Overhanging Audio Events");
    EXPECT_EQ(remains().getTitle(), "Create Audio Snippet Markers");
    EXPECT_EQ(before().getTitle(), "Preserve Material Before");
    EXPECT_EQ(toggle("vfxShotHandlingSelect2").getTitle(), "VFX Handling 2");
    EXPECT_EQ(editor(Prefix1).getTitle(), "Text before the Version Number 1");
    EXPECT_EQ(editor(Postfix1).getTitle(), "Text after the Version Number 1");
}

TEST_F(SettingsDialogTest, HasNoTextThatIsCutInAnyLanguage)
{
    m_settings.setVfxPattern(VfxPatternEntry("A/B", "_v", true), 0);
    m_settings.setSnippetThreshold(10000);
    open();
    EXPECT_EQ(cutTextsOf(*m_dialog), std::vector<std::string>{});

    const GermanTexts german;
    SettingsDialog dialog;
    dialog.setSettings(&m_settings);
    EXPECT_EQ(cutTextsOf(dialog), std::vector<std::string>{});
    for (const juce::Component* const child : dialog.getChildren())
        EXPECT_TRUE(dialog.getLocalBounds().withWidth(507).contains(child->getBounds())) << child->getName();
}

TEST_F(SettingsDialogTest, LooksAsItDoesWithNewSettings)
{
    open();
    m_dialog->grabKeyboardFocus();

    m_dialog->setSize(540, 750);
    expectPicture(*m_dialog, "settings");
}

TEST_F(SettingsDialogTest, LooksAsItDoesWithEverythingUsed)
{
    m_settings.setRestrictRange(true);
    m_settings.setPreserveMaterial(-3600.0, 7384.52);
    m_settings.setIncludeOverhangingAudioEvents(true);
    m_settings.setSnippetThreshold(10000);
    m_settings.setApplyTo(core::ApplyTo::SelectedTracks);
    m_settings.setHealMode(core::HealMode::GapsWithoutInserts);
    m_settings.setVfxPattern(VfxPatternEntry("VFX_****_v", "_comp", true), 0);
    m_settings.setVfxPattern(VfxPatternEntry("A/B", "", true), 1);
    open();
    editor(Postfix1).grabKeyboardFocus();

    m_dialog->setSize(540, 750);
    expectPicture(*m_dialog, "settings-used");
}

TEST_F(SettingsDialogTest, LooksAsItDoesWithoutSettings)
{
    m_settings.setVfxPattern(VfxPatternEntry("VFX_****_v", "_comp", true), 0);
    open();
    m_dialog->setSettings(nullptr);

    m_dialog->setSize(540, 750);
    expectPicture(*m_dialog, "settings-disabled");
}

} // namespace
} // namespace cadrel::tests
