// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/ViewManager.h"

#include "tests/standin/window/FakeWindows.h"
#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <string>
#include <utility>
#include <vector>

using namespace Velmark;
using cadrel::tests::FakeView;
using cadrel::tests::FakeWindows;
using standin::ViewManager;

namespace {

class Builder : public Implements<Builder, FObject, IViewBuilder> {
public:
    static constexpr const char* ClassName = "Builder";

    explicit Builder(std::vector<std::string>& calls) : m_calls(calls) {}

    int32 createView(const char* name, FUnknown*, IPlugView** view) override
    {
        m_calls.push_back(std::string("view for ") + name);
        if (isOutOfViews)
            return ResultFalse;
        last = makeCounted<FakeView>(m_calls).detach();
        *view = last;
        return ResultOk;
    }

    bool isOutOfViews = false;
    FakeView* last = nullptr;

private:
    std::vector<std::string>& m_calls;
};

class ViewManagerTest : public testing::Test {
protected:
    ViewManagerTest()
    {
        cadrel::tests::writeFile(m_folder.path() / "skin.xml", R"(<windows>
            <window name="Main" title="One" resizable="true"/><window name="Other" title="Two"/></windows>)");
    }
    ~ViewManagerTest() override { m_views->setWindowSystem(nullptr); }

    int32 loadSkin(const char* file = "skin.xml") { return m_views->loadSkin(m_bundle.data(), file); }
    int32 open(const char* name)
    {
        const int32 result = m_views->openWindow(name, m_builder.get(), m_window.out());
        return result == ResultOk ? m_window->open() : result;
    }
    bool has(const std::string& call) const
    {
        return std::find(m_windows.calls.begin(), m_windows.calls.end(), call) != m_windows.calls.end();
    }

    cadrel::tests::TempFolder m_folder;
    std::string m_bundle = m_folder.path().string();
    FakeWindows m_windows;
    Counted<Builder> m_builder = makeCounted<Builder>(m_windows.calls);
    Counted<ViewManager> m_views = makeCounted<ViewManager>();
    Counted<IHostWindow> m_window;
};

} // namespace

TEST_F(ViewManagerTest, RefusesEverythingWithoutAWindowSystem)
{
    EXPECT_NE(loadSkin(), ResultOk);
    m_views->setWindowSystem(&m_windows);
    ASSERT_EQ(loadSkin(), ResultOk);
    m_views->setWindowSystem(nullptr);

    EXPECT_NE(open("Main"), ResultOk);
    EXPECT_EQ(m_window, nullptr);
}

TEST_F(ViewManagerTest, OpensTheWindowsThatAreDescribed)
{
    m_views->setWindowSystem(&m_windows);
    EXPECT_NE(open("Main"), ResultOk);
    ASSERT_EQ(loadSkin(), ResultOk);

    EXPECT_EQ(open("Main"), ResultOk);
    EXPECT_TRUE(has("view for Main"));
    EXPECT_TRUE(has("window One 600 x 400"));
    EXPECT_EQ(open("Other"), ResultOk);
    EXPECT_TRUE(has("window Two 600 x 400"));
    ASSERT_EQ(m_views->windows().size(), 2U);
    EXPECT_EQ(m_views->windows()[1]->description().name, "Other");
}

TEST_F(ViewManagerTest, RefusesUnknownNamesAndMissingThings)
{
    m_views->setWindowSystem(&m_windows);
    EXPECT_NE(loadSkin("missing.xml"), ResultOk);
    EXPECT_NE(loadSkin(nullptr), ResultOk);
    EXPECT_NE(m_views->loadSkin(nullptr, "skin.xml"), ResultOk);
    ASSERT_EQ(loadSkin(), ResultOk);

    EXPECT_NE(open("Nothing"), ResultOk);
    EXPECT_NE(open(nullptr), ResultOk);
    EXPECT_NE(m_views->openWindow("Main", nullptr, m_window.out()), ResultOk);
    EXPECT_NE(m_views->openWindow("Main", m_builder.get(), nullptr), ResultOk);
    m_builder->isOutOfViews = true;
    EXPECT_NE(open("Main"), ResultOk);
    EXPECT_EQ(m_window, nullptr);
    EXPECT_TRUE(m_views->windows().empty());
}

TEST_F(ViewManagerTest, KeepsAWindowWhileItIsOpen)
{
    m_views->setWindowSystem(&m_windows);
    loadSkin();
    open("Main");
    m_window.reset();

    EXPECT_FALSE(has("view gone"));
    m_views->idle();
    EXPECT_TRUE(has("idle"));
    m_windows.last->listener.closedByUser();
    EXPECT_TRUE(has("view gone"));
    EXPECT_TRUE(m_views->windows().empty());
}

TEST_F(ViewManagerTest, KeepsAWindowUntilTheCallIsOverInWhichItsViewClosesIt)
{
    m_views->setWindowSystem(&m_windows);
    loadSkin();
    const std::vector<std::pair<const char*, std::function<void()>>> events = {
        {"onFocus", [this] { m_windows.last->listener.focusChanged(true); }},
        {"onSize", [this] { m_windows.last->listener.resizedByUser(800, 300); }},
        {"checkSizeConstraint", [this] { m_windows.last->listener.resizedByUser(499, 300); }},
        {"idle", [this] { m_views->idle(); }},
        {"removed", [this] { m_windows.last->listener.closedByUser(); }},
    };
    for (const auto& [call, happen] : events) {
        ASSERT_EQ(open("Main"), ResultOk) << call;
        m_window.reset();
        m_builder->last->actsIn = call;
        m_builder->last->action = [this] { m_views->closeAll(); };
        happen();
        EXPECT_TRUE(m_views->windows().empty()) << call;
        EXPECT_EQ(std::count(m_windows.calls.begin(), m_windows.calls.end(), "view gone"), 1) << call;
        m_windows.calls.clear();
    }
}

TEST_F(ViewManagerTest, ClosesAllWindowsBeforeTheirSystemGoes)
{
    m_views->setWindowSystem(&m_windows);
    loadSkin();
    open("Main");
    open("Other");

    m_views->setWindowSystem(nullptr);
    EXPECT_TRUE(m_views->windows().empty());
    EXPECT_EQ(std::count(m_windows.calls.begin(), m_windows.calls.end(), "window closed"), 2);
}
