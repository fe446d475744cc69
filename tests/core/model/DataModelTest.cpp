// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/model/DataModel.h"

#include "core/model/DataModelCommandCreator.h"
#include "core/serialize/ByteArchive.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/HexBytes.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace cadrel::core {

// The host adapter's class is opaque here; a test needs no more than something to refer to.
class EditTransactionHandle {};

} // namespace cadrel::core

namespace cadrel::tests {
namespace {

using core::ChangeContext;
using core::DataModel;
using core::EventBase;
using core::EventList;
using core::Framerate;
using core::GenerationFailure;
using core::PropertyKey;
using core::Timecode;
using core::TransitionType;
using core::Variant;
using core::VfxPatternEntry;
using core::VideoList;
using core::serialize::ByteArchive;
using util::Result;

using Events = std::vector<std::shared_ptr<EventBase>>;
using Types = std::vector<std::int32_t>;

/// A model of a 25 fps project, and what its host hears.
class Model : public testing::Test {
protected:
    Model() { model.setNotifier(&host); }

    const RecordingListener& heard() const { return host.heard; }
    void forget() { host.heard.forget(); }

    /// Something in each of the model's members.
    void fill()
    {
        model.oldEdl().add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
        model.newEdl().add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00", 1));
        model.changeEdl().add(makeEvent("A", "01:00:00:00", "01:00:10:00", "01:00:00:00", "01:00:10:00", 1));
        model.setProperty(PropertyKey::LastEdlFolder, Variant("/edl"));
        model.settings().setHealMode(core::HealMode::GapsWithInserts);
        model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", true), 0);
        model.videoList().add(VideoList::Entry("/video/reel.mov", Timecode("01:00:00:00"), Timecode("00:20:00:00")),
                              false);
        forget();
    }

    void expectEmptyBesideSettings() const
    {
        EXPECT_TRUE(model.oldEdl().isEmpty());
        EXPECT_TRUE(model.newEdl().isEmpty());
        EXPECT_TRUE(model.changeEdl().isEmpty());
        EXPECT_FALSE(model.hasProperty(PropertyKey::LastEdlFolder));
        EXPECT_TRUE(model.videoList().isEmpty());
    }

    void expectDefaultOptions() const
    {
        EXPECT_EQ(model.settings().healMode(), core::HealMode::Normal);
        EXPECT_EQ(model.settings().vfxPatterns().size(), 3U);
    }

    /// Whether a change of a member reaches the host.
    bool isListening()
    {
        forget();
        model.oldEdl().clear();
        return heard().types.size() == 1;
    }

    static ByteArchive written(const DataModel& source)
    {
        ByteArchive archive;
        archive << source;
        return archive;
    }

