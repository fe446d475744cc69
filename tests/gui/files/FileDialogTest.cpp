// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/files/FileDialog.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "gui/look/LookAndFeel.h"
#include "tests/gui/files/EdlTexts.h"
#include "tests/support/TempFolder.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/GermanTexts.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/RecordingAlerts.h"
#include "tests/support/window/RecordingFileBox.h"

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <stdexcept>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::ListKind;
using core::Timecode;
using gui::FileDialog;
using gui::TcInput;
using util::Result;

class FileDialogTest : public testing::Test {
protected:
    FileDialogTest()
    {
        m_window.addAndMakeVisible(m_beneath);
        m_window.addChildComponent(*m_dialog);
        m_dialog->setBeneath(&m_beneath);
        m_dialog->setBounds(m_window.getLocalBounds());
        m_dialog->setModel(&m_model, widePath(m_folder / "film.stage"));
    }

    std::string write(const std::string& name, const std::string& content) const
    {
        return m_folder.write(name, content).string();
    }
    void choose(const std::vector<std::string>& paths)
    {
        m_box.chosen = paths;
        m_window.click(open());
    }

    juce::Component& named(const std::string& name) const
    {
        for (juce::Component* const component : m_dialog->getChildren()) {
            if (component->getName() == juce::String(name))
                return *component;
        }
        throw std::runtime_error("there is no " + name);
    }
    std::string text(const std::string& name) const
    {
        return dynamic_cast<juce::Label&>(named(name)).getText().toStdString();
    }
    std::string summary() const { return fileList().getText().toStdString(); }
    juce::TextEditor& fileList() const { return dynamic_cast<juce::TextEditor&>(named("EDL File List")); }
    juce::Button& button(const std::string& name) const { return dynamic_cast<juce::Button&>(named(name)); }
    juce::Button& open() const { return button("Open Files Button"); }
    juce::Button& ok() const { return button("Ok Button"); }
    juce::Button& cancel() const { return button("Cancel Button"); }
    TcInput& offset(const std::string& side) const { return dynamic_cast<TcInput&>(named(side + " Offset")); }
    void enter(const std::string& side, const char* amount, bool isPositive = true)
    {
        offset(side).setValue(Timecode(amount), isPositive, juce::sendNotification);
    }
    std::string offsetText(const std::string& side) const
    {
        std::string shown(1, offset(side).isPositive() ? '+' : '-');
        return shown += offset(side).getValue().toString();
    }
    std::string rangeText(const std::string& side) const
    {
        return text(side + " In TC") + " " + text(side + " Out TC");
    }
    bool isOpen() const { return m_dialog->isVisible(); }
    /// With little around the panel.
    void showSmall() { m_dialog->setSize(780, 400); }
    std::wstring folder() const { return widePath(m_folder.path()); }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    TestProject m_project;
    RecordingUndo m_undo;
    RecordingAlerts m_alerts;
    RecordingFileBox m_box;
    TempFolder m_folder;
    DataModel m_model;
    FocusedWindow m_window{1300, 750};
    juce::Component m_beneath;
    std::unique_ptr<FileDialog> m_dialog = std::make_unique<FileDialog>();
};

TEST_F(FileDialogTest, IsClosedAndForNoListAtFirst)
{
    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_dialog->listType(), FileDialog::NoList);
}

TEST_F(FileDialogTest, ComesUpForTheOldList)
{
    m_dialog->showForOldList();

    EXPECT_TRUE(isOpen());
    EXPECT_EQ(m_dialog->listType(), ListKind::Old);
    EXPECT_EQ(text("Add Edls Label"), "Add EDL to Old List");
    EXPECT_EQ(rangeText("DST"), "00:00:00:00 00:00:00:00");
    EXPECT_EQ(summary(), "");
}

TEST_F(FileDialogTest, ComesUpForTheNewList)
{
    m_dialog->showForNewList();

    EXPECT_EQ(m_dialog->listType(), ListKind::New);
    EXPECT_EQ(text("Add Edls Label"), "Add EDL to New List");
}

