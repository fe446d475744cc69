// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/main/EngineAnswers.h"

#include "core/notify/ChangeContext.h"

#include <gtest/gtest.h>

namespace cadrel::tests {
namespace {

using Action = core::ActionChangeContext;
using util::Result;
namespace EngineAnswers = gui::EngineAnswers;

const std::wstring NoEvents = L"No events in Change EDL.";
const std::wstring NoneForPreview = L"No tracks available for the preview.";
const std::wstring NoneForRun = L"No tracks available for Cadrel process.";
const std::wstring NoneSelectedForPreview =
    L"No tracks selected for the preview.\nPlease select the tracks that you want to use.";
const std::wstring NoneSelectedForRun =
    L"No tracks selected for Cadrel process.\nPlease select the tracks that you want to use.";
const std::wstring Locked = L"The workstation has refused this. Check that no track is locked.";

TEST(EngineAnswers, TellWhyNoPreviewCanBegin)
{
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::Ok, Action::Preview), L"");
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::ChangeEdlEmpty, Action::Preview), NoEvents);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoTracksSelected, Action::Preview), NoneSelectedForPreview);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoTracks, Action::Preview), NoneForPreview);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::HostCallFailed, Action::Preview), NoneForPreview);
}

TEST(EngineAnswers, TellWhyNoRunCanBegin)
{
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::Ok, Action::Run), L"");
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::ChangeEdlEmpty, Action::Run), NoEvents);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoTracksSelected, Action::Run), NoneSelectedForRun);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoTracks, Action::Run), NoneForRun);
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::HostCallFailed, Action::Run), NoneForRun);
}

TEST(EngineAnswers, TellNothingWithoutAProject)
{
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoProject, Action::Preview), L"");
    EXPECT_EQ(EngineAnswers::ofReadiness(Result::NoProject, Action::Run), L"");
    EXPECT_EQ(EngineAnswers::ofRequest(Result::NoProject, Action::Preview), L"");
    EXPECT_EQ(EngineAnswers::ofRequest(Result::NoProject, Action::Run), L"");
}

TEST(EngineAnswers, TellWhyARequestWasRefused)
{
    EXPECT_EQ(EngineAnswers::ofRequest(Result::Ok, Action::Run), L"");
    EXPECT_EQ(EngineAnswers::ofRequest(Result::ChangeEdlEmpty, Action::Run), NoEvents);
    EXPECT_EQ(EngineAnswers::ofRequest(Result::NoTracks, Action::Preview), NoneForPreview);
    EXPECT_EQ(EngineAnswers::ofRequest(Result::HostCallFailed, Action::Run), Locked);
    EXPECT_EQ(EngineAnswers::ofRequest(Result::NotAvailable, Action::Preview), L"This could not be carried out.");
}

TEST(EngineAnswers, TellThatARunIsIncompleteAndWhy)
{
    EXPECT_EQ(EngineAnswers::ofEnd(Action(Action::Run, Result::HostCallFailed)),
              L"The run has ended before it was complete. Undo takes back what it has done.\n" + Locked);
    EXPECT_EQ(EngineAnswers::ofEnd(Action(Action::Preview, Result::HostCallFailed)),
              L"The preview isn't complete.\n" + Locked);
}

TEST(EngineAnswers, TellNothingOfWhatHasEndedWellOrWasCancelledOrDropped)
{
    for (const std::int32_t action : {Action::Run, Action::Preview}) {
        EXPECT_EQ(EngineAnswers::ofEnd(Action(action)), L"");
        EXPECT_EQ(EngineAnswers::ofEnd(Action(action, Result::Cancelled)), L"");
        EXPECT_EQ(EngineAnswers::ofEnd(Action(action, Result::NoProject)), L"");
        EXPECT_EQ(EngineAnswers::ofEnd(Action::dropped(action)), L"");
    }
}

} // namespace
} // namespace cadrel::tests
