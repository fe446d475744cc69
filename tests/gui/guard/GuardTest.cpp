// SPDX-License-Identifier: GPL-3.0-or-later

#include "gui/guard/Guard.h"

#include "tests/support/window/RecordingAlerts.h"
#include "util/Result.h"

#include <gtest/gtest.h>

#include <new>
#include <stdexcept>
#include <string>
#include <vector>

using cadrel::gui::Guard;
using cadrel::gui::guardSystem;
using cadrel::gui::guardUser;
using cadrel::tests::RecordingAlerts;
using cadrel::util::Result;

namespace {

const std::wstring NotCarriedOut = L"This could not be carried out.";

void fail(Result::Type result)
{
    throw result;
}

} // namespace

TEST(Guard, RunsTheFunctionOnce)
{
    const RecordingAlerts alerts;
    int calls = 0;

    EXPECT_TRUE(guardUser([&] { ++calls; }));
    EXPECT_TRUE(guardSystem([&] { ++calls; }));

    EXPECT_EQ(calls, 2);
    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, TellsWhatTheUserDidAndWhatFailedByOneAlert)
{
    const RecordingAlerts alerts;

    EXPECT_FALSE(guardUser([] { fail(Result::PositionOccupied); }));

    EXPECT_EQ(alerts.messages, std::vector<std::wstring>{L"Another video starts at this timecode."});
}

TEST(Guard, TellsOfEveryKindOfException)
{
    const RecordingAlerts alerts;

    EXPECT_FALSE(guardUser([] { throw std::runtime_error("any"); }));
    EXPECT_FALSE(guardUser([] { throw 7; }));
    EXPECT_FALSE(guardUser([] { throw std::bad_alloc(); }));

    EXPECT_EQ(alerts.messages,
              (std::vector<std::wstring>{NotCarriedOut, NotCarriedOut, L"There is not enough memory for this."}));
}

TEST(Guard, TellsNothingWhenTheUserCancelledOrThereIsNoProject)
{
    const RecordingAlerts alerts;

    EXPECT_FALSE(guardUser([] { fail(Result::Cancelled); }));
    EXPECT_FALSE(guardUser([] { fail(Result::NoProject); }));

    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, HasAMessageForEachOtherResult)
{
    for (int result = Result::Refused; result <= Result::PositionOccupied; ++result) {
        const RecordingAlerts alerts;
        guardUser([&] { fail(static_cast<Result::Type>(result)); });

        const bool isSilent = result == Result::Cancelled || result == Result::NoProject;
        EXPECT_EQ(alerts.messages.size(), isSilent ? 0U : 1U) << result;
    }
}

TEST(Guard, DropsWhatFailsWithoutTheUser)
{
    const RecordingAlerts alerts;

    EXPECT_FALSE(guardSystem([] { fail(Result::OutOfRange); }));
    EXPECT_FALSE(guardSystem([] { throw std::runtime_error("any"); }));
    EXPECT_FALSE(guardSystem([] { throw 7; }));

    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, ShowsOneAlertForAllThatFailsInWhatTheUserDid)
{
    const RecordingAlerts alerts;

    guardUser([] {
        guardUser([] { fail(Result::PositionOccupied); });
        guardUser([] { fail(Result::FileAccessFailed); });
        fail(Result::OutOfRange);
    });

    EXPECT_EQ(alerts.messages, std::vector<std::wstring>{L"Another video starts at this timecode."});
}

TEST(Guard, ShowsTheAlertAfterTheOutermostFrameHasEnded)
{
    const RecordingAlerts alerts;

    guardUser([&] {
        guardUser([] { fail(Result::PositionOccupied); });
        EXPECT_TRUE(alerts.messages.empty());
    });

    EXPECT_EQ(alerts.messages.size(), 1U);
}

TEST(Guard, DropsWhatFailsInAChangeThatTheUserMade)
{
    const RecordingAlerts alerts;

    EXPECT_TRUE(guardUser([] { guardSystem([] { fail(Result::OutOfRange); }); }));

    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, DropsWhatFailsInAButtonThatAChangeSwitched)
{
    const RecordingAlerts alerts;

    guardSystem([] { guardUser([] { fail(Result::OutOfRange); }); });

    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, ShowsWhatFailsWhileAnAlertIsOpenByAnAlertOfItsOwn)
{
    RecordingAlerts alerts;
    alerts.meanwhile = [] { guardUser([] { fail(Result::FileAccessFailed); }); };

    guardUser([] { fail(Result::PositionOccupied); });

    EXPECT_EQ(alerts.messages.size(), 2U);
}

TEST(Guard, TellsWhatIsToBeToldAfterTheOutermostFrame)
{
    const RecordingAlerts alerts;

    guardUser([&] {
        guardUser([] { Guard::tell(L"first"); });
        EXPECT_TRUE(alerts.messages.empty());
        Guard::tell(L"second");
    });

    EXPECT_EQ(alerts.messages, std::vector<std::wstring>{L"first"});
}

TEST(Guard, TellsNothingOutsideOfWhatTheUserDoes)
{
    const RecordingAlerts alerts;

    Guard::tell(L"nobody's");
    guardSystem([] { Guard::tell(L"the system's"); });
    guardUser([] { Guard::tell(L""); });
    guardUser([] {});

    EXPECT_TRUE(alerts.messages.empty());
}

TEST(Guard, TellsTheFirstOfAFailureAndAMessage)
{
    const RecordingAlerts alerts;

    guardUser([] {
        guardUser([] { fail(Result::PositionOccupied); });
        Guard::tell(L"later");
    });

    EXPECT_EQ(alerts.messages, std::vector<std::wstring>{L"Another video starts at this timecode."});
}

TEST(Guard, SurvivesAnAlertThatFails)
{
    RecordingAlerts alerts;
    alerts.meanwhile = [] { throw std::runtime_error("no host"); };

    EXPECT_FALSE(guardUser([] { fail(Result::PositionOccupied); }));
    EXPECT_FALSE(guardUser([] { fail(Result::PositionOccupied); }));

    EXPECT_EQ(alerts.messages.size(), 2U);
}

TEST(Guard, TellsNobodyWhereThereAreNoAlerts)
{
    EXPECT_FALSE(guardUser([] { fail(Result::PositionOccupied); }));
    const RecordingAlerts alerts;

    EXPECT_TRUE(guardUser([] {}));

    EXPECT_TRUE(alerts.messages.empty());
}
