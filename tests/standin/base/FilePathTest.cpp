// SPDX-License-Identifier: GPL-3.0-or-later

#include "standin/base/FilePath.h"

#include "velmark/Counted.h"

#include <gtest/gtest.h>

#include <array>
#include <string>

using namespace Velmark;

namespace standin::tests {

namespace {

using Buffer = std::array<char16_t, IFilePath::Capacity + 1>;

/// With a unit behind what getPath may write.
Buffer filledBuffer()
{
    Buffer buffer;
    buffer.fill(u'#');
    return buffer;
}

} // namespace

TEST(FilePath, GivesThePathThatWasSet)
{
    const Counted<IFilePath> path = makeCounted<FilePath>();
    Buffer buffer = filledBuffer();

    EXPECT_EQ(path->setPath(u"/films/Größe.edl", 0), ResultOk);
    EXPECT_EQ(path->getPath(buffer.data()), ResultOk);

    EXPECT_EQ(std::u16string(buffer.data()), u"/films/Größe.edl");
    EXPECT_EQ(buffer[17], u'#') << "Behind the zero nothing is written.";
}

TEST(FilePath, IsEmptyAtFirst)
{
    const Counted<IFilePath> path = makeCounted<FilePath>();
    Buffer buffer = filledBuffer();

    EXPECT_EQ(path->getPath(buffer.data()), ResultOk);

    EXPECT_EQ(buffer[0], u'\0');
}

TEST(FilePath, HoldsAsMuchAsTheBufferAndNoMore)
{
    const Counted<IFilePath> path = makeCounted<FilePath>();
    const std::u16string longest(1024, u'x');
    Buffer buffer = filledBuffer();

    EXPECT_EQ(path->setPath(longest.c_str(), 0), ResultOk);
    EXPECT_NE(path->setPath((longest + u"y").c_str(), 0), ResultOk);

    EXPECT_EQ(path->getPath(buffer.data()), ResultOk);
    EXPECT_EQ(std::u16string(buffer.data()), longest) << "The refused path has changed nothing.";
    EXPECT_EQ(buffer.back(), u'#');
}

TEST(FilePath, RefusesToGiveAPathOfTheHostThatIsLongerThanTheBuffer)
{
    const Counted<IFilePath> path = makeCounted<FilePath>(std::u16string(1025, u'x'));
    Buffer buffer = filledBuffer();

    EXPECT_NE(path->getPath(buffer.data()), ResultOk);

    EXPECT_EQ(buffer, filledBuffer());
}

TEST(FilePath, RefusesNull)
{
    const Counted<IFilePath> path = makeCounted<FilePath>(u"/films");
    Buffer buffer = filledBuffer();

    EXPECT_NE(path->setPath(nullptr, 0), ResultOk);
    EXPECT_NE(path->getPath(nullptr), ResultOk);

    path->getPath(buffer.data());
    EXPECT_EQ(std::u16string(buffer.data()), u"/films");
}

} // namespace standin::tests
