// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainGui.h"

#include "core/protect/RunRecord.h"
#include "core/serialize/ByteArchive.h"
#include "gui/look/FlashTextButton.h"
#include "gui/look/Text.h"
#include "tests/gui/main/ShownWindow.h"
#include "tests/support/TempFolder.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/GermanTexts.h"

#include <functional>
#include <optional>

namespace cadrel::tests {
namespace {

using core::ActionChangeContext;
using core::ChangeContext;
using core::DataModel;
using core::EventListChangeContext;
using core::ListKind;
using core::PropertyKey;
using gui::EventTableModel;
using gui::LookAndFeel;
using gui::MainGui;
using util::Result;

class MainGuiTest : public ShownWindow {};

// ---- Its sources ---------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, HasTheModelThatItsNotifierNames)
{
    EXPECT_EQ(m_gui->model(), nullptr);
    activate();
    EXPECT_EQ(m_gui->model(), &m_model);
    deactivate();
    EXPECT_EQ(m_gui->model(), nullptr);
}

TEST_F(MainGuiTest, HasNoModelWithoutANotifier)
{
    activate();
    m_gui->setNotifier(nullptr);

    EXPECT_EQ(m_gui->model(), nullptr);
    EXPECT_EQ(m_notifier.listeners, 0);
    activate();
    EXPECT_EQ(m_gui->model(), nullptr);
}

TEST_F(MainGuiTest, ListensToOneNotifierAtATime)
{
    CountingNotifier other;
    m_gui->setNotifier(&other);

    EXPECT_EQ(m_notifier.listeners, 0);
    EXPECT_EQ(other.listeners, 1);
    m_gui->setNotifier(nullptr);
}

TEST_F(MainGuiTest, ListensNoLongerWhenItHasGone)
{
    EXPECT_EQ(m_notifier.listeners, 1);
    m_gui.reset();

    EXPECT_EQ(m_notifier.listeners, 0);
    activate();
}

TEST_F(MainGuiTest, SharesOneLookWithOtherWindows)
{
    MainGui other;
    EXPECT_EQ(&m_gui->getLookAndFeel(), &other.getLookAndFeel());
    EXPECT_EQ(&m_gui->getLookAndFeel(), &juce::LookAndFeel::getDefaultLookAndFeel());
}

TEST_F(MainGuiTest, SelectsTheChangeEventThatTheHostNamesByItsPlaces)
{
    const core::Timecode source(1, 0, 5, 0);
    const core::Timecode destination(2, 0, 5, 0);
    EXPECT_FALSE(m_gui->selectChange(source, destination)) << "There is no model.";
    showThree();
    select("Change", {0, 2});

    EXPECT_FALSE(m_gui->selectChange(source, core::Timecode(2, 0, 5, 1)));
    EXPECT_FALSE(m_gui->selectChange(core::Timecode(1, 0, 4, 23), destination));
    EXPECT_EQ(tableModel("Change").getNumSelectedRows(), 2);

    EXPECT_TRUE(m_gui->selectChange(source, destination));
    EXPECT_EQ(tableModel("Change").getSelectedEvents(), EventTableModel::Events{list(ListKind::Change).events()[1]});
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), selected("Change")) << "It is stored.";
    EXPECT_EQ(counters("change"), "3 1 0");
}

TEST_F(MainGuiTest, SelectsNoChangeEventForTheHostWhileASheetIsOpen)
{
    showThree();
    select("Change", {0});
    click("Settings Button");
    EXPECT_FALSE(m_gui->selectChange(core::Timecode(1, 0, 5, 0), core::Timecode(2, 0, 5, 0)));
    EXPECT_EQ(tableModel("Change").getSelectedEvents(), EventTableModel::Events{list(ListKind::Change).events()[0]});
}

TEST_F(MainGuiTest, EndsAPreviewThatIsOnWhenItGoes)
{
    showThree();
    m_engine.setPreviewActive(true);
    m_engine.calls.clear();
    m_gui.reset();

    EXPECT_EQ(m_engine.calls, Calls{"off"});
}

TEST_F(MainGuiTest, GoesAlsoWhenThePreviewCannotBeEnded)
{
    showThree();
    m_engine.setPreviewActive(true);
    m_engine.thrown = Result::NotAvailable;
    m_gui.reset();

    EXPECT_EQ(m_notifier.listeners, 0);
    EXPECT_EQ(m_alerts.messages, Texts());
}

// ---- Controls ------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, HasItsControlsInTheirOrder)
{
    const std::vector<std::string> expected{"Change Table List Box",
                                            "Load Change Edl Button",
                                            "Cadrel Button",
                                            "Old Table List Box",
                                            "New Table List Box",
                                            "Load Old Edl Button",
                                            "Load New Edl Button",
                                            "Generate Button",
                                            "Clear Old Edl Button",
                                            "Clear New Edl Button",
                                            "Clear Change Edl Button",
                                            "Settings Button",
                                            "oldEdlNoEventsLabel",
                                            "oldEdlInvaldEventsLabel",
                                            "oldEdlNoEventsValue",
                                            "oldEdlInvalidEventsValue",
                                            "newEdlNoEventsLabel",
                                            "newEdlInvaldEventsLabel",
                                            "newEdlNoEventsValue",
                                            "newEdlInvalidEventsValue",
                                            "changeEdlNoEventsLabel",
                                            "changeEdlInvaldEventsLabel",
                                            "changeEdlNoEventsValue",
                                            "changeEdlInvalidEventsValue",
                                            "timelineView",
                                            "Save Change Edl Button",
                                            "oldEdlSelectedEventsLabel",
                                            "oldEdlSelectedEventsValue",
                                            "newEdlSelectedEventsLabel",
                                            "newEdlSelectedEventsValue",
                                            "changeEdlSelectedEventsLabel",
                                            "changeEdlSelectedEventsValue",
                                            "videodisplay",
                                            "Source Toggle",
                                            "Destination Toggle",
                                            "m_showNewVideosDialogButton",
                                            "m_videoLeftToggle",
                                            "m_videoRightToggle",
                                            "new component"};
    std::vector<std::string> names;
    for (const juce::Component* const control : controls().getChildren()) {
        names.push_back(control->getName().toStdString());
    }
    EXPECT_EQ(names, expected);
}

TEST_F(MainGuiTest, HasTheTextsOfItsControls)
{
    const auto text = [this](const std::string& name) { return button(name).getButtonText().toStdString(); };
    EXPECT_EQ(text("Cadrel Button"), "Start Cadrel");
    EXPECT_EQ(text("Generate Button"), "Generate");
    EXPECT_EQ(text("Source Toggle"), "SRC");
    EXPECT_EQ(text("Destination Toggle"), "DST");
    EXPECT_EQ(text("m_videoLeftToggle"), "IN");
    EXPECT_EQ(text("m_videoRightToggle"), "OUT");
    EXPECT_EQ(text("new component"), "Preview");
    for (const std::string list : {"old", "new", "change"}) {
        EXPECT_EQ(label(list + "EdlNoEventsLabel").getText(), "Total");
        EXPECT_EQ(label(list + "EdlSelectedEventsLabel").getText(), "Selected");
        EXPECT_EQ(label(list + "EdlInvaldEventsLabel").getText(), "Invalid");
    }
}

TEST_F(MainGuiTest, CountsTheInvalidEventsInGreenBeforeThereIsAnyModel)
{
    const gui::MainControls controls([](std::int32_t, const std::vector<std::string>&) {});

    for (const std::string list : {"old", "new", "change"})
        EXPECT_EQ(find<juce::Label>(controls, list + "EdlInvalidEventsValue").findColour(juce::Label::textColourId),
                  juce::Colour(0xff00ff00));
}

TEST_F(MainGuiTest, ShowsNoHintBeneathASheet)
{
    const auto hasHint = [this](const std::string& name) {
        const juce::Rectangle<int> middle = table(name).getBounds().withSizeKeepingCentre(200, 40);
        const juce::Image image = controls().createComponentSnapshot(middle);
        for (int x = 0; x < image.getWidth(); ++x) {
            for (int y = 0; y < image.getHeight(); ++y) {
                if (image.getPixelAt(x, y).getBrightness() > 0.35F)
                    return true;
            }
        }
        return false;
    };
    EXPECT_FALSE(hasHint("Old"));
    EXPECT_TRUE(hasHint("Change")); // that no project is open
    activate();
    EXPECT_TRUE(hasHint("Old"));
    EXPECT_TRUE(hasHint("Change"));
    click("Settings Button");
    EXPECT_FALSE(hasHint("Old"));
    EXPECT_FALSE(hasHint("Change"));
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_TRUE(hasHint("Old"));
}

