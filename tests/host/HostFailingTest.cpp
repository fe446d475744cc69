// Runs and previews in a host of which one call fails, whichever it is.

#include "host/Host.h"
#include "host/TrackRole.h"
#include "standin/project/Track.h"
#include "tests/host/AdaptedHost.h"
#include "tests/host/FailingHost.h"
#include "velmark/Attributes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <functional>
#include <string>

namespace cadrel::host::tests {
namespace {

using namespace Velmark;
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
        for (standin::Track* const track : project.allTracks()) {
            track->setLocked(false);
            track->removeAttribute(AttributeKey::LockState);
        }
        return host.dump();
    }
    bool isAnyTrackLocked()
    {
        const auto tracks = host.project.allTracks();
        return std::ranges::any_of(tracks, [](const standin::Track* track) { return track->isLocked(); });
    }

    AdaptedHost host;
    FailingHost failing{host.context()};
    Entries entriesBefore;
};

class HostFailingTest : public AtEachOrigin {};

INSTANTIATE_TEST_SUITE_P(Origins, HostFailingTest, testing::Values(0.0, 3600.0));

} // namespace

TEST_P(HostFailingTest, ARunCanBeTakenBackAndTellsOfItsFailureWhicheverCallFails)
{
    std::string whole;
    std::size_t incomplete = 0;
    // The first time round none fails.
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        ASSERT_EQ(film.host.adapter().startCadrel(), Result::Ok);
        const std::string before = film.host.bytes();

        const bool hasFailed = film.failIn(call, [&] { film.host.idle(); });

        ASSERT_FALSE(film.host.isEditOpen());
        const std::string after = film.host.bytes();
        const std::u16string entry = film.newEntry();
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
}

TEST_P(HostFailingTest, APreviewCanBeTakenBackAndTellsOfItsFailureWhicheverCallFails)
{
    std::string whole;
    std::size_t incomplete = 0;
    for (std::size_t call = 0;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        AdaptedHost& host = film.host;
        host.adapter().setPreviewActive(true);
        ASSERT_EQ(host.adapter().startPreview(host.model().changeEdl(), 0, 0, 1), Result::Ok);
        const std::string before = film.content();

        const bool hasFailed = film.failIn(call, [&] { host.idle(); });

        ASSERT_FALSE(host.isEditOpen());
        const std::u16string entry = film.newEntry();
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
            EXPECT_TRUE(after == whole || film.failing.failedToTell()) << "It looks done and isn't.";
        } else if (!entry.empty()) {
            EXPECT_EQ(entry, u"Preview (incomplete)");
            ++incomplete;
        }
        if (!hasFailed)
            break;
    }
    EXPECT_GT(incomplete, 100U);
}

TEST_P(HostFailingTest, APreviewIsOffAtItsEndWhicheverCallFails)
{
    for (std::size_t call = 1;; ++call) {
        SCOPED_TRACE(call);
        FailingFilm film(GetParam());
        AdaptedHost& host = film.host;
        host.adapter().setPreviewActive(true);
        host.preview(host.model().changeEdl());
        const std::string contentBefore = film.content();
        film.entriesBefore = host.undoNames();

        const bool hasFailed = film.failIn(call, [&] {
            try {
                host.adapter().setPreviewActive(false);
            } catch (Result::Type) {
                // It says so, when all that could be done has been.
            }
        });

        ASSERT_FALSE(host.isEditOpen());
        EXPECT_FALSE(host.adapter().isPreviewActive());
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