    TestProject project;
    RecordingNotifier host;
    DataModel model;
};

/// Breaks into a change of a list, once, with an exception that is none of the system's own.
class Saboteur : public core::ChangeContextListenerInterface {
public:
    void onChange(const ChangeContext&) override
    {
        if (!m_done) {
            m_done = true;
            throw std::runtime_error("out of order");
        }
    }

private:
    bool m_done = false;
};

TEST_F(Model, HoldsAnOldANewAndAChangeList)
{
    EXPECT_EQ(model.oldEdl().listKind(), 0);
    EXPECT_EQ(model.newEdl().listKind(), 1);
    EXPECT_EQ(model.changeEdl().listKind(), 2);
    expectEmptyBesideSettings();
    expectDefaultOptions();
}

TEST_F(Model, ForwardsAChangeOfEachOfItsFiveMembers)
{
    model.oldEdl().clear();
    model.newEdl().clear();
    model.changeEdl().clear();
    model.settings().setMatchBy(1);
    model.videoList().clear();

    EXPECT_EQ(heard().types,
              (Types{ChangeContext::EventListChanged, ChangeContext::EventListChanged, ChangeContext::EventListChanged,
                     ChangeContext::SettingsChanged, ChangeContext::VideoListChanged}));
    EXPECT_EQ(heard().listKinds, (Types{0, 1, 2}));
}

TEST_F(Model, TellsTheHostsListenersOfOneEditOfOneEventAsOneListChange)
{
    RecordingListener window;
    host.addListener(&window);
    const auto event = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    model.newEdl().add(event);
    window.forget();

    event->setTimecodes(Timecode(0), Timecode(25), Timecode(0), Timecode(25));

    EXPECT_EQ(window.types, Types{ChangeContext::EventListChanged});
    EXPECT_EQ(window.listKinds, Types{1});
}

TEST_F(Model, ForwardsTheWholeContextWithoutLookingAtIt)
{
    struct StrangeContext : ChangeContext {
        StrangeContext() : ChangeContext(99) {}
        StrangeContext(const StrangeContext&) = delete;
    };
    struct : core::ChangeContextListenerInterface {
        void onChange(const ChangeContext& context) override
        {
            isStrange = dynamic_cast<const StrangeContext*>(&context) != nullptr;
        }
        bool isStrange = false;
    } listener;
    host.addListener(&listener);

    model.onChange(StrangeContext());

    EXPECT_TRUE(listener.isStrange);
    EXPECT_EQ(heard().types, Types{99});
}

TEST_F(Model, ForwardsNothingWithoutANotifier)
{
    model.setNotifier(nullptr);

    model.oldEdl().clear();
    model.generateChangeEdl();
    model.revalidateEvents();
    model.onChange(ChangeContext(99));

    EXPECT_TRUE(heard().types.empty());
}

TEST_F(Model, StopsAndStartsListeningToAllMembersInSilence)
{
    model.stopListening();
    model.oldEdl().clear();
    model.newEdl().clear();
    model.changeEdl().clear();
    model.settings().setMatchBy(1);
    model.videoList().clear();
    model.startListening();
    model.startListening();
    EXPECT_TRUE(heard().types.empty());

    model.videoList().clear();
    EXPECT_EQ(heard().types, Types{ChangeContext::VideoListChanged});
}

TEST_F(Model, AnAbsentPropertyIsAResultAndNoException)
{
    Variant value(std::int32_t{7});

    EXPECT_FALSE(model.hasProperty(10003));
    EXPECT_EQ(model.getProperty(10003, value), Result::InvalidArgument);
    EXPECT_EQ(value.toInt(), 7);
}

TEST_F(Model, PropertiesAreAddedOverwrittenAndRemovedInSilence)
{
    Variant value;

    model.setProperty(10006, Variant(std::int32_t{3}));
    EXPECT_TRUE(model.hasProperty(10006));
    EXPECT_FALSE(model.hasProperty(10007));
    EXPECT_EQ(model.getProperty(10006, value), Result::Ok);
    EXPECT_EQ(value.toInt(), 3);

    model.setProperty(10006, Variant("text"));
    EXPECT_EQ(model.getProperty(10006, value), Result::Ok);
    EXPECT_EQ(value.valueType(), Variant::String);
    EXPECT_EQ(value.toText(), "text");

    model.removeProperty(10006);
    model.removeProperty(10006);
    EXPECT_FALSE(model.hasProperty(10006));
    EXPECT_TRUE(heard().types.empty());
}

TEST_F(Model, PreviewIsActiveByItsProperty)
{
    EXPECT_FALSE(model.isPreviewActive());

    model.setPreviewActive(true);
    EXPECT_TRUE(model.isPreviewActive());
    Variant value;
    ASSERT_EQ(model.getProperty(10005, value), Result::Ok);
    EXPECT_EQ(value.valueType(), Variant::Bool);
    EXPECT_TRUE(value.toBool());

    model.setPreviewActive(false);
    EXPECT_FALSE(model.isPreviewActive());
    EXPECT_TRUE(model.hasProperty(10005));

    model.setProperty(10005, Variant(std::int32_t{2}));
    EXPECT_TRUE(model.isPreviewActive());
    model.setProperty(10005, Variant("true"));
    EXPECT_FALSE(model.isPreviewActive());
    EXPECT_TRUE(heard().types.empty());
}

TEST_F(Model, TellsTheStateOfThePreview)
{
    model.notifyPreviewState();

    EXPECT_EQ(heard().types, Types{ChangeContext::PreviewStateChanged});
}

TEST_F(Model, GeneratingFromAnEmptyOldListGivesAnEmptyChangeListAndOneChangeOfKindTwo)
{
    fill();
    model.oldEdl().clear();
    forget();

    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);

    EXPECT_TRUE(model.changeEdl().isEmpty());
    EXPECT_EQ(heard().types, Types{ChangeContext::EventListChanged});
    EXPECT_EQ(heard().listKinds, Types{2});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, GeneratingReplacesTheChangeListAndSendsOneChangeOfKindTwo)
{
    fill();
    const auto before = model.changeEdl().eventAt(0);

    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);

    ASSERT_EQ(model.changeEdl().size(), 1U);
    EXPECT_NE(model.changeEdl().eventAt(0), before);
    EXPECT_EQ(timecodesOf(model.changeEdl().at(0)), "01:00:00:00 01:00:10:00 01:00:00:00 01:00:10:00");
    EXPECT_EQ(heard().types, Types{ChangeContext::EventListChanged});
    EXPECT_EQ(heard().listKinds, Types{2});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, GeneratingComparesByTheMatchSetting)
{
    const auto oldEvent = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    const auto newEvent = makeEvent("B", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    oldEvent->setClipName("shot");
    newEvent->setClipName("shot");
    model.oldEdl().add(oldEvent);
    model.newEdl().add(newEvent);

    model.settings().setMatchBy(core::MatchBy::RollName);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 0U);

    model.settings().setMatchBy(core::MatchBy::ClipName);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 1U);
}

TEST_F(Model, GeneratingHealsByTheHealSetting)
{
    for (EventList* list : {&model.oldEdl(), &model.newEdl()}) {
        list->add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));
        list->add(makeEvent("B", "00:20:00:00", "00:20:10:00", "01:00:10:00", "01:00:20:00"));
    }

    model.settings().setHealMode(core::HealMode::None);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 2U);

    model.settings().setHealMode(core::HealMode::Normal);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    ASSERT_EQ(model.changeEdl().size(), 1U);
    EXPECT_EQ(timecodesOf(model.changeEdl().at(0)), "01:00:00:00 01:00:20:00 01:00:00:00 01:00:20:00");
    EXPECT_EQ(model.changeEdl().at(0).rollName(), "Healed Event 001");
}

