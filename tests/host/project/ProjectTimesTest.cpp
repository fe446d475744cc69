// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/Project.h"

#include "core/notify/ChangeContext.h"
#include "host/border/HostFailure.h"
#include "standin/base/Parameter.h"
#include "tests/host/project/AlteredDocument.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/core/EventMaking.h"
#include "tests/support/core/RecordingListener.h"
#include "tests/support/core/TestProject.h"
#include "tests/support/host/FakeProject.h"
#include "tests/support/host/TrackHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::tests::makeEvent;
using cadrel::tests::thrownBy;
using cadrel::util::Result;

namespace cadrel::host {

using tests::AlteredDocument;
using tests::FakeProject;
using tests::TrackHost;
using RateFlag = FrameRateInfo::Flag;

namespace {

constexpr double Day = 86400.0;

class Told : public ProjectListener {
public:
    void projectChanging(Project&) override {}
    void projectChanged(Project&) override
    {
        ++times;
        if (failure != Result::Ok)
            throw failure;
    }

    int times = 0;
    Result::Type failure = Result::Ok; ///< what it throws when it is told
};

/// Has all locators of a project but one.
class LocatorsBut : public Implements<LocatorsBut, FObject, ILocators> {
public:
    static constexpr const char* ClassName = "LocatorsBut";

    LocatorsBut(ILocators* locators, std::string missing) : m_locators(locators), m_missing(std::move(missing)) {}

    IParameter* getParameter(const char* name) override
    {
        return name == m_missing ? nullptr : m_locators->getParameter(name);
    }

private:
    ILocators* m_locators;
    std::string m_missing;
};

/// With a clock that begins at 0 and with one that begins at 01:00:00:00. The tests give times of the clock.
class ProjectTimesTest : public testing::TestWithParam<double> {
protected:
    TrackHost::Node addClip(double start, double end)
    {
        return host.addClip(host.addTrack(TypeWord::Audio, u"FX"), u"clip", start - host.origin, end - host.origin);
    }
    double offset()
    {
        host.adapter.computePreviewOffset();
        return host.adapter.previewOffset();
    }

