// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/AlertService.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace Velmark;

namespace standin::tests {

namespace {

class AlertServiceTest : public testing::Test {
protected:
    std::ostringstream out;
    Terminal terminal{out, false};
    Counted<IAlertService> alerts = makeCounted<AlertService>(terminal);
};

} // namespace

TEST_F(AlertServiceTest, WritesTheMessageAndAnswersTheDefaultButton)
{
    EXPECT_EQ(alerts->show(u"An error occurred.", nullptr, nullptr, nullptr), 1);
    EXPECT_EQ(out.str(), "An error occurred.\n");
}

TEST_F(AlertServiceTest, SaysWhichOfTheLabelledButtonsItUsed)
{
    EXPECT_EQ(alerts->show(u"Overwrite?", u"Yes", u"No", nullptr), 1);
    EXPECT_EQ(out.str(), "Overwrite? [Yes]\n");
}

TEST_F(AlertServiceTest, PassesOverButtonsThatAreLeftOut)
{
    EXPECT_EQ(alerts->show(u"Overwrite?", nullptr, u"No", u"Cancel"), 2);
    EXPECT_EQ(alerts->show(u"Overwrite?", nullptr, nullptr, u"Cancel"), 3);
    EXPECT_EQ(out.str(), "Overwrite? [No]\nOverwrite? [Cancel]\n");
}

TEST_F(AlertServiceTest, ShowsNothingWithoutAMessage)
{
    EXPECT_EQ(alerts->show(nullptr, u"Yes", nullptr, nullptr), 0);
    EXPECT_EQ(out.str(), "");
}

} // namespace standin::tests