TEST_F(MainGuiTest, BeginsWithItsTogglesInTheirFirstState)
{
    EXPECT_TRUE(button("m_videoLeftToggle").getToggleState());
    EXPECT_FALSE(button("m_videoRightToggle").getToggleState());
    EXPECT_TRUE(source().getToggleState());
    EXPECT_FALSE(destination().getToggleState());
    EXPECT_FALSE(preview().getToggleState());
    activate();
    EXPECT_FALSE(source().isEnabled());
    EXPECT_FALSE(destination().isEnabled());
}

TEST_F(MainGuiTest, LaysItselfOutAtAnySize)
{
    showThree();
    for (const juce::Point<int> size : {juce::Point<int>(1300, 750), {1701, 901}, {2560, 1440}}) {
        m_gui->setSize(size.x, size.y);
        EXPECT_EQ(controls().getBounds(), juce::Rectangle<int>(size.x, size.y));
        EXPECT_EQ(fileDialog().getBounds(), controls().getBounds());
        EXPECT_EQ(table("Change").getBounds(),
                  juce::Rectangle<int>(18, size.y / 2 + 55, size.x - 244, size.y / 2 - 225));
        EXPECT_EQ(button("Cadrel Button").getBounds(), juce::Rectangle<int>(size.x - 164, size.y - 32, 112, 24));
        EXPECT_EQ(label("changeEdlNoEventsLabel").getPosition(), juce::Point<int>(22, size.y - 169));
        EXPECT_EQ(editDialog().getWidth(), gui::TcEditDialog::Width);
    }
}

TEST_F(MainGuiTest, CutsNoTextInEitherLanguage)
{
    EXPECT_EQ(cutTextsOf(controls()), std::vector<std::string>());
    m_gui.reset();
    {
        const GermanTexts german;
        const MainGui other;
        EXPECT_EQ(cutTextsOf(*other.getChildComponent(0)), std::vector<std::string>());
    }
}

TEST_F(MainGuiTest, MakesRoomForALargeCount)
{
    fill(ListKind::Old, 3);
    activate();
    const int narrow = label("oldEdlNoEventsValue").getWidth();
    std::vector<std::shared_ptr<core::EventBase>> many(100000, list(ListKind::Old).eventAt(0));
    list(ListKind::Old).append(std::move(many));

    EXPECT_EQ(label("oldEdlNoEventsValue").getText(), "100003");
    EXPECT_GT(label("oldEdlNoEventsValue").getWidth(), narrow);
    EXPECT_EQ(cutTextsOf(controls()), std::vector<std::string>());
}

// ---- Models --------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, IsDisabledWithoutAModel)
{
    EXPECT_FALSE(m_gui->isEnabled());
    activate();
    EXPECT_TRUE(m_gui->isEnabled());
    deactivate();
    EXPECT_FALSE(m_gui->isEnabled());
}

TEST_F(MainGuiTest, ShowsZerosOfAModelWithoutEvents)
{
    activate();

    for (const std::string list : {"old", "new", "change"}) {
        EXPECT_EQ(counters(list), "0 0 0");
        EXPECT_EQ(label(list + "EdlInvalidEventsValue").findColour(juce::Label::textColourId),
                  gui::toColour(gui::Palette::green));
    }
    EXPECT_FALSE(preview().isEnabled());
}

TEST_F(MainGuiTest, CountsTheEventsOfEachList)
{
    fill(ListKind::Old, 3);
    fill(ListKind::New, 4);
    fill(ListKind::Change, 5);
    list(ListKind::New).at(2).addFlaw(core::EventFlaw::RollNameInvalid);
    activate();

    EXPECT_EQ(counters("old"), "3 0 0");
    EXPECT_EQ(counters("new"), "4 0 1");
    EXPECT_EQ(counters("change"), "5 0 0");
    EXPECT_EQ(label("newEdlInvalidEventsValue").findColour(juce::Label::textColourId),
              gui::toColour(gui::Palette::red));
    EXPECT_EQ(label("oldEdlInvalidEventsValue").findColour(juce::Label::textColourId),
              gui::toColour(gui::Palette::green));
}

TEST_F(MainGuiTest, EmptiesItselfWhenTheProjectGoes)
{
    showThree();
    select("Change", {1});
    deactivate();

    for (const std::string list : {"old", "new", "change"})
        EXPECT_EQ(counters(list), "0 0 0");
    EXPECT_EQ(table("Change").getModel(), nullptr);
    EXPECT_EQ(table("Old").getModel(), nullptr);
    EXPECT_EQ(table("New").getModel(), nullptr);
    // The selection that is stored isn't lost with it.
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "1");
}

TEST_F(MainGuiTest, EmptiesItselfAlsoWhenTheFrameRateHasGoneWithTheProject)
{
    showThree();
    select("Change", {1});
    {
        const NoProject noProject;
        deactivate();

        EXPECT_EQ(m_gui->model(), nullptr);
        EXPECT_EQ(counters("change"), "0 0 0");
        EXPECT_FALSE(video().isActive());
        EXPECT_FALSE(m_gui->isEnabled());
    }
    activate();
    EXPECT_EQ(counters("change"), "3 1 0");
}

TEST_F(MainGuiTest, ShowsAnotherModelInTablesOfItsOwn)
{
    showThree();
    select("Change", {0, 2});
    DataModel other;
    other.setNotifier(&m_notifier);
    notify(core::DataModelChangeContext(&other));

    EXPECT_EQ(counters("change"), "0 0 0");
    EXPECT_EQ(table("Change").getSelectedRows().size(), 0);
    list(ListKind::Change).clear();
    EXPECT_EQ(m_gui->model(), &other);
    activate();
    EXPECT_EQ(counters("change"), "0 0 0");
    other.setNotifier(nullptr);
}

TEST_F(MainGuiTest, KeepsItsTableModelsWhileTheModelIsTheSame)
{
    showThree();
    const auto* const before = table("Change").getModel();
    activate();

    EXPECT_EQ(table("Change").getModel(), before);
}

TEST_F(MainGuiTest, TakesSelectionAndOrderFromTheModel)
{
    m_model.setProperty(PropertyKey::ChangeTableSelection, core::Variant(std::string("0;2")));
    m_model.setProperty(PropertyKey::OldTableSelection, core::Variant(std::string("1")));
    m_model.setProperty(PropertyKey::NewTableSelection, core::Variant(std::string("2;7;x")));
    m_model.setProperty(PropertyKey::OldTableSortColumn, core::Variant(std::int32_t{2}));
    m_model.setProperty(PropertyKey::OldTableSortForward, core::Variant(false));
    showThree();

    EXPECT_EQ(selected("Change"), "0;2");
    EXPECT_EQ(selected("Old"), "1");
    EXPECT_EQ(selected("New"), "2");
    EXPECT_FALSE(tableModel("Old").getSortForwards());
    EXPECT_EQ(counters("change"), "3 2 0");
    EXPECT_EQ(counters("old"), "3 1 0");
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiTest, ClosesItsDialogsWhenAnotherModelComes)
{
    showThree();
    click("Load Old Edl Button");
    ASSERT_TRUE(fileDialog().isVisible());
    DataModel other;
    notify(core::DataModelChangeContext(&other));

    EXPECT_FALSE(fileDialog().isVisible());
    EXPECT_TRUE(controls().isEnabled());
    deactivate();
}

// ---- Lists ---------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, FollowsEachList)
{
    showThree();
    fill(ListKind::Old, 1);
    EXPECT_EQ(counters("old"), "4 0 0");
    list(ListKind::New).clear();
    EXPECT_EQ(counters("new"), "0 0 0");
    fill(ListKind::Change, 2);
    EXPECT_EQ(counters("change"), "5 0 0");
    EXPECT_EQ(tableModel("Change").getNumRows(), 5);
}

TEST_F(MainGuiTest, IgnoresAListWithoutAModel)
{
    showThree();
    deactivate();
    notify(EventListChangeContext(ListKind::Old));

    EXPECT_EQ(counters("old"), "0 0 0");
}

TEST_F(MainGuiTest, StoresTheRowsThatAreLeftOfASelection)
{
    showThree();
    select("Change", {1, 2});
    list(ListKind::Change).erase(0, 1);

    EXPECT_EQ(selected("Change"), "0;1");
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "0;1");
    EXPECT_EQ(counters("change"), "2 2 0");
}

