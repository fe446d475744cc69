// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelChangeCommand.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/host/HostedModel.h"
#include "velmark/StringObject.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <optional>
#include <stdexcept>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

using Names = std::vector<std::u16string>;

class DataModelChangeCommandTest : public HostedModel {
protected:
    std::shared_ptr<const NamedEdit> edit(IEditTransaction& transaction)
    {
        return std::make_shared<NamedEdit>(NamedEdit{&transaction, host.document()});
    }
};

/// A transaction that writes down what it is told, keeps the step, and answers what the test wants.
class RecordingTransaction : public Implements<RecordingTransaction, FObject, IEditTransaction> {
public:
    static constexpr const char* ClassName = "RecordingTransaction";

    std::vector<std::string> calls;
    int32 answer = ResultOk;
    Counted<IEditStep> step;
    IProjectDocument* project = nullptr;
    std::u16string name;

    int32 begin(bool flag) override { return note(flag ? "begin true" : "begin false"); }
    int32 commit(IProjectDocument* committed, const char16_t* entry) override
    {
        project = committed;
        name = entry;
        return note("commit");
    }
    int32 insert(FUnknown*, FUnknown*) override { return note("insert"); }
    int32 remove(FUnknown*, FUnknown*) override { return note("remove"); }
    int32 move(FUnknown*, FUnknown*, FUnknown*) override { return note("move"); }
    int32 copyAll(IProjectDocument*, FUnknown**, double, double, int32) override { return note("copyAll"); }
    int32 paste(IProjectDocument*, FUnknown*, int32, double) override { return note("paste"); }
    int32 deleteRange(IProjectDocument*, int32, double, double) override { return note("deleteRange"); }
    int32 addStep(IEditStep* added) override
    {
        step = Counted<IEditStep>::share(added);
        return note("addStep");
    }

private:
    int32 note(const char* call)
    {
        calls.emplace_back(call);
        return answer;
    }
};

} // namespace

