// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/MainCommands.h"

#include "core/edl/EventBase.h"
#include "core/model/DataModel.h"
#include "gui/main/EmptyListHint.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <vector>

namespace cadrel::tests {
namespace {

using core::DataModel;
using core::EventList;
using core::ListKind;
using gui::emptyListHint;
using gui::MainButton;
using gui::MainCommands;

class MainCommandsTest : public testing::Test {
protected:
    static void fill(EventList& list)
    {
        list.add(makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00"));
    }
    bool allows(MainButton button) const { return MainCommands(&m_model).allows(button); }
    std::wstring tooltip(MainButton button) const { return MainCommands(&m_model).tooltip(button); }

    TestProject m_project;
    DataModel m_model;
};

TEST_F(MainCommandsTest, AllowNothingWithoutAProject)
{
    const MainCommands commands(nullptr);

    for (std::size_t index = 0; index < gui::MainButtonCount; ++index) {
        EXPECT_FALSE(commands.allows(static_cast<MainButton>(index)));
        EXPECT_EQ(commands.tooltip(static_cast<MainButton>(index)), L"No project is open.");
    }
}

TEST_F(MainCommandsTest, AlwaysAllowWhatNeedsNoEvents)
{
    for (const MainButton button : {MainButton::AddOld, MainButton::AddNew, MainButton::AddChange, MainButton::Settings,
                                    MainButton::Videos, MainButton::In, MainButton::Out})
        EXPECT_TRUE(allows(button));
    EXPECT_EQ(tooltip(MainButton::AddOld), L"Add EDL");
    EXPECT_EQ(tooltip(MainButton::AddNew), L"Add EDL");
    EXPECT_EQ(tooltip(MainButton::AddChange), L"Add EDL");
    EXPECT_EQ(tooltip(MainButton::Settings), L"Open Cadrel Settings");
    EXPECT_EQ(tooltip(MainButton::Videos), L"Open Video Preview Settings");
    EXPECT_EQ(tooltip(MainButton::In), L"Preview First Video Frame");
    EXPECT_EQ(tooltip(MainButton::Out), L"Preview Last Video Frame");
}

TEST_F(MainCommandsTest, TellWhatIsMissingBeforeAnythingCanBeGenerated)
{
    EXPECT_FALSE(allows(MainButton::Generate));
    EXPECT_EQ(tooltip(MainButton::Generate), L"Add an Old EDL and a New EDL first.");
    fill(m_model.oldEdl());
    EXPECT_FALSE(allows(MainButton::Generate));
    EXPECT_EQ(tooltip(MainButton::Generate), L"Add a New EDL first.");
    fill(m_model.newEdl());
    EXPECT_TRUE(allows(MainButton::Generate));
    EXPECT_EQ(tooltip(MainButton::Generate), L"Generate Change EDL");
    m_model.oldEdl().clear();
    EXPECT_FALSE(allows(MainButton::Generate));
    EXPECT_EQ(tooltip(MainButton::Generate), L"Add an Old EDL first.");
}

TEST_F(MainCommandsTest, AllowAListToBeClearedWhileItHasEvents)
{
    EXPECT_EQ(tooltip(MainButton::ClearOld), L"The Old EDL is empty.");
    EXPECT_EQ(tooltip(MainButton::ClearNew), L"The New EDL is empty.");
    EXPECT_EQ(tooltip(MainButton::ClearChange), L"The Change EDL is empty.");
    fill(m_model.newEdl());

    EXPECT_FALSE(allows(MainButton::ClearOld));
    EXPECT_TRUE(allows(MainButton::ClearNew));
    EXPECT_FALSE(allows(MainButton::ClearChange));
    fill(m_model.oldEdl());
    fill(m_model.changeEdl());
    for (const MainButton button : {MainButton::ClearOld, MainButton::ClearNew, MainButton::ClearChange}) {
        EXPECT_TRUE(allows(button));
        EXPECT_EQ(tooltip(button), L"Delete EDL");
    }
}

TEST_F(MainCommandsTest, AllowARunAndAPreviewWhenTheChangeListHasEvents)
{
    for (const MainButton button : {MainButton::Start, MainButton::Preview, MainButton::Save}) {
        EXPECT_FALSE(allows(button));
        EXPECT_EQ(tooltip(button), L"No events in Change EDL.");
    }
    fill(m_model.changeEdl());

    EXPECT_TRUE(allows(MainButton::Start));
    EXPECT_EQ(tooltip(MainButton::Start), L"Start Cadrel");
    EXPECT_TRUE(allows(MainButton::Preview));
    EXPECT_EQ(tooltip(MainButton::Preview), L"Activate/Deactivate Preview");
    EXPECT_TRUE(allows(MainButton::Save));
    EXPECT_EQ(tooltip(MainButton::Save), L"Save Change EDL");
}

TEST_F(MainCommandsTest, AllowAPreviewToBeSwitchedOffWithoutEvents)
{
    m_model.setPreviewActive(true);

    EXPECT_TRUE(allows(MainButton::Preview));
    EXPECT_FALSE(allows(MainButton::Start));
}

TEST_F(MainCommandsTest, AllowSourceAndDestinationWhileThePreviewIsOn)
{
    for (const MainButton button : {MainButton::Source, MainButton::Destination}) {
        EXPECT_FALSE(allows(button));
        EXPECT_EQ(tooltip(button), L"Switch the preview on first.");
    }
    m_model.setPreviewActive(true);

    EXPECT_TRUE(allows(MainButton::Source));
    EXPECT_EQ(tooltip(MainButton::Source), L"Show Source Preview");
    EXPECT_TRUE(allows(MainButton::Destination));
    EXPECT_EQ(tooltip(MainButton::Destination), L"Show Destination Preview");
}

TEST_F(MainCommandsTest, AllowNoSavingOfAListWithoutAReadableEvent)
{
    auto event = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");
    event->addFlaw(core::EventFlaw::SrcInUnreadable);
    m_model.changeEdl().add(event);

    EXPECT_FALSE(allows(MainButton::Save));
    EXPECT_EQ(tooltip(MainButton::Save), L"No event of the Change EDL can be written.");
}

TEST_F(MainCommandsTest, AreAccompaniedByWhatToDoFirst)
{
    const auto hints = [this] {
        return std::vector{emptyListHint(&m_model, ListKind::Old), emptyListHint(&m_model, ListKind::New),
                           emptyListHint(&m_model, ListKind::Change)};
    };
    const std::wstring addOld = L"Add the EDL of the old cut, or drop it here.";
    const std::wstring addNew = L"Add the EDL of the new cut, or drop it here.";
    const std::wstring addBoth = L"Add the EDLs of both cuts and press Generate, or add a Change EDL here.";
    EXPECT_EQ(hints(), (std::vector{addOld, addNew, addBoth}));

    fill(m_model.oldEdl());
    EXPECT_EQ(hints(), (std::vector<std::wstring>{L"", addNew, addBoth}));
    fill(m_model.newEdl());
    EXPECT_EQ(hints(), (std::vector<std::wstring>{L"", L"", L"Press Generate to find out what has changed."}));
    fill(m_model.changeEdl());
    EXPECT_EQ(hints(), (std::vector<std::wstring>{L"", L"", L""}));
}

TEST_F(MainCommandsTest, SayInTheMiddleThatNoProjectIsOpen)
{
    EXPECT_EQ(emptyListHint(nullptr, ListKind::Old), L"");
    EXPECT_EQ(emptyListHint(nullptr, ListKind::New), L"");
    EXPECT_EQ(emptyListHint(nullptr, ListKind::Change), L"No project is open.");
}

} // namespace
} // namespace cadrel::tests
