// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/WindowDescription.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <fstream>

#include <sys/stat.h>

using standin::readWindowDescriptions;
using standin::WindowDescription;

namespace {

std::optional<std::vector<WindowDescription>> read(const std::string& content)
{
    const cadrel::tests::TempFolder folder;
    const auto file = folder.path() / "skin.xml";
    std::ofstream(file, std::ios::binary) << content;
    return readWindowDescriptions(file);
}

} // namespace

TEST(WindowDescription, IsReadWithNameTitleAndWhetherItsSizeMayChange)
{
    const auto windows = read(R"(<?xml version="1.0" encoding="UTF-8"?>
<windows>
    <!-- Two. -->
    <window name="Main" title="Größe" resizable="true"/>
    <window name="Small" resizable="false"/>
    <window name="Plain"/>
</windows>)");

    ASSERT_TRUE(windows);
    ASSERT_EQ(windows->size(), 3U);
    EXPECT_EQ((*windows)[0].name, "Main");
    EXPECT_EQ((*windows)[0].title, "Größe");
    EXPECT_TRUE((*windows)[0].isResizable);
    EXPECT_EQ((*windows)[1].name, "Small");
    EXPECT_EQ((*windows)[1].title, "");
    EXPECT_FALSE((*windows)[1].isResizable);
    EXPECT_FALSE((*windows)[2].isResizable);
}

TEST(WindowDescription, MayBeOfNoWindows)
{
    const auto windows = read("<windows/>");

    ASSERT_TRUE(windows);
    EXPECT_TRUE(windows->empty());
}

TEST(WindowDescription, IsRefusedWhereItIsNoXml)
{
    EXPECT_FALSE(read(""));
    EXPECT_FALSE(read("windows"));
    EXPECT_FALSE(read("<windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" name=\"b\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"/></windows"));
}

TEST(WindowDescription, IsRefusedWhereItsTextsAreNotUtf8)
{
    EXPECT_FALSE(read("<windows><window name=\"\xff\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" title=\"Gr\xf6\xdf\x65\"/></windows>"));
    EXPECT_FALSE(read(std::string("<\0w\0i\0n\0d\0o\0w\0s\0/\0>\0", 20)));
}

TEST(WindowDescription, IsRefusedWithAnythingBesideTheWindows)
{
    EXPECT_FALSE(read("<other/>"));
    EXPECT_FALSE(read("<windows/><windows/>"));
    EXPECT_FALSE(read("<windows/><other/>"));
    EXPECT_FALSE(read("<other/><windows/>"));
    EXPECT_FALSE(read("text<windows/>"));
    EXPECT_FALSE(read("<windows/>text"));
    EXPECT_FALSE(read("<windows>text</windows>"));
    EXPECT_FALSE(read("<windows><![CDATA[text]]></windows>"));
    EXPECT_FALSE(read("<windows version=\"2\"/>"));
    EXPECT_FALSE(read("<windows><other name=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"/><other/></windows>"));
    EXPECT_TRUE(read("<!-- Before. --><windows><!-- Within. --></windows><!-- After. -->"));
}

TEST(WindowDescription, IsRefusedWithAnythingWithinAWindow)
{
    EXPECT_FALSE(read("<windows><window name=\"a\">text</window></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"><window name=\"b\"/></window></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"><![CDATA[text]]></window></windows>"));
    EXPECT_TRUE(read("<windows><window name=\"a\"></window></windows>"));
    EXPECT_TRUE(read("<windows><window name=\"a\"> <!-- Remark. --> </window></windows>"));
}

TEST(WindowDescription, IsRefusedWithAWindowThatHasNoNameOfItsOwn)
{
    EXPECT_FALSE(read("<windows><window/></windows>"));
    EXPECT_FALSE(read("<windows><window title=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"/><window name=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"/><window name=\"b\"/><window name=\"a\"/></windows>"));
    EXPECT_TRUE(read("<windows><window name=\"a\"/><window name=\"A\"/></windows>"));
}

TEST(WindowDescription, IsRefusedWithOtherAttributesOrValues)
{
    EXPECT_FALSE(read("<windows><window name=\"a\" width=\"100\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" resizable=\"yes\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" resizable=\"\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" resizable=\"True\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" resizable=\"1\"/></windows>"));
}

TEST(WindowDescription, IsReadFromAFileAlone)
{
    const cadrel::tests::TempFolder folder;

    EXPECT_FALSE(readWindowDescriptions(folder.path()));
    EXPECT_FALSE(readWindowDescriptions(folder.path() / "missing.xml"));
    // Nobody writes into the pipe, so that whoever opened it would wait for ever.
    ASSERT_EQ(mkfifo((folder.path() / "pipe.xml").c_str(), 0600), 0);
    EXPECT_FALSE(readWindowDescriptions(folder.path() / "pipe.xml"));
}

TEST(WindowDescription, OfTheModuleDescribesItsWindow)
{
    const auto windows = readWindowDescriptions(cadrel::tests::treePath("resources/skin.xml"));

    ASSERT_TRUE(windows);
    ASSERT_EQ(windows->size(), 1U);
    EXPECT_EQ(windows->front().name, "CadrelWindow");
    EXPECT_EQ(windows->front().title, "Cadrel");
    EXPECT_TRUE(windows->front().isResizable);
}
