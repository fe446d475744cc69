// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/IdleManager.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Writes its letter down at each idle call, and then does what the test wants done.
class Handler : public Implements<Handler, FObject, IIdleHandler> {
public:
    static constexpr const char* ClassName = "Handler";

    Handler(std::string& calls, char letter) : m_calls(calls), m_letter(letter) {}

    int32 onIdle() override
    {
        m_calls += m_letter;
        if (whenCalled)
            whenCalled();
        return ResultFalse;
    }

    std::function<void()> whenCalled;

private:
    std::string& m_calls;
    char m_letter;
};

class IdleManagerTest : public testing::Test {
protected:
    /// The letters of the handlers that were called in one idle call.
    std::string idle()
    {
        calls.clear();
        idleManager->callHandlers();
        return calls;
    }
    void addAll()
    {
        manager->addIdleHandler(a.get());
        manager->addIdleHandler(b.get());
        manager->addIdleHandler(c.get());
    }

    std::string calls;
    Counted<Handler> a = makeCounted<Handler>(calls, 'a');
    Counted<Handler> b = makeCounted<Handler>(calls, 'b');
    Counted<Handler> c = makeCounted<Handler>(calls, 'c');
    Counted<IdleManager> idleManager = makeCounted<IdleManager>();
    Counted<IIdleManager> manager = idleManager;
};

} // namespace

TEST_F(IdleManagerTest, CallsTheHandlersInTheOrderInWhichTheyCame)
{
    EXPECT_EQ(idle(), "");

    addAll();
    EXPECT_EQ(idle(), "abc");

    manager->removeIdleHandler(a.get());
    manager->addIdleHandler(a.get());
    EXPECT_EQ(idle(), "bca");
}

TEST_F(IdleManagerTest, DoesntCountItsHandlers)
{
    addAll();

    EXPECT_EQ(a->refCount(), 1);
}

TEST_F(IdleManagerTest, RefusesNullAndWhatItHasOrHasntAlready)
{
    EXPECT_NE(manager->addIdleHandler(nullptr), ResultOk);
    EXPECT_NE(manager->removeIdleHandler(nullptr), ResultOk);
    EXPECT_NE(manager->removeIdleHandler(a.get()), ResultOk);
    EXPECT_EQ(manager->addIdleHandler(a.get()), ResultOk);
    EXPECT_NE(manager->addIdleHandler(a.get()), ResultOk);

    EXPECT_EQ(idle(), "a") << "Once, although it was added twice.";
    EXPECT_EQ(manager->removeIdleHandler(a.get()), ResultOk);
    EXPECT_EQ(idle(), "");
}

TEST_F(IdleManagerTest, PassesOverAHandlerThatIsRemovedMeanwhile)
{
    addAll();
    a->whenCalled = [&] { manager->removeIdleHandler(b.get()); };

    EXPECT_EQ(idle(), "ac");
}

TEST_F(IdleManagerTest, LetsAHandlerGoForGoodInItsOwnCall)
{
    addAll();
    b->whenCalled = [&] {
        manager->removeIdleHandler(b.get());
        // Its call goes on for as long as something else holds it.
        manager->removeIdleHandler(a.get());
        a.reset();
    };

    EXPECT_EQ(idle(), "abc");
    EXPECT_EQ(idle(), "c");
}

TEST_F(IdleManagerTest, CallsAHandlerThatIsAddedMeanwhileTheNextTime)
{
    manager->addIdleHandler(a.get());
    a->whenCalled = [&] { manager->addIdleHandler(b.get()); };

    EXPECT_EQ(idle(), "a");
    EXPECT_EQ(idle(), "ab");
}

TEST_F(IdleManagerTest, BlocksUntilEachBlockHasEnded)
{
    addAll();

    EXPECT_EQ(manager->setIdleBlocked(true), ResultOk);
    EXPECT_EQ(manager->setIdleBlocked(true), ResultOk);
    EXPECT_EQ(idle(), "");
    EXPECT_EQ(manager->setIdleBlocked(false), ResultOk);
    EXPECT_EQ(idle(), "");
    EXPECT_EQ(manager->setIdleBlocked(false), ResultOk);
    EXPECT_EQ(idle(), "abc");
}

TEST_F(IdleManagerTest, RefusesTheEndOfABlockThatHasntBegun)
{
    addAll();

    EXPECT_NE(manager->setIdleBlocked(false), ResultOk);
    manager->setIdleBlocked(true);

    EXPECT_EQ(idle(), "") << "The refused end took nothing off this block.";
}

TEST_F(IdleManagerTest, StopsWhenAHandlerBlocks)
{
    addAll();
    b->whenCalled = [&] { manager->setIdleBlocked(true); };

    EXPECT_EQ(idle(), "ab");
    EXPECT_EQ(idle(), "");

    b->whenCalled = nullptr;
    manager->setIdleBlocked(false);
    EXPECT_EQ(idle(), "abc");
}

TEST_F(IdleManagerTest, GoesOnAfterAHandlerThatBlockedForItsOwnCallAlone)
{
    addAll();
    b->whenCalled = [&] {
        manager->setIdleBlocked(true);
        idleManager->callHandlers();
        manager->setIdleBlocked(false);
    };

    EXPECT_EQ(idle(), "abc") << "The idle call from within called nobody.";
}

} // namespace standin::tests
