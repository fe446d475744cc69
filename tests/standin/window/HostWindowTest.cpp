// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/HostWindow.h"

#include "tests/standin/window/FakeWindows.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <utility>

using namespace Velmark;
using cadrel::tests::FakeView;
using cadrel::tests::FakeWindows;
using standin::HostWindow;
using Calls = std::vector<std::string>;

namespace {

class Closing : public Implements<Closing, FObject, ICloseWindowNotification> {
public:
    static constexpr const char* ClassName = "Closing";

    explicit Closing(Calls& calls) : m_calls(calls) {}

    int32 windowClosed(IHostWindow*) override
    {
        m_calls.push_back("told");
        return ResultOk;
    }

private:
    Calls& m_calls;
};

class HostWindowTest : public testing::Test {
protected:
    // An open window and its view hold one another.
    ~HostWindowTest() override
    {
        if (m_window)
            m_window->show(false);
    }

    void make(bool isResizable = true)
    {
        auto view = makeCounted<FakeView>(m_windows.calls);
        m_view = view.get();
        const auto changed = [this](HostWindow&, bool isOpen) {
            m_windows.calls.push_back(isOpen ? "open" : "closed");
        };
        m_window = makeCounted<HostWindow>(m_windows, standin::WindowDescription{"Name", "Title", isResizable},
                                           std::move(view), changed);
    }
    Calls taken() { return std::exchange(m_windows.calls, {}); }

    FakeWindows m_windows;
    FakeView* m_view = nullptr;
    Counted<HostWindow> m_window;
};

} // namespace

TEST_F(HostWindowTest, ShowsTheViewAtTheSizeThatItHas)
{
    make();
    EXPECT_EQ(m_window->open(), ResultOk);

    EXPECT_EQ(taken(), (Calls{"window Title 600 x 400", "frame", "attached to Fake", "shown", "open"}));
    EXPECT_NE(m_window->open(), ResultOk);
    EXPECT_EQ(m_window->show(true), ResultOk);
    EXPECT_EQ(taken(), Calls{"shown"});
    m_window->idle();
    EXPECT_EQ(taken(), Calls{"idle"});
}

TEST_F(HostWindowTest, EndsTheViewBeforeItsOwnWindowAndTellsThen)
{
    make();
    const auto closing = makeCounted<Closing>(m_windows.calls);
    m_window->setCloseNotification(closing.get());
    m_window->open();
    taken();

    EXPECT_EQ(m_window->show(false), ResultOk);
    EXPECT_EQ(taken(), (Calls{"removed", "no frame", "view gone", "window closed", "told", "closed"}));
    EXPECT_NE(m_window->show(false), ResultOk);
    EXPECT_NE(m_window->open(), ResultOk);
    m_window->idle();
    EXPECT_EQ(taken(), Calls());
}

TEST_F(HostWindowTest, TellsNobodyWhoHasTakenTheNotificationBack)
{
    make();
    const auto closing = makeCounted<Closing>(m_windows.calls);
    m_window->setCloseNotification(closing.get());
    m_window->setCloseNotification(nullptr);
    m_window->open();
    m_windows.last->listener.closedByUser();

    EXPECT_EQ(std::count(m_windows.calls.begin(), m_windows.calls.end(), "told"), 0);
    EXPECT_EQ(m_windows.calls.back(), "closed");
}

TEST_F(HostWindowTest, DoesNotOpenWithAViewThatRefusesItsParent)
{
    make();
    m_view->refusesParent = true;
    EXPECT_NE(m_window->open(), ResultOk);

    EXPECT_EQ(taken(), (Calls{"window Title 600 x 400", "frame", "attached to Fake", "no frame", "window closed"}));
    EXPECT_NE(m_window->show(true), ResultOk);
    m_view->refusesParent = false;
    EXPECT_EQ(m_window->open(), ResultOk);
}

TEST_F(HostWindowTest, DoesNotOpenWithoutAWindow)
{
    make();
    m_windows.isOutOfWindows = true;

    EXPECT_NE(m_window->open(), ResultOk);
    EXPECT_EQ(taken(), Calls());
}

TEST_F(HostWindowTest, GrantsASizeThatItsViewAsksFor)
{
    make();
    EXPECT_NE(m_window->resizeView(m_view, {0, 0, 700, 500}), ResultOk);
    m_window->open();
    taken();

    EXPECT_EQ(m_view->frame->resizeView(m_view, {10, 10, 710, 510}), ResultOk);
    EXPECT_EQ(taken(), (Calls{"size 700 x 500", "on size 700 x 500"}));
    EXPECT_NE(m_view->frame->resizeView(nullptr, {0, 0, 700, 500}), ResultOk);
    EXPECT_NE(m_view->frame->resizeView(m_view, {0, 0, 0, 500}), ResultOk);
    EXPECT_NE(m_view->frame->resizeView(m_view, {0, 0, 500, -1}), ResultOk);
    EXPECT_EQ(taken(), Calls());
}