TEST_F(MainGuiTest, StoresWhatIsSelectedInEachTable)
{
    showThree();
    select("Old", {0, 1});
    select("New", {2});
    select("Change", {1});

    EXPECT_EQ(property(PropertyKey::OldTableSelection), "0;1");
    EXPECT_EQ(property(PropertyKey::NewTableSelection), "2");
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "1");
    EXPECT_EQ(counters("old"), "3 2 0");
    EXPECT_EQ(counters("new"), "3 1 0");
    EXPECT_EQ(counters("change"), "3 1 0");
}

TEST_F(MainGuiTest, StoresHowEachTableIsSorted)
{
    showThree();
    tableModel("New").applySort(3, false);

    core::Variant column;
    ASSERT_EQ(m_model.getProperty(PropertyKey::NewTableSortColumn, column), Result::Ok);
    EXPECT_EQ(column.toInt(), 3);
    core::Variant forwards;
    ASSERT_EQ(m_model.getProperty(PropertyKey::NewTableSortForward, forwards), Result::Ok);
    EXPECT_FALSE(forwards.toBool());
}

TEST_F(MainGuiTest, HighlightsWhereTheSelectedEventsComeFrom)
{
    showThree();
    select("Change", {1});

    const auto isRelated = [this](const std::string& name, int row) {
        return tableModel(name).getSpokenRow(row).contains("Related");
    };
    EXPECT_FALSE(isRelated("Old", 0));
    EXPECT_TRUE(isRelated("Old", 1));
    EXPECT_FALSE(isRelated("Old", 2));
    EXPECT_TRUE(isRelated("New", 1));
    table("Change").deselectAllRows();
    EXPECT_FALSE(isRelated("Old", 1));
    EXPECT_FALSE(isRelated("New", 1));
}

TEST_F(MainGuiTest, HighlightsNothingForAnEventWithoutUsableTimes)
{
    fill(ListKind::Old, 1);
    fill(ListKind::New, 1);
    list(ListKind::Change).add(makeEvent("A001", "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:99:05:00"));
    activate();
    select("Change", {0});

    EXPECT_FALSE(tableModel("Old").getSpokenRow(0).contains("Related"));
    EXPECT_FALSE(tableModel("New").getSpokenRow(0).contains("Related"));
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, FindsTheHighlightsAnewWhenAListHasChanged)
{
    showThree();
    select("Change", {1});
    list(ListKind::Old).clear();
    fill(ListKind::Old, 3);

    EXPECT_TRUE(tableModel("Old").getSpokenRow(1).contains("Related"));
}

// ---- Buttons for lists ---------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, OpensTheFileDialogForTheListOfTheButton)
{
    activate();
    click("Load Old Edl Button");
    EXPECT_TRUE(fileDialog().isVisible());
    EXPECT_EQ(fileDialog().listType(), ListKind::Old);
    EXPECT_FALSE(controls().isEnabled());
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_FALSE(fileDialog().isVisible());
    EXPECT_TRUE(controls().isEnabled());

    click("Load New Edl Button");
    EXPECT_EQ(fileDialog().listType(), ListKind::New);
    m_window.press(juce::KeyPress::escapeKey);
    click("Load Change Edl Button");
    EXPECT_EQ(fileDialog().listType(), ListKind::Change);
}

TEST_F(MainGuiTest, TakesFilesThatAreDroppedOnAPanel)
{
    const TempFolder folder;
    const juce::String path = folder
                                  .write("reel.edl", "001  A001 V     C        10:00:00:00 10:00:05:00 "
                                                     "01:00:00:00 01:00:05:00\n")
                                  .string();
    activate();
    auto& target = dynamic_cast<juce::FileDragAndDropTarget&>(controls());
    EXPECT_TRUE(target.isInterestedInFileDrag({path}));
    target.filesDropped({path}, 800, 150);

    ASSERT_TRUE(fileDialog().isVisible());
    EXPECT_EQ(fileDialog().listType(), ListKind::New);
    EXPECT_FALSE(target.isInterestedInFileDrag({path}));
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_EQ(counters("new"), "1 0 0");
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, TakesNoFilesThatAreDroppedBesideThePanels)
{
    activate();
    dynamic_cast<juce::FileDragAndDropTarget&>(controls()).filesDropped({"/reel.edl"}, 1290, 740);

    EXPECT_FALSE(fileDialog().isVisible());
}

TEST_F(MainGuiTest, MarksVfxShotsAtOnceWhenTheFileDialogCloses)
{
    fill(ListKind::Old, 1);
    activate();
    m_model.settings().setVfxPattern({"A00", "", true}, 0);
    click("Load Old Edl Button");
    EXPECT_FALSE(list(ListKind::Old).at(0).vfx());
    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_TRUE(list(ListKind::Old).at(0).vfx());
}

TEST_F(MainGuiTest, TellsOfAVfxNameThatCannotBeUsed)
{
    activate();
    m_model.settings().setVfxPattern({"(", "", true}, 0);
    click("Load Old Edl Button");
    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_EQ(m_alerts.messages, Texts{L"A VFX name of the settings can't be used. Correct it there."});
}

TEST_F(MainGuiTest, MarksNothingInAModelThatComes)
{
    showThree();
    m_model.settings().setVfxPattern({"A00", "", true}, 0);
    click("Load Old Edl Button");
    activate();

    EXPECT_FALSE(fileDialog().isVisible());
    EXPECT_FALSE(list(ListKind::Old).at(0).vfx());
}

TEST_F(MainGuiTest, GeneratesTheChangeEdlWithNothingSelected)
{
    showThree();
    for (auto* const cut : {&list(ListKind::Old), &list(ListKind::New)}) {
        cut->clear();
        fill(cut->listKind(), 2);
    }
    select("Change", {0, 1});
    click("Generate Button");

    EXPECT_EQ(m_undo.entries, Texts{L"Generate Change EDL"});
    // The two that touch are healed.
    EXPECT_EQ(list(ListKind::Change).size(), 1U);
    EXPECT_EQ(selected("Change"), "");
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, MarksGenerateWhenTheSettingsWouldGiveAnotherListNow)
{
    showThree();
    const juce::String purpose = "Generate Change EDL";
    const auto hasDot = [this] {
        const juce::Button& generate = button("Generate Button");
        const juce::Image shown = m_gui->createComponentSnapshot(generate.getBounds());
        return shown.getPixelAt(generate.getWidth() - 7, 7) == gui::toColour(gui::Palette::orange);
    };
    click("Generate Button");
    EXPECT_EQ(button("Generate Button").getTooltip(), purpose);
    EXPECT_FALSE(hasDot());

    m_model.settings().setHealMode(core::HealMode::None);
    EXPECT_EQ(button("Generate Button").getTooltip(),
              "The settings have changed since the Change EDL was generated. Press to generate it anew.");
    EXPECT_TRUE(hasDot());
    click("Generate Button");
    EXPECT_EQ(button("Generate Button").getTooltip(), purpose);
    EXPECT_FALSE(hasDot());

    // The names of VFX shots count when the sheet closes.
    click("Settings Button");
    m_model.settings().setVfxPattern({"VFX_", "_v", true}, 0);
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_TRUE(hasDot());
    list(ListKind::Change).clear();
    EXPECT_FALSE(hasDot());
}

