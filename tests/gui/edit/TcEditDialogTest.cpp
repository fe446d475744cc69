// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/edit/TcEditDialog.h"

#include "core/edl/EventList.h"
#include "core/notify/ChangeContext.h"
#include "core/notify/ChangeContextListenerInterface.h"
#include "gui/look/LookAndFeel.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingUndo.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/window/CutTexts.h"
#include "tests/support/window/FocusedWindow.h"
#include "tests/support/window/GermanTexts.h"
#include "tests/support/window/Pictures.h"
#include "tests/support/window/RecordingAlerts.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventList;
using core::ListKind;
using core::Timecode;
using gui::TcEditDialog;
using gui::TcInput;
using util::Result;

constexpr const char* SrcIn = "m_copyIn";
constexpr const char* SrcOut = "m_copyOut";
constexpr const char* DstIn = "m_pasteIn";
constexpr const char* DstOut = "m_pasteOut";

/// Calls a function at each change of a list.
class OnListChange : public core::ChangeContextListenerInterface {
public:
    OnListChange(EventList& list, std::function<void()> call) : m_list(list), m_call(std::move(call))
    {
        m_list.addListener(this);
    }
    ~OnListChange() override { m_list.removeListener(this); }

    void onChange(const core::ChangeContext&) override { m_call(); }

private:
    EventList& m_list;
    std::function<void()> m_call;
};

class TcEditDialogTest : public testing::Test {
protected:
    TcEditDialogTest()
    {
        m_window.addAndMakeVisible(m_beneath);
        m_window.addChildComponent(*m_dialog);
        m_dialog->setBeneath(&m_beneath);
    }

    std::shared_ptr<EventBase> add(EventList& list) const
    {
        auto event = makeEvent("A001", "10:00:00:00", "10:00:05:00", "01:00:00:00", "01:00:05:00");
        event->setClipName("SC14_TK1004");
        list.add(event);
        return event;
    }
    void open(const std::shared_ptr<EventBase>& event, std::int32_t listKind)
    {
        m_dialog->setSingleSelectionMode(listKind != ListKind::Change);
        m_dialog->setEvent(event, listKind);
        m_dialog->setVisible(true);
    }
    std::shared_ptr<EventBase> openChange()
    {
        auto event = add(m_change);
        open(event, ListKind::Change);
        return event;
    }
    std::shared_ptr<EventBase> openOld()
    {
        auto event = add(m_old);
        open(event, ListKind::Old);
        return event;
    }

    /// The child of that name.
    juce::Component& named(const std::string& name) const
    {
        for (juce::Component* const component : m_dialog->getChildren()) {
            if (component->getName() == juce::String(name))
                return *component;
        }
        throw std::runtime_error("there is no " + name);
    }
    TcInput& input(const char* timecode) const { return dynamic_cast<TcInput&>(named(std::string(timecode) + "Edit")); }
    juce::ToggleButton& tick(const char* timecode) const
    {
        return dynamic_cast<juce::ToggleButton&>(named(std::string(timecode) + "Select"));
    }
    std::string text(const std::string& name) const
    {
        return dynamic_cast<juce::Label&>(named(name)).getText().toStdString();
    }
    juce::Button& ok() const { return dynamic_cast<juce::Button&>(named("m_applyButton")); }
    juce::Button& cancel() const { return dynamic_cast<juce::Button&>(named("m_cancelButton")); }

    /// As a user does who types it.
    void enter(const char* timecode, const char* value)
    {
        input(timecode).setValue(Timecode(value), juce::sendNotification);
    }
    std::string shown() const
    {
        std::string all;
        for (const char* const timecode : {SrcIn, SrcOut, DstIn, DstOut}) {
            all += input(timecode).getValue().toString();
            all += ' ';
        }
        return all;
    }
    std::string ticks() const
    {
        std::string all;
        for (const char* const timecode : {SrcIn, SrcOut, DstIn, DstOut})
            all += tick(timecode).getToggleState() ? 'x' : '-';
        return all;
    }
    bool isOpen() const { return m_dialog->isVisible(); }

    juce::ScopedJuceInitialiser_GUI m_juce;
    gui::LookAndFeel m_look;
    TestProject m_project;
    RecordingUndo m_undo;
    RecordingAlerts m_alerts;
    EventList m_old{ListKind::Old};
    EventList m_change{ListKind::Change};
    FocusedWindow m_window{1300, 750};
    juce::Component m_beneath;
    std::unique_ptr<TcEditDialog> m_dialog = std::make_unique<TcEditDialog>();
};