TEST_F(FileDialogTest, ComesUpForTheChangeList)
{
    m_dialog->showForChangeList();

    EXPECT_EQ(m_dialog->listType(), ListKind::Change);
    EXPECT_EQ(text("Add Edls Label"), "Add EDL to Change EDL List");
}

TEST_F(FileDialogTest, ShowsTheSourceSideForTheChangeListAlone)
{
    const std::vector<std::string> source{"SRC In Label", "SRC Out Label", "SRC Offset Label",
                                          "SRC Offset",   "SRC In TC",     "SRC Out TC"};
    m_dialog->showForChangeList();
    for (const std::string& name : source)
        EXPECT_TRUE(named(name).isVisible()) << name;
    m_window.click(cancel());

    m_dialog->showForOldList();
    for (const std::string& name : source)
        EXPECT_FALSE(named(name).isVisible()) << name;
    m_window.click(cancel());
}

TEST_F(FileDialogTest, HasItsPlacesAtAnySize)
{
    struct Place {
        const char* name;
        int x, y, width, height;
    };
    // From the middle of the sheet.
    const std::vector<Place> places{
        {"SRC In Label", -122, 101, 25, 24},     {"DST In Label", -122, 60, 25, 24},
        {"SRC Out Label", 18, 101, 40, 24},      {"DST Out Label", 18, 60, 40, 24},
        {"DST Offset Label", -350, 60, 96, 24},  {"DST Offset", -254, 60, 100, 24},
        {"SRC Offset Label", -350, 101, 96, 24}, {"SRC Offset", -254, 101, 100, 24},
        {"Add Edls Label", -353, -179, 472, 24}, {"Horizontal Line", -349, -152, 699, 1},
        {"EDL Label", -350, -129, 472, 24},      {"Cancel Button", 266, 100, 80, 24},
        {"Ok Button", 177, 100, 80, 24},         {"DST In TC", -98, 60, 96, 24},
        {"DST Out TC", 55, 60, 96, 24},          {"SRC In TC", -98, 101, 96, 24},
        {"SRC Out TC", 55, 101, 96, 24},         {"Open Files Button", 266, -127, 80, 24},
        {"EDL File List", -254, -88, 600, 132},
    };
    struct Middle {
        int width, height, x, y;
    };
    for (const Middle& size :
         {Middle{1300, 750, 650, 375}, Middle{1601, 901, 800, 450}, Middle{1920, 1199, 960, 599}}) {
        m_dialog->setSize(size.width, size.height);
        for (const Place& place : places) {
            const juce::Rectangle<int> expected(size.x + place.x, size.y + place.y, place.width, place.height);
            EXPECT_EQ(named(place.name).getBounds().toString(), expected.toString()) << place.name;
        }
    }
}

TEST_F(FileDialogTest, PaintsAShadeAndItsPanel)
{
    m_dialog->showForOldList();

    const juce::Image image = m_dialog->createComponentSnapshot(m_dialog->getLocalBounds());

    // The panel begins at 650 - 366 and 375 - 190, and is 732 x 337.
    EXPECT_EQ(image.getPixelAt(283, 186).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(284, 185).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(1015, 521).getARGB(), 0xff899593U);
    EXPECT_EQ(image.getPixelAt(1016, 521).getAlpha(), 0x3a);
    EXPECT_EQ(image.getPixelAt(1015, 522).getAlpha(), 0x3a);
}

// ---- Choosing files ------------------------------------------------------------------------------------------------

TEST_F(FileDialogTest, OpensTheFileBoxInTheFolderOfTheProjectAtFirst)
{
    m_dialog->showForOldList();

    choose({});

    ASSERT_EQ(m_box.requests.size(), 1U);
    EXPECT_EQ(m_box.requests[0].title, L"Add EDL to Old List");
    EXPECT_EQ(m_box.requests[0].folder, folder());
    EXPECT_EQ(m_box.requests[0].extension, L"edl");
    EXPECT_EQ(m_box.requests[0].description, L"Edit Decision List");
    EXPECT_FALSE(m_box.requests[0].isForSaving);
}

