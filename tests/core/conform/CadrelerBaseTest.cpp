// SPDX-License-Identifier: GPL-3.0-or-later

#include "core/conform/CadrelerBase.h"

#include "core/cut/Cut.h"
#include "core/cut/CutList.h"
#include "tests/support/core/ConformFilm.h"
#include "tests/support/core/MemoryEngine.h"
#include "tests/support/core/RecordingProgress.h"
#include "util/StringUtil.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <iterator>
#include <memory>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::tests {
namespace {

using core::CadrelerBase;
using core::MarkerEntry;
using core::MarkerKind;
using core::Settings;
using util::Result;

using Calls = std::vector<std::string>;
using Markers = std::vector<MarkerEntry>;

/// Notes the steps of a run as they are called, and lets one of them fail in place of what it does.
class ScriptedEngine : public MemoryEngine {
public:
    using MemoryEngine::MemoryEngine;

    /// `fail` runs in place of the step.
    void failAt(std::string step, std::function<Result::Type()> fail)
    {
        m_failingStep = std::move(step);
        m_fail = std::move(fail);
    }
    void showProgress(core::ProgressHandlerBase* progress) { m_progress = progress; }
    /// Neighbours and the side shown play no part in what a preview does to the tracks, whatever they are.
    Result::Type preview(const core::EventList& events) { return CadrelerBase::startPreview(events, 3, 4, 1); }

    Result::Type removeVirginTerritoryMarkers() override
    {
        return step("remove", [&] { return MemoryEngine::removeVirginTerritoryMarkers(); });
    }
    std::shared_ptr<core::Cut> makeCutEvents(const std::shared_ptr<core::EventBase>& changeEvent) override
    {
        std::shared_ptr<core::Cut> cut;
        step("make " + std::to_string(changeEvent->eventNumber()), [&] {
            cut = MemoryEngine::makeCutEvents(changeEvent);
            return Result::Ok;
        });
        return cut;
    }
    core::CadrelPreviewState getPreviewState() override
    {
        step("preview state", [] { return Result::Ok; });
        return MemoryEngine::getPreviewState();
    }
    Result::Type applyVirginTerritories(core::CutList& cuts) override
    {
        const Result::Type result =
            step("apply " + std::to_string(cuts.size()), [&] { return CadrelerBase::applyVirginTerritories(cuts); });
        return result != Result::Ok ? result : step("own stage", [] { return Result::Ok; });
    }
    Result::Type processEvent(core::Cut& cut) override
    {
        return step("process " + std::to_string(cut.event()->eventNumber()),
                    [&] { return MemoryEngine::processEvent(cut); });
    }
    core::CadrelRunState getRunState() override
    {
        step("run state", [] { return Result::Ok; });
        return MemoryEngine::getRunState();
    }
    Result::Type generateMarkers(const std::vector<MarkerEntry>& entries) override
    {
        return step("generate " + std::to_string(entries.size()),
                    [&] { return MemoryEngine::generateMarkers(entries); });
    }
    Result::Type completeCadrel() override
    {
        // Completing clears the stretch, which is no step of the run.
        return step("complete", [&] {
            const Calls before = calls;
            const Result::Type result = MemoryEngine::completeCadrel();
            calls = before;
            return result;
        });
    }

    Calls calls;

private:
    template <typename Step>
    Result::Type step(const std::string& name, Step carryOut)
    {
        calls.push_back(name);
        return name == m_failingStep ? m_fail() : carryOut();
    }

    std::string m_failingStep;
    std::function<Result::Type()> m_fail;
};

/// The second half of a film comes first, in a list with an event that can't be used; no markers.
struct SwappedFilm : ConformFilm {
    SwappedFilm()
    {
        engineWithSteps.addTrack(L"Dialogue");
        carryOver("00:00:10:00", "00:00:20:00", "00:00:00:00", "00:00:10:00");
        carryOverNothing();
        carryOver("00:00:00:00", "00:00:10:00", "00:00:10:00", "00:00:20:00");
        switchMarkersOff();
    }

