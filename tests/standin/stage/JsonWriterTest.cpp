// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/JsonWriter.h"

#include "standin/stage/JsonDocument.h"

#include <gtest/gtest.h>

#include <string>

namespace standin::tests {

namespace {

using Layout = JsonWriter::Layout;

TEST(JsonWriter, PutsEachMemberOnALineAndSmallObjectsOnOne)
{
    JsonWriter json;

    json.beginObject(Layout::Lines);
    json.key("name");
    json.text("DX 1");
    json.key("points");
    json.beginList();
    for (const double time : {0.0, 2.5}) {
        json.beginObject(Layout::OneLine);
        json.key("time");
        json.number(time);
        json.key("locked");
        json.boolean(true);
        json.endObject();
    }
    json.endList();
    json.key("count");
    json.integer(-3);
    json.endObject();

    EXPECT_EQ(json.takeText(), "{\n"
                               "  \"name\": \"DX 1\",\n"
                               "  \"points\": [\n"
                               "    {\"time\": 0, \"locked\": true},\n"
                               "    {\"time\": 2.5, \"locked\": true}\n"
                               "  ],\n"
                               "  \"count\": -3\n"
                               "}\n");
}

TEST(JsonWriter, KeepsAllOnOneLineWithinAnObjectOnOneLine)
{
    JsonWriter json;

    json.beginObject(Layout::OneLine);
    json.key("a");
    json.beginObject(Layout::Lines);
    json.key("b");
    json.beginList();
    json.integer(1);
    json.integer(2);
    json.endList();
    json.endObject();
    json.endObject();

    EXPECT_EQ(json.takeText(), "{\"a\": {\"b\": [1, 2]}}\n");
}

TEST(JsonWriter, LeavesNothingBetweenTheBracketsOfWhatIsEmpty)
{
    JsonWriter json;

    json.beginObject(Layout::Lines);
    json.key("a");
    json.beginList();
    json.endList();
    json.key("b");
    json.beginObject(Layout::Lines);
    json.endObject();
    json.endObject();

    EXPECT_EQ(json.takeText(), "{\n  \"a\": [],\n  \"b\": {}\n}\n");
}

TEST(JsonWriter, TellsThePlaceOfTheLastValue)
{
    JsonWriter json;
    EXPECT_EQ(json.place(), "");
    json.beginObject(Layout::Lines);
    EXPECT_EQ(json.place(), "");
    json.key("tracks");
    json.beginList();
    EXPECT_EQ(json.place(), "tracks");
    json.beginObject(Layout::Lines);
    json.endObject();
    json.beginObject(Layout::Lines);
    json.key("User:STR_MAReel");

    EXPECT_EQ(json.place(), "tracks[1][\"User:STR_MAReel\"]");
}

TEST(JsonWriter, GoesNoFurtherToTheRightThanTwentyLevels)
{
    JsonWriter json;
    for (int level = 0; level < 30; ++level)
        json.beginList();
    json.integer(1);
    for (int level = 0; level < 30; ++level)
        json.endList();

    EXPECT_NE(json.takeText().find("[\n" + std::string(40, ' ') + "1\n" + std::string(40, ' ') + "]"),
              std::string::npos);
}

} // namespace

} // namespace standin::tests