TEST_F(TcEditDialogTest, ShowsTheNamesAndTimecodesOfTheEvent)
{
    openChange();

    EXPECT_EQ(text("m_eventName"), "SC14_TK1004 A001");
    EXPECT_EQ(shown(), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00 ");
    EXPECT_EQ(ticks(), "xx--");
}

TEST_F(TcEditDialogTest, ShowsNamesThatAreNoUtf8WithReplacementCharacters)
{
    const auto event = add(m_old);
    event->setClipName("caf\xe9");
    open(event, ListKind::Old);

    EXPECT_EQ(text("m_eventName"), "caf\xef\xbf\xbd A001");
}

TEST_F(TcEditDialogTest, HasItsSizeAndPlaces)
{
    EXPECT_EQ(m_dialog->getLocalBounds(), juce::Rectangle<int>(0, 0, 300, 300));
    const std::vector<std::pair<std::string, juce::Rectangle<int>>> places{
        {"m_eventName", {13, 8, 250, 24}},       {"HLine1", {11, 34, 277, 1}},
        {"m_copyInSelect", {126, 52, 30, 24}},   {"m_copyOutSelect", {126, 92, 30, 24}},
        {"m_pasteInSelect", {126, 140, 30, 24}}, {"m_pasteOutSelect", {126, 180, 30, 24}},
        {"m_applyButton", {66, 260, 80, 24}},    {"m_cancelButton", {155, 260, 80, 24}},
        {"m_copyInEdit", {156, 52, 128, 24}},    {"m_copyOutEdit", {156, 92, 128, 24}},
        {"m_pasteInEdit", {156, 140, 128, 24}},  {"m_pasteOutEdit", {156, 180, 128, 24}},
        {"motioSpeedLabel", {19, 216, 141, 24}}, {"motioSpeedValue", {210, 216, 70, 24}},
    };
    for (const auto& [name, bounds] : places)
        EXPECT_EQ(named(name).getBounds().toString(), bounds.toString()) << name;
}

TEST_F(TcEditDialogTest, HasEachNameInTheRowOfItsInput)
{
    std::vector<std::string> rows;
    for (const juce::Component* const component : m_dialog->getChildren()) {
        if (component->getName() != "new label")
            continue;
        const auto& label = dynamic_cast<const juce::Label&>(*component);
        rows.push_back(label.getText().toStdString() + " " + label.getBounds().toString().toStdString());
    }
    EXPECT_EQ(rows, (std::vector<std::string>{"SRC IN 20 52 80 24", "SRC OUT 20 92 80 24", "DST IN 20 140 104 24",
                                              "DST OUT 20 180 104 24"}));
}

TEST_F(TcEditDialogTest, ShowsTheSpeedForOldAndNewEventsAlone)
{
    openChange();
    EXPECT_FALSE(named("motioSpeedLabel").isVisible());
    EXPECT_FALSE(named("motioSpeedValue").isVisible());

    openOld();
    EXPECT_TRUE(named("motioSpeedLabel").isVisible());
    EXPECT_TRUE(named("motioSpeedValue").isVisible());
    EXPECT_EQ(text("motioSpeedValue"), "1.00x");
}

TEST_F(TcEditDialogTest, TicksABoxOfAChangeEventAgainAtOnce)
{
    openChange();

    m_window.click(tick(SrcIn));

    EXPECT_EQ(ticks(), "xx--");
}

TEST_F(TcEditDialogTest, LetsOneBoxOfAnOldEventRemainAlone)
{
    openOld();

    m_window.click(tick(SrcIn));
    EXPECT_EQ(ticks(), "-x--");
    m_window.click(tick(SrcOut));
    EXPECT_EQ(ticks(), "-x--");
}

TEST_F(TcEditDialogTest, GivesUpTheOldestTickForAThird)
{
    openChange();

    m_window.click(tick(DstOut));
    EXPECT_EQ(ticks(), "-x-x");
    m_window.click(tick(DstIn));
    EXPECT_EQ(ticks(), "--xx");
}

TEST_F(TcEditDialogTest, MovesSrcOutWithSrcIn)
{
    openChange();

    enter(SrcIn, "10:00:01:00");

    EXPECT_EQ(shown(), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00 ");
}

TEST_F(TcEditDialogTest, TakesWhatIsTyped)
{
    openChange();

    // The first field has the focus, and all of it is selected.
    m_window.type("10000200");

    EXPECT_EQ(shown(), "10:00:02:00 10:00:07:00 01:00:00:00 01:00:05:00 ");
}

TEST_F(TcEditDialogTest, SnapsATimecodeWithoutATickBackAtOnce)
{
    openChange();

    enter(DstIn, "02:00:00:00");

    EXPECT_EQ(shown(), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00 ");
}

TEST_F(TcEditDialogTest, RestoresAllFourWhenAStepFails)
{
    const auto event = makeEvent("A001", "23:00:00:00", "23:59:59:24", "01:00:00:00", "01:59:59:24");
    m_change.add(event);
    open(event, ListKind::Change);

    enter(SrcIn, "23:00:00:01");

    EXPECT_EQ(shown(), "23:00:00:00 23:59:59:24 01:00:00:00 01:59:59:24 ");
    EXPECT_TRUE(m_alerts.messages.empty());
}

TEST_F(TcEditDialogTest, ShowsTheSpeedWhileItChanges)
{
    openOld();
    m_window.click(tick(SrcIn));

    enter(SrcOut, "10:00:10:00");

    EXPECT_EQ(text("motioSpeedValue"), "2.00x");
}

TEST_F(TcEditDialogTest, ShowsTheFlawAndDisablesOkWhileAnInIsAfterItsOut)
{
    const auto event = openOld();
    m_window.click(tick(SrcIn));
    EXPECT_EQ(text("m_flaw"), "");

    enter(SrcOut, "09:00:00:00");
    EXPECT_EQ(text("m_flaw"), "Detected invalid timecode range.");
    EXPECT_FALSE(ok().isEnabled());
    EXPECT_EQ(ok().getTooltip(), "Detected invalid timecode range.");
    m_window.click(ok());
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_TRUE(isOpen());
    EXPECT_EQ(event->srcOut(), Timecode("10:00:05:00"));

    enter(SrcOut, "10:00:00:00");
    EXPECT_EQ(text("m_flaw"), "");
    EXPECT_TRUE(ok().isEnabled());
    EXPECT_EQ(ok().getTooltip(), "");
}

TEST_F(TcEditDialogTest, ShowsZerosForATimecodeThatDoesNotExistAtTheRate)
{
    openChange();
    const auto event = makeEvent("A002", "10:00:00:27", "10:00:05:00", "01:00:00:00", "01:00:05:00");
    m_old.add(event);

    open(event, ListKind::Old);

    EXPECT_EQ(shown(), "00:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00 ");
    EXPECT_EQ(text("m_flaw"), "Detected invalid timecode. Mismatch between timecode and project frame rate?");
    EXPECT_TRUE(ok().isEnabled());
}

TEST_F(TcEditDialogTest, GivesTheEventItsTimecodesOnOk)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(timecodesOf(*event), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00");
    EXPECT_EQ(m_undo.entries, std::vector<std::wstring>{L"Edit EDL Event"});
}

TEST_F(TcEditDialogTest, GivesTheEventItsTimecodesOnReturn)
{
    const auto event = openChange();
    m_window.type("100001");

    // The first takes what was typed, the second confirms.
    m_window.press(juce::KeyPress::returnKey);
    EXPECT_TRUE(isOpen());
    m_window.press(juce::KeyPress::returnKey);

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(timecodesOf(*event), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00");
}

TEST_F(TcEditDialogTest, TakesWhatWasTypedWhenOkIsClicked)
{
    const auto event = openChange();
    m_window.type("100001");

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(event->srcIn(), Timecode("10:00:01:00"));
}

TEST_F(TcEditDialogTest, LeavesTheEventAloneOnCancel)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");

    m_window.click(cancel());

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(timecodesOf(*event), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00");
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(TcEditDialogTest, LeavesTheEventAloneOnEscape)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");

    m_window.press(juce::KeyPress::escapeKey);

    EXPECT_FALSE(isOpen());
    EXPECT_EQ(event->srcIn(), Timecode("10:00:00:00"));
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(TcEditDialogTest, ForgetsWhatWasTypedWhenItIsCancelled)
{
    const auto event = openChange();
    m_window.type("11");

    m_window.click(cancel());
    open(event, ListKind::Change);

    EXPECT_EQ(shown(), "10:00:00:00 10:00:05:00 01:00:00:00 01:00:05:00 ");
}

TEST_F(TcEditDialogTest, MakesNoUndoEntryWhenNothingChanged)
{
    openChange();

    m_window.click(ok());

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(TcEditDialogTest, StaysOpenAndTellsWhenTheUndoEntryFails)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");
    m_undo.failure = Result::HostCallFailed;

    m_window.click(ok());

    EXPECT_TRUE(isOpen());
    EXPECT_EQ(m_alerts.messages.size(), 1U);
    EXPECT_EQ(event->srcIn(), Timecode("10:00:00:00"));
    EXPECT_EQ(shown(), "10:00:01:00 10:00:06:00 01:00:00:00 01:00:05:00 ");
}

TEST_F(TcEditDialogTest, ClosesWhenItsEventHasLeftTheList)
{
    const auto event = openChange();
    add(m_change);
    m_dialog->listChanged(m_change);
    EXPECT_TRUE(isOpen());

    EventList removed;
    removed.add(event);
    m_change.remove(removed);
    m_dialog->listChanged(m_change);

    EXPECT_FALSE(isOpen());
    EXPECT_TRUE(m_undo.begun.empty());
}

TEST_F(TcEditDialogTest, StaysOpenWhenAnotherListChanges)
{
    openChange();

    m_dialog->listChanged(m_old);

    EXPECT_TRUE(isOpen());
}

TEST_F(TcEditDialogTest, ClosesWhenTheModelChanges)
{
    openChange();

    m_dialog->modelChanged();

    EXPECT_FALSE(isOpen());
}

TEST_F(TcEditDialogTest, IsToldOfItsOwnChangeAndCloses)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");
    int calls = 0;
    const OnListChange listener(m_change, [&] {
        ++calls;
        m_dialog->listChanged(m_change);
    });

    m_window.click(ok());

    EXPECT_EQ(calls, 1);
    EXPECT_FALSE(isOpen());
    EXPECT_EQ(m_undo.entries.size(), 1U);
}

TEST_F(TcEditDialogTest, MayBeClosedAndEvenDestroyedByWhoIsToldOfItsChange)
{
    const auto event = openChange();
    enter(SrcIn, "10:00:01:00");
    const OnListChange listener(m_change, [&] { m_dialog.reset(); });

    m_window.press(juce::KeyPress::returnKey);

    EXPECT_EQ(m_dialog, nullptr);
    EXPECT_EQ(event->srcIn(), Timecode("10:00:01:00"));
}

TEST_F(TcEditDialogTest, MayBeDestroyedWhileSomethingIsTyped)
{
    const auto event = openChange();
    m_window.type("11");

    m_dialog.reset();

    EXPECT_EQ(event->srcIn(), Timecode("10:00:00:00"));
}

TEST_F(TcEditDialogTest, DoesNothingWhileItIsClosed)
{
    enter(SrcIn, "10:00:01:00");
    m_dialog->listChanged(m_change);
    m_dialog->modelChanged();

    EXPECT_FALSE(isOpen());
}

TEST_F(TcEditDialogTest, WorksWithoutAProject)
{
    openChange();
    {
        const NoProject none;
        enter(SrcIn, "10:00:01:00");
        m_window.click(cancel());
    }
    EXPECT_FALSE(isOpen());
}

TEST_F(TcEditDialogTest, NamesItsBoxesAndInputsForScreenReaders)
{
    EXPECT_EQ(tick(DstOut).getTitle(), "DST OUT");
    EXPECT_EQ(input(DstOut).getTitle(), "DST OUT");
    EXPECT_EQ(m_dialog->getTitle(), "Edit EDL Event");
}

TEST_F(TcEditDialogTest, HasNoTextThatIsCutInAnyLanguage)
{
    openOld();
    EXPECT_EQ(cutTextsOf(*m_dialog), std::vector<std::string>{});

    const GermanTexts german;
    const TcEditDialog dialog;
    EXPECT_EQ(cutTextsOf(dialog), std::vector<std::string>{});
}

TEST_F(TcEditDialogTest, LooksAsItDoesForAChangeEvent)
{
    openChange();
    m_dialog->grabKeyboardFocus();

    expectPicture(*m_dialog, "edit-change");
}

TEST_F(TcEditDialogTest, LooksAsItDoesForAnOldEventWithAFlaw)
{
    openOld();
    m_window.click(tick(SrcIn));
    enter(SrcOut, "09:00:00:00");
    m_dialog->grabKeyboardFocus();

    expectPicture(*m_dialog, "edit-old-flawed");
}

TEST_F(TcEditDialogTest, LooksAsItDoesWhenItIsDisabled)
{
    openOld();
    m_dialog->setEnabled(false);

    expectPicture(*m_dialog, "edit-disabled");
}

} // namespace
} // namespace cadrel::tests