    ScriptedEngine engineWithSteps{model};
};

const Calls StepsOfRun{"remove",    "make 1",    "make 3",    "preview state", "apply 2", "process 1",
                       "process 3", "own stage", "run state", "generate 0",    "complete"};

/// The steps up to and including `last`.
Calls stepsUpTo(const std::string& last, Calls steps = StepsOfRun)
{
    steps.erase(std::next(std::find(steps.begin(), steps.end(), last)), steps.end());
    return steps;
}

TEST(CadrelerBase, RunsItsStepsInOrder)
{
    SwappedFilm film;

    const Result::Type result = film.engineWithSteps.run(film.model.changeEdl());

    EXPECT_EQ(result, Result::Ok);
    EXPECT_EQ(film.engineWithSteps.calls, StepsOfRun);
}

TEST(CadrelerBase, PreviewsWithTheStepsOfARunButTheLast)
{
    SwappedFilm film;

    const Result::Type result = film.engineWithSteps.preview(film.model.changeEdl());

    EXPECT_EQ(result, Result::Ok);
    EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo("generate 0"));
}

TEST(CadrelerBase, AppliesTheCutsInTheOrderOfTheListAndNotOfTheProgramme)
{
    ConformFilm film;
    film.switchMarkersOff();
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:10:00", "00:00:20:00");
    film.carryOver("00:00:10:00", "00:00:20:00", "00:00:00:00", "00:00:10:00");
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");

    engine.run(film.model.changeEdl());

    EXPECT_EQ(engine.calls, (Calls{"remove", "make 1", "make 2", "preview state", "apply 2", "process 1", "process 2",
                                   "own stage", "run state", "generate 0", "complete"}));
}

TEST(CadrelerBase, EndsARunWithTheCodeThatAStepReturns)
{
    for (const char* failing : {"remove", "apply 2", "process 1", "process 3", "own stage", "generate 0", "complete"}) {
        SCOPED_TRACE(failing);
        SwappedFilm film;
        film.engineWithSteps.failAt(failing, [] { return Result::HostCallFailed; });

        EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::HostCallFailed);
        EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo(failing));
    }
}

TEST(CadrelerBase, EndsARunWithTheCodeThatAStepThrows)
{
    for (const std::string& failing : StepsOfRun) {
        SCOPED_TRACE(failing);
        SwappedFilm film;
        film.engineWithSteps.failAt(failing, []() -> Result::Type { throw Result::HostObjectMissing; });

        EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::HostObjectMissing);
        EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo(failing));
    }
}

TEST(CadrelerBase, EndsAPreviewWithTheCodeThatAStepReturns)
{
    for (const char* failing : {"remove", "apply 2", "process 1", "process 3", "own stage", "generate 0"}) {
        SCOPED_TRACE(failing);
        SwappedFilm film;
        film.engineWithSteps.failAt(failing, [] { return Result::HostCallFailed; });

        EXPECT_EQ(film.engineWithSteps.preview(film.model.changeEdl()), Result::HostCallFailed);
        EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo(failing));
    }
}

TEST(CadrelerBase, EndsAPreviewWithTheCodeThatAStepThrows)
{
    for (const std::string& failing : stepsUpTo("generate 0")) {
        SCOPED_TRACE(failing);
        SwappedFilm film;
        film.engineWithSteps.failAt(failing, []() -> Result::Type { throw Result::HostObjectMissing; });

        EXPECT_EQ(film.engineWithSteps.preview(film.model.changeEdl()), Result::HostObjectMissing);
        EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo(failing));
    }
}

TEST(CadrelerBase, TurnsACodeThatACutThrowsIntoTheResultOfTheApplication)
{
    SwappedFilm film;
    core::CutList cuts;
    cuts.add(film.engineWithSteps.makeCutEvents(film.model.changeEdl().eventAt(0)));
    film.engineWithSteps.failAt("process 1", []() -> Result::Type { throw Result::HostObjectMissing; });

    EXPECT_EQ(film.engineWithSteps.CadrelerBase::applyVirginTerritories(cuts), Result::HostObjectMissing);
}

TEST(CadrelerBase, LeavesTheTracksAsFarAsAFailedRunGot)
{
    SwappedFilm film;
    MemoryTrack& track = film.engineWithSteps.tracks().front();
    track.addClip({"A", 0.0, 10.0, 0.0});
    track.addClip({"B", 10.0, 20.0, 0.0});
    film.engineWithSteps.failAt("process 3", [] { return Result::HostCallFailed; });

    film.engineWithSteps.run(film.model.changeEdl());

    EXPECT_EQ(track.clips(),
              (std::vector<MemoryClip>{{"A", 0.0, 10.0, 0.0}, {"B", 10.0, 20.0, 0.0}, {"B", 86400.0, 86410.0, 0.0}}));
}

