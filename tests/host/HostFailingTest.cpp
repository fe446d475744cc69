// SPDX-License-Identifier: GPL-3.0-or-later

// Runs and previews in a host of which one call fails, whichever it is.

#include "host/Host.h"
#include "host/track/TrackRole.h"
#include "standin/project/Track.h"
#include "standin/services/IdleManager.h"
#include "tests/host/FailingHost.h"
#include "tests/support/ThrownResult.h"
#include "tests/support/host/AdaptedHost.h"
#include "tests/support/host/WatchedProgress.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <functional>
#include <initializer_list>
#include <string>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
using cadrel::tests::thrownBy;
using util::Result;

using Entries = AdaptedHost::Entries;

/// A film with sound, automation, a new picture and a memo, in a host that may fail.
class FailingFilm {
public:
    explicit FailingFilm(double origin) : host(origin)
    {
        const auto track = host.addTrack(TypeWord::Audio, u"DX");
        host.addSound(track, u"one", 0.0, 10.0);
        host.addSound(track, u"two", 10.0, 20.0);
        host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(2.0), 0.25F);
        host.addPoint(track, standin::Envelope::Curve::Volume, host.inHost(18.0), 0.75F);
        const auto memos = host.addTrack(TypeWord::Marker, u"Memos");
        memos->setAttribute(AttributeKey::MarkerType, FVariant::integer(TrackRole::Memos), true);
        host.addPointMarker(memos, u"click", host.inHost(3.0));

        host.disconnect();
        host.connectTo(failing.context());
        core::DataModel& model = host.model();
        model.settings().setCreateVirginTerritories(true);
        model.videoList().add(core::VideoList::Entry("/picture/reel3_v12.mov", core::Timecode("01:00:05:00"),
                                                     core::Timecode("00:00:04:00")),
                              false);
        host.carryOver("01:00:00:00", "01:00:08:00", "01:00:10:00", "01:00:18:00");
        host.carryOver("01:00:10:00", "01:00:20:00", "01:00:20:00", "01:00:30:00");
        entriesBefore = host.undoNames();
    }
    FailingFilm(const FailingFilm&) = delete;
    FailingFilm& operator=(const FailingFilm&) = delete;
    ~FailingFilm()
    {
        host.disconnect();
        EXPECT_EQ(failing.heldCount(), 0U) << "Somebody has kept an object of the host.";
    }

    /// Lets the n-th call of what is done fail; false when there are not so many.
    bool failIn(std::size_t call, const std::function<void()>& done)
    {
        failing.arm(call);
        done();
        const bool hasFailed = failing.callCount() >= call;
        failing.arm(0);
        return hasFailed;
    }

    /// The entry that has been added; empty for none.
    std::u16string newEntry()
    {
        const Entries entries = host.undoNames();
        EXPECT_LE(entries.size(), entriesBefore.size() + 1);
        return entries.size() == entriesBefore.size() ? std::u16string() : entries.back();
    }

    /// The project without what an undo doesn't touch: where the user is, and who holds the tracks.
    std::string content()
    {
        standin::Project& project = host.project;
        for (standin::Parameter* const parameter : {&project.locatorLeft(), &project.locatorRight(),
                                                    &project.cycleLeft(), &project.cycleRight(), &project.position()})
            parameter->setValue(0, 0.0);
        project.removeAttribute(AttributeKey::ProjectEnd);
        for (standin::Track* const track : project.allTracks()) {
            track->setLocked(false);
            track->removeAttribute(AttributeKey::LockState);
        }
        std::string text = host.dump();
        // The end of the project follows the preview and stands in no entry of the undo list.
        const std::size_t end = text.find("\n  \"end\": ");
        return text.erase(end, text.find('\n', end + 1) - end);
    }
    bool isAnyTrackLocked()
    {
        const auto tracks = host.project.allTracks();
        return std::ranges::any_of(tracks, [](const standin::Track* track) { return track->isLocked(); });
    }

    bool isIdleBlocked() { return host.application.idleManager().isBlocked(); }
    /// How many of the locators, the cycle and the position the model keeps for the end of a preview.
    std::size_t keptCount()
    {
        using Key = core::PropertyKey;
        const auto keeps = [this](std::initializer_list<std::int32_t> keys) {
            return std::ranges::all_of(keys, [this](std::int32_t key) { return host.model().hasProperty(key); });
        };
        return std::size_t{keeps({Key::ProjectCycleLeft, Key::ProjectCycleRight})} +
               std::size_t{keeps({Key::TransportCycleLower, Key::TransportCycleUpper})} +
               std::size_t{keeps({Key::TransportPosition})};
    }

    AdaptedHost host;
    FailingHost failing{&host.altered};
    Entries entriesBefore;
};

class HostFailingTest : public AtEachOrigin {};

INSTANTIATE_TEST_SUITE_P(Origins, HostFailingTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostFailingTest, ARunCanBeTakenBackAndTellsOfItsFailureWhicheverCallFails)
{
    std::string whole;
    std::size_t incomplete = 0;
    std::size_t leftBlocked = 0;
    // The first time round none fails.
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        Result::Type started = Result::NotAvailable;
        std::string before;

        const bool hasFailed = film.failIn(call, [&] {
            ASSERT_NO_THROW(started = film.host.adapter().startCadrel());
            before = film.host.bytes();
            film.host.idle();
        });

        ASSERT_FALSE(film.host.isEditOpen());
        leftBlocked += std::size_t{film.isIdleBlocked()};
        const std::string after = film.host.bytes();
        const std::u16string entry = film.newEntry();
        EXPECT_TRUE(started == Result::Ok || entry.empty()) << "It wasn't requested.";
        if (call == 0)
            whole = after;
        if (entry == u"Apply Cadrel") {
            EXPECT_TRUE(after == whole || film.failing.failedToTell()) << "It looks done and isn't.";
        } else if (!entry.empty()) {
            EXPECT_EQ(entry, u"Apply Cadrel (incomplete)");
            ++incomplete;
        }
        ASSERT_TRUE(entry.empty() || film.host.undo());
        ASSERT_EQ(film.host.bytes(), before);
        if (!hasFailed)
            break;
    }
    EXPECT_GT(incomplete, 100U);
    EXPECT_LE(leftBlocked, 1U) << "Only where the host refuses to end the block.";
}

