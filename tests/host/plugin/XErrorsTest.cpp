// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/plugin/XErrors.h"

#include "host/plugin/XConnection.h"

#include "tests/support/x11/VirtualScreen.h"

#include <gtest/gtest.h>

#include <X11/Xlib.h>

#include <optional>

using cadrel::host::XConnection;
using cadrel::host::XErrors;

namespace {

int errors = 0;

int countError(Display*, XErrorEvent*)
{
    ++errors;
    return 0;
}

/// The server knows no such window.
void causeError(Display* display)
{
    XDestroyWindow(display, 1);
    XSync(display, False);
}

/// In a host whose own handler counts the errors.
class XErrorsTest : public testing::Test {
protected:
    XErrorsTest() : m_before(XSetErrorHandler(countError)), m_ofTheHost(XOpenDisplay(nullptr)) { errors = 0; }
    ~XErrorsTest() override
    {
        XCloseDisplay(m_ofTheHost);
        XSetErrorHandler(m_before);
    }

    cadrel::tests::VirtualScreen m_screen;
    XErrorHandler m_before;
    Display* m_ofTheHost;
};

} // namespace

TEST_F(XErrorsTest, PassesOverThoseOfOurConnectionsAlone)
{
    const XErrors passedOver;
    const XConnection ours;
    causeError(ours.display());
    EXPECT_EQ(errors, 0);

    causeError(m_ofTheHost);
    EXPECT_EQ(errors, 1);
}

TEST_F(XErrorsTest, GivesTheHandlerBackThatWasThereBefore)
{
    std::optional<XErrors> passedOver(std::in_place);
    passedOver.reset();

    EXPECT_EQ(XSetErrorHandler(countError), countError);
    const XConnection ours;
    causeError(ours.display());
    EXPECT_EQ(errors, 1);
}

TEST_F(XErrorsTest, LeavesAHandlerInPlaceThatWasInstalledLater)
{
    const auto later = [](Display*, XErrorEvent*) { return 0; };
    std::optional<XErrors> passedOver(std::in_place);
    const XErrorHandler ours = XSetErrorHandler(later);
    passedOver.reset();
    EXPECT_EQ(XSetErrorHandler(ours), static_cast<XErrorHandler>(later));

    // Ours is in place again, and is taken out by the next.
    passedOver.emplace();
    passedOver.reset();
    EXPECT_EQ(XSetErrorHandler(countError), countError);
}

TEST_F(XErrorsTest, IsInstalledAgainWhereOursWasTakenOutMeanwhile)
{
    std::optional<XErrors> passedOver(std::in_place);
    XSetErrorHandler(countError);
    passedOver.reset();
    passedOver.emplace();
    const XConnection ours;
    causeError(ours.display());
    EXPECT_EQ(errors, 0);
    causeError(m_ofTheHost);
    EXPECT_EQ(errors, 1);
    passedOver.reset();
}

namespace {

XErrorHandler handlerBelow = nullptr;
int chained = 0;

/// Of somebody who hands on what isn't his own.
int handOn(Display* display, XErrorEvent* error)
{
    ++chained;
    return handlerBelow(display, error);
}

} // namespace

TEST_F(XErrorsTest, HandsAnErrorOnOnceThroughAHandlerThatKnowsOurs)
{
    std::optional<XErrors> passedOver(std::in_place);
    handlerBelow = XSetErrorHandler(handOn);
    chained = 0;
    passedOver.reset();
    causeError(m_ofTheHost);
    EXPECT_EQ(chained, 1);
    EXPECT_EQ(errors, 1);

    passedOver.emplace();
    causeError(m_ofTheHost);
    EXPECT_EQ(chained, 2);
    EXPECT_EQ(errors, 2);
    const XConnection ours;
    causeError(ours.display());
    EXPECT_EQ(chained, 2);
    passedOver.reset();
    causeError(m_ofTheHost);
    EXPECT_EQ(chained, 3);
    EXPECT_EQ(errors, 3);
}