TEST(CadrelerBase, LetsOtherExceptionsThanCodesPass)
{
    for (const std::string& failing : StepsOfRun) {
        SCOPED_TRACE(failing);
        SwappedFilm film;
        film.engineWithSteps.failAt(failing, []() -> Result::Type { throw std::runtime_error("disk full"); });

        EXPECT_THROW(film.engineWithSteps.run(film.model.changeEdl()), std::runtime_error);
    }
}

TEST(CadrelerBase, CompletesARunOfFlawedEventsAloneWithoutACut)
{
    ConformFilm film;
    film.carryOverNothing();
    film.carryOverNothing();
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");
    ASSERT_TRUE(film.model.changeEdl().at(0).hasFlaw(core::EventFlaw::TimecodeInvalid));

    EXPECT_EQ(engine.run(film.model.changeEdl()), Result::Ok);

    EXPECT_EQ(engine.calls,
              (Calls{"remove", "preview state", "apply 0", "own stage", "run state", "generate 0", "complete"}));
}

TEST(CadrelerBase, CarriesOverEventsWithOtherFlaws)
{
    ConformFilm film;
    film.switchMarkersOff();
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00").addFlaw(core::EventFlaw::FreeText);
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");

    engine.run(film.model.changeEdl());

    EXPECT_EQ(engine.calls, (Calls{"remove", "make 1", "preview state", "apply 1", "process 1", "own stage",
                                   "run state", "generate 0", "complete"}));
}

TEST(CadrelerBase, ClearsWithAPreviewOfNothingAndWritesNoMarkers)
{
    ConformFilm film;
    film.model.newEdl().add(makeEvent("NEW", "00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00"));
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");

    EXPECT_EQ(engine.preview(core::EventList()), Result::Ok);

    EXPECT_EQ(engine.calls, (Calls{"remove", "preview state", "apply 0", "own stage"}));
}

TEST(CadrelerBase, WritesNoMarkersForAPreviewOfFlawedEventsAlone)
{
    ConformFilm film;
    film.model.newEdl().add(makeEvent("NEW", "00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00"));
    film.carryOverNothing();
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");

    EXPECT_EQ(engine.preview(film.model.changeEdl()), Result::Ok);

    EXPECT_EQ(engine.calls, (Calls{"remove", "preview state", "apply 0", "own stage", "run state", "generate 0"}));
}

/// Three events of which the first stands at 50 to 60 seconds and the last at 60 to 70; the preview keeps what reaches
/// into 50 to 70 seconds. The one between them brings a piece of sound that the tests choose.
class PreviewedPiece : public ::testing::Test {
protected:
    PreviewedPiece()
    {
        film.switchMarkersOff();
        film.model.settings().setCreateAudioSnippetMarkers(true);
        film.model.settings().setRemainsThreshold(1000);
        engine.addTrack(L"Dialogue");
    }

    /// The markers of a preview with an event of 20 seconds of material from 100 seconds on, of which a clip from
    /// `clipStart` to `clipEnd` sounds.
    Markers markersOf(const char* dstIn, const char* dstOut, double clipStart, double clipEnd)
    {
        engine.tracks().front().addClip({"Piece", clipStart, clipEnd, 0.0});
        film.carryOver("00:00:00:00", "00:00:10:00", "00:00:50:00", "00:01:00:00");
        film.carryOver("00:01:40:00", "00:02:00:00", dstIn, dstOut);
        film.carryOver("00:00:10:00", "00:00:20:00", "00:01:00:00", "00:01:10:00");
        EXPECT_EQ(engine.preview(film.model.changeEdl()), Result::Ok);
        return engine.stretchMarkers();
    }
    /// The markers when the piece stands from 40 seconds to `end`.
    Markers markersWithEndAt(double end) { return markersOf("00:00:40:00", "00:01:00:00", 90.0, 60.0 + end); }
    /// The markers when the piece stands from `start` to 81 seconds.
    Markers markersWithStartAt(double start) { return markersOf("00:01:01:00", "00:01:21:00", 39.0 + start, 130.0); }

    ConformFilm film;
    ScriptedEngine engine{film.model};
};

TEST_F(PreviewedPiece, HasNoMarkerWhenItEndsBeforeTheFirstEvent)
{
    EXPECT_EQ(markersWithEndAt(49.0), Markers());
}

