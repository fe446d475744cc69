// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/services/ProgressHandler.h"

#include "standin/Application.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AlteredContext.h"
#include "util/HostString.h"
#include "velmark/StringObject.h"

#include <gtest/gtest.h>

#include <csignal>
#include <optional>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

using Calls = std::vector<std::string>;

/// A progress window that writes down what it is told, and answers what the test wants.
class RecordingWindow : public Implements<RecordingWindow, FObject, IProgressService> {
public:
    static constexpr const char* ClassName = "RecordingWindow";

    Calls calls;
    bool* cancelled = nullptr;
    /// Of `begin`, and of everything else.
    int32 answerToBegin = ResultOk;
    int32 answer = ResultOk;

    int32 begin(int32 mode, const char16_t* title, bool* cancelFlag) override
    {
        calls.push_back("begin " + std::to_string(mode) + " " + textOf(title) + (cancelFlag ? " cancellable" : ""));
        cancelled = cancelFlag;
        return answerToBegin;
    }
    int32 setStatus(const char16_t* text) override { return note("setStatus " + textOf(text)); }
    int32 setRange(uint64 total) override { return note("setRange " + std::to_string(total)); }
    int32 setPosition(uint64 value) override { return note("setPosition " + std::to_string(value)); }
    int32 setText(const char16_t* text) override { return note("setText " + textOf(text)); }
    int32 tick(uint64 steps) override { return note("tick " + std::to_string(steps)); }
    int32 show() override { return note("show"); }
    int32 end() override { return note("end"); }

    Calls takeCalls() { return std::exchange(calls, {}); }

private:
    static std::string textOf(const char16_t* text) { return text ? ConstString(text).text8() : "none"; }

    int32 note(std::string call)
    {
        calls.push_back(std::move(call));
        return answer;
    }
};

class ProgressHandlerTest : public testing::Test {
protected:
    ProgressHandlerTest() { context.replace(IProgressService::iid, window); }

    /// A window on which nothing but its beginning has happened.
    void start(bool canCancel = true)
    {
        progress->start(L"Processing Project", 270, canCancel);
        window->takeCalls();
    }

    standin::Application application;
    AlteredContext context{application.context()};
    Counted<RecordingWindow> window = makeCounted<RecordingWindow>();
    std::optional<ProgressHandler> progress{&context};
};

} // namespace

TEST_F(ProgressHandlerTest, OpensTheHostsWindow)
{
    progress->start(L"Processing Project", 270, true);

    const Calls expected{"begin 1 Cadrel cancellable", "setStatus none", "setRange 270", "setText Processing Project",
                         "show"};
    EXPECT_EQ(window->calls, expected);
    EXPECT_EQ(progress->steps(), 270U);
    EXPECT_FALSE(progress->isCancelled());
}

TEST_F(ProgressHandlerTest, HasNoCancelButtonWhereNoneIsWanted)
{
    progress->start(L"Project Preview", 4, false);

    EXPECT_EQ(window->calls.front(), "begin 1 Cadrel");
    EXPECT_EQ(window->cancelled, nullptr);
}

TEST_F(ProgressHandlerTest, TellsThatTheUserCancelled)
{
    start();

    *window->cancelled = true;

    EXPECT_TRUE(progress->isCancelled());
    progress->finish();
    EXPECT_TRUE(progress->isCancelled()) << "Who asks behind the end is told too.";
}

TEST_F(ProgressHandlerTest, PassesStepsAndPositionsOn)
{
    start();

    progress->tick(3);
    progress->setPosition(18446744073709551615U);

    EXPECT_EQ(window->calls, (Calls{"tick 3", "setPosition 18446744073709551615"}));
}

TEST_F(ProgressHandlerTest, ShowsTheTitleAndWhatIsBeingDone)
{
    progress->start(L"Project Preview", 4, false);
    window->takeCalls();

    progress->setText(L"Generate Markers");
    progress->setText(L"Completing");

    EXPECT_EQ(window->calls,
              (Calls{"setText Project Preview - Generate Markers", "setText Project Preview - Completing"}));
}

TEST_F(ProgressHandlerTest, CountsTheStepsOfAllStages)
{
    start();

    progress->beginStage(30);
    progress->beginStage(5);

    EXPECT_EQ(window->calls, (Calls{"setRange 30", "setRange 5"})) << "Each stage has a range of its own.";
    EXPECT_EQ(progress->steps(), 305U);
}

TEST_F(ProgressHandlerTest, ClosesTheWindow)
{
    start();

    progress->finish();

    EXPECT_EQ(window->calls, Calls{"end"});
    EXPECT_EQ(window->refCount(), 2) << "The context's and the test's are left.";
}