TEST_F(MainGuiTest, TellsThatNothingWasFound)
{
    showThree();
    list(ListKind::New).clear();
    list(ListKind::New).add(makeEvent("Z999", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00"));
    click("Generate Button");

    EXPECT_EQ(m_alerts.messages,
              Texts{L"Nothing of the old cut survives in the new one. See that both are of one reel."});
    EXPECT_FALSE(preview().isEnabled());
}

TEST_F(MainGuiTest, EndsThePreviewBeforeItGenerates)
{
    showThree();
    click("new component");
    m_engine.calls.clear();
    click("Generate Button");

    ASSERT_FALSE(m_engine.calls.empty());
    EXPECT_EQ(m_engine.calls.front(), "off");
    EXPECT_FALSE(preview().getToggleState());
    EXPECT_FALSE(source().isEnabled());
}

TEST_F(MainGuiTest, ClearsTheListOfTheButton)
{
    showThree();
    click("Clear New Edl Button");
    EXPECT_EQ(counters("new"), "0 0 0");
    EXPECT_FALSE(button("Clear New Edl Button").isEnabled());
    click("Clear Old Edl Button");
    EXPECT_EQ(counters("old"), "0 0 0");
    click("Clear Change Edl Button");
    EXPECT_EQ(counters("change"), "0 0 0");

    EXPECT_EQ(m_undo.entries, (Texts{L"Delete New EDL", L"Delete Old EDL", L"Delete Change EDL"}));
    EXPECT_FALSE(preview().isEnabled());
    EXPECT_FALSE(button("Cadrel Button").isEnabled());
}

TEST_F(MainGuiTest, EndsThePreviewThroughTheEngineBeforeTheChangeListIsCleared)
{
    showThree();
    click("new component");
    m_engine.calls.clear();
    std::size_t events = 0;
    m_engine.onPreview = [&] { events = list(ListKind::Change).size(); };
    click("Clear Change Edl Button");

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_EQ(events, 3U);
    EXPECT_TRUE(list(ListKind::Change).isEmpty());
    EXPECT_FALSE(m_model.isPreviewActive());
    EXPECT_FALSE(preview().getToggleState());
}

TEST_F(MainGuiTest, ClearsNothingWhenThePreviewCannotBeEnded)
{
    showThree();
    click("new component");
    m_engine.thrown = Result::HostCallFailed;
    click("Clear Change Edl Button");

    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_EQ(m_alerts.messages, Texts{L"The workstation has refused this. Check that no track is locked."});
    EXPECT_TRUE(preview().getToggleState());
    m_engine.thrown = Result::Ok;
}

TEST_F(MainGuiTest, ClearsNothingWhenTheProjectGoesWithItsPreview)
{
    showThree();
    click("new component");
    m_engine.onPreview = [this] { deactivate(); };
    click("Clear Change Edl Button");

    EXPECT_EQ(list(ListKind::Change).size(), 3U);
    EXPECT_EQ(m_gui->model(), nullptr);
}

TEST_F(MainGuiTest, EndsThePreviewWhenItsListChangesElsewhere)
{
    showThree();
    click("new component");
    m_engine.calls.clear();
    list(ListKind::Old).clear();
    EXPECT_EQ(m_engine.calls, Calls());
    list(ListKind::Change).erase(0, 1);

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_FALSE(preview().getToggleState());
    EXPECT_TRUE(preview().isEnabled());
    EXPECT_FALSE(source().isEnabled());
    EXPECT_FALSE(destination().isEnabled());
}

// ---- Saving --------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, SavesTheChangeListWhereTheUserWants)
{
    const TempFolder folder;
    showThree();
    m_box.chosen = {(folder / "change.edl").string()};
    click("Save Change Edl Button");

    ASSERT_EQ(m_box.requests.size(), 1U);
    EXPECT_EQ(m_box.requests[0].title, L"Save Change EDL as...");
    EXPECT_EQ(m_box.requests[0].extension, L"edl");
    EXPECT_EQ(m_box.requests[0].description, L"Edit Decision List");
    EXPECT_TRUE(m_box.requests[0].isForSaving);
    EXPECT_EQ(m_box.requests[0].folder,
              juce::File::getSpecialLocation(juce::File::userHomeDirectory).getFullPathName().toWideCharPointer());
    EXPECT_NE(contentOf(folder / "change.edl").find("003  A003"), std::string::npos);

    m_box.chosen.clear();
    click("Save Change Edl Button");
    EXPECT_EQ(m_box.requests[1].folder, widePath(folder.path()));
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, KeepsItsSaveFolderWhenASaveFails)
{
    const TempFolder folder;
    showThree();
    m_box.chosen = {(folder / "no" / "change.edl").string()};
    click("Save Change Edl Button");
    click("Save Change Edl Button");

    EXPECT_EQ(m_alerts.messages.at(0),
              L"The file can't be read or written. Check that it is there and that you are allowed to use it.");
    EXPECT_NE(m_box.requests[1].folder, widePath(folder / "no"));
}

TEST_F(MainGuiTest, SavesNothingWhenTheListGoesWhileTheBoxIsOpen)
{
    const TempFolder folder;
    showThree();
    m_box.chosen = {(folder / "change.edl").string()};
    m_box.meanwhile = [this] { list(ListKind::Change).clear(); };
    click("Save Change Edl Button");
    EXPECT_EQ(folder.names(), std::vector<std::string>());

    fill(ListKind::Change, 1);
    m_box.meanwhile = [this] { deactivate(); };
    click("Save Change Edl Button");
    EXPECT_EQ(folder.names(), std::vector<std::string>());
}

TEST_F(MainGuiTest, SavesNothingWhenItGoesWhileTheBoxIsOpen)
{
    const TempFolder folder;
    showThree();
    m_box.chosen = {(folder / "change.edl").string()};
    m_box.meanwhile = [this] { m_gui.reset(); };
    click("Save Change Edl Button");

    EXPECT_EQ(folder.names(), std::vector<std::string>());
}

TEST_F(MainGuiTest, AsksBeforeItOverwritesNumberedFiles)
{
    const TempFolder folder;
    std::vector<std::shared_ptr<core::EventBase>> many(
        1000, makeEvent("A001", "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:00:05:00"));
    list(ListKind::Change).append(std::move(many));
    activate();
    folder.write("change_1.edl", "old");
    m_box.chosen = {(folder / "change.edl").string()};
    m_alerts.answer = 3;
    click("Save Change Edl Button");

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_alerts.buttons.at(0), (Texts{L"Overwrite", L"Cancel"}));
    EXPECT_EQ(contentOf(folder / "change_1.edl"), "old");
    EXPECT_EQ(folder.names(), std::vector<std::string>{"change_1.edl"});
    for (const auto key : {RecordingAlerts::Key::Return, RecordingAlerts::Key::Escape}) {
        m_alerts.key = key;
        click("Save Change Edl Button");
        EXPECT_EQ(contentOf(folder / "change_1.edl"), "old");
    }
    m_alerts.key.reset();
    m_alerts.answer = 2;
    click("Save Change Edl Button");
    EXPECT_NE(contentOf(folder / "change_1.edl"), "old");
}

// ---- The preview ---------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, ShowsAPreviewOfTheSelectionWithItsNeighbours)
{
    fill(ListKind::Change, 5);
    activate();
    select("Change", {2});
    EXPECT_EQ(m_engine.calls, Calls());
    click("new component");

    EXPECT_EQ(m_engine.calls, (Calls{"on", "preview 2+3+4 1 1 0"}));
    EXPECT_TRUE(preview().getToggleState());
    EXPECT_TRUE(source().isEnabled());
    EXPECT_TRUE(destination().isEnabled());
    select("Change", {0});
    EXPECT_EQ(m_engine.calls.back(), "preview 1+2 0 1 0");
    select("Change", {4});
    EXPECT_EQ(m_engine.calls.back(), "preview 4+5 1 0 0");
}

TEST_F(MainGuiTest, EndsThePreviewWhenNothingIsSelected)
{
    showThree();
    click("new component");
    EXPECT_EQ(m_engine.calls, (Calls{"on", "end"}));
    select("Change", {0});
    table("Change").deselectAllRows();

    EXPECT_EQ(m_engine.calls, (Calls{"on", "end", "preview 1+2 0 1 0", "end"}));
}

TEST_F(MainGuiTest, SwitchesThePreviewOff)
{
    showThree();
    select("Change", {0});
    click("new component");
    m_engine.calls.clear();
    click("new component");

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_FALSE(preview().getToggleState());
    EXPECT_FALSE(source().isEnabled());
    EXPECT_FALSE(destination().isEnabled());
    EXPECT_TRUE(preview().isEnabled());
}

TEST_F(MainGuiTest, ShowsWhatTheModelSaysWhenThePreviewCannotBeSwitched)
{
    showThree();
    m_engine.thrown = Result::NotAvailable;
    click("new component");

    EXPECT_FALSE(preview().getToggleState());
    EXPECT_FALSE(source().isEnabled());
    EXPECT_EQ(m_alerts.messages, Texts{L"This could not be carried out."});
}

TEST_F(MainGuiTest, TellsOnceWhyAPreviewIsRefusedAndLeavesItOn)
{
    showThree();
    m_engine.ready = Result::NoTracks;
    click("new component");
    EXPECT_EQ(m_alerts.messages, Texts{L"No tracks available for the preview."});
    EXPECT_EQ(m_alerts.buttons, std::vector<Texts>{Texts()});
    EXPECT_TRUE(preview().getToggleState());
    EXPECT_TRUE(dynamic_cast<gui::FlashTextButton&>(preview()).isTimerRunning());
    select("Change", {0});
    select("Change", {1});
    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_engine.calls, Calls{"on"});

    click("new component");
    click("new component");
    EXPECT_EQ(m_alerts.messages.size(), 2U);
}

TEST_F(MainGuiTest, TellsWhyAPreviewCannotBeRequested)
{
    showThree();
    click("new component");
    m_engine.answer = Result::HostCallFailed;
    select("Change", {0});
    select("Change", {1});

    EXPECT_EQ(m_alerts.messages, Texts{L"The workstation has refused this. Check that no track is locked."});
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "1");
}

