// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/file/JsonWriter.h"

#include "standin/file/JsonDocument.h"
#include "standin/file/JsonText.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <string>

namespace standin::tests {

namespace {

using Layout = JsonWriter::Layout;

std::string numberText(double number)
{
    std::string text;
    appendJsonNumber(text, number);
    return text;
}

std::string quotedText(std::string_view content)
{
    std::string text;
    appendJsonText(text, content);
    return text;
}

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

TEST(JsonText, EscapesWhatCannotStandInIt)
{
    EXPECT_EQ(quotedText("say \"no\" \\ yes/no"), R"("say \"no\" \\ yes/no")");
    EXPECT_EQ(quotedText("a\nb\tc"), R"("a\nb\tc")");
    EXPECT_EQ(quotedText(std::string_view("\0\x01\x1f\x7f", 4)), "\"\\u0000\\u0001\\u001f\x7f\"");
    EXPECT_EQ(quotedText("T\xc3\xb6ne"), "\"T\xc3\xb6ne\"");
}

TEST(JsonNumber, HasAsFewDigitsAsLeadBack)
{
    EXPECT_EQ(numberText(0.1), "0.1");
    EXPECT_EQ(numberText(3600.0), "3600");
    EXPECT_EQ(numberText(1.0 / 24.0), "0.041666666666666664");
    EXPECT_EQ(numberText(-2.5), "-2.5");
    EXPECT_EQ(numberText(0.0), "0");
}

TEST(JsonNumber, IsPlainUnlessItHasTooManyZeros)
{
    EXPECT_EQ(numberText(1e9), "1000000000");
    EXPECT_EQ(numberText(123456789012345.0), "123456789012345");
    EXPECT_EQ(numberText(1e15), "1e+15");
    EXPECT_EQ(numberText(0.000001), "0.000001");
    EXPECT_EQ(numberText(0.0000001), "1e-07");
    EXPECT_EQ(numberText(5e-324), "5e-324");
}

RC_GTEST_PROP(JsonNumber, ReadsBackExactly, (std::uint64_t bits))
{
    double number = 0.0;
    std::memcpy(&number, &bits, sizeof number);
    RC_PRE(std::isfinite(number));

    RC_ASSERT(std::strtod(numberText(number).c_str(), nullptr) == number);
}

} // namespace

} // namespace standin::tests