TEST_F(HostWindowTest, RefusesASizeWhereTheDescriptionAllowsNone)
{
    make(false);
    m_window->open();
    taken();

    EXPECT_NE(m_window->resizeView(m_view, {0, 0, 700, 500}), ResultOk);
    EXPECT_EQ(taken(), Calls());
}

TEST_F(HostWindowTest, RefusesASizeWhereTheRoomIsTheHostsAlone)
{
    m_windows.isRoomFixed = true;
    make();
    m_window->open();
    taken();

    EXPECT_NE(m_window->resizeView(m_view, {0, 0, 700, 500}), ResultOk);
    EXPECT_EQ(taken(), Calls());
}

TEST_F(HostWindowTest, GivesTheViewTheRoomThatThereIsThoughItIsLessThanItsLeastSize)
{
    make();
    m_window->open();
    taken();

    m_windows.last->listener.givenRoom(499, 100);
    EXPECT_EQ(taken(), Calls{"on size 499 x 100"});
}

TEST_F(HostWindowTest, HoldsTheUserToSizesThatTheViewCanHave)
{
    make();
    m_window->open();
    taken();

    m_windows.last->listener.resizedByUser(800, 300);
    EXPECT_EQ(taken(), Calls{"on size 800 x 300"});
    m_windows.last->listener.resizedByUser(499, 300);
    EXPECT_EQ(taken(), (Calls{"size 500 x 300", "on size 500 x 300"}));
    m_windows.last->listener.resizedByUser(500, 300);
    EXPECT_EQ(taken(), Calls{"on size 500 x 300"});
}

TEST_F(HostWindowTest, KeepsAViewUntilItsCallIsOverThatClosesTheWindow)
{
    const Calls closing = {"removed", "no frame", "window closed", "closed", "done", "view gone"};
    const auto callsOf = [&](const char* call, const std::function<void(standin::NativeWindow::Listener&)>& event) {
        make();
        m_window->open();
        taken();
        m_view->actsIn = call;
        m_view->action = [this] { m_window->show(false); };
        event(m_windows.last->listener);
        return taken();
    };
    const auto after = [&](const char* first) {
        Calls calls = {first};
        calls.insert(calls.end(), closing.begin(), closing.end());
        return calls;
    };
    EXPECT_EQ(callsOf("onFocus", [](auto& listener) { listener.focusChanged(true); }), after("focus"));
    EXPECT_EQ(callsOf("onSize", [](auto& listener) { listener.resizedByUser(800, 300); }), after("on size 800 x 300"));
    EXPECT_EQ(callsOf("checkSizeConstraint", [](auto& listener) { listener.resizedByUser(499, 300); }), closing);
    EXPECT_EQ(callsOf("idle", [this](auto&) { m_window->idle(); }), after("idle"));
}

TEST_F(HostWindowTest, ClosesOnceWhereTheViewClosesItAgain)
{
    make();
    m_window->open();
    taken();
    m_view->actsIn = "removed";
    m_view->action = [this] { EXPECT_NE(m_window->show(false), ResultOk); };

    EXPECT_EQ(m_window->show(false), ResultOk);
    EXPECT_EQ(taken(), (Calls{"removed", "done", "no frame", "view gone", "window closed", "closed"}));
}

TEST_F(HostWindowTest, DoesNotOpenWhereTheViewClosesItMeanwhile)
{
    const Calls closing = {"removed", "no frame", "window closed", "closed", "done", "view gone"};
    const auto callsOf = [&](const char* call) {
        make();
        m_view->actsIn = call;
        m_view->action = [this] { m_window->show(false); };
        EXPECT_NE(m_window->open(), ResultOk);
        EXPECT_EQ(m_window->native(), nullptr);
        EXPECT_NE(m_window->show(true), ResultOk);
        return taken();
    };
    const auto after = [&](Calls calls) {
        calls.insert(calls.end(), closing.begin(), closing.end());
        return calls;
    };
    EXPECT_EQ(callsOf("setFrame"), after({"window Title 600 x 400", "frame"}));
    EXPECT_EQ(callsOf("attached"), after({"window Title 600 x 400", "frame", "attached to Fake"}));
}

TEST_F(HostWindowTest, TellsTheViewOfTheKeyboard)
{
    make();
    m_window->open();
    taken();

    m_windows.last->listener.focusChanged(true);
    m_windows.last->listener.focusChanged(false);
    EXPECT_EQ(taken(), (Calls{"focus", "no focus"}));
}
