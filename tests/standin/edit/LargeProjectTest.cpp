// SPDX-License-Identifier: GPL-3.0-or-later

// What large projects cost. A step that is quadratic in clips would take sixteen times as long for four times as many.

#include "tests/support/standin/TestHost.h"

#include "standin/project/Track.h"
#include "tests/support/NotQuadratic.h"
#include "tests/support/SecondsOf.h"
#include "velmark/Events.h"
#include "velmark/Media.h"
#include "velmark/Tracks.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <functional>

using namespace Velmark;
using cadrel::tests::expectNotQuadratic;
using cadrel::tests::secondsOf;

namespace standin::tests {

namespace {

/// One track with so many clips of a second, which come in no order, and an envelope with as many points.
class LargeHost : public TestHost {
public:
    explicit LargeHost(int clips) : m_clips(clips), m_end(clips)
    {
        tracks->add(track.get(), 0);
        edit(u"Fill", [&] {
            for (int index = 0; index < clips; ++index) {
                const double start = static_cast<double>(index * 7919LL % clips);
                addClip(track, u"clip", start, start + 1.0);
                insertPoint(start);
            }
        });
    }

    void editEachClip()
    {
        edit(u"Trim", [&] {
            for (const Node& clip : childrenOf(*track)) {
                clip->setEnd(nullptr, 0, clip->getEnd(nullptr) - 0.25);
                clip->setStart(nullptr, 0, clip->getStart(nullptr) + 0.125);
            }
        });
    }

    void removeEachClip()
    {
        edit(u"Delete", [&] {
            for (const Node& clip : childrenOf(*track))
                transaction()->remove(track.get(), clip.get());
        });
    }

    void copyAllClips()
    {
        edit(u"Copy", [&] {
            editService()->copyRange(document(), tracks.get(), 0, 0.0, m_end, 2.0 * m_end);
            editService()->copyRange(document(), tracks.get(), 0, 0.5, m_end, 0.0);
            editService()->closeRange(document(), tracks.get(), 0.0, 3.0 * m_end, 0.0);
        });
    }

    /// As a conform does it: each clip has a range of its own.
    void copyClipByClip()
    {
        edit(u"Conform", [&] {
            for (int index = 0; index < m_clips; ++index)
                editService()->copyRange(document(), tracks.get(), 0, index + 0.25, index + 1.0, 4.0 * m_end + index);
            transaction()->deleteRange(document(), 0, 4.0 * m_end, 5.0 * m_end);
        });
    }

private:
    void insertPoint(double time)
    {
        const auto point = create<IProjectNode>(context(), ClassId::AutomationPoint);
        point->setStart(nullptr, 0, time);
        transaction()->insert(curve.get(), point.get());
    }

    const int m_clips;
    const double m_end;
    Node track = addTrack(TypeWord::Audio, u"DX 1");
    Node curve = curveOf(track, Envelope::Curve::Volume);
    Counted<IObjectList> tracks = create<IObjectList>(context());
};

/// So many copies of one clip of two seconds at one place, on the track or in a part of it.
class StackedCopies : public TestHost {
public:
    StackedCopies(int count, bool areInAPart) : m_areInAPart(areInAPart)
    {
        m_list->add(m_track.get(), 0);
        edit(u"Fill", [&] {
            const auto holder = areInAPart ? addPart(m_track, u"part", 0.0, 2.0) : m_track;
            addClip(holder, u"clip", 0.0, 2.0);
            for (int copies = 1; copies < count; copies *= 2) {
                copy(0.0, 2.0, 2.0);
                gatherIn(holder);
            }
        });
    }

    /// What it takes to find, and to join, what goes on where the first halves of all copies end, when that is what stands
    /// at `start` in the clip. It is the second half of each for 1, and fits to none for 0.
    double secondsToJoin(double start)
    {
        edit(u"Cut", [&] {
            copy(0.0, 1.0, 10.0);
            copy(start, start + 1.0, 11.0);
        });
        return secondsOf([&] {
            edit(u"Join", [&] {
                const int32 result = editService()->closeRange(document(), m_list.get(), 10.0, 12.0, 0.0);
                EXPECT_EQ(result, start == 1.0 ? ResultOk : ResultFalse);
            });
        });
    }

private:
    void copy(double start, double end, double destination)
    {
        editService()->copyRange(document(), m_list.get(), 0, start, end, destination);
    }
    void gatherIn(const TestHost::Node& holder)
    {
        const auto copied = m_areInAPart ? childrenOf(*m_track)[1] : m_track;
        for (const auto& clip : childrenOf(*copied)) {
            if (m_areInAPart)
                transaction()->move(copied.get(), holder.get(), clip.get());
            clip->setStart(nullptr, 0, 0.0);
        }
        if (m_areInAPart)
            transaction()->remove(m_track.get(), copied.get());
    }

