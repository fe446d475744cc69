// SPDX-License-Identifier: GPL-3.0-or-later

#include "tests/support/standin/TestHost.h"

#include "standin/project/MediaClip.h"
#include "velmark/Media.h"

#include <gtest/gtest.h>

#include <limits>

using namespace Velmark;

namespace standin::tests {

namespace {

/// Two sounds and a picture.
struct HostWithPool : TestHost {
    HostWithPool()
    {
        addMedia(u"/sound/door.wav", 5.0);
        project.pool().add(makeCounted<MediaClip>(MediaClip::Kind::Video, u"/picture/reel3.mov", 100.0));
        addMedia(u"/sound/rain.wav", 60.0);
    }

    IMediaPool* pool() { return document()->getMediaPool(); }
};

} // namespace

TEST(MediaPool, CountsTheItemsOfAKind)
{
    HostWithPool host;

    EXPECT_EQ(host.pool()->count(TypeWord::Audio), 2);
    EXPECT_EQ(host.pool()->count(TypeWord::Video), 1);
    EXPECT_EQ(host.pool()->count(TypeWord::Marker), 0);
    EXPECT_EQ(host.pool()->count(nullptr), 0);
}

TEST(MediaPool, GivesTheItemsOfAKindByIndex)
{
    HostWithPool host;

    EXPECT_EQ(std::u16string(host.pool()->itemAt(0, TypeWord::Audio)->getName()), u"door");
    EXPECT_EQ(std::u16string(host.pool()->itemAt(1, TypeWord::Audio)->getName()), u"rain");
    EXPECT_EQ(std::u16string(host.pool()->itemAt(0, TypeWord::Video)->getName()), u"reel3");
}

TEST(MediaPool, GivesTheItemsByTheirNumbersWheneverTheyCame)
{
    TestHost host;
    MediaPool& pool = host.project.pool();
    const auto add = [&](const char16_t* path, int number) {
        pool.add(makeCounted<MediaClip>(MediaClip::Kind::Audio, path, 1.0), number);
    };
    add(u"/b.wav", 7);
    add(u"/c.wav", 9);
    EXPECT_EQ(std::u16string(pool.itemAt(0, TypeWord::Audio)->getName()), u"b");

    add(u"/a.wav", 3);

    EXPECT_EQ(pool.count(TypeWord::Audio), 3);
    EXPECT_EQ(std::u16string(pool.itemAt(0, TypeWord::Audio)->getName()), u"a");
    EXPECT_EQ(std::u16string(pool.itemAt(2, TypeWord::Audio)->getName()), u"c");
}

TEST(MediaPool, HasNothingAtAnIndexThatIsNotThere)
{
    HostWithPool host;

    for (const int32 index : {2, -1, std::numeric_limits<int32>::max(), std::numeric_limits<int32>::min()})
        EXPECT_EQ(host.pool()->itemAt(index, TypeWord::Audio), nullptr) << index;
    EXPECT_EQ(host.pool()->itemAt(0, nullptr), nullptr);
}

TEST(MediaPool, AnItemKnowsItsFileAndItsLengthInFramesOfTheProject)
{
    HostWithPool host;
    host.project.setFrameRate({25.0, 0});
    const auto clip = query<IMediaClip>(host.pool()->itemAt(0, TypeWord::Audio));

    EXPECT_EQ(clip->getFrameCount(), 125U);
    char16_t path[IFilePath::Capacity] = {};
    EXPECT_EQ(clip->getFile()->getPath(path), ResultOk);
    EXPECT_EQ(std::u16string(path), u"/sound/door.wav");
}

TEST(MediaPool, TheFileOfAnItemIsItsOwn)
{
    HostWithPool host;
    const auto clip = query<IMediaClip>(host.pool()->itemAt(0, TypeWord::Audio));

    clip->getFile()->setPath(u"/elsewhere.wav", 0);

    char16_t path[IFilePath::Capacity] = {};
    clip->getFile()->getPath(path);
    EXPECT_EQ(std::u16string(path), u"/sound/door.wav");
}

TEST(MediaPool, ImportsWhatIsThereAlreadyAndNothingElse)
{
    HostWithPool host;
    const auto path = create<IFilePath>(host.context());

    path->setPath(u"/picture/reel3.mov", 0);
    EXPECT_EQ(query<IProjectNode>(host.pool()->import(path.get())).get(), host.pool()->itemAt(0, TypeWord::Video));
    path->setPath(u"/picture/reel4.mov", 0);
    EXPECT_EQ(host.pool()->import(path.get()), nullptr);
    EXPECT_EQ(host.pool()->import(nullptr), nullptr);
}

TEST(MediaPool, ANameIsTheFileWithoutFolderAndExtension)
{
    EXPECT_EQ(MediaClip(MediaClip::Kind::Audio, u"/a.b/c.d.wav", 1.0).name(), u"c.d");
    EXPECT_EQ(MediaClip(MediaClip::Kind::Audio, u"C:\\sound\\door.wav", 1.0).name(), u"door");
    EXPECT_EQ(MediaClip(MediaClip::Kind::Audio, u"door", 1.0).name(), u"door");
    EXPECT_EQ(MediaClip(MediaClip::Kind::Audio, u"/sound/.hidden", 1.0).name(), u".hidden");
}

TEST(MediaPool, NumbersStayAndAreGivenOnce)
{
    TestHost host;
    const auto clip = [](const char16_t* path) { return makeCounted<MediaClip>(MediaClip::Kind::Audio, path, 1.0); };
    MediaPool& pool = host.project.pool();

    pool.add(clip(u"/a.wav"));
    pool.add(clip(u"/b.wav"), 7);
    pool.add(clip(u"/c.wav"));
    pool.add(clip(u"/d.wav"), std::numeric_limits<int>::max());
    pool.add(clip(u"/e.wav"));

    EXPECT_EQ(pool.clipWith(1)->path(), u"/a.wav");
    EXPECT_EQ(pool.clipWith(7)->path(), u"/b.wav");
    EXPECT_EQ(pool.clipWith(8)->path(), u"/c.wav");
    EXPECT_EQ(pool.clipWith(2)->path(), u"/e.wav");
    EXPECT_EQ(pool.clipWith(3), nullptr);
}

TEST(MediaPool, OutlivesItsProject)
{
    Counted<IMediaPool> pool;
    Counted<IMediaClip> clip;
    {
        HostWithPool host;
        pool = Counted<IMediaPool>::share(host.pool());
        clip = query<IMediaClip>(host.pool()->itemAt(0, TypeWord::Audio));
    }

    EXPECT_EQ(pool->count(TypeWord::Audio), 2);
    EXPECT_EQ(clip->getFrameCount(), 0U);
    pool.reset();
    EXPECT_EQ(clip->getFrameCount(), 0U);
    EXPECT_EQ(query<IProjectNode>(clip)->setName(nullptr, text(u"other").get(), 0), ResultOk);
}

} // namespace standin::tests