TEST_P(HostFailingTest, ARunThatIsCancelledCanBeTakenBackAndTellsOfItsFailureWhicheverCallFails)
{
    std::string whole;
    std::size_t takenBack = 0;
    std::size_t incomplete = 0;
    std::size_t kept = 0;
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        const auto progress = makeCounted<WatchedProgress>();
        film.host.altered.replace(IProgressService::iid, progress);
        // The first time round nobody cancels, and the second none fails.
        progress->whenCalled = [&] {
            if (call > 0 && progress->calls.back().find("Event: 2") != std::string::npos)
                progress->cancel();
        };
        ASSERT_EQ(film.host.adapter().startCadrel(), Result::Ok);
        const std::string before = film.host.bytes();

        const bool hasFailed = film.failIn(call > 0 ? call - 1 : 0, [&] { film.host.idle(); });

        ASSERT_FALSE(film.host.isEditOpen());
        const std::string after = film.host.bytes();
        const std::u16string entry = film.newEntry();
        if (call == 0)
            whole = after;
        if (entry.empty()) {
            ++takenBack;
        } else if (entry == u"Apply Cadrel") {
            // The cancel went unheard, or its undo was refused.
            kept += std::size_t{after != whole};
        } else {
            EXPECT_EQ(entry, u"Apply Cadrel (incomplete)");
            ++incomplete;
        }
        ASSERT_TRUE(entry.empty() || film.host.undo());
        ASSERT_EQ(film.host.bytes(), before);
        if (!hasFailed && call > 1)
            break;
    }
    EXPECT_GT(takenBack, 1U);
    EXPECT_GT(incomplete, 50U);
    EXPECT_LE(kept, 1U) << "It looks done and isn't.";
}

TEST_P(HostFailingTest, APreviewCanBeTakenBackAndTellsOfItsFailureWhicheverCallFails)
{
    std::string whole;
    std::size_t incomplete = 0;
    std::size_t leftBlocked = 0;
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        AdaptedHost& host = film.host;
        Result::Type switched = Result::NotAvailable;
        Result::Type started = Result::NotAvailable;
        std::string before;

        const bool hasFailed = film.failIn(call, [&] {
            switched = thrownBy([&] { host.adapter().setPreviewActive(true); });
            EXPECT_TRUE(host.adapter().isPreviewActive());
            EXPECT_GE(film.keptCount(), switched == Result::Ok ? 3U : 2U) << "Each is kept for itself.";
            ASSERT_NO_THROW(started = host.adapter().startPreview(host.model().changeEdl(), 0, 0, 1));
            before = film.content();
            host.idle();
        });

        ASSERT_FALSE(host.isEditOpen());
        leftBlocked += std::size_t{film.isIdleBlocked()};
        const std::u16string entry = film.newEntry();
        EXPECT_TRUE(started == Result::Ok || entry.empty()) << "It wasn't requested.";
        if (!entry.empty()) {
            ASSERT_TRUE(host.undo());
            // Whoever isn't in a preview any more holds no track.
            EXPECT_TRUE(host.adapter().isPreviewActive() || !film.isAnyTrackLocked());
            ASSERT_EQ(film.content(), before);
            ASSERT_TRUE(host.redo());
        }
        const std::string after = film.content();
        EXPECT_TRUE(!entry.empty() || after == before);
        if (call == 0)
            whole = after;
        if (entry == u"Preview") {
            EXPECT_TRUE(after == whole || film.failing.failedToTell() || switched != Result::Ok)
                << "It looks done and isn't.";
        } else if (!entry.empty()) {
            EXPECT_EQ(entry, u"Preview (incomplete)");
            ++incomplete;
        }
        if (!hasFailed)
            break;
    }
    EXPECT_GT(incomplete, 100U);
    EXPECT_LE(leftBlocked, 1U) << "Only where the host refuses to end the block.";
}

TEST_P(HostFailingTest, APreviewIsOffAtItsEndWhicheverCallFails)
{
    std::string contentBefore;
    // The first time round it isn't ended.
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        AdaptedHost& host = film.host;
        host.adapter().setPreviewActive(true);
        host.preview(host.model().changeEdl());
        ASSERT_TRUE(film.isAnyTrackLocked());
        if (call == 0) {
            contentBefore = film.content();
            continue;
        }
        film.entriesBefore = host.undoNames();

        // It says so, when all that could be done has been.
        const bool hasFailed = film.failIn(call, [&] { thrownBy([&] { host.adapter().setPreviewActive(false); }); });

        ASSERT_FALSE(host.isEditOpen());
        EXPECT_FALSE(host.adapter().isPreviewActive());
        EXPECT_FALSE(film.isAnyTrackLocked());
        const std::u16string entry = film.newEntry();
        if (!entry.empty()) {
            EXPECT_TRUE(entry == u"End Preview" || entry == u"End Preview (incomplete)");
            ASSERT_TRUE(host.undo());
        }
        ASSERT_EQ(film.content(), contentBefore);
        if (!hasFailed) {
            EXPECT_EQ(entry, u"End Preview");
            break;
        }
    }
}

} // namespace cadrel::host::tests