    TrackHost host{GetParam()};
};

INSTANTIATE_TEST_SUITE_P(Origins, ProjectTimesTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(ProjectTimesTest, HasTheRateOfTheHost)
{
    host.project.setFrameRate({29.97, RateFlag::DropFrame | RateFlag::PulledDown});

    const core::Framerate rate = host.adapter.getFramerate();

    EXPECT_EQ(rate.framesPerSecond, 30);
    EXPECT_EQ(rate.rate, 29.97);
    EXPECT_EQ(rate.dropFrame, 1);
    EXPECT_TRUE(rate.pulledDown);
    EXPECT_EQ(rate.lastFrame, 2589407) << "24 hours of 107892 drop-frame numbers";
}

TEST_P(ProjectTimesTest, AWholeRateIsTheNumberItself)
{
    const core::Framerate rate = host.adapter.getFramerate();

    EXPECT_EQ(rate.framesPerSecond, 25);
    EXPECT_EQ(rate.rate, 25.0);
    EXPECT_EQ(rate.dropFrame, 0);
    EXPECT_FALSE(rate.pulledDown);
    EXPECT_EQ(rate.lastFrame, 2159999);
}

TEST_P(ProjectTimesTest, ReadsTheRateWhenTheHostTellsOfAChange)
{
    EXPECT_EQ(host.adapter.getFramerate().framesPerSecond, 25);

    host.project.setFrameRate({24.0, 0});
    EXPECT_EQ(host.adapter.getFramerate().framesPerSecond, 25);

    host.adapter.onProjectChanged();
    EXPECT_EQ(host.adapter.getFramerate().framesPerSecond, 24);
}

TEST_P(ProjectTimesTest, RefusesWhatIsNoRate)
{
    for (const double rate :
         {0.0, -25.0, 0.9, 1001.0, std::numeric_limits<double>::quiet_NaN(), std::numeric_limits<double>::infinity()}) {
        host.project.setFrameRate({rate, 0});
        EXPECT_EQ(thrownBy([&] { host.adapter.getFramerate(); }), Result::NotSupported) << rate;
    }
    host.project.setFrameRate({25.0, RateFlag::DropFrame});
    EXPECT_EQ(thrownBy([&] { host.adapter.getFramerate(); }), Result::NotSupported);
}

TEST_P(ProjectTimesTest, LooksAtTheEventsAnewUnderAnotherRate)
{
    // The 28th frame of a second is one of 30 frames, and none of 25.
    const cadrel::tests::TestProject other(core::Framerate(25, 0));
    host.adapter.getFramerate();
    host.adapter.model().newEdl().add(makeEvent("A", "00:10:00:28", "00:10:10:28", "01:00:00:28", "01:00:10:28", 1));
    const core::EventBase& event = host.adapter.model().newEdl().at(0);
    EXPECT_TRUE(event.hasFlaw(core::EventFlaw::TimecodeInvalid));
    cadrel::tests::RecordingNotifier notifier;
    host.adapter.model().setNotifier(&notifier);

    host.project.setFrameRate({30.0, 0});
    host.adapter.onProjectChanged();

    EXPECT_FALSE(event.hasFlaw(core::EventFlaw::TimecodeInvalid));
    EXPECT_EQ(notifier.heard.types, std::vector<std::int32_t>{core::ChangeContext::DataModelChanged});
    EXPECT_EQ(core::Timecode::framerateProvider(), &other);
}

TEST_P(ProjectTimesTest, NotesEachPartOfTheRate)
{
    cadrel::tests::RecordingNotifier notifier;
    host.project.setFrameRate({30.0, 0});
    host.adapter.getFramerate();
    host.adapter.model().setNotifier(&notifier);
    host.adapter.onProjectChanged();
    EXPECT_TRUE(notifier.heard.types.empty()) << "nothing is new";

    host.project.setFrameRate({30.0, RateFlag::DropFrame});
    host.adapter.onProjectChanged();
    EXPECT_EQ(notifier.heard.types.size(), 1U);
    EXPECT_EQ(host.adapter.getFramerate().dropFrame, 1);

    host.project.setFrameRate({30.0, RateFlag::DropFrame | RateFlag::PulledDown});
    host.adapter.onProjectChanged();
    EXPECT_EQ(notifier.heard.types.size(), 2U);
    EXPECT_TRUE(host.adapter.getFramerate().pulledDown);

    host.project.setFrameRate({29.97, RateFlag::DropFrame | RateFlag::PulledDown});
    host.adapter.onProjectChanged();
    EXPECT_EQ(notifier.heard.types.size(), 3U);
    EXPECT_EQ(host.adapter.getFramerate().rate, 29.97);
}

TEST_P(ProjectTimesTest, TellsAllListenersWhateverTheRateIs)
{
    struct PoolTold : core::MediaPoolInterface::Listener {
        void mediaPoolChanged() override { ++times; }
        int times = 0;
    } pool;
    Told listener;
    host.adapter.addListener(&listener);
    host.adapter.mediaPool().addListener(&pool);

    host.adapter.onProjectChanged();
    EXPECT_EQ(listener.times, 1);
    EXPECT_EQ(pool.times, 1);

    host.project.setFrameRate({0.0, 0});
    EXPECT_EQ(thrownBy([&] { host.adapter.onProjectChanged(); }), Result::NotSupported);
    EXPECT_EQ(listener.times, 2);
    EXPECT_EQ(pool.times, 2);

    host.adapter.removeListener(&listener);
    host.adapter.mediaPool().removeListener(&pool);
    host.project.setFrameRate({25.0, 0});
    host.adapter.onProjectChanged();
    EXPECT_EQ(listener.times, 2);
    EXPECT_EQ(pool.times, 2);
}

TEST_P(ProjectTimesTest, TellsItsListenersOfAnEdit)
{
    Told listener;
    host.adapter.addListener(&listener);

    host.adapter.onProjectEdited(*host.transaction());

    EXPECT_EQ(listener.times, 1);
    host.adapter.removeListener(&listener);
}

TEST_P(ProjectTimesTest, AListenerThatFailsKeepsNoOtherFromBeingTold)
{
    std::array<Told, 3> listeners;
    for (Told& listener : listeners)
        host.adapter.addListener(&listener);
    listeners[1].failure = Result::InvalidArgument;

    EXPECT_EQ(thrownBy([&] { host.adapter.onProjectChanged(); }), Result::InvalidArgument);
    EXPECT_EQ(thrownBy([&] { host.adapter.onProjectEdited(*host.transaction()); }), Result::InvalidArgument);
    for (const Told& listener : listeners)
        EXPECT_EQ(listener.times, 2);

    host.project.setFrameRate({0.0, 0});
    EXPECT_EQ(thrownBy([&] { host.adapter.onProjectChanged(); }), Result::NotSupported)
        << "The first failure is raised.";
    for (Told& listener : listeners) {
        EXPECT_EQ(listener.times, 3);
        host.adapter.removeListener(&listener);
    }
}

TEST_P(ProjectTimesTest, TellsItsListenersOfAnEditThatTheMemosCannotFollow)
{
    const auto broken = FakeProject::withoutUsableTrack();
    Project project(host.context(), broken.get());
    project.model().setPreviewActive(true);
    project.model().setProperty(core::PropertyKey::PreviewOffset, core::Variant(Day));
    Told listener;
    project.addListener(&listener);

    EXPECT_EQ(thrownBy([&] { project.onProjectEdited(*host.transaction()); }), Result::HostObjectMissing);

    EXPECT_EQ(listener.times, 1);
    project.removeListener(&listener);
}

TEST_P(ProjectTimesTest, KnowsTheOriginAndTheEndOfTheProject)
{
    EXPECT_EQ(host.adapter.timeOrigin(), host.origin);
    EXPECT_EQ(host.adapter.projectEnd(), host.origin);

    addClip(4000.0, 4010.0);
    EXPECT_EQ(host.adapter.projectEnd(), 4010.0);

    requireOk(host.document()->setProjectEnd(5000.0 - host.origin));
    EXPECT_EQ(host.adapter.projectEnd(), 5000.0);
}

TEST_P(ProjectTimesTest, HasNoPreviewOffsetAtFirst)
{
    EXPECT_FALSE(host.adapter.hasPreviewOffset());
    EXPECT_EQ(host.adapter.previewOffset(), -std::numeric_limits<double>::max());

    host.adapter.computePreviewOffset();
    EXPECT_TRUE(host.adapter.hasPreviewOffset());

    host.adapter.resetPreviewOffset();
    EXPECT_FALSE(host.adapter.hasPreviewOffset());
    core::Variant stored;
    host.adapter.model().getProperty(core::PropertyKey::PreviewOffset, stored);
    EXPECT_EQ(stored.valueType(), core::Variant::Double);
    EXPECT_EQ(stored.toDouble(), -std::numeric_limits<double>::max());
}

TEST_P(ProjectTimesTest, AnEmptyProjectIsPreviewedADayLater)
{
    EXPECT_EQ(offset(), Day);
    core::Variant stored;
    host.adapter.model().getProperty(core::PropertyKey::PreviewOffset, stored);
    EXPECT_EQ(stored.valueType(), core::Variant::Double);
}

TEST_P(ProjectTimesTest, ThePreviewIsPastTheEndOfAllMaterial)
{
    addClip(4000.0, Day - 1.0);
    EXPECT_EQ(offset(), Day);

    addClip(4000.0, Day);
    EXPECT_EQ(offset(), 2.0 * Day);

    host.addPointMarker(host.addTrack(TypeWord::Marker, u"Cues"), u"cue", 2.5 * Day - host.origin);
    EXPECT_EQ(offset(), 3.0 * Day);
}

TEST_P(ProjectTimesTest, ALateProjectEndMovesNoPreview)
{
    requireOk(host.document()->setProjectEnd(3.0 * Day));

    EXPECT_EQ(offset(), Day);
}

TEST_P(ProjectTimesTest, ThePreviewIsBehindTheOriginOfTheClock)
{
    host.project.setTimeOrigin(1.5 * Day);

    EXPECT_EQ(offset(), 2.0 * Day);
}

TEST_P(ProjectTimesTest, ADayLastsAsLongAsTheClockTakesForIt)
{
    // 24 x 60 x 60 x 24 frames
    host.project.setFrameRate({23.976, RateFlag::PulledDown});
    EXPECT_DOUBLE_EQ(offset(), 2073600 / 23.976);

    // 24 x 107892 frames
    host.project.setFrameRate({30.0, RateFlag::DropFrame});
    host.adapter.onProjectChanged();
    EXPECT_DOUBLE_EQ(offset(), 2589408 / 30.0);
}

TEST_P(ProjectTimesTest, TheProjectEndMakesRoomForThePreview)
{
    host.adapter.model().setPreviewActive(true);
    host.adapter.computePreviewOffset();
    addClip(4000.0, Day + 10.0);

    host.adapter.extendProjectEnd(false);

    // The copies may stand as late as the material does: two days past the offset of one.
    EXPECT_EQ(host.adapter.projectEnd(), 3.0 * Day);
}

TEST_P(ProjectTimesTest, OnlyTracksThatHaveChangedCountInAnActivePreview)
{
    host.adapter.model().setPreviewActive(true);
    host.adapter.computePreviewOffset();
    addClip(4000.0, Day + 10.0);
    const auto second = host.addTrack(TypeWord::Audio, u"Music");
    host.teller.whenTold = [&] { host.adapter.extendProjectEnd(true); };

    host.addClip(second, u"clip", 4000.0 - host.origin, 4010.0 - host.origin);

    EXPECT_EQ(host.adapter.projectEnd(), 2.0 * Day);
}

TEST_P(ProjectTimesTest, TheProjectEndIsNeverDrawnIn)
{
    host.adapter.model().setPreviewActive(true);
    host.adapter.computePreviewOffset();
    requireOk(host.document()->setProjectEnd(5.0 * Day - host.origin));

    host.adapter.extendProjectEnd(false);

    EXPECT_EQ(host.adapter.projectEnd(), 5.0 * Day);
}

TEST_P(ProjectTimesTest, TheProjectEndStaysWithoutPreview)
{
    host.adapter.computePreviewOffset();

    host.adapter.extendProjectEnd(false);

    EXPECT_EQ(host.adapter.projectEnd(), host.origin);
}

TEST_P(ProjectTimesTest, TheProjectEndGoesBackAlsoWhereTheHostRoundsIt)
{
    // An instant is 2.6 microseconds.
    for (const double rounding : {-2e-6, -1e-9, 1e-9, 2e-6}) {
        SCOPED_TRACE(rounding);
        requireOk(host.document()->setProjectEnd(5000.0 - host.origin));
        AlteredDocument document(host.document());
        document.endRounding = rounding;
        Project rounded(host.context(), &document);
        rounded.model().setPreviewActive(true);
        rounded.computePreviewOffset();
        rounded.extendProjectEnd(false);
        ASSERT_NEAR(rounded.projectEnd(), 2.0 * Day, 1e-5);

        rounded.model().setPreviewActive(false);
        rounded.extendProjectEnd(false);

        EXPECT_NEAR(rounded.projectEnd(), 5000.0, 1e-5);
    }
}

TEST_P(ProjectTimesTest, TheProjectEndGoesBackWhenThePreviewIsOver)
{
    requireOk(host.document()->setProjectEnd(5000.0 - host.origin));
    host.adapter.model().setPreviewActive(true);
    host.adapter.computePreviewOffset();
    host.adapter.extendProjectEnd(false);
    ASSERT_GT(host.adapter.projectEnd(), Day);
    addClip(4000.0, Day + 10.0);
    host.adapter.extendProjectEnd(false);
    ASSERT_EQ(host.adapter.projectEnd(), 3.0 * Day);
    host.edit(u"Delete", [&] { host.transaction()->deleteRange(host.document(), 0, 0.0, 2.0 * Day); });

    host.adapter.model().setPreviewActive(false);
    host.adapter.extendProjectEnd(false);

    EXPECT_EQ(host.adapter.projectEnd(), 5000.0);
    requireOk(host.document()->setProjectEnd(6000.0 - host.origin));
    host.adapter.extendProjectEnd(false);
    EXPECT_EQ(host.adapter.projectEnd(), 6000.0) << "It goes back once.";
}

TEST_P(ProjectTimesTest, TheProjectEndCannotBeExtendedWithoutAnOffset)
{
    const auto document = makeCounted<AlteredDocument>(host.document());
    Project project(host.context(), document.get());
    project.model().setPreviewActive(true);
    EXPECT_EQ(thrownBy([&] { project.extendProjectEnd(false); }), Result::NotAvailable);

    project.computePreviewOffset();
    document->endResult = ResultFalse;
    EXPECT_EQ(thrownBy([&] { project.extendProjectEnd(false); }), Result::HostCallFailed);
}

TEST_P(ProjectTimesTest, ReadsTheLocatorsAsTheHostHasThem)
{
    host.project.locatorLeft().setValue(0, 10.0);
    host.project.locatorRight().setValue(0, 20.0);
    double left = 0.0;
    double right = 0.0;

    host.adapter.getLocators(left, right);

    EXPECT_EQ(left, 10.0);
    EXPECT_EQ(right, 20.0);
}

TEST_P(ProjectTimesTest, SetsTheLocatorsAsTheyAre)
{
    host.adapter.setLocators(false, 4000.0, 4100.0);

    EXPECT_EQ(host.project.locatorLeft().getValue(), 4000.0);
    EXPECT_EQ(host.project.locatorRight().getValue(), 4100.0);
}

TEST_P(ProjectTimesTest, AdjustedLocatorsBeginATenthEarlierAndAreTimesOfTheHost)
{
    host.adapter.setLocators(true, 4000.0, 4100.0);

    EXPECT_EQ(host.project.locatorLeft().getValue(), 3990.0 - host.origin);
    EXPECT_EQ(host.project.locatorRight().getValue(), 4090.0 - host.origin);
}

TEST_P(ProjectTimesTest, LocatorsCanBeMissingOrRefused)
{
    const auto document = makeCounted<AlteredDocument>(host.document());
    document->hasLocators = false;
    Project project(host.context(), document.get());
    double left = 0.0;
    double right = 0.0;

    EXPECT_EQ(thrownBy([&] { project.getLocators(left, right); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { project.setLocators(false, 0.0, 1.0); }), Result::HostObjectMissing);
    EXPECT_EQ(thrownBy([&] { host.adapter.setLocators(false, 1e12, 2e12); }), Result::HostCallFailed);
}

TEST_P(ProjectTimesTest, NeedsBothLocators)
{
    for (const char* missing : {ParameterName::LeftTime, ParameterName::RightTime}) {
        const auto locators = makeCounted<LocatorsBut>(host.document()->getLocators(), missing);
        const auto document = makeCounted<AlteredDocument>(host.document());
        document->locators = locators.get();
        Project project(host.context(), document.get());
        double left = 0.0;
        double right = 0.0;

        EXPECT_EQ(thrownBy([&] { project.getLocators(left, right); }), Result::HostObjectMissing);
        EXPECT_EQ(thrownBy([&] { project.setLocators(false, 1.0, 2.0); }), Result::HostObjectMissing);
    }
    EXPECT_EQ(host.project.locatorLeft().getValue(), 0.0);
    EXPECT_EQ(host.project.locatorRight().getValue(), 0.0);
}

TEST_P(ProjectTimesTest, TheApplyRangeIsAllThatLiesBeforeThePreview)
{
    double start = 0.0;
    double end = 0.0;
    EXPECT_EQ(thrownBy([&] { host.adapter.getApplyRange(start, end); }), Result::NotAvailable);

    host.adapter.computePreviewOffset();
    host.adapter.getApplyRange(start, end);
    EXPECT_EQ(start, 0.0);
    EXPECT_EQ(end, Day);
}

TEST_P(ProjectTimesTest, TheApplyRangeIsTheOneTheUserSets)
{
    host.adapter.computePreviewOffset();
    core::Settings& settings = host.adapter.model().settings();
    settings.setRestrictRange(true);
    settings.setPreserveMaterial(3700.0, 3800.0);
    double start = 0.0;
    double end = 0.0;

    host.adapter.getApplyRange(start, end);

    EXPECT_EQ(start, 3700.0);
    EXPECT_EQ(end, 3800.0);
}

TEST_P(ProjectTimesTest, AlgorithmsKnowTheModelAndTheOffset)
{
    host.adapter.computePreviewOffset();

    const core::CadrelRunState run = host.adapter.runState();
    const core::CadrelPreviewState preview = host.adapter.previewState();

    core::DataModel& model = host.adapter.model();
    EXPECT_EQ(run.oldEvents, &model.oldEdl());
    EXPECT_EQ(run.newEvents, &model.newEdl());
    EXPECT_EQ(run.settings, &model.settings());
    EXPECT_EQ(run.framerate.framesPerSecond, 25);
    EXPECT_EQ(run.previewOffset, Day);
    EXPECT_EQ(preview.settings, &model.settings());
    EXPECT_EQ(preview.framerate.framesPerSecond, 25);
}

} // namespace cadrel::host