TEST_F(PreviewedPiece, HasNoMarkerWhenItEndsExactlyWhereTheFirstEventStarts)
{
    EXPECT_EQ(markersWithEndAt(50.0), Markers());
}

TEST_F(PreviewedPiece, HasNoMarkerWhenItEndsAnInstantBehindTheStartOfTheFirstEvent)
{
    EXPECT_EQ(markersWithEndAt(50.0 + 2.6e-6), Markers());
}

TEST_F(PreviewedPiece, HasAMarkerWhenItEndsMoreThanAnInstantBehindTheStartOfTheFirstEvent)
{
    const Markers markers = markersWithEndAt(50.0 + 2.7e-6);

    ASSERT_EQ(markers.size(), 1U);
    EXPECT_EQ(markers[0].start, 40.0);
    EXPECT_NEAR(markers[0].end, 50.0 + 2.7e-6, 1e-9);
}

TEST_F(PreviewedPiece, HasAMarkerWhenItStartsMoreThanAnInstantBeforeTheEndOfTheLastEvent)
{
    const Markers markers = markersWithStartAt(70.0 - 2.7e-6);

    ASSERT_EQ(markers.size(), 1U);
    EXPECT_NEAR(markers[0].start, 70.0 - 2.7e-6, 1e-9);
    EXPECT_EQ(markers[0].end, 81.0);
}

TEST_F(PreviewedPiece, HasNoMarkerWhenItStartsAnInstantBeforeTheEndOfTheLastEvent)
{
    EXPECT_EQ(markersWithStartAt(70.0 - 2.6e-6), Markers());
}

TEST_F(PreviewedPiece, HasNoMarkerWhenItStartsExactlyWhereTheLastEventEnds)
{
    EXPECT_EQ(markersWithStartAt(70.0), Markers());
}

TEST_F(PreviewedPiece, HasNoMarkerWhenItStartsBehindTheLastEvent)
{
    EXPECT_EQ(markersWithStartAt(71.0), Markers());
}

TEST_F(PreviewedPiece, IsMeasuredAgainstTheFirstAndTheLastEventThatCanBeUsed)
{
    film.carryOverNothing();
    film.carryOver("00:00:20:00", "00:00:30:00", "00:00:45:00", "00:00:55:00");

    const Markers markers = markersWithEndAt(46.0);
    film.carryOverNothing();
    engine.preview(film.model.changeEdl());

    EXPECT_EQ(markers, (Markers{{40.0, 46.0, "Audio snippet in Dialogue", MarkerKind::AudioSnippet}}));
    EXPECT_EQ(engine.stretchMarkers(), markers);
}

TEST(CadrelerBase, EndsAPreviewByRemovingWhatItLeft)
{
    SwappedFilm film;
    film.engineWithSteps.failAt("remove", [] { return Result::NoProject; });

    EXPECT_EQ(film.engineWithSteps.CadrelerBase::endPreview(), Result::NoProject);
    EXPECT_EQ(film.engineWithSteps.calls, (Calls{"remove"}));
}

/// Puts its mark on every text.
class MarkingConverter : public PlainConverter {
public:
    std::wstring translate(const std::wstring& text) const override { return L"<" + text + L">"; }
};

TEST(CadrelerBase, ShowsTheTranslatedNameOfEachDetectAlgorithmInTheOrderInWhichTheyRun)
{
    ConformFilm film;
    const MarkingConverter converter;
    util::StringUtil::setConverter(&converter);
    film.carryOver("00:00:00:00", "00:00:10:00", "00:00:00:00", "00:00:10:00");
    ScriptedEngine engine(film.model);
    engine.addTrack(L"Dialogue");
    RecordingProgress progress;
    engine.showProgress(&progress);

    EXPECT_EQ(engine.run(film.model.changeEdl()), Result::Ok);

    EXPECT_EQ(progress.texts,
              (std::vector<std::wstring>{L"<Insert Markers>", L"<Dissolve/Wipe Markers>", L"<Audio Snippet Markers>",
                                         L"<Automation Warning Markers>", L"<Overlap Markers>"}));
}