TEST_F(ProgressHandlerTest, StartsAfreshBehindTheEnd)
{
    start();
    *window->cancelled = true;
    progress->beginStage(30);
    progress->finish();
    window->takeCalls();

    progress->start(L"Project Preview", 4, true);

    const Calls expected{"begin 1 Cadrel cancellable", "setStatus none", "setRange 4", "setText Project Preview",
                         "show"};
    EXPECT_EQ(window->calls, expected);
    EXPECT_FALSE(progress->isCancelled());
    EXPECT_EQ(progress->steps(), 4U);
    progress->setText(L"Completing");
    EXPECT_EQ(window->calls.back(), "setText Project Preview - Completing");
}

TEST_F(ProgressHandlerTest, StartsOnceAtATime)
{
    start();
    *window->cancelled = true;

    EXPECT_EQ(thrownBy([&] { progress->start(L"Project Preview", 4, false); }), Result::NotAvailable);

    EXPECT_EQ(window->calls, Calls{});
    EXPECT_TRUE(progress->isCancelled());
    progress->setText(L"Completing");
    EXPECT_EQ(window->calls, Calls{"setText Processing Project - Completing"}) << "The first one goes on.";
}

TEST_F(ProgressHandlerTest, IsNotAvailableWhileThereIsNoWindow)
{
    const auto refusesAll = [&] {
        const auto refuses = [](auto action) { return thrownBy(action) == Result::NotAvailable; };
        return refuses([&] { progress->finish(); }) && refuses([&] { progress->tick(1); }) &&
               refuses([&] { progress->setPosition(1); }) && refuses([&] { progress->setText(L""); }) &&
               refuses([&] { progress->beginStage(1); });
    };

    EXPECT_TRUE(refusesAll());
    EXPECT_FALSE(progress->isCancelled());
    EXPECT_EQ(progress->steps(), 0U);
    start();
    progress->finish();
    window->takeCalls();
    EXPECT_TRUE(refusesAll());
    EXPECT_EQ(window->calls, Calls{});
    EXPECT_EQ(progress->steps(), 270U) << "A stage that isn't announced isn't counted.";
}

TEST_F(ProgressHandlerTest, NeedsTheHostsService)
{
    AlteredContext lacking(application.context());
    lacking.hide(IProgressService::iid);
    ProgressHandler unseen(&lacking);

    EXPECT_EQ(thrownBy([&] { unseen.start(L"Processing Project", 1, true); }), Result::HostObjectMissing);
}

TEST_F(ProgressHandlerTest, HasNoWindowWhenTheHostRefusesOne)
{
    window->answerToBegin = ResultFalse;

    EXPECT_EQ(thrownBy([&] { progress->start(L"Processing Project", 1, true); }), Result::HostCallFailed);

    EXPECT_EQ(window->calls, Calls{"begin 1 Cadrel cancellable"});
    EXPECT_EQ(thrownBy([&] { progress->tick(1); }), Result::NotAvailable);
    window->answerToBegin = ResultOk;
    EXPECT_NO_THROW(progress->start(L"Processing Project", 1, true));
}

TEST_F(ProgressHandlerTest, DoesntBreakOffForWhatTheHostDoesntDisplay)
{
    window->answer = ResultFalse;

    EXPECT_NO_THROW(progress->start(L"Processing Project", 1, true));
    EXPECT_NO_THROW(progress->setText(L"Completing"));
    EXPECT_NO_THROW(progress->tick(1));
    EXPECT_NO_THROW(progress->setPosition(1));
    EXPECT_NO_THROW(progress->beginStage(1));
    EXPECT_NO_THROW(progress->finish());

    EXPECT_EQ(thrownBy([&] { progress->finish(); }), Result::NotAvailable) << "It is closed all the same.";
}

TEST_F(ProgressHandlerTest, ClosesTheWindowWhenItGoesItself)
{
    start();
    progress.reset();
    EXPECT_EQ(window->takeCalls(), Calls{"end"});

    progress.emplace(&context);
    start();
    progress->finish();
    window->takeCalls();
    progress.reset();
    EXPECT_EQ(window->calls, Calls{}) << "It was closed already.";
}

TEST(ProgressHandlerOnAHost, ShowsItsLineAndTakesTheUsersCancelOver)
{
    std::ostringstream screen;
    volatile std::sig_atomic_t interrupted = 0;
    standin::Application application{standin::Terminal(screen, true, &interrupted)};
    ProgressHandler progress(application.context());

    progress.start(L"Project Preview", 8, true);
    progress.tick(2);
    progress.setText(L"Virgin Territories");

    const std::string line = "Cadrel:  25% (2 of 8) Project Preview - Virgin Territories";
    EXPECT_EQ(screen.str().substr(screen.str().size() - line.size()), line);
    EXPECT_FALSE(progress.isCancelled());
    interrupted = SIGINT;
    progress.tick(1);
    EXPECT_TRUE(progress.isCancelled());
    progress.finish();

    interrupted = 0;
    progress.start(L"Project Preview", 8, true);
    EXPECT_FALSE(progress.isCancelled());
}

} // namespace cadrel::host::tests