TEST_F(FileDialogTest, OpensTheFileBoxInTheFolderOfTheLastFiles)
{
    const TempFolder elsewhere;
    m_dialog->showForOldList();
    choose({elsewhere.write("a.edl", fiveSecondsEdl()).string()});
    choose({});
    EXPECT_EQ(m_box.requests[1].folder, widePath(elsewhere.path()));

    m_window.click(ok());
    m_dialog->setModel(&m_model, L"/films/film.stage");
    m_dialog->showForNewList();
    choose({});
    EXPECT_EQ(m_box.requests[2].folder, widePath(elsewhere.path()));
}

TEST_F(FileDialogTest, ShowsWhatTheFilesHold)
{
    m_dialog->showForOldList();

    choose({write("b.edl", tenSecondsEdl()), write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(summary(), "DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: a.edl\n"
                         "DST IN: 01:00:05:00 DST OUT: 01:00:15:00     File: b.edl\n");
    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:15:00");
    EXPECT_TRUE(m_model.oldEdl().isEmpty());
}

TEST_F(FileDialogTest, ShowsBothSidesForTheChangeList)
{
    m_dialog->showForChangeList();

    choose({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:05:00");
    EXPECT_EQ(rangeText("SRC"), "10:00:00:00 10:00:05:00");
}

TEST_F(FileDialogTest, ShowsNoRangeWhenNothingWasTaken)
{
    m_dialog->showForOldList();

    choose({write("a.edl", "TITLE: NOTHING\n")});

    EXPECT_EQ(rangeText("DST"), " ");
    EXPECT_EQ(summary(), "");
    EXPECT_EQ(m_alerts.messages, std::vector<std::wstring>{L"The loaded EDL file " + folder() +
                                                           L"/a.edl does not contain valid entries."});
}

TEST_F(FileDialogTest, KeepsWhatItHasWhenNothingIsChosen)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});

    choose({});

    EXPECT_EQ(summary(), "DST IN: 01:00:00:00 DST OUT: 01:00:05:00     File: a.edl\n");
    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:05:00");
}

TEST_F(FileDialogTest, StaysAsItIsWhenNothingIsChosenAtFirst)
{
    m_dialog->showForChangeList();
    enter("DST", "00:00:01:00");

    choose({});

    EXPECT_EQ(rangeText("DST"), "00:00:00:00 00:00:00:00");
    EXPECT_EQ(rangeText("SRC"), "00:00:00:00 00:00:00:00");
    EXPECT_EQ(offsetText("DST"), "+00:00:01:00");
}

TEST_F(FileDialogTest, RenamesBRollsAsTheSettingsSay)
{
    const std::string path =
        write("a.edl", edlLine("001", "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00") +
                           edlLine("002", "10:00:00:00 10:00:05:00 01:00:05:00 01:00:10:00", "A001B"));
    for (const bool isRenamed : {true, false}) {
        m_model.settings().setBRollRenaming(isRenamed);
        m_model.oldEdl().clear();
        m_dialog->showForOldList();
        choose({path});
        m_window.click(ok());
        ASSERT_EQ(m_model.oldEdl().size(), 2U);
        EXPECT_EQ(m_model.oldEdl().at(1).rollName(), isRenamed ? "A001" : "A001B");
    }
}

TEST_F(FileDialogTest, TakesFilesThatAreDropped)
{
    m_dialog->showForOldList();
    const juce::StringArray files{juce::String(write("a.edl", fiveSecondsEdl()))};
    EXPECT_TRUE(m_dialog->isInterestedInFileDrag(files));

    m_dialog->fileDragEnter(files, 0, 0);
    m_dialog->filesDropped(files, 0, 0);

    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:05:00");
}

TEST_F(FileDialogTest, TakesFilesThatAreDroppedOnATable)
{
    m_dialog->showForNewList();
    m_dialog->takeFiles({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:05:00");
}

TEST_F(FileDialogTest, TakesNoFilesWhileItIsClosed)
{
    const std::string path = write("a.edl", fiveSecondsEdl());
    EXPECT_FALSE(m_dialog->isInterestedInFileDrag({juce::String(path)}));

    m_dialog->takeFiles({path});

    EXPECT_EQ(summary(), "");
}

TEST_F(FileDialogTest, ScrollsALongSummary)
{
    m_dialog->showForOldList();
    std::vector<std::string> paths;
    for (int number = 10; number < 40; ++number)
        paths.push_back(write("reel" + std::to_string(number) + ".edl", fiveSecondsEdl()));

    choose(paths);

    EXPECT_GT(fileList().getTextHeight(), fileList().getHeight());
    const auto* const view = dynamic_cast<const juce::Viewport*>(fileList().getChildComponent(0));
    ASSERT_NE(view, nullptr);
    EXPECT_TRUE(view->isVerticalScrollBarShown());
}

TEST_F(FileDialogTest, ShowsTheFirstFileOfALongSummary)
{
    m_dialog->showForOldList();
    std::vector<std::string> paths;
    for (int number = 10; number < 40; ++number)
        paths.push_back(write("reel" + std::to_string(number) + ".edl", fiveSecondsEdl()));

    choose(paths);

    const auto* const view = dynamic_cast<const juce::Viewport*>(fileList().getChildComponent(0));
    EXPECT_EQ(view->getViewPositionY(), 0);
}

// ---- Offsets -------------------------------------------------------------------------------------------------------

TEST_F(FileDialogTest, ShowsTheRangesWithTheOffsets)
{
    m_dialog->showForChangeList();
    choose({write("a.edl", fiveSecondsEdl())});

    enter("DST", "00:30:00:00", false);
    enter("SRC", "01:00:00:12");

    EXPECT_EQ(rangeText("DST"), "00:30:00:00 00:30:05:00");
    EXPECT_EQ(rangeText("SRC"), "11:00:00:12 11:00:05:12");
}

TEST_F(FileDialogTest, SnapsAnOffsetThatIsTooFarBackToTheStartOfTheDay)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});

    enter("DST", "02:00:00:00", false);

    EXPECT_EQ(offsetText("DST"), "-01:00:00:00");
    EXPECT_EQ(rangeText("DST"), "00:00:00:00 00:00:05:00");
}