TEST(CadrelerBase, RunsOnlyTheDetectAlgorithmsThatAreSwitchedOn)
{
    const std::vector<std::pair<void (Settings::*)(bool), std::wstring>> switches{
        {&Settings::setCreateInsertMarkers, L"Insert Markers"},
        {&Settings::setCreateDissolveWipeMarkers, L"Dissolve/Wipe Markers"},
        {&Settings::setCreateAudioSnippetMarkers, L"Audio Snippet Markers"},
        {&Settings::setCreateAutomationWarningMarkers, L"Automation Warning Markers"},
        {&Settings::setCreateOverlapMarkers, L"Overlap Markers"},
    };
    for (const auto& [switchOn, text] : switches) {
        SwappedFilm film;
        (film.model.settings().*switchOn)(true);
        RecordingProgress progress;
        film.engineWithSteps.showProgress(&progress);

        EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::Ok);

        EXPECT_EQ(progress.texts, std::vector<std::wstring>{text});
    }
}

TEST(CadrelerBase, EstimatesTheStepsOfTheDetectAlgorithmsThatAreSwitchedOn)
{
    ConformFilm film;
    Settings& settings = film.model.settings();
    const auto estimate = [&] { return film.engine.CadrelerBase::estimateSteps(10, settings, 4); };

    EXPECT_EQ(estimate(), 3U + 3U + 40U + 40U + 10U);

    film.switchMarkersOff();
    EXPECT_EQ(estimate(), 0U);
    settings.setCreateInsertMarkers(true);
    EXPECT_EQ(estimate(), 3U);
    settings.setCreateDissolveWipeMarkers(true);
    EXPECT_EQ(estimate(), 6U);
    settings.setCreateAudioSnippetMarkers(true);
    EXPECT_EQ(estimate(), 46U);
    settings.setCreateAutomationWarningMarkers(true);
    EXPECT_EQ(estimate(), 86U);
    settings.setCreateOverlapMarkers(true);
    EXPECT_EQ(estimate(), 96U);
}

TEST(CadrelerBase, StopsBeforeACutWhenTheUserCancels)
{
    SwappedFilm film;
    RecordingProgress cancelledAtOnce(0);
    film.engineWithSteps.showProgress(&cancelledAtOnce);
    EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::Cancelled);
    EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo("process 1"));

    film.engineWithSteps.calls.clear();
    RecordingProgress cancelledAfterOneCut(1);
    film.engineWithSteps.showProgress(&cancelledAfterOneCut);
    EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::Cancelled);
    EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo("process 3"));
}

TEST(CadrelerBase, StopsInTheDetectAlgorithmsThatLookWhetherTheUserCancels)
{
    for (const auto switchOn : {&Settings::setCreateAudioSnippetMarkers, &Settings::setCreateAutomationWarningMarkers,
                                &Settings::setCreateOverlapMarkers}) {
        SwappedFilm film;
        (film.model.settings().*switchOn)(true);
        RecordingProgress cancelledBehindTheCuts(3);
        film.engineWithSteps.showProgress(&cancelledBehindTheCuts);

        EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::Cancelled);

        EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo("run state"));
    }
}

TEST(CadrelerBase, FinishesTheDetectAlgorithmsThatDoNotLookWhetherTheUserCancels)
{
    for (const auto switchOn : {&Settings::setCreateInsertMarkers, &Settings::setCreateDissolveWipeMarkers}) {
        SwappedFilm film;
        (film.model.settings().*switchOn)(true);
        RecordingProgress cancelledBehindTheCuts(3);
        film.engineWithSteps.showProgress(&cancelledBehindTheCuts);

        EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::Ok);

        EXPECT_EQ(film.engineWithSteps.calls, StepsOfRun);
        EXPECT_EQ(cancelledBehindTheCuts.steps(), 5U);
    }
}

TEST(CadrelerBase, EndsARunWithTheCodeThatADetectAlgorithmThrows)
{
    SwappedFilm film;
    film.model.settings().setCreateDissolveWipeMarkers(true);
    const auto dissolve = makeEvent("NEW", "00:00:00:00", "00:00:10:00", "00:00:05:00", "00:00:15:00");
    dissolve->setTransitionType(core::TransitionType::Dissolve);
    film.model.newEdl().add(dissolve);
    // The change events can't be told in seconds then.
    film.engineWithSteps.failAt("run state", [] {
        core::Timecode::setFramerateProvider(nullptr);
        return Result::Ok;
    });

    EXPECT_EQ(film.engineWithSteps.run(film.model.changeEdl()), Result::NotAvailable);

    EXPECT_EQ(film.engineWithSteps.calls, stepsUpTo("run state"));
}

} // namespace
} // namespace cadrel::tests
