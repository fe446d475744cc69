// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/ProgressService.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <limits>
#include <sstream>
#include <string>

using namespace Velmark;

namespace standin::tests {

namespace {

constexpr uint64 Endless = std::numeric_limits<uint64>::max();

class ProgressServiceTest : public testing::Test {
protected:
    /// A visible operation, whose line has been drawn already.
    void start(uint64 total)
    {
        progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
        progress->setText(u"Work");
        progress->setRange(total);
        progress->show();
        drawn();
    }

    /// What was written since the last call, with a "|" for each time the line was erased.
    std::string drawn()
    {
        std::string text = out.str();
        out.str("");
        const std::string erase = "\r\033[K";
        for (std::size_t at = text.find(erase); at != std::string::npos; at = text.find(erase))
            text.replace(at, erase.size(), 1, '|');
        return text;
    }

    std::ostringstream out;
    volatile std::sig_atomic_t interrupted = 0;
    Terminal terminal{out, true, &interrupted};
    Counted<IProgressService> progress = makeCounted<ProgressService>(terminal);
    bool cancelled = false;
};

} // namespace

TEST_F(ProgressServiceTest, ShowsTitleStepsAndTextOnOneLine)
{
    progress->begin(IProgressService::Modal, u"Cadrel", nullptr);
    progress->setRange(270);
    progress->setText(u"Processing Project - Generate Markers");
    progress->setPosition(123);
    EXPECT_EQ(drawn(), "") << "Nothing is seen before it is shown.";

    progress->show();

    EXPECT_EQ(drawn(), "|Cadrel:  45% (123 of 270) Processing Project - Generate Markers");
}

TEST_F(ProgressServiceTest, ShowsNoStepsBeforeAStageHasBegun)
{
    progress->begin(IProgressService::Modal, u"Cadrel", nullptr);
    progress->setText(u"Completing");
    progress->show();

    EXPECT_EQ(drawn(), "|Cadrel: Completing");
    EXPECT_EQ(progress->tick(3), ResultOk);
    EXPECT_EQ(drawn(), "");
}

TEST_F(ProgressServiceTest, ShowsTheStatusBehindTheText)
{
    start(4);

    progress->setStatus(u"reel 3");
    EXPECT_EQ(drawn(), "|Cadrel:   0% (0 of 4) Work (reel 3)");
    progress->setStatus(nullptr);
    EXPECT_EQ(drawn(), "|Cadrel:   0% (0 of 4) Work");
}

TEST_F(ProgressServiceTest, TakesTextsThatAreMissingAsEmpty)
{
    progress->begin(IProgressService::Modal, nullptr, nullptr);
    progress->setText(nullptr);
    progress->setRange(2);
    progress->show();

    EXPECT_EQ(drawn(), "|  0% (0 of 2) ");
}

TEST_F(ProgressServiceTest, MovesOnByTicksAndToPositions)
{
    start(8);

    progress->tick(3);
    EXPECT_EQ(drawn(), "|Cadrel:  37% (3 of 8) Work");
    progress->tick(1);
    EXPECT_EQ(drawn(), "|Cadrel:  50% (4 of 8) Work");
    progress->setPosition(2);
    EXPECT_EQ(drawn(), "|Cadrel:  25% (2 of 8) Work");
}

TEST_F(ProgressServiceTest, GoesOnInEachStageFromWhereTheFormerOneStood)
{
    start(8);
    progress->tick(6);
    drawn();

    progress->setRange(5);
    EXPECT_EQ(drawn(), "|Cadrel:  75% (0 of 5) Work");
    progress->tick(2);
    EXPECT_EQ(drawn(), "|Cadrel:  85% (2 of 5) Work");
    progress->tick(3);
    EXPECT_EQ(drawn(), "|Cadrel: 100% (5 of 5) Work");
    progress->setRange(4);
    EXPECT_EQ(drawn(), "|Cadrel: 100% (0 of 4) Work");
    progress->tick(2);
    EXPECT_EQ(drawn(), "");
}

TEST_F(ProgressServiceTest, StopsAtTheEndOfTheStage)
{
    start(8);

    progress->tick(6);
    drawn();
    progress->tick(Endless);
    EXPECT_EQ(drawn(), "|Cadrel: 100% (8 of 8) Work");
    progress->setPosition(0);
    drawn();
    progress->setPosition(9);
    EXPECT_EQ(drawn(), "|Cadrel: 100% (8 of 8) Work");
}

TEST_F(ProgressServiceTest, ReachesAHundredPercentWithTheLastStepAlone)
{
    start(Endless);

    progress->tick(Endless - 1);
    EXPECT_EQ(drawn(), "|Cadrel:  99% (18446744073709551614 of 18446744073709551615) Work");
    progress->tick(1);
    EXPECT_EQ(drawn(), "|Cadrel: 100% (18446744073709551615 of 18446744073709551615) Work");
}

TEST_F(ProgressServiceTest, DrawsTheLineOncePerPercent)
{
    start(1000);

    for (int step = 0; step < 9; ++step)
        progress->tick(1);
    EXPECT_EQ(drawn(), "");
    progress->tick(1);
    EXPECT_EQ(drawn(), "|Cadrel:   1% (10 of 1000) Work");
}

TEST_F(ProgressServiceTest, ErasesItsLineAtTheEnd)
{
    start(8);

    EXPECT_EQ(progress->end(), ResultOk);

    EXPECT_EQ(drawn(), "|");
}

TEST_F(ProgressServiceTest, ErasesItsLineWhenTheHostGoes)
{
    start(8);

    progress.reset();

    EXPECT_EQ(drawn(), "|");
}

TEST_F(ProgressServiceTest, BeginsAnewAfterTheEnd)
{
    start(8);
    progress->setStatus(u"reel 3");
    progress->end();
    drawn();

    EXPECT_EQ(progress->begin(IProgressService::Modal, u"Other", nullptr), ResultOk);
    progress->show();

    EXPECT_EQ(drawn(), "|Other: ");
}

TEST_F(ProgressServiceTest, RefusesASecondOperationAtATime)
{
    start(8);
    bool other = false;

    EXPECT_NE(progress->begin(IProgressService::Modal, u"Other", &other), ResultOk);

    interrupted = SIGINT;
    progress->tick(1);
    EXPECT_FALSE(other);
    EXPECT_TRUE(cancelled);
    EXPECT_EQ(drawn(), "|Cadrel:  12% (1 of 8) Work");
}

TEST_F(ProgressServiceTest, RefusesAModeThatItDoesntKnow)
{
    EXPECT_NE(progress->begin(0, u"Cadrel", nullptr), ResultOk);
    EXPECT_NE(progress->begin(2, u"Cadrel", nullptr), ResultOk);
    EXPECT_NE(progress->show(), ResultOk) << "None has begun.";
}

TEST_F(ProgressServiceTest, RefusesAllButABeginningWhileNothingGoesOn)
{
    const auto refusesAll = [&] {
        return progress->setStatus(u"") != ResultOk && progress->setRange(1) != ResultOk &&
               progress->setPosition(1) != ResultOk && progress->setText(u"") != ResultOk &&
               progress->tick(1) != ResultOk && progress->show() != ResultOk && progress->end() != ResultOk;
    };

    EXPECT_TRUE(refusesAll());
    start(8);
    progress->end();
    drawn();
    EXPECT_TRUE(refusesAll());
    EXPECT_EQ(drawn(), "");
}

TEST_F(ProgressServiceTest, TellsTheOperationThatTheUserCancelled)
{
    start(8);
    progress->tick(1);
    EXPECT_FALSE(cancelled);

    interrupted = SIGINT;
    EXPECT_FALSE(cancelled) << "The signal alone does nothing.";

    progress->tick(1);
    EXPECT_TRUE(cancelled);
}

TEST_F(ProgressServiceTest, AsksForTheCancelInEachCallThatTellsOfProgress)
{
    start(8);
    interrupted = SIGINT;

    progress->setPosition(3);
    EXPECT_TRUE(cancelled);
    cancelled = false;
    progress->setText(u"Next");
    EXPECT_TRUE(cancelled);
    cancelled = false;
    progress->setRange(4);
    EXPECT_TRUE(cancelled);
    cancelled = false;
    progress->setStatus(u"reel 3");
    EXPECT_TRUE(cancelled);
    cancelled = false;
    progress->tick(0);
    EXPECT_TRUE(cancelled);
}

TEST_F(ProgressServiceTest, LeavesTheCancelFlagAloneAfterTheEnd)
{
    start(8);
    progress->end();
    interrupted = SIGINT;

    progress->begin(IProgressService::Modal, u"Cadrel", nullptr);
    progress->tick(1);

    EXPECT_FALSE(cancelled) << "An operation that can't be cancelled has none, and the former one has ended.";
}

TEST(ProgressService, IsSilentButCanBeCancelledWhereLinesCantBeRedrawn)
{
    std::ostringstream out;
    volatile std::sig_atomic_t interrupted = 0;
    Terminal terminal(out, false, &interrupted);
    const Counted<IProgressService> progress = makeCounted<ProgressService>(terminal);
    bool cancelled = false;

    progress->begin(IProgressService::Modal, u"Cadrel", &cancelled);
    progress->show();
    progress->setRange(2);
    interrupted = SIGINT;
    progress->tick(1);
    progress->end();

    EXPECT_TRUE(cancelled);
    EXPECT_EQ(out.str(), "");
}

} // namespace standin::tests
