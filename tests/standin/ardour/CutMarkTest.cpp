// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/CutMark.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

namespace standin::tests {

namespace {

class MarkedRegion : public testing::Test {
protected:
    explicit MarkedRegion(const char* text = "<Region><Extra><Other/></Extra></Region>")
    {
        m_document.load_string(text);
        region = m_document.document_element();
    }

    pugi::xml_node region;

private:
    pugi::xml_document m_document;
};

TEST_F(MarkedRegion, TellsWhatWasNotedOfEachEnd)
{
    CutMark{RegionEdge::New, 64}.write(region, "head", 1000, 700);
    CutMark{RegionEdge::Seam, 0}.write(region, "tail", 5000, 0);
    const auto head = CutMark::read(region, "head", 1000, 700);
    ASSERT_TRUE(head);
    EXPECT_EQ(head->edge, RegionEdge::New);
    EXPECT_EQ(head->fade, 64);
    const auto tail = CutMark::read(region, "tail", 5000, 0);
    ASSERT_TRUE(tail);
    EXPECT_EQ(tail->edge, RegionEdge::Seam);
    EXPECT_TRUE(region.child("Extra").child("Other"));
}

TEST_F(MarkedRegion, TellsNothingOfAnEndThatTheUserHasChangedSince)
{
    CutMark{RegionEdge::New, 64}.write(region, "head", 1000, 700);
    EXPECT_FALSE(CutMark::read(region, "head", 1001, 700));
    EXPECT_FALSE(CutMark::read(region, "head", 1000, 701));
    EXPECT_FALSE(CutMark::read(region, "tail", 1000, 700));
}

TEST_F(MarkedRegion, TellsNothingByWordsThatItDoesNotKnow)
{
    for (const char* const words : {"", "old 0 0 0", "new", "new 0 0", "new 0 x 0", "new 0 -1 0", "new 0 1 0",
                                    "new 99999999999999999999 0 0", "new 0 99999999999 99999999999"}) {
        region.child("Extra").remove_child("Cadrel");
        region.child("Extra").append_child("Cadrel").append_attribute("head").set_value(words);
        EXPECT_FALSE(CutMark::read(region, "head", 0, 0)) << words;
    }
}

TEST_F(MarkedRegion, ForgetsOneEndAndThenLeavesNothing)
{
    CutMark{RegionEdge::New, 64}.write(region, "head", 1000, 700);
    CutMark{RegionEdge::New, 64}.write(region, "tail", 5000, 64);
    CutMark::remove(region, "head");
    EXPECT_FALSE(CutMark::read(region, "head", 1000, 700));
    EXPECT_TRUE(CutMark::read(region, "tail", 5000, 64));
    CutMark::remove(region, "tail");
    EXPECT_FALSE(region.child("Extra").child("Cadrel"));
    region.child("Extra").remove_child("Other");
    CutMark::remove(region, "tail");
    EXPECT_FALSE(region.child("Extra"));
}

} // namespace

} // namespace standin::tests