TEST_F(DataModelChangeCommandTest, MakesANamedChangeOneEntryOfTheUndoList)
{
    const Bytes before = bytes();

    {
        const DataModelChangeCommand command(L"Load New EDL", edit(*host.transaction()), shared);
        EXPECT_TRUE(isEditOpen());
        change("B");
        EXPECT_EQ(undoNames(), Names{});
    }

    const Bytes after = bytes();
    EXPECT_FALSE(isEditOpen());
    EXPECT_EQ(undoNames(), Names{u"Load New EDL"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
    EXPECT_TRUE(host.redo());
    EXPECT_EQ(bytes(), after);
}

TEST_F(DataModelChangeCommandTest, MakesAnEntryWithoutAChangeToo)
{
    const Bytes before = bytes();

    {
        const DataModelChangeCommand command(L"Load New EDL", edit(*host.transaction()), shared);
    }

    EXPECT_EQ(undoNames(), Names{u"Load New EDL"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelChangeCommandTest, LeavesTheNameOfAnOpenEditToItsCommit)
{
    const Bytes before = bytes();
    const std::string tracksBefore = host.dump();
    host.transaction()->begin(true);
    host.addTrack(TypeWord::Marker, u"Overlap");

    {
        const DataModelChangeCommand command(*host.transaction(), shared, host.document(),
                                             DataModelEditStep::snapshotOf(model));
        change("B");
    }

    EXPECT_TRUE(isEditOpen());
    EXPECT_EQ(undoNames(), Names{});
    host.transaction()->commit(host.document(), u"Apply Cadrel");
    const Bytes after = bytes();
    const std::string tracksAfter = host.dump();
    EXPECT_EQ(undoNames(), Names{u"Apply Cadrel"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
    EXPECT_EQ(host.dump(), tracksBefore) << "One undo is for the tracks and for the model.";
    EXPECT_TRUE(host.redo());
    EXPECT_EQ(bytes(), after);
    EXPECT_EQ(host.dump(), tracksAfter);
}

TEST_F(DataModelChangeCommandTest, GoesBackToTheSnapshotThatItWasGiven)
{
    const Bytes requested = bytes();
    const auto snapshot = DataModelEditStep::snapshotOf(model);
    change("B");

    host.edit(u"Preview", [&] {
        const DataModelChangeCommand command(*host.transaction(), shared, host.document(), snapshot);
        change("C");
    });

    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), requested);
}

TEST_F(DataModelChangeCommandTest, KeepsWhatWasChangedBeforeAFailureAsItsEntry)
{
    const Bytes before = bytes();
    const auto failingChange = [&] {
        const DataModelChangeCommand command(L"Load New EDL", edit(*host.transaction()), shared);
        change("B");
        throw Result::OutOfRange;
    };

    EXPECT_EQ(thrownBy(failingChange), Result::OutOfRange);

    EXPECT_FALSE(isEditOpen());
    EXPECT_EQ(model.newEdl().size(), 2U);
    EXPECT_EQ(undoNames(), Names{u"Load New EDL"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelChangeCommandTest, LeavesAnEditAloneThatIsOpenAlready)
{
    host.transaction()->begin(true);

    EXPECT_EQ(thrownBy([&] { DataModelChangeCommand(L"Load New EDL", edit(*host.transaction()), shared); }),
              Result::HostCallFailed);

    EXPECT_TRUE(isEditOpen());
    host.transaction()->commit(host.document(), u"Other");
    EXPECT_EQ(undoNames(), Names{}) << "No step has come to it.";
}

TEST_F(DataModelChangeCommandTest, IsntMadeOfAModelThatCantBeStored)
{
    model.changeEdl().add(std::make_shared<UnwritableEvent>());

    EXPECT_EQ(thrownBy([&] { DataModelChangeCommand(L"Load New EDL", edit(*host.transaction()), shared); }),
              Result::OutOfRange);

    EXPECT_FALSE(isEditOpen());
    EXPECT_EQ(undoNames(), Names{});
}

TEST_F(DataModelChangeCommandTest, AddsItsStepAndCommitsUnderTheNameInUtf16)
{
    const auto transaction = makeCounted<RecordingTransaction>();

    {
        const DataModelChangeCommand command(L"Z\u00fcrich \U0001F3AC", edit(*transaction), shared);
        EXPECT_EQ(transaction->calls, std::vector<std::string>{"begin true"});
        EXPECT_EQ(transaction->refCount(), 2);
    }

    EXPECT_EQ(transaction->calls, (std::vector<std::string>{"begin true", "addStep", "commit"}));
    EXPECT_EQ(transaction->project, host.document());
    EXPECT_EQ(transaction->name, u"Z\u00fcrich \U0001F3AC");
    EXPECT_EQ(transaction->refCount(), 1);
    EXPECT_EQ(query<FObject>(transaction->step)->refCount(), 2) << "The transaction's and the one that asks.";
}

TEST_F(DataModelChangeCommandTest, HoldsTheProjectForWhichItCommits)
{
    const auto transaction = makeCounted<RecordingTransaction>();
    const auto before = host.project.refCount();

    {
        const DataModelChangeCommand command(L"Load New EDL", edit(*transaction), shared);
        EXPECT_EQ(host.project.refCount(), before + 1);
    }

    EXPECT_EQ(host.project.refCount(), before);
}

TEST_F(DataModelChangeCommandTest, AddsNothingButItsStepToAnOpenEdit)
{
    const auto transaction = makeCounted<RecordingTransaction>();

    {
        const DataModelChangeCommand command(*transaction, shared, host.document(),
                                             DataModelEditStep::snapshotOf(model));
    }

    EXPECT_EQ(transaction->calls, std::vector<std::string>{"addStep"});
    EXPECT_EQ(transaction->refCount(), 1);
}

TEST_F(DataModelChangeCommandTest, PassesOverWhatTheHostRefusesAtTheEnd)
{
    const auto transaction = makeCounted<RecordingTransaction>();

    {
        const DataModelChangeCommand command(L"Load New EDL", edit(*transaction), shared);
        transaction->answer = ResultFalse;
    }

    EXPECT_EQ(transaction->calls, (std::vector<std::string>{"begin true", "addStep", "commit"}))
        << "The transaction is closed even when it has taken no step.";
}

RC_GTEST_FIXTURE_PROP(DataModelChangeCommandTest, TheUndoListLeadsToEveryStateOfTheModel,
                      (const std::vector<bool>& edits, const std::vector<bool>& walk))
{
    // Edits of the model alone and edits of model and tracks by turns, then a walk over the undo list.
    std::vector<std::pair<Bytes, std::string>> states{{bytes(), host.dump()}};
    for (const bool ofModelAlone : edits) {
        const std::string roll = std::string("R").append(std::to_string(states.size()));
        if (ofModelAlone) {
            const DataModelChangeCommand command(L"Edit", edit(*host.transaction()), shared);
            change(roll);
        } else {
            host.edit(u"Run", [&] {
                const DataModelChangeCommand command(*host.transaction(), shared, host.document(),
                                                     DataModelEditStep::snapshotOf(model));
                host.addTrack(TypeWord::Audio, u"Dialogue");
                change(roll);
            });
        }
        states.emplace_back(bytes(), host.dump());
    }

    std::size_t at = states.size() - 1;
    for (const bool back : walk) {
        if (back)
            RC_ASSERT(host.undo() == (at > 0));
        else
            RC_ASSERT(host.redo() == (at + 1 < states.size()));
        if (back && at > 0)
            --at;
        else if (!back && at + 1 < states.size())
            ++at;
        RC_ASSERT(bytes() == states[at].first);
        RC_ASSERT(host.dump() == states[at].second);
    }
}

} // namespace cadrel::host::tests
