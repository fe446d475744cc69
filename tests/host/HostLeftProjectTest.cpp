// SPDX-License-Identifier: GPL-3.0-or-later

// Runs and previews whose project the user leaves or closes while they go on.

#include "host/Host.h"
#include "host/border/HostFailure.h"
#include "standin/edit/EditService.h"
#include "standin/file/ProjectFile.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/WatchedProgress.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

enum class Leaving { ForAnother, ForNone, Closing };

/// A film of two clips that change places, and another project that is open.
class LeftFilm {
public:
    explicit LeftFilm(double origin) : host(origin), other(host.application.createProject())
    {
        const auto track = host.addTrack(TypeWord::Audio, u"DX");
        host.addSound(track, u"one", 0.0, 10.0);
        host.addSound(track, u"two", 10.0, 20.0);
        host.carryOver("01:00:00:00", "01:00:10:00", "01:00:10:00", "01:00:20:00");
        host.carryOver("01:00:10:00", "01:00:20:00", "01:00:00:00", "01:00:10:00");
        host.altered.replace(IProgressService::iid, progress);
    }

    void leave(Leaving leaving)
    {
        switch (leaving) {
        case Leaving::ForAnother:
            host.application.activateProject(&other);
            break;
        case Leaving::ForNone:
            host.adapter().projectDeactivated(host.document());
            break;
        case Leaving::Closing:
            host.adapter().projectClosing(host.document(), 0);
            break;
        }
    }

    std::string otherContent() const { return standin::ProjectFile::toText(other); }

    AdaptedHost host;
    standin::Project& other;
    Counted<WatchedProgress> progress = makeCounted<WatchedProgress>();
};

class HostLeftProjectTest : public AtEachOrigin {
protected:
    /// Leaves the project in each call of the progress window by turns. The entry of an edit that didn't end whole says so.
    void expectSafe(Leaving leaving, bool isPreview, const std::u16string& done)
    {
        std::size_t incomplete = 0;
        std::string whole;
        // The first time round it isn't left.
        for (std::size_t call = 0;; ++call) {
            SCOPED_TRACE(call);
            LeftFilm film(GetParam());
            AdaptedHost& host = film.host;
            if (isPreview) {
                host.adapter().setPreviewActive(true);
                ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 1), Result::Ok);
            } else {
                ASSERT_EQ(host.adapter().startCadrel(), Result::Ok);
            }
            const std::string before = host.dump();
            const std::string otherBefore = film.otherContent();
            std::size_t calls = 0;
            film.progress->whenCalled = [&] {
                if (++calls == call)
                    film.leave(leaving);
            };

            host.idle();

            film.progress->whenCalled = {};
            ASSERT_FALSE(host.isEditOpen());
            EXPECT_EQ(film.otherContent(), otherBefore);
            const AdaptedHost::Entries entries = host.undoNames();
            const std::u16string entry = entries.empty() ? u"" : entries.back();
            if (call == 0)
                whole = host.dump();
            if (entry == done + u" (incomplete)")
                ++incomplete;
            if (entry == done && !isPreview) {
                EXPECT_EQ(host.dump(), whole) << "It looks done and isn't.";
            }
            if ((entry == done || entry == done + u" (incomplete)") && !isPreview) {
                ASSERT_TRUE(host.application.edits().undo(host.project));
                EXPECT_EQ(host.dump(), before);
            }
            if (call > calls)
                break;
        }
        EXPECT_GT(incomplete, 2U);
    }
};

INSTANTIATE_TEST_SUITE_P(Origins, HostLeftProjectTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostLeftProjectTest, ARunEndsIncompleteWhenAnotherProjectIsActivated)
{
    expectSafe(Leaving::ForAnother, false, u"Apply Cadrel");
}

TEST_P(HostLeftProjectTest, ARunEndsIncompleteWhenNoProjectIsActive)
{
    expectSafe(Leaving::ForNone, false, u"Apply Cadrel");
}

TEST_P(HostLeftProjectTest, ARunEndsIncompleteWhenItsProjectCloses)
{
    expectSafe(Leaving::Closing, false, u"Apply Cadrel");
}

TEST_P(HostLeftProjectTest, APreviewEndsIncompleteWhenAnotherProjectIsActivated)
{
    expectSafe(Leaving::ForAnother, true, u"Preview");
}

TEST_P(HostLeftProjectTest, APreviewEndsIncompleteWhenNoProjectIsActive)
{
    expectSafe(Leaving::ForNone, true, u"Preview");
}

TEST_P(HostLeftProjectTest, APreviewEndsIncompleteWhenItsProjectCloses)
{
    expectSafe(Leaving::Closing, true, u"Preview");
}

TEST_P(HostLeftProjectTest, ACancelledRunIsTakenBackInItsOwnProjectAlone)
{
    LeftFilm film(GetParam());
    AdaptedHost& host = film.host;
    ASSERT_EQ(host.adapter().startCadrel(), Result::Ok);
    film.progress->whenCalled = [&] {
        if (film.progress->calls.back().find("Event: 2") == std::string::npos)
            return;
        film.progress->cancel();
        film.leave(Leaving::ForAnother);
    };
    const std::string otherBefore = film.otherContent();

    host.idle();

    EXPECT_EQ(film.otherContent(), otherBefore);
    EXPECT_EQ(host.undoNames().back(), u"Apply Cadrel (incomplete)");
}

TEST_P(HostLeftProjectTest, ThePreviewOfAProjectThatClosesAtItsEndIsSwitchedOff)
{
    for (const Leaving leaving : {Leaving::ForAnother, Leaving::ForNone, Leaving::Closing}) {
        LeftFilm film(GetParam());
        AdaptedHost& host = film.host;
        host.adapter().setPreviewActive(true);
        host.preview(host.model().changeEdl());
        std::vector<std::string> calls;
        const auto dependent = makeCounted<standin::tests::Recorder>(calls);
        const auto dependencies = service<IDependencyManager>(host.context());
        requireOk(dependencies->addDependent(host.document(), dependent.get()));
        bool isLeft = false;
        dependent->whenCalled = [&](const std::string&) {
            if (!std::exchange(isLeft, true))
                film.leave(leaving);
        };

        EXPECT_EQ(thrownBy([&] { host.adapter().setPreviewActive(false); }), Result::NoProject);

        EXPECT_TRUE(isLeft);
        EXPECT_FALSE(host.isEditOpen());
        EXPECT_EQ(host.undoNames().back(), u"End Preview");
        dependencies->removeDependent(host.document(), dependent.get());
    }
}

} // namespace cadrel::host::tests
