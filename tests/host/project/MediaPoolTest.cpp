// SPDX-License-Identifier: GPL-3.0-or-later

#include "host/project/MediaPool.h"

#include "host/border/HostFailure.h"
#include "standin/project/MediaClip.h"
#include "tests/support/host/AlteredContext.h"
#include "tests/support/standin/TestHost.h"
#include "velmark/ClassId.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>

using namespace Velmark;

namespace cadrel::host {

using standin::MediaClip;
using util::Result;

namespace {

/// A sound and two pictures, 25 frames per second.
struct HostWithPool : standin::tests::TestHost {
    HostWithPool()
    {
        project.setFrameRate({25.0, 0});
        addMedia(u"/sound/door.wav", 5.0);
        addVideo(u"/picture/reel3_v07.mov", 100.0);
        addVideo(u"/picture/Szene 1 \u2013 Küche.mov", 4.0);
    }

    IMediaPool* hostPool() { return document()->getMediaPool(); }
};

/// A pool of the host as far as a case needs one.
class FakePool : public Implements<FakePool, FObject, IMediaPool> {
public:
    static constexpr const char* ClassName = "FakePool";

    int32 count(const char*) override { return size; }
    IProjectNode* itemAt(int32, const char*) override { return item; }
    FUnknown* import(IFilePath*) override { return nullptr; }

    int32 size = 0;
    IProjectNode* item = nullptr;
};

class RefusingDependencies : public Implements<RefusingDependencies, FObject, IDependencyManager> {
public:
    static constexpr const char* ClassName = "RefusingDependencies";

    int32 addDependent(FUnknown*, FObject*) override { return ResultFalse; }
    int32 removeDependent(FUnknown*, FObject*) override { return ResultFalse; }
};

struct CountingListener : core::MediaPoolInterface::Listener {
    void mediaPoolChanged() override
    {
        ++calls;
        if (whenCalled)
            whenCalled();
    }

    int calls = 0;
    std::function<void()> whenCalled;
};

void changePool(HostWithPool& host)
{
    host.addVideo(u"/picture/new.mov", 1.0);
    host.application.idle();
}

} // namespace

TEST(MediaPool, HoldsTheVideosOfTheHostsPool)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(pool.count(), 2U);
    EXPECT_EQ(pool.getPath(0), L"/picture/reel3_v07.mov");
    EXPECT_EQ(pool.getName(0), L"reel3_v07");
    EXPECT_EQ(pool.getFileName(0), L"reel3_v07");
    EXPECT_EQ(pool.getFrameCount(0), 2500U);
    EXPECT_EQ(pool.getPath(1), L"/picture/Szene 1 \u2013 Küche.mov");
    EXPECT_EQ(pool.getFileName(1), L"Szene 1 \u2013 Küche");
    EXPECT_EQ(pool.getFrameCount(1), 100U);
}

TEST(MediaPool, NamesAnItemAsTheHostDoesAndItsFileAsItIsStored)
{
    HostWithPool host;
    MediaClip& clip = host.addVideo(u"/picture/0047a.take.mov", 1.0);
    ASSERT_EQ(clip.setName(nullptr, standin::tests::text(u"Titles").get(), 0), ResultOk);
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(pool.getName(2), L"Titles");
    EXPECT_EQ(pool.getFileName(2), L"0047a.take");
}

