// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/edit/ActionManager.h"

#include "tests/support/standin/TestHost.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Carries out the one action of its category, and writes down what it was asked.
class Handler : public Implements<Handler, FObject, IActionHandler> {
public:
    static constexpr const char* ClassName = "Handler";

    Handler(std::vector<std::string>& asked, std::string category) : m_asked(asked), m_category(std::move(category)) {}

    int32 handleAction(const char* category, const char* action, bool show) override
    {
        m_asked.push_back(m_category + " was asked for " + category + "/" + action + (show ? "" : " in thought"));
        if (whenAsked)
            whenAsked();
        return category == m_category ? ResultOk : ResultFalse;
    }

    std::function<void()> whenAsked;

private:
    std::vector<std::string>& m_asked;
    std::string m_category;
};

class ActionManagerTest : public testing::Test {
protected:
    using Asked = std::vector<std::string>;

    int32 invoke(const char* category, const char* action) { return actions->invoke(category, action, 0); }
    int32 undo() { return invoke(IActionManager::EditCategory, IActionManager::Undo); }
    int32 redo() { return invoke(IActionManager::EditCategory, IActionManager::Redo); }
    /// An entry of the undo list.
    void insertTrack() { host.addTrack(TypeWord::Audio, u"FX 1"); }
    std::vector<std::u16string> tracks() { return namesOf(*host.root()); }

    TestHost host;
    Counted<IActionManager> actions = service<IActionManager>(host.context());
    Asked asked;
    Counted<Handler> cut = makeCounted<Handler>(asked, "Cut");
    Counted<Handler> mix = makeCounted<Handler>(asked, "Mix");
};

} // namespace

TEST_F(ActionManagerTest, AsksTheHandlersInTheirOrderUntilOneCarriesTheActionOut)
{
    actions->addHandler(cut.get());
    actions->addHandler(mix.get());

    EXPECT_EQ(invoke("Mix", "Louder"), ResultOk);
    EXPECT_EQ(invoke("Cut", "Here"), ResultOk);

    EXPECT_EQ(asked,
              (Asked{"Cut was asked for Mix/Louder", "Mix was asked for Mix/Louder", "Cut was asked for Cut/Here"}));
}

TEST_F(ActionManagerTest, RefusesAnActionThatNobodyCarriesOut)
{
    EXPECT_NE(invoke("Cut", "Here"), ResultOk);
    actions->addHandler(mix.get());
    EXPECT_NE(invoke("Cut", "Here"), ResultOk);

    actions->addHandler(cut.get());
    actions->removeHandler(cut.get());
    EXPECT_NE(invoke("Cut", "Here"), ResultOk);
}

TEST_F(ActionManagerTest, RefusesActionsWithoutAName)
{
    actions->addHandler(cut.get());

    EXPECT_NE(invoke(nullptr, "Here"), ResultOk);
    EXPECT_NE(invoke("Cut", nullptr), ResultOk);
    EXPECT_NE(invoke(nullptr, nullptr), ResultOk);

    EXPECT_EQ(asked, Asked{});
}

TEST_F(ActionManagerTest, RefusesHandlersThatAreNoneOrItHasOrHasntAlready)
{
    EXPECT_NE(actions->addHandler(nullptr), ResultOk);
    EXPECT_NE(actions->removeHandler(cut.get()), ResultOk);
    EXPECT_EQ(actions->addHandler(cut.get()), ResultOk);
    EXPECT_NE(actions->addHandler(cut.get()), ResultOk);
    EXPECT_EQ(cut->refCount(), 1) << "Handlers aren't counted.";
    EXPECT_EQ(actions->removeHandler(cut.get()), ResultOk);
    EXPECT_NE(actions->removeHandler(cut.get()), ResultOk);
}

TEST_F(ActionManagerTest, PassesOverAHandlerThatIsRemovedMeanwhile)
{
    actions->addHandler(cut.get());
    actions->addHandler(mix.get());
    cut->whenAsked = [&] { actions->removeHandler(mix.get()); };

    EXPECT_NE(invoke("Mix", "Louder"), ResultOk);

    EXPECT_EQ(asked, Asked{"Cut was asked for Mix/Louder"});
}

TEST_F(ActionManagerTest, UndoesAndRedoesInTheActiveProject)
{
    insertTrack();

    EXPECT_EQ(undo(), ResultOk);
    EXPECT_EQ(tracks().size(), 0U);
    EXPECT_EQ(redo(), ResultOk);
    EXPECT_EQ(tracks(), std::vector<std::u16string>{u"FX 1"});
}

TEST_F(ActionManagerTest, RefusesToUndoAndToRedoWhatIsntThere)
{
    EXPECT_NE(undo(), ResultOk);
    insertTrack();
    EXPECT_NE(redo(), ResultOk);
    EXPECT_EQ(undo(), ResultOk);
    EXPECT_NE(undo(), ResultOk);
}

TEST_F(ActionManagerTest, RefusesToUndoWithoutAnActiveProject)
{
    insertTrack();
    host.application.activateProject(nullptr);

    EXPECT_NE(undo(), ResultOk);
    EXPECT_NE(redo(), ResultOk);

    EXPECT_EQ(tracks().size(), 1U);
}

TEST_F(ActionManagerTest, UndoesWhileIdleCallsAreBlocked)
{
    insertTrack();
    service<IIdleManager>(host.context())->setIdleBlocked(true);

    EXPECT_EQ(undo(), ResultOk);
    EXPECT_EQ(redo(), ResultOk);
    EXPECT_EQ(undo(), ResultOk);

    EXPECT_EQ(tracks().size(), 0U);
}

TEST_F(ActionManagerTest, RefusesToUndoWhileATransactionIsOpen)
{
    insertTrack();
    insertTrack();
    undo();
    host.transaction()->begin(true);

    EXPECT_NE(undo(), ResultOk);
    EXPECT_NE(redo(), ResultOk);

    host.transaction()->commit(host.document(), u"Nothing");
    EXPECT_EQ(tracks().size(), 1U);
}

TEST_F(ActionManagerTest, LeavesActionsOfTheSameNameInOtherCategoriesToTheHandlers)
{
    insertTrack();
    actions->addHandler(mix.get());

    EXPECT_EQ(invoke("Mix", "Undo"), ResultOk);
    EXPECT_NE(invoke("Cut", "Undo"), ResultOk);

    EXPECT_EQ(asked, (Asked{"Mix was asked for Mix/Undo", "Mix was asked for Cut/Undo"}));
    EXPECT_EQ(tracks().size(), 1U);
}

TEST_F(ActionManagerTest, PassesItsOwnActionsOnToNobodyAndTheRestOfTheirCategoryToAll)
{
    const auto edit = makeCounted<Handler>(asked, "Edit");
    actions->addHandler(edit.get());

    EXPECT_NE(undo(), ResultOk) << "There is nothing to undo.";
    EXPECT_EQ(asked, Asked{});
    EXPECT_EQ(invoke("Edit", "Paste"), ResultOk);
    EXPECT_EQ(asked, Asked{"Edit was asked for Edit/Paste"});
}

} // namespace standin::tests
