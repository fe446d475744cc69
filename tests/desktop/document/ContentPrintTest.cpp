// SPDX-License-Identifier: GPL-3.0-or-later

#include "desktop/document/ContentPrint.h"

#include "tests/support/TempFolder.h"

#include <gtest/gtest.h>

#include <string>

namespace desktop::tests {

using cadrel::tests::TempFolder;

// The values for "" and "a" stand in the list of the hash's authors.

TEST(ContentPrint, HashesAsTheAuthorsOfFnvDo)
{
    EXPECT_EQ(ContentPrint::of("").hash, 0xcbf29ce484222325U);
    EXPECT_EQ(ContentPrint::of("a").hash, 0xaf63dc4c8601ec8cU);
    EXPECT_EQ(ContentPrint::of("foobar").hash, 0x85944171f73967e8U);
}

TEST(ContentPrint, OfAFileIsThatOfItsContentInBlocksOfAnySize)
{
    const TempFolder folder;
    for (const std::size_t size : {0U, 1U, 1048575U, 1048576U, 1048577U}) {
        const std::string content(size, 'x');
        EXPECT_EQ(ContentPrint::ofFile(folder.write("file", content)), ContentPrint::of(content)) << size;
    }
}

TEST(ContentPrint, IsNotOfAFolderOrOfWhatIsNotThere)
{
    const TempFolder folder;
    EXPECT_EQ(ContentPrint::ofFile(folder.path()), std::nullopt);
    EXPECT_EQ(ContentPrint::ofFile(folder / "nothing"), std::nullopt);
}

TEST(ContentPrint, IsWrittenWithAllItsDigitsAndReadAgain)
{
    const ContentPrint print{3, 0xab};
    EXPECT_EQ(print.hashText(), "00000000000000ab");
    EXPECT_EQ(ContentPrint::hashOf("00000000000000ab"), 0xabU);
    for (const char* const text : {"", "ab", "00000000000000abc", "0000000000000-ab", "000000000000000x"})
        EXPECT_EQ(ContentPrint::hashOf(text), std::nullopt) << text;
}

} // namespace desktop::tests