TEST_F(MainGuiTest, SelectsAlsoWhenThePreviewThrows)
{
    showThree();
    click("new component");
    m_engine.thrown = Result::OutOfRange;
    select("Change", {1});

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "1");
    EXPECT_TRUE(tableModel("Old").getSpokenRow(1).contains("Related"));
    m_engine.thrown = Result::Ok;
}

TEST_F(MainGuiTest, GoesToTheEventsAtTheirDestinationAndBack)
{
    fill(ListKind::Change, 5);
    activate();
    select("Change", {1, 2});
    click("new component");
    m_engine.calls.clear();
    click("Destination Toggle");
    EXPECT_EQ(m_engine.calls, Calls{"cycle 2+3 0 0 1"});
    click("Source Toggle");
    EXPECT_EQ(m_engine.calls, (Calls{"cycle 2+3 0 0 1", "cycle 2+3 0 0 0"}));
    click("Destination Toggle");
    select("Change", {1});
    EXPECT_EQ(m_engine.calls.back(), "preview 1+2+3 1 1 1");
}

TEST_F(MainGuiTest, TellsWhyItCannotGoToTheEvents)
{
    showThree();
    select("Change", {1});
    click("new component");
    m_engine.answer = Result::NotAvailable;
    click("Destination Toggle");

    EXPECT_EQ(m_alerts.messages, Texts{L"This could not be carried out."});
}

TEST_F(MainGuiTest, GoesToNoEventsWhenNoneIsSelected)
{
    showThree();
    click("new component");
    m_engine.calls.clear();
    click("Destination Toggle");

    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, ShowsAPreviewThatIsOnWhenAModelComes)
{
    for (const int kind : {0, 1, 2})
        fill(kind, 3);
    m_model.setPreviewActive(true);
    activate();
    EXPECT_TRUE(preview().getToggleState());
    EXPECT_TRUE(source().isEnabled());
    EXPECT_TRUE(source().getToggleState());
    m_model.setProperty(PropertyKey::PreviewAtDestination, core::Variant(true));
    activate();
    EXPECT_TRUE(destination().getToggleState());
    EXPECT_FALSE(source().getToggleState());

    deactivate();
    EXPECT_FALSE(preview().getToggleState());
    EXPECT_TRUE(source().getToggleState());
    EXPECT_FALSE(destination().getToggleState());
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiTest, LeavesAPreviewThatHasEndedElsewhere)
{
    showThree();
    click("new component");
    m_model.setPreviewActive(false);
    notify(ChangeContext(ChangeContext::PreviewStateChanged));

    EXPECT_FALSE(preview().getToggleState());
    EXPECT_FALSE(destination().isEnabled());
}

TEST_F(MainGuiTest, LetsAPreviewWithoutRowsBeSwitchedOff)
{
    m_model.setPreviewActive(true);
    activate();
    EXPECT_TRUE(preview().isEnabled());
    click("new component");

    EXPECT_EQ(m_engine.calls, Calls{"off"});
    EXPECT_FALSE(preview().isEnabled());
}

TEST_F(MainGuiTest, TakesTheKeyboardWhenAPreviewHasBeenShown)
{
    showThree();
    button("Cadrel Button").grabKeyboardFocus();
    notify(ActionChangeContext(ActionChangeContext::Preview));

    EXPECT_TRUE(table("Change").hasKeyboardFocus(true));
}

TEST_F(MainGuiTest, LeavesTheKeyboardToASheetWhenAPreviewHasBeenShown)
{
    showThree();
    click("Load Old Edl Button");
    notify(ActionChangeContext(ActionChangeContext::Preview));

    EXPECT_FALSE(table("Change").hasKeyboardFocus(true));
    EXPECT_TRUE(fileDialog().hasKeyboardFocus(true));
}

TEST_F(MainGuiTest, LeavesTheKeyboardToOthersWhenAPreviewHasBeenShown)
{
    showThree();
    m_window.grabKeyboardFocus();
    notify(ActionChangeContext(ActionChangeContext::Preview));

    EXPECT_TRUE(m_window.hasKeyboardFocus(false));
}

TEST_F(MainGuiTest, TellsOnceThatAPreviewIsIncomplete)
{
    showThree();
    click("new component");
    notify(ActionChangeContext(ActionChangeContext::Preview, Result::HostCallFailed));
    notify(ActionChangeContext(ActionChangeContext::Preview, Result::HostCallFailed));

    EXPECT_EQ(m_alerts.messages,
              Texts{L"The preview isn't complete.\nThe workstation has refused this. Check that no track is locked."});
}

// ---- Video ---------------------------------------------------------------------------------------------------------

const std::string NoTimes = "--:--:--:-- - --:--:--:--";

TEST_F(MainGuiTest, ShowsTheFramesOfTheOneSelectedEvent)
{
    showThree();
    EXPECT_FALSE(video().isActive());
    EXPECT_EQ(times(), NoTimes);
    select("Change", {1});
    EXPECT_TRUE(video().isActive());
    EXPECT_EQ(times(), "01:00:05:00 - 02:00:05:00");
    EXPECT_FALSE(m_video->request(gui::VideoProviderBase::OldSide).lastFrame);

    click("m_videoRightToggle");
    EXPECT_EQ(times(), "01:00:10:00 - 02:00:10:00");
    EXPECT_TRUE(m_video->request(gui::VideoProviderBase::NewSide).lastFrame);
    click("m_videoLeftToggle");
    EXPECT_EQ(times(), "01:00:05:00 - 02:00:05:00");
}

TEST_F(MainGuiTest, ShowsNoFramesOfSeveralEvents)
{
    showThree();
    select("Change", {0, 1});
    EXPECT_FALSE(video().isActive());
    select("Change", {0});
    EXPECT_TRUE(video().isActive());
    table("Change").deselectAllRows();
    EXPECT_FALSE(video().isActive());
}

TEST_F(MainGuiTest, ShowsNoFramesOfAnEventWithoutUsableTimes)
{
    list(ListKind::Change).add(makeEvent("A001", "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:99:05:00"));
    activate();
    select("Change", {0});

    EXPECT_FALSE(video().isActive());
    EXPECT_EQ(times(), NoTimes);
}

TEST_F(MainGuiTest, ShowsNoFramesWhenTheProjectGoesOrTheEvent)
{
    showThree();
    select("Change", {1});
    list(ListKind::Change).erase(1, 1);
    EXPECT_FALSE(video().isActive());
    select("Change", {0});
    deactivate();
    EXPECT_FALSE(video().isActive());
}

TEST_F(MainGuiTest, DropsWhatKeepsAPictureFromComing)
{
    showThree();
    m_video->failure = Result::HostCallFailed;
    select("Change", {1});

    EXPECT_EQ(property(PropertyKey::ChangeTableSelection), "1");
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, AsksForFramesOnceWhenInOrOutIsPressed)
{
    showThree();
    select("Change", {1});
    const int before = m_video->requestCount;
    click("m_videoRightToggle");

    EXPECT_EQ(m_video->requestCount, before + 2);
}

TEST_F(MainGuiTest, OpensTheChoiceOfVideos)
{
    activate();
    EXPECT_TRUE(videosDialog().isEnabled());
    click("m_showNewVideosDialogButton");
    EXPECT_TRUE(videosDialog().isVisible());
    EXPECT_FALSE(controls().isEnabled());
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_FALSE(videosDialog().isVisible());
    EXPECT_TRUE(controls().isEnabled());
}

TEST_F(MainGuiTest, ClosesTheChoiceOfVideosWhenTheProjectGoes)
{
    activate();
    click("m_showNewVideosDialogButton");
    m_model.videoList().add({"/a.mov", core::Timecode("01:00:00:00"), core::Timecode("00:00:01:00")}, false);
    EXPECT_TRUE(videosDialog().isVisible());
    deactivate();

    EXPECT_FALSE(videosDialog().isVisible());
    EXPECT_EQ(m_alerts.messages, Texts());
}

// ---- Settings ------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, OpensTheSettings)
{
    activate();
    EXPECT_TRUE(settingsDialog().isEnabled());
    click("Settings Button");
    EXPECT_TRUE(settingsDialog().isVisible());
    EXPECT_FALSE(controls().isEnabled());
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_FALSE(settingsDialog().isVisible());
    EXPECT_TRUE(controls().isEnabled());
}

TEST_F(MainGuiTest, MarksVfxShotsAtOnceWhenTheSettingsClose)
{
    fill(ListKind::Old, 1);
    activate();
    click("Settings Button");
    m_model.settings().setVfxPattern({"A00", "", true}, 0);
    EXPECT_FALSE(list(ListKind::Old).at(0).vfx());
    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_TRUE(list(ListKind::Old).at(0).vfx());
}

