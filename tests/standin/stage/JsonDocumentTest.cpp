// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/stage/JsonDocument.h"

#include "standin/project/FileFault.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace standin::tests {

namespace {

std::string again(std::string_view text)
{
    std::string json;
    JsonDocument(text, 10).root().appendTo(json);
    return json;
}

std::string faultOf(std::string_view text, std::size_t deepest = 10)
{
    try {
        const JsonDocument document(text, deepest);
        return "none";
    } catch (const FileFault& fault) {
        return fault.what();
    }
}

std::string nested(std::size_t levels)
{
    return std::string(levels, '[') + std::string(levels, ']');
}

TEST(JsonDocument, GivesTheValuesAsTheyStand)
{
    const JsonDocument document(R"({"a": [1, -2.5, "x", true, null], "b": {}})", 10);
    std::vector<std::string> keys;
    for (const JsonValue& member : document.root().children())
        keys.push_back(member.key());
    std::vector<JsonValue> elements;
    for (const JsonValue& element : (*document.root().children().begin()).children())
        elements.push_back(element);

    EXPECT_EQ(keys, (std::vector<std::string>{"a", "b"}));
    ASSERT_EQ(elements.size(), 5U);
    EXPECT_EQ(elements[0].integer(), 1);
    EXPECT_EQ(elements[0].number(), 1.0);
    EXPECT_EQ(elements[1].number(), -2.5);
    EXPECT_EQ(elements[1].integer(), std::nullopt);
    EXPECT_EQ(elements[2].text(), "x");
    EXPECT_TRUE(elements[3].boolean());
    EXPECT_STREQ(elements[4].kindName(), "null");
}

TEST(JsonDocument, KnowsIntegersOf64Bits)
{
    const JsonDocument smallest("-9223372036854775808", 1);
    const JsonDocument largest("9223372036854775807", 1);
    const JsonDocument tooLarge("9223372036854775808", 1);

    EXPECT_EQ(smallest.root().integer(), INT64_MIN);
    EXPECT_EQ(largest.root().integer(), INT64_MAX);
    EXPECT_EQ(tooLarge.root().integer(), std::nullopt);
    EXPECT_EQ(tooLarge.root().number(), 9223372036854775808.0);
}

TEST(JsonDocument, WritesItsValuesOnOneLine)
{
    EXPECT_EQ(again(" { \"b\" :[1,2 , {\"x\":null}],\n\"a\":\"\\u00f6\\n\" } "),
              "{\"b\": [1, 2, {\"x\": null}], \"a\": \"\xc3\xb6\\n\"}");
    EXPECT_EQ(again("[[], {}, [[]]]"), "[[], {}, [[]]]");
    EXPECT_EQ(again("[18446744073709551615, -9223372036854775808, true, false]"),
              "[18446744073709551615, -9223372036854775808, true, false]");
}

TEST(JsonDocument, KeepsANumberWithAPointOneWithAPoint)
{
    EXPECT_EQ(again("[2.0, 2, 1e3, 1.50, -0.0, 1e300]"), "[2.0, 2, 1000.0, 1.5, -0.0, 1e+300]");
}

TEST(JsonDocument, CountsLevelsOfNesting)
{
    EXPECT_EQ(JsonDocument("1", 10).root().depth(), 0U);
    EXPECT_EQ(JsonDocument("{}", 10).root().depth(), 1U);
    EXPECT_EQ(JsonDocument("[1, {\"a\": [[], 2]}, [[]]]", 10).root().depth(), 4U);
}

TEST(JsonDocument, FindsAKeyThatIsThereTwice)
{
    const JsonDocument once(R"({"a": {"b": 1}, "b": {"a": 1}})", 10);
    const JsonDocument twice(R"({"a": 1, "b": 2, "c": 3, "b": 4})", 10);

    EXPECT_FALSE(once.root().doubledMember());
    ASSERT_TRUE(twice.root().doubledMember());
    EXPECT_EQ(twice.root().doubledMember()->integer(), 4);
}

TEST(JsonDocument, NamesTheLineAndTheColumnOfAFault)
{
    EXPECT_EQ(faultOf("{\n  \"a\": 1\n  \"b\": 2\n}"),
              "line 3, column 5: broken JSON while parsing object - unexpected string literal; expected '}'");
    EXPECT_EQ(faultOf("[1, 2"),
              "line 1, column 6: broken JSON while parsing array - unexpected end of input; expected ']'");
    EXPECT_EQ(faultOf(""),
              "line 1, column 1: broken JSON while parsing value - unexpected end of input; expected '[', '{', "
              "or a literal");
    EXPECT_EQ(faultOf("[] 1"),
              "line 1, column 4: broken JSON while parsing value - unexpected number literal; expected end "
              "of input");
}

TEST(JsonDocument, CountsColumnsInCharacters)
{
    EXPECT_EQ(faultOf("[\"\xe5\xa3\xb0\", x]"), "line 1, column 7: broken JSON while parsing value - invalid literal");
}

TEST(JsonDocument, RefusesWhatIsNoUtf8)
{
    EXPECT_EQ(faultOf("[\"a\xff\"]"),
              "line 1, column 4: broken JSON while parsing value - invalid string: ill-formed UTF-8 byte");
    EXPECT_EQ(faultOf("[\"\\ud800\"]").substr(0, 14), "line 1, column");
}

TEST(JsonDocument, RefusesNumbersBeyondAllBounds)
{
    EXPECT_EQ(faultOf("[1e999]"), "line 1, column 6: a number beyond all bounds");
    EXPECT_EQ(faultOf("[-1e400]"), "line 1, column 7: a number beyond all bounds");
    EXPECT_EQ(faultOf("[NaN]").substr(0, 20), "line 1, column 2: br");
}

TEST(JsonDocument, RefusesDeepNestingWhateverStandsInTheTexts)
{
    EXPECT_EQ(faultOf(nested(10)), "none");
    EXPECT_EQ(faultOf(nested(11)), "line 1, column 11: nested deeper than 10 levels");
    EXPECT_EQ(faultOf("[\"[[[\\\"[[\",\n[[]]]", 2), "line 2, column 2: nested deeper than 2 levels");
}

TEST(JsonDocument, TakesAMillionLevelsForWhatTheyAre)
{
    EXPECT_EQ(faultOf(nested(1000000)), "line 1, column 11: nested deeper than 10 levels");
}

} // namespace

} // namespace standin::tests
