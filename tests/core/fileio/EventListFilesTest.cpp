// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/edl/EventBase.h"
#include "core/edl/EventList.h"
#include "core/time/Framerate.h"
#include "tests/support/TempFolder.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EdlReading.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace cadrel::tests {
namespace {

using core::EventBase;
using core::EventFlaw;
using core::EventList;
using core::Framerate;
using core::ListKind;
using util::Result;

using Names = std::vector<std::string>;

const std::string Timecodes = "01:00:00:00 01:00:05:00 02:00:00:00 02:00:05:12";

std::string edlOf(const Names& rolls)
{
    std::string text = "FCM: NON-DROP FRAME\n";
    for (const std::string& roll : rolls)
        text += "001 " + roll + " V C " + Timecodes + "\n";
    return text;
}

Names rollsOf(const EventList& events)
{
    Names rolls;
    for (const auto& event : events.events())
        rolls.push_back(event->rollName());
    return rolls;
}

/// The roll names of a file after loading with B-roll renaming.
Names renamed(const Names& rolls)
{
    const TempFolder folder;
    EventList events;
    Framerate framerate;
    events.load(widePath(folder.write("reel.edl", edlOf(rolls))), true, framerate, true, false);
    return rollsOf(events);
}

TEST(EventListFiles, LoadsInPlaceOfThePresentEvents)
{
    const TempFolder folder;
    const auto path = folder.write("reel.edl", edlOf({"NEW"}));
    EventList events;
    events.add(std::make_shared<EventBase>());

    events.load(widePath(path), false);

    EXPECT_EQ(rollsOf(events), Names{"NEW"});
}

TEST(EventListFiles, LoadingWithoutAFramerateProviderIsNotAvailableAndChangesNothing)
{
    const TempFolder folder;
    const auto path = folder.write("reel.edl", edlOf({"NEW"}));
    EventList events;
    events.add(std::make_shared<EventBase>());
    const std::wstring widened = widePath(path);

    const NoProject none;
    EXPECT_EQ(thrownBy([&] { events.load(widened, false); }), Result::NotAvailable);
    EXPECT_EQ(thrownBy([&] { events.load(widened, true); }), Result::NotAvailable);

    EXPECT_EQ(events.size(), 1U);
}

TEST(EventListFiles, LoadsBehindThePresentEvents)
{
    const TempFolder folder;
    const auto path = folder.write("reel.edl", edlOf({"NEW", "NEWER"}));
    EventList events;
    const auto present = std::make_shared<EventBase>();
    events.add(present);

    events.load(widePath(path), true);
    events.load(widePath(path), true);

    EXPECT_EQ(rollsOf(events), (Names{"", "NEW", "NEWER", "NEW", "NEWER"}));
    EXPECT_EQ(events.eventAt(0), present);
}

TEST(EventListFiles, GivesTheRateThatTheFileShows)
{
    const TempFolder folder;
    EventList events;
    Framerate framerate(60, 0);

    events.load(widePath(folder.write("reel.edl", edlOf({"A"}))), true, framerate, false, false);

    EXPECT_EQ(shown(framerate), (ShownRate{24, 0}));
}

TEST(EventListFiles, AcceptsAudioWhereItIsAskedTo)
{
    const TempFolder folder;
    const std::wstring path = widePath(folder.write("reel.edl", "001 AX A C " + Timecodes));
    EventList events;
    Framerate framerate;

    events.load(path, true);
    events.load(path, true, framerate, false, false);
    events.load(path, true, framerate, false, true);

    ASSERT_EQ(events.size(), 3U);
    EXPECT_TRUE(events.at(0).hasFlaw(EventFlaw::NotVideoEvent));
    EXPECT_TRUE(events.at(1).hasFlaw(EventFlaw::NotVideoEvent));
    EXPECT_TRUE(events.at(2).isValid());
}

TEST(EventListFiles, NotifiesOfTheClearingAndOfTheLoading)
{
    const TempFolder folder;
    const std::wstring path = widePath(folder.write("reel.edl", edlOf({"A", "AB", "B"})));
    EventList events(ListKind::New);
    RecordingListener listener;
    events.addListener(&listener);
    Framerate framerate;

    events.load(path, false, framerate, true, false);
    EXPECT_EQ(listener.listKinds, (std::vector<std::int32_t>{ListKind::New, ListKind::New}));

    listener.forget();
    events.load(path, true, framerate, true, false);
    EXPECT_EQ(listener.listKinds, (std::vector<std::int32_t>{ListKind::New}));

    listener.forget();
    events.at(0).setRollName("C");
    events.at(5).setRollName("C");
    EXPECT_EQ(listener.listKinds, (std::vector<std::int32_t>{ListKind::New, ListKind::New}));
    events.removeListener(&listener);
}

TEST(EventListFiles, StaysClearedAfterAFailure)
{
    const TempFolder folder;
    EventList events;
    events.add(std::make_shared<EventBase>());
    RecordingListener listener;
    events.addListener(&listener);

    EXPECT_EQ(thrownBy([&] { events.load(widePath(folder / "missing.edl"), false); }), Result::FileAccessFailed);

    EXPECT_TRUE(events.isEmpty());
    EXPECT_EQ(listener.types.size(), 1U);
    events.removeListener(&listener);
}

TEST(EventListFiles, KeepsThePresentEventsAfterAFailureToAppend)
{
    EventList events;
    events.add(std::make_shared<EventBase>());
    Framerate framerate(25, 0);

    EXPECT_EQ(thrownBy([&] { events.load(L"reel\xD800.edl", true, framerate, true, true); }), Result::InvalidArgument);

    EXPECT_EQ(events.size(), 1U);
    EXPECT_EQ(shown(framerate), (ShownRate{25, 0}));
}

TEST(EventListFiles, NamesABRollLikeItsRoll)
{
    EXPECT_EQ(renamed({"A001B", "A001"}), (Names{"A001", "A001"}));
    EXPECT_EQ(renamed({"A001", "A001B", "A001B"}), (Names{"A001", "A001", "A001"}));
}

TEST(EventListFiles, KeepsABRollWithoutItsRoll)
{
    EXPECT_EQ(renamed({"A002B", "A001"}), (Names{"A002B", "A001"}));
    EXPECT_EQ(renamed({"A001b", "A001"}), (Names{"A001b", "A001"}));
    EXPECT_EQ(renamed({"B", "A"}), (Names{"B", "A"}));
}

TEST(EventListFiles, NamesARollBLikeOneWithoutAName)
{
    // "X/1" can't be read as a roll name, which leaves the name empty.
    EXPECT_EQ(renamed({"B", "X/1"}), (Names{"", ""}));
}

TEST(EventListFiles, LooksForTheRollAmongTheNamesAsTheyWereRead)
{
    EXPECT_EQ(renamed({"A1BB", "A1B", "A1"}), (Names{"A1B", "A1", "A1"}));
    EXPECT_EQ(renamed({"A1B", "A1BB"}), (Names{"A1B", "A1B"}));
}

TEST(EventListFiles, LeavesBRollsAloneUnlessItIsAskedTo)
{
    const TempFolder folder;
    const std::wstring path = widePath(folder.write("reel.edl", edlOf({"A001B", "A001"})));
    EventList events;

    events.load(path, true);

    EXPECT_EQ(rollsOf(events), (Names{"A001B", "A001"}));
}

TEST(EventListFiles, LooksForTheRollAmongTheNewEventsOnly)
{
    const TempFolder folder;
    EventList events;
    Framerate framerate;

    events.load(widePath(folder.write("first.edl", edlOf({"A001", "A002B"}))), true, framerate, true, false);
    events.load(widePath(folder.write("second.edl", edlOf({"A001B", "A002"}))), true, framerate, true, false);

    EXPECT_EQ(rollsOf(events), (Names{"A001", "A002B", "A001B", "A002"}));
}

TEST(EventListFiles, SavesWhatItCanLoad)
{
    const TempFolder folder;
    const std::wstring path = widePath(folder / "reel.edl");
    EventList events;
    events.add(makeEvent("a1", "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:00:05:00"));
    events.add(makeEvent("b1", "03:00:00:00", "03:00:05:00", "02:00:05:00", "02:00:10:00"));

    events.save(path);
    EventList loaded;
    loaded.load(path, true);

    EXPECT_EQ(rollsOf(loaded), (Names{"A1", "B1"}));
    EXPECT_TRUE(loaded.at(0).hasSameTimecodes(events.at(0)));
    EXPECT_TRUE(loaded.at(1).hasSameTimecodes(events.at(1)));
}

TEST(EventListFiles, ThrowsWhatTheWriterReturns)
{
    const TempFolder folder;
    EventList events;

    EXPECT_EQ(thrownBy([&] { events.save(widePath(folder / "reel.edl")); }), Result::InvalidArgument);
    events.add(makeEvent("a1", "01:00:00:00", "01:00:05:00", "02:00:00:00", "02:00:05:00"));
    EXPECT_EQ(thrownBy([&] { events.save(widePath(folder.path())); }), Result::FileAccessFailed);
    EXPECT_EQ(thrownBy([&] { events.save(widePath(folder / "reel.edl")); }), Result::Ok);
}

TEST(EventListFiles, AppendsEventsThatNoListListenedTo)
{
    EventList events;
    RecordingListener listener;
    events.addListener(&listener);
    const auto first = std::make_shared<EventBase>();
    const auto second = std::make_shared<EventBase>();

    events.append({first});
    events.append({second, first});

    EXPECT_EQ(events.events(), (std::vector<std::shared_ptr<EventBase>>{first, second, first}));
    EXPECT_EQ(listener.types.size(), 2U);
    second->setRollName("A");
    EXPECT_EQ(listener.types.size(), 3U);
    events.removeListener(&listener);
}

} // namespace
} // namespace cadrel::tests
