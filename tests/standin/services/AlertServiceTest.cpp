// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/services/AlertService.h"

#include "tests/support/standin/FakeBoxes.h"
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
    Counted<AlertService> alerts = makeCounted<AlertService>(terminal);
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
    EXPECT_EQ(alerts->show(u"Overwrite?", u"Yes", nullptr, u"Cancel"), 1);
    EXPECT_EQ(alerts->show(u"Overwrite?", nullptr, nullptr, u"Cancel"), 3);
    EXPECT_EQ(out.str(), "Overwrite? [Yes]\nOverwrite? [Cancel]\n");
}

TEST_F(AlertServiceTest, TakesTheLastButtonWhereTheFirstIsLeftOut)
{
    EXPECT_EQ(alerts->show(u"Overwrite?", nullptr, u"Overwrite", u"Cancel"), 3);
    EXPECT_EQ(out.str(), "Overwrite? [Cancel]\n");
}

TEST_F(AlertServiceTest, LetsReturnUseTheFirstButtonAndEscapeTheLast)
{
    FakeBoxes boxes;
    alerts->setBoxes(&boxes);
    const auto pressed = [&](const char16_t* key, const char16_t* first, const char16_t* second,
                             const char16_t* third) {
        boxes.answers = {key};
        return alerts->show(u"Start?", first, second, third);
    };
    EXPECT_EQ(pressed(FakeBoxes::Return, u"Keep", u"Remove", u"Cancel"), 1);
    EXPECT_EQ(pressed(FakeBoxes::Escape, u"Keep", u"Remove", u"Cancel"), 3);
    EXPECT_EQ(pressed(FakeBoxes::Return, u"Continue", u"Abort", nullptr), 1);
    EXPECT_EQ(pressed(FakeBoxes::Escape, u"Continue", u"Abort", nullptr), 2);
    EXPECT_EQ(pressed(FakeBoxes::Return, nullptr, u"Remove", u"Cancel"), 3);
    EXPECT_EQ(pressed(FakeBoxes::Escape, nullptr, u"Remove", u"Cancel"), 3);
    boxes.answers = {u"Remove"};
    EXPECT_EQ(alerts->show(u"Start?", nullptr, u"Remove", u"Cancel"), 2);
}

TEST_F(AlertServiceTest, ShowsNothingWithoutAMessage)
{
    EXPECT_EQ(alerts->show(nullptr, u"Yes", nullptr, nullptr), 0);
    EXPECT_EQ(out.str(), "");
}

} // namespace standin::tests