TEST_F(FileDialogTest, SnapsAnOffsetThatIsTooFarOnToTheEndOfTheDay)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});

    enter("DST", "23:00:00:00");

    EXPECT_EQ(offsetText("DST"), "+22:59:54:24");
    EXPECT_EQ(rangeText("DST"), "23:59:54:24 23:59:59:24");
}

TEST_F(FileDialogTest, DoesNothingWithAnOffsetWithoutAFile)
{
    m_dialog->showForOldList();

    enter("DST", "05:00:00:00", false);

    EXPECT_EQ(offsetText("DST"), "-05:00:00:00");
    EXPECT_EQ(rangeText("DST"), "00:00:00:00 00:00:00:00");
}

TEST_F(FileDialogTest, TestsAnOffsetAgainWhenFilesCome)
{
    m_dialog->showForOldList();
    enter("DST", "05:00:00:00", false);

    choose({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(offsetText("DST"), "-01:00:00:00");
    EXPECT_EQ(rangeText("DST"), "00:00:00:00 00:00:05:00");
}

// ---- OK and Cancel -------------------------------------------------------------------------------------------------

TEST_F(FileDialogTest, AppendsTheFilesToTheListOnOk)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});
    enter("DST", "01:00:00:00");

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_dialog->listType(), FileDialog::NoList);
    ASSERT_EQ(m_model.oldEdl().size(), 1U);
    EXPECT_EQ(timecodesOf(m_model.oldEdl().at(0)), "10:00:00:00 10:00:05:00 02:00:00:00 02:00:05:00");
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Load Old EDL"});
}

TEST_F(FileDialogTest, AppendsTheFilesOnReturn)
{
    m_dialog->showForChangeList();
    choose({write("a.edl", fiveSecondsEdl())});

    m_window.press(juce::KeyPress::returnKey);

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_model.changeEdl().size(), 1U);
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Load Change EDL"});
}