TEST_F(MainGuiTest, TellsOnceOfAVfxNameThatCannotBeUsedInWhateverWayTheSettingsClose)
{
    const Texts once{L"A VFX name of the settings can't be used. Correct it there."};
    fill(ListKind::Old, 1);
    activate();
    m_model.settings().setVfxPattern({"A00", "", true}, 0);
    m_model.settings().setVfxPattern({"(", "", true}, 1);
    const std::vector<std::function<void()>> ways{[this] { m_window.press(juce::KeyPress::escapeKey); },
                                                  [this] { m_window.press(juce::KeyPress::returnKey); },
                                                  [this] { m_window.click(juce::Point<int>(1200, 300)); }};
    for (const auto& close : ways) {
        m_alerts.messages.clear();
        click("Settings Button");
        close();

        EXPECT_FALSE(settingsDialog().isVisible());
        EXPECT_EQ(m_alerts.messages, once);
    }
    EXPECT_FALSE(list(ListKind::Old).at(0).vfx()) << "no name counts until all can be used";
}

TEST_F(MainGuiTest, SaysNothingOfAVfxNameWhenTheProjectComesOrGoes)
{
    fill(ListKind::Old, 1);
    m_model.settings().setVfxPattern({"(", "", true}, 0);
    activate();
    for (const char* const open : {"Settings Button", "Load Old Edl Button"}) {
        click(open);
        deactivate();
        activate();
        click(open);
        DataModel other;
        notify(core::DataModelChangeContext(&other));
        activate();
    }
    click("Settings Button");
    m_gui.reset();

    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, TellsOfAVfxNameAfterAnUndoOnlyWhenTheSettingsClose)
{
    fill(ListKind::Old, 1);
    activate();
    m_model.settings().setVfxPattern({"(", "", true}, 0);
    core::serialize::ByteArchive before;
    before << m_model;
    click("Settings Button");
    m_model.restore(before);

    EXPECT_EQ(m_alerts.messages, Texts());
    ASSERT_TRUE(settingsDialog().isVisible());
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_EQ(m_alerts.messages.size(), 1U);
}

TEST_F(MainGuiTest, ShowsSettingsThatChangeElsewhere)
{
    activate();
    click("Settings Button");
    auto& renaming = find<juce::ToggleButton>(settingsDialog(), "B Roll Renaming");
    const bool before = renaming.getToggleState();
    m_model.settings().setBRollRenaming(!before);

    EXPECT_EQ(renaming.getToggleState(), !before);
}

TEST_F(MainGuiTest, ClosesTheSettingsWhenAnotherProjectComes)
{
    activate();
    click("Settings Button");
    DataModel other;
    notify(core::DataModelChangeContext(&other));
    EXPECT_FALSE(settingsDialog().isVisible());
    EXPECT_TRUE(settingsDialog().isEnabled());
    deactivate();

    EXPECT_FALSE(settingsDialog().isEnabled());
}

// ---- The run -------------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, StartsARunAndIsDisabledUntilItsEnd)
{
    showThree();
    click("Cadrel Button");
    EXPECT_EQ(m_engine.calls, Calls{"run"});
    EXPECT_FALSE(m_gui->isEnabled());
    notify(ActionChangeContext(ActionChangeContext::Preview));
    EXPECT_FALSE(m_gui->isEnabled());
    notify(ActionChangeContext(ActionChangeContext::Run));

    EXPECT_TRUE(m_gui->isEnabled());
    EXPECT_EQ(m_alerts.messages, Texts());
    EXPECT_TRUE(table("Change").hasKeyboardFocus(true));
}

TEST_F(MainGuiTest, IsEnabledAgainWhenARunIsDroppedOrItsModelReplaced)
{
    showThree();
    click("Cadrel Button");
    notify(ActionChangeContext::dropped(ActionChangeContext::Run));
    EXPECT_TRUE(m_gui->isEnabled());
    click("Cadrel Button");
    EXPECT_FALSE(m_gui->isEnabled());
    activate();
    EXPECT_TRUE(m_gui->isEnabled());
    EXPECT_EQ(m_alerts.messages, Texts());
}

TEST_F(MainGuiTest, EndsThePreviewBeforeARun)
{
    showThree();
    select("Change", {0});
    click("new component");
    click("Destination Toggle");
    m_engine.calls.clear();
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, (Calls{"off", "run"}));
    EXPECT_FALSE(preview().getToggleState());
    EXPECT_TRUE(source().getToggleState());
    EXPECT_FALSE(source().isEnabled());
    EXPECT_FALSE(destination().isEnabled());
}

TEST_F(MainGuiTest, TellsWhyNoRunCanBegin)
{
    showThree();
    for (const Result::Type ready :
         {Result::ChangeEdlEmpty, Result::NoTracksSelected, Result::NoTracks, Result::NoProject}) {
        m_engine.ready = ready;
        click("Cadrel Button");
    }

    EXPECT_EQ(m_alerts.messages,
              (Texts{L"No events in Change EDL.",
                     L"No tracks selected for Cadrel process.\nPlease select the tracks that you want to use.",
                     L"No tracks available for Cadrel process."}));
    EXPECT_EQ(m_alerts.buttons, std::vector<Texts>(3));
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_TRUE(m_gui->isEnabled());
}

TEST_F(MainGuiTest, TellsWhyARunWasRefused)
{
    showThree();
    m_engine.answer = Result::HostCallFailed;
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages, Texts{L"The workstation has refused this. Check that no track is locked."});
    EXPECT_TRUE(m_gui->isEnabled());
}

TEST_F(MainGuiTest, TellsThatARunIsIncompleteAndWhy)
{
    showThree();
    click("Cadrel Button");
    notify(ActionChangeContext(ActionChangeContext::Run, Result::HostCallFailed));

    EXPECT_EQ(m_alerts.messages,
              Texts{L"The run has ended before it was complete. Undo takes back what it has done.\nThe workstation has "
                    L"refused this. Check that no track is locked."});
    EXPECT_TRUE(m_gui->isEnabled());
}

// ---- What a run would take away ------------------------------------------------------------------------------------

class MainGuiProtectionTest : public ShownWindow {
protected:
    /// Fifteen seconds from 01:00:00:00 come to stand ten seconds later, and a minute of sound stands at 05:00:00:00.
    void showGivenList()
    {
        list(ListKind::Change).add(makeEvent("A001", "01:00:00:00", "01:00:15:00", "01:00:10:00", "01:00:25:00", 1));
        m_engine.material = {{3600, 3615}, {5 * 3600, 5 * 3600 + 60}};
        activate();
    }
    /// Two shots, of which the first has lost its last two seconds, and a second of sound before them:
    ///
    ///     old    |-- A --|-- B --|       10 s each, from 01:00:00:00
    ///     new    |- A -|-- B --|
    void showGenerated()
    {
        const auto addShots = [](core::EventList& cut, const char* endOfA, const char* between, const char* end) {
            cut.add(makeEvent("A001", "10:00:00:00", endOfA, "01:00:00:00", between));
            cut.add(makeEvent("B002", "12:00:00:00", "12:00:10:00", between, end));
        };
        addShots(list(ListKind::Old), "10:00:10:00", "01:00:10:00", "01:00:20:00");
        addShots(list(ListKind::New), "10:00:08:00", "01:00:08:00", "01:00:18:00");
        ASSERT_EQ(m_model.generateChangeEdl(), Result::Ok);
        ASSERT_EQ(list(ListKind::Change).size(), 2U);
        m_engine.material = {{3598, 3599}};
        activate();
    }
    /// A shot that comes to stand eight seconds later, close to midnight, and sound hours before.
    void showLateReel()
    {
        list(ListKind::Old).add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "23:59:40:00", "23:59:50:00"));
        list(ListKind::New).add(makeEvent("A001", "10:00:00:00", "10:00:10:00", "23:59:48:00", "23:59:58:00"));
        ASSERT_EQ(m_model.generateChangeEdl(), Result::Ok);
        m_engine.material = {{12 * 3600, 12 * 3600 + 1}};
        activate();
    }
    /// Sound after the late reel, which would move with it, out of the day.
    void addSoundAtMidnight() { m_engine.material.push_back({24 * 3600 - 6, 24 * 3600 - 4}); }
};

TEST_F(MainGuiProtectionTest, StartsARunThatTakesNothingAwayWithoutAQuestion)
{
    showGivenList();
    m_engine.material.pop_back();
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages, Texts());
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiProtectionTest, KeepsWhatTheListDoesNotCarryUnlessTheUserWantsOtherwise)
{
    showGivenList();
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_alerts.messages[0].substr(0, 11), L"00:01:00:00");
    EXPECT_EQ(m_alerts.buttons[0], (Texts{L"Keep", L"Don't Keep", L"Cancel"}));
    EXPECT_EQ(m_engine.calls, Calls{"run 3600..3625"});
    // The list stays as it is, so that there is nothing to undo.
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_EQ(list(ListKind::Change).size(), 1U);
    EXPECT_FALSE(m_gui->isEnabled());
}