TEST(MediaPool, RefusesAnIndexAtOrAboveItsCount)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(resultOf([&] { pool.getPath(2); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { pool.getName(2); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { pool.getFileName(2); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { pool.getFrameCount(2); }), Result::InvalidArgument);
    EXPECT_EQ(resultOf([&] { pool.getFrameCount(std::size_t{1} << 32); }), Result::InvalidArgument);
}

TEST(MediaPool, IsEmptyAndNotAvailableWithoutAPoolOfTheHost)
{
    HostWithPool host;
    MediaPool pool(host.context(), nullptr);

    EXPECT_EQ(pool.count(), 0U);
    EXPECT_FALSE(pool.findClip(L"/picture/reel3_v07.mov", 2500));
    EXPECT_EQ(resultOf([&] { pool.getPath(0); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { pool.getName(0); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { pool.getFileName(0); }), Result::NotAvailable);
    EXPECT_EQ(resultOf([&] { pool.getFrameCount(0); }), Result::NotAvailable);
}

TEST(MediaPool, MissesWhatTheHostCountsAndDoesNotGive)
{
    HostWithPool host;
    FakePool hostPool;
    hostPool.size = 1;
    MediaPool pool(host.context(), &hostPool);

    EXPECT_EQ(pool.count(), 1U);
    EXPECT_EQ(resultOf([&] { pool.getName(0); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { pool.getFrameCount(0); }), Result::HostObjectMissing);
}

TEST(MediaPool, MissesTheClipOfAnItemThatIsNone)
{
    HostWithPool host;
    FakePool hostPool;
    hostPool.size = 1;
    hostPool.item = host.root();
    MediaPool pool(host.context(), &hostPool);

    EXPECT_EQ(resultOf([&] { pool.getPath(0); }), Result::HostObjectMissing);
    EXPECT_EQ(resultOf([&] { pool.getFrameCount(0); }), Result::HostObjectMissing);
}

TEST(MediaPool, IsEmptyWhenTheHostCountsLessThanNothing)
{
    HostWithPool host;
    FakePool hostPool;
    hostPool.size = -1;
    MediaPool pool(host.context(), &hostPool);

    EXPECT_EQ(pool.count(), 0U);
    EXPECT_EQ(resultOf([&] { pool.getName(0); }), Result::InvalidArgument);
}

TEST(MediaPool, RefusesAPathThatIsLongerThanTheHostCanGive)
{
    HostWithPool host;
    host.addVideo((u"/" + std::u16string(1030, u'x')).c_str(), 1.0);
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(resultOf([&] { pool.getPath(2); }), Result::HostCallFailed);
}

TEST(MediaPool, TellsItsListenersWhenTheHostsPoolChanges)
{
    HostWithPool host;
    host.application.idle();
    MediaPool pool(host.context(), host.hostPool());
    CountingListener listener;
    pool.addListener(&listener);
    pool.addListener(&listener);

    changePool(host);

    EXPECT_EQ(listener.calls, 1);

    pool.removeListener(&listener);
    changePool(host);

    EXPECT_EQ(listener.calls, 1);
}

TEST(MediaPool, TellsItsListenersWhenItIsAskedTo)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());
    CountingListener listener;
    pool.addListener(&listener);

    pool.notifyListeners();

    EXPECT_EQ(listener.calls, 1);
}

TEST(MediaPool, AListenerMayLeaveWhileItIsTold)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());
    CountingListener listener;
    listener.whenCalled = [&] { pool.removeListener(&listener); };
    pool.addListener(&listener);

    pool.notifyListeners();
    pool.notifyListeners();

    EXPECT_EQ(listener.calls, 1);
}

TEST(MediaPool, ACopyIsADependentInItsTurnAndHasNoListeners)
{
    HostWithPool host;
    host.application.idle();
    auto pool = std::make_unique<MediaPool>(host.context(), host.hostPool());
    CountingListener ofOriginal;
    pool->addListener(&ofOriginal);
    MediaPool copy(*pool);
    CountingListener ofCopy;
    copy.addListener(&ofCopy);

    changePool(host);

    EXPECT_EQ(ofOriginal.calls, 1);
    EXPECT_EQ(ofCopy.calls, 1);

    pool.reset();
    changePool(host);

    EXPECT_EQ(ofOriginal.calls, 1);
    EXPECT_EQ(ofCopy.calls, 2);
    EXPECT_EQ(copy.count(), 4U);
}

TEST(MediaPool, IsNoDependentAnyMoreOnceItIsGone)
{
    HostWithPool host;
    const auto dependencies = service<IDependencyManager>(host.context());
    auto pool = std::make_unique<MediaPool>(host.context(), host.hostPool());
    MediaPool* const former = pool.get();

    pool.reset();

    // Refused by this host when the object hasn't that dependent.
    EXPECT_NE(dependencies->removeDependent(host.hostPool(), former), ResultOk);
}

TEST(MediaPool, FailsWhenItCanNotBecomeADependent)
{
    HostWithPool host;
    tests::AlteredContext context(host.context());
    context.replace(IDependencyManager::iid, makeCounted<RefusingDependencies>());

    EXPECT_EQ(resultOf([&] { MediaPool(&context, host.hostPool()); }), Result::HostCallFailed);
    EXPECT_EQ(resultOf([&] { MediaPool(&context, nullptr); }), Result::Ok);
}

TEST(MediaPool, FailsWithoutTheHostsDependencyManager)
{
    HostWithPool host;
    tests::AlteredContext context(host.context());
    context.hide(IDependencyManager::iid);

    EXPECT_EQ(resultOf([&] { MediaPool(&context, host.hostPool()); }), Result::HostObjectMissing);
}

TEST(MediaPool, FindsTheClipThatTheHostImportsWhateverItsLength)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());

    const auto clip = pool.findClip(L"/picture/reel3_v07.mov", 17);

    ASSERT_TRUE(clip);
    EXPECT_EQ(clip->getFrameCount(), 2500U);
}

