// SPDX-License-Identifier: GPL-3.0-or-later

#include "velmark/CPluginView.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace Velmark;

namespace {

class Frame : public Implements<Frame, FObject, IPlugFrame> {
public:
    static constexpr const char* ClassName = "Frame";

    int32 resizeView(IPlugView*, const ViewRect&) override { return ResultOk; }
};

class View : public Implements<View, CPluginView> {
public:
    static constexpr const char* ClassName = "View";

    using Implements::Implements;

    void attachedToParent() override { calls.push_back(systemWindow() ? "attached" : "attached to nothing"); }
    void removedFromParent() override { calls.push_back(systemWindow() ? "removed too early" : "removed"); }

    using CPluginView::plugFrame;
    using CPluginView::systemWindow;

    std::vector<std::string> calls;
};

constexpr ViewRect Rect{10, 20, 310, 220};

std::vector<int32> sides(const ViewRect& rect)
{
    return {rect.left, rect.top, rect.right, rect.bottom};
}

} // namespace

TEST(CPluginView, IsAViewAndAnObjectOfOurs)
{
    const auto view = makeCounted<CPluginView>(Rect);

    EXPECT_TRUE(query<IPlugView>(view));
    EXPECT_TRUE(query<FObject>(view));
    EXPECT_TRUE(view->isA("CPluginView", false));
    EXPECT_FALSE(view->isA("FObject", false));
    EXPECT_TRUE(view->isA("FObject", true));
}

TEST(CPluginView, RemembersItsRectangle)
{
    const auto view = makeCounted<CPluginView>(Rect);
    ViewRect told;
    EXPECT_EQ(view->getSize(told), 0);
    EXPECT_EQ(sides(told), sides(Rect));

    EXPECT_EQ(view->onSize({0, 0, 0, 750}), 0);
    view->getSize(told);
    EXPECT_EQ(sides(told), (std::vector<int32>{0, 0, 0, 750}));
}

TEST(CPluginView, TellsItselfOfItsParentAfterItIsSetOrCleared)
{
    const auto view = makeCounted<View>(Rect);
    int parent = 0;

    EXPECT_EQ(view->attached(&parent, "any"), 0);
    EXPECT_EQ(view->systemWindow(), &parent);
    EXPECT_EQ(view->removed(), 0);
    EXPECT_EQ(view->systemWindow(), nullptr);

    EXPECT_EQ(view->calls, (std::vector<std::string>{"attached", "removed"}));
}

TEST(CPluginView, KeepsAReferenceToItsFrame)
{
    const auto frame = makeCounted<Frame>();
    {
        const auto view = makeCounted<View>(Rect);
        EXPECT_EQ(view->plugFrame(), nullptr);
        EXPECT_EQ(view->setFrame(frame.get()), 0);
        EXPECT_EQ(view->plugFrame(), frame.get());
        EXPECT_EQ(frame->refCount(), 2);
        view->setFrame(nullptr);
        EXPECT_EQ(frame->refCount(), 1);
        view->setFrame(frame.get());
    }
    EXPECT_EQ(frame->refCount(), 1);
}

TEST(CPluginView, DoesNothingElse)
{
    const auto view = makeCounted<CPluginView>(Rect);
    ViewRect rect = Rect;

    EXPECT_EQ(view->idle(), 0);
    EXPECT_EQ(view->onWheel(1), 0);
    EXPECT_EQ(view->onKeyDown(u'a', 0, 0), 0);
    EXPECT_EQ(view->onKeyUp(u'a', 0, 0), 0);
    EXPECT_EQ(view->onFocus(true), 0);
    EXPECT_EQ(view->canResize(), 1);
    EXPECT_EQ(view->checkSizeConstraint(rect), 0);
    EXPECT_EQ(sides(rect), sides(Rect));
    EXPECT_EQ(view->isPlatformTypeSupported("any"), 0);
}