TEST_F(FileDialogTest, AppendsTheFilesOnReturnAlsoWhenTheFileBoxHadTheKeyboard)
{
    m_dialog->showForOldList();
    m_window.loseKeyboard();
    m_dialog->takeFiles({write("a.edl", fiveSecondsEdl())});
    m_window.regainKeyboard();

    EXPECT_TRUE(ok().hasKeyboardFocus(false));
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_model.oldEdl().size(), 1U);
}

TEST_F(FileDialogTest, LeavesTheKeyboardWhereTheUserPutsItAfterTheFileBox)
{
    m_dialog->showForOldList();
    m_window.loseKeyboard();
    m_dialog->takeFiles({write("a.edl", fiveSecondsEdl())});
    m_window.regainKeyboard();
    open().grabKeyboardFocus();

    EXPECT_TRUE(open().hasKeyboardFocus(false));
}

TEST_F(FileDialogTest, OpensTheFileBoxOnReturnAtFirst)
{
    m_dialog->showForOldList();

    m_window.press(juce::KeyPress::returnKey);

    EXPECT_EQ(m_box.requests.size(), 1U);
}

TEST_F(FileDialogTest, MakesAnUndoEntryWithoutContentWhenNothingWasTaken)
{
    m_dialog->showForNewList();

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_model.newEdl().isEmpty());
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Load New EDL"});
}

TEST_F(FileDialogTest, OnlyClosesOnOkWithoutAModel)
{
    m_dialog->setModel(nullptr, {});
    m_dialog->showForOldList();

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(FileDialogTest, ForgetsEverythingOnCancel)
{
    m_dialog->showForChangeList();
    choose({write("a.edl", fiveSecondsEdl())});
    enter("DST", "01:00:00:00");
    enter("SRC", "01:00:00:00", false);

    m_window.click(cancel());

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_dialog->listType(), FileDialog::NoList);
    EXPECT_TRUE(m_model.changeEdl().isEmpty());
    EXPECT_TRUE(m_undo.begun.empty());
    EXPECT_EQ(offsetText("DST") + offsetText("SRC"), "+00:00:00:00+00:00:00:00");
    EXPECT_EQ(rangeText("DST") + rangeText("SRC"), "00:00:00:00 00:00:00:0000:00:00:00 00:00:00:00");
    EXPECT_EQ(summary(), "");
}

TEST_F(FileDialogTest, ForgetsEverythingOnEscape)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});

    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_FALSE(isOpen());
    m_dialog->showForOldList();
    EXPECT_EQ(summary(), "");
}

TEST_F(FileDialogTest, ForgetsAnOffsetThatWasTypedButNotTaken)
{
    m_dialog->showForOldList();
    m_window.click(offset("DST"));
    m_window.type("03");

    m_dialog->setModel(&m_model, {});

    EXPECT_EQ(offsetText("DST"), "+00:00:00:00");
}

TEST_F(FileDialogTest, StaysOpenAndTellsWhenTheUndoEntryFails)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});
    m_undo.failure = Result::HostCallFailed;

    m_window.click(ok());

    EXPECT_TRUE(isOpen());
    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_TRUE(m_model.oldEdl().isEmpty());
    EXPECT_EQ(rangeText("DST"), "01:00:00:00 01:00:05:00");
}

TEST_F(FileDialogTest, TellsWhenThereIsNoFileBox)
{
    m_dialog->showForOldList();
    gui::FileBrowserDialogBase::uninstall();

    m_window.click(open());

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_TRUE(isOpen());
}

// ---- While a box of the host is open -------------------------------------------------------------------------------

TEST_F(FileDialogTest, IsCancelledByAModelThatChanges)
{
    m_dialog->showForOldList();
    choose({write("a.edl", fiveSecondsEdl())});

    m_dialog->setModel(&m_model, {});

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_model.oldEdl().isEmpty());
}

