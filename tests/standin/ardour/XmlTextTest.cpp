// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/ardour/XmlText.h"

#include <gtest/gtest.h>
#include <pugixml.hpp>

namespace standin::tests {

namespace {

/// The text that the first element of a name takes.
std::string elementIn(const std::string& text, const char* name)
{
    pugi::xml_document document;
    EXPECT_TRUE(document.load_string(text.c_str(), pugi::parse_full));
    const pugi::xml_node node =
        document.find_node([name](const pugi::xml_node& candidate) { return candidate.name() == std::string(name); });
    return std::string(rangeOf(node, text).in(text));
}

TEST(XmlText, FindsAnElementWithAllThatIsInIt)
{
    EXPECT_EQ(elementIn("<a> <b x=\"1\"><b/>text</b > <c/></a>", "b"), "<b x=\"1\"><b/>text</b >");
    EXPECT_EQ(elementIn("<a> <b x=\"1\"><b/>text</b > <c/></a>", "c"), "<c/>");
}

TEST(XmlText, IsNotMisledByAttributesCommentsAndData)
{
    EXPECT_EQ(elementIn("<a><b x='\">/>' y=\"</b>\"/><c/></a>", "b"), "<b x='\">/>' y=\"</b>\"/>");
    EXPECT_EQ(elementIn("<a><b><!-- </b> --><![CDATA[</b>]]><?b </b>?></b><c/></a>", "b"),
              "<b><!-- </b> --><![CDATA[</b>]]><?b </b>?></b>");
}

TEST(XmlText, FindsAStartTag)
{
    const std::string text = "<a x=\">\"><b/></a>";
    EXPECT_EQ(startTagOf({0, text.size()}, text).in(text), "<a x=\">\">");
}

TEST(XmlText, FindsTheValueOfAnAttribute)
{
    const std::string text = "<a note=\" id=7\" xid='8' id = '9' empty=\"\"/>";
    const TextRange tag{0, text.size()};
    EXPECT_EQ(valueIn(tag, "id", text)->in(text), "9");
    EXPECT_EQ(valueIn(tag, "note", text)->in(text), " id=7");
    EXPECT_EQ(valueIn(tag, "empty", text)->in(text), "");
    EXPECT_FALSE(valueIn(tag, "other", text));
}

TEST(XmlText, TellsHowDeepAnElementStands)
{
    const std::string text = "<a>\n    <b/><c/>\n</a>";
    EXPECT_EQ(depthOf({text.find("<b"), text.find("<c")}, text), 2U);
    EXPECT_EQ(depthOf({text.find("<c"), text.find("\n</a")}, text), 0U);
    EXPECT_EQ(depthOf({0, text.size()}, text), 0U);
}

TEST(XmlText, ReplacesWhatXmlCannotHold)
{
    EXPECT_EQ(withoutForbidden("a\x01"
                               "b\x0B"
                               "c\x1F\t\r\n\x7F"),
              "a\xEF\xBF\xBD"
              "b\xEF\xBF\xBD"
              "c\xEF\xBF\xBD\t\r\n\x7F");
    EXPECT_EQ(withoutForbidden("\xEF\xBF\xBE|\xEF\xBF\xBF|\xEF\xBF\xBD|\xC3\xA4"),
              "\xEF\xBF\xBD|\xEF\xBF\xBD|\xEF\xBF\xBD|\xC3\xA4");
}

TEST(TextPatch, LeavesAllElseAsItWas)
{
    const std::string text = "one two  three";
    TextPatch patch(text);
    patch.replace({4, 7}, "2");
    patch.remove({9, 14});
    patch.insert(3, "!");
    patch.insert(3, "?");
    EXPECT_EQ(patch.result(), "one!? 2");
}

TEST(TextPatch, IsTheTextItselfWithoutAnEdit)
{
    const std::string text = " <a/> \n";
    EXPECT_EQ(TextPatch(text).result(), text);
}

} // namespace

} // namespace standin::tests
