// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelEditStep.h"

#include "tests/support/host/HostedModel.h"
#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <memory>
#include <stdexcept>
#include <utility>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using core::DataModel;
using core::serialize::ByteArchive;
using util::Result;

using DataModelEditStepTest = HostedModel;

/// The first bytes of a snapshot.
ByteArchive beginningOf(const ByteArchive& whole, std::size_t size)
{
    ByteArchive beginning;
    beginning.assign(whole.data(), size);
    return beginning;
}

/// Fails in every change that it is told of.
class FailingListener : public core::ChangeContextListenerInterface {
public:
    void onChange(const core::ChangeContext&) override { throw std::runtime_error("can't show this"); }
};

} // namespace

TEST_F(DataModelEditStepTest, AnswersAsAStepOfTheHost)
{
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));

    EXPECT_EQ(query<IEditStep>(step), static_cast<IEditStep*>(step.get()));
    EXPECT_TRUE(query<FObject>(step));
    EXPECT_TRUE(query<FUnknown>(step));
    EXPECT_FALSE(query<IIdleHandler>(step));
    EXPECT_TRUE(step->isA("DataModelEditStep", false));
    EXPECT_TRUE(step->isA("FObject", true));
    EXPECT_FALSE(step->isA("FObject", false));
    EXPECT_FALSE(step->isA("Host", true));
}

TEST_F(DataModelEditStepTest, DoesNothingWhenItIsExecutedAndHasNoDescription)
{
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    change("B");
    const Bytes after = bytes();

    EXPECT_EQ(step->execute(), ResultOk);
    EXPECT_EQ(step->getDescription(), nullptr);

    EXPECT_EQ(bytes(), after);
}

TEST_F(DataModelEditStepTest, BringsTheModelBackByteForByteInBothDirectionsForEver)
{
    const Bytes before = bytes();
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    change("B");
    const Bytes after = bytes();
    ASSERT_NE(before, after);

    for (int round = 0; round < 5; ++round) {
        EXPECT_EQ(step->undo(), ResultOk);
        EXPECT_EQ(bytes(), before);
        EXPECT_EQ(step->redo(), ResultOk);
        EXPECT_EQ(bytes(), after);
    }
}

TEST_F(DataModelEditStepTest, TellsTheListenersOnceEachWay)
{
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    change("B");
    notifier.heard.forget();

    step->undo();
    EXPECT_EQ(notifier.heard.dataModels, std::vector<DataModel*>{&model});
    step->redo();
    EXPECT_EQ(notifier.heard.dataModels, (std::vector<DataModel*>{&model, &model}));
    EXPECT_EQ(notifier.heard.types.size(), 2U) << "Nothing else is told.";
}

TEST_F(DataModelEditStepTest, LeavesTheSettingsAsTheUserHasThemNow)
{
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    change("B");
    model.settings().setHealMode(core::HealMode::Normal);

    step->undo();

    EXPECT_EQ(model.settings().healMode(), core::HealMode::Normal);
    EXPECT_EQ(model.oldEdl().size(), 1U);
    step->redo();
    EXPECT_EQ(model.settings().healMode(), core::HealMode::Normal);
}

TEST_F(DataModelEditStepTest, ReadsASnapshotFromItsStart)
{
    const Bytes before = bytes();
    ByteArchive snapshot = DataModelEditStep::snapshotOf(model);
    std::uint32_t version = 0;
    snapshot >> version;
    const auto step = makeCounted<DataModelEditStep>(shared, snapshot);
    change("B");

    EXPECT_EQ(step->undo(), ResultOk);

    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelEditStepTest, BringsThePresentStateBackBehindAnUndoThatFailed)
{
    const ByteArchive whole = DataModelEditStep::snapshotOf(model);
    const auto step = makeCounted<DataModelEditStep>(shared, beginningOf(whole, whole.size() - 1));
    change("B");
    const Bytes after = bytes();

    EXPECT_EQ(step->undo(), Result::EndOfData);
    EXPECT_TRUE(model.newEdl().isEmpty()) << "The model has nothing that was half read.";

    EXPECT_EQ(step->redo(), ResultOk);
    EXPECT_EQ(bytes(), after);
}

TEST_F(DataModelEditStepTest, AnswersThatASnapshotIsOfANewerVersion)
{
    ByteArchive newer;
    newer << (model.version() + 1);
    const auto step = makeCounted<DataModelEditStep>(shared, newer);
    change("B");
    const Bytes after = bytes();

    EXPECT_EQ(step->undo(), Result::NewerVersion);

    EXPECT_EQ(step->redo(), ResultOk);
    EXPECT_EQ(bytes(), after);
}

TEST_F(DataModelEditStepTest, LetsNoExceptionOfAListenerThrough)
{
    const Bytes before = bytes();
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    change("B");
    const Bytes after = bytes();
    FailingListener failing;
    notifier.addListener(&failing);

    EXPECT_EQ(step->undo(), Result::NotAvailable);
    EXPECT_EQ(bytes(), before);
    EXPECT_EQ(step->redo(), Result::NotAvailable);
    EXPECT_EQ(bytes(), after);

    notifier.removeListener(&failing);
}

TEST_F(DataModelEditStepTest, RefusesWhenItsModelIsGone)
{
    auto other = std::make_shared<DataModel>();
    const auto step = makeCounted<DataModelEditStep>(other, DataModelEditStep::snapshotOf(*other));
    const Bytes before = bytes();

    const std::weak_ptr<DataModel> gone = other;
    other.reset();
    EXPECT_TRUE(gone.expired());

    EXPECT_EQ(step->undo(), Result::NotAvailable);
    EXPECT_EQ(step->redo(), Result::NotAvailable);
    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelEditStepTest, LeavesAModelAloneThatCantBeKept)
{
    const auto step = makeCounted<DataModelEditStep>(shared, DataModelEditStep::snapshotOf(model));
    model.oldEdl().clear();
    model.changeEdl().add(std::make_shared<UnwritableEvent>());

    EXPECT_EQ(step->undo(), Result::OutOfRange);

    EXPECT_TRUE(model.oldEdl().isEmpty());
    EXPECT_EQ(model.changeEdl().size(), 2U);
}

} // namespace cadrel::host::tests
