// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/FadeCurve.h"

#include "standin/ardour/SessionClock.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

#include <string>

namespace standin::tests {

namespace {

/// Of a list at 48,000 samples a second, which is one of 5,880 superclocks.
FadeCurve curveOf(const std::string& style, const std::string& events)
{
    pugi::xml_document document;
    document.load_string(("<Session version=\"7002\" sample-rate=\"48000\"><AutomationList interpolation-style=\"" +
                          style + "\"><events>" + events + "</events></AutomationList></Session>")
                             .c_str());
    const SessionClock clock(document.document_element());
    return {document.document_element().child("AutomationList"), clock};
}

TEST(FadeCurve, RunsStraightBetweenTheTwoPointsThatItHas)
{
    const FadeCurve curve = curveOf("Curved", "a0 0.5 a588000 1");
    EXPECT_DOUBLE_EQ(curve.at(-1.0), 0.5);
    EXPECT_DOUBLE_EQ(curve.at(0.0), 0.5);
    EXPECT_DOUBLE_EQ(curve.at(50.0), 0.75);
    EXPECT_DOUBLE_EQ(curve.at(100.0), 1.0);
    EXPECT_DOUBLE_EQ(curve.at(101.0), 1.0);
}

TEST(FadeCurve, IsAConstrainedSplineThroughMorePoints)
{
    // The rises are 1 and 3 a sample: the slope in the middle is 2 / (1/1 + 1/3) = 1.5, at the beginning 1.5 - 1.5/2 = 0.75,
    // at the end 1.5 * 3 - 1.5/2 = 3.75. In the middle of a step it is half of both values and an eighth of both slopes.
    const FadeCurve curve = curveOf("Curved", "a0 0 a5880 1 a11760 4");
    EXPECT_DOUBLE_EQ(curve.at(0.5), 0.5 + (0.75 - 1.5) / 8.0);
    EXPECT_DOUBLE_EQ(curve.at(1.0), 1.0);
    EXPECT_DOUBLE_EQ(curve.at(1.5), 2.5 + (1.5 - 3.75) / 8.0);
}

TEST(FadeCurve, IsLevelWhereItTurns)
{
    // No slope in the middle, and 1.5 at the beginning.
    const FadeCurve curve = curveOf("Curved", "a0 0 a5880 1 a11760 0");
    EXPECT_DOUBLE_EQ(curve.at(0.5), 0.5 + 1.5 / 8.0);
    EXPECT_LE(curve.at(1.01), 1.0);
}

TEST(FadeCurve, RunsStraightThroughTheListOfAnyOtherStyle)
{
    EXPECT_DOUBLE_EQ(curveOf("Linear", "a0 0 a5880 1 a11760 4").at(1.5), 2.5);
}

TEST(FadeCurve, IsOneWithoutPoints)
{
    EXPECT_EQ(FadeCurve().at(7.0), 1.0);
    EXPECT_EQ(curveOf("Curved", "").at(7.0), 1.0);
}

TEST(FadeCurve, HasOneValueWhereTwoPointsStand)
{
    EXPECT_DOUBLE_EQ(curveOf("Curved", "a0 0 a5880 0.5 a5880 0.7 a11760 1").at(1.0), 0.5);
}

TEST(FadeCurve, OfConstantPowerIsASine)
{
    EXPECT_NEAR(FadeCurve::constantPower(64, true).at(32.0), 0.70711, 1e-5);
    EXPECT_NEAR(FadeCurve::constantPower(64, false).at(16.0), 0.92388, 1e-5);
}

} // namespace

} // namespace standin::tests