TEST(MediaPool, FindsAFileThatHasMovedByItsNameAndItsNumberOfFrames)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());

    const auto clip = pool.findClip(L"/Volumes/old disk/reel3_v07.mov", 2500);

    ASSERT_TRUE(clip);
    EXPECT_EQ(query<IProjectNode>(clip), host.hostPool()->itemAt(0, TypeWord::Video));
}

TEST(MediaPool, FindsAFileThatHasMovedByTheNameOfTheItem)
{
    HostWithPool host;
    MediaClip& clip = host.addVideo(u"/cache/0001.mov", 8.0);
    ASSERT_EQ(clip.setName(nullptr, standin::tests::text(u"reel4.mov").get(), 0), ResultOk);
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(pool.findClip(L"/picture/reel4.mov", 200).get(), static_cast<IMediaClip*>(&clip));
    ASSERT_EQ(clip.setName(nullptr, standin::tests::text(u"reel4").get(), 0), ResultOk);
    EXPECT_EQ(pool.findClip(L"/picture/reel4.mov", 200).get(), static_cast<IMediaClip*>(&clip));
}

TEST(MediaPool, TheFirstItemOfANameAndLengthIsFound)
{
    HostWithPool host;
    host.addVideo(u"/a/reel4.mov", 8.0);
    MediaClip& first = host.addVideo(u"/b/reel4.mov", 9.0);
    host.addVideo(u"/c/reel4.mov", 9.0);
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_EQ(pool.findClip(L"reel4.mov", 225).get(), static_cast<IMediaClip*>(&first));
}

TEST(MediaPool, FindsNothingOfAnotherNameOrLengthOrKind)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());

    EXPECT_FALSE(pool.findClip(L"/old/reel3_v07.mov", 2499));
    EXPECT_FALSE(pool.findClip(L"/old/reel3_v08.mov", 2500));
    EXPECT_FALSE(pool.findClip(L"/old/door.wav", 125));
    EXPECT_FALSE(pool.findClip(L"", 2500));
}

TEST(MediaPool, FindsByNameWhatTheHostCanNotTakeAsAPath)
{
    HostWithPool host;
    MediaPool pool(host.context(), host.hostPool());
    const std::wstring path = L"/" + std::wstring(1100, L'x') + L"/reel3_v07.mov";

    EXPECT_TRUE(pool.findClip(path, 2500));

    tests::AlteredContext context(host.context());
    context.hide(ClassId::FilePath);
    MediaPool poolWithoutPaths(&context, host.hostPool());

    EXPECT_TRUE(poolWithoutPaths.findClip(L"/picture/reel3_v07.mov", 2500));
}

} // namespace cadrel::host
