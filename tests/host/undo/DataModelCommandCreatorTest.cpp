// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/undo/DataModelCommandCreator.h"

#include "tests/support/ThrownResult.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/host/HostedModel.h"
#include "velmark/Editing.h"

#include <gtest/gtest.h>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using core::EditTransactionHandle;
using core::serialize::ByteArchive;
using util::Result;

using Names = std::vector<std::u16string>;

class DataModelCommandCreatorTest : public HostedModel {
protected:
    /// Of a module whose active project is the test's, or none.
    class Creator : public DataModelCommandCreator {
    public:
        Creator(const std::shared_ptr<core::DataModel>& model, standin::tests::TestHost& host)
            : context(host.context()), m_document{model, host.document()}
        {
        }

        bool hasProject = true;
        AlteredContext context;

    protected:
        std::optional<Document> activeDocument() override
        {
            return hasProject ? std::optional<Document>(m_document) : std::nullopt;
        }
        IHostContext* serviceContext() override { return &context; }

    private:
        Document m_document;
    };

    Creator creator{shared, host};
    EditTransactionHandle transaction{*host.transaction()};
};

/// A service that has no transactions.
class BareEditService : public Implements<BareEditService, FObject, IEditService> {
public:
    static constexpr const char* ClassName = "BareEditService";

    int32 copyRange(IProjectDocument*, IObjectList*, int32, double, double, double) override { return ResultFalse; }
    int32 closeRange(IProjectDocument*, IObjectList*, double, double, double) override { return ResultFalse; }
};

} // namespace

TEST_F(DataModelCommandCreatorTest, MakesANamedCommandAnEntryOfItsOwn)
{
    const Bytes before = bytes();

    auto command = creator.createCommand(L"Delete Old EDL");
    ASSERT_TRUE(command);
    EXPECT_TRUE(isEditOpen());
    change("B");
    command.reset();

    EXPECT_FALSE(isEditOpen());
    EXPECT_EQ(undoNames(), Names{u"Delete Old EDL"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelCommandCreatorTest, MakesACommandOnAnOpenEditFromTheModelAsItStands)
{
    change("B");
    const Bytes before = bytes();

    host.edit(u"Apply Cadrel", [&] {
        const auto command = creator.createCommand(transaction);
        ASSERT_TRUE(command);
        change("C");
    });

    EXPECT_EQ(undoNames(), Names{u"Apply Cadrel"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), before);
}

TEST_F(DataModelCommandCreatorTest, MakesACommandOnAnOpenEditFromACopyOfASnapshot)
{
    const Bytes requested = bytes();
    ByteArchive snapshot = DataModelEditStep::snapshotOf(model);
    change("B");

    host.edit(u"Preview", [&] {
        const auto command = creator.createCommand(transaction, snapshot);
        ASSERT_TRUE(command);
        snapshot.clear();
        change("C");
    });

    EXPECT_EQ(undoNames(), Names{u"Preview"});
    EXPECT_TRUE(host.undo());
    EXPECT_EQ(bytes(), requested);
}

TEST_F(DataModelCommandCreatorTest, MakesNoCommandWithoutAProject)
{
    creator.hasProject = false;

    EXPECT_FALSE(creator.createCommand(L"Delete Old EDL"));
    EXPECT_FALSE(isEditOpen());
    host.transaction()->begin(true);
    EXPECT_FALSE(creator.createCommand(transaction));
    EXPECT_FALSE(creator.createCommand(transaction, ByteArchive()));
    host.transaction()->commit(host.document(), u"Other");

    EXPECT_EQ(undoNames(), Names{});
}

TEST_F(DataModelCommandCreatorTest, AsksForNoServiceWithoutAProject)
{
    creator.hasProject = false;
    creator.context.hide(IEditService::iid);

    EXPECT_FALSE(creator.createCommand(L"Delete Old EDL"));
}

TEST_F(DataModelCommandCreatorTest, NeedsTheEditServiceForANamedCommandAlone)
{
    creator.context.hide(IEditService::iid);

    EXPECT_EQ(thrownBy([&] { creator.createCommand(L"Delete Old EDL"); }), Result::HostObjectMissing);
    host.edit(u"Apply Cadrel", [&] { EXPECT_TRUE(creator.createCommand(transaction)); });
}

TEST_F(DataModelCommandCreatorTest, NeedsAnEditServiceThatHasTransactions)
{
    creator.context.replace(IEditService::iid, makeCounted<BareEditService>());

    EXPECT_EQ(thrownBy([&] { creator.createCommand(L"Delete Old EDL"); }), Result::HostObjectMissing);
}

TEST_F(DataModelCommandCreatorTest, MakesOneNamedCommandAtATime)
{
    auto first = creator.createCommand(L"Delete Old EDL");

    EXPECT_EQ(thrownBy([&] { creator.createCommand(L"Delete New EDL"); }), Result::HostCallFailed);

    change("B");
    first.reset();
    EXPECT_EQ(undoNames(), Names{u"Delete Old EDL"});
}

TEST_F(DataModelCommandCreatorTest, ServesTheCoreWhileItIsThePresentCreator)
{
    core::setDataModelCommandCreator(&creator);
    core::createDataModelCommand(L"Delete Old EDL").reset();
    core::setDataModelCommandCreator(nullptr);

    EXPECT_EQ(undoNames(), Names{u"Delete Old EDL"});
    EXPECT_FALSE(core::createDataModelCommand(L"Delete New EDL"));
    EXPECT_FALSE(isEditOpen());
}

} // namespace cadrel::host::tests