TEST_F(FileDialogTest, DropsTheFilesWhenItIsCancelledWhileTheFileBoxIsOpen)
{
    m_dialog->showForOldList();
    m_box.meanwhile = [this] {
        m_dialog->setModel(nullptr, {});
        m_dialog->showForNewList();
    };

    choose({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(summary(), "");
    EXPECT_TRUE(m_alerts.messages.empty());
}

TEST_F(FileDialogTest, DropsTheFilesWhenItIsCancelledWhileAnAlertIsOpen)
{
    m_dialog->showForOldList();
    m_alerts.meanwhile = [this] {
        m_dialog->setModel(nullptr, {});
        m_dialog->showForNewList();
    };

    choose({(m_folder / "gone.edl").string(), write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(summary(), "");
}

TEST_F(FileDialogTest, MayBeDestroyedWhileTheFileBoxIsOpen)
{
    m_dialog->showForOldList();
    m_box.meanwhile = [this] { m_dialog.reset(); };

    choose({write("a.edl", fiveSecondsEdl())});

    EXPECT_EQ(m_dialog, nullptr);
}

TEST_F(FileDialogTest, MayBeDestroyedWhileAnAlertIsOpen)
{
    m_dialog->showForOldList();
    m_alerts.meanwhile = [this] { m_dialog.reset(); };

    m_dialog->filesDropped({juce::String((m_folder / "gone.edl").string()), "/gone"}, 0, 0);

    EXPECT_EQ(m_dialog, nullptr);
    EXPECT_EQ(m_alerts.messages.size(), 1U);
}

// ---- What it looks like --------------------------------------------------------------------------------------------

TEST_F(FileDialogTest, NamesItsButtonAndInputsForScreenReaders)
{
    EXPECT_EQ(open().getTitle(), "Browse EDL Files");
    EXPECT_EQ(offset("DST").getTitle(), "DST Offset");
    EXPECT_EQ(offset("SRC").getTitle(), "SRC Offset");
}

TEST_F(FileDialogTest, HasNoTextThatIsCutInAnyLanguage)
{
    m_dialog->showForChangeList();
    choose({write("a.edl", fiveSecondsEdl())});
    EXPECT_EQ(cutTextsOf(*m_dialog), std::vector<std::string>{});

    const GermanTexts german;
    FileDialog dialog;
    dialog.setSize(1300, 750);
    for (const auto show : {&FileDialog::showForOldList, &FileDialog::showForNewList, &FileDialog::showForChangeList}) {
        (dialog.*show)();
        EXPECT_EQ(cutTextsOf(dialog), std::vector<std::string>{});
    }
}

TEST_F(FileDialogTest, LooksAsItDoesWhenItIsEmpty)
{
    m_dialog->showForOldList();
    m_dialog->grabKeyboardFocus();

    showSmall();
    expectPicture(*m_dialog, "files-empty");
}

TEST_F(FileDialogTest, LooksAsItDoesWithFilesForTheChangeList)
{
    m_dialog->showForChangeList();
    choose({write("reel3_v07_change.edl", fiveSecondsEdl() + "002  A001 V C 10:00:00:00 10:00:05:00 01:00:00:00\n"),
            write("reel4_v03_change.edl", tenSecondsEdl())});
    enter("DST", "00:10:00:00", false);

    showSmall();
    expectPicture(*m_dialog, "files-change");
}

TEST_F(FileDialogTest, LooksAsItDoesWhileFilesAreDraggedOverIt)
{
    m_dialog->showForNewList();
    std::vector<std::string> paths;
    for (int number = 10; number < 40; ++number)
        paths.push_back(write("reel" + std::to_string(number) + ".edl", fiveSecondsEdl()));
    choose(paths);

    m_dialog->fileDragEnter({}, 0, 0);

    showSmall();
    expectPicture(*m_dialog, "files-dragged");
}

TEST_F(FileDialogTest, LooksAsItDoesWhenItIsDisabled)
{
    m_dialog->showForChangeList();
    choose({write("reel3_v07_change.edl", fiveSecondsEdl())});
    m_dialog->setEnabled(false);

    showSmall();
    expectPicture(*m_dialog, "files-disabled");
}

} // namespace
} // namespace cadrel::tests