TEST_F(Model, GeneratingFindsInsertsInTheNewList)
{
    for (EventList* list : {&model.oldEdl(), &model.newEdl()}) {
        list->add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));
        list->add(makeEvent("B", "00:20:00:00", "00:20:08:00", "01:00:12:00", "01:00:20:00"));
    }
    const auto insert = makeEvent("C", "00:30:00:00", "00:30:01:00", "01:00:10:12", "01:00:11:12");
    model.settings().setHealMode(core::HealMode::GapsWithoutInserts);

    model.oldEdl().add(insert);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 1U);

    model.oldEdl().erase(2, 1);
    model.newEdl().add(insert);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 2U);
}

TEST_F(Model, GeneratingComparesWithTheVfxRowsInUse)
{
    model.oldEdl().add(makeEvent("VFX_1", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));
    model.newEdl().add(makeEvent("VFX_2", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));

    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", false), 0);
    model.settings().setVfxPattern(VfxPatternEntry("", "", true), 1);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 0U);

    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", true), 2);
    EXPECT_EQ(model.generateChangeEdl(), Result::Ok);
    EXPECT_EQ(model.changeEdl().size(), 1U);
}

TEST_F(Model, ARowThatDoesNotCompileEmptiesTheChangeListAndIsTheResult)
{
    fill();
    model.settings().setVfxPattern(VfxPatternEntry("A/B", "", true), 1);

    EXPECT_EQ(model.generateChangeEdl(), Result::InvalidArgument);

    EXPECT_TRUE(model.changeEdl().isEmpty());
    EXPECT_EQ(model.oldEdl().size(), 1U);
    EXPECT_EQ(heard().types, Types{ChangeContext::EventListChanged});
    EXPECT_EQ(heard().listKinds, Types{2});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AFailureThatIsDueToAnEventTellsWhichOneItIs)
{
    fill();
    const auto endless = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:10:00:00", "01:10:10:00");
    endless->setTransitionType(TransitionType::Dissolve);
    endless->setTransitionDuration(9999999);
    model.newEdl().add(endless);
    GenerationFailure failure;

    const Result::Type result = model.generateChangeEdl([&](const GenerationFailure& told) {
        failure = told;
        return core::FailureAnswer::Stop;
    });

    EXPECT_EQ(result, Result::OutOfRange);
    EXPECT_EQ(failure.newEvent, endless);
    EXPECT_EQ(failure.oldEvent, nullptr);
    EXPECT_TRUE(model.changeEdl().isEmpty());
}

TEST_F(Model, AFailureThatIsDueToNoEventTellsNone)
{
    fill();
    model.settings().setVfxPattern(VfxPatternEntry("A/B", "", true), 1);

    EXPECT_EQ(model.generateChangeEdl([](const GenerationFailure&) {
        ADD_FAILURE();
        return core::FailureAnswer::PassOver;
    }),
              Result::InvalidArgument);
}

TEST_F(Model, AFailureOfTheGeneratorEmptiesTheChangeListAndIsTheResult)
{
    fill();
    Timecode::setFramerateProvider(nullptr);

    EXPECT_EQ(model.generateChangeEdl(), Result::NotAvailable);

    EXPECT_TRUE(model.changeEdl().isEmpty());
    EXPECT_EQ(heard().types, Types{ChangeContext::EventListChanged});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AFailureOfTheHealingEmptiesTheChangeListAndIsTheResult)
{
    for (EventList* list : {&model.oldEdl(), &model.newEdl()}) {
        list->add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));
        list->add(makeEvent("B", "00:20:00:00", "00:20:10:00", "01:00:10:00", "01:00:20:00"));
    }
    // The name of a healed event is a translated text.
    util::StringUtil::setConverter(nullptr);
    forget();

    EXPECT_EQ(model.generateChangeEdl(), Result::NotAvailable);

    EXPECT_TRUE(model.changeEdl().isEmpty());
    EXPECT_EQ(heard().types, Types{ChangeContext::EventListChanged});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AnyOtherExceptionLeavesTheGenerationAndTheModelListening)
{
    fill();
    Saboteur saboteur;
    model.changeEdl().addListener(&saboteur);

    EXPECT_THROW(model.generateChangeEdl(), std::runtime_error);

    EXPECT_TRUE(heard().types.empty());
    model.oldEdl().clear();
    model.newEdl().clear();
    model.changeEdl().clear();
    model.settings().setMatchBy(1);
    model.videoList().clear();
    EXPECT_EQ(heard().types.size(), 5u);
    model.changeEdl().removeListener(&saboteur);
}

TEST_F(Model, AnExceptionOfWhoIsToldOfAFailureLeavesTheModelListening)
{
    fill();
    const auto endless = makeEvent("A", "00:10:00:00", "00:10:10:00", "01:10:00:00", "01:10:10:00");
    endless->setTransitionType(TransitionType::Dissolve);
    endless->setTransitionDuration(9999999);
    model.newEdl().add(endless);

    EXPECT_THROW(model.generateChangeEdl(
                     [](const GenerationFailure&) -> core::FailureAnswer { throw std::runtime_error("out of order"); }),
                 std::runtime_error);

    EXPECT_TRUE(isListening());
}