TEST_F(MainGuiProtectionTest, TakesItAwayWhenTheUserWantsThat)
{
    showGivenList();
    m_alerts.answer = 2;
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, Calls{"run"});
    EXPECT_EQ(m_undo.begun, Texts());
}

TEST_F(MainGuiProtectionTest, StartsNoRunWhenTheUserCancelsOrClosesTheQuestion)
{
    showGivenList();
    for (const std::int32_t answer : {3, 0, 4}) {
        m_alerts.answer = answer;
        click("Cadrel Button");
    }

    EXPECT_EQ(m_alerts.messages.size(), 3U);
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_TRUE(m_gui->isEnabled());
}

TEST_F(MainGuiProtectionTest, StartsNoRunWhenTheProjectGoesDuringTheQuestion)
{
    showGivenList();
    m_alerts.meanwhile = [this] { deactivate(); };
    click("Cadrel Button");
    activate();
    m_alerts.meanwhile = [this] { m_engine.ready = Result::NoTracks; };
    click("Cadrel Button");
    m_alerts.meanwhile = [this] { m_gui.reset(); };
    m_engine.ready = Result::Ok;
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages.size(), 3U);
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiProtectionTest, PutsAListThatKeepsAllInThePlaceOfAGeneratedOne)
{
    showGenerated();
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_engine.calls, Calls{"run 3608..3620 of B002"});
    // The list changes with the run, so that both are one entry of the undo list.
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_EQ(list(ListKind::Change).size(), 2U);
}

TEST_F(MainGuiProtectionTest, LeavesAGeneratedListAsItIsWhenTheRunIsRefused)
{
    showGenerated();
    m_engine.answer = Result::HostCallFailed;
    click("Cadrel Button");

    EXPECT_EQ(list(ListKind::Change).size(), 2U);
    EXPECT_EQ(m_undo.begun, Texts());
    EXPECT_EQ(m_alerts.messages.back(), L"The workstation has refused this. Check that no track is locked.");
    EXPECT_TRUE(m_gui->isEnabled());
}

TEST_F(MainGuiProtectionTest, KeepsOnReturnAndStartsNoRunOnEscape)
{
    showGenerated();
    m_alerts.key = RecordingAlerts::Key::Escape;
    click("Cadrel Button");
    EXPECT_EQ(m_engine.calls, Calls());
    m_alerts.key = RecordingAlerts::Key::Return;
    click("Cadrel Button");
    EXPECT_EQ(m_engine.calls, Calls{"run 3608..3620 of B002"});
}

TEST_F(MainGuiProtectionTest, StartsNoRunOnReturnOrEscapeWhereNothingCanBeKept)
{
    showLateReel();
    addSoundAtMidnight();
    for (const auto key : {RecordingAlerts::Key::Return, RecordingAlerts::Key::Escape}) {
        m_alerts.key = key;
        click("Cadrel Button");
    }

    EXPECT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiProtectionTest, AsksAgainWhenThereIsMoreToKeepAfterTheQuestion)
{
    showGivenList();
    m_alerts.meanwhile = [this] { m_engine.material.push_back({6 * 3600, 6 * 3600 + 30}); };
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_EQ(m_alerts.messages[0].substr(0, 11), L"00:01:00:00");
    EXPECT_EQ(m_alerts.messages[1].substr(0, 11), L"00:01:30:00");
    EXPECT_EQ(m_engine.calls, Calls{"run 3600..3625"});
}

TEST_F(MainGuiProtectionTest, StartsAPlainRunWhenThereIsNothingLeftToKeepAfterTheQuestion)
{
    showGivenList();
    m_alerts.meanwhile = [this] { m_engine.material.pop_back(); };
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiProtectionTest, AsksAgainWhenNothingCanBeKeptAfterTheQuestion)
{
    showLateReel();
    m_alerts.meanwhile = [this] { addSoundAtMidnight(); };
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_NE(m_alerts.messages[1].find(L"It can't be kept"), std::wstring::npos);
    EXPECT_EQ(m_alerts.buttons[1], (Texts{L"Don't Keep", L"Cancel"}));
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(list(ListKind::Change).size(), 1U);
}

TEST_F(MainGuiProtectionTest, AsksWhetherToRepeatARunThatHasBeenDoneDuringTheQuestion)
{
    showGivenList();
    m_alerts.meanwhile = [this] { core::RunRecord::addRun(m_model, core::PastRuns::AllTime); };
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_EQ(m_alerts.messages[1].substr(0, 61), L"This Change EDL has been carried out in the project already.\n");
    // No button is the first one of the second question.
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiProtectionTest, EndsAPreviewThatHasComeOnDuringTheQuestion)
{
    showGenerated();
    click("Destination Toggle");
    m_alerts.meanwhile = [this] {
        m_model.setPreviewActive(true);
        m_model.notifyPreviewState();
    };
    click("Cadrel Button");

    // Else the change of the list would end it, and drop the run.
    EXPECT_EQ(m_engine.calls, (Calls{"off", "run 3608..3620 of B002"}));
    EXPECT_FALSE(m_model.isPreviewActive());
    EXPECT_TRUE(source().getToggleState());
    EXPECT_FALSE(m_gui->isEnabled());
}

TEST_F(MainGuiProtectionTest, StartsNoRunOfCutsWhoseNamesCannotBeCompared)
{
    showGenerated();
    m_model.settings().setVfxPattern({"(", "", true}, 0);
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_alerts.messages, Texts{L"A VFX name of the settings can't be used. Correct it there."});
    EXPECT_TRUE(m_gui->isEnabled());
}

TEST_F(MainGuiProtectionTest, OffersToLeaveItWhereNothingCanBeKept)
{
    showLateReel();
    addSoundAtMidnight();
    m_alerts.answer = 2;
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.buttons.at(0), (Texts{L"Don't Keep", L"Cancel"}));
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiProtectionTest, StartsNoRunWhenItCannotLookAtTheProject)
{
    showGivenList();
    m_engine.material = {{10, 5}};
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_EQ(m_alerts.messages, Texts{L"This could not be carried out."});
}

TEST_F(MainGuiProtectionTest, TellsThatNothingHasToChange)
{
    for (const int kind : {0, 1, 2})
        fill(kind, 1);
    // The cut onto itself.
    list(ListKind::New).clear();
    list(ListKind::New).append(list(ListKind::Old));
    list(ListKind::Change).clear();
    list(ListKind::Change).add(makeEvent("A001", "01:00:00:00", "01:00:05:00", "01:00:00:00", "01:00:05:00", 1));
    m_engine.material = {{3500, 3510}};
    activate();
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages.back(), L"Everything stands where the new cut has it. Nothing has to change.");
    EXPECT_EQ(m_engine.calls, Calls());
    // It counts as done, so that the next one can go on from there.
    EXPECT_EQ(m_undo.entries, Texts{L"Apply Cadrel"});
    const auto noted = core::RunRecord::find(m_model);
    ASSERT_TRUE(noted);
    EXPECT_EQ(noted->firstDifference(list(ListKind::New)), std::nullopt);
}

// ---- A run that has been done --------------------------------------------------------------------------------------

class MainGuiRepeatTest : public ShownWindow {
protected:
    MainGuiRepeatTest()
    {
        list(ListKind::Change).add(makeEvent("A001", "01:00:00:00", "01:00:15:00", "01:00:10:00", "01:00:25:00", 1));
        m_engine.material = {{3600, 3615}};
        activate();
        core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    }
};

