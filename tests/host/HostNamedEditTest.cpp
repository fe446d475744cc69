// SPDX-License-Identifier: GPL-3.0-or-later

// Previews that begin and end within a named change of the model, and what is asked while a run or a preview goes on.

#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "tests/host/PreviewedFilm.h"
#include "tests/host/project/AlteredEdits.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/WatchedProgress.h"

#include <gtest/gtest.h>

#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

using HostNamedEditTest = PreviewedFilm;

INSTANTIATE_TEST_SUITE_P(Origins, HostNamedEditTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostNamedEditTest, EndsAPreviewInTheEntryOfTheChange)
{
    previewAll();
    const Texts previewed = host.contentOf(track);
    const auto before = host.undoNames();
    {
        const auto command = adapter().createCommand(L"Delete Event");
        adapter().setPreviewActive(false);
        host.model().changeEdl().remove(firstChange());
    }

    auto expected = before;
    expected.push_back(u"Delete Event");
    EXPECT_EQ(host.undoNames(), expected);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_FALSE(host.model().isPreviewActive());
    EXPECT_FALSE(isLocked(track));

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.contentOf(track), previewed);
    EXPECT_TRUE(host.model().isPreviewActive());
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
    EXPECT_TRUE(isLocked(track));

    ASSERT_TRUE(host.redo());
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_FALSE(host.model().isPreviewActive());
    EXPECT_EQ(host.model().changeEdl().size(), 1U);
}

TEST_P(HostNamedEditTest, DeletesThePreviewRangeInTheEntryOfTheChange)
{
    previewAll();
    const auto before = host.undoNames();
    {
        const auto command = adapter().createCommand(L"Edit Event");
        host.model().changeEdl().remove(firstChange());
        EXPECT_EQ(adapter().endPreview(), Result::Ok);
    }

    auto expected = before;
    expected.push_back(u"Edit Event");
    EXPECT_EQ(host.undoNames(), expected);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));

    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20", "two 86400-86410", "one 86410-86420"}));
}

TEST_P(HostNamedEditTest, BeginsNoRunWhileTheChangeGoesOn)
{
    ASSERT_EQ(adapter().startCadrel(), Result::Ok);
    {
        const auto command = adapter().createCommand(L"Edit Event");
        host.idle();
        EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    }
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Edit Event"}));

    host.idle();
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Edit Event", u"Apply Cadrel"}));
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostNamedEditTest, LeavesTheChangeOpenWhenTheEndOfThePreviewFails)
{
    previewAll();
    const auto before = host.undoNames();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    edits->deletes = false;
    host.altered.replace(IEditService::iid, edits);
    {
        const auto command = adapter().createCommand(L"Delete Event");
        EXPECT_NE(thrownBy([&] { adapter().setPreviewActive(false); }), Result::Ok);
        host.altered.unhide(IEditService::iid);
        EXPECT_EQ(host.undoNames(), before);
        host.model().changeEdl().remove(firstChange());
    }

    auto expected = before;
    expected.push_back(u"Delete Event");
    EXPECT_EQ(host.undoNames(), expected);
    ASSERT_TRUE(host.undo());
    EXPECT_EQ(host.model().changeEdl().size(), 2U);
}

TEST_P(HostNamedEditTest, RefusesRequestsAndTheEndOfAPreviewWhileARunGoesOn)
{
    const auto progress = makeCounted<WatchedProgress>();
    host.altered.replace(IProgressService::iid, progress);
    std::vector<Result::Type> answers;
    progress->whenCalled = [&] {
        if (progress->calls.back() != "show")
            return;
        answers.push_back(adapter().startCadrel());
        answers.push_back(adapter().startPreview(changes(), 0, 0, 0));
        answers.push_back(adapter().endPreview());
        answers.push_back(thrownBy([&] { adapter().setPreviewActive(true); }));
        answers.push_back(thrownBy([&] { adapter().setPreviewActive(false); }));
    };

    ASSERT_EQ(adapter().startCadrel(), Result::Ok);
    host.idle();

    EXPECT_EQ(answers, std::vector<Result::Type>(5, Result::NotAvailable));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
    host.idle();
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
}

TEST_P(HostNamedEditTest, RefusesRequestsAndTheEndOfAPreviewAtEachStepOfARun)
{
    const auto progress = makeCounted<WatchedProgress>();
    host.altered.replace(IProgressService::iid, progress);
    std::size_t asked = 0;
    std::vector<Result::Type> answers;
    progress->whenCalled = [&] {
        if (!progress->calls.back().starts_with("tick"))
            return;
        ++asked;
        answers.push_back(adapter().endPreview());
        answers.push_back(thrownBy([&] { adapter().setPreviewActive(false); }));
        adapter().onIdle();
    };

    ASSERT_EQ(adapter().startCadrel(), Result::Ok);
    host.idle();

    ASSERT_GT(asked, 0U);
    EXPECT_EQ(answers, std::vector<Result::Type>(2 * asked, Result::NotAvailable));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Apply Cadrel"}));
    EXPECT_EQ(host.contentOf(track), (Texts{"two 0-10", "one 10-20"}));
}

TEST_P(HostNamedEditTest, RefusesTheEndOfAPreviewAndRequestsWhileOneEnds)
{
    previewAll();
    const auto edits = makeCounted<AlteredEdits>(host.context());
    std::vector<Result::Type> answers;
    edits->beforeDelete = [&] {
        if (!answers.empty())
            return;
        answers.push_back(adapter().endPreview());
        answers.push_back(thrownBy([&] { adapter().setPreviewActive(false); }));
        answers.push_back(adapter().startCadrel());
        answers.push_back(adapter().startPreview(changes(), 0, 0, 0));
        adapter().onIdle();
    };
    host.altered.replace(IEditService::iid, edits);

    EXPECT_EQ(adapter().endPreview(), Result::Ok);

    EXPECT_EQ(answers, std::vector<Result::Type>(4, Result::NotAvailable));
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Delete Preview Range"}));
    EXPECT_EQ(host.contentOf(track), (Texts{"one 0-10", "two 10-20"}));
    EXPECT_TRUE(host.model().isPreviewActive());
    EXPECT_FALSE(host.isEditOpen());
    host.idle();
    EXPECT_EQ(host.undoNames(), entriesBeforeAnd({u"Preview", u"Delete Preview Range"}));
}

} // namespace cadrel::host::tests