    const bool m_areInAPart;
    TestHost::Node m_track = addTrack(TypeWord::Audio, u"DX 1");
    Counted<IObjectList> m_list = create<IObjectList>(context());
};

double secondsToEdit(int clips)
{
    return secondsOf([=] {
        LargeHost host(clips);
        host.editEachClip();
        host.copyAllClips();
        host.copyClipByClip();
        host.removeEachClip();
        while (host.undo()) {
        }
        while (host.redo()) {
        }
    });
}

} // namespace

TEST(LargeProject, NoEditIsQuadraticInClips)
{
    expectNotQuadratic(2500, secondsToEdit);
}

TEST(LargeProject, AWalkOverTheMediaPoolByIndexIsNotQuadratic)
{
    const auto secondsToWalk = [](int clips) {
        TestHost host;
        for (int index = 0; index < clips; ++index)
            host.addMedia(u"/sound/take.wav", 1.0);
        IMediaPool* const pool = host.document()->getMediaPool();
        return secondsOf([&] {
            for (int32 index = 0; index < pool->count(TypeWord::Audio); ++index)
                pool->itemAt(index, TypeWord::Audio)->getName();
        });
    };

    // So many, because a clip takes longer once not all of them fit into the processor's cache.
    expectNotQuadratic(50000, secondsToWalk);
}

TEST(LargeProject, WhatLiesOutsideOfARangeDoesNotCount)
{
    const auto secondsToCopy = [](int clips) {
        TestHost host;
        const auto track = host.addTrack(TypeWord::Audio, u"DX 1");
        const auto list = create<IObjectList>(host.context());
        list->add(track.get(), 0);
        host.edit(u"Fill", [&] {
            for (int index = 0; index < clips; ++index)
                host.addClip(track, u"clip", index, index + 1.0);
        });
        return secondsOf([&] {
            host.edit(u"Copy", [&] {
                for (int index = 0; index < 2000; ++index)
                    host.editService()->copyRange(host.document(), list.get(), 0, 10.5, 12.5, clips / 2.0);
            });
        });
    };
    secondsToCopy(1000);

    const double few = std::max(secondsToCopy(1000), secondsToCopy(1000));
    const double many = std::min(secondsToCopy(50000), secondsToCopy(50000));

    EXPECT_LT(many, 8.0 * few);
}

TEST(LargeProject, NoEditIsQuadraticInWhatIsStackedOnOneTrack)
{
    constexpr double Length = 1000.0;
    enum class Stack { Clips, Ranges, Points };
    const auto secondsToConform = [](Stack stack, int count) {
        TestHost host;
        const auto track = host.addTrack(stack == Stack::Clips ? TypeWord::Audio : TypeWord::Marker, u"track");
        const auto list = create<IObjectList>(host.context());
        list->add(track.get(), 0);
        host.edit(u"Fill", [&] {
            for (int index = 0; index < count; ++index) {
                const double start = Length * index / count / 2;
                if (stack == Stack::Clips)
                    host.addClip(track, u"clip", start, start + Length / 2);
                else if (stack == Stack::Ranges)
                    host.addRangeMarker(track, u"range", 0.0, Length);
                else
                    host.addPointMarker(track, u"point", Length / 2);
            }
        });
        return secondsOf([&] {
            host.edit(u"Conform", [&] {
                for (int part = 0; part < 4; ++part)
                    host.editService()->copyRange(host.document(), list.get(), 0, part * Length / 4,
                                                  (part + 1) * Length / 4, 2 * Length + (part ^ 1) * Length / 4);
                host.transaction()->deleteRange(host.document(), 0, 0.0, Length);
                host.editService()->closeRange(host.document(), list.get(), 0.0, 4.0 * Length, 0.0);
            });
            host.undo();
            host.redo();
        });
    };

    for (const Stack stack : {Stack::Clips, Stack::Ranges, Stack::Points}) {
        SCOPED_TRACE(static_cast<int>(stack));
        expectNotQuadratic(2000, [&](int count) { return secondsToConform(stack, count); });
    }
}

TEST(LargeProject, NoJoinIsQuadraticInCopiesOfOneClip)
{
    for (const bool areInAPart : {false, true}) {
        SCOPED_TRACE(areInAPart);
        expectNotQuadratic(4096, [&](int count) { return StackedCopies(count, areInAPart).secondsToJoin(1.0); });
    }
}

TEST(LargeProject, NoSearchForWhatToJoinIsQuadraticInCopiesOfOneClip)
{
    const auto seconds = [](int count) { return StackedCopies(count, false).secondsToJoin(0.0); };

    expectNotQuadratic(4096, seconds);
}

} // namespace standin::tests
