// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/RunNoteStep.h"

#include "core/model/DataModel.h"
#include "util/Result.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>

namespace cadrel::host::tests {
namespace {

using core::PropertyKey;
using core::Variant;
using util::Result;
using Text = std::optional<std::string>;

/// A model, and a step that was made before the note of a run is written into it.
class RunNoteStepTest : public testing::Test {
protected:
    Text noted(PropertyKey::Type key) const
    {
        Variant value;
        return model->getProperty(key, value) == Result::Ok ? Text(value.toText()) : std::nullopt;
    }
    void note(PropertyKey::Type key, const char* text) { model->setProperty(key, Variant(std::string(text))); }

    std::shared_ptr<core::DataModel> model = std::make_shared<core::DataModel>();
};

} // namespace

TEST_F(RunNoteStepTest, TakesTheNoteOfARunAwayAndBringsItBackByTurns)
{
    const auto step = Velmark::makeCounted<RunNoteStep>(model);
    note(PropertyKey::DoneRuns, "first");

    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(step->undo(), Velmark::ResultOk);
        EXPECT_EQ(noted(PropertyKey::DoneRuns), std::nullopt);
        EXPECT_EQ(step->redo(), Velmark::ResultOk);
        EXPECT_EQ(noted(PropertyKey::DoneRuns), "first");
    }
}

TEST_F(RunNoteStepTest, BringsTheNoteOfTheRunsBeforeBack)
{
    note(PropertyKey::DoneRuns, "first");
    note(PropertyKey::EarlierRuns, "earlier");
    const auto step = Velmark::makeCounted<RunNoteStep>(model);
    note(PropertyKey::DoneRuns, "first and second");
    model->removeProperty(PropertyKey::EarlierRuns);

    EXPECT_EQ(step->undo(), Velmark::ResultOk);
    EXPECT_EQ(noted(PropertyKey::DoneRuns), "first");
    EXPECT_EQ(noted(PropertyKey::EarlierRuns), "earlier");
    EXPECT_EQ(step->redo(), Velmark::ResultOk);
    EXPECT_EQ(noted(PropertyKey::DoneRuns), "first and second");
    EXPECT_EQ(noted(PropertyKey::EarlierRuns), std::nullopt);
}

TEST_F(RunNoteStepTest, LeavesAllElseOfTheModelAsItIs)
{
    const auto step = Velmark::makeCounted<RunNoteStep>(model);
    note(PropertyKey::DoneRuns, "first");
    model->setProperty(PropertyKey::PreviewOffset, Variant(86400.0));
    model->setPreviewActive(true);

    EXPECT_EQ(step->undo(), Velmark::ResultOk);

    Variant offset;
    EXPECT_EQ(model->getProperty(PropertyKey::PreviewOffset, offset), Result::Ok);
    EXPECT_EQ(offset.toDouble(), 86400.0);
    EXPECT_TRUE(model->isPreviewActive());
}

TEST_F(RunNoteStepTest, RefusesWhenItsModelIsGone)
{
    const auto step = Velmark::makeCounted<RunNoteStep>(model);

    const std::weak_ptr<core::DataModel> gone = model;
    model.reset();
    EXPECT_TRUE(gone.expired());

    EXPECT_EQ(step->undo(), Result::NotAvailable);
    EXPECT_EQ(step->redo(), Result::NotAvailable);
}

TEST_F(RunNoteStepTest, IsPartOfItsEntryAndNothingMore)
{
    const auto step = Velmark::makeCounted<RunNoteStep>(model);
    note(PropertyKey::DoneRuns, "first");

    EXPECT_EQ(step->execute(), Velmark::ResultOk);

    EXPECT_EQ(noted(PropertyKey::DoneRuns), "first");
    EXPECT_EQ(step->getDescription(), nullptr);
    EXPECT_TRUE(step->isA("RunNoteStep", false));
}

} // namespace cadrel::host::tests