TEST_F(MainGuiRepeatTest, StartsTheSameRunAgainOnlyWhenTheUserWantsThat)
{
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_alerts.messages[0].substr(0, 61), L"This Change EDL has been carried out in the project already.\n");
    EXPECT_EQ(m_alerts.buttons[0], (Texts{L"Start Anyway", L"Cancel"}));
    EXPECT_EQ(m_engine.calls, Calls());
    EXPECT_TRUE(m_gui->isEnabled());
    m_alerts.answer = 2;
    click("Cadrel Button");
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiRepeatTest, StartsNoRunWhenTheUserClosesTheQuestion)
{
    for (const std::int32_t answer : {0, 3}) {
        m_alerts.answer = answer;
        click("Cadrel Button");
    }

    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiRepeatTest, StartsNoRunOnReturnOrEscape)
{
    for (const auto key : {RecordingAlerts::Key::Return, RecordingAlerts::Key::Escape}) {
        m_alerts.key = key;
        click("Cadrel Button");
    }
    EXPECT_EQ(m_alerts.messages.size(), 2U);

    // The sound stands in the cut of a shot that isn't the one of the old cut now.
    list(ListKind::Old).add(makeEvent("A001", "10:00:00:00", "10:00:15:00", "01:00:00:00", "01:00:15:00"));
    list(ListKind::New).add(makeEvent("B002", "10:00:00:00", "10:00:15:00", "01:00:00:00", "01:00:15:00"));
    core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    for (const auto key : {RecordingAlerts::Key::Return, RecordingAlerts::Key::Escape}) {
        m_alerts.key = key;
        click("Cadrel Button");
        EXPECT_EQ(m_alerts.messages.back().substr(0, 46), L"The Old EDL isn't the cut of the last run. The");
    }
    EXPECT_EQ(m_alerts.messages.size(), 4U);
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiRepeatTest, AsksWhateverTheVfxNamesOfTheSettingsAre)
{
    m_model.settings().setVfxPattern({"(", "", true}, 0);
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_alerts.messages[0].substr(0, 61), L"This Change EDL has been carried out in the project already.\n");
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiRepeatTest, AsksOfRunsThatAnOlderVersionHasNoted)
{
    m_model.setProperty(PropertyKey::EarlierRuns, core::Variant(property(PropertyKey::DoneRuns)));
    m_model.removeProperty(PropertyKey::DoneRuns);
    click("Cadrel Button");

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(m_engine.calls, Calls());
}

TEST_F(MainGuiRepeatTest, AsksAgainWhenTheSoundStandsInAnotherCutAfterTheQuestion)
{
    m_alerts.answer = 2;
    m_alerts.meanwhile = [this] {
        // The sound stands in the cut of a shot that isn't the one of the old cut now.
        list(ListKind::Old).add(makeEvent("A001", "10:00:00:00", "10:00:15:00", "01:00:00:00", "01:00:15:00"));
        list(ListKind::New).add(makeEvent("B002", "10:00:00:00", "10:00:15:00", "01:00:00:00", "01:00:15:00"));
        core::RunRecord::addRun(m_model, core::PastRuns::AllTime);
    };
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.messages.size(), 2U);
    EXPECT_EQ(m_alerts.messages[1].substr(0, 46), L"The Old EDL isn't the cut of the last run. The");
}

TEST_F(MainGuiRepeatTest, EndsAPreviewThatHasComeOnDuringTheQuestion)
{
    m_alerts.answer = 2;
    m_alerts.meanwhile = [this] { m_model.setPreviewActive(true); };
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, (Calls{"off", "run"}));
}

TEST_F(MainGuiRepeatTest, AsksThenAlsoWhatIsToBeKept)
{
    m_engine.material.push_back({5 * 3600, 5 * 3600 + 60});
    m_alerts.answer = 2;
    click("Cadrel Button");

    ASSERT_EQ(m_alerts.buttons.size(), 2U);
    EXPECT_EQ(m_alerts.buttons[1], (Texts{L"Keep", L"Don't Keep", L"Cancel"}));
    EXPECT_EQ(m_engine.calls, Calls{"run"});
}

TEST_F(MainGuiRepeatTest, AsksNothingWhereNoRunCanBeReadFromTheProject)
{
    for (const char* const note : {"", "no bytes of runs"}) {
        m_model.setProperty(PropertyKey::DoneRuns, core::Variant(note));
        click("Cadrel Button");
        notify(ActionChangeContext(ActionChangeContext::Run, Result::Ok));
    }

    EXPECT_EQ(m_alerts.messages, Texts());
    EXPECT_EQ(m_engine.calls, (Calls{"run", "run"}));
}

TEST_F(MainGuiRepeatTest, StartsNoRunWhenTheProjectGoesDuringTheQuestion)
{
    m_alerts.answer = 2;
    m_alerts.meanwhile = [this] { deactivate(); };
    click("Cadrel Button");
    activate();
    m_alerts.meanwhile = [this] { m_gui.reset(); };
    click("Cadrel Button");

    EXPECT_EQ(m_engine.calls, Calls());
}

// ---- Editing, keys -------------------------------------------------------------------------------------------------

TEST_F(MainGuiTest, EditsAnEventBesideThePlaceWhereTheUserAsked)
{
    showThree();
    select("Change", {1});
    table("Change").grabKeyboardFocus();
    m_window.press(juce::KeyPress::returnKey);

    ASSERT_TRUE(editDialog().isVisible());
    EXPECT_FALSE(controls().isEnabled());
    // The row begins at the left edge of the table, and the dialog doesn't fit below it.
    EXPECT_EQ(editDialog().getX(), 18 + 10);
    EXPECT_EQ(editDialog().getY(), 750 - 300 - 10);
    m_window.press(juce::KeyPress::escapeKey);
    EXPECT_FALSE(editDialog().isVisible());
    EXPECT_TRUE(table("Change").hasKeyboardFocus(true));
}

TEST_F(MainGuiTest, ClosesTheEditDialogWhenItsEventLeavesTheList)
{
    showThree();
    select("Old", {1});
    table("Old").grabKeyboardFocus();
    m_window.press(juce::KeyPress::returnKey);
    ASSERT_TRUE(editDialog().isVisible());
    list(ListKind::Old).erase(0, 1);
    EXPECT_TRUE(editDialog().isVisible());
    list(ListKind::Old).clear();

    EXPECT_FALSE(editDialog().isVisible());
}

TEST_F(MainGuiTest, GivesTheKeyboardToTheChangeTableFirst)
{
    showThree();
    m_gui->grabKeyboardFocus();

    EXPECT_TRUE(table("Change").hasKeyboardFocus(true));
}

/// Counts the clicks that a button tells of.
class ClickCount : public juce::Button::Listener {
public:
    explicit ClickCount(juce::Button& button) : m_button(button) { m_button.addListener(this); }
    ~ClickCount() override { m_button.removeListener(this); }
    void buttonClicked(juce::Button*) override { ++count; }

    int count = 0;

private:
    juce::Button& m_button;
};

TEST_F(MainGuiTest, SwitchesThePicturesByTheArrowKeys)
{
    showThree();
    m_gui->grabKeyboardFocus();
    juce::Button& in = button("m_videoLeftToggle");
    juce::Button& out = button("m_videoRightToggle");
    const ClickCount clicks(in);

    EXPECT_TRUE(m_window.press(juce::KeyPress::leftKey));
    EXPECT_EQ(clicks.count, 0);
    EXPECT_TRUE(m_window.press(juce::KeyPress::rightKey));
    EXPECT_TRUE(out.getToggleState());
    EXPECT_FALSE(in.getToggleState());
    EXPECT_TRUE(m_window.press(juce::KeyPress::leftKey));
    EXPECT_TRUE(in.getToggleState());
}

TEST_F(MainGuiTest, LeavesOtherKeysToTheHost)
{
    showThree();
    m_gui->grabKeyboardFocus();

    for (const int key : {juce::KeyPress::F5Key, juce::KeyPress::escapeKey, static_cast<int>('q')})
        EXPECT_FALSE(m_gui->keyPressed(juce::KeyPress(key)));
    EXPECT_FALSE(m_gui->keyPressed({juce::KeyPress::leftKey, juce::ModifierKeys::shiftModifier, 0}));
}

TEST_F(MainGuiTest, UsesNoKeysWhileItIsDisabledOrASheetIsOpen)
{
    EXPECT_FALSE(m_gui->keyPressed(juce::KeyPress(juce::KeyPress::rightKey)));
    showThree();
    click("Load Old Edl Button");

    EXPECT_FALSE(m_gui->keyPressed(juce::KeyPress(juce::KeyPress::rightKey)));
    EXPECT_TRUE(button("m_videoLeftToggle").getToggleState());
}

TEST_F(MainGuiTest, TellsByATooltipWhatAButtonDoesOrWhyItCannot)
{
    activate();
    EXPECT_EQ(button("Cadrel Button").getTooltip(), "No events in Change EDL.");
    EXPECT_EQ(button("Generate Button").getTooltip(), "Add an Old EDL and a New EDL first.");
    for (const int kind : {0, 1, 2})
        fill(kind, 1);

    EXPECT_EQ(button("Cadrel Button").getTooltip(), "Start Cadrel");
    EXPECT_EQ(button("Generate Button").getTooltip(), "Generate Change EDL");
    EXPECT_TRUE(button("Save Change Edl Button").isEnabled());
}

} // namespace
} // namespace cadrel::tests