TEST_F(Model, MarksTheVfxShotsOfTheOldAndTheNewListAlone)
{
    for (EventList* list : {&model.oldEdl(), &model.newEdl(), &model.changeEdl()}) {
        list->add(makeEvent("VFX_01", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00"));
        list->add(makeEvent("A", "00:10:00:00", "00:10:10:00", "01:00:10:00", "01:00:20:00"));
    }
    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", true), 0);

    model.applyVfxHandling();

    EXPECT_TRUE(model.oldEdl().at(0).vfx());
    EXPECT_FALSE(model.oldEdl().at(1).vfx());
    EXPECT_TRUE(model.newEdl().at(0).vfx());
    EXPECT_FALSE(model.newEdl().at(1).vfx());
    EXPECT_FALSE(model.changeEdl().at(0).vfx());
}

TEST_F(Model, MarksByTheMatchSettingAndLeavesOutRowsThatAreOffOrEmpty)
{
    const auto event = makeEvent("VFX_01", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    event->setClipName("SHOT_01");
    model.oldEdl().add(event);
    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", false), 0);
    model.settings().setVfxPattern(VfxPatternEntry("", "", true), 1);
    model.settings().setVfxPattern(VfxPatternEntry("SHOT_", "", true), 2);

    model.settings().setMatchBy(core::MatchBy::RollName);
    model.applyVfxHandling();
    EXPECT_FALSE(event->vfx());

    model.settings().setMatchBy(core::MatchBy::ClipName);
    model.applyVfxHandling();
    EXPECT_TRUE(event->vfx());

    model.settings().setVfxPattern(VfxPatternEntry("SHOT_", "", false), 2);
    model.applyVfxHandling();
    EXPECT_FALSE(event->vfx());
}

TEST_F(Model, MarkingWithARowThatDoesNotCompileTouchesNoEvent)
{
    const auto event = makeEvent("VFX_01", "00:10:00:00", "00:10:10:00", "01:00:00:00", "01:00:10:00");
    model.oldEdl().add(event);
    model.settings().setVfxPattern(VfxPatternEntry("VFX_", "", true), 0);
    model.settings().setVfxPattern(VfxPatternEntry("A/B", "", true), 1);
    forget();

    EXPECT_EQ(thrownBy([&] { model.applyVfxHandling(); }), Result::InvalidArgument);

    EXPECT_FALSE(event->vfx());
    EXPECT_TRUE(heard().types.empty());
}

//  old programme   |--- a ---|--- b ---|--- c ---|
//                  10        20        30        40 s
//  new programme       |- x -|----- y -----|- z -|
//                      110   115           130   140 s
class BehindAChange : public Model {
protected:
    BehindAChange()
    {
        for (const auto& event : {a, b, c})
            model.oldEdl().add(event);
        for (const auto& event : {x, y, z})
            model.newEdl().add(event);
    }

    std::shared_ptr<EventBase> change(const char* srcIn, const char* srcOut, const char* dstIn, const char* dstOut)
    {
        auto event = makeEvent("A", srcIn, srcOut, dstIn, dstOut);
        model.changeEdl().add(event);
        return event;
    }

    const std::shared_ptr<EventBase> a = makeEvent("A", "08:00:00:00", "08:00:10:00", "00:00:10:00", "00:00:20:00");
    const std::shared_ptr<EventBase> b = makeEvent("B", "08:00:00:00", "08:00:10:00", "00:00:20:00", "00:00:30:00");
    const std::shared_ptr<EventBase> c = makeEvent("C", "08:00:00:00", "08:00:10:00", "00:00:30:00", "00:00:40:00");
    const std::shared_ptr<EventBase> x = makeEvent("A", "08:00:05:00", "08:00:10:00", "00:01:50:00", "00:01:55:00");
    const std::shared_ptr<EventBase> y = makeEvent("B", "08:00:00:00", "08:00:15:00", "00:01:55:00", "00:02:10:00");
    const std::shared_ptr<EventBase> z = makeEvent("C", "08:00:00:00", "08:00:10:00", "00:02:10:00", "00:02:20:00");
};

TEST_F(BehindAChange, StandTheEventsOfTheOldProgrammeOfItsSourceAndOfTheNewOneOfItsDestination)
{
    const auto event = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:00");

    const EventList oldEvents = model.oldEventsFor(event);
    const EventList newEvents = model.newEventsFor(event);

    EXPECT_EQ(oldEvents.events(), (Events{a, b}));
    EXPECT_EQ(newEvents.events(), (Events{x, y}));
    EXPECT_EQ(oldEvents.listKind(), 2);
    EXPECT_EQ(newEvents.listKind(), 2);
}

TEST_F(BehindAChange, NeighboursThatMerelyTouchAreLeftOut)
{
    const auto event = change("00:00:20:00", "00:00:30:00", "00:01:55:00", "00:02:10:00");

    EXPECT_EQ(model.oldEventsFor(event).events(), Events{b});
    EXPECT_EQ(model.newEventsFor(event).events(), Events{y});
}

TEST_F(BehindAChange, ANeighbourOfWhichItCoversOneFrameIsThere)
{
    const auto event = change("00:00:19:24", "00:00:30:00", "00:01:55:00", "00:02:10:01");

    EXPECT_EQ(model.oldEventsFor(event).events(), (Events{a, b}));
    EXPECT_EQ(model.newEventsFor(event).events(), (Events{y, z}));
}

TEST_F(BehindAChange, AnEventAroundItsWholeRangeIsThere)
{
    const auto event = change("00:00:22:00", "00:00:24:00", "00:02:00:00", "00:02:02:00");

    EXPECT_EQ(model.oldEventsFor(event).events(), Events{b});
    EXPECT_EQ(model.newEventsFor(event).events(), Events{y});
}

TEST_F(BehindAChange, NothingStandsOutsideTheProgrammes)
{
    const auto event = change("05:00:00:00", "05:00:01:00", "06:00:00:00", "06:00:01:00");

    EXPECT_TRUE(model.oldEventsFor(event).isEmpty());
    EXPECT_TRUE(model.newEventsFor(event).isEmpty());
}

TEST_F(BehindAChange, OnlyMembersOfTheChangeListHaveSources)
{
    const auto event = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:00");

    EXPECT_TRUE(model.oldEventsFor(b).isEmpty());
    EXPECT_TRUE(model.newEventsFor(y).isEmpty());
    EXPECT_TRUE(model.oldEventsFor(std::make_shared<EventBase>(*event)).isEmpty());
}

TEST_F(BehindAChange, AnEmptyRangeOnEitherSideHasNothingOnBoth)
{
    const auto noSource = change("00:00:15:00", "00:00:15:00", "00:01:50:00", "00:02:00:00");
    const auto noDestination = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:01:50:00");
    const auto reversed = change("00:00:25:00", "00:00:15:00", "00:01:50:00", "00:02:00:00");

    for (const auto& event : {noSource, noDestination, reversed}) {
        EXPECT_TRUE(model.oldEventsFor(event).isEmpty());
        EXPECT_TRUE(model.newEventsFor(event).isEmpty());
    }
}

TEST_F(BehindAChange, AnInvalidTimecodeHasNothing)
{
    const auto event = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:25");

    EXPECT_TRUE(model.oldEventsFor(event).isEmpty());
    EXPECT_TRUE(model.newEventsFor(event).isEmpty());
}

TEST_F(BehindAChange, OtherFlawsDoNotMatter)
{
    const auto event = change("00:00:22:00", "00:00:24:00", "00:02:00:00", "00:02:02:00");
    event->addFlaw(4);

    EXPECT_EQ(model.oldEventsFor(event).events(), Events{b});
}

TEST_F(BehindAChange, StandTheEventsOfManyChangesOnceEach)
{
    const auto first = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:00");
    const auto second = change("00:00:20:00", "00:00:35:00", "00:02:00:00", "00:02:15:00");
    const auto flawed = change("00:00:00:00", "00:00:01:00", "00:01:50:00", "00:02:00:25");
    const std::vector<std::shared_ptr<EventBase>> changes = {second, nullptr, flawed, first, b};

    EXPECT_EQ(model.oldEventsBehind(changes), (Events{b, c, a}));
    EXPECT_EQ(model.newEventsBehind(changes), (Events{y, z, x}));
    EXPECT_TRUE(model.oldEventsBehind({}).empty());
    EXPECT_TRUE(model.newEventsBehind({b, y}).empty());
}

TEST_F(BehindAChange, NothingOfTheProgrammesIsReadWhereNoChangeIsAsked)
{
    const NoProject none;
    EXPECT_TRUE(model.oldEventsBehind({}).empty());
    EXPECT_TRUE(model.newEventsBehind({}).empty());
    EXPECT_TRUE(model.oldEventsBehind({b, nullptr}).empty());
    EXPECT_TRUE(model.oldEventsFor(y).isEmpty());
}

TEST_F(BehindAChange, ARangeShorterThanTheToleranceFails)
{
    const auto event = change("00:00:22:00", "00:00:22:01", "00:02:00:00", "00:02:00:01");
    // A frame of a microsecond; twice 1/384000 s is more than that.
    project.framerate.rate = 1e6;

    EXPECT_EQ(thrownBy([&] { model.oldEventsFor(event); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { model.newEventsFor(event); }), Result::InvalidArgument);
}

TEST_F(BehindAChange, AnEventWithAnotherInsideItStandsThereOnce)
{
    //  old, new   |------------- outer -------------|
    //                    |--- inner ---|
    const auto outer = makeEvent("O", "08:00:00:00", "08:00:30:00", "01:00:00:00", "01:00:30:00");
    const auto inner = makeEvent("I", "08:00:00:00", "08:00:10:00", "01:00:10:00", "01:00:20:00");
    for (core::EventList* list : {&model.oldEdl(), &model.newEdl()}) {
        list->add(outer);
        list->add(inner);
    }
    const auto event = change("00:59:50:00", "01:00:40:00", "00:59:50:00", "01:00:40:00");

    EXPECT_EQ(model.oldEventsFor(event).events(), (Events{outer, inner}));
    EXPECT_EQ(model.newEventsFor(event).events(), (Events{outer, inner}));
}

TEST_F(BehindAChange, AnEventThatIsInTheProgrammeTwiceStandsThereOnce)
{
    model.oldEdl().add(b);
    const auto event = change("00:00:15:00", "00:00:35:00", "00:01:50:00", "00:02:00:00");

    EXPECT_EQ(model.oldEventsFor(event).events(), (Events{a, b, c}));
}

TEST_F(BehindAChange, StandTheEventsAsTheyAreWhenItIsAsked)
{
    const auto event = change("00:00:22:00", "00:00:24:00", "00:02:00:00", "00:02:02:00");
    const auto oldEvents = [&] { return model.oldEventsBehind({event}); };
    ASSERT_EQ(oldEvents(), Events{b});

    model.oldEdl().setListening(false);
    b->setDst(Timecode("00:00:20:00"), Timecode("00:00:23:00"));
    c->setDst(Timecode("00:00:23:00"), Timecode("00:00:40:00"));
    EXPECT_EQ(oldEvents(), (Events{b, c}));
    *b = EventBase();
    b->addFlaw(core::EventFlaw::TimecodeInvalid);
    EXPECT_EQ(oldEvents(), Events{c});
    c->addFlaw(core::EventFlaw::TimecodeInvalid);
    EXPECT_EQ(oldEvents(), Events());
    c->removeFlaw(core::EventFlaw::TimecodeInvalid);
    model.oldEdl().release();
    EXPECT_EQ(oldEvents(), Events());
    model.oldEdl() = model.newEdl();
    EXPECT_EQ(oldEvents(), Events());
    x->setDst(Timecode("00:00:20:00"), Timecode("00:00:30:00"));
    EXPECT_EQ(oldEvents(), Events{x});
}

TEST_F(BehindAChange, StandTheEventsAtTheRateOfTheProject)
{
    const auto touching = makeEvent("D", "08:00:00:00", "08:00:10:00", "00:00:59:29", "00:01:00:02");
    model.oldEdl().add(touching);
    const auto event = change("00:00:59:00", "00:00:59:24", "00:01:50:00", "00:02:00:00");
    ASSERT_EQ(model.oldEventsBehind({event}), Events());

    project.framerate = Framerate(30, 0);
    touching->setDst(Timecode("00:00:58:29"), Timecode("00:00:59:01"));
    EXPECT_EQ(model.oldEventsBehind({event}), Events{touching});
    project.framerate = Framerate(25, 0);
    touching->revalidate();
    EXPECT_EQ(model.oldEventsBehind({event}), Events());
}

TEST_F(BehindAChange, ManyChangesAreAnsweredAtOneGoAListForEach)
{
    const auto first = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:00");
    const auto empty = change("00:00:15:00", "00:00:15:00", "00:01:50:00", "00:02:00:00");
    const auto last = change("00:00:30:00", "00:00:40:00", "00:02:10:00", "00:02:20:00");
    const Events asked{last, first, b, empty, nullptr, last};

    const std::vector<EventList> oldEvents = model.oldEventsFor(asked);
    const std::vector<EventList> newEvents = model.newEventsFor(asked);

    const std::vector<Events> expectedOld{{c}, {a, b}, {}, {}, {}, {c}};
    const std::vector<Events> expectedNew{{z}, {x, y}, {}, {}, {}, {z}};
    ASSERT_EQ(oldEvents.size(), expectedOld.size());
    ASSERT_EQ(newEvents.size(), expectedNew.size());
    for (std::size_t index = 0; index < asked.size(); ++index) {
        EXPECT_EQ(oldEvents[index].events(), expectedOld[index]) << index;
        EXPECT_EQ(newEvents[index].events(), expectedNew[index]) << index;
        EXPECT_EQ(oldEvents[index].listKind(), 2) << index;
    }
    EXPECT_TRUE(model.oldEventsFor(Events{}).empty());
}

TEST_F(BehindAChange, AskingIsNoChange)
{
    const auto event = change("00:00:15:00", "00:00:25:00", "00:01:50:00", "00:02:00:00");
    forget();

    {
        const EventList oldEvents = model.oldEventsFor(event);
        const EventList newEvents = model.newEventsFor(event);
    }

    EXPECT_TRUE(heard().types.empty());
    b->setRollName("X");
    EXPECT_EQ(heard().listKinds, Types{0});
}

TEST_F(Model, RevalidatingLooksAtAllListsAndSendsOneContextOfTheModel)
{
    const auto late = [] { return makeEvent("A", "00:00:00:24", "00:00:01:00", "00:00:00:24", "00:00:01:00"); };
    model.oldEdl().add(late());
    model.newEdl().add(late());
    model.changeEdl().add(late());
    forget();

    project.framerate = Framerate(24, 0);
    model.revalidateEvents();

    EXPECT_TRUE(model.oldEdl().at(0).hasFlaw(11));
    EXPECT_TRUE(model.newEdl().at(0).hasFlaw(11));
    EXPECT_TRUE(model.changeEdl().at(0).hasFlaw(11));
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(heard().dataModels, std::vector<DataModel*>{&model});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, RevalidatingWithoutAFrameRateFailsAndTheModelListensOn)
{
    fill();
    Timecode::setFramerateProvider(nullptr);

    EXPECT_EQ(thrownBy([&] { model.revalidateEvents(); }), Result::NotAvailable);

    EXPECT_TRUE(heard().types.empty());
    EXPECT_TRUE(isListening());
    forget();
    model.newEdl().at(0).setRollName("heard");
    EXPECT_EQ(heard().listKinds, Types{1});
}

TEST_F(Model, ResettingGivesAFreshModelThatKeepsThePatternRows)
{
    fill();
    model.settings().setMatchBy(1);

    model.reset();

    expectEmptyBesideSettings();
    expectDefaultOptions();
    EXPECT_EQ(model.settings().matchBy(), 0);
    EXPECT_EQ(model.settings().vfxPattern(0), VfxPatternEntry("VFX_", "", true));
}

TEST_F(Model, ResettingAListeningModelIsHeard)
{
    model.reset();

    EXPECT_EQ(heard().types, (Types{ChangeContext::EventListChanged, ChangeContext::EventListChanged,
                                    ChangeContext::EventListChanged, ChangeContext::VideoListChanged}));
    EXPECT_EQ(heard().listKinds, (Types{0, 1, 2}));

    forget();
    model.stopListening();
    model.reset();
    EXPECT_TRUE(heard().types.empty());
}

TEST_F(Model, ReadingSendsOneContextOfTheModelAndListensToWhatItRead)
{
    fill();
    ByteArchive archive = written(model);
    DataModel other;
    RecordingNotifier otherHost;
    other.setNotifier(&otherHost);

    archive >> other;

    EXPECT_EQ(otherHost.heard.types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(otherHost.heard.dataModels, std::vector<DataModel*>{&other});
    EXPECT_EQ(timecodesOf(other.changeEdl().at(0)), timecodesOf(model.changeEdl().at(0)));
    EXPECT_EQ(other.settings().healMode(), core::HealMode::GapsWithInserts);
    EXPECT_EQ(other.videoList().size(), 1U);
    EXPECT_TRUE(other.hasProperty(PropertyKey::LastEdlFolder));
    otherHost.heard.forget();
    other.oldEdl().at(0).setRollName("X");
    EXPECT_EQ(otherHost.heard.listKinds, Types{0});
}

TEST_F(Model, AStreamThatBreaksOffInTheVideoListGivesAnEmptyModel)
{
    fill();
    std::vector<std::uint8_t> bytes = bytesOf(written(model));
    bytes.resize(bytes.size() - 5);
    ByteArchive archive = archiveOf(bytes);

    EXPECT_EQ(thrownBy([&] { archive >> model; }), Result::EndOfData);

    expectEmptyBesideSettings();
    expectDefaultOptions();
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AFailedReadingOfAnOlderStreamIsAnUnknownVersionWhateverItsCause)
{
    fill();
    ByteArchive archive = archiveOf("00 00 00 00  00 00 00 00  01 00 00 00");

    EXPECT_EQ(thrownBy([&] { archive >> model; }), Result::UnknownVersion);

    expectEmptyBesideSettings();
    expectDefaultOptions();
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AnOlderVersionThatNeverWasIsUnknownAndNothingIsRead)
{
    fill();
    ByteArchive archive = archiveOf("00 00 00 00  00 00 00 00");

    EXPECT_EQ(thrownBy([&] { model.readOlder(archive, 2); }), Result::UnknownVersion);

    EXPECT_EQ(archive.bytesLeft(), 8U);
    expectEmptyBesideSettings();
    expectDefaultOptions();
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(heard().dataModels, std::vector<DataModel*>{&model});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, ANewerStreamIsRefusedAndLeavesTheModelAsItIs)
{
    fill();
    ByteArchive archive = archiveOf("02 00 00 00");

    EXPECT_EQ(thrownBy([&] { archive >> model; }), Result::NewerVersion);

    EXPECT_EQ(model.oldEdl().size(), 1U);
    EXPECT_TRUE(heard().types.empty());
}

TEST_F(Model, AnyOtherExceptionDuringTheReadingMeansNotAvailable)
{
    fill();
    ByteArchive current = written(model);
    Saboteur first;
    model.newEdl().addListener(&first);

    EXPECT_EQ(thrownBy([&] { current >> model; }), Result::NotAvailable);

    expectEmptyBesideSettings();
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_TRUE(isListening());

    fill();
    ByteArchive older = archiveOf("00 00 00 00"
                                  "00 00 00 00 00 00 00 00  00 00 00 00 00 00 00 00");
    Saboteur second;
    model.newEdl().addListener(&second);

    EXPECT_EQ(thrownBy([&] { older >> model; }), Result::NotAvailable);

    expectEmptyBesideSettings();
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    model.newEdl().removeListener(&first);
    model.newEdl().removeListener(&second);
}

TEST_F(Model, RestoringBringsAllBackButTheSettings)
{
    fill();
    ByteArchive snapshot = written(model);
    model.oldEdl().clear();
    model.changeEdl().at(0).setRollName("changed");
    model.removeProperty(PropertyKey::LastEdlFolder);
    model.videoList().clear();
    model.settings().setHealMode(core::HealMode::None);
    model.settings().setVfxPattern(VfxPatternEntry("SHOT_", "", true), 0);
    forget();

    model.restore(snapshot);

    EXPECT_EQ(model.oldEdl().size(), 1U);
    EXPECT_EQ(model.changeEdl().at(0).rollName(), "A");
    EXPECT_TRUE(model.hasProperty(PropertyKey::LastEdlFolder));
    EXPECT_EQ(model.videoList().size(), 1U);
    EXPECT_EQ(model.settings().healMode(), core::HealMode::None);
    EXPECT_EQ(model.settings().vfxPattern(0).prefix, "SHOT_");
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(heard().dataModels, std::vector<DataModel*>{&model});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AFailedRestoringKeepsTheSettingsSendsOneContextAndThrowsOn)
{
    fill();
    std::vector<std::uint8_t> bytes = bytesOf(written(model));
    bytes.pop_back();
    ByteArchive snapshot = archiveOf(bytes);
    model.settings().setVfxPattern(VfxPatternEntry("SHOT_", "", true), 0);
    forget();

    EXPECT_EQ(thrownBy([&] { model.restore(snapshot); }), Result::EndOfData);

    expectEmptyBesideSettings();
    EXPECT_EQ(model.settings().healMode(), core::HealMode::GapsWithInserts);
    EXPECT_EQ(model.settings().vfxPattern(0).prefix, "SHOT_");
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, AFailedRestoringOfAnOlderSnapshotKeepsTheSettingsAndSendsOneContext)
{
    fill();
    // The old list is empty, and the new one breaks off behind its count.
    ByteArchive snapshot = archiveOf("00 00 00 00  00 00 00 00 00 00 00 00  00 00 00 00 01 00 00 00");

    EXPECT_EQ(thrownBy([&] { model.restore(snapshot); }), Result::UnknownVersion);

    expectEmptyBesideSettings();
    EXPECT_EQ(model.settings().healMode(), core::HealMode::GapsWithInserts);
    EXPECT_EQ(model.settings().vfxPattern(0), VfxPatternEntry("VFX_", "", true));
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(heard().dataModels, std::vector<DataModel*>{&model});
    EXPECT_TRUE(isListening());
}

TEST_F(Model, RestoringFromANewerOrAnEmptyStreamSendsOneContextToo)
{
    fill();
    ByteArchive newer = archiveOf("02 00 00 00");
    EXPECT_EQ(thrownBy([&] { model.restore(newer); }), Result::NewerVersion);
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});

    forget();
    ByteArchive empty;
    EXPECT_EQ(thrownBy([&] { model.restore(empty); }), Result::EndOfData);
    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
    EXPECT_EQ(model.settings().healMode(), core::HealMode::GapsWithInserts);
}

TEST_F(Model, ReadsAloudAgainBehindARestoringThatFailed)
{
    fill();
    ByteArchive good = written(model);
    ByteArchive broken;
    EXPECT_EQ(thrownBy([&] { model.restore(broken); }), Result::EndOfData);
    forget();

    good >> model;

    EXPECT_EQ(heard().types, Types{ChangeContext::DataModelChanged});
}

class NamedCommand : public core::DataModelChangeCommand {
public:
    using DataModelChangeCommand::DataModelChangeCommand;
    const std::wstring& name() const { return m_name; }
};

class Creator : public core::DataModelCommandCreator {
public:
    ~Creator() override { core::setDataModelCommandCreator(nullptr); }

    std::unique_ptr<core::DataModelChangeCommand> createCommand(const std::wstring& name) override
    {
        return std::make_unique<NamedCommand>(name);
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle& transaction) override
    {
        lastTransaction = &transaction;
        return std::make_unique<NamedCommand>(L"transaction");
    }
    std::unique_ptr<core::DataModelChangeCommand> createCommand(core::EditTransactionHandle& transaction,
                                                                const ByteArchive& snapshot) override
    {
        lastTransaction = &transaction;
        lastSnapshot = &snapshot;
        return std::make_unique<NamedCommand>(L"snapshot");
    }

    core::EditTransactionHandle* lastTransaction = nullptr;
    const ByteArchive* lastSnapshot = nullptr;
};

std::wstring nameOf(const std::unique_ptr<core::DataModelChangeCommand>& command)
{
    return dynamic_cast<const NamedCommand&>(*command).name();
}

TEST(DataModelCommand, NoneIsMadeWithoutACreator)
{
    core::EditTransactionHandle transaction;
    const ByteArchive snapshot;

    EXPECT_EQ(core::createDataModelCommand(L"Edit Event"), nullptr);
    EXPECT_EQ(core::createDataModelCommand(transaction), nullptr);
    EXPECT_EQ(core::createDataModelCommand(transaction, snapshot), nullptr);
}

TEST(DataModelCommand, EachFormIsMadeByTheCreator)
{
    core::EditTransactionHandle transaction;
    const ByteArchive snapshot;
    Creator creator;
    core::setDataModelCommandCreator(&creator);

    EXPECT_EQ(nameOf(core::createDataModelCommand(L"Edit Event")), L"Edit Event");
    EXPECT_EQ(creator.lastTransaction, nullptr);
    EXPECT_EQ(nameOf(core::createDataModelCommand(transaction)), L"transaction");
    EXPECT_EQ(creator.lastTransaction, &transaction);
    EXPECT_EQ(creator.lastSnapshot, nullptr);
    EXPECT_EQ(nameOf(core::createDataModelCommand(transaction, snapshot)), L"snapshot");
    EXPECT_EQ(creator.lastSnapshot, &snapshot);
}

TEST(DataModelCommand, NoneIsMadeAfterTheCreatorIsRemoved)
{
    Creator creator;
    core::setDataModelCommandCreator(&creator);

    core::setDataModelCommandCreator(nullptr);

    EXPECT_EQ(core::createDataModelCommand(L"Edit Event"), nullptr);
}

} // namespace
} // namespace cadrel::tests
