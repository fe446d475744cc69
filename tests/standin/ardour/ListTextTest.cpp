// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/ListText.h"

#include "standin/ardour/SessionClock.h"
#include "standin/project/FileFault.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

namespace standin::tests {

namespace {

class ListText : public testing::Test {
protected:
    ListText()
    {
        m_session.load_string(R"(<Session version="7002" sample-rate="48000"><TempoMap><Tempos>)"
                              R"(<Tempo npm="60" enpm="60" note-type="4" sclock="0" quarters="0:0"/>)"
                              R"(</Tempos></TempoMap></Session>)");
        clock = SessionClock(m_session.document_element());
    }

    pugi::xml_node list(const std::string& events)
    {
        m_list.load_string(("<AutomationList automation-id=\"gain\" time-domain=\"BeatTime\"><events>" + events +
                            "</events></AutomationList>")
                               .c_str());
        return m_list.document_element();
    }
    std::string written(const std::vector<ListPoint>& points)
    {
        pugi::xml_node node = list("a0 9");
        writePoints(node, points, clock);
        return node.child("events").text().get();
    }

    SessionClock clock;

private:
    pugi::xml_document m_session;
    pugi::xml_document m_list;
};

TEST_F(ListText, IsPairsOfTimeAndValue)
{
    const auto points = readPoints(list("\n a282240000 0.5\r\n\tb3840 -1e-3 "), clock);
    ASSERT_EQ(points.size(), 2U);
    EXPECT_EQ(points[0].seconds, 1.0);
    EXPECT_EQ(points[0].value, 0.5);
    EXPECT_FALSE(points[0].isMusical);
    EXPECT_EQ(points[1].seconds, 2.0);
    EXPECT_EQ(points[1].value, -0.001);
    EXPECT_TRUE(points[1].isMusical);
}

TEST_F(ListText, MayHavePointsAtOneTime)
{
    EXPECT_EQ(readPoints(list("a0 1 a0 2 a0 3"), clock).size(), 3U);
}

TEST_F(ListText, MayBeEmpty)
{
    EXPECT_TRUE(readPoints(list(""), clock).empty());
}

TEST_F(ListText, RefusesPairsThatAreNone)
{
    for (const char* const events : {"a0", "a0 x", "x 0", "a0 1 a0", "a5880 1 a0 1", "a0 1x"})
        EXPECT_THROW(readPoints(list(events), clock), FileFault) << events;
}

TEST_F(ListText, IsWrittenAtWholeSamples)
{
    EXPECT_EQ(written({{0.0, 1.0}, {1.0 / 96000, 2.0}, {2.0, 0.1}}), "a0 1\na5880 2\na564480000 0.1\n");
}

TEST_F(ListText, KeepsTheFirstAndTheLastOfThePointsAtOneSample)
{
    EXPECT_EQ(written({{1.0, 1.0}, {1.0, 5.0}, {1.0, 2.0}}), "a282239999 1\na282240000 2\n");
    EXPECT_EQ(written({{1.0, 2.0}, {1.0, 5.0}, {1.0, 2.0}}), "a282240000 2\n");
}

TEST_F(ListText, HasNothingBeforeTheBeginning)
{
    EXPECT_EQ(written({{0.0, 1.0}, {0.0, 2.0}}), "a0 2\n");
}

TEST_F(ListText, StepsOverASampleWhereTheSessionCountsSamples)
{
    pugi::xml_document session;
    session.load_string(R"(<Session version="6000" sample-rate="48000"/>)");
    clock = SessionClock(session.document_element());
    EXPECT_EQ(written({{0.0, 2.0}, {1.0, 1.0}, {1.0, 3.0}}), "0 2\n47999 1\n48000 3\n");
    // There is no room before the sample where another point stands there already.
    EXPECT_EQ(written({{0.0, 2.0}, {1.0 / 48000, 1.0}, {1.0 / 48000, 3.0}}), "0 2\n1 3\n");
}

TEST_F(ListText, LosesItsEventsWithItsPoints)
{
    pugi::xml_node node = list("a0 1");
    writePoints(node, {}, clock);
    EXPECT_FALSE(node.child("events"));
}

} // namespace

} // namespace standin::tests
