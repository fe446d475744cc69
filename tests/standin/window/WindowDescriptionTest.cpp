// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/window/WindowDescription.h"

#include "tests/support/TempFolder.h"
#include "tests/support/TreePaths.h"

#include <gtest/gtest.h>

#include <fstream>

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

TEST(WindowDescription, IsRefusedAsAWholeWhenItIsBroken)
{
    EXPECT_FALSE(read(""));
    EXPECT_FALSE(read("<windows>"));
    EXPECT_FALSE(read("<other/>"));
    EXPECT_FALSE(read("<windows/><windows/>"));
    EXPECT_FALSE(read("<windows><other name=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window title=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"/><window name=\"a\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\" resizable=\"yes\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"\xff\"/></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\">text</window></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"><window name=\"b\"/></window></windows>"));
    EXPECT_FALSE(read("<windows><window name=\"a\"><![CDATA[text]]></window></windows>"));
    EXPECT_TRUE(read("<windows><window name=\"a\"></window></windows>"));
    EXPECT_TRUE(read("<windows><window name=\"a\"> <!-- Remark. --> </window></windows>"));
}

TEST(WindowDescription, IsNotReadFromAFolderOrFromNothing)
{
    const cadrel::tests::TempFolder folder;

    EXPECT_FALSE(readWindowDescriptions(folder.path()));
    EXPECT_FALSE(readWindowDescriptions(folder.path() / "missing.xml"));
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
